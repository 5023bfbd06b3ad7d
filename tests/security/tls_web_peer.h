#pragma once
// TlsWebPeer: the reference service's wd.php, configuration files and file
// lists served by nginx and php-fpm over https on loopback, as a deployment
// would serve them, with certificates made for the test (make_certs.py).
//
// One nginx serves the same data root on several free ports, one per kind of
// certificate, and once in plain text:
//
//   ReferenceService service;                   // only for its data root
//   service.AddUser({.name = "ann", .password = "pw"});
//   TlsWebPeer web;
//   ASSERT_TRUE(web.Start(service.DataRoot())) << web.LastError().toStdString();
//   object.SetRemoteHost(web.Address(TlsSite::Good));   // "https://localhost:PORT"
//   TlsTrust::SetExtraCaFiles({web.CaFile()});          // trust the test's CA
//
// Every site also answers /to-plain/PATH with a redirect to PATH on the plain
// site. The destructor stops both servers; nothing stays running.

#include <QMap>
#include <QProcess>
#include <QString>
#include <QTemporaryDir>

namespace quorvel::testing {

enum class TlsSite {
    Good,      // signed by the test CA for localhost and 127.0.0.1
    Expired,   // signed by the test CA, ran out a year ago
    WrongName, // signed by the test CA for other.example
    Stranger,  // for localhost, signed by a CA nobody trusts
    Plain,     // no TLS at all
};

class TlsWebPeer {
public:
    TlsWebPeer();
    ~TlsWebPeer();
    TlsWebPeer(const TlsWebPeer&) = delete;
    TlsWebPeer& operator=(const TlsWebPeer&) = delete;

    bool Start(const QString& dataRoot);
    void Stop();

    int Port(TlsSite site) const { return ports_.value(site); }
    // "https://localhost:PORT" (also for the plain site: a plain server behind
    // an https address); host may be another name for the same server.
    QString Address(TlsSite site, const QString& host = "localhost") const;
    // "localhost:PORT", the plain site as a plain server text.
    QString HostPort(TlsSite site) const;
    QString CaFile() const { return File("certs/ca.pem"); }
    QString CertFolder() const { return File("certs"); }
    QString LastError() const { return lastError_; }
    QString Log() const;
    // Every request nginx answered so far, "PORT REQUEST-LINE" a line.
    QString AccessLog() const;

private:
    QString File(const QString& name) const { return dir_.filePath(name); }
    bool MakeCertificates();
    bool WriteConfigs(const QString& dataRoot);
    bool StartFpm();
    bool StartNginx();
    bool Fail(const QString& text);

    QTemporaryDir dir_;
    QProcess fpm_;
    QProcess nginx_;
    QMap<TlsSite, int> ports_;
    QString lastError_;
};

// The folder of this test suite's scripts (make_certs.py, ftps_peer.py).
QString SecurityTestDir();
// A loopback port nobody listens on right now.
int FreePort();
// Makes the certificates of make_certs.py in folder.
bool MakeTestCertificates(const QString& folder, QString& error);

} // namespace quorvel::testing
