#include "support/ui/my_msg_box.h"

#include "support/ports.h"
#include "support/ui/wrapped_text.h"

#include <QFontMetrics>
#include <QGuiApplication>
#include <QHideEvent>
#include <QKeyEvent>
#include <QLabel>
#include <QPainter>
#include <QPushButton>

#include <algorithm>

namespace quorvel {

namespace {

// The buttons' design size; a larger font or a longer caption makes them grow.
constexpr QSize kDesignButton(81, 25);
constexpr int kTextLeft = 12;

} // namespace

frm_MyMsgBox::frm_MyMsgBox(QWidget* parent) : QDialog(parent) {
    setObjectName(QStringLiteral("frm_MyMsgBox"));
    setWindowFlag(Qt::WindowContextHelpButtonHint, false);
    setModal(true);
    for (int i = 0; i < 3; ++i) {
        auto* button = new QPushButton(this);
        button->setObjectName(QStringLiteral("Cmd_Command(%1)").arg(i));
        connect(button, &QPushButton::clicked, this, [this, i] { Answer(i); });
        buttons_[i] = button;
    }
    countDown_ = new QLabel(this);
    countDown_->setObjectName(QStringLiteral("Lbl_CountDown"));
    countDown_->hide();
    timer_.setObjectName(QStringLiteral("Timer1"));
    timer_.setSingleShot(true);
    connect(&timer_, &QTimer::timeout, this, &frm_MyMsgBox::CountDown);
}

void frm_MyMsgBox::SetMessage(const QString& message) {
    message_ = message;
    update();
}

void frm_MyMsgBox::SetWhichButtons(int buttons) {
    whichButtons_ = buttons;
}

void frm_MyMsgBox::showEvent(QShowEvent* event) {
    QDialog::showEvent(event);
    if (!active_) Activate();
}

void frm_MyMsgBox::hideEvent(QHideEvent* event) {
    QDialog::hideEvent(event);
    // A box whose owner is minimised (start-up mode) may be hidden by the
    // desktop; it must go on counting down, or an unattended run would hang.
    if (event->spontaneous()) return;
    timer_.stop();
    active_ = false;
}

void frm_MyMsgBox::Activate() {
    active_ = true;
    setWindowTitle(QGuiApplication::applicationDisplayName());
    set_ = ButtonSetFor(whichButtons_);
    response_ = set_.defaultAnswer;
    LayOut();

    const auto wait = std::max<qint64>(1, CurrentClock().Waits().messageBox.count());
    deadline_ = QDeadlineTimer(wait);
    countDown_->hide();
    StartTick();
}

void frm_MyMsgBox::LayOut() {
    const QFontMetrics metrics(font());
    const QSize letter(metrics.horizontalAdvance(QLatin1Char('X')), metrics.height());
    buttonSize_ = kDesignButton;
    for (int i = 0; i < 3; ++i) {
        buttons_[i]->setText(set_.captions[i]);
        buttonSize_ = buttonSize_.expandedTo(buttons_[i]->sizeHint());
    }
    // The rules give the text area; a message with many line breaks may need more.
    const MsgBoxLayout rough =
        ComputeMsgBoxLayout(int(message_.size()), letter, buttonSize_, whichButtons_);
    const int needed = WrappedTextHeight(message_, font(), rough.textRect.width());
    layout_ = ComputeMsgBoxLayout(int(message_.size()), letter, buttonSize_, whichButtons_, needed);

    for (int i = 0; i < 3; ++i) {
        QPushButton* button = buttons_[i];
        button->setGeometry(layout_.buttonLeft[i], layout_.buttonTop, buttonSize_.width(),
                            buttonSize_.height());
        button->setVisible(i < layout_.buttonCount);
        button->setDefault(i == 0);
    }
    countDown_->setGeometry(kTextLeft, layout_.buttonTop,
                            metrics.horizontalAdvance(QLatin1String("000")), buttonSize_.height());
    setFixedSize(layout_.width, layout_.height);
    buttons_[0]->setFocus();
}

int frm_MyMsgBox::SecondsLeft(qint64 remainingMs) {
    // Rounded to the nearest second so that a tick arriving a little early or
    // late still counts 4, 3, 2, 1, 0.
    return remainingMs <= 0 ? 0 : static_cast<int>((remainingMs + 500) / 1000);
}

void frm_MyMsgBox::StartTick() {
    // Whole seconds apart, the last tick exactly at the deadline.
    const qint64 remaining = std::max<qint64>(1, deadline_.remainingTime());
    timer_.start(static_cast<int>(std::min<qint64>(1000, remaining)));
}

void frm_MyMsgBox::CountDown() {
    const int left = SecondsLeft(deadline_.remainingTime());
    countDown_->setText(QString::number(left));
    countDown_->show();
    if (left > 0) {
        StartTick();
        return;
    }
    timer_.stop();
    countDown_->hide();
    Close();
}

void frm_MyMsgBox::Answer(int index) {
    timer_.stop();
    response_ = set_.answers[index];
    Close();
}

void frm_MyMsgBox::Close() {
    done(response_);
}

void frm_MyMsgBox::reject() {
    // Closing the window gives the default answer, as the count-down would.
    timer_.stop();
    Close();
}

void frm_MyMsgBox::keyPressEvent(QKeyEvent* event) {
    // Escape is no answer: only a button or the count-down ends the box.
    if (event->key() == Qt::Key_Escape) {
        event->accept();
        return;
    }
    QDialog::keyPressEvent(event);
}

void frm_MyMsgBox::paintEvent(QPaintEvent* event) {
    QDialog::paintEvent(event);
    QPainter painter(this);
    painter.setPen(palette().color(QPalette::WindowText));
    painter.setClipRect(layout_.textRect);
    WrapText(message_, font(), layout_.textRect.width())
        ->draw(&painter, layout_.textRect.topLeft());
}

} // namespace quorvel
