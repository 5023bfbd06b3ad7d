#include "support/date_value.h"

#include "support/ports.h"

#include <array>
#include <cmath>

namespace quorvel {

namespace {

constexpr double kSecondsPerDay = 86400.0;
const qint64 kEpochJulian = QDate(1899, 12, 30).toJulianDay();

const std::array<const char*, 12> kMonthNames = {"January",   "February", "March",    "April",
                                                 "May",       "June",     "July",     "August",
                                                 "September", "October",  "November", "December"};

QString TwoDigits(int n) {
    return QStringLiteral("%1").arg(n, 2, 10, QLatin1Char('0'));
}

} // namespace

DateValue MakeDate(int year, int month, int day, int hour, int minute, int second) {
    // Carry months into years first, then days (day 0 is the last day before).
    const int monthIndex = month - 1;
    const int yearCarry = monthIndex >= 0 ? monthIndex / 12 : -((11 - monthIndex) / 12);
    const int m = monthIndex - yearCarry * 12 + 1;
    const QDate first(year + yearCarry, m, 1);
    if (!first.isValid()) return 0.0;
    const double time = MakeTime(hour, minute, second);
    const double carry = std::floor(time);
    const double days = static_cast<double>(first.toJulianDay() + (day - 1) - kEpochJulian) + carry;
    const double fraction = time - carry;
    // Before the epoch the whole days count back while the time still counts forward.
    return days >= 0 ? days + fraction : days - fraction;
}

DateValue MakeTime(int hour, int minute, int second) {
    return (hour * 3600.0 + minute * 60.0 + second) / kSecondsPerDay;
}

DateValue DatePart(DateValue value) {
    return std::trunc(value);
}

DateValue TimePart(DateValue value) {
    return std::fabs(value - std::trunc(value));
}

DateParts SplitDate(DateValue value) {
    // A negative value counts whole days back with the fraction still forward.
    double whole = std::trunc(value);
    qint64 seconds = std::llround(TimePart(value) * kSecondsPerDay);
    if (seconds >= 86400) {
        seconds -= 86400;
        whole += value < 0 ? -1 : 1;
    }
    const QDate date = QDate::fromJulianDay(kEpochJulian + static_cast<qint64>(whole));
    DateParts parts;
    parts.year = date.year();
    parts.month = date.month();
    parts.day = date.day();
    parts.hour = static_cast<int>(seconds / 3600);
    parts.minute = static_cast<int>(seconds / 60 % 60);
    parts.second = static_cast<int>(seconds % 60);
    return parts;
}

DateValue FromQDateTime(const QDateTime& when) {
    if (!when.isValid()) return 0.0;
    const QDate d = when.date();
    const QTime t = when.time();
    return MakeDate(d.year(), d.month(), d.day(), t.hour(), t.minute(), t.second());
}

QDateTime ToQDateTime(DateValue value) {
    const DateParts p = SplitDate(value);
    return QDateTime(QDate(p.year, p.month, p.day), QTime(p.hour, p.minute, p.second));
}

QString FormatDate(DateValue value, const QString& pattern) {
    const DateParts p = SplitDate(value);
    QString out;
    qsizetype i = 0;
    const auto run = [&](QChar c) {
        qsizetype n = 0;
        while (i + n < pattern.size() && pattern[i + n] == c)
            ++n;
        return n;
    };
    while (i < pattern.size()) {
        const QChar c = pattern[i];
        const qsizetype n = run(c);
        switch (c.unicode()) {
        case u'y':
            out += n >= 3 ? QString::number(p.year) : TwoDigits(p.year % 100);
            break;
        case u'm':
            if (n >= 4)
                out += QLatin1String(kMonthNames[p.month - 1]);
            else if (n == 3)
                out += QLatin1String(kMonthNames[p.month - 1]).left(3);
            else
                out += n == 2 ? TwoDigits(p.month) : QString::number(p.month);
            break;
        case u'd':
            out += n >= 2 ? TwoDigits(p.day) : QString::number(p.day);
            break;
        case u'H':
        case u'h':
            out += n >= 2 ? TwoDigits(p.hour) : QString::number(p.hour);
            break;
        case u'M':
        case u'n':
            out += n >= 2 ? TwoDigits(p.minute) : QString::number(p.minute);
            break;
        case u'S':
        case u's': {
            // "Ss" is one seconds field too.
            qsizetype len = 0;
            while (i + len < pattern.size() &&
                   (pattern[i + len] == u'S' || pattern[i + len] == u's'))
                ++len;
            out += len >= 2 ? TwoDigits(p.second) : QString::number(p.second);
            i += len;
            continue;
        }
        default:
            out += QString(n, c);
            break;
        }
        i += n;
    }
    return out;
}

DateValue NowValue() {
    return FromQDateTime(CurrentClock().Now());
}

} // namespace quorvel
