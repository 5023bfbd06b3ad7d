#include "support/files.h"

#include "common/recorders.h"
#include "common/temp_home.h"
#include "support/program_home.h"

#include <QDir>
#include <QFile>

#include <gtest/gtest.h>

using namespace quorvel;
using quorvel::testing::RecordingPorts;
using quorvel::testing::TempHome;

namespace {

QStringList LogLines() {
    QFile log(ProgramHome::LogFile());
    if (!log.open(QIODevice::ReadOnly)) return {};
    return QString::fromUtf8(log.readAll()).split("\r\n", Qt::SkipEmptyParts);
}

} // namespace

TEST(FileExists, FilesFoldersAndWildcardsButFolderExistsOnlyForFolders) {
    TempHome home;
    home.Write("logs/site1.dat", "x");
    home.Write("logs/site2.csv", "y");
    EXPECT_TRUE(FileExists(home.File("logs/site1.dat")));
    EXPECT_TRUE(FileExists(home.File("logs")));
    EXPECT_TRUE(FileExists(home.File("logs/*.dat")));
    EXPECT_TRUE(FileExists(home.File("logs/site?.csv")));
    EXPECT_FALSE(FileExists(home.File("logs/*.txt")));
    EXPECT_FALSE(FileExists(home.File("logs/site3.dat")));
    EXPECT_FALSE(FileExists(home.File("nowhere/*.dat")));
    EXPECT_FALSE(FileExists(""));
    // A "\" is a separator too.
    EXPECT_TRUE(FileExists(home.Path() + "\\logs\\site1.dat"));
    // Only folders count as folders.
    home.Write("a/file.txt", "x");
    EXPECT_TRUE(FolderExists(home.File("a")));
    EXPECT_TRUE(FolderExists(home.File("a") + "/"));
    EXPECT_TRUE(FolderExists("  " + home.File("a") + "  "));
    EXPECT_FALSE(FolderExists(home.File("a/file.txt")));
    EXPECT_FALSE(FolderExists(home.File("b")));
    EXPECT_TRUE(FolderExists("/"));
    EXPECT_FALSE(FolderExists(""));
}

TEST(CheckLocalFolders, CreatesEachMissingLevelAndLogsIt) {
    TempHome home;
    RecordingPorts ports;
    QDir().mkpath(home.File("A"));
    EXPECT_TRUE(CheckLocalFolders(home.File("A/B/C")));
    EXPECT_TRUE(FolderExists(home.File("A/B/C")));
    const QStringList lines = LogLines();
    ASSERT_EQ(lines.size(), 2);
    EXPECT_TRUE(lines[0].endsWith(":Creaded folder: " + QDir::toNativeSeparators(home.File("A/B"))))
        << lines[0].toStdString();
    EXPECT_TRUE(
        lines[1].endsWith("Creaded folder: " + QDir::toNativeSeparators(home.File("A/B/C"))));
    EXPECT_TRUE(ports.prompter.shown.empty());

    // Everything present, a trailing separator and backslashes: nothing more to do.
    EXPECT_TRUE(CheckLocalFolders(home.File("A/B/C/")));
    EXPECT_TRUE(CheckLocalFolders(home.Path() + "\\A\\B"));
    EXPECT_EQ(LogLines().size(), 2);
    EXPECT_TRUE(CheckLocalFolder(""));
}

TEST(CheckLocalFolders, StopsAtTheFirstLevelThatCannotBeMade) {
    TempHome home;
    RecordingPorts ports;
    home.Write("blocker", "a file where a folder should go");
    EXPECT_FALSE(CheckLocalFolders(home.File("blocker/sub/deeper")));
    EXPECT_FALSE(FileExists(home.File("blocker/sub")));
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_TRUE(ports.prompter.shown[0].message.contains(
        "CheckLocalFolder: " + QDir::toNativeSeparators(home.File("blocker"))));
    EXPECT_FALSE(ports.prompter.shown[0].timed);
}
