#pragma once
// One FTP connection kept for the whole run, plus the plain HTTP fetch that
// shares its reporting. Passive mode, binary transfers.
//
// Intended use (the window and the processing engine reach it through the
// facade in transfer/ftp.h):
//   SetDisplay(trace, progress)     when the window loads or is activated
//   SetDetails(server, user, pwd, trace)  each time the account is configured
//   Download / Upload / RemoteFileExists / RemoteFileSize  any number of times;
//                                   the first one connects, later ones reuse it
//   LastError()                     after a false result: the reason to show
//   Close()                         when the window closes
//
// Every operation blocks but lets the event loop run from curl's callbacks, so
// the window stays responsive. An operation started from such an event while
// another one runs is refused (false, LastError() says why); Close() from such
// an event stops the running transfer and closes once it has ended.

#include "support/ports.h"
#include "transfer/curl_ftp_events.h"
#include "transfer/curl_handle.h"
#include "transfer/curl_multi_run.h"
#include "transfer/ftp_report.h"

#include <QDateTime>
#include <QString>

#include <cstdint>
#include <functional>
#include <memory>

namespace quorvel {

// What the latest successful remote find learned about a file.
struct RemoteFileInfo {
    QString name;
    std::int64_t size = 0;
    QDateTime modified; // invalid when the server did not say
};

class FtpSession {
public:
    FtpSession();
    ~FtpSession();
    FtpSession(const FtpSession&) = delete;
    FtpSession& operator=(const FtpSession&) = delete;

    void SetDisplay(TraceView* trace, ProgressView* progress);
    // server: "host", "host:port", optionally with "ftp://" in front, or with
    // "ftps://" (implicit TLS) or "ftpes://" (explicit TLS, required).
    void SetDetails(const QString& server, const QString& user, const QString& password,
                    bool trace);

    bool Open();
    void Close();
    // The local file is replaced only by a completely received copy.
    bool Download(const QString& remote, const QString& local);
    bool Upload(const QString& local, const QString& remote);
    bool RemoteFileExists(const QString& remote);
    bool RemoteFileSize(const QString& remote, std::int64_t& size);
    // The reason of the latest failure, with curl's own message after a line
    // break when it gave one. Each operation starts with an empty reason.
    QString LastError() const;

    // Fetches a small text file; false for a failure, a status outside
    // 200-299 or a reply that starts with "<" (an HTML page).
    bool HttpGetFileContents(const QString& url, QString& contents);

    const RemoteFileInfo& RemoteFindData() const { return findData_; }
    TransferState State() const { return report_.Counters().state; }
    bool IsOpen() const { return ids_.internet != 0 && ids_.connection != 0; }

private:
    // Marks an operation as running; when the outermost one ends, a close
    // asked for in the meantime is carried out.
    class CallScope {
    public:
        explicit CallScope(FtpSession& session) : session_(session) { ++session_.depth_; }
        ~CallScope();
        CallScope(const CallScope&) = delete;
        CallScope& operator=(const CallScope&) = delete;

    private:
        FtpSession& session_;
    };

    bool DoOpen();
    void DoClose();
    bool CreateHandle();
    void ConfigureHandle();
    bool FindWithRetries(const QString& remote, bool& openFailed);
    bool FindOnce(const QString& remote);
    bool GetOnce(const QString& remote, const QString& local);
    bool PutOnce(const QString& local, const QString& remote);
    bool Perform(const QString& remote, bool ignoreNotFound = false);
    void TransferDone();
    void LogTransfer(const QString& text);
    bool RefuseNested();
    bool Guarded(const QString& where, const std::function<bool()>& body);
    void Fail(const QString& text) { lastError_ = text; }
    void ClearError();
    // The server text as traces and messages show it: never with a password.
    QString ShownServer() const;

    HandleIds ids_;
    FtpReport report_{ids_};
    CurlFtpEvents events_{report_};
    std::unique_ptr<CurlHandle> curl_;
    std::unique_ptr<CurlMultiRun> runner_; // holds the connection between transfers
    char errorBuffer_[CURL_ERROR_SIZE] = {};
    long handlesMade_ = 0;
    long connectionsMade_ = 0;

    QString server_, user_, password_;
    QString lastError_;
    QString detail_;
    QString localError_;
    RemoteFileInfo findData_;

    int depth_ = 0;
    bool closeRequested_ = false;
};

} // namespace quorvel
