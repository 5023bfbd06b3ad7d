#pragma once
// The window's prompter: questions of runs go to the timed box, the rest to
// the system's message box, which waits for an answer.

#include "support/ports.h"

#include <QPointer>

class QWidget;

namespace quorvel {

class frm_MyMsgBox;

class WidgetPrompter : public Prompter {
public:
    explicit WidgetPrompter(QWidget* parent = nullptr);
    ~WidgetPrompter() override;
    WidgetPrompter(const WidgetPrompter&) = delete;
    WidgetPrompter& operator=(const WidgetPrompter&) = delete;

    // Shows the one timed box (created on first use and reused) modally.
    int MyMsgBox(const QString& message, int buttons) override;
    // Shows a QMessageBox with the set's buttons and icon and waits.
    int SystemMsgBox(const QString& message, int buttons) override;

    // The timed box, created on first use.
    frm_MyMsgBox* Box();

private:
    QPointer<QWidget> parent_;
    QPointer<frm_MyMsgBox> box_;
};

} // namespace quorvel
