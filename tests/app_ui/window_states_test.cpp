// The window states derived from the data: which controls a user can reach in
// each situation, and what the status and trace panes show.

#include "window_fixture.h"

#include "support/shell_open.h"
#include "transfer/ftp.h"
#include "webdata/script_server.h"
#include "webdata/talu_web_data.h"

#include <QDir>

#include <utility>

namespace quorvel::testing {
namespace {

using WindowStatesTest = WindowTest;

TEST_F(WindowStatesTest, ListsAndFoldersFromAdministratorLockTheirFieldsAndMenus) {
    WriteList({Line("A", "a.csv"), Line("B", "b.csv")});
    Setting("GetFileList", "1");
    Setting("GetLocalFolders", "1");
    Start();
    Select(0);
    ExpectEnabled({C().Txt_Name, C().Cmd_DoFile[kFileNew], C().Txt_UserFolder}, false);
    ExpectEnabled({C().Cmd_GetFileList, C().Cmd_Process[1]}, true);
    EXPECT_FALSE(C().mnu_File[0]->isVisible());
    EXPECT_TRUE(C().mnu_File[4]->isVisible());
    // No recent lists either: the administrator's list is the only one.
    for (QAction* entry : C().mnu_RecentFile)
        EXPECT_FALSE(entry->isVisible());

    C().Opt_GetFileList->Button(0)->click();
    C().Opt_GetLocalFolders->Button(0)->click();
    ExpectEnabled({C().Txt_Name, C().Txt_UserFolder, C().Cmd_DoFile[kFileNew]}, true);
    EXPECT_TRUE(C().mnu_File[0]->isVisible());
}

TEST_F(WindowStatesTest, ShowingARecordIsNoEditAndSaveIsOfferedOnlyAfterOne) {
    StartWith({"A", "B"});
    C().Chk_Trace->setChecked(true);
    Select(0);
    Select(1);
    EXPECT_FALSE(window->Flags().RecordEdited);
    EXPECT_FALSE(window->Files().ListChanged);
    EXPECT_FALSE(C().Cmd_DoFile[4]->isEnabled());
    C().Txt_FileName->setText("other.csv");
    EXPECT_TRUE(C().Cmd_DoFile[4]->isEnabled());
    C().Cmd_DoFile[4]->click();
    EXPECT_FALSE(C().Cmd_DoFile[4]->isEnabled());
    EXPECT_EQ(window->Files().At(1).FileName, "other.csv");
}

TEST_F(WindowStatesTest, LocalStatusShowsSizeMissingFileOrNothingAndTheLastDate) {
    UserMaintainsList();
    WriteList({Line("Rain", "rain.csv"), Line("Gone", "gone.csv"), Line("Folder", "noext"),
               Line("Logs", "log*.txt"), " 0 ~1~Station~station.dat~1~0~0~1~0~1~0~~~0"});
    home.Write("rain.csv", QByteArray(1234, 'x'));
    home.Write("log1.txt", "x");
    home.Write("station.dat", "2024-03-01 10:00:00,1\r\n2024-03-02 11:30:00,2\r\n");
    Start();
    const QStringList status = {"1,234 b", "NotExist", "", " - "};
    for (int row = 0; row < status.size(); ++row) {
        Select(row);
        EXPECT_EQ(C().Lbl_FileStatus[0]->text(), status[row]) << row;
        // The service side is asked only when its "Show" box is ticked.
        EXPECT_EQ(C().Lbl_FileStatus[1]->text(), "") << row;
    }
    Select(0);
    EXPECT_EQ(C().Lbl_FullFilename[0]->text(), home.File("rain.csv"));
    Select(4);
    EXPECT_EQ(C().Lbl_LastDate[0]->text(), "2 Mar 2024 11:30:00");
    C().chk_ShowDate[0]->setChecked(false);
    EXPECT_EQ(C().Lbl_LastDate[0]->text(), "-");
    // A selection looks at the record's files once, not once for each record it passes.
    const int before = ports.busy.pushes;
    Select(0);
    EXPECT_EQ(ports.busy.pushes - before, 2); // the last date of each side
    // Nothing selected: the status rows are emptied.
    Select(-1);
    for (int i = 0; i < 2; ++i) {
        EXPECT_TRUE(C().Lbl_FullFilename[i]->text().isEmpty());
        EXPECT_TRUE(C().Lbl_FileStatus[i]->text().isEmpty());
        EXPECT_TRUE(C().Lbl_LastDate[i]->text().isEmpty());
    }
}

// With "Show" ticked for the web site each selection asks the service for the
// last date and waits for the reply in the event loop. Selections made during
// that wait never start a second exchange inside the first; the latest one is
// what the status shows when the wait is over.
TEST_F(WindowStatesTest, SelectionsDuringAServiceWaitStartNoExchangeInsideIt) {
    ScriptServer server;
    WaitLengths waits;
    waits.replyGap = std::chrono::milliseconds(1000); // only a nested wait would reach it
    ports.clock.SetWaits(waits);
    UserMaintainsList();
    QStringList lines;
    for (const char* name : {"A", "B", "C"})
        lines << QStringLiteral(" 0 ~1~%1~%2.dat~1~0~0~1~0~1~0~~~0")
                     .arg(name, QString(name).toLower());
    WriteList(lines);
    Start();
    C().Txt_httpServer->setText(server.HostPort());
    window->ConfigureClass();
    int nested = -1;
    bool acted = false;
    server.responder = [&](const QByteArray& request) {
        // The day of the month tells the files apart: a.dat 1, b.dat 2, c.dat 3.
        const int day = request.contains("file=a%2Edat")   ? 1
                        : request.contains("file=b%2Edat") ? 2
                                                           : 3;
        Reply reply;
        if (!std::exchange(acted, true))
            reply.push_back(Act([&] {
                const auto before = server.requests.size();
                Select(1);
                Select(2);
                nested = int(server.requests.size() - before);
            }));
        reply.push_back(Send(HttpReply(QStringLiteral("OK 2006-05-%1 10:00:00\r\n")
                                           .arg(day, 2, 10, QLatin1Char('0'))
                                           .toLatin1())));
        return reply;
    };
    C().chk_ShowDate[1]->setChecked(true);
    EXPECT_EQ(nested, 0);
    EXPECT_FALSE(window->RefreshingFileStatus());
    ASSERT_EQ(server.requests.size(), 2);
    EXPECT_TRUE(server.requests[1].contains("file=c%2Edat"));
    EXPECT_EQ(window->CurrentRecordNumber(), 3);
    EXPECT_EQ(C().Lbl_LastDate[1]->text(), "3 May 2006 10:00:00");
}

TEST_F(WindowStatesTest, EditOpensTheLocalFileAndRefusesANameClimbingOut) {
    UserMaintainsList();
    WriteList({Line("Rain", "rain.csv"), Line("Escape", "../../etc/passwd")});
    home.Write("rain.csv", "1,2\r\n");
    Start();
    QStringList opened;
    SetDesktopOpener([&](const QString& file) {
        opened << file;
        return true;
    });
    Select(0);
    C().Cmd_EditFile->click();
    Select(1);
    EXPECT_EQ(C().Lbl_FileStatus[0]->text(), "Refused");
    // The label explains the refusal instead of showing a path outside the folder.
    EXPECT_FALSE(C().Lbl_FullFilename[0]->text().isEmpty());
    EXPECT_FALSE(C().Lbl_FullFilename[0]->text().startsWith(QDir::rootPath() + "etc"));
    ports.prompter.shown.clear();
    C().Cmd_EditFile->click();
    SetDesktopOpener({});
    EXPECT_EQ(opened, QStringList{home.File("rain.csv")});
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_TRUE(ports.prompter.shown[0].message.contains("Quorvel:EditFile"));
}

TEST_F(WindowStatesTest, TraceAndWebDataEventsReachStatusAndTraceOneLinePerLine) {
    Start();
    C().chk_Log[0]->setChecked(false);
    window->AddTrace("one\ntwo");
    EXPECT_EQ(C().Lst_Trace->count(), 0);
    C().chk_Log[0]->setChecked(true);
    window->AddTrace("one\ntwo");
    EXPECT_EQ(C().Lst_Trace->currentRow(), 1);
    Q_EMIT window->WebData().Finished("OK 3 lines");
    Q_EMIT window->WebData().ShowStatus("Connecting to host");
    EXPECT_EQ(C().Lbl_status->text(), "Connecting to host");
    Q_EMIT window->WebData().ShowLog("D>Connect");
    // Received text is connected by ConfigureClass, which runs before every exchange.
    window->ConfigureClass();
    Q_EMIT window->WebData().ShowReceived("line 1\nline 2");
    const QStringList expected = {
        "one",    "two",   "Status>OK 3 lines", "Status>Connecting to host", "D>Connect",
        "line 1", "line 2"};
    ASSERT_EQ(C().Lst_Trace->count(), expected.size());
    for (int i = 0; i < expected.size(); ++i)
        EXPECT_EQ(C().Lst_Trace->item(i)->text(), expected[i]);
    C().Cmd_Clear->click();
    EXPECT_EQ(C().Lst_Trace->count(), 0);
    // The status label is one line high: a reason of two lines is shown whole on it.
    window->ShowStatus("Could not connect to http://\nURL using bad/illegal format\r\n");
    EXPECT_EQ(C().Lbl_status->text(),
              "Could not connect to http:// \u2014 URL using bad/illegal format");
    EXPECT_EQ(C().Lst_Trace->count(), 3);
}

TEST_F(WindowStatesTest, FtpTraceFollowsTraceAloneAndItsStatusGoesToTheLabel) {
    Start();
    C().chk_Log[0]->setChecked(false);
    C().Txt_ftpServer->setText(DeadServer()); // the connection fails at once
    C().Chk_Trace->setChecked(true);
    std::int64_t size = -1;
    EXPECT_FALSE(ftpRemoteFileSize("data/site.csv", size));
    ASSERT_GT(C().Lst_Trace->count(), 0);
    for (int i = 0; i < C().Lst_Trace->count(); ++i)
        EXPECT_TRUE(C().Lst_Trace->item(i)->text().startsWith("TraceFTP:")) << i;
    EXPECT_FALSE(C().Lbl_status->text().isEmpty());

    C().Lst_Trace->clear();
    C().Chk_Trace->setChecked(false);
    ftpRemoteFileSize("data/site.csv", size);
    EXPECT_EQ(C().Lst_Trace->count(), 0);
}

TEST_F(WindowStatesTest, ErrorReportNamesTheProcedureAndUnlocksTheWindow) {
    Start();
    window->Flags().IsLoading = true;
    EXPECT_FALSE(window->ShowError("DoFile", "Disk full"));
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_EQ(ports.prompter.shown[0].message, "Disk full\r\nQuorvel:DoFile");
    EXPECT_TRUE(ports.prompter.shown[0].timed);
    EXPECT_EQ(ports.prompter.shown[0].buttons, kIconExclamation);
    EXPECT_FALSE(window->Flags().IsLoading);
    EXPECT_TRUE(window->Flags().InMessage);
}

TEST_F(WindowStatesTest, LongPathsAndMessagesDoNotWidenTheWindow) {
    UserMaintainsList();
    WriteList({Line("Deep", QString(300, 'x') + ".csv")});
    Start();
    Select(-1);
    const int before = window->minimumSizeHint().width();
    C().Txt_LocalFolder[1]->setText("/" + QString(400, 'd'));
    Select(0);
    window->ShowStatus("Failed: " + QString(400, 'e'));
    Pump();
    EXPECT_EQ(window->minimumSizeHint().width(), before);
    EXPECT_TRUE(C().lbl_UserLocationFolder[1]->toolTip().endsWith("ddd"));
}

} // namespace
} // namespace quorvel::testing
