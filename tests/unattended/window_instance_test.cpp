// One window per program home, with real processes: a second start brings
// the open window forward and ends; the lock of a killed window is taken over.

#include "app/window_instance.h"
#include "common/command_line_process.h"
#include "common/reference_service.h"
#include "common/temp_home.h"

#include <QElapsedTimer>
#include <QFile>
#include <QLocalSocket>
#include <QProcess>
#include <QThread>

#include <gtest/gtest.h>

#include <csignal>

#include <sys/types.h>

namespace quorvel::testing {
namespace {

class WindowInstanceTest : public ::testing::Test {
protected:
    ~WindowInstanceTest() override {
        for (QProcess* window : {&first, &third})
            if (window->state() != QProcess::NotRunning) {
                window->kill();
                window->waitForFinished();
            }
    }
    void StartWindow(QProcess& window) {
        QProcessEnvironment env = CommandLineProcess::Unattended(home.Path());
        env.insert("QT_QPA_PLATFORM", "offscreen");
        window.setProcessEnvironment(env);
        window.start(ReferenceService::ProgramPath(), {"--home", home.Path()});
        ASSERT_TRUE(window.waitForStarted());
    }
    // Until the window of the home answers on its socket (or its process ended).
    bool WaitUntilListening(QProcess& window) {
        const QString name = WindowInstance(home.Path()).ServerName();
        QElapsedTimer waited;
        waited.start();
        while (window.state() == QProcess::Running && waited.elapsed() < 60000) {
            QLocalSocket probe;
            probe.connectToServer(name);
            if (probe.waitForConnected(100)) return true;
            QThread::msleep(20);
        }
        return false;
    }
    QString Log() const { return QString::fromUtf8(home.Read("quorvel.log")); }

    TempHome home;
    QProcess first, third;
};

TEST_F(WindowInstanceTest, ASecondStartBringsTheWindowForwardAndAKilledWindowsLockIsTakenOver) {
    StartWindow(first);
    ASSERT_TRUE(WaitUntilListening(first)) << first.readAllStandardError().toStdString();

    QProcess second;
    QProcessEnvironment env = CommandLineProcess::Unattended(home.Path());
    env.insert("QT_QPA_PLATFORM", "offscreen");
    second.setProcessEnvironment(env);
    second.start(ReferenceService::ProgramPath(), {"--home", home.Path()});
    ASSERT_TRUE(second.waitForFinished(60000));
    EXPECT_EQ(second.exitCode(), 0);
    EXPECT_TRUE(QString::fromUtf8(second.readAllStandardError())
                    .contains("its window was brought forward"));
    EXPECT_EQ(first.state(), QProcess::Running);
    // A scheduled start on an open home ends quietly, saying so in the log.
    second.start(ReferenceService::ProgramPath(), {"--home", home.Path(), "/S"});
    ASSERT_TRUE(second.waitForFinished(60000));
    EXPECT_EQ(second.exitCode(), 0);
    EXPECT_TRUE(Log().contains("A start with /S found Quorvel open on")) << Log().toStdString();

    ::kill(static_cast<pid_t>(first.processId()), SIGKILL);
    first.waitForFinished();
    EXPECT_TRUE(QFile::exists(home.File(WindowInstance::kFileName)));
    StartWindow(third);
    EXPECT_TRUE(WaitUntilListening(third)) << "the next window did not take the home over";
}

} // namespace
} // namespace quorvel::testing
