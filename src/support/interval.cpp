#include "support/interval.h"

#include "support/value_rules.h"

namespace quorvel {

bool ParseInterval(const QString& text, std::int16_t& count, QString& unit) {
    if (text.isEmpty() || !text.front().isDigit() || text.front().unicode() > 127) return false;
    const auto parsed = ToInt16(ValDouble(text));
    if (!parsed) return false; // a count beyond 16 bits is no interval
    count = *parsed;
    for (qsizetype i = 0; i < text.size(); ++i) {
        const QChar c = text[i];
        if (c >= u'0' && c <= u'9') continue;
        unit = text.mid(i).trimmed().left(1);
        break;
    }
    if (unit == QLatin1String("m")) unit = QStringLiteral("n");
    if (unit.isEmpty()) unit = QStringLiteral("h");
    if (count <= 0) count = 1;
    return true;
}

} // namespace quorvel
