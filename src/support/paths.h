#pragma once
// Path texts. Local paths use the native separator; a "\" read from a list file
// is a separator too. Service paths always use "/".

#include <QString>

namespace quorvel {

// True for "/" or "\".
bool IsSeparator(QChar c);
QChar NativeSeparator();

QString GetPath(const QString& path);     // before the last separator of either kind
QString GetFileName(const QString& path); // after the last separator of either kind
QString GetFileNameFromURL(const QString& url);

// Absolute when it starts with "/" or contains ":" or "//".
bool IsFullPath(const QString& path);

// Blanks trimmed; one final separator removed.
QString RemoveTrailingSlash(const QString& path);
// Empty stays empty; a path ending in a separator is unchanged; else the native
// separator is appended.
QString AddTrailingSlash(const QString& path);
QString ConvertSlashes(const QString& text, bool toForward);
// Every separator of either kind becomes the native one.
QString ToNativeSeparators(const QString& path);

} // namespace quorvel
