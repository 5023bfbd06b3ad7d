#include "support/tls_trust.h"

#include <QFile>
#include <QMutex>
#include <QMutexLocker>

namespace quorvel {

namespace {

QMutex& TrustMutex() {
    static QMutex mutex;
    return mutex;
}

QStringList& Files() {
    static QStringList files;
    return files;
}

// A CA file that exists but holds no certificate is as wrong as a missing one.
bool ReadPem(const QString& file, QByteArray& pem, QString& error) {
    QFile in(file);
    if (!in.open(QIODevice::ReadOnly)) {
        error = QStringLiteral("The CA file ") + file + QStringLiteral(" could not be read: ") +
                in.errorString();
        return false;
    }
    const QByteArray bytes = in.readAll();
    if (!bytes.contains("-----BEGIN CERTIFICATE-----")) {
        error = QStringLiteral("The CA file ") + file +
                QStringLiteral(" holds no certificate in PEM form");
        return false;
    }
    pem += bytes;
    if (!pem.endsWith('\n')) pem += '\n';
    return true;
}

} // namespace

QStringList TlsTrust::ExtraCaFiles() {
    QMutexLocker lock(&TrustMutex());
    return Files();
}

void TlsTrust::SetExtraCaFiles(const QStringList& files) {
    QMutexLocker lock(&TrustMutex());
    Files().clear();
    for (const QString& file : files)
        if (!file.isEmpty() && !Files().contains(file)) Files() << file;
}

void TlsTrust::AddExtraCaFile(const QString& file) {
    QMutexLocker lock(&TrustMutex());
    if (!file.isEmpty() && !Files().contains(file)) Files() << file;
}

bool TlsTrust::ReadExtraCaPem(QByteArray& pem, QString& error) {
    pem.clear();
    error.clear();
    for (const QString& file : ExtraCaFiles())
        if (!ReadPem(file, pem, error)) return false;
    return true;
}

QString TlsTrust::CheckCaFile(const QString& file) {
    QByteArray pem;
    QString error;
    ReadPem(file, pem, error);
    return error;
}

} // namespace quorvel
