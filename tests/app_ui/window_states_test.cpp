// The window states derived from the data: which controls a user can reach in
// each situation.

#include "window_fixture.h"

#include "support/shell_open.h"
#include "transfer/ftp.h"
#include "webdata/talu_web_data.h"

#include <QDir>
#include <QTcpServer>

namespace quorvel::testing {
namespace {

class WindowStatesTest : public WindowTest {
protected:
    void StartWithThree() {
        UserMaintainsList();
        WriteList({Line("A", "a.csv"), Line("B", "b.csv"), Line("C", "c.csv")});
        Start();
    }
    bool Enabled(QWidget* w) { return w->isEnabled(); }
    // Visible as far as the window decides (the page it is on may be hidden).
    bool Shown(QWidget* w) { return !w->isHidden(); }
};

TEST_F(WindowStatesTest, ControlsCarryTheirDescribedNamesWithArrayIndices) {
    Start();
    for (const char* name :
         {"Opt_Automatic(1)", "Opt_Download(3)", "Opt_UserLocationID(4)",
          "lbl_UserLocationFolder(3)", "Pic_Route(1)", "Lbl_FileStatus(1)", "Txt_LocalFolder(1)",
          "Cmd_DoFile(4)", "Cmd_Process(1)", "chk_Log(4)", "Frame_WebDetails", "Pic_ProgressFTP"})
        EXPECT_NE(window->findChild<QWidget*>(name), nullptr) << name;
    for (const char* name : {"mnu_File(4)", "mnu_RecentFile(5)", "mnu_Help(0)"})
        EXPECT_NE(window->findChild<QAction*>(name), nullptr) << name;
    const QStringList tabs = {"Main", "Files", "Folders", "New Season", "Options"};
    ASSERT_EQ(C().SSTab1->count(), 5);
    for (int i = 0; i < 5; ++i)
        EXPECT_EQ(C().SSTab1->tabText(i), tabs[i]);
}

TEST_F(WindowStatesTest, ListFromAdministratorLocksRecordFieldsButLeavesProcessAll) {
    WriteList({Line("A", "a.csv"), Line("B", "b.csv")});
    Setting("GetFileList", "1");
    Start();
    Select(0);
    for (QWidget* w : std::initializer_list<QWidget*>{
             C().Txt_Name, C().Txt_FileName, C().Cmd_LocateFile, C().Chk_Zip,
             C().Frame_AdminLocationID, C().Frame_UserLocationID, C().Frame_Download,
             C().Frame_Upload, C().Frame_MethodID, C().Txt_Folder, C().Cmd_DoFile[0],
             C().Cmd_DoFile[3]})
        EXPECT_FALSE(w->isEnabled()) << w->objectName().toStdString();
    for (int i = 0; i < 4; ++i)
        EXPECT_FALSE(C().mnu_File[i]->isVisible()) << i;
    EXPECT_TRUE(C().mnu_File[4]->isVisible());
    // No recent lists either: the administrator's list is the only one.
    for (QAction* entry : C().mnu_RecentFile)
        EXPECT_FALSE(entry->isVisible());
    EXPECT_TRUE(C().Cmd_GetFileList->isEnabled());
    EXPECT_TRUE(C().Cmd_Process[0]->isEnabled());

    C().Opt_GetFileList->Button(0)->click();
    EXPECT_TRUE(C().Txt_Name->isEnabled());
    EXPECT_TRUE(C().mnu_File[0]->isVisible());
    EXPECT_FALSE(C().Cmd_GetFileList->isEnabled());
}

TEST_F(WindowStatesTest, NothingSelectedDisablesRecordCommandsAndEmptiesStatusRows) {
    StartWithThree();
    home.Write("a.csv", "1,2\r\n");
    Select(0);
    EXPECT_FALSE(C().Lbl_FullFilename[0]->text().isEmpty());
    Select(-1);
    for (QWidget* w : {C().Cmd_DoFile[0], C().Cmd_DoFile[1], C().Cmd_DoFile[2], C().Cmd_DoFile[3],
                       C().Cmd_Process[1]})
        EXPECT_FALSE(w->isEnabled()) << w->objectName().toStdString();
    EXPECT_TRUE(C().Cmd_Process[0]->isEnabled());
    for (int i = 0; i < 2; ++i) {
        EXPECT_TRUE(C().Lbl_FullFilename[i]->text().isEmpty());
        EXPECT_TRUE(C().Lbl_FileStatus[i]->text().isEmpty());
        EXPECT_TRUE(C().Lbl_LastDate[i]->text().isEmpty());
    }
}

TEST_F(WindowStatesTest, MoveButtonsFollowThePositionInTheList) {
    StartWithThree();
    Select(0);
    EXPECT_FALSE(C().Cmd_DoFile[1]->isEnabled());
    EXPECT_TRUE(C().Cmd_DoFile[2]->isEnabled());
    Select(1);
    EXPECT_TRUE(C().Cmd_DoFile[1]->isEnabled());
    EXPECT_TRUE(C().Cmd_DoFile[2]->isEnabled());
    Select(2);
    EXPECT_TRUE(C().Cmd_DoFile[1]->isEnabled());
    EXPECT_FALSE(C().Cmd_DoFile[2]->isEnabled());
}

TEST_F(WindowStatesTest, DuringARunOnlyCancelIsOfferedAndCloseIsRefused) {
    StartWithThree();
    Select(1);
    window->Flags().IsBusy = true;
    window->EnableControls();
    EXPECT_FALSE(C().Cmd_Process[0]->isEnabled());
    EXPECT_FALSE(C().Cmd_Process[1]->isEnabled());
    EXPECT_TRUE(C().Cmd_Cancel->isEnabled());
    EXPECT_FALSE(C().Cmd_Close->isEnabled());
    for (int i = 0; i < 4; ++i)
        EXPECT_FALSE(C().Cmd_DoFile[i]->isEnabled()) << i;

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
    StartWithThree();
    const std::initializer_list<QWidget*> support = {
        C().Cmd_DoFile[4],  C().Cmd_GetCFG,      C().Cmd_GetFileList,  C().Cmd_Admin,
        C().Cmd_ClearFiles, C().Chk_GotFileList, C().Frame_WebDetails, C().Chk_GotPHP};
    for (QWidget* w : support)
        EXPECT_FALSE(Shown(w)) << w->objectName().toStdString();
    C().Chk_Trace->setChecked(true);
    for (QWidget* w : support)
        EXPECT_TRUE(Shown(w)) << w->objectName().toStdString();
    C().Chk_Trace->setChecked(false);
    for (QWidget* w : support)
        EXPECT_FALSE(Shown(w)) << w->objectName().toStdString();
}

TEST_F(WindowStatesTest, SaveIsOfferedOnlyAfterAnEdit) {
    StartWithThree();
    C().Chk_Trace->setChecked(true);
    Select(0);
    EXPECT_FALSE(C().Cmd_DoFile[4]->isEnabled());
    C().Txt_FileName->setText("other.csv");
    EXPECT_TRUE(C().Cmd_DoFile[4]->isEnabled());
    C().Cmd_DoFile[4]->click();
    EXPECT_FALSE(C().Cmd_DoFile[4]->isEnabled());
    EXPECT_EQ(window->Files().At(0).FileName, "other.csv");
}

TEST_F(WindowStatesTest, FoldersFromAdministratorLockTheFolderFields) {
    Setting("GetLocalFolders", "1");
    Start();
    for (QWidget* w :
         std::initializer_list<QWidget*>{C().Txt_LocalFolder[1], C().Cmd_LocateFolder[1],
                                         C().Txt_UserFolder, C().Txt_UserCurrentFolder})
        EXPECT_FALSE(w->isEnabled()) << w->objectName().toStdString();
    EXPECT_TRUE(C().Txt_LocalFolder[0]->isEnabled());
    C().Opt_GetLocalFolders->Button(0)->click();
    EXPECT_TRUE(C().Txt_UserFolder->isEnabled());
}

TEST_F(WindowStatesTest, LocalStatusShowsSizeMissingFileOrNothing) {
    UserMaintainsList();
    WriteList({Line("Rain", "rain.csv"), Line("Gone", "gone.csv"), Line("Folder", "noext"),
               Line("Logs", "log*.txt")});
    home.Write("rain.csv", QByteArray(1234, 'x'));
    home.Write("log1.txt", "x");
    Start();
    Select(0);
    EXPECT_EQ(C().Lbl_FullFilename[0]->text(), home.File("rain.csv"));
    EXPECT_EQ(C().Lbl_FileStatus[0]->text(), "1,234 b");
    Select(1);
    EXPECT_EQ(C().Lbl_FileStatus[0]->text(), "NotExist");
    Select(2);
    EXPECT_EQ(C().Lbl_FileStatus[0]->text(), "");
    Select(3);
    EXPECT_EQ(C().Lbl_FileStatus[0]->text(), " - ");
    // The service side is asked only when its "Show" box is ticked.
    EXPECT_EQ(C().Lbl_FileStatus[1]->text(), "");
}

TEST_F(WindowStatesTest, LocalLastDateIsShownWhenItsBoxIsTicked) {
    UserMaintainsList();
    WriteList({" 0 ~1~Station~station.dat~1~0~0~1~0~1~0~~~0"});
    home.Write("station.dat", "2024-03-01 10:00:00,1\r\n2024-03-02 11:30:00,2\r\n");
    Start();
    Select(0);
    EXPECT_EQ(C().Lbl_LastDate[0]->text(), "2 Mar 2024 11:30:00");
    C().chk_ShowDate[0]->setChecked(false);
    EXPECT_EQ(C().Lbl_LastDate[0]->text(), "-");
}

TEST_F(WindowStatesTest, FileNameClimbingOutOfItsFolderIsRefusedOnScreen) {
    UserMaintainsList();
    WriteList({Line("Escape", "../../etc/passwd")});
    Start();
    Select(0);
    EXPECT_EQ(C().Lbl_FileStatus[0]->text(), "Refused");
    // The label explains the refusal instead of showing a path outside the folder.
    EXPECT_FALSE(C().Lbl_FullFilename[0]->text().isEmpty());
    EXPECT_FALSE(C().Lbl_FullFilename[0]->text().startsWith(QDir::rootPath() + "etc"));
    ports.prompter.shown.clear();
    C().Cmd_EditFile->click();
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_TRUE(ports.prompter.shown[0].message.contains("Quorvel:EditFile"));
}

TEST_F(WindowStatesTest, TraceShowsOneLinePerLineOnlyWhileStatusIsTicked) {
    Start();
    C().chk_Log[0]->setChecked(false);
    window->AddTrace("one\ntwo");
    EXPECT_EQ(C().Lst_Trace->count(), 0);
    C().chk_Log[0]->setChecked(true);
    window->AddTrace("one\ntwo\nthree");
    ASSERT_EQ(C().Lst_Trace->count(), 3);
    EXPECT_EQ(C().Lst_Trace->item(2)->text(), "three");
    EXPECT_EQ(C().Lst_Trace->currentRow(), 2);
    window->ShowStatus("Connected to host");
    EXPECT_EQ(C().Lst_Trace->item(3)->text(), "Status>Connected to host");
    EXPECT_EQ(C().Lbl_status->text(), "Connected to host");
    C().Cmd_Clear->click();
    EXPECT_EQ(C().Lst_Trace->count(), 0);
}

TEST_F(WindowStatesTest, WebDataEventsReachStatusAndTrace) {
    Start();
    C().chk_Log[0]->setChecked(true);
    Q_EMIT window->WebData().Finished("OK 3 lines");
    EXPECT_EQ(C().Lbl_status->text(), "OK 3 lines");
    Q_EMIT window->WebData().ShowStatus("Connecting to host");
    EXPECT_EQ(C().Lbl_status->text(), "Connecting to host");
    Q_EMIT window->WebData().ShowLog("D>Connect");
    Q_EMIT window->WebData().ShowReceived("line 1\nline 2");
    const QStringList expected = {"Status>OK 3 lines", "Status>Connecting to host", "D>Connect",
                                  "line 1", "line 2"};
    ASSERT_EQ(C().Lst_Trace->count(), expected.size());
    for (int i = 0; i < expected.size(); ++i)
        EXPECT_EQ(C().Lst_Trace->item(i)->text(), expected[i]);
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
    for (int i = 0; i < C().Lst_Trace->count(); ++i) {
        EXPECT_TRUE(C().Lst_Trace->item(i)->text().startsWith("TraceFTP:"))
            << C().Lst_Trace->item(i)->text().toStdString();
    }
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

TEST_F(WindowStatesTest, EditOpensTheLocalFileOfTheRecord) {
    UserMaintainsList();
    WriteList({Line("Rain", "rain.csv")});
    home.Write("rain.csv", "1,2\r\n");
    Start();
    Select(0);
    QString opened;
    SetDesktopOpener([&](const QString& file) {
        opened = file;
        return true;
    });
    C().Cmd_EditFile->click();
    SetDesktopOpener({});
    EXPECT_EQ(opened, home.File("rain.csv"));
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
    EXPECT_FALSE(window->Flags().IsBusy);
    EXPECT_FALSE(window->Flags().IsLoading);
    EXPECT_TRUE(window->Flags().InMessage);
}

TEST_F(WindowStatesTest, LongPathsDoNotWidenTheWindow) {
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

TEST_F(WindowStatesTest, TracePaneTakesTheRoomOfAGrowingWindow) {
    Start();
    window->resize(1000, 800);
    Pump();
    const QRect tabs = C().SSTab1->geometry();
    const QSize trace = C().Lst_Trace->size();
    window->resize(1200, 1000);
    Pump();
    EXPECT_EQ(C().SSTab1->geometry().top(), tabs.top());
    EXPECT_EQ(C().SSTab1->height(), tabs.height());
    EXPECT_EQ(C().Lst_Trace->height(), trace.height() + 200);
    EXPECT_EQ(C().Lst_Trace->width(), trace.width() + 200);
}

} // namespace
} // namespace quorvel::testing
