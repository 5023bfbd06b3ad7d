#include "script_server.h"

#include <QPointer>
#include <QTcpSocket>
#include <QTimer>

#include <algorithm>
#include <memory>

namespace quorvel::testing {

QByteArray HttpReply(const QByteArray& body, const QByteArray& extraHeaders) {
    return "HTTP/1.1 200 OK\r\nContent-Type: text/plain\r\nContent-Length: " +
           QByteArray::number(body.size()) + "\r\n" + extraHeaders + "\r\n" + body;
}

QByteArray ChunkedReply(const QByteArray& body, const QList<int>& sizes) {
    QByteArray out = "HTTP/1.1 200 OK\r\nTransfer-Encoding: chunked\r\n\r\n";
    qsizetype pos = 0;
    for (qsizetype n : sizes + QList<int>{int(body.size())}) {
        n = std::min(n, body.size() - pos);
        if (n > 0)
            out += QByteArray::number(qulonglong(n), 16) + "\r\n" + body.mid(pos, n) + "\r\n";
        pos += n;
    }
    return out + "0\r\n\r\n";
}

Reply SplitAt(const QByteArray& bytes, const QList<qsizetype>& offsets) {
    Reply reply;
    qsizetype from = 0;
    for (const qsizetype at : offsets) {
        reply.insert(reply.end(), {Send(bytes.mid(from, at - from)), Pause(5)});
        from = at;
    }
    reply.push_back(Send(bytes.mid(from)));
    return reply;
}

ScriptServer::ScriptServer() {
    connect(&server_, &QTcpServer::newConnection, this, [this] {
        while (QTcpSocket* socket = server_.nextPendingConnection()) {
            ++connections;
            sockets_ << socket;
            auto buffer = std::make_shared<QByteArray>();
            connect(socket, &QTcpSocket::readyRead, this, [this, socket, buffer] {
                *buffer += socket->readAll();
                for (qsizetype end; (end = buffer->indexOf("\r\n\r\n")) >= 0;) {
                    requests << buffer->left(end + 4);
                    buffer->remove(0, end + 4);
                    Reply reply;
                    if (!replies.empty()) {
                        reply = replies.front();
                        replies.pop_front();
                    } else if (responder) {
                        reply = responder(requests.last());
                    }
                    Run(socket, reply, 0);
                }
            });
        }
    });
    server_.listen(QHostAddress::LocalHost, 0);
}

void ScriptServer::CloseAll() {
    for (const QPointer<QTcpSocket>& socket : std::as_const(sockets_))
        if (socket) socket->disconnectFromHost();
    sockets_.clear();
}

void ScriptServer::Run(QTcpSocket* socket, const Reply& reply, std::size_t step) {
    for (; step < reply.size(); ++step) {
        if (reply[step].kind == Step::kClose) return socket->disconnectFromHost();
        if (reply[step].kind == Step::kPause) {
            QTimer::singleShot(reply[step].ms, this, [this, guard = QPointer(socket), reply, step] {
                if (guard) Run(guard, reply, step + 1);
            });
            return;
        }
        socket->write(reply[step].bytes);
        socket->flush();
        ++sends;
    }
}

} // namespace quorvel::testing
