#pragma once
// The prompter while a run is under way: the timed box for everything, so
// that no question waits for a person. A box that would have waited shows its
// text with OK only and is answered "No" where it asks (the web-data object's
// "Do you want to debug ?" must never end the program by default).

#include "support/ports.h"

#include <functional>

namespace quorvel {

// The answer of a waiting box that nobody is to answer: "No" where it asks,
// "Cancel" where it offers that, else OK.
int QuietAnswer(int buttons);

class RunPrompter : public Prompter {
public:
    // beforeBox runs before every box (the window notes that a box was shown).
    RunPrompter(Prompter& timed, std::function<void()> beforeBox)
        : timed_(timed), beforeBox_(std::move(beforeBox)) {}

    int MyMsgBox(const QString& message, int buttons) override;
    int SystemMsgBox(const QString& message, int buttons) override;

private:
    Prompter& timed_;
    std::function<void()> beforeBox_;
};

// Installs a RunPrompter over the process's prompter for its lifetime.
class RunPromptScope {
public:
    explicit RunPromptScope(std::function<void()> beforeBox);
    RunPromptScope(const RunPromptScope&) = delete;
    RunPromptScope& operator=(const RunPromptScope&) = delete;

private:
    RunPrompter prompter_;
    ScopedPorts scope_;
};

} // namespace quorvel
