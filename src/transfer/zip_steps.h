#pragma once
// The zip steps around a transfer of a zipped record, with their progress on
// the transfer's progress view (percentages, "Zip: " + file name).

#include "support/ports.h"

#include <QString>

namespace quorvel {

struct ZipStepResult {
    int code = 0;
    QString zipFile;
};

// Packs the data file (or pattern) into ZipFileName(local).
ZipStepResult ZipForUpload(const QString& local, ProgressView* progress);
// ZipErrorText(code, "Zip") + CR LF + "File:" + local + CR LF + "ZipFile:" + zip file.
QString ZipUploadErrorText(const ZipStepResult& result, const QString& local);

// Unpacks a received zip file into its own folder.
int UnzipAfterDownload(const QString& localZip, ProgressView* progress);

} // namespace quorvel
