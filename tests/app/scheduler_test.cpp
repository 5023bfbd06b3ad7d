// The scheduler's arithmetic: the grid from today's midnight and the decision
// of one tick.

#include "app/run/scheduler.h"
#include "support/date_text.h"
#include "support/date_value.h"

#include <gtest/gtest.h>

#include <ostream>

namespace quorvel {
namespace {

struct DueCase {
    const char* name;
    bool automatic;
    const char* interval;
    const char* now; // "d mmm yyyy HH:MM:SS"
    DueLabels::Kind kind;
    const char* next;  // "Next:" after the computation
    const char* dueIn; // "Due in:" after the computation
};
// The case's name in test listings.
void PrintTo(const DueCase& c, std::ostream* out) {
    *out << c.name;
}

class NextDueTest : public ::testing::TestWithParam<DueCase> {};

TEST_P(NextDueTest, LabelsFollowTheGridFromMidnight) {
    const DueCase& c = GetParam();
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

// Cases are made before main(): times are texts, read when the test runs.
constexpr const char* k1020 = "1 Nov 2024 10:20:00";

INSTANTIATE_TEST_SUITE_P(
    Grid, NextDueTest,
    ::testing::Values(
        DueCase{"Manual", false, "3 hours", k1020, DueLabels::kManual, " -", " -"},
        DueCase{"ThreeHours", true, "3 hours", k1020, DueLabels::kDue, "1 Nov 2024 12:00",
                "01:40:00"},
        DueCase{"ThreeHoursLateEvening", true, "3 hours", "1 Nov 2024 23:10:00", DueLabels::kDue,
                "2 Nov 2024 00:00", "00:50:00"},
        DueCase{"DefaultSettingText", true, "3 hrs", k1020, DueLabels::kDue, "1 Nov 2024 12:00",
                "01:40:00"},
        DueCase{"OneDayAtMidnightIsTheNextMidnight", true, "1 day", "1 Nov 2024 00:00:00",
                DueLabels::kDue, "2 Nov 2024 00:00", "1 day 00:00"},
        DueCase{"OneDayLateInTheDay", true, "1 day", "1 Nov 2024 23:59:59", DueLabels::kDue,
                "2 Nov 2024 00:00", "00:00:01"},
        DueCase{"HalfHours", true, "30 minutes", k1020, DueLabels::kDue, "1 Nov 2024 10:30",
                "00:10:00"},
        DueCase{"OnAGridPointTheNextOne", true, "15 minutes", "1 Nov 2024 10:15:00",
                DueLabels::kDue, "1 Nov 2024 10:30", "00:15:00"},
        DueCase{"FiveHoursBeforeTheLastPoint", true, "5 hours", "1 Nov 2024 19:59:00",
                DueLabels::kDue, "1 Nov 2024 20:00", "00:01:00"},
        DueCase{"FiveHoursRestartsAtMidnight", true, "5 hours", "1 Nov 2024 20:30:00",
                DueLabels::kDue, "2 Nov 2024 00:00", "03:30"},
        DueCase{"TwoDaysFromTodaysMidnight", true, "2 d", k1020, DueLabels::kDue,
                "3 Nov 2024 00:00", "1 day 13:40"},
        DueCase{"EndOfMonth", true, "6 hours", "31 Dec 2024 22:00:00", DueLabels::kDue,
                "1 Jan 2025 00:00", "02:00"},
        DueCase{"NotADigitFirst", true, "abc", k1020, DueLabels::kUnchanged, "", ""},
        DueCase{"Empty", true, "", k1020, DueLabels::kUnchanged, "", ""},
        DueCase{"LeadingBlank", true, " 15 minutes", k1020, DueLabels::kUnchanged, "", ""},
        DueCase{"NoUnitOfTime", true, "3 x", k1020, DueLabels::kBadUnit, "", ""},
        DueCase{"MonthsAreRefused", true, "3 M", k1020, DueLabels::kBadUnit, "", ""}),
    [](const auto& info) { return std::string(info.param.name); });

struct TickCase {
    const char* name;
    bool automatic;
    bool busy;
    const char* now;
    const char* due;
    const char* interval;
    bool minimised;
    bool startRun;
    const char* dueIn;   // "" when the tick leaves "Due in:" alone
    const char* caption; // "" when the tick leaves the caption alone
};
// The case's name in test listings.
void PrintTo(const TickCase& c, std::ostream* out) {
    *out << c.name;
}

class TickTest : public ::testing::TestWithParam<TickCase> {};

TEST_P(TickTest, DecidesRunOrCountdown) {
    const TickCase& c = GetParam();
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

INSTANTIATE_TEST_SUITE_P(
    Ticks, TickTest,
    ::testing::Values(TickCase{"ManualOnlyRefreshesNow", false, false, "1 Nov 2024 10:20:00",
                               "1 Nov 2024 09:00", "3 hours", true, false, "", ""},
                      TickCase{"PastDueStartsARun", true, false, "1 Nov 2024 10:20:00",
                               "1 Nov 2024 09:00", "3 hours", false, true, "", ""},
                      TickCase{"PastDueWhileBusyStartsNone", true, true, "1 Nov 2024 10:20:00",
                               "1 Nov 2024 09:00", "3 hours", false, false, "", ""},
                      TickCase{"EmptyDueReadsAsLongPast", true, false, "1 Nov 2024 10:20:00", "",
                               "3 hours", false, true, "", ""},
                      TickCase{"UnusableIntervalNeverRunsEveryTick", true, false,
                               "1 Nov 2024 10:20:00", "1 Nov 2024 09:00", "3 x", false, false, "",
                               ""},
                      TickCase{"DueNowIsNotYetPast", true, false, "1 Nov 2024 13:00:00",
                               "1 Nov 2024 13:00", "3 hours", false, false, "", ""},
                      TickCase{"DueNowMinimisedShowsZeroLeft", true, false, "1 Nov 2024 13:00:00",
                               "1 Nov 2024 13:00", "3 hours", true, false, "", "Due in: 00:00:00"},
                      TickCase{"WaitingCountsDown", true, false, "1 Nov 2024 10:20:00",
                               "1 Nov 2024 13:00", "3 hours", false, false, "02:40", ""},
                      TickCase{"WaitingMinimisedSetsTheCaption", true, false, "1 Nov 2024 10:20:10",
                               "1 Nov 2024 13:00", "3 hours", true, false, "02:39",
                               "Due in: 02:39"}),
    [](const auto& info) { return std::string(info.param.name); });

} // namespace
} // namespace quorvel
