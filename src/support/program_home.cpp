#include "support/program_home.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QStandardPaths>

namespace quorvel {

namespace {

QString& ChosenFolder() {
    static QString folder;
    return folder;
}

QString ConfigFolder() {
    return QStandardPaths::writableLocation(QStandardPaths::GenericConfigLocation) +
           QStringLiteral("/quorvel");
}

QString ExeFolder() {
    return QCoreApplication::instance() ? QCoreApplication::applicationDirPath() : QString();
}

QString DefaultFolder() {
    const QString folder = ProgramHome::DefaultFolderFor(ExeFolder(), ProgramHome::ProgramName());
    QDir().mkpath(folder);
    return QDir::cleanPath(folder);
}

QString Absolute(const QString& folder) {
    QDir().mkpath(folder);
    return QDir::cleanPath(QFileInfo(folder).absoluteFilePath());
}

} // namespace

void ProgramHome::Configure(QStringList& args) {
    QString folder = qEnvironmentVariable("QUORVEL_HOME");
    for (qsizetype i = 0; i < args.size(); ++i) {
        if (args[i] == QLatin1String("--home") && i + 1 < args.size()) {
            folder = args[i + 1];
            args.remove(i, 2);
            break;
        }
        if (args[i].startsWith(QLatin1String("--home="))) {
            folder = args[i].mid(7);
            args.remove(i);
            break;
        }
    }
    SetFolder(folder);
}

void ProgramHome::SetFolder(const QString& folder) {
    ChosenFolder() = folder.isEmpty() ? QString() : Absolute(folder);
}

QString ProgramHome::Folder() {
    if (ChosenFolder().isEmpty()) ChosenFolder() = DefaultFolder();
    return QDir::toNativeSeparators(ChosenFolder());
}

QString ProgramHome::DefaultFolderFor(const QString& exeFolder, const QString& programName) {
    if (!exeFolder.isEmpty() &&
        QFileInfo(exeFolder + QLatin1Char('/') + programName + QStringLiteral(".ini")).isFile())
        return exeFolder;
    return ConfigFolder();
}

bool ProgramHome::IsDefault() {
    const QString chosen = QDir::cleanPath(QFileInfo(Folder()).absoluteFilePath());
    const QString own =
        QDir::cleanPath(QFileInfo(DefaultFolderFor(ExeFolder(), ProgramName())).absoluteFilePath());
    return chosen == own;
}

QString ProgramHome::DefaultDataFolder() {
    if (QDir::cleanPath(Folder()) != QDir::cleanPath(ConfigFolder())) return Folder();
    const QString documents = QStandardPaths::writableLocation(QStandardPaths::DocumentsLocation);
    if (documents.isEmpty()) return Folder();
    return QDir::toNativeSeparators(documents + QStringLiteral("/Quorvel"));
}

QString ProgramHome::ProgramName() {
    if (!QCoreApplication::instance()) return QStringLiteral("quorvel");
    return QFileInfo(QCoreApplication::applicationFilePath()).completeBaseName();
}

QString ProgramHome::SettingsFile() {
    return Folder() + QDir::separator() + ProgramName() + QStringLiteral(".ini");
}

QString ProgramHome::LogFile() {
    return Folder() + QDir::separator() + ProgramName() + QStringLiteral(".log");
}

QString ProgramHome::FtpLogFile() {
    return Folder() + QDir::separator() + QStringLiteral("ftp.log");
}

} // namespace quorvel
