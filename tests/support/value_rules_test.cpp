#include "support/value_rules.h"

#include <gtest/gtest.h>

using namespace quorvel;

TEST(LeadingNumber, ReadsUpToTheFirstCharacterThatCannotContinue) {
    const struct {
        const char16_t* text;
        double value;
    } cases[] = {
        {u"  12.5abc", 12.5},
        {u"-3e2x", -300.0},
        {u"+7", 7.0},
        {u".5", 0.5},
        {u"12e", 12.0},  // exponent without digits ends the number
        {u"1.2.3", 1.2}, // a second point cannot continue it
        {u"--5", 0.0},
        {u"\t\n 1 2\t3", 123.0}, // blanks, tabs and line feeds are skipped
                                 // wherever they stand
        {u"- 4", -4.0},
        {u"4\r5", 4.0}, // a carriage return is not skipped: it ends the
                        // number
        {u"1,5", 1.0},  // the decimal point is "." whatever the locale
    };
    for (const auto& c : cases)
        EXPECT_DOUBLE_EQ(ValDouble(c.text), c.value) << QString::fromUtf16(c.text).toStdString();
}

TEST(LeadingNumber, LongRoundsHalvesToEvenClampsAndGivesZeroForNoNumber) {
    EXPECT_EQ(ValLong(QString("2.5")), 2);
    EXPECT_EQ(ValLong(QString("3.5")), 4);
    EXPECT_EQ(ValLong(QString("-2.5")), -2);
    EXPECT_EQ(ValLong(QString("99999999999")), 2147483647);
    EXPECT_EQ(ValLong(QVariant(7.5)), 8);
    EXPECT_EQ(ValLong(QVariant(true)), -1);
    EXPECT_EQ(ValLong(QStringView(u"abc")), 0);
    EXPECT_EQ(ValLong(QStringView(u"")), 0);
    EXPECT_EQ(ValLong(QVariant()), 0);
    EXPECT_FALSE(IsNonZero(QString("x1")));
    EXPECT_TRUE(IsNonZero(QString(" 1")));
}

TEST(StrictInt16, WholeNumbersHalvesToEvenAndErrors) {
    const struct {
        const char16_t* text;
        std::optional<std::int16_t> value;
    } cases[] = {
        {u" 12 ", 12},  {u"-32768", -32768}, {u"32767", 32767}, {u"1e3", 1000},
        {u"0.5", 0},    {u"1.5", 2},         {u"2.5", 2},       {u"-1.5", -2},
        {u"abc", {}},   {u"", {}},           {u"12abc", {}},    {u"1 2", {}},
        {u"32768", {}}, {u"-32769", {}},     {u"1e400", {}},    {u"32767.5", {}}, // rounds to 32768
    };
    for (const auto& c : cases)
        EXPECT_EQ(ToInt16(c.text), c.value) << QString::fromUtf16(c.text).toStdString();
    EXPECT_EQ(ToInt16(32766.5), std::int16_t{32766});
    EXPECT_FALSE(ToInt32(u"2147483648"));
    EXPECT_EQ(ToInt32(u"40000"), 40000);
}
