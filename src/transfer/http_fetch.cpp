#include "transfer/http_fetch.h"

#include "support/masked_text.h"
#include "support/paths.h"
#include "transfer/curl_handle.h"
#include "transfer/curl_tls.h"

#include <QStringDecoder>
#include <QUrl>

namespace quorvel {

namespace {

size_t AppendBody(char* data, size_t size, size_t count, void* body) {
    static_cast<QByteArray*>(body)->append(data, static_cast<qsizetype>(size * count));
    return size * count;
}

// UTF-8 when the bytes are valid UTF-8, else the Windows "ANSI" reading.
QString DecodeText(const QByteArray& bytes) {
    QStringDecoder utf8(QStringDecoder::Utf8);
    QString text = utf8.decode(bytes);
    if (!utf8.hasError()) return text;
    return QString::fromLatin1(bytes);
}

// Lets the window repaint while a slow server answers.
int PumpEvents(void* report, curl_off_t, curl_off_t, curl_off_t, curl_off_t) {
    static_cast<FtpReport*>(report)->Pump();
    return 0;
}

void Prepare(CURL* curl, const QByteArray& address, const QString& userAgent, QByteArray& body,
             char* errorBuffer, FtpReport& report) {
    const long waitMs =
        std::max<long>(1, static_cast<long>(CurrentClock().Waits().replyGap.count()));
    const long waitS = std::max<long>(1, (waitMs + 999) / 1000);
    curl_easy_setopt(curl, CURLOPT_URL, address.constData());
    curl_easy_setopt(curl, CURLOPT_ERRORBUFFER, errorBuffer);
    curl_easy_setopt(curl, CURLOPT_NOSIGNAL, 1L);
    curl_easy_setopt(curl, CURLOPT_PROTOCOLS_STR, "http,https");
    // A secure address is never redirected to plain text.
    const bool secure = address.startsWith("https:");
    curl_easy_setopt(curl, CURLOPT_REDIR_PROTOCOLS_STR, secure ? "https" : "http,https");
    curl_easy_setopt(curl, CURLOPT_FOLLOWLOCATION, 1L);
    curl_easy_setopt(curl, CURLOPT_MAXREDIRS, 10L);
    curl_easy_setopt(curl, CURLOPT_USERAGENT, userAgent.toUtf8().constData());
    curl_easy_setopt(curl, CURLOPT_CONNECTTIMEOUT_MS, waitMs);
    curl_easy_setopt(curl, CURLOPT_LOW_SPEED_LIMIT, 1L);
    curl_easy_setopt(curl, CURLOPT_LOW_SPEED_TIME, waitS);
    curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, AppendBody);
    curl_easy_setopt(curl, CURLOPT_WRITEDATA, &body);
    curl_easy_setopt(curl, CURLOPT_XFERINFOFUNCTION, PumpEvents);
    curl_easy_setopt(curl, CURLOPT_XFERINFODATA, &report);
    curl_easy_setopt(curl, CURLOPT_NOPROGRESS, 0L);
}

} // namespace

QString HttpAddress(const QString& url) {
    QString address = url.trimmed();
    if (!address.startsWith(QStringLiteral("http://"), Qt::CaseInsensitive) &&
        !address.startsWith(QStringLiteral("https://"), Qt::CaseInsensitive))
        address.prepend(QStringLiteral("http://"));
    return ConvertSlashes(address, true);
}

HttpFetchOutcome FetchHttpText(const QString& url, const QString& userAgent, FtpReport& report,
                               QString& contents) {
    HttpFetchOutcome outcome;
    const QString address = HttpAddress(url);
    contents.clear();
    CurlHandle curl;
    if (!curl.Valid()) {
        outcome.error = QStringLiteral("Could not connect to internet");
        return outcome;
    }
    // A password in the address never reaches a trace or a message.
    const QString shown = MaskUrlPassword(address);
    report.Trace(QStringLiteral("Getting: ") + shown);
    QByteArray body;
    char errorBuffer[CURL_ERROR_SIZE] = {};
    Prepare(curl.get(), QUrl(address, QUrl::TolerantMode).toEncoded(), userAgent, body, errorBuffer,
            report);
    QString trustError;
    if (!ApplyTlsTrust(curl.get(), trustError)) {
        outcome.error = QStringLiteral("Could not connect to ") + shown;
        outcome.detail = trustError;
        return outcome;
    }
    const CURLcode code = curl_easy_perform(curl.get());
    if (code != CURLE_OK) {
        outcome.error = QStringLiteral("Could not connect to ") + shown;
        outcome.detail = CurlErrorText(code, errorBuffer);
        return outcome;
    }
    long status = 0;
    curl_easy_getinfo(curl.get(), CURLINFO_RESPONSE_CODE, &status);
    if (status < 200 || status > 299) {
        // A "not found" page must never stand in for a configuration or a list.
        outcome.error = QStringLiteral("Could not get ") + shown +
                        QStringLiteral(": HTTP status ") + QString::number(status);
        return outcome;
    }
    contents = DecodeText(body);
    if (contents.startsWith(QLatin1Char('<'))) {
        report.Trace(
            QStringLiteral("HTTPGetFileContents - found html tag, so file not there ???: ") +
            shown);
        outcome.error = QStringLiteral("An HTML page came back instead of ") + shown;
        return outcome;
    }
    report.Status(QStringLiteral("Received: ") + shown);
    outcome.ok = true;
    return outcome;
}

} // namespace quorvel
