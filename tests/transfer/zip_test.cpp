// Zip packaging: names, codes, and archives written and read on disk.
#include "common/full_disk.h"
#include "common/recorders.h"
#include "transfer/zip_archive.h"
#include "transfer/zip_codes.h"
#include "transfer/zip_entry_path.h"
#include "transfer/zip_steps.h"

#include <zip.h>

#include <QDir>
#include <QFile>
#include <QProcess>
#include <QRegularExpression>
#include <QStorageInfo>
#include <QTemporaryDir>
#include <QtEndian>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

class ZipTest : public ::testing::Test {
protected:
    QString Write(const QString& name, const QByteArray& bytes) {
        const QString path = dir.filePath(name);
        QDir().mkpath(QFileInfo(path).path());
        QFile file(path);
        EXPECT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(bytes);
        return path;
    }
    static QByteArray Read(const QString& path) {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<missing>");
    }
    // An archive holding the given entries, made without our packer.
    QString MakeArchive(const QString& name, const QList<QPair<QByteArray, QByteArray>>& entries) {
        const QString path = dir.filePath(name);
        zip_t* archive =
            zip_open(QFile::encodeName(path).constData(), ZIP_CREATE | ZIP_TRUNCATE, nullptr);
        for (const auto& [entry, body] : entries) {
            zip_source_t* source = zip_source_buffer(archive, body.constData(), body.size(), 0);
            zip_file_add(archive, entry.constData(), source, 0);
        }
        EXPECT_EQ(zip_close(archive), 0);
        return path;
    }
    QTemporaryDir dir;
    testing::RecordingProgressView progress;
};

QByteArray LoggerText(int lines) {
    QByteArray text;
    for (int i = 0; i < lines; ++i)
        text += "2024-11-01 10:" + QByteArray::number(i % 60) + ":00,12.5," +
                QByteArray::number(i) + "\r\n";
    return text;
}

TEST(ZipNames, FollowTheDescribedExamples) {
    EXPECT_EQ(ZipFileName(QStringLiteral("data.csv")), QStringLiteral("data_csv.zip"));
    EXPECT_EQ(ZipFileName(QStringLiteral("*.dat")), QStringLiteral("AllFiles_dat.zip"));
    EXPECT_EQ(ZipFileName(QStringLiteral("*.*")), QStringLiteral("AllFiles_AllFiles.zip"));
    // Only the file name's dots: a dotted folder is where the zip must go.
    EXPECT_EQ(ZipFileName(QStringLiteral("C:\\Logger.Data\\site1.dat")),
              QStringLiteral("C:\\Logger.Data\\site1_dat.zip"));
    EXPECT_EQ(ZipFileName(QStringLiteral("/home/first.last/site1.dat")),
              QStringLiteral("/home/first.last/site1_dat.zip"));
    EXPECT_EQ(ZipFileName(QStringLiteral("/data.d/*.*")),
              QStringLiteral("/data.d/AllFiles_AllFiles.zip"));
    EXPECT_EQ(ZipErrorText(999, QStringLiteral("Zip")), QStringLiteral("Zip:Error 999 occured"));
    EXPECT_EQ(ZipErrorText(150, QStringLiteral("UnZip")),
              QStringLiteral("UnZip:Full disk was inserted instead of an empty one"));
    EXPECT_EQ(ZipErrorText(110, QStringLiteral("UnZip")),
              QStringLiteral("UnZip:ZIP file is corrupted - try using the Fix option"));
    for (int code : {0, 10, 99, 140})
        EXPECT_FALSE(IsZipError(code)) << code;
    for (int code : {100, 139, 141, 510})
        EXPECT_TRUE(IsZipError(code)) << code;
}

TEST_F(ZipTest, FileTravelsThroughAnArchiveUnchanged) {
    const QByteArray data = LoggerText(20000);
    const QString local = Write(QStringLiteral("site1.dat"), data);
    const ZipStepResult zipped = ZipForUpload(local, &progress);
    EXPECT_EQ(zipped.code, kZipOk);
    EXPECT_EQ(zipped.zipFile, dir.filePath(QStringLiteral("site1_dat.zip")));
    EXPECT_EQ(progress.total, -1);
    EXPECT_EQ(progress.style, 0);
    ASSERT_FALSE(progress.steps.empty());
    EXPECT_EQ(progress.steps.back().value, 100);
    EXPECT_EQ(progress.steps.back().text, QStringLiteral("Zip: site1.dat"));
    EXPECT_EQ(progress.finished, 1);

    Write(QStringLiteral("site1.dat"), "stale local copy");
    EXPECT_EQ(UnzipAfterDownload(zipped.zipFile, &progress), kZipOk);
    EXPECT_EQ(Read(local), data);
    EXPECT_EQ(progress.steps.back().value, 100);
}

TEST_F(ZipTest, PatternPacksEveryMatchingFileButTheArchive) {
    Write(QStringLiteral("a.dat"), "alpha");
    Write(QStringLiteral("b.dat"), "beta");
    Write(QStringLiteral("c.txt"), "gamma");
    const QString pattern = dir.filePath(QStringLiteral("*.*"));
    Write(QStringLiteral("AllFiles_AllFiles.zip"), "older archive");
    EXPECT_EQ(ZipForUpload(pattern, nullptr).code, kZipOk);
    EXPECT_EQ(
        ZipFiles({dir.filePath(QStringLiteral("*.dat"))}, dir.filePath(QStringLiteral("dat.zip"))),
        kZipOk);

    EXPECT_EQ(UnzipFile(dir.filePath(QStringLiteral("AllFiles_AllFiles.zip")),
                        dir.filePath(QStringLiteral("all"))),
              kZipOk);
    EXPECT_EQ(
        QDir(dir.filePath(QStringLiteral("all"))).entryList(QDir::Files),
        (QStringList{QStringLiteral("a.dat"), QStringLiteral("b.dat"), QStringLiteral("c.txt")}));
    EXPECT_EQ(
        UnzipFile(dir.filePath(QStringLiteral("dat.zip")), dir.filePath(QStringLiteral("dat"))),
        kZipOk);
    EXPECT_EQ(QDir(dir.filePath(QStringLiteral("dat"))).entryList(QDir::Files),
              (QStringList{QStringLiteral("a.dat"), QStringLiteral("b.dat")}));
    EXPECT_EQ(Read(dir.filePath(QStringLiteral("dat/b.dat"))), QByteArray("beta"));
    EXPECT_EQ(
        ZipFiles({dir.filePath(QStringLiteral("*.none"))}, dir.filePath(QStringLiteral("n.zip"))),
        kZipNothingToDo);
}

TEST_F(ZipTest, MissingCorruptOrDamagedArchivesGiveErrorCodesAndLeaveTheOlderCopy) {
    EXPECT_EQ(UnzipFile(dir.filePath(QStringLiteral("none.zip")), dir.path()), kZipNotFound);
    const QString junk = Write(QStringLiteral("junk.zip"), QByteArray(4096, 'x'));
    EXPECT_EQ(UnzipFile(junk, dir.path()), kZipCorrupt);
    EXPECT_TRUE(IsZipError(kZipCorrupt));
    const QString old = Write(QStringLiteral("out/site.dat"), "older copy");
    const QString archive = dir.filePath(QStringLiteral("site_dat.zip"));
    ASSERT_EQ(ZipFiles({Write(QStringLiteral("site.dat"), LoggerText(5000))}, archive), kZipOk);
    QByteArray bytes = Read(archive);
    bytes[bytes.size() / 2] = static_cast<char>(bytes[bytes.size() / 2] ^ 0x55);
    Write(QStringLiteral("site_dat.zip"), bytes);

    const int code = UnzipFile(archive, dir.filePath(QStringLiteral("out")));
    EXPECT_TRUE(IsZipError(code)) << code;
    EXPECT_EQ(Read(old), QByteArray("older copy"));
    EXPECT_EQ(QDir(dir.filePath(QStringLiteral("out"))).entryList(QDir::Files | QDir::Hidden),
              QStringList{QStringLiteral("site.dat")});
}

TEST_F(ZipTest, EntryLeavingTheFolderRefusesTheArchive) {
    const QString archive =
        MakeArchive(QStringLiteral("evil.zip"), {{"good.dat", "good"}, {"../evil", "evil"}});
    const QString target = dir.filePath(QStringLiteral("inside"));
    EXPECT_EQ(UnzipFile(archive, target), kZipUnsafeEntry);
    EXPECT_TRUE(IsZipError(kZipUnsafeEntry));
    EXPECT_FALSE(QFile::exists(dir.filePath(QStringLiteral("evil"))));
    EXPECT_FALSE(QFile::exists(target + QStringLiteral("/good.dat")));

    EXPECT_TRUE(SafeEntryPath(target, QStringLiteral("/etc/passwd")).isEmpty());
    EXPECT_TRUE(SafeEntryPath(target, QStringLiteral("a\\..\\..\\x")).isEmpty());
    EXPECT_TRUE(SafeEntryPath(target, QStringLiteral("C:\\x")).isEmpty());
    EXPECT_EQ(SafeEntryPath(target, QStringLiteral("sub\\./x.dat")),
              target + QStringLiteral("/sub/x.dat"));
}

TEST_F(ZipTest, ArchivesThatInfoZipAcceptsAreExtractedFoldersAndAll) {
    const QByteArray data = LoggerText(3000);
    Write(QStringLiteral("src/site.dat"), data);
    // Written to a pipe: sizes and checksums follow each entry's data.
    QProcess zip;
    zip.setWorkingDirectory(dir.filePath(QStringLiteral("src")));
    zip.start(QStringLiteral("sh"),
              {QStringLiteral("-c"), QStringLiteral("zip -q - site.dat | cat > ../piped.zip")});
    ASSERT_TRUE(zip.waitForFinished(30000) && zip.exitCode() == 0);
    EXPECT_EQ(
        UnzipFile(dir.filePath(QStringLiteral("piped.zip")), dir.filePath(QStringLiteral("p"))),
        kZipOk);
    EXPECT_EQ(Read(dir.filePath(QStringLiteral("p/site.dat"))), data);

    // "./" names the target folder itself.
    const QString dotted =
        MakeArchive(QStringLiteral("dotted.zip"), {{"./", ""}, {"./site.dat", "d"}});
    EXPECT_EQ(UnzipFile(dotted, dir.filePath(QStringLiteral("d"))), kZipOk);
    EXPECT_EQ(Read(dir.filePath(QStringLiteral("d/site.dat"))), QByteArray("d"));
    EXPECT_EQ(SafeEntryPath(dir.filePath(QStringLiteral("d")), QStringLiteral("./")),
              dir.filePath(QStringLiteral("d")) + QStringLiteral("/"));
    // Entries in folders land below the target.
    const QString tree =
        MakeArchive(QStringLiteral("tree.zip"), {{"sub/", ""}, {"sub/x.dat", "x"}});
    EXPECT_EQ(UnzipFile(tree, dir.filePath(QStringLiteral("t"))), kZipOk);
    EXPECT_EQ(Read(dir.filePath(QStringLiteral("t/sub/x.dat"))), QByteArray("x"));
}

// Sets the uncompressed size of the archive's last entry in both headers.
void ClaimSize(QByteArray& archive, quint32 size) {
    const qsizetype local = archive.lastIndexOf("PK\x03\x04");
    const qsizetype central = archive.lastIndexOf("PK\x01\x02");
    ASSERT_TRUE(local >= 0 && central > local);
    qToLittleEndian<quint32>(size, archive.data() + local + 22);
    qToLittleEndian<quint32>(size, archive.data() + central + 24);
}

TEST_F(ZipTest, EntryLongerThanItsHeaderSaysIsRefusedAtThatSize) {
    const QString old = Write(QStringLiteral("out/bomb.dat"), "older copy");
    QByteArray bytes =
        Read(MakeArchive(QStringLiteral("bomb.zip"), {{"bomb.dat", QByteArray(10 << 20, '\0')}}));
    ClaimSize(bytes, 1000);
    const QString archive = Write(QStringLiteral("bomb.zip"), bytes);
    EXPECT_EQ(UnzipFile(archive, dir.filePath(QStringLiteral("out"))), kZipCorruptEntry);
    EXPECT_EQ(Read(old), QByteArray("older copy"));
    EXPECT_EQ(QDir(dir.filePath(QStringLiteral("out"))).entryList(QDir::Files | QDir::Hidden),
              QStringList{QStringLiteral("bomb.dat")});
}

TEST_F(ZipTest, ArchiveLargerThanTheFreeSpaceIsRefusedBeforeAnythingIsWritten) {
    QByteArray bytes = Read(
        MakeArchive(QStringLiteral("huge.zip"), {{"a.dat", "a"}, {"huge.dat", LoggerText(10)}}));
    ClaimSize(bytes, 0xFFFFFFF0u); // close to 4 GiB; the first entry is honest
    const QString archive = Write(QStringLiteral("huge.zip"), bytes);

    testing::FullDisk disk(8 << 20);
    const QString old = disk.Write(QStringLiteral("a.dat"), "older a");
    const auto outcome = disk.Run([&] {
        const int code = UnzipFile(archive, disk.Path());
        return testing::FullDisk::Outcome{code == kZipNoRoom, QString::number(code)};
    });
    if (disk.Mounted() || QStorageInfo(disk.Path()).bytesAvailable() < 0xFFFFFFF0ll) {
        EXPECT_TRUE(outcome.ok) << outcome.text.toStdString();
        EXPECT_EQ(disk.Read(QStringLiteral("a.dat")), QByteArray("older a"));
        EXPECT_EQ(disk.Files(), QStringList{QStringLiteral("a.dat")});
    }
    EXPECT_EQ(ZipErrorText(kZipNoRoom, QStringLiteral("UnZip")),
              QStringLiteral(
                  "UnZip:Not enough free space for the files of the ZIP file - nothing extracted"));
}

TEST_F(ZipTest, FullDiskLeavesEveryOlderCopyWhole) {
    const QString archive = dir.filePath(QStringLiteral("site.zip"));
    ASSERT_EQ(ZipFiles({Write(QStringLiteral("site.dat"), LoggerText(300))}, archive), kZipOk);
    testing::FullDisk disk;
    disk.Write(QStringLiteral("site.dat"), "older copy");
    disk.Fill();
    const auto outcome = disk.Run([&] {
        const int code = UnzipFile(archive, disk.Path());
        return testing::FullDisk::Outcome{IsZipError(code), QString::number(code)};
    });
    EXPECT_TRUE(outcome.ok) << outcome.text.toStdString();
    EXPECT_EQ(disk.Read(QStringLiteral("site.dat")), QByteArray("older copy"));
    EXPECT_EQ(disk.Files(), QStringList{QStringLiteral("site.dat")});
}

TEST_F(ZipTest, PackingOntoAFullDiskKeepsTheOlderArchive) {
    testing::FullDisk disk;
    const QString data = disk.Write(QStringLiteral("site.dat"), LoggerText(2000));
    const QString older = disk.Write(QStringLiteral("site_dat.zip"), "older archive");
    disk.Fill(4096);
    const auto outcome = disk.Run([&] {
        const int code = ZipFiles({data}, older);
        return testing::FullDisk::Outcome{IsZipError(code), QString::number(code)};
    });
    EXPECT_TRUE(outcome.ok) << outcome.text.toStdString();
    EXPECT_EQ(disk.Read(QStringLiteral("site_dat.zip")), QByteArray("older archive"));
    EXPECT_EQ(disk.Files(),
              (QStringList{QStringLiteral("site.dat"), QStringLiteral("site_dat.zip")}));
}

TEST_F(ZipTest, FullDiskMidwayKeepsTheFileItMetWhole) {
    // The free space covers the sizes the entries declare but not the disk
    // blocks they take, so the disk fills part-way through the archive.
    QList<QPair<QByteArray, QByteArray>> entries;
    for (int i = 0; i < 60; ++i)
        entries.append(
            {"f" + QByteArray::number(100 + i) + ".dat", QByteArray(4097, 'a' + i % 26)});
    const QString archive = MakeArchive(QStringLiteral("many.zip"), entries);
    testing::FullDisk disk;
    for (int i = 50; i < 60; ++i)
        disk.Write(QStringLiteral("f%1.dat").arg(100 + i), "old");
    disk.Fill(disk.Mounted() ? 300 * 1024 : 100);
    const auto outcome = disk.Run([&] {
        const int code = UnzipFile(archive, disk.Path());
        return testing::FullDisk::Outcome{code == kZipWriteProblem, QString::number(code)};
    });
    EXPECT_TRUE(outcome.ok) << outcome.text.toStdString();
    const QStringList files = disk.Files();
    EXPECT_EQ(files.filter(QRegularExpression(QStringLiteral("^f1[0-5][0-9]\\.dat$"))), files);
    for (int i = 0; i < 60; ++i) {
        const QString name = QStringLiteral("f%1.dat").arg(100 + i);
        if (!files.contains(name)) continue;
        const QByteArray now = disk.Read(name);
        EXPECT_TRUE(now == entries[i].second || (i >= 50 && now == "old")) << i;
    }
    EXPECT_EQ(disk.Read(QStringLiteral("f159.dat")), QByteArray("old"));
}

} // namespace
} // namespace quorvel
