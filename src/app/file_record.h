#pragma once
// One entry of the file list: which local file, where it lives on this PC and at
// the service, how and in which direction it travels.

#include <QString>

#include <cstdint>

namespace quorvel {

// Where a file name is relative to (the index of the location option buttons).
enum LocationId : std::int16_t {
    kLocationApplication = 0,
    kLocationData = 1,
    kLocationUser = 2,
    kLocationUserCurrent = 3,
    kLocationOther = 4,
};

enum MethodId : std::int16_t { kMethodCompleteFile = 0, kMethodOnlyNewData = 1 };

enum DownloadRule : std::int16_t {
    kDownloadNever = 0,
    kDownloadAlways = 1,
    kDownloadOnce = 2,
    kDownloadDate = 3,
};

enum UploadRule : std::int16_t { kUploadNever = 0, kUploadAlways = 1, kUploadOnce = 2 };

// Field order is the order of the fields in a list file line.
struct FileRecord {
    std::int32_t FileID = 0; // identifier at the service; 0 for records made here
    std::int16_t Active = 0; // non-zero: takes part in runs of all files
    QString Name;            // display name; "DIR" and "FROMDATE" are commands
    QString FileName;        // relative to the location's folder, may hold subfolders
    std::int16_t TypeID = 0; // date layout of the data, 0 "[no date]"
    std::int16_t AdminLocationID = 0;
    std::int16_t UserLocationID = 0;
    std::int16_t MethodID = 0; // MethodId
    std::int16_t Zip = 0;      // non-zero: travels zipped
    std::int16_t Download = 0; // DownloadRule
    std::int16_t Upload = 0;   // UploadRule
    QString Folder;            // for kLocationOther: absolute, or under the data folder
    QString FileDate;          // the service's date of its copy, as the list states it
    QString FileDateLocal;     // this PC's date for the same FileID; never written
    std::int32_t SpareNumber = 0;

    bool operator==(const FileRecord&) const = default;
};

// The record made for a file the user picked or dropped: active, downloaded
// always as a complete file, never uploaded; name and file name are the file's name.
FileRecord NewFileRecord(const QString& fileName, std::int16_t locationId, const QString& folder);

} // namespace quorvel
