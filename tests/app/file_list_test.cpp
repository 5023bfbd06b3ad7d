// The file list against real files: loading, saving, local dates.

#include "app/file_list.h"
#include "app/file_list_format.h"
#include "common/recorders.h"
#include "common/temp_home.h"
#include "sample_list.h"

#include <QDir>
#include <QFile>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

using testing::TempHome;

FileRecord FullRecord(int id, const QString& name) {
    FileRecord r;
    r.FileID = id;
    r.Active = 1;
    r.Name = name;
    r.FileName = "sub\\" + name + ".csv";
    r.TypeID = 3;
    r.AdminLocationID = 2;
    r.UserLocationID = 4;
    r.MethodID = 1;
    r.Zip = 0;
    r.Download = 3;
    r.Upload = 2;
    r.Folder = "Logs";
    r.FileDate = "3 Mar 2024 10:00:00";
    r.FileDateLocal = "1 Mar 2024";
    r.SpareNumber = -17;
    return r;
}

LocationFolders FoldersIn(const TempHome& home) {
    LocationFolders folders;
    folders.application = home.Path();
    folders.data = home.File("data");
    return folders;
}

TEST(FileListLoad, SkipsCommentAndBadLinesAndKeepsOrder) {
    TempHome home;
    const QString path =
        home.Write("files.txt", "Files of farm 1\r\n"
                                " 1 ~1~First~a.csv~0~0~0~0~0~1~0~~~0\r\n"
                                "~~~~~\r\n"
                                "ID~Active~Name~File~Type~Admin\r\n"
                                " 2 ~0~Second~b.csv~1~1~1~1~0~3~0~~2 Jan 2024~9\r\n");
    FileList list;
    const ListLoadResult result = list.LoadDataFile(path);
    EXPECT_TRUE(result.ok);
    EXPECT_TRUE(result.errors.empty());
    ASSERT_EQ(list.Count(), 2);
    EXPECT_EQ(list.At(0).Name, "First");
    EXPECT_EQ(list.At(1).Name, "Second");
    EXPECT_EQ(list.At(1).FileDate, "2 Jan 2024");
    EXPECT_EQ(list.At(1).SpareNumber, 9);
    EXPECT_EQ(list.LoadedFile, path);
}

TEST(FileListLoad, ReplacesTheRecordsOfAnEarlierList) {
    TempHome home;
    FileList list;
    list.Append(FullRecord(1, "old"));
    list.LoadDataFile(home.Write("files.txt", " 5 ~1~New~n.csv~0~0\r\n"));
    ASSERT_EQ(list.Count(), 1);
    EXPECT_EQ(list.At(0).FileID, 5);
}

TEST(FileListLoad, MissingFileGivesAnEmptyListThatWillBeSavedThere) {
    TempHome home;
    FileList list;
    list.Append(FullRecord(1, "old"));
    const QString path = home.File("nothing.txt");
    const ListLoadResult result = list.LoadDataFile(path);
    EXPECT_TRUE(result.ok);
    EXPECT_TRUE(list.IsEmpty());
    EXPECT_EQ(list.LoadedFile, path);
}

TEST(FileListLoad, UnreadableFileFails) {
    TempHome home;
    // A folder of that name exists but cannot be read as a list.
    const QString path = home.File("files.txt");
    ASSERT_TRUE(QDir().mkpath(path));
    FileList list;
    const ListLoadResult result = list.LoadDataFile(path);
    EXPECT_FALSE(result.ok);
    ASSERT_EQ(result.errors.size(), 1u);
    EXPECT_EQ(result.errors[0].where, "LoadDataFile:" + path);
    EXPECT_TRUE(list.IsEmpty());
}

TEST(FileListLoad, OverflowIsReportedWithTheLineAndLoadingGoesOn) {
    TempHome home;
    const QString bad = "40000~1~Big~big.csv~0~0~0~0~0~1~0~~~0";
    const QString path = home.Write(
        "files.txt", (" 1 ~1~a~a.csv~0~0\r\n" + bad + "\r\n 3 ~1~c~c.csv~0~0\r\n").toUtf8());
    FileList list;
    const ListLoadResult result = list.LoadDataFile(path);
    EXPECT_TRUE(result.ok);
    ASSERT_EQ(result.errors.size(), 1u);
    EXPECT_EQ(result.errors[0], (AppError{"Overflow", "LoadFilesRecord: " + bad}));
    ASSERT_EQ(list.Count(), 3);
    EXPECT_EQ(list.At(1), FileRecord{});
    EXPECT_EQ(list.At(2).FileID, 3);
}

TEST(FileListSave, SaveAndReloadGiveEveryFieldButTheLocalDate) {
    TempHome home;
    FileList list;
    list.Append(FullRecord(7, "one"));
    list.Append(FullRecord(-3, "two"));
    list.Append(NewFileRecord("rain.csv", kLocationOther, "/srv/logs"));
    const QString path = home.File("files.txt");
    ASSERT_FALSE(list.WriteTo(path).has_value());

    FileList again;
    ASSERT_TRUE(again.LoadDataFile(path).ok);
    ASSERT_EQ(again.Count(), list.Count());
    for (int i = 0; i < list.Count(); ++i) {
        FileRecord expected = list.At(i);
        expected.FileDateLocal.clear();
        EXPECT_EQ(again.At(i), expected) << "record " << i;
    }
}

TEST(FileListSave, NewRecordIsWrittenByteForByte) {
    TempHome home;
    FileList list;
    list.Append(NewFileRecord("rain.csv", kLocationApplication, {}));
    ASSERT_FALSE(list.WriteTo(home.File("files.txt")).has_value());
    EXPECT_EQ(home.Read("files.txt"), QByteArray(" 0 ~1~rain.csv~rain.csv~0~0~0~0~0~1~0~~~0\r\n"));
}

TEST(FileListSave, InterruptedSaveLeavesTheOldListAndNoStrayFile) {
    TempHome home;
    const QByteArray old = " 1 ~1~keep~keep.csv~0~0~0~0~0~1~0~~~0\r\n";
    const QString path = home.Write("files.txt", old);
    FileList list;
    for (int i = 0; i < 5; ++i)
        list.Append(FullRecord(i, QString("r%1").arg(i)));

    const auto error = list.WriteTo(path, [](int written) { return written < 3; });
    ASSERT_TRUE(error.has_value());
    EXPECT_EQ(error->where, "SaveFileList:" + path);
    EXPECT_EQ(home.Read("files.txt"), old);
    EXPECT_EQ(QDir(home.Path()).entryList(QDir::Files), QStringList{"files.txt"});
}

TEST(FileListSave, SaveIntoAMissingFolderFailsAndReportsThePath) {
    TempHome home;
    FileList list;
    list.Append(FullRecord(1, "a"));
    list.LoadedFile = home.File("no/such/folder/files.txt");
    list.ListChanged = true;
    const auto error = list.SaveFileList(FoldersIn(home));
    ASSERT_TRUE(error.has_value());
    EXPECT_EQ(error->where, "SaveFileList:" + list.LoadedFile);
    EXPECT_TRUE(list.ListChanged);
}

TEST(FileListSave, WritesOnlyWhenChanged) {
    TempHome home;
    const QByteArray old = " 1 ~1~keep~keep.csv~0~0~0~0~0~1~0~~~0\r\n";
    FileList list;
    ASSERT_TRUE(list.LoadDataFile(home.Write("files.txt", old)).ok);
    list.At(0).Name = "edited";
    EXPECT_FALSE(list.SaveFileList(FoldersIn(home)).has_value());
    EXPECT_EQ(home.Read("files.txt"), old);

    list.ListChanged = true;
    EXPECT_FALSE(list.SaveFileList(FoldersIn(home)).has_value());
    EXPECT_FALSE(list.ListChanged);
    EXPECT_TRUE(home.Read("files.txt").contains("~edited~"));
}

TEST(FileListSave, WaitsWhileTheDataFolderCannotBeMade) {
    TempHome home;
    home.Write("blocker", "a file where a folder should be");
    FileList list;
    list.Append(FullRecord(1, "a"));
    list.LoadedFile = home.File("files.txt");
    list.ListChanged = true;
    LocationFolders folders = FoldersIn(home);
    folders.data = home.File("blocker/data");
    testing::RecordingPorts ports;
    EXPECT_FALSE(list.SaveFileList(folders).has_value());
    EXPECT_TRUE(list.ListChanged);
    EXPECT_FALSE(QFile::exists(list.LoadedFile));
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_TRUE(ports.prompter.shown[0].message.contains(home.File("blocker")));
}

TEST(FileListEdit, MovesStayInsideTheListAndInsertHonoursTheCountLimit) {
    FileList list;
    list.Append(FullRecord(1, "a"));
    list.Append(FullRecord(2, "b"));
    EXPECT_FALSE(list.Move(0, -1));
    EXPECT_FALSE(list.Move(1, 1));
    EXPECT_TRUE(list.Move(1, -1));
    EXPECT_EQ(list.At(0).Name, "b");
    EXPECT_TRUE(list.Insert(1, FullRecord(3, "c")));
    EXPECT_EQ(list.At(1).Name, "c");
    EXPECT_FALSE(list.Insert(5, FullRecord(4, "d")));
    list.Remove(0);
    EXPECT_EQ(list.At(0).Name, "c");
}

TEST(FileListEdit, ALineBeyondTheLargestCountIsRefused) {
    FileList list;
    for (int i = 0; i < FileList::kMaxRecords; ++i)
        list.Append(FileRecord{});
    const auto error = list.LoadFilesRecord(" 1 ~1~a~b~0~0");
    ASSERT_TRUE(error.has_value());
    EXPECT_EQ(list.Count(), FileList::kMaxRecords);
}

TEST(LocalDates, TheLastLineForAnIdentifierWins) {
    TempHome home;
    home.Write("files.txt", " 4 ~1~a~a.csv~0~0~0~0~0~3~0~~1 Jan 2024~0\r\n"
                            "comment\r\n"
                            " 9 ~1~z~z.csv~0~0~0~0~0~3~0~~9 Jan 2024~0\r\n"
                            " 4 ~1~a~a.csv~0~0~0~0~0~3~0~~5 Jan 2024~0\r\n");
    FileList list;
    list.Append(FullRecord(4, "a"));
    list.Append(FullRecord(5, "b"));
    list.At(1).FileDateLocal.clear();
    EXPECT_FALSE(list.LoadLocalDates(home.Path()).has_value());
    EXPECT_EQ(list.At(0).FileDateLocal, "5 Jan 2024");
    EXPECT_TRUE(list.At(1).FileDateLocal.isEmpty());
}

TEST(LocalDates, NoLocalListChangesNothing) {
    TempHome home;
    FileList list;
    list.Append(FullRecord(4, "a"));
    EXPECT_FALSE(list.LoadLocalDates(home.File("empty")).has_value());
    EXPECT_EQ(list.At(0).FileDateLocal, "1 Mar 2024");
}

TEST(FileListSave, ALongListRoundTrips) {
    TempHome home;
    const QString path = home.File("big.txt");
    ASSERT_FALSE(testing::WriteSampleList(path, 5000).has_value());
    FileList list;
    const ListLoadResult result = list.LoadDataFile(path);
    EXPECT_TRUE(result.ok);
    EXPECT_TRUE(result.errors.empty());
    ASSERT_EQ(list.Count(), 5000);
    EXPECT_EQ(list.At(4321), testing::SampleRecord(4321));
}

TEST(FileListEdit, NewFilesChosenTogetherStandInReverseBeforeTheSelectedEntry) {
    LocationFolders folders;
    folders.application = "/opt/quorvel";
    folders.data = "/data";
    folders.user = "Farm1";
    FileList list;
    list.Append(FullRecord(1, "kept"));
    int selected = 0;
    for (const char* path : {"/data/A.csv", "/opt/quorvel/B.csv", "/elsewhere/C.csv"}) {
        selected = AddNewFileRecord(list, folders, path, selected);
    }
    ASSERT_EQ(list.Count(), 4);
    EXPECT_TRUE(list.ListChanged);
    EXPECT_EQ(list.At(0).Name, "C.csv");
    EXPECT_EQ(list.At(0).UserLocationID, kLocationOther);
    EXPECT_EQ(list.At(0).Folder, "/elsewhere");
    EXPECT_EQ(list.At(1).FileName, "B.csv");
    EXPECT_EQ(list.At(1).AdminLocationID, kLocationApplication);
    EXPECT_EQ(list.At(2).UserLocationID, kLocationData);
    EXPECT_TRUE(list.At(2).Folder.isEmpty());
    EXPECT_EQ(list.At(3).Name, "kept");
    EXPECT_EQ(AddNewFileRecord(list, folders, "/data/D.csv", -1), 4);
}

} // namespace
} // namespace quorvel
