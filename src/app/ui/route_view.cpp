#include "app/ui/route_view.h"

#include <QPainter>

namespace quorvel {

namespace {

QColor ToColour(const RouteColour& colour) {
    return QColor(colour.red, colour.green, colour.blue);
}

} // namespace

RouteView::RouteView(const QString& name, QWidget* parent) : QWidget(parent) {
    setObjectName(name);
    setAttribute(Qt::WA_TransparentForMouseEvents);
}

void RouteView::SetSource(QWidget* page, Source source) {
    page_ = page;
    source_ = std::move(source);
}

void RouteView::paintEvent(QPaintEvent*) {
    if (!page_ || !source_) return;
    const RouteDrawing drawing = source_();
    QPainter painter(this);
    painter.translate(drawing.origin - mapTo(page_, QPoint(0, 0)));
    for (const auto& stroke : drawing.strokes) {
        const QColor colour = ToColour(stroke.colour);
        painter.setPen(QPen(colour, stroke.lineWidth, Qt::SolidLine, Qt::FlatCap));
        painter.drawLine(stroke.from, stroke.to);
        if (stroke.arrow) {
            painter.setPen(QPen(colour, 1));
            painter.setBrush(colour);
            painter.drawPolygon(stroke.arrow->data(), static_cast<int>(stroke.arrow->size()));
            painter.setBrush(Qt::NoBrush);
        }
    }
}

} // namespace quorvel
