#pragma once
// Small interfaces through which core code reaches the screen and the clock.
// The window implements them with widgets; tests implement them with recorders.

#include <QDateTime>
#include <QString>

#include <chrono>
#include <cstdint>

namespace quorvel {

// Standard message-box answers and button sets (only the lowest three bits of
// a button code choose the set; icon flags such as 32 or 48 are ignored).
enum MsgAnswer : int {
    kAnswerOk = 1,
    kAnswerCancel = 2,
    kAnswerRetry = 4,
    kAnswerYes = 6,
    kAnswerNo = 7
};
enum MsgButtons : int {
    kButtonsOk = 0,
    kButtonsOkCancel = 1,
    kButtonsYesNoCancel = 3,
    kButtonsYesNo = 4,
    kButtonsRetryCancel = 5,
    kIconQuestion = 32,
    kIconExclamation = 48,
};

// The answer a box gives when nobody clicks: the first button's code.
int DefaultAnswer(int buttons);

class Prompter {
public:
    virtual ~Prompter() = default;
    // The self-closing box: returns the default answer when nobody answers in time.
    virtual int MyMsgBox(const QString& message, int buttons) = 0;
    // The system's box, which waits for an answer (login messages, delete
    // confirmation, error reports of the support modules).
    virtual int SystemMsgBox(const QString& message, int buttons) = 0;
};

class ProgressView {
public:
    virtual ~ProgressView() = default;
    // total < 0: values are percentages; total == 0: the bar is always full.
    virtual void Initialise(std::int64_t total, int style, const QString& units) = 0;
    virtual void Show(std::int64_t value, const QString& text) = 0;
    virtual void Finish() = 0;
};

class TraceView {
public:
    virtual ~TraceView() = default;
    virtual void AddTrace(const QString& line) = 0;
    virtual void ShowStatus(const QString& text) = 0;
};

class BusyPointer {
public:
    virtual ~BusyPointer() = default;
    virtual void Push() = 0;
    virtual void Pop() = 0;
};

// Holds the hourglass for its lifetime; nested guards restore in reverse order.
class BusyGuard {
public:
    explicit BusyGuard(BusyPointer* pointer);
    ~BusyGuard();
    BusyGuard(const BusyGuard&) = delete;
    BusyGuard& operator=(const BusyGuard&) = delete;

private:
    BusyPointer* pointer_;
};

// Every wait of the program takes its length from here, so tests can shorten them.
struct WaitLengths {
    std::chrono::milliseconds replyGap{10000};  // silence that ends a wait for a reply
    std::chrono::milliseconds messageBox{5000}; // self-closing message box
    std::chrono::milliseconds firstTick{60000}; // scheduler's first tick after start
    std::chrono::milliseconds tick{10000};      // scheduler's later ticks
};

class Clock {
public:
    virtual ~Clock() = default;
    virtual QDateTime Now() const = 0;
    const WaitLengths& Waits() const { return waits_; }
    void SetWaits(const WaitLengths& waits) { waits_ = waits; }

private:
    WaitLengths waits_;
};

class SystemClock : public Clock {
public:
    QDateTime Now() const override { return QDateTime::currentDateTime(); }
};

// The ports a process uses. The program installs the window's implementations
// at start-up; until then prompts answer with their default and views drop output.
struct Ports {
    Prompter* prompter = nullptr;
    Clock* clock = nullptr;
    BusyPointer* busy = nullptr;
};

Ports& CurrentPorts();
Prompter& CurrentPrompter();
Clock& CurrentClock();
BusyPointer* CurrentBusyPointer();

// Replaces the process's ports for its lifetime (tests, the window's start-up).
class ScopedPorts {
public:
    explicit ScopedPorts(const Ports& ports);
    ~ScopedPorts();
    ScopedPorts(const ScopedPorts&) = delete;
    ScopedPorts& operator=(const ScopedPorts&) = delete;

private:
    Ports saved_;
};

} // namespace quorvel
