#pragma once
// The prompter of "/S" mode and of the command-line run: no box ever waits
// for a person, and every message is written to the program log first.
//
// With a timed box (the window in "/S" mode) each message counts down there,
// and the system's waiting box becomes the timed box with OK only, answered
// "No" where it asks. Without one (the command-line run) every box answers at
// once: the timed box its default, the waiting box as above, so that the
// web-data object's "Do you want to debug ?" never ends the program.

#include "support/ports.h"

#include <functional>

namespace quorvel {

class UnattendedPrompter : public Prompter {
public:
    // timed: the window's prompter, or null to answer at once.
    explicit UnattendedPrompter(Prompter* timed = nullptr) : timed_(timed) {}

    int MyMsgBox(const QString& message, int buttons) override;
    int SystemMsgBox(const QString& message, int buttons) override;

    // Called with every message after it was answered (the command-line run
    // keeps the latest one as the reason of a failure that gives no other).
    void SetWatcher(std::function<void(const QString&)> watcher) { watcher_ = std::move(watcher); }

    // The log line of a message: its lines joined with " | " and the answer.
    static QString LogLine(const QString& message, int answer);

private:
    int Note(const QString& message, int answer);

    Prompter* timed_;
    std::function<void(const QString&)> watcher_;
};

} // namespace quorvel
