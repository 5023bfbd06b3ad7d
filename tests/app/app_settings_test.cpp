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

AppSettings LoadFrom(const QString& path, std::optional<AppError>* error = nullptr) {
    AppSettings settings;
    const auto result = settings.Load(LocalSettings(path), "/opt/q", 2024);
    if (error) *error = result;
    return settings;
}

TEST(AppSettingsLoad, FirstStartWithoutAFileGivesEveryDefault) {
    TempHome home;
    testing::ManualClock clock(QDateTime(QDate(2031, 3, 4), QTime(8, 0)));
    ScopedPorts ports(Ports{nullptr, &clock, nullptr});
    AppSettings s;
    EXPECT_FALSE(s.Load(LocalSettings(ProgramHome::SettingsFile())).has_value());
    EXPECT_EQ(s, AppSettings::Defaults(home.Path(), 2031));
    EXPECT_TRUE(s.applicationFolder == home.Path() && s.dataFolder == home.Path());
    EXPECT_EQ((std::array{s.showDate0, s.getLocalFolders, s.getFileList, s.automatic,
                          s.downloadOnly, s.whichdates}),
              (std::array<std::int16_t, 6>{1, 1, 1, 0, 0, 0}));
    EXPECT_TRUE(s.interval == "3 hrs" && s.lastDownload == "never" && s.afterDate == "1 Nov 2031");
    EXPECT_EQ(s.loadedFile, home.File("files.txt"));
    EXPECT_EQ(s.recentFiles.Entry(1), s.loadedFile);
    EXPECT_FALSE(QFile::exists(ProgramHome::SettingsFile()));
}

TEST(AppSettingsLoad, NullInAnyLetterCaseReadsEmptyNotTheDefault) {
    TempHome home;
    const AppSettings s = LoadFrom(home.Write(
        "q.ini", "[General]\r\nInterval=nULL\r\nLastDownload=Null\r\nApplicationFolder=NULL\r\n"));
    EXPECT_TRUE(s.interval.isEmpty() && s.lastDownload.isEmpty());
    EXPECT_EQ(s.loadedFile, "files.txt");
}

TEST(AppSettingsLoad, AnOptionIndexThatIsNoSixteenBitNumberStopsTheReading) {
    TempHome home;
    std::optional<AppError> error;
    const AppSettings s =
        LoadFrom(home.Write("q.ini", "[General]\r\nUserID=farm\r\nGetFileList=user"
                                     "\r\nAutomatic=1\r\nInterval=1 day\r\n"),
                 &error);
    EXPECT_EQ(error, (AppError{"Type mismatch", "Load"}));
    EXPECT_TRUE(s.userId == "farm" && s.automatic == 0 && s.interval.isEmpty());
    LoadFrom(home.Write("q.ini", "[General]\r\nWhichdates=99999\r\n"), &error);
    EXPECT_EQ(error, (AppError{"Overflow", "Load"}));
}

TEST(AppSettingsSave, EditedValuesSurviveARestart) {
    TempHome home;
    const QString path = home.File("q.ini");
    AppSettings s = LoadFrom(path);
    s.password.clear();
    s.userId = "farm1";
    s.interval = "15 minutes";
    s.automatic = s.whichdates = 1;
    s.getFileList = s.showDate0 = 0;
    s.dataFolder = "/srv/data";
    LocalSettings store(path);
    ASSERT_TRUE(s.Save(store));
    EXPECT_EQ(LoadFrom(path), s);
}

TEST(AppSettingsSave, KeysInExitOrderEmptyAsNullAndTheFileOwnerOnly) {
    TempHome home;
    AppSettings s = AppSettings::Defaults("/opt/q", 2024);
    s.left = 1440;
    s.top = 123.5f;
    LocalSettings store(home.File("q.ini"));
    ASSERT_TRUE(s.Save(store));
    const QString text = QString::fromUtf8(home.Read("q.ini"));
    qsizetype last = -1;
    for (const QString key :
         {"Left=1440", "Top=123.5", "CFG_URL=Null", "UserID=", "Password=", "ApplicationFolder=",
          "DataFolder=", "Automatic=0", "Interval=3 hrs", "LastDownload=never",
          "NextDownloadDue=Null", "Whichdates=", "AfterDate=", "ShowDate0=1", "ShowDate1=0",
          "GetFileList=1", "GetLocalFolders=1", "DownloadOnly=0"}) {
        EXPECT_GT(text.indexOf("\n" + key), last) << key.toStdString();
        last = text.indexOf("\n" + key);
    }
    EXPECT_FALSE(text.contains("File1"));
    const auto others = QFileDevice::ReadGroup | QFileDevice::ReadOther | QFileDevice::WriteOther;
    EXPECT_FALSE(QFile::permissions(home.File("q.ini")) & others);
}

} // namespace
} // namespace quorvel
