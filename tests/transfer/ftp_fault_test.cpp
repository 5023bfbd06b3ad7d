// The FTP session against a server that misbehaves on purpose (ftp_peer.py's
// faults). One fault per case, named by a sentence; each case states the
// commands the server received, the result, the last error and the local file
// afterwards.
#include "common/full_disk.h"
#include "common/recorders.h"
#include "common/temp_home.h"
#include "peer_process.h"
#include "transfer/ftp_session.h"

#include <QDir>
#include <QFile>
#include <QRandomGenerator>
#include <QRegularExpression>
#include <QTemporaryDir>

#include <gtest/gtest.h>

#include <chrono>

namespace quorvel {
namespace {

using namespace std::chrono_literals;
using testing::FtpPeer;
using testing::FullDisk;

enum class Op { Download, Upload, Size };

constexpr qsizetype kRemoteSize = 300'000;
const QByteArray kOldCopy = "old copy";

QByteArray RemoteBytes() {
    QByteArray bytes(kRemoteSize, Qt::Uninitialized);
    QRandomGenerator generator(11);
    for (char& byte : bytes)
        byte = static_cast<char>(generator.bounded(256));
    return bytes;
}

// The commands of a fresh connection and of each step of a download.
const QByteArray kWhole = RemoteBytes();

const char* const kLogin = "USER logger | PASS **** | PWD";
const char* const kFind = "MDTM site.dat | TYPE I | SIZE site.dat | REST 0";
const char* const kFailedFind = "MDTM site.dat | TYPE I | SIZE site.dat";
const char* const kStore = "EPSV | TYPE I | STOR site.dat";
const char* const kGet = "EPSV | SIZE site.dat | RETR site.dat";

struct FaultCase {
    const char* name;
    const char* faults;
    Op op;
    std::string commands; // " | " between commands
    bool ok;
    std::string error;     // exact, or a regular expression when it starts with "^"
    QByteArray localAfter; // downloads: the local file afterwards; empty: the old copy
};
// Test names show the case name, not the bytes of the case.
void PrintTo(const FaultCase& c, std::ostream* os) {
    *os << c.name;
}

std::string Join(std::initializer_list<const char*> parts) {
    std::string joined;
    for (const char* part : parts)
        joined += (joined.empty() ? "" : " | ") + std::string(part);
    return joined;
}

class FtpFaultFixture : public ::testing::Test {
protected:
    void SetUp() override {
        // Time-outs end after a short silence instead of ten seconds.
        ports.clock.SetWaits(WaitLengths{.replyGap = 300ms});
        ASSERT_TRUE(root.isValid());
        QFile file(root.filePath(QStringLiteral("site.dat")));
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(remote);
        file.close();
        local = home.Write(QStringLiteral("in/site.dat"), kOldCopy);
        session.SetDisplay(&view, &progress);
    }
    void StartPeer(const char* faults) {
        ASSERT_TRUE(peer.Start(root.path(), 0, faults));
        session.SetDetails(peer.Server(), QStringLiteral("logger"), QStringLiteral("secret"), true);
    }
    static QByteArray Read(const QString& path) {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<missing>");
    }
    bool Run(Op op) {
        std::int64_t size = 0;
        switch (op) {
        case Op::Download:
            return session.Download(QStringLiteral("site.dat"), local);
        case Op::Upload:
            return session.Upload(home.Write(QStringLiteral("up.dat"), remote),
                                  QStringLiteral("site.dat"));
        case Op::Size:
            return session.RemoteFileSize(QStringLiteral("site.dat"), size) && size == kRemoteSize;
        }
        return false;
    }
    std::string Commands(int expected) {
        return peer.Commands(expected).join(QStringLiteral(" | ")).toStdString();
    }
    static void ExpectError(const QString& actual, const std::string& expected) {
        const std::string text = actual.toStdString();
        if (!expected.empty() && expected.front() == '^') {
            EXPECT_TRUE(
                QRegularExpression(QString::fromStdString(expected)).match(actual).hasMatch())
                << text << "\n  does not match " << expected;
        } else {
            EXPECT_EQ(text, expected);
        }
    }

    testing::RecordingPorts ports;
    testing::TempHome home;
    QTemporaryDir root;
    FtpPeer peer;
    testing::RecordingTraceView view;
    testing::RecordingProgressView progress;
    FtpSession session;
    const QByteArray remote = RemoteBytes();
    QString local;
};

class FtpFaultTest : public FtpFaultFixture, public ::testing::WithParamInterface<FaultCase> {};

TEST_P(FtpFaultTest, Case) {
    const FaultCase& c = GetParam();
    StartPeer(c.faults);
    const bool ok = Run(c.op);
    EXPECT_EQ(ok, c.ok);
    const auto expected =
        static_cast<int>(std::count(c.commands.begin(), c.commands.end(), '|')) + 1;
    EXPECT_EQ(Commands(expected), c.commands);
    ExpectError(session.LastError(), c.error);
    if (c.op == Op::Download) {
        EXPECT_EQ(Read(local), c.localAfter.isEmpty() ? kOldCopy : c.localAfter);
    }
    if (c.op == Op::Upload && c.ok) {
        EXPECT_EQ(Read(root.filePath(QStringLiteral("site.dat"))), remote);
    }
    // Nothing but the local file is left in its folder.
    EXPECT_EQ(QDir(home.File(QStringLiteral("in"))).entryList(QDir::Files | QDir::Hidden),
              QStringList{QStringLiteral("site.dat")});
}

INSTANTIATE_TEST_SUITE_P(
    Faults, FtpFaultTest,
    ::testing::Values(
        FaultCase{"DataConnectionDroppedAfter1000BytesKeepsTheOldCopy",
                  R"j([{"at": "RETR", "cut_after": 1000}])j",
                  Op::Download,
                  Join({kLogin, kFind, kGet}),
                  false,
                  "^FtpGetFile Error\r\n.*299000 bytes remaining",
                  {}},
        FaultCase{"ServerCallingAShortTransferCompleteKeepsTheOldCopy",
                  R"j([{"at": "RETR", "cut_after": 1000, "then": "226"}])j",
                  Op::Download,
                  Join({kLogin, kFind, kGet}),
                  false,
                  "^FtpGetFile Error\r\n.*299000 bytes remaining",
                  {}},
        FaultCase{"ServerKilledMidTransferKeepsTheOldCopy",
                  R"j([{"at": "RETR", "cut_after": 65536, "then": "kill"}])j",
                  Op::Download,
                  Join({kLogin, kFind, kGet}),
                  false,
                  "^FtpGetFile Error\r\n.+",
                  {}},
        FaultCase{"DataStallingAfter64KilobytesEndsAfterTheReplyGap",
                  R"j([{"at": "RETR", "stall_after": 65536}])j",
                  Op::Download,
                  Join({kLogin, kFind, kGet}),
                  false,
                  "FtpGetFile Error\r\nTimeout was reached",
                  {}},
        FaultCase{"Reply425ToRetrKeepsTheOldCopy",
                  R"j([{"at": "RETR", "reply": "425 Can't open data connection."}])j",
                  Op::Download,
                  Join({kLogin, kFind, kGet}),
                  false,
                  "^FtpGetFile Error\r\n.*425",
                  {}},
        FaultCase{"Reply450ToRetrKeepsTheOldCopy",
                  R"j([{"at": "RETR", "reply": "450 File busy."}])j",
                  Op::Download,
                  Join({kLogin, kFind, kGet}),
                  false,
                  "^FtpGetFile Error\r\n.*450",
                  {}},
        FaultCase{"Reply451ToRetrKeepsTheOldCopy",
                  R"j([{"at": "RETR", "reply": "451 Local error in processing."}])j",
                  Op::Download,
                  Join({kLogin, kFind, kGet}),
                  false,
                  "^FtpGetFile Error\r\n.*451",
                  {}},
        FaultCase{
            "Reply550ToEverySizeMeansTheFileIsMissingAfterThreeFinds",
            R"j([{"at": "SIZE", "count": 0, "reply": "550 No such file."}])j",
            Op::Download,
            Join({kLogin, kFailedFind, "QUIT", kLogin, kFailedFind, "QUIT", kLogin, kFailedFind}),
            false,
            "Downloading, but site.dat does not exist",
            {}},
        FaultCase{"Reply421ToUserRefusesTheLogin",
                  R"j([{"at": "USER", "count": 0, "reply": "421 Service not available."}])j",
                  Op::Size,
                  "USER logger",
                  false,
                  "^Failed ftp access to 127\\.0\\.0\\.1:\\d+\r\n.+",
                  {}},
        FaultCase{"Reply421ToTheFirstSizeIsForgottenWhenTheRetrySucceeds",
                  R"j([{"at": "SIZE", "reply": "421 Closing."}])j", Op::Download,
                  Join({kLogin, kFailedFind, kLogin, kFind, kGet}), true, "", kWhole},
        FaultCase{"SizeQueryTimingOutOnceIsForgottenWhenTheRetrySucceeds",
                  R"j([{"at": "SIZE", "stall": true}])j",
                  Op::Size,
                  Join({kLogin, kFailedFind, kLogin, kFind}),
                  true,
                  "",
                  {}},
        FaultCase{"UploadRefusedOnceWith451SucceedsOnTheSecondTry",
                  R"j([{"at": "STOR", "reply": "451 Local error."}])j",
                  Op::Upload,
                  Join({kLogin, kStore, "QUIT", kLogin, kStore}),
                  true,
                  "",
                  {}},
        FaultCase{"BadExtendedPassiveReplyFallsBackToPassive",
                  R"j([{"at": "EPSV", "reply": "229 Entering extended passive mode (|||0|)"}])j",
                  Op::Download,
                  Join({kLogin, kFind, "EPSV | PASV | SIZE site.dat | RETR site.dat"}), true, "",
                  kWhole},
        FaultCase{
            "PassiveReplyNamingAnotherHostIsNotFollowed",
            R"j([{"at": "EPSV", "reply": "500 No EPSV."}, {"at": "PASV", "pasv_host": "127,0,0,2"}])j",
            Op::Download, Join({kLogin, kFind, "EPSV | PASV | SIZE site.dat | RETR site.dat"}),
            true, "", kWhole},
        FaultCase{
            "UnreadablePassiveReplyFailsWithTheReason",
            R"j([{"at": "EPSV", "reply": "500 No EPSV."}, {"at": "PASV", "reply": "227 Entering passive mode (here)"}])j",
            Op::Download,
            Join({kLogin, kFind, "EPSV | PASV"}),
            false,
            "^FtpGetFile Error\r\n.*227",
            {}},
        FaultCase{"FileShrinkingDuringTheDownloadKeepsTheOldCopy",
                  R"j([{"at": "RETR", "resize_after": 100000, "size": 150000}])j",
                  Op::Download,
                  Join({kLogin, kFind, kGet}),
                  false,
                  "^FtpGetFile Error\r\n.*bytes remaining",
                  {}},
        FaultCase{"FileGrowingDuringTheDownloadGivesTheSizeAnnounced",
                  R"j([{"at": "RETR", "resize_after": 100000, "size": 400000}])j", Op::Download,
                  Join({kLogin, kFind, kGet}), true, "", kWhole}),
    [](const auto& info) { return std::string(info.param.name); });

using FtpIdleTest = FtpFaultFixture;

TEST_F(FtpIdleTest, ControlConnectionClosedWhileIdleIsReplacedByANewLogin) {
    StartPeer(R"j([{"idle_close": 0.2}])j");
    ASSERT_TRUE(session.Download(QStringLiteral("site.dat"), local))
        << session.LastError().toStdString();
    ASSERT_EQ(peer.CountInLog(QStringLiteral("Control connection timed out"), 1), 1);
    home.Write(QStringLiteral("in/site.dat"), kOldCopy);
    EXPECT_TRUE(session.Download(QStringLiteral("site.dat"), local))
        << session.LastError().toStdString();
    EXPECT_EQ(session.LastError(), QString());
    EXPECT_EQ(Read(local), remote);
    EXPECT_EQ(peer.Logins(2), 2);
}

struct FullDiskDownload {
    const char* name;
    qsizetype size;
    qint64 room;
};
// Test names show the case name, not the bytes of the case.
void PrintTo(const FullDiskDownload& c, std::ostream* os) {
    *os << c.name;
}

class FtpFullDiskTest : public FtpFaultFixture,
                        public ::testing::WithParamInterface<FullDiskDownload> {};

TEST_P(FtpFullDiskTest, DownloadFailsKeepsTheOldCopyAndNamesTheFile) {
    const FullDiskDownload& c = GetParam();
    QFile served(root.filePath(QStringLiteral("full.dat")));
    ASSERT_TRUE(served.open(QIODevice::WriteOnly));
    served.write(QByteArray(c.size, 'd'));
    served.close();
    FullDisk disk;
    const QString target = disk.Write(QStringLiteral("full.dat"), kOldCopy);
    disk.Fill(c.room);
    StartPeer("[]");
    const auto outcome = disk.Run([&] {
        const bool ok = session.Download(QStringLiteral("full.dat"), target);
        return FullDisk::Outcome{ok, session.LastError()};
    });
    EXPECT_FALSE(outcome.ok);
    EXPECT_EQ(
        outcome.text.toStdString(),
        ("FtpGetFile Error\r\nCould not write " + target + ": " + disk.Reason()).toStdString());
    EXPECT_EQ(disk.Read(QStringLiteral("full.dat")), kOldCopy);
    EXPECT_EQ(disk.Files(), QStringList{QStringLiteral("full.dat")});
}

INSTANTIATE_TEST_SUITE_P(Cases, FtpFullDiskTest,
                         ::testing::Values(FullDiskDownload{"TenKilobytesNoRoom", 10 * 1024, 0},
                                           FullDiskDownload{"TwoMegabytesPartialRoom", 2 << 20,
                                                            64 * 1024}),
                         [](const auto& info) { return std::string(info.param.name); });

} // namespace
} // namespace quorvel
