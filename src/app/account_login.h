#pragma once
// Login and account configuration: the configuration file (its five lines
// name the FTP server, FTP user, enciphered FTP password, HTTP server and web
// folder), the user's details from the service (GETUSERFOLDERS) and the
// user's file list from the service. Widget-free: the window copies its
// fields into AccountFields, runs a step and shows the fields again; the
// command-line run keeps its own AccountFields.
//
// How a caller signs in (start-up, "Login", the command-line run):
//   AccountLogin login(services, trace);
//   login.GetSecureFTPDetails(fields)                      the CFG file
//   login.GetUserDetails(fields, base)                     the user's name and folders
//   if (fields.foldersFromAdministrator)
//       login.GetFileListFromServer(fields, base, list)    the user's list
// Each step ticks its "Got ..." box in fields when it succeeded; a ticked box
// makes the step skip its work. After a false result, LastError() says why.

#include "app/app_error.h"
#include "app/run/run_settings.h"

#include <QString>

#include <optional>
#include <vector>

namespace quorvel {

class FileList;
class TraceView;

// The key text under which a configuration file's FTP password is enciphered.
inline constexpr const char* kLoginKeyText = "tlu";

// The account fields of the window that the login steps read and fill.
struct AccountFields {
    QString cfgUrl, userId, password; // typed by the user
    // Lines 1 to 5 of the configuration file (line 3 deciphered).
    QString ftpServer, ftpUserId, ftpPassword, httpServer, webFolder;
    bool gotSecure = false;   // "Got Secure"
    bool gotPHP = false;      // "Got user folders"
    bool gotFileList = false; // "Got file list"
    QString userName;         // beside "Welcome..."
    QString userFolderOnSite; // "User folder on web site:"
    QString userFolder;       // "User folder:"
    QString userCurrentFolder;
    QString applicationFolder, dataFolder;
    bool foldersFromAdministrator = true; // "Folders from..." = "Administrator"

    bool operator==(const AccountFields&) const = default;
};

// What the service answers to GETUSERFOLDERS.
struct UserDetails {
    QString name, folder, currentFolder, dataFolder;
};

// What the login steps ask of the services (AppServices in the program).
class AccountService {
public:
    virtual ~AccountService() = default;
    // ConfigureClass: the web-data object and the FTP module take the account.
    virtual void Configure(const AccountSettings& account) = 0;
    // A plain GET of a small text file; false with LastError().
    virtual bool FetchText(const QString& url, QString& contents) = 0;
    // GETUSERFOLDERS with the configured user; nullopt with LastError().
    virtual std::optional<UserDetails> GetUserFolders() = 0;
    virtual QString LastError() const = 0;
};

// The lines of a text served from Windows or from Linux: a line ends at CR LF,
// LF or a lone CR; a final line end starts no further line.
QStringList SplitServedLines(const QString& text);

// The address of the user's file list: the HTTP server text, exactly one "/",
// the user folder (with "/" after it when it has one), "files.txt".
QString FileListAddress(const QString& httpServer, const QString& userFolder);

// base with the account of fields: what ConfigureClass hands over.
AccountSettings WithAccount(AccountSettings base, const AccountFields& fields);

class AccountLogin {
public:
    AccountLogin(AccountService& service, TraceView& trace) : service_(service), trace_(trace) {}

    bool GetSecureFTPDetails(AccountFields& fields);
    // base: the trace switches and from-date that go to the services with the account.
    bool GetUserDetails(AccountFields& fields, const AccountSettings& base);
    // On success the list holds the service's records, is marked changed and
    // will be written as "files.txt" in the application folder (LoadedFile).
    // Records that could not be loaded are in LoadErrors().
    bool GetFileListFromServer(AccountFields& fields, const AccountSettings& base, FileList& list);

    // Why the last step failed (empty when it did not say).
    const QString& LastError() const { return lastError_; }
    const std::vector<AppError>& LoadErrors() const { return loadErrors_; }

private:
    AccountService& service_;
    TraceView& trace_;
    QString lastError_;
    std::vector<AppError> loadErrors_;
};

} // namespace quorvel
