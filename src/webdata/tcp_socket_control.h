#pragma once
// SocketControl over QTcpSocket.

#include "webdata/socket_control.h"

#include <QTcpSocket>

namespace quorvel {

class TcpSocketControl : public SocketControl {
    Q_OBJECT
public:
    // index is only carried in the events, for traces.
    explicit TcpSocketControl(int index = 0, QObject* parent = nullptr);
    ~TcpSocketControl() override;

    int State() const override;
    void Close() override;
    void SetRemotePort(int port) override { port_ = port; }
    void SetRemoteHost(const QString& host) override { host_ = host; }
    void Connect() override;
    bool SendData(const QByteArray& bytes) override;
    QByteArray GetData() override;
    // A client socket has nothing to accept; kept for the interface.
    void Accept(std::int32_t) override {}
    void Refresh() override;

private:
    void OnConnected();
    void OnReadyRead();
    void OnDisconnected();
    void OnError(QAbstractSocket::SocketError error);
    void OnBytesWritten(qint64 bytes);

    QTcpSocket socket_;
    int index_;
    int port_ = 80;
    QString host_;
    bool failed_ = false;     // an error was reported since the last Connect or Close
    bool peerClosed_ = false; // the peer closed since the last Connect or Close
    bool closing_ = false;    // our own Close is under way
};

} // namespace quorvel
