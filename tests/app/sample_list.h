#pragma once
// Lists of any length with varied records, for benchmarks and tests. Header
// only: add ${PROJECT_SOURCE_DIR}/tests to the include path and link quorvel_app.

#include "app/file_list.h"

#include <QString>

#include <optional>

namespace quorvel::testing {

// Record i of a sample list: every field set, the rules and locations cycling.
inline FileRecord SampleRecord(int i) {
    FileRecord r;
    r.FileID = i % 32767 + 1;
    r.Active = i % 7 == 0 ? 0 : 1;
    r.Name = QStringLiteral("Station %1").arg(i);
    r.FileName = QStringLiteral("site%1\\log%2.csv").arg(i % 10).arg(i);
    r.TypeID = static_cast<std::int16_t>(i % 9);
    r.AdminLocationID = static_cast<std::int16_t>(i % 5);
    r.UserLocationID = static_cast<std::int16_t>((i + 2) % 5);
    r.MethodID = r.TypeID == 0 ? kMethodCompleteFile : kMethodOnlyNewData;
    r.Zip = r.MethodID == kMethodCompleteFile && i % 3 == 0 ? 1 : 0;
    r.Download = static_cast<std::int16_t>(i % 4);
    r.Upload = r.Download == kDownloadAlways ? std::int16_t{kUploadNever}
                                             : static_cast<std::int16_t>(i % 3);
    r.Folder =
        r.AdminLocationID == kLocationOther ? QStringLiteral("Logs%1").arg(i % 4) : QString();
    r.FileDate =
        QStringLiteral("%1 Nov 2024 10:%2:00").arg(i % 28 + 1).arg(i % 60, 2, 10, QChar(u'0'));
    r.SpareNumber = i % 100;
    return r;
}

inline FileList SampleList(int count) {
    FileList list;
    for (int i = 0; i < count; ++i)
        list.Append(SampleRecord(i));
    return list;
}

// Writes a list file of count records to path; the error when it failed.
inline std::optional<AppError> WriteSampleList(const QString& path, int count) {
    return SampleList(count).WriteTo(path);
}

} // namespace quorvel::testing
