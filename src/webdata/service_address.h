#pragma once
// The HTTP server text of the configuration ("host", "host:port",
// "https://host[:port]") read for connecting: whether the exchange runs over
// TLS, where to connect, and the "host[:port]" that the request line and the
// Host header carry.

#include <QString>

namespace quorvel {

struct ServiceAddress {
    bool secure = false; // "https://" in front: TLS, never plain text
    QString hostPort;    // the text after the scheme, up to the first "/"
    QString host;        // for connecting and for the certificate's name check
    int port = 80;
};

// plainPort is the port of a plain text without one; a secure one uses 443.
// The scheme is matched without regard to case; "http://" is taken as plain.
ServiceAddress ParseServiceAddress(const QString& httpServer, int plainPort = 80);

// "https" or "http", for the request line.
QString ServiceScheme(const ServiceAddress& address);

} // namespace quorvel
