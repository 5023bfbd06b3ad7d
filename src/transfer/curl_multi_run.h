#pragma once
// Runs the transfers of one easy handle through a multi handle of our own,
// instead of curl_easy_perform. The multi handle keeps the connection between
// transfers, so one FTP log-in serves the whole run.
//
// Why not curl_easy_perform: in libcurl 7.88, when the passive-mode reply on
// a reused connection is read in the same step that sent the command (a fast
// server, often), the transfer is parked in a state that names no socket and
// no timer to wait for, and curl's own loop then sleeps its full poll time -
// one second - before it starts the data connection. About one transfer in
// four lost a second that way. Here a wait with nothing to wait on lasts a
// millisecond.
//
// It also ends a transfer that showed no sign of life for the stall limit, to
// the millisecond (curl's own response and low-speed limits count in whole
// seconds).
//
// Use:
//   CurlMultiRun runner;          // one per connection; destroying it closes it
//   const CurlRunResult r = runner.Run(easy, limit, [&] { return TakeActivity(); });

#include <curl/curl.h>

#include <chrono>
#include <functional>

namespace quorvel {

struct CurlRunResult {
    CURLcode code = CURLE_OK;
    bool stalled = false; // ended by the stall limit (code CURLE_OPERATION_TIMEDOUT)
};

class CurlMultiRun {
public:
    CurlMultiRun();
    ~CurlMultiRun();
    CurlMultiRun(const CurlMultiRun&) = delete;
    CurlMultiRun& operator=(const CurlMultiRun&) = delete;

    bool Valid() const { return multi_ != nullptr; }
    // Runs the handle's prepared transfer to its end. sawActivity tells whether
    // anything moved (a command, a reply, data) since it was last asked.
    CurlRunResult Run(CURL* easy, std::chrono::milliseconds stallLimit,
                      const std::function<bool()>& sawActivity);

private:
    long NextWaitMs() const;

    CURLM* multi_ = nullptr;
};

} // namespace quorvel
