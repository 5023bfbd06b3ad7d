#include "support/ui/desktop_opener.h"

#include "support/shell_open.h"

#include "common/recorders.h"
#include "common/temp_home.h"

#include <QDesktopServices>
#include <QUrl>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

// Takes the desktop's "file" requests instead of starting an application.
class FileUrlCatcher : public QObject {
    Q_OBJECT
public:
    FileUrlCatcher() { QDesktopServices::setUrlHandler(QStringLiteral("file"), this, "Open"); }
    ~FileUrlCatcher() override { QDesktopServices::unsetUrlHandler(QStringLiteral("file")); }
    QList<QUrl> opened;
public Q_SLOTS:
    void Open(const QUrl& url) { opened << url; }
};

TEST(DesktopOpenerTest, ShellOpenFileHandsTheFileToTheDesktopAsAUrl) {
    testing::RecordingPorts ports;
    testing::TempHome home;
    const QString file = home.Write(QStringLiteral("site 1 #2;rm -rf.txt"), "x");
    FileUrlCatcher catcher;
    InstallDesktopOpener();
    EXPECT_TRUE(ShellOpenFile(file));
    ASSERT_EQ(catcher.opened.size(), 1);
    EXPECT_TRUE(catcher.opened[0].isLocalFile());
    EXPECT_EQ(catcher.opened[0].toLocalFile(), file);
    EXPECT_TRUE(ports.prompter.shown.empty());
    SetDesktopOpener({});
}

TEST(DesktopOpenerTest, MissingFileNeverReachesTheDesktop) {
    testing::RecordingPorts ports;
    testing::TempHome home;
    FileUrlCatcher catcher;
    InstallDesktopOpener();
    EXPECT_FALSE(ShellOpenFile(home.File(QStringLiteral("missing.txt"))));
    EXPECT_TRUE(catcher.opened.empty());
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_TRUE(ports.prompter.shown[0].message.startsWith("File not found\r\nFile: "));
    SetDesktopOpener({});
}

} // namespace
} // namespace quorvel

#include "desktop_opener_test.moc"
