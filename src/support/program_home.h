#pragma once
// Where the program keeps its settings, logs and default application folder.
//
// $XDG_CONFIG_HOME/quorvel (~/.config/quorvel) by default; beside the
// executable only when a settings file already lies there (a portable
// install); "--home DIR" or QUORVEL_HOME moves it anywhere.

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

    static QString Folder(); // no trailing separator
    // True when Folder() is the one the program would choose by itself, so a
    // command that starts it again needs no "--home".
    static bool IsDefault();
    // The default folder for a program run from exeFolder: exeFolder when it
    // holds "<programName>.ini", else "quorvel" in the user's configuration
    // folder. Neither is created here.
    static QString DefaultFolderFor(const QString& exeFolder, const QString& programName);
    // Where data files go by default: the user's documents ("Quorvel") when
    // the settings are in the default configuration folder, else Folder().
    static QString DefaultDataFolder();
    static QString ProgramName(); // executable name without extension
    static QString SettingsFile();
    static QString LogFile();
    static QString FtpLogFile();
};

} // namespace quorvel
