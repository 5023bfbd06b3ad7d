#pragma once
// One run at a time per program home: a lock file in the home, held by
// whoever runs (the window's "Process", a scheduler tick, the command-line
// run) for the whole run. Another process finds it held; a lock left by a
// process that was killed is taken over.
//
// A process holds it through one RunLock object; TryAcquire nests within that
// object (the command-line run holds it from start to end, and the engine
// takes it again for the run itself).

#include <QLockFile>
#include <QString>

#include <memory>

namespace quorvel {

class RunLock {
public:
    // The lock of the program home in use (ProgramHome::Folder()).
    RunLock();
    explicit RunLock(const QString& folder);
    ~RunLock();
    RunLock(const RunLock&) = delete;
    RunLock& operator=(const RunLock&) = delete;

    // False when another process holds it.
    bool TryAcquire();
    void Release();
    bool IsHeld() const { return depth_ > 0; }

    QString Path() const { return path_; }
    // Who holds it, for a message ("process 1234"); empty when unknown.
    QString Holder() const;

    static constexpr const char* kFileName = "quorvel-run.lock";

private:
    QString path_;
    std::unique_ptr<QLockFile> file_;
    int depth_ = 0;
};

// Holds a RunLock for its lifetime when it could be taken.
class RunLockHold {
public:
    explicit RunLockHold(RunLock* lock) : lock_(lock), held_(!lock || lock->TryAcquire()) {}
    ~RunLockHold() {
        if (lock_ && held_) lock_->Release();
    }
    RunLockHold(const RunLockHold&) = delete;
    RunLockHold& operator=(const RunLockHold&) = delete;
    bool Held() const { return held_; }

private:
    RunLock* lock_;
    bool held_;
};

} // namespace quorvel
