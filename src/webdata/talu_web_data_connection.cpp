// Opening and reusing the connection, waiting for a reply, the socket's events.
#include "webdata/talu_web_data.h"

#include "webdata/request.h"
#include "webdata/service_address.h"
#include "webdata/webdata_error.h"

#include <QCoreApplication>
#include <QMetaMethod>
#include <QTimer>

namespace quorvel {

namespace {
// While waiting, the event loop hands control back at least this often so the
// clock and the cancel flag are looked at.
constexpr int kTickMs = 20;
} // namespace

QDateTime CTALUWebData::Now() const {
    return CurrentClock().Now();
}

QDateTime CTALUWebData::NextDeadline() const {
    return Now().addMSecs(CurrentClock().Waits().replyGap.count());
}

void CTALUWebData::PumpOnce() {
    QCoreApplication::processEvents(QEventLoop::AllEvents | QEventLoop::WaitForMoreEvents);
}

bool CTALUWebData::OpenConnection() {
    try {
        if (!socket_) throw WebDataError(QStringLiteral("Object variable not set"));
        // A close the service sent after its last reply, perhaps while nobody
        // ran the event loop, must be seen before the connection is trusted
        // again; bytes still waiting from before are dropped on the way.
        QCoreApplication::processEvents();
        connectError_.clear();
        const ServiceAddress target = ParseServiceAddress(remoteHost_, remotePort_);
        if (socket_ && !ChooseEncryption(target)) return false;
        if (socket_ && socket_->State() == kSocketConnected) socket_->Refresh();
        // A plain connection may serve another host text (the request names
        // its host), but a secure one was verified for one name only: the
        // request, and the password in it, must not go to that server when
        // the text now names another.
        if (socket_ && target.secure && socket_->State() == kSocketConnected &&
            connectedTo_ != target.host + QLatin1Char(':') + QString::number(target.port))
            socket_->Close();
        reused_ = socket_ && socket_->State() == kSocketConnected;
        if (socket_ && socket_->State() != kSocketConnected) {
            socket_->Close();
            stream_.Clear();
            socket_->SetRemotePort(target.port);
            socket_->SetRemoteHost(target.host);
            connectedTo_ = target.host + QLatin1Char(':') + QString::number(target.port);
            socket_->Connect();
            ShowStatusText(QStringLiteral("Connecting to ") + remoteHost_);
            const QDateTime giveUp = NextDeadline();
            QTimer tick;
            tick.start(kTickMs);
            while (socket_ && socket_->State() != kSocketConnected) {
                PumpOnce();
                if (socket_ && socket_->State() == kSocketError) return false;
                if (userCancel_ || Now() > giveUp) break;
            }
            if (socket_)
                TraceDebug(QStringLiteral("Connected Winsock State:") +
                           WinsockStatus(socket_->State()));
        }
        if (socket_ && socket_->State() == kSocketConnected) {
            ShowStatusText(QStringLiteral("Connected to ") + remoteHost_);
            return true;
        }
        ShowStatusText(QStringLiteral("*Not* connected to ") + remoteHost_);
        return false;
    } catch (const WebDataError& e) {
        if (socket_) socket_->Close();
        ErrorReport(QStringLiteral("Connect"), e.Description());
        return false;
    }
}

bool CTALUWebData::WaitForReply() {
    deadline_ = NextDeadline();
    TraceDebug(QStringLiteral("Waiting..."));
    QTimer tick;
    tick.start(kTickMs);
    for (;;) {
        // A closed connection brings no more of the reply.
        if (replyStatus_ != 0 || closedWhileWaiting_) break;
        PumpOnce();
        if (userCancel_ || (Now() > deadline_ && !ReplyCameMeanwhile())) break;
    }
    waiting_ = false;
    replyKind_ = kNothing;
    if (replyStatus_ == 0) {
        // The reply was cut off: its file keeps its whole records, and
        // whatever of it still comes can never reach a later command.
        CloseOutputFile(false);
        DropConnection();
    }
    return replyStatus_ == 1;
}

// The clock says the gap is over, but the thread may have been held up (a
// loaded or suspended machine, a slow handler elsewhere) while the reply came:
// the socket announces such bytes only on a later turn of the event loop. One
// direct look at the socket before giving up; bytes found renew the deadline.
bool CTALUWebData::ReplyCameMeanwhile() {
    if (socket_) socket_->Refresh();
    return replyStatus_ != 0 || closedWhileWaiting_ || Now() <= deadline_;
}

void CTALUWebData::DropConnection() {
    if (socket_) socket_->Close();
    stream_.Clear();
    chunkedBody_ = false;
    closeAfterReply_ = false;
}

void CTALUWebData::Connect(int /*index*/) {
    TraceDebug(QStringLiteral("Connect"));
}

void CTALUWebData::ConnectionRequest(int index, std::int32_t requestId) {
    TraceDebug(QStringLiteral("ConnectionRequest: ") + QString::number(requestId) +
               QStringLiteral(" on Winsock: ") + QString::number(index));
    if (socket_)
        socket_->Accept(requestId);
    else
        ErrorReport(QStringLiteral("ConnectionRequest"), QStringLiteral("Object variable not set"));
}

void CTALUWebData::Disconnect() {
    if (waiting_) closedWhileWaiting_ = true;
    // Inside DataArrival the bytes that came before the close are still to be
    // taken; the close follows when they are.
    if (inArrival_) {
        closePending_ = true;
        return;
    }
    // Bytes of a closed connection never continue on the next one.
    DropConnection();
}

// A secure address must never be served by a plain connection: the socket
// is switched (a connection of the other kind is closed first) or, when it
// cannot speak TLS, nothing is sent.
bool CTALUWebData::ChooseEncryption(const ServiceAddress& target) {
    if (socket_->Encrypted() == target.secure || socket_->SetEncrypted(target.secure)) return true;
    connectError_ = QStringLiteral("No secure connection to ") + target.hostPort +
                    QStringLiteral(": this connection cannot use TLS");
    ShowStatusText(QStringLiteral("*Not* connected to ") + remoteHost_ + QStringLiteral(": ") +
                   connectError_);
    return false;
}

void CTALUWebData::WError(int /*index*/, int /*number*/, const QString& description) {
    // Why the connection failed (a refused certificate names the host and
    // the reasons) stays for the command's LastError.
    connectError_ = description;
    ShowStatusText(QStringLiteral("WinsockError: ") + description);
    RestorePointer();
    Q_EMIT ShowStatus(description);
}

void CTALUWebData::SendComplete(int /*index*/) {
    TraceSent(QStringLiteral("Send complete"));
}

void CTALUWebData::SendProgress(int /*index*/, std::int64_t bytesSent,
                                std::int64_t bytesRemaining) {
    TraceDebug(QStringLiteral("SendProgress: BytesSent:") + QString::number(bytesSent) +
               QStringLiteral(" BytesRemaining: ") + QString::number(bytesRemaining));
}

bool CTALUWebData::ShowsReceivedText() const {
    static const QMetaMethod received = QMetaMethod::fromSignal(&CTALUWebData::ShowReceived);
    return Logging(4) || isSignalConnected(received);
}

// Takes every byte the socket holds, also those that came while a handler
// inside ran an event loop of its own (a box): the socket does not announce
// them again.
void CTALUWebData::DataArrival(int /*index*/, std::int64_t bytes) {
    if (bytes <= 0 || inArrival_) return;
    inArrival_ = true;
    try {
        if (!socket_) throw WebDataError(QStringLiteral("Object variable not set"));
        while (socket_) {
            QByteArray data = socket_->GetData();
            if (data.isEmpty()) break;
            TakeArrival(std::move(data));
        }
    } catch (const WebDataError& e) {
        inArrival_ = false;
        ErrorReport(QStringLiteral("DataArrival"), e.Description());
    }
    inArrival_ = false;
    if (closePending_) {
        closePending_ = false;
        DropConnection();
    } else if (dropAfterDrain_) {
        DropConnection();
    }
    dropAfterDrain_ = false;
}

void CTALUWebData::TakeArrival(QByteArray data) {
    deadline_ = NextDeadline();
    if (waiting_) replyBytes_ += data.size();
    stream_.Append(std::move(data));
    if (ShowsReceivedText()) {
        QByteArray shown = stream_.Unconsumed();
        shown.replace("\r\n", "\n");
        const QString text = QString::fromUtf8(shown);
        TraceReceivedData(text);
        Q_EMIT ShowReceived(text);
    }
    switch (stream_.Drain(*this)) {
    case ReplyStream::Outcome::Ok:
        break;
    case ReplyStream::Outcome::LineTooLong:
        EndReplyWithError(QStringLiteral("Received more than 1 MiB without a line end"));
        break;
    case ReplyStream::Outcome::BadChunking:
        EndReplyWithError(QStringLiteral("Invalid chunked transfer coding in the reply"));
        break;
    }
}

} // namespace quorvel
