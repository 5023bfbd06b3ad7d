#pragma once
// Where the FTP module tells what it does: trace lines, the status text and
// the progress of the running transfer. Also keeps the window responsive while
// a transfer blocks, by letting the event loop run from the transfer's
// callbacks.

#include "support/ports.h"

#include <QString>

#include <cstdint>

namespace quorvel {

// Numbers shown at the end of every trace line, so that a reader of the trace
// can tell which connection an event belongs to. 0 means "none".
struct HandleIds {
    long callback = 0;
    long connection = 0;
    long internet = 0;
};

enum class TransferState : int { None = 0, Download = 3, Upload = 5 };

// Counters of the running transfer (64-bit: files may exceed 4 GiB).
struct TransferCounters {
    TransferState state = TransferState::None;
    std::int64_t sent = 0;
    std::int64_t received = 0;
    std::int64_t total = 0;
    QString currentFile;
};

class FtpReport {
public:
    explicit FtpReport(const HandleIds& ids) : ids_(ids) {}

    void SetDisplay(TraceView* trace, ProgressView* progress);
    void SetTracing(bool on) { tracing_ = on; }
    // True when a trace line would be shown; callers skip building texts otherwise.
    bool Tracing() const { return tracing_ && trace_ != nullptr; }

    void Trace(const QString& text);
    void Status(const QString& text);
    // Lets pending events run.
    void Pump();

    TransferCounters& Counters() { return counters_; }
    const TransferCounters& Counters() const { return counters_; }
    void ProgressStart(TransferState state, std::int64_t total, const QString& text);
    void Progress(std::int64_t bytes);
    void ProgressFinish();

private:
    const HandleIds& ids_;
    TraceView* trace_ = nullptr;
    ProgressView* progress_ = nullptr;
    bool tracing_ = false;
    TransferCounters counters_;
    std::int64_t shownBytes_ = -1;
};

// "50%" for bytes within a known total, empty otherwise.
QString PercentText(std::int64_t bytes, std::int64_t total);

} // namespace quorvel
