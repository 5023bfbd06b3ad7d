#pragma once
// TLS settings every curl handle of the program gets: the peer's certificate
// and host name are always verified, against the system's store plus the
// extra CAs of TlsTrust (a private service's CA). There is no switch to turn
// verification off.

#include <curl/curl.h>

#include <QString>

namespace quorvel {

// False, with the reason naming the CA file, when an extra CA cannot be used;
// the caller then does not connect.
bool ApplyTlsTrust(CURL* curl, QString& error);

} // namespace quorvel
