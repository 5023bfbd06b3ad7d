#include "webdata/date_texts.h"

#include "support/date_text.h"
#include "support/log_file.h"

#include <QRegularExpression>

#include <optional>

namespace quorvel {

namespace {

// The date text before a time of hour 24, or nullopt when the text has no such time.
std::optional<QString> BeforeHour24(const QString& text) {
    static const QRegularExpression hour24(
        QStringLiteral("^\\s*(?:(.*\\S)\\s+)?24:00(?::00)?\\s*$"));
    const QRegularExpressionMatch m = hour24.match(text);
    if (!m.hasMatch()) return std::nullopt;
    return m.captured(1);
}

} // namespace

DateValue MyTimeValue(const QString& text) {
    if (BeforeHour24(text)) return 1.0;
    if (const std::optional<DateValue> v = ParseDateText(text)) return TimePart(*v);
    WriteLogFile(QStringLiteral("Time error: ") + text);
    return 0;
}

DateValue MyDateValue(const QString& text) {
    const std::optional<QString> before = BeforeHour24(text);
    if (before && before->isEmpty()) return 0;
    if (const std::optional<DateValue> v = ParseDateText(before ? *before : text))
        return DatePart(*v);
    WriteLogFile(QStringLiteral("Date error:") + text);
    return 0;
}

DateValue DateTimeValue(const QString& text) {
    if (text == QLatin1String("0")) return 0;
    return MyTimeValue(text) + MyDateValue(text);
}

QString FormatDateLong(DateValue value) {
    return value == 0 ? QStringLiteral("-") : FormatDate(value, QLatin1String(kPatternLong));
}

QString FormatDateIso(DateValue value) {
    return value == 0 ? QStringLiteral("0") : FormatDate(value, QLatin1String(kPatternIso));
}

} // namespace quorvel
