// The file list against real files: loading, saving, local dates.

#include "app/file_list.h"
#include "app/file_list_format.h"
#include "common/full_disk.h"
#include "common/recorders.h"
#include "common/temp_home.h"
#include "sample_list.h"

#include <QDir>
#include <QFile>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

using testing::FullDisk;
using testing::TempHome;

const QByteArray kOldList = " 1 ~1~keep~keep.csv~0~0~0~0~0~1~0~~~0\r\n";

TEST(FileListLoad, SkipsCommentAndBadLinesAndKeepsOrder) {
    TempHome home;
    const QString path =
        home.Write("files.txt", "Files of farm 1\r\n"
                                " 1 ~1~First~a.csv~0~0~0~0~0~1~0~~~0\r\n"
                                "~~~~~\r\n"
                                "ID~Active~Name~File~Type~Admin\r\n"
                                "12abc~1~a~b~0~0\r\n1~1~five~fields~0\r\n\r\n"
                                " 2 ~0~Second~b.csv~1~1~1~1~0~3~0~~2 Jan 2024~9\n");
    FileList list;
    list.Append(testing::SampleRecord(9));
    const ListLoadResult result = list.LoadDataFile(path);
    EXPECT_TRUE(result.ok && result.errors.empty());
    ASSERT_EQ(list.Count(), 2);
    EXPECT_EQ(list.At(0).Name, "First");
    EXPECT_EQ(list.At(1).FileDate, "2 Jan 2024");
    EXPECT_EQ(list.LoadedFile, path);
}

TEST(FileListLoad, MissingFileIsEmptyAFolderFailsAndAnOverflowIsReported) {
    TempHome home;
    FileList list;
    list.Append(testing::SampleRecord(1));
    EXPECT_TRUE(list.LoadDataFile(home.File("none.txt")).ok);
    EXPECT_TRUE(list.IsEmpty());
    EXPECT_EQ(list.LoadedFile, home.File("none.txt"));

    ASSERT_TRUE(QDir().mkpath(home.File("dir.txt")));
    const ListLoadResult result = list.LoadDataFile(home.File("dir.txt"));
    EXPECT_FALSE(result.ok);
    ASSERT_EQ(result.errors.size(), 1u);
    EXPECT_EQ(result.errors[0].where, "LoadDataFile:" + home.File("dir.txt"));

    // An overflowing identifier is reported with its line and the loading goes on.
    const QString bad = "40000~1~Big~big.csv~0~0~0~0~0~1~0~~~0";
    const ListLoadResult overflow = list.LoadDataFile(home.Write(
        "files.txt", (" 1 ~1~a~a.csv~0~0\r\n" + bad + "\r\n 3 ~1~c~c.csv~0~0").toUtf8()));
    EXPECT_TRUE(overflow.ok);
    ASSERT_EQ(overflow.errors.size(), 1u);
    EXPECT_EQ(overflow.errors[0], (AppError{"Overflow", "LoadFilesRecord: " + bad}));
    ASSERT_EQ(list.Count(), 3);
    EXPECT_EQ(list.At(1), FileRecord{});
    EXPECT_EQ(list.At(2).FileID, 3);

    // Several make one report that names the first.
    const QString path = home.Write(
        "files.txt", (" 1 ~1~a~a.csv~0~0\r\n" + bad + "\r\n 3 ~1~c~c.csv~0~99999\r\n").toUtf8());
    const ListLoadResult several = list.LoadDataFile(path);
    EXPECT_EQ(list.Count(), 3);
    ASSERT_EQ(several.errors.size(), 1u);
    EXPECT_EQ(several.errors[0],
              (AppError{"Overflow in 2 records: a number above 32767 or below -32768 (the first: "
                        "LoadFilesRecord: " +
                            bad + ")",
                        "LoadDataFile:" + path}));
}

TEST(FileListSave, SaveAndReloadGiveEveryFieldButTheLocalDate) {
    TempHome home;
    FileList list = testing::SampleList(300);
    list.At(5).FileID = -3;
    list.At(7).FileDateLocal = "1 Mar 2024";
    list.Insert(0, NewFileRecord("rain.csv", kLocationApplication, {}));
    ASSERT_FALSE(list.WriteTo(home.File("files.txt")).has_value());
    EXPECT_TRUE(
        home.Read("files.txt").startsWith(" 0 ~1~rain.csv~rain.csv~0~0~0~0~0~1~0~~~0\r\n 1 ~"));
    FileList again;
    ASSERT_TRUE(again.LoadDataFile(home.File("files.txt")).ok);
    list.At(8).FileDateLocal.clear();
    EXPECT_EQ(again.Records(), list.Records());
}

TEST(FileListSave, InterruptedSaveLeavesTheOldListAndNoStrayFile) {
    TempHome home;
    const QString path = home.Write("files.txt", kOldList);
    const auto error =
        testing::SampleList(5).WriteTo(path, [](int written) { return written < 3; });
    ASSERT_TRUE(error.has_value());
    EXPECT_EQ(error->where, "SaveFileList:" + path);
    EXPECT_EQ(home.Read("files.txt"), kOldList);
    EXPECT_EQ(QDir(home.Path()).entryList(QDir::Files), QStringList{"files.txt"});
}

TEST(FileListSave, WritesOnlyChangedListsAndWaitsForUsableFolders) {
    TempHome home;
    testing::RecordingPorts ports;
    FileList list;
    ASSERT_TRUE(list.LoadDataFile(home.Write("files.txt", kOldList)).ok);
    list.At(0).Name = "edited";
    LocationFolders folders{home.Path(), home.File("data"), {}, {}, {}, {}};
    EXPECT_FALSE(list.SaveFileList(folders).has_value());
    EXPECT_EQ(home.Read("files.txt"), kOldList);

    list.ListChanged = true;
    home.Write("blocker", "a file where a folder should be");
    LocationFolders blocked = folders;
    blocked.data = home.File("blocker/data");
    EXPECT_FALSE(list.SaveFileList(blocked).has_value());
    EXPECT_TRUE(list.ListChanged);
    EXPECT_EQ(home.Read("files.txt"), kOldList);

    EXPECT_FALSE(list.SaveFileList(folders).has_value());
    EXPECT_FALSE(list.ListChanged);
    EXPECT_TRUE(home.Read("files.txt").contains("~edited~"));

    // Saved under a new name, an unchanged list is written too.
    EXPECT_FALSE(list.SaveFileListAs(home.File("copy.txt"), folders).has_value());
    EXPECT_EQ(home.Read("copy.txt"), home.Read("files.txt"));
    const auto error = list.SaveFileListAs(home.File("no/such/files.txt"), folders);
    ASSERT_TRUE(error.has_value());
    EXPECT_EQ(error->where, "SaveFileList:" + list.LoadedFile);
    EXPECT_TRUE(list.ListChanged);
}

// The changes of one list never make the next one be written: a list just
// read keeps its comment lines until something in it changes.
TEST(FileListSave, AListJustReadIsNotWrittenForTheChangesOfTheOneBefore) {
    TempHome home;
    const QByteArray commented = "Files of farm 1\r\n" + kOldList;
    FileList list;
    ASSERT_TRUE(list.LoadDataFile(home.Write("first.txt", kOldList)).ok);
    list.At(0).Name = "edited";
    list.ListChanged = true;
    ASSERT_TRUE(list.LoadDataFile(home.Write("second.txt", commented)).ok);
    EXPECT_FALSE(list.ListChanged);
    LocationFolders folders{home.Path(), home.File("data"), {}, {}, {}, {}};
    EXPECT_FALSE(list.SaveFileList(folders).has_value());
    EXPECT_EQ(home.Read("second.txt"), commented);
}

TEST(FileListEdit, NewFilesChosenTogetherStandInReverseBeforeTheSelectedEntry) {
    const LocationFolders folders{"/opt/quorvel", "/data", "Farm1", {}, {}, {}};
    FileList list;
    list.Append(testing::SampleRecord(1));
    int selected = 0;
    for (const char* path : {"/data/A.csv", "/opt/quorvel/B.csv", "/elsewhere/C.csv"}) {
        selected = AddNewFileRecord(list, folders, path, selected);
    }
    ASSERT_EQ(list.Count(), 4);
    EXPECT_TRUE(list.ListChanged);
    EXPECT_EQ(list.At(0), NewFileRecord("C.csv", kLocationOther, "/elsewhere"));
    EXPECT_EQ(list.At(1), NewFileRecord("B.csv", kLocationApplication, {}));
    EXPECT_EQ(list.At(2), NewFileRecord("A.csv", kLocationData, {}));
    EXPECT_EQ(list.At(3), testing::SampleRecord(1));
}

TEST(LocalDates, TheLastLineForAnIdentifierWins) {
    TempHome home;
    home.Write("files.txt", " 4 ~1~a~a.csv~0~0~0~0~0~3~0~~1 Jan 2024~0\r\n"
                            "comment\r\n"
                            " 9 ~1~z~z.csv~0~0~0~0~0~3~0~~9 Jan 2024~0\r\n"
                            " 4 ~1~a~a.csv~0~0~0~0~0~3~0~~5 Jan 2024~0\r\n");
    FileList list = testing::SampleList(2);
    list.At(0).FileID = 4;
    list.At(1).FileID = 5;
    EXPECT_FALSE(list.LoadLocalDates(home.Path()).has_value());
    EXPECT_EQ(list.At(0).FileDateLocal, "5 Jan 2024");
    EXPECT_TRUE(list.At(1).FileDateLocal.isEmpty());
}

TEST(FileListSave, OnAFullDiskFailsSaysWhyAndKeepsTheOldList) {
    struct Case {
        int oldRecords, newRecords;
        qint64 room;
    };
    for (const Case& c : {Case{2, 3, 0}, Case{40, 483, 8192}}) { // no room, room for a part
        SCOPED_TRACE(c.room);
        FullDisk disk;
        const QString path = disk.File("files.txt");
        ASSERT_FALSE(testing::WriteSampleList(path, c.oldRecords).has_value());
        const QByteArray before = disk.Read("files.txt");
        disk.Fill(c.room);

        FileList list = testing::SampleList(c.newRecords);
        list.LoadedFile = path;
        list.ListChanged = true;
        const LocationFolders folders{disk.Path(), disk.Path(), {}, {}, {}, {}};
        const auto outcome = disk.Run([&] {
            const auto error = list.SaveFileList(folders);
            return FullDisk::Outcome{!error, error ? error->description + "|" + error->where : ""};
        });
        EXPECT_FALSE(outcome.ok);
        EXPECT_EQ(outcome.text,
                  "Could not write " + path + ": " + disk.Reason() + "|SaveFileList:" + path);
        EXPECT_EQ(disk.Read("files.txt"), before);
        EXPECT_EQ(disk.Files(), QStringList{"files.txt"});
        FileList again;
        ASSERT_TRUE(again.LoadDataFile(path).ok);
        EXPECT_EQ(again.Count(), c.oldRecords);
    }
}

TEST(FileListText, EachLineKeepsItsOwnEncodingBothWays) {
    TempHome home;
    const QByteArray utf8Line = " 1 ~1~Caf\xc3\xa9~caf\xc3\xa9.csv~0~0~0~0~0~1~0~~~0\r\n";
    const QByteArray latin1Line = " 2 ~1~M\xfcller~m\xfcller.csv~0~0~0~0~0~1~0~~~0\r\n";
    const QString path = home.Write("files.txt", utf8Line + latin1Line + utf8Line);
    FileList list;
    ASSERT_TRUE(list.LoadDataFile(path).ok);
    ASSERT_EQ(list.Count(), 3);
    EXPECT_EQ(list.At(0).FileName, QString::fromUtf8("caf\u00e9.csv"));
    EXPECT_EQ(list.At(1).FileName, QString::fromUtf8("m\u00fcller.csv"));
    EXPECT_EQ(list.At(2).Name, QString::fromUtf8("Caf\u00e9"));

    // Written back as read; a line whose new text Latin-1 cannot hold becomes UTF-8.
    ASSERT_FALSE(list.WriteTo(path).has_value());
    EXPECT_EQ(home.Read("files.txt"), utf8Line + latin1Line + utf8Line);
    list.At(1).Name = QString::fromUtf8("M\u00fcller \u20ac");
    list.Move(1, 1);
    ASSERT_FALSE(list.WriteTo(path).has_value());
    EXPECT_EQ(home.Read("files.txt"),
              utf8Line + utf8Line +
                  " 2 ~1~M\xc3\xbcller \xe2\x82\xac~m\xc3\xbcller.csv~0~0~0~0~0~1~0~~~0\r\n");
}

TEST(FileListText, LongLinesAreReadInLinearTimeAndOverlongOnesRefused) {
    TempHome home;
    const QByteArray digits(1'000'000, '7');
    EXPECT_FALSE(IsNumericText(QString::fromLatin1(digits + "x")));
    EXPECT_TRUE(IsNumericText(QString::fromLatin1(" " + digits + ".5e3 ")));
    const QByteArray overlong(3 << 20, '~');
    const QString path =
        home.Write("files.txt", digits + "x~1~a~b~0~0\r\n" + overlong + "\r\n" + kOldList);
    FileList list;
    const ListLoadResult result = list.LoadDataFile(path);
    EXPECT_TRUE(result.ok);
    ASSERT_EQ(list.Count(), 1);
    EXPECT_EQ(list.At(0).Name, "keep");
    ASSERT_EQ(result.errors.size(), 1u);
    EXPECT_EQ(result.errors[0].description, "1 line was not read: longer than 1 MiB (line 2)");
    EXPECT_EQ(result.errors[0].where, "LoadDataFile:" + path);
}

TEST(FileListLoad, RecordsBeyondTheLimitAreReportedOnceWithTheirNumber) {
    TempHome home;
    const QString path = home.File("files.txt");
    ASSERT_FALSE(testing::SampleList(FileList::kMaxRecords).WriteTo(path).has_value());
    QFile file(path);
    ASSERT_TRUE(file.open(QIODevice::Append));
    for (int i = 0; i < 40000 - FileList::kMaxRecords; ++i)
        file.write(" 7 ~1~late~late.csv~0~0~0~0~0~1~0~~~0\r\n");
    file.write("40000~1~Big~big.csv~0~0~0~0~0~1~0~~~0\r\n");
    file.close();

    FileList list;
    const ListLoadResult result = list.LoadDataFile(path);
    EXPECT_TRUE(result.ok);
    EXPECT_EQ(list.Count(), FileList::kMaxRecords);
    ASSERT_EQ(result.errors.size(), 1u);
    EXPECT_EQ(result.errors[0].description,
              "7234 records were not loaded: a file list holds at most 32767 records");
    EXPECT_EQ(result.errors[0].where, "LoadDataFile:" + path);
}

} // namespace
} // namespace quorvel
