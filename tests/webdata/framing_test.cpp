// Cutting received bytes into lines, de-chunking, and finding a file's last line.
#include "common/temp_home.h"
#include "webdata/chunk_decoder.h"
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

QList<QByteArray> Cut(const QList<QByteArray>& arrivals, const QByteArray& chunkAfter = {}) {
    ReplyStream stream;
    Lines sink;
    sink.chunkAfter = chunkAfter;
    for (const QByteArray& a : arrivals) {
        stream.Append(a);
        EXPECT_EQ(stream.Drain(sink), ReplyStream::Outcome::Ok);
    }
    return sink.lines;
}

TEST(ReplyStream, KeepsAPartialLineForTheNextArrival) {
    EXPECT_EQ(Cut({"ab", "c\r\nde", "f\n"}), (QList<QByteArray>{"abc", "def"}));
}

TEST(ReplyStream, ACrBeforeAnLfInTheNextArrivalIsPartOfTheLineEnd) {
    EXPECT_EQ(Cut({"abc\r", "\n\r", "\n"}), (QList<QByteArray>{"abc", ""}));
}

TEST(ReplyStream, ALoneCrInsideALineStays) {
    EXPECT_EQ(Cut({"a\rb\r\r\n"}), (QList<QByteArray>{"a\rb\r"}));
}

TEST(ReplyStream, DechunksFromTheAnnouncedLineOn) {
    // "5" then "\r\n" split from its data, a chunk boundary inside a line.
    const QList<QByteArray> lines =
        Cut({"HEAD\r\n5\r", "\nx1\r\nx\r\n3\r\n2\r\n\r\n0\r\n\r\n", "NEXT\r\n"}, "HEAD");
    EXPECT_EQ(lines, (QList<QByteArray>{"HEAD", "x1", "x2", "NEXT"}));
}

TEST(ReplyStream, FlushesTheLastLineWhenTheChunkedBodyEnds) {
    EXPECT_EQ(Cut({"H\r\n2\r\nOK\r\n0\r\n\r\n"}, "H"), (QList<QByteArray>{"H", "OK"}));
}

TEST(ReplyStream, RefusesEndlessLinesAndBrokenChunking) {
    ReplyStream stream;
    Lines sink;
    stream.Append(QByteArray(ReplyStream::kLineLimit + 1, 'x'));
    EXPECT_EQ(stream.Drain(sink), ReplyStream::Outcome::LineTooLong);

    ReplyStream chunked;
    sink.chunkAfter = "H";
    chunked.Append("H\r\nzz\r\n");
    EXPECT_EQ(chunked.Drain(sink), ReplyStream::Outcome::BadChunking);
}

TEST(ChunkDecoder, ReadsExtensionsAndTrailers) {
    ChunkDecoder decoder;
    QByteArray out;
    qsizetype used = 0;
    const QByteArray input = "3;name=v\r\nabc\r\n0\r\nX-Trailer: 1\r\n\r\nrest";
    EXPECT_EQ(decoder.Decode(input, out, used), ChunkDecoder::Result::Done);
    EXPECT_EQ(out, "abc");
    EXPECT_EQ(input.mid(used), "rest");
}

TEST(ChunkDecoder, RejectsDataWithoutItsLineEnd) {
    ChunkDecoder decoder;
    QByteArray out;
    qsizetype used = 0;
    EXPECT_EQ(decoder.Decode("2\r\nabc\r\n", out, used), ChunkDecoder::Result::Invalid);
}

class LastLineTest : public ::testing::Test {
protected:
    QByteArray Last(const QByteArray& content) {
        const std::optional<LastLine> last = ReadLastLine(home.Write(QStringLiteral("f"), content));
        EXPECT_TRUE(last.has_value());
        return last ? last->line : QByteArray("<unreadable>");
    }
    TempHome home;
};

TEST_F(LastLineTest, LinesEndAtLfCrLfOrCr) {
    EXPECT_EQ(Last("a\r\nb\r\n"), "b");
    EXPECT_EQ(Last("a\nb\n"), "b");
    EXPECT_EQ(Last("a\rb\r"), "b");
    EXPECT_EQ(Last("a\nb"), "b");
}

TEST_F(LastLineTest, SkipsEmptyLinesAtTheEnd) {
    EXPECT_EQ(Last("a\r\nlast one\r\n\r\n\n\r\r\n"), "last one");
    EXPECT_EQ(Last(" \r\n\r\n"), " ");
}

TEST_F(LastLineTest, EmptyFilesAndFilesOfLineEndsHaveNone) {
    EXPECT_EQ(Last(""), "");
    EXPECT_EQ(Last("\r\n\r\n"), "");
}

TEST_F(LastLineTest, ReadsLinesLongerThanOneBlockAndBlockEdges) {
    const QByteArray big(10000, 'q');
    EXPECT_EQ(Last("first\r\n" + big + "\r\n"), big);
    EXPECT_EQ(Last(big), big);
    // A line end exactly at a 4096-byte boundary from the end.
    const QByteArray tail(4095, 't');
    EXPECT_EQ(Last(QByteArray(5000, 'h') + "\n" + tail + "\n"), tail);
    EXPECT_EQ(Last(QByteArray(5000, 'h') + "\n" + tail + QByteArray(4096, '\n')), tail);
}

TEST_F(LastLineTest, TellsWhetherTheFileEndsWithALineEnd) {
    EXPECT_FALSE(ReadLastLine(home.Write(QStringLiteral("a"), "x\r\ny"))->endsWithLineEnd);
    EXPECT_TRUE(ReadLastLine(home.Write(QStringLiteral("b"), "x\r\ny\r"))->endsWithLineEnd);
    EXPECT_FALSE(ReadLastLine(home.File(QStringLiteral("missing"))).has_value());
}

} // namespace
} // namespace quorvel::testing
