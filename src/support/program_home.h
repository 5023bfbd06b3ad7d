#pragma once
// Where the program keeps its settings, logs and default application folder.
//
// Beside the executable when that folder is writable, else
// $XDG_CONFIG_HOME/quorvel; "--home DIR" or QUORVEL_HOME moves it.

#include <QString>
#include <QStringList>

namespace quorvel {

class ProgramHome {
public:
    // Decides the folder from the arguments, the environment and the executable.
    // Removes "--home DIR" from args.
    static void Configure(QStringList& args);
    // Sets the folder directly (tests); an empty folder returns to the default.
    static void SetFolder(const QString& folder);

    static QString Folder();      // no trailing separator
    static QString ProgramName(); // executable name without extension
    static QString SettingsFile();
    static QString LogFile();
    static QString FtpLogFile();
};

} // namespace quorvel
