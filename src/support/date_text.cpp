#include "support/date_text.h"

#include <QLocale>
#include <QRegularExpression>

namespace quorvel {

namespace {

const char* const kMonthNames[] = {"january",   "february", "march",    "april",
                                   "may",       "june",     "july",     "august",
                                   "september", "october",  "november", "december"};

constexpr const char* kTime = R"((?:[ T]+(\d{1,2}):(\d{2})(?::(\d{2}))?(?:\s*([AaPp][Mm]))?)?)";

int MonthFromName(const QString& name) {
    const QString lower = name.toLower();
    if (lower.size() < 3) return 0;
    for (int m = 0; m < 12; ++m) {
        const QLatin1String full(kMonthNames[m]);
        if (lower == full || (lower.size() <= full.size() && full.startsWith(lower) &&
                              (lower.size() == 3 || lower == QLatin1String("sept"))))
            return m + 1;
    }
    return 0;
}

int FullYear(const QString& digits) {
    const int y = digits.toInt();
    if (digits.size() > 2) return y;
    return y < 30 ? 2000 + y : 1900 + y; // the usual two-digit-year window
}

// Validates the parts and builds the value; nullopt for an impossible date or time.
std::optional<DateValue> Build(int year, int month, int day, const QRegularExpressionMatch& m,
                               int timeAt, bool hasDate) {
    int hour = 0, minute = 0, second = 0;
    if (m.hasCaptured(timeAt)) {
        hour = m.captured(timeAt).toInt();
        minute = m.captured(timeAt + 1).toInt();
        second = m.hasCaptured(timeAt + 2) ? m.captured(timeAt + 2).toInt() : 0;
        if (m.hasCaptured(timeAt + 3)) {
            if (hour < 1 || hour > 12) return std::nullopt;
            const bool pm = m.captured(timeAt + 3).at(0).toLower() == u'p';
            hour = hour % 12 + (pm ? 12 : 0);
        }
        if (hour > 23 || minute > 59 || second > 59) return std::nullopt;
    }
    if (!hasDate) return MakeTime(hour, minute, second);
    if (!QDate(year, month, day).isValid() || year < 100 || year > 9999) return std::nullopt;
    return MakeDate(year, month, day, hour, minute, second);
}

} // namespace

NumericDateOrder SystemDateOrder() {
    const QString format = QLocale::system().dateFormat(QLocale::ShortFormat);
    const qsizetype d = format.indexOf(u'd');
    const qsizetype m = format.indexOf(u'M');
    return (m >= 0 && d >= 0 && m < d) ? NumericDateOrder::MonthFirst : NumericDateOrder::DayFirst;
}

std::optional<DateValue> ParseDateText(QStringView text) {
    return ParseDateText(text, SystemDateOrder());
}

std::optional<DateValue> ParseDateText(QStringView text, NumericDateOrder order) {
    static const QRegularExpression iso(QStringLiteral(R"(^(\d{4})[-/.](\d{1,2})[-/.](\d{1,2}))") +
                                        kTime + QStringLiteral("$"));
    static const QRegularExpression named(
        QStringLiteral(R"(^(\d{1,2})[ -]+([A-Za-z]{3,9})\.?[ ,-]+(\d{2}|\d{4}))") + kTime +
        QStringLiteral("$"));
    static const QRegularExpression numeric(
        QStringLiteral(R"(^(\d{1,2})([-/.])(\d{1,2})\2(\d{2}|\d{4}))") + kTime +
        QStringLiteral("$"));
    static const QRegularExpression timeOnly(
        QStringLiteral(R"(^(\d{1,2}):(\d{2})(?::(\d{2}))?(?:\s*([AaPp][Mm]))?$)"));

    const QString s = text.trimmed().toString();
    if (s.isEmpty()) return std::nullopt;

    if (auto m = iso.match(s); m.hasMatch())
        return Build(m.captured(1).toInt(), m.captured(2).toInt(), m.captured(3).toInt(), m, 4,
                     true);
    if (auto m = named.match(s); m.hasMatch()) {
        const int month = MonthFromName(m.captured(2));
        if (month == 0) return std::nullopt;
        return Build(FullYear(m.captured(3)), month, m.captured(1).toInt(), m, 4, true);
    }
    if (auto m = numeric.match(s); m.hasMatch()) {
        int day = m.captured(1).toInt();
        int month = m.captured(3).toInt();
        if (order == NumericDateOrder::MonthFirst) std::swap(day, month);
        return Build(FullYear(m.captured(4)), month, day, m, 5, true);
    }
    if (auto m = timeOnly.match(s); m.hasMatch()) return Build(0, 0, 0, m, 1, false);
    return std::nullopt;
}

bool IsDateText(QStringView text) {
    return ParseDateText(text).has_value();
}

DateValue DateFromText(QStringView text) {
    return ParseDateText(text).value_or(0.0);
}

std::int32_t DayFromText(QStringView text) {
    return static_cast<std::int32_t>(DatePart(DateFromText(text)));
}

} // namespace quorvel
