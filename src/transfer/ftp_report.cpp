#include "transfer/ftp_report.h"

#include "support/texts.h"

#include <QCoreApplication>

namespace quorvel {

void FtpReport::SetDisplay(TraceView* trace, ProgressView* progress) {
    trace_ = trace;
    progress_ = progress;
}

void FtpReport::Trace(const QString& text) {
    if (Tracing()) {
        const QString time = CurrentClock().Now().toString(QStringLiteral("HH:mm:ss"));
        trace_->AddTrace(QStringLiteral("TraceFTP:") + time + QLatin1Char(':') + text +
                         QStringLiteral(" Callback=") + QString::number(ids_.callback) +
                         QStringLiteral(" ftpConnection=") + QString::number(ids_.connection) +
                         QStringLiteral(" Internet=") + QString::number(ids_.internet));
    }
    Pump();
}

void FtpReport::Status(const QString& text) {
    if (trace_ != nullptr) trace_->ShowStatus(text);
    Trace(QStringLiteral("StatusFTP:") + text);
}

void FtpReport::Pump() {
    // curl reports once per received block (up to half a megabyte), so this
    // runs often enough for the window and rarely enough to cost nothing.
    if (QCoreApplication::instance() != nullptr) QCoreApplication::processEvents();
}

void FtpReport::ProgressStart(TransferState state, std::int64_t total, const QString& text) {
    counters_.state = state;
    counters_.total = total;
    counters_.sent = 0;
    counters_.received = 0;
    shownBytes_ = -1;
    if (progress_ != nullptr) progress_->Initialise(total, 3, QStringLiteral("bytes"));
    Status(text);
    Trace(text);
}

void FtpReport::Progress(std::int64_t bytes) {
    if (Tracing()) {
        Trace(QStringLiteral("FTPProgress: ") + QString::number(bytes) + QLatin1Char('/') +
              QString::number(counters_.total) + QStringLiteral(" = ") +
              PercentText(bytes, counters_.total));
    }
    // The bar only changes when the count does; curl reports far more often.
    if (progress_ != nullptr && bytes != shownBytes_) {
        shownBytes_ = bytes;
        progress_->Show(bytes, counters_.currentFile);
    }
}

void FtpReport::ProgressFinish() {
    if (progress_ != nullptr) progress_->Finish();
    Status(QString());
}

QString PercentText(std::int64_t bytes, std::int64_t total) {
    if (total <= 0 || bytes > total) return QString();
    return FormatPercent(static_cast<double>(bytes) / static_cast<double>(total));
}

} // namespace quorvel
