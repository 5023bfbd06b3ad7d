// Reading and writing single lines of a list file.

#include "app/file_list_format.h"

#include <gtest/gtest.h>

namespace quorvel {
namespace {

TEST(ListLineFormat, ATildeOrLineBreakInATextCannotShiftTheFields) {
    FileRecord r = NewFileRecord("a~b.csv", kLocationData, {});
    r.Name = "North~\r\nSouth";
    const ParsedRecordLine back = ParseFileRecordLine(FormatFileRecordLine(r));
    EXPECT_TRUE(back.record.Name == "North-  South" && back.record.FileName == "a-b.csv");
    EXPECT_TRUE(back.record.UserLocationID == kLocationData && back.record.Download == 1);
}

TEST(ListLineFormat, ShortLinesBlanksAndFractionsAreRead) {
    const ParsedRecordLine six = ParseFileRecordLine("  77  ~1~ Rain ~rain.csv~2~1");
    ASSERT_EQ(six.kind, ParsedRecordLine::kRecord);
    EXPECT_TRUE(six.record.FileID == 77 && six.record.Name == " Rain ");
    EXPECT_TRUE(six.record.AdminLocationID == 1 && six.record.UserLocationID == 0);
    EXPECT_TRUE(six.record.Folder.isEmpty() && six.record.FileDate.isEmpty());
    // Leading numbers, halves to even.
    const FileRecord r = ParseFileRecordLine("1~1~n~f~2.5~3.5~7x~ 1 ~0.5~1.5~~d~e~-4").record;
    EXPECT_EQ((std::array{r.TypeID, r.AdminLocationID, r.UserLocationID, r.MethodID, r.Zip,
                          r.Download, r.Upload}),
              (std::array<std::int16_t, 7>{2, 4, 7, 1, 0, 2, 0}));
    EXPECT_EQ(r.SpareNumber, -4);
}

TEST(ListLineFormat, OverflowKeepsOnlyTheFieldsReadBeforeIt) {
    const ParsedRecordLine id = ParseFileRecordLine("40000~1~Rain~rain.csv~0~1~1~0~0~1~0~~~0");
    EXPECT_EQ(id.kind, ParsedRecordLine::kOverflow);
    EXPECT_EQ(id.record, FileRecord{});
    const ParsedRecordLine later = ParseFileRecordLine("5~1~R~r.csv~0~1~-32769~0~0~1~0~F~D~0");
    EXPECT_TRUE(later.kind == ParsedRecordLine::kOverflow && later.failedField == 6);
    EXPECT_TRUE(later.record.AdminLocationID == 1 && later.record.Folder.isEmpty());
    const FileRecord edge = ParseFileRecordLine("32767~1~a~b~0~0~0~0~0~0~0~~~-32768").record;
    EXPECT_TRUE(edge.FileID == 32767 && edge.SpareNumber == -32768);
}

TEST(ListText, AnyLineEndSplitsAndTheEncodingIsFoundOut) {
    EXPECT_EQ(SplitListText("a\r\nb\nc\rd\r\n\r\ne"), (QStringList{"a", "b", "c", "d", "", "e"}));
    // A byte-order mark does not hide the first identifier; bytes that are no UTF-8 are Latin-1.
    EXPECT_EQ(SplitListText("\xEF\xBB\xBF 1 ~1"), QStringList{" 1 ~1"});
    EXPECT_EQ(SplitListText("M\xFCller"), QStringList{QString::fromUtf8("M\u00fcller")});
}

} // namespace
} // namespace quorvel
