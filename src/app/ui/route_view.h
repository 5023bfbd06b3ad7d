#pragma once
// A picture that draws part of the route diagram. The lines are given in the
// coordinates of a common origin widget, so that several pictures side by side
// show one unbroken drawing.

#include <QColor>
#include <QPoint>
#include <QPolygon>
#include <QWidget>

#include <functional>
#include <vector>

namespace quorvel {

struct RouteStroke {
    QPoint from;
    QPoint to;
    QColor colour;
    int width = 1;
    QPolygon arrowHead; // filled in the stroke's colour; empty for none
};

class RouteView : public QWidget {
    Q_OBJECT
public:
    using Source = std::function<std::vector<RouteStroke>()>;

    RouteView(const QString& name, QWidget* parent);

    // origin: the widget whose coordinates the strokes use.
    void SetSource(QWidget* origin, Source source);

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    QWidget* origin_ = nullptr;
    Source source_;
};

} // namespace quorvel
