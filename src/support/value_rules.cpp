#include "support/value_rules.h"

#include <charconv>
#include <cmath>
#include <limits>
#include <string>

namespace quorvel {

namespace {

bool IsSkipped(QChar c) {
    return c == u' ' || c == u'\t' || c == u'\n';
}

// Collects the characters of the leading number, skipping blanks, tabs and line
// feeds wherever they stand. Returns the consumed length of the source too.
std::string LeadingNumber(QStringView text, qsizetype* consumed) {
    std::string number;
    bool digits = false, point = false, exponent = false, expDigits = false;
    qsizetype i = 0;
    for (; i < text.size(); ++i) {
        const QChar c = text[i];
        if (IsSkipped(c)) continue;
        const char ch = c.toLatin1();
        if (ch >= '0' && ch <= '9') {
            number += ch;
            (exponent ? expDigits : digits) = true;
        } else if ((ch == '+' || ch == '-') &&
                   (number.empty() || (exponent && (number.back() == 'e')))) {
            number += ch;
        } else if (ch == '.' && !point && !exponent) {
            number += ch;
            point = true;
        } else if ((ch == 'e' || ch == 'E' || ch == 'd' || ch == 'D') && digits && !exponent) {
            number += 'e';
            exponent = true;
        } else {
            break;
        }
    }
    // An exponent without digits does not count ("12e" reads as 12).
    if (exponent && !expDigits) {
        while (!number.empty() && number.back() != 'e')
            number.pop_back();
        if (!number.empty()) number.pop_back();
    }
    if (consumed) *consumed = i;
    if (!digits) number.clear();
    return number;
}

// Locale-independent: the decimal point is always ".".
double ToDouble(const std::string& number) {
    double v = 0.0;
    const char* first = number.data();
    if (*first == '+') ++first;
    const auto [ptr, ec] = std::from_chars(first, number.data() + number.size(), v);
    if (ec == std::errc::result_out_of_range)
        return number.find('e') != std::string::npos && number.find("e-") != std::string::npos
                   ? 0.0
                   : (number.front() == '-' ? -HUGE_VAL : HUGE_VAL);
    (void)ptr;
    return v;
}

} // namespace

double ValDouble(QStringView text) {
    const std::string number = LeadingNumber(text, nullptr);
    if (number.empty()) return 0.0;
    return ToDouble(number);
}

double RoundHalfEven(double value) {
    return std::nearbyint(value);
}

std::int32_t ValLong(QStringView text) {
    const double v = RoundHalfEven(ValDouble(text));
    if (!(v >= std::numeric_limits<std::int32_t>::min()))
        return std::numeric_limits<std::int32_t>::min();
    if (v > std::numeric_limits<std::int32_t>::max())
        return std::numeric_limits<std::int32_t>::max();
    return static_cast<std::int32_t>(v);
}

std::int32_t ValLong(const QString& text) {
    return ValLong(QStringView(text));
}
std::int32_t ValLong(const char* text) {
    return ValLong(QString::fromLatin1(text));
}

std::int32_t ValLong(const QVariant& value) {
    if (!value.isValid() || value.isNull()) return 0;
    switch (value.typeId()) {
    case QMetaType::Bool:
        return value.toBool() ? -1 : 0;
    case QMetaType::Double:
    case QMetaType::Float:
    case QMetaType::Int:
    case QMetaType::LongLong:
    case QMetaType::UInt:
    case QMetaType::ULongLong:
        return ValLong(QString::number(value.toDouble(), 'g', 17));
    default:
        return ValLong(value.toString());
    }
}

bool IsNonZero(const QVariant& value) {
    return ValLong(value) != 0;
}
bool IsNonZero(QStringView text) {
    return ValLong(text) != 0;
}
bool IsNonZero(const QString& text) {
    return ValLong(text) != 0;
}

namespace {

// The whole text must be a number: blanks around it are allowed, nothing else.
std::optional<double> StrictNumber(QStringView text) {
    const QStringView trimmed = text.trimmed();
    if (trimmed.isEmpty()) return std::nullopt;
    for (const QChar c : trimmed)
        if (IsSkipped(c)) return std::nullopt;
    qsizetype consumed = 0;
    const std::string number = LeadingNumber(trimmed, &consumed);
    if (number.empty() || consumed != trimmed.size()) return std::nullopt;
    const double v = ToDouble(number);
    if (!std::isfinite(v)) return std::nullopt;
    return v;
}

} // namespace

std::optional<std::int16_t> ToInt16(double value) {
    if (!std::isfinite(value)) return std::nullopt;
    const double r = RoundHalfEven(value);
    if (r < std::numeric_limits<std::int16_t>::min() ||
        r > std::numeric_limits<std::int16_t>::max())
        return std::nullopt;
    return static_cast<std::int16_t>(r);
}

std::optional<std::int16_t> ToInt16(QStringView text) {
    const auto v = StrictNumber(text);
    return v ? ToInt16(*v) : std::nullopt;
}

std::optional<std::int32_t> ToInt32(QStringView text) {
    const auto v = StrictNumber(text);
    if (!v) return std::nullopt;
    const double r = RoundHalfEven(*v);
    if (r < std::numeric_limits<std::int32_t>::min() ||
        r > std::numeric_limits<std::int32_t>::max())
        return std::nullopt;
    return static_cast<std::int32_t>(r);
}

} // namespace quorvel
