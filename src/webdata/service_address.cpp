#include "webdata/service_address.h"

#include "webdata/request.h"

namespace quorvel {

namespace {
constexpr int kTlsPort = 443;
const QString kHttps = QStringLiteral("https://");
const QString kHttp = QStringLiteral("http://");
} // namespace

ServiceAddress ParseServiceAddress(const QString& httpServer, int plainPort) {
    ServiceAddress address;
    QString rest = httpServer;
    if (rest.startsWith(kHttps, Qt::CaseInsensitive)) {
        address.secure = true;
        rest = rest.mid(kHttps.size());
    } else if (rest.startsWith(kHttp, Qt::CaseInsensitive)) {
        rest = rest.mid(kHttp.size());
    } else {
        // The described form: the text is the host as it stands.
        address.hostPort = httpServer;
        const HostPort target = SplitHostPort(httpServer, plainPort);
        address.host = target.host;
        address.port = target.port;
        return address;
    }
    // After a scheme only the authority counts; a path or a trailing "/" of
    // an address copied from a browser is dropped.
    const qsizetype slash = rest.indexOf(QLatin1Char('/'));
    if (slash >= 0) rest.truncate(slash);
    address.hostPort = rest;
    const HostPort target = SplitHostPort(rest, address.secure ? kTlsPort : plainPort);
    address.host = target.host;
    address.port = target.port;
    return address;
}

QString ServiceScheme(const ServiceAddress& address) {
    return address.secure ? QStringLiteral("https") : QStringLiteral("http");
}

} // namespace quorvel
