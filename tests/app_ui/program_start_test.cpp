// The program itself, started as a user or the desktop would start it.

#include <QProcess>
#include <QProcessEnvironment>

#include <gtest/gtest.h>

namespace {

TEST(ProgramStartTest, WithoutAnyDisplayItSaysSoInOneLineAndPointsToTheCommandLineRun) {
    QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
    for (const char* name : {"DISPLAY", "WAYLAND_DISPLAY", "QT_QPA_PLATFORM"})
        env.remove(QString::fromLatin1(name));
    for (const QString& platform : {QString(), QStringLiteral("xcb")}) {
        if (!platform.isEmpty()) env.insert("QT_QPA_PLATFORM", platform);
        QProcess program;
        program.setProcessEnvironment(env);
        program.start(QStringLiteral(QUORVEL_EXECUTABLE), {"--home", "/nonexistent/q"});
        ASSERT_TRUE(program.waitForFinished(30000));
        EXPECT_EQ(program.exitStatus(), QProcess::NormalExit) << platform.toStdString();
        EXPECT_EQ(program.exitCode(), 2);
        const QString err = QString::fromLocal8Bit(program.readAllStandardError());
        EXPECT_EQ(err.count('\n'), 1) << err.toStdString();
        EXPECT_TRUE(err.contains("no display") && err.contains("quorvel --run-all"))
            << err.toStdString();
        EXPECT_FALSE(err.contains("plugin")) << err.toStdString();
    }
}

} // namespace
