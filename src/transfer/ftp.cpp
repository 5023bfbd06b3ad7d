#include "transfer/ftp.h"

namespace quorvel {

FtpSession& ProcessFtpSession() {
    static FtpSession session;
    return session;
}

void SetFTPDisplay(TraceView* trace, ProgressView* progress) {
    ProcessFtpSession().SetDisplay(trace, progress);
}

void SetFTPDetails(const QString& server, const QString& user, const QString& password,
                   bool trace) {
    ProcessFtpSession().SetDetails(server, user, password, trace);
}

bool OpenFTP() {
    return ProcessFtpSession().Open();
}

void ftpClose() {
    ProcessFtpSession().Close();
}

bool ftpDownLoadFile(const QString& remote, const QString& local) {
    return ProcessFtpSession().Download(remote, local);
}

bool ftpUploadFile(const QString& local, const QString& remote) {
    return ProcessFtpSession().Upload(local, remote);
}

bool ftpRemoteFileExists(const QString& remote) {
    return ProcessFtpSession().RemoteFileExists(remote);
}

bool ftpRemoteFileSize(const QString& remote, std::int64_t& size) {
    return ProcessFtpSession().RemoteFileSize(remote, size);
}

QString ftpLastError() {
    return ProcessFtpSession().LastError();
}

bool HTTPGetFileContents(const QString& url, QString& contents) {
    return ProcessFtpSession().HttpGetFileContents(url, contents);
}

} // namespace quorvel
