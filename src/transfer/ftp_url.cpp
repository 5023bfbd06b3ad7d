#include "transfer/ftp_url.h"

#include <QUrl>

namespace quorvel {

namespace {
QString HostAndPort(const QString& server) {
    QString host = server.trimmed();
    if (host.startsWith(QStringLiteral("ftp://"), Qt::CaseInsensitive)) host = host.mid(6);
    while (host.endsWith(QLatin1Char('/')))
        host.chop(1);
    return host;
}
} // namespace

QByteArray FtpServerUrl(const QString& server) {
    return "ftp://" + HostAndPort(server).toUtf8() + '/';
}

QByteArray FtpFileUrl(const QString& server, const QString& remote) {
    return FtpServerUrl(server) + QUrl::toPercentEncoding(remote, "/");
}

QString FtpHostName(const QString& server) {
    const QString host = HostAndPort(server);
    const qsizetype slash = host.indexOf(QLatin1Char('/'));
    const QString authority = slash < 0 ? host : host.left(slash);
    if (authority.startsWith(QLatin1Char('[')))
        return authority.left(authority.indexOf(QLatin1Char(']')) + 1);
    const qsizetype colon = authority.lastIndexOf(QLatin1Char(':'));
    return colon < 0 ? authority : authority.left(colon);
}

} // namespace quorvel
