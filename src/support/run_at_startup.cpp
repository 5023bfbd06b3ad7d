#include "support/run_at_startup.h"

#include "support/error_box.h"
#include "support/program_home.h"
#include "support/replacing_file.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QProcessEnvironment>
#include <QStringList>

namespace quorvel {

namespace {

const QString kWhere = QStringLiteral("RunAtStartup:");
const QString kDescription = QStringLiteral("Porlan Schedule");

QString ConfigFolder(bool allUsers) {
    const QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
    if (allUsers) {
        const QString dirs = env.value(QStringLiteral("XDG_CONFIG_DIRS"));
        const QString first = dirs.section(QLatin1Char(':'), 0, 0);
        return first.isEmpty() ? QStringLiteral("/etc/xdg") : first;
    }
    // A relative XDG_CONFIG_HOME is invalid and ignored, as desktops do.
    const QString home = env.value(QStringLiteral("XDG_CONFIG_HOME"));
    return QDir::isAbsolutePath(home) ? home : QDir::homePath() + QStringLiteral("/.config");
}

// One argument of an Exec line: quoted when it holds a reserved character,
// with the desktop-entry escapes applied.
QString ExecArgument(const QString& argument) {
    static const QString reserved = QStringLiteral(" \t\n\"'\\><~|&;$*?#()`=");
    bool quote = argument.isEmpty();
    for (const QChar c : argument)
        quote = quote || reserved.contains(c);
    QString out;
    for (const QChar c : argument) {
        if (quote && (c == QLatin1Char('"') || c == QLatin1Char('`') || c == QLatin1Char('$') ||
                      c == QLatin1Char('\\')))
            out += QLatin1Char('\\');
        out += c;
    }
    if (quote) out = QLatin1Char('"') + out + QLatin1Char('"');
    // Field codes start with "%"; a literal one is doubled.
    out.replace(QLatin1Char('%'), QLatin1String("%%"));
    // The whole value is a string of the entry file, where "\" is escaped too.
    out.replace(QLatin1Char('\\'), QLatin1String("\\\\"));
    return out;
}

bool FileFound(const QString& path) {
    return QFileInfo::exists(path);
}

QStringList Split(const QString& arguments) {
    return arguments.split(QLatin1Char(' '), Qt::SkipEmptyParts);
}

} // namespace

QString AutostartEntryText(const QString& name, const QString& exePath, const QString& arguments) {
    return AutostartEntryText(name, exePath, Split(arguments));
}

QString AutostartEntryText(const QString& name, const QString& exePath,
                           const QStringList& arguments) {
    QStringList exec{ExecArgument(exePath)};
    for (const QString& argument : arguments)
        exec << ExecArgument(argument);
    return QStringLiteral("[Desktop Entry]\n"
                          "Type=Application\n"
                          "Name=%1\n"
                          "Comment=%2\n"
                          "Exec=%3\n"
                          "Terminal=false\n"
                          "X-GNOME-Autostart-enabled=true\n")
        .arg(name, kDescription, exec.join(QLatin1Char(' ')));
}

QString ShortcutFileName(bool allUsers) {
    return ConfigFolder(allUsers) + QStringLiteral("/autostart/") + ProgramHome::ProgramName() +
           QStringLiteral(".desktop");
}

bool CreateShortcut(bool allUsers, const QString& arguments) {
    return CreateShortcut(allUsers, Split(arguments));
}

bool CreateShortcut(bool allUsers, const QStringList& arguments) {
    const QString path = ShortcutFileName(allUsers);
    if (FileFound(path)) return true;
    const QString where =
        kWhere + QStringLiteral("CreateShortcut switch= ") + arguments.join(QLatin1Char(' '));
    if (!QDir().mkpath(QFileInfo(path).absolutePath()))
        return ShowErrorBox(QStringLiteral("Cannot create the folder of ") + path, where);
    const QString text = AutostartEntryText(ProgramHome::ProgramName(),
                                            QCoreApplication::applicationFilePath(), arguments);
    if (const auto error = ReplaceFileContents(path, text.toUtf8()))
        return ShowErrorBox(*error, where);
    return true;
}

bool DeleteShortcutFile(const QString& path) {
    if (!FileFound(path)) return true;
    QFile file(path);
    if (!file.remove())
        return ShowErrorBox(file.errorString(),
                            kWhere + QStringLiteral("DeleteShortcutFile:") + path);
    return true;
}

int GetRunAtStartup(bool allUsers, const QString& arguments) {
    return GetRunAtStartup(allUsers, Split(arguments));
}

int GetRunAtStartup(bool allUsers, const QStringList& /*arguments*/) {
    // The arguments are only needed to move a Windows Run-key value; see the header.
    return FileFound(ShortcutFileName(allUsers)) ? 1 : 0;
}

void SetRunAtStartup(int on, bool allUsers, const QString& arguments) {
    SetRunAtStartup(on, allUsers, Split(arguments));
}

void SetRunAtStartup(int on, bool allUsers, const QStringList& arguments) {
    if (on != 0)
        CreateShortcut(allUsers, arguments);
    else
        DeleteShortcutFile(ShortcutFileName(allUsers));
}

} // namespace quorvel
