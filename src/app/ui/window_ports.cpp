#include "app/ui/window_ports.h"

#include "support/ui/desktop_opener.h"

namespace quorvel {

WindowPorts::WindowPorts(QWidget* owner, bool unattended)
    : prompter_(owner), unattended_(&prompter_) {
    Ports ports;
    ports.prompter = unattended ? static_cast<Prompter*>(&unattended_) : &prompter_;
    ports.busy = &busy_;
    ports.clock = &clock_;
    scope_ = std::make_unique<ScopedPorts>(ports);
    InstallDesktopOpener();
}

WindowPorts::~WindowPorts() = default;

} // namespace quorvel
