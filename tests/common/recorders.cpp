#include "common/recorders.h"

namespace quorvel::testing {

int RecordingPrompter::Answer(int buttons) {
    if (answers_.empty()) return DefaultAnswer(buttons);
    const int answer = answers_.front();
    answers_.pop_front();
    return answer;
}

int RecordingPrompter::MyMsgBox(const QString& message, int buttons) {
    shown.push_back({message, buttons, true});
    return Answer(buttons);
}

int RecordingPrompter::SystemMsgBox(const QString& message, int buttons) {
    shown.push_back({message, buttons, false});
    return Answer(buttons);
}

void RecordingProgressView::Initialise(std::int64_t t, int s, const QString& u) {
    total = t;
    style = s;
    units = u;
    ++initialised;
    steps.clear();
}

void RecordingProgressView::Show(std::int64_t value, const QString& text) {
    steps.push_back({value, text});
}

RecordingPorts::RecordingPorts() : scope_(Ports{&prompter, &clock, &busy}) {}

} // namespace quorvel::testing
