#pragma once
// Lists of any length with varied records, for benchmarks and tests. Header
// only: add ${PROJECT_SOURCE_DIR}/tests to the include path and link quorvel_app.

#include "app/file_list.h"

namespace quorvel::testing {

// Record i of a sample list: every field set, rules and locations cycling.
inline FileRecord SampleRecord(int i) {
    const auto small = [i](int n) { return static_cast<std::int16_t>(i % n); };
    return FileRecord{i % 32767 + 1,
                      small(7) ? std::int16_t{1} : std::int16_t{0},
                      QStringLiteral("Station %1").arg(i),
                      QStringLiteral("site%1\\log%2.csv").arg(i % 10).arg(i),
                      small(9),
                      small(5),
                      small(4),
                      small(2),
                      small(3),
                      small(4),
                      small(3),
                      i % 5 == 4 ? QStringLiteral("Logs%1").arg(i % 4) : QString(),
                      QStringLiteral("%1 Nov 2024 10:%2:00").arg(i % 28 + 1).arg(i % 60),
                      QString(),
                      i % 100};
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
