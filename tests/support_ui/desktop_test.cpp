#include "support/ui/desktop_opener.h"
#include "support/ui/folder_chooser.h"
#include "support/ui/mouse_pointer.h"

#include "support/shell_open.h"

#include "common/recorders.h"
#include "common/temp_home.h"

#include <QCursor>
#include <QDesktopServices>
#include <QDir>
#include <QGuiApplication>
#include <QUrl>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

Qt::CursorShape Shown() {
    const QCursor* cursor = QGuiApplication::overrideCursor();
    return cursor != nullptr ? cursor->shape() : Qt::ArrowCursor;
}

// Another pointer is shown before each test.
class BusyPointerTest : public ::testing::Test {
protected:
    BusyPointerTest() { QGuiApplication::setOverrideCursor(QCursor(Qt::PointingHandCursor)); }
    ~BusyPointerTest() override {
        while (QGuiApplication::overrideCursor() != nullptr)
            QGuiApplication::restoreOverrideCursor();
    }
};

TEST_F(BusyPointerTest, NestedPointersKeepTheHourglassUntilAllAreGone) {
    {
        CMousePointer outer;
        outer.SetMousePointer(Qt::BusyCursor);
        outer.SetHourglass(); // a second set must not save the busy pointer
        {
            CMousePointer inner;
            inner.SetHourglass();
            CMousePointer unused;
        }
        EXPECT_EQ(Shown(), Qt::WaitCursor);
    }
    EXPECT_EQ(Shown(), Qt::PointingHandCursor);
    // The port ignores unmatched pops and gives back what it holds.
    {
        OverrideBusyPointer busy;
        {
            BusyGuard first(&busy);
            BusyGuard second(&busy);
            EXPECT_EQ(Shown(), Qt::WaitCursor);
        }
        busy.Pop();
        EXPECT_EQ(Shown(), Qt::PointingHandCursor);
        busy.Push();
    }
    EXPECT_EQ(Shown(), Qt::PointingHandCursor);
}

TEST(FolderChooserTest, PromptStartAndWhatComesBack) {
    QUrl reply;
    QString prompt;
    QString start;
    ScopedFolderDialog scoped([&](QWidget*, const QString& p, const QString& s) {
        prompt = p;
        start = s;
        return reply;
    });
    QString folder;
    EXPECT_FALSE(BrowseForFolder(nullptr, folder, QStringLiteral("data"))); // cancelled
    EXPECT_EQ(start, QDir::currentPath());
    EXPECT_EQ(prompt, "Choose data folder");
    EXPECT_TRUE(folder.isEmpty());

    folder = QStringLiteral("/home\\user"); // a stored backslash is a separator
    reply = QUrl(QStringLiteral("sftp://server/share"));
    EXPECT_FALSE(BrowseForFolder(nullptr, folder, QStringLiteral("user")));
    EXPECT_EQ(start, "/home/user");
    EXPECT_EQ(folder, "/home\\user");

    reply = QUrl::fromLocalFile(QStringLiteral("/home/user/My Data/"));
    EXPECT_TRUE(BrowseForFolder(nullptr, folder, QStringLiteral("user")));
    EXPECT_EQ(folder, QDir::toNativeSeparators(QStringLiteral("/home/user/My Data")));
}

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

TEST(DesktopOpenerTest, FileReachesTheDesktopAsAUrlNeverAsACommand) {
    testing::RecordingPorts ports;
    testing::TempHome home;
    const QString file = home.Write(QStringLiteral("site 1 #2;rm -rf.txt"), "x");
    FileUrlCatcher catcher;
    InstallDesktopOpener();
    EXPECT_TRUE(ShellOpenFile(file));
    EXPECT_FALSE(ShellOpenFile(home.File(QStringLiteral("missing.txt"))));
    SetDesktopOpener({});
    ASSERT_EQ(catcher.opened.size(), 1);
    EXPECT_EQ(catcher.opened[0].toLocalFile(), file);
    ASSERT_EQ(ports.prompter.shown.size(), 1u);
    EXPECT_TRUE(ports.prompter.shown[0].message.startsWith("File not found\r\n"));
}

} // namespace
} // namespace quorvel

#include "desktop_test.moc"
