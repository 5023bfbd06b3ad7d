// Configuration and file-list fetches over https (libcurl) against nginx.
#include "security_fixture.h"

#include "transfer/ftp.h"

namespace quorvel::testing {
namespace {

TEST_F(TlsServiceTest, ConfigurationAndFileListComeOverVerifiedHttps) {
    service.PlaceFile("ann", "files.txt", "site1.dat~1\r\n");
    QString cfg;
    ASSERT_TRUE(HTTPGetFileContents(web.Address(TlsSite::Good) + "/cfg/ann.cfg", cfg))
        << ftpLastError().toStdString();
    EXPECT_GE(cfg.split("\r\n").size(), 5) << cfg.toStdString();
    QString list;
    // The scheme in capitals is the same scheme.
    ASSERT_TRUE(HTTPGetFileContents(
        "HTTPS://localhost:" + QString::number(web.Port(TlsSite::Good)) + "/ann/files.txt", list))
        << ftpLastError().toStdString();
    EXPECT_EQ(list, "site1.dat~1\r\n");
}

struct FetchRefusal {
    const char* name;
    TlsSite site;
    bool trustTestCa;
    const char* path;
    const char* reason; // part of curl's message
};

TEST_F(TlsServiceTest, FetchesAreRefusedWithTheAddressAndTheReason) {
    const FetchRefusal cases[] = {
        {"expired", TlsSite::Expired, true, "/cfg/ann.cfg", "certificate has expired"},
        {"wrong name", TlsSite::WrongName, true, "/cfg/ann.cfg",
         "no alternative certificate subject name matches target host name 'localhost'"},
        {"unknown CA", TlsSite::Stranger, true, "/cfg/ann.cfg", "unable to get local issuer"},
        {"private CA not added", TlsSite::Good, false, "/cfg/ann.cfg",
         "unable to get local issuer"},
        {"plain server", TlsSite::Plain, true, "/cfg/ann.cfg", "wrong version number"},
        // Once secure, never redirected to plain text.
        {"redirect to http", TlsSite::Good, true, "/to-plain/cfg/ann.cfg",
         "Protocol \"http\" not supported"},
    };
    for (const FetchRefusal& c : cases) {
        SCOPED_TRACE(c.name);
        TlsTrust::SetExtraCaFiles(c.trustTestCa ? QStringList{web.CaFile()} : QStringList{});
        const QString url = web.Address(c.site) + QString::fromLatin1(c.path);
        QString contents = "old";
        EXPECT_FALSE(HTTPGetFileContents(url, contents));
        const QString error = ftpLastError();
        EXPECT_TRUE(error.startsWith("Could not connect to " + url)) << error.toStdString();
        EXPECT_TRUE(error.contains(QString::fromUtf8(c.reason))) << error.toStdString();
        EXPECT_TRUE(contents.isEmpty());
    }
    // Only the redirecting request was answered; the plain site was never asked.
    EXPECT_EQ(AccessCount("/to-plain/", 1), 1);
    EXPECT_FALSE(
        AccessLog().contains(QString::number(web.Port(TlsSite::Plain)) + " GET /cfg/ann.cfg"))
        << AccessLog().toStdString();
}

} // namespace
} // namespace quorvel::testing
