// Where settings, logs and the default file list live.

#include "support/program_home.h"

#include "common/temp_home.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QStandardPaths>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

class ProgramHomeTest : public ::testing::Test {
protected:
    ProgramHomeTest() : saved_(qgetenv("XDG_CONFIG_HOME")) {
        qputenv("XDG_CONFIG_HOME", config.Path().toUtf8());
    }
    ~ProgramHomeTest() override {
        qputenv("XDG_CONFIG_HOME", saved_);
        ProgramHome::SetFolder({});
    }

    testing::TempHome exe;    // the program's own folder, writable
    testing::TempHome config; // the user's configuration folder

private:
    QByteArray saved_;
};

TEST_F(ProgramHomeTest, TheConfigurationFolderUnlessASettingsFileLiesBesideTheProgram) {
    // A writable program folder alone is no reason to keep settings there.
    EXPECT_EQ(ProgramHome::DefaultFolderFor(exe.Path(), "quorvel"), config.File("quorvel"));
    // Another program's settings file does not count either.
    exe.Write("other.ini", "[General]\n");
    EXPECT_EQ(ProgramHome::DefaultFolderFor(exe.Path(), "quorvel"), config.File("quorvel"));
    // A portable install: its settings file is beside it.
    exe.Write("quorvel.ini", "[General]\n");
    EXPECT_EQ(ProgramHome::DefaultFolderFor(exe.Path(), "quorvel"), exe.Path());
    EXPECT_EQ(ProgramHome::DefaultFolderFor({}, "quorvel"), config.File("quorvel"));
}

TEST_F(ProgramHomeTest, HomeSwitchWinsAndIsNotTheDefault) {
    ProgramHome::SetFolder({});
    // The test binary has no settings file beside it.
    EXPECT_EQ(ProgramHome::Folder(), config.File("quorvel"));
    EXPECT_TRUE(QFileInfo(config.File("quorvel")).isDir());
    EXPECT_TRUE(ProgramHome::IsDefault());
    EXPECT_EQ(ProgramHome::SettingsFile(),
              config.File("quorvel/" + ProgramHome::ProgramName() + ".ini"));
    // In the default home, data files go under the user's documents.
    EXPECT_EQ(ProgramHome::DefaultDataFolder(),
              QStandardPaths::writableLocation(QStandardPaths::DocumentsLocation) + "/Quorvel");

    QStringList args = {"/S", "--home", exe.File("elsewhere"), "--other"};
    ProgramHome::Configure(args);
    EXPECT_EQ(args, QStringList({"/S", "--other"}));
    EXPECT_EQ(ProgramHome::Folder(), exe.File("elsewhere"));
    EXPECT_FALSE(ProgramHome::IsDefault());
    EXPECT_EQ(ProgramHome::DefaultDataFolder(), exe.File("elsewhere"));
    EXPECT_EQ(ProgramHome::FtpLogFile(), exe.File("elsewhere/ftp.log"));

    qputenv("QUORVEL_HOME", QFile::encodeName(exe.File("env")));
    QStringList none;
    ProgramHome::Configure(none);
    qunsetenv("QUORVEL_HOME");
    EXPECT_EQ(ProgramHome::Folder(), exe.File("env"));
}

} // namespace
} // namespace quorvel
