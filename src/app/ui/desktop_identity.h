#pragma once
// How the desktop knows the program: its title, its icon and the name of its
// desktop entry, so that boxes, the task bar and the tray show the same.

#include <QIcon>

namespace quorvel {

// The name of the desktop entry and of the icon ("<id>.desktop", "<id>.svg").
inline constexpr const char* kDesktopId = "org.quorvel.Quorvel";

// The icon of the installed theme, else the one built into the program.
QIcon ProgramIcon();

// Gives the whole program its title, icon and desktop entry name.
void ApplyDesktopIdentity(const QString& title);

} // namespace quorvel
