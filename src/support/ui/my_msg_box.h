#pragma once
// The program's own message box: one to three buttons and a count-down that
// closes the box with its default answer when nobody answers in time, so that
// unattended runs are never held up for long.

#include "support/ui/button_sets.h"
#include "support/ui/msg_box_layout.h"

#include <QDeadlineTimer>
#include <QDialog>
#include <QTimer>

#include <array>

class QLabel;
class QPushButton;

namespace quorvel {

class frm_MyMsgBox : public QDialog {
    Q_OBJECT
public:
    explicit frm_MyMsgBox(QWidget* parent = nullptr);

    // Set before each showing; the box keeps them until set anew.
    void SetMessage(const QString& message);
    void SetWhichButtons(int buttons);
    QString Message() const { return message_; }
    int WhichButtons() const { return whichButtons_; }

    // The answer of the last showing: the clicked button's code, or the set's
    // default when the count-down ran out.
    int Response() const { return response_; }

    // Geometry of the current (or last) showing.
    const MsgBoxLayout& Layout() const { return layout_; }
    QRect TextRect() const { return layout_.textRect; }
    QSize ButtonSize() const { return buttonSize_; }

    // The count-down's figure for the time left; 0 ends the box.
    static int SecondsLeft(qint64 remainingMs);

protected:
    void showEvent(QShowEvent* event) override;
    void hideEvent(QHideEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void reject() override;

private:
    void Activate();
    void LayOut();
    void CountDown();
    void Answer(int index);
    void Close();
    void StartTick();

    QString message_;
    int whichButtons_ = 0;
    int response_ = 0;
    bool active_ = false;
    ButtonSet set_;
    MsgBoxLayout layout_;
    QSize buttonSize_;
    std::array<QPushButton*, 3> buttons_{};
    QLabel* countDown_ = nullptr;
    QTimer timer_;
    QDeadlineTimer deadline_;
};

} // namespace quorvel
