#include "webdata/socket_control.h"

#include <array>

namespace quorvel {

QString SocketStateText(std::int32_t code) {
    static const std::array<const char*, 10> texts = {"Closed",
                                                      "Open",
                                                      "Listening",
                                                      "Connection pending",
                                                      "Resolving Host",
                                                      "Host resolved",
                                                      "Connecting",
                                                      "Connected",
                                                      "Peer is closing the connection",
                                                      "Error"};
    if (code >= 0 && code < static_cast<std::int32_t>(texts.size()))
        return QString::fromLatin1(texts[static_cast<std::size_t>(code)]);
    return QStringLiteral("WStatus:") + QString::number(code);
}

int SocketStateOf(QAbstractSocket::SocketState state, bool ready) {
    switch (state) {
    case QAbstractSocket::UnconnectedState:
        return kSocketClosed;
    case QAbstractSocket::HostLookupState:
        return kSocketResolvingHost;
    case QAbstractSocket::ConnectingState:
        return kSocketConnecting;
    case QAbstractSocket::ConnectedState:
        return ready ? kSocketConnected : kSocketConnecting;
    case QAbstractSocket::BoundState:
        return kSocketOpen;
    case QAbstractSocket::ListeningState:
        return kSocketListening;
    case QAbstractSocket::ClosingState:
        return kSocketPeerClosing;
    }
    return kSocketClosed;
}

void LookForArrivals(QAbstractSocket& socket) {
    for (int look = 0; look < 8 && socket.state() == QAbstractSocket::ConnectedState; ++look)
        if (!socket.waitForReadyRead(0)) break;
}

} // namespace quorvel
