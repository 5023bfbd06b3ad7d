#pragma once
// SocketControl over QSslSocket: the exchange with the service over TLS.
//
// The connection counts as made (State 7, Connected) only once the handshake
// has succeeded and the certificate was verified against the system's store
// and the extra CAs of TlsTrust, for the host name given. Any certificate
// problem ends the connection: Error carries the host and the reasons, and
// nothing is ever sent over a connection that was not verified. There is no
// way to accept a certificate that failed.

#include "webdata/socket_control.h"

#include <QList>
#include <QSslError>
#include <QSslSocket>

namespace quorvel {

class SslSocketControl : public SocketControl {
    Q_OBJECT
public:
    explicit SslSocketControl(int index = 0, QObject* parent = nullptr);
    ~SslSocketControl() override;

    int State() const override;
    void Close() override;
    void SetRemotePort(int port) override { port_ = port; }
    void SetRemoteHost(const QString& host) override { host_ = host; }
    // Only TLS: a request for plain text is refused.
    bool SetEncrypted(bool on) override { return on; }
    bool Encrypted() const override { return true; }
    void Connect() override;
    bool SendData(const QByteArray& bytes) override;
    QByteArray GetData() override;
    void Accept(std::int32_t) override {}
    void Refresh() override;

    // "host:port" as the reports name it.
    QString Peer() const;

private:
    void OnEncrypted();
    void OnReadyRead();
    void AnnounceArrival();
    void OnDisconnected();
    void OnError(QAbstractSocket::SocketError error);
    void OnSslErrors(const QList<QSslError>& errors);
    void OnBytesWritten(qint64 bytes);
    // Reports a failure found before any byte went out (Connect returns first).
    void FailLater(const QString& description);
    QString Describe(QAbstractSocket::SocketError error) const;

    QSslSocket socket_;
    int index_;
    int port_ = 443;
    QString host_;
    QList<QSslError> sslErrors_; // what the last handshake found wrong
    bool failed_ = false;
    bool peerClosed_ = false;
    bool closing_ = false;
    bool verified_ = false;      // the handshake of this connection succeeded
    bool arrivalPosted_ = false; // an announcement of received bytes is queued
};

} // namespace quorvel
