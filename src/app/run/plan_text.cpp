#include "app/run/plan_text.h"

#include "support/date_text.h"

namespace quorvel {

namespace {

QString DayText(std::int32_t day) {
    return day > 0 ? FormatDate(day, QStringLiteral("d mmm yyyy")) : QStringLiteral("none");
}

QString DateReason(const TransferFacts& facts, bool later) {
    return QStringLiteral("Date: the list's date %1 is %2 the local copy's %3")
        .arg(DayText(facts.listDay),
             later ? QStringLiteral("later than") : QStringLiteral("not later than"),
             DayText(facts.localDay));
}

QString DownloadReason(const FileRecord& record, const FilePlan& p) {
    if (p.facts.downloadOnly) return QStringLiteral("Download only");
    switch (record.Download) {
    case kDownloadAlways:
        return QStringLiteral("Always");
    case kDownloadOnce:
        return p.facts.localExists ? QStringLiteral("Once: the local copy exists")
                                   : QStringLiteral("Once: there is no local copy yet");
    case kDownloadDate:
        return DateReason(p.facts, p.plan.download);
    default:
        return QStringLiteral("Never");
    }
}

QString UploadReason(const FileRecord& record, const FilePlan& p) {
    if (p.facts.downloadOnly) return QStringLiteral("Download only");
    if (p.plan.download && !p.facts.localExists && record.MethodID == kMethodOnlyNewData &&
        !record.Zip && record.Upload != kUploadNever)
        return QStringLiteral("nothing local to send");
    switch (record.Upload) {
    case kUploadAlways:
        return QStringLiteral("Always");
    case kUploadOnce:
        return p.facts.remoteExists ? QStringLiteral("Once: the service has it")
                                    : QStringLiteral("Once: the service does not have it yet");
    default:
        return QStringLiteral("Never");
    }
}

QString What(int method, bool zip, const AccountSettings& account, bool down) {
    if (method != kMethodOnlyNewData)
        return zip ? QStringLiteral("the complete file, zipped")
                   : QStringLiteral("the complete file");
    if (!down)
        return QStringLiteral("new records (nothing is sent: the service takes files by FTP)");
    if (account.fromDateChoice == 1)
        return QStringLiteral("new records after ") + account.afterDate;
    return QStringLiteral("new records after the local copy's last record");
}

} // namespace

QString DescribePlan(const FileRecord& record, const FilePlan& p, const AccountSettings& account) {
    switch (p.kind) {
    case FilePlan::kNoUserFolders:
        return QStringLiteral("would fail: the user folders could not be made");
    case FilePlan::kRefused:
        return QStringLiteral("would fail: ") + p.refusal;
    case FilePlan::kFromDate:
        return IsDateText(record.FileName)
                   ? QStringLiteral("the records after it take data after ") + record.FileName
                   : QStringLiteral("the records after it take new data");
    case FilePlan::kTransfer:
    case FilePlan::kDirectory:
        break;
    }
    QString line =
        p.kind == FilePlan::kDirectory
            ? QStringLiteral("write the directory listing to ") + p.local + QStringLiteral("; ")
            : QString();
    const bool zip = record.Zip != 0;
    line += p.plan.download
                ? QStringLiteral("download ") + What(p.plan.downloadMethod, zip, account, true) +
                      QStringLiteral(" from ") + p.remote + QStringLiteral(" to ") + p.local
                : QStringLiteral("no download");
    line += QStringLiteral(" (") + DownloadReason(record, p) + QStringLiteral("); ");
    line += p.plan.upload
                ? QStringLiteral("upload ") + What(p.plan.uploadMethod, zip, account, false) +
                      QStringLiteral(" from ") + p.local + QStringLiteral(" to ") + p.remote
                : QStringLiteral("no upload");
    line += QStringLiteral(" (") + UploadReason(record, p) + u')';
    return line;
}

} // namespace quorvel
