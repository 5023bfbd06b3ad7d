#include "app/run/file_processor.h"

#include "app/run/directory_listing.h"
#include "app/run/transfer_decision.h"
#include "support/date_text.h"
#include "support/files.h"
#include "transfer/zip_codes.h"
#include "transfer/zip_steps.h"

#include <QFileInfo>

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

FilePlan FileProcessor::Locate(const FileRecord& record, const RunSettings& settings) const {
    FilePlan p;
    const LocationFolders folders = FoldersFor(settings, record);
    if (!CheckUserFolders(folders)) {
        p.kind = FilePlan::kNoUserFolders;
        return p;
    }
    if (IsCommandRecord(record, "FROMDATE")) {
        p.kind = FilePlan::kFromDate;
        return p;
    }
    const LocationPath local = ProcessFilename(folders, record.FileName, record.UserLocationID,
                                               record.AdminLocationID, false, kOnThisPc);
    const LocationPath remote = ProcessFilename(folders, record.FileName, record.UserLocationID,
                                                record.AdminLocationID, false, kAtService);
    if (!local.ok() || !remote.ok()) {
        p.kind = FilePlan::kRefused;
        p.refusal = local.ok() ? remote.refusal : local.refusal;
        return p;
    }
    if (IsCommandRecord(record, "DIR")) p.kind = FilePlan::kDirectory;
    p.local = local.path;
    p.remote = remote.path;
    return p;
}

void FileProcessor::Decide(FilePlan& p, const FileRecord& record, const RunSettings& settings) {
    const TransferRules rules = RulesOf(record);
    p.facts.downloadOnly = settings.downloadOnly;
    p.facts.localExists = FileExists(p.local);
    p.facts.listDay = DayFromText(record.FileDate);
    p.facts.localDay = DayFromText(record.FileDateLocal);
    if (NeedsRemoteCheck(rules, settings.downloadOnly)) {
        p.facts.remoteExists =
            services_.WholeFiles().RemoteFileExists(rules.zip ? ZipFileName(p.remote) : p.remote);
    }
    p.plan = DecideTransfers(rules, p.facts);
}

FilePlan FileProcessor::Plan(const FileRecord& record, const RunSettings& settings) {
    FilePlan p = Locate(record, settings);
    if (p.kind == FilePlan::kTransfer || p.kind == FilePlan::kDirectory)
        Decide(p, record, settings);
    return p;
}

FileOutcome FileProcessor::Process(const FileRecord& record, const RunSettings& settings) {
    FileOutcome out;
    out.record = record;
    FilePlan p = Locate(record, settings);
    switch (p.kind) {
    case FilePlan::kNoUserFolders:
        // The folder check has shown which folder it could not make.
        Fail(out, QStringLiteral("The user folders could not be made"));
        out.showReason = false;
        return out;
    case FilePlan::kFromDate:
        out.fromDateChoice = IsDateText(record.FileName) ? 1 : 0;
        out.afterDate = record.FileName;
        return out;
    case FilePlan::kRefused:
        Fail(out, p.refusal);
        return out;
    case FilePlan::kDirectory:
        // Written before the decision, so that an upload of it finds it.
        if (auto error = GenerateAllFiles(p.local, FoldersFor(settings, record), NowValue()))
            report_(*error);
        break;
    case FilePlan::kTransfer:
        break;
    }
    Decide(p, record, settings);
    if (p.plan.newerListDate) {
        trace_.AddTrace(QStringLiteral("Downloading: ") + p.remote +
                        QStringLiteral(" because new date: ") + record.FileDate +
                        QStringLiteral(" Local:") + record.FileDateLocal);
    }
    if (p.plan.download && !Download(record, p.local, p.remote, p.plan.downloadMethod, out))
        return out;
    if (p.plan.upload) Upload(record, p.local, p.remote, p.plan.uploadMethod, out);
    return out;
}

bool FileProcessor::Download(const FileRecord& record, const QString& local, const QString& remote,
                             int method, FileOutcome& out) {
    const QString localFile = record.Zip ? ZipFileName(local) : local;
    const QString remoteFile = record.Zip ? ZipFileName(remote) : remote;
    out.downloadedFile = localFile;
    out.sizeBefore = FileExists(localFile) ? QFileInfo(localFile).size() : -1;
    out.newRecords = method == kMethodOnlyNewData;
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
    out.uploadedFile = localFile;
    return true;
}

} // namespace quorvel
