// Commands: composing and sending requests, the public exchanges, file dates.
#include "webdata/talu_web_data.h"

#include "support/paths.h"
#include "webdata/append_note.h"
#include "webdata/date_texts.h"
#include "webdata/last_line.h"
#include "webdata/line_dates.h"
#include "webdata/request.h"
#include "webdata/service_address.h"
#include "webdata/webdata_error.h"

#include <QFileInfo>

namespace quorvel {

namespace {
enum Action { kActionLastDate = 3, kActionData = 5, kActionUserFolders = 12 };
}

bool CTALUWebData::Initialise() {
    return DoCommand(kActionUserFolders);
}

bool CTALUWebData::GetNewData(const QString& localFilename, int location, int dateType) {
    localFile_ = localFilename;
    dateFormat_ = dateType;
    remoteFile_ = GetFileName(localFilename);
    fileLocation_ = location;
    if (progress_) progress_->Initialise(-1, 0, QStringLiteral("Records"));
    if (!DoCommand(kActionLastDate)) return false;
    if (doFromDate_ && fromDate_ > serverLastDate_) serverLastDate_ = fromDate_;
    return DoCommand(kActionData);
}

QString CTALUWebData::LastDateInFile(const QString& file, int locationId, int which, int dateFormat,
                                     int display) {
    BusyGuard busy(CurrentBusyPointer());
    dateFormat_ = dateFormat;
    if (dateFormat == 0 || display == 0) return QStringLiteral("-");
    if (which == 0) return FormatDateLong(GetLastDateInFile(file));
    if (which == 1) {
        remoteFile_ = file.mid(file.lastIndexOf(QLatin1Char('/')) + 1);
        fileLocation_ = locationId;
        return DoCommand(kActionLastDate) ? FormatDateLong(serverLastDate_) : QStringLiteral("-");
    }
    return {};
}

bool CTALUWebData::DoCommand(int action) {
    userCancel_ = false;
    replyStatus_ = 0;
    bool connected = false;
    for (int attempt = 0;; ++attempt) {
        closedWhileWaiting_ = false;
        replyBytes_ = 0;
        connected = OpenConnection();
        if (connected) SendAction(action);
        WaitForReply();
        // A connection kept from before that the service closed before
        // answering at all (an idle time-out meeting the request) says nothing
        // about the request: it goes once more, on a fresh connection.
        const bool unanswered = replyStatus_ == 0 && closedWhileWaiting_ && replyBytes_ == 0;
        if (!(unanswered && reused_ && attempt == 0 && !userCancel_)) break;
        TraceDebug(QStringLiteral("Connection closed before the reply; sending again"));
    }
    RestorePointer();
    if (replyStatus_ == 0) lastError_ = FailureText(action, connected);
    return replyStatus_ == 1;
}

void CTALUWebData::SendAction(int action) {
    try {
        ShowBusy();
        httpState_ = 0;
        replyKind_ = kNothing;
        switch (action) {
        case kActionLastDate:
            serverLastDate_ = 0;
            replyKind_ = kLastDate;
            SendCommand(kCommandGetLastDate, {});
            break;
        case kActionData:
            RepairTornAppend(localFile_);
            localLastDate_ = GetLastDateInFile(localFile_);
            replyKind_ = kDataLines;
            SendCommand(kCommandGetData, FormatDateIso(localLastDate_));
            break;
        case kActionUserFolders:
            SendCommand(kCommandGetUserFolders, {});
            replyKind_ = kUser;
            break;
        default:
            break;
        }
    } catch (const WebDataError& e) {
        ErrorReport(QStringLiteral("DoCommand"), e.Description());
    }
}

// What a command that got no final line leaves in LastError, so that an
// earlier command's "OK" never stands for it.
QString CTALUWebData::FailureText(int action, bool connected) const {
    const QString command = action == kActionLastDate ? commandWords_[kCommandGetLastDate]
                            : action == kActionData   ? commandWords_[kCommandGetData]
                                                      : commandWords_[kCommandGetUserFolders];
    if (!connected)
        return QStringLiteral("*Not* connected to ") + remoteHost_ +
               (connectError_.isEmpty() ? QString() : QStringLiteral(": ") + connectError_);
    if (userCancel_) return QStringLiteral("Cancelled (") + command + QStringLiteral(")");
    if (closedWhileWaiting_)
        return QStringLiteral("Connection closed before the reply ended (") + command +
               QStringLiteral(")");
    return QStringLiteral("No reply from ") + remoteHost_ + QStringLiteral(" (") + command +
           QStringLiteral(")");
}

void CTALUWebData::SendCommand(int commandIndex, const QString& dateText) {
    try {
        httpState_ = 0;
        if (commandIndex < 0 || commandIndex >= static_cast<int>(commandWords_.size()))
            throw WebDataError(QStringLiteral("Subscript out of range"));
        RequestFields fields;
        fields.commandIndex = commandIndex;
        fields.command = commandWords_[static_cast<std::size_t>(commandIndex)];
        fields.user = userId_;
        fields.password = password_;
        fields.file = remoteFile_;
        fields.dateFormat = dateFormat_;
        fields.fileLocation = fileLocation_;
        fields.traceServer = traceServer_;
        fields.date = dateText;
        const ServiceAddress target = ParseServiceAddress(remoteHost_, remotePort_);
        fields.host = target.hostPort;
        fields.scheme = ServiceScheme(target);
        fields.webFolder = webFolder_;
        fields.agent = agent_;
        // Whatever is left of earlier replies is no part of this one.
        stream_.ExpectReply(*this);
        waiting_ = true;
        for (const QString& line : RequestLines(fields))
            SendReply(line);
        lastCommand_ = fields.command;
    } catch (const WebDataError& e) {
        ErrorReport(QStringLiteral("SendCommand:") + QString::number(commandIndex),
                    e.Description());
    }
}

void CTALUWebData::SendReply(const QString& line) {
    try {
        if (!socket_) throw WebDataError(QStringLiteral("Object variable not set"));
        if (!socket_->SendData(line.toUtf8() + "\r\n"))
            throw WebDataError(QStringLiteral("Wrong protocol or connection state for the "
                                              "requested transaction or request"));
        TraceSent(MaskPassword(line));
    } catch (const WebDataError& e) {
        const int state = socket_ ? socket_->State() : kSocketClosed;
        ErrorReport(QStringLiteral("SendReply:") + MaskPassword(line) +
                        QStringLiteral("\r\nWState:") + WinsockStatus(state),
                    e.Description());
    }
}

// An append that was killed left a torn record at the end of the file; it goes
// before the file's last date is read.
void CTALUWebData::RepairTornAppend(const QString& file) {
    if (output_.IsOpen() && output_.Path() == file) return;
    const std::optional<qint64> whole = append_note::WholeLength(file);
    if (!whole) return;
    if (!append_note::Repair(file))
        throw WebDataError(QStringLiteral("Path/File access error: ") + file);
    TraceDebug(QStringLiteral("Cut a torn record after byte ") + QString::number(*whole) +
               QStringLiteral(" of ") + file);
}

bool CTALUWebData::GetDateFromLine(const QString& line, DateValue& date) {
    try {
        const LineDate read = DateOfLine(line, dateFormat_);
        if (read.hasDate) {
            date = read.value;
            if (dateFormat_ == kTeksmart)
                TraceDebug(QStringLiteral("TekSmart:") + read.firstField + QStringLiteral(" -> ") +
                           FormatDateIso(date));
        }
        return read.found;
    } catch (const WebDataError& e) {
        ErrorReport(QStringLiteral("GetDateFromLine"), e.Description());
        return false;
    }
}

// The date of the last line that has one: header, blank and damaged lines at
// the end are walked over. Only the last non-empty line reports what it lacks.
DateValue CTALUWebData::GetLastDateInFile(const QString& file) {
    DateValue result = 0;
    TraceDebug(QStringLiteral("Finding last date in file: ") + file);
    if (!QFileInfo::exists(file)) {
        TraceDebug(QStringLiteral("File: ") + file +
                   QStringLiteral(" does not exists, so return 0"));
    } else if (ReadsDates(dateFormat_)) {
        BackwardLines lines;
        // A torn record that an append left is no line of the file.
        if (!lines.Open(file, append_note::WholeLength(file))) {
            ErrorReport(QStringLiteral("GetLastDateInFile: ") + file,
                        QStringLiteral("Path/File access error"));
            return 0;
        }
        QByteArray line;
        for (bool last = true; result == 0 && lines.Previous(line); last = false) {
            const QString text = QString::fromUtf8(line);
            DateValue date = 0;
            if (last) {
                if (GetDateFromLine(text, date)) result = date;
            } else {
                try {
                    const LineDate read = DateOfLine(text, dateFormat_);
                    if (read.hasDate) result = read.value;
                } catch (const WebDataError&) {
                    result = 0;
                }
            }
            if (result == 0 && Logging(3)) TraceDebug(QStringLiteral("No date in line: ") + text);
        }
        if (lines.Failed())
            ErrorReport(QStringLiteral("GetLastDateInFile: ") + file,
                        QStringLiteral("Path/File access error"));
    }
    localLastDate_ = result;
    TraceDebug(QStringLiteral("Last date in file: ") + file + QStringLiteral(" date: ") +
               FormatDateIso(result));
    return result;
}

} // namespace quorvel
