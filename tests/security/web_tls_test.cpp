// The wd.php exchange over TLS against nginx and php-fpm.
#include "security_fixture.h"

#include "webdata/tcp_socket_control.h"

namespace quorvel::testing {
namespace {

QString Port(const TlsWebPeer& web, TlsSite site) {
    return QString::number(web.Port(site));
}

TEST_F(TlsServiceTest, AnHttpsServerTextRunsTheWholeExchangeOverVerifiedTls) {
    object.SetRemoteHost(web.Address(TlsSite::Good));
    ASSERT_TRUE(object.Initialise()) << object.LastError().toStdString();
    EXPECT_EQ(object.UserName(), "Ann Example");
    service.PlaceFile(
        "ann", "site1.dat",
        "2006-05-01 10:00:00,1\r\n2006-05-01 10:10:00,2\r\n2006-05-01 10:20:00,3\r\n");
    const QString local = home.Write("site1.dat", "2006-05-01 10:00:00,1\r\n");
    ASSERT_TRUE(object.GetNewData(local, 1, 1)) << object.LastError().toStdString();
    EXPECT_EQ(home.Read("site1.dat"),
              "2006-05-01 10:00:00,1\r\n2006-05-01 10:10:00,2\r\n2006-05-01 10:20:00,3\r\n");

    // Request line and Host header carry the host and port of the text; the
    // three commands went over one connection.
    const QString hostPort = "localhost:" + Port(web, TlsSite::Good);
    EXPECT_TRUE(traces.contains("S>GET https://" + hostPort +
                                QStringLiteral("/wd/wd.php?cmd=GETUSERFOLDERS&user=ann&pwd=***&"
                                               "dt=0&filelocation=0 HTTP/1.1")))
        << traces.join('\n').toStdString();
    EXPECT_TRUE(traces.contains("S>Host: " + hostPort));
    EXPECT_EQ(statuses.count("Connecting to " + web.Address(TlsSite::Good)), 1);
    EXPECT_EQ(AccessCount("/wd/wd.php?cmd=", 3), 3) << AccessLog().toStdString();
    EXPECT_EQ(programEnds, 0);
    EXPECT_TRUE(prompter.shown.empty());
}

TEST_F(TlsServiceTest, TheCertificateMatchesByAddressAndThePortDefaultsTo443) {
    // 127.0.0.1 is in the certificate as an address.
    object.SetRemoteHost(web.Address(TlsSite::Good, "127.0.0.1"));
    EXPECT_TRUE(object.Initialise()) << object.LastError().toStdString();
    // Without a port the exchange goes to 443, where nobody listens here.
    ShortGap();
    object.Disconnect();
    object.SetRemoteHost("HTTPS://127.0.0.1/");
    EXPECT_FALSE(object.Initialise());
    EXPECT_TRUE(object.LastError().contains("refused")) << object.LastError().toStdString();
}

TEST_F(TlsServiceTest, AnUntrustedOrPlainServerIsRefusedWithItsReasonAndNothingIsSent) {
    struct Case {
        TlsSite site;
        bool trustTestCa;
        const char* reason; // part of the message after the host
    };
    const Case cases[] = {
        {TlsSite::Expired, true, "was refused: The certificate has expired"},
        {TlsSite::WrongName, true, "host name did not match"},
        {TlsSite::Stranger, true, "issuer certificate"}, // an unknown CA
        {TlsSite::Good, false, "issuer certificate"},    // the private CA not added
        {TlsSite::Plain, true, "does it speak TLS on this port?"},
    };
    ShortGap();
    for (const Case& c : cases) {
        SCOPED_TRACE(c.reason);
        TlsTrust::SetExtraCaFiles(c.trustTestCa ? QStringList{web.CaFile()} : QStringList{});
        object.Disconnect();
        statuses.clear();
        object.SetRemoteHost(web.Address(c.site));
        EXPECT_FALSE(object.Initialise());
        const QString error = object.LastError();
        EXPECT_TRUE(error.contains("localhost:" + Port(web, c.site))) << error.toStdString();
        EXPECT_TRUE(error.contains(QString::fromUtf8(c.reason), Qt::CaseInsensitive))
            << error.toStdString();
        // The socket's reason reached the status line and stays in LastError.
        const QStringList shown = statuses.filter("WinsockError: ");
        ASSERT_EQ(shown.size(), 1) << statuses.join('\n').toStdString();
        EXPECT_EQ(error, "*Not* connected to " + web.Address(c.site) + ": " +
                             shown[0].mid(QStringLiteral("WinsockError: ").size()));
    }
    // Not a byte of any request, and so not the password, reached the server.
    EXPECT_FALSE(AccessLog().contains("wd.php")) << AccessLog().toStdString();
    EXPECT_FALSE(traces.join('\n').contains("S>GET"));
    // A failure of the connection is a result, not a question for the user.
    EXPECT_TRUE(prompter.shown.empty());
    EXPECT_EQ(programEnds, 0);
}

TEST_F(TlsServiceTest, APlainConnectionIsNeverReusedForAnHttpsAddressNorTheOtherWayRound) {
    object.SetRemoteHost(web.HostPort(TlsSite::Plain));
    ASSERT_TRUE(object.Initialise()) << object.LastError().toStdString();
    // The open plain connection would take the next request; the https text
    // makes a new, verified one.
    object.SetRemoteHost(web.Address(TlsSite::Good));
    ASSERT_TRUE(object.Initialise()) << object.LastError().toStdString();
    object.SetRemoteHost(web.HostPort(TlsSite::Plain));
    ASSERT_TRUE(object.Initialise()) << object.LastError().toStdString();
    AccessCount("wd.php", 3);
    const QString access = AccessLog();
    EXPECT_EQ(access.count(Port(web, TlsSite::Plain) + " GET http://"), 2) << access.toStdString();
    EXPECT_EQ(access.count(Port(web, TlsSite::Good) + " GET https://"), 1) << access.toStdString();
    EXPECT_EQ(statuses.filter("Connecting to ").size(), 3);
}

TEST_F(TlsServiceTest, ASecureConnectionServesOnlyTheServerItWasVerifiedFor) {
    object.SetRemoteHost(web.Address(TlsSite::Good));
    ASSERT_TRUE(object.Initialise()) << object.LastError().toStdString();
    // The text now names another server: the open connection was verified
    // for the first one only, so the request goes to the new one, whose
    // certificate is then refused.
    ShortGap();
    object.SetRemoteHost(web.Address(TlsSite::Expired));
    EXPECT_FALSE(object.Initialise());
    EXPECT_TRUE(object.LastError().contains("The certificate has expired"))
        << object.LastError().toStdString();
    EXPECT_EQ(AccessCount("wd.php", 1), 1) << AccessLog().toStdString();
}

// Both fail before a byte is sent, with the whole reason.
TEST_F(TlsServiceTest, AnHttpsAddressFailsOnASocketWithoutTlsAndWithACaFileWithoutACertificate) {
    ShortGap();
    const QString prefix = "*Not* connected to " + web.Address(TlsSite::Good) +
                           ": No secure connection to localhost:" + Port(web, TlsSite::Good);
    TcpSocketControl plainOnly;
    object.MyWinsock(&plainOnly);
    object.SetRemoteHost(web.Address(TlsSite::Good));
    EXPECT_FALSE(object.Initialise());
    EXPECT_EQ(object.LastError(), prefix + ": this connection cannot use TLS");
    EXPECT_EQ(plainOnly.State(), kSocketClosed);

    object.MyWinsock(&socket);
    const QString notACert = web.CertFolder() + "/not_a_cert.pem";
    TlsTrust::SetExtraCaFiles({notACert});
    EXPECT_FALSE(object.Initialise());
    EXPECT_EQ(object.LastError(),
              prefix + ": The CA file " + notACert + " holds no certificate in PEM form");
    EXPECT_TRUE(AccessLog().isEmpty()) << AccessLog().toStdString();
}

} // namespace
} // namespace quorvel::testing
