#include "support/ui/desktop_opener.h"

#include "support/shell_open.h"

#include <QDesktopServices>
#include <QUrl>

namespace quorvel {

bool OpenWithDesktop(const QString& file) {
    // A URL, never a shell command line: file names reach no shell.
    return QDesktopServices::openUrl(QUrl::fromLocalFile(file));
}

void InstallDesktopOpener() {
    SetDesktopOpener(&OpenWithDesktop);
}

} // namespace quorvel
