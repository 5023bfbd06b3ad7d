#include "support/masked_text.h"

namespace quorvel {

QString MaskUrlPassword(const QString& text) {
    // The user part runs from after "scheme://" (or the start) to the last
    // "@" of the text; a password may hold any character, ":", "@", "/" and
    // spaces included, when it was typed into an address unescaped. An "@"
    // later in a path makes the shown text wrong, never a password visible.
    const qsizetype schemeEnd = text.indexOf(QStringLiteral("://"));
    const qsizetype userStart = schemeEnd < 0 ? 0 : schemeEnd + 3;
    const qsizetype at = text.lastIndexOf(QLatin1Char('@'));
    if (at < userStart) return text;
    const qsizetype colon = text.indexOf(QLatin1Char(':'), userStart);
    if (colon < 0 || colon > at) return text;
    return text.left(colon + 1) + QStringLiteral("***") + text.mid(at);
}

} // namespace quorvel
