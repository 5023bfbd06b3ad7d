#include "support/ui/msg_box_layout.h"
#include "support/ui/my_msg_box.h"
#include "support/ui/widget_prompter.h"

#include "common/recorders.h"

#include <QApplication>
#include <QMessageBox>
#include <QPushButton>
#include <QTest>
#include <QTimer>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

using namespace std::chrono_literals;

QPushButton* Button(QWidget* box, int index) {
    return box->findChild<QPushButton*>(QStringLiteral("Cmd_Command(%1)").arg(index));
}

// Runs the action once the next modal box is up.
void WhenShown(std::function<void()> action) {
    QTimer::singleShot(0, qApp, std::move(action));
}

class TimedBoxTest : public ::testing::Test {
protected:
    void ShortenWait(std::chrono::milliseconds wait) {
        WaitLengths waits;
        waits.messageBox = wait;
        ports.clock.SetWaits(waits);
    }
    testing::RecordingPorts ports;
    WidgetPrompter prompter;
};

TEST(MsgBoxLayoutTest, TextIsNeverCutOffAndTheCountDownRoundsToWholeSeconds) {
    // Text that needs more room than its length suggests (many line breaks)
    // pushes the buttons down instead of being cut off.
    EXPECT_EQ(ComputeMsgBoxLayout(20, {8, 16}, {81, 25}, 0, 150).buttonTop, 182);
    // Three wide buttons widen the window; two fit in it.
    EXPECT_GT(ComputeMsgBoxLayout(10, {7, 13}, {100, 25}, kButtonsYesNoCancel).width,
              ComputeMsgBoxLayout(10, {7, 13}, {100, 25}, kButtonsYesNo).width);
    // Ticks arriving early or late.
    EXPECT_EQ(frm_MyMsgBox::SecondsLeft(4003), 4);
    EXPECT_EQ(frm_MyMsgBox::SecondsLeft(997), 1);
    EXPECT_EQ(frm_MyMsgBox::SecondsLeft(4), 0);
}

TEST_F(TimedBoxTest, UnansweredBoxReturnsTheDefaultOfItsSet) {
    ShortenWait(30ms);
    for (const auto& [buttons, answer] : {std::pair<int, int>{kButtonsOk, kAnswerOk},
                                          {kButtonsOkCancel, kAnswerOk},
                                          {3 + 32, kAnswerYes},
                                          {4 + 48, kAnswerYes},
                                          {kButtonsRetryCancel, kAnswerRetry}})
        EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Nobody answers"), buttons), answer) << buttons;
    EXPECT_FALSE(prompter.Box()->isVisible());
}

TEST_F(TimedBoxTest, ClickOrEnterGivesTheButtonsAnswerAndEscapeNone) {
    frm_MyMsgBox* box = prompter.Box();
    WhenShown([box] { QTest::mouseClick(Button(box, 1), Qt::LeftButton); });
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Delete it?"), kButtonsYesNo), kAnswerNo);
    WhenShown([box] { QTest::mouseClick(Button(box, 2), Qt::LeftButton); });
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Go on?"), kButtonsYesNoCancel), kAnswerCancel);
    WhenShown([box] {
        QTest::keyClick(box, Qt::Key_Escape);
        if (box->isVisible()) QTest::mouseClick(Button(box, 1), Qt::LeftButton);
    });
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Failed"), kButtonsRetryCancel), kAnswerCancel);
    WhenShown([box] { QTest::keyClick(Button(box, 0), Qt::Key_Return); });
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Go on?"), kButtonsOkCancel), kAnswerOk);
    EXPECT_EQ(prompter.Box(), box); // one box serves every call
}

TEST_F(TimedBoxTest, QuestionWhileTheBoxIsOpenGetsItsOwnBox) {
    ShortenWait(40ms);
    int inner = 0;
    QString outerMessage;
    WhenShown([&] {
        inner = prompter.MyMsgBox(QStringLiteral("Inner"), kButtonsRetryCancel);
        outerMessage = prompter.Box()->Message();
    });
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Outer"), kButtonsYesNo), kAnswerYes);
    EXPECT_EQ(inner, kAnswerRetry);
    EXPECT_EQ(outerMessage, "Outer");
}

TEST_F(TimedBoxTest, ShownBoxFollowsTheLayoutRules) {
    frm_MyMsgBox* box = prompter.Box();
    box->SetMessage(QStringLiteral("Short text"));
    box->SetWhichButtons(kButtonsYesNoCancel);
    box->show();
    const QFontMetrics metrics(box->font());
    // Yes/No/Cancel reads Cancel, No, Yes from left to right; Yes answers Enter.
    EXPECT_EQ(Button(box, 2)->text(), "&Cancel");
    EXPECT_LT(Button(box, 2)->x(), Button(box, 1)->x());
    EXPECT_LT(Button(box, 1)->x(), Button(box, 0)->x());
    EXPECT_TRUE(Button(box, 0)->isDefault());
    box->hide();

    box->SetMessage(QStringLiteral("1\r\n2\r\n3\r\n4\r\n5\r\n6\r\n7\r\n8\r\n9\r\n10"));
    box->SetWhichButtons(kButtonsOk);
    box->show();
    EXPECT_GE(box->TextRect().height(), 10 * metrics.lineSpacing());
    EXPECT_FALSE(Button(box, 1)->isVisibleTo(box));
    box->hide();
}

TEST_F(TimedBoxTest, SystemBoxWaitsForTheClickedAnswer) {
    WhenShown([] {
        auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
        ASSERT_NE(box, nullptr);
        EXPECT_EQ(box->defaultButton(), box->button(QMessageBox::Yes));
        QTest::mouseClick(box->button(QMessageBox::No), Qt::LeftButton);
    });
    EXPECT_EQ(prompter.SystemMsgBox(QStringLiteral("Delete?"), kButtonsYesNo | 32), kAnswerNo);
}

} // namespace
} // namespace quorvel
