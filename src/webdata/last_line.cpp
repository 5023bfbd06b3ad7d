#include "webdata/last_line.h"

#include <QFile>
#include <QList>

#include <algorithm>

namespace quorvel {

namespace {

constexpr qint64 kBlock = 4096;

bool IsLineEnd(char c) {
    return c == '\n' || c == '\r';
}

// Reads [offset, offset + size) of the file.
bool ReadAt(QFile& file, qint64 offset, qint64 size, QByteArray& out) {
    if (!file.seek(offset)) return false;
    out = file.read(size);
    return out.size() == size;
}

} // namespace

std::optional<LastLine> ReadLastLine(const QString& name) {
    QFile file(name);
    if (!file.open(QIODevice::ReadOnly)) return std::nullopt;
    LastLine result;
    qint64 end = file.size();
    QByteArray block;
    // Skip the line ends (and empty lines) at the end of the file.
    bool first = true;
    while (end > 0) {
        const qint64 start = std::max<qint64>(0, end - kBlock);
        if (!ReadAt(file, start, end - start, block)) return std::nullopt;
        if (first) {
            result.endsWithLineEnd = IsLineEnd(block.back());
            first = false;
        }
        qsizetype i = block.size();
        while (i > 0 && IsLineEnd(block[i - 1]))
            --i;
        end = start + i;
        if (i > 0) break;
    }
    // Collect the line backwards up to the line end before it.
    QList<QByteArray> pieces; // last piece first
    while (end > 0) {
        const qint64 start = std::max<qint64>(0, end - kBlock);
        if (!ReadAt(file, start, end - start, block)) return std::nullopt;
        qsizetype i = block.size();
        while (i > 0 && !IsLineEnd(block[i - 1]))
            --i;
        pieces.append(block.mid(i));
        if (i > 0) break;
        end = start;
    }
    for (auto it = pieces.crbegin(); it != pieces.crend(); ++it)
        result.line += *it;
    return result;
}

} // namespace quorvel
