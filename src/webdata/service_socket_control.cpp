#include "webdata/service_socket_control.h"

namespace quorvel {

ServiceSocketControl::ServiceSocketControl(int index, QObject* parent)
    : SocketControl(parent), plain_(index), tls_(index) {
    Relay(plain_);
    Relay(tls_);
}

void ServiceSocketControl::Relay(SocketControl& from) {
    // Only the socket in use raises events; the other one is closed.
    connect(&from, &SocketControl::Closed, this, &SocketControl::Closed);
    connect(&from, &SocketControl::Connected, this, &SocketControl::Connected);
    connect(&from, &SocketControl::ConnectionRequested, this, &SocketControl::ConnectionRequested);
    connect(&from, &SocketControl::DataArrived, this, &SocketControl::DataArrived);
    connect(&from, &SocketControl::ErrorOccurred, this, &SocketControl::ErrorOccurred);
    connect(&from, &SocketControl::SendCompleted, this, &SocketControl::SendCompleted);
    connect(&from, &SocketControl::SendProgressed, this, &SocketControl::SendProgressed);
}

void ServiceSocketControl::Close() {
    plain_.Close();
    tls_.Close();
}

void ServiceSocketControl::SetRemotePort(int port) {
    plain_.SetRemotePort(port);
    tls_.SetRemotePort(port);
}

void ServiceSocketControl::SetRemoteHost(const QString& host) {
    plain_.SetRemoteHost(host);
    tls_.SetRemoteHost(host);
}

bool ServiceSocketControl::SetEncrypted(bool on) {
    if (on == secure_) return true;
    // A connection of the other kind never serves the next request.
    Close();
    secure_ = on;
    return true;
}

} // namespace quorvel
