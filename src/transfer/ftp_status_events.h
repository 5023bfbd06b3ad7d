#pragma once
// What each event of an FTP connection means for the user: the status text,
// the trace line and the progress it produces. The events carry the numbers of
// the classic internet-status codes, so that traces read the same whatever
// library delivers them.

#include "transfer/ftp_report.h"

#include <QString>

#include <cstdint>

namespace quorvel {

enum class FtpStatus : int {
    ResolvingName = 10,
    NameResolved = 11,
    ConnectingToServer = 20,
    ConnectedToServer = 21,
    SendingRequest = 30,
    RequestSent = 31,
    ReceivingResponse = 40,
    ResponseReceived = 41,
    CtlResponseReceived = 42,
    Prefetch = 43,
    ClosingConnection = 50,
    ConnectionClosed = 51,
    HandleCreated = 60,
    HandleClosing = 70,
    DetectingProxy = 80,
    RequestComplete = 100,
    Redirect = 110,
    IntermediateResponse = 120,
    StateChange = 200,
};

// What the connection's owner must do after an event.
enum class FtpFollowUp { None, CloseConnection };

// `info` is the event's text; `number` its count (bytes moved, a state code).
FtpFollowUp HandleFtpStatus(FtpReport& report, int status, const QString& info,
                            std::int64_t number);

} // namespace quorvel
