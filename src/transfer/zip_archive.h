#pragma once
// Packing files into a zip archive and unpacking one into a folder (libzip).
// Both return a code of zip_codes.h.

#include <QString>
#include <QStringList>

#include <functional>

namespace quorvel {

// Called for each file with its name (no folder) and the percentage done.
using ZipProgress = std::function<void(const QString& file, int percent)>;

// Each entry is a file name or a pattern with "*" or "?" in its last part.
// Entries keep their file names only. The archive is written under a temporary
// name and replaces an older one only when complete. No matching file gives
// kZipNothingToDo and leaves any older archive alone.
int ZipFiles(const QStringList& namesOrPatterns, const QString& zipFile,
             const ZipProgress& progress = {});

// Extracts every entry into the folder (created when missing). An entry whose
// path would leave the folder, or files that together would not fit into the
// free space, refuse the whole archive before anything is written. Each file
// is written under a temporary name and replaces an older copy only when it
// was read completely, its checksum matched and every byte reached the disk;
// an entry never writes more than the size its header declares.
int UnzipFile(const QString& zipFile, const QString& folder, const ZipProgress& progress = {});

} // namespace quorvel
