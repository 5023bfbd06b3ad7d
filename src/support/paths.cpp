#include "support/paths.h"

#include <QDir>

namespace quorvel {

namespace {

qsizetype LastSeparator(const QString& path) {
    return std::max(path.lastIndexOf(u'\\'), path.lastIndexOf(u'/'));
}

} // namespace

bool IsSeparator(QChar c) {
    return c == u'\\' || c == u'/';
}

QChar NativeSeparator() {
    return QDir::separator();
}

QString GetPath(const QString& path) {
    const qsizetype at = LastSeparator(path);
    return at < 0 ? QString() : path.left(at);
}

QString GetFileName(const QString& path) {
    const qsizetype at = LastSeparator(path);
    return at < 0 ? path : path.mid(at + 1);
}

QString GetFileNameFromURL(const QString& url) {
    const qsizetype at = url.lastIndexOf(u'/');
    return at < 0 ? url : url.mid(at + 1);
}

bool IsFullPath(const QString& path) {
    return path.startsWith(u'/') || path.contains(u':') || path.contains(QStringLiteral("//"));
}

QString RemoveTrailingSlash(const QString& path) {
    QString p = path.trimmed();
    if (!p.isEmpty() && IsSeparator(p.back())) p.chop(1);
    return p;
}

QString AddTrailingSlash(const QString& path) {
    if (path.isEmpty() || IsSeparator(path.back())) return path;
    return path + NativeSeparator();
}

QString ConvertSlashes(const QString& text, bool toForward) {
    QString out = text;
    return toForward ? out.replace(u'\\', u'/') : out.replace(u'/', u'\\');
}

QString ToNativeSeparators(const QString& path) {
    QString out = path;
    const QChar native = NativeSeparator();
    for (QChar& c : out)
        if (IsSeparator(c)) c = native;
    return out;
}

} // namespace quorvel
