#pragma once
// Port implementations that record what core code shows and answer from a script.

#include "support/ports.h"

#include <QDateTime>
#include <QStringList>

#include <cstdint>
#include <deque>
#include <vector>

namespace quorvel::testing {

// Answers each box from the script, then with the box's default answer.
class RecordingPrompter : public Prompter {
public:
    struct Shown {
        QString message;
        int buttons;
        bool timed;
    };
    void Script(int answer) { answers_.push_back(answer); }
    int MyMsgBox(const QString& message, int buttons) override;
    int SystemMsgBox(const QString& message, int buttons) override;

    std::vector<Shown> shown;

private:
    int Answer(int buttons);
    std::deque<int> answers_;
};

class RecordingProgressView : public ProgressView {
public:
    struct Step {
        std::int64_t value;
        QString text;
    };
    void Initialise(std::int64_t total, int style, const QString& units) override;
    void Show(std::int64_t value, const QString& text) override;
    void Finish() override { ++finished; }

    std::int64_t total = 0;
    int style = -1;
    QString units;
    int initialised = 0;
    int finished = 0;
    std::vector<Step> steps;
};

class RecordingTraceView : public TraceView {
public:
    void AddTrace(const QString& line) override { traces << line; }
    void ShowStatus(const QString& text) override { statuses << text; }

    QStringList traces;
    QStringList statuses;
};

class CountingBusyPointer : public BusyPointer {
public:
    void Push() override { ++depth, ++pushes; }
    void Pop() override { --depth; }
    int depth = 0;
    int pushes = 0;
};

// A clock that stands still until a test moves it.
class ManualClock : public Clock {
public:
    explicit ManualClock(QDateTime now = QDateTime(QDate(2024, 11, 1), QTime(10, 20, 0)))
        : now_(std::move(now)) {}
    QDateTime Now() const override { return now_; }
    void Set(const QDateTime& now) { now_ = now; }
    void AdvanceSeconds(qint64 seconds) { now_ = now_.addSecs(seconds); }

private:
    QDateTime now_;
};

// Installs recorders as the process's ports for one test.
class RecordingPorts {
public:
    RecordingPorts();
    RecordingPrompter prompter;
    SystemClock clock;
    CountingBusyPointer busy;

private:
    ScopedPorts scope_;
};

} // namespace quorvel::testing
