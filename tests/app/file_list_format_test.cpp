// Reading and writing single lines of a list file.

#include "app/file_list_format.h"

#include <gtest/gtest.h>

namespace quorvel {
namespace {

TEST(ListLineFormat, NewRecordForAFileInTheApplicationFolderHasTheKnownLine) {
    const FileRecord record = NewFileRecord("rain.csv", kLocationApplication, {});
    EXPECT_EQ(FormatFileRecordLine(record), " 0 ~1~rain.csv~rain.csv~0~0~0~0~0~1~0~~~0");
}

TEST(ListLineFormat, IdentifierIsWrittenWithSignPlaceAndTrailingBlank) {
    EXPECT_EQ(FormatListNumber(12), " 12 ");
    EXPECT_EQ(FormatListNumber(-5), "-5 ");
    FileRecord record;
    record.FileID = 12;
    record.Active = 1;
    EXPECT_TRUE(FormatFileRecordLine(record).startsWith(" 12 ~1~"));
}

TEST(ListLineFormat, LinesThatAreNoRecordsAreSkipped) {
    EXPECT_EQ(ParseFileRecordLine("# my files").kind, ParsedRecordLine::kNotRecord);
    EXPECT_EQ(ParseFileRecordLine("~~~~~").kind, ParsedRecordLine::kNotRecord);
    EXPECT_EQ(ParseFileRecordLine("ID~1~a~b~0~0~0").kind, ParsedRecordLine::kNotRecord);
    EXPECT_EQ(ParseFileRecordLine("12abc~1~a~b~0~0~0").kind, ParsedRecordLine::kNotRecord);
    EXPECT_EQ(ParseFileRecordLine("").kind, ParsedRecordLine::kNotRecord);
    // Five fields are one too few.
    EXPECT_EQ(ParseFileRecordLine("1~1~a~b~0").kind, ParsedRecordLine::kNotRecord);
}

TEST(ListLineFormat, IdentifierWithSurroundingBlanksIsRead) {
    const ParsedRecordLine parsed = ParseFileRecordLine("  77  ~1~a~b~0~1");
    ASSERT_EQ(parsed.kind, ParsedRecordLine::kRecord);
    EXPECT_EQ(parsed.record.FileID, 77);
    EXPECT_EQ(parsed.record.AdminLocationID, 1);
}

TEST(ListLineFormat, SixFieldsLeaveTheRestEmptyOrZero) {
    const ParsedRecordLine parsed = ParseFileRecordLine("3~1~Rain~rain.csv~2~1");
    ASSERT_EQ(parsed.kind, ParsedRecordLine::kRecord);
    const FileRecord& r = parsed.record;
    EXPECT_EQ(r.FileID, 3);
    EXPECT_EQ(r.Name, "Rain");
    EXPECT_EQ(r.FileName, "rain.csv");
    EXPECT_EQ(r.TypeID, 2);
    EXPECT_EQ(r.AdminLocationID, 1);
    EXPECT_EQ(r.UserLocationID, 0);
    EXPECT_EQ(r.Download, 0);
    EXPECT_EQ(r.SpareNumber, 0);
    EXPECT_TRUE(r.Folder.isEmpty());
    EXPECT_TRUE(r.FileDate.isEmpty());
}

TEST(ListLineFormat, NumbersAreReadByTheirLeadingDigitsAndRoundedHalvesToEven) {
    const ParsedRecordLine parsed = ParseFileRecordLine("1~1~n~f~2.5~3.5~7x~ 1 ~0.5~1.5~~d~e~-4");
    ASSERT_EQ(parsed.kind, ParsedRecordLine::kRecord);
    EXPECT_EQ(parsed.record.TypeID, 2);
    EXPECT_EQ(parsed.record.AdminLocationID, 4);
    EXPECT_EQ(parsed.record.UserLocationID, 7);
    EXPECT_EQ(parsed.record.MethodID, 1);
    EXPECT_EQ(parsed.record.Zip, 0);
    EXPECT_EQ(parsed.record.Download, 2);
    EXPECT_EQ(parsed.record.Upload, 0);
    EXPECT_EQ(parsed.record.SpareNumber, -4);
}

TEST(ListLineFormat, TextFieldsKeepTheirBlanks) {
    const ParsedRecordLine parsed =
        ParseFileRecordLine("1~1~ My file ~a b.csv~0~4~4~0~0~1~0~ D:\\x ~~0");
    ASSERT_EQ(parsed.kind, ParsedRecordLine::kRecord);
    EXPECT_EQ(parsed.record.Name, " My file ");
    EXPECT_EQ(parsed.record.Folder, " D:\\x ");
}

TEST(ListLineFormat, OverflowingIdentifierLeavesAWhollyEmptyRecord) {
    const ParsedRecordLine parsed = ParseFileRecordLine("40000~1~Rain~rain.csv~0~1~1~0~0~1~0~~~0");
    EXPECT_EQ(parsed.kind, ParsedRecordLine::kOverflow);
    EXPECT_EQ(parsed.failedField, 0);
    EXPECT_EQ(parsed.record, FileRecord{});
}

TEST(ListLineFormat, OverflowInALaterFieldKeepsTheFieldsBeforeIt) {
    const ParsedRecordLine parsed =
        ParseFileRecordLine("5~1~Rain~rain.csv~0~1~-32769~0~0~1~0~F~D~0");
    EXPECT_EQ(parsed.kind, ParsedRecordLine::kOverflow);
    EXPECT_EQ(parsed.failedField, 6);
    EXPECT_EQ(parsed.record.FileID, 5);
    EXPECT_EQ(parsed.record.FileName, "rain.csv");
    EXPECT_EQ(parsed.record.AdminLocationID, 1);
    EXPECT_EQ(parsed.record.UserLocationID, 0);
    EXPECT_EQ(parsed.record.Download, 0);
    EXPECT_TRUE(parsed.record.Folder.isEmpty());
}

TEST(ListLineFormat, LargestSixteenBitNumbersStillRead) {
    const ParsedRecordLine parsed = ParseFileRecordLine("32767~1~a~b~0~0~0~0~0~0~0~~~-32768");
    ASSERT_EQ(parsed.kind, ParsedRecordLine::kRecord);
    EXPECT_EQ(parsed.record.FileID, 32767);
    EXPECT_EQ(parsed.record.SpareNumber, -32768);
}

TEST(ListText, EveryKindOfLineEndSplitsLines) {
    EXPECT_EQ(SplitListText("a\r\nb\nc\rd\r\n"), (QStringList{"a", "b", "c", "d"}));
    EXPECT_EQ(SplitListText("a\r\n\r\nb"), (QStringList{"a", "", "b"}));
    EXPECT_TRUE(SplitListText("").isEmpty());
}

TEST(ListText, ByteOrderMarkDoesNotHideTheFirstRecord) {
    const QStringList lines = SplitListText("\xEF\xBB\xBF 1 ~1~a~b~0~0\r\n");
    ASSERT_EQ(lines.size(), 1);
    EXPECT_EQ(ParseFileRecordLine(lines.first()).kind, ParsedRecordLine::kRecord);
}

TEST(ListText, TextThatIsNoUtf8IsReadAsLatin1) {
    const QStringList lines = SplitListText(" 1 ~1~M\xFCller~b~0~0\r\n");
    ASSERT_EQ(lines.size(), 1);
    EXPECT_EQ(ParseFileRecordLine(lines.first()).record.Name, QString::fromUtf8("M\u00fcller"));
}

} // namespace
} // namespace quorvel
