#include "transfer/zip_archive.h"

#include "transfer/zip_codes.h"
#include "transfer/zip_entry_path.h"

#include <zip.h>

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QSaveFile>

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

// Reads every entry's name and checks it before anything is written.
int ListEntries(zip_t* archive, const QString& folder, std::vector<Entry>& entries) {
    const zip_int64_t count = zip_get_num_entries(archive, 0);
    for (zip_int64_t i = 0; i < count; ++i) {
        zip_stat_t stat;
        zip_stat_init(&stat);
        if (zip_stat_index(archive, static_cast<zip_uint64_t>(i), 0, &stat) < 0) return kZipCorrupt;
        const QString path = SafeEntryPath(folder, QString::fromUtf8(stat.name));
        if (path.isEmpty()) return kZipUnsafeEntry;
        entries.push_back({static_cast<zip_uint64_t>(i), path,
                           (stat.valid & ZIP_STAT_SIZE) ? stat.size : 0, stat.mtime,
                           (stat.valid & ZIP_STAT_MTIME) != 0});
    }
    return kZipOk;
}

int CopyEntry(zip_file_t* in, QSaveFile& out, const Entry& entry, const ZipProgress& progress) {
    constexpr zip_int64_t kChunk = 1 << 20;
    std::unique_ptr<char[]> buffer(new char[kChunk]);
    const QString name = QFileInfo(entry.path).fileName();
    zip_uint64_t done = 0;
    int shown = -1;
    for (;;) {
        const zip_int64_t got = zip_fread(in, buffer.get(), kChunk);
        if (got < 0) return ReadCode(zip_file_get_error(in));
        if (got == 0) return kZipOk;
        if (out.write(buffer.get(), got) != got) return kZipWriteProblem;
        done += static_cast<zip_uint64_t>(got);
        const int percent = entry.size == 0 ? 100 : static_cast<int>(done * 100 / entry.size);
        if (progress && percent != shown) progress(name, shown = percent);
    }
}

int ExtractEntry(zip_t* archive, const Entry& entry, const ZipProgress& progress) {
    if (entry.path.endsWith(QLatin1Char('/')))
        return QDir().mkpath(entry.path) ? kZipOk : kZipFolderProblem;
    if (!QDir().mkpath(QFileInfo(entry.path).absolutePath())) return kZipFolderProblem;
    std::unique_ptr<zip_file_t, EntryCloser> in(zip_fopen_index(archive, entry.index, 0));
    if (!in) return ReadCode(zip_get_error(archive));
    QSaveFile out(entry.path);
    if (!out.open(QIODevice::WriteOnly)) return kZipCreateProblem;
    const int code = CopyEntry(in.get(), out, entry, progress);
    if (code != kZipOk) return code; // the older copy stays; the temporary file goes with `out`
    if (!out.commit()) return kZipWriteProblem;
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
    std::unique_ptr<zip_t, ArchiveCloser> archive(
        zip_open(QFile::encodeName(zipFile).constData(), ZIP_RDONLY | ZIP_CHECKCONS, &error));
    if (!archive) return OpenCode(error);
    std::vector<Entry> entries;
    if (const int code = ListEntries(archive.get(), folder, entries); code != kZipOk) return code;
    if (entries.empty()) return kZipEmpty;
    if (!QDir().mkpath(folder)) return kZipFolderProblem;
    for (const Entry& entry : entries) {
        if (const int code = ExtractEntry(archive.get(), entry, progress); code != kZipOk)
            return code;
    }
    return kZipOk;
}

} // namespace quorvel
