// The one replacing write: a full disk, a size limit or a closed folder never
// leaves a shortened file behind, and the reason names the file.
#include "support/replacing_file.h"

#include "common/full_disk.h"
#include "common/temp_home.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <gtest/gtest.h>

using namespace quorvel;
using quorvel::testing::FullDisk;
using quorvel::testing::TempHome;

namespace {

const QByteArray kOld = "[General]\r\nUserID=ann\r\n";

FullDisk::Outcome Replace(const QString& path, const QByteArray& bytes) {
    const auto error = ReplaceFileContents(path, bytes);
    return {!error, error.value_or(QString())};
}

// Writes in pieces as a download does.
FullDisk::Outcome ReplaceInPieces(const QString& path, const QByteArray& bytes, int piece) {
    ReplacingFile file(path);
    bool ok = file.Open();
    for (qsizetype at = 0; ok && at < bytes.size(); at += piece)
        ok = file.Write(
            QByteArrayView(bytes).sliced(at, std::min<qsizetype>(piece, bytes.size() - at)));
    ok = ok && file.Commit();
    return {ok, file.ErrorText()};
}

struct FullDiskCase {
    const char* name;
    qint64 room;
    qsizetype size;
    int piece; // 0: in one piece
};
// Test names show the case name, not the bytes of the case.
void PrintTo(const FullDiskCase& c, std::ostream* os) {
    *os << c.name;
}

class ReplacingFileOnFullDisk : public ::testing::TestWithParam<FullDiskCase> {};

TEST_P(ReplacingFileOnFullDisk, FailsKeepsTheOldFileAndSaysWhy) {
    const FullDiskCase& c = GetParam();
    FullDisk disk;
    ASSERT_TRUE(disk.Valid());
    const QString path = disk.Write(QStringLiteral("settings.ini"), kOld);
    disk.Fill(c.room);
    const QByteArray bytes(c.size, 'n');
    const auto outcome = disk.Run([&] {
        return c.piece == 0 ? Replace(path, bytes) : ReplaceInPieces(path, bytes, c.piece);
    });
    EXPECT_FALSE(outcome.ok);
    EXPECT_EQ(outcome.text,
              QStringLiteral("Could not write ") + path + QStringLiteral(": ") + disk.Reason());
    EXPECT_EQ(disk.Read(QStringLiteral("settings.ini")), kOld);
    EXPECT_EQ(disk.Files(), QStringList{QStringLiteral("settings.ini")});
}

INSTANTIATE_TEST_SUITE_P(
    Cases, ReplacingFileOnFullDisk,
    ::testing::Values(FullDiskCase{"SmallFileNoRoom", 0, 299, 0},
                      FullDiskCase{"TenKilobytesNoRoom", 0, 10 * 1024, 0},
                      FullDiskCase{"LargeFilePartialRoom", 8 * 1024, 200 * 1024, 0},
                      FullDiskCase{"InPiecesPartialRoom", 8 * 1024, 200 * 1024, 3000}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(ReplacingFile, ReplacesKeepsPermissionsAndSetsThoseOfANewFile) {
    TempHome home;
    const QString path = home.Write(QStringLiteral("list.txt"), kOld);
    const auto ownerOnly =
        QFile::ReadOwner | QFile::WriteOwner | QFile::ReadUser | QFile::WriteUser;
    QFile::setPermissions(path, ownerOnly);
    EXPECT_EQ(ReplaceFileContents(path, "new content"), std::nullopt);
    EXPECT_EQ(home.Read(QStringLiteral("list.txt")), QByteArray("new content"));
    EXPECT_EQ(QFile::permissions(path), ownerOnly);

    const QString fresh = home.File(QStringLiteral("fresh.ini"));
    EXPECT_EQ(ReplaceFileContents(fresh, "", QFile::ReadOwner | QFile::WriteOwner), std::nullopt);
    EXPECT_TRUE(QFileInfo(fresh).isFile());
    EXPECT_EQ(QFile::permissions(fresh) & (QFile::ReadGroup | QFile::ReadOther),
              QFile::Permissions());
}

TEST(ReplacingFile, UnfinishedWriteLeavesTheOldFileAndNoTemporaryFile) {
    TempHome home;
    const QString path = home.Write(QStringLiteral("list.txt"), kOld);
    {
        ReplacingFile file(path);
        ASSERT_TRUE(file.Open());
        ASSERT_TRUE(file.Write("half of it"));
    }
    ReplacingFile cancelled(path);
    ASSERT_TRUE(cancelled.Open());
    ASSERT_TRUE(cancelled.Write("half of it"));
    cancelled.Cancel();
    EXPECT_FALSE(cancelled.Commit());
    EXPECT_EQ(home.Read(QStringLiteral("list.txt")), kOld);
    EXPECT_EQ(QDir(home.Path()).entryList(QDir::Files | QDir::Hidden),
              QStringList{QStringLiteral("list.txt")});
}

TEST(ReplacingFile, MissingFolderIsNamedInTheError) {
    TempHome home;
    const QString path = home.File(QStringLiteral("no/such/folder/s.ini"));
    const auto error = ReplaceFileContents(path, "x");
    ASSERT_TRUE(error.has_value());
    EXPECT_TRUE(error->startsWith(QStringLiteral("Could not write ") + path + QStringLiteral(": ")))
        << error->toStdString();
    EXPECT_GT(error->size(), QStringLiteral("Could not write : ").size() + path.size());
}

} // namespace
