#pragma once
// The program's command line, read by one parser:
//   quorvel [/S] [--home DIR] [--ca-file FILE]      the window
//   quorvel --run-all [--home DIR] [--ca-file FILE] [--dry-run] [--quiet]
//   quorvel --encipher TEXT | --version | --help
// "/S" may stand anywhere, in any letter case. Qt's own window options
// (-platform, -style, ...) are let through to the window. Anything else is a
// bad argument: the usage is printed and the program ends with 2.

#include <QString>
#include <QStringList>

#include <optional>

namespace quorvel {

struct CommandLine {
    bool scheduled = false; // "/S": start minimised and work on the schedule
    std::optional<QString> home;
    std::optional<QString> caFile; // a private certificate authority (PEM)
    bool runAll = false;
    bool dryRun = false;
    bool quiet = false;
    std::optional<QString> encipher;
    bool help = false;
    bool version = false;
    QString error; // not empty: the arguments are not usable
};

// arguments: without the program's name.
CommandLine ParseCommandLine(const QStringList& arguments);

// The text of --help (also printed after a bad argument).
QString UsageText(const QString& version);

} // namespace quorvel
