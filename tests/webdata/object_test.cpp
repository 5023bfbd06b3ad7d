// The object's settings, defaults, lists, traces and notices.
#include "webdata/combo_sink.h"
#include "webdata_fixture.h"

namespace quorvel::testing {
namespace {

TEST_F(WebDataTest, LogSwitchesOutsideTheRangeChangeNothing) {
    web.EnableLog(5, 1);
    web.EnableLog(-1, 1);
    web.Connect(0);
    EXPECT_TRUE(logs.isEmpty());
    web.EnableLog(3, 1);
    web.Connect(0);
    web.SendProgress(2, 10, 5);
    EXPECT_EQ(logs,
              (QStringList{QStringLiteral("D>Connect"),
                           QStringLiteral("D>SendProgress: BytesSent:10 BytesRemaining: 5")}));
    // Decisions go to the window only, never to the log file.
    EXPECT_FALSE(LogBytes().contains("Connect"));
    web.EnableLog(3, 0);
    web.Connect(0);
    EXPECT_EQ(logs.size(), 2);
}

TEST_F(WebDataTest, SentLinesReachTheWindowAndTheLogFile) {
    web.EnableLog(1, 1);
    web.SendComplete(0);
    EXPECT_EQ(logs, QStringList{QStringLiteral("S>Send complete")});
    EXPECT_TRUE(LogBytes().contains(":CTALUWebData:S>Send complete"));
}

TEST_F(WebDataTest, EncryptKeyIsStoredDoubled) {
    EXPECT_EQ(web.EncryptKey(), QStringLiteral("583640917").repeated(8));
    web.SetEncryptKey(QString(51, QLatin1Char('1')));
    EXPECT_EQ(web.EncryptKey().size(), 51);
    web.SetEncryptKey(QString(50, QLatin1Char('1')));
    EXPECT_EQ(web.EncryptKey().size(), 100);
}

TEST_F(WebDataTest, EncryptSimpleBeyondTheKeyIsReportedAndEmpty) {
    prompter.Script(kAnswerNo);
    web.SetEncryptKey(QString(51, QLatin1Char('1')));
    EXPECT_EQ(web.EncryptSimple(QString(52, QLatin1Char('a'))), QString());
    ASSERT_EQ(prompter.shown.size(), 1u);
    EXPECT_TRUE(prompter.shown[0].message.contains(QStringLiteral("TALUWebData:EncryptSimple")));
    EXPECT_EQ(programEnds, 0);
    const QString text = QStringLiteral("pass word-1");
    EXPECT_EQ(web.EncryptSimple(web.EncryptSimple(text)), text);
}

TEST_F(WebDataTest, SocketStateTexts) {
    EXPECT_EQ(web.WinsockStatus(8), QStringLiteral("Peer is closing the connection"));
    EXPECT_EQ(web.WinsockStatus(12), QStringLiteral("WStatus:12"));
    EXPECT_EQ(web.WinsockStatus(-1), QStringLiteral("WStatus:-1"));
}

TEST_F(WebDataTest, ListFillers) {
    StringListCombo addresses;
    addresses.AddItem(QStringLiteral("old"), 3);
    web.LoadComboWithIPAddresses(addresses);
    EXPECT_EQ(addresses.items.first(), QStringLiteral("127.0.0.1"));
    EXPECT_EQ(addresses.current, 1);

    StringListCombo intervals;
    intervals.AddItem(QStringLiteral("kept"), 0);
    web.LoadComboWithIntervals(intervals);
    EXPECT_EQ(intervals.items.size(), 7);
    EXPECT_EQ(intervals.current, -1);

    StringListCombo types;
    types.AddItem(QStringLiteral("old"), 3);
    web.LoadComboWithDataTypes(types);
    ASSERT_EQ(types.items.size(), 9);
    EXPECT_EQ(types.items.at(8), QStringLiteral("Teksmart"));
    EXPECT_EQ(types.itemData.at(8), 8);
}

TEST_F(WebDataTest, SendNewDataOnlyShowsATimedNotice) {
    EXPECT_TRUE(web.SendNewData(QStringLiteral("/data/site1.dat"), 2, 1));
    ASSERT_EQ(prompter.shown.size(), 1u);
    EXPECT_TRUE(prompter.shown[0].timed);
    EXPECT_EQ(prompter.shown[0].buttons, 0);
    EXPECT_EQ(prompter.shown[0].message,
              QStringLiteral("Should be doing php incremental upload: /data/site1.dat=>site1.dat "
                             "DateFormat:1"));
    EXPECT_EQ(server.connections, 0);
}

TEST_F(WebDataTest, FromDateRaisesTheProgressEndOnlyWhenValidAndAsked) {
    const QString file = home.Write(QStringLiteral("f.dat"), "2006-05-01 00:00:00,1\r\n");
    web.SetFromDate(1, QStringLiteral("2006-05-05 00:00:00"));
    web.SetFromDate(1, QStringLiteral("not a date"));
    QueueNewData("OK 2006-05-03 00:00:00", {Send(HttpReply("2006-05-03 00:00:00,5\r\nOK\r\n"))});
    ASSERT_TRUE(web.GetNewData(file, 1, 1));
    // An invalid text cleared the switch: the service's date ends the scale.
    ASSERT_FALSE(progress.steps.empty());
    EXPECT_EQ(progress.steps.front().value, 100);

    web.SetFromDate(1, QStringLiteral("2006-05-05 00:00:00"));
    QueueNewData("OK 2006-05-03 00:00:00", {Send(HttpReply("2006-05-03 00:00:00,6\r\nOK\r\n"))});
    ASSERT_TRUE(web.GetNewData(file, 1, 1));
    ASSERT_FALSE(progress.steps.empty());
    // The scale runs from the local file's date (3 May now) to 5 May.
    EXPECT_EQ(progress.steps.front().value, 0);
    EXPECT_EQ(web.ServerLastDate(), MakeDate(2006, 5, 5));
}

TEST_F(WebDataTest, WithoutASocketCommandsFailAndAreReported) {
    CTALUWebData lonely;
    lonely.SetProgramEnder([this] { ++programEnds; });
    prompter.Script(kAnswerNo);
    EXPECT_FALSE(lonely.Initialise());
    ASSERT_FALSE(prompter.shown.empty());
    EXPECT_TRUE(prompter.shown[0].message.contains(QStringLiteral("TALUWebData:Connect")));
    EXPECT_EQ(programEnds, 0);
}

} // namespace
} // namespace quorvel::testing
