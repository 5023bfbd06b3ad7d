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

} // namespace quorvel
