#pragma once
// The run-time's rules for reading numbers out of texts.

#include <QString>
#include <QStringView>
#include <QVariant>

#include <cstdint>
#include <optional>

namespace quorvel {

inline constexpr std::int16_t kTrue = -1;
inline constexpr std::int16_t kFalse = 0;

// The leading number of a text: blanks, tabs and line feeds skipped, then an
// optional sign, digits, a decimal point and an exponent; reading stops at the
// first character that cannot continue the number. No number gives 0.
double ValDouble(QStringView text);

// Rounds to the nearest integer, halves to even.
double RoundHalfEven(double value);

// ValDouble rounded (halves to even) and clamped to 32 bits; 0 for null or empty.
std::int32_t ValLong(QStringView text);
std::int32_t ValLong(const QString& text);
std::int32_t ValLong(const char* text);
std::int32_t ValLong(const QVariant& value);
bool IsNonZero(const QVariant& value);
bool IsNonZero(QStringView text);
bool IsNonZero(const QString& text);

// Strict conversion to 16 bits: the whole text (blanks around it allowed) must
// be a number; halves round to even. A non-number or an overflow gives nullopt.
std::optional<std::int16_t> ToInt16(QStringView text);
std::optional<std::int16_t> ToInt16(double value);
std::optional<std::int32_t> ToInt32(QStringView text);

} // namespace quorvel
