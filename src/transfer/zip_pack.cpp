#include "transfer/zip_archive.h"

#include "support/paths.h"
#include "transfer/zip_codes.h"

#include <zip.h>

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <cmath>
#include <set>

namespace quorvel {

namespace {

bool IsPattern(const QString& name) {
    return name.contains(QLatin1Char('*')) || name.contains(QLatin1Char('?'));
}

QFileInfoList MatchingFiles(const QString& nameOrPattern) {
    const QString name = GetFileName(nameOrPattern);
    if (!IsPattern(name)) {
        QFileInfo info(nameOrPattern);
        return info.isFile() ? QFileInfoList{info} : QFileInfoList{};
    }
    QString folder = GetPath(nameOrPattern);
    if (folder.isEmpty() && !nameOrPattern.isEmpty() && IsSeparator(nameOrPattern.front()))
        folder = QStringLiteral("/");
    QDir dir(folder.isEmpty() ? QStringLiteral(".") : folder);
    return dir.entryInfoList({name}, QDir::Files | QDir::Hidden, QDir::Name);
}

int CodeOf(zip_error_t* error) {
    switch (zip_error_code_zip(error)) {
    case ZIP_ER_MEMORY:
        return kZipOutOfMemory;
    case ZIP_ER_OPEN:
    case ZIP_ER_READ:
        return kZipReadProblem;
    case ZIP_ER_WRITE:
    case ZIP_ER_CLOSE:
        return kZipWriteProblem;
    case ZIP_ER_TMPOPEN:
    case ZIP_ER_RENAME:
        return kZipTempFileProblem;
    default:
        return kZipReadWriteProblem;
    }
}

// libzip reports the progress of the whole archive, entry after entry in equal
// shares; this turns it back into the file being packed and its percentage.
struct PackProgress {
    const ZipProgress* report;
    QStringList names;
    int lastIndex = -1;
    int lastPercent = -1;
};

void OnPackProgress(zip_t*, double done, void* state) {
    auto* p = static_cast<PackProgress*>(state);
    const int count = static_cast<int>(p->names.size());
    const double position = done * count;
    const int index = std::min(count - 1, static_cast<int>(std::floor(position)));
    const int percent =
        done >= 1.0 ? 100 : static_cast<int>(std::lround((position - index) * 100.0));
    if (index < 0 || (index == p->lastIndex && percent == p->lastPercent)) return;
    p->lastIndex = index;
    p->lastPercent = percent;
    (*p->report)(p->names[index], percent);
}

int AddFile(zip_t* archive, const QFileInfo& file) {
    const QByteArray path = QFile::encodeName(file.absoluteFilePath());
    zip_source_t* source = zip_source_file(archive, path.constData(), 0, -1);
    if (source == nullptr) return CodeOf(zip_get_error(archive));
    const QByteArray entry = file.fileName().toUtf8();
    const zip_int64_t index = zip_file_add(archive, entry.constData(), source, ZIP_FL_ENC_UTF_8);
    if (index < 0) {
        zip_source_free(source);
        return CodeOf(zip_get_error(archive));
    }
    // libzip's own default is the slowest level; 6 is what zip tools use.
    if (zip_set_file_compression(archive, static_cast<zip_uint64_t>(index), ZIP_CM_DEFLATE, 6) < 0)
        return CodeOf(zip_get_error(archive));
    return kZipOk;
}

} // namespace

int ZipFiles(const QStringList& namesOrPatterns, const QString& zipFile,
             const ZipProgress& progress) {
    const QString zipPath = QFileInfo(zipFile).absoluteFilePath();
    QFileInfoList files;
    std::set<QString> entryNames;
    for (const QString& name : namesOrPatterns) {
        for (const QFileInfo& file : MatchingFiles(name)) {
            if (file.absoluteFilePath() == zipPath)
                continue; // a pattern may match the archive being made
            if (!entryNames.insert(file.fileName()).second) return kZipNamesRepeated;
            files << file;
        }
    }
    if (files.isEmpty()) return kZipNothingToDo;

    int error = 0;
    zip_t* archive =
        zip_open(QFile::encodeName(zipPath).constData(), ZIP_CREATE | ZIP_TRUNCATE, &error);
    if (archive == nullptr) return error == ZIP_ER_MEMORY ? kZipOutOfMemory : kZipCreateProblem;
    PackProgress state{&progress, {}};
    for (const QFileInfo& file : files) {
        const int code = AddFile(archive, file);
        if (code != kZipOk) {
            zip_discard(archive);
            return code;
        }
        state.names << file.fileName();
    }
    if (progress)
        zip_register_progress_callback_with_state(archive, 0.001, OnPackProgress, nullptr, &state);
    if (zip_close(archive) < 0) {
        const int code = CodeOf(zip_get_error(archive));
        zip_discard(archive);
        return code;
    }
    return kZipOk;
}

} // namespace quorvel
