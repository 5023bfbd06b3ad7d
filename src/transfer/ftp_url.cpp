#include "transfer/ftp_url.h"

#include <QUrl>

#include <array>
#include <utility>

namespace quorvel {

namespace {

struct Scheme {
    const char* prefix;
    FtpTls tls;
};
constexpr std::array<Scheme, 3> kSchemes{{
    {"ftpes://", FtpTls::Explicit},
    {"ftps://", FtpTls::Implicit},
    {"ftp://", FtpTls::None},
}};

// The server text without its scheme, and the security the scheme names.
std::pair<QString, FtpTls> Split(const QString& server) {
    QString host = server.trimmed();
    FtpTls tls = FtpTls::None;
    for (const Scheme& scheme : kSchemes) {
        const QString prefix = QString::fromLatin1(scheme.prefix);
        if (host.startsWith(prefix, Qt::CaseInsensitive)) {
            host = host.mid(prefix.size());
            tls = scheme.tls;
            break;
        }
    }
    while (host.endsWith(QLatin1Char('/')))
        host.chop(1);
    return {host, tls};
}

} // namespace

FtpTls FtpTlsOf(const QString& server) {
    return Split(server).second;
}

QByteArray FtpServerUrl(const QString& server) {
    const auto [host, tls] = Split(server);
    return (tls == FtpTls::Implicit ? "ftps://" : "ftp://") + host.toUtf8() + '/';
}

QByteArray FtpFileUrl(const QString& server, const QString& remote) {
    return FtpServerUrl(server) + QUrl::toPercentEncoding(remote, "/");
}

QString FtpHostName(const QString& server) {
    const QString host = Split(server).first;
    const qsizetype slash = host.indexOf(QLatin1Char('/'));
    QString authority = slash < 0 ? host : host.left(slash);
    if (const qsizetype at = authority.lastIndexOf(QLatin1Char('@')); at >= 0)
        authority = authority.mid(at + 1);
    if (authority.startsWith(QLatin1Char('[')))
        return authority.left(authority.indexOf(QLatin1Char(']')) + 1);
    const qsizetype colon = authority.lastIndexOf(QLatin1Char(':'));
    return colon < 0 ? authority : authority.left(colon);
}

} // namespace quorvel
