#pragma once
// Runs of the file list: "Process all" (every active entry, in list order) and
// "Process file" (the entry shown). One engine serves the window, the
// scheduler and the command-line run; each brings its own RunHost and
// RunObserver.
//
// No question of a run waits for a person: failures and "Continue ?" go to
// the timed box, and while a run is under way every other box goes there too
// with OK only (answered "No" where it asks), so an unattended run goes on.

#include "app/run/file_processor.h"

#include <functional>

namespace quorvel {

class RunLock;

struct RunSummary {
    bool ran = false;      // false: a run was under way already, or the folders were unusable
    bool lockHeld = false; // another process holds the run lock: nothing was done
    int processed = 0;     // active entries taken up
    int failed = 0;
    bool cancelled = false;
};

class RunEngine {
public:
    enum Which : int { kProcessAll = 0, kProcessFile = 1 };

    // status: "Processed n file(s)" and the engine's trace lines.
    RunEngine(RunServices& services, TraceView& status);

    // A call while a run is under way (a timer tick, a second click) does
    // nothing; so does a call while another process holds the run lock.
    RunSummary Process(int which, RunHost& host, RunObserver& observer);

    // The program home's run lock, held for every run; none by default.
    void SetRunLock(RunLock* lock) { runLock_ = lock; }

    bool IsBusy() const { return busy_; }
    bool CancelRequested() const { return cancelRequested_; }
    // Why the latest file failed; emptied when a run starts.
    const QString& LastErrorText() const { return lastErrorText_; }

    // "Cancel": the run ends after the current file, and a running exchange
    // or download stops waiting.
    void Cancel();
    // A close refused during a run: the run ends after the current file.
    void RequestStop() { cancelRequested_ = true; }

    // The scheduler's seam: called after every run of all files, once "Last:"
    // is stamped, to set the next due time.
    std::function<void()> CalculateNextProcessDue;

private:
    void ProcessAllFiles(RunHost& host, RunObserver& observer, RunSummary& summary);
    bool ProcessFile(RunHost& host, RunObserver& observer, int index, const FileRecord& record,
                     RunSummary& summary);
    FileOutcome ProcessGuarded(const FileRecord& record, const RunSettings& settings);
    void ShowError(const AppError& error);

    RunServices& services_;
    TraceView& status_;
    FileProcessor processor_;
    RunLock* runLock_ = nullptr;
    bool busy_ = false;
    bool cancelRequested_ = false;
    QString lastErrorText_;
};

} // namespace quorvel
