#include "app/run/command_line_run.h"

#include "app/account_login.h"
#include "app/app_services.h"
#include "app/app_settings.h"
#include "app/file_list.h"
#include "app/run/list_run_host.h"
#include "app/run/plan_text.h"
#include "app/run/run_engine.h"
#include "app/run/run_lock.h"
#include "app/run/scheduler.h"
#include "app/run/transfer_decision.h"
#include "app/run/unattended_prompter.h"
#include "support/date_text.h"
#include "support/files.h"
#include "support/ini_store.h"
#include "support/log_file.h"
#include "support/program_home.h"
#include "support/texts.h"

#include <QFile>
#include <QFileInfo>
#include <QRegularExpression>

namespace quorvel {

namespace {

QString OneLine(const QString& text) {
    static const QRegularExpression lineEnds(QStringLiteral("\\s*(\r\n|\n|\r)\\s*"));
    return QString(text).replace(lineEnds, QStringLiteral(" | ")).trimmed();
}

QString ShortSize(std::int64_t bytes) {
    if (bytes < 1024) return QString::number(bytes) + QStringLiteral(" b");
    const char* units[] = {"Kb", "Mb", "Gb"};
    double value = static_cast<double>(bytes) / 1024.0;
    int unit = 0;
    while (value >= 1024.0 && unit < 2) {
        value /= 1024.0;
        ++unit;
    }
    return QString::number(value, 'f', 1) + u' ' + QLatin1String(units[unit]);
}

std::int64_t SizeOf(const QString& file) {
    const QFileInfo info(file);
    return info.exists() ? info.size() : 0;
}

// Lines that end in the part of the file from offset on.
std::int64_t LinesFrom(const QString& file, std::int64_t offset) {
    QFile in(file);
    if (!in.open(QIODevice::ReadOnly) || !in.seek(offset)) return 0;
    std::int64_t lines = 0;
    char previous = '\0';
    while (!in.atEnd()) {
        const QByteArray block = in.read(256 * 1024);
        for (const char c : block) {
            if (c == '\n' || (previous == '\r' && c != '\n')) ++lines;
            previous = c;
        }
    }
    return lines + (previous == '\r' ? 1 : 0);
}

QString Counted(std::int64_t count, const char* one, const char* many) {
    return FormatThousands(static_cast<double>(count)) + u' ' +
           QLatin1String(count == 1 ? one : many);
}

// What moved for one file, in a few words.
QString Movement(const FileRecord& record, const FileOutcome& out) {
    if (out.fromDateChoice) {
        return *out.fromDateChoice == 1
                   ? QStringLiteral("the records after it take data after ") + out.afterDate
                   : QStringLiteral("the records after it take new data");
    }
    QStringList parts;
    if (IsCommandRecord(record, "DIR")) parts << QStringLiteral("wrote the directory listing");
    if (out.downloaded) {
        const std::int64_t now = SizeOf(out.downloadedFile);
        if (out.newRecords) {
            // A file without dates is replaced, not appended to.
            const std::int64_t from =
                out.sizeBefore >= 0 && now >= out.sizeBefore ? out.sizeBefore : 0;
            const std::int64_t lines = LinesFrom(out.downloadedFile, from);
            parts << (lines == 0 ? QStringLiteral("no new records")
                                 : QStringLiteral("downloaded ") +
                                       Counted(lines, "new record", "new records"));
        } else {
            parts << QStringLiteral("downloaded ") + ShortSize(now);
        }
    }
    if (out.uploaded) {
        parts << (out.uploadedFile.isEmpty() ||
                          (record.MethodID == kMethodOnlyNewData && record.Zip == 0)
                      ? QStringLiteral("uploaded nothing (new records are not sent)")
                      : QStringLiteral("uploaded ") + ShortSize(SizeOf(out.uploadedFile)));
    }
    return parts.isEmpty() ? QStringLiteral("nothing to do") : parts.join(QStringLiteral(", "));
}

QString NameOf(const FileRecord& record) {
    return record.Name.isEmpty() ? record.FileName : record.Name;
}

// Prints one line per file as the engine walks the list.
class LinePrinter : public RunObserver {
public:
    LinePrinter(QTextStream& out, bool quiet, const QString& lastMessage)
        : out_(out), quiet_(quiet), lastMessage_(lastMessage) {}

    void FilesBegin(int activeCount) override { total_ = activeCount; }
    void FileBegins(int number, const FileRecord&) override {
        number_ = number;
        messageBefore_ = lastMessage_;
    }
    void FileEnds(const FileRecord& record, const FileOutcome& out) override {
        if (out.ok && quiet_) return;
        QString what;
        if (out.ok) {
            what = Movement(record, out);
        } else {
            // A failure that gave no reason of its own has shown one in a box.
            const QString reason = !out.reason.isEmpty() ? out.reason
                                   : lastMessage_ != messageBefore_
                                       ? lastMessage_
                                       : QStringLiteral("no reason given");
            what = QStringLiteral("failed: ") + OneLine(reason);
        }
        out_ << QStringLiteral("[%1/%2] ").arg(number_).arg(total_) << NameOf(record) << ": "
             << what << Qt::endl;
    }

private:
    QTextStream& out_;
    bool quiet_;
    const QString& lastMessage_;
    QString messageBefore_;
    int total_ = 0;
    int number_ = 0;
};

// The web-data object's status texts and traces are for a window; the run
// reports by its own lines.
class NoTrace : public TraceView {
public:
    void AddTrace(const QString&) override {}
    void ShowStatus(const QString&) override {}
};

LocationFolders FoldersOf(const AccountFields& f) {
    LocationFolders folders;
    folders.application = f.applicationFolder;
    folders.data = f.dataFolder;
    folders.user = f.userFolder;
    folders.userCurrent = f.userCurrentFolder;
    folders.web = f.webFolder;
    return folders;
}

AccountFields FieldsOf(const AppSettings& s) {
    AccountFields f;
    f.cfgUrl = s.cfgUrl;
    f.userId = s.userId;
    f.password = s.password;
    f.applicationFolder = s.applicationFolder;
    f.dataFolder = s.dataFolder;
    f.foldersFromAdministrator = s.getLocalFolders == 1;
    return f;
}

AccountSettings BaseAccount(const AppSettings& s) {
    AccountSettings a;
    a.fromDateChoice = s.whichdates == 1 ? 1 : 0;
    a.afterDate = s.afterDate;
    return a;
}

void DryRun(FileList& list, RunSettings settings, RunServices& services, QTextStream& out) {
    NoTrace trace;
    FileProcessor processor(services, trace, [](const AppError&) {});
    int total = 0;
    for (const FileRecord& record : list.Records())
        total += record.Active != 0 ? 1 : 0;
    int number = 0;
    for (int i = 0; i < list.Count(); ++i) {
        const FileRecord record = AsShownInFields(list.At(i));
        if (record.Active == 0) continue;
        const FilePlan plan = processor.Plan(record, settings);
        out << QStringLiteral("[%1/%2] ").arg(++number).arg(total) << NameOf(record) << ": "
            << DescribePlan(record, plan, settings.account) << Qt::endl;
        if (plan.kind == FilePlan::kFromDate) {
            settings.account.fromDateChoice = IsDateText(record.FileName) ? 1 : 0;
            settings.account.afterDate = record.FileName;
        }
    }
    out << QStringLiteral("Dry run: %1 file(s), nothing moved").arg(total) << Qt::endl;
}

} // namespace

int CommandLineRun::CouldNotStart(const QString& why) {
    err_ << "quorvel --run-all: " << OneLine(why) << Qt::endl;
    WriteLogFile(QStringLiteral("Run of all files from the command line could not start: ") +
                 OneLine(why));
    return kCouldNotStart;
}

int CommandLineRun::Exec() {
    RunLock lock;
    if (!options_.dryRun && !lock.TryAcquire()) {
        const QString holder = lock.Holder();
        err_ << "quorvel --run-all: another run holds the run lock " << lock.Path()
             << (holder.isEmpty() ? QString() : QStringLiteral(" (") + holder + u')') << Qt::endl;
        return kLockHeld;
    }
    QString lastMessage;
    if (auto* prompter = dynamic_cast<UnattendedPrompter*>(&CurrentPrompter()))
        prompter->SetWatcher([&lastMessage](const QString& message) { lastMessage = message; });

    LocalSettings settings(ProgramHome::SettingsFile());
    AppSettings values;
    if (const auto error = values.Load(settings))
        return CouldNotStart(QStringLiteral("The settings in %1 cannot be read: %2 (%3)")
                                 .arg(settings.Path(), error->description, error->where));
    if (values.cfgUrl.isEmpty())
        return CouldNotStart(QStringLiteral("No configuration file address (CFG_URL) in %1: log "
                                            "in once from the window, or set it there")
                                 .arg(settings.Path()));

    // The window may have moved the password into the desktop's secret store,
    // which a run from cron cannot reach: say so rather than "Login failed".
    if (values.password.isEmpty())
        return CouldNotStart(QStringLiteral("No password for user %1: neither %2 nor a secret "
                                            "store that answers here holds one (run inside the "
                                            "desktop session, or set Password in %2)")
                                 .arg(values.userId, settings.Path()));

    NoTrace trace;
    AppServices services;
    services.SetViews(&trace, nullptr, nullptr);
    AccountFields fields = FieldsOf(values);
    const AccountSettings base = BaseAccount(values);
    AccountLogin login(services, trace);
    if (!login.GetSecureFTPDetails(fields))
        return CouldNotStart(QStringLiteral("Could not get details from: ") + fields.cfgUrl +
                             QStringLiteral(" (") + login.LastError() + u')');
    if (!login.GetUserDetails(fields, base))
        return CouldNotStart(QStringLiteral("Login failed: ") + login.LastError());

    FileList list;
    if (fields.foldersFromAdministrator) {
        if (!login.GetFileListFromServer(fields, base, list))
            return CouldNotStart(QStringLiteral("Could not get the file list from ") +
                                 FileListAddress(fields.httpServer, fields.userFolder) +
                                 QStringLiteral(": ") + login.LastError());
        for (const AppError& error : login.LoadErrors())
            err_ << "quorvel --run-all: " << OneLine(error.description) << Qt::endl;
    } else {
        if (!FileExists(values.loadedFile))
            return CouldNotStart(QStringLiteral("No file list: ") + values.loadedFile +
                                 QStringLiteral(" does not exist"));
        const ListLoadResult loaded = list.LoadDataFile(values.loadedFile);
        for (const AppError& error : loaded.errors)
            err_ << "quorvel --run-all: " << OneLine(error.description) << Qt::endl;
        if (!loaded.ok) return CouldNotStart(QStringLiteral("The file list cannot be read"));
    }

    RunSettings run;
    run.folders = FoldersOf(fields);
    run.account = WithAccount(base, fields);
    run.downloadOnly = values.downloadOnly != 0;
    if (!CheckDataFolders(run.folders))
        return CouldNotStart(
            QStringLiteral("The folders cannot be used: ") + run.folders.application +
            QStringLiteral(", ") + run.folders.data +
            (lastMessage.isEmpty() ? QString() : QStringLiteral(" (") + lastMessage + u')'));

    if (options_.dryRun) {
        DryRun(list, run, services, out_);
        services.CloseFtp();
        return kAllDone;
    }

    WriteLogFile(QStringLiteral("Run of all files from the command line: ") + list.LoadedFile);
    RunEngine engine(services, trace);
    engine.SetRunLock(&lock);
    QString nextDue = values.nextDownloadDue;
    engine.CalculateNextProcessDue = [&] {
        const DueLabels labels =
            CalculateNextProcessDue(values.automatic == 1, values.interval, NowValue());
        if (labels.kind == DueLabels::kDue || labels.kind == DueLabels::kManual)
            nextDue = labels.next;
    };
    ListRunHost host(list, run);
    LinePrinter printer(out_, options_.quiet, lastMessage);
    const RunSummary summary = engine.Process(RunEngine::kProcessAll, host, printer);
    services.CloseFtp();
    if (summary.lockHeld) return kLockHeld;
    if (!summary.ran) return CouldNotStart(QStringLiteral("The folders cannot be used"));

    const bool saved = settings.SaveLocalSetting(QStringLiteral("LastDownload"), host.LastRun()) &&
                       settings.SaveLocalSetting(QStringLiteral("NextDownloadDue"), nextDue);
    if (!saved) err_ << "quorvel --run-all: " << settings.LastError() << Qt::endl;
    const QString result = QStringLiteral("Processed %1 file(s): %2 succeeded, %3 failed")
                               .arg(summary.processed)
                               .arg(summary.processed - summary.failed)
                               .arg(summary.failed);
    if (!options_.quiet) out_ << result << Qt::endl;
    WriteLogFile(QStringLiteral("Run of all files from the command line ended. ") + result);
    return summary.failed > 0 || !saved ? kSomeFailed : kAllDone;
}

} // namespace quorvel
