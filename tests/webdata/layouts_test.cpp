// The date of a line in each of the nine layouts, and the last date of a file.
#include "support/date_text.h"
#include "support/program_home.h"
#include "webdata/date_texts.h"
#include "webdata/line_dates.h"
#include "webdata/webdata_error.h"
#include "webdata_fixture.h"

#include <QFile>

namespace quorvel::testing {
namespace {

DateValue DateOf(const QString& line, int type) {
    const LineDate d = DateOfLine(line, type);
    EXPECT_TRUE(d.found) << line.toStdString();
    EXPECT_TRUE(d.hasDate) << line.toStdString();
    return d.value;
}

void ExpectSame(DateValue actual, DateValue expected) {
    EXPECT_NEAR(actual, expected, 1e-8)
        << FormatDateIso(actual).toStdString() << " vs " << FormatDateIso(expected).toStdString();
}

class Layouts : public ::testing::Test {
protected:
    TempHome home; // date errors are logged
};

TEST_F(Layouts, DateTimeGeminiAndTeksmartReadTheFirstField) {
    for (int type : {kDateTime, kGemini, kTeksmart})
        ExpectSame(DateOf(QStringLiteral("2006-05-01 10:20:30,12.5"), type),
                   MakeDate(2006, 5, 1, 10, 20, 30));
    ExpectSame(DateOf(QStringLiteral("1 May 2006 10:20:30\t7"), kDateTime),
               MakeDate(2006, 5, 1, 10, 20, 30));
}

TEST_F(Layouts, DateCommaTimeAddsTheTwoFields) {
    const QString line = SystemDateOrder() == NumericDateOrder::DayFirst
                             ? QStringLiteral("01/05/2006,10:20:30,12.5")
                             : QStringLiteral("05/01/2006,10:20:30,12.5");
    ExpectSame(DateOf(line, kDateComma), MakeDate(2006, 5, 1, 10, 20, 30));
    ExpectSame(DateOf(QStringLiteral("2006-05-01,24:00,1"), kDateComma), MakeDate(2006, 5, 2));
}

TEST_F(Layouts, YmdhmCarriesHour24IntoTheNextDay) {
    ExpectSame(DateOf(QStringLiteral("2006,5,1,10,20"), kYmdhm), MakeDate(2006, 5, 1, 10, 20));
    ExpectSame(DateOf(QStringLiteral("2006,5,1,24,0"), kYmdhm), MakeDate(2006, 5, 2));
    ExpectSame(DateOf(QStringLiteral("6,13,1,0,0"), kYmdhm), MakeDate(2007, 1, 1));
}

TEST_F(Layouts, CsiCountsDaysOfTheYearAndHhmm) {
    ExpectSame(DateOf(QStringLiteral("101,2006,121,1020,12.5"), kCsi),
               MakeDate(2006, 5, 1, 10, 20));
    ExpectSame(DateOf(QStringLiteral("101,2006,121,2400,12.5"), kCsi), MakeDate(2006, 5, 2));
}

TEST_F(Layouts, CimisReadsFixedPositions) {
    ExpectSame(DateOf(QStringLiteral("20060501,1020,3.2"), kCimis), MakeDate(2006, 5, 1, 10, 20));
}

TEST_F(Layouts, DecagonCountsFromTheYear2000) {
    ExpectSame(DateOf(QStringLiteral("x,2312,600"), kDecagon), MakeDate(2006, 5, 1, 10, 0));
}

TEST_F(Layouts, NoDateAndUnknownTypesReadNothingButCountAsFound) {
    for (int type : {0, 9, -1}) {
        const LineDate d = DateOfLine(QStringLiteral("2006-05-01 10:20:30,1"), type);
        EXPECT_TRUE(d.found);
        EXPECT_FALSE(d.hasDate);
    }
}

TEST_F(Layouts, ALineOfOneFieldHasNoDateInEveryType) {
    for (int type = 0; type <= 8; ++type)
        EXPECT_FALSE(DateOfLine(QStringLiteral("2006-05-01"), type).found) << type;
}

TEST_F(Layouts, QuotesAreRemovedAndTabsWin) {
    ExpectSame(DateOf(QStringLiteral("\"2006-05-01 10:20:30\",\"12.5\""), kDateTime),
               MakeDate(2006, 5, 1, 10, 20, 30));
    EXPECT_EQ(LineFields(QStringLiteral("a,b\tc,d")), (QStringList{"a,b", "c,d"}));
    EXPECT_EQ(LineFields(QStringLiteral("a  b")), (QStringList{"a", "", "b"}));
}

TEST_F(Layouts, MissingFieldsAndNonNumbersFailCleanly) {
    const QStringList ymdhm = {QStringLiteral("2006,5,1,10"), QStringLiteral("2006,5,x,10,20"),
                               QStringLiteral("2006,5,1,10,99999")};
    for (const QString& line : ymdhm)
        EXPECT_THROW(DateOfLine(line, kYmdhm), WebDataError) << line.toStdString();
    EXPECT_THROW(DateOfLine(QStringLiteral("101,2006,121"), kCsi), WebDataError);
    EXPECT_THROW(DateOfLine(QStringLiteral("2006x501,1020"), kCimis), WebDataError);
    EXPECT_THROW(DateOfLine(QStringLiteral("20060501,10"), kCimis), WebDataError);
    EXPECT_THROW(DateOfLine(QStringLiteral("x,2312"), kDecagon), WebDataError);
    // Unreadable date texts are not errors: they count as 0.
    EXPECT_EQ(DateOf(QStringLiteral("not a date,1"), kDateTime), 0);
}

TEST_F(Layouts, OnlyAnHour24TimeIsAWholeDay) {
    EXPECT_EQ(MyTimeValue(QStringLiteral("24:00")), 1);
    EXPECT_EQ(MyTimeValue(QStringLiteral("24:00:00")), 1);
    ExpectSame(MyTimeValue(QStringLiteral("12:24")), MakeTime(12, 24, 0));
    ExpectSame(DateTimeValue(QStringLiteral("2006-05-24 10:00")), MakeDate(2006, 5, 24, 10));
    ExpectSame(DateTimeValue(QStringLiteral("2024-05-01 10:00:00")), MakeDate(2024, 5, 1, 10));
    ExpectSame(DateTimeValue(QStringLiteral("2006-05-01 24:00")), MakeDate(2006, 5, 2));
    EXPECT_EQ(DateTimeValue(QStringLiteral("0")), 0);
    ExpectSame(DateTimeValue(QStringLiteral("2006-05-01")), MakeDate(2006, 5, 1));
}

TEST_F(Layouts, UnreadableTextsAreLogged) {
    EXPECT_EQ(MyTimeValue(QStringLiteral("later")), 0);
    EXPECT_EQ(MyDateValue(QStringLiteral("someday")), 0);
    QFile log(ProgramHome::LogFile());
    ASSERT_TRUE(log.open(QIODevice::ReadOnly));
    const QByteArray text = log.readAll();
    EXPECT_TRUE(text.contains(":Time error: later"));
    EXPECT_TRUE(text.contains(":Date error:someday"));
}

// Through the object: the last date of a file in each layout.
class FileDates : public WebDataTest {
protected:
    QString LastDate(const QByteArray& content, int type) {
        const QString file = home.Write(QStringLiteral("data.dat"), content);
        return web.LastDateInFile(file, 0, 0, type, 1);
    }
};

TEST_F(FileDates, EveryLayoutGivesTheLastRecordsDate) {
    EXPECT_EQ(LastDate("2006-01-01 00:00:00,1\r\n2006-05-01 10:20:30,12.5\r\n", kDateTime),
              QStringLiteral("1 May 2006 10:20:30"));
    EXPECT_EQ(LastDate("2006-05-01,10:20:30,1\r\n", kDateComma),
              QStringLiteral("1 May 2006 10:20:30"));
    EXPECT_EQ(LastDate("2006,5,1,24,0\r\n", kYmdhm), QStringLiteral("2 May 2006 00:00:00"));
    EXPECT_EQ(LastDate("101,2006,121,1020,12.5\r\n", kCsi), QStringLiteral("1 May 2006 10:20:00"));
    EXPECT_EQ(LastDate("20060501,1020,1\r\n", kCimis), QStringLiteral("1 May 2006 10:20:00"));
    EXPECT_EQ(LastDate("2006-05-01 10:20:30,1\r\n", kGemini),
              QStringLiteral("1 May 2006 10:20:30"));
    EXPECT_EQ(LastDate("x,2312,600\r\n", kDecagon), QStringLiteral("1 May 2006 10:00:00"));
    web.EnableLog(3, 1);
    EXPECT_EQ(LastDate("2006-05-01 10:20:30,1\r\n", kTeksmart),
              QStringLiteral("1 May 2006 10:20:30"));
    EXPECT_TRUE(
        logs.contains(QStringLiteral("D>TekSmart:2006-05-01 10:20:30 -> 2006-05-01 10:20:30")));
    EXPECT_TRUE(prompter.shown.empty());
}

TEST_F(FileDates, LineFeedOnlyFilesAndTrailingEmptyLines) {
    EXPECT_EQ(LastDate("2006-01-01 00:00:00,1\n2006-05-01 10:20:30,2\n\n\n", kDateTime),
              QStringLiteral("1 May 2006 10:20:30"));
    EXPECT_EQ(LastDate("2006-01-01 00:00:00,1\r2006-05-01 10:20:30,2\r", kDateTime),
              QStringLiteral("1 May 2006 10:20:30"));
}

TEST_F(FileDates, NothingToReadGivesADash) {
    EXPECT_EQ(LastDate("", kDateTime), QStringLiteral("-"));
    EXPECT_EQ(LastDate("2006-05-01 10:20:30,1\r\n", kNoDate), QStringLiteral("-"));
    EXPECT_EQ(web.LastDateInFile(home.File(QStringLiteral("absent.dat")), 0, 0, kDateTime, 1),
              QStringLiteral("-"));
    EXPECT_EQ(web.LastDateInFile(home.File(QStringLiteral("data.dat")), 0, 0, kDateTime, 0),
              QStringLiteral("-"));
    EXPECT_EQ(web.LastDateInFile(home.File(QStringLiteral("data.dat")), 0, 7, kDateTime, 1),
              QString());
    EXPECT_GE(busy.pushes, 5);
    EXPECT_EQ(busy.depth, 0);
}

TEST_F(FileDates, ABadLastLineIsReportedAndGivesNoDate) {
    prompter.Script(kAnswerNo);
    EXPECT_EQ(LastDate("2006,5,1,10\r\n", kYmdhm), QStringLiteral("-"));
    ASSERT_EQ(prompter.shown.size(), 1u);
    EXPECT_FALSE(prompter.shown[0].timed);
    EXPECT_EQ(prompter.shown[0].buttons, kButtonsYesNo | kIconQuestion);
    EXPECT_EQ(prompter.shown[0].message,
              QStringLiteral("Subscript out of range\r\nTALUWebData:GetDateFromLine\r\n"
                             "Do you want to debug ?"));
    EXPECT_TRUE(statuses.contains(QStringLiteral("Subscript out of range|GetDateFromLine")));
    EXPECT_EQ(programEnds, 0);

    prompter.Script(kAnswerYes);
    EXPECT_EQ(LastDate("2006,5,x,10,20\r\n", kYmdhm), QStringLiteral("-"));
    EXPECT_EQ(programEnds, 1);
}

} // namespace
} // namespace quorvel::testing
