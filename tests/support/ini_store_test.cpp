#include "support/ini_store.h"

#include "common/full_disk.h"
#include "common/temp_home.h"

#include <QFile>
#include <QFileInfo>

#include <gtest/gtest.h>

using namespace quorvel;
using quorvel::testing::FullDisk;
using quorvel::testing::TempHome;

TEST(IniStore, MissingFileOrKeyGivesTheDefault) {
    TempHome home;
    IniStore ini(home.File("none.ini"));
    EXPECT_EQ(ini.Read("General", "Key", "dflt"), QString("dflt"));
    EXPECT_FALSE(QFile::exists(home.File("none.ini")));
    ASSERT_TRUE(ini.Write("General", "Other", "1"));
    EXPECT_EQ(ini.Read("General", "Key", "dflt"), QString("dflt"));
    EXPECT_EQ(ini.Read("Elsewhere", "Other", "d"), QString("d"));
}

TEST(IniStore, KeysAndSectionsIgnoreCase) {
    TempHome home;
    const QString path = home.Write("s.ini", "[general]\r\n  userid = abc  \r\n");
    IniStore ini(path);
    EXPECT_EQ(ini.Read("General", "UserID", ""), QString("abc"));
    ASSERT_TRUE(ini.Write("GENERAL", "USERID", "xyz"));
    EXPECT_EQ(ini.Read("General", "userid", ""), QString("xyz"));
    // Replaced in place, with the file's own line ends.
    EXPECT_EQ(home.Read("s.ini"), QByteArray("[general]\r\nUSERID=xyz\r\n"));
}

TEST(IniStore, LongValuesLineBreaksPermissionsAndMissingFolder) {
    TempHome home;
    IniStore ini(home.File("s.ini"));
    ASSERT_TRUE(ini.Write("General", "Long", QString(300, 'x')));
    EXPECT_EQ(ini.Read("General", "Long", "").size(), 255);
    // A value cannot break the file.
    ASSERT_TRUE(ini.Write("General", "Password", "a\r\n[Evil]\r\nx=1"));
    ASSERT_TRUE(ini.Write("General", "Next", "2"));
    EXPECT_EQ(ini.Read("Evil", "x", "none"), QString("none"));
    EXPECT_EQ(ini.Read("General", "Next", ""), QString("2"));
    // A new file is readable by its owner only.
    const QFileDevice::Permissions p = QFileInfo(home.File("s.ini")).permissions();
    EXPECT_TRUE(p & QFileDevice::ReadOwner);
    EXPECT_FALSE(p & (QFileDevice::ReadGroup | QFileDevice::ReadOther | QFileDevice::WriteGroup |
                      QFileDevice::WriteOther));
    EXPECT_FALSE(IniStore(home.File("missing-folder/s.ini")).Write("General", "A", "1"));
}

TEST(LocalSettings, NullMeansEmptyInAnyCase) {
    TempHome home;
    LocalSettings settings(home.File("q.ini"));
    ASSERT_TRUE(settings.SaveLocalSetting("Password", ""));
    EXPECT_EQ(IniStore(home.File("q.ini")).Read("General", "Password", ""), QString("Null"));
    EXPECT_EQ(settings.GetLocalSetting("Password", "dflt"), QString());
    home.Write("q.ini", "[General]\nA=NULL\nB=nUlL\nC=Nullify\n");
    EXPECT_EQ(settings.GetLocalSetting("A", "d"), QString());
    EXPECT_EQ(settings.GetLocalSetting("B", "d"), QString());
    EXPECT_EQ(settings.GetLocalSetting("C", "d"), QString("Nullify"));
    EXPECT_EQ(settings.GetLocalSetting("Missing", "3 hrs"), QString("3 hrs"));
    // An edited value survives a new reader.
    ASSERT_TRUE(LocalSettings(home.File("q.ini")).SaveLocalSetting("Interval", "6 hours"));
    EXPECT_EQ(LocalSettings(home.File("q.ini")).GetLocalSetting("Interval", "3 hrs"),
              QString("6 hours"));
}

TEST(IniStore, LinesItDoesNotOwnAreWrittenBackByteForByte) {
    TempHome home;
    const QByteArray before = "; Kommentar f\xfcr caf\xe9\r\n[General]\r\nComment=caf\xe9\r\n"
                              "Bytes=\xff\xfe\x01\n[Other]\rk=\xe9\r\nUserID=old\r\n";
    const QString path = home.Write("s.ini", before);
    LocalSettings settings(path);
    ASSERT_TRUE(settings.SaveLocalSetting("UserID", QString::fromUtf8("J\u00fcrgen")));
    ASSERT_TRUE(settings.SaveLocalSetting("New", "1"));
    EXPECT_EQ(home.Read("s.ini"),
              QByteArray("; Kommentar f\xfcr caf\xe9\r\n[General]\r\nComment=caf\xe9\r\n"
                         "Bytes=\xff\xfe\x01\nUserID=J\xc3\xbcrgen\r\nNew=1\r\n[Other]\rk=\xe9\r\n"
                         "UserID=old\r\n"));
    // A line that is not UTF-8 reads as Latin-1; one that is, as UTF-8.
    EXPECT_EQ(settings.GetLocalSetting("Comment", ""), QString::fromUtf8("caf\u00e9"));
    EXPECT_EQ(settings.GetLocalSetting("UserID", ""), QString::fromUtf8("J\u00fcrgen"));
}

TEST(IniStore, CarriageReturnsEndLines) {
    struct Case {
        const char* name;
        QByteArray file;
    };
    const Case cases[] = {
        {"CR only", "[General]\rUserID=ann\rPassword=secret\r"},
        {"CR inside a CR LF line", "[General]\r\nUserID=ann\rPassword=secret\r\n"},
        {"no end after the last line", "[General]\nUserID=ann\r\nPassword=secret"},
    };
    for (const Case& c : cases) {
        TempHome home;
        LocalSettings settings(home.Write("s.ini", c.file));
        EXPECT_EQ(settings.GetLocalSetting("UserID", "dflt"), QString("ann")) << c.name;
        EXPECT_EQ(settings.GetLocalSetting("Password", "dflt"), QString("secret")) << c.name;
        ASSERT_TRUE(settings.SaveLocalSetting("Interval", "1 day")) << c.name;
        EXPECT_EQ(settings.GetLocalSetting("Password", "dflt"), QString("secret")) << c.name;
        EXPECT_EQ(settings.GetLocalSetting("Interval", "dflt"), QString("1 day")) << c.name;
        EXPECT_TRUE(home.Read("s.ini").startsWith(c.file)) << c.name;
    }
}

TEST(IniStore, FullDiskFailsAndKeepsTheSettingsFile) {
    FullDisk disk;
    QByteArray before = "[General]\r\nCFG_URL=http://example.org/quorvel.cfg\r\nUserID=ann\r\n";
    while (before.size() < 299)
        before += "Key" + QByteArray::number(before.size()) + "=value\r\n";
    const QString path = disk.Write("quorvel.ini", before);
    disk.Fill();
    LocalSettings settings(path);
    const auto outcome = disk.Run([&] {
        const bool ok = settings.SaveLocalSetting("Interval", "6 hrs");
        return FullDisk::Outcome{ok, settings.LastError()};
    });
    EXPECT_FALSE(outcome.ok);
    EXPECT_EQ(outcome.text, "Could not write " + path + ": " + disk.Reason());
    EXPECT_EQ(disk.Read("quorvel.ini"), before);
    EXPECT_EQ(disk.Files(), QStringList{"quorvel.ini"});
}

TEST(LocalSettings, ManyKeysInOneWriteKeepEveryOtherLine) {
    TempHome home;
    const QByteArray before = "; mine\r\n[General]\r\nB=old\r\nOdd \xe9 line\r\n[Other]\r\nB=x\r\n";
    LocalSettings settings(home.Write("s.ini", before));
    ASSERT_TRUE(settings.SaveLocalSettings({{"A", "1"}, {"B", ""}, {"C", "3"}, {"A", "2"}}));
    EXPECT_EQ(home.Read("s.ini"), QByteArray("; mine\r\n[General]\r\nB=Null\r\nOdd \xe9 line\r\n"
                                             "A=2\r\nC=3\r\n[Other]\r\nB=x\r\n"));
}
