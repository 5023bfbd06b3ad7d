// The tray icon of an unattended program: when it shows, what its tooltip
// says, its menu, and a close that leaves the program working in the tray.

#include "window_fixture.h"

#include "app/run/run_engine.h"
#include "app/ui/window_scheduler.h"
#include "app/ui/window_tray.h"
#include "support/ini_store.h"
#include "support/program_home.h"

#include <QApplication>
#include <QMessageBox>

namespace quorvel::testing {
namespace {

class WindowTrayTest : public WindowTest {
protected:
    WindowTrayTest() : clockPorts_(Ports{&ports.prompter, &clock, &ports.busy}) {
        WindowTray::SetAvailable(true);
    }
    ~WindowTrayTest() override { WindowTray::SetAvailable(std::nullopt); }

    // A list the user keeps, on a schedule of 3 hours when automatic.
    frm_WebDataClient& StartWith(bool automatic, const QStringList& arguments = {}) {
        UserMaintainsList();
        Setting("Automatic", automatic ? "1" : "0");
        Setting("Interval", "3 hours");
        Setting("NextDownloadDue", "1 Nov 2024 13:00");
        WriteList({Line("Keep", "keep.csv", 0, 0)});
        Start(arguments);
        window->Tray().quitProgram = [this] { ++quits; };
        return *window;
    }
    WindowTray& Tray() { return window->Tray(); }
    QString Stored(const QString& key) {
        return IniStore(ProgramHome::SettingsFile()).Read("General", key, "<missing>");
    }

    ManualClock clock{QDateTime(QDate(2024, 11, 1), QTime(10, 20, 0))};
    int quits = 0;

private:
    ScopedPorts clockPorts_;
};

TEST_F(WindowTrayTest, TheIconShowsWhileTheProgramWorksUnattendedAndATrayExists) {
    struct Case {
        bool tray, scheduledStart, automatic, shown;
    };
    const Case cases[] = {{true, false, false, false},
                          {true, true, false, true},
                          {true, false, true, true},
                          {false, true, true, false}};
    for (const Case& c : cases) {
        WindowTray::SetAvailable(c.tray);
        StartWith(c.automatic, c.scheduledStart ? QStringList{"/S"} : QStringList{});
        EXPECT_EQ(Tray().Shown(), c.shown) << c.tray << c.scheduledStart << c.automatic;
        Close();
    }
    // Choosing automatic runs brings the icon, choosing manual ones takes it away.
    WindowTray::SetAvailable(true);
    StartWith(false);
    C().Opt_Automatic->Button(1)->click();
    EXPECT_TRUE(Tray().Shown());
    C().Opt_Automatic->Button(0)->click();
    EXPECT_FALSE(Tray().Shown());
}

TEST_F(WindowTrayTest, TheTooltipGivesTheDueTimeAndFollowsTheTicks) {
    StartWith(true);
    window->Scheduler().Timer1_Timer();
    EXPECT_EQ(Tray().ToolTip(), "TALU Quorvel\nNext run: 1 Nov 2024 13:00 (in 02:40)");
    // The time left as the window's "Due in:" gives it, after each tick.
    clock.AdvanceSeconds(3600);
    window->Scheduler().Timer1_Timer();
    ASSERT_NE(C().Lbl_Due->text(), "02:40");
    EXPECT_EQ(Tray().ToolTip(), "TALU Quorvel\nNext run: 1 Nov 2024 13:00 (in " +
                                    C().Lbl_Due->text().trimmed() + ")");
    Close();
    StartWith(false, {"/S"});
    EXPECT_EQ(Tray().ToolTip(), "TALU Quorvel\nNo automatic run planned");
}

// Closing the window of automatic runs hides it; the program works on and
// says so once. Quit in the tray's menu ends it the usual way.
TEST_F(WindowTrayTest, CloseKeepsRunningInTheTraySaysSoOnceAndQuitEndsIt) {
    StartWith(true);
    for (int close = 0; close < 2; ++close) {
        EXPECT_FALSE(window->close());
        EXPECT_FALSE(window->isVisible());
        Tray().ShowAction()->trigger();
        EXPECT_TRUE(window->isVisible());
    }
    EXPECT_EQ(Tray().Notices().size(), 1);
    EXPECT_TRUE(Tray().Notices()[0].contains("keeps running in the tray"));
    EXPECT_EQ(Stored("Automatic"), "1"); // nothing written: the program did not end
    EXPECT_EQ(Stored("LastDownload"), "<missing>");

    // Quit with unsaved changes: Cancel keeps everything as it was.
    C().Txt_Name->setText("Edited");
    AnswerUnsaved({QMessageBox::Cancel});
    Tray().QuitAction()->trigger();
    EXPECT_TRUE(window->isVisible());
    EXPECT_EQ(quits, 0);
    AnswerUnsaved({QMessageBox::Save});
    Tray().QuitAction()->trigger();
    EXPECT_FALSE(window->isVisible());
    EXPECT_EQ(quits, 1);
    EXPECT_EQ(Stored("LastDownload"), "never"); // the settings were written
    EXPECT_TRUE(home.Read("files.txt").contains("~Edited~"));
    EXPECT_FALSE(Tray().Shown());
    EXPECT_TRUE(QApplication::quitOnLastWindowClosed());
}

// Without automatic runs a close is the end, also for a start with "/S".
TEST_F(WindowTrayTest, CloseWithoutAutomaticRunsEndsTheProgramAndTakesTheIcon) {
    StartWith(false, {"/S"});
    ASSERT_TRUE(Tray().Shown());
    EXPECT_FALSE(QApplication::quitOnLastWindowClosed());
    EXPECT_TRUE(window->close());
    EXPECT_FALSE(Tray().Shown());
    EXPECT_TRUE(QApplication::quitOnLastWindowClosed()); // the program ends with the window
    EXPECT_TRUE(Tray().Notices().isEmpty());
}

TEST_F(WindowTrayTest, ProcessAllFromTheMenuRunsTheListWhenTheWindowMay) {
    StartWith(true);
    window->close(); // into the tray
    Tray().Menu().aboutToShow();
    ASSERT_TRUE(Tray().ProcessAllAction()->isEnabled());
    Tray().ProcessAllAction()->trigger();
    EXPECT_EQ(C().Lbl_status->text(), "Processed 1 file(s)");
    EXPECT_FALSE(window->isVisible()); // a run does not pull the window forward

    C().Lst_Files->clear(); // nothing to process: the entry follows "Process all"
    window->EnableControls();
    Tray().Menu().aboutToShow();
    EXPECT_FALSE(Tray().ProcessAllAction()->isEnabled());
}

} // namespace
} // namespace quorvel::testing
