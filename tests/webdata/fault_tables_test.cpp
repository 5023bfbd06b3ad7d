// Replies cut or stalled at every place, and appends killed at random moments:
// the data file always ends at the end of its last whole record, and the next
// run makes it equal to the service's file byte for byte.
#include "fake_service.h"
#include "webdata/line_dates.h"
#include "webdata_fixture.h"

#include <QDir>
#include <QProcess>

#include <iostream>
#include <random>

namespace quorvel::testing {
namespace {

const QByteArray kBefore = "2006-05-01 09:59:00,0.5\r\n";
const QList<QByteArray> kRecords = MinuteRecords(3);
const QByteArray kBody = Joined(kRecords) + "OK\r\n";

// A reply and, for each byte of its body, where that byte stands in the reply.
struct Framed {
    const char* name;
    QByteArray bytes;
    QList<qsizetype> at;
};

Framed WithLength() {
    Framed f{"Content-Length", HttpReply(kBody), {}};
    const qsizetype start = f.bytes.size() - kBody.size();
    for (qsizetype i = 0; i < kBody.size(); ++i)
        f.at << start + i;
    return f;
}

Framed Chunked() {
    Framed f{"chunked", "HTTP/1.1 200 OK\r\nTransfer-Encoding: chunked\r\n\r\n", {}};
    qsizetype pos = 0;
    for (qsizetype size : {7, 20, 1, 30, 1000}) {
        size = std::min(size, kBody.size() - pos);
        f.bytes += QByteArray::number(qulonglong(size), 16) + "\r\n";
        for (qsizetype i = 0; i < size; ++i) {
            f.at << f.bytes.size();
            f.bytes += kBody[pos++];
        }
        f.bytes += "\r\n";
    }
    f.bytes += "0\r\n\r\n";
    return f;
}

// The records whose line end is among the first n bytes of the reply, and
// whether the final line is.
std::pair<QByteArray, bool> Received(const Framed& f, qsizetype n) {
    QByteArray records;
    qsizetype lineStart = 0;
    for (qsizetype i = 0; i < kBody.size(); ++i) {
        if (kBody[i] != '\n') continue;
        if (f.at[i] >= n) return {records, false};
        const QByteArray line = kBody.mid(lineStart, i + 1 - lineStart);
        if (line.startsWith("OK")) return {records, true};
        records += line;
        lineStart = i + 1;
    }
    return {records, false};
}

TEST_F(WebDataTest, AReplyCutAtEveryByteLeavesItsWholeRecordsAndNoOther) {
    for (const Framed& f : {WithLength(), Chunked()}) {
        for (qsizetype n = 0; n <= f.bytes.size(); ++n) {
            SCOPED_TRACE(std::string(f.name) + " cut after " + std::to_string(n));
            const QString file = home.Write(QStringLiteral("cut.dat"), kBefore);
            server.replies.clear();
            QueueNewData("OK 2006-05-01 10:02:00", {Send(f.bytes.left(n)), CloseConnection()});
            auto [records, ended] = Received(f, n);
            if (n == 0) {
                // Closed before any byte: the request goes once more.
                server.Queue(f.bytes);
                records = Joined(kRecords);
                ended = true;
            }
            ASSERT_EQ(web.GetNewData(file, 1, kDateTime), ended);
            ASSERT_EQ(home.Read(QStringLiteral("cut.dat")), kBefore + records);
        }
    }
}

TEST_F(WebDataTest, AReplyThatStallsAnywhereEndsByTimeOutWithItsWholeRecords) {
    clock.SetWaits(WaitLengths{.replyGap = std::chrono::milliseconds(150)});
    const struct {
        const char* where;
        QByteArray after; // the reply stops right after the first of these
        int extra = 0;    // ... and this many bytes more
    } places[] = {
        {"in the status line", "HTTP/1.1 2"},      {"in a header line", "HTTP/1.1 200 OK\r\n", 3},
        {"before the blank line", "\r\n\r\n", -2}, {"inside a record", "10:01:00", -3},
        {"between records", "10:01:00,1.5\r\n"},   {"inside the final line", "\r\nO"},
        {"after the final line", "OK\r\n"}};
    for (const Framed& f : {WithLength(), Chunked()}) {
        for (const auto& p : places) {
            SCOPED_TRACE(std::string(f.name) + " " + p.where);
            const qsizetype n = f.bytes.indexOf(p.after) + p.after.size() + p.extra;
            const QString file = home.Write(QStringLiteral("stall.dat"), kBefore);
            server.replies.clear();
            QueueNewData("OK 2006-05-01 10:02:00", {Send(f.bytes.left(n)), Pause(100000)});
            const auto [records, ended] = Received(f, n);
            EXPECT_EQ(web.GetNewData(file, 1, kDateTime), ended);
            EXPECT_EQ(home.Read(QStringLiteral("stall.dat")), kBefore + records);
        }
    }
}

TEST_F(WebDataTest, AnAppendKilledAtRandomMomentsIsCompletedByTheNextRun) {
    FakeService service;
    // Large enough for several gathered writes while the reply comes in.
    service.records = MinuteRecords(30000);
    service.pieces = 60;
    service.pauseMs = 3;
    service.Serve(server);
    const QByteArray start = Joined(service.records.first(100));
    std::mt19937 random(20061);
    std::uniform_int_distribution<int> moment(0, 600);
    int duringAppend = 0;
    for (int run = 0; run < 50; ++run) {
        SCOPED_TRACE(run);
        const QString file = home.Write(QStringLiteral("kill.dat"), start);
        service.pauseMs = 3; // the killed run's reply comes slowly, the next one at once
        QProcess child;
        child.start(QStringLiteral(WEBDATA_APPEND_CHILD),
                    {server.HostPort(), file, QString::number(kDateTime)});
        ASSERT_TRUE(child.waitForStarted());
        QElapsedTimer timer;
        timer.start();
        const int killAt = moment(random);
        PumpUntil([&] { return timer.elapsed() >= killAt; }, killAt + 10);
        child.kill();
        ASSERT_TRUE(PumpUntil([&] { return child.state() == QProcess::NotRunning; }, 10000));
        const qint64 grown = QFileInfo(file).size() - start.size();
        if (grown > 0 && grown < service.File().size() - start.size()) ++duringAppend;
        service.pauseMs = 0;

        // Each normal run on a connection of its own, like a run after a restart.
        web.SetUserID(QStringLiteral("U%1").arg(run));
        ASSERT_TRUE(web.GetNewData(file, 1, kDateTime)) << web.LastError().toStdString();
        ASSERT_EQ(home.Read(QStringLiteral("kill.dat")), service.File());
        ASSERT_EQ(
            QDir(home.Path()).entryList({QStringLiteral("*kill.dat*")}, QDir::Files | QDir::Hidden),
            QStringList{QStringLiteral("kill.dat")});
    }
    // How many kills met the append itself depends on the machine's speed.
    std::cout << "kills during an append: " << duringAppend << " of 50\n";
}

} // namespace
} // namespace quorvel::testing
