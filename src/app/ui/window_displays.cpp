#include "app/ui/window_displays.h"

#include "support/ui/status_label.h"

#include <QComboBox>
#include <QListWidget>

namespace quorvel {

void ComboBoxSink::Clear() {
    combo_->clear();
}

void ComboBoxSink::AddItem(const QString& text, int itemData) {
    combo_->addItem(text, itemData);
}

void ComboBoxSink::SetCurrentIndex(int index) {
    combo_->setCurrentIndex(index);
}

void FtpDisplay::AddTrace(const QString& line) {
    trace_->addItem(line);
    trace_->scrollToItem(trace_->item(trace_->count() - 1), QAbstractItemView::PositionAtTop);
}

void FtpDisplay::ShowStatus(const QString& text) {
    SetStatusLabel(status_, text);
}

} // namespace quorvel
