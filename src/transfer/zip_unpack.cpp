#include "transfer/zip_archive.h"

#include "support/replacing_file.h"
#include "transfer/zip_codes.h"
#include "transfer/zip_entry_path.h"

#include <zip.h>

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QStorageInfo>

#include <limits>
#include <memory>
#include <vector>

namespace quorvel {

namespace {

struct Entry {
    zip_uint64_t index;
    QString path; // ends with "/" for a folder
    zip_uint64_t size;
    time_t modified;
    bool hasTime;
};

struct ArchiveCloser {
    void operator()(zip_t* archive) const { zip_discard(archive); }
};
struct EntryCloser {
    void operator()(zip_file_t* file) const { zip_fclose(file); }
};

int OpenCode(int error) {
    switch (error) {
    case ZIP_ER_NOENT:
        return kZipNotFound;
    case ZIP_ER_MEMORY:
        return kZipOutOfMemory;
    case ZIP_ER_OPEN:
    case ZIP_ER_READ:
        return kZipReadProblem;
    default:
        return kZipCorrupt;
    }
}

int ReadCode(zip_error_t* error) {
    switch (zip_error_code_zip(error)) {
    case ZIP_ER_MEMORY:
        return kZipOutOfMemory;
    case ZIP_ER_READ:
    case ZIP_ER_SEEK:
        return kZipReadProblem;
    default:
        return kZipCorruptEntry; // checksum, inflate or header trouble
    }
}

bool IsFolder(const Entry& entry) {
    return entry.path.endsWith(QLatin1Char('/'));
}

// Reads every entry's name and size and checks them before anything is written.
int ListEntries(zip_t* archive, const QString& folder, std::vector<Entry>& entries) {
    const zip_int64_t count = zip_get_num_entries(archive, 0);
    for (zip_int64_t i = 0; i < count; ++i) {
        zip_stat_t stat;
        zip_stat_init(&stat);
        if (zip_stat_index(archive, static_cast<zip_uint64_t>(i), 0, &stat) < 0) return kZipCorrupt;
        // Without a size nothing would bound what the entry writes.
        if ((stat.valid & ZIP_STAT_NAME) == 0 || (stat.valid & ZIP_STAT_SIZE) == 0)
            return kZipCorrupt;
        const QString path = SafeEntryPath(folder, QString::fromUtf8(stat.name));
        if (path.isEmpty()) return kZipUnsafeEntry;
        entries.push_back({static_cast<zip_uint64_t>(i), path, stat.size, stat.mtime,
                           (stat.valid & ZIP_STAT_MTIME) != 0});
    }
    return kZipOk;
}

// The free space of the disk that holds the folder (or will, once created).
qint64 FreeSpace(const QString& folder) {
    QFileInfo at(QDir(folder).absolutePath());
    while (!at.exists() && !at.isRoot() && at.absolutePath() != at.absoluteFilePath())
        at = QFileInfo(at.absolutePath());
    return QStorageInfo(at.absoluteFilePath()).bytesAvailable();
}

// Every file is written beside its older copy before it replaces it, so the
// files together must fit into the free space.
bool FitsOnDisk(const std::vector<Entry>& entries, const QString& folder) {
    const qint64 free = FreeSpace(folder);
    if (free < 0) return true; // unknown: the writes themselves will tell
    zip_uint64_t total = 0;
    for (const Entry& entry : entries) {
        if (IsFolder(entry)) continue;
        if (entry.size > std::numeric_limits<zip_uint64_t>::max() - total) return false;
        total += entry.size;
    }
    return total <= static_cast<zip_uint64_t>(free);
}

// Never writes more than the entry's declared size: data beyond it makes the
// entry corrupt, however well it decompresses.
int CopyEntry(zip_file_t* in, ReplacingFile& out, const Entry& entry, const ZipProgress& progress) {
    constexpr zip_uint64_t kChunk = 1 << 20;
    std::unique_ptr<char[]> buffer(new char[kChunk]);
    const QString name = QFileInfo(entry.path).fileName();
    zip_uint64_t done = 0;
    int shown = -1;
    for (;;) {
        // One byte more than is left is enough to see an entry run over.
        const zip_uint64_t wanted = std::min(kChunk, entry.size - done + 1);
        const zip_int64_t got = zip_fread(in, buffer.get(), wanted);
        if (got < 0) return ReadCode(zip_file_get_error(in));
        if (got == 0) return done == entry.size ? kZipOk : kZipCorruptEntry;
        if (static_cast<zip_uint64_t>(got) > entry.size - done) return kZipCorruptEntry;
        if (!out.Write(QByteArrayView(buffer.get(), got))) return kZipWriteProblem;
        done += static_cast<zip_uint64_t>(got);
        const int percent = entry.size == 0 ? 100 : static_cast<int>(done * 100 / entry.size);
        if (progress && percent != shown) progress(name, shown = percent);
    }
}

int ExtractEntry(zip_t* archive, const Entry& entry, const ZipProgress& progress) {
    if (IsFolder(entry)) return QDir().mkpath(entry.path) ? kZipOk : kZipFolderProblem;
    if (!QDir().mkpath(QFileInfo(entry.path).absolutePath())) return kZipFolderProblem;
    std::unique_ptr<zip_file_t, EntryCloser> in(zip_fopen_index(archive, entry.index, 0));
    if (!in) return ReadCode(zip_get_error(archive));
    ReplacingFile out(entry.path);
    if (!out.Open()) return kZipCreateProblem;
    const int code = CopyEntry(in.get(), out, entry, progress);
    if (code != kZipOk) return code; // the older copy stays; the temporary file goes with `out`
    if (!out.Commit()) return kZipWriteProblem;
    if (entry.hasTime) {
        QFile done(entry.path);
        if (done.open(QIODevice::ReadWrite))
            done.setFileTime(QDateTime::fromSecsSinceEpoch(entry.modified),
                             QFileDevice::FileModificationTime);
    }
    return kZipOk;
}

} // namespace

int UnzipFile(const QString& zipFile, const QString& folder, const ZipProgress& progress) {
    if (!QFileInfo(zipFile).isFile()) return kZipNotFound;
    int error = 0;
    // No whole-archive consistency check: it refuses what zip tools write to a
    // pipe (sizes after the data), which Info-ZIP reads well. Every entry's
    // checksum and size are still checked as it is read.
    std::unique_ptr<zip_t, ArchiveCloser> archive(
        zip_open(QFile::encodeName(zipFile).constData(), ZIP_RDONLY, &error));
    if (!archive) return OpenCode(error);
    std::vector<Entry> entries;
    if (const int code = ListEntries(archive.get(), folder, entries); code != kZipOk) return code;
    if (entries.empty()) return kZipEmpty;
    if (!FitsOnDisk(entries, folder)) return kZipNoRoom;
    if (!QDir().mkpath(folder)) return kZipFolderProblem;
    for (const Entry& entry : entries) {
        if (const int code = ExtractEntry(archive.get(), entry, progress); code != kZipOk)
            return code;
    }
    return kZipOk;
}

} // namespace quorvel
