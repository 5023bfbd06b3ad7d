// Folders of the locations and the paths of a record's file.

#include "app/file_record.h"
#include "app/locations.h"
#include "common/recorders.h"
#include "common/temp_home.h"

#include <QDir>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

LocationFolders FarmFolders() {
    LocationFolders f;
    f.application = "/opt/quorvel";
    f.data = "/data";
    f.user = "Farm1";
    f.userCurrent = "2024";
    f.web = "data/clients";
    return f;
}

QString LocalPath(const LocationFolders& f, const QString& name, int userLocation) {
    const LocationPath p = ProcessFilename(f, name, userLocation, 0, false, kOnThisPc);
    EXPECT_TRUE(p.ok()) << p.refusal.toStdString();
    return p.path;
}

QString RemotePath(const LocationFolders& f, const QString& name, int adminLocation,
                   bool userFoldersOnly = false) {
    const LocationPath p = ProcessFilename(f, name, 0, adminLocation, userFoldersOnly, kAtService);
    EXPECT_TRUE(p.ok()) << p.refusal.toStdString();
    return p.path;
}

TEST(LocationFolder, EachLocationOnThisPc) {
    LocationFolders f = FarmFolders();
    f.other = "Logs";
    EXPECT_EQ(GetLocationFolder(f, kLocationApplication, kOnThisPc), "/opt/quorvel");
    EXPECT_EQ(GetLocationFolder(f, kLocationData, kOnThisPc), "/data");
    EXPECT_EQ(GetLocationFolder(f, kLocationUser, kOnThisPc), "/data/Farm1");
    EXPECT_EQ(GetLocationFolder(f, kLocationUserCurrent, kOnThisPc), "/data/Farm1/2024");
    EXPECT_EQ(GetLocationFolder(f, kLocationOther, kOnThisPc), "/data/Logs");
    EXPECT_EQ(GetLocationFolder(f, 9, kOnThisPc), "/data");
}

TEST(LocationFolder, EachLocationAtTheServiceUsesForwardSlashes) {
    LocationFolders f = FarmFolders();
    f.other = "in\\box";
    EXPECT_EQ(GetLocationFolder(f, kLocationApplication, kAtService), "data/clients");
    EXPECT_EQ(GetLocationFolder(f, kLocationData, kAtService), "data/clients");
    EXPECT_EQ(GetLocationFolder(f, kLocationUser, kAtService), "data/clients/Farm1");
    EXPECT_EQ(GetLocationFolder(f, kLocationUserCurrent, kAtService), "data/clients/Farm1/2024");
    EXPECT_EQ(GetLocationFolder(f, kLocationOther, kAtService), "data/clients/in/box");
}

TEST(LocationFolder, OtherFolderIsUsedAsItIsWhenAbsolute) {
    LocationFolders f = FarmFolders();
    f.other = "/var/logs";
    EXPECT_EQ(GetLocationFolder(f, kLocationOther, kOnThisPc), "/var/logs");
    f.other = "Logs";
    EXPECT_EQ(GetLocationFolder(f, kLocationOther, kOnThisPc), "/data/Logs");
    f.other.clear();
    EXPECT_EQ(GetLocationFolder(f, kLocationOther, kOnThisPc), "/data");
}

TEST(ProcessFilename, SeasonFileWithASubfolderOnThisPc) {
    EXPECT_EQ(LocalPath(FarmFolders(), "site\\log.csv", kLocationUserCurrent),
              "/data/Farm1/2024/site/log.csv");
}

TEST(ProcessFilename, BackslashesFromAListAreSeparatorsInEveryLocalFolder) {
    LocationFolders f = FarmFolders();
    f.data = "/srv\\data";
    f.user = "farms\\Farm1";
    EXPECT_EQ(LocalPath(f, "a.csv", kLocationUser), "/srv/data/farms/Farm1/a.csv");
    EXPECT_EQ(LocalPath(f, "a.csv", kLocationApplication), "/opt/quorvel/a.csv");
}

TEST(ProcessFilename, RemotePathFollowsTheAdminLocation) {
    const LocationFolders f = FarmFolders();
    EXPECT_EQ(RemotePath(f, "log.csv", kLocationUser), "data/clients/Farm1/log.csv");
    EXPECT_EQ(RemotePath(f, "site\\log.csv", kLocationUser), "data/clients/Farm1/site/log.csv");
    EXPECT_EQ(RemotePath(f, "log.csv", kLocationApplication), "data/clients/log.csv");
}

TEST(ProcessFilename, UserFoldersOnlyKeepsUploadsInTheUsersFolders) {
    const LocationFolders f = FarmFolders();
    EXPECT_EQ(RemotePath(f, "a.csv", kLocationApplication, true), "data/clients/Farm1/a.csv");
    EXPECT_EQ(RemotePath(f, "a.csv", kLocationOther, true), "data/clients/Farm1/a.csv");
    EXPECT_EQ(RemotePath(f, "a.csv", kLocationUserCurrent, true), "data/clients/Farm1/2024/a.csv");
}

TEST(ProcessFilename, FileNameThatClimbsOutIsRefused) {
    const LocationFolders f = FarmFolders();
    for (const QString name : {"../secret.csv", "..\\..\\etc\\passwd", "a/../../b.csv"}) {
        for (int which : {int(kOnThisPc), int(kAtService)}) {
            const LocationPath p = ProcessFilename(f, name, 2, 2, false, which);
            EXPECT_FALSE(p.ok()) << name.toStdString();
            EXPECT_TRUE(p.path.isEmpty());
            EXPECT_TRUE(p.refusal.contains(name));
        }
    }
    EXPECT_EQ(LocalPath(f, "a/../b.csv", kLocationData), "/data/a/../b.csv");
    EXPECT_EQ(LocalPath(f, "./x..y.csv", kLocationData), "/data/./x..y.csv");
}

TEST(ProcessFilename, RelativeOtherFolderThatClimbsOutIsRefused) {
    LocationFolders f = FarmFolders();
    f.other = "..\\outside";
    EXPECT_FALSE(ProcessFilename(f, "a.csv", kLocationOther, 0, false, kOnThisPc).ok());
    EXPECT_FALSE(ProcessFilename(f, "a.csv", 0, kLocationOther, false, kAtService).ok());
    // Only a location that uses the folder is affected.
    EXPECT_TRUE(ProcessFilename(f, "a.csv", kLocationData, 0, false, kOnThisPc).ok());
    // An absolute folder on this PC is the user's own choice.
    f.other = "/var/../srv/logs";
    EXPECT_EQ(LocalPath(f, "a.csv", kLocationOther), "/var/../srv/logs/a.csv");
}

TEST(AnalyseFilename, TheMostSpecificFolderWins) {
    const LocationFolders f = FarmFolders();
    EXPECT_EQ(AnalyseFilename(f, "/data/a.csv").locationId, kLocationData);
    EXPECT_EQ(AnalyseFilename(f, "/data/Farm1/a.csv").locationId, kLocationUser);
    EXPECT_EQ(AnalyseFilename(f, "/data/Farm1/2024/a.csv").locationId, kLocationUserCurrent);
    EXPECT_EQ(AnalyseFilename(f, "/opt/quorvel/a.csv").locationId, kLocationApplication);
    const AnalysedFilename a = AnalyseFilename(f, "/DATA/farm1/a.csv");
    EXPECT_EQ(a.locationId, kLocationUser);
    EXPECT_EQ(a.name, "a.csv");
    EXPECT_TRUE(a.folder.isEmpty());
}

TEST(AnalyseFilename, WithoutUserFoldersTheSeasonLocationStandsForTheDataFolder) {
    LocationFolders f = FarmFolders();
    f.user.clear();
    f.userCurrent.clear();
    EXPECT_EQ(AnalyseFilename(f, "/data/a.csv").locationId, kLocationUserCurrent);
}

TEST(AnalyseFilename, SameApplicationAndDataFolderGivesData) {
    LocationFolders f = FarmFolders();
    f.application = "/data";
    EXPECT_EQ(AnalyseFilename(f, "/data/a.csv").locationId, kLocationData);
}

TEST(AnalyseFilename, AnUnrelatedFolderIsOther) {
    const LocationFolders f = FarmFolders();
    const AnalysedFilename a = AnalyseFilename(f, "/home/me/logs/b.csv");
    EXPECT_EQ(a.locationId, kLocationOther);
    EXPECT_EQ(a.folder, "/home/me/logs");
    EXPECT_EQ(a.name, "b.csv");
    const AnalysedFilename bare = AnalyseFilename(f, "b.csv");
    EXPECT_EQ(bare.locationId, kLocationOther);
    EXPECT_TRUE(bare.folder.isEmpty());
    EXPECT_EQ(bare.name, "b.csv");
}

TEST(AnalyseFilename, AFolderTextEndingInASeparatorNeverMatches) {
    LocationFolders f = FarmFolders();
    f.data = "/data/";
    EXPECT_EQ(AnalyseFilename(f, "/data/a.csv").locationId, kLocationOther);
    EXPECT_EQ(AnalyseFilename(f, "/data/Farm1/a.csv").locationId, kLocationUser);
}

TEST(FolderChecks, MissingFoldersAreMadeLevelByLevel) {
    testing::TempHome home;
    LocationFolders f;
    f.application = home.File("app");
    f.data = home.File("store/data");
    f.user = "Farm1";
    f.userCurrent = "2024";
    EXPECT_TRUE(CheckDataFolders(f));
    EXPECT_TRUE(CheckUserFolders(f));
    EXPECT_TRUE(QDir(home.File("app")).exists());
    EXPECT_TRUE(QDir(home.File("store/data/Farm1/2024")).exists());
}

TEST(FolderChecks, TheSecondFolderIsNotTriedWhenTheFirstFails) {
    testing::TempHome home;
    testing::RecordingPorts ports;
    home.Write("blocker", "a file");
    LocationFolders f;
    f.application = home.File("blocker/app");
    f.data = home.File("data");
    EXPECT_FALSE(CheckDataFolders(f));
    EXPECT_FALSE(QDir(home.File("data")).exists());

    f.application = home.File("app");
    f.data = home.File("data");
    f.user = "blocker2";
    home.Write("data/blocker2", "a file");
    f.userCurrent = "2024";
    EXPECT_TRUE(CheckDataFolders(f));
    EXPECT_FALSE(CheckUserFolders(f));
}

} // namespace
} // namespace quorvel
