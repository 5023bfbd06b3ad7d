#pragma once
// Cuts the received bytes into lines. A line ends at LF; a CR right before the
// LF belongs to the line end, also when the two arrive apart. Once a reply's
// head announces chunked coding, the body is de-chunked before it is cut, and
// the end of the body ends its last line.

#include "webdata/chunk_decoder.h"

#include <QByteArray>
#include <QByteArrayView>

namespace quorvel {

class ReplyStream {
public:
    enum class Next { Continue, ChunkedBody, Stop };
    enum class Outcome { Ok, LineTooLong, BadChunking };

    class LineSink {
    public:
        virtual ~LineSink() = default;
        // ChunkedBody: the bytes after this line are a chunked body.
        // Stop: leave the remaining bytes for later.
        virtual Next OnLine(QByteArrayView line) = 0;
        // Whether OnLines may be offered complete lines in one piece now.
        virtual bool TakesLinesInBulk() const { return false; }
        // Takes whole lines, each with its line end, from the front of lines;
        // returns how many bytes it took (it stops before a line it must see
        // on its own, which then goes to OnLine).
        virtual qsizetype OnLines(QByteArrayView lines) {
            (void)lines;
            return 0;
        }
    };

    // Longest text kept without a line end.
    static constexpr qsizetype kLineLimit = qsizetype{1} << 20;

    void Append(QByteArrayView bytes);
    // Hands every complete line to the sink, in order.
    Outcome Drain(LineSink& sink);
    // The received text not yet cut into lines.
    QByteArray Unconsumed() const;
    bool IsEmpty() const;
    void Clear();

private:
    void Compact();
    void StartChunked();
    bool DecodeChunks(bool& bodyEnded);

    QByteArray text_; // bytes to cut into lines
    qsizetype pos_ = 0;
    QByteArray raw_; // chunked bytes not yet decoded
    bool chunked_ = false;
    ChunkDecoder decoder_;
};

} // namespace quorvel
