#pragma once
// Opening a file with the application the desktop associates with it.

#include <QString>

#include <functional>

namespace quorvel {

// Result codes of an open attempt, as the described shell reports them.
enum ShellResult : int {
    kShellOk = 33,
    kShellOutOfMemory = 8,
    kShellFileNotFound = 2,
    kShellPathNotFound = 3,
    kShellAccessDenied = 5,
    kShellNoAssociation = 31,
};

// The desktop's open operation; returns true when it started an application.
using DesktopOpener = std::function<bool(const QString& file)>;
void SetDesktopOpener(DesktopOpener opener);

// The message for a failed result code (empty for success).
QString ShellErrorText(int code);

// Opens the file; on failure shows the message + CR LF + "File: " + file in a
// plain box and returns false.
bool ShellOpenFile(const QString& file, const QString& folder = {});

} // namespace quorvel
