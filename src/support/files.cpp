#include "support/files.h"

#include "support/error_box.h"
#include "support/log_file.h"
#include "support/paths.h"

#include <QDir>
#include <QFileInfo>

namespace quorvel {

namespace {

bool HasWildcard(const QString& name) {
    return name.contains(u'*') || name.contains(u'?');
}

bool IsDriveOnly(const QString& part) {
    return part.size() == 2 && part[1] == u':';
}

} // namespace

bool FileExists(const QString& pathOrPattern) {
    const QString path = ToNativeSeparators(pathOrPattern.trimmed());
    if (path.isEmpty()) return false;
    const QString name = GetFileName(path);
    if (!HasWildcard(name)) return QFileInfo::exists(path);
    const QString folder = GetPath(path);
    QDir dir(folder.isEmpty() && path.startsWith(NativeSeparator()) ? QString(NativeSeparator())
             : folder.isEmpty()                                     ? "."
                                                                    : folder);
    if (HasWildcard(folder) || !dir.exists()) return false;
    return !dir.entryList({name},
                          QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot)
                .isEmpty();
}

bool FolderExists(const QString& path) {
    QString p = RemoveTrailingSlash(ToNativeSeparators(path));
    if (p.isEmpty()) p = path.trimmed(); // the root itself
    return !p.isEmpty() && QFileInfo(p).isDir();
}

bool CheckLocalFolder(const QString& folder) {
    if (folder.isEmpty()) return true;
    const QString native = ToNativeSeparators(folder);
    if (FolderExists(native)) return true;
    if (!QDir().mkdir(native))
        return ShowErrorBox(QStringLiteral("Could not create the folder"),
                            QStringLiteral("CheckLocalFolder: ") + native);
    WriteLogFile(QStringLiteral("Creaded folder: ") + native);
    return true;
}

bool CheckLocalFolders(const QString& path) {
    const QString native = ToNativeSeparators(path.trimmed());
    if (native.isEmpty()) return true;
    const QChar sep = NativeSeparator();
    const QStringList parts = native.split(sep);
    QString current = parts.first();
    // A relative first part is a folder of its own; a drive or the root is not created.
    if (!current.isEmpty() && !IsDriveOnly(current) && !CheckLocalFolder(current)) return false;
    for (qsizetype i = 1; i < parts.size(); ++i) {
        current += sep + parts[i];
        if (current == sep) continue;
        if (!CheckLocalFolder(current)) return false;
    }
    return true;
}

} // namespace quorvel
