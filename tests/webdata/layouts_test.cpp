// The date of a line in each of the nine layouts, and the last date of a file.
#include "support/date_text.h"
#include "webdata/date_texts.h"
#include "webdata/line_dates.h"
#include "webdata/webdata_error.h"
#include "webdata_fixture.h"

namespace quorvel::testing {
namespace {

class Layouts : public WebDataTest {
protected:
    QString LastDate(const QByteArray& content, int type) {
        const QString file = home.Write(QStringLiteral("data.dat"), content);
        return web.LastDateInFile(file, 0, 0, type, 1);
    }
};

void ExpectSame(DateValue actual, DateValue expected) {
    EXPECT_NEAR(actual, expected, 1e-8)
        << FormatDateIso(actual).toStdString() << " vs " << FormatDateIso(expected).toStdString();
}

TEST_F(Layouts, EveryLayoutReadsTheDateOfAFilesLastLine) {
    const QString dayMonth = SystemDateOrder() == NumericDateOrder::DayFirst
                                 ? QStringLiteral("01/05/2006")
                                 : QStringLiteral("05/01/2006");
    const struct {
        int type;
        QString line;
        DateValue date;
    } cases[] = {
        {kDateTime, "2006-05-01 10:20:30,12.5", MakeDate(2006, 5, 1, 10, 20, 30)},
        {kDateTime, "1 May 2006 10:20:30\t7", MakeDate(2006, 5, 1, 10, 20, 30)},
        {kDateTime, "\"2006-05-01 10:20:30\",\"12.5\"", MakeDate(2006, 5, 1, 10, 20, 30)},
        {kDateComma, dayMonth + ",10:20:30,12.5", MakeDate(2006, 5, 1, 10, 20, 30)},
        {kDateComma, "2006-05-01,24:00,1", MakeDate(2006, 5, 2)},
        {kYmdhm, "2006,5,1,10,20", MakeDate(2006, 5, 1, 10, 20)},
        {kYmdhm, "2006,5,1,24,0", MakeDate(2006, 5, 2)},
        {kYmdhm, "6,13,1,0,0", MakeDate(2007, 1, 1)},
        {kCsi, "101,2006,121,1020,12.5", MakeDate(2006, 5, 1, 10, 20)},
        {kCsi, "101,2006,121,2400,12.5", MakeDate(2006, 5, 2)},
        {kCimis, "20060501,1020,3.2", MakeDate(2006, 5, 1, 10, 20)},
        {kGemini, "2006-05-01 10:20:30,12.5", MakeDate(2006, 5, 1, 10, 20, 30)},
        {kDecagon, "x,2312,600", MakeDate(2006, 5, 1, 10, 0)},
        {kTeksmart, "2006-05-01 10:20:30,12.5", MakeDate(2006, 5, 1, 10, 20, 30)},
    };
    for (const auto& c : cases) {
        // Lines end at CR alone, LF or CR LF; empty lines at the end are skipped.
        EXPECT_EQ(LastDate("2000-01-01 00:00:00,1\r" + c.line.toUtf8() + "\n\r\n\n", c.type),
                  FormatDateLong(c.date))
            << c.line.toStdString();
    }
    EXPECT_TRUE(prompter.shown.empty());
}

TEST_F(Layouts, MissingFieldsAndNonNumbersFail) {
    const struct {
        int type;
        const char* line;
    } cases[] = {{kYmdhm, "2006,5,1,10"}, {kYmdhm, "2006,5,x,10,20"}, {kYmdhm, "2006,5,1,10,99999"},
                 {kCsi, "101,2006,121"},  {kCimis, "2006x501,1020"},  {kCimis, "20060501,10"},
                 {kDecagon, "x,2312"}};
    for (const auto& c : cases)
        EXPECT_THROW(DateOfLine(QString::fromLatin1(c.line), c.type), WebDataError) << c.line;
    // An unreadable date text is no error: it counts as 0.
    EXPECT_EQ(DateOfLine(QStringLiteral("not a date,1"), kDateTime).value, 0);
    for (int type = 0; type <= 8; ++type)
        EXPECT_FALSE(DateOfLine(QStringLiteral("2006-05-01"), type).found) << type;
    for (int type : {0, 9, -1}) {
        const LineDate d = DateOfLine(QStringLiteral("2006-05-01 10:20:30,1"), type);
        EXPECT_TRUE(d.found && !d.hasDate) << type;
    }
    EXPECT_EQ(LineFields(QStringLiteral("a,b\tc,d")), (QStringList{"a,b", "c,d"}));
    EXPECT_EQ(LineFields(QStringLiteral("a  b")), (QStringList{"a", "", "b"}));
}

TEST_F(Layouts, OnlyAnHour24TimeIsAWholeDayAndUnreadableTextsAreLogged) {
    const struct {
        DateValue (*read)(const QString&);
        const char* text;
        DateValue value;
    } cases[] = {{MyTimeValue, "24:00", 1},
                 {MyTimeValue, "24:00:00", 1},
                 {MyTimeValue, "12:24", MakeTime(12, 24, 0)},
                 {DateTimeValue, "2006-05-24 10:00", MakeDate(2006, 5, 24, 10)},
                 {DateTimeValue, "2024-05-01 10:00:00", MakeDate(2024, 5, 1, 10)},
                 {DateTimeValue, "2006-05-01 24:00", MakeDate(2006, 5, 2)},
                 {DateTimeValue, "2006-05-01", MakeDate(2006, 5, 1)},
                 {DateTimeValue, "0", 0},
                 {MyTimeValue, "later", 0},
                 {MyDateValue, "someday", 0}};
    for (const auto& c : cases)
        ExpectSame(c.read(QString::fromLatin1(c.text)), c.value);
    EXPECT_TRUE(LogBytes().contains(":Time error: later"));
    EXPECT_TRUE(LogBytes().contains(":Date error:someday"));
}

TEST_F(Layouts, AFileWithNothingToReadOrABadLastLineGivesADash) {
    EXPECT_EQ(LastDate("2006-01-01 00:00:00,1\r2006-05-01 10:20:30,2\r", kDateTime),
              QStringLiteral("1 May 2006 10:20:30"));
    EXPECT_EQ(LastDate("", kDateTime), QStringLiteral("-"));
    EXPECT_EQ(LastDate("2006-05-01 10:20:30,1\r\n", kNoDate), QStringLiteral("-"));
    const QString data = home.File(QStringLiteral("data.dat"));
    EXPECT_EQ(web.LastDateInFile(home.File(QStringLiteral("absent.dat")), 0, 0, kDateTime, 1),
              QStringLiteral("-"));
    EXPECT_EQ(web.LastDateInFile(data, 0, 0, kDateTime, 0), QStringLiteral("-"));
    EXPECT_EQ(web.LastDateInFile(data, 0, 7, kDateTime, 1), QString());
    EXPECT_EQ(busy.depth, 0);

    // A bad last line is reported as well.
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
