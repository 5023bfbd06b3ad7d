#include "app/run/file_processor.h"

#include "app/run/directory_listing.h"
#include "app/run/transfer_decision.h"
#include "support/date_text.h"
#include "support/files.h"
#include "transfer/zip_codes.h"
#include "transfer/zip_steps.h"

namespace quorvel {

namespace {

LocationFolders FoldersFor(const RunSettings& settings, const FileRecord& record) {
    LocationFolders folders = settings.folders;
    folders.other = record.Folder;
    return folders;
}

} // namespace

bool IsCommandRecord(const FileRecord& record, const char* word) {
    return record.Name.compare(QLatin1String(word), Qt::CaseInsensitive) == 0;
}

FileProcessor::FileProcessor(RunServices& services, TraceView& trace,
                             std::function<void(const AppError&)> report)
    : services_(services), trace_(trace), report_(std::move(report)) {}

bool FileProcessor::Fail(FileOutcome& out, const QString& reason) {
    out.ok = false;
    out.reason = reason;
    return false;
}

FileOutcome FileProcessor::Process(const FileRecord& record, const RunSettings& settings) {
    FileOutcome out;
    out.record = record;
    const LocationFolders folders = FoldersFor(settings, record);
    if (!CheckUserFolders(folders)) {
        // The folder check has shown which folder it could not make.
        Fail(out, QStringLiteral("The user folders could not be made"));
        out.showReason = false;
        return out;
    }
    if (IsCommandRecord(record, "FROMDATE")) {
        out.fromDateChoice = IsDateText(record.FileName) ? 1 : 0;
        out.afterDate = record.FileName;
        return out;
    }
    const LocationPath local = ProcessFilename(folders, record.FileName, record.UserLocationID,
                                               record.AdminLocationID, false, kOnThisPc);
    const LocationPath remote = ProcessFilename(folders, record.FileName, record.UserLocationID,
                                                record.AdminLocationID, false, kAtService);
    if (!local.ok() || !remote.ok()) {
        Fail(out, local.ok() ? remote.refusal : local.refusal);
        return out;
    }
    if (IsCommandRecord(record, "DIR")) {
        if (auto error = GenerateAllFiles(local.path, folders, NowValue())) report_(*error);
    }

    const TransferRules rules = RulesOf(record);
    TransferFacts facts;
    facts.downloadOnly = settings.downloadOnly;
    facts.localExists = FileExists(local.path);
    facts.listDay = DayFromText(record.FileDate);
    facts.localDay = DayFromText(record.FileDateLocal);
    if (NeedsRemoteCheck(rules, settings.downloadOnly)) {
        facts.remoteExists = services_.WholeFiles().RemoteFileExists(
            rules.zip ? ZipFileName(remote.path) : remote.path);
    }
    const TransferPlan plan = DecideTransfers(rules, facts);
    if (plan.newerListDate) {
        trace_.AddTrace(QStringLiteral("Downloading: ") + remote.path +
                        QStringLiteral(" because new date: ") + record.FileDate +
                        QStringLiteral(" Local:") + record.FileDateLocal);
    }
    if (plan.download && !Download(record, local.path, remote.path, plan.downloadMethod, out))
        return out;
    if (plan.upload) Upload(record, local.path, remote.path, plan.uploadMethod, out);
    return out;
}

bool FileProcessor::Download(const FileRecord& record, const QString& local, const QString& remote,
                             int method, FileOutcome& out) {
    const QString localFile = record.Zip ? ZipFileName(local) : local;
    const QString remoteFile = record.Zip ? ZipFileName(remote) : remote;
    if (method == kMethodOnlyNewData) {
        NewRecordsChannel& channel = services_.NewRecords();
        if (!channel.GetNewData(localFile, record.UserLocationID, record.TypeID))
            return Fail(out, channel.LastError());
    } else {
        WholeFileChannel& channel = services_.WholeFiles();
        if (!channel.Download(remoteFile, localFile)) return Fail(out, channel.LastError());
    }
    if (record.Zip) {
        const int code = UnzipAfterDownload(localFile, services_.TransferProgress());
        if (IsZipError(code)) return Fail(out, ZipErrorText(code, QStringLiteral("UnZip")));
    }
    // Only a download that arrived whole and unpacked takes the list's date, so
    // a failed one is tried again by the next run.
    if (record.Download == kDownloadDate) out.record.FileDateLocal = record.FileDate;
    out.downloaded = true;
    return true;
}

bool FileProcessor::Upload(const FileRecord& record, const QString& local, const QString& remote,
                           int method, FileOutcome& out) {
    QString localFile = local;
    QString remoteFile = remote;
    if (record.Zip) {
        const ZipStepResult zipped = ZipForUpload(local, services_.TransferProgress());
        if (IsZipError(zipped.code)) return Fail(out, ZipUploadErrorText(zipped, local));
        localFile = zipped.zipFile;
        remoteFile = ZipFileName(remote);
    }
    if (method == kMethodOnlyNewData) {
        NewRecordsChannel& channel = services_.NewRecords();
        if (!channel.SendNewData(localFile, record.UserLocationID, record.TypeID))
            return Fail(out, channel.LastError());
    } else {
        WholeFileChannel& channel = services_.WholeFiles();
        if (!channel.Upload(localFile, remoteFile)) return Fail(out, channel.LastError());
    }
    out.uploaded = true;
    return true;
}

} // namespace quorvel
