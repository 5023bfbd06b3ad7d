#pragma once
// CTALUWebData: the client's side of the service script wd.php.
//
// How the window wires it:
// - Create one object for the whole run and one TcpSocketControl; hand the
//   socket over with MyWinsock(&socket). MyWinsock connects the socket's seven
//   events to Disconnect, Connect, ConnectionRequest, DataArrival, WError,
//   SendComplete and SendProgress, so the window forwards nothing itself.
// - Connect Finished and ShowStatus to the status display, ShowLog and
//   ShowReceived to the trace display; ProgressShow is never raised.
// - Before every exchange copy the fields in (ConfigureClass): SetAgent,
//   EnableLog per check box, SetRemoteHost ("host" or "host:port"),
//   SetWebFolder, SetFromDate, SetUserID, SetPassword and SetPictureBox with
//   the progress view (a ProgressView, or nullptr for none).
// - The cancel button calls SetUserCancel(1).
// - The error question ("Do you want to debug ?") goes to CurrentPrompter()'s
//   waiting SystemMsgBox unless SetPrompter injects another; the notice of
//   SendNewData goes to its timed MyMsgBox. Waits take their length from
//   CurrentClock().Waits().replyGap.
// - The list fillers take a ComboSink; the window adapts its combo boxes.
//
// Every operation runs on the window's thread. A command sends its request and
// then pumps the event loop until the reply's final line or a time-out, so
// socket events, timer ticks and the cancel button run inside that wait.

#include "support/date_value.h"
#include "support/ports.h"
#include "webdata/combo_sink.h"
#include "webdata/output_file.h"
#include "webdata/reply_stream.h"
#include "webdata/socket_control.h"

#include <QDateTime>
#include <QElapsedTimer>
#include <QObject>
#include <QPointer>
#include <QString>

#include <array>
#include <cstdint>
#include <functional>

namespace quorvel {

struct ServiceAddress;

class CTALUWebData : public QObject, private ReplyStream::LineSink {
    Q_OBJECT
public:
    explicit CTALUWebData(QObject* parent = nullptr);
    ~CTALUWebData() override;

    // GETUSERFOLDERS; true when the reply ended with "OK".
    bool Initialise();
    // Socket events.
    void Connect(int index);
    void ConnectionRequest(int index, std::int32_t requestId);

    void SetUserCancel(int value);
    QString LastError() const { return lastError_; }
    void SetTraceServer(int value) { traceServer_ = value != 0; }
    // Index 0 to 4; others are ignored.
    void EnableLog(int which, int value);
    void MyWinsock(SocketControl* socket);
    // A new non-empty value closes the connection first.
    void SetUserID(const QString& userId);
    void SetPassword(const QString& password);
    void SetRemoteHost(const QString& host) { remoteHost_ = host; }
    void SetPictureBox(ProgressView* progress) { progress_ = progress; }
    void SetFileLocation(int location) { fileLocation_ = location; }
    QString UserFolder() const { return userFolder_; }
    QString UserName() const { return userName_; }
    QString UserCurrentFolder() const { return userCurrentFolder_; }
    QString UserDataFolder() const { return userDataFolder_; }

    // which 0: the local file's last date; 1: the service's (GETLASTDATE).
    // "-" when there is none or display is 0; empty for any other which.
    QString LastDateInFile(const QString& file, int locationId, int which, int dateFormat,
                           int display);
    void SetFromDate(int doFromDate, const QString& fromDate);
    // GETLASTDATE, then GETDATA from the local file's last date; appends the
    // received records. True when both ended with "OK".
    bool GetNewData(const QString& localFilename, int location, int dateType);
    // Only tells that incremental uploads go by FTP; true.
    bool SendNewData(const QString& localFilename, int location, int dateFormat);

    // Socket events.
    void DataArrival(int index, std::int64_t bytes);
    void Disconnect();
    void WError(int index, int number, const QString& description);
    void SendComplete(int index);
    void SendProgress(int index, std::int64_t bytesSent, std::int64_t bytesRemaining);

    QString URLEncode(const QString& text) const;
    QString WinsockStatus(std::int32_t code) const;
    void LoadComboWithIPAddresses(ComboSink& combo) const;
    void LoadComboWithIntervals(ComboSink& combo) const;
    void LoadComboWithDataTypes(ComboSink& combo) const;
    void SetAgent(const QString& agent) { agent_ = agent; }
    void SetWebFolder(const QString& folder) { webFolder_ = folder; }
    QString WebFolder() const { return webFolder_; }
    // Stored doubled until longer than 50 characters.
    void SetEncryptKey(const QString& key);
    QString EncryptKey() const { return encryptKey_; }
    QString EncryptSimple(const QString& text);

    // Whether an arrival of data is shown as text (ShowReceived is connected or
    // "Receive detail" is on); without it no arrival is converted to text.
    bool ShowsReceivedText() const;

    // What the last exchanges found; 0 means none.
    DateValue ServerLastDate() const { return serverLastDate_; }
    DateValue LocalLastDate() const { return localLastDate_; }

    // Injection points. A null prompter means CurrentPrompter(). The ender
    // runs when the user answers Yes to the error question.
    void SetPrompter(Prompter* prompter) { prompter_ = prompter; }
    void SetProgramEnder(std::function<void()> ender) { endProgram_ = std::move(ender); }

Q_SIGNALS:
    void Finished(const QString& message);
    void ShowStatus(const QString& message);
    void ShowLog(const QString& message);
    void ShowReceived(const QString& text);
    void ProgressShow(int which, std::int64_t bytesSent, std::int64_t bytesRemaining);

private:
    enum ReplyKind : int { kNothing = 0, kDataLines = 1, kLastDate = 3, kFolder = 4, kUser = 5 };

    // Requests.
    bool DoCommand(int action);
    void SendAction(int action);
    QString FailureText(int action, bool connected) const;
    void SendCommand(int commandIndex, const QString& dateText);
    void SendReply(const QString& line);
    // Connection.
    bool OpenConnection();
    bool ChooseEncryption(const ServiceAddress& target);
    bool WaitForReply();
    bool ReplyCameMeanwhile();
    void PumpOnce();
    QDateTime Now() const;
    QDateTime NextDeadline() const;
    void DropConnection();
    // Replies.
    void TakeArrival(QByteArray data);
    ReplyStream::Next OnLine(QByteArrayView line) override;
    ReplyStream::Framing BodyFraming() const override;
    bool TakesLinesInBulk() const override;
    qsizetype OnLines(QByteArrayView lines) override;
    void OnDropped(QByteArrayView bytes) override;
    void ProcessReply(QByteArrayView line);
    bool ProcessBrowserReplies(QByteArrayView line);
    void ProcessStatusLine(const QString& line);
    void ProcessHeaderLine(QByteArrayView line);
    void ProcessDataLine(QByteArrayView line, bool final, bool ok, QString& message);
    void WriteDataLine(QByteArrayView line);
    void ShowRecordProgress(QByteArrayView line, bool manyLines = false);
    void ProcessLastDate(const QString& value);
    void ProcessUserFolders(QByteArrayView line);
    void EndReplyWithError(const QString& message);
    void CloseOutputFile(bool complete);
    // Dates.
    bool GetDateFromLine(const QString& line, DateValue& date);
    DateValue GetLastDateInFile(const QString& file);
    void RepairTornAppend(const QString& file);
    // Traces and reports.
    void TraceSent(const QString& text);
    void TraceReceived(const QString& text);
    void TraceReceivedData(const QString& text);
    void TraceDebug(const QString& text);
    void ShowStatusText(const QString& text);
    void ReportAsyncError(const QString& text);
    void LogLine(const QString& text);
    void ErrorReport(const QString& where, const QString& description);
    bool Logging(int which) const { return enableLog_[static_cast<std::size_t>(which)]; }
    void ShowBusy();
    void RestorePointer();

    QPointer<SocketControl> socket_;
    QString remoteHost_;
    int remotePort_ = 80;
    QString agent_;
    QString webFolder_;
    QString userId_, password_;
    QString encryptKey_;
    int fileLocation_ = 0;
    int dateFormat_ = 0;
    QString remoteFile_;
    QString localFile_;
    std::array<QString, 16> commandWords_;
    bool traceServer_ = false;
    std::array<bool, 5> enableLog_{};
    bool userCancel_ = false;
    int replyStatus_ = 0;
    int replyKind_ = kNothing;
    int httpState_ = 0;
    QString lastCommand_;
    QString lastError_;
    QString connectError_; // why the latest connection failed, when the socket said
    QDateTime deadline_;
    DateValue serverLastDate_ = 0;
    DateValue localLastDate_ = 0;
    DateValue fromDate_ = 0;
    bool doFromDate_ = false;
    ReplyStream stream_;
    OutputFile output_;
    QString userName_, userFolder_, userCurrentFolder_, userFurtherFolder_, userDataFolder_;
    ProgressView* progress_ = nullptr;
    Prompter* prompter_ = nullptr;
    std::function<void()> endProgram_;
    bool busyShown_ = false;
    // What the head of the reply in progress announced.
    bool chunkedBody_ = false;
    std::int64_t contentLength_ = -1; // -1: none given
    bool closeAfterReply_ = false;
    bool replyEnded_ = false;     // a final line was handled by the last OnLine
    bool dropAfterDrain_ = false; // the service closes after this reply
    // The connection while a command runs.
    bool inArrival_ = false;          // DataArrival is running (a box inside may nest events)
    bool closePending_ = false;       // the peer closed while DataArrival was running
    bool waiting_ = false;            // a request waits for its reply
    bool closedWhileWaiting_ = false; // ... and the peer closed the connection
    bool reused_ = false;             // the request went over a connection kept from before
    QString connectedTo_;             // host and port the open connection was made to
    std::int64_t replyBytes_ = 0;     // bytes received since the request
    // Progress of received records is drawn at most every few tens of milliseconds.
    std::int64_t recordsSinceProgress_ = 0;
    qint64 lastProgressMs_ = -1;
    QElapsedTimer progressClock_;
};

} // namespace quorvel
