#include "support/ui/widget_prompter.h"

#include "support/ui/button_sets.h"
#include "support/ui/my_msg_box.h"

#include <QAbstractButton>
#include <QGuiApplication>
#include <QMessageBox>
#include <QWidget>

#include <memory>

namespace quorvel {

namespace {

int ShowTimedBox(frm_MyMsgBox& box, const QString& message, int buttons) {
    box.SetMessage(message);
    box.SetWhichButtons(buttons);
    box.exec();
    return box.Response();
}

QMessageBox::Icon IconFor(int buttons) {
    switch (buttons & 0x70) {
    case 16:
        return QMessageBox::Critical;
    case kIconQuestion:
        return QMessageBox::Question;
    case kIconExclamation:
        return QMessageBox::Warning;
    case 64:
        return QMessageBox::Information;
    default:
        return QMessageBox::NoIcon;
    }
}

QMessageBox::StandardButton StandardFor(int answer) {
    switch (answer) {
    case kAnswerOk:
        return QMessageBox::Ok;
    case kAnswerCancel:
        return QMessageBox::Cancel;
    case kAnswerRetry:
        return QMessageBox::Retry;
    case kAnswerYes:
        return QMessageBox::Yes;
    case kAnswerNo:
        return QMessageBox::No;
    default:
        return QMessageBox::NoButton;
    }
}

} // namespace

WidgetPrompter::WidgetPrompter(QWidget* parent) : parent_(parent) {}

WidgetPrompter::~WidgetPrompter() {
    delete box_.data();
}

frm_MyMsgBox* WidgetPrompter::Box() {
    if (!box_) box_ = new frm_MyMsgBox(parent_);
    return box_;
}

int WidgetPrompter::MyMsgBox(const QString& message, int buttons) {
    frm_MyMsgBox* box = Box();
    if (!box->isVisible()) return ShowTimedBox(*box, message, buttons);
    // A question raised while the box is still open (a timer event during the
    // wait) gets a box of its own instead of taking over the open one.
    frm_MyMsgBox nested(parent_);
    return ShowTimedBox(nested, message, buttons);
}

int WidgetPrompter::SystemMsgBox(const QString& message, int buttons) {
    ButtonSet set = ButtonSetFor(buttons);
    if (set.defaultAnswer == 0) set = ButtonSetFor(kButtonsOk);
    QMessageBox box(IconFor(buttons), QGuiApplication::applicationDisplayName(), message,
                    QMessageBox::NoButton, parent_);
    bool hasCancel = false;
    for (int i = 0; i < set.count; ++i) {
        box.addButton(StandardFor(set.answers[i]));
        hasCancel = hasCancel || set.answers[i] == kAnswerCancel;
    }
    box.setDefaultButton(StandardFor(set.defaultAnswer));
    box.exec();
    QAbstractButton* clicked = box.clickedButton();
    if (clicked == nullptr) return hasCancel ? kAnswerCancel : set.defaultAnswer;
    for (int i = 0; i < set.count; ++i) {
        if (box.button(StandardFor(set.answers[i])) == clicked) return set.answers[i];
    }
    return set.defaultAnswer;
}

} // namespace quorvel
