#include "app/run/run_prompter.h"

namespace quorvel {

namespace {

Ports WithPrompter(Prompter* prompter) {
    Ports ports = CurrentPorts();
    ports.prompter = prompter;
    return ports;
}

} // namespace

int QuietAnswer(int buttons) {
    switch (buttons & 7) {
    case kButtonsYesNo:
    case kButtonsYesNoCancel:
        return kAnswerNo;
    case kButtonsOkCancel:
    case kButtonsRetryCancel:
        return kAnswerCancel;
    default:
        return kAnswerOk;
    }
}

int RunPrompter::MyMsgBox(const QString& message, int buttons) {
    if (beforeBox_) beforeBox_();
    return timed_.MyMsgBox(message, buttons);
}

int RunPrompter::SystemMsgBox(const QString& message, int buttons) {
    if (beforeBox_) beforeBox_();
    timed_.MyMsgBox(message, kButtonsOk | (buttons & ~7));
    return QuietAnswer(buttons);
}

RunPromptScope::RunPromptScope(std::function<void()> beforeBox)
    : prompter_(CurrentPrompter(), std::move(beforeBox)), scope_(WithPrompter(&prompter_)) {}

} // namespace quorvel
