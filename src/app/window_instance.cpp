#include "app/window_instance.h"

#include <QCryptographicHash>
#include <QDir>
#include <QLocalSocket>

namespace quorvel {

namespace {

constexpr char kShowRequest[] = "show\n";
constexpr char kShowAnswer[] = "shown\n";

QString NameFor(const QString& folder) {
    const QByteArray key = (QDir(folder).absolutePath() + u'|' + QDir::homePath()).toUtf8();
    return QStringLiteral("quorvel-") +
           QString::fromLatin1(
               QCryptographicHash::hash(key, QCryptographicHash::Sha1).toHex().left(16));
}

} // namespace

WindowInstance::WindowInstance(const QString& folder, QObject* parent)
    : QObject(parent), lockPath_(QDir(folder).filePath(QString::fromLatin1(kFileName))),
      serverName_(NameFor(folder)), lock_(lockPath_) {
    // A window stays open for months: only a holder that no longer exists
    // makes the lock stale.
    lock_.setStaleLockTime(0);
    server_.setSocketOptions(QLocalServer::UserAccessOption);
    connect(&server_, &QLocalServer::newConnection, this, [this] { Answer(); });
}

WindowInstance::~WindowInstance() {
    server_.close();
    if (lock_.isLocked()) lock_.unlock();
}

bool WindowInstance::Claim() {
    if (!lock_.tryLock(0)) return false;
    // A socket left by a killed window is ours to replace now.
    QLocalServer::removeServer(serverName_);
    server_.listen(serverName_);
    return true;
}

bool WindowInstance::AskHolderToShow(std::chrono::milliseconds wait) {
    QLocalSocket socket;
    socket.connectToServer(serverName_);
    const int ms = static_cast<int>(wait.count());
    if (!socket.waitForConnected(ms)) return false;
    socket.write(kShowRequest);
    if (!socket.waitForBytesWritten(ms)) return false;
    while (!socket.canReadLine()) {
        if (!socket.waitForReadyRead(ms)) return false;
    }
    return socket.readLine() == kShowAnswer;
}

void WindowInstance::Answer() {
    while (QLocalSocket* socket = server_.nextPendingConnection()) {
        connect(socket, &QLocalSocket::disconnected, socket, &QObject::deleteLater);
        connect(socket, &QLocalSocket::readyRead, this, [this, socket] {
            if (!socket->canReadLine()) return;
            if (socket->readLine() != kShowRequest) {
                socket->disconnectFromServer();
                return;
            }
            Q_EMIT ShowRequested();
            socket->write(kShowAnswer);
            socket->flush();
        });
    }
}

} // namespace quorvel
