// The File menu: new, open and save of file lists, and the recent list.

#include "window_fixture.h"

#include "support/program_home.h"

namespace quorvel::testing {
namespace {

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
    EXPECT_EQ(VisibleRecent(), QStringList({home.File("files.txt")}));
    EXPECT_TRUE(C().mnu_RecentFile[0]->isVisible());

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
}

TEST_F(MenusTest, NewEmptiesTheListButKeepsTheRecentList) {
    Start();
    C().mnu_File[0]->trigger();
    EXPECT_EQ(C().Lst_Files->count(), 0);
    EXPECT_EQ(window->Files().Count(), 0);
    EXPECT_TRUE(C().Lbl_LoadedFile->text().isEmpty());
    EXPECT_EQ(VisibleRecent(), QStringList({home.File("files.txt")}));
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

TEST_F(MenusTest, CancelledDialogsChangeNothing) {
    Start();
    AnswerDialogs({});
    C().mnu_File[1]->trigger();
    C().mnu_File[2]->trigger();
    EXPECT_EQ(dialogsShown, 2);
    EXPECT_EQ(ListNames(), QStringList({"Home list"}));
    EXPECT_EQ(VisibleRecent(), QStringList({home.File("files.txt")}));
    EXPECT_TRUE(ports.prompter.shown.empty());
}

} // namespace
} // namespace quorvel::testing
