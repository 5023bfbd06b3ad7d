// Start-up, the settings file and shut-down, seen through the window.

#include "window_fixture.h"

#include "support/ini_store.h"
#include "support/program_home.h"
#include "support/ui/folder_chooser.h"

#include <QDate>
#include <QDir>
#include <QFile>
#include <QImage>
#include <QMessageBox>
#include <QRegularExpression>
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

// A first start is no dead end: the empty list says what to do next, and
// what it says follows who keeps the list.
TEST_F(SettingsTest, AFirstStartSaysWhatToDoNext) {
    Start();
    // Drawn pixels in the middle band of the list, where the hint stands and
    // where the first entries do not reach.
    const auto hintPixels = [&] {
        const QImage image = C().Lst_Files->viewport()->grab().toImage();
        const QColor back = C().Lst_Files->palette().color(QPalette::Base);
        int count = 0;
        for (int y = image.height() / 3; y < image.height() * 2 / 3; ++y)
            for (int x = 0; x < image.width(); ++x)
                count += QColor(image.pixel(x, y)) != back ? 1 : 0;
        return count;
    };
    // The defaults themselves are the settings' own; here the window shows them.
    EXPECT_EQ(C().Txt_LocalFolder[0]->text(), home.Path());
    EXPECT_EQ(C().Opt_GetFileList->CheckedIndex(), 1);
    EXPECT_EQ(C().Cmb_interval->currentText(), "3 hrs");
    EXPECT_EQ(C().Cmb_interval->count(), 6);
    EXPECT_EQ(C().Lbl_LoadedFile->text(), home.File("files.txt"));
    EXPECT_EQ(window->windowTitle(), "TALU Quorvel");
    EXPECT_FALSE(window->StartedMinimised());
    // Nothing to sign in with yet: no fetch from an empty address, but the way there.
    EXPECT_TRUE(C().Lbl_status->text().startsWith("Welcome to Quorvel: enter the CFG file"))
        << C().Lbl_status->text().toStdString();
    EXPECT_TRUE(ports.prompter.shown.empty());
    EXPECT_TRUE(C().Lst_Files->EmptyHint().contains("Log in on the Main tab"));
    EXPECT_GT(hintPixels(), 0);
    C().Opt_GetFileList->Button(0)->click();
    EXPECT_TRUE(C().Lst_Files->EmptyHint().contains("Press New"));
    ASSERT_TRUE(C().Cmd_DoFile[kFileNew]->isEnabled());
    AnswerDialogs({home.File("first.csv")});
    C().Cmd_DoFile[kFileNew]->click();
    EXPECT_EQ(ListNames(), QStringList({"first.csv"}));
    EXPECT_EQ(hintPixels(), 0);
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

// One unreadable value falls back to its own default: the start goes on and
// the exit writes every other setting as it was stored.
TEST_F(SettingsTest, AnUnreadableOptionFallsBackAloneAndTheOthersSurviveTheExit) {
    const QStringList keys = {"GetFileList", "Automatic",  "Interval", "CFG_URL",
                              "DataFolder",  "Whichdates", "AfterDate"};
    const QStringList values = {
        "0", "1", "6 hours", "http://example.test/cfg.txt", home.File("data"), "1", "1 Mar 2021"};
    for (int i = 0; i < keys.size(); ++i)
        Setting(keys[i], values[i]);
    Setting("GetLocalFolders", "many");
    Start();
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_TRUE(ports.prompter.shown[0].message.contains("GetLocalFolders=many"))
        << ports.prompter.shown[0].message.toStdString();
    EXPECT_FALSE(window->Flags().IsLoading);
    EXPECT_EQ(C().Opt_GetLocalFolders->CheckedIndex(), 1);
    EXPECT_EQ(C().Cmb_interval->currentText(), "6 hours");
    Close();
    for (int i = 0; i < keys.size(); ++i)
        EXPECT_EQ(Stored(keys[i]), values[i]) << keys[i].toStdString();
    EXPECT_EQ(Stored("GetLocalFolders"), "1");
}

// Started at log-on, the program must find the settings and the list it has
// now: a home other than the default one goes into the entry, quoted.
TEST_F(SettingsTest, TheAutostartEntryCarriesAHomeThatIsNotTheDefault) {
    struct Case {
        QString home; // empty: the default folder
        QString arguments;
    };
    const QString spaced = home.File("my data");
    const Case cases[] = {{spaced, "/S --home \"" + spaced + "\""},
                          {home.File("plain"), "/S --home " + home.File("plain")},
                          {QString(), "/S"}};
    for (const Case& c : cases) {
        ProgramHome::SetFolder(c.home);
        ASSERT_EQ(ProgramHome::IsDefault(), c.home.isEmpty());
        Start();
        C().Chk_RunAtStartUp->click();
        const QStringList lines =
            QString::fromUtf8(home.Read("autostart/" + ProgramHome::ProgramName() + ".desktop"))
                .split('\n');
        const QStringList exec = lines.filter(QRegularExpression("^Exec="));
        ASSERT_EQ(exec.size(), 1) << c.arguments.toStdString();
        EXPECT_TRUE(exec[0].endsWith(" " + c.arguments)) << exec[0].toStdString();
        // The box reads the entry back as ticked; unticking removes it.
        Close();
        Start();
        EXPECT_TRUE(C().Chk_RunAtStartUp->isChecked());
        C().Chk_RunAtStartUp->click();
        EXPECT_FALSE(QFile::exists(AutostartEntry()));
        Close();
    }
    ProgramHome::SetFolder(home.Path());
}

// The recent lists are written at exit with the other settings, and the
// start opens the newest of them.
TEST_F(SettingsTest, TheRecentListsSurviveARestart) {
    UserMaintainsList();
    WriteList({Line("A", "a.csv")});
    WriteList({Line("B", "b.csv")}, "lists/b.txt");
    WriteList({Line("C", "c.csv")}, "lists/c.txt");
    Start();
    for (const char* name : {"lists/b.txt", "lists/c.txt"}) {
        AnswerDialogs({home.File(name)});
        C().mnu_File[1]->trigger();
    }
    const QStringList shown = {home.File("lists/c.txt"), home.File("lists/b.txt"),
                               home.File("files.txt")};
    Close();
    Start();
    QStringList recent;
    for (int i = 1; i <= 5 && !window->Recent().Entry(i).isEmpty(); ++i)
        recent << window->Recent().Entry(i);
    EXPECT_EQ(recent, shown);
    // The first activation opens the newest and shows its first record.
    EXPECT_EQ(ListNames(), QStringList({"C"}));
    EXPECT_EQ(C().Lst_Files->currentRow(), 0);
    EXPECT_EQ(C().Txt_Name->text(), "C");
    EXPECT_EQ(C().Lbl_LoadedFile->text(), home.File("lists/c.txt"));
}

TEST_F(SettingsTest, AListOnlyLoadedIsNotWrittenBackAtExit) {
    UserMaintainsList();
    // Comment lines and the layout of a list the user wrote stay as they are.
    WriteList({"' a list kept by hand", Line("A", "a.csv")});
    const QByteArray before = home.Read("files.txt");
    Start();
    Close();
    EXPECT_EQ(home.Read("files.txt"), before);
    EXPECT_TRUE(unsavedAsked.isEmpty());
}

TEST_F(SettingsTest, ClosingWithChangesAsksSaveDiscardOrCancel) {
    struct Case {
        int answer;
        bool closes;
        const char* written; // the record line's part in files.txt afterwards
    };
    // Save stores the fields on screen too: what the user sees is what is kept.
    const Case cases[] = {{QMessageBox::Save, true, "~Renamed~edited.csv~"},
                          {QMessageBox::Discard, true, "~A~a.csv~"},
                          {QMessageBox::Cancel, false, "~A~a.csv~"}};
    for (const Case& c : cases) {
        UserMaintainsList();
        WriteList({Line("A", "a.csv")});
        Start();
        C().Txt_Name->setText("Renamed");
        window->StoreCurrentRecord();
        C().Txt_FileName->setText("edited.csv");
        unsavedAsked.clear();
        AnswerUnsaved({c.answer});
        EXPECT_EQ(window->close(), c.closes) << c.answer;
        EXPECT_EQ(unsavedAsked, QStringList({"files.txt"})) << c.answer;
        EXPECT_TRUE(home.Read("files.txt").contains(c.written)) << c.answer;
        AnswerUnsaved({QMessageBox::Discard});
        Close();
    }
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
