#include "transfer/curl_handle.h"

#include <mutex>

namespace quorvel {

namespace {
void InitialiseCurlOnce() {
    static std::once_flag once;
    std::call_once(once, [] { curl_global_init(CURL_GLOBAL_DEFAULT); });
}
} // namespace

CurlHandle::CurlHandle() {
    InitialiseCurlOnce();
    handle_.reset(curl_easy_init());
}

QString CurlErrorText(CURLcode code, const char* errorBuffer) {
    if (errorBuffer != nullptr && errorBuffer[0] != '\0')
        return QString::fromUtf8(errorBuffer).trimmed();
    return QString::fromUtf8(curl_easy_strerror(code));
}

} // namespace quorvel
