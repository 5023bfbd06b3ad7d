#include "support/run_at_startup.h"

#include "support/program_home.h"

#include "common/recorders.h"
#include "common/temp_home.h"

#include <QCoreApplication>
#include <QFile>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

// Points the desktop's configuration folder at a temporary folder.
class AutostartTest : public ::testing::Test {
protected:
    AutostartTest() : saved_(qgetenv("XDG_CONFIG_HOME")) {
        qputenv("XDG_CONFIG_HOME", home.Path().toUtf8());
    }
    ~AutostartTest() override { qputenv("XDG_CONFIG_HOME", saved_); }
    QString Entry() const {
        return QStringLiteral("autostart/%1.desktop").arg(ProgramHome::ProgramName());
    }

    testing::RecordingPorts ports;
    testing::TempHome home;

private:
    QByteArray saved_;
};

TEST_F(AutostartTest, SwitchingOnAndOffWritesAndRemovesTheEntryButKeepsAnother) {
    EXPECT_EQ(GetRunAtStartup(false, QStringLiteral("/S")), 0);
    SetRunAtStartup(1, false, QStringLiteral("/S"));
    EXPECT_EQ(GetRunAtStartup(false, QStringLiteral("/S")), 1);
    const QByteArray entry = home.Read(Entry());
    EXPECT_TRUE(entry.startsWith("[Desktop Entry]\nType=Application\n"));
    EXPECT_TRUE(
        entry.contains("\nExec=" + QCoreApplication::applicationFilePath().toUtf8() + " /S\n"));
    SetRunAtStartup(0, false, QStringLiteral("/S"));
    EXPECT_EQ(GetRunAtStartup(false, QStringLiteral("/S")), 0);
    SetRunAtStartup(0, false, QStringLiteral("/S")); // none there: quietly nothing
    EXPECT_TRUE(ports.prompter.shown.empty());
    // An existing entry is left unchanged.
    home.Write(Entry(), "[Desktop Entry]\nExec=/elsewhere/other /S\n");
    SetRunAtStartup(1, false, QStringLiteral("/S"));
    EXPECT_EQ(home.Read(Entry()), "[Desktop Entry]\nExec=/elsewhere/other /S\n");
}

TEST_F(AutostartTest, FailuresAreReportedWithTheirPlace) {
    home.Write(Entry() + QStringLiteral("/inside"), "x"); // a folder cannot be deleted as a file
    EXPECT_FALSE(DeleteShortcutFile(home.File(Entry())));
    qputenv("XDG_CONFIG_HOME", home.Write(QStringLiteral("blocker"), "x").toUtf8());
    EXPECT_FALSE(CreateShortcut(false, QStringLiteral("/S")));
    ASSERT_EQ(ports.prompter.shown.size(), 2u);
    EXPECT_TRUE(ports.prompter.shown[0].message.endsWith("RunAtStartup:DeleteShortcutFile:" +
                                                         home.File(Entry())));
    EXPECT_TRUE(
        ports.prompter.shown[1].message.endsWith("\r\nRunAtStartup:CreateShortcut switch= /S"));
    EXPECT_FALSE(ports.prompter.shown[1].timed);
}

TEST(AutostartEntryTest, ProgramPathsAreQuotedAndEscaped) {
    const auto exec = [](const char* path) {
        const QString text =
            AutostartEntryText(QStringLiteral("q"), QString::fromUtf8(path), QStringLiteral("/S"));
        return text.section(QStringLiteral("\nExec="), 1).section(QLatin1Char('\n'), 0, 0);
    };
    EXPECT_EQ(exec("/opt/q/quorvel"), "/opt/q/quorvel /S");
    EXPECT_EQ(exec("/opt/My Apps/q\"uo$rvel"), "\"/opt/My Apps/q\\\\\"uo\\\\$rvel\" /S");
    EXPECT_EQ(exec("/opt/100%/quorvel"), "/opt/100%%/quorvel /S");
    // Each argument on its own: a home with a blank stays one argument.
    const QString text = AutostartEntryText("q", "/opt/q/quorvel", {"/S", "--home", "/my data/q"});
    EXPECT_TRUE(text.contains("\nExec=/opt/q/quorvel /S --home \"/my data/q\"\n"))
        << text.toStdString();
}

} // namespace
} // namespace quorvel
