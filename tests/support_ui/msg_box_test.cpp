#include "support/ui/button_sets.h"
#include "support/ui/msg_box_layout.h"
#include "support/ui/my_msg_box.h"
#include "support/ui/widget_prompter.h"

#include "common/recorders.h"

#include <QApplication>
#include <QLabel>
#include <QMessageBox>
#include <QPushButton>
#include <QTest>
#include <QTimer>

#include <gtest/gtest.h>

#include <functional>

namespace quorvel {
namespace {

using namespace std::chrono_literals;

QPushButton* CommandButton(QWidget* box, int index) {
    return box->findChild<QPushButton*>(QStringLiteral("Cmd_Command(%1)").arg(index));
}

// Runs the action once the next modal box has come up.
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
};

TEST(MsgBoxLayoutTest, ShortMessageGetsTheMinimumTextArea) {
    const MsgBoxLayout layout = ComputeMsgBoxLayout(10, {7, 13}, {81, 25}, kButtonsOk);
    EXPECT_EQ(layout.charsPerLine, 20);
    EXPECT_EQ(layout.lines, 3);
    EXPECT_EQ(layout.textRect, QRect(12, 24, 250, 60));
    EXPECT_EQ(layout.width, 298);
    EXPECT_EQ(layout.buttonTop, 92);
    EXPECT_EQ(layout.height, 92 + 25 + 16);
}

TEST(MsgBoxLayoutTest, FiftyCharactersTakeFortyPerLine) {
    const MsgBoxLayout at49 = ComputeMsgBoxLayout(49, {8, 16}, {81, 25}, kButtonsOk);
    EXPECT_EQ(at49.charsPerLine, 20);
    const MsgBoxLayout at50 = ComputeMsgBoxLayout(50, {8, 16}, {81, 25}, kButtonsOk);
    EXPECT_EQ(at50.charsPerLine, 40);
    EXPECT_EQ(at50.lines, 3); // 1.25 lines, raised to the minimum
    EXPECT_EQ(at50.textRect.width(), 320);
    EXPECT_EQ(at50.textRect.height(), 60); // 3 lines of 16 are raised to the minimum
}

TEST(MsgBoxLayoutTest, LongMessagesAddLinesWithHalvesToEven) {
    EXPECT_EQ(ComputeMsgBoxLayout(200, {8, 16}, {81, 25}, kButtonsOk).lines, 5);
    EXPECT_EQ(ComputeMsgBoxLayout(180, {8, 16}, {81, 25}, kButtonsOk).lines, 4); // 4.5
    EXPECT_EQ(ComputeMsgBoxLayout(220, {8, 16}, {81, 25}, kButtonsOk).lines, 6); // 5.5
    EXPECT_EQ(ComputeMsgBoxLayout(200, {8, 16}, {81, 25}, kButtonsOk).textRect.height(), 80);
}

TEST(MsgBoxLayoutTest, TextThatNeedsMoreRoomIsNeverCutOff) {
    const MsgBoxLayout layout = ComputeMsgBoxLayout(20, {8, 16}, {81, 25}, kButtonsOk, 150);
    EXPECT_EQ(layout.textRect.height(), 150);
    EXPECT_EQ(layout.buttonTop, 182);
}

TEST(MsgBoxLayoutTest, ThreeWideButtonsWidenTheWindow) {
    const MsgBoxLayout narrow = ComputeMsgBoxLayout(10, {7, 13}, {81, 25}, kButtonsYesNoCancel);
    EXPECT_EQ(narrow.width, 298);
    const MsgBoxLayout wide = ComputeMsgBoxLayout(10, {7, 13}, {100, 25}, kButtonsYesNoCancel);
    EXPECT_EQ(wide.width, 324);
    const MsgBoxLayout two = ComputeMsgBoxLayout(10, {7, 13}, {100, 25}, kButtonsYesNo);
    EXPECT_EQ(two.width, 298);
}

TEST(MsgBoxLayoutTest, ButtonsRunRightToLeftTwoPixelsApart) {
    const MsgBoxLayout one = ComputeMsgBoxLayout(10, {7, 13}, {80, 25}, kButtonsOk);
    EXPECT_EQ(one.buttonLeft[0], 149 - 40);

    const MsgBoxLayout two = ComputeMsgBoxLayout(10, {7, 13}, {80, 25}, kButtonsYesNo);
    EXPECT_EQ(two.buttonLeft[0], 149 + 2);
    EXPECT_EQ(two.buttonLeft[1] + 80, 149);

    const MsgBoxLayout three = ComputeMsgBoxLayout(10, {7, 13}, {81, 25}, kButtonsYesNoCancel);
    EXPECT_EQ(three.buttonLeft[1], 149 - 40); // "No" centred
    EXPECT_EQ(three.buttonLeft[0], three.buttonLeft[1] + 81 + 2);
    EXPECT_EQ(three.buttonLeft[2] + 81 + 2, three.buttonLeft[1]);
}

TEST(ButtonSetTest, CaptionsAnswersAndDefaultsOfEachSet) {
    const ButtonSet yesNoCancel = ButtonSetFor(kButtonsYesNoCancel | kIconQuestion);
    EXPECT_EQ(yesNoCancel.count, 3);
    EXPECT_EQ(yesNoCancel.captions[0], "&Yes");
    EXPECT_EQ(yesNoCancel.captions[2], "&Cancel");
    EXPECT_EQ(yesNoCancel.answers[1], kAnswerNo);
    EXPECT_EQ(ButtonSetFor(kButtonsRetryCancel).answers[1], kAnswerCancel);
    for (int code : {0, 1, 3, 4, 5, 4 + 48})
        EXPECT_EQ(ButtonSetFor(code).defaultAnswer, DefaultAnswer(code)) << code;
    EXPECT_EQ(ButtonSetFor(2).count, 3);
    EXPECT_EQ(ButtonSetFor(2).defaultAnswer, 0);
}

TEST_F(TimedBoxTest, UnansweredBoxReturnsTheDefaultOfItsSet) {
    ShortenWait(30ms);
    WidgetPrompter prompter;
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Nobody answers"), kButtonsOk), kAnswerOk);
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Nobody answers"), kButtonsOkCancel), kAnswerOk);
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Nobody answers"), kButtonsYesNoCancel | 32),
              kAnswerYes);
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Nobody answers"), kButtonsYesNo | 48), kAnswerYes);
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Nobody answers"), kButtonsRetryCancel),
              kAnswerRetry);
    EXPECT_FALSE(prompter.Box()->isVisible());
}

TEST(CountDownTest, TicksCountFourThreeTwoOneThenEnd) {
    // Ticks a second apart after a 5-second start, each a little early or late.
    EXPECT_EQ(frm_MyMsgBox::SecondsLeft(4003), 4);
    EXPECT_EQ(frm_MyMsgBox::SecondsLeft(2996), 3);
    EXPECT_EQ(frm_MyMsgBox::SecondsLeft(2004), 2);
    EXPECT_EQ(frm_MyMsgBox::SecondsLeft(997), 1);
    EXPECT_EQ(frm_MyMsgBox::SecondsLeft(4), 0);
    EXPECT_EQ(frm_MyMsgBox::SecondsLeft(-6), 0);
}

TEST_F(TimedBoxTest, CountDownIsShownFromItsFirstTick) {
    ShortenWait(60ms); // ticks until the deadline, which ends the box
    frm_MyMsgBox box;
    auto* label = box.findChild<QLabel*>(QStringLiteral("Lbl_CountDown"));
    ASSERT_NE(label, nullptr);
    box.SetMessage(QStringLiteral("Unattended"));
    box.show();
    EXPECT_FALSE(label->isVisibleTo(&box));
    EXPECT_TRUE(QTest::qWaitFor([&] { return !box.isVisible(); }, 2000));
    EXPECT_EQ(box.Response(), kAnswerOk);
    EXPECT_FALSE(label->isVisibleTo(&box));
}

TEST_F(TimedBoxTest, ClickedButtonGivesItsAnswer) {
    WidgetPrompter prompter;
    frm_MyMsgBox* box = prompter.Box();
    WhenShown([box] { QTest::mouseClick(CommandButton(box, 1), Qt::LeftButton); });
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Delete it?"), kButtonsYesNo), kAnswerNo);

    WhenShown([box] { QTest::mouseClick(CommandButton(box, 2), Qt::LeftButton); });
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Go on?"), kButtonsYesNoCancel), kAnswerCancel);

    WhenShown([box] { QTest::mouseClick(CommandButton(box, 1), Qt::LeftButton); });
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Failed"), kButtonsRetryCancel), kAnswerCancel);
    EXPECT_EQ(box->Response(), kAnswerCancel);
}

TEST_F(TimedBoxTest, EnterAnswersWithTheDefaultButtonAndEscapeIsNoAnswer) {
    WidgetPrompter prompter;
    frm_MyMsgBox* box = prompter.Box();
    WhenShown([box] {
        QTest::keyClick(box, Qt::Key_Escape);
        if (box->isVisible()) QTest::keyClick(CommandButton(box, 0), Qt::Key_Return);
    });
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Go on?"), kButtonsYesNo), kAnswerYes);
    // The box was still open for Return, so Escape did not close it.
    EXPECT_EQ(box->result(), kAnswerYes);
}

TEST_F(TimedBoxTest, OneBoxServesEveryCallAndTakesEachCallsButtons) {
    ShortenWait(20ms);
    WidgetPrompter prompter;
    frm_MyMsgBox* box = prompter.Box();
    prompter.MyMsgBox(QStringLiteral("First"), kButtonsYesNoCancel);
    EXPECT_TRUE(CommandButton(box, 2)->isVisibleTo(box));

    prompter.MyMsgBox(QStringLiteral("Second"), kButtonsOk);
    EXPECT_EQ(prompter.Box(), box);
    EXPECT_EQ(box->Message(), "Second");
    EXPECT_EQ(CommandButton(box, 0)->text(), "&Ok");
    EXPECT_FALSE(CommandButton(box, 1)->isVisibleTo(box));
    EXPECT_FALSE(CommandButton(box, 2)->isVisibleTo(box));
}

TEST_F(TimedBoxTest, QuestionWhileTheBoxIsOpenGetsItsOwnBox) {
    ShortenWait(40ms);
    WidgetPrompter prompter;
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
    frm_MyMsgBox box;
    box.SetMessage(QStringLiteral("Short text"));
    box.SetWhichButtons(kButtonsYesNoCancel);
    box.show();
    const QFontMetrics metrics(box.font());
    const int letter = metrics.horizontalAdvance(QLatin1Char('X'));
    EXPECT_EQ(box.TextRect().topLeft(), QPoint(12, 24));
    EXPECT_EQ(box.TextRect().width(), std::max(250, 20 * letter));
    EXPECT_EQ(box.TextRect().height(), std::max(60, 3 * metrics.height()));
    const QSize button = box.ButtonSize();
    EXPECT_GE(button.width(), 81);
    EXPECT_EQ(box.width(), std::max(box.TextRect().width() + 48, 3 * button.width() + 24));
    EXPECT_EQ(box.height(), box.TextRect().height() + 32 + button.height() + 16);

    // Yes/No/Cancel reads Cancel, No, Yes from left to right.
    QPushButton* yes = CommandButton(&box, 0);
    QPushButton* no = CommandButton(&box, 1);
    QPushButton* cancel = CommandButton(&box, 2);
    EXPECT_EQ(cancel->text(), "&Cancel");
    EXPECT_LT(cancel->x(), no->x());
    EXPECT_LT(no->x(), yes->x());
    EXPECT_NEAR(no->geometry().center().x(), box.width() / 2, 1);
    EXPECT_TRUE(yes->isDefault());
    EXPECT_EQ(yes->y(), box.TextRect().height() + 32);
    box.hide();
}

TEST_F(TimedBoxTest, FiftyCharacterMessageUsesFortyPerLine) {
    frm_MyMsgBox box;
    box.SetMessage(QString(50, QLatin1Char('a')));
    box.show();
    const int letter = QFontMetrics(box.font()).horizontalAdvance(QLatin1Char('X'));
    EXPECT_EQ(box.Layout().charsPerLine, 40);
    EXPECT_EQ(box.Layout().lines, 3);
    EXPECT_EQ(box.TextRect().width(), std::max(250, 40 * letter));
    box.hide();
}

TEST_F(TimedBoxTest, ManyLineBreaksMakeTheBoxTaller) {
    frm_MyMsgBox box;
    box.SetMessage(QStringLiteral("1\r\n2\r\n3\r\n4\r\n5\r\n6\r\n7\r\n8\r\n9\r\n10"));
    box.show();
    EXPECT_GE(box.TextRect().height(), 10 * QFontMetrics(box.font()).lineSpacing());
    EXPECT_GT(CommandButton(&box, 0)->y(), box.TextRect().bottom());
    box.hide();
}

TEST_F(TimedBoxTest, ClosingTheWindowGivesTheDefaultAnswer) {
    WidgetPrompter prompter;
    frm_MyMsgBox* box = prompter.Box();
    WhenShown([box] { box->close(); });
    EXPECT_EQ(prompter.MyMsgBox(QStringLiteral("Closed"), kButtonsRetryCancel), kAnswerRetry);
}

TEST_F(TimedBoxTest, SystemBoxWaitsForTheClickedAnswer) {
    WidgetPrompter prompter;
    WhenShown([] {
        auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
        ASSERT_NE(box, nullptr);
        EXPECT_EQ(box->defaultButton(), box->button(QMessageBox::Yes));
        EXPECT_EQ(box->text(), "Delete the record?");
        QTest::mouseClick(box->button(QMessageBox::No), Qt::LeftButton);
    });
    EXPECT_EQ(prompter.SystemMsgBox(QStringLiteral("Delete the record?"), kButtonsYesNo | 32),
              kAnswerNo);

    WhenShown([] {
        auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
        ASSERT_NE(box, nullptr);
        EXPECT_EQ(box->buttons().size(), 1);
        box->close();
    });
    EXPECT_EQ(prompter.SystemMsgBox(QStringLiteral("Error"), kButtonsOk), kAnswerOk);
}

} // namespace
} // namespace quorvel
