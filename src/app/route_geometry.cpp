#include "app/route_geometry.h"

#include "app/file_record.h"
#include "support/value_rules.h"

#include <cmath>

namespace quorvel {

namespace {

constexpr double kHalfAngle = 18 * 3.14159 / 180;

int Nearest(double value) {
    return static_cast<int>(RoundHalfEven(value));
}

int Sign(int value) {
    return (value > 0) - (value < 0);
}

bool IsRow(int index) {
    return index >= 0 && index < 5;
}

QPoint ToPixels(const RouteLayout& layout, QPoint point) {
    return {Nearest(point.x() / layout.unitsPerPixelX), Nearest(point.y() / layout.unitsPerPixelY)};
}

RouteStroke Stroke(const RouteLayout& layout, RouteColour colour, int width, QPoint from,
                   QPoint to) {
    return {colour, width, from, to,
            ArrowPolygon(ToPixels(layout, from), ToPixels(layout, to), kArrowPosition)};
}

} // namespace

int RouteRowOffset(int optionHeight, int pictureTop) {
    return optionHeight / 2 - pictureTop;
}

int RouteShift(int pixel, int downloadRule, int uploadRule) {
    return downloadRule != kDownloadNever && uploadRule != kUploadNever ? 2 * pixel : 0;
}

std::vector<RouteStroke> RouteStrokes(const RouteLayout& layout, int adminIndex, int userIndex,
                                      int downloadRule, int uploadRule) {
    std::vector<RouteStroke> strokes;
    if (!IsRow(adminIndex) || !IsRow(userIndex)) return strokes;
    const int shift = RouteShift(layout.pixel, downloadRule, uploadRule);
    const int userRow = layout.userTops[userIndex] + layout.rowOffset;
    if (downloadRule > kDownloadNever) {
        const int yA = layout.adminTops[adminIndex] + layout.rowOffset - shift;
        const int width = downloadRule == kDownloadAlways ? 2 : 1;
        strokes.push_back(
            Stroke(layout, kDownloadColour, width, {0, yA}, {layout.innerWidth, userRow - shift}));
    }
    if (uploadRule > kUploadNever) {
        // Uploads always arrive in the user's own folders at the service.
        const int adminRow =
            adminIndex == kLocationUserCurrent ? kLocationUserCurrent : kLocationUser;
        const int yA = layout.adminTops[adminRow] + layout.rowOffset + shift;
        strokes.push_back(
            Stroke(layout, kUploadColour, 2, {layout.innerWidth, userRow + shift}, {0, yA}));
    }
    return strokes;
}

std::optional<ArrowHead> ArrowPolygon(QPoint from, QPoint to, float fraction) {
    const int dx = to.x() - from.x();
    const int dy = to.y() - from.y();
    if (dx == 0 && dy == 0) return std::nullopt;
    const double f = fraction; // the single-precision fraction, widened as the arithmetic does
    const QPoint tip(Nearest(f * dx + from.x()), Nearest(f * dy + from.y()));
    QPoint back1, back2;
    if (dx != 0 && dy != 0) {
        const double angle = std::atan(static_cast<double>(dx) / dy);
        const int s = Sign(dy);
        back1 = {Nearest(kArrowLength * std::sin(angle - kHalfAngle) * s),
                 Nearest(kArrowLength * std::cos(angle - kHalfAngle) * s)};
        back2 = {Nearest(kArrowLength * std::sin(angle + kHalfAngle) * s),
                 Nearest(kArrowLength * std::cos(angle + kHalfAngle) * s)};
    } else if (dy == 0) {
        back1 = {kArrowLength * Sign(dx), kArrowHalfWidth};
        back2 = {kArrowLength * Sign(dx), -kArrowHalfWidth};
    } else {
        back1 = {kArrowHalfWidth, kArrowLength * Sign(dy)};
        back2 = {-kArrowHalfWidth, kArrowLength * Sign(dy)};
    }
    return ArrowHead{tip, tip - back1, tip - back2, tip};
}

} // namespace quorvel
