// Plain HTTP fetches against a real HTTP server on a loopback port.
#include "common/recorders.h"
#include "peer_process.h"
#include "transfer/ftp_session.h"
#include "transfer/http_fetch.h"

#include <QDir>
#include <QFile>
#include <QTemporaryDir>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

class HttpFetchTest : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(root.isValid());
        ASSERT_TRUE(peer.Start(QStringLiteral("http_peer.py"), {root.path()}));
        session.SetDisplay(&view, nullptr);
        session.SetDetails(QString(), QString(), QString(), true);
    }
    void Serve(const QString& name, const QByteArray& body) {
        QFile file(root.filePath(name));
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(body);
    }
    QString Host() const { return QStringLiteral("127.0.0.1:") + QString::number(peer.Port()); }

    testing::RecordingPorts ports;
    QTemporaryDir root;
    testing::PeerProcess peer;
    testing::RecordingTraceView view;
    FtpSession session;
    QString contents;
};

TEST_F(HttpFetchTest, BodyIsReadWhole) {
    QByteArray body;
    for (int i = 0; i < 5000; ++i)
        body += "site" + QByteArray::number(i) + ".dat~1~0~2\r\n";
    Serve(QStringLiteral("files.txt"), body);
    const QString url = QStringLiteral("http://") + Host() + QStringLiteral("/files.txt");
    EXPECT_TRUE(session.HttpGetFileContents(url, contents));
    EXPECT_EQ(contents.toLatin1(), body);
    EXPECT_EQ(view.statuses.last(), QStringLiteral("Received: ") + url);
    EXPECT_EQ(ports.busy.pushes, 1);
    EXPECT_EQ(ports.busy.depth, 0);
}

TEST_F(HttpFetchTest, AnHtmlReplyOrNotFoundIsNotTheFile) {
    Serve(QStringLiteral("cfg.txt"), "<html>ftp.example.com\r\n");
    EXPECT_FALSE(session.HttpGetFileContents(
        QStringLiteral("http://") + Host() + QStringLiteral("/cfg.txt"), contents));
    EXPECT_EQ(contents, QStringLiteral("<html>ftp.example.com\r\n"));
    EXPECT_EQ(view.traces.filter(QStringLiteral("found html tag, so file not there")).size(), 1);
    // Not found, with a plain text body.
    EXPECT_FALSE(session.HttpGetFileContents(
        QStringLiteral("http://") + Host() + QStringLiteral("/missing.txt"), contents));
    EXPECT_TRUE(contents.isEmpty());
    EXPECT_TRUE(session.LastError().contains(QStringLiteral("HTTP status 404")));
    EXPECT_EQ(view.statuses.last(), session.LastError());
}

TEST_F(HttpFetchTest, AddressWithoutSchemeWithBackslashesOrInCapitals) {
    QDir(root.path()).mkpath(QStringLiteral("cfg"));
    Serve(QStringLiteral("cfg/site.cfg"), "ftp.example.com\r\n");
    const QString url = Host() + QStringLiteral("\\cfg\\site.cfg");
    EXPECT_EQ(HttpAddress(url),
              QStringLiteral("http://") + Host() + QStringLiteral("/cfg/site.cfg"));
    EXPECT_TRUE(session.HttpGetFileContents(url, contents)) << session.LastError().toStdString();
    EXPECT_EQ(contents, QStringLiteral("ftp.example.com\r\n"));

    const QString capitals = QStringLiteral("HTTP://") + Host() + QStringLiteral("/cfg/site.cfg");
    EXPECT_EQ(HttpAddress(capitals), capitals);
    EXPECT_TRUE(session.HttpGetFileContents(capitals, contents));
}

TEST_F(HttpFetchTest, EarlierFailureIsNotShownAfterASuccess) {
    const QString stopped = QStringLiteral("http://") + Host() + QStringLiteral("/a.txt");
    Serve(QStringLiteral("a.txt"), "A");
    peer.Stop();
    EXPECT_FALSE(session.HttpGetFileContents(stopped, contents));
    EXPECT_TRUE(session.LastError().startsWith(QStringLiteral("Could not connect to ") + stopped +
                                               QStringLiteral("\r\n")));
    ASSERT_TRUE(peer.Start(QStringLiteral("http_peer.py"), {root.path()}));
    EXPECT_TRUE(session.HttpGetFileContents(
        QStringLiteral("http://") + Host() + QStringLiteral("/a.txt"), contents));
    EXPECT_TRUE(session.LastError().isEmpty());
    EXPECT_TRUE(view.statuses.last().startsWith(QStringLiteral("Received: ")));
}

} // namespace
} // namespace quorvel
