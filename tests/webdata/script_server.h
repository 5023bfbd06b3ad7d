#pragma once
// A loopback HTTP peer whose answers are scripted step by step: it can split a
// reply anywhere, pause, close mid-reply or never answer.

#include <QByteArray>
#include <QList>
#include <QPointer>
#include <QTcpServer>

#include <deque>
#include <functional>
#include <memory>
#include <vector>

class QTcpSocket;

namespace quorvel::testing {

struct Step {
    enum Kind { kSend, kPause, kClose, kAct } kind;
    QByteArray bytes;
    int ms = 0;
    std::function<void()> act; // kAct: runs on the server's side, then the next step follows
};
using Reply = std::vector<Step>;

inline const auto Send = [](const QByteArray& bytes) { return Step{Step::kSend, bytes, 0, {}}; };
inline const auto Pause = [](int ms) { return Step{Step::kPause, {}, ms, {}}; };
inline const auto CloseConnection = [] { return Step{Step::kClose, {}, 0, {}}; };
inline const auto Act = [](std::function<void()> act) {
    return Step{Step::kAct, {}, 0, std::move(act)};
};

// "HTTP/1.1 200 OK", a Content-Length and the given extra header lines, then body.
QByteArray HttpReply(const QByteArray& body, const QByteArray& extraHeaders = {});
// The same body in chunked coding, cut into chunks of the given sizes (the
// rest goes into one last chunk).
QByteArray ChunkedReply(const QByteArray& body, const QList<int>& sizes);
// Bytes sent in pieces cut at the given offsets, with a short pause between
// pieces so that each arrives on its own.
Reply SplitAt(const QByteArray& bytes, const QList<qsizetype>& offsets);

class ScriptServer : public QObject {
public:
    ScriptServer();
    ~ScriptServer() override;
    QString HostPort() const { return QStringLiteral("127.0.0.1:%1").arg(server_.serverPort()); }
    void Queue(const Reply& reply) { replies.push_back(reply); }
    void Queue(const QByteArray& bytes) { Queue(Reply{Send(bytes)}); }

    // Ends every connection from this side at once, without waiting for the client.
    void CloseAll();

    // Answers to the coming requests in order; a request finding none goes to
    // the responder, and without one gets no answer.
    std::deque<Reply> replies;
    std::function<Reply(const QByteArray& request)> responder;
    QList<QByteArray> requests; // each request's bytes, up to and with its blank line
    int connections = 0;
    int sends = 0; // Send steps carried out

private:
    struct Connection;
    void TakeRequests(const std::shared_ptr<Connection>& c);
    void NextReply(const std::shared_ptr<Connection>& c);
    void Run(const std::shared_ptr<Connection>& c, const Reply& reply, std::size_t step);

    QTcpServer server_;
    QList<QPointer<QTcpSocket>> sockets_;
};

} // namespace quorvel::testing
