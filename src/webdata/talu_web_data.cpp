// Creation, settings, list fillers, traces and the error report.
#include "webdata/talu_web_data.h"

#include "support/date_text.h"
#include "support/log_file.h"
#include "support/paths.h"
#include "webdata/date_texts.h"
#include "webdata/request.h"
#include "webdata/simple_cipher.h"
#include "webdata/webdata_error.h"

#include <cstdlib>

namespace quorvel {

CTALUWebData::CTALUWebData(QObject* parent) : QObject(parent) {
    remotePort_ = 80;
    commandWords_[kCommandSendData] = QStringLiteral("SENDDATA");
    commandWords_[kCommandGetData] = QStringLiteral("GETDATA");
    commandWords_[kCommandGetLastDate] = QStringLiteral("GETLASTDATE");
    commandWords_[kCommandGetFolder] = QStringLiteral("GETFOLDER");
    commandWords_[kCommandGetUserFolders] = QStringLiteral("GETUSERFOLDERS");
    SetEncryptKey(QStringLiteral("583640917"));
    webFolder_ = QStringLiteral("/wd");
    endProgram_ = [] { std::exit(EXIT_FAILURE); };
}

CTALUWebData::~CTALUWebData() {
    try {
        output_.Close();
    } catch (const WebDataError&) {
        // The object is going away; there is no one left to tell.
    }
    if (socket_) socket_->Close();
}

void CTALUWebData::SetUserCancel(int value) {
    userCancel_ = value != 0;
}

void CTALUWebData::EnableLog(int which, int value) {
    if (which >= 0 && which < static_cast<int>(enableLog_.size()))
        enableLog_[static_cast<std::size_t>(which)] = value != 0;
}

void CTALUWebData::MyWinsock(SocketControl* socket) {
    if (socket_) disconnect(socket_, nullptr, this, nullptr);
    socket_ = socket;
    if (!socket) return;
    connect(socket, &SocketControl::Closed, this, [this](int) { Disconnect(); });
    connect(socket, &SocketControl::Connected, this, &CTALUWebData::Connect);
    connect(socket, &SocketControl::ConnectionRequested, this, &CTALUWebData::ConnectionRequest);
    connect(socket, &SocketControl::DataArrived, this, &CTALUWebData::DataArrival);
    connect(socket, &SocketControl::ErrorOccurred, this, &CTALUWebData::WError);
    connect(socket, &SocketControl::SendCompleted, this, &CTALUWebData::SendComplete);
    connect(socket, &SocketControl::SendProgressed, this, &CTALUWebData::SendProgress);
}

void CTALUWebData::SetUserID(const QString& userId) {
    if (!userId.isEmpty() && userId != userId_) Disconnect();
    userId_ = userId;
}

void CTALUWebData::SetPassword(const QString& password) {
    if (!password.isEmpty() && password != password_) Disconnect();
    password_ = password;
}

void CTALUWebData::SetFromDate(int doFromDate, const QString& fromDate) {
    doFromDate_ = false;
    if (IsDateText(fromDate)) {
        fromDate_ = DateTimeValue(fromDate);
        doFromDate_ = doFromDate != 0;
    }
}

bool CTALUWebData::SendNewData(const QString& localFilename, int location, int dateFormat) {
    remoteFile_ = GetFileName(localFilename);
    dateFormat_ = dateFormat;
    fileLocation_ = location;
    Prompter& prompter = prompter_ ? *prompter_ : CurrentPrompter();
    prompter.MyMsgBox(QStringLiteral("Should be doing php incremental upload: ") + localFilename +
                          QStringLiteral("=>") + remoteFile_ + QStringLiteral(" DateFormat:") +
                          QString::number(dateFormat),
                      kButtonsOk);
    return true;
}

QString CTALUWebData::URLEncode(const QString& text) const {
    return quorvel::URLEncode(text);
}

QString CTALUWebData::WinsockStatus(std::int32_t code) const {
    return SocketStateText(code);
}

void CTALUWebData::LoadComboWithIPAddresses(ComboSink& combo) const {
    LoadIPAddresses(combo);
}
void CTALUWebData::LoadComboWithIntervals(ComboSink& combo) const {
    LoadIntervals(combo);
}
void CTALUWebData::LoadComboWithDataTypes(ComboSink& combo) const {
    LoadDataTypes(combo);
}

void CTALUWebData::SetEncryptKey(const QString& key) {
    encryptKey_ = ExpandKey(key);
}

QString CTALUWebData::EncryptSimple(const QString& text) {
    const std::optional<QString> result = quorvel::EncryptSimple(text, encryptKey_);
    if (result) return *result;
    ErrorReport(QStringLiteral("EncryptSimple"), QStringLiteral("Subscript out of range"));
    return {};
}

// ---- traces and reports ----

void CTALUWebData::TraceSent(const QString& text) {
    if (Logging(1)) LogLine(QStringLiteral("S>") + text);
}

void CTALUWebData::TraceReceived(const QString& text) {
    if (Logging(2)) LogLine(QStringLiteral("R>") + text);
}

void CTALUWebData::TraceReceivedData(const QString& text) {
    if (Logging(4)) LogLine(QStringLiteral("RD>") + text);
}

void CTALUWebData::TraceDebug(const QString& text) {
    if (Logging(3)) Q_EMIT ShowLog(QStringLiteral("D>") + text);
}

void CTALUWebData::ShowStatusText(const QString& text) {
    Q_EMIT ShowStatus(text);
}

void CTALUWebData::ReportAsyncError(const QString& text) {
    LogLine(QStringLiteral("A-error> ") + text);
    Q_EMIT ShowStatus(text);
}

void CTALUWebData::LogLine(const QString& text) {
    Q_EMIT ShowLog(text);
    WriteLogFile(QStringLiteral("CTALUWebData:") + text);
}

void CTALUWebData::ErrorReport(const QString& where, const QString& description) {
    Q_EMIT ShowStatus(description + QStringLiteral("|") + where);
    Prompter& prompter = prompter_ ? *prompter_ : CurrentPrompter();
    const int answer =
        prompter.SystemMsgBox(description + QStringLiteral("\r\nTALUWebData:") + where +
                                  QStringLiteral("\r\nDo you want to debug ?"),
                              kButtonsYesNo | kIconQuestion);
    if (answer == kAnswerYes && endProgram_) endProgram_();
}

void CTALUWebData::ShowBusy() {
    if (busyShown_) return;
    if (BusyPointer* busy = CurrentBusyPointer()) {
        busy->Push();
        busyShown_ = true;
    }
}

void CTALUWebData::RestorePointer() {
    if (!busyShown_) return;
    busyShown_ = false;
    if (BusyPointer* busy = CurrentBusyPointer()) busy->Pop();
}

} // namespace quorvel
