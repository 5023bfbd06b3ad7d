// The transfers of the FTP session: remote find, download, upload.
#include "transfer/ftp_session.h"

#include "support/replacing_file.h"
#include "transfer/ftp_status_events.h"

#include <QFile>
#include <QFileInfo>

#include <algorithm>

namespace quorvel {

namespace {

constexpr int kTries = 3;

struct WriteTarget {
    ReplacingFile* file;
    QString* error;
};

size_t Discard(char*, size_t size, size_t count, void*) {
    return size * count;
}

void RestoreDiscard(CURL* curl) {
    curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, Discard);
    curl_easy_setopt(curl, CURLOPT_WRITEDATA, nullptr);
}

size_t WriteToFile(char* data, size_t size, size_t count, void* target) {
    auto* out = static_cast<WriteTarget*>(target);
    if (out->file->Write(QByteArrayView(data, static_cast<qsizetype>(size * count))))
        return size * count;
    *out->error = out->file->ErrorText();
    return 0; // curl ends the transfer with a write error
}

// Sends exactly the size announced at the start, so that a logger appending to
// the file meanwhile cannot make the upload overrun what curl was told.
struct ReadSource {
    QFile* file;
    QString* error;
    qint64 remaining;
};

size_t ReadFromFile(char* buffer, size_t size, size_t count, void* source) {
    auto* in = static_cast<ReadSource*>(source);
    const qint64 wanted = std::min(static_cast<qint64>(size * count), in->remaining);
    const qint64 bytes = wanted > 0 ? in->file->read(buffer, wanted) : 0;
    if (bytes >= 0) {
        in->remaining -= bytes;
        return static_cast<size_t>(bytes);
    }
    *in->error = in->file->errorString();
    return CURL_READFUNC_ABORT;
}

} // namespace

bool FtpSession::RemoteFileExists(const QString& remote) {
    if (RefuseNested()) return false;
    ClearError();
    CallScope scope(*this);
    return Guarded(QStringLiteral("ftpRemoteFileExists: ") + remote, [&] {
        bool openFailed = false;
        return FindWithRetries(remote, openFailed);
    });
}

bool FtpSession::RemoteFileSize(const QString& remote, std::int64_t& size) {
    size = 0;
    if (!RemoteFileExists(remote)) return false;
    size = findData_.size;
    return true;
}

bool FtpSession::FindWithRetries(const QString& remote, bool& openFailed) {
    BusyGuard busy(CurrentBusyPointer());
    for (int tries = 0;;) {
        if (!DoOpen()) {
            openFailed = true;
            return false;
        }
        report_.Trace(QStringLiteral("File exists: ") + remote);
        if (FindOnce(remote)) return true;
        if (++tries >= kTries || closeRequested_) return false;
        report_.Trace(QStringLiteral("FtpFindFirstFile error - ftpClose and try again Try: ") +
                      QString::number(tries));
        DoClose();
    }
}

bool FtpSession::FindOnce(const QString& remote) {
    CURL* curl = curl_->get();
    curl_easy_setopt(curl, CURLOPT_UPLOAD, 0L);
    curl_easy_setopt(curl, CURLOPT_NOBODY, 1L);
    curl_easy_setopt(curl, CURLOPT_FILETIME, 1L);
    const bool found = Perform(remote, true);
    if (curl_) curl_easy_setopt(curl_->get(), CURLOPT_FILETIME, 0L);
    if (!found) return false;
    curl_off_t size = -1;
    curl_off_t time = -1;
    curl_easy_getinfo(curl, CURLINFO_CONTENT_LENGTH_DOWNLOAD_T, &size);
    curl_easy_getinfo(curl, CURLINFO_FILETIME_T, &time);
    findData_.name = remote;
    findData_.size = size > 0 ? size : 0;
    findData_.modified = time >= 0 ? QDateTime::fromSecsSinceEpoch(time) : QDateTime();
    return true;
}

bool FtpSession::Download(const QString& remote, const QString& local) {
    if (RefuseNested()) return false;
    ClearError();
    CallScope scope(*this);
    report_.Counters().currentFile = remote;
    const QString text = remote + QStringLiteral("=>") + local;
    return Guarded(QStringLiteral("ftpDownLoadFile: ") + text, [&] {
        bool openFailed = false;
        if (!FindWithRetries(remote, openFailed)) {
            // A failed log-in is reported as such, not as a missing file.
            if (!openFailed)
                Fail(QStringLiteral("Downloading, but ") + remote +
                     QStringLiteral(" does not exist"));
            return false;
        }
        report_.ProgressStart(TransferState::Download, findData_.size, text);
        const bool received = GetOnce(remote, local);
        if (received)
            LogTransfer(text);
        else
            Fail(QStringLiteral("FtpGetFile Error"));
        report_.ProgressFinish();
        return received;
    });
}

// Receives into a temporary file beside the target, which replaces the target
// only once everything arrived and is on the disk: a broken transfer or a full
// disk leaves the old copy alone.
bool FtpSession::GetOnce(const QString& remote, const QString& local) {
    ReplacingFile file(local);
    if (!file.Open()) {
        detail_ = file.ErrorText();
        return false;
    }
    WriteTarget target{&file, &localError_};
    CURL* curl = curl_->get();
    curl_easy_setopt(curl, CURLOPT_UPLOAD, 0L);
    curl_easy_setopt(curl, CURLOPT_NOBODY, 0L);
    curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, WriteToFile);
    curl_easy_setopt(curl, CURLOPT_WRITEDATA, &target);
    const bool received = Perform(remote);
    if (curl_) RestoreDiscard(curl_->get());
    if (!received) return false; // the temporary file goes with `file`
    if (!file.Commit()) {
        detail_ = file.ErrorText();
        return false;
    }
    TransferDone();
    return true;
}

bool FtpSession::Upload(const QString& local, const QString& remote) {
    if (RefuseNested()) return false;
    ClearError();
    CallScope scope(*this);
    report_.Counters().currentFile = local;
    const QString text = local + QStringLiteral("=>") + remote;
    return Guarded(QStringLiteral("ftpUploadFile: ") + text, [&] {
        if (!QFileInfo(local).isFile()) {
            Fail(QStringLiteral("Uploading: ") + text +
                 QStringLiteral(" - but file does not exist"));
            return false;
        }
        for (int tries = 0; DoOpen();) {
            report_.ProgressStart(TransferState::Upload, QFileInfo(local).size(), text);
            if (PutOnce(local, remote)) {
                LogTransfer(text);
                report_.ProgressFinish();
                return true;
            }
            if (++tries >= kTries || closeRequested_) {
                Fail(QStringLiteral("FtpPutFile failed: ") + text);
                report_.ProgressFinish();
                return false;
            }
            report_.Trace(QStringLiteral("ftpPutFile error - call ftpClose and try again Try: ") +
                          QString::number(tries));
            DoClose();
        }
        return false;
    });
}

bool FtpSession::PutOnce(const QString& local, const QString& remote) {
    QFile file(local);
    if (!file.open(QIODevice::ReadOnly)) {
        detail_ = file.errorString();
        return false;
    }
    ReadSource source{&file, &localError_, file.size()};
    CURL* curl = curl_->get();
    curl_easy_setopt(curl, CURLOPT_NOBODY, 0L);
    curl_easy_setopt(curl, CURLOPT_UPLOAD, 1L);
    curl_easy_setopt(curl, CURLOPT_INFILESIZE_LARGE, static_cast<curl_off_t>(file.size()));
    curl_easy_setopt(curl, CURLOPT_READFUNCTION, ReadFromFile);
    curl_easy_setopt(curl, CURLOPT_READDATA, &source);
    const bool sent = Perform(remote);
    if (curl_) {
        curl_easy_setopt(curl_->get(), CURLOPT_UPLOAD, 0L);
        curl_easy_setopt(curl_->get(), CURLOPT_READFUNCTION, nullptr);
        curl_easy_setopt(curl_->get(), CURLOPT_READDATA, nullptr);
    }
    if (sent) TransferDone();
    return sent;
}

void FtpSession::TransferDone() {
    events_.OnStatus(static_cast<int>(FtpStatus::RequestComplete), QString(), 0);
    events_.OnStatus(static_cast<int>(FtpStatus::HandleClosing), QString(), 0);
}

} // namespace quorvel
