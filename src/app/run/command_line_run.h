#pragma once
// The command-line run, `quorvel --run-all`: no display and no widget. It
// loads the settings and the file list as start-up does, signs in without
// boxes, runs all files through the engine, saves the list and the settings a
// window would save after a run (last run, next due time) and ends.
//
// Output: one line per active file on standard output ("[2/7] Site 1:
// downloaded 1,234 new records") and a summary line; --quiet prints only the
// failures. Start-up failures go to standard error. Every message a window
// would have shown goes to the program log.
//
// The process's prompter must answer at once (UnattendedPrompter without a
// timed box); main() installs it.

#include <QString>
#include <QTextStream>

namespace quorvel {

struct CommandLineRunOptions {
    bool dryRun = false; // print each record's decision; move nothing, write nothing
    bool quiet = false;  // print only failures
};

class CommandLineRun {
public:
    enum Exit : int {
        kAllDone = 0,       // every file succeeded
        kSomeFailed = 1,    // at least one file failed
        kCouldNotStart = 2, // bad arguments, no list, login failed, folders unusable
        kLockHeld = 3,      // another run holds the run lock
    };

    CommandLineRun(CommandLineRunOptions options, QTextStream& out, QTextStream& err)
        : options_(options), out_(out), err_(err) {}

    int Exec();

private:
    int CouldNotStart(const QString& why);

    CommandLineRunOptions options_;
    QTextStream& out_;
    QTextStream& err_;
};

} // namespace quorvel
