#pragma once
// A picture that shows part of the route diagram. The diagram is laid out on
// one virtual picture between the two location frames; each RouteView paints
// the piece of it that lies under itself, so pictures side by side (one of them
// inside the "User PC" frame) show one unbroken drawing.

#include "app/route_geometry.h"

#include <QPoint>
#include <QWidget>

#include <functional>
#include <vector>

namespace quorvel {

struct RouteDrawing {
    QPoint origin; // the virtual picture's top left, in the page's coordinates
    std::vector<RouteStroke> strokes;
};

class RouteView : public QWidget {
    Q_OBJECT
public:
    using Source = std::function<RouteDrawing()>;

    RouteView(const QString& name, QWidget* parent);

    // page: the widget whose coordinates RouteDrawing::origin uses.
    void SetSource(QWidget* page, Source source);

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    QWidget* page_ = nullptr;
    Source source_;
};

} // namespace quorvel
