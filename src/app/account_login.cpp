#include "app/account_login.h"

#include "app/file_list.h"
#include "support/cipher.h"
#include "support/paths.h"
#include "support/ports.h"

#include <QRegularExpression>

namespace quorvel {

namespace {

constexpr int kCfgLines = 5;

bool IsSlash(QChar c) {
    return c == u'/' || c == u'\\';
}

// The folder rule of the locations: a trailing "\" unless it ends in one.
QString WithFolderSlash(const QString& folder) {
    if (folder.isEmpty() || IsSlash(folder.back())) return folder;
    return folder + u'\\';
}

} // namespace

QStringList SplitServedLines(const QString& text) {
    static const QRegularExpression lineEnd(QStringLiteral("\r\n|\n|\r"));
    QStringList lines = text.split(lineEnd);
    if (!lines.isEmpty() && lines.back().isEmpty()) lines.removeLast();
    return lines;
}

QString FileListAddress(const QString& httpServer, const QString& userFolder) {
    const QString rest = WithFolderSlash(userFolder) + QStringLiteral("files.txt");
    QString address = httpServer;
    // The service gives its user folder as "/ann" and the server text is
    // "host:port": one "/" between them, never two and never none.
    if (!address.isEmpty()) {
        const bool serverEnds = IsSlash(address.back());
        const bool restStarts = IsSlash(rest.front());
        if (serverEnds && restStarts)
            address.chop(1);
        else if (!serverEnds && !restStarts)
            address += u'/';
    }
    return QString(address + rest).replace(u'\\', u'/');
}

AccountSettings WithAccount(AccountSettings base, const AccountFields& f) {
    base.ftpServer = f.ftpServer;
    base.ftpUserId = f.ftpUserId;
    base.ftpPassword = f.ftpPassword;
    base.httpServer = f.httpServer;
    base.webFolder = f.webFolder;
    base.userId = f.userId;
    base.password = f.password;
    return base;
}

bool AccountLogin::GetSecureFTPDetails(AccountFields& f) {
    lastError_.clear();
    if (f.gotSecure) return true;
    QString body;
    if (!service_.FetchText(f.cfgUrl, body)) {
        lastError_ = service_.LastError();
        return false;
    }
    const QStringList lines = SplitServedLines(body);
    if (lines.size() < kCfgLines) {
        lastError_ = QStringLiteral("The configuration file %1 has %2 of its %3 lines")
                         .arg(f.cfgUrl)
                         .arg(lines.size())
                         .arg(kCfgLines);
        return false;
    }
    f.ftpServer = lines[0];
    f.ftpUserId = lines[1];
    f.ftpPassword = DecryptHex(lines[2], QString::fromLatin1(kLoginKeyText));
    f.httpServer = lines[3];
    f.webFolder = lines[4];
    f.gotSecure = true;
    return true;
}

bool AccountLogin::GetUserDetails(AccountFields& f, const AccountSettings& base) {
    lastError_.clear();
    // A ticked box reports failure here, so that a later activation does not
    // reload the file list.
    if (f.gotPHP) return false;
    service_.Configure(WithAccount(base, f));
    const std::optional<UserDetails> user = service_.GetUserFolders();
    if (!user) {
        lastError_ = service_.LastError();
        // Details of an earlier login must not outlive a failed one.
        f.userName.clear();
        if (f.foldersFromAdministrator) {
            f.userFolder.clear();
            f.userCurrentFolder.clear();
        }
        return false;
    }
    f.userName = user->name;
    f.userFolderOnSite = user->folder;
    if (f.foldersFromAdministrator) {
        if (!user->dataFolder.isEmpty()) f.dataFolder = user->dataFolder;
        f.userFolder = user->folder;
        f.userCurrentFolder = user->currentFolder;
    } else {
        trace_.AddTrace(QStringLiteral("GetUserDetails, but skip setting local folders"));
    }
    f.gotPHP = true;
    return true;
}

bool AccountLogin::GetFileListFromServer(AccountFields& f, const AccountSettings& base,
                                         FileList& list) {
    lastError_.clear();
    loadErrors_.clear();
    const QString address = FileListAddress(f.httpServer, f.userFolder);
    if (f.gotFileList) return true;
    service_.Configure(WithAccount(base, f));
    QString body;
    if (!service_.FetchText(address, body)) {
        lastError_ = service_.LastError();
        return false;
    }
    loadErrors_ = list.LoadListBytes(body.toUtf8(), address).errors;
    list.ListChanged = true;
    if (auto error = list.LoadLocalDates(f.applicationFolder)) loadErrors_.push_back(*error);
    list.LoadedFile = AddTrailingSlash(f.applicationFolder) + QStringLiteral("files.txt");
    trace_.AddTrace(QStringLiteral("Got file list"));
    f.gotFileList = true;
    return true;
}

} // namespace quorvel
