#include "webdata/line_dates.h"

#include "support/value_rules.h"
#include "webdata/date_texts.h"
#include "webdata/webdata_error.h"

#include <cmath>
#include <optional>

namespace quorvel {

const QStringList& DataTypeNames() {
    static const QStringList names = {
        QStringLiteral("[no date]"), QStringLiteral("DateTime"), QStringLiteral("Date,Time"),
        QStringLiteral("Y,M,D,H,M"), QStringLiteral("CSI"),      QStringLiteral("CIMIS"),
        QStringLiteral("GEMINI"),    QStringLiteral("Decagon"),  QStringLiteral("Teksmart")};
    return names;
}

namespace {

const QString& Field(const QStringList& fields, qsizetype index) {
    if (index >= fields.size()) throw WebDataError(QStringLiteral("Subscript out of range"));
    return fields.at(index);
}

int Int16(QStringView text) {
    const std::optional<std::int16_t> v = ToInt16(text);
    if (!v) throw WebDataError(QStringLiteral("Type mismatch"));
    return *v;
}

// Two-digit years follow the usual window: 0-29 are 2000-2029, 30-99 are 1930-1999.
int FullYear(int year) {
    if (year >= 0 && year < 30) return year + 2000;
    if (year >= 30 && year < 100) return year + 1900;
    return year;
}

DateValue CalendarDate(int year, int month, int day) {
    return MakeDate(FullYear(year), month, day);
}

DateValue YmdhmDate(const QStringList& f) {
    const int year = Int16(Field(f, 0));
    const int month = Int16(Field(f, 1));
    const int day = Int16(Field(f, 2));
    const int hour = Int16(Field(f, 3));
    const int minute = Int16(Field(f, 4));
    return CalendarDate(year, month, day) + MakeTime(hour, minute, 0);
}

DateValue CsiDate(const QStringList& f) {
    const double year = RoundHalfEven(ValDouble(Field(f, 1)));
    const double day = ValDouble(Field(f, 2));
    const std::int32_t hhmm = ValLong(Field(f, 3));
    if (std::fabs(year) > 9999) throw WebDataError(QStringLiteral("Overflow"));
    return CalendarDate(static_cast<int>(year), 1, 1) + day - 1 + (hhmm / 100) / 24.0 +
           (hhmm % 100) / 1440.0;
}

DateValue CimisDate(const QStringList& f) {
    const QString& date = Field(f, 0);
    const QString& time = Field(f, 1);
    const int year = Int16(date.mid(0, 4));
    const int month = Int16(date.mid(4, 2));
    const int day = Int16(date.mid(6, 2));
    const int hour = Int16(time.mid(0, 2));
    const int minute = Int16(time.mid(2, 2));
    return CalendarDate(year, month, day) + MakeTime(hour, minute, 0);
}

DateValue DecagonDate(const QStringList& f) {
    return MakeDate(2000, 1, 1) + ValDouble(Field(f, 1)) + ValDouble(Field(f, 2)) / 1440.0;
}

} // namespace

QStringList LineFields(const QString& line) {
    QChar separator = QLatin1Char(' ');
    if (line.contains(QLatin1Char('\t')))
        separator = QLatin1Char('\t');
    else if (line.contains(QLatin1Char(',')))
        separator = QLatin1Char(',');
    QString unquoted = line;
    unquoted.remove(QLatin1Char('"'));
    return unquoted.split(separator);
}

LineDate DateOfLine(const QString& line, int dataType) {
    LineDate result;
    const QStringList f = LineFields(line);
    if (f.size() < 2) return result;
    result.found = true;
    result.firstField = f.at(0);
    switch (dataType) {
    case kDateTime:
    case kGemini:
    case kTeksmart:
        result.value = DateTimeValue(f.at(0));
        break;
    case kDateComma:
        result.value = MyDateValue(f.at(0)) + MyTimeValue(f.at(1));
        break;
    case kYmdhm:
        result.value = YmdhmDate(f);
        break;
    case kCsi:
        result.value = CsiDate(f);
        break;
    case kCimis:
        result.value = CimisDate(f);
        break;
    case kDecagon:
        result.value = DecagonDate(f);
        break;
    default:
        return result;
    }
    if (!InCalendar(result.value)) {
        result.found = false;
        result.value = 0;
        return result;
    }
    result.hasDate = true;
    return result;
}

bool InCalendar(DateValue value) {
    static const DateValue first = MakeDate(100, 1, 1);
    static const DateValue last = MakeDate(9999, 12, 31);
    if (!std::isfinite(value)) return false;
    const DateValue day = DatePart(value);
    return day >= first && day <= last;
}

} // namespace quorvel
