#pragma once
// The file list in memory: the records in list-box order, the file they came
// from and whether they differ from it.

#include "app/app_error.h"
#include "app/file_record.h"
#include "app/locations.h"
#include "support/text_lines.h"

#include <QString>

#include <functional>
#include <optional>
#include <vector>

namespace quorvel {

struct ListLoadResult {
    bool ok = true;               // false: the file could not be read
    std::vector<AppError> errors; // each one for the error box, in order
};

class FileList {
public:
    // The record count is a 16-bit number.
    static constexpr int kMaxRecords = 32767;

    int Count() const { return static_cast<int>(records_.size()); }
    bool IsEmpty() const { return records_.empty(); }
    // index is the list-box index (record number - 1).
    const FileRecord& At(int index) const { return records_.at(index); }
    FileRecord& At(int index) { return records_.at(index); }
    const std::vector<FileRecord>& Records() const { return records_; }

    // Empties the records; LoadedFile and ListChanged are left alone.
    void Clear() {
        records_.clear();
        readAsLatin1_.clear();
    }
    // Inserts before index (at the end when index is Count()); false when full.
    bool Insert(int index, FileRecord record);
    void Append(FileRecord record) { Insert(Count(), std::move(record)); }
    void Remove(int index);
    // Swaps entry index with its neighbour index + delta (delta -1 or 1); false
    // when that neighbour does not exist.
    bool Move(int index, int delta);

    // Appends the record of one line when the line is a record line. A number
    // field that overflows is reported; the record stays with the fields read
    // before it.
    std::optional<AppError> LoadFilesRecord(const QString& line);

    // Replaces the records with those of the file at path; a missing file gives
    // an empty list that will be written there. LoadedFile becomes path and
    // ListChanged is cleared.
    // Whatever kept records out (too many, a number too large, a line too
    // long) comes back as one error that counts them, never one per line.
    ListLoadResult LoadDataFile(const QString& path);
    // The same for a list's bytes from elsewhere (the service); source names
    // it in the report. LoadedFile is left alone.
    ListLoadResult LoadListBytes(const QByteArray& bytes, const QString& source);

    // Writes the records to LoadedFile when ListChanged is set and the
    // application and data folders exist (or could be made); otherwise the
    // list waits for a later save. Clears ListChanged after writing.
    std::optional<AppError> SaveFileList(const LocationFolders& folders);

    // The File menu's "Save...": the list is written under the chosen name even
    // when it has not changed (it could not be found there otherwise) and the
    // name becomes LoadedFile.
    std::optional<AppError> SaveFileListAs(const QString& path, const LocationFolders& folders);

    // Writes the records to path through a temporary file that replaces the old
    // one only when every byte is on the disk; the error names the file and the
    // system's reason. A record read from a Latin-1 line is written in Latin-1
    // again (when it still fits), every other one in UTF-8. keepGoing, when
    // given, is asked after every line and may stop the save part-way; the old
    // file then stays as it was.
    std::optional<AppError> WriteTo(const QString& path,
                                    const std::function<bool(int written)>& keepGoing = {}) const;

    // Sets FileDateLocal of every record from the FileDate that the list
    // "files.txt" in the application folder holds for the same identifier (the
    // last such line wins). No local list is no error.
    std::optional<AppError> LoadLocalDates(const QString& applicationFolder);

    QString LoadedFile;       // the list file in use
    bool ListChanged = false; // the records differ from LoadedFile

private:
    // Appends the record of one line of a file, noting its encoding.
    std::optional<AppError> LoadLine(const ByteLine& line);

    std::vector<FileRecord> records_;
    std::vector<bool> readAsLatin1_; // beside records_, entry by entry
};

// Inserts the record for a file the user picked or dropped before entry before
// (at the end when before is -1 or beyond the end) and sets ListChanged. Returns
// the new entry's index, or -1 when the list is full.
int AddNewFileRecord(FileList& list, const LocationFolders& folders, const QString& path,
                     int before);

} // namespace quorvel
