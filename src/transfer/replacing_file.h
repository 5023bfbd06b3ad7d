#pragma once
// Writes a file under a temporary name beside its target and puts it in the
// target's place only when complete, in one rename: until then, and whenever
// writing fails, the older copy stays as it was. A file that is not committed
// is removed.

#include <QFile>
#include <QString>

namespace quorvel {

class ReplacingFile {
public:
    explicit ReplacingFile(const QString& target) : target_(target) {}
    ~ReplacingFile();
    ReplacingFile(const ReplacingFile&) = delete;
    ReplacingFile& operator=(const ReplacingFile&) = delete;

    bool Open();
    bool Write(const char* data, qint64 size);
    // Takes over the older copy's permissions and replaces it.
    bool Commit();
    QString ErrorString() const { return error_; }

private:
    QString target_;
    QFile temp_;
    QString error_;
    bool committed_ = false;
};

} // namespace quorvel
