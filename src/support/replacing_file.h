#pragma once
// Replacing a file's whole content safely. The new content goes to a temporary
// file beside the old one, which it replaces (by rename) only when every byte
// was written and reached the disk. Whatever goes wrong - a full disk, a size
// limit, a folder without write access - the old file stays as it was, no
// temporary file is left behind, and ErrorText() names the file and gives the
// system's own reason: "Could not write /data/files.txt: No space left on device".
//
// Every write in the program that replaces a file goes through here: the
// settings file, file lists, downloads, unzipped files, the autostart entry.
//
// Content already in memory:
//   if (const auto error = ReplaceFileContents(path, bytes)) report(*error);
//
// Content that arrives piece by piece:
//   ReplacingFile out(path);
//   if (!out.Open()) return out.ErrorText();
//   for (each piece) if (!out.Write(piece)) return out.ErrorText();
//   if (!out.Commit()) return out.ErrorText();
// Destroying the object without Commit() (or calling Cancel()) drops the new
// content and leaves the old file alone.
//
// A replaced file keeps its permissions; a new file gets the default ones, or
// those given to SetNewFilePermissions() before Open().

#include <QByteArray>
#include <QByteArrayView>
#include <QFileDevice>
#include <QSaveFile>
#include <QString>

#include <optional>

namespace quorvel {

class ReplacingFile {
public:
    explicit ReplacingFile(const QString& path);
    ReplacingFile(const ReplacingFile&) = delete;
    ReplacingFile& operator=(const ReplacingFile&) = delete;

    void SetNewFilePermissions(QFileDevice::Permissions permissions) {
        newFilePermissions_ = permissions;
    }

    bool Open();
    // False when not every byte could be written; later calls fail too.
    bool Write(QByteArrayView bytes);
    // Flushes to the disk, checks the size written and puts the new file in
    // place of the old one.
    bool Commit();
    void Cancel();

    const QString& Path() const { return path_; }
    qint64 BytesWritten() const { return written_; }
    // Empty while nothing failed.
    const QString& ErrorText() const { return error_; }

private:
    bool Fail(const QString& action, const QString& reason);

    QString path_;
    QSaveFile file_;
    std::optional<QFileDevice::Permissions> newFilePermissions_;
    qint64 written_ = 0;
    QString error_;
};

// Replaces the file's content by bytes; the error text when it failed.
std::optional<QString>
ReplaceFileContents(const QString& path, QByteArrayView bytes,
                    std::optional<QFileDevice::Permissions> newFilePermissions = std::nullopt);

} // namespace quorvel
