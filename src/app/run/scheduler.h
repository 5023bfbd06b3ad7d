#pragma once
// The scheduler's arithmetic: the next due time on the interval grid from
// today's midnight, and what one tick of Timer1 does. Pure functions over date
// values and the label texts, so that the window (WindowScheduler, which owns
// Timer1 and the "Now/Next/Last/Due in" labels) and the command-line run
// (which saves the next due time a window would have shown) agree.
//
// How a caller uses it:
//   after a run of all files, or a change of "Manual"/"Automatic every" or
//   of the interval:  labels = CalculateNextProcessDue(automatic, interval, now)
//   every tick:        decision = DecideTick(input)

#include "support/date_value.h"

#include <QString>

#include <cstdint>
#include <optional>

namespace quorvel {

// An interval text as a length of time.
struct IntervalSpan {
    std::int16_t count = 0;
    QString unit;             // "n" minutes, "h" hours, "d" days, ... as ParseInterval gives it
    std::int64_t seconds = 0; // 0 when the unit is no unit of time
};

// nullopt when the text is no interval at all (empty, or not starting with a
// digit). Units: "s" seconds, "n" minutes, "h" hours, "d" days, "w" weeks, in
// either letter case, except that "M" stays months and is refused like any
// other letter (a span of 0 seconds).
std::optional<IntervalSpan> SpanOfInterval(const QString& text);

// True when the text gives a usable length of time.
bool IsUsableInterval(const QString& text);

// The first point of the grid after now. The grid starts at midnight of now's
// day and steps by the span; an interval shorter than a day that does not
// divide the day evenly starts again at the next midnight (5 hours: 00:00,
// 05:00, 10:00, 15:00, 20:00, then 00:00 of the next day).
DateValue NextDueOnGrid(DateValue now, std::int64_t spanSeconds);

// What CalculateNextProcessDue puts into "Next:" and "Due in:".
struct DueLabels {
    enum Kind {
        kManual,    // both show " -"
        kUnchanged, // the interval text is no interval: both stay as they are
        kDue,       // next and dueIn are set
        kBadUnit,   // the interval's unit is no unit of time: reported as an error
    };
    Kind kind = kUnchanged;
    QString next;  // "d mmm yyyy HH:MM"
    QString dueIn; // DurationText of next - now
    DateValue nextValue = 0;
};

inline constexpr const char* kNoDueText = " -";
// The text of the error a unit that is no unit of time gives.
inline constexpr const char* kBadUnitText = "Invalid procedure call or argument";

DueLabels CalculateNextProcessDue(bool automatic, const QString& interval, DateValue now);

// What one tick sees.
struct TickInput {
    bool automatic = false; // "Automatic every" is selected
    bool busy = false;      // a run is under way
    QString nowText;        // "Now:" as the tick has just set it
    QString dueText;        // "Next:"
    QString interval;       // the interval box
    bool minimised = false;
};

// What the tick does after refreshing "Now:".
struct TickDecision {
    bool startRun = false;
    std::optional<QString> dueIn;   // the new "Due in:" text
    std::optional<QString> caption; // the window's caption while minimised
};

// A due time in the past starts a run of all files; otherwise "Due in:" (and
// the caption when minimised) shows what is left. A due text that is not a
// date counts as long past. No run starts while one is under way, nor while
// the interval is unusable: its due time would never move on, and a run would
// start again every ten seconds.
TickDecision DecideTick(const TickInput& input);

} // namespace quorvel
