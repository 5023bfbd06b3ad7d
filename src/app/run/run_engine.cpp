#include "app/run/run_engine.h"

#include "app/run/run_lock.h"
#include "app/run/run_prompter.h"
#include "app/run/transfer_decision.h"
#include "support/date_value.h"

#include <QCoreApplication>
#include <QScopeGuard>

#include <exception>

namespace quorvel {

namespace {

// Lets the window (or whoever runs an event loop) handle "Cancel" and paint.
void PumpEvents() {
    if (QCoreApplication::instance() != nullptr) QCoreApplication::processEvents();
}

} // namespace

RunEngine::RunEngine(RunServices& services, TraceView& status)
    : services_(services), status_(status),
      processor_(services, status, [this](const AppError& error) { ShowError(error); }) {}

void RunEngine::Cancel() {
    cancelRequested_ = true;
    services_.Cancel();
}

void RunEngine::ShowError(const AppError& error) {
    CurrentPrompter().MyMsgBox(ErrorBoxText(error), kButtonsOk | kIconExclamation);
}

RunSummary RunEngine::Process(int which, RunHost& host, RunObserver& observer) {
    RunSummary summary;
    if (busy_) return summary;
    const RunLockHold lock(runLock_);
    if (!lock.Held()) {
        summary.lockHeld = true;
        return summary;
    }
    BusyGuard pointer(CurrentBusyPointer());
    RunPromptScope prompts([&observer] { observer.MessageShown(); });
    busy_ = true;
    cancelRequested_ = false;
    lastErrorText_.clear();
    const auto idle = qScopeGuard([&] {
        busy_ = false;
        observer.BusyChanged(false);
    });
    observer.BusyChanged(true);
    if (!CheckDataFolders(host.Settings().folders)) return summary;
    summary.ran = true;
    if (which == kProcessAll) {
        ProcessAllFiles(host, observer, summary);
        host.StampLastRun(FormatDate(NowValue(), QString::fromLatin1(kPatternLong)));
        if (CalculateNextProcessDue) CalculateNextProcessDue();
    } else if (which == kProcessFile) {
        const int index = host.CurrentEntry();
        if (index >= 0) {
            const FileRecord record = AsShownInFields(host.BeginFile(index));
            ++summary.processed;
            ProcessFile(host, observer, index, record, summary);
        }
    }
    summary.cancelled = cancelRequested_;
    return summary;
}

void RunEngine::ProcessAllFiles(RunHost& host, RunObserver& observer, RunSummary& summary) {
    observer.FilesBegin(host.ActiveCount());
    for (int i = 0; i < host.EntryCount(); ++i) {
        const FileRecord record = AsShownInFields(host.BeginFile(i));
        if (record.Active != 0) {
            ++summary.processed;
            observer.FileBegins(summary.processed, record);
            if (!ProcessFile(host, observer, i, record, summary) && !cancelRequested_ &&
                CurrentPrompter().MyMsgBox(QStringLiteral("Continue ?"),
                                           kButtonsYesNo | kIconQuestion) == kAnswerNo)
                cancelRequested_ = true;
        }
        PumpEvents();
        if (cancelRequested_) break;
    }
    if (const auto error = host.SaveFileList()) ShowError(*error);
    observer.FilesEnd(summary.processed);
    status_.ShowStatus(QStringLiteral("Processed %1 file(s)").arg(summary.processed));
}

bool RunEngine::ProcessFile(RunHost& host, RunObserver& observer, int index,
                            const FileRecord& record, RunSummary& summary) {
    const RunSettings settings = host.Settings();
    services_.Configure(settings.account);
    const FileOutcome out = ProcessGuarded(record, settings);
    if (out.fromDateChoice) host.SetFromDate(*out.fromDateChoice, out.afterDate);
    host.EndFile(index, out.record);
    observer.FileEnds(record, out);
    if (out.ok) return true;
    ++summary.failed;
    lastErrorText_ = out.reason;
    if (cancelRequested_) {
        // The user stopped the run; the file's failure is no news to ask about.
        status_.AddTrace(QStringLiteral("Cancelled: ") + record.Name + QStringLiteral(": ") +
                         out.reason);
    } else if (out.showReason) {
        CurrentPrompter().MyMsgBox(out.reason, kButtonsOk);
    }
    return false;
}

FileOutcome RunEngine::ProcessGuarded(const FileRecord& record, const RunSettings& settings) {
    try {
        return processor_.Process(record, settings);
    } catch (const std::exception& error) {
        FileOutcome out;
        out.record = record;
        out.ok = false;
        out.showReason = false;
        out.reason = QString::fromLocal8Bit(error.what());
        ShowError({out.reason, QStringLiteral("ProcessFile")});
        return out;
    }
}

} // namespace quorvel
