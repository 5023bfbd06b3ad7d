// The window states derived from the data: which controls a user can reach in
// each situation, and what the status and trace panes show.

#include "window_fixture.h"

#include "support/shell_open.h"
#include "transfer/ftp.h"
#include "webdata/talu_web_data.h"

#include <QDir>
#include <QTcpServer>

namespace quorvel::testing {
namespace {

using WindowStatesTest = WindowTest;

TEST_F(WindowStatesTest, ListsAndFoldersFromAdministratorLockTheirFields) {
    WriteList({Line("A", "a.csv"), Line("B", "b.csv")});
    Setting("GetFileList", "1");
    Setting("GetLocalFolders", "1");
    Start();
    Select(0);
    ExpectEnabled({C().Txt_Name, C().Txt_FileName, C().Cmd_LocateFile, C().Chk_Zip,
                   C().Frame_AdminLocationID, C().Frame_UserLocationID, C().Frame_Download,
                   C().Frame_Upload, C().Frame_MethodID, C().Txt_Folder, C().Cmd_DoFile[0],
                   C().Cmd_DoFile[3], C().Txt_LocalFolder[1], C().Cmd_LocateFolder[1],
                   C().Txt_UserFolder, C().Txt_UserCurrentFolder},
                  false);
    ExpectEnabled({C().Cmd_GetFileList, C().Cmd_Process[0], C().Txt_LocalFolder[0]}, true);
    for (int i = 0; i < 4; ++i)
        EXPECT_FALSE(C().mnu_File[i]->isVisible()) << i;
    EXPECT_TRUE(C().mnu_File[4]->isVisible());
    // No recent lists either: the administrator's list is the only one.
    for (QAction* entry : C().mnu_RecentFile)
        EXPECT_FALSE(entry->isVisible());

    C().Opt_GetFileList->Button(0)->click();
    C().Opt_GetLocalFolders->Button(0)->click();
    ExpectEnabled({C().Txt_Name, C().Txt_UserFolder}, true);
    EXPECT_TRUE(C().mnu_File[0]->isVisible());
    EXPECT_FALSE(C().Cmd_GetFileList->isEnabled());
}

TEST_F(WindowStatesTest, RecordCommandsFollowTheSelection) {
    StartWith({"A", "B", "C"});
    struct Case {
        int row;
        bool record, up, down;
    };
    for (const Case& c : {Case{0, true, false, true}, Case{1, true, true, true},
                          Case{2, true, true, false}, Case{-1, false, false, false}}) {
        SCOPED_TRACE(c.row);
        Select(c.row);
        ExpectEnabled({C().Cmd_DoFile[0], C().Cmd_DoFile[3], C().Cmd_Process[1]}, c.record);
        EXPECT_EQ(C().Cmd_DoFile[1]->isEnabled(), c.up);
        EXPECT_EQ(C().Cmd_DoFile[2]->isEnabled(), c.down);
        EXPECT_TRUE(C().Cmd_Process[0]->isEnabled());
        EXPECT_EQ(C().Lbl_FileStatus[0]->text().isEmpty(), !c.record);
    }
    // Nothing selected: the status rows are emptied.
    for (int i = 0; i < 2; ++i) {
        EXPECT_TRUE(C().Lbl_FullFilename[i]->text().isEmpty());
        EXPECT_TRUE(C().Lbl_FileStatus[i]->text().isEmpty());
        EXPECT_TRUE(C().Lbl_LastDate[i]->text().isEmpty());
    }
}

TEST_F(WindowStatesTest, DuringARunOnlyCancelIsOfferedAndCloseIsRefused) {
    StartWith({"A", "B", "C"});
    Select(1);
    window->Flags().IsBusy = true;
    window->EnableControls();
    ExpectEnabled({C().Cmd_Process[0], C().Cmd_Process[1], C().Cmd_Close, C().Cmd_DoFile[0],
                   C().Cmd_DoFile[1], C().Cmd_DoFile[2], C().Cmd_DoFile[3]},
                  false);
    EXPECT_TRUE(C().Cmd_Cancel->isEnabled());
    // A close request only asks the run to stop.
    EXPECT_FALSE(window->close());
    EXPECT_TRUE(window->isVisible());
    EXPECT_TRUE(window->Flags().CancelRequested);
    window->Flags().CancelRequested = false;
    C().Cmd_Cancel->click();
    EXPECT_TRUE(window->Flags().CancelRequested);

    window->Flags().IsBusy = false;
    window->EnableControls();
    EXPECT_TRUE(C().Cmd_Process[0]->isEnabled());
    EXPECT_FALSE(C().Cmd_Cancel->isEnabled());
}

TEST_F(WindowStatesTest, SupportModeShowsAdministrativeControlsAndHidesThemAgain) {
    StartWith({"A"});
    for (bool support : {false, true, false}) {
        SCOPED_TRACE(support);
        C().Chk_Trace->setChecked(support);
        // Visible as far as the window decides (the page it is on may be hidden).
        for (QWidget* w : std::initializer_list<QWidget*>{
                 C().Cmd_DoFile[4], C().Cmd_GetCFG, C().Cmd_GetFileList, C().Cmd_Admin,
                 C().Cmd_ClearFiles, C().Chk_GotFileList, C().Frame_WebDetails, C().Chk_GotPHP})
            EXPECT_EQ(!w->isHidden(), support) << w->objectName().toStdString();
    }
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
}

TEST_F(WindowStatesTest, FtpTraceFollowsTraceAloneAndItsStatusGoesToTheLabel) {
    // A loopback port with nobody listening: the connection fails at once.
    QTcpServer probe;
    ASSERT_TRUE(probe.listen(QHostAddress::LocalHost));
    const QString server = QStringLiteral("127.0.0.1:%1").arg(probe.serverPort());
    probe.close();
    Start();
    C().chk_Log[0]->setChecked(false);
    C().Txt_ftpServer->setText(server);
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

TEST_F(WindowStatesTest, WebDataWorksWithTheFieldsAsTheyStand) {
    Start();
    C().Txt_WebFolder->setText("/clients/wd");
    EXPECT_NE(window->WebData().WebFolder(), "/clients/wd");
    window->ConfigureClass();
    EXPECT_EQ(window->WebData().WebFolder(), "/clients/wd");
}

TEST_F(WindowStatesTest, ErrorReportNamesTheProcedureAndUnlocksTheWindow) {
    Start();
    window->Flags().IsBusy = true;
    window->Flags().IsLoading = true;
    EXPECT_FALSE(window->ShowError("DoFile", "Disk full"));
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_EQ(ports.prompter.shown[0].message, "Disk full\r\nQuorvel:DoFile");
    EXPECT_TRUE(ports.prompter.shown[0].timed);
    EXPECT_EQ(ports.prompter.shown[0].buttons, kIconExclamation);
    EXPECT_FALSE(window->Flags().IsBusy || window->Flags().IsLoading);
    EXPECT_TRUE(window->Flags().InMessage);
}

TEST_F(WindowStatesTest, LongPathsDoNotWidenTheWindowAndTracePaneTakesTheRoom) {
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

    window->resize(1000, 800);
    Pump();
    const QRect tabs = C().SSTab1->geometry();
    const QSize trace = C().Lst_Trace->size();
    window->resize(1200, 1000);
    Pump();
    EXPECT_EQ(C().SSTab1->geometry().top(), tabs.top());
    EXPECT_EQ(C().SSTab1->height(), tabs.height());
    EXPECT_EQ(C().Lst_Trace->size(), trace + QSize(200, 200));
}

} // namespace
} // namespace quorvel::testing
