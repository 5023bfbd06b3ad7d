// The FTP session against a real FTP server on a loopback port.
#include "common/recorders.h"
#include "common/temp_home.h"
#include "peer_process.h"
#include "support/program_home.h"
#include "transfer/ftp_session.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QRandomGenerator>
#include <QTemporaryDir>
#include <QTimer>

#include <gtest/gtest.h>

#include <functional>

namespace quorvel {
namespace {

using testing::FtpPeer;

QByteArray RandomBytes(qsizetype size) {
    QByteArray bytes(size, Qt::Uninitialized);
    QRandomGenerator generator(7);
    for (char& byte : bytes)
        byte = static_cast<char>(generator.bounded(256));
    return bytes + "\r\n\n\r\0end";
}

int Lines(const QStringList& lines, const QString& text) {
    return static_cast<int>(lines.filter(text).size());
}

// A progress view that can act in the middle of a transfer.
class ActingProgressView : public testing::RecordingProgressView {
public:
    void Show(std::int64_t value, const QString& text) override {
        RecordingProgressView::Show(value, text);
        if (value > 0 && onData) {
            auto act = std::move(onData);
            onData = nullptr;
            act();
        }
    }
    std::function<void()> onData;
};

class FtpSessionTest : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(root.isValid());
        ASSERT_TRUE(peer.Start(root.path()));
        session.SetDisplay(&view, &progress);
        session.SetDetails(peer.Server(), QStringLiteral("logger"), QStringLiteral("secret"), true);
    }
    QString OnServer(const QString& name) const { return root.filePath(name); }
    void Serve(const QString& name, const QByteArray& bytes) {
        QFile file(OnServer(name));
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(bytes);
    }
    static QByteArray Read(const QString& path) {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<missing>");
    }

    testing::TempHome home;
    testing::RecordingPorts ports;
    QTemporaryDir root;
    FtpPeer peer;
    testing::RecordingTraceView view;
    ActingProgressView progress;
    FtpSession session;
};

TEST_F(FtpSessionTest, UploadAndDownloadKeepEveryByteOverOneConnection) {
    const QByteArray data = RandomBytes(3 << 20);
    const QString local = home.Write(QStringLiteral("data/site1.dat"), data);
    ASSERT_TRUE(session.Upload(local, QStringLiteral("site1.dat")))
        << session.LastError().toStdString();
    EXPECT_EQ(Read(OnServer(QStringLiteral("site1.dat"))), data);
    EXPECT_EQ(progress.total, data.size());

    const QString back = home.Write(QStringLiteral("data/back.dat"), "older copy");
    const auto ownerOnly =
        QFile::ReadOwner | QFile::WriteOwner | QFile::ReadUser | QFile::WriteUser;
    QFile::setPermissions(back, ownerOnly);
    ASSERT_TRUE(session.Download(QStringLiteral("site1.dat"), back))
        << session.LastError().toStdString();
    EXPECT_EQ(Read(back), data);
    EXPECT_EQ(QFile::permissions(back), ownerOnly);
    EXPECT_EQ(progress.total, data.size());
    EXPECT_EQ(progress.style, 3);
    EXPECT_EQ(progress.units, QStringLiteral("bytes"));
    ASSERT_FALSE(progress.steps.empty());
    EXPECT_EQ(progress.steps.back().value, data.size());
    EXPECT_EQ(progress.steps.back().text, QStringLiteral("site1.dat"));
    EXPECT_EQ(progress.finished, 2);
    EXPECT_EQ(peer.Logins(1), 1);
    EXPECT_TRUE(view.statuses.contains(QStringLiteral("Download complete")));

    const QStringList log =
        QString::fromUtf8(Read(ProgramHome::FtpLogFile())).split(QStringLiteral("\r\n"));
    ASSERT_GE(log.size(), 2);
    EXPECT_TRUE(log[0].endsWith(QStringLiteral(":") + local + QStringLiteral("=>site1.dat")));
    EXPECT_TRUE(log[1].endsWith(QStringLiteral(":site1.dat=>") + back));
}

TEST_F(FtpSessionTest, MissingRemoteFileCostsThreeFindsAndKeepsTheLocalCopy) {
    const QString local = home.Write(QStringLiteral("site2.dat"), "old copy");
    EXPECT_FALSE(session.Download(QStringLiteral("nothere.dat"), local));
    EXPECT_EQ(session.LastError(), QStringLiteral("Downloading, but nothere.dat does not exist"));
    EXPECT_EQ(Lines(view.traces, QStringLiteral(":File exists: nothere.dat ")), 3);
    EXPECT_EQ(Lines(view.traces,
                    QStringLiteral("FtpFindFirstFile error - ftpClose and try again Try: 1 ")),
              1);
    EXPECT_EQ(Lines(view.traces,
                    QStringLiteral("FtpFindFirstFile error - ftpClose and try again Try: 2 ")),
              1);
    EXPECT_EQ(peer.Logins(3), 3);
    EXPECT_EQ(Read(local), QByteArray("old copy"));
    EXPECT_EQ(progress.initialised, 0);
}

TEST_F(FtpSessionTest, UploadOfMissingLocalFileOpensNoConnection) {
    const QString local = home.File(QStringLiteral("gone.dat"));
    EXPECT_FALSE(session.Upload(local, QStringLiteral("gone.dat")));
    EXPECT_EQ(session.LastError(), QStringLiteral("Uploading: ") + local +
                                       QStringLiteral("=>gone.dat - but file does not exist"));
    EXPECT_FALSE(session.IsOpen());
    EXPECT_TRUE(view.statuses.filter(QStringLiteral("Connecting")).isEmpty());
}

TEST_F(FtpSessionTest, WrongPasswordIsReportedAsFailedAccess) {
    ASSERT_TRUE(session.Open()); // changed details drop this connection
    session.SetDetails(peer.Server(), QStringLiteral("logger"), QStringLiteral("wrong"), true);
    const QString local = home.Write(QStringLiteral("site3.dat"), "old copy");
    EXPECT_FALSE(session.Download(QStringLiteral("site3.dat"), local));
    EXPECT_TRUE(session.LastError().startsWith(QStringLiteral("Failed ftp access to ") +
                                               peer.Server() + QStringLiteral("\r\n")))
        << session.LastError().toStdString();
    EXPECT_EQ(peer.CountInLog(QStringLiteral("failed login"), 1), 1);
    EXPECT_EQ(Read(local), QByteArray("old copy"));
    // The password reaches neither the trace nor the status line.
    EXPECT_TRUE(view.traces.filter(QStringLiteral("wrong")).isEmpty());
}

TEST_F(FtpSessionTest, UploadThatKeepsFailingIsTriedThreeTimesOnFreshConnections) {
    const QString local = home.Write(QStringLiteral("site4.dat"), "data");
    EXPECT_FALSE(session.Upload(local, QStringLiteral("nofolder/site4.dat")));
    EXPECT_TRUE(session.LastError().startsWith(QStringLiteral("FtpPutFile failed: ") + local +
                                               QStringLiteral("=>nofolder/site4.dat")));
    EXPECT_EQ(
        Lines(view.traces, QStringLiteral("ftpPutFile error - call ftpClose and try again Try: ")),
        2);
    EXPECT_EQ(peer.Logins(3), 3);
    EXPECT_EQ(progress.initialised, 3);
    EXPECT_EQ(progress.finished, 1);
}

TEST_F(FtpSessionTest, FileGrowingDuringUploadIsSentAsItWasAtTheStart) {
    const QByteArray data = RandomBytes(4 << 20);
    const QString local = home.Write(QStringLiteral("grow.dat"), data);
    progress.onData = [&] {
        QFile file(local);
        if (file.open(QIODevice::Append))
            file.write(QByteArray(1 << 20, 'n')); // the logger appends meanwhile
    };
    EXPECT_TRUE(session.Upload(local, QStringLiteral("grow.dat")))
        << session.LastError().toStdString();
    EXPECT_EQ(Read(OnServer(QStringLiteral("grow.dat"))), data);
    EXPECT_EQ(progress.initialised, 1);
}

TEST_F(FtpSessionTest, RemoteFileBeyondFourGigabytesHasItsTrueSize) {
    const std::int64_t size = (std::int64_t{5} << 30) + 3;
    QFile sparse(OnServer(QStringLiteral("huge.dat")));
    ASSERT_TRUE(sparse.open(QIODevice::WriteOnly));
    ASSERT_TRUE(sparse.resize(size));
    sparse.close();
    std::int64_t remoteSize = 0;
    EXPECT_TRUE(session.RemoteFileSize(QStringLiteral("huge.dat"), remoteSize));
    EXPECT_EQ(remoteSize, size);
    EXPECT_FALSE(session.RemoteFileSize(QStringLiteral("absent.dat"), remoteSize));
    EXPECT_EQ(remoteSize, 0);
}

TEST_F(FtpSessionTest, OpenConnectionIsReusedAndTracesNameIt) {
    testing::ManualClock clock(QDateTime(QDate(2024, 3, 9), QTime(14, 5, 6)));
    ScopedPorts scope(Ports{&ports.prompter, &clock, &ports.busy});
    ASSERT_TRUE(session.Open());
    EXPECT_TRUE(view.statuses.contains(QStringLiteral("Connected to ") + peer.Server()));
    const auto traces = view.traces.size();
    const auto statuses = view.statuses.size();
    EXPECT_TRUE(session.Open());
    EXPECT_EQ(view.traces.size(), traces);
    EXPECT_EQ(view.statuses.size(), statuses);
    EXPECT_TRUE(view.traces.back().startsWith(QStringLiteral("TraceFTP:14:05:06:")));
    EXPECT_TRUE(
        view.traces.back().endsWith(QStringLiteral(" Callback=1 ftpConnection=1 Internet=1")));
    EXPECT_EQ(ports.busy.depth, 0);

    session.Close();
    EXPECT_FALSE(session.IsOpen());
    EXPECT_TRUE(view.traces.back().contains(
        QStringLiteral(":close internet Callback=0 ftpConnection=0 Internet=1")));
}

TEST_F(FtpSessionTest, WindowEventsRunDuringTransferAndMayCloseIt) {
    Serve(QStringLiteral("mid.dat"), RandomBytes(32 << 20));
    const QString local = home.Write(QStringLiteral("mid.dat"), "old copy");
    bool ranDuringTransfer = false;
    bool nestedRefused = false;
    progress.onData = [&] {
        QTimer::singleShot(0, [&] {
            ranDuringTransfer = session.State() == TransferState::Download;
            nestedRefused = !session.RemoteFileExists(QStringLiteral("mid.dat"));
            session.Close(); // the window closing
        });
    };
    EXPECT_FALSE(session.Download(QStringLiteral("mid.dat"), local));
    EXPECT_TRUE(ranDuringTransfer);
    EXPECT_TRUE(nestedRefused);
    EXPECT_FALSE(session.IsOpen());
    EXPECT_EQ(Read(local), QByteArray("old copy"));
    EXPECT_TRUE(session.Download(QStringLiteral("mid.dat"), local));
    EXPECT_TRUE(session.LastError().isEmpty());
}

TEST_F(FtpSessionTest, UnwritableTransferLogIsReportedAndTransferStillCounts) {
    QDir().mkpath(ProgramHome::FtpLogFile()); // a folder where the log should be
    const QString local = home.Write(QStringLiteral("site5.dat"), "five");
    EXPECT_TRUE(session.Upload(local, QStringLiteral("site5.dat")));
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_TRUE(ports.prompter.shown[0].message.endsWith(QStringLiteral("\r\n") +
                                                         ProgramHome::FtpLogFile()));
    EXPECT_TRUE(ports.prompter.shown[0].timed);
}

} // namespace
} // namespace quorvel
