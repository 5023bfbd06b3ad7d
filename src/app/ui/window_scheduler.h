#pragma once
// The window's scheduler: Timer1, the "Manual"/"Automatic every" choice, the
// interval box and the "Now/Next/Last/Due in" labels. The arithmetic is the
// core's (app/run/scheduler.h); this object reads and writes the controls.
//
// Timer1 takes its lengths from the clock port (CurrentClock().Waits(): the
// first tick after start-up, then every tick), so tests shorten them or call
// Timer1_Timer() themselves with a manual clock.
//
// For others who show the schedule (the tray icon): NextDue() is the due time
// the window works to, DueIn() the "Due in:" text, and ScheduleChanged() is
// emitted whenever either may have changed (every tick, every new due time).

#include <QDateTime>
#include <QObject>
#include <QTimer>

#include <optional>

namespace quorvel {

class frm_WebDataClient;

class WindowScheduler : public QObject {
    Q_OBJECT
public:
    explicit WindowScheduler(frm_WebDataClient& window);

    // Arms Timer1 for the first tick after start-up (the window's load).
    void Start();
    void Timer1_Timer();
    void CalculateNextProcessDue();

    // The due time of the next automatic run of all files; nullopt under
    // "Manual" or while "Next:" holds no date.
    std::optional<QDateTime> NextDue() const;
    // The "Due in:" text (" -" under "Manual").
    QString DueIn() const;
    bool IsAutomatic() const;

    QTimer& Timer1() { return timer_; }
    // True once the first tick has run to its end.
    bool Ticking() const { return ticking_; }

Q_SIGNALS:
    void ScheduleChanged();

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    void ConnectHandlers();
    void Opt_Automatic_Click();
    void Cmb_interval_Change();
    void ShowCaption(const QString& caption);

    frm_WebDataClient& window_;
    QTimer timer_;
    bool ticking_ = false;
    bool captionShown_ = false; // the caption shows the time left, not the title
};

} // namespace quorvel
