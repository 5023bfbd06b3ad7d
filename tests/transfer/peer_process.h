#pragma once
// A test peer: a Python server script started on a loopback port and killed at
// the end of the test.

#include <QProcess>
#include <QString>
#include <QStringList>
#include <QTemporaryDir>

namespace quorvel::testing {

class PeerProcess {
public:
    ~PeerProcess() { Stop(); }
    // Starts `script` (in the test folder) with the arguments; the script prints
    // its port once it listens. False when it did not come up in time.
    bool Start(const QString& script, const QStringList& args);
    void Stop();
    int Port() const { return port_; }
    // Everything the peer logged so far.
    QString Log();
    // How often the log holds the text, waiting (bounded) until it reaches `expected`.
    int CountInLog(const QString& text, int expected);

private:
    QString LogFile() const;

    QTemporaryDir logDir_;
    QProcess process_;
    int port_ = 0;
};

// An FTP server with user "logger" and password "secret" over a root folder,
// with the faults of ftp_peer.py given as a JSON list.
class FtpPeer : public PeerProcess {
public:
    bool Start(const QString& root, int port = 0, const QByteArray& faults = "[]");
    QString Server() const { return QStringLiteral("127.0.0.1:") + QString::number(Port()); }
    int Logins(int expected) { return CountInLog(QStringLiteral(" logged in."), expected); }
    // The commands received so far, in order, waiting (bounded) for `expected` of them.
    QStringList Commands(int expected = 0);
};

} // namespace quorvel::testing
