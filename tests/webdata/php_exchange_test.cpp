// One exchange end to end against PHP's own web server and a small wd.php.
#include "webdata_fixture.h"

#include <QProcess>
#include <QScopeGuard>
#include <QStandardPaths>
#include <QTcpSocket>

namespace quorvel::testing {
namespace {

TEST_F(WebDataTest, PhpsWebServerGivesTheRightUserOnlyTheRecordsAfterTheLocalLastDate) {
    const QString php = QStandardPaths::findExecutable(QStringLiteral("php"));
    if (php.isEmpty()) GTEST_SKIP() << "php is not installed";
    clock.SetWaits(WaitLengths{}); // the full reply gap: PHP may be slow to start
    const QByteArray records = "2006-05-01 10:00:00,1\n2006-05-01 10:10:00,2\n"
                               "2006-05-01 10:20:00,3\n2006-05-01 10:30:00,4\n";
    home.Write(QStringLiteral("data/site1.dat"), records);

    const QString address = ScriptServer().HostPort(); // a port nobody listens on
    QProcess service;
    service.setStandardErrorFile(QProcess::nullDevice());
    service.start(php, {"-S", address, "-t", home.Path(), QStringLiteral(WEBDATA_PHP_SCRIPT)});
    const auto stop = qScopeGuard([&] {
        service.kill();
        service.waitForFinished();
    });
    web.SetRemoteHost(address);
    web.SetUserID(QStringLiteral("ann"));
    web.SetPassword(QStringLiteral("p&ss word"));
    const quint16 port = quint16(address.section(QLatin1Char(':'), 1).toUInt());
    ASSERT_TRUE(PumpUntil(
        [port] {
            QTcpSocket probe;
            probe.connectToHost(QHostAddress::LocalHost, port);
            return probe.waitForConnected(100);
        },
        10000));
    ASSERT_TRUE(web.Initialise());
    EXPECT_EQ(web.UserName(), QStringLiteral("Ann Example"));
    EXPECT_EQ(web.UserDataFolder(), QStringLiteral("users/ann/data"));
    const QString local = home.Write(QStringLiteral("site1.dat"),
                                     "2006-05-01 10:00:00,1\r\n2006-05-01 10:10:00,2\r\n");
    ASSERT_TRUE(web.GetNewData(local, 1, 1)) << web.LastError().toStdString();
    const QByteArray expected = QByteArray(records).replace("\n", "\r\n");
    EXPECT_EQ(home.Read(QStringLiteral("site1.dat")), expected);
    EXPECT_EQ(web.LastDateInFile(QStringLiteral("site1.dat"), 1, 1, 1, 1),
              QStringLiteral("1 May 2006 10:30:00"));
    // Asked again, the service has nothing newer.
    ASSERT_TRUE(web.GetNewData(local, 1, 1));
    EXPECT_EQ(web.LastError(), QStringLiteral("No new data"));
    EXPECT_EQ(home.Read(QStringLiteral("site1.dat")), expected);

    web.SetPassword(QStringLiteral("wrong"));
    EXPECT_FALSE(web.Initialise());
    EXPECT_EQ(web.LastError(), QStringLiteral("NOK bad user (GETUSERFOLDERS)"));
    EXPECT_EQ(programEnds, 0);
}

} // namespace
} // namespace quorvel::testing
