// Timer1 in the window against a manual clock: the lengths of its ticks, a due
// time restored from the settings, a run under way, and a run of another
// process on the same program home.

#include "window_fixture.h"

#include "app/run/run_engine.h"
#include "app/run/run_lock.h"
#include "app/ui/window_scheduler.h"
#include "support/program_home.h"

#include <QTimer>

#include <functional>
#include <utility>

namespace quorvel::testing {
namespace {

// Runs a hook at the first box: a box of a run is a moment in the middle of it.
class HookedPrompter : public RecordingPrompter {
public:
    int MyMsgBox(const QString& message, int buttons) override {
        if (auto hook = std::exchange(atFirstBox, nullptr)) hook();
        return RecordingPrompter::MyMsgBox(message, buttons);
    }
    int SystemMsgBox(const QString& message, int buttons) override {
        if (auto hook = std::exchange(atFirstBox, nullptr)) hook();
        return RecordingPrompter::SystemMsgBox(message, buttons);
    }
    std::function<void()> atFirstBox;
};

class WindowSchedulerTest : public WindowTest {
protected:
    WindowSchedulerTest() : clockPorts_(Ports{&prompter, &clock, &ports.busy}) {}

    // A list of two local files the user keeps, on a schedule of 3 hours
    // whose due time was stored as the given text.
    frm_WebDataClient& StartScheduled(const QString& storedDue, const QStringList& arguments = {}) {
        UserMaintainsList();
        Setting("Automatic", "1");
        Setting("Interval", "3 hours");
        Setting("NextDownloadDue", storedDue);
        WriteList({Line("A", "a.csv"), Line("B", "b.csv")});
        return Start(arguments);
    }
    void Tick() { window->Scheduler().Timer1_Timer(); }
    QString Last() const { return window->Controls().Lbl_LastDownload->text(); }

    ManualClock clock{QDateTime(QDate(2024, 11, 1), QTime(10, 20, 0))};
    HookedPrompter prompter;

private:
    ScopedPorts clockPorts_;
};

TEST_F(WindowSchedulerTest, FirstTickAfterAMinuteThenEveryTenSeconds) {
    StartScheduled("1 Nov 2024 13:00");
    QTimer& timer = window->Scheduler().Timer1();
    EXPECT_TRUE(timer.isActive());
    EXPECT_EQ(timer.interval(), 60000);
    Tick();
    EXPECT_EQ(timer.interval(), 10000);
    EXPECT_TRUE(window->Scheduler().Ticking());

    // Other lengths come from the clock port, not from the window (long
    // enough that the timer itself never fires during the test).
    Close();
    WaitLengths waits;
    waits.firstTick = std::chrono::milliseconds(45000);
    waits.tick = std::chrono::milliseconds(7000);
    clock.SetWaits(waits);
    StartScheduled("1 Nov 2024 13:00");
    EXPECT_EQ(window->Scheduler().Timer1().interval(), 45000);
    Tick();
    EXPECT_EQ(window->Scheduler().Timer1().interval(), 7000);
}

TEST_F(WindowSchedulerTest, WaitingTicksCountDownAndShowTheTimeLeftWhileMinimised) {
    StartScheduled("1 Nov 2024 13:00");
    Tick();
    EXPECT_EQ(C().Lbl_Now->text(), "1 Nov 2024 10:20:00");
    EXPECT_EQ(C().Lbl_Due->text(), "02:40");
    EXPECT_EQ(Last(), "never");
    EXPECT_EQ(window->Scheduler().NextDue(), QDateTime(QDate(2024, 11, 1), QTime(13, 0)));

    window->setWindowState(Qt::WindowMinimized);
    clock.AdvanceSeconds(10);
    Tick();
    EXPECT_EQ(window->windowTitle(), "Due in: 02:39");
    window->setWindowState(Qt::WindowNoState);
    EXPECT_EQ(window->windowTitle(), frm_WebDataClient::kApplicationTitle);
}

TEST_F(WindowSchedulerTest, ADueTimeStoredInThePastRunsOnTheFirstTickInScheduledMode) {
    StartScheduled("1 Nov 2024 09:00", {"/S"});
    EXPECT_EQ(Last(), "never");
    Tick();
    EXPECT_EQ(Last(), "1 Nov 2024 10:20:00");
    // The run put the due time on the grid from midnight again.
    EXPECT_EQ(C().Lbl_NextDownloadDue->text(), "1 Nov 2024 12:00");
    EXPECT_EQ(C().Lbl_Due->text(), "01:40:00");

    // Until then the ticks only count down.
    clock.AdvanceSeconds(60);
    Tick();
    EXPECT_EQ(Last(), "1 Nov 2024 10:20:00");
    clock.Set(QDateTime(QDate(2024, 11, 1), QTime(12, 0, 0)));
    Tick();
    EXPECT_EQ(Last(), "1 Nov 2024 10:20:00") << "due now is not yet past";
    clock.AdvanceSeconds(10);
    Tick();
    EXPECT_EQ(Last(), "1 Nov 2024 12:00:10");
    EXPECT_EQ(C().Lbl_NextDownloadDue->text(), "1 Nov 2024 15:00");
}

TEST_F(WindowSchedulerTest, TicksDuringARunStartNoSecondRun) {
    StartScheduled("1 Nov 2024 09:00");
    C().Txt_ftpServer->setText(DeadServer());
    window->Flags().InMessage = false; // failures are shown in the timed box
    QString dueDuringRun;
    bool busyDuringRun = false;
    int runsStarted = 0;
    // The tick of the timer starts the run; while its first failure is shown
    // a second tick arrives.
    prompter.atFirstBox = [&] {
        busyDuringRun = window->Engine().IsBusy();
        clock.AdvanceSeconds(20);
        const QString stampBefore = Last();
        Tick();
        runsStarted += Last() != stampBefore ? 1 : 0;
        dueDuringRun = C().Lbl_Due->text();
    };
    const QString dueBefore = C().Lbl_Due->text();
    Tick();
    ASSERT_EQ(C().Lst_Files->count(), 2);
    EXPECT_TRUE(busyDuringRun);
    EXPECT_EQ(runsStarted, 0);
    EXPECT_EQ(dueDuringRun, dueBefore); // a busy tick only refreshes "Now:"
    EXPECT_EQ(C().Lbl_Now->text(), "1 Nov 2024 10:20:20");
    EXPECT_EQ(C().Lbl_NextDownloadDue->text(), "1 Nov 2024 12:00");
}

TEST_F(WindowSchedulerTest, ATickWhileAnotherProcessRunsSkipsAndTriesAgain) {
    StartScheduled("1 Nov 2024 09:00");
    {
        RunLock other(ProgramHome::Folder());
        ASSERT_TRUE(other.TryAcquire());
        Tick();
        EXPECT_EQ(Last(), "never");
        EXPECT_EQ(C().Lbl_NextDownloadDue->text(), "1 Nov 2024 09:00");
        EXPECT_TRUE(prompter.shown.empty()) << "a skipped tick asks nobody";
    }
    clock.AdvanceSeconds(10);
    Tick();
    EXPECT_EQ(Last(), "1 Nov 2024 10:20:10");
}

TEST_F(WindowSchedulerTest, ProcessAllWhileAnotherProcessRunsTellsTheUser) {
    StartScheduled("1 Nov 2024 13:00");
    RunLock other(ProgramHome::Folder());
    ASSERT_TRUE(other.TryAcquire());
    window->Flags().InMessage = false;
    C().Cmd_Process[RunEngine::kProcessAll]->click();
    ASSERT_EQ(prompter.shown.size(), 1u);
    EXPECT_TRUE(prompter.shown[0].message.startsWith("A run is under way elsewhere"))
        << prompter.shown[0].message.toStdString();
    EXPECT_EQ(Last(), "never");
    EXPECT_FALSE(window->Engine().IsBusy());
}

} // namespace
} // namespace quorvel::testing
