#include "support/text_lines.h"

#include <gtest/gtest.h>

using namespace quorvel;

TEST(TextLines, EveryLineEndEndsALineAndIsKept) {
    const auto lines = SplitByteLines("a\r\nb\nc\rd\r\r\ne");
    ASSERT_EQ(lines.size(), 6u);
    const char* texts[] = {"a", "b", "c", "d", "", "e"};
    const char* ends[] = {"\r\n", "\n", "\r", "\r", "\r\n", ""};
    for (size_t i = 0; i < lines.size(); ++i) {
        EXPECT_EQ(lines[i].text, QByteArray(texts[i])) << i;
        EXPECT_EQ(lines[i].end, QByteArray(ends[i])) << i;
    }
    EXPECT_TRUE(SplitByteLines("").empty());
}

TEST(TextLines, EachLineIsUtf8WhereValidElseLatin1) {
    EXPECT_TRUE(IsValidUtf8("caf\xc3\xa9"));
    EXPECT_FALSE(IsValidUtf8("caf\xe9"));
    EXPECT_FALSE(IsValidUtf8("\xc3")); // cut in the middle of a character
    EXPECT_EQ(DecodeLine("caf\xc3\xa9"), QString::fromUtf8("caf\u00e9"));
    EXPECT_EQ(DecodeLine("caf\xe9"), QString::fromUtf8("caf\u00e9"));
    EXPECT_EQ(DecodeLine("\xc3\xa9\xe9"), QString::fromUtf8("\u00c3\u00a9\u00e9"));
}
