#pragma once
// The route diagram between the "Admin PC" and "User PC" location rows: which
// lines to draw, where, in which colour and width, and the arrow heads.
//
// Positions are in the picture's units; arrow heads are in device pixels. With
// a picture measured in pixels both scales are 1.

#include <QPoint>

#include <array>
#include <optional>
#include <vector>

namespace quorvel {

struct RouteColour {
    int red = 0, green = 0, blue = 0;
    bool operator==(const RouteColour&) const = default;
};

inline constexpr RouteColour kDownloadColour{128, 0, 0}; // dark red
inline constexpr RouteColour kUploadColour{0, 0, 255};   // blue
inline constexpr float kArrowPosition = 0.65f;           // tip at 65 % of the line
inline constexpr int kArrowLength = 12;                  // pixels back from the tip
inline constexpr int kArrowHalfWidth = 4;                // pixels, for level or upright lines

// Added to an option button's top it gives the row's vertical centre in the picture.
int RouteRowOffset(int optionHeight, int pictureTop);
// Download and upload lines move apart by this much when both are drawn.
int RouteShift(int pixel, int downloadRule, int uploadRule);

struct RouteLayout {
    std::array<int, 5> adminTops{}; // tops of the "Admin PC" option rows 0 to 4
    std::array<int, 5> userTops{};  // tops of the "User PC" option rows 0 to 4
    int rowOffset = 0;              // RouteRowOffset
    int pixel = 1;                  // one screen pixel in picture units
    int innerWidth = 0;             // the picture's inner width
    double unitsPerPixelX = 1.0;    // picture units per device pixel
    double unitsPerPixelY = 1.0;
};

using ArrowHead = std::array<QPoint, 4>; // closed: the last point repeats the tip

struct RouteStroke {
    RouteColour colour;
    int lineWidth = 1; // pixels
    QPoint from, to;   // picture units
    std::optional<ArrowHead> arrow;
};

// The strokes for the selected rows and rules: a download line from the admin
// row to the user row (2 pixels wide for "Always", else 1), then an upload line
// from the user row back to the admin side's user or user season row. None
// for a rule "Never" or a row index outside 0 to 4.
std::vector<RouteStroke> RouteStrokes(const RouteLayout& layout, int adminIndex, int userIndex,
                                      int downloadRule, int uploadRule);

// The filled head of an arrow from (x1, y1) to (x2, y2), in device pixels, its
// tip at fraction of the way; nullopt when the two points are the same.
std::optional<ArrowHead> ArrowPolygon(QPoint from, QPoint to, float fraction = kArrowPosition);

} // namespace quorvel
