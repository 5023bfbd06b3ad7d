// Nothing outside a user's own folder is read: not through wd.php's file
// names, not through the web server's addresses, not through FTP.
#include "service_fixture.h"

#include <QDir>

namespace quorvel::testing {
namespace {

TEST_F(ServiceTest, FileNamesThatLeaveTheUsersFolderAreRefused) {
    service.PlaceFile(QStringLiteral("bob"), QStringLiteral("secret.dat"),
                      "2006-05-01 10:00:00,bob\r\n");
    service.PlaceFile(QStringLiteral("ann"), QStringLiteral(".hidden"),
                      "2006-05-01 10:00:00,x\r\n");
    // A link in ann's folder to bob's file is not followed.
    ASSERT_TRUE(QFile::link(service.UserPath(QStringLiteral("bob"), QStringLiteral("secret.dat")),
                            service.UserPath(QStringLiteral("ann"), QStringLiteral("link.dat"))));
    struct Row {
        const char* file; // as it travels in the query
        QString answer;
    };
    const Row rows[] = {
        {"..%2Fbob%2Fsecret.dat",
         QStringLiteral("NOK refused file name \"../bob/secret.dat\"\r\n")},
        {"..%5C..%5Cusers.json",
         QStringLiteral("NOK refused file name \"..\\..\\users.json\"\r\n")},
        {"%2Fetc%2Fpasswd", QStringLiteral("NOK refused file name \"/etc/passwd\"\r\n")},
        {"..", QStringLiteral("NOK refused file name \"..\"\r\n")},
        {".hidden", QStringLiteral("NOK refused file name \".hidden\"\r\n")},
        {"secret.dat%00.txt", QStringLiteral("NOK refused file name \"secret.dat\\000.txt\"\r\n")},
        {"", QStringLiteral("NOK refused file name \"\"\r\n")},
        {"secret.dat", QStringLiteral("NOK NO FILE secret.dat\r\n")},
        {"link.dat", QStringLiteral("NOK NO FILE link.dat\r\n")},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.file);
        for (const int location : {0, 2, 3, 4})
            EXPECT_EQ(Ask(AsAnn(QStringLiteral("cmd=GETDATA&dt=1&date=0&filelocation=%1&file=%2")
                                    .arg(location)
                                    .arg(QLatin1String(row.file)))),
                      row.answer);
    }
    EXPECT_EQ(
        Ask(AsAnn(QStringLiteral("cmd=GETLASTDATE&dt=1&filelocation=2&file=..%2Fusers.json"))),
        QStringLiteral("NOK refused file name \"../users.json\"\r\n"));
}

TEST_F(ServiceTest, OnlyTheScriptTheConfigurationFilesAndTheFileListsAreServed) {
    service.PlaceFile(QStringLiteral("ann"), QStringLiteral("files.txt"),
                      " 1 ~1~Site~site.dat~1~2~2~1~0~1~0~~~0\r\n");
    service.PlaceFile(QStringLiteral("ann"), QStringLiteral("site.dat"),
                      "2006-05-01 10:00:00,1\r\n");
    const QString base = QStringLiteral("http://") + service.HttpHostPort();
    QString body;
    EXPECT_TRUE(HTTPGetFileContents(service.FilesTxtUrl(QStringLiteral("ann")), body));
    EXPECT_EQ(body, QStringLiteral(" 1 ~1~Site~site.dat~1~2~2~1~0~1~0~~~0\r\n"));
    EXPECT_TRUE(HTTPGetFileContents(base + QStringLiteral("//ann//files.txt"), body));
    EXPECT_TRUE(HTTPGetFileContents(service.CfgUrl(QStringLiteral("bob")), body));
    EXPECT_TRUE(QFile::exists(service.DataRoot() + QStringLiteral("/users.json")));
    for (const char* path :
         {"/users.json", "/../users.json", "/%2e%2e/users.json", "/cfg/../users.json",
          "/wd/..%2fusers.json", "/users/ann/site.dat", "/ann/site.dat", "/ann/../users.json",
          "/router.php", "/lib/accounts.php", "/wd/", "/wd/wd.php/../../users.json", "/site.json",
          "/logs/http.log", "/cfg/nobody.cfg", "/nobody/files.txt", "/cfg/ann.cfg%00.txt"}) {
        SCOPED_TRACE(path);
        body.clear();
        EXPECT_FALSE(HTTPGetFileContents(base + QLatin1String(path), body));
        EXPECT_FALSE(body.contains(QStringLiteral("password_hash")));
        EXPECT_FALSE(body.contains(QStringLiteral("2006-05-01")));
    }
}

TEST_F(ServiceTest, FtpStaysInsideTheUsersFolder) {
    service.PlaceFile(QStringLiteral("bob"), QStringLiteral("secret.dat"), "bob's\r\n");
    SetFTPDetails(service.FtpServer(), QStringLiteral("ann"),
                  service.FtpPassword(QStringLiteral("ann")), true);
    const QString local = home.Write(QStringLiteral("got.dat"), "old\r\n");
    for (const char* remote :
         {"/wd/ann/../bob/secret.dat", "/wd/../bob/secret.dat", "/../../users/bob/secret.dat",
          "../../users.json", "/users.json", "/wd/ann/../../../users.json"}) {
        SCOPED_TRACE(remote);
        EXPECT_FALSE(ftpDownLoadFile(QLatin1String(remote), local));
        EXPECT_EQ(ReadLocal(QStringLiteral("got.dat")), QByteArray("old\r\n"));
    }
    // Uploads that try to climb out land inside the user's folder or nowhere.
    EXPECT_TRUE(ftpUploadFile(local, QStringLiteral("/wd/ann/../../../../escape.dat")));
    EXPECT_EQ(service.ReadFile(QStringLiteral("ann"), QStringLiteral("escape.dat")),
              QByteArray("old\r\n"));
    EXPECT_FALSE(QFile::exists(service.DataRoot() + QStringLiteral("/escape.dat")));
    EXPECT_FALSE(QFile::exists(QDir(service.DataRoot()).filePath(QStringLiteral("../escape.dat"))));
}

} // namespace
} // namespace quorvel::testing
