// Editing the file list: new entries, moves, deletion, drops and clearing; and
// the File menu: new, open and save of file lists, and the recent list.

#include "window_fixture.h"

#include <QApplication>
#include <QDropEvent>
#include <QMimeData>
#include <QUrl>

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

} // namespace
} // namespace quorvel::testing
