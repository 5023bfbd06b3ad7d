#pragma once
// The process's ports while the window runs: questions go to the timed box or
// the system's box, the busy pointer to the application's override pointer.
// Unattended ("/S"), no box waits: everything goes to the timed box, which
// counts down, and every message is written to the program log.

#include "app/run/unattended_prompter.h"
#include "support/ports.h"
#include "support/ui/mouse_pointer.h"
#include "support/ui/widget_prompter.h"

#include <memory>

class QWidget;

namespace quorvel {

class WindowPorts {
public:
    // owner: the main window, parent of the message boxes.
    explicit WindowPorts(QWidget* owner, bool unattended = false);
    ~WindowPorts();
    WindowPorts(const WindowPorts&) = delete;
    WindowPorts& operator=(const WindowPorts&) = delete;

private:
    WidgetPrompter prompter_;
    UnattendedPrompter unattended_;
    OverrideBusyPointer busy_;
    SystemClock clock_;
    std::unique_ptr<ScopedPorts> scope_;
};

} // namespace quorvel
