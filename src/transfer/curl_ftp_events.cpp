#include "transfer/curl_ftp_events.h"

#include "transfer/ftp_status_events.h"

namespace quorvel {

namespace {

int DebugTrampoline(CURL*, curl_infotype type, char* data, size_t size, void* self) {
    auto* events = static_cast<CurlFtpEvents*>(self);
    if (type != CURLINFO_TEXT) events->NoteActivity();
    switch (type) {
    case CURLINFO_TEXT:
        events->OnText(data, size);
        break;
    case CURLINFO_HEADER_OUT:
        // Only the size: the password travels in one of these commands.
        events->OnStatus(static_cast<int>(FtpStatus::RequestSent), QString(),
                         static_cast<std::int64_t>(size));
        break;
    case CURLINFO_HEADER_IN:
        events->OnStatus(static_cast<int>(FtpStatus::CtlResponseReceived), QString(),
                         static_cast<std::int64_t>(size));
        break;
    default:
        break;
    }
    return 0;
}

int ProgressTrampoline(void* self, curl_off_t, curl_off_t dlnow, curl_off_t, curl_off_t ulnow) {
    return static_cast<CurlFtpEvents*>(self)->OnProgress(dlnow, ulnow);
}

int ResolverTrampoline(void*, void*, void* self) {
    static_cast<CurlFtpEvents*>(self)->OnResolverStart();
    return 0;
}

// "Trying 127.0.0.1:21..." gives "127.0.0.1:21".
QString AddressOfTrying(const QString& line) {
    QString address = line.mid(QStringLiteral("Trying ").size());
    while (address.endsWith(QLatin1Char('.')))
        address.chop(1);
    return address;
}

// "Connected to host (1.2.3.4) port 21 (#0)" gives "host (1.2.3.4) port 21".
QString AddressOfConnected(const QString& line) {
    QString address = line.mid(QStringLiteral("Connected to ").size());
    const qsizetype tag = address.indexOf(QStringLiteral(" (#"));
    return tag < 0 ? address : address.left(tag);
}

} // namespace

bool CurlFtpEvents::Attach(CURL* curl, const QString& host) {
    host_ = host;
    return curl_easy_setopt(curl, CURLOPT_DEBUGFUNCTION, DebugTrampoline) == CURLE_OK &&
           curl_easy_setopt(curl, CURLOPT_DEBUGDATA, this) == CURLE_OK &&
           curl_easy_setopt(curl, CURLOPT_VERBOSE, 1L) == CURLE_OK &&
           curl_easy_setopt(curl, CURLOPT_XFERINFOFUNCTION, ProgressTrampoline) == CURLE_OK &&
           curl_easy_setopt(curl, CURLOPT_XFERINFODATA, this) == CURLE_OK &&
           curl_easy_setopt(curl, CURLOPT_NOPROGRESS, 0L) == CURLE_OK &&
           curl_easy_setopt(curl, CURLOPT_RESOLVER_START_FUNCTION, ResolverTrampoline) ==
               CURLE_OK &&
           curl_easy_setopt(curl, CURLOPT_RESOLVER_START_DATA, this) == CURLE_OK;
}

void CurlFtpEvents::Detach(CURL* curl) {
    curl_easy_setopt(curl, CURLOPT_VERBOSE, 0L);
    curl_easy_setopt(curl, CURLOPT_DEBUGFUNCTION, nullptr);
    curl_easy_setopt(curl, CURLOPT_NOPROGRESS, 1L);
    curl_easy_setopt(curl, CURLOPT_XFERINFOFUNCTION, nullptr);
    curl_easy_setopt(curl, CURLOPT_RESOLVER_START_FUNCTION, nullptr);
}

void CurlFtpEvents::BeginCall() {
    connectionLost_ = false;
    lastDown_ = 0;
    lastUp_ = 0;
}

void CurlFtpEvents::OnStatus(int status, const QString& info, std::int64_t number) {
    if (HandleFtpStatus(report_, status, info, number) == FtpFollowUp::CloseConnection)
        connectionLost_ = true; // closed by the owner once curl has returned
}

void CurlFtpEvents::OnText(const char* data, size_t size) {
    const QString line = QString::fromUtf8(data, static_cast<qsizetype>(size)).trimmed();
    if (line.startsWith(QStringLiteral("Trying "))) {
        const QString address = AddressOfTrying(line);
        if (resolving_) {
            resolving_ = false;
            OnStatus(static_cast<int>(FtpStatus::NameResolved), address, 0);
        }
        OnStatus(static_cast<int>(FtpStatus::ConnectingToServer), address, 0);
    } else if (line.startsWith(QStringLiteral("Connected to "))) {
        OnStatus(static_cast<int>(FtpStatus::ConnectedToServer), AddressOfConnected(line), 0);
    } else if (line.startsWith(QStringLiteral("Closing connection"))) {
        OnStatus(static_cast<int>(FtpStatus::ClosingConnection), QString(), 0);
        OnStatus(static_cast<int>(FtpStatus::ConnectionClosed), QString(), 0);
    }
}

int CurlFtpEvents::OnProgress(curl_off_t dlnow, curl_off_t ulnow) {
    if (dlnow > lastDown_ || ulnow > lastUp_) active_ = true;
    if (dlnow > lastDown_) {
        const curl_off_t step = dlnow - lastDown_;
        lastDown_ = dlnow;
        OnStatus(static_cast<int>(FtpStatus::ResponseReceived), QString(), step);
    }
    if (ulnow > lastUp_) {
        const curl_off_t step = ulnow - lastUp_;
        lastUp_ = ulnow;
        OnStatus(static_cast<int>(FtpStatus::SendingRequest), QString(), step);
    }
    report_.Pump();
    return abort_ ? 1 : 0;
}

void CurlFtpEvents::OnResolverStart() {
    resolving_ = true;
    OnStatus(static_cast<int>(FtpStatus::ResolvingName), host_, 0);
}

} // namespace quorvel
