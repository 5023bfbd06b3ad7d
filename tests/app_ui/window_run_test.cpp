// Runs started from the window's buttons: the walk through the list, the
// window's states while it goes, "Cancel", a refused close, and failures.

#include "window_fixture.h"

#include "app/run/run_engine.h"
#include "support/date_text.h"

#include <QTimer>

namespace quorvel::testing {
namespace {

class WindowRunTest : public WindowTest {
protected:
    // Runs f at the first moment the run lets events through (after the first entry).
    static void DuringTheRun(std::function<void()> f) { QTimer::singleShot(0, f); }
};

TEST_F(WindowRunTest, DuringARunOnlyCancelIsOfferedAndCloseOnlyStopsTheRun) {
    StartWith({"A", "B", "C"});
    QStringList offered;
    bool closed = true;
    DuringTheRun([&] {
        for (QWidget* w : std::initializer_list<QWidget*>{
                 C().Cmd_Process[0], C().Cmd_Process[1], C().Cmd_Cancel, C().Cmd_Close,
                 C().Lst_Files, C().Txt_Name, C().Cmd_DoFile[kFileDelete]})
            if (w->isEnabled()) offered << w->objectName();
        closed = window->close();
    });
    // Every record downloads from a server that is not there.
    C().Txt_ftpServer->setText(DeadServer());
    C().Cmd_Process[RunEngine::kProcessAll]->click();
    EXPECT_EQ(offered, QStringList{"Cmd_Cancel"});
    EXPECT_FALSE(closed);
    EXPECT_TRUE(window->isVisible());
    // Stopped after the first file, without asking about a failure the user caused.
    EXPECT_EQ(C().Lst_Files->currentRow(), 0);
    EXPECT_TRUE(ports.prompter.shown.empty());
    EXPECT_TRUE(window->Engine().CancelRequested());
    EXPECT_TRUE(C().Cmd_Close->isEnabled() && C().Lst_Files->isEnabled());

    // "Cancel" does the same, and the next run starts afresh.
    DuringTheRun([&] { C().Cmd_Cancel->click(); });
    C().Cmd_Process[RunEngine::kProcessAll]->click();
    EXPECT_EQ(C().Lst_Files->currentRow(), 0);
    EXPECT_EQ(C().Lbl_status->text(), "Processed 1 file(s)");
}

TEST_F(WindowRunTest, AFailedFileIsReportedInTheTimedBoxAndNoStopsTheWalk) {
    StartWith({"A", "B", "C"});
    C().Txt_ftpServer->setText(DeadServer());
    ports.prompter.Script(kAnswerOk);
    ports.prompter.Script(kAnswerNo);
    window->Flags().InMessage = false;
    C().Cmd_Process[RunEngine::kProcessAll]->click();
    ASSERT_EQ(Boxes().size(), 2);
    EXPECT_FALSE(Boxes()[0].isEmpty());
    EXPECT_EQ(Boxes()[0], window->Engine().LastErrorText());
    EXPECT_EQ(Boxes()[1], "Continue ?");
    for (const auto& box : ports.prompter.shown)
        EXPECT_TRUE(box.timed);
    // B was never shown; returning to the window after the boxes does not reload the list.
    EXPECT_EQ(C().Lst_Files->currentRow(), 0);
    EXPECT_TRUE(window->Flags().InMessage);
    EXPECT_TRUE(IsDateText(C().Lbl_LastDownload->text()));
}

TEST_F(WindowRunTest, ProcessFileWorksOnTheRecordShownAndStampsNothing) {
    UserMaintainsList();
    WriteList({Line("Keep", "keep.csv", 0, 0), " 0 ~1~dir~listing.txt~0~0~0~0~0~0~0~~~0",
               Line("Other", "other.csv", 0, 0)});
    Start();
    Select(1);
    C().Cmd_Process[RunEngine::kProcessFile]->click();
    EXPECT_TRUE(home.Read("listing.txt").contains("files.txt"));
    EXPECT_EQ(C().Lst_Files->currentRow(), 1);
    EXPECT_EQ(C().Lbl_LastDownload->text(), "never");
    EXPECT_TRUE(ports.prompter.shown.empty());
}

} // namespace
} // namespace quorvel::testing
