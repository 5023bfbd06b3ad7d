// Cutting received bytes into lines, de-chunking, and finding a file's last line.
#include "common/temp_home.h"
#include "webdata/last_line.h"
#include "webdata/reply_stream.h"

#include <gtest/gtest.h>

#include <QList>

namespace quorvel::testing {
namespace {

// Records lines; announces a chunked body after the line given.
class Lines : public ReplyStream::LineSink {
public:
    ReplyStream::Next OnLine(QByteArrayView line) override {
        lines << line.toByteArray();
        if (!chunkAfter.isEmpty() && line == chunkAfter) return ReplyStream::Next::ChunkedBody;
        return ReplyStream::Next::Continue;
    }
    QList<QByteArray> lines;
    QByteArray chunkAfter;
};

TEST(ReplyStream, CutsArrivalsIntoLinesAcrossSplitsAndChunksAndRefusesBrokenOnes) {
    using enum ReplyStream::Outcome;
    struct Case {
        QList<QByteArray> arrivals;
        QByteArray chunkAfter;
        QList<QByteArray> lines;
        ReplyStream::Outcome outcome = Ok;
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
        {{QByteArray(ReplyStream::kLineLimit + 1, 'x')}, {}, {}, LineTooLong},
        {{"H\r\nzz\r\n"}, "H", {"H"}, BadChunking},
        {{"H\r\n2\r\nabc\r\n"}, "H", {"H"}, BadChunking}};
    for (const Case& c : cases) {
        SCOPED_TRACE(c.arrivals.join('|').left(60).toStdString());
        ReplyStream stream;
        Lines sink;
        sink.chunkAfter = c.chunkAfter;
        ReplyStream::Outcome outcome = Ok;
        for (const QByteArray& a : c.arrivals) {
            stream.Append(a);
            if (outcome == Ok) outcome = stream.Drain(sink);
        }
        EXPECT_EQ(outcome, c.outcome);
        EXPECT_EQ(sink.lines, c.lines);
    }
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
