#pragma once
// The one date-text parser used everywhere.
//
// Accepts every pattern the program writes, ISO "yyyy-mm-dd[ HH:MM[:SS]]",
// "d mmm yyyy[ HH:MM[:SS]]" with English month names (short or long), a bare
// time "HH:MM[:SS]", and numeric d/m/yyyy or m/d/yyyy (separators "/", "-" or
// ".") in the order of the system locale's short date, day first when the
// locale says nothing. Each date may be followed by a time.

#include "support/date_value.h"

#include <QStringView>

#include <optional>

namespace quorvel {

enum class NumericDateOrder { DayFirst, MonthFirst };

// The order the system locale writes a short date in.
NumericDateOrder SystemDateOrder();

std::optional<DateValue> ParseDateText(QStringView text);
std::optional<DateValue> ParseDateText(QStringView text, NumericDateOrder order);

bool IsDateText(QStringView text);
// Date and time of a valid date text, otherwise 0.
DateValue DateFromText(QStringView text);
// The whole day of a valid date text, otherwise 0.
std::int32_t DayFromText(QStringView text);

} // namespace quorvel
