#include "support/texts.h"

#include <QLocale>

#include <cmath>

namespace quorvel {

namespace {

QString TwoDigits(qint64 n) {
    return QStringLiteral("%1").arg(n, 2, 10, QLatin1Char('0'));
}

QString GroupDigits(qint64 value) {
    QString sep = QLocale::system().groupSeparator();
    if (sep.isEmpty()) sep = QStringLiteral(",");
    const QString digits = QString::number(value < 0 ? -value : value);
    QString out;
    for (qsizetype i = 0; i < digits.size(); ++i) {
        if (i > 0 && (digits.size() - i) % 3 == 0) out += sep;
        out += digits[i];
    }
    return value < 0 ? QStringLiteral("-") + out : out;
}

} // namespace

QString DurationText(double days) {
    const qint64 total = std::llround(std::fabs(days) * 86400.0);
    const qint64 wholeDays = total / 86400;
    const qint64 rest = total % 86400;
    const qint64 hours = rest / 3600, minutes = rest / 60 % 60, seconds = rest % 60;
    const QString hm = TwoDigits(hours) + u':' + TwoDigits(minutes);
    if (wholeDays >= 2) return QString::number(wholeDays) + QStringLiteral(" days ") + hm;
    if (wholeDays == 1) return QStringLiteral("1 day ") + hm;
    if (hours > 1) return hm;
    return hm + u':' + TwoDigits(seconds);
}

QString FormatThousands(double value) {
    return GroupDigits(std::llround(value));
}

QString FormatPercent(double fraction) {
    return QString::number(std::llround(fraction * 100.0)) + u'%';
}

QString FormatByteSize(std::int64_t bytes) {
    const double b = static_cast<double>(bytes);
    if (bytes < 50'000) return FormatThousands(b) + QStringLiteral(" b");
    if (bytes < 50'000'000) return FormatThousands(b / 1e3) + QStringLiteral(" Kb");
    if (bytes < 50'000'000'000) return FormatThousands(b / 1e6) + QStringLiteral(" Mb");
    return FormatThousands(b / 1e9) + QStringLiteral(" Gb");
}

QString AlignRight(const QString& text, int width) {
    if (width <= 0) return {};
    return (QString(width, u' ') + text).right(width);
}

QString AlignLeft(const QString& text, int width) {
    if (width <= 0) return {};
    return (text + QString(width, u' ')).left(width);
}

QString StripNull(const QString& text) {
    const qsizetype at = text.indexOf(QChar(u'\0'));
    return at < 0 ? text : text.left(at);
}

} // namespace quorvel
