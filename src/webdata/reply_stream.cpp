#include "webdata/reply_stream.h"

#include <utility>

namespace quorvel {

namespace {
QByteArrayView WithoutCr(QByteArrayView line) {
    return line.endsWith('\r') ? line.chopped(1) : line;
}
} // namespace

void ReplyStream::Append(QByteArrayView bytes) {
    if (chunked_)
        raw_.append(bytes);
    else
        text_.append(bytes);
}

void ReplyStream::Clear() {
    text_.clear();
    pos_ = 0;
    raw_.clear();
    chunked_ = false;
    decoder_.Reset();
}

bool ReplyStream::IsEmpty() const {
    return pos_ >= text_.size() && raw_.isEmpty();
}

QByteArray ReplyStream::Unconsumed() const {
    return text_.mid(pos_) + raw_;
}

void ReplyStream::Compact() {
    if (pos_ > 0) {
        text_.remove(0, pos_);
        pos_ = 0;
    }
}

void ReplyStream::StartChunked() {
    raw_.prepend(QByteArrayView(text_).sliced(pos_));
    text_.clear();
    pos_ = 0;
    chunked_ = true;
    decoder_.Reset();
}

bool ReplyStream::DecodeChunks(bool& bodyEnded) {
    qsizetype used = 0;
    const ChunkDecoder::Result r = decoder_.Decode(raw_, text_, used);
    raw_.remove(0, used);
    if (r == ChunkDecoder::Result::Invalid) return false;
    bodyEnded = r == ChunkDecoder::Result::Done;
    return true;
}

ReplyStream::Outcome ReplyStream::Drain(LineSink& sink) {
    for (;;) {
        bool bodyEnded = false;
        if (chunked_ && !DecodeChunks(bodyEnded)) return Outcome::BadChunking;
        bool restart = false;
        while (!restart) {
            if (sink.TakesLinesInBulk()) {
                const qsizetype last = QByteArrayView(text_).sliced(pos_).lastIndexOf('\n');
                if (last >= 0) pos_ += sink.OnLines(QByteArrayView(text_).sliced(pos_, last + 1));
            }
            const qsizetype lf = text_.indexOf('\n', pos_);
            if (lf < 0) break;
            const QByteArrayView line = WithoutCr(QByteArrayView(text_).sliced(pos_, lf - pos_));
            pos_ = lf + 1;
            switch (sink.OnLine(line)) {
            case Next::Continue:
                break;
            case Next::ChunkedBody:
                StartChunked();
                restart = true;
                break;
            case Next::Stop:
                Compact();
                return Outcome::Ok;
            }
        }
        if (restart) continue;
        if (bodyEnded) {
            if (pos_ < text_.size()) {
                const QByteArray tail = text_.mid(pos_);
                pos_ = text_.size();
                sink.OnLine(WithoutCr(tail));
            }
            // What follows the body belongs to the next reply.
            chunked_ = false;
            text_ = std::exchange(raw_, QByteArray());
            pos_ = 0;
            continue;
        }
        Compact();
        return text_.size() > kLineLimit ? Outcome::LineTooLong : Outcome::Ok;
    }
}

} // namespace quorvel
