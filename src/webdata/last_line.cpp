#include "webdata/last_line.h"

#include <QList>

#include <algorithm>

namespace quorvel {

namespace {

constexpr qint64 kBlock = 4096;

bool IsLineEnd(char c) {
    return c == '\n' || c == '\r';
}

} // namespace

bool BackwardLines::ReadAt(qint64 offset, qint64 size, QByteArray& out) {
    if (!file_.seek(offset)) return false;
    out = file_.read(size);
    return out.size() == size;
}

bool BackwardLines::Open(const QString& name, std::optional<qint64> end) {
    file_.setFileName(name);
    failed_ = false;
    if (!file_.open(QIODevice::ReadOnly)) {
        failed_ = true;
        return false;
    }
    end_ = std::min(file_.size(), end.value_or(file_.size()));
    QByteArray last;
    endsWithLineEnd_ = end_ == 0 || (ReadAt(end_ - 1, 1, last) && IsLineEnd(last[0]));
    return true;
}

bool BackwardLines::Previous(QByteArray& line) {
    line.clear();
    QByteArray block;
    // Skip the line ends (and empty lines) before end_.
    while (end_ > 0) {
        const qint64 start = std::max<qint64>(0, end_ - kBlock);
        if (!ReadAt(start, end_ - start, block)) return !(failed_ = true);
        qsizetype i = block.size();
        while (i > 0 && IsLineEnd(block[i - 1]))
            --i;
        end_ = start + i;
        if (i > 0) break;
    }
    if (end_ == 0) return false;
    // Collect the line backwards up to the line end before it.
    QList<QByteArray> pieces; // last piece first
    while (end_ > 0) {
        const qint64 start = std::max<qint64>(0, end_ - kBlock);
        if (!ReadAt(start, end_ - start, block)) return !(failed_ = true);
        qsizetype i = block.size();
        while (i > 0 && !IsLineEnd(block[i - 1]))
            --i;
        pieces.append(block.mid(i));
        end_ = start + i;
        if (i > 0) break;
    }
    for (auto it = pieces.crbegin(); it != pieces.crend(); ++it)
        line += *it;
    return true;
}

std::optional<LastLine> ReadLastLine(const QString& name) {
    BackwardLines lines;
    if (!lines.Open(name)) return std::nullopt;
    LastLine result;
    result.endsWithLineEnd = lines.EndsWithLineEnd();
    if (!lines.Previous(result.line) && lines.Failed()) return std::nullopt;
    return result;
}

} // namespace quorvel
