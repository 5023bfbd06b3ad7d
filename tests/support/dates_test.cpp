#include "support/date_text.h"
#include "support/date_value.h"

#include <gtest/gtest.h>

using namespace quorvel;

TEST(DateValue, CountsDaysFromTheEpochPartsCarryOver) {
    EXPECT_DOUBLE_EQ(MakeDate(1899, 12, 30), 0.0);
    EXPECT_DOUBLE_EQ(MakeDate(1900, 1, 1), 2.0);
    EXPECT_DOUBLE_EQ(MakeDate(2024, 11, 1), 45597.0);
    EXPECT_DOUBLE_EQ(MakeDate(2024, 11, 1, 6, 0, 0), 45597.25);
    EXPECT_DOUBLE_EQ(MakeDate(2024, 13, 1), MakeDate(2025, 1, 1));
    EXPECT_DOUBLE_EQ(MakeDate(2024, 3, 0), MakeDate(2024, 2, 29));
    EXPECT_DOUBLE_EQ(MakeDate(2024, 0, 15), MakeDate(2023, 12, 15));
    EXPECT_DOUBLE_EQ(MakeDate(2024, 12, 31, 24, 0, 0), MakeDate(2025, 1, 1));
    EXPECT_DOUBLE_EQ(MakeDate(2024, 1, 1, 0, 90, 0), MakeDate(2024, 1, 1, 1, 30, 0));
    const DateValue v = MakeDate(2024, 11, 1, 18, 0, 0);
    EXPECT_DOUBLE_EQ(DatePart(v), 45597.0);
    EXPECT_DOUBLE_EQ(TimePart(v), 0.75);
    // Before the epoch the day counts back while the time counts forward.
    const DateValue before = MakeDate(1899, 12, 29, 6, 0, 0);
    EXPECT_DOUBLE_EQ(before, -1.25);
    EXPECT_EQ(FormatDate(before, kPatternIso), QString("1899-12-29 06:00:00"));
}

TEST(DateFormat, EveryPatternTheProgramWritesRoundedToTheSecond) {
    const DateValue v = MakeDate(2024, 3, 5, 7, 8, 9);
    EXPECT_EQ(FormatDate(v, kPatternLong), QString("5 Mar 2024 07:08:09"));
    EXPECT_EQ(FormatDate(v, kPatternDue), QString("5 Mar 2024 07:08"));
    EXPECT_EQ(FormatDate(v, kPatternIso), QString("2024-03-05 07:08:09"));
    EXPECT_EQ(FormatDate(v, kPatternStart), QString("05 March 2024 07:08:09"));
    EXPECT_EQ(FormatDate(v, kPatternHourMinute), QString("07:08"));
    EXPECT_EQ(FormatDate(v, kPatternHms), QString("07:08:09"));
    EXPECT_EQ(FormatDate(v, "HH:MM:Ss"), QString("07:08:09"));
    const DateValue almostMidnight = MakeDate(2024, 12, 31) + (86400.0 - 0.2) / 86400.0;
    EXPECT_EQ(FormatDate(almostMidnight, kPatternIso), QString("2025-01-01 00:00:00"));
}

TEST(DateText, EveryWrittenTextParsesBackToTheSameValue) {
    const char* patterns[] = {kPatternLong, kPatternDue, kPatternIso, kPatternStart};
    for (int month = 1; month <= 12; ++month) {
        const DateValue v = MakeDate(2025, month, 28 - month, month + 10, 59 - month, month);
        for (const char* p : patterns) {
            const QString text = FormatDate(v, p);
            const auto parsed = ParseDateText(text, NumericDateOrder::MonthFirst);
            ASSERT_TRUE(parsed) << text.toStdString();
            EXPECT_EQ(FormatDate(*parsed, p), text);
            EXPECT_DOUBLE_EQ(*parsed, ParseDateText(text, NumericDateOrder::DayFirst).value());
        }
    }
}

TEST(DateText, IsoAndNamedForms) {
    EXPECT_DOUBLE_EQ(DateFromText(u"2024-11-01"), MakeDate(2024, 11, 1));
    EXPECT_DOUBLE_EQ(DateFromText(u"2024-11-01 13:00"), MakeDate(2024, 11, 1, 13, 0, 0));
    EXPECT_DOUBLE_EQ(DateFromText(u"1 Nov 2024"), MakeDate(2024, 11, 1));
    EXPECT_DOUBLE_EQ(DateFromText(u"1 november 2024 10:20:30"), MakeDate(2024, 11, 1, 10, 20, 30));
    EXPECT_DOUBLE_EQ(DateFromText(u"  1 Nov 2024  "), MakeDate(2024, 11, 1));
    EXPECT_DOUBLE_EQ(DateFromText(u"2024-11-01 1:05 pm"), MakeDate(2024, 11, 1, 13, 5, 0));
    EXPECT_DOUBLE_EQ(DateFromText(u"13:30"), MakeTime(13, 30, 0));
}

TEST(DateText, NumericFollowsTheGivenOrder) {
    EXPECT_DOUBLE_EQ(*ParseDateText(u"3/4/2024", NumericDateOrder::DayFirst), MakeDate(2024, 4, 3));
    EXPECT_DOUBLE_EQ(*ParseDateText(u"3/4/2024", NumericDateOrder::MonthFirst),
                     MakeDate(2024, 3, 4));
    EXPECT_DOUBLE_EQ(*ParseDateText(u"25.12.2024 08:00", NumericDateOrder::DayFirst),
                     MakeDate(2024, 12, 25, 8, 0, 0));
    EXPECT_DOUBLE_EQ(*ParseDateText(u"1-2-24", NumericDateOrder::DayFirst), MakeDate(2024, 2, 1));
    EXPECT_DOUBLE_EQ(*ParseDateText(u"1/2/95", NumericDateOrder::DayFirst), MakeDate(1995, 2, 1));
    EXPECT_FALSE(ParseDateText(u"25/12/2024", NumericDateOrder::MonthFirst));
    EXPECT_FALSE(ParseDateText(u"1/2-2024", NumericDateOrder::DayFirst)); // mixed separators
}

TEST(DateText, MalformedTextsAreNoDateAndDayFromTextDropsTheTime) {
    for (const char16_t* bad :
         {u"", u"never", u" -", u"12", u"2024-13-01", u"2024-02-30", u"31 Abc 2024",
          u"1 Nov 2024 25:00", u"1 Nov 2024 10:60", u"2024-11-01x", u"13:00 pm", u"1 No 2024"}) {
        EXPECT_FALSE(IsDateText(bad)) << QString::fromUtf16(bad).toStdString();
        EXPECT_DOUBLE_EQ(DateFromText(bad), 0.0);
        EXPECT_EQ(DayFromText(bad), 0);
    }
    EXPECT_EQ(DayFromText(u"1 Nov 2024 23:59:59"), 45597);
}
