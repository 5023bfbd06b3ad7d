#pragma once
// The window's socket for the web-data exchange: plain TCP or TLS, chosen
// before each connection from the HTTP server text ("https://" means TLS).
// It holds one socket of each kind and passes every call to the one chosen;
// their events come out as its own.

#include "webdata/socket_control.h"
#include "webdata/ssl_socket_control.h"
#include "webdata/tcp_socket_control.h"

namespace quorvel {

class ServiceSocketControl : public SocketControl {
    Q_OBJECT
public:
    explicit ServiceSocketControl(int index = 0, QObject* parent = nullptr);

    int State() const override { return Active().State(); }
    void Close() override;
    void SetRemotePort(int port) override;
    void SetRemoteHost(const QString& host) override;
    // Takes effect at the next Connect; the open connection stays as it is.
    bool SetEncrypted(bool on) override;
    bool Encrypted() const override { return secure_; }
    void Connect() override { Active().Connect(); }
    bool SendData(const QByteArray& bytes) override { return Active().SendData(bytes); }
    QByteArray GetData() override { return Active().GetData(); }
    void Accept(std::int32_t requestId) override { Active().Accept(requestId); }
    void Refresh() override { Active().Refresh(); }

private:
    SocketControl& Active() { return secure_ ? static_cast<SocketControl&>(tls_) : plain_; }
    const SocketControl& Active() const {
        return secure_ ? static_cast<const SocketControl&>(tls_) : plain_;
    }
    void Relay(SocketControl& from);

    TcpSocketControl plain_;
    SslSocketControl tls_;
    bool secure_ = false;
};

} // namespace quorvel
