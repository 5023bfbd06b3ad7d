#pragma once
// Starting the program at log-on, in scheduled mode.
//
// The desktop's autostart entry "<autostart folder>/<program>.desktop" starts
// the program with the given arguments ("/S"). The user's folder is
// $XDG_CONFIG_HOME/autostart (~/.config/autostart when unset); the all-users
// folder is the first of $XDG_CONFIG_DIRS (/etc/xdg) + "/autostart".
//
// Older Windows versions of the program started from a value in the
// machine-wide Run key; on Windows that value would be moved to the entry the
// first time the state is read. Other platforms never had it, so the move is
// a no-op there.

#include <QString>
#include <QStringList>

namespace quorvel {

// The autostart entry's full path.
QString ShortcutFileName(bool allUsers);

// Creates the entry unless a file of that name exists already (an existing
// entry is left unchanged). False, after the error box, when it cannot be written.
bool CreateShortcut(bool allUsers, const QStringList& arguments);
// The same with the arguments given as one text, split at blanks ("/S").
bool CreateShortcut(bool allUsers, const QString& arguments);

// Deletes the entry when it exists. False, after the error box, when it exists
// and cannot be deleted.
bool DeleteShortcutFile(const QString& path);

// 1 when the entry exists, 0 when not (the check box's values).
int GetRunAtStartup(bool allUsers, const QStringList& arguments);
int GetRunAtStartup(bool allUsers, const QString& arguments);

// on != 0 creates the entry, 0 deletes it.
void SetRunAtStartup(int on, bool allUsers, const QStringList& arguments);
void SetRunAtStartup(int on, bool allUsers, const QString& arguments);

// The entry's text for the program at exePath started with arguments, each
// quoted the way desktop entries quote their Exec arguments.
QString AutostartEntryText(const QString& name, const QString& exePath,
                           const QStringList& arguments);
QString AutostartEntryText(const QString& name, const QString& exePath, const QString& arguments);

} // namespace quorvel
