#include "script_server.h"

#include <QPointer>
#include <QTimer>

namespace quorvel::testing {

Step Send(const QByteArray& bytes) {
    return {Step::kSend, bytes, 0};
}
Step Pause(int ms) {
    return {Step::kPause, {}, ms};
}
Step CloseConnection() {
    return {Step::kClose, {}, 0};
}

QByteArray HttpReply(const QByteArray& body, const QByteArray& extraHeaders) {
    return "HTTP/1.1 200 OK\r\nContent-Type: text/plain\r\nContent-Length: " +
           QByteArray::number(body.size()) + "\r\n" + extraHeaders + "\r\n" + body;
}

QByteArray ChunkedReply(const QByteArray& body, const QList<int>& sizes) {
    QByteArray out =
        "HTTP/1.1 200 OK\r\nContent-Type: text/plain\r\nTransfer-Encoding: chunked\r\n\r\n";
    qsizetype pos = 0;
    auto chunk = [&](qsizetype n) {
        out += QByteArray::number(qulonglong(n), 16) + "\r\n" + body.mid(pos, n) + "\r\n";
        pos += n;
    };
    for (const int size : sizes)
        if (pos + size <= body.size()) chunk(size);
    if (pos < body.size()) chunk(body.size() - pos);
    return out + "0\r\n\r\n";
}

Reply SplitAt(const QByteArray& bytes, const QList<qsizetype>& offsets, int pauseMs) {
    Reply reply;
    qsizetype from = 0;
    for (const qsizetype at : offsets) {
        reply.push_back(Send(bytes.mid(from, at - from)));
        reply.push_back(Pause(pauseMs));
        from = at;
    }
    reply.push_back(Send(bytes.mid(from)));
    return reply;
}

ScriptServer::ScriptServer() {
    connect(&server_, &QTcpServer::newConnection, this, &ScriptServer::OnConnection);
    server_.listen(QHostAddress::LocalHost, 0);
}

ScriptServer::~ScriptServer() {
    for (const Peer& peer : peers_)
        peer.socket->abort();
}

QString ScriptServer::HostPort() const {
    return QStringLiteral("127.0.0.1:") + QString::number(Port());
}

void ScriptServer::OnConnection() {
    while (QTcpSocket* socket = server_.nextPendingConnection()) {
        ++connections;
        socket->setParent(this);
        peers_.append(Peer{socket, {}});
        connect(socket, &QTcpSocket::readyRead, this, [this, socket] { OnReadyRead(socket); });
    }
}

void ScriptServer::OnReadyRead(QTcpSocket* socket) {
    for (Peer& peer : peers_) {
        if (peer.socket != socket) continue;
        peer.buffer += socket->readAll();
        qsizetype end;
        while ((end = peer.buffer.indexOf("\r\n\r\n")) >= 0) {
            requests << peer.buffer.left(end + 4);
            peer.buffer.remove(0, end + 4);
            if (replies_.empty()) continue;
            Reply reply = replies_.front();
            replies_.pop_front();
            Run(socket, reply, 0);
        }
    }
}

void ScriptServer::Run(QTcpSocket* socket, Reply reply, std::size_t step) {
    for (; step < reply.size(); ++step) {
        const Step& s = reply[step];
        if (s.kind == Step::kSend) {
            socket->write(s.bytes);
            socket->flush();
            ++sends;
        } else if (s.kind == Step::kClose) {
            socket->disconnectFromHost();
            return;
        } else {
            QPointer<QTcpSocket> guard(socket);
            QTimer::singleShot(s.ms, this, [this, guard, reply, step] {
                if (guard) Run(guard, reply, step + 1);
            });
            return;
        }
    }
}

} // namespace quorvel::testing
