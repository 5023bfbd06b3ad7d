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
    AutostartTest()
        : saved_(qgetenv("XDG_CONFIG_HOME")),
          hadValue_(qEnvironmentVariableIsSet("XDG_CONFIG_HOME")) {
        qputenv("XDG_CONFIG_HOME", home.Path().toUtf8());
    }
    ~AutostartTest() override {
        if (hadValue_)
            qputenv("XDG_CONFIG_HOME", saved_);
        else
            qunsetenv("XDG_CONFIG_HOME");
    }
    QString Entry() const {
        return home.File(QStringLiteral("autostart/") + ProgramHome::ProgramName() +
                         QStringLiteral(".desktop"));
    }

    testing::RecordingPorts ports;
    testing::TempHome home;

private:
    QByteArray saved_;
    bool hadValue_;
};

TEST_F(AutostartTest, EntryLivesInTheConfiguredAutostartFolder) {
    EXPECT_EQ(ShortcutFileName(false), Entry());
    qunsetenv("XDG_CONFIG_HOME");
    EXPECT_TRUE(ShortcutFileName(false).endsWith(QStringLiteral("/.config/autostart/") +
                                                 ProgramHome::ProgramName() + ".desktop"));
}

TEST_F(AutostartTest, SwitchingOnWritesAnEntryThatStartsWithS) {
    EXPECT_EQ(GetRunAtStartup(false, QStringLiteral("/S")), 0);
    SetRunAtStartup(1, false, QStringLiteral("/S"));
    EXPECT_EQ(GetRunAtStartup(false, QStringLiteral("/S")), 1);
    const QByteArray entry =
        home.Read(QStringLiteral("autostart/") + ProgramHome::ProgramName() + ".desktop");
    EXPECT_TRUE(entry.startsWith("[Desktop Entry]\n"));
    EXPECT_TRUE(entry.contains("\nType=Application\n"));
    EXPECT_TRUE(
        entry.contains("\nExec=" + QCoreApplication::applicationFilePath().toUtf8() + " /S\n"));
    EXPECT_TRUE(ports.prompter.shown.empty());
}

TEST_F(AutostartTest, AnExistingEntryIsLeftUnchanged) {
    home.Write(QStringLiteral("autostart/") + ProgramHome::ProgramName() + ".desktop",
               "[Desktop Entry]\nExec=/elsewhere/other /S\n");
    SetRunAtStartup(1, false, QStringLiteral("/S"));
    EXPECT_EQ(home.Read(QStringLiteral("autostart/") + ProgramHome::ProgramName() + ".desktop"),
              "[Desktop Entry]\nExec=/elsewhere/other /S\n");
    EXPECT_EQ(GetRunAtStartup(false, QStringLiteral("/S")), 1);
}

TEST_F(AutostartTest, SwitchingOffRemovesTheEntryAndIsQuietWhenThereIsNone) {
    SetRunAtStartup(1, false, QStringLiteral("/S"));
    SetRunAtStartup(0, false, QStringLiteral("/S"));
    EXPECT_FALSE(QFile::exists(Entry()));
    EXPECT_EQ(GetRunAtStartup(false, QStringLiteral("/S")), 0);
    SetRunAtStartup(0, false, QStringLiteral("/S"));
    EXPECT_TRUE(DeleteShortcutFile(Entry()));
    EXPECT_TRUE(ports.prompter.shown.empty());
}

TEST_F(AutostartTest, UnwritableFolderIsReportedWithItsPlace) {
    // A plain file where the configuration folder should be.
    const QString blocker = home.Write(QStringLiteral("blocker"), "x");
    qputenv("XDG_CONFIG_HOME", blocker.toUtf8());
    EXPECT_FALSE(CreateShortcut(false, QStringLiteral("/S")));
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_TRUE(
        ports.prompter.shown[0].message.endsWith("\r\nRunAtStartup:CreateShortcut switch= /S"));
    EXPECT_FALSE(ports.prompter.shown[0].timed);
    EXPECT_EQ(GetRunAtStartup(false, QStringLiteral("/S")), 0);
}

TEST_F(AutostartTest, EntryThatCannotBeDeletedIsReported) {
    // A folder of the entry's name cannot be removed as a file.
    home.Write(QStringLiteral("autostart/") + ProgramHome::ProgramName() + ".desktop/inside", "x");
    EXPECT_FALSE(DeleteShortcutFile(Entry()));
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_TRUE(
        ports.prompter.shown[0].message.endsWith("RunAtStartup:DeleteShortcutFile:" + Entry()));
}

TEST(AutostartEntryTest, ProgramPathsAreQuotedAndEscaped) {
    const QString plain = AutostartEntryText(
        QStringLiteral("quorvel"), QStringLiteral("/opt/q/quorvel"), QStringLiteral("/S"));
    EXPECT_TRUE(plain.contains(QStringLiteral("\nExec=/opt/q/quorvel /S\n")));
    EXPECT_TRUE(plain.contains(QStringLiteral("\nComment=Porlan Schedule\n")));

    const QString spaced = AutostartEntryText(
        QStringLiteral("quorvel"), QStringLiteral("/opt/My Apps/q\"uo$rvel"), QStringLiteral("/S"));
    EXPECT_TRUE(spaced.contains(QStringLiteral("\nExec=\"/opt/My Apps/q\\\\\"uo\\\\$rvel\" /S\n")))
        << qPrintable(spaced);

    const QString percent = AutostartEntryText(
        QStringLiteral("quorvel"), QStringLiteral("/opt/100%/quorvel"), QStringLiteral("/S"));
    EXPECT_TRUE(percent.contains(QStringLiteral("\nExec=/opt/100%%/quorvel /S\n")))
        << qPrintable(percent);
}

} // namespace
} // namespace quorvel
