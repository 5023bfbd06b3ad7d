#pragma once
// Where an archive entry may be written.

#include <QString>

namespace quorvel {

// The full path of an entry inside the folder, or an empty text when the entry
// name is empty, absolute, names a drive, or climbs out with "..". Either "/"
// or "\" separates folders in an entry name; "." parts are dropped, so "./"
// gives the folder itself (ending in "/", as every folder entry does).
QString SafeEntryPath(const QString& folder, const QString& entryName);

} // namespace quorvel
