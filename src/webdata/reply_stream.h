#pragma once
// Cuts the received bytes into lines and keeps track of where each reply ends.
//
// A line ends at LF; a CR right before the LF belongs to the line end, also
// when the two arrive apart. A reply's head is cut into lines as it comes; once
// the sink has read the head, the body is framed as the head said: so many
// bytes (Content-Length), chunked coding (de-chunked before it is cut), or up
// to the close of the connection. The end of a framed body ends its last line.
//
// A reply ends where its framing ends. Whatever follows the sink's final line
// up to that end, and whatever comes while no request waits for a reply,
// belongs to no command: it goes to OnDropped and is never parsed as the head
// of the next reply.

#include "webdata/chunk_decoder.h"

#include <QByteArray>
#include <QByteArrayView>

#include <cstdint>

namespace quorvel {

class ReplyStream {
public:
    // How the body of the reply being read ends.
    struct Framing {
        enum Kind { kUntilClose, kLength, kChunked } kind = kUntilClose;
        std::int64_t length = 0;
    };
    // Body: the line ended the head; ask BodyFraming. EndOfReply: the line was
    // the reply's final line; the rest of the body is dropped.
    enum class Next { Continue, Body, EndOfReply };
    enum class Outcome { Ok, LineTooLong, BadChunking };

    class LineSink {
    public:
        virtual ~LineSink() = default;
        virtual Next OnLine(QByteArrayView line) = 0;
        virtual Framing BodyFraming() const { return {}; }
        // Whether OnLines may be offered complete body lines in one piece now.
        virtual bool TakesLinesInBulk() const { return false; }
        // Takes whole lines, each with its line end, from the front of lines;
        // returns how many bytes it took (it stops before a line it must see
        // on its own, which then goes to OnLine).
        virtual qsizetype OnLines(QByteArrayView lines) {
            (void)lines;
            return 0;
        }
        virtual void OnDropped(QByteArrayView bytes) { (void)bytes; }
    };

    // Longest text kept without a line end.
    static constexpr qsizetype kLineLimit = qsizetype{1} << 20;

    void Append(QByteArray bytes);
    // Hands every complete line to the sink, in order.
    Outcome Drain(LineSink& sink);
    // A request has gone out: its reply starts where the current reply's
    // framing ends (at once when no reply is being read). Text left over
    // from before goes to the sink's OnDropped.
    void ExpectReply(LineSink& sink);
    // The received text not yet cut into lines.
    QByteArray Unconsumed() const;
    bool IsEmpty() const;
    // Forgets everything: a new connection starts with no reply expected.
    void Clear();

private:
    enum class Mode { kIdle, kHead, kBody };

    void Fill(LineSink& sink, bool& bodyEnded);
    qsizetype TakeRaw(qsizetype n);
    // Whether raw_ holds bytes the current framing lets into text_.
    bool MoreToTake() const;
    void StartBody(const Framing& framing);
    void EndBody(LineSink& sink);
    void DropText(LineSink& sink);

    Mode mode_ = Mode::kIdle;
    Framing framing_;
    std::int64_t bodyLeft_ = 0; // of a body with a length
    bool afterFinal_ = false;   // the body's final line has been read
    bool wanted_ = false;       // a request waits for the next reply
    bool broken_ = false;       // the chunked coding broke; nothing more is decoded
    QByteArray text_;           // bytes to cut into lines
    qsizetype pos_ = 0;
    QByteArray raw_; // bytes not yet taken into text_
    ChunkDecoder decoder_;
};

} // namespace quorvel
