// One exchange end to end against PHP's own web server and a small wd.php.
#include "webdata_fixture.h"

#include <QDir>
#include <QFile>
#include <QProcess>
#include <QProcessEnvironment>
#include <QStandardPaths>
#include <QTcpSocket>

namespace quorvel::testing {
namespace {

const QByteArray kServiceRecords = "2006-05-01 10:00:00,1\n2006-05-01 10:10:00,2\n"
                                   "2006-05-01 10:20:00,3\n2006-05-01 10:30:00,4\n"
                                   "2006-05-01 10:40:00,5\n";

class PhpExchange : public WebDataTest {
protected:
    void SetUp() override {
        const QString php = QStandardPaths::findExecutable(QStringLiteral("php"));
        if (php.isEmpty()) GTEST_SKIP() << "php is not installed";
        WaitLengths waits;
        waits.replyGap = std::chrono::seconds(10);
        clock.SetWaits(waits);

        QDir().mkpath(home.File(QStringLiteral("www/wd")));
        QDir().mkpath(home.File(QStringLiteral("service")));
        ASSERT_TRUE(QFile::copy(QStringLiteral(WEBDATA_PHP_SCRIPT),
                                home.File(QStringLiteral("www/wd/wd.php"))));
        home.Write(QStringLiteral("service/site1.dat"), kServiceRecords);

        quint16 port = 0;
        {
            QTcpServer probe;
            ASSERT_TRUE(probe.listen(QHostAddress::LocalHost, 0));
            port = probe.serverPort();
        }
        QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
        env.insert(QStringLiteral("WD_DATA"), home.File(QStringLiteral("service")));
        php_.setProcessEnvironment(env);
        php_.setStandardErrorFile(QProcess::nullDevice());
        php_.setStandardOutputFile(QProcess::nullDevice());
        php_.start(php, {QStringLiteral("-S"), QStringLiteral("127.0.0.1:%1").arg(port),
                         QStringLiteral("-t"), home.File(QStringLiteral("www"))});
        ASSERT_TRUE(php_.waitForStarted());
        ASSERT_TRUE(PumpUntil(
            [port] {
                QTcpSocket probe;
                probe.connectToHost(QHostAddress::LocalHost, port);
                return probe.waitForConnected(100);
            },
            10000));
        web.SetRemoteHost(QStringLiteral("127.0.0.1:%1").arg(port));
        web.SetUserID(QStringLiteral("ann"));
        web.SetPassword(QStringLiteral("p&ss word"));
    }
    void TearDown() override {
        if (php_.state() != QProcess::NotRunning) {
            php_.terminate();
            if (!php_.waitForFinished(5000)) php_.kill();
            php_.waitForFinished();
        }
    }
    QProcess php_;
};

TEST_F(PhpExchange, FetchesOnlyTheRecordsAfterTheLocalFilesLastDate) {
    ASSERT_TRUE(web.Initialise());
    EXPECT_EQ(web.UserName(), QStringLiteral("Ann Example"));
    EXPECT_EQ(web.UserDataFolder(), QStringLiteral("users/ann/data"));

    const QString local = home.Write(QStringLiteral("site1.dat"),
                                     "2006-05-01 10:00:00,1\r\n2006-05-01 10:10:00,2\r\n");
    ASSERT_TRUE(web.GetNewData(local, 1, 1)) << web.LastError().toStdString();
    QByteArray expected = kServiceRecords;
    expected.replace("\n", "\r\n");
    EXPECT_EQ(FileBytes(QStringLiteral("site1.dat")), expected);
    EXPECT_EQ(web.LastDateInFile(QStringLiteral("site1.dat"), 1, 1, 1, 1),
              QStringLiteral("1 May 2006 10:40:00"));

    // Asked again, the service has nothing newer.
    ASSERT_TRUE(web.GetNewData(local, 1, 1));
    EXPECT_EQ(web.LastError(), QStringLiteral("No new data"));
    EXPECT_EQ(FileBytes(QStringLiteral("site1.dat")), expected);
    EXPECT_EQ(programEnds, 0);
}

TEST_F(PhpExchange, AWrongPasswordIsAFailedCommand) {
    web.SetPassword(QStringLiteral("wrong"));
    EXPECT_FALSE(web.Initialise());
    EXPECT_EQ(web.LastError(), QStringLiteral("NOK bad user (GETUSERFOLDERS)"));
}

} // namespace
} // namespace quorvel::testing
