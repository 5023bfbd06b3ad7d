#include "transfer/curl_multi_run.h"

#include <algorithm>

namespace quorvel {

namespace {
// The longest single wait, so that the stall limit and a requested stop are
// looked at often enough.
constexpr long kLongestWaitMs = 100;
} // namespace

CurlMultiRun::CurlMultiRun() : multi_(curl_multi_init()) {}

CurlMultiRun::~CurlMultiRun() {
    if (multi_ != nullptr) curl_multi_cleanup(multi_);
}

long CurlMultiRun::NextWaitMs() const {
    fd_set read, write, error;
    FD_ZERO(&read);
    FD_ZERO(&write);
    FD_ZERO(&error);
    int highest = -1;
    curl_multi_fdset(multi_, &read, &write, &error, &highest);
    // Nothing to wait on: curl is ready for its next step now.
    if (highest < 0) return 1;
    long timeout = -1;
    curl_multi_timeout(multi_, &timeout);
    return timeout < 0 ? kLongestWaitMs : std::clamp(timeout, 0L, kLongestWaitMs);
}

CurlRunResult CurlMultiRun::Run(CURL* easy, std::chrono::milliseconds stallLimit,
                                const std::function<bool()>& sawActivity) {
    using Steady = std::chrono::steady_clock;
    CurlRunResult result;
    if (multi_ == nullptr || curl_multi_add_handle(multi_, easy) != CURLM_OK) {
        result.code = CURLE_FAILED_INIT;
        return result;
    }
    Steady::time_point lastSign = Steady::now();
    for (;;) {
        int running = 0;
        if (curl_multi_perform(multi_, &running) != CURLM_OK) {
            result.code = CURLE_FAILED_INIT;
            break;
        }
        int left = 0;
        while (CURLMsg* message = curl_multi_info_read(multi_, &left)) {
            if (message->msg == CURLMSG_DONE && message->easy_handle == easy)
                result.code = message->data.result;
        }
        if (running == 0) break;
        const Steady::time_point now = Steady::now();
        if (sawActivity()) {
            lastSign = now;
        } else if (now - lastSign >= stallLimit) {
            result.code = CURLE_OPERATION_TIMEDOUT;
            result.stalled = true;
            break;
        }
        curl_multi_poll(multi_, nullptr, 0, static_cast<int>(NextWaitMs()), nullptr);
    }
    curl_multi_remove_handle(multi_, easy);
    return result;
}

} // namespace quorvel
