#pragma once
// Addresses of the FTP server and of a remote file, as curl takes them.
//
// The server text chooses the security: "ftps://" implicit TLS (port 990
// unless given), "ftpes://" explicit TLS that must succeed (AUTH TLS on the
// usual port), "ftp://" or no scheme plain FTP. Both TLS kinds protect the
// data connections too.

#include <QByteArray>
#include <QString>

namespace quorvel {

enum class FtpTls { None, Implicit, Explicit };

// The security the server text asks for (the scheme in any letter case).
FtpTls FtpTlsOf(const QString& server);
// "host", "host:port" or "SCHEME://host[:port][/]" gives "ftp://host[:port]/",
// or "ftps://host[:port]/" for implicit TLS.
QByteArray FtpServerUrl(const QString& server);
// The server's address followed by the remote name, percent-encoded; the name
// reaches the server as given (a leading "/" makes it absolute).
QByteArray FtpFileUrl(const QString& server, const QString& remote);
// The host part alone, for the name look-up status.
QString FtpHostName(const QString& server);

} // namespace quorvel
