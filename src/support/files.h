#pragma once
// File and folder tests and creation of missing local folders.

#include <QString>

namespace quorvel {

// True when the path names a file or folder, or a "*"/"?" pattern in its last
// component matches anything in its folder.
bool FileExists(const QString& pathOrPattern);
bool FolderExists(const QString& path);

// Creates one missing folder level (its parent must exist) and logs it.
bool CheckLocalFolder(const QString& folder);
// Creates every missing level of a path, stopping at the first failure.
bool CheckLocalFolders(const QString& path);

} // namespace quorvel
