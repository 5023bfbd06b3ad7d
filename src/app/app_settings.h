#pragma once
// The window's values kept in the settings file between runs, with their
// defaults. The window copies them into its controls at start-up and back at
// exit.

#include "app/app_error.h"
#include "app/recent_files.h"

#include <QString>

#include <cstdint>
#include <optional>

namespace quorvel {

class LocalSettings;

struct AppSettings {
    QString cfgUrl;                   // "CFG_URL": configuration file address
    QString userId;                   // "UserID"
    QString password;                 // "Password"
    QString applicationFolder;        // "ApplicationFolder"
    QString dataFolder;               // "DataFolder"
    std::int16_t showDate0 = 1;       // "ShowDate0": check box 1 or 0
    std::int16_t getLocalFolders = 1; // "GetLocalFolders": 0 User, 1 Administrator
    std::int16_t getFileList = 1;     // "GetFileList": 0 User, 1 Administrator
    std::int16_t automatic = 0;       // "Automatic": 0 Manual, 1 Automatic every
    QString interval;                 // "Interval"
    QString lastDownload;             // "LastDownload"
    QString nextDownloadDue;          // "NextDownloadDue"
    std::int16_t downloadOnly = 0;    // "DownloadOnly": check box 1 or 0
    std::int16_t whichdates = 0;      // "Whichdates": 0 New data, 1 Data after
    QString afterDate;                // "AfterDate"
    RecentFiles recentFiles;          // "File1" to "File5"
    QString loadedFile;               // the file list in use ("File1" or files.txt)

    // Written at exit but never read back.
    float left = 0;             // "Left"
    float top = 0;              // "Top"
    std::int16_t showDate1 = 0; // "ShowDate1"

    bool operator==(const AppSettings&) const = default;

    // The values of a first start without a settings file.
    // dataFolder: the data folder's default (the program's folder when empty).
    static AppSettings Defaults(const QString& programFolder, int currentYear,
                                const QString& dataFolder = {});

    // Reads every key in order, each with its default. An option index that is
    // not a 16-bit number takes its own default; the first such key comes back
    // as the error ("Load") and every other key is read as usual.
    std::optional<AppError> Load(const LocalSettings& settings, const QString& programFolder,
                                 int currentYear, const QString& defaultDataFolder = {});
    // The same with the program's folders and the clock's year.
    std::optional<AppError> Load(const LocalSettings& settings);

    // Writes every written key in the order of exit, then the recent lists,
    // with one replacement of the file; false when it failed.
    bool Save(LocalSettings& settings) const;
};

// "1 Nov " followed by the year.
QString DefaultAfterDate(int year);
// The run-time's text of a single-precision number ("1440", "123.5").
QString SingleText(float value);

} // namespace quorvel
