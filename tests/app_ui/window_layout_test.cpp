// The window as it meets a screen: the size it takes, the room each part gets,
// and the titles its boxes carry.

#include "window_fixture.h"

#include "support/ui/my_msg_box.h"
#include "support/ui/widget_prompter.h"

#include <QApplication>
#include <QImage>
#include <QMessageBox>
#include <QScreen>
#include <QTimer>

namespace quorvel::testing {
namespace {

using WindowLayoutTest = WindowTest;

std::string SizeText(QSize size) {
    return std::to_string(size.width()) + "x" + std::to_string(size.height());
}

// A laptop's 1366x768 leaves room for panels; the window must fit well inside,
// and growing it gives the file list and the record editor room too, not only
// the trace pane.
TEST_F(WindowLayoutTest, TheWindowShrinksTo800x600AndEveryPartGrowsWithIt) {
    StartWith({"A", "B"});
    C().SSTab1->setCurrentIndex(1);
    const QSize least = window->minimumSizeHint().expandedTo(window->minimumSize());
    EXPECT_LE(least.width(), 800) << SizeText(least);
    EXPECT_LE(least.height(), 600) << SizeText(least);
    struct Sizes {
        QSize list, tabs, trace;
    };
    const auto measure = [&](QSize size) {
        window->resize(size);
        Pump();
        return Sizes{C().Lst_Files->size(), C().SSTab1->size(), C().Lst_Trace->size()};
    };
    const Sizes small = measure({800, 600});
    EXPECT_EQ(window->size(), QSize(800, 600));
    const Sizes large = measure({1300, 900});
    EXPECT_GT(large.list.height(), small.list.height()) << SizeText(large.list);
    EXPECT_GT(large.tabs.height(), small.tabs.height()) << SizeText(large.tabs);
    EXPECT_GT(large.tabs.width(), small.tabs.width()) << SizeText(large.tabs);
    EXPECT_GT(large.trace.height(), small.trace.height()) << SizeText(large.trace);
    EXPECT_GT(large.trace.width(), small.trace.width()) << SizeText(large.trace);
    // At the least size every part keeps usable room.
    EXPECT_GE(small.list.height(), 60) << SizeText(small.list);
    EXPECT_GE(small.trace.height(), 40) << SizeText(small.trace);

    // The first size is the screen's room at most.
    const QRect room = window->screen()->availableGeometry();
    window.reset();
    Start();
    EXPECT_LE(window->width(), room.width());
    EXPECT_LE(window->height(), room.height());
}

// Every box carries the program's title, not the executable's name.
TEST_F(WindowLayoutTest, BoxesCarryTheProgramsTitle) {
    Start();
    QStringList titles;
    // Reads the title of each box as it opens, then answers it.
    const auto readAndClose = [&] {
        QTimer::singleShot(0, [&] {
            QWidget* box = QApplication::activeModalWidget();
            ASSERT_NE(box, nullptr);
            titles << box->windowTitle();
            box->close();
        });
    };
    WidgetPrompter prompter(window.get());
    readAndClose();
    prompter.SystemMsgBox("Remove 'a.csv' ?", kButtonsYesNo | kIconQuestion);
    readAndClose();
    prompter.MyMsgBox("Disk full", kButtonsOk | kIconExclamation);
    EXPECT_EQ(titles, QStringList({"TALU Quorvel", "TALU Quorvel"}));
}

// The task bar and the tray show the program's own icon, and the desktop can
// match the window to the installed entry.
TEST_F(WindowLayoutTest, TheWindowCarriesTheProgramsIconAndEntryName) {
    Start();
    EXPECT_EQ(QGuiApplication::desktopFileName(), "org.quorvel.Quorvel");
    const QImage icon = window->windowIcon().pixmap(48, 48).toImage();
    ASSERT_FALSE(icon.isNull());
    // Drawn, not blank: the tile's blue fills the middle.
    const QColor middle = icon.pixelColor(24, 12);
    EXPECT_GT(middle.alpha(), 200);
    EXPECT_GT(middle.blue(), middle.red());
}

} // namespace
} // namespace quorvel::testing
