// The scheduler's arithmetic: the grid from today's midnight and the decision
// of one tick.

#include "app/run/scheduler.h"
#include "support/date_text.h"
#include "support/date_value.h"

#include <gtest/gtest.h>

namespace quorvel {
namespace {

struct DueCase {
    bool automatic;
    const char* interval;
    const char* now; // "d mmm yyyy HH:MM:SS"
    DueLabels::Kind kind;
    const char* next;  // "Next:" after the computation
    const char* dueIn; // "Due in:" after the computation
};
void ExpectDue(const DueCase& c) {
    SCOPED_TRACE(std::string(c.interval) + " at " + c.now);
    const DateValue now = DateFromText(QString::fromUtf8(c.now));
    const DueLabels labels =
        CalculateNextProcessDue(c.automatic, QString::fromUtf8(c.interval), now);
    EXPECT_EQ(labels.kind, c.kind);
    EXPECT_EQ(labels.next.toStdString(), c.next);
    EXPECT_EQ(labels.dueIn.toStdString(), c.dueIn);
    if (c.kind == DueLabels::kDue) {
        // What "Next:" shows must read back as the time that was computed.
        EXPECT_EQ(DateFromText(labels.next), labels.nextValue);
        EXPECT_GT(labels.nextValue, now);
    }
}

TEST(NextDueTest, LabelsFollowTheGridFromMidnight) {
    constexpr const char* k1020 = "1 Nov 2024 10:20:00";
    // "3 hrs" is the default setting's text; months are refused.
    const DueCase cases[] = {
        {false, "3 hours", k1020, DueLabels::kManual, " -", " -"},
        {true, "3 hours", k1020, DueLabels::kDue, "1 Nov 2024 12:00", "01:40:00"},
        {true, "3 hours", "1 Nov 2024 23:10:00", DueLabels::kDue, "2 Nov 2024 00:00", "00:50:00"},
        {true, "3 hrs", k1020, DueLabels::kDue, "1 Nov 2024 12:00", "01:40:00"},
        {true, "1 day", "1 Nov 2024 00:00:00", DueLabels::kDue, "2 Nov 2024 00:00", "1 day 00:00"},
        {true, "1 day", "1 Nov 2024 23:59:59", DueLabels::kDue, "2 Nov 2024 00:00", "00:00:01"},
        {true, "30 minutes", k1020, DueLabels::kDue, "1 Nov 2024 10:30", "00:10:00"},
        {true, "15 minutes", "1 Nov 2024 10:15:00", DueLabels::kDue, "1 Nov 2024 10:30",
         "00:15:00"},
        {true, "5 hours", "1 Nov 2024 19:59:00", DueLabels::kDue, "1 Nov 2024 20:00", "00:01:00"},
        {true, "5 hours", "1 Nov 2024 20:30:00", DueLabels::kDue, "2 Nov 2024 00:00", "03:30"},
        {true, "2 d", k1020, DueLabels::kDue, "3 Nov 2024 00:00", "1 day 13:40"},
        {true, "6 hours", "31 Dec 2024 22:00:00", DueLabels::kDue, "1 Jan 2025 00:00", "02:00"},
        {true, "abc", k1020, DueLabels::kUnchanged, "", ""}, // no digit first
        {true, "", k1020, DueLabels::kUnchanged, "", ""},
        {true, " 15 minutes", k1020, DueLabels::kUnchanged, "", ""},
        {true, "3 x", k1020, DueLabels::kBadUnit, "", ""},
        {true, "3 M", k1020, DueLabels::kBadUnit, "", ""},
    };
    for (const DueCase& c : cases)
        ExpectDue(c);
}

TEST(TickTest, DecidesRunOrCountdown) {
    struct TickCase {
        bool automatic, busy, minimised;
        const char* now;
        const char* due;
        const char* interval;
        bool startRun;
        const char* dueIn;   // "" when the tick leaves "Due in:" alone
        const char* caption; // "" when the tick leaves the caption alone
    };
    constexpr const char* k1020 = "1 Nov 2024 10:20:00";
    constexpr const char* k1300 = "1 Nov 2024 13:00:00";
    constexpr const char* dueAt9 = "1 Nov 2024 09:00";
    constexpr const char* dueAt13 = "1 Nov 2024 13:00";
    // clang-format off
    const TickCase cases[] = {
        {false, false, true,  k1020, dueAt9,  "3 hours", false, "", ""}, // manual: only "Now:"
        {true,  false, false, k1020, dueAt9,  "3 hours", true,  "", ""}, // past due
        {true,  true,  false, k1020, dueAt9,  "3 hours", false, "", ""}, // past due but busy
        {true,  false, false, k1020, "",      "3 hours", true,  "", ""}, // empty: long past
        {true,  false, false, k1020, dueAt9,  "3 x",     false, "", ""}, // unusable interval
        {true,  false, false, k1300, dueAt13, "3 hours", false, "", ""}, // due now: not yet past
        {true,  false, true,  k1300, dueAt13, "3 hours", false, "", "Due in: 00:00:00"},
        {true,  false, false, k1020, dueAt13, "3 hours", false, "02:40", ""},
        {true,  false, true,  "1 Nov 2024 10:20:10", dueAt13, "3 hours", false, "02:39",
         "Due in: 02:39"},
    };
    // clang-format on
    for (const TickCase& c : cases) {
        SCOPED_TRACE(std::string(c.now) + " due " + c.due + (c.busy ? " busy" : "") +
                     (c.minimised ? " minimised" : ""));
        const TickDecision d = DecideTick({.automatic = c.automatic,
                                           .busy = c.busy,
                                           .nowText = QString::fromUtf8(c.now),
                                           .dueText = QString::fromUtf8(c.due),
                                           .interval = QString::fromUtf8(c.interval),
                                           .minimised = c.minimised});
        EXPECT_EQ(d.startRun, c.startRun);
        EXPECT_EQ(d.dueIn.value_or(QString()).toStdString(), c.dueIn);
        EXPECT_EQ(d.caption.value_or(QString()).toStdString(), c.caption);
    }
}

} // namespace
} // namespace quorvel
