#include "support/interval.h"

#include <gtest/gtest.h>

using namespace quorvel;

TEST(ParseInterval, CountAndUnitOrRefusal) {
    const struct {
        const char* text;
        int count;
        const char* unit;
    } cases[] = {
        {"15 minutes", 15, "n"}, {"1 hour", 1, "h"}, {"12 hours", 12, "h"},
        {"1 day", 1, "d"},       {"3 hrs", 3, "h"},  {"15", 15, "h"}, // the default unit
        {"0 hours", 1, "h"},     {"5M", 5, "M"}, // only lower-case "m" means minutes
        {"2 weeks", 2, "w"},     {"12h", 12, "h"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.text);
        std::int16_t count = -99;
        QString unit;
        ASSERT_TRUE(ParseInterval(QString::fromLatin1(c.text), count, unit));
        EXPECT_EQ(count, c.count);
        EXPECT_EQ(unit, QString::fromLatin1(c.unit));
    }
    // Texts that do not start with a digit, and counts beyond sixteen bits.
    for (const char* text : {"", "abc", " 15 minutes", "-5 hours", "40000 minutes"}) {
        std::int16_t count = 0;
        QString unit;
        EXPECT_FALSE(ParseInterval(QString::fromLatin1(text), count, unit)) << text;
    }
}
