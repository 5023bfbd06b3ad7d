#include "transfer/ftp_session.h"

#include "support/log_file.h"
#include "support/masked_text.h"
#include "support/program_home.h"
#include "transfer/curl_tls.h"
#include "transfer/ftp_status_events.h"
#include "transfer/ftp_url.h"
#include "transfer/http_fetch.h"

#include <chrono>
#include <exception>

namespace quorvel {

namespace {
const QString kCrLf = QStringLiteral("\r\n");

// The longer waits of a transfer follow the reply gap of the whole program.
long WaitSeconds() {
    const auto gap = CurrentClock().Waits().replyGap;
    return std::max<long>(1, static_cast<long>((gap.count() + 999) / 1000));
}
long WaitMilliseconds() {
    return std::max<long>(1, static_cast<long>(CurrentClock().Waits().replyGap.count()));
}
std::chrono::milliseconds StallLimit() {
    return std::chrono::milliseconds(WaitMilliseconds());
}

size_t DiscardBody(char*, size_t size, size_t count, void*) {
    return size * count;
}
} // namespace

FtpSession::CallScope::~CallScope() {
    if (--session_.depth_ == 0 && session_.closeRequested_) {
        session_.closeRequested_ = false;
        session_.events_.ClearAbort();
        session_.DoClose();
    }
}

FtpSession::FtpSession() = default;

FtpSession::~FtpSession() {
    if (curl_) CurlFtpEvents::Detach(curl_->get());
}

void FtpSession::SetDisplay(TraceView* trace, ProgressView* progress) {
    report_.SetDisplay(trace, progress);
}

void FtpSession::SetDetails(const QString& server, const QString& user, const QString& password,
                            bool trace) {
    const bool changed = server != server_ || user != user_ || password != password_;
    server_ = server;
    user_ = user;
    password_ = password;
    report_.SetTracing(trace);
    // A connection made with other details must not serve the next transfer.
    if (changed && ids_.internet != 0) {
        if (depth_ == 0)
            DoClose();
        else
            closeRequested_ = true;
    }
}

QString FtpSession::ShownServer() const {
    QString shown = MaskUrlPassword(server_);
    // Also where the password stands in the text in some other form.
    if (!password_.isEmpty()) shown.replace(password_, QStringLiteral("***"));
    return shown;
}

void FtpSession::ClearError() {
    lastError_.clear();
    detail_.clear();
}

QString FtpSession::LastError() const {
    if (detail_.isEmpty()) return lastError_;
    return lastError_ + kCrLf + detail_;
}

bool FtpSession::RefuseNested() {
    if (depth_ == 0) return false;
    lastError_ = QStringLiteral("Another FTP transfer is running");
    detail_.clear();
    return true;
}

bool FtpSession::Guarded(const QString& where, const std::function<bool()>& body) {
    bool result = false;
    try {
        result = body();
    } catch (const std::exception& error) {
        CurrentPrompter().MyMsgBox(QString::fromLocal8Bit(error.what()) + kCrLf +
                                       QStringLiteral("FTP:") + where,
                                   kButtonsOk);
    }
    return result;
}

bool FtpSession::Open() {
    if (RefuseNested()) return false;
    ClearError();
    CallScope scope(*this);
    return Guarded(QStringLiteral("OpenFTP: ") + ShownServer(), [&] { return DoOpen(); });
}

void FtpSession::Close() {
    if (depth_ > 0) {
        closeRequested_ = true;
        events_.RequestAbort();
        return;
    }
    DoClose();
}

bool FtpSession::DoOpen() {
    if (IsOpen() && !events_.ConnectionLost()) return true;
    DoClose();
    BusyGuard busy(CurrentBusyPointer());
    report_.Status(QStringLiteral("Connecting to internet..."));
    if (!CreateHandle()) {
        Fail(QStringLiteral("Could not connect to internet"));
        return false;
    }
    if (!events_.Attach(curl_->get(), FtpHostName(server_))) {
        ids_.callback = -1;
        Fail(QStringLiteral("Failed to set callback"));
        return false;
    }
    ids_.callback = 1;
    report_.Status(QStringLiteral("Connecting to ") + ShownServer() + QStringLiteral("..."));
    QString trustError;
    if (!ApplyTlsTrust(curl_->get(), trustError)) {
        Fail(QStringLiteral("Failed ftp access to ") + ShownServer());
        detail_ = trustError;
        return false;
    }
    curl_easy_setopt(curl_->get(), CURLOPT_NOBODY, 1L);
    if (!Perform(QString())) {
        Fail(QStringLiteral("Failed ftp access to ") + ShownServer());
        return false;
    }
    ids_.connection = ++connectionsMade_;
    report_.Status(QStringLiteral("Connected to ") + ShownServer());
    return true;
}

bool FtpSession::CreateHandle() {
    curl_ = std::make_unique<CurlHandle>();
    runner_ = std::make_unique<CurlMultiRun>();
    if (!curl_->Valid() || !runner_->Valid()) {
        curl_.reset();
        runner_.reset();
        return false;
    }
    ids_.internet = ++handlesMade_;
    ConfigureHandle();
    return true;
}

void FtpSession::ConfigureHandle() {
    CURL* curl = curl_->get();
    curl_easy_setopt(curl, CURLOPT_ERRORBUFFER, errorBuffer_);
    curl_easy_setopt(curl, CURLOPT_NOSIGNAL, 1L);
    // The scheme of the server text decides; a secure session that cannot be
    // had fails instead of going on in plain text.
    const FtpTls tls = FtpTlsOf(server_);
    curl_easy_setopt(curl, CURLOPT_PROTOCOLS_STR, tls == FtpTls::Implicit ? "ftps" : "ftp");
    curl_easy_setopt(curl, CURLOPT_USE_SSL,
                     static_cast<long>(tls == FtpTls::None ? CURLUSESSL_NONE : CURLUSESSL_ALL));
    curl_easy_setopt(curl, CURLOPT_USERNAME, user_.toUtf8().constData());
    curl_easy_setopt(curl, CURLOPT_PASSWORD, password_.toUtf8().constData());
    // The data connection goes to the server we logged in to, whatever address
    // a passive-mode reply names: a hostile reply cannot send it elsewhere.
    curl_easy_setopt(curl, CURLOPT_FTP_SKIP_PASV_IP, 1L);
    // Remote names go to the server as given, without walking folders.
    curl_easy_setopt(curl, CURLOPT_FTP_FILEMETHOD, static_cast<long>(CURLFTPMETHOD_NOCWD));
    curl_easy_setopt(curl, CURLOPT_CONNECTTIMEOUT_MS, WaitMilliseconds());
    curl_easy_setopt(curl, CURLOPT_SERVER_RESPONSE_TIMEOUT, WaitSeconds());
    // A transfer that stalls completely ends instead of hanging the run.
    curl_easy_setopt(curl, CURLOPT_LOW_SPEED_LIMIT, 1L);
    curl_easy_setopt(curl, CURLOPT_LOW_SPEED_TIME, WaitSeconds());
    curl_easy_setopt(curl, CURLOPT_TCP_KEEPALIVE, 1L);
    curl_easy_setopt(curl, CURLOPT_BUFFERSIZE, 512L * 1024L);
    curl_easy_setopt(curl, CURLOPT_UPLOAD_BUFFERSIZE, 512L * 1024L);
    curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, DiscardBody);
}

void FtpSession::DoClose() {
    report_.Trace(QStringLiteral("fl_Callback=") + QString::number(ids_.callback) +
                  QStringLiteral(" fl_ftpConnection=") + QString::number(ids_.connection) +
                  QStringLiteral(" fl_Internet=") + QString::number(ids_.internet));
    if (ids_.callback != 0 && ids_.callback != -1 && ids_.internet != 0)
        report_.Trace(QStringLiteral("Remove Callback"));
    // Silenced in every case: curl reports its goodbye while it cleans up.
    if (curl_) CurlFtpEvents::Detach(curl_->get());
    ids_.callback = 0;
    if (ids_.connection != 0) {
        report_.Trace(QStringLiteral("close connection"));
        ids_.connection = 0;
    }
    if (ids_.internet != 0) {
        report_.Trace(QStringLiteral("close internet"));
        ids_.internet = 0;
    }
    runner_.reset(); // closes the connection it holds
    curl_.reset();
}

// Runs the prepared call. A success drops the reason an earlier try of the
// same operation left. On failure the reason is kept and, when the connection
// was dropped or went silent, the session closes so that the next call starts
// afresh.
bool FtpSession::Perform(const QString& remote, bool ignoreNotFound) {
    CURL* curl = curl_->get();
    curl_easy_setopt(
        curl, CURLOPT_URL,
        (remote.isEmpty() ? FtpServerUrl(server_) : FtpFileUrl(server_, remote)).constData());
    errorBuffer_[0] = '\0';
    localError_.clear();
    events_.BeginCall();
    const CurlRunResult run =
        runner_->Run(curl, StallLimit(), [this] { return events_.TakeActivity(); });
    if (run.code == CURLE_OK) {
        detail_.clear();
        return true;
    }
    if (run.stalled) errorBuffer_[0] = '\0'; // curl knows nothing of our limit
    if (!(ignoreNotFound && run.code == CURLE_REMOTE_FILE_NOT_FOUND))
        detail_ = localError_.isEmpty() ? CurlErrorText(run.code, errorBuffer_) : localError_;
    if (closeRequested_ && detail_.isEmpty())
        detail_ = QStringLiteral("The connection was closed during the transfer");
    if (events_.ConnectionLost() || run.stalled) DoClose();
    return false;
}

bool FtpSession::HttpGetFileContents(const QString& url, QString& contents) {
    // Uses a handle of its own, so it may run while a transfer waits.
    ClearError();
    BusyGuard busy(CurrentBusyPointer());
    const bool ok = Guarded(QStringLiteral("HTTPGetFileContents: ") + MaskUrlPassword(url), [&] {
        const HttpFetchOutcome outcome =
            FetchHttpText(url, QStringLiteral("TALUWebdData"), report_, contents);
        lastError_ = outcome.error;
        detail_ = outcome.detail;
        return outcome.ok;
    });
    if (!lastError_.isEmpty()) report_.Status(lastError_);
    return ok;
}

void FtpSession::LogTransfer(const QString& text) {
    const QString file = ProgramHome::FtpLogFile();
    if (!AppendLogLine(file, text))
        CurrentPrompter().MyMsgBox(
            QStringLiteral("Could not write the transfer log") + kCrLf + file, kButtonsOk);
}

} // namespace quorvel
