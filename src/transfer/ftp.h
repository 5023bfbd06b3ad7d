#pragma once
// Whole-file transfer by FTP and plain HTTP fetches, as free functions over the
// one FTP session the process owns (ProcessFtpSession()). The session object
// holds all state; these names are a thin facade for the window and the
// processing engine.
//
// Intended use:
//   window, on load and on activation:  SetFTPDisplay(&traceView, &progressView)
//   window, when the account is configured (ConfigureClass):
//                                       SetFTPDetails(server, user, password, traceOn)
//   window, for a record's remote size: ftpRemoteFileSize(remote, size)
//   window, when it closes:             ftpClose()
//   engine, a whole file down or up:    ftpDownLoadFile(remote, local) /
//                                       ftpUploadFile(local, remote);
//                                       after false, ftpLastError() is the reason
//   login, configuration and file list: HTTPGetFileContents(url, contents)
// Server: "host" or "host:port". Remote names go to the server as given.
// All calls block on the caller's thread while letting its event loop run.

#include "support/ports.h"
#include "transfer/ftp_session.h"

#include <QString>

#include <cstdint>

namespace quorvel {

FtpSession& ProcessFtpSession();

// Either view may be null.
void SetFTPDisplay(TraceView* trace, ProgressView* progress);
void SetFTPDetails(const QString& server, const QString& user, const QString& password, bool trace);
bool OpenFTP();
void ftpClose();
bool ftpDownLoadFile(const QString& remote, const QString& local);
bool ftpUploadFile(const QString& local, const QString& remote);
bool ftpRemoteFileExists(const QString& remote);
bool ftpRemoteFileSize(const QString& remote, std::int64_t& size);
QString ftpLastError();
bool HTTPGetFileContents(const QString& url, QString& contents);

} // namespace quorvel
