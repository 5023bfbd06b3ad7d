#include "app/ui/route_view.h"

#include <QPainter>

namespace quorvel {

RouteView::RouteView(const QString& name, QWidget* parent) : QWidget(parent) {
    setObjectName(name);
    setAttribute(Qt::WA_TransparentForMouseEvents);
}

void RouteView::SetSource(QWidget* origin, Source source) {
    origin_ = origin;
    source_ = std::move(source);
}

void RouteView::paintEvent(QPaintEvent*) {
    if (!origin_ || !source_) return;
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.translate(-mapTo(origin_, QPoint(0, 0)));
    for (const auto& stroke : source_()) {
        QPen pen(stroke.colour, stroke.width, Qt::SolidLine, Qt::FlatCap);
        painter.setPen(pen);
        painter.drawLine(stroke.from, stroke.to);
        if (stroke.arrowHead.size() >= 3) {
            painter.setPen(QPen(stroke.colour, 1));
            painter.setBrush(stroke.colour);
            painter.drawPolygon(stroke.arrowHead);
            painter.setBrush(Qt::NoBrush);
        }
    }
}

} // namespace quorvel
