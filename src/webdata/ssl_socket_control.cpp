#include "webdata/ssl_socket_control.h"

#include "support/tls_trust.h"

#include <QSslCertificate>
#include <QSslConfiguration>
#include <QTimer>

namespace quorvel {

namespace {

constexpr qint64 kReadBufferLimit = 1 << 20;

// The system's store plus the extra CAs; false with the reason when an extra
// file cannot be used.
bool TrustedConfiguration(QSslConfiguration& config, QString& error) {
    config = QSslConfiguration::defaultConfiguration();
    config.setPeerVerifyMode(QSslSocket::VerifyPeer);
    QByteArray pem;
    if (!TlsTrust::ReadExtraCaPem(pem, error)) return false;
    if (pem.isEmpty()) return true; // the system's store, loaded as needed
    const QList<QSslCertificate> extra = QSslCertificate::fromData(pem, QSsl::Pem);
    if (extra.isEmpty()) {
        error = QStringLiteral("The CA files ") +
                TlsTrust::ExtraCaFiles().join(QStringLiteral(", ")) +
                QStringLiteral(" hold no readable certificate");
        return false;
    }
    // The system's store is read once per run, not at every connection.
    static const QList<QSslCertificate> system = QSslConfiguration::systemCaCertificates();
    config.setCaCertificates(system + extra);
    return true;
}

} // namespace

SslSocketControl::SslSocketControl(int index, QObject* parent)
    : SocketControl(parent), index_(index) {
    socket_.setReadBufferSize(kReadBufferLimit);
    connect(&socket_, &QSslSocket::encrypted, this, &SslSocketControl::OnEncrypted);
    connect(&socket_, &QSslSocket::readyRead, this, &SslSocketControl::OnReadyRead);
    connect(&socket_, &QSslSocket::disconnected, this, &SslSocketControl::OnDisconnected);
    connect(&socket_, &QSslSocket::errorOccurred, this, &SslSocketControl::OnError);
    connect(&socket_, &QSslSocket::sslErrors, this, &SslSocketControl::OnSslErrors);
    connect(&socket_, &QSslSocket::bytesWritten, this, &SslSocketControl::OnBytesWritten);
}

SslSocketControl::~SslSocketControl() {
    closing_ = true;
    socket_.abort();
}

QString SslSocketControl::Peer() const {
    const QString host =
        host_.contains(QLatin1Char(':')) ? QLatin1Char('[') + host_ + QLatin1Char(']') : host_;
    return host + QLatin1Char(':') + QString::number(port_);
}

int SslSocketControl::State() const {
    if (failed_) return kSocketError;
    if (peerClosed_) return kSocketPeerClosing;
    return SocketStateOf(socket_.state(), socket_.isEncrypted());
}

void SslSocketControl::Close() {
    closing_ = true;
    socket_.abort();
    closing_ = false;
    failed_ = false;
    peerClosed_ = false;
    verified_ = false;
    sslErrors_.clear();
}

void SslSocketControl::Connect() {
    failed_ = false;
    peerClosed_ = false;
    verified_ = false;
    sslErrors_.clear();
    if (!QSslSocket::supportsSsl()) {
        FailLater(QStringLiteral("No secure connection to ") + Peer() +
                  QStringLiteral(": TLS is not available on this computer"));
        return;
    }
    QSslConfiguration config;
    QString error;
    if (!TrustedConfiguration(config, error)) {
        FailLater(QStringLiteral("No secure connection to ") + Peer() + QStringLiteral(": ") +
                  error);
        return;
    }
    socket_.setSslConfiguration(config);
    socket_.connectToHostEncrypted(host_, static_cast<quint16>(port_));
}

void SslSocketControl::FailLater(const QString& description) {
    failed_ = true;
    QTimer::singleShot(0, this, [this, description] {
        if (failed_) Q_EMIT ErrorOccurred(index_, QAbstractSocket::SslInternalError, description);
    });
}

bool SslSocketControl::SendData(const QByteArray& bytes) {
    if (socket_.state() != QAbstractSocket::ConnectedState || !socket_.isEncrypted()) return false;
    return socket_.write(bytes) == bytes.size();
}

QByteArray SslSocketControl::GetData() {
    return socket_.readAll();
}

void SslSocketControl::Refresh() {
    // What was decrypted is announced now, not on the next pass of the loop.
    LookForArrivals(socket_);
    AnnounceArrival();
}

void SslSocketControl::OnEncrypted() {
    verified_ = true;
    socket_.setSocketOption(QAbstractSocket::LowDelayOption, 1);
    Q_EMIT Connected(index_);
}

void SslSocketControl::OnReadyRead() {
    // QSslSocket announces every 4 KiB it decrypts; the object is told once
    // per pass of the event loop, with everything decrypted by then.
    if (arrivalPosted_) return;
    arrivalPosted_ = true;
    QMetaObject::invokeMethod(this, &SslSocketControl::AnnounceArrival, Qt::QueuedConnection);
}

void SslSocketControl::AnnounceArrival() {
    arrivalPosted_ = false;
    const qint64 waiting = socket_.bytesAvailable();
    if (waiting > 0) Q_EMIT DataArrived(index_, waiting);
}

void SslSocketControl::OnDisconnected() {
    if (closing_) return;
    // A close during the handshake is a failed connection, reported by OnError.
    if (!verified_ || failed_) return;
    peerClosed_ = true;
    // Bytes that came with the close are handed over before the close itself.
    AnnounceArrival();
    Q_EMIT Closed(index_);
}

void SslSocketControl::OnSslErrors(const QList<QSslError>& errors) {
    // Never ignored: the handshake fails and OnError reports these reasons.
    sslErrors_ = errors;
}

QString SslSocketControl::Describe(QAbstractSocket::SocketError error) const {
    if (!sslErrors_.isEmpty()) {
        QStringList reasons;
        for (const QSslError& e : sslErrors_)
            if (!reasons.contains(e.errorString())) reasons << e.errorString();
        return QStringLiteral("The certificate of ") + Peer() + QStringLiteral(" was refused: ") +
               reasons.join(QStringLiteral("; "));
    }
    if (error == QAbstractSocket::SslHandshakeFailedError ||
        error == QAbstractSocket::SslInternalError ||
        error == QAbstractSocket::SslInvalidUserDataError)
        return QStringLiteral("No secure connection to ") + Peer() +
               QStringLiteral(" (does it speak TLS on this port?): ") + socket_.errorString();
    if (error == QAbstractSocket::RemoteHostClosedError)
        return QStringLiteral("No secure connection to ") + Peer() +
               QStringLiteral(": the server closed the connection during the TLS handshake");
    return socket_.errorString();
}

void SslSocketControl::OnError(QAbstractSocket::SocketError error) {
    // A look that found nothing (Refresh) is no failure.
    if (closing_ || failed_ || error == QAbstractSocket::SocketTimeoutError) return;
    // After the handshake a peer closing is an ordinary close; during it, a
    // failed connection.
    if (error == QAbstractSocket::RemoteHostClosedError && verified_) return;
    failed_ = true;
    const QString description = Describe(error);
    socket_.abort();
    Q_EMIT ErrorOccurred(index_, static_cast<int>(error), description);
}

void SslSocketControl::OnBytesWritten(qint64 bytes) {
    const qint64 remaining = socket_.bytesToWrite();
    Q_EMIT SendProgressed(index_, bytes, remaining);
    if (remaining == 0) Q_EMIT SendCompleted(index_);
}

} // namespace quorvel
