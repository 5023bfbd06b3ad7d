#pragma once
// Undoes the chunked transfer coding of an HTTP body, a piece at a time.

#include <QByteArray>
#include <QByteArrayView>

#include <cstdint>

namespace quorvel {

class ChunkDecoder {
public:
    enum class Result { NeedMore, Done, Invalid };

    void Reset();
    // Consumes bytes from the front of input and appends the body bytes to
    // output. Done: the last chunk and its trailer have been read, and
    // consumed stops right after them.
    Result Decode(QByteArrayView input, QByteArray& output, qsizetype& consumed);
    // A line that ended the trailer without being a trailer field (a trailer
    // that never got its blank line): it was consumed, but belongs to what
    // follows the body. Empty once taken.
    QByteArray TakeGivenBack();

private:
    enum class Stage { Size, Data, DataEnd, Trailer, Done };

    Result EndOfLine(QByteArrayView line);

    Stage stage_ = Stage::Size;
    std::int64_t remaining_ = 0;
    QByteArray line_; // the control line read so far
    QByteArray givenBack_;
};

} // namespace quorvel
