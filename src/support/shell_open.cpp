#include "support/shell_open.h"

#include "support/error_box.h"
#include "support/paths.h"
#include "support/ports.h"

#include <QFileInfo>

namespace quorvel {

namespace {

DesktopOpener& Opener() {
    static DesktopOpener opener;
    return opener;
}

// What the desktop made of the request, in the codes the messages are keyed by.
int TryOpen(const QString& file) {
    const QFileInfo info(file);
    if (!info.exists())
        return QFileInfo(GetPath(file)).isDir() || GetPath(file).isEmpty() ? kShellFileNotFound
                                                                           : kShellPathNotFound;
    if (!info.isReadable()) return kShellAccessDenied;
    if (!Opener() || !Opener()(info.absoluteFilePath()))
        return 27; // nothing on this desktop opens the file
    return kShellOk;
}

} // namespace

void SetDesktopOpener(DesktopOpener opener) {
    Opener() = std::move(opener);
}

QString ShellErrorText(int code) {
    switch (code) {
    case 0:
    case 8:
        return QStringLiteral("Out of memory");
    case 2:
        return QStringLiteral("File not found");
    case 3:
        return QStringLiteral("Path not found");
    case 5:
        return QStringLiteral("Path/file access error");
    case 11:
        return QStringLiteral("The executable file is invalid or corrupt");
    case 26:
        return QStringLiteral("A sharing violation occurred.");
    case 27:
        return QStringLiteral("This file type does not have a valid file association.");
    case 28:
        return QStringLiteral("The file could not be opened due to time out. Please try again in a "
                              "moment.");
    case 29:
        return QStringLiteral("The file could not be opened because the DDE transaction failed. "
                              "Please try again in a moment.");
    case 30:
        return QStringLiteral("The file could not be opened because the target application is "
                              "busy. Please try again in a moment.");
    case 32:
        return QStringLiteral("The specified dynamic-link library was not found.");
    default:
        if (code >= 1 && code <= 32)
            return QStringLiteral(
                "An error occurred occurred whilst trying to open or print the selected file.");
        return {};
    }
}

bool ShellOpenFile(const QString& file, const QString& /*folder*/) {
    const QString native = ToNativeSeparators(file);
    const int code = TryOpen(native);
    if (code > 32 || code < 0) return true;
    CurrentPrompter().SystemMsgBox(ShellErrorText(code) + QStringLiteral("\r\nFile: ") + native,
                                   kButtonsOk);
    return false;
}

} // namespace quorvel
