#include "app/file_list.h"

#include "app/file_list_format.h"
#include "support/files.h"
#include "support/paths.h"

#include <QFile>
#include <QSaveFile>

namespace quorvel {

namespace {

constexpr const char* kOverflow = "Overflow";
constexpr const char* kLocalListName = "files.txt";

// The whole file, or nullopt with the reason when it cannot be read.
std::optional<QByteArray> ReadWholeFile(const QString& path, QString* reason) {
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        *reason = file.errorString();
        return std::nullopt;
    }
    QByteArray bytes = file.readAll();
    if (file.error() != QFileDevice::NoError) {
        *reason = file.errorString();
        return std::nullopt;
    }
    return bytes;
}

} // namespace

bool FileList::Insert(int index, FileRecord record) {
    if (Count() >= kMaxRecords || index < 0 || index > Count()) return false;
    records_.insert(records_.begin() + index, std::move(record));
    return true;
}

void FileList::Remove(int index) {
    if (index >= 0 && index < Count()) records_.erase(records_.begin() + index);
}

bool FileList::Move(int index, int delta) {
    const int other = index + delta;
    if (index < 0 || index >= Count() || other < 0 || other >= Count()) return false;
    std::swap(records_[index], records_[other]);
    return true;
}

std::optional<AppError> FileList::LoadFilesRecord(const QString& line) {
    ParsedRecordLine parsed = ParseFileRecordLine(line);
    if (parsed.kind == ParsedRecordLine::kNotRecord) return std::nullopt;
    if (!Insert(Count(), std::move(parsed.record))) {
        return AppError{kOverflow, QStringLiteral("LoadFilesRecord: ") + line};
    }
    if (parsed.kind == ParsedRecordLine::kOverflow) {
        return AppError{kOverflow, QStringLiteral("LoadFilesRecord: ") + line};
    }
    return std::nullopt;
}

ListLoadResult FileList::LoadDataFile(const QString& path) {
    ListLoadResult result;
    records_.clear();
    if (FileExists(path)) {
        QString reason;
        const auto bytes = ReadWholeFile(path, &reason);
        if (!bytes) {
            result.ok = false;
            result.errors.push_back({reason, QStringLiteral("LoadDataFile:") + path});
        } else {
            for (const QString& line : SplitListText(*bytes)) {
                if (auto error = LoadFilesRecord(line)) result.errors.push_back(*error);
            }
        }
    }
    LoadedFile = path;
    return result;
}

std::optional<AppError> FileList::SaveFileList(const LocationFolders& folders) {
    if (!ListChanged) return std::nullopt;
    if (!CheckDataFolders(folders)) return std::nullopt;
    if (auto error = WriteTo(LoadedFile)) return error;
    ListChanged = false;
    return std::nullopt;
}

std::optional<AppError> FileList::SaveFileListAs(const QString& path,
                                                 const LocationFolders& folders) {
    LoadedFile = path;
    ListChanged = true;
    return SaveFileList(folders);
}

std::optional<AppError> FileList::WriteTo(const QString& path,
                                          const std::function<bool(int)>& keepGoing) const {
    const QString where = QStringLiteral("SaveFileList:") + path;
    if (path.isEmpty()) return AppError{QStringLiteral("No file name"), where};
    QSaveFile file(path);
    if (!file.open(QIODevice::WriteOnly)) return AppError{file.errorString(), where};
    int written = 0;
    for (const FileRecord& record : records_) {
        const QByteArray line = FormatFileRecordLine(record).toUtf8() + "\r\n";
        if (file.write(line) != line.size()) return AppError{file.errorString(), where};
        ++written;
        if (keepGoing && !keepGoing(written)) {
            file.cancelWriting();
            return AppError{QStringLiteral("The save was stopped"), where};
        }
    }
    if (!file.commit()) return AppError{file.errorString(), where};
    return std::nullopt;
}

std::optional<AppError> FileList::LoadLocalDates(const QString& applicationFolder) {
    const QString path = AddTrailingSlash(applicationFolder) + kLocalListName;
    if (!FileExists(path)) return std::nullopt;
    const QString where = QStringLiteral("LoadLocalDates");
    QString reason;
    const auto bytes = ReadWholeFile(path, &reason);
    if (!bytes) return AppError{reason, where};
    for (const QString& line : SplitListText(*bytes)) {
        const QStringList tokens = line.split(kListFieldSeparator);
        if (!IsNumericText(tokens.first())) continue;
        const auto id = FileFieldNumber(tokens, 0);
        if (!id) return AppError{kOverflow, where};
        for (FileRecord& record : records_) {
            if (record.FileID == *id) {
                record.FileDateLocal = FileField(tokens, 12);
                break;
            }
        }
    }
    return std::nullopt;
}

int AddNewFileRecord(FileList& list, const LocationFolders& folders, const QString& path,
                     int before) {
    const AnalysedFilename found = AnalyseFilename(folders, path);
    const int index = before < 0 || before > list.Count() ? list.Count() : before;
    const auto location = static_cast<std::int16_t>(found.locationId);
    if (!list.Insert(index, NewFileRecord(found.name, location, found.folder))) return -1;
    list.ListChanged = true;
    return index;
}

} // namespace quorvel
