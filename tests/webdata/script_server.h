#pragma once
// A loopback HTTP peer whose answers are scripted byte by byte: it can split a
// reply anywhere, pause, close mid-reply or never answer.

#include <QByteArray>
#include <QList>
#include <QObject>
#include <QTcpServer>
#include <QTcpSocket>

#include <deque>
#include <vector>

namespace quorvel::testing {

struct Step {
    enum Kind { kSend, kPause, kClose };
    Kind kind = kSend;
    QByteArray bytes;
    int ms = 0;
};
using Reply = std::vector<Step>;

Step Send(const QByteArray& bytes);
Step Pause(int ms);
Step CloseConnection();

// "HTTP/1.1 200 OK", a Content-Length and the given extra header lines, then body.
QByteArray HttpReply(const QByteArray& body, const QByteArray& extraHeaders = {});
// The same body in chunked coding, cut into chunks of the given sizes (the
// rest goes into one last chunk).
QByteArray ChunkedReply(const QByteArray& body, const QList<int>& sizes);
// Bytes sent in pieces cut at the given offsets, with a short pause between
// pieces so that each arrives on its own.
Reply SplitAt(const QByteArray& bytes, const QList<qsizetype>& offsets, int pauseMs = 5);

class ScriptServer : public QObject {
    Q_OBJECT
public:
    ScriptServer();
    ~ScriptServer() override;

    quint16 Port() const { return server_.serverPort(); }
    QString HostPort() const;
    // Replies go to requests in order; a request without a queued reply gets no answer.
    void Queue(const Reply& reply) { replies_.push_back(reply); }
    void Queue(const QByteArray& bytes) { Queue(Reply{Send(bytes)}); }

    QList<QByteArray> requests; // each request's bytes, up to and with its blank line
    int connections = 0;
    int sends = 0; // Send steps carried out

private:
    struct Peer {
        QTcpSocket* socket;
        QByteArray buffer;
    };
    void OnConnection();
    void OnReadyRead(QTcpSocket* socket);
    void Run(QTcpSocket* socket, Reply reply, std::size_t step);

    QTcpServer server_;
    std::deque<Reply> replies_;
    QList<Peer> peers_;
};

} // namespace quorvel::testing
