#pragma once
// Date and time texts of data files and of the service, read into date values.
// Unreadable texts are written to the program log and count as 0.

#include "support/date_value.h"

#include <QString>

namespace quorvel {

// 1 (a whole day) for a time of hour 24 ("24:00", "24:00:00", or a date followed
// by such a time); else the time of day of a date or time text; else 0.
DateValue MyTimeValue(const QString& text);
// The whole day of a date text (also one followed by 24:00); else 0.
DateValue MyDateValue(const QString& text);
// "0" gives 0; otherwise MyTimeValue + MyDateValue of the whole text.
DateValue DateTimeValue(const QString& text);

// "d mmm yyyy HH:MM:SS", "-" for 0.
QString FormatDateLong(DateValue value);
// "yyyy-mm-dd HH:MM:SS", "0" for 0.
QString FormatDateIso(DateValue value);

} // namespace quorvel
