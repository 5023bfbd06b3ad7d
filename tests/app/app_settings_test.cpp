// The window's persisted values in a real settings file.

#include "app/app_settings.h"
#include "common/recorders.h"
#include "common/temp_home.h"
#include "support/ini_store.h"
#include "support/program_home.h"

#include <QFile>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

using testing::TempHome;

constexpr int kYear = 2024;

AppSettings LoadFrom(const QString& path, std::optional<AppError>* error = nullptr) {
    AppSettings settings;
    LocalSettings store(path);
    const auto result = settings.Load(store, "/opt/quorvel", kYear);
    if (error) *error = result;
    return settings;
}

TEST(AppSettingsLoad, FirstStartWithoutAFileGivesEveryDefault) {
    TempHome home;
    std::optional<AppError> error;
    const AppSettings s = LoadFrom(home.File("quorvel.ini"), &error);
    EXPECT_FALSE(error.has_value());
    EXPECT_TRUE(s.cfgUrl.isEmpty());
    EXPECT_TRUE(s.userId.isEmpty());
    EXPECT_TRUE(s.password.isEmpty());
    EXPECT_EQ(s.applicationFolder, "/opt/quorvel");
    EXPECT_EQ(s.dataFolder, "/opt/quorvel");
    EXPECT_EQ(s.showDate0, 1);
    EXPECT_EQ(s.getLocalFolders, 1);
    EXPECT_EQ(s.getFileList, 1);
    EXPECT_EQ(s.automatic, 0);
    EXPECT_EQ(s.interval, "3 hrs");
    EXPECT_EQ(s.lastDownload, "never");
    EXPECT_TRUE(s.nextDownloadDue.isEmpty());
    EXPECT_EQ(s.downloadOnly, 0);
    EXPECT_EQ(s.whichdates, 0);
    EXPECT_EQ(s.afterDate, "1 Nov 2024");
    EXPECT_EQ(s.loadedFile, "/opt/quorvel/files.txt");
    EXPECT_EQ(s.recentFiles.Entry(1), "/opt/quorvel/files.txt");
    EXPECT_TRUE(s.recentFiles.Entry(2).isEmpty());
    EXPECT_FALSE(QFile::exists(home.File("quorvel.ini")));

    // The defaults of a first start are the same values.
    const AppSettings defaults = AppSettings::Defaults("/opt/quorvel", kYear);
    EXPECT_EQ(defaults.loadedFile, s.loadedFile);
    EXPECT_EQ(defaults.afterDate, s.afterDate);
    EXPECT_EQ(defaults.interval, s.interval);
}

TEST(AppSettingsLoad, DefaultsComeFromTheProgramFolderAndTheClocksYear) {
    TempHome home;
    testing::ManualClock clock(QDateTime(QDate(2031, 3, 4), QTime(8, 0)));
    ScopedPorts ports(Ports{nullptr, &clock, nullptr});
    AppSettings s;
    LocalSettings store(ProgramHome::SettingsFile());
    EXPECT_FALSE(s.Load(store).has_value());
    EXPECT_EQ(s.applicationFolder, home.Path());
    EXPECT_EQ(s.afterDate, "1 Nov 2031");
    EXPECT_EQ(s.loadedFile, home.Path() + "/files.txt");
}

TEST(AppSettingsLoad, NullInAnyLetterCaseReadsEmptyNotTheDefault) {
    TempHome home;
    const QString path = home.Write("q.ini", "[General]\r\nInterval=nULL\r\nLastDownload=Null\r\n"
                                             "ApplicationFolder=NULL\r\n");
    const AppSettings s = LoadFrom(path);
    EXPECT_TRUE(s.interval.isEmpty());
    EXPECT_TRUE(s.lastDownload.isEmpty());
    EXPECT_TRUE(s.applicationFolder.isEmpty());
    // The list in use then lies in the current folder.
    EXPECT_EQ(s.loadedFile, "files.txt");
}

TEST(AppSettingsLoad, CheckBoxesAreCheckedByAnyNonZeroNumber) {
    TempHome home;
    const QString path = home.Write("q.ini", "[General]\r\nShowDate0=0\r\nDownloadOnly=-1\r\n");
    const AppSettings s = LoadFrom(path);
    EXPECT_EQ(s.showDate0, 0);
    EXPECT_EQ(s.downloadOnly, 1);
}

TEST(AppSettingsLoad, AnOptionIndexThatIsNoNumberStopsTheReading) {
    TempHome home;
    const QString path = home.Write("q.ini", "[General]\r\nUserID=farm\r\nGetFileList=user\r\n"
                                             "Automatic=1\r\nInterval=1 day\r\n");
    std::optional<AppError> error;
    const AppSettings s = LoadFrom(path, &error);
    ASSERT_TRUE(error.has_value());
    EXPECT_EQ(error->where, "Load");
    EXPECT_EQ(s.userId, "farm");
    EXPECT_EQ(s.automatic, 0);
    EXPECT_TRUE(s.interval.isEmpty());
}

TEST(AppSettingsLoad, AnOptionIndexBeyondSixteenBitsStopsTheReading) {
    TempHome home;
    const QString path = home.Write("q.ini", "[General]\r\nWhichdates=99999\r\n");
    std::optional<AppError> error;
    LoadFrom(path, &error);
    ASSERT_TRUE(error.has_value());
    EXPECT_EQ(error->description, "Overflow");
}

TEST(AppSettingsLoad, RecentEntriesComeFromTheFileKeys) {
    TempHome home;
    const QString path =
        home.Write("q.ini", "[General]\r\nFile1=/a/one.txt\r\nFile3=/a/three.txt\r\n");
    const AppSettings s = LoadFrom(path);
    EXPECT_EQ(s.loadedFile, "/a/one.txt");
    EXPECT_EQ(s.recentFiles.Entry(1), "/a/one.txt");
    EXPECT_TRUE(s.recentFiles.Entry(2).isEmpty());
    EXPECT_EQ(s.recentFiles.Entry(3), "/a/three.txt");
}

TEST(AppSettingsSave, EditedValuesSurviveARestart) {
    TempHome home;
    const QString path = home.File("q.ini");
    AppSettings s = LoadFrom(path);
    s.password.clear();
    s.userId = "farm1";
    s.interval = "15 minutes";
    s.automatic = 1;
    s.getFileList = 0;
    s.whichdates = 1;
    s.afterDate = "1 Nov 2023";
    s.showDate0 = 0;
    s.dataFolder = "/srv/data";
    LocalSettings store(path);
    ASSERT_TRUE(s.Save(store));

    const AppSettings again = LoadFrom(path);
    EXPECT_TRUE(again.password.isEmpty());
    EXPECT_EQ(again.userId, "farm1");
    EXPECT_EQ(again.interval, "15 minutes");
    EXPECT_EQ(again.automatic, 1);
    EXPECT_EQ(again.getFileList, 0);
    EXPECT_EQ(again.whichdates, 1);
    EXPECT_EQ(again.afterDate, "1 Nov 2023");
    EXPECT_EQ(again.showDate0, 0);
    EXPECT_EQ(again.dataFolder, "/srv/data");
    // The recent entries are never written.
    EXPECT_FALSE(home.Read("q.ini").contains("File1"));
}

TEST(AppSettingsSave, EmptyValuesAreStoredAsNullAndKeysInExitOrder) {
    TempHome home;
    AppSettings s = AppSettings::Defaults("/opt/quorvel", kYear);
    s.left = 1440;
    s.top = 123.5f;
    LocalSettings store(home.File("q.ini"));
    ASSERT_TRUE(s.Save(store));
    const QString text = QString::fromUtf8(home.Read("q.ini"));
    EXPECT_TRUE(text.contains("CFG_URL=Null"));
    EXPECT_TRUE(text.contains("Left=1440"));
    EXPECT_TRUE(text.contains("Top=123.5"));
    const QStringList order{"Left",
                            "Top",
                            "CFG_URL",
                            "UserID",
                            "Password",
                            "ApplicationFolder",
                            "DataFolder",
                            "Automatic",
                            "Interval",
                            "LastDownload",
                            "NextDownloadDue",
                            "Whichdates",
                            "AfterDate",
                            "ShowDate0",
                            "ShowDate1",
                            "GetFileList",
                            "GetLocalFolders",
                            "DownloadOnly"};
    qsizetype last = -1;
    for (const QString& key : order) {
        const qsizetype at = text.indexOf("\n" + key + "=");
        ASSERT_GT(at, last) << key.toStdString();
        last = at;
    }
}

TEST(AppSettingsSave, TheSettingsFileIsReadableByItsOwnerOnly) {
    TempHome home;
    const QString path = home.File("q.ini");
    LocalSettings store(path);
    ASSERT_TRUE(AppSettings::Defaults("/opt/quorvel", kYear).Save(store));
    const QFileDevice::Permissions others = QFileDevice::ReadGroup | QFileDevice::WriteGroup |
                                            QFileDevice::ReadOther | QFileDevice::WriteOther;
    EXPECT_EQ(QFile::permissions(path) & others, QFileDevice::Permissions());
    EXPECT_TRUE(QFile::permissions(path) & QFileDevice::ReadOwner);
}

} // namespace
} // namespace quorvel
