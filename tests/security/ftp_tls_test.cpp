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
        Write(Root() + QStringLiteral("/site1.dat"), "2006-05-01 10:00:00,1\r\n");
        TlsTrust::SetExtraCaFiles({certs.filePath(QStringLiteral("ca.pem"))});
        session.SetDisplay(&trace, nullptr);
    }
    void TearDown() override { TlsTrust::SetExtraCaFiles({}); }

    QString Root() const { return files.filePath(QStringLiteral("root")); }
    static void Write(const QString& path, const QByteArray& bytes) {
        QFile file(path);
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(bytes);
    }
    static QByteArray Read(const QString& path) {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<missing>");
    }
    void Start(const QString& mode, const QString& cert = QStringLiteral("good")) {
        ASSERT_TRUE(peer.Start(mode, Root(), certs.path(), cert)) << peer.Log().toStdString();
    }
    QString Server(const QString& scheme) const {
        return scheme + QStringLiteral("://localhost:") + QString::number(peer.Port());
    }

    TempHome home;
    RecordingPrompter prompter;
    SystemClock clock;
    CountingBusyPointer busy;
    ScopedPorts ports{Ports{&prompter, &clock, &busy}};
    QTemporaryDir certs, files;
    FtpsPeer peer;
    FtpSession session;
    RecordingTraceView trace;
};

struct Secure {
    const char* name;
    const char* mode;   // of the peer
    const char* scheme; // of the server text
};

class FtpTlsModeTest : public FtpTlsTest, public ::testing::WithParamInterface<Secure> {};

TEST_P(FtpTlsModeTest, DownloadsAndUploadsWithControlAndDataProtected) {
    Start(QString::fromLatin1(GetParam().mode));
    session.SetDetails(Server(QString::fromLatin1(GetParam().scheme)), QStringLiteral("logger"),
                       QStringLiteral("secret"), true);
    const QString local = home.File(QStringLiteral("site1.dat"));
    ASSERT_TRUE(session.Download(QStringLiteral("site1.dat"), local))
        << session.LastError().toStdString() << peer.Log().toStdString();
    EXPECT_EQ(Read(local), "2006-05-01 10:00:00,1\r\n");
    Write(local, "2006-05-01 10:00:00,1\r\n2006-05-01 10:10:00,2\r\n");
    ASSERT_TRUE(session.Upload(local, QStringLiteral("up.dat")))
        << session.LastError().toStdString();
    EXPECT_EQ(Read(Root() + QStringLiteral("/up.dat")),
              "2006-05-01 10:00:00,1\r\n2006-05-01 10:10:00,2\r\n");
    session.Close();

    const QStringList commands = peer.Commands();
    // Protection is asked for before the first data connection, and every data
    // connection ran TLS.
    EXPECT_TRUE(commands.contains(QStringLiteral("PBSZ 0")));
    EXPECT_TRUE(commands.contains(QStringLiteral("PROT P")));
    EXPECT_LT(commands.indexOf(QStringLiteral("PROT P")), commands.indexOf(QStringLiteral("EPSV")));
    EXPECT_EQ(peer.Count(QStringLiteral("DATA TLS"), 2), 2) << peer.Log().toStdString();
    const bool explicitTls = QString::fromLatin1(GetParam().mode) == QStringLiteral("explicit");
    EXPECT_EQ(commands.value(0).startsWith(QStringLiteral("AUTH")), explicitTls)
        << commands.join(QLatin1Char(',')).toStdString();
}

INSTANTIATE_TEST_SUITE_P(Tls, FtpTlsModeTest,
                         ::testing::Values(Secure{"Implicit", "implicit", "ftps"},
                                           Secure{"Explicit", "explicit", "ftpes"},
                                           Secure{"ExplicitCapitals", "explicit", "FTPES"}),
                         [](const ::testing::TestParamInfo<Secure>& info) {
                             return std::string(info.param.name);
                         });

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
        ASSERT_TRUE(server.Start(QString::fromLatin1(c.mode), Root(), certs.path(),
                                 QString::fromLatin1(c.cert)));
        TlsTrust::SetExtraCaFiles(
            c.trustTestCa ? QStringList{certs.filePath(QStringLiteral("ca.pem"))} : QStringList{});
        const QString address = QString::fromLatin1(c.scheme) + QStringLiteral("://localhost:") +
                                QString::number(server.Port());
        session.SetDetails(address, QStringLiteral("logger"), QStringLiteral("secret"), true);
        EXPECT_FALSE(session.Download(QStringLiteral("site1.dat"), home.File(QStringLiteral("x"))));
        const QString error = session.LastError();
        EXPECT_TRUE(error.startsWith(QStringLiteral("Failed ftp access to ") + address))
            << error.toStdString();
        EXPECT_TRUE(error.contains(QString::fromUtf8(c.reason))) << error.toStdString();
        EXPECT_FALSE(server.Log().contains(QStringLiteral("CMD USER")))
            << server.Log().toStdString();
        EXPECT_FALSE(server.Log().contains(QStringLiteral("CMD PASS")));
        session.Close();
    }
    EXPECT_FALSE(QFile::exists(home.File(QStringLiteral("x"))));
}

} // namespace
} // namespace quorvel::testing
