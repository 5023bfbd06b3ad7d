#include "webdata/reply_stream.h"

#include <algorithm>
#include <utility>

namespace quorvel {

namespace {
QByteArrayView WithoutCr(QByteArrayView line) {
    return line.endsWith('\r') ? line.chopped(1) : line;
}
} // namespace

void ReplyStream::Append(QByteArray bytes) {
    if (raw_.isEmpty())
        raw_ =
            std::move(bytes); // not copied, and ours alone, so taking from its front moves no byte
    else
        raw_.append(bytes);
}

void ReplyStream::Clear() {
    mode_ = Mode::kIdle;
    framing_ = {};
    bodyLeft_ = 0;
    afterFinal_ = false;
    wanted_ = false;
    broken_ = false;
    text_.clear();
    pos_ = 0;
    raw_.clear();
    decoder_.Reset();
}

bool ReplyStream::IsEmpty() const {
    return pos_ >= text_.size() && raw_.isEmpty();
}

QByteArray ReplyStream::Unconsumed() const {
    return text_.mid(pos_) + raw_;
}

void ReplyStream::ExpectReply(LineSink& sink) {
    wanted_ = true;
    // The body of a reply whose final line was read runs on to its own end first.
    if (mode_ == Mode::kBody && afterFinal_) return;
    const QByteArray left = Unconsumed();
    if (!left.isEmpty()) sink.OnDropped(left);
    text_.clear();
    pos_ = 0;
    raw_.clear();
    decoder_.Reset();
    afterFinal_ = false;
    mode_ = Mode::kHead;
}

// Moves up to n bytes from the front of raw_ into text_; returns how many.
// With no text left over the bytes become the text without a copy. A line left
// over takes only the bytes that end it; the rest follows on the next round,
// again without a copy, so a large arrival is never copied to join a few bytes.
qsizetype ReplyStream::TakeRaw(qsizetype n) {
    if (n <= 0) return 0;
    qsizetype take = n;
    if (pos_ >= text_.size()) {
        text_.clear();
        pos_ = 0;
        if (n == raw_.size()) {
            text_ = std::exchange(raw_, QByteArray());
            return n;
        }
    } else {
        const qsizetype lf = QByteArrayView(raw_).first(n).indexOf('\n');
        if (lf >= 0) take = lf + 1;
    }
    text_.append(QByteArrayView(raw_).first(take));
    raw_.remove(0, take);
    return take;
}

bool ReplyStream::MoreToTake() const {
    if (raw_.isEmpty()) return false;
    if (mode_ == Mode::kHead) return true;
    if (mode_ != Mode::kBody) return false;
    return framing_.kind == Framing::kUntilClose ||
           (framing_.kind == Framing::kLength && bodyLeft_ > 0);
}

void ReplyStream::DropText(LineSink& sink) {
    if (pos_ < text_.size()) sink.OnDropped(QByteArrayView(text_).sliced(pos_));
    text_.clear();
    pos_ = 0;
}

// Moves what the current framing allows from raw_ into text_. Broken chunked
// coding stops the decoding; the lines decoded before it are still read.
void ReplyStream::Fill(LineSink& sink, bool& bodyEnded) {
    bodyEnded = false;
    switch (mode_) {
    case Mode::kIdle:
        if (!raw_.isEmpty()) sink.OnDropped(std::exchange(raw_, QByteArray()));
        return;
    case Mode::kHead:
        TakeRaw(raw_.size());
        return;
    case Mode::kBody:
        break;
    }
    switch (framing_.kind) {
    case Framing::kUntilClose:
        TakeRaw(raw_.size());
        return;
    case Framing::kLength: {
        bodyLeft_ -=
            TakeRaw(static_cast<qsizetype>(std::min<std::int64_t>(bodyLeft_, raw_.size())));
        bodyEnded = bodyLeft_ == 0;
        return;
    }
    case Framing::kChunked: {
        if (broken_) return;
        if (pos_ > 0) {
            text_.remove(0, pos_);
            pos_ = 0;
        }
        qsizetype used = 0;
        const ChunkDecoder::Result r = decoder_.Decode(raw_, text_, used);
        raw_.remove(0, used);
        broken_ = r == ChunkDecoder::Result::Invalid;
        bodyEnded = r == ChunkDecoder::Result::Done;
        if (bodyEnded) raw_.prepend(decoder_.TakeGivenBack());
        return;
    }
    }
}

void ReplyStream::StartBody(const Framing& framing) {
    raw_.prepend(QByteArrayView(text_).sliced(pos_));
    text_.clear();
    pos_ = 0;
    mode_ = Mode::kBody;
    framing_ = framing;
    bodyLeft_ = std::max<std::int64_t>(0, framing.length);
    afterFinal_ = false;
    decoder_.Reset();
}

void ReplyStream::EndBody(LineSink& sink) {
    DropText(sink);
    mode_ = wanted_ ? Mode::kHead : Mode::kIdle;
    afterFinal_ = false;
    broken_ = false;
    decoder_.Reset();
}

ReplyStream::Outcome ReplyStream::Drain(LineSink& sink) {
    // What a line's answer means for the stream; true when the text must be
    // taken again under a new framing.
    const auto follow = [&](Next next) {
        switch (next) {
        case Next::Continue:
            return false;
        case Next::Body:
            if (mode_ != Mode::kHead) return false;
            StartBody(sink.BodyFraming());
            return true;
        case Next::EndOfReply:
            wanted_ = false;
            if (mode_ == Mode::kBody)
                afterFinal_ = true;
            else
                mode_ = Mode::kIdle;
            DropText(sink);
            return true;
        }
        return false;
    };
    for (;;) {
        bool bodyEnded = false;
        Fill(sink, bodyEnded);
        if (mode_ == Mode::kBody && afterFinal_) DropText(sink);
        bool again = false;
        while (!again && pos_ < text_.size()) {
            if (mode_ == Mode::kBody && sink.TakesLinesInBulk()) {
                const qsizetype last = QByteArrayView(text_).sliced(pos_).lastIndexOf('\n');
                if (last >= 0) pos_ += sink.OnLines(QByteArrayView(text_).sliced(pos_, last + 1));
            }
            const qsizetype lf = text_.indexOf('\n', pos_);
            if (lf < 0) break;
            const QByteArrayView line = WithoutCr(QByteArrayView(text_).sliced(pos_, lf - pos_));
            pos_ = lf + 1;
            again = follow(sink.OnLine(line));
        }
        if (again) continue;
        if (broken_) {
            // Broken after the final line: the reply is over all the same.
            if (!afterFinal_) return Outcome::BadChunking;
            if (!raw_.isEmpty()) sink.OnDropped(std::exchange(raw_, QByteArray()));
            EndBody(sink);
            continue;
        }
        if (bodyEnded) {
            // The end of the body ends its last line.
            if (pos_ < text_.size()) {
                const QByteArray tail = text_.mid(pos_);
                pos_ = text_.size();
                follow(sink.OnLine(WithoutCr(tail)));
            }
            EndBody(sink);
            continue;
        }
        if (pos_ > 0) {
            text_.remove(0, pos_);
            pos_ = 0;
        }
        if (text_.size() > kLineLimit) return Outcome::LineTooLong;
        if (MoreToTake()) continue;
        return Outcome::Ok;
    }
}

} // namespace quorvel
