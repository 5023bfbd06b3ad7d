#include "webdata/date_texts.h"

#include "support/date_text.h"
#include "support/log_file.h"
#include "webdata/line_dates.h"

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

// Seconds may carry a fraction ("10:20:30.5"); it is read and left out, so a
// record dates to its whole second like the dates the service is asked for.
QString WithoutFraction(const QString& text) {
    if (!text.contains(QLatin1Char('.'))) return text;
    static const QRegularExpression fraction(QStringLiteral("(\\d:\\d\\d:\\d\\d)\\.\\d+"));
    QString out = text;
    return out.replace(fraction, QStringLiteral("\\1"));
}

} // namespace

DateValue MyTimeValue(const QString& given) {
    const QString text = WithoutFraction(given);
    if (BeforeHour24(text)) return 1.0;
    if (const std::optional<DateValue> v = ParseDateText(text)) return TimePart(*v);
    WriteLogFile(QStringLiteral("Time error: ") + given);
    return 0;
}

DateValue MyDateValue(const QString& given) {
    const QString text = WithoutFraction(given);
    const std::optional<QString> before = BeforeHour24(text);
    if (before && before->isEmpty()) return 0;
    if (const std::optional<DateValue> v = ParseDateText(before ? *before : text))
        return DatePart(*v);
    WriteLogFile(QStringLiteral("Date error:") + given);
    return 0;
}

DateValue DateTimeValue(const QString& text) {
    if (text == QLatin1String("0")) return 0;
    return MyTimeValue(text) + MyDateValue(text);
}

// A value outside the calendar has no text of its own; it shows as no date.
QString FormatDateLong(DateValue value) {
    return value == 0 || !InCalendar(value) ? QStringLiteral("-")
                                            : FormatDate(value, QLatin1String(kPatternLong));
}

QString FormatDateIso(DateValue value) {
    if (value == 0 || !InCalendar(value)) return QStringLiteral("0");
    // Years before 1000 keep four digits, so the text reads back.
    const QString text = FormatDate(value, QLatin1String(kPatternIso));
    const qsizetype dash = text.indexOf(QLatin1Char('-'));
    return dash < 4 ? QString(4 - dash, QLatin1Char('0')) + text : text;
}

} // namespace quorvel
