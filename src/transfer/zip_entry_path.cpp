#include "transfer/zip_entry_path.h"

#include <QDir>

namespace quorvel {

QString SafeEntryPath(const QString& folder, const QString& entryName) {
    QString name = entryName;
    name.replace(QLatin1Char('\\'), QLatin1Char('/'));
    if (name.isEmpty() || name.startsWith(QLatin1Char('/')) || name.contains(QLatin1Char(':')))
        return QString();
    QStringList parts;
    for (const QString& part : name.split(QLatin1Char('/'), Qt::SkipEmptyParts)) {
        if (part == QStringLiteral("..")) return QString();
        if (part != QStringLiteral(".")) parts << part;
    }
    const QString root = QDir::cleanPath(QDir(folder).absolutePath());
    // "./" and the like name the folder itself, as some packers write it.
    if (parts.isEmpty()) return root + QLatin1Char('/');
    QString path = root + QLatin1Char('/') + parts.join(QLatin1Char('/'));
    if (name.endsWith(QLatin1Char('/'))) path += QLatin1Char('/');
    return path;
}

} // namespace quorvel
