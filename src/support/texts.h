#pragma once
// Small text services shared by every subsystem.

#include <QString>

#include <cstdint>

namespace quorvel {

// "3 days 04:05", "1 day 04:05", "05:30" (two hours or more), "01:05:09".
QString DurationText(double days);

// "#,##0 b" below 50,000; "#,##0 Kb" below 50,000,000; "#,##0 Mb" below
// 50,000,000,000; "#,##0 Gb" above.
QString FormatByteSize(std::int64_t bytes);

// The "#,##0" and "0%" number patterns (thousands separator of the system).
QString FormatThousands(double value);
QString FormatPercent(double fraction);

QString AlignRight(const QString& text, int width);
QString AlignLeft(const QString& text, int width);
QString StripNull(const QString& text);

} // namespace quorvel
