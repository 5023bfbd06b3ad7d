#pragma once
// The report of a "DIR" record: a plain-text listing of the application and
// data folders with every sub-folder and file, its size and modification
// time, written to the record's local file so that its upload rule can send it.
//
// Entries are sorted by name so that two listings of the same folders read
// the same; hidden entries (a leading ".") are left out; a folder reached
// through a symbolic link is listed as a line of its own but not entered.

#include "app/app_error.h"
#include "app/locations.h"
#include "support/date_value.h"

#include <QString>
#include <QStringList>

#include <cstdint>
#include <optional>

namespace quorvel {

// The header line of a folder section at depth (0 for a tree's top).
QString ListingFolderLine(int depth, const QString& path);
// The line of a link to a folder, which the listing does not enter.
QString ListingLinkLine(int depth, const QString& path, const QString& target);
// A file line: 4 x depth blanks, the name in 20 characters (cut when longer),
// the size as "#,##0" and the time as "d mmm yyyy HH:MM:SS", right-aligned in
// 10 and 22 characters (a longer text keeps its end).
QString ListingFileLine(int depth, const QString& name, std::int64_t size, DateValue modified);

// The folder trees to walk: one when the two folder texts are equal (in any
// letter case) or one starts with the other, else both, application first.
QStringList ListingTrees(const QString& application, const QString& data);

// Writes the listing to output (replacing it only when complete): five header
// lines, then the section of each tree. A folder's sub-folder sections come
// before its own files. Lines end with CR LF.
std::optional<AppError> GenerateAllFiles(const QString& output, const LocationFolders& folders,
                                         DateValue now);

} // namespace quorvel
