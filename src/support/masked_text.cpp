#include "support/masked_text.h"

#include <QRegularExpression>

namespace quorvel {

QString MaskUrlPassword(const QString& text) {
    // scheme://user:password@ or a bare user:password@host: everything after
    // the first ":" of the user part up to the last "@" before the path, so a
    // password holding ":" or "@" is masked whole.
    static const QRegularExpression userInfo(
        QStringLiteral("^((?:[A-Za-z][A-Za-z0-9+.-]*://)?[^/@:\\s]*:)[^/\\s]*(@)"));
    QString masked = text;
    masked.replace(userInfo, QStringLiteral("\\1***\\2"));
    return masked;
}

} // namespace quorvel
