#include "common/command_line_process.h"

#include "common/reference_service.h"

#include <QDir>

namespace quorvel::testing {

namespace {
// A run against a service on loopback ends in seconds; a run that hangs is a fault.
constexpr int kRunLimitMs = 120000;
} // namespace

QStringList CommandLineProcess::Result::OutLines() const {
    return out.split(u'\n', Qt::SkipEmptyParts);
}

CommandLineProcess::CommandLineProcess(QString home) : home_(std::move(home)) {}

QProcessEnvironment CommandLineProcess::Unattended(const QString& home) {
    QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
    for (const char* name : {"DISPLAY", "WAYLAND_DISPLAY", "QT_QPA_PLATFORM", "QUORVEL_HOME"})
        env.remove(QString::fromLatin1(name));
    env.insert(QStringLiteral("DBUS_SESSION_BUS_ADDRESS"),
               QStringLiteral("unix:path=/nonexistent/bus"));
    env.insert(QStringLiteral("XDG_CONFIG_HOME"), QDir(home).filePath(QStringLiteral("xdg")));
    return env;
}

QProcess& CommandLineProcess::Start(const QStringList& arguments) {
    process_.setProcessEnvironment(Unattended(home_));
    process_.start(ReferenceService::ProgramPath(),
                   QStringList{QStringLiteral("--home"), home_} + arguments);
    process_.waitForStarted();
    return process_;
}

CommandLineProcess::Result CommandLineProcess::Finish() {
    Result result;
    const bool ended = process_.waitForFinished(kRunLimitMs);
    if (!ended) {
        process_.kill();
        process_.waitForFinished();
    }
    result.out = QString::fromUtf8(process_.readAllStandardOutput());
    result.err = QString::fromUtf8(process_.readAllStandardError());
    if (ended && process_.exitStatus() == QProcess::NormalExit) result.code = process_.exitCode();
    return result;
}

CommandLineProcess::Result CommandLineProcess::Run(const QStringList& arguments) {
    Start(arguments);
    return Finish();
}

} // namespace quorvel::testing
