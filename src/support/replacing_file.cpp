#include "support/replacing_file.h"

#include "support/disk_sync.h"

#include <QDir>
#include <QFileInfo>

namespace quorvel {

namespace {

// Qt leaves the text empty (or "Unknown error") where it saw a short write
// without a system error.
QString ReasonOf(const QFileDevice& file) {
    const QString text = file.errorString();
    if (text.isEmpty() || text == QLatin1String("Unknown error"))
        return QStringLiteral("not every byte could be written");
    return text;
}

} // namespace

ReplacingFile::ReplacingFile(const QString& path) : path_(path), file_(path) {}

bool ReplacingFile::Open() {
    written_ = 0;
    error_.clear();
    const bool isNew = !QFileInfo::exists(path_);
    // Unbuffered: every write reaches the system at once, so a full disk shows
    // at the write that met it, with the system's reason, and never only in a
    // final flush whose failure would go unnoticed.
    if (!file_.open(QIODevice::WriteOnly | QIODevice::Unbuffered))
        return Fail(QStringLiteral("write"), ReasonOf(file_));
    if (isNew && newFilePermissions_) file_.setPermissions(*newFilePermissions_);
    return true;
}

bool ReplacingFile::Write(QByteArrayView bytes) {
    if (!error_.isEmpty()) return false;
    if (!file_.isOpen())
        return Fail(QStringLiteral("write"), QStringLiteral("the file is not open"));
    const char* data = bytes.data();
    qint64 left = bytes.size();
    while (left > 0) {
        // A short count means the system refused the rest; the next attempt
        // fails at once and brings the system's reason.
        const qint64 done = file_.write(data, left);
        if (done <= 0) return Fail(QStringLiteral("write"), ReasonOf(file_));
        data += done;
        left -= done;
        written_ += done;
    }
    return true;
}

bool ReplacingFile::Commit() {
    if (!error_.isEmpty()) return false;
    if (!file_.isOpen())
        return Fail(QStringLiteral("write"), QStringLiteral("the file is not open"));
    QString reason;
    if (!SyncToDisk(static_cast<int>(file_.handle()), &reason))
        return Fail(QStringLiteral("write"), reason);
    if (const qint64 onDisk = file_.size(); onDisk != written_) {
        return Fail(QStringLiteral("write"),
                    QStringLiteral("%1 of %2 bytes reached the disk").arg(onDisk).arg(written_));
    }
    if (!file_.commit()) return Fail(QStringLiteral("replace"), ReasonOf(file_));
    return true;
}

void ReplacingFile::Cancel() {
    if (file_.isOpen()) file_.cancelWriting();
}

bool ReplacingFile::Fail(const QString& action, const QString& reason) {
    if (error_.isEmpty()) {
        error_ = QStringLiteral("Could not ") + action + u' ' + QDir::toNativeSeparators(path_) +
                 QStringLiteral(": ") + reason;
    }
    Cancel();
    return false;
}

std::optional<QString>
ReplaceFileContents(const QString& path, QByteArrayView bytes,
                    std::optional<QFileDevice::Permissions> newFilePermissions) {
    ReplacingFile file(path);
    if (newFilePermissions) file.SetNewFilePermissions(*newFilePermissions);
    if (file.Open() && file.Write(bytes) && file.Commit()) return std::nullopt;
    return file.ErrorText();
}

} // namespace quorvel
