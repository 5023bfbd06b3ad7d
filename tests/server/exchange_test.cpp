// The client's web-data object against the reference service: log-in, and new
// records of data files in all nine layouts.
#include "service_fixture.h"

namespace quorvel::testing {
namespace {

TEST_F(ServiceTest, UserFoldersOnlyForTheRightPassword) {
    struct Row {
        QString user, password;
        bool ok;
    };
    const Row rows[] = {
        {QStringLiteral("ann"), kAnnPassword, true},
        {QStringLiteral("ann"), QStringLiteral("p&ss word"), false},
        {QStringLiteral("ann"), QString(), false},
        {QStringLiteral("nobody"), kAnnPassword, false},
        {QStringLiteral("ANN"), kAnnPassword, false},
        {QString(), QString(), false},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.user.toStdString() + " / " + row.password.toStdString());
        web.SetUserID(row.user);
        web.SetPassword(row.password);
        EXPECT_EQ(web.Initialise(), row.ok) << web.LastError().toStdString();
        if (!row.ok) {
            EXPECT_EQ(web.LastError(),
                      QStringLiteral("NOK unknown user or wrong password (GETUSERFOLDERS)"));
        }
    }
    web.SetUserID(QStringLiteral("ann"));
    web.SetPassword(kAnnPassword);
    ASSERT_TRUE(web.Initialise());
    EXPECT_EQ(web.UserName(), QStringLiteral("Ann Example"));
    EXPECT_EQ(web.UserFolder(), QStringLiteral("/ann"));
    EXPECT_EQ(web.UserCurrentFolder(), QStringLiteral("current"));
    EXPECT_EQ(web.UserDataFolder(), QStringLiteral("/home/ann/loggers"));
    // A wrong password gets the reason and nothing else.
    EXPECT_EQ(
        Ask(QStringLiteral("user=ann&pwd=x&cmd=GETDATA&file=a.dat&dt=1&filelocation=2&date=0")),
        QStringLiteral("NOK unknown user or wrong password\r\n"));
}

struct Layout {
    int type;
    const char* name;
    QByteArrayList records; // four, dates rising
    const char* lastDate;   // the service's last date as the client shows it
};

QList<Layout> Layouts() {
    const QByteArray dm =
        SystemDateOrder() == NumericDateOrder::DayFirst ? "01/05/2006" : "05/01/2006";
    return {
        {1,
         "DateTime",
         {"2006-05-01 10:00:00,1", "2006-05-01 10:10:00,2", "2006-05-01 10:20:30,3",
          "2006-05-01 10:30:00,4"},
         "1 May 2006 10:30:00"},
        {2,
         "Date,Time",
         {dm + ",10:00:00,1", dm + ",10:10:00,2", dm + ",10:20:00,3", dm + ",24:00,4"},
         "2 May 2006 00:00:00"},
        {3,
         "Y,M,D,H,M",
         {"2006,5,1,10,0,1", "2006,5,1,10,10,2", "2006,5,1,10,20,3", "2006,5,1,24,0,4"},
         "2 May 2006 00:00:00"},
        {4,
         "CSI",
         {"101,2006,121,1000,1", "101,2006,121,1010,2", "101,2006,121,1020,3",
          "101,2006,121,2400,4"},
         "2 May 2006 00:00:00"},
        {5,
         "CIMIS",
         {"20060501,1000,1", "20060501,1010,2", "20060501,1020,3", "20060501,1030,4"},
         "1 May 2006 10:30:00"},
        {6,
         "GEMINI",
         {"1 May 2006 10:00:00\t1", "1 May 2006 10:10:00\t2", "1 May 2006 10:20:00\t3",
          "1 May 2006 10:30:00\t4"},
         "1 May 2006 10:30:00"},
        {7,
         "Decagon",
         {"x,2312,600,1", "x,2312,610,2", "x,2312,620.5,3", "x,2312,630,4"},
         "1 May 2006 10:30:00"},
        {8,
         "Teksmart",
         {"\"2006-05-01 10:00\",\"1\"", "\"2006-05-01 10:10\",\"2\"", "\"2006-05-01 10:20\",\"3\"",
          "\"2006-05-01 10:30\",\"4\""},
         "1 May 2006 10:30:00"},
    };
}

QByteArray Joined(const QByteArrayList& lines, const QByteArray& end, bool finalEnd = true) {
    QByteArray text = lines.join(end);
    return finalEnd ? text + end : text;
}

TEST_F(ServiceTest, NewRecordsInEveryLayoutWithLfAndCrLfFiles) {
    for (const Layout& layout : Layouts()) {
        for (const QByteArray& end : {QByteArray("\n"), QByteArray("\r\n")}) {
            const QString name = QStringLiteral("layout%1-%2.dat").arg(layout.type).arg(end.size());
            SCOPED_TRACE(std::string(layout.name) + (end.size() == 1 ? " LF" : " CR LF"));
            service.PlaceFile(QStringLiteral("ann"), name, Joined(layout.records, end));
            home.Write(name, Joined(layout.records.mid(0, 2), "\r\n"));

            ASSERT_TRUE(web.GetNewData(Local(name), 2, layout.type))
                << web.LastError().toStdString();
            EXPECT_EQ(ReadLocal(name), Joined(layout.records, "\r\n"));
            EXPECT_EQ(web.LastDateInFile(name, 2, 1, layout.type, 1),
                      QLatin1String(layout.lastDate));
            // After the last record the service has nothing newer.
            ASSERT_TRUE(web.GetNewData(Local(name), 2, layout.type))
                << web.LastError().toStdString();
            EXPECT_EQ(web.LastError(), QStringLiteral("No new data"));
            EXPECT_EQ(ReadLocal(name), Joined(layout.records, "\r\n"));
        }
    }
    EXPECT_TRUE(prompter.shown.empty());
}

TEST_F(ServiceTest, MissingLocalFileGetsEveryRecordAlsoWithoutDates) {
    const QByteArrayList lines = {"Site 1 export", "a,1", "b,2", "c,3"};
    for (const int type : {0, 1})
        for (const QByteArray& end : {QByteArray("\n"), QByteArray("\r\n")}) {
            SCOPED_TRACE(std::to_string(type) + (end.size() == 1 ? " LF" : " CR LF"));
            const QString name = QStringLiteral("whole%1-%2.dat").arg(type).arg(end.size());
            service.PlaceFile(QStringLiteral("ann"), name, Joined(lines, end, false));
            ASSERT_TRUE(web.GetNewData(Local(name), 1, type)) << web.LastError().toStdString();
            EXPECT_EQ(ReadLocal(name), Joined(lines, "\r\n"));
            // A file whose last record has no date has no last date at the service.
            EXPECT_EQ(Ask(AsAnn(QStringLiteral("cmd=GETLASTDATE&file=%1&dt=%2&filelocation=1")
                                    .arg(name)
                                    .arg(type))),
                      QStringLiteral("OK 0\r\n"));
        }
}

TEST_F(ServiceTest, FilesAreFoundInTheUserAndSeasonFoldersAndOtherRequestsGetAReason) {
    service.PlaceFile(QStringLiteral("ann"), QStringLiteral("top.dat"),
                      "2006-05-01 10:00:00,1\r\n");
    service.PlaceFile(QStringLiteral("ann"), QStringLiteral("current/season.dat"),
                      "2006-05-01 11:00:00,1\r\n");
    service.PlaceFile(QStringLiteral("bob"), QStringLiteral("bobs.dat"),
                      "2006-05-01 12:00:00,1\r\n");
    const struct {
        const char* query;
        const char* answer;
    } rows[] = {
        {"cmd=GETLASTDATE&file=top.dat&dt=1&filelocation=2", "OK 2006-05-01 10:00:00\r\n"},
        {"cmd=GETLASTDATE&file=top.dat&dt=1&filelocation=0", "OK 2006-05-01 10:00:00\r\n"},
        {"cmd=GETLASTDATE&file=top.dat&dt=1&filelocation=3", "OK 2006-05-01 10:00:00\r\n"},
        {"cmd=GETLASTDATE&file=season.dat&dt=1&filelocation=3", "OK 2006-05-01 11:00:00\r\n"},
        {"cmd=GETLASTDATE&file=season.dat&dt=1&filelocation=1", "OK 2006-05-01 11:00:00\r\n"},
        {"cmd=GETLASTDATE&file=season.dat&dt=1&filelocation=4", "OK 2006-05-01 11:00:00\r\n"},
        {"cmd=GETLASTDATE&file=bobs.dat&dt=1&filelocation=2", "OK NO FILE\r\n"},
        {"cmd=GETLASTDATE&file=top.dat&dt=1&filelocation=5", "NOK unknown file location \"5\"\r\n"},
        {"cmd=GETDATA&file=top.dat&dt=9&filelocation=2&date=0", "NOK unknown data type \"9\"\r\n"},
        {"cmd=GETDATA&file=top.dat&filelocation=2&date=0", "NOK unknown data type \"\"\r\n"},
        {"cmd=GETDATA&file=top.dat&dt=1&filelocation=2&date=soon",
         "NOK unreadable date \"soon\"\r\n"},
        {"cmd=GETDATA&file=top.dat&dt=1&filelocation=2&date=2006-05-01%2009%3A59%3A59",
         "2006-05-01 10:00:00,1\r\nOK\r\n"},
        {"cmd=GETDATA&file=top.dat&dt=1&filelocation=2&date=2006-05-01%2010%3A00%3A00", "OK\r\n"},
        {"cmd=SENDDATA&file=top.dat&dt=1&filelocation=2", "NOK unknown command SENDDATA\r\n"},
        {"cmd=GETFOLDER", "NOK unknown command GETFOLDER\r\n"},
        {"file=top.dat", "NOK no command\r\n"},
        {"cmd=GETUSERFOLDERS&trace=on",
         "php wd.php: GETUSERFOLDERS for ann\r\n/ann|current|/ann/current|/home/ann/loggers|Ann "
         "Example\r\nOK\r\n"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.query);
        EXPECT_EQ(Ask(AsAnn(QLatin1String(row.query))), QLatin1String(row.answer));
    }
    // GETDATA of a file the user does not have says so plainly.
    EXPECT_FALSE(web.GetNewData(Local(QStringLiteral("bobs.dat")), 2, 1));
    EXPECT_EQ(web.LastError(), QStringLiteral("NOK NO FILE bobs.dat (GETDATA)"));
    EXPECT_FALSE(QFile::exists(Local(QStringLiteral("bobs.dat"))));
}

} // namespace
} // namespace quorvel::testing
