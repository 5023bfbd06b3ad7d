#include "support/value_rules.h"

#include <gtest/gtest.h>

using namespace quorvel;

TEST(LeadingNumber, ReadsUpToTheFirstCharacterThatCannotContinue) {
    EXPECT_DOUBLE_EQ(ValDouble(u"  12.5abc"), 12.5);
    EXPECT_DOUBLE_EQ(ValDouble(u"-3e2x"), -300.0);
    EXPECT_DOUBLE_EQ(ValDouble(u"+7"), 7.0);
    EXPECT_DOUBLE_EQ(ValDouble(u".5"), 0.5);
    EXPECT_DOUBLE_EQ(ValDouble(u"12e"), 12.0);  // exponent without digits ends the number
    EXPECT_DOUBLE_EQ(ValDouble(u"1.2.3"), 1.2); // a second point cannot continue it
    EXPECT_DOUBLE_EQ(ValDouble(u"--5"), 0.0);
}

TEST(LeadingNumber, SkipsBlanksTabsAndLineFeedsWhereverTheyStand) {
    EXPECT_DOUBLE_EQ(ValDouble(u"\t\n 1 2\t3"), 123.0);
    EXPECT_DOUBLE_EQ(ValDouble(u"- 4"), -4.0);
    // A carriage return is not skipped: it ends the number.
    EXPECT_DOUBLE_EQ(ValDouble(u"4\r5"), 4.0);
}

TEST(LeadingNumber, NoNumberGivesZero) {
    EXPECT_EQ(ValLong(QStringView(u"abc")), 0);
    EXPECT_EQ(ValLong(QStringView(u"")), 0);
    EXPECT_EQ(ValLong(QVariant()), 0);
    EXPECT_FALSE(IsNonZero(QString("x1")));
    EXPECT_TRUE(IsNonZero(QString(" 1")));
}

TEST(LeadingNumber, IgnoresTheLocaleDecimalComma) {
    // "1,5" reads as 1 whatever the locale: the decimal point is always ".".
    EXPECT_DOUBLE_EQ(ValDouble(u"1,5"), 1.0);
}

TEST(LeadingNumber, LongRoundsHalvesToEvenAndClamps) {
    EXPECT_EQ(ValLong(QString("2.5")), 2);
    EXPECT_EQ(ValLong(QString("3.5")), 4);
    EXPECT_EQ(ValLong(QString("-2.5")), -2);
    EXPECT_EQ(ValLong(QString("99999999999")), 2147483647);
    EXPECT_EQ(ValLong(QVariant(7.5)), 8);
    EXPECT_EQ(ValLong(QVariant(true)), -1);
}

TEST(StrictInt16, AcceptsWholeNumbersWithBlanksAround) {
    EXPECT_EQ(ToInt16(u" 12 "), std::int16_t{12});
    EXPECT_EQ(ToInt16(u"-32768"), std::int16_t{-32768});
    EXPECT_EQ(ToInt16(u"32767"), std::int16_t{32767});
    EXPECT_EQ(ToInt16(u"1e3"), std::int16_t{1000});
}

TEST(StrictInt16, HalvesGoToEven) {
    EXPECT_EQ(ToInt16(u"0.5"), std::int16_t{0});
    EXPECT_EQ(ToInt16(u"1.5"), std::int16_t{2});
    EXPECT_EQ(ToInt16(u"2.5"), std::int16_t{2});
    EXPECT_EQ(ToInt16(u"-1.5"), std::int16_t{-2});
    EXPECT_EQ(ToInt16(32766.5), std::int16_t{32766});
}

TEST(StrictInt16, NonNumbersAndOverflowAreErrors) {
    EXPECT_FALSE(ToInt16(u"abc"));
    EXPECT_FALSE(ToInt16(u""));
    EXPECT_FALSE(ToInt16(u"12abc"));
    EXPECT_FALSE(ToInt16(u"1 2"));
    EXPECT_FALSE(ToInt16(u"32768"));
    EXPECT_FALSE(ToInt16(u"32767.5")); // rounds to 32768
    EXPECT_FALSE(ToInt16(u"-32769"));
    EXPECT_FALSE(ToInt16(u"1e400"));
    EXPECT_FALSE(ToInt32(u"2147483648"));
    EXPECT_EQ(ToInt32(u"40000"), 40000);
}
