#include "transfer/zip_steps.h"

#include "support/paths.h"
#include "transfer/zip_archive.h"
#include "transfer/zip_codes.h"

namespace quorvel {

namespace {

// Percentages mode, caption at the left, no units.
ZipProgress StartProgress(ProgressView* view) {
    if (view == nullptr) return {};
    view->Initialise(-1, 0, QString());
    return [view](const QString& file, int percent) {
        view->Show(percent, QStringLiteral("Zip: ") + file);
    };
}

void FinishProgress(ProgressView* view) {
    if (view != nullptr) view->Finish();
}

} // namespace

ZipStepResult ZipForUpload(const QString& local, ProgressView* progress) {
    ZipStepResult result;
    result.zipFile = ZipFileName(local);
    result.code = ZipFiles({local}, result.zipFile, StartProgress(progress));
    FinishProgress(progress);
    return result;
}

QString ZipUploadErrorText(const ZipStepResult& result, const QString& local) {
    return ZipErrorText(result.code, QStringLiteral("Zip")) + QStringLiteral("\r\nFile:") + local +
           QStringLiteral("\r\nZipFile:") + result.zipFile;
}

int UnzipAfterDownload(const QString& localZip, ProgressView* progress) {
    QString folder = GetPath(localZip);
    if (folder.isEmpty()) folder = QStringLiteral(".");
    const int code = UnzipFile(localZip, folder, StartProgress(progress));
    FinishProgress(progress);
    return code;
}

} // namespace quorvel
