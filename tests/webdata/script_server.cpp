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

// One accepted connection. Its replies go out in the order of the requests:
// a request that comes while an earlier reply is still under way (paused)
// gets its answer when that reply has ended, as from a real server.
struct ScriptServer::Connection {
    QPointer<QTcpSocket> socket;
    QByteArray received; // request bytes not yet cut at a blank line
    std::deque<Reply> waiting;
    bool replying = false;
};

ScriptServer::ScriptServer() {
    connect(&server_, &QTcpServer::newConnection, this, [this] {
        while (QTcpSocket* socket = server_.nextPendingConnection()) {
            ++connections;
            sockets_ << socket;
            // Each step's bytes leave at once, not held back for the client's
            // acknowledgement of the step before.
            socket->setSocketOption(QAbstractSocket::LowDelayOption, 1);
            auto c = std::make_shared<Connection>();
            c->socket = socket;
            connect(socket, &QTcpSocket::readyRead, this, [this, c] { TakeRequests(c); });
        }
    });
    server_.listen(QHostAddress::LocalHost, 0);
}

ScriptServer::~ScriptServer() = default;

void ScriptServer::TakeRequests(const std::shared_ptr<Connection>& c) {
    c->received += c->socket->readAll();
    for (qsizetype end; (end = c->received.indexOf("\r\n\r\n")) >= 0;) {
        requests << c->received.left(end + 4);
        c->received.remove(0, end + 4);
        Reply reply;
        if (!replies.empty()) {
            reply = replies.front();
            replies.pop_front();
        } else if (responder) {
            reply = responder(requests.last());
        }
        c->waiting.push_back(std::move(reply));
    }
    if (!c->replying) NextReply(c);
}

void ScriptServer::NextReply(const std::shared_ptr<Connection>& c) {
    if (c->waiting.empty() || !c->socket) return;
    c->replying = true;
    Reply reply = std::move(c->waiting.front());
    c->waiting.pop_front();
    Run(c, std::move(reply), 0);
}

void ScriptServer::CloseAll() {
    for (const QPointer<QTcpSocket>& socket : std::as_const(sockets_))
        if (socket) socket->disconnectFromHost();
    sockets_.clear();
}

void ScriptServer::Run(const std::shared_ptr<Connection>& c, const Reply& reply, std::size_t step) {
    for (; step < reply.size(); ++step) {
        if (!c->socket) return;
        switch (reply[step].kind) {
        case Step::kClose:
            c->waiting.clear();
            return c->socket->disconnectFromHost();
        case Step::kAct:
            reply[step].act();
            break;
        case Step::kPause:
            QTimer::singleShot(reply[step].ms, this,
                               [this, c, reply, step] { Run(c, reply, step + 1); });
            return;
        case Step::kSend:
            c->socket->write(reply[step].bytes);
            c->socket->flush();
            ++sends;
            break;
        }
    }
    c->replying = false;
    NextReply(c);
}

} // namespace quorvel::testing
