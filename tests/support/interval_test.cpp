#include "support/interval.h"

#include <gtest/gtest.h>

using namespace quorvel;

namespace {

struct Parsed {
    bool ok;
    int count;
    QString unit;
};

Parsed Parse(const QString& text) {
    std::int16_t count = -99;
    QString unit;
    const bool ok = ParseInterval(text, count, unit);
    return {ok, count, unit};
}

} // namespace

TEST(ParseInterval, ListEntriesAndTheDefault) {
    const struct {
        const char* text;
        int count;
        const char* unit;
    } cases[] = {{"15 minutes", 15, "n"}, {"1 hour", 1, "h"},    {"3 hours", 3, "h"},
                 {"6 hours", 6, "h"},     {"12 hours", 12, "h"}, {"1 day", 1, "d"},
                 {"3 hrs", 3, "h"},       {"15", 15, "h"},       {"10 minutes", 10, "n"},
                 {"30 minutes", 30, "n"}};
    for (const auto& c : cases) {
        const Parsed p = Parse(c.text);
        EXPECT_TRUE(p.ok) << c.text;
        EXPECT_EQ(p.count, c.count) << c.text;
        EXPECT_EQ(p.unit, QString(c.unit)) << c.text;
    }
}

TEST(ParseInterval, RefusesTextsThatDoNotStartWithADigit) {
    EXPECT_FALSE(Parse("").ok);
    EXPECT_FALSE(Parse("abc").ok);
    EXPECT_FALSE(Parse(" 15 minutes").ok);
    EXPECT_FALSE(Parse("-5 hours").ok);
}

TEST(ParseInterval, ZeroBecomesOneAndOtherLettersPassThrough) {
    EXPECT_EQ(Parse("0 hours").count, 1);
    EXPECT_EQ(Parse("5M").unit, QString("M")); // only lower-case "m" means minutes
    EXPECT_EQ(Parse("2 weeks").unit, QString("w"));
    EXPECT_EQ(Parse("12h").unit, QString("h"));
}

TEST(ParseInterval, ACountBeyondSixteenBitsIsRefused) {
    EXPECT_FALSE(Parse("40000 minutes").ok);
}
