// The window's persisted values in a real settings file.

#include "app/app_settings.h"
#include "common/recorders.h"
#include "common/temp_home.h"
#include "support/ini_store.h"
#include "support/program_home.h"

#include <QFile>

#include <gtest/gtest.h>

#include <sys/inotify.h>
#include <unistd.h>

#include <functional>

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
    EXPECT_EQ(s.recentFiles.Entry(1), home.File("files.txt"));
    EXPECT_FALSE(QFile::exists(ProgramHome::SettingsFile()));
}

TEST(AppSettingsLoad, NullInAnyLetterCaseReadsEmptyNotTheDefault) {
    TempHome home;
    const AppSettings s = LoadFrom(home.Write(
        "q.ini", "[General]\r\nInterval=nULL\r\nLastDownload=Null\r\nApplicationFolder=NULL\r\n"));
    EXPECT_TRUE(s.interval.isEmpty() && s.lastDownload.isEmpty());
    EXPECT_EQ(s.loadedFile, "files.txt");
}

TEST(AppSettingsLoad, AnUnreadableOptionIndexFallsBackAloneAndIsReported) {
    struct Case {
        const char* key;
        const char* value;
        const char* error;
    };
    const Case cases[] = {{"GetLocalFolders", "many", "Type mismatch"},
                          {"GetFileList", "user", "Type mismatch"},
                          {"Whichdates", "99999", "Overflow"}};
    for (const Case& c : cases) {
        TempHome home;
        std::optional<AppError> error;
        QByteArray file = "[General]\r\nUserID=farm\r\nGetLocalFolders=0\r\nGetFileList=0\r\n"
                          "Whichdates=1\r\nAutomatic=1\r\nInterval=1 day\r\n"
                          "AfterDate=2 Feb 2022\r\n";
        const QByteArray key = QByteArray(c.key) + "=";
        const qsizetype at = file.indexOf(key) + key.size();
        file.replace(at, 1, c.value);
        const AppSettings s = LoadFrom(home.Write("q.ini", file), &error);
        ASSERT_TRUE(error.has_value()) << c.key;
        EXPECT_TRUE(error->description.startsWith(c.error)) << error->description.toStdString();
        EXPECT_TRUE(error->description.contains(QString(c.key) + "=" + c.value))
            << error->description.toStdString();
        EXPECT_EQ(error->where, "Load");
        // Every other value is the stored one; the bad one its own default.
        const AppSettings defaults = AppSettings::Defaults("/opt/q", 2024);
        const std::pair<const char*, std::pair<std::int16_t, std::int16_t>> options[] = {
            {"GetLocalFolders", {s.getLocalFolders, defaults.getLocalFolders}},
            {"GetFileList", {s.getFileList, defaults.getFileList}},
            {"Whichdates", {s.whichdates, defaults.whichdates}}};
        for (const auto& [key, values] : options) {
            const std::int16_t stored = QString(key) == "Whichdates" ? 1 : 0;
            EXPECT_EQ(values.first, QString(key) == c.key ? values.second : stored)
                << c.key << " " << key;
        }
        EXPECT_TRUE(s.userId == "farm" && s.automatic == 1 && s.interval == "1 day" &&
                    s.afterDate == "2 Feb 2022")
            << c.key;
    }
}

TEST(AppSettingsSave, EditedValuesAndRecentListsSurviveARestart) {
    TempHome home;
    const QString path = home.File("q.ini");
    AppSettings s = LoadFrom(path);
    s.password.clear();
    s.userId = "farm1";
    s.interval = "15 minutes";
    s.automatic = s.whichdates = 1;
    s.getFileList = s.showDate0 = 0;
    s.dataFolder = "/srv/data";
    for (const char* list : {"/lists/a.txt", "/lists/b.txt", "/lists/c.txt"})
        s.recentFiles.Add(list);
    LocalSettings store(path);
    ASSERT_TRUE(s.Save(store));
    const AppSettings again = LoadFrom(path);
    EXPECT_EQ(again.recentFiles, s.recentFiles);
    EXPECT_EQ(again.loadedFile, "/lists/c.txt"); // the newest list opens
    s.loadedFile = again.loadedFile;
    EXPECT_EQ(again, s);
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
    // The recent list is written with the others; free entries are not.
    EXPECT_GT(text.indexOf("\nFile1=/opt/q/files.txt"), last);
    EXPECT_FALSE(text.contains("File2"));
    const auto others = QFileDevice::ReadGroup | QFileDevice::ReadOther | QFileDevice::WriteOther;
    EXPECT_FALSE(QFile::permissions(home.File("q.ini")) & others);
}

// Counts the renames onto one file of a folder while work runs. The folder's
// creations are watched too: the kernel folds an event into the one queued
// before it when both are alike, and the temporary file of each replacement
// stands between two renames.
int RenamesOnto(const QString& folder, const QString& name, const std::function<void()>& work) {
    const int watch = inotify_init1(IN_NONBLOCK);
    if (watch < 0 || inotify_add_watch(watch, QFile::encodeName(folder).constData(),
                                       IN_MOVED_TO | IN_CREATE) < 0)
        return -1;
    work();
    int count = 0;
    alignas(inotify_event) char buffer[64 * 1024];
    for (ssize_t got; (got = read(watch, buffer, sizeof buffer)) > 0;) {
        for (char* at = buffer; at < buffer + got;) {
            const auto* event = reinterpret_cast<const inotify_event*>(at);
            if ((event->mask & IN_MOVED_TO) && event->len > 0 &&
                name == QFile::decodeName(event->name))
                ++count;
            at += sizeof(inotify_event) + event->len;
        }
    }
    close(watch);
    return count;
}

TEST(AppSettingsSave, ASaveReplacesTheSettingsFileOnceAndKeepsLinesItDoesNotOwn) {
    TempHome home;
    const QByteArray foreign = "; kept as it is\r\n[Window]\r\nGeometry=\xff\x01\r\n";
    const QString path = home.Write("q.ini", foreign + "[General]\r\nUserID=old\r\n");
    AppSettings s = LoadFrom(path);
    s.userId = "farm";
    LocalSettings store(path);
    bool saved = false;
    EXPECT_EQ(RenamesOnto(home.Path(), "q.ini", [&] { saved = s.Save(store); }), 1);
    EXPECT_TRUE(saved);
    EXPECT_TRUE(home.Read("q.ini").startsWith(foreign + "[General]\r\nUserID=farm\r\n"));
    EXPECT_EQ(LoadFrom(path), s);
}

} // namespace
} // namespace quorvel
