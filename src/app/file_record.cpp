#include "app/file_record.h"

namespace quorvel {

FileRecord NewFileRecord(const QString& fileName, std::int16_t locationId, const QString& folder) {
    FileRecord record;
    record.Active = 1;
    record.Name = fileName;
    record.FileName = fileName;
    record.AdminLocationID = locationId;
    record.UserLocationID = locationId;
    record.Folder = locationId == kLocationOther ? folder : QString();
    record.Download = kDownloadAlways;
    record.Upload = kUploadNever;
    record.MethodID = kMethodCompleteFile;
    return record;
}

} // namespace quorvel
