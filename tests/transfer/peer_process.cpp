#include "peer_process.h"

#include <QTcpSocket>

namespace quorvel::testing {

bool PeerProcess::Start(const QString& script, const QStringList& args) {
    log_.clear();
    process_.setReadChannel(QProcess::StandardOutput);
    process_.start(QStringLiteral("/usr/bin/python3"),
                   QStringList{QStringLiteral(QUORVEL_TRANSFER_TEST_DIR "/") + script} + args);
    // Bounded: the script prints its port as soon as it listens.
    if (!process_.waitForStarted(10000) || !process_.waitForReadyRead(10000)) return false;
    port_ = process_.readLine().trimmed().toInt();
    process_.setReadChannel(QProcess::StandardError);
    QTcpSocket probe;
    probe.connectToHost(QStringLiteral("127.0.0.1"), static_cast<quint16>(port_));
    return port_ > 0 && probe.waitForConnected(5000);
}

void PeerProcess::Stop() {
    if (process_.state() == QProcess::NotRunning) return;
    process_.kill();
    process_.waitForFinished(5000);
}

QString PeerProcess::Log() {
    log_ += QString::fromUtf8(process_.readAllStandardError());
    return log_;
}

int PeerProcess::CountInLog(const QString& text, int expected) {
    // The peer may log a moment after it answered.
    for (int i = 0; i < 50 && Log().count(text) < expected; ++i)
        process_.waitForReadyRead(100);
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
