#include "support/texts.h"

#include <gtest/gtest.h>

using namespace quorvel;

TEST(DurationText, DaysHoursAndSecondsAndAlmostAWholeDayIsAWholeDay) {
    EXPECT_EQ(DurationText(1.5), QString("1 day 12:00"));
    EXPECT_EQ(DurationText(2.25), QString("2 days 06:00"));
    EXPECT_EQ(DurationText(3 + (4 * 60 + 5) / 1440.0), QString("3 days 04:05"));
    EXPECT_EQ(DurationText((5 * 3600 + 30 * 60) / 86400.0), QString("05:30"));
    EXPECT_EQ(DurationText((2 * 3600 + 40 * 60) / 86400.0), QString("02:40"));
    EXPECT_EQ(DurationText((3600 + 5 * 60 + 9) / 86400.0), QString("01:05:09"));
    EXPECT_EQ(DurationText(50 / 1440.0), QString("00:50:00"));
    EXPECT_EQ(DurationText(7 / 86400.0), QString("00:00:07"));
    // Floating-point sums that fall a hair short of a day must not read "23:59:60".
    EXPECT_EQ(DurationText(1.0 - 1e-12), QString("1 day 00:00"));
    EXPECT_EQ(DurationText(2 / 24.0 - 1e-12), QString("02:00"));
}

TEST(NumberPatterns, ByteSizesStepAtFiftyThousandThousandsAndPercent) {
    EXPECT_EQ(FormatByteSize(0), QString("0 b"));
    EXPECT_EQ(FormatByteSize(49999), QString("49,999 b"));
    EXPECT_EQ(FormatByteSize(50000), QString("50 Kb"));
    EXPECT_EQ(FormatByteSize(49999999), QString("50,000 Kb"));
    EXPECT_EQ(FormatByteSize(50000000), QString("50 Mb"));
    EXPECT_EQ(FormatByteSize(1073741824), QString("1,074 Mb"));
    EXPECT_EQ(FormatByteSize(50000000000), QString("50 Gb"));
    EXPECT_EQ(FormatByteSize(5000000000000), QString("5,000 Gb"));
    EXPECT_EQ(FormatThousands(1234567.4), QString("1,234,567"));
    EXPECT_EQ(FormatThousands(999), QString("999"));
    EXPECT_EQ(FormatThousands(-1234), QString("-1,234"));
    EXPECT_EQ(FormatPercent(0.256), QString("26%"));
    EXPECT_EQ(FormatPercent(1), QString("100%"));
}

TEST(Align, PadsAndCutsAndStripNullCutsAtTheFirstNul) {
    EXPECT_EQ(AlignRight("ab", 5), QString("   ab"));
    EXPECT_EQ(AlignRight("abcdef", 3), QString("def"));
    EXPECT_EQ(AlignLeft("ab", 5), QString("ab   "));
    EXPECT_EQ(AlignLeft("abcdef", 3), QString("abc"));
    EXPECT_EQ(AlignLeft("ab", -1), QString());
    EXPECT_EQ(StripNull(QString("abc") + QChar(0) + "def"), QString("abc"));
    EXPECT_EQ(StripNull("abc"), QString("abc"));
    EXPECT_EQ(StripNull(QString(QChar(0))), QString());
}
