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

bool IsWritableFolder(const QString& folder) {
    const QFileInfo info(folder);
    return info.isDir() && info.isWritable();
}

QString DefaultFolder() {
    const QString exeFolder =
        QCoreApplication::instance() ? QCoreApplication::applicationDirPath() : QString();
    if (!exeFolder.isEmpty() && IsWritableFolder(exeFolder)) return exeFolder;
    const QString config =
        QStandardPaths::writableLocation(QStandardPaths::GenericConfigLocation) + "/quorvel";
    QDir().mkpath(config);
    return config;
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
