#include "transfer/ftp_status_events.h"

namespace quorvel {

namespace {

// Trace texts of the data events are built only when someone reads them: these
// events come for every block of a transfer.
template <class MakeText> void TraceLazily(FtpReport& report, MakeText makeText) {
    if (report.Tracing())
        report.Trace(makeText());
    else
        report.Pump();
}

QString Num(std::int64_t n) {
    return QString::number(n);
}

void DataSent(FtpReport& report, std::int64_t bytes) {
    TransferCounters& c = report.Counters();
    c.sent += bytes;
    switch (c.state) {
    case TransferState::Download:
        report.Progress(c.sent);
        TraceLazily(report, [&] {
            return QString(QStringLiteral("Downloading ") + Num(c.sent) + '/' + Num(c.total));
        });
        break;
    case TransferState::Upload:
        report.Progress(c.sent);
        TraceLazily(report, [&] {
            return QString(QStringLiteral("Uploading ") + Num(c.sent) + '/' + Num(c.total));
        });
        break;
    case TransferState::None:
        report.Trace(QStringLiteral("Sending request: ") + Num(bytes) +
                     QStringLiteral(" bytes CurrentState=") + Num(static_cast<int>(c.state)));
        break;
    }
}

void DataReceived(FtpReport& report, std::int64_t bytes) {
    TransferCounters& c = report.Counters();
    c.received += bytes;
    switch (c.state) {
    case TransferState::Download:
        report.Progress(c.received);
        TraceLazily(report, [&] {
            return QString(QStringLiteral("Downloading  ") + Num(c.received) +
                           QStringLiteral(" of ") + Num(c.total));
        });
        break;
    case TransferState::Upload:
        report.Progress(c.received);
        TraceLazily(report, [&] {
            return QString(QStringLiteral("Uploading  ") + Num(c.received) +
                           QStringLiteral(" of ") + Num(c.total));
        });
        break;
    case TransferState::None:
        report.Trace(QStringLiteral("Response received: ") + Num(bytes) + QStringLiteral(" bytes"));
        break;
    }
}

void HandleClosing(FtpReport& report) {
    TransferCounters& c = report.Counters();
    if (c.state == TransferState::Download) {
        report.Status(QStringLiteral("Download complete"));
        c.state = TransferState::None;
    } else if (c.state == TransferState::Upload) {
        report.Status(QStringLiteral("Upload complete"));
        c.state = TransferState::None;
    } else {
        report.Trace(QStringLiteral("Handle closed - unknown state"));
    }
}

FtpFollowUp StateChange(FtpReport& report, std::int64_t state) {
    switch (state) {
    case 1:
        report.Trace(QStringLiteral("Connected state moved between secure and nonsecure site"));
        return FtpFollowUp::None;
    case 2:
        report.Status(QStringLiteral("Disconnected from network (call CloseFTP)"));
        return FtpFollowUp::CloseConnection;
    case 16:
        report.Status(QStringLiteral("Disconnected by user request"));
        return FtpFollowUp::None;
    case 140:
        report.Trace(QStringLiteral("The request requires user input to complete"));
        return FtpFollowUp::None;
    case 256:
        report.Trace(QStringLiteral("No network requests are being made by Wininet"));
        return FtpFollowUp::None;
    case 512:
        report.Trace(QStringLiteral("Network requests are being made by Wininet"));
        return FtpFollowUp::None;
    default:
        report.Trace(QStringLiteral("INTERNET_STATUS_STATE_CHANGE, but unknown state ll_Read= ") +
                     Num(state));
        return FtpFollowUp::None;
    }
}

} // namespace

FtpFollowUp HandleFtpStatus(FtpReport& report, int status, const QString& info,
                            std::int64_t number) {
    if (report.Tracing())
        report.Trace(QStringLiteral("=========CallbackStatusFTP InternetStatus= ") + Num(status));
    switch (static_cast<FtpStatus>(status)) {
    case FtpStatus::ResolvingName:
        report.Status(QStringLiteral("Looking up the IP address for ") + info);
        break;
    case FtpStatus::NameResolved:
        report.Status(QStringLiteral("Name resolved ") + info);
        break;
    case FtpStatus::ConnectingToServer:
        report.Status(QStringLiteral("Connecting to server...") + info);
        break;
    case FtpStatus::ConnectedToServer:
        report.Status(QStringLiteral("Connected to ") + info);
        break;
    case FtpStatus::SendingRequest:
        DataSent(report, number);
        break;
    case FtpStatus::RequestSent:
        // A command on the control connection: the counters hold file bytes only,
        // so that a finished transfer shows exactly its total.
        report.Trace(QStringLiteral("Request sent: ") + Num(number) + QStringLiteral(" bytes"));
        break;
    case FtpStatus::ReceivingResponse:
        report.Trace(QStringLiteral("INTERNET_STATUS_RECEIVING_RESPONSE"));
        break;
    case FtpStatus::ResponseReceived:
        DataReceived(report, number);
        break;
    case FtpStatus::CtlResponseReceived:
        report.Trace(QStringLiteral("INTERNET_STATUS_CTL_RESPONSE_RECEIVED"));
        break;
    case FtpStatus::Prefetch:
        report.Trace(QStringLiteral("INTERNET_STATUS_PREFETCH"));
        break;
    case FtpStatus::ClosingConnection:
        report.Status(QStringLiteral("Closing connection"));
        break;
    case FtpStatus::ConnectionClosed:
        report.Status(QStringLiteral("Connection closed (call ftpClose)"));
        return FtpFollowUp::CloseConnection;
    case FtpStatus::HandleCreated:
        report.Trace(QStringLiteral("Handle created: ") + Num(number));
        break;
    case FtpStatus::HandleClosing:
        HandleClosing(report);
        break;
    case FtpStatus::DetectingProxy:
        report.Status(QStringLiteral("Detecting proxy"));
        break;
    case FtpStatus::RequestComplete:
        report.Trace(QStringLiteral("Request completed"));
        break;
    case FtpStatus::Redirect:
        report.Status(QStringLiteral("HTTP request redirected to ") + info);
        break;
    case FtpStatus::IntermediateResponse:
        report.Trace(QStringLiteral("Received intermediate status message from the server"));
        break;
    case FtpStatus::StateChange:
        return StateChange(report, number);
    default:
        report.Trace(QStringLiteral("CallStatusFTP, but unknown al_InternetStatus= ") +
                     Num(status));
        break;
    }
    return FtpFollowUp::None;
}

} // namespace quorvel
