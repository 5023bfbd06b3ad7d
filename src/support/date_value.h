#pragma once
// Date values: days since 30 December 1899 as a double, the fraction being the
// time of day; 0 means no date.

#include <QDateTime>
#include <QString>

namespace quorvel {

using DateValue = double;

// Patterns the program writes. Lower-case "mm"/"mmm"/"mmmm" is the month,
// upper-case "MM" the minutes; month names are English.
inline constexpr const char* kPatternLong = "d mmm yyyy HH:MM:SS";
inline constexpr const char* kPatternDue = "d mmm yyyy HH:MM";
inline constexpr const char* kPatternIso = "yyyy-mm-dd HH:MM:SS";
inline constexpr const char* kPatternStart = "dd mmmm yyyy HH:MM:SS";
inline constexpr const char* kPatternHourMinute = "HH:MM";
inline constexpr const char* kPatternHms = "HH:MM:SS";

// Builds a date value; out-of-range parts carry over (month 13 is January of the
// next year, day 0 the last day of the previous month, hour 24 the next day).
DateValue MakeDate(int year, int month, int day, int hour = 0, int minute = 0, int second = 0);
DateValue MakeTime(int hour, int minute, int second);

DateValue DatePart(DateValue value); // the whole day
DateValue TimePart(DateValue value); // the time of day (0 <= t < 1)

struct DateParts {
    int year = 1899, month = 12, day = 30, hour = 0, minute = 0, second = 0;
};
// Splits a value, rounding to the nearest second.
DateParts SplitDate(DateValue value);

DateValue FromQDateTime(const QDateTime& when);
QDateTime ToQDateTime(DateValue value);

// Formats with a pattern of d, dd, mmm, mmmm, mm, yyyy, HH, MM, SS (see above).
QString FormatDate(DateValue value, const QString& pattern);

// The date value of "now" from the process's clock.
DateValue NowValue();

} // namespace quorvel
