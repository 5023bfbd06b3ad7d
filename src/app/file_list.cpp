#include "app/file_list.h"

#include "app/file_list_format.h"
#include "support/files.h"
#include "support/paths.h"
#include "support/replacing_file.h"

#include <QFile>

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

QString Counted(qsizetype count, const char* one, const char* many) {
    return QString::number(count) + u' ' + QLatin1String(count == 1 ? one : many);
}

// What kept lines of a list file out of the list, gathered for one report:
// a list of 40,000 records must not bring 7,233 message boxes.
struct Refusals {
    int beyondLimit = 0;
    std::vector<AppError> overflows;
    std::vector<int> tooLong; // line numbers

    std::optional<AppError> Report(const QString& path) const {
        if (beyondLimit == 0 && tooLong.empty() && overflows.size() == 1) return overflows[0];
        QStringList parts;
        if (beyondLimit > 0) {
            parts << Counted(beyondLimit, "record was", "records were") +
                         QStringLiteral(" not loaded: a file list holds at most ") +
                         QString::number(FileList::kMaxRecords) + QStringLiteral(" records");
        }
        if (!overflows.empty()) {
            parts << QStringLiteral("Overflow in ") +
                         Counted(static_cast<qsizetype>(overflows.size()), "record", "records") +
                         QStringLiteral(": a number above 32767 or below -32768 (the first: ") +
                         overflows[0].where + u')';
        }
        if (!tooLong.empty()) {
            parts << Counted(static_cast<qsizetype>(tooLong.size()), "line was", "lines were") +
                         QStringLiteral(" not read: longer than 1 MiB (") +
                         QLatin1String(tooLong.size() == 1 ? "line " : "the first: line ") +
                         QString::number(tooLong[0]) + u')';
        }
        if (parts.isEmpty()) return std::nullopt;
        return AppError{parts.join(QStringLiteral("\r\n")), QStringLiteral("LoadDataFile:") + path};
    }
};

// Lines go to the disk in blocks: one system call per line would make a long
// list slow to save.
constexpr qsizetype kWriteBlock = 64 * 1024;

} // namespace

bool FileList::Insert(int index, FileRecord record) {
    if (Count() >= kMaxRecords || index < 0 || index > Count()) return false;
    records_.insert(records_.begin() + index, std::move(record));
    readAsLatin1_.insert(readAsLatin1_.begin() + index, false);
    return true;
}

void FileList::Remove(int index) {
    if (index < 0 || index >= Count()) return;
    records_.erase(records_.begin() + index);
    readAsLatin1_.erase(readAsLatin1_.begin() + index);
}

bool FileList::Move(int index, int delta) {
    const int other = index + delta;
    if (index < 0 || index >= Count() || other < 0 || other >= Count()) return false;
    std::swap(records_[index], records_[other]);
    std::vector<bool>::swap(readAsLatin1_[index], readAsLatin1_[other]);
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
    Clear();
    if (FileExists(path)) {
        QString reason;
        const auto bytes = ReadWholeFile(path, &reason);
        if (!bytes) {
            result.ok = false;
            result.errors.push_back({reason, QStringLiteral("LoadDataFile:") + path});
        } else {
            result = LoadListBytes(*bytes, path);
        }
    }
    LoadedFile = path;
    // A list just read is what its file holds: nothing to write back (an
    // earlier list's changes must not make this one be rewritten at exit).
    ListChanged = false;
    return result;
}

ListLoadResult FileList::LoadListBytes(const QByteArray& bytes, const QString& source) {
    ListLoadResult result;
    Clear();
    Refusals refused;
    int number = 0;
    for (const ByteLine& line : SplitListLines(bytes)) {
        ++number;
        if (line.text.size() > kMaxListLineBytes) {
            refused.tooLong.push_back(number);
            continue;
        }
        const bool full = Count() >= kMaxRecords;
        if (auto error = LoadLine(line)) {
            if (full)
                ++refused.beyondLimit;
            else
                refused.overflows.push_back(*error);
        }
    }
    if (auto report = refused.Report(source)) result.errors.push_back(*report);
    return result;
}

std::optional<AppError> FileList::LoadLine(const ByteLine& line) {
    const int before = Count();
    auto error = LoadFilesRecord(DecodeLine(line.text));
    if (Count() > before) readAsLatin1_.back() = !IsValidUtf8(line.text);
    return error;
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
    ReplacingFile file(path);
    if (!file.Open()) return AppError{file.ErrorText(), where};
    QByteArray block;
    for (int i = 0; i < Count(); ++i) {
        block += EncodeListLine(FormatFileRecordLine(records_[i]), readAsLatin1_[i]) + "\r\n";
        if (keepGoing && !keepGoing(i + 1)) {
            file.Cancel();
            return AppError{QStringLiteral("The save was stopped"), where};
        }
        if (block.size() >= kWriteBlock) {
            if (!file.Write(block)) return AppError{file.ErrorText(), where};
            block.clear();
        }
    }
    if (!file.Write(block) || !file.Commit()) return AppError{file.ErrorText(), where};
    return std::nullopt;
}

std::optional<AppError> FileList::LoadLocalDates(const QString& applicationFolder) {
    const QString path = AddTrailingSlash(applicationFolder) + kLocalListName;
    if (!FileExists(path)) return std::nullopt;
    const QString where = QStringLiteral("LoadLocalDates");
    QString reason;
    const auto bytes = ReadWholeFile(path, &reason);
    if (!bytes) return AppError{reason, where};
    for (const ByteLine& line : SplitListLines(*bytes)) {
        if (line.text.size() > kMaxListLineBytes) continue;
        const QStringList tokens = DecodeLine(line.text).split(kListFieldSeparator);
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
