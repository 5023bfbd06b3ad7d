// Whole commands against the scripted loopback server: request bytes, reply
// framing, reuse and loss of the connection, and what reaches the data file.
#include "webdata_fixture.h"

#include <QTimer>

namespace quorvel::testing {
namespace {

const QByteArray kRecord1 = "2006-05-01 10:30:00,1.5";
const QByteArray kRecord2 = "2006-05-01 10:40:00,2.5";
const QByteArray kTwoRecords = kRecord1 + "\r\n" + kRecord2 + "\r\n";
const QByteArray kFolders = HttpReply("a|b|c|d|e\r\nOK\r\n");

TEST_F(WebDataTest, RequestsAreByteExactWithAddressHostAndEscapedValues) {
    web.SetPassword(QStringLiteral("P&q w"));
    const QString file = home.Write(QStringLiteral("site1.dat"), "2006-05-01 10:20:30,1.5\r\n");
    QueueNewData("OK 2006-05-02 00:00:00", {Send(HttpReply("OK\r\n"))});

    EXPECT_TRUE(web.GetNewData(file, 2, 1));

    const QByteArray host = server.HostPort().toLatin1();
    const QByteArray tail = " HTTP/1.1\r\nHost: " + host + "\r\nUser-Agent: TALUQuorvel\r\n\r\n";
    const QByteArray query = "user=U&pwd=P%26q%20w&file=site1%2Edat&dt=1&filelocation=2";
    ASSERT_EQ(server.requests.size(), 2);
    EXPECT_EQ(server.requests[0],
              "GET http://" + host + "/wd/wd.php?cmd=GETLASTDATE&" + query + tail);
    EXPECT_EQ(server.requests[1], "GET http://" + host + "/wd/wd.php?cmd=GETDATA&" + query +
                                      "&date=2006-05-01%2010%3A20%3A30" + tail);

    // A file missing here asks for everything and is created.
    const QString missing = home.File(QStringLiteral("new.dat"));
    QueueNewData("OK NO FILE yet", {Send(HttpReply(kTwoRecords + "OK\r\n"))});
    EXPECT_TRUE(web.GetNewData(missing, 2, 1));
    EXPECT_TRUE(server.requests.last().contains("&filelocation=2&date=0 HTTP/1.1"));
    EXPECT_EQ(home.Read(QStringLiteral("new.dat")), kTwoRecords);
    EXPECT_EQ(web.ServerLastDate(), 0);
    EXPECT_TRUE(statuses.contains(QStringLiteral("Data in: ") + missing));
    EXPECT_EQ(busy.depth, 0);
}

struct DataCase {
    const char* what;
    bool ok;
    QByteArray before; // the file's bytes before; empty: no file
    QByteArray after;  // empty: still no file
    const char* error; // the start of LastError()
    Reply reply;       // to GETDATA
};

TEST_F(WebDataTest, AReplyLeavesExactlyItsWholeRecordsInTheFile) {
    const QByteArray head = "HTTP/1.1 200 OK\r\n\r\n";
    const int half = int(kGap.count()) / 2;
    const QByteArray unended = "2006-05-01 10:20:30,1";
    const std::vector<DataCase> cases = {
        {"bare LF", true, "", kTwoRecords, "OK",
         Reply{Send("HTTP/1.1 200 OK\nA: b\n\n" + kRecord1 + "\n" + kRecord2 + "\nOK\n")}},
        {"notices and empty lines", true, "", kTwoRecords + "ok lower case\r\n", "OKAY",
         Reply{Send(HttpReply(kRecord1 + "\r\nphp notice: x\r\n" + kRecord2 +
                              "\nPhP Warning\r\n\r\nok lower case\r\nOKAY\r\n"))}},
        {"no data lines", true, "", "", "No new data", Reply{Send(HttpReply("OK\r\n"))}},
        {"closed mid-record", false, "", kRecord1 + "\r\n", "",
         Reply{Send(head + kRecord1 + "\r\n2006-05-01 10:4"), CloseConnection()}},
        {"endless line", false, "", "", "Received more than 1 MiB without a line end",
         Reply{Send(head + QByteArray(1100 * 1024, 'x'))}},
        {"chunked body ends the last line", true, "", kRecord1 + "\r\n", "OK",
         Reply{Send(ChunkedReply(kRecord1 + "\r\nOK", {4}))}},
        // Together the pauses outlast the time-out; each alone is well within it.
        {"slow arrivals", true, "", kTwoRecords, "OK",
         Reply{Send(head), Pause(half), Send(kRecord1 + "\r\n"), Pause(half),
               Send(kRecord2 + "\r\n"), Pause(half), Send("OK\r\n")}},
        {"local file without a last line end", true, unended, unended + "\r\n" + kRecord1 + "\r\n",
         "OK", Reply{Send(HttpReply(kRecord1 + "\r\nOK\r\n"))}},
    };
    for (std::size_t i = 0; i < cases.size(); ++i) {
        const DataCase& c = cases[i];
        SCOPED_TRACE(c.what);
        const QString name = QStringLiteral("%1.dat").arg(i);
        const QString file = c.before.isEmpty() ? home.File(name) : home.Write(name, c.before);
        server.replies.clear();
        QueueNewData("OK 2006-05-03 00:00:00", c.reply);
        EXPECT_EQ(web.GetNewData(file, 1, 1), c.ok);
        EXPECT_EQ(QFile::exists(file), !c.after.isEmpty());
        EXPECT_EQ(home.Read(name), c.after);
        EXPECT_TRUE(web.LastError().startsWith(QLatin1String(c.error)));
    }
    // Replaced: the connections whose replies only a close ends (bare LF, slow
    // arrivals), the one closed mid-record and the one given up on the endless line.
    EXPECT_EQ(server.connections, 5);
}

TEST_F(WebDataTest, RecordsSurviveASplitAtEveryByteOfTheReply) {
    const QByteArray reply = HttpReply(kTwoRecords + "OK\r\n");
    for (int at = 1; at < reply.size(); ++at) {
        SCOPED_TRACE(at);
        const QString name = QStringLiteral("split%1.dat").arg(at);
        const QString file = home.Write(name, "2006-05-01 10:00:00,0\r\n");
        QueueNewData("OK 0", SplitAt(reply, {at}));
        ASSERT_TRUE(web.GetNewData(file, 1, 1));
        ASSERT_EQ(home.Read(name), "2006-05-01 10:00:00,0\r\n" + kTwoRecords);
    }
    EXPECT_EQ(server.connections, 1);
}

TEST_F(WebDataTest, AChunkedReplyIsDechunkedBeforeItIsCutIntoLines) {
    const QByteArray records = kTwoRecords + "2006-05-01 10:50:00,3.5\r\n";
    const QByteArray reply = ChunkedReply(records + "OK\r\n", {5, 17, 1, 2, 30, 3});
    // Chunk boundaries, and arrivals, fall inside lines and inside chunk-size lines.
    QueueNewData("OK 0", SplitAt(reply, {reply.indexOf("\r\n\r\n") + 7, reply.size() - 9,
                                         reply.size() - 3}));
    server.Queue(kFolders);
    const QString file = home.File(QStringLiteral("chunked.dat"));

    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(home.Read(QStringLiteral("chunked.dat")), records);
    // The last chunk and its blank line were taken: the connection serves the next reply.
    EXPECT_TRUE(web.Initialise());
    EXPECT_EQ(server.connections, 1);
    EXPECT_TRUE(statuses.filter(QStringLiteral("HTTP header reply")).isEmpty());
}

TEST_F(WebDataTest, ContinueIsWaitedThroughAndAnHttpErrorFailsTheCommand) {
    web.EnableLog(3, 1);
    server.Queue("HTTP/1.1 100 Continue\r\n\r\n" + HttpReply("OK 2006-05-02 10:00:00\r\n"));
    server.Queue("HTTP/1.1 404 Not Found\r\nContent-Length: 4\r\n\r\nOK\r\n");

    EXPECT_EQ(web.LastDateInFile(QStringLiteral("d/site1.dat"), 2, 1, 1, 1),
              QStringLiteral("2 May 2006 10:00:00"));
    EXPECT_TRUE(
        logs.contains(QStringLiteral("D>ReplyCode=100 - wait HTTPState:0 |HTTP/1.1 100 Continue")));
    EXPECT_TRUE(server.requests[0].contains("file=site1%2Edat&dt=1&filelocation=2 "));

    EXPECT_EQ(web.LastDateInFile(QStringLiteral("site1.dat"), 2, 1, 1, 1), QStringLiteral("-"));
    EXPECT_TRUE(statuses.contains(QStringLiteral("HTTP/1.1 404 Not Found")));
    EXPECT_TRUE(LogBytes().contains(
        "CTALUWebData:A-error> ReplyCode=404 - error HTTPState:0 |HTTP/1.1 404 Not Found"));
    EXPECT_EQ(finished.size(), 1);
}

TEST_F(WebDataTest, NokOrAnUnwritableFileFailsTheCommandAndTouchesNoFile) {
    const QString file = home.File(QStringLiteral("nok.dat"));
    server.Queue(HttpReply("NOK bad user\r\n"));
    EXPECT_FALSE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(web.LastError(), QStringLiteral("NOK bad user (GETLASTDATE)"));
    EXPECT_EQ(server.requests.size(), 1);

    QueueNewData("OK 0", {Send(HttpReply("NOK file unknown\r\n"))});
    EXPECT_FALSE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(web.LastError(), QStringLiteral("NOK file unknown (GETDATA)"));
    EXPECT_EQ(finished.last(), web.LastError());
    EXPECT_TRUE(LogBytes().contains("GETDATA>NOK file unknown"));
    EXPECT_FALSE(QFile::exists(file));

    // A file that cannot be written is reported.
    prompter.Script(kAnswerNo);
    QueueNewData("OK 0", {Send(HttpReply(kTwoRecords + "OK\r\n"))});
    const QString unwritable = home.File(QStringLiteral("no/such/folder/x.dat"));
    EXPECT_FALSE(web.GetNewData(unwritable, 1, 1));
    ASSERT_EQ(prompter.shown.size(), 1u);
    EXPECT_TRUE(prompter.shown[0].message.contains(QStringLiteral("TALUWebData:ProcessReply")));
    EXPECT_EQ(programEnds, 0);
    EXPECT_FALSE(QFile::exists(unwritable));
}

TEST_F(WebDataTest, UserFoldersNeedFiveItems) {
    server.Queue(HttpReply("uf|ucf|more|udf|Ann Smith|ignored\r\nOK\r\n"));
    server.Queue(HttpReply("a|b|c\r\nOK\r\n"));
    ASSERT_TRUE(web.Initialise());
    EXPECT_TRUE(web.Initialise());
    EXPECT_EQ((QStringList{web.UserFolder(), web.UserCurrentFolder(), web.UserDataFolder(),
                           web.UserName()}),
              (QStringList{"uf", "ucf", "udf", "Ann Smith"}));
}

TEST_F(WebDataTest, TraceServerModeSavesNothingButFinishes) {
    web.SetTraceServer(1);
    QueueNewData("OK 0", {Send(HttpReply(kTwoRecords + "OK\r\n"))});
    const QString file = home.File(QStringLiteral("trace.dat"));

    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    EXPECT_FALSE(QFile::exists(file));
    EXPECT_TRUE(server.requests[1].contains("&trace=on&date=0 "));
    EXPECT_TRUE(statuses.contains(QStringLiteral("Should be saving, but TraceServer mode:") +
                                  QString::fromLatin1(kRecord1)));
    EXPECT_EQ(finished.last(), QStringLiteral("OK"));
}

TEST_F(WebDataTest, TheOpenConnectionServesNewHostsAndTheSameUserButNotANewUser) {
    for (int i = 0; i < 4; ++i)
        server.Queue(kFolders);
    ASSERT_TRUE(web.Initialise());
    statuses.clear();
    ASSERT_TRUE(web.Initialise());
    EXPECT_TRUE(statuses.contains(QStringLiteral("Connected to ") + server.HostPort()));
    EXPECT_FALSE(statuses.contains(QStringLiteral("Connecting to ") + server.HostPort()));

    web.SetRemoteHost(QStringLiteral("other.example"));
    web.SetUserID(QStringLiteral("U"));
    web.SetPassword(QString());
    ASSERT_TRUE(web.Initialise());
    EXPECT_TRUE(
        server.requests[2].startsWith("GET http://other.example/wd/wd.php?cmd=GETUSERFOLDERS"
                                      "&user=U&dt=0&filelocation=0 HTTP/1.1\r\n"
                                      "Host: other.example\r\n"));
    EXPECT_EQ(server.connections, 1);

    web.SetRemoteHost(server.HostPort());
    web.SetUserID(QStringLiteral("V"));
    EXPECT_EQ(socket.State(), kSocketClosed);
    ASSERT_TRUE(web.Initialise());
    EXPECT_EQ(server.connections, 2);
}

TEST_F(WebDataTest, ACutOffReplyNeverWritesIntoItsFileAgain) {
    const QByteArray head = "HTTP/1.1 200 OK\r\nContent-Length: 999\r\n\r\n";
    QueueNewData("OK 0", {Send(head + kTwoRecords), Pause(int(kGap.count()) + 200),
                          Send("2006-05-01 10:50:00,3.5\r\nOK\r\n")});
    const QString first = home.File(QStringLiteral("first.dat"));
    EXPECT_FALSE(web.GetNewData(first, 1, 1));
    // Closed when the wait ended: complete on disk already.
    EXPECT_EQ(home.Read(QStringLiteral("first.dat")), kTwoRecords);

    const QByteArray other = "2006-06-01 00:00:00,9\r\n";
    QueueNewData("OK 0", {Send(HttpReply(other + "OK\r\n"))});
    const QString second = home.File(QStringLiteral("second.dat"));
    EXPECT_TRUE(web.GetNewData(second, 1, 1));
    ASSERT_TRUE(PumpUntil([&] { return server.sends == 5; }));
    QCoreApplication::processEvents();

    EXPECT_EQ(home.Read(QStringLiteral("first.dat")), kTwoRecords);
    EXPECT_EQ(home.Read(QStringLiteral("second.dat")), other);
    EXPECT_EQ(server.connections, 2);
}

TEST_F(WebDataTest, ASilentServerTimesOutARefusedConnectionFailsAndCancelEndsTheWait) {
    server.Queue(kFolders);
    ASSERT_TRUE(web.Initialise());
    ASSERT_EQ(web.LastError(), QStringLiteral("OK"));
    // Each failure has its own text, never the earlier command's.
    QElapsedTimer timer;
    timer.start();
    EXPECT_FALSE(web.Initialise()); // no answer at all
    EXPECT_GE(timer.elapsed(), kGap.count() - 20);
    EXPECT_TRUE(web.LastError().contains(QStringLiteral("GETUSERFOLDERS")))
        << web.LastError().toStdString();
    EXPECT_EQ(server.requests.size(), 2);
    EXPECT_EQ(finished.size(), 1);
    EXPECT_EQ(busy.depth, 0);

    web.SetRemoteHost(ScriptServer().HostPort()); // nobody listens there any more
    statuses.clear();
    EXPECT_FALSE(web.Initialise());
    EXPECT_TRUE(web.LastError().startsWith(QStringLiteral("*Not* connected to ")));
    EXPECT_FALSE(statuses.filter(QStringLiteral("WinsockError: ")).isEmpty());
    EXPECT_TRUE(statuses.filter(QStringLiteral("Connected to ")).isEmpty());

    web.SetRemoteHost(server.HostPort());
    clock.SetWaits(WaitLengths{.replyGap = std::chrono::seconds(20)});
    QObject::connect(&web, &CTALUWebData::ShowStatus, [&](const QString& text) {
        if (text.startsWith(QStringLiteral("Connected to ")))
            QTimer::singleShot(10, [&] { web.SetUserCancel(1); });
    });
    timer.restart();
    EXPECT_FALSE(web.Initialise());
    EXPECT_LT(timer.elapsed(), 10000);
    EXPECT_EQ(server.requests.size(), 3);
}

TEST_F(WebDataTest, ProgressRunsFromTheLocalDateToTheServiceOrFromDateAndIsClamped) {
    struct Case {
        QStringList fromDates;
        QByteArray lastDate, record;
        QString step; // percent and date shown for the record
    };
    const std::vector<Case> cases = {
        {{}, "OK 2006-05-03", "2006-05-02,5", "50 2 May 2006 00:00:00"},
        {{}, "OK 2006-05-03", "2007-01-01,5", "100 1 Jan 2007 00:00:00"},
        {{}, "OK 2008-01-03", "garbage,5", "0 -"},
        // A text that is no date clears the switch.
        {{"2006-05-05", "not a date"}, "OK 2006-05-03", "2006-05-03,5", "100 3 May 2006 00:00:00"},
        {{"2006-05-05"}, "OK 2006-05-03", "2006-05-03,5", "50 3 May 2006 00:00:00"}};
    for (const Case& c : cases) {
        SCOPED_TRACE(c.record.toStdString());
        const QString file = home.Write(QStringLiteral("p.dat"), "2006-05-01 00:00:00,1\r\n");
        web.SetFromDate(0, QStringLiteral("2006-05-02")); // not asked for: no effect
        for (const QString& from : c.fromDates)
            web.SetFromDate(1, from);
        QueueNewData(c.lastDate, {Send(HttpReply(c.record + "\r\nOK\r\n"))});
        ASSERT_TRUE(web.GetNewData(file, 1, 1));
        ASSERT_FALSE(progress.steps.empty());
        EXPECT_EQ(QString::number(progress.steps.front().value) + QLatin1Char(' ') +
                      progress.steps.front().text,
                  c.step);
    }
    EXPECT_EQ(progress.finished, 5);
    EXPECT_TRUE(prompter.shown.empty());
}

TEST_F(WebDataTest, ThePasswordIsMaskedInTracesAndTheLogAndReceivedTextShowsWithLf) {
    web.EnableLog(1, 1);
    web.SetPassword(QStringLiteral("s3cr3t"));
    QString shown;
    QObject::connect(&web, &CTALUWebData::ShowReceived, [&](const QString& t) { shown += t; });
    server.Queue(kFolders);
    ASSERT_TRUE(web.Initialise());

    EXPECT_TRUE(server.requests[0].contains("&pwd=s3cr3t&"));
    EXPECT_FALSE(logs.filter(QStringLiteral("&pwd=***&")).isEmpty());
    EXPECT_TRUE(logs.filter(QStringLiteral("s3cr3t")).isEmpty());
    EXPECT_TRUE(LogBytes().contains("CTALUWebData:S>GET http://" + server.HostPort().toLatin1() +
                                    "/wd/wd.php?cmd=GETUSERFOLDERS&user=U&pwd=***&"));
    EXPECT_FALSE(LogBytes().contains("s3cr3t"));
    EXPECT_TRUE(shown.contains(QStringLiteral("a|b|c|d|e\nOK\n")));
    EXPECT_FALSE(shown.contains(QLatin1Char('\r')));
}

} // namespace
} // namespace quorvel::testing
