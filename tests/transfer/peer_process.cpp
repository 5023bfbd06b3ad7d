#include "peer_process.h"

#include <QFile>
#include <QTcpSocket>
#include <QThread>

namespace quorvel::testing {

bool PeerProcess::Start(const QString& script, const QStringList& args) {
    // The log goes to a file: a pipe nobody reads while a benchmark or a long
    // test runs would fill up and stop the peer in the middle of a reply.
    process_.setStandardErrorFile(LogFile());
    process_.setReadChannel(QProcess::StandardOutput);
    process_.start(QStringLiteral("/usr/bin/python3"),
                   QStringList{QStringLiteral(QUORVEL_TRANSFER_TEST_DIR "/") + script} + args);
    // Bounded: the script prints its port as soon as it listens.
    if (!process_.waitForStarted(10000) || !process_.waitForReadyRead(10000)) return false;
    port_ = process_.readLine().trimmed().toInt();
    QTcpSocket probe;
    probe.connectToHost(QStringLiteral("127.0.0.1"), static_cast<quint16>(port_));
    return port_ > 0 && probe.waitForConnected(5000);
}

void PeerProcess::Stop() {
    if (process_.state() == QProcess::NotRunning) return;
    process_.kill();
    process_.waitForFinished(5000);
}

QString PeerProcess::LogFile() const {
    return logDir_.filePath(QStringLiteral("peer.log"));
}

QString PeerProcess::Log() {
    QFile file(LogFile());
    return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
}

int PeerProcess::CountInLog(const QString& text, int expected) {
    // The peer may log a moment after it answered.
    for (int i = 0; i < 250 && Log().count(text) < expected; ++i)
        QThread::msleep(20);
    return static_cast<int>(Log().count(text));
}

bool FtpPeer::Start(const QString& root, int port, const QByteArray& faults) {
    return PeerProcess::Start(QStringLiteral("ftp_peer.py"),
                              {root, QStringLiteral("logger"), QStringLiteral("secret"),
                               QString::number(port), QString::fromUtf8(faults)});
}

QStringList FtpPeer::Commands(int expected) {
    const QString tag = QStringLiteral("CMD ");
    CountInLog(tag, expected);
    QStringList commands;
    for (const QString& line : Log().split(QLatin1Char('\n')))
        if (line.startsWith(tag)) commands << line.mid(tag.size());
    return commands;
}

} // namespace quorvel::testing
