#pragma once
// Owns one libcurl easy handle. The library's global set-up runs once per
// process, before the first handle, and is never undone: handles may outlive
// main() inside process-owned objects.

#include <curl/curl.h>

#include <QString>

#include <memory>

namespace quorvel {

class CurlHandle {
public:
    CurlHandle();
    bool Valid() const { return handle_ != nullptr; }
    CURL* get() const { return handle_.get(); }
    void Reset() { handle_.reset(); }

private:
    struct Cleanup {
        void operator()(CURL* handle) const { curl_easy_cleanup(handle); }
    };
    std::unique_ptr<CURL, Cleanup> handle_;
};

// curl's message for a result, preferring the detailed text it wrote into the
// error buffer of the failed call.
QString CurlErrorText(CURLcode code, const char* errorBuffer);

} // namespace quorvel
