// Editing the file list: new entries, moves, deletion, drops and clearing; and
// the File menu: new, open and save of file lists, and the recent list.

#include "window_fixture.h"

#include "app/run/run_engine.h"
#include "support/program_home.h"

#include <QApplication>
#include <QDir>
#include <QDropEvent>
#include <QFile>
#include <QFileInfo>
#include <QMessageBox>
#include <QMimeData>
#include <QTest>
#include <QUrl>

#include <functional>

namespace quorvel::testing {
namespace {

class FileListEditingTest : public WindowTest {
protected:
    // Drags files (with none, text) over a target and drops them; true when accepted.
    static bool Drop(QWidget* target, const QStringList& files, const QString& text = {}) {
        QMimeData data;
        QList<QUrl> urls;
        for (const QString& path : files)
            urls << QUrl::fromLocalFile(path);
        files.isEmpty() ? data.setText(text) : data.setUrls(urls);
        QDragEnterEvent enter(QPoint(5, 5), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QApplication::sendEvent(target, &enter);
        if (!enter.isAccepted()) return false;
        QDropEvent drop(QPointF(5, 5), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QApplication::sendEvent(target, &drop);
        return true;
    }
};

// The order of new records is the list's own (FileListEdit); here the list box
// and the records stay in step through every command.
TEST_F(FileListEditingTest, NewMoveAndDeleteKeepTheListBoxAndTheRecordsInStep) {
    StartWith({"Old", "Other"});
    Select(0);
    AnswerDialogs({}); // cancelled: nothing added
    C().Cmd_DoFile[kFileNew]->click();
    EXPECT_FALSE(window->Files().ListChanged);
    AnswerDialogs({home.File("A.csv"), home.File("B.csv")});
    C().Cmd_DoFile[kFileNew]->click();
    EXPECT_EQ(ListNames(), QStringList({"B.csv", "A.csv", "Old", "Other"}));
    EXPECT_EQ(C().SSTab1->currentIndex(), 1);
    EXPECT_EQ(C().Txt_Name->text(), "B.csv");

    window->DoFile(kFileMoveUp); // up from the top: nothing to swap with
    window->DoFile(kFileMoveDown);
    EXPECT_EQ(ListNames(), QStringList({"A.csv", "B.csv", "Old", "Other"}));
    EXPECT_EQ(C().Lst_Files->currentRow(), 1);
    Select(3);
    window->DoFile(kFileMoveDown); // down from the bottom: nothing
    C().Cmd_DoFile[kFileMoveUp]->click();
    EXPECT_EQ(ListNames(), QStringList({"A.csv", "B.csv", "Other", "Old"}));
    EXPECT_EQ(C().Txt_Name->text(), "Other");
    for (int i = 0; i < 4; ++i)
        EXPECT_EQ(window->Files().At(i).Name, ListNames()[i]);
    EXPECT_TRUE(ports.prompter.shown.empty());

    // Written at exit without any further edit.
    Close();
    const QStringList lines = QString::fromUtf8(home.Read("files.txt")).split("\r\n");
    ASSERT_EQ(lines.size(), 5);
    EXPECT_EQ(lines[0], " 0 ~1~A.csv~A.csv~0~3~3~0~0~1~0~~~0");
}

// A click on the empty part of the list, a Ctrl+click and Ctrl+Space clear the
// selection without moving the current row. The commands then follow what the
// list highlights, never the current row it no longer shows.
TEST_F(FileListEditingTest, RecordCommandsActOnTheHighlightedEntryAndNeverSplitListAndRecords) {
    struct Case {
        const char* what;
        std::function<void(QListWidget*)> disturb;
        int highlighted; // the entry the list shows as selected afterwards
    };
    const auto click = [](QListWidget* list, Qt::KeyboardModifiers modifiers, QPoint at) {
        QTest::mouseClick(list->viewport(), Qt::LeftButton, modifiers, at);
    };
    const Case cases[] = {
        {"click below the entries",
         [&](QListWidget* list) { click(list, {}, QPoint(10, list->viewport()->height() - 3)); },
         -1},
        {"Ctrl+click on the entry",
         [&](QListWidget* list) {
             click(list, Qt::ControlModifier, list->visualItemRect(list->item(1)).center());
         },
         -1},
        {"Ctrl+Space on the entry",
         [](QListWidget* list) { QTest::keyClick(list, Qt::Key_Space, Qt::ControlModifier); }, -1},
    };
    for (const Case& c : cases) {
        StartWith({"A", "B", "C"});
        Select(1);
        c.disturb(C().Lst_Files);
        ASSERT_EQ(window->SelectedRow(), c.highlighted) << c.what;
        if (c.highlighted < 0) {
            // No entry highlighted: no record shown and nothing to move or delete.
            EXPECT_EQ(window->CurrentRecordNumber(), 0) << c.what;
            EXPECT_TRUE(C().Txt_Name->text().isEmpty()) << c.what;
            ExpectEnabled({C().Cmd_DoFile[kFileMoveUp], C().Cmd_DoFile[kFileMoveDown],
                           C().Cmd_DoFile[kFileDelete], C().Cmd_Process[1], C().Txt_Name},
                          false);
        }
        // Whatever the commands still do, the list box and the records agree.
        ports.prompter.Script(kAnswerYes);
        for (const int command : {kFileMoveUp, kFileMoveDown, kFileDelete}) {
            window->DoFile(command);
            QStringList records;
            for (const FileRecord& record : window->Files().Records())
                records << record.Name;
            EXPECT_EQ(ListNames(), records) << c.what << " command " << command;
        }
        EXPECT_EQ(window->Files().Count(), c.highlighted < 0 ? 3 : 2) << c.what;
        AnswerUnsaved({QMessageBox::Discard});
        Close();
    }
}

// "New" also starts a list: on an empty list and with nothing selected the
// new entries go to the end.
TEST_F(FileListEditingTest, NewAddsToAnEmptyListAndAtTheEndWithNothingSelected) {
    StartWith({});
    ASSERT_TRUE(C().Cmd_DoFile[kFileNew]->isEnabled());
    AnswerDialogs({home.File("first.csv")});
    C().Cmd_DoFile[kFileNew]->click();
    EXPECT_EQ(ListNames(), QStringList({"first.csv"}));
    EXPECT_EQ(window->CurrentRecordNumber(), 1);
    C().Lst_Files->clearSelection();
    ASSERT_TRUE(C().Cmd_DoFile[kFileNew]->isEnabled());
    AnswerDialogs({home.File("second.csv")});
    C().Cmd_DoFile[kFileNew]->click();
    EXPECT_EQ(ListNames(), QStringList({"first.csv", "second.csv"}));
    EXPECT_EQ(C().Txt_Name->text(), "second.csv");
}

TEST_F(FileListEditingTest, DeletingAsksFirstAndSelectsTheNewLastOrNothing) {
    StartWith({"A", "B"});
    Select(1);
    ports.prompter.Script(kAnswerNo);
    C().Cmd_DoFile[kFileDelete]->click();
    EXPECT_FALSE(window->Files().ListChanged);
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_EQ(ports.prompter.shown[0].message, "Remove 'b.csv' ?");
    EXPECT_FALSE(ports.prompter.shown[0].timed);
    const QStringList left[] = {{"A"}, {}};
    for (int deleted = 0; deleted < 2; ++deleted) {
        ports.prompter.Script(kAnswerYes);
        C().Cmd_DoFile[kFileDelete]->click();
        EXPECT_EQ(ListNames(), left[deleted]);
        EXPECT_EQ(window->Files().Count(), 1 - deleted);
        EXPECT_EQ(C().Lst_Files->currentRow(), -deleted);
    }
    // The only entry gone: the fields are empty and an empty list is saved at exit.
    EXPECT_TRUE(C().Txt_FileName->text().isEmpty());
    EXPECT_EQ(window->CurrentRecordNumber(), 0);
    Close();
    EXPECT_TRUE(home.Read("files.txt").isEmpty());
}

TEST_F(FileListEditingTest, DroppedFilesBecomeRecordsAndDroppedTextNothing) {
    StartWith({"Old"});
    Select(-1);
    EXPECT_FALSE(Drop(C().Txt_FileName, {home.File("new.csv")}));
    Select(0);
    EXPECT_FALSE(Drop(C().Lst_Files->viewport(), {}, "not a file"));
    EXPECT_FALSE(Drop(C().Txt_FileName, {}, "typed.csv"));
    EXPECT_FALSE(window->Flags().RecordEdited || window->Files().ListChanged);

    EXPECT_TRUE(Drop(C().Lst_Files->viewport(), {home.File("one.dat"), home.File("two.dat")}));
    EXPECT_EQ(ListNames(), QStringList({"two.dat", "one.dat", "Old"}));
    // The old record was not touched by the fields passing through.
    EXPECT_EQ(window->Files().At(2).FileName, "old.csv");

    // On the file name, the first file replaces the name of the record shown.
    EXPECT_TRUE(Drop(C().Txt_FileName, {"/other/first.csv", home.File("second.csv")}));
    EXPECT_EQ(C().Txt_FileName->text(), "first.csv");
    EXPECT_EQ(C().Opt_UserLocationID->CheckedIndex(), kLocationOther);
    EXPECT_EQ(ListNames().size(), 3);
    EXPECT_TRUE(window->Flags().RecordEdited);
}

TEST_F(FileListEditingTest, ClearEmptiesTheListBoxButKeepsTheRecords) {
    StartWith({"A", "B"});
    Select(1);
    C().Cmd_ClearFiles->click();
    EXPECT_EQ(C().Lst_Files->count(), 0);
    EXPECT_EQ(window->Files().At(1).Name, "B");
    EXPECT_EQ(C().Chk_Active->checkState(), Qt::PartiallyChecked);
    EXPECT_EQ(C().Opt_Download->CheckedIndex(), -1);
    EXPECT_TRUE(C().Txt_Name->text().isEmpty());
}

class MenusTest : public WindowTest {
protected:
    void SetUp() override {
        UserMaintainsList();
        WriteList({Line("Home list", "h.csv")});
        WriteList({Line("Second", "s.csv")}, "second.txt");
    }
    QStringList VisibleRecent() {
        QStringList shown;
        for (int i = 1; i <= 5; ++i)
            if (C().mnu_RecentFile[i]->isVisible()) shown << C().mnu_RecentFile[i]->text();
        return shown;
    }
    void Open(const QString& path) {
        AnswerDialogs({path});
        C().mnu_File[1]->trigger();
    }
};

// The recent list's order is its own (RecentFiles); here the menu opens lists.
TEST_F(MenusTest, OpenRecentNewAndSaveWorkOnTheListsTheyName) {
    Start();
    // Cancelled dialogs change nothing.
    AnswerDialogs({});
    C().mnu_File[1]->trigger();
    C().mnu_File[2]->trigger();
    EXPECT_EQ(dialogsShown, 2);
    EXPECT_EQ(ListNames(), QStringList({"Home list"}));
    EXPECT_TRUE(ports.prompter.shown.empty());

    Open(home.File("second.txt"));
    EXPECT_EQ(ListNames(), QStringList({"Second"}));
    // The fields of the list that was shown do not leak into the new one.
    EXPECT_EQ(window->Files().At(0).Name, "Second");
    EXPECT_EQ(C().Lbl_LoadedFile->text(), home.File("second.txt"));
    EXPECT_EQ(VisibleRecent(), QStringList({home.File("second.txt"), home.File("files.txt")}));
    C().mnu_RecentFile[2]->trigger();
    EXPECT_EQ(ListNames(), QStringList({"Home list"}));

    // Saved under a chosen name, an edited list is written there, and an unchanged one too.
    C().Txt_Name->setText("Edited");
    AnswerDialogs({home.File("copy.txt")});
    C().mnu_File[2]->trigger();
    EXPECT_TRUE(home.Read("copy.txt").contains("~Edited~"));
    EXPECT_EQ(window->Recent().Entry(1), home.File("copy.txt"));
    AnswerDialogs({home.File("again.txt")});
    C().mnu_File[2]->trigger();
    EXPECT_TRUE(home.Read("again.txt").contains("~Edited~"));

    // New empties the list but keeps the recent list.
    C().mnu_File[0]->trigger();
    EXPECT_EQ(window->Files().Count(), 0);
    EXPECT_TRUE(C().Lbl_LoadedFile->text().isEmpty());
    EXPECT_EQ(VisibleRecent().size(), 4);
    EXPECT_FALSE(C().Cmd_Process[0]->isEnabled());
}

// New, Open and a recent entry never drop changes without a word: the
// desktop's Save / Discard / Cancel comes first.
TEST_F(MenusTest, ReplacingAChangedListAsksSaveDiscardOrCancel) {
    enum Command { kNew, kOpen, kRecent };
    struct Case {
        Command command;
        int answer;
        bool replaced; // the command went on
        bool written;  // the edit reached files.txt
    };
    const Case cases[] = {
        {kNew, QMessageBox::Save, true, true},      {kNew, QMessageBox::Discard, true, false},
        {kNew, QMessageBox::Cancel, false, false},  {kOpen, QMessageBox::Save, true, true},
        {kOpen, QMessageBox::Discard, true, false}, {kOpen, QMessageBox::Cancel, false, false},
        {kRecent, QMessageBox::Save, true, true},   {kRecent, QMessageBox::Cancel, false, false},
    };
    for (const Case& c : cases) {
        const std::string what =
            "command " + std::to_string(c.command) + " answer " + std::to_string(c.answer);
        // Each case from the same start (the exit writes the recent list).
        QFile::remove(ProgramHome::SettingsFile());
        SetUp();
        Setting("File2", home.File("second.txt"));
        Start();
        C().Txt_Name->setText("Edited");
        unsavedAsked.clear();
        AnswerUnsaved({c.answer, QMessageBox::Discard}); // the second for the close
        switch (c.command) {
        case kNew:
            C().mnu_File[0]->trigger();
            break;
        case kOpen:
            Open(home.File("second.txt"));
            break;
        case kRecent:
            C().mnu_RecentFile[2]->trigger();
            break;
        }
        EXPECT_EQ(unsavedAsked, QStringList({"files.txt"})) << what;
        const QStringList expected = !c.replaced         ? QStringList({"Edited"})
                                     : c.command == kNew ? QStringList()
                                                         : QStringList({"Second"});
        EXPECT_EQ(ListNames(), expected) << what;
        EXPECT_EQ(home.Read("files.txt").contains("~Edited~"), c.written) << what;
        Close();
    }
}

// A new list has no file yet: closing asks for a name rather than drop it.
TEST_F(MenusTest, ClosingWithANewListAsksForItsNameAndStaysOpenWithoutOne) {
    for (const bool named : {true, false}) {
        Start();
        C().mnu_File[0]->trigger();
        AnswerDialogs({home.File("new.csv")});
        C().Cmd_DoFile[kFileNew]->click();
        // A run writes the list when it ends; without a name it waits for one.
        ports.prompter.Script(kAnswerOk);
        C().Cmd_Process[RunEngine::kProcessAll]->click();
        for (const auto& box : ports.prompter.shown)
            EXPECT_FALSE(box.message.contains("No file name")) << box.message.toStdString();
        ports.prompter.shown.clear();
        unsavedAsked.clear();
        AnswerUnsaved({QMessageBox::Save});
        AnswerDialogs(named ? QStringList({home.File("season.txt")}) : QStringList());
        EXPECT_EQ(window->close(), named);
        EXPECT_EQ(unsavedAsked, QStringList({""})); // a list without a name
        if (named) {
            EXPECT_TRUE(home.Read("season.txt").contains("~new.csv~new.csv~"));
            window.reset();
            // The next start opens it: the name went to the recent list.
            Start();
            EXPECT_EQ(ListNames(), QStringList({"new.csv"}));
            EXPECT_EQ(C().Lbl_LoadedFile->text(), home.File("season.txt"));
        } else {
            EXPECT_TRUE(window->isVisible());
            EXPECT_EQ(ListNames(), QStringList({"new.csv"}));
            EXPECT_TRUE(ports.prompter.shown.empty());
            AnswerUnsaved({QMessageBox::Discard});
        }
        Close();
    }
}

// Started with "/S" nobody may be there to answer: the close saves without a
// question, and a list without a name goes to a file of its own in the home.
TEST_F(MenusTest, AnUnattendedCloseSavesWithoutAskingAndNeverDropsANewList) {
    Start({"/S"});
    C().mnu_File[0]->trigger();
    AnswerDialogs({home.File("new.csv")});
    C().Cmd_DoFile[kFileNew]->click();
    EXPECT_TRUE(window->close());
    EXPECT_TRUE(unsavedAsked.isEmpty());
    const QStringList rescued = QDir(home.Path()).entryList({"files-unsaved-*.txt"});
    ASSERT_EQ(rescued.size(), 1);
    EXPECT_TRUE(home.Read(rescued[0]).contains("~new.csv~new.csv~"));
    EXPECT_TRUE(
        home.Read(QFileInfo(ProgramHome::LogFile()).fileName()).contains(rescued[0].toUtf8()));
}

// File > Save writes the list to its own file; the keys of the File menu and
// Delete on the list work as on any desktop.
TEST_F(MenusTest, SaveAndTheUsualKeysWork) {
    Start();
    window->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(window.get()));
    C().Txt_Name->setText("Edited");
    QTest::keyClick(window.get(), Qt::Key_S, Qt::ControlModifier);
    EXPECT_TRUE(home.Read("files.txt").contains("~Edited~h.csv~"));
    EXPECT_FALSE(window->Files().ListChanged);

    AnswerDialogs({home.File("second.txt")});
    QTest::keyClick(window.get(), Qt::Key_O, Qt::ControlModifier);
    EXPECT_EQ(ListNames(), QStringList({"Second"}));
    ports.prompter.Script(kAnswerYes);
    C().Lst_Files->setFocus();
    QTest::keyClick(C().Lst_Files, Qt::Key_Delete);
    EXPECT_TRUE(ListNames().isEmpty());
    EXPECT_EQ(ports.prompter.shown.size(), 1u);
    QTest::keyClick(C().Lst_Files, Qt::Key_Delete); // nothing left to delete: no question
    EXPECT_EQ(ports.prompter.shown.size(), 1u);
    AnswerUnsaved({QMessageBox::Discard});
    QTest::keyClick(window.get(), Qt::Key_N, Qt::ControlModifier);
    EXPECT_TRUE(C().Lbl_LoadedFile->text().isEmpty());

    C().mnu_Help[1]->trigger();
    ASSERT_EQ(infoShown.size(), 1);
    EXPECT_TRUE(infoShown[0].contains(QStringLiteral("Quorvel " QUORVEL_VERSION)))
        << infoShown[0].toStdString();
}

} // namespace
} // namespace quorvel::testing
