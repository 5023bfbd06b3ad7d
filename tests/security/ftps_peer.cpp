#include "ftps_peer.h"

#include "tls_web_peer.h"

#include <QFile>
#include <QTcpSocket>
#include <QThread>

namespace quorvel::testing {

bool FtpsPeer::Start(const QString& mode, const QString& root, const QString& certFolder,
                     const QString& certStem, const QString& password) {
    process_.setStandardErrorFile(logDir_.filePath("peer.log"));
    process_.setReadChannel(QProcess::StandardOutput);
    process_.start("/usr/bin/python3",
                   {SecurityTestDir() + "/ftps_peer.py", mode, root, "logger", password,
                    certFolder + '/' + certStem + ".pem", certFolder + '/' + certStem + ".key"});
    if (!process_.waitForStarted(10000) || !process_.waitForReadyRead(10000)) return false;
    port_ = process_.readLine().trimmed().toInt();
    QTcpSocket probe;
    probe.connectToHost("127.0.0.1", static_cast<quint16>(port_));
    return port_ > 0 && probe.waitForConnected(5000);
}

void FtpsPeer::Stop() {
    if (process_.state() == QProcess::NotRunning) return;
    process_.kill();
    process_.waitForFinished(5000);
}

QString FtpsPeer::Log() const {
    QFile file(logDir_.filePath("peer.log"));
    return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
}

int FtpsPeer::Count(const QString& text, int expected) const {
    for (int i = 0; i < 100 && Log().count(text) < expected; ++i)
        QThread::msleep(20);
    return static_cast<int>(Log().count(text));
}

QStringList FtpsPeer::Commands(int expected) const {
    const QString tag = "CMD ";
    Count(tag, expected);
    QStringList commands;
    for (const QString& line : Log().split('\n'))
        if (line.startsWith(tag)) commands << line.mid(tag.size());
    return commands;
}

} // namespace quorvel::testing
