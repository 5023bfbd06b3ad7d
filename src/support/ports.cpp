#include "support/ports.h"

namespace quorvel {

int DefaultAnswer(int buttons) {
    switch (buttons & 7) {
    case kButtonsYesNoCancel:
    case kButtonsYesNo:
        return kAnswerYes;
    case kButtonsRetryCancel:
        return kAnswerRetry;
    default:
        return kAnswerOk;
    }
}

BusyGuard::BusyGuard(BusyPointer* pointer) : pointer_(pointer) {
    if (pointer_) pointer_->Push();
}

BusyGuard::~BusyGuard() {
    if (pointer_) pointer_->Pop();
}

namespace {

// Until the window installs its own, nobody can answer: take the default at once.
class UnattendedPrompter : public Prompter {
public:
    int MyMsgBox(const QString&, int buttons) override { return DefaultAnswer(buttons); }
    int SystemMsgBox(const QString&, int buttons) override { return DefaultAnswer(buttons); }
};

Ports& Installed() {
    static Ports ports;
    return ports;
}

} // namespace

Ports& CurrentPorts() {
    return Installed();
}

Prompter& CurrentPrompter() {
    static UnattendedPrompter fallback;
    Prompter* prompter = Installed().prompter;
    return prompter ? *prompter : fallback;
}

Clock& CurrentClock() {
    static SystemClock fallback;
    Clock* clock = Installed().clock;
    return clock ? *clock : fallback;
}

BusyPointer* CurrentBusyPointer() {
    return Installed().busy;
}

ScopedPorts::ScopedPorts(const Ports& ports) : saved_(Installed()) {
    Installed() = ports;
}

ScopedPorts::~ScopedPorts() {
    Installed() = saved_;
}

} // namespace quorvel
