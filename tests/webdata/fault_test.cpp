// Faults found by probes and real servers, one per test, each against the
// scripted loopback server with the data file checked byte for byte.
#include "fake_service.h"
#include "webdata/date_texts.h"
#include "webdata/line_dates.h"
#include "webdata_fixture.h"

#include <QDir>
#include <QEventLoop>
#include <QProcess>
#include <QTimer>

namespace quorvel::testing {
namespace {

const QByteArray kFolders = HttpReply("a|b|c|d|e\r\nOK\r\n");

class Faults : public WebDataTest {
protected:
    // Runs the child helper once against the server; pumps events meanwhile.
    QProcess::ExitStatus RunChild(const QString& file, int type, const QStringList& extra = {}) {
        QProcess child;
        child.setProcessChannelMode(QProcess::ForwardedErrorChannel);
        child.start(QStringLiteral(WEBDATA_APPEND_CHILD),
                    QStringList{server.HostPort(), file, QString::number(type)} + extra);
        EXPECT_TRUE(child.waitForStarted());
        EXPECT_TRUE(PumpUntil([&] { return child.state() == QProcess::NotRunning; }, 20000));
        return child.exitStatus();
    }
    // Files in the test's folder other than the program log.
    QStringList DataFolderEntries() const {
        QStringList names = QDir(home.Path()).entryList(QDir::Files | QDir::Hidden);
        names.removeIf([](const QString& n) { return n.endsWith(QLatin1String(".log")); });
        return names;
    }
    FakeService service;
};

TEST_F(Faults, AnAppendStoppedInsideARecordLeavesNoTornRecordAndTheNextRunCompletesTheFile) {
    service.records = MinuteRecords(300);
    service.Serve(server);
    const QByteArray start = Joined(service.records.first(10));
    // The cap falls inside a record.
    const qsizetype cap = start.size() + Joined(service.records.mid(10, 150)).size() + 13;
    for (const bool killed : {false, true}) {
        // A write past the cap fails, or kills the child in the middle of a record.
        SCOPED_TRACE(killed ? "killed" : "write failure");
        const QString file = home.Write(QStringLiteral("site.dat"), start);
        QStringList extra{QString::number(cap)};
        if (killed) extra << QStringLiteral("die");
        EXPECT_EQ(RunChild(file, kDateTime, extra),
                  killed ? QProcess::CrashExit : QProcess::NormalExit);
        const QByteArray after = home.Read(QStringLiteral("site.dat"));
        if (killed) {
            EXPECT_FALSE(after.endsWith("\r\n"));
            // The display of the last date does not read the torn record either.
            const QByteArray whole = after.left(after.lastIndexOf("\r\n"));
            const QByteArray lastWhole = whole.mid(whole.lastIndexOf("\r\n") + 2);
            EXPECT_EQ(web.LastDateInFile(file, 1, 0, kDateTime, 1),
                      FormatDateLong(DateTimeValue(QString::fromLatin1(lastWhole.left(19)))));
        } else {
            EXPECT_LE(after.size(), cap);
            EXPECT_TRUE(after.endsWith("\r\n"));
            EXPECT_TRUE(service.File().startsWith(after));
        }
        ASSERT_TRUE(web.GetNewData(file, 1, kDateTime)) << web.LastError().toStdString();
        EXPECT_EQ(home.Read(QStringLiteral("site.dat")), service.File());
        EXPECT_EQ(DataFolderEntries(), QStringList{QStringLiteral("site.dat")});
    }
}

TEST_F(Faults, AReplyEndedEarlyKeepsTheRecordsBeforeItAndTheNextRunAddsTheRest) {
    const QList<QByteArray> records = MinuteRecords(4);
    const QByteArray head = "HTTP/1.1 200 OK\r\n\r\n";
    const QByteArray two = Joined(records.first(2));
    const QByteArray torn = records[2].left(12);
    const int gap = int(kGap.count());
    const std::vector<std::pair<const char*, Reply>> endings = {
        {"closed", {Send(head + two + torn), CloseConnection()}},
        {"stalled", {Send(head + two + torn), Pause(gap * 3)}},
        {"cancelled", {Send(head + two + torn), Pause(gap * 3)}},
    };
    for (const auto& [what, ending] : endings) {
        SCOPED_TRACE(what);
        const QString file = home.File(QStringLiteral("early.dat"));
        QFile::remove(file);
        server.replies.clear();
        QueueNewData("OK 2006-05-01 10:03:00", ending);
        if (QByteArray(what) == "cancelled")
            QTimer::singleShot(gap / 4, &web, [&] { web.SetUserCancel(1); });
        EXPECT_FALSE(web.GetNewData(file, 1, kDateTime));
        EXPECT_EQ(home.Read(QStringLiteral("early.dat")), two);

        QueueNewData("OK 2006-05-01 10:03:00",
                     {Send(HttpReply(Joined(records.mid(2)) + "OK\r\n"))});
        ASSERT_TRUE(web.GetNewData(file, 1, kDateTime));
        EXPECT_TRUE(server.requests.last().contains("&date=2006-05-01%2010%3A01%3A00 "));
        EXPECT_EQ(home.Read(QStringLiteral("early.dat")), Joined(records));
    }
}

TEST_F(Faults, TheLastDateComesFromTheLastLineThatHasOne) {
    const QList<QByteArray> records = MinuteRecords(3);
    const struct {
        const char* what;
        QByteArray before;
        QByteArray asked; // the date parameter sent
        QList<QByteArray> fetched;
    } cases[] = {
        {"only a header", "Date,Value\r\n", "0", records},
        {"header and blank lines", "Date,Value\r\n\r\n  \r\n", "0", records},
        {"damaged and blank lines after the records",
         Joined(records.first(2)) + "2006-05-0x 1,damaged\r\nno date here\r\n\r\n",
         "2006-05-01%2010%3A01%3A00", records.mid(2)},
        {"a header before the records", "Date,Value\r\n" + Joined(records.first(1)),
         "2006-05-01%2010%3A00%3A00", records.mid(1)},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        const QString file = home.Write(QStringLiteral("h.dat"), c.before);
        QueueNewData("OK 2006-05-01 10:02:00", {Send(HttpReply(Joined(c.fetched) + "OK\r\n"))});
        ASSERT_TRUE(web.GetNewData(file, 1, kDateTime)) << web.LastError().toStdString();
        EXPECT_TRUE(server.requests.last().contains("&date=" + c.asked + " HTTP/1.1"));
        EXPECT_EQ(home.Read(QStringLiteral("h.dat")), c.before + Joined(c.fetched));
    }
    EXPECT_TRUE(prompter.shown.empty());
}

TEST_F(Faults, AFileWithoutDatesIsReplacedByTheReplyAndNeverGrowsTwice) {
    service.records = MinuteRecords(200);
    service.Serve(server);
    const QString file = home.File(QStringLiteral("nodate.dat"));
    for (int run = 0; run < 2; ++run) {
        ASSERT_TRUE(web.GetNewData(file, 1, kNoDate));
        EXPECT_EQ(home.Read(QStringLiteral("nodate.dat")), service.File()) << run;
    }
    // A reply cut off leaves the file as it was.
    server.responder = nullptr;
    QueueNewData("OK", {Send("HTTP/1.1 200 OK\r\n\r\nnew,1\r\nnew,2\r\n"), CloseConnection()});
    EXPECT_FALSE(web.GetNewData(file, 1, kNoDate));
    EXPECT_EQ(home.Read(QStringLiteral("nodate.dat")), service.File());
    EXPECT_EQ(DataFolderEntries(), QStringList{QStringLiteral("nodate.dat")});
}

TEST_F(Faults, AConnectionTheServerEndedIsOpenedAnewForTheNextCommandAtOnce) {
    const struct {
        const char* what;
        Reply ending;
        bool pump; // whether the client runs an event loop before its next command
    } cases[] = {
        {"closed after the reply", {Send(kFolders), CloseConnection()}, true},
        // Announced, but not yet done when the next command starts.
        {"announced", {Send(HttpReply("a|b|c|d|e\r\nOK\r\n", "Connection: close\r\n"))}, true},
        {"closed while the client was busy", {Send(kFolders)}, false},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        server.Queue(c.ending);
        server.Queue(kFolders);
        ASSERT_TRUE(web.Initialise());
        const int opened = server.connections;
        if (c.pump)
            ASSERT_TRUE(PumpUntil([&] { return socket.State() != kSocketConnected; }));
        else
            server.CloseAll();
        statuses.clear();
        QElapsedTimer timer;
        timer.start();
        EXPECT_TRUE(web.Initialise());
        EXPECT_LT(timer.elapsed(), kGap.count());
        EXPECT_EQ(web.LastError(), QStringLiteral("OK"));
        EXPECT_EQ(server.connections, opened + 1);
        EXPECT_TRUE(statuses.contains(QStringLiteral("Connecting to ") + server.HostPort()));
    }
}

TEST_F(Faults, AReusedConnectionClosedBeforeAnyReplyByteCarriesTheRequestOnceMore) {
    server.Queue(kFolders);
    server.Queue(Reply{CloseConnection()});
    server.Queue(kFolders);
    ASSERT_TRUE(web.Initialise());
    EXPECT_TRUE(web.Initialise());
    EXPECT_EQ(server.requests.size(), 3);
    EXPECT_EQ(server.requests[1], server.requests[2]);
    EXPECT_EQ(server.connections, 2);

    // A fresh connection is not tried again, and the failure has its own text.
    web.SetUserID(QStringLiteral("other")); // closes the connection
    server.Queue(Reply{CloseConnection()});
    QElapsedTimer timer;
    timer.start();
    EXPECT_FALSE(web.Initialise());
    EXPECT_LT(timer.elapsed(), kGap.count());
    EXPECT_EQ(server.requests.size(), 4);
    EXPECT_FALSE(web.LastError().isEmpty());
    EXPECT_NE(web.LastError(), QStringLiteral("OK"));
}

TEST_F(Faults, BytesThatArriveWhileABoxIsOpenInsideReplyProcessingAreProcessed) {
    const QList<QByteArray> records = MinuteRecords(300);
    const QByteArray reply = HttpReply(Joined(records) + "OK\r\n");
    const qsizetype firstPiece = reply.indexOf(records[10]);
    QueueNewData("OK 0", {Send(reply.left(firstPiece)), Pause(20), Send(reply.mid(firstPiece))});
    web.EnableLog(3, 1);
    bool boxShown = false;
    QObject::connect(&web, &CTALUWebData::ShowLog, [&](const QString& line) {
        if (boxShown || !line.startsWith(QStringLiteral("D>Open"))) return;
        boxShown = true; // a box runs its own event loop until it is answered
        QEventLoop box;
        QTimer::singleShot(150, &box, &QEventLoop::quit);
        box.exec();
    });
    const QString file = home.File(QStringLiteral("box.dat"));
    EXPECT_TRUE(web.GetNewData(file, 1, kDateTime));
    EXPECT_TRUE(boxShown);
    EXPECT_EQ(home.Read(QStringLiteral("box.dat")), Joined(records));
}

// The clock as the client sees it after its thread was held up (a loaded or
// suspended machine, a slow handler elsewhere in the window): far ahead of the
// moment the server answered.
class HeldUpClock : public Clock {
public:
    QDateTime Now() const override { return QDateTime::currentDateTime().addMSecs(ahead_); }
    void HoldUp(std::chrono::milliseconds by) { ahead_ += by.count(); }

private:
    qint64 ahead_ = 0;
};

TEST_F(Faults, AReplyThatCameWhileTheClientWasHeldUpPastTheGapIsTaken) {
    HeldUpClock held;
    held.SetWaits(clock.Waits());
    ScopedPorts heldPorts({&prompter, &held, &busy});
    const Step holdUp = Act([&] { held.HoldUp(kGap * 4); });
    const QList<QByteArray> records = MinuteRecords(300);
    const QByteArray lastDate = HttpReply("OK 2006-05-01 14:59:00\r\n");
    const QByteArray data = HttpReply(Joined(records) + "OK\r\n");
    const qsizetype half = data.indexOf(records[150]) + 7;
    const struct {
        const char* when;
        Reply lastDate, data;
    } cases[] = {
        {"before the last date", {holdUp, Send(lastDate)}, {Send(data)}},
        {"before the records", {Send(lastDate)}, {holdUp, Send(data)}},
        {"in the middle of a record",
         {Send(lastDate)},
         {Send(data.left(half)), Pause(5), holdUp, Send(data.mid(half))}},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.when);
        const QString file = home.File(QStringLiteral("held.dat"));
        QFile::remove(file);
        server.replies.clear();
        server.Queue(c.lastDate);
        server.Queue(c.data);
        EXPECT_TRUE(web.GetNewData(file, 1, kDateTime)) << web.LastError().toStdString();
        EXPECT_EQ(home.Read(QStringLiteral("held.dat")), Joined(records));
    }
}

TEST_F(Faults, BytesAfterAReplysEndBelongToNoCommand) {
    const std::vector<std::pair<const char*, QByteArray>> leftovers = {
        {"a trailing space counted in the length", HttpReply("a|b|c|d|e\r\nOK\r\n ")},
        {"a banner after the length", kFolders + "<!-- banner -->\r\n\r\n"},
        {"half a line after the length", kFolders + "HTTP/1.1 2"},
        {"a trailer that never ends",
         QByteArray("HTTP/1.1 200 OK\r\nTransfer-Encoding: chunked\r\n\r\n"
                    "f\r\na|b|c|d|e\r\nOK\r\n\r\n0\r\nX-Check: 1\r\n")},
        {"lines after the final line", HttpReply("a|b|c|d|e\r\nOK\r\nmore\r\n\r\n")},
    };
    web.EnableLog(3, 1);
    for (const auto& [what, first] : leftovers) {
        SCOPED_TRACE(what);
        server.Queue(first);
        server.Queue(HttpReply("f|g|h|i|j\r\nOK\r\n"));
        const int opened = server.connections;
        ASSERT_TRUE(web.Initialise());
        ASSERT_TRUE(web.Initialise()) << web.LastError().toStdString();
        EXPECT_EQ(web.UserName(), QStringLiteral("j"));
        EXPECT_EQ(server.connections, std::max(opened, 1));
        EXPECT_TRUE(statuses.filter(QStringLiteral("HTTP header reply")).isEmpty());
    }
    EXPECT_FALSE(logs.filter(QStringLiteral("D>Dropped ")).isEmpty());
}

TEST_F(Faults, DatesOutsideTheCalendarAreNoDate) {
    const struct {
        int type;
        const char* line;
    } lines[] = {{kDecagon, "x,1e12,0"},    {kDecagon, "x,-1e12,0"},    {kDecagon, "x,1e400,0"},
                 {kDecagon, "x,0,1e300"},   {kCsi, "x,2006,1e12,1030"}, {kYmdhm, "-5,1,1,0,0"},
                 {kCsi, "x,9999,400,1030"}, {kYmdhm, "10000,1,1,0,0"}};
    for (const auto& l : lines) {
        const LineDate d = DateOfLine(QString::fromLatin1(l.line), l.type);
        EXPECT_FALSE(d.hasDate || d.found) << l.line;
    }
    // In a reply, and as the local file's last line.
    const QString file =
        home.Write(QStringLiteral("decagon.dat"), "x,2312,600\r\nx,1e12,0\r\nx,-1e12,0\r\n");
    QueueNewData("OK 2006-05-03", {Send(HttpReply("x,1e12,0\r\nx,1e400,5\r\nOK\r\n"))});
    ASSERT_TRUE(web.GetNewData(file, 1, kDecagon));
    EXPECT_TRUE(server.requests.last().contains("&date=2006-05-01%2010%3A00%3A00 "));
    ASSERT_FALSE(progress.steps.empty());
    for (const auto& step : progress.steps)
        EXPECT_EQ(step.text, QStringLiteral("-"));
}

TEST_F(Faults, FractionalSecondsAreReadAndLeftOutOfTheComparison) {
    const struct {
        int type;
        const char* last;
    } cases[] = {{kDateTime, "2006-05-01 10:20:30.5,1"},
                 {kDateComma, "2006-05-01,10:20:30.25,1"},
                 {kGemini, "\"2006-05-01 10:20:30.999\",1"}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.last);
        const QString file = home.Write(QStringLiteral("f.dat"), QByteArray(c.last) + "\r\n");
        QueueNewData("OK 2006-05-01 10:20:31.5", {Send(HttpReply("OK\r\n"))});
        ASSERT_TRUE(web.GetNewData(file, 1, c.type));
        EXPECT_TRUE(server.requests.last().contains("&date=2006-05-01%2010%3A20%3A30 "));
        EXPECT_EQ(web.ServerLastDate(), MakeDate(2006, 5, 1, 10, 20, 31));
    }
}

} // namespace
} // namespace quorvel::testing
