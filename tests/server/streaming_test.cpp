// GETDATA over files that are large or oddly made: the client receives exactly
// the records after its last date, whatever the file's line ends.
#include "service_fixture.h"

namespace quorvel::testing {
namespace {

// Records one minute apart from 20 February 2008, so a leap day is among them.
QByteArray Record(int minute) {
    const QDateTime t = QDateTime(QDate(2008, 2, 20), QTime(0, 0)).addSecs(minute * 60LL);
    return t.toString(QStringLiteral("yyyy-MM-dd HH:mm:ss")).toLatin1() + ',' +
           QByteArray::number(minute);
}

TEST_F(ServiceTest, LargeFileGivesTheRecordsAfterTheLocalLastDateInFileOrder) {
    // 30,000 records (about 800 KB, several blocks of the service's reader),
    // some separated by tabs, with one late-arriving older record and one
    // unreadable date among them.
    QByteArrayList records;
    for (int m = 0; m < 30000; ++m)
        records << (m >= 27000 && m < 27100 ? Record(m).replace(',', '\t') : Record(m));
    records.insert(25000, Record(5));                 // older than the local copy: not new
    records.insert(26000, "2008-02-30 10:00:00,bad"); // no date: not new
    QByteArray file = records.join("\r\n") + "\r\n";
    service.PlaceFile(QStringLiteral("ann"), QStringLiteral("big.dat"), file);
    QByteArrayList local = records.mid(0, 20000);
    home.Write(QStringLiteral("big.dat"), local.join("\r\n") + "\r\n");

    ASSERT_TRUE(web.GetNewData(Local(QStringLiteral("big.dat")), 2, 1))
        << web.LastError().toStdString();
    QByteArrayList expected = records;
    expected.removeAt(26000);
    expected.removeAt(25000);
    EXPECT_EQ(ReadLocal(QStringLiteral("big.dat")), expected.join("\r\n") + "\r\n");
}

TEST_F(ServiceTest, RecordsReachTheClientWhateverTheFileLooksLike) {
    const QByteArray a = "2006-05-01 10:00:00,1", b = "2006-05-01 10:10:00,2",
                     c = "2006-05-01 10:20:00,3";
    const QByteArray longLine = "2006-05-01 10:05:00," + QByteArray(1100000, 'x');
    struct Row {
        const char* what;
        QByteArray file;
        QByteArray received; // after a local copy holding record a
    };
    const Row rows[] = {
        {"CR line ends", a + "\r" + b + "\r" + c + "\r", b + "\r\n" + c + "\r\n"},
        {"no final line end", a + "\n" + b + "\n" + c, b + "\r\n" + c + "\r\n"},
        {"mixed line ends and empty lines", a + "\r\n\r\n" + b + "\n\n\r" + c + "\r\n\r\n",
         b + "\r\n" + c + "\r\n"},
        {"lines the client would take as the reply's end",
         a + "\r\nOK,2006-05-01 10:15:00\r\n" + b + "\r\nNOK\r\nphp,2006-05-01 11:00:00\r\n" + c +
             "\r\n",
         b + "\r\n" + c + "\r\n"},
        {"a line too long for the client", a + "\r\n" + b + "\r\n" + longLine + "\r\n" + c + "\r\n",
         b + "\r\n" + c + "\r\n"},
    };
    int n = 0;
    for (const Row& row : rows) {
        SCOPED_TRACE(row.what);
        const QString name = QStringLiteral("odd%1.dat").arg(++n);
        service.PlaceFile(QStringLiteral("ann"), name, row.file);
        home.Write(name, a + "\r\n");
        ASSERT_TRUE(web.GetNewData(Local(name), 2, 1)) << web.LastError().toStdString();
        EXPECT_EQ(ReadLocal(name), a + "\r\n" + row.received);
        EXPECT_EQ(web.LastDateInFile(name, 2, 1, 1, 1), QStringLiteral("1 May 2006 10:20:00"));
    }
    // Without a local copy every record comes, but still no protocol words.
    service.PlaceFile(QStringLiteral("ann"), QStringLiteral("fresh.dat"), rows[3].file);
    ASSERT_TRUE(web.GetNewData(Local(QStringLiteral("fresh.dat")), 2, 1))
        << web.LastError().toStdString();
    EXPECT_EQ(ReadLocal(QStringLiteral("fresh.dat")), a + "\r\n" + b + "\r\n" + c + "\r\n");
}

} // namespace
} // namespace quorvel::testing
