// Folders of the locations and the paths of a record's file.

#include "app/file_record.h"
#include "app/locations.h"
#include "common/recorders.h"
#include "common/temp_home.h"

#include <QDir>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

const LocationFolders kFarm{"/opt/q", "/data", "Farm1", "2024", "data/clients", "Logs"};

QString PathOf(const LocationFolders& f, const QString& name, int location, int which,
               bool userFoldersOnly = false) {
    const LocationPath p = ProcessFilename(f, name, location, location, userFoldersOnly, which);
    EXPECT_TRUE(p.ok()) << p.refusal.toStdString();
    return p.path;
}

TEST(LocationFolder, EachLocationOnThisPcAndAtTheService) {
    const QStringList local{"/opt/q", "/data", "/data/Farm1", "/data/Farm1/2024", "/data/Logs"};
    const QStringList remote{"data/clients", "data/clients", "data/clients/Farm1",
                             "data/clients/Farm1/2024", "data/clients/Logs"};
    for (int id = 0; id < 5; ++id) {
        EXPECT_EQ(GetLocationFolder(kFarm, id, kOnThisPc), local[id]) << id;
        EXPECT_EQ(GetLocationFolder(kFarm, id, kAtService), remote[id]) << id;
    }
    LocationFolders f = kFarm;
    f.other = "/var/logs";
    EXPECT_EQ(GetLocationFolder(f, kLocationOther, kOnThisPc), "/var/logs");
}

TEST(ProcessFilename, BackslashesTravelWithTheSideSeparatorAndUserFoldersOnlyHold) {
    EXPECT_EQ(PathOf(kFarm, "site\\log.csv", kLocationUserCurrent, kOnThisPc),
              "/data/Farm1/2024/site/log.csv");
    EXPECT_EQ(PathOf(kFarm, "site\\log.csv", kLocationUser, kAtService),
              "data/clients/Farm1/site/log.csv");
    LocationFolders f = kFarm;
    f.data = "/srv\\data";
    f.other = "in\\box";
    EXPECT_EQ(PathOf(f, "a.csv", kLocationOther, kOnThisPc), "/srv/data/in/box/a.csv");
    EXPECT_EQ(PathOf(f, "a.csv", kLocationOther, kAtService), "data/clients/in/box/a.csv");
    // With user folders only, the service path stays in the user's folders.
    EXPECT_EQ(PathOf(kFarm, "a.csv", kLocationApplication, kAtService, true),
              "data/clients/Farm1/a.csv");
    EXPECT_EQ(PathOf(kFarm, "a.csv", kLocationUserCurrent, kAtService, true),
              "data/clients/Farm1/2024/a.csv");
}

TEST(ProcessFilename, NamesAndRelativeFoldersThatClimbOutAreRefused) {
    for (const QString name : {"../secret.csv", "..\\..\\etc\\passwd", "a/../../b.csv"}) {
        for (int which : {0, 1}) {
            const LocationPath p = ProcessFilename(kFarm, name, 2, 2, false, which);
            EXPECT_TRUE(p.path.isEmpty() && p.refusal.contains(name)) << name.toStdString();
        }
    }
    EXPECT_EQ(PathOf(kFarm, "a/../b..c.csv", kLocationData, kOnThisPc), "/data/a/../b..c.csv");

    LocationFolders f = kFarm;
    f.other = "..\\outside";
    EXPECT_FALSE(ProcessFilename(f, "a.csv", kLocationOther, 0, false, kOnThisPc).ok());
    EXPECT_FALSE(ProcessFilename(f, "a.csv", 0, kLocationOther, false, kAtService).ok());
    EXPECT_TRUE(ProcessFilename(f, "a.csv", kLocationData, 0, false, kOnThisPc).ok());
    // An absolute folder on this PC is the user's own choice.
    f.other = "/var/../srv";
    EXPECT_EQ(PathOf(f, "a.csv", kLocationOther, kOnThisPc), "/var/../srv/a.csv");
}

TEST(AnalyseFilename, TheMostSpecificFolderWinsAndOtherFoldersAreKept) {
    const QStringList paths{"/opt/q/a.csv", "/data/a.csv", "/DATA/farm1/a.csv",
                            "/data/Farm1/2024/a.csv", "/home/me/a.csv"};
    for (int id = 0; id < 5; ++id)
        EXPECT_EQ(AnalyseFilename(kFarm, paths[id]).locationId, id);
    const AnalysedFilename other = AnalyseFilename(kFarm, "/home/me/b.csv");
    EXPECT_TRUE(other.folder == "/home/me" && other.name == "b.csv");
    EXPECT_TRUE(AnalyseFilename(kFarm, "/data/b.csv").folder.isEmpty());
    const AnalysedFilename bare = AnalyseFilename(kFarm, "b.csv");
    EXPECT_TRUE(bare.locationId == kLocationOther && bare.folder.isEmpty());

    LocationFolders f = kFarm;
    f.application = "/data";
    EXPECT_EQ(AnalyseFilename(f, "/data/a.csv").locationId, kLocationData);
    f.user = f.userCurrent = QString();
    EXPECT_EQ(AnalyseFilename(f, "/data/a.csv").locationId, kLocationUserCurrent);
    f.application = "/opt/q";
    f.data = "/data/"; // a folder text ending in a separator never matches
    EXPECT_EQ(AnalyseFilename(f, "/data/a.csv").locationId, kLocationOther);
}

TEST(FolderChecks, MissingFoldersAreMadeAndAFailureStopsTheCheck) {
    testing::TempHome home;
    testing::RecordingPorts ports;
    LocationFolders f{home.File("app"), home.File("store/data"), "Farm1", "2024", {}, {}};
    EXPECT_TRUE(CheckDataFolders(f) && CheckUserFolders(f));
    EXPECT_TRUE(QDir(home.File("app")).exists());
    EXPECT_TRUE(QDir(home.File("store/data/Farm1/2024")).exists());

    home.Write("blocker", "a file");
    f.application = home.File("blocker/app");
    f.data = home.File("other");
    EXPECT_FALSE(CheckDataFolders(f));
    EXPECT_FALSE(QDir(home.File("other")).exists());
    f.data = home.Path();
    f.user = "blocker";
    EXPECT_FALSE(CheckUserFolders(f));
}

} // namespace
} // namespace quorvel
