#include "support/ui/hint_list.h"

#include <QPainter>

namespace quorvel {

void HintList::SetEmptyHint(const QString& text) {
    if (text == hint_) return;
    hint_ = text;
    viewport()->update();
}

void HintList::paintEvent(QPaintEvent* event) {
    QListWidget::paintEvent(event);
    if (count() > 0 || hint_.isEmpty()) return;
    QPainter painter(viewport());
    painter.setPen(palette().color(QPalette::PlaceholderText));
    const int margin = fontMetrics().height() / 2;
    painter.drawText(viewport()->rect().adjusted(margin, margin, -margin, -margin),
                     Qt::AlignCenter | Qt::TextWordWrap, hint_);
}

} // namespace quorvel
