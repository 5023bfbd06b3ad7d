#pragma once
// A plain HTTP GET of a small text file (a configuration or a file list).

#include "transfer/ftp_report.h"

#include <QString>

namespace quorvel {

struct HttpFetchOutcome {
    bool ok = false;
    QString error;  // the reason, empty on success
    QString detail; // curl's own message, when it gave one
};

// "http://" is put in front of an address without a scheme and every "\"
// becomes "/". The reply counts only with a status of 200-299, and not when it
// starts with "<" (an HTML page where a text file was expected).
HttpFetchOutcome FetchHttpText(const QString& url, const QString& userAgent, FtpReport& report,
                               QString& contents);

// The address actually fetched for a given one.
QString HttpAddress(const QString& url);

} // namespace quorvel
