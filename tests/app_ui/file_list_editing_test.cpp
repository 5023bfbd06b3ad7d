// Editing the file list: new entries, moves, deletion, drops and clearing.

#include "window_fixture.h"

#include <QApplication>
#include <QDropEvent>
#include <QMimeData>
#include <QUrl>

namespace quorvel::testing {
namespace {

class FileListEditingTest : public WindowTest {
protected:
    void StartWith(const QStringList& names) {
        UserMaintainsList();
        QStringList lines;
        for (const QString& name : names)
            lines << Line(name, name.toLower() + ".csv");
        WriteList(lines);
        Start();
    }
    // Drags data over a target and drops it; true when the drag was accepted.
    bool Drop(QWidget* target, QMimeData* data) {
        QDragEnterEvent enter(QPoint(5, 5), Qt::CopyAction, data, Qt::LeftButton, Qt::NoModifier);
        QApplication::sendEvent(target, &enter);
        const bool accepted = enter.isAccepted();
        if (accepted) {
            QDropEvent drop(QPointF(5, 5), Qt::CopyAction, data, Qt::LeftButton, Qt::NoModifier);
            QApplication::sendEvent(target, &drop);
        }
        return accepted;
    }
    QMimeData* Files(const QStringList& paths) {
        auto* data = new QMimeData;
        QList<QUrl> urls;
        for (const QString& path : paths)
            urls << QUrl::fromLocalFile(path);
        data->setUrls(urls);
        mime.reset(data);
        return data;
    }
    QMimeData* Text(const QString& text) {
        auto* data = new QMimeData;
        data->setText(text);
        mime.reset(data);
        return data;
    }
    std::unique_ptr<QMimeData> mime;
};

TEST_F(FileListEditingTest, NewWithThreeFilesPutsThemInReverseBeforeTheSelection) {
    StartWith({"Old", "Other"});
    Select(0);
    AnswerDialogs({home.File("A.csv"), home.File("B.csv"), home.File("C.csv")});
    C().Cmd_DoFile[0]->click();
    EXPECT_EQ(ListNames(), QStringList({"C.csv", "B.csv", "A.csv", "Old", "Other"}));
    EXPECT_EQ(C().SSTab1->currentIndex(), 1);
    ASSERT_EQ(window->Files().Count(), 5);
    const FileRecord& c = window->Files().At(0);
    EXPECT_EQ(c.FileName, "C.csv");
    // With no user folders set, the most specific location naming the folder wins.
    EXPECT_EQ(c.UserLocationID, kLocationUserCurrent);
    EXPECT_EQ(c.AdminLocationID, kLocationUserCurrent);
    EXPECT_EQ(c.Download, kDownloadAlways);
    EXPECT_EQ(c.Upload, kUploadNever);
    EXPECT_EQ(c.Active, 1);
    EXPECT_EQ(window->Files().At(3).Name, "Old");
    // The fields show the last one added.
    EXPECT_EQ(C().Lst_Files->currentRow(), 0);
    EXPECT_EQ(C().Txt_Name->text(), "C.csv");

    // Written at exit without any further edit.
    Close();
    const QString saved = QString::fromUtf8(home.Read("files.txt"));
    const QStringList lines = saved.split("\r\n", Qt::SkipEmptyParts);
    ASSERT_EQ(lines.size(), 5);
    EXPECT_EQ(lines[0], " 0 ~1~C.csv~C.csv~0~3~3~0~0~1~0~~~0");
    EXPECT_TRUE(lines[3].contains("~Old~"));
}

TEST_F(FileListEditingTest, CancelledNewAddsNothing) {
    StartWith({"Old"});
    Select(0);
    AnswerDialogs({});
    C().Cmd_DoFile[0]->click();
    EXPECT_EQ(ListNames(), QStringList({"Old"}));
    EXPECT_FALSE(window->Files().ListChanged);
    EXPECT_TRUE(ports.prompter.shown.empty());
}

TEST_F(FileListEditingTest, MovesAtBothEnds) {
    StartWith({"A", "B", "C"});
    Select(0);
    window->DoFile(1); // up from the top: nothing to swap with
    EXPECT_EQ(ListNames(), QStringList({"A", "B", "C"}));
    window->DoFile(2);
    EXPECT_EQ(ListNames(), QStringList({"B", "A", "C"}));
    EXPECT_EQ(C().Lst_Files->currentRow(), 1);
    EXPECT_EQ(C().Txt_Name->text(), "A");
    Select(2);
    window->DoFile(2); // down from the bottom: nothing
    EXPECT_EQ(ListNames(), QStringList({"B", "A", "C"}));
    C().Cmd_DoFile[1]->click();
    EXPECT_EQ(ListNames(), QStringList({"B", "C", "A"}));
    EXPECT_EQ(C().Txt_Name->text(), "C");
    // The records moved with their entries.
    EXPECT_EQ(window->Files().At(1).FileName, "c.csv");
    EXPECT_EQ(window->Files().At(2).FileName, "a.csv");
    EXPECT_TRUE(window->Files().ListChanged);
}

TEST_F(FileListEditingTest, DeletingTheLastSelectsTheNewLast) {
    StartWith({"A", "B", "C"});
    Select(2);
    ports.prompter.Script(kAnswerYes);
    C().Cmd_DoFile[3]->click();
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_EQ(ports.prompter.shown[0].message, "Remove 'c.csv' ?");
    EXPECT_FALSE(ports.prompter.shown[0].timed);
    EXPECT_EQ(ports.prompter.shown[0].buttons, kButtonsYesNo | kIconQuestion);
    EXPECT_EQ(ListNames(), QStringList({"A", "B"}));
    EXPECT_EQ(C().Lst_Files->currentRow(), 1);
    EXPECT_EQ(C().Txt_Name->text(), "B");
    EXPECT_EQ(window->Files().Count(), 2);
}

TEST_F(FileListEditingTest, AnsweringNoKeepsTheEntry) {
    StartWith({"A", "B"});
    Select(0);
    ports.prompter.Script(kAnswerNo);
    C().Cmd_DoFile[3]->click();
    EXPECT_EQ(ListNames(), QStringList({"A", "B"}));
    EXPECT_EQ(window->Files().Count(), 2);
    EXPECT_FALSE(window->Files().ListChanged);
}

TEST_F(FileListEditingTest, DeletingTheOnlyEntryEmptiesListAndFields) {
    StartWith({"A"});
    Select(0);
    ports.prompter.Script(kAnswerYes);
    C().Cmd_DoFile[3]->click();
    EXPECT_EQ(C().Lst_Files->count(), 0);
    EXPECT_EQ(window->Files().Count(), 0);
    EXPECT_TRUE(C().Txt_Name->text().isEmpty());
    EXPECT_TRUE(C().Txt_FileName->text().isEmpty());
    EXPECT_EQ(window->CurrentRecordNumber(), 0);
    // Saved at exit: an empty list file.
    Close();
    EXPECT_TRUE(home.Read("files.txt").isEmpty());
}

TEST_F(FileListEditingTest, DroppedFilesBecomeRecordsInReverseOrder) {
    StartWith({"Old"});
    Select(0);
    QWidget* list = C().Lst_Files->viewport();
    EXPECT_TRUE(Drop(list, Files({home.File("one.dat"), home.File("two.dat")})));
    EXPECT_EQ(ListNames(), QStringList({"two.dat", "one.dat", "Old"}));
    EXPECT_EQ(window->Files().Count(), 3);
    EXPECT_EQ(window->Files().At(1).FileName, "one.dat");
    // The old record was not touched by the fields passing through.
    EXPECT_EQ(window->Files().At(2).FileName, "old.csv");
    EXPECT_TRUE(window->Files().ListChanged);
}

TEST_F(FileListEditingTest, DroppedTextIsRefused) {
    StartWith({"Old"});
    Select(0);
    EXPECT_FALSE(Drop(C().Lst_Files->viewport(), Text("not a file")));
    EXPECT_FALSE(Drop(C().Txt_FileName, Text("typed.csv")));
    EXPECT_EQ(ListNames(), QStringList({"Old"}));
    EXPECT_EQ(C().Txt_FileName->text(), "old.csv");
    EXPECT_FALSE(window->Files().ListChanged);
}

TEST_F(FileListEditingTest, FileDroppedOnTheFileNameReplacesIt) {
    StartWith({"Old", "Next"});
    Select(-1);
    EXPECT_FALSE(Drop(C().Txt_FileName, Files({home.File("new.csv")})));
    Select(0);
    EXPECT_TRUE(Drop(C().Txt_FileName, Files({"/other/first.csv", home.File("second.csv")})));
    EXPECT_EQ(C().Txt_FileName->text(), "first.csv");
    EXPECT_EQ(C().Opt_UserLocationID->CheckedIndex(), kLocationOther);
    EXPECT_EQ(ListNames(), QStringList({"Old", "Next"}));
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

} // namespace
} // namespace quorvel::testing
