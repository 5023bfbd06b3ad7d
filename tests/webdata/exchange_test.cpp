// Whole commands against the scripted loopback server: request bytes, reply
// framing, reuse and loss of the connection, and what reaches the data file.
#include "webdata_fixture.h"

#include <QElapsedTimer>
#include <QTimer>

namespace quorvel::testing {
namespace {

const QByteArray kRecord1 = "2006-05-01 10:30:00,1.5";
const QByteArray kRecord2 = "2006-05-01 10:40:00,2.5";
const QByteArray kTwoRecords = kRecord1 + "\r\n" + kRecord2 + "\r\n";

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
}

TEST_F(WebDataTest, AFileMissingLocallyAsksForEverythingAndIsCreated) {
    const QString file = home.File(QStringLiteral("new.dat"));
    QueueNewData("OK NO FILE yet", {Send(HttpReply(kTwoRecords + "OK\r\n"))});

    EXPECT_TRUE(web.GetNewData(file, 1, 1));

    ASSERT_EQ(server.requests.size(), 2);
    EXPECT_TRUE(server.requests[1].contains("&date=0 HTTP/1.1"));
    EXPECT_EQ(FileBytes(QStringLiteral("new.dat")), kTwoRecords);
    EXPECT_EQ(web.ServerLastDate(), 0);
    EXPECT_EQ(finished.last(), QStringLiteral("OK"));
    EXPECT_TRUE(statuses.contains(QStringLiteral("Data in: ") + file));
    EXPECT_EQ(busy.depth, 0);
}

TEST_F(WebDataTest, RecordsSurviveASplitAtEveryByteOfTheReply) {
    const QByteArray reply = HttpReply(kTwoRecords + "OK\r\n");
    for (int at = 1; at < reply.size(); ++at) {
        const QString name = QStringLiteral("split%1.dat").arg(at);
        const QString file = home.Write(name, "2006-05-01 10:00:00,0\r\n");
        QueueNewData("OK 0", SplitAt(reply, {at}));
        ASSERT_TRUE(web.GetNewData(file, 1, 1)) << "split at " << at;
        ASSERT_EQ(FileBytes(name), "2006-05-01 10:00:00,0\r\n" + kTwoRecords) << "split at " << at;
    }
    EXPECT_EQ(server.connections, 1);
}

TEST_F(WebDataTest, ACrLfPairArrivingApartEndsTheLineOnce) {
    const QByteArray reply = HttpReply(kTwoRecords + "OK\r\n");
    const int blank = reply.indexOf("\r\n\r\n");
    const int record1End = reply.indexOf(kRecord1) + kRecord1.size();
    const int record2End = reply.indexOf(kRecord2) + kRecord2.size();
    // Between CR and LF of the last header, of the blank line and of both records.
    QueueNewData("OK 0", SplitAt(reply, {blank + 1, blank + 3, record1End + 1, record2End + 1}));
    const QString file = home.File(QStringLiteral("crlf.dat"));

    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(FileBytes(QStringLiteral("crlf.dat")), kTwoRecords);
}

TEST_F(WebDataTest, AReplyWithBareLineFeedsIsReadLikeCrLf) {
    const QByteArray body = kRecord1 + "\n" + kRecord2 + "\nOK\n";
    QueueNewData("OK 0", {Send("HTTP/1.1 200 OK\nContent-Length: " +
                               QByteArray::number(body.size()) + "\n\n" + body)});
    const QString file = home.File(QStringLiteral("lf.dat"));

    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(FileBytes(QStringLiteral("lf.dat")), kTwoRecords);
}

TEST_F(WebDataTest, PhpNoticesAndEmptyLinesNeverReachTheFile) {
    const QByteArray body = kRecord1 + "\r\nphp notice: x\r\n" + kRecord2 +
                            "\nPhP Warning\r\n\r\n" + "ok lower case\r\nOKAY\r\n";
    QueueNewData("OK 0", {Send(HttpReply(body))});
    const QString file = home.File(QStringLiteral("php.dat"));

    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(FileBytes(QStringLiteral("php.dat")), kTwoRecords + "ok lower case\r\n");
    EXPECT_EQ(finished.last(), QStringLiteral("OKAY"));
}

TEST_F(WebDataTest, ContinueThenOkIsWaitedThrough) {
    web.EnableLog(3, 1);
    server.Queue("HTTP/1.1 100 Continue\r\n\r\n" + HttpReply("OK 2006-05-02 10:00:00\r\n"));

    EXPECT_EQ(web.LastDateInFile(QStringLiteral("d/site1.dat"), 2, 1, 1, 1),
              QStringLiteral("2 May 2006 10:00:00"));
    EXPECT_TRUE(
        logs.contains(QStringLiteral("D>ReplyCode=100 - wait HTTPState:0 |HTTP/1.1 100 Continue")));
    EXPECT_TRUE(statuses.contains(
        QStringLiteral("Empty line when expecting HTTP header reply HTTPState:0")));
    ASSERT_EQ(server.requests.size(), 1);
    EXPECT_TRUE(server.requests[0].contains("file=site1%2Edat&dt=1&filelocation=2 "));
}

TEST_F(WebDataTest, AnHttpErrorIsReportedAndTheCommandFails) {
    server.Queue("HTTP/1.1 404 Not Found\r\nContent-Length: 4\r\n\r\nOK\r\n");

    EXPECT_EQ(web.LastDateInFile(QStringLiteral("site1.dat"), 2, 1, 1, 1), QStringLiteral("-"));
    EXPECT_TRUE(statuses.contains(QStringLiteral("HTTP/1.1 404 Not Found")));
    EXPECT_TRUE(LogBytes().contains(
        "CTALUWebData:A-error> ReplyCode=404 - error HTTPState:0 |HTTP/1.1 404 Not Found"));
    EXPECT_TRUE(finished.isEmpty());
}

TEST_F(WebDataTest, NokNamesTheCommandAndTouchesNoFile) {
    QueueNewData("OK 0", {Send(HttpReply("NOK file unknown\r\n"))});
    const QString file = home.File(QStringLiteral("nok.dat"));

    EXPECT_FALSE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(web.LastError(), QStringLiteral("NOK file unknown (GETDATA)"));
    EXPECT_EQ(finished.last(), web.LastError());
    EXPECT_TRUE(LogBytes().contains("GETDATA>NOK file unknown"));
    EXPECT_FALSE(QFile::exists(file));
}

TEST_F(WebDataTest, AFailedLastDateStopsBeforeAskingForData) {
    server.Queue(HttpReply("NOK bad user\r\n"));
    EXPECT_FALSE(web.GetNewData(home.File(QStringLiteral("x.dat")), 1, 1));
    EXPECT_EQ(web.LastError(), QStringLiteral("NOK bad user (GETLASTDATE)"));
    EXPECT_EQ(server.requests.size(), 1);
}

TEST_F(WebDataTest, NoDataLinesMeansNoNewDataAndAnUntouchedFile) {
    QueueNewData("OK 0", {Send(HttpReply("OK\r\n"))});
    const QString file = home.File(QStringLiteral("none.dat"));

    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    EXPECT_FALSE(QFile::exists(file));
    EXPECT_EQ(finished.last(), QStringLiteral("No new data"));
    EXPECT_EQ(web.LastError(), QStringLiteral("No new data"));
}

TEST_F(WebDataTest, UserFoldersNeedFiveItems) {
    server.Queue(HttpReply("uf|ucf|more|udf|Ann Smith|ignored\r\nOK\r\n"));
    ASSERT_TRUE(web.Initialise());
    EXPECT_EQ(web.UserFolder(), QStringLiteral("uf"));
    EXPECT_EQ(web.UserCurrentFolder(), QStringLiteral("ucf"));
    EXPECT_EQ(web.UserDataFolder(), QStringLiteral("udf"));
    EXPECT_EQ(web.UserName(), QStringLiteral("Ann Smith"));

    server.Queue(HttpReply("a|b|c\r\nOK\r\n"));
    EXPECT_TRUE(web.Initialise());
    EXPECT_EQ(web.UserFolder(), QStringLiteral("uf"));
    EXPECT_EQ(web.UserName(), QStringLiteral("Ann Smith"));
    EXPECT_TRUE(
        server.requests[1].contains("cmd=GETUSERFOLDERS&user=U&pwd=P&dt=0&filelocation=0 "));
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

TEST_F(WebDataTest, ASecondCommandReusesTheOpenConnection) {
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    ASSERT_TRUE(web.Initialise());
    statuses.clear();
    ASSERT_TRUE(web.Initialise());

    EXPECT_EQ(server.connections, 1);
    EXPECT_TRUE(statuses.contains(QStringLiteral("Connected to ") + server.HostPort()));
    EXPECT_FALSE(statuses.contains(QStringLiteral("Connecting to ") + server.HostPort()));
}

TEST_F(WebDataTest, ANewHostTravelsOverTheOpenConnection) {
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    ASSERT_TRUE(web.Initialise());
    web.SetRemoteHost(QStringLiteral("other.example"));
    ASSERT_TRUE(web.Initialise());
    EXPECT_EQ(server.connections, 1);
    EXPECT_TRUE(server.requests[1].startsWith("GET http://other.example/wd/wd.php?"));
    EXPECT_TRUE(server.requests[1].contains("\r\nHost: other.example\r\n"));
}

TEST_F(WebDataTest, AServerThatClosesBetweenCommandsIsReconnected) {
    server.Queue(Reply{Send(HttpReply("a|b|c|d|e\r\nOK\r\n")), CloseConnection()});
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    ASSERT_TRUE(web.Initialise());
    ASSERT_TRUE(PumpUntil([&] { return socket.State() != kSocketConnected; }));
    statuses.clear();

    EXPECT_TRUE(web.Initialise());
    EXPECT_EQ(server.connections, 2);
    EXPECT_TRUE(statuses.contains(QStringLiteral("Connecting to ") + server.HostPort()));
}

TEST_F(WebDataTest, ConnectionCloseInTheHeadIsHonouredAtOnce) {
    // The server announces the close but has not closed yet when the next command starts.
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n", "Connection: close\r\n"));
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    ASSERT_TRUE(web.Initialise());
    EXPECT_TRUE(web.Initialise());
    EXPECT_EQ(server.connections, 2);
}

TEST_F(WebDataTest, ACutOffReplyNeverWritesIntoItsFileAgain) {
    const QByteArray head = "HTTP/1.1 200 OK\r\nContent-Length: 999\r\n\r\n";
    QueueNewData("OK 0", {Send(head + kTwoRecords), Pause(int(kGap.count()) + 200),
                          Send("2006-05-01 10:50:00,3.5\r\nOK\r\n")});
    const QString first = home.File(QStringLiteral("first.dat"));
    EXPECT_FALSE(web.GetNewData(first, 1, 1));
    // Closed when the wait ended: complete on disk already.
    EXPECT_EQ(FileBytes(QStringLiteral("first.dat")), kTwoRecords);

    const QByteArray other = "2006-06-01 00:00:00,9\r\n";
    QueueNewData("OK 0", {Send(HttpReply(other + "OK\r\n"))});
    const QString second = home.File(QStringLiteral("second.dat"));
    EXPECT_TRUE(web.GetNewData(second, 1, 1));
    ASSERT_TRUE(PumpUntil([&] { return server.sends == 5; }));
    QCoreApplication::processEvents();

    EXPECT_EQ(FileBytes(QStringLiteral("first.dat")), kTwoRecords);
    EXPECT_EQ(FileBytes(QStringLiteral("second.dat")), other);
    EXPECT_EQ(server.connections, 2);
}

TEST_F(WebDataTest, AConnectionClosedMidRecordKeepsOnlyWholeRecords) {
    QueueNewData("OK 0", {Send("HTTP/1.1 200 OK\r\n\r\n" + kRecord1 + "\r\n2006-05-01 10:4"),
                          CloseConnection()});
    const QString file = home.File(QStringLiteral("cut.dat"));

    EXPECT_FALSE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(FileBytes(QStringLiteral("cut.dat")), kRecord1 + "\r\n");
}

TEST_F(WebDataTest, AChunkedReplyIsDechunkedBeforeItIsCutIntoLines) {
    const QByteArray records = kTwoRecords + "2006-05-01 10:50:00,3.5\r\n";
    const QByteArray reply = ChunkedReply(records + "OK\r\n", {5, 17, 1, 2, 30, 3});
    // Chunk boundaries, and arrivals, fall inside lines and inside chunk-size lines.
    QueueNewData("OK 0", SplitAt(reply, {reply.indexOf("\r\n\r\n") + 7, reply.size() - 9,
                                         reply.size() - 3}));
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    const QString file = home.File(QStringLiteral("chunked.dat"));

    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(FileBytes(QStringLiteral("chunked.dat")), records);
    // The last chunk and its blank line were taken: the connection serves the next reply.
    EXPECT_TRUE(web.Initialise());
    EXPECT_EQ(server.connections, 1);
    EXPECT_TRUE(statuses.filter(QStringLiteral("HTTP header reply")).isEmpty());
}

TEST_F(WebDataTest, TheEndOfAChunkedBodyEndsItsLastLine) {
    QueueNewData("OK 0", {Send(ChunkedReply(kRecord1 + "\r\nOK", {4}))});
    const QString file = home.File(QStringLiteral("tail.dat"));
    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(FileBytes(QStringLiteral("tail.dat")), kRecord1 + "\r\n");
}

TEST_F(WebDataTest, EveryArrivalPushesTheTimeOutBack) {
    const int gap = int(kGap.count());
    // Together the pauses last longer than the time-out; each alone is well within it.
    QueueNewData("OK 0", {Send("HTTP/1.1 200 OK\r\n\r\n"), Pause(gap / 2), Send(kRecord1 + "\r\n"),
                          Pause(gap / 2), Send(kRecord2 + "\r\n"), Pause(gap / 2), Send("OK\r\n")});
    const QString file = home.File(QStringLiteral("slow.dat"));
    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(FileBytes(QStringLiteral("slow.dat")), kTwoRecords);
}

TEST_F(WebDataTest, AnUnwritableFileIsReportedAndTheCommandFails) {
    prompter.Script(kAnswerNo);
    QueueNewData("OK 0", {Send(HttpReply(kTwoRecords + "OK\r\n"))});
    const QString file = home.File(QStringLiteral("no/such/folder/x.dat"));

    EXPECT_FALSE(web.GetNewData(file, 1, 1));
    ASSERT_EQ(prompter.shown.size(), 1u);
    EXPECT_TRUE(prompter.shown[0].message.contains(QStringLiteral("TALUWebData:ProcessReply")));
    EXPECT_EQ(programEnds, 0);
    EXPECT_FALSE(QFile::exists(file));
}

TEST_F(WebDataTest, AServerThatNeverAnswersTimesOut) {
    QElapsedTimer timer;
    timer.start();
    EXPECT_FALSE(web.Initialise());
    EXPECT_GE(timer.elapsed(), kGap.count() - 20);
    EXPECT_EQ(server.requests.size(), 1);
    EXPECT_TRUE(finished.isEmpty());
    EXPECT_EQ(busy.depth, 0);
}

TEST_F(WebDataTest, CancelEndsTheWaitAtOnce) {
    WaitLengths waits;
    waits.replyGap = std::chrono::seconds(20);
    clock.SetWaits(waits);
    QObject::connect(&web, &CTALUWebData::ShowStatus, [&](const QString& text) {
        if (text.startsWith(QStringLiteral("Connected to ")))
            QTimer::singleShot(10, [&] { web.SetUserCancel(1); });
    });
    QElapsedTimer timer;
    timer.start();
    EXPECT_FALSE(web.Initialise());
    EXPECT_LT(timer.elapsed(), 10000);
}

TEST_F(WebDataTest, ARefusedConnectionFailsWithTheSocketsError) {
    quint16 closedPort = 0;
    {
        QTcpServer probe;
        probe.listen(QHostAddress::LocalHost, 0);
        closedPort = probe.serverPort();
    }
    web.SetRemoteHost(QStringLiteral("127.0.0.1:") + QString::number(closedPort));
    EXPECT_FALSE(web.Initialise());
    EXPECT_FALSE(statuses.filter(QStringLiteral("WinsockError: ")).isEmpty());
    EXPECT_TRUE(statuses.filter(QStringLiteral("Connected to ")).isEmpty());
}

TEST_F(WebDataTest, AnEndlessLineEndsTheCommandInsteadOfGrowingMemory) {
    QueueNewData("OK 0", {Send("HTTP/1.1 200 OK\r\n\r\n" + QByteArray(1100 * 1024, 'x'))});
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    const QString file = home.File(QStringLiteral("long.dat"));

    EXPECT_FALSE(web.GetNewData(file, 1, 1));
    EXPECT_TRUE(web.LastError().contains(QStringLiteral("1 MiB")));
    EXPECT_FALSE(QFile::exists(file));
    EXPECT_TRUE(web.Initialise());
    EXPECT_EQ(server.connections, 2);
}

TEST_F(WebDataTest, RecordsJoinAFileWhoseLastLineLacksItsEnd) {
    const QString file = home.Write(QStringLiteral("open.dat"), "2006-05-01 10:20:30,1");
    QueueNewData("OK 0", {Send(HttpReply(kRecord1 + "\r\nOK\r\n"))});

    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    EXPECT_TRUE(server.requests[1].contains("date=2006-05-01%2010%3A20%3A30 "));
    EXPECT_EQ(FileBytes(QStringLiteral("open.dat")),
              "2006-05-01 10:20:30,1\r\n" + kRecord1 + "\r\n");
}

TEST_F(WebDataTest, AFileWhoseLastRecordHasNoDateIsNotFetchedAgain) {
    const QByteArray content = "2006-05-01 10:20:30,1\r\nnot a date,2\r\n";
    const QString file = home.Write(QStringLiteral("undated.dat"), content);
    QueueNewData("OK 2006-05-03 00:00:00", {Send(HttpReply(kTwoRecords + "OK\r\n"))});

    EXPECT_FALSE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(server.requests.size(), 1);
    EXPECT_TRUE(web.LastError().startsWith(QStringLiteral("No date in the last record of ")));
    EXPECT_EQ(FileBytes(QStringLiteral("undated.dat")), content);
}

TEST_F(WebDataTest, ProgressRunsFromTheLocalToTheServiceDateAndIsClamped) {
    const QString file = home.Write(QStringLiteral("p.dat"), "2006-05-01 00:00:00,1\r\n");
    QueueNewData("OK 2006-05-03 00:00:00", {Send(HttpReply("2006-05-02 00:00:00,5\r\nOK\r\n"))});
    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    EXPECT_EQ(progress.total, -1);
    EXPECT_EQ(progress.units, QStringLiteral("Records"));
    ASSERT_FALSE(progress.steps.empty());
    EXPECT_EQ(progress.steps.front().value, 50);
    EXPECT_EQ(progress.steps.front().text, QStringLiteral("2 May 2006 00:00:00"));
    EXPECT_EQ(progress.finished, 1);

    // A record beyond the service's date, and one whose date cannot be read.
    QueueNewData("OK 2006-05-03 00:00:00", {Send(HttpReply("2007-01-01 00:00:00,5\r\nOK\r\n"))});
    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    ASSERT_FALSE(progress.steps.empty());
    EXPECT_EQ(progress.steps.front().value, 100);
    QueueNewData("OK 2008-01-03 00:00:00", {Send(HttpReply("garbage,5\r\nOK\r\n"))});
    EXPECT_TRUE(web.GetNewData(file, 1, 1));
    ASSERT_FALSE(progress.steps.empty());
    EXPECT_EQ(progress.steps.front().value, 0);
    EXPECT_EQ(progress.steps.front().text, QStringLiteral("-"));
    EXPECT_TRUE(FileBytes(QStringLiteral("p.dat")).endsWith("garbage,5\r\n"));
    EXPECT_EQ(programEnds, 0);
    EXPECT_TRUE(prompter.shown.empty());
}

TEST_F(WebDataTest, ThePasswordNeverReachesATraceOrTheLog) {
    web.EnableLog(1, 1);
    web.SetPassword(QStringLiteral("s3cr3t"));
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    ASSERT_TRUE(web.Initialise());

    EXPECT_TRUE(server.requests[0].contains("pwd=s3cr3t"));
    EXPECT_FALSE(logs.filter(QStringLiteral("pwd=***")).isEmpty());
    EXPECT_TRUE(logs.filter(QStringLiteral("s3cr3t")).isEmpty());
    EXPECT_TRUE(LogBytes().contains("CTALUWebData:S>GET http://"));
    EXPECT_FALSE(LogBytes().contains("s3cr3t"));
}

TEST_F(WebDataTest, ANewUserClosesTheConnectionButTheSameOneDoesNot) {
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    ASSERT_TRUE(web.Initialise());
    web.SetUserID(QStringLiteral("U"));
    web.SetPassword(QString());
    EXPECT_EQ(socket.State(), kSocketConnected);
    ASSERT_TRUE(web.Initialise());
    EXPECT_TRUE(server.requests[1].contains("user=U&dt=0"));
    web.SetUserID(QStringLiteral("V"));
    EXPECT_EQ(socket.State(), kSocketClosed);
    ASSERT_TRUE(web.Initialise());
    EXPECT_EQ(server.connections, 2);
}

TEST_F(WebDataTest, ReceivedTextIsShownWithPlainLineFeeds) {
    QStringList shown;
    QObject::connect(&web, &CTALUWebData::ShowReceived, [&](const QString& t) { shown << t; });
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    ASSERT_TRUE(web.Initialise());
    ASSERT_FALSE(shown.isEmpty());
    EXPECT_TRUE(shown.join(QString()).contains(QStringLiteral("a|b|c|d|e\nOK\n")));
    EXPECT_FALSE(shown.join(QString()).contains(QLatin1Char('\r')));
}

} // namespace
} // namespace quorvel::testing
