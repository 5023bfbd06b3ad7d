#include "support/ui/status_label.h"

#include <QApplication>
#include <QLabel>

namespace quorvel {

void SetStatusLabel(QLabel* label, const QString& text) {
    if (label == nullptr) return;
    QPalette palette = label->palette();
    const QColor face = QApplication::palette(label).color(QPalette::Button);
    palette.setColor(QPalette::Window, text.isEmpty() ? face : kStatusHighlight);
    label->setAutoFillBackground(true);
    label->setPalette(palette);
    label->setText(text);
    label->repaint();
}

} // namespace quorvel
