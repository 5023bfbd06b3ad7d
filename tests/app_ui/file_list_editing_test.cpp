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

TEST_F(FileListEditingTest, NewWithThreeFilesPutsThemInReverseBeforeTheSelection) {
    StartWith({"Old", "Other"});
    Select(0);
    AnswerDialogs({}); // cancelled: nothing added
    C().Cmd_DoFile[0]->click();
    EXPECT_FALSE(window->Files().ListChanged);
    AnswerDialogs({home.File("A.csv"), home.File("B.csv"), home.File("C.csv")});
    C().Cmd_DoFile[0]->click();
    EXPECT_EQ(ListNames(), QStringList({"C.csv", "B.csv", "A.csv", "Old", "Other"}));
    EXPECT_EQ(C().SSTab1->currentIndex(), 1);
    ASSERT_EQ(window->Files().Count(), 5);
    const FileRecord& c = window->Files().At(0);
    // With no user folders set, the most specific location naming the folder wins.
    EXPECT_TRUE(c.UserLocationID == kLocationUserCurrent && c.AdminLocationID == c.UserLocationID);
    EXPECT_EQ(window->Files().At(3).Name, "Old");
    // The fields show the last one added.
    EXPECT_EQ(C().Lst_Files->currentRow(), 0);
    EXPECT_EQ(C().Txt_Name->text(), "C.csv");
    EXPECT_TRUE(ports.prompter.shown.empty());

    // Written at exit without any further edit.
    Close();
    const QStringList lines = QString::fromUtf8(home.Read("files.txt")).split("\r\n");
    ASSERT_EQ(lines.size(), 6);
    EXPECT_EQ(lines[0], " 0 ~1~C.csv~C.csv~0~3~3~0~0~1~0~~~0");
    EXPECT_TRUE(lines[3].contains("~Old~"));
}

TEST_F(FileListEditingTest, MovesAtBothEnds) {
    StartWith({"A", "B", "C"});
    Select(0);
    window->DoFile(kFileMoveUp); // up from the top: nothing to swap with
    EXPECT_EQ(ListNames(), QStringList({"A", "B", "C"}));
    window->DoFile(kFileMoveDown);
    EXPECT_EQ(ListNames(), QStringList({"B", "A", "C"}));
    EXPECT_EQ(C().Lst_Files->currentRow(), 1);
    EXPECT_EQ(C().Txt_Name->text(), "A");
    Select(2);
    window->DoFile(kFileMoveDown); // down from the bottom: nothing
    EXPECT_EQ(ListNames(), QStringList({"B", "A", "C"}));
    C().Cmd_DoFile[1]->click();
    EXPECT_EQ(ListNames(), QStringList({"B", "C", "A"}));
    EXPECT_EQ(C().Txt_Name->text(), "C");
    // The records moved with their entries.
    EXPECT_EQ(window->Files().At(1).FileName, "c.csv");
    EXPECT_EQ(window->Files().At(2).FileName, "a.csv");
    EXPECT_TRUE(window->Files().ListChanged);
}

TEST_F(FileListEditingTest, DeletingAsksFirstAndSelectsTheNewLastOrNothing) {
    StartWith({"A", "B", "C"});
    Select(2);
    ports.prompter.Script(kAnswerNo);
    C().Cmd_DoFile[3]->click();
    EXPECT_FALSE(window->Files().ListChanged);
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_EQ(ports.prompter.shown[0].message, "Remove 'c.csv' ?");
    EXPECT_FALSE(ports.prompter.shown[0].timed);
    EXPECT_EQ(ports.prompter.shown[0].buttons, kButtonsYesNo | kIconQuestion);
    const QStringList left[] = {{"A", "B", "C"}, {"A", "B"}, {"A"}, {}};
    for (int deleted = 1; deleted <= 3; ++deleted) {
        SCOPED_TRACE(deleted);
        ports.prompter.Script(kAnswerYes);
        C().Cmd_DoFile[3]->click();
        EXPECT_EQ(ListNames(), left[deleted]);
        EXPECT_EQ(window->Files().Count(), 3 - deleted);
        EXPECT_EQ(C().Lst_Files->currentRow(), 2 - deleted);
        EXPECT_EQ(C().Txt_Name->text(), left[deleted].value(left[deleted].size() - 1));
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
    EXPECT_EQ(C().Txt_FileName->text(), "old.csv");
    EXPECT_FALSE(window->Flags().RecordEdited || window->Files().ListChanged);

    EXPECT_TRUE(Drop(C().Lst_Files->viewport(), {home.File("one.dat"), home.File("two.dat")}));
    EXPECT_EQ(ListNames(), QStringList({"two.dat", "one.dat", "Old"}));
    ASSERT_EQ(window->Files().Count(), 3);
    EXPECT_EQ(window->Files().At(1).FileName, "one.dat");
    // The old record was not touched by the fields passing through.
    EXPECT_EQ(window->Files().At(2).FileName, "old.csv");
    EXPECT_TRUE(window->Files().ListChanged);

    // On the file name, the first file replaces the name of the record shown.
    EXPECT_TRUE(Drop(C().Txt_FileName, {"/other/first.csv", home.File("second.csv")}));
    EXPECT_EQ(C().Txt_FileName->text(), "first.csv");
    EXPECT_EQ(C().Opt_UserLocationID->CheckedIndex(), kLocationOther);
    EXPECT_EQ(ListNames(), QStringList({"two.dat", "one.dat", "Old"}));
    EXPECT_TRUE(window->Flags().RecordEdited);
}

TEST_F(FileListEditingTest, ClearEmptiesTheListBoxButKeepsTheRecords) {
    StartWith({"A", "B"});
    Select(1);
    C().Cmd_ClearFiles->click();
    EXPECT_EQ(C().Lst_Files->count(), 0);
    EXPECT_EQ(window->Files().Count(), 2);
    EXPECT_EQ(window->Files().At(1).Name, "B");
    EXPECT_EQ(C().Chk_Active->checkState(), Qt::PartiallyChecked);
    EXPECT_EQ(C().Opt_Download->CheckedIndex(), -1);
    EXPECT_EQ(C().Cmb_TypeID->currentIndex(), -1);
    EXPECT_TRUE(C().Txt_Name->text().isEmpty());
}

class MenusTest : public WindowTest {
protected:
    void SetUp() override {
        UserMaintainsList();
        WriteList({Line("Home list", "h.csv")});
        WriteList({Line("Second", "s.csv")}, "second.txt");
        WriteList({Line("Third", "t.csv")}, "third.txt");
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

TEST_F(MenusTest, OpeningAListMovesItToTheTopOfTheRecentList) {
    Start();
    // Cancelled dialogs change nothing.
    AnswerDialogs({});
    C().mnu_File[1]->trigger();
    C().mnu_File[2]->trigger();
    EXPECT_EQ(dialogsShown, 2);
    EXPECT_EQ(ListNames(), QStringList({"Home list"}));
    EXPECT_EQ(VisibleRecent(), QStringList({home.File("files.txt")}));
    EXPECT_TRUE(C().mnu_RecentFile[0]->isVisible());
    EXPECT_TRUE(ports.prompter.shown.empty());

    Open(home.File("second.txt"));
    EXPECT_EQ(ListNames(), QStringList({"Second"}));
    // The fields of the list that was shown do not leak into the new one.
    EXPECT_EQ(window->Files().At(0).Name, "Second");
    EXPECT_EQ(C().Txt_FileName->text(), "s.csv");
    EXPECT_EQ(C().Lbl_LoadedFile->text(), home.File("second.txt"));
    Open(home.File("third.txt"));
    EXPECT_EQ(VisibleRecent(), QStringList({home.File("third.txt"), home.File("second.txt"),
                                            home.File("files.txt")}));
    // A list opened again moves up without a second entry.
    Open(home.File("second.txt"));
    EXPECT_EQ(VisibleRecent(), QStringList({home.File("second.txt"), home.File("third.txt"),
                                            home.File("files.txt")}));

    // Choosing an entry opens that list.
    C().mnu_RecentFile[3]->trigger();
    EXPECT_EQ(ListNames(), QStringList({"Home list"}));
    EXPECT_EQ(window->Recent().Entry(1), home.File("files.txt"));

    // New empties the list but keeps the recent list.
    C().mnu_File[0]->trigger();
    EXPECT_EQ(C().Lst_Files->count(), 0);
    EXPECT_EQ(window->Files().Count(), 0);
    EXPECT_TRUE(C().Lbl_LoadedFile->text().isEmpty());
    EXPECT_EQ(VisibleRecent().size(), 3);
    EXPECT_FALSE(C().Cmd_Process[0]->isEnabled());
}

TEST_F(MenusTest, SaveWritesTheListUnderTheChosenName) {
    Start();
    Select(0);
    C().Txt_Name->setText("Edited");
    AnswerDialogs({home.File("copy.txt")});
    C().mnu_File[2]->trigger();
    EXPECT_TRUE(home.Read("copy.txt").contains("~Edited~"));
    EXPECT_EQ(C().Lbl_LoadedFile->text(), home.File("copy.txt"));
    EXPECT_EQ(window->Recent().Entry(1), home.File("copy.txt"));
    EXPECT_FALSE(window->Files().ListChanged);
    // Saving an unchanged list under a new name still writes it.
    AnswerDialogs({home.File("again.txt")});
    C().mnu_File[2]->trigger();
    EXPECT_TRUE(home.Read("again.txt").contains("~Edited~"));
}

} // namespace
} // namespace quorvel::testing
