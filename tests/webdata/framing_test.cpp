// Cutting received bytes into lines, de-chunking, and finding a file's last line.
#include "common/temp_home.h"
#include "webdata/last_line.h"
#include "webdata/reply_stream.h"

#include <gtest/gtest.h>

#include <QList>

namespace quorvel::testing {
namespace {

// Records lines; after the line given the body follows in the framing given,
// and the line "OK" ends the reply.
class Lines : public ReplyStream::LineSink {
public:
    ReplyStream::Next OnLine(QByteArrayView line) override {
        lines << line.toByteArray();
        if (!bodyAfter.isEmpty() && line == bodyAfter) return ReplyStream::Next::Body;
        if (line == "OK") return ReplyStream::Next::EndOfReply;
        return ReplyStream::Next::Continue;
    }
    ReplyStream::Framing BodyFraming() const override { return framing; }
    void OnDropped(QByteArrayView bytes) override { dropped += bytes.toByteArray(); }
    QList<QByteArray> lines;
    QByteArray bodyAfter;
    ReplyStream::Framing framing{ReplyStream::Framing::kChunked, 0};
    QByteArray dropped;
};

TEST(ReplyStream, CutsArrivalsIntoLinesAcrossSplitsAndChunksAndRefusesBrokenOnes) {
    using enum ReplyStream::Outcome;
    using F = ReplyStream::Framing;
    struct Case {
        QList<QByteArray> arrivals;
        QByteArray bodyAfter;
        QList<QByteArray> lines;
        ReplyStream::Outcome outcome = Ok;
        F framing = {F::kChunked, 0};
        QByteArray dropped = {};
    };
    const std::vector<Case> cases = {
        {{"ab", "c\r\nde", "f\n"}, {}, {"abc", "def"}},
        // A CR whose LF comes in the next arrival is part of the line end.
        {{"abc\r", "\n\r", "\n"}, {}, {"abc", ""}},
        {{"a\rb\r\r\n"}, {}, {"a\rb\r"}},
        // "5" and its "\r\n" apart, a chunk boundary inside a line.
        {{"HEAD\r\n5\r", "\nx1\r\nx\r\n3\r\n2\r\n\r\n0\r\n\r\n", "NEXT\r\n"},
         "HEAD",
         {"HEAD", "x1", "x2", "NEXT"}},
        // The end of the chunked body ends its last line; extensions and trailers are skipped.
        {{"H\r\n2\r\nOK\r\n0\r\n\r\n"}, "H", {"H", "OK"}},
        {{"H\r\n3;name=v\r\nabc\r\n0\r\nX-Trailer: 1\r\n\r\nNEXT\r\n"}, "H", {"H", "abc", "NEXT"}},
        // A trailer line that is no field ends the trailer and is read again.
        {{"H\r\n3\r\nabc\r\n0\r\nX: 1\r\nHTTP/1.1 200 OK: yes\r\n"},
         "H",
         {"H", "abc", "HTTP/1.1 200 OK: yes"}},
        {{QByteArray(ReplyStream::kLineLimit + 1, 'x')}, {}, {}, LineTooLong},
        {{"H\r\nzz\r\n"}, "H", {"H"}, BadChunking},
        {{"H\r\n2\r\nabc\r\n"}, "H", {"H"}, BadChunking},
        // A body of a given length ends its last line; what follows is a new head.
        {{"H\r\nab\r\nc", "dNEXT\r\n"}, "H", {"H", "ab", "cd", "NEXT"}, Ok, {F::kLength, 6}},
        // After the final line the rest of the body, and all after it, is dropped.
        {{"H\r\nOK\r\n x\r\n", "tail\r\n"},
         "H",
         {"H", "OK"},
         Ok,
         {F::kLength, 9},
         " x\r\ntail\r\n"},
        {{"H\r\n2\r\nOK\r\n", "3\r\n\r\nx\r\n0\r\n\r\nafter"},
         "H",
         {"H", "OK"},
         Ok,
         {F::kChunked, 0},
         "xafter"},
        {{"H\r\nOK\r\nmore\r\n"}, "H", {"H", "OK"}, Ok, {F::kUntilClose, 0}, "more\r\n"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.arrivals.join('|').left(60).toStdString());
        ReplyStream stream;
        Lines sink;
        sink.bodyAfter = c.bodyAfter;
        sink.framing = c.framing;
        stream.ExpectReply(sink);
        ReplyStream::Outcome outcome = Ok;
        for (const QByteArray& a : c.arrivals) {
            stream.Append(a);
            if (outcome == Ok) outcome = stream.Drain(sink);
        }
        EXPECT_EQ(outcome, c.outcome);
        EXPECT_EQ(sink.lines, c.lines);
        EXPECT_EQ(sink.dropped, c.dropped);
    }
}

TEST(ReplyStream, TheNextRequestsReplyStartsWhereTheLastOnesFramingEnds) {
    ReplyStream stream;
    Lines sink;
    sink.bodyAfter = "H";
    stream.Append("left over before any request\r\n");
    stream.Drain(sink);
    EXPECT_TRUE(sink.lines.isEmpty());
    stream.ExpectReply(sink);
    // The last chunk of the first reply comes after the next request went out.
    stream.Append("H\r\n4\r\nOK\r\n\r\n");
    stream.Drain(sink);
    stream.ExpectReply(sink);
    stream.Append("0\r\n\r\nH\r\n2\r\nOK\r\n0\r\n\r\n");
    stream.Drain(sink);
    EXPECT_EQ(sink.lines, (QList<QByteArray>{"H", "OK", "H", "OK"}));
    EXPECT_EQ(sink.dropped, "left over before any request\r\n");
}

TEST(LastLine, IsReadBackwardsPastLineEndsOfEveryKindAndBlockEdges) {
    const QByteArray big(10000, 'q');
    const QByteArray tail(4095, 't'); // its line end sits on a 4096-byte boundary from the end
    const QByteArray head(5000, 'h');
    const struct {
        QByteArray content, last;
        bool endsWithLineEnd;
    } cases[] = {{"a\r\nb\r\n", "b", true},
                 {"a\nb\n", "b", true},
                 {"a\rb\r", "b", true},
                 {"x\r\ny", "y", false},
                 {"a\r\nlast one\r\n\r\n\n\r\r\n", "last one", true},
                 {" \r\n\r\n", " ", true},
                 {"", "", true},
                 {"\r\n\r\n", "", true},
                 {"first\r\n" + big + "\r\n", big, true},
                 {big, big, false},
                 {head + "\n" + tail + "\n", tail, true},
                 {head + "\n" + tail + QByteArray(4096, '\n'), tail, true}};
    TempHome home;
    for (const auto& c : cases) {
        SCOPED_TRACE(c.content.left(40).toStdString());
        const std::optional<LastLine> last =
            ReadLastLine(home.Write(QStringLiteral("f"), c.content));
        ASSERT_TRUE(last.has_value());
        EXPECT_EQ(last->line, c.last);
        EXPECT_EQ(last->endsWithLineEnd, c.endsWithLineEnd);
    }
    EXPECT_FALSE(ReadLastLine(home.File(QStringLiteral("missing"))).has_value());
}

} // namespace
} // namespace quorvel::testing
