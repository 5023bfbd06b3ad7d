// The object's settings, defaults, lists, traces and notices.
#include "webdata/combo_sink.h"
#include "webdata/display_link.h"
#include "webdata_fixture.h"

namespace quorvel::testing {
namespace {

TEST_F(WebDataTest, LogSwitchesDecideWhatReachesTheWindowAndTheLogFile) {
    web.EnableLog(5, 1); // outside the range: nothing changes
    web.EnableLog(-1, 1);
    web.Connect(0);
    EXPECT_TRUE(logs.isEmpty());
    web.EnableLog(3, 1);
    web.EnableLog(1, 1);
    web.Connect(0);
    web.SendProgress(2, 10, 5);
    web.SendComplete(0);
    EXPECT_EQ(logs, (QStringList{"D>Connect", "D>SendProgress: BytesSent:10 BytesRemaining: 5",
                                 "S>Send complete"}));
    // Decisions go to the window only, sent lines to the log file too.
    EXPECT_FALSE(LogBytes().contains("Connect"));
    EXPECT_TRUE(LogBytes().contains(":CTALUWebData:S>Send complete"));
    web.EnableLog(3, 0);
    web.Connect(0);
    EXPECT_EQ(logs.size(), 3);
    EXPECT_EQ(web.WinsockStatus(12), QStringLiteral("WStatus:12"));
    EXPECT_EQ(web.WinsockStatus(-1), QStringLiteral("WStatus:-1"));
}

TEST_F(WebDataTest, EncryptSimpleUsesTheDoubledKeyAndReportsTextBeyondIt) {
    EXPECT_EQ(web.EncryptKey(), QStringLiteral("583640917").repeated(8));
    const QString text = QStringLiteral("Pass word-42?zZ");
    const QString once = web.EncryptSimple(text);
    EXPECT_NE(once, text);
    EXPECT_EQ(once.at(4), QLatin1Char(' '));
    EXPECT_EQ(once.at(9), QLatin1Char('-'));
    EXPECT_EQ(web.EncryptSimple(once), text);
    prompter.Script(kAnswerNo);
    web.SetEncryptKey(QString(51, QLatin1Char('1')));
    EXPECT_EQ(web.EncryptSimple(QString(52, QLatin1Char('a'))), QString());
    ASSERT_EQ(prompter.shown.size(), 1u);
    EXPECT_TRUE(prompter.shown[0].message.contains(QStringLiteral("TALUWebData:EncryptSimple")));
    EXPECT_EQ(programEnds, 0);
}

TEST_F(WebDataTest, ListFillersReplaceTheOldItems) {
    StringListCombo addresses, types;
    addresses.AddItem(QStringLiteral("old"), 3);
    types.AddItem(QStringLiteral("old"), 3);
    web.LoadComboWithIPAddresses(addresses);
    web.LoadComboWithDataTypes(types);
    EXPECT_FALSE(addresses.items.contains(QStringLiteral("old")));
    EXPECT_EQ(addresses.current, 1);
    ASSERT_EQ(types.items.size(), 9);
    EXPECT_EQ(types.itemData.at(8), 8);
}

TEST_F(WebDataTest, SendNewDataOnlyShowsATimedNotice) {
    EXPECT_TRUE(web.SendNewData(QStringLiteral("/data/site1.dat"), 2, 1));
    ASSERT_EQ(prompter.shown.size(), 1u);
    EXPECT_TRUE(prompter.shown[0].timed);
    EXPECT_TRUE(prompter.shown[0].message.endsWith(
        QStringLiteral(": /data/site1.dat=>site1.dat DateFormat:1")));
    EXPECT_EQ(server.connections, 0);
}

TEST_F(WebDataTest, TheWindowsLinkPreparesReceivedTextOnlyWhileTracesAreShown) {
    RecordingTraceView view;
    auto link = std::make_unique<DisplayLink>(web, view);
    link->SetTracesShown(false);
    EXPECT_FALSE(web.ShowsReceivedText());
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    ASSERT_TRUE(web.Initialise());
    EXPECT_TRUE(view.statuses.contains(QStringLiteral("OK")));
    EXPECT_TRUE(view.traces.isEmpty());

    link->SetTracesShown(true);
    EXPECT_TRUE(web.ShowsReceivedText());
    server.Queue(HttpReply("a|b|c|d|e\r\nOK\r\n"));
    ASSERT_TRUE(web.Initialise());
    EXPECT_FALSE(view.traces.filter(QStringLiteral("a|b|c|d|e\nOK\n")).isEmpty());
    link.reset();
    EXPECT_FALSE(web.ShowsReceivedText());
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
