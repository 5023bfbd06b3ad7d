#pragma once
// The one network access of the web-data object: a TCP client socket that is
// polled for its state and reports what happens as events.
//
// Every event is emitted on the thread that owns the socket, from its event
// loop, so it reaches the web-data object only while that object (or the
// window) pumps events.

#include <QAbstractSocket>
#include <QByteArray>
#include <QObject>
#include <QString>

#include <cstdint>

namespace quorvel {

// State codes of the socket, as the window and the traces show them.
enum SocketState : int {
    kSocketClosed = 0,
    kSocketOpen = 1,
    kSocketListening = 2,
    kSocketConnectionPending = 3,
    kSocketResolvingHost = 4,
    kSocketHostResolved = 5,
    kSocketConnecting = 6,
    kSocketConnected = 7,
    kSocketPeerClosing = 8,
    kSocketError = 9,
};

// "Closed", "Connected", ... for 0 to 9; "WStatus:" and the code otherwise.
QString SocketStateText(std::int32_t code);

// The code of a Qt socket's state. A connected socket that may not carry a
// request yet (ready false: a TLS one before its certificate is verified)
// still counts as connecting.
int SocketStateOf(QAbstractSocket::SocketState state, bool ready = true);

// Each look reads what has come, the close included; a few looks take in
// bytes that came just before a close.
void LookForArrivals(QAbstractSocket& socket);

class SocketControl : public QObject {
    Q_OBJECT
public:
    using QObject::QObject;
    ~SocketControl() override = default;

    virtual int State() const = 0;
    // Closes the connection; harmless when it is closed already. Never raises Closed.
    virtual void Close() = 0;
    virtual void SetRemotePort(int port) = 0;
    virtual void SetRemoteHost(const QString& host) = 0;
    // Whether the next Connect runs TLS, with the certificate verified for the
    // remote host. A socket that cannot speak TLS refuses (false), so that a
    // secure address never goes out in plain text.
    virtual bool SetEncrypted(bool on) { return !on; }
    // True when the connection, or the next one, runs TLS.
    virtual bool Encrypted() const { return false; }
    // Returns at once; the outcome shows as State 7 and Connected, or State 9 and Error.
    virtual void Connect() = 0;
    // Queues bytes for sending, in call order; false when the socket cannot take them.
    virtual bool SendData(const QByteArray& bytes) = 0;
    // Every byte received and not yet taken.
    virtual QByteArray GetData() = 0;
    virtual void Accept(std::int32_t requestId) = 0;
    // Looks at the connection now, without waiting and without an event loop:
    // bytes waiting are announced by DataArrived, and a close that the peer
    // sent while nobody looked shows in State and Closed.
    virtual void Refresh() {}

Q_SIGNALS:
    void Closed(int index); // the peer closed the connection
    void Connected(int index);
    void ConnectionRequested(int index, std::int32_t requestId);
    void DataArrived(int index, std::int64_t bytes);
    void ErrorOccurred(int index, int number, const QString& description);
    void SendCompleted(int index);
    void SendProgressed(int index, std::int64_t bytesSent, std::int64_t bytesRemaining);
};

} // namespace quorvel
