// The reply stream with its chunk decoder: any bytes, in any framing, cut
// into lines the same way whether they come whole or in pieces.
#include "fuzz_input.h"
#include "webdata/reply_stream.h"

#include <cstdlib>

namespace {

using quorvel::ReplyStream;

// Records what the stream hands over; the line "H" ends the head, "OK" the reply.
class Recorder : public ReplyStream::LineSink {
public:
    explicit Recorder(ReplyStream::Framing framing) : framing_(framing) {}
    ReplyStream::Next OnLine(QByteArrayView line) override {
        seen += line.toByteArray() + '\n';
        if (line == "H") return ReplyStream::Next::Body;
        if (line.startsWith("OK")) return ReplyStream::Next::EndOfReply;
        return ReplyStream::Next::Continue;
    }
    ReplyStream::Framing BodyFraming() const override { return framing_; }
    void OnDropped(QByteArrayView bytes) override { dropped += bytes.size(); }

    QByteArray seen;
    qsizetype dropped = 0;

private:
    ReplyStream::Framing framing_;
};

struct Outcome {
    QByteArray seen;
    qsizetype dropped;
    ReplyStream::Outcome outcome;
};

Outcome Run(const QList<QByteArray>& pieces, ReplyStream::Framing framing, int requestAfter) {
    ReplyStream stream;
    Recorder sink(framing);
    stream.ExpectReply(sink);
    ReplyStream::Outcome outcome = ReplyStream::Outcome::Ok;
    for (const QByteArray& piece : pieces) {
        stream.Append(piece);
        outcome = stream.Drain(sink);
        if (outcome != ReplyStream::Outcome::Ok) break;
        // A second request goes out once the first reply has ended.
        if (requestAfter > 0 && sink.seen.contains("OK")) {
            stream.ExpectReply(sink);
            requestAfter = 0;
        }
    }
    return {sink.seen, sink.dropped, outcome};
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    quorvel::fuzz::Input input(data, size);
    const std::uint8_t kind = input.Byte();
    const std::uint8_t seed = input.Byte();
    const QByteArray bytes = input.Rest();
    ReplyStream::Framing framing;
    framing.kind = static_cast<ReplyStream::Framing::Kind>(kind % 3);
    framing.length = bytes.size() / 2;
    const int requestAfter = kind & 4;
    const Outcome whole = Run({bytes}, framing, 0);
    const Outcome split = Run(quorvel::fuzz::Pieces(bytes, seed), framing, 0);
    if (whole.outcome != split.outcome || whole.seen != split.seen ||
        whole.dropped != split.dropped)
        std::abort();
    Run(quorvel::fuzz::Pieces(bytes, seed), framing, requestAfter);
    return 0;
}
