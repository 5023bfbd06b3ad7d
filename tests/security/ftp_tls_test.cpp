// FTP over TLS (ftps:// implicit, ftpes:// explicit) against pyftpdlib's TLS handler.
#include "common/recorders.h"
#include "common/temp_home.h"
#include "ftps_peer.h"
#include "support/tls_trust.h"
#include "tls_web_peer.h"
#include "transfer/ftp_session.h"

#include <QDir>
#include <QFile>

#include <gtest/gtest.h>

#include <chrono>

namespace quorvel::testing {
namespace {

class FtpTlsTest : public ::testing::Test {
protected:
    void SetUp() override {
        clock.SetWaits(WaitLengths{.replyGap = std::chrono::milliseconds(3000)});
        QString error;
        ASSERT_TRUE(MakeTestCertificates(certs.path(), error)) << error.toStdString();
        QDir().mkpath(Root());
        Write(Root() + "/site1.dat", "2006-05-01 10:00:00,1\r\n");
        TlsTrust::SetExtraCaFiles({certs.filePath("ca.pem")});
        session.SetDisplay(&trace, nullptr);
    }
    void TearDown() override { TlsTrust::SetExtraCaFiles({}); }

    QString Root() const { return files.filePath("root"); }
    static void Write(const QString& path, const QByteArray& bytes) {
        QFile file(path);
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(bytes);
    }
    static QByteArray Read(const QString& path) {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<missing>");
    }
    // A server of the mode and certificate, and the address of a scheme on it.
    QString Start(FtpsPeer& server, const char* mode, const char* cert, const char* scheme) {
        EXPECT_TRUE(server.Start(mode, Root(), certs.path(), cert)) << server.Log().toStdString();
        return QString::fromLatin1(scheme) + "://localhost:" + QString::number(server.Port());
    }

    TempHome home;
    RecordingPrompter prompter;
    SystemClock clock;
    CountingBusyPointer busy;
    ScopedPorts ports{Ports{&prompter, &clock, &busy}};
    QTemporaryDir certs, files;
    FtpSession session;
    RecordingTraceView trace;
};

TEST_F(FtpTlsTest, DownloadsAndUploadsWithControlAndDataProtected) {
    const std::pair<const char*, const char*> cases[] = {
        {"implicit", "ftps"}, {"explicit", "ftpes"}, {"explicit", "FTPES"}}; // mode, scheme
    for (const auto& [mode, scheme] : cases) {
        SCOPED_TRACE(scheme);
        FtpsPeer peer;
        session.SetDetails(Start(peer, mode, "good", scheme), "logger", "secret", true);
        const QString local = home.File("site1.dat");
        ASSERT_TRUE(session.Download("site1.dat", local))
            << session.LastError().toStdString() << peer.Log().toStdString();
        EXPECT_EQ(Read(local), "2006-05-01 10:00:00,1\r\n");
        Write(local, "2006-05-01 10:00:00,1\r\n2006-05-01 10:10:00,2\r\n");
        ASSERT_TRUE(session.Upload(local, "up.dat")) << session.LastError().toStdString();
        EXPECT_EQ(Read(Root() + "/up.dat"), "2006-05-01 10:00:00,1\r\n2006-05-01 10:10:00,2\r\n");
        session.Close();

        const QStringList commands = peer.Commands();
        // Protection is asked for before the first data connection, and every data
        // connection ran TLS.
        EXPECT_TRUE(commands.contains("PBSZ 0"));
        EXPECT_TRUE(commands.contains("PROT P"));
        EXPECT_LT(commands.indexOf("PROT P"), commands.indexOf("EPSV"));
        EXPECT_EQ(peer.Count("DATA TLS", 2), 2) << peer.Log().toStdString();
        EXPECT_EQ(commands.value(0).startsWith("AUTH"), QLatin1String(mode) == "explicit")
            << commands.join(',').toStdString();
        QFile::remove(Root() + "/up.dat");
    }
}

struct FtpRefusal {
    const char* name;
    const char* mode;
    const char* cert;
    bool trustTestCa;
    const char* scheme;
    const char* reason; // part of curl's message
};

// Each case: the transfer fails with the host and the reason, and the user name
// and password never went out.
TEST_F(FtpTlsTest, CertificateAndProtocolFailuresAreRefusedBeforeTheLogIn) {
    const FtpRefusal cases[] = {
        {"expired", "implicit", "expired", true, "ftps", "certificate has expired"},
        {"wrong name", "explicit", "wrong_name", true, "ftpes",
         "no alternative certificate subject name matches target host name 'localhost'"},
        {"unknown CA", "implicit", "stranger", true, "ftps", "unable to get local issuer"},
        {"private CA not added", "explicit", "good", false, "ftpes", "unable to get local issuer"},
        {"explicit TLS to a plain server", "plain", "good", true, "ftpes",
         "Requested SSL level failed"},
        {"implicit TLS to a plain server", "plain", "good", true, "ftps", ""},
    };
    for (const FtpRefusal& c : cases) {
        SCOPED_TRACE(c.name);
        FtpsPeer server;
        const QString address = Start(server, c.mode, c.cert, c.scheme);
        TlsTrust::SetExtraCaFiles(c.trustTestCa ? QStringList{certs.filePath("ca.pem")}
                                                : QStringList{});
        session.SetDetails(address, "logger", "secret", true);
        EXPECT_FALSE(session.Download("site1.dat", home.File("x")));
        const QString error = session.LastError();
        EXPECT_TRUE(error.startsWith("Failed ftp access to " + address)) << error.toStdString();
        EXPECT_TRUE(error.contains(QString::fromUtf8(c.reason))) << error.toStdString();
        EXPECT_FALSE(server.Log().contains("CMD USER")) << server.Log().toStdString();
        EXPECT_FALSE(server.Log().contains("CMD PASS"));
        session.Close();
    }
    EXPECT_FALSE(QFile::exists(home.File("x")));
}

} // namespace
} // namespace quorvel::testing
