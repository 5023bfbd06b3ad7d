// Commands: composing and sending requests, the public exchanges, file dates.
#include "webdata/talu_web_data.h"

#include "support/paths.h"
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
    if (OpenConnection()) {
        try {
            ShowBusy();
            httpState_ = 0;
            replyKind_ = kNothing;
            switch (action) {
            case kActionLastDate:
                serverLastDate_ = 0;
                replyKind_ = kLastDate;
                SendCommand(4, {});
                break;
            case kActionData:
                localLastDate_ = GetLastDateInFile(localFile_);
                if (lastRecordUndated_) {
                    RefuseUndatedFile();
                    break;
                }
                replyKind_ = kDataLines;
                SendCommand(2, FormatDateIso(localLastDate_));
                break;
            case kActionUserFolders:
                SendCommand(11, {});
                replyKind_ = kUser;
                break;
            default:
                break;
            }
        } catch (const WebDataError& e) {
            ErrorReport(QStringLiteral("DoCommand"), e.Description());
        }
    }
    const bool ok = WaitForReply();
    RestorePointer();
    return ok;
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

// A file that holds records but whose last record has no readable date would
// be sent date=0, and every record the service has would be appended again.
void CTALUWebData::RefuseUndatedFile() {
    lastError_ = QStringLiteral("No date in the last record of ") + localFile_ +
                 QStringLiteral(", so no data is fetched");
    ReportAsyncError(lastError_);
    replyStatus_ = 2;
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

DateValue CTALUWebData::GetLastDateInFile(const QString& file) {
    DateValue result = 0;
    lastRecordUndated_ = false;
    TraceDebug(QStringLiteral("Finding last date in file: ") + file);
    if (QFileInfo::exists(file)) {
        const std::optional<LastLine> last = ReadLastLine(file);
        if (!last) {
            lastRecordUndated_ = true;
            ErrorReport(QStringLiteral("GetLastDateInFile: ") + file,
                        QStringLiteral("Path/File access error"));
            return 0;
        }
        DateValue date = 0;
        if (!last->line.isEmpty() && GetDateFromLine(QString::fromUtf8(last->line), date))
            result = date;
        lastRecordUndated_ = !last->line.isEmpty() && result == 0 && dateFormat_ >= kDateTime &&
                             dateFormat_ <= kTeksmart;
    } else {
        TraceDebug(QStringLiteral("File: ") + file +
                   QStringLiteral(" does not exists, so return 0"));
    }
    localLastDate_ = result;
    TraceDebug(QStringLiteral("Last date in file: ") + file + QStringLiteral(" date: ") +
               FormatDateIso(result));
    return result;
}

} // namespace quorvel
