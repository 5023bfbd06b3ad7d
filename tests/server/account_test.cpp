// A user's configuration file, fetched and deciphered as the client's log-in
// does, gives the FTP account; files then travel by FTP under the remote names
// the client forms, and arrive where wd.php finds them.
#include "service_fixture.h"

#include "support/cipher.h"

namespace quorvel::testing {
namespace {

// The login code's key text, under which `quorvel --encipher` enciphers.
const QString kLoginKey = QStringLiteral("tlu");

TEST_F(ServiceTest, ConfigurationFileGivesTheFtpAccountThatLogsIn) {
    QString cfg;
    ASSERT_TRUE(HTTPGetFileContents(service.CfgUrl(QStringLiteral("ann")), cfg));
    const QStringList lines = cfg.split(QStringLiteral("\r\n"));
    ASSERT_GE(lines.size(), 5) << cfg.toStdString();
    EXPECT_EQ(lines.mid(0, 5), (QStringList{service.FtpServer(), QStringLiteral("ann"), lines[2],
                                            service.HttpHostPort(), service.WebFolder()}));
    const QString ftpPassword = DecryptHex(lines[2], kLoginKey);
    EXPECT_EQ(ftpPassword, service.FtpPassword(QStringLiteral("ann")));
    EXPECT_NE(ftpPassword, kAnnPassword); // the log-in password never travels in a public file

    SetFTPDetails(lines[0], lines[1], ftpPassword, true);
    const QString local = home.Write(QStringLiteral("up.dat"), "2006-05-01 10:00:00,1\r\n");
    // Remote names as the client forms them for each service location.
    struct Row {
        QString remote, onDisk;
    };
    const Row rows[] = {
        {QStringLiteral("/wd//ann/up.dat"), QStringLiteral("up.dat")}, // user folder
        {QStringLiteral("/wd//ann/current/up.dat"), QStringLiteral("current/up.dat")}, // season
        {QStringLiteral("/wd/app.dat"), QStringLiteral("app.dat")}, // application, data
        {QStringLiteral("/wd/Logs/other.dat"), QStringLiteral("Logs/other.dat")}, // other
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.remote.toStdString());
        if (row.onDisk.startsWith(QStringLiteral("Logs/")))
            service.PlaceFile(QStringLiteral("ann"), QStringLiteral("Logs/.keep"), {});
        ASSERT_TRUE(ftpUploadFile(local, row.remote)) << ftpLastError().toStdString();
        EXPECT_EQ(service.ReadFile(QStringLiteral("ann"), row.onDisk),
                  QByteArray("2006-05-01 10:00:00,1\r\n"));
        std::int64_t size = 0;
        EXPECT_TRUE(ftpRemoteFileSize(row.remote, size));
        EXPECT_EQ(size, 23);
    }
    // What arrived by FTP is what wd.php serves.
    service.PlaceFile(QStringLiteral("ann"), QStringLiteral("up.dat"),
                      "2006-05-01 10:00:00,1\r\n2006-05-01 10:10:00,2\r\n");
    ASSERT_TRUE(web.GetNewData(local, 2, 1)) << web.LastError().toStdString();
    EXPECT_EQ(ReadLocal(QStringLiteral("up.dat")),
              QByteArray("2006-05-01 10:00:00,1\r\n2006-05-01 10:10:00,2\r\n"));
    ASSERT_TRUE(
        ftpDownLoadFile(QStringLiteral("/wd//ann/up.dat"), Local(QStringLiteral("down.dat"))))
        << ftpLastError().toStdString();
    EXPECT_EQ(ReadLocal(QStringLiteral("down.dat")),
              service.ReadFile(QStringLiteral("ann"), QStringLiteral("up.dat")));
    ftpClose();

    // The log-in password, or another user's FTP password, does not open the account.
    for (const QString& wrong : {kAnnPassword, service.FtpPassword(QStringLiteral("bob"))}) {
        SetFTPDetails(lines[0], lines[1], wrong, false);
        EXPECT_FALSE(OpenFTP());
        ftpClose();
    }
}

TEST_F(ServiceTest, NewUserHasAnEmptyFileListAndCanLogInWhileTheServiceRuns) {
    ASSERT_TRUE(service.AddUser({.name = QStringLiteral("carol"), .password = QStringLiteral("c")}))
        << service.LastError().toStdString();
    QString body = QStringLiteral("<unset>");
    EXPECT_TRUE(HTTPGetFileContents(service.FilesTxtUrl(QStringLiteral("carol")), body));
    EXPECT_EQ(body, QString());
    QString cfg;
    ASSERT_TRUE(HTTPGetFileContents(service.CfgUrl(QStringLiteral("carol")), cfg));
    EXPECT_TRUE(cfg.startsWith(service.FtpServer() + QStringLiteral("\r\ncarol\r\n")));
    web.SetUserID(QStringLiteral("carol"));
    web.SetPassword(QStringLiteral("c"));
    ASSERT_TRUE(web.Initialise()) << web.LastError().toStdString();
    EXPECT_EQ(web.UserName(), QStringLiteral("carol"));
    EXPECT_EQ(web.UserFolder(), QStringLiteral("/carol"));
    EXPECT_EQ(web.UserDataFolder(), QString());
}

} // namespace
} // namespace quorvel::testing
