#pragma once
// The last non-empty line of a file, read backwards from its end, so the time
// does not grow with the file. Lines end at LF, CR LF or CR.

#include <QByteArray>
#include <QString>

#include <optional>

namespace quorvel {

struct LastLine {
    QByteArray line;             // empty when the file holds no non-empty line
    bool endsWithLineEnd = true; // the file is empty or its last byte is CR or LF
};

// nullopt when the file cannot be opened or read.
std::optional<LastLine> ReadLastLine(const QString& file);

} // namespace quorvel
