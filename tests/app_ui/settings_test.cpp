// Start-up, the settings file and shut-down, seen through the window.

#include "window_fixture.h"

#include "support/ini_store.h"
#include "support/program_home.h"
#include "support/ui/folder_chooser.h"

#include <QDate>
#include <QDir>
#include <QFile>
#include <QUrl>

#include <array>

namespace quorvel::testing {
namespace {

class SettingsTest : public WindowTest {
protected:
    QString Stored(const QString& key) {
        return IniStore(ProgramHome::SettingsFile()).Read("General", key, "<missing>");
    }
    QString AutostartEntry() {
        return home.File("autostart/" + ProgramHome::ProgramName() + ".desktop");
    }
};

// The values themselves are the settings' own; here the window shows them.
TEST_F(SettingsTest, FirstStartWithoutSettingsUsesTheDefaults) {
    Start();
    EXPECT_EQ(C().Txt_LocalFolder[0]->text(), home.Path());
    EXPECT_EQ(C().Opt_GetFileList->CheckedIndex(), 1);
    EXPECT_EQ(C().Cmb_interval->currentText(), "3 hrs");
    EXPECT_EQ(C().Cmb_interval->count(), 6);
    EXPECT_EQ(C().Lbl_LoadedFile->text(), home.File("files.txt"));
    EXPECT_EQ(window->windowTitle(), "TALU Quorvel");
    EXPECT_FALSE(window->StartedMinimised());
}

TEST_F(SettingsTest, FirstActivationLoadsTheListOfTheFirstRecentEntry) {
    UserMaintainsList();
    WriteList({Line("A", "a.csv")}, "lists/season.txt");
    Setting("File1", home.File("lists/season.txt"));
    Start();
    EXPECT_EQ(ListNames(), QStringList({"A"}));
    EXPECT_EQ(C().Lst_Files->currentRow(), 0);
    EXPECT_EQ(C().Txt_Name->text(), "A");
    EXPECT_EQ(C().Lbl_LoadedFile->text(), home.File("lists/season.txt"));
}

TEST_F(SettingsTest, FieldsSurviveARestart) {
    Start();
    C().Txt_CFG_URL->setText("http://example.test/cfg.txt");
    C().Txt_UserID->setText("farmer");
    C().Txt_Password->setText("");
    C().Txt_LocalFolder[1]->setText(home.File("data"));
    C().Txt_AfterDate->setText("1 Nov 2023");
    C().chk_ShowDate[0]->setChecked(false);
    C().chk_ShowDate[1]->setChecked(true);
    C().Chk_DownloadOnly->setChecked(true);
    for (OptionButtons* o :
         {C().Opt_GetFileList, C().Opt_GetLocalFolders, C().Opt_Automatic, C().Opt_Whichdates})
        o->Button(1 - o->CheckedIndex())->click();
    C().Cmb_interval->setCurrentText("6 hours");
    Close();
    // An emptied field is written as the word Null.
    EXPECT_EQ(Stored("Password"), "Null");
    EXPECT_EQ(Stored("ShowDate1"), "1");
    EXPECT_NE(Stored("Left"), "<missing>");

    Start();
    EXPECT_EQ(C().Txt_CFG_URL->text(), "http://example.test/cfg.txt");
    EXPECT_EQ(C().Txt_UserID->text(), "farmer");
    EXPECT_EQ(C().Txt_Password->text(), "");
    EXPECT_EQ(C().Txt_LocalFolder[1]->text(), home.File("data"));
    EXPECT_EQ(C().Txt_AfterDate->text(), "1 Nov 2023");
    EXPECT_FALSE(C().chk_ShowDate[0]->isChecked());
    // "ShowDate1" is written but never read back.
    EXPECT_FALSE(C().chk_ShowDate[1]->isChecked());
    EXPECT_TRUE(C().Chk_DownloadOnly->isChecked());
    const std::array options = {C().Opt_GetFileList, C().Opt_GetLocalFolders, C().Opt_Automatic,
                                C().Opt_Whichdates};
    const std::array<int, 4> chosen = {0, 0, 1, 1};
    for (std::size_t i = 0; i < options.size(); ++i)
        EXPECT_EQ(options[i]->CheckedIndex(), chosen[i]) << i;
    EXPECT_EQ(C().Cmb_interval->currentText(), "6 hours");
}

TEST_F(SettingsTest, ScheduledStartIsMinimisedAndDoesNotInitialise) {
    UserMaintainsList();
    WriteList({Line("A", "a.csv")});
    Start({"--other", "/s"});
    EXPECT_TRUE(window->StartedMinimised());
    EXPECT_TRUE(window->isMinimized());
    EXPECT_EQ(C().Lst_Files->count(), 0);
    // Minimised, the status shows in the caption.
    window->ShowStatus("Due in 02:00");
    EXPECT_EQ(window->windowTitle(), "Due in 02:00");
}

TEST_F(SettingsTest, UnreadableOptionIndexEndsTheLoadWithAReport) {
    Setting("GetLocalFolders", "many");
    Start();
    ASSERT_FALSE(ports.prompter.shown.empty());
    EXPECT_TRUE(ports.prompter.shown[0].message.contains("Quorvel:Load"))
        << ports.prompter.shown[0].message.toStdString();
    // The window is not left locked.
    EXPECT_FALSE(window->Flags().IsLoading);
}

TEST_F(SettingsTest, RunAtStartUpWritesAndRemovesTheAutostartEntry) {
    Start();
    EXPECT_FALSE(C().Chk_RunAtStartUp->isChecked());
    C().Chk_RunAtStartUp->click();
    ASSERT_TRUE(QFile::exists(AutostartEntry()));
    EXPECT_TRUE(home.Read("autostart/" + ProgramHome::ProgramName() + ".desktop").contains("/S"));
    Close();

    Start();
    EXPECT_TRUE(C().Chk_RunAtStartUp->isChecked());
    C().Chk_RunAtStartUp->click();
    EXPECT_FALSE(QFile::exists(AutostartEntry()));
}

TEST_F(SettingsTest, ListIsSavedAtExitOnlyWhenChangedAndFromTheRecords) {
    UserMaintainsList();
    WriteList({Line("A", "a.csv")});
    const QByteArray before = home.Read("files.txt");
    Start();
    Close();
    EXPECT_EQ(home.Read("files.txt"), before);

    Start();
    C().Txt_Name->setText("Renamed");
    window->StoreCurrentRecord();
    // An edit not yet stored in its record is not written.
    C().Txt_FileName->setText("edited.csv");
    Close();
    EXPECT_TRUE(home.Read("files.txt").contains("~Renamed~a.csv~"));
}

TEST_F(SettingsTest, FolderChooserStartsAtTheFieldAndFillsIt) {
    UserMaintainsList();
    Start();
    QString prompt, start;
    QUrl answer = QUrl::fromLocalFile(home.File("chosen"));
    ScopedFolderDialog dialog([&](QWidget*, const QString& p, const QString& s) {
        prompt = p;
        start = s;
        return answer;
    });
    C().Cmd_LocateFolder[1]->click();
    EXPECT_EQ(prompt, "Choose data folder");
    EXPECT_EQ(start, home.Path());
    EXPECT_EQ(C().Txt_LocalFolder[1]->text(), home.File("chosen"));
    answer = QUrl();
    C().Cmd_LocateFolder[1]->click();
    EXPECT_EQ(C().Txt_LocalFolder[1]->text(), home.File("chosen"));
}

} // namespace
} // namespace quorvel::testing
