#pragma once
// Addresses of the FTP server and of a remote file, as curl takes them.

#include <QByteArray>
#include <QString>

namespace quorvel {

// "host", "host:port" or "ftp://host[:port][/]" gives "ftp://host[:port]/".
QByteArray FtpServerUrl(const QString& server);
// The server's address followed by the remote name, percent-encoded; the name
// reaches the server as given (a leading "/" makes it absolute).
QByteArray FtpFileUrl(const QString& server, const QString& remote);
// The host part alone, for the name look-up status.
QString FtpHostName(const QString& server);

} // namespace quorvel
