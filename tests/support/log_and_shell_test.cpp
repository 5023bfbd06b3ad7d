#include "support/log_file.h"
#include "support/program_home.h"
#include "support/shell_open.h"

#include "common/recorders.h"
#include "common/temp_home.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <gtest/gtest.h>

using namespace quorvel;
using quorvel::testing::ManualClock;
using quorvel::testing::RecordingPorts;
using quorvel::testing::TempHome;

TEST(ProgramLog, OneStampedLinePerCallAndTheFileIsNotHeldOpen) {
    TempHome home;
    ManualClock clock(QDateTime(QDate(2024, 11, 1), QTime(9, 5, 7)));
    ScopedPorts ports(Ports{nullptr, &clock, nullptr});
    WriteLogFile("first");
    ASSERT_TRUE(QFile::remove(ProgramHome::LogFile())); // deletable between lines
    WriteLogFile("second");
    WriteLogFile("third");
    EXPECT_EQ(home.Read(QFileInfo(ProgramHome::LogFile()).fileName()),
              QByteArray("2024-11-01 09:05:07:second\r\n2024-11-01 09:05:07:third\r\n"));
    EXPECT_TRUE(ProgramHome::LogFile().endsWith(ProgramHome::ProgramName() + ".log"));
}

TEST(ProgramLog, AnUnwritableLogIsReportedAndTheCallerGoesOn) {
    TempHome home;
    RecordingPorts ports;
    QDir().mkpath(ProgramHome::LogFile()); // a folder where the log file should be
    WriteLogFile("lost");
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_TRUE(ports.prompter.shown[0].message.endsWith("\r\n" + ProgramHome::LogFile()));
}

TEST(ShellOpen, HandsExistingFilesToTheDesktopAndNamesEachFailure) {
    TempHome home;
    RecordingPorts ports;
    QStringList opened;
    SetDesktopOpener([&](const QString& f) { return opened << f, true; });
    const QString file = home.Write("report.txt", "x");
    EXPECT_TRUE(ShellOpenFile(file));
    EXPECT_EQ(opened, QStringList{file});
    EXPECT_TRUE(ports.prompter.shown.empty());

    // Failures show the described message and the file.
    SetDesktopOpener([](const QString&) { return false; });
    EXPECT_FALSE(ShellOpenFile(home.File("missing.txt")));
    EXPECT_FALSE(ShellOpenFile(home.File("nofolder/missing.txt")));
    EXPECT_FALSE(ShellOpenFile(home.Write("data.xyz", "x")));
    ASSERT_EQ(ports.prompter.shown.size(), 3u);
    EXPECT_EQ(ports.prompter.shown[0].message,
              "File not found\r\nFile: " + QDir::toNativeSeparators(home.File("missing.txt")));
    EXPECT_TRUE(ports.prompter.shown[1].message.startsWith("Path not found\r\nFile: "));
    EXPECT_TRUE(ports.prompter.shown[2].message.startsWith(
        "This file type does not have a valid file association.\r\nFile: "));
    SetDesktopOpener({});
}

TEST(ShellOpen, MessageTable) {
    EXPECT_EQ(ShellErrorText(0), QString("Out of memory"));
    EXPECT_EQ(ShellErrorText(8), QString("Out of memory"));
    EXPECT_EQ(ShellErrorText(5), QString("Path/file access error"));
    EXPECT_EQ(ShellErrorText(26), QString("A sharing violation occurred."));
    EXPECT_EQ(ShellErrorText(32), QString("The specified dynamic-link library was not found."));
    EXPECT_EQ(
        ShellErrorText(17),
        QString("An error occurred occurred whilst trying to open or print the selected file."));
    EXPECT_TRUE(ShellErrorText(42).isEmpty());
}
