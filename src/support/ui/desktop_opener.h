#pragma once
// Opening files with the desktop's associated application.

#include <QString>

namespace quorvel {

// Asks the desktop to open the local file; true when it started an application.
bool OpenWithDesktop(const QString& file);

// Makes ShellOpenFile use OpenWithDesktop.
void InstallDesktopOpener();

} // namespace quorvel
