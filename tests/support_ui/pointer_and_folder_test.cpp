#include "support/ui/folder_chooser.h"
#include "support/ui/mouse_pointer.h"

#include <QCursor>
#include <QDir>
#include <QGuiApplication>

#include <gtest/gtest.h>

#include <optional>

namespace quorvel {
namespace {

std::optional<Qt::CursorShape> ShownPointer() {
    const QCursor* cursor = QGuiApplication::overrideCursor();
    if (cursor == nullptr) return std::nullopt;
    return cursor->shape();
}

// Something else already shows a pointer of its own before each test.
class BusyPointerTest : public ::testing::Test {
protected:
    BusyPointerTest() { QGuiApplication::setOverrideCursor(QCursor(Qt::PointingHandCursor)); }
    ~BusyPointerTest() override {
        while (QGuiApplication::overrideCursor() != nullptr)
            QGuiApplication::restoreOverrideCursor();
    }
};

TEST_F(BusyPointerTest, NestedPointersKeepTheHourglassUntilBothAreGone) {
    {
        CMousePointer outer;
        outer.SetHourglass();
        {
            CMousePointer inner;
            inner.SetHourglass();
            EXPECT_EQ(ShownPointer(), Qt::WaitCursor);
        }
        EXPECT_EQ(ShownPointer(), Qt::WaitCursor);
    }
    EXPECT_EQ(ShownPointer(), Qt::PointingHandCursor);
}

TEST_F(BusyPointerTest, SettingTwiceRestoresOnceAndUnsetRestoresNothing) {
    {
        CMousePointer pointer;
        pointer.SetMousePointer(Qt::BusyCursor);
        pointer.SetHourglass();
        EXPECT_EQ(ShownPointer(), Qt::WaitCursor);
        CMousePointer unused;
    }
    EXPECT_EQ(ShownPointer(), Qt::PointingHandCursor);
}

TEST_F(BusyPointerTest, PortPushesAndPopsInPairs) {
    {
        OverrideBusyPointer busy;
        {
            BusyGuard first(&busy);
            BusyGuard second(&busy);
            EXPECT_EQ(ShownPointer(), Qt::WaitCursor);
            EXPECT_EQ(busy.Depth(), 2);
        }
        EXPECT_EQ(ShownPointer(), Qt::PointingHandCursor);
        busy.Pop(); // unmatched: must not take away the other pointer
        EXPECT_EQ(ShownPointer(), Qt::PointingHandCursor);
        busy.Push(); // left pushed: the port's end gives it back
    }
    EXPECT_EQ(ShownPointer(), Qt::PointingHandCursor);
}

class FolderChooserTest : public ::testing::Test {
protected:
    // A dialog that records what it was asked and answers with reply.
    FolderDialog Dialog() {
        return [this](QWidget*, const QString& prompt, const QString& start) {
            seenPrompt = prompt;
            seenStart = start;
            ++opened;
            return reply;
        };
    }
    QUrl reply;
    QString seenPrompt;
    QString seenStart;
    int opened = 0;
};

TEST_F(FolderChooserTest, CancelLeavesTheFolderUnchanged) {
    ScopedFolderDialog scoped(Dialog());
    QString folder = QStringLiteral("/data/loggers");
    EXPECT_FALSE(BrowseForFolder(nullptr, folder, QStringLiteral("data")));
    EXPECT_EQ(folder, "/data/loggers");
    EXPECT_EQ(seenStart, "/data/loggers");
    EXPECT_EQ(seenPrompt, "Choose data folder");
}

TEST_F(FolderChooserTest, EmptyFolderStartsAtTheCurrentDirectory) {
    ScopedFolderDialog scoped(Dialog());
    QString folder;
    EXPECT_FALSE(BrowseForFolder(nullptr, folder, QStringLiteral("application")));
    EXPECT_EQ(seenStart, QDir::currentPath());
    EXPECT_TRUE(folder.isEmpty()); // a cancel leaves even an empty folder alone
    EXPECT_EQ(seenPrompt, "Choose application folder");
}

TEST_F(FolderChooserTest, ChosenLocalFolderIsReturned) {
    ScopedFolderDialog scoped(Dialog());
    reply = QUrl::fromLocalFile(QStringLiteral("/home/user/My Data/"));
    QString folder = QStringLiteral("/home\\user");
    EXPECT_TRUE(BrowseForFolder(nullptr, folder, QStringLiteral("user")));
    EXPECT_EQ(folder, QDir::toNativeSeparators(QStringLiteral("/home/user/My Data")));
    EXPECT_EQ(seenStart, "/home/user"); // a stored backslash is a separator
}

TEST_F(FolderChooserTest, ChoiceWithoutLocalPathIsRefused) {
    ScopedFolderDialog scoped(Dialog());
    reply = QUrl(QStringLiteral("sftp://server/share"));
    QString folder = QStringLiteral("/data");
    EXPECT_FALSE(BrowseForFolder(nullptr, folder, QStringLiteral("data")));
    EXPECT_EQ(folder, "/data");
    EXPECT_EQ(opened, 1);
}

} // namespace
} // namespace quorvel
