#include "webdata/tcp_socket_control.h"

namespace quorvel {

namespace {
// Bytes the socket holds before it stops reading from the network, so that a
// large reply never piles up in memory faster than it is consumed. Arrivals of
// this size reuse the same memory; larger ones each touch fresh pages, which
// costs more than the extra turns of the event loop.
constexpr qint64 kReadBufferLimit = 256 << 10;
} // namespace

TcpSocketControl::TcpSocketControl(int index, QObject* parent)
    : SocketControl(parent), index_(index) {
    socket_.setReadBufferSize(kReadBufferLimit);
    connect(&socket_, &QTcpSocket::connected, this, &TcpSocketControl::OnConnected);
    connect(&socket_, &QTcpSocket::readyRead, this, &TcpSocketControl::OnReadyRead);
    connect(&socket_, &QTcpSocket::disconnected, this, &TcpSocketControl::OnDisconnected);
    connect(&socket_, &QTcpSocket::errorOccurred, this, &TcpSocketControl::OnError);
    connect(&socket_, &QTcpSocket::bytesWritten, this, &TcpSocketControl::OnBytesWritten);
}

TcpSocketControl::~TcpSocketControl() {
    closing_ = true;
    socket_.abort();
}

int TcpSocketControl::State() const {
    if (failed_) return kSocketError;
    if (peerClosed_) return kSocketPeerClosing;
    return SocketStateOf(socket_.state());
}

void TcpSocketControl::Close() {
    closing_ = true;
    socket_.abort();
    closing_ = false;
    failed_ = false;
    peerClosed_ = false;
}

void TcpSocketControl::Connect() {
    failed_ = false;
    peerClosed_ = false;
    socket_.connectToHost(host_, static_cast<quint16>(port_));
}

bool TcpSocketControl::SendData(const QByteArray& bytes) {
    if (socket_.state() != QAbstractSocket::ConnectedState) return false;
    return socket_.write(bytes) == bytes.size();
}

QByteArray TcpSocketControl::GetData() {
    // Exactly what is there, in one piece: readAll grows its result by steps.
    return socket_.read(socket_.bytesAvailable());
}

void TcpSocketControl::Refresh() {
    LookForArrivals(socket_);
}

void TcpSocketControl::OnConnected() {
    // A request goes out line by line; none of them may wait for the peer's
    // acknowledgement of the one before.
    socket_.setSocketOption(QAbstractSocket::LowDelayOption, 1);
    Q_EMIT Connected(index_);
}

void TcpSocketControl::OnReadyRead() {
    const qint64 waiting = socket_.bytesAvailable();
    if (waiting > 0) Q_EMIT DataArrived(index_, waiting);
}

void TcpSocketControl::OnDisconnected() {
    if (closing_) return;
    peerClosed_ = true;
    // Bytes that came with the close are handed over before the close itself.
    OnReadyRead();
    Q_EMIT Closed(index_);
}

void TcpSocketControl::OnError(QAbstractSocket::SocketError error) {
    // A peer closing is an ordinary close, not a failure; a look that found
    // nothing (Refresh) is no failure either.
    if (error == QAbstractSocket::RemoteHostClosedError ||
        error == QAbstractSocket::SocketTimeoutError || closing_)
        return;
    failed_ = true;
    Q_EMIT ErrorOccurred(index_, static_cast<int>(error), socket_.errorString());
}

void TcpSocketControl::OnBytesWritten(qint64 bytes) {
    const qint64 remaining = socket_.bytesToWrite();
    Q_EMIT SendProgressed(index_, bytes, remaining);
    if (remaining == 0) Q_EMIT SendCompleted(index_);
}

} // namespace quorvel
