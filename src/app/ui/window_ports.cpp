#include "app/ui/window_ports.h"

#include "support/ui/desktop_opener.h"

namespace quorvel {

WindowPorts::WindowPorts(QWidget* owner) : prompter_(owner) {
    Ports ports;
    ports.prompter = &prompter_;
    ports.busy = &busy_;
    ports.clock = &clock_;
    scope_ = std::make_unique<ScopedPorts>(ports);
    InstallDesktopOpener();
}

WindowPorts::~WindowPorts() = default;

} // namespace quorvel
