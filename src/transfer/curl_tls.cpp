#include "transfer/curl_tls.h"

#include "support/tls_trust.h"

#include <QFile>

namespace quorvel {

namespace {

// The bundle curl would read by itself; a CA blob replaces it, so it is put
// in front of the extra CAs.
QByteArray DefaultBundle(CURL* curl) {
    char* path = nullptr;
    if (curl_easy_getinfo(curl, CURLINFO_CAINFO, &path) != CURLE_OK || path == nullptr) return {};
    QFile file(QString::fromLocal8Bit(path));
    return file.open(QIODevice::ReadOnly) ? file.readAll() + '\n' : QByteArray();
}

} // namespace

bool ApplyTlsTrust(CURL* curl, QString& error) {
    curl_easy_setopt(curl, CURLOPT_SSL_VERIFYPEER, 1L);
    curl_easy_setopt(curl, CURLOPT_SSL_VERIFYHOST, 2L);
    QByteArray extra;
    if (!TlsTrust::ReadExtraCaPem(extra, error)) return false;
    if (extra.isEmpty()) return true;
    QByteArray bundle = DefaultBundle(curl) + extra;
    curl_blob blob{bundle.data(), static_cast<size_t>(bundle.size()), CURL_BLOB_COPY};
    if (curl_easy_setopt(curl, CURLOPT_CAINFO_BLOB, &blob) != CURLE_OK) {
        error = QStringLiteral("This program's curl cannot add the CA files ") +
                TlsTrust::ExtraCaFiles().join(QStringLiteral(", "));
        return false;
    }
    return true;
}

} // namespace quorvel
