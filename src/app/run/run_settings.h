#pragma once
// What a run takes from the window's fields besides the file records: the
// folders, the account and trace settings handed to the services before every
// file, and the run options.

#include "app/locations.h"

#include <QString>

#include <array>

namespace quorvel {

// The fields ConfigureClass copies into the FTP module and the web-data object.
struct AccountSettings {
    QString ftpServer, ftpUserId, ftpPassword;
    bool ftpTrace = false;      // "Trace": the FTP module's trace lines
    std::array<bool, 5> logs{}; // the web-data object's trace kinds, by index
    QString httpServer, webFolder;
    int fromDateChoice = 0; // 0 "New data", 1 "Data after"
    QString afterDate;
    QString userId, password;

    bool operator==(const AccountSettings&) const = default;
};

struct RunSettings {
    LocationFolders folders; // "other" is each record's own folder
    AccountSettings account;
    bool downloadOnly = false; // support mode: every file that moves is downloaded

    bool operator==(const RunSettings&) const = default;
};

} // namespace quorvel
