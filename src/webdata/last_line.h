#pragma once
// The last lines of a file, read backwards from its end, so the time does not
// grow with the file. Lines end at LF, CR LF or CR; empty lines are skipped.

#include <QByteArray>
#include <QFile>
#include <QString>

#include <optional>

namespace quorvel {

struct LastLine {
    QByteArray line;             // empty when the file holds no non-empty line
    bool endsWithLineEnd = true; // the file is empty or its last byte is CR or LF
};

// nullopt when the file cannot be opened or read.
std::optional<LastLine> ReadLastLine(const QString& file);

class BackwardLines {
public:
    // Reads [0, end) of the file, the whole file when end is not given; false
    // when the file cannot be opened.
    bool Open(const QString& file, std::optional<qint64> end = std::nullopt);
    // The non-empty line before the one returned last; false at the start of
    // the file or when the file cannot be read (then Failed is true).
    bool Previous(QByteArray& line);
    bool Failed() const { return failed_; }
    // Whether the part read ends with CR or LF (or is empty).
    bool EndsWithLineEnd() const { return endsWithLineEnd_; }

private:
    bool ReadAt(qint64 offset, qint64 size, QByteArray& out);

    QFile file_;
    qint64 end_ = 0; // the lines before this offset are still to come
    bool failed_ = false;
    bool endsWithLineEnd_ = true;
};

} // namespace quorvel
