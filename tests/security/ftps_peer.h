#pragma once
// An FTP server over TLS (ftps_peer.py) on a loopback port for one test, with
// user "logger" and password "secret" (unless given) over a root folder.

#include <QProcess>
#include <QString>
#include <QStringList>
#include <QTemporaryDir>

namespace quorvel::testing {

class FtpsPeer {
public:
    ~FtpsPeer() { Stop(); }
    // mode: "implicit", "explicit" or "plain"; certStem names a certificate
    // of make_certs.py in certFolder ("good", "expired", ...).
    bool Start(const QString& mode, const QString& root, const QString& certFolder,
               const QString& certStem = "good", const QString& password = "secret");
    void Stop();
    int Port() const { return port_; }
    QString Log() const;
    // The commands received so far, waiting (bounded) for `expected` of them.
    QStringList Commands(int expected = 0) const;
    // How often the log holds text, waiting (bounded) for `expected`.
    int Count(const QString& text, int expected) const;

private:
    QTemporaryDir logDir_;
    QProcess process_;
    int port_ = 0;
};

} // namespace quorvel::testing
