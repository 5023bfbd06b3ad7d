#include "transfer/replacing_file.h"

#include <QFileInfo>
#include <QRandomGenerator>

#include <filesystem>
#include <system_error>

namespace quorvel {

namespace {
std::filesystem::path FsPath(const QString& path) {
    return std::filesystem::path(path.toStdU16String());
}
} // namespace

ReplacingFile::~ReplacingFile() {
    if (!committed_ && !temp_.fileName().isEmpty()) {
        temp_.close();
        temp_.remove();
    }
}

bool ReplacingFile::Open() {
    const QFileInfo target(target_);
    // A new file of the user's own (not a 0600 temporary one): permissions
    // follow the process's defaults.
    for (int attempt = 0; attempt < 8; ++attempt) {
        const QString suffix = QString::number(QRandomGenerator::global()->generate64(), 36);
        temp_.setFileName(target.absolutePath() + QStringLiteral("/.") + target.fileName() +
                          QLatin1Char('.') + suffix + QStringLiteral(".part"));
        if (temp_.open(QIODevice::WriteOnly | QIODevice::NewOnly)) return true;
        if (!QFileInfo::exists(temp_.fileName())) break; // not a name clash: the folder refuses
    }
    error_ = temp_.errorString();
    temp_.setFileName(QString());
    return false;
}

bool ReplacingFile::Write(const char* data, qint64 size) {
    if (temp_.write(data, size) == size) return true;
    error_ = temp_.errorString();
    return false;
}

bool ReplacingFile::Commit() {
    if (!temp_.flush()) {
        error_ = temp_.errorString();
        return false;
    }
    if (QFileInfo::exists(target_)) temp_.setPermissions(QFile::permissions(target_));
    temp_.close();
    std::error_code code;
    std::filesystem::rename(FsPath(temp_.fileName()), FsPath(target_), code);
    if (code) {
        error_ = QString::fromStdString(code.message());
        return false;
    }
    committed_ = true;
    return true;
}

} // namespace quorvel
