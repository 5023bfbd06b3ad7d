#pragma once
// Turns what libcurl reports during an FTP call (its debug texts, the commands
// and replies on the control connection, the byte counts of its progress
// callback) into connection events (ftp_status_events.h). Also the place where
// a running call is told to stop.

#include "transfer/ftp_report.h"

#include <curl/curl.h>

#include <QString>

#include <utility>

namespace quorvel {

class CurlFtpEvents {
public:
    explicit CurlFtpEvents(FtpReport& report) : report_(report) {}
    CurlFtpEvents(const CurlFtpEvents&) = delete;
    CurlFtpEvents& operator=(const CurlFtpEvents&) = delete;

    // Registers the callbacks on a handle; false when curl refused one.
    bool Attach(CURL* curl, const QString& host);
    // Silences the handle before it is cleaned up.
    static void Detach(CURL* curl);

    // Starts the byte counting of a new call.
    void BeginCall();
    // True when curl closed the connection during the last call.
    bool ConnectionLost() const { return connectionLost_; }
    // Makes the running call end at curl's next progress report.
    void RequestAbort() { abort_ = true; }
    void ClearAbort() { abort_ = false; }
    // True when a command went out or a reply or data came in since the last ask.
    bool TakeActivity() { return std::exchange(active_, false); }
    void NoteActivity() { active_ = true; }

    // Entry points of the callbacks (public for the C trampolines).
    void OnText(const char* data, size_t size);
    void OnStatus(int status, const QString& info, std::int64_t number);
    int OnProgress(curl_off_t dlnow, curl_off_t ulnow);
    void OnResolverStart();

private:
    FtpReport& report_;
    QString host_;
    bool resolving_ = false;
    bool connectionLost_ = false;
    bool abort_ = false;
    bool active_ = false;
    curl_off_t lastDown_ = 0;
    curl_off_t lastUp_ = 0;
};

} // namespace quorvel
