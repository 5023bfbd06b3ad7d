// Lines and arrow heads of the route diagram.

#include "app/file_record.h"
#include "app/route_geometry.h"

#include <gtest/gtest.h>

namespace quorvel {
namespace {

// A picture measured in twips, 15 to the pixel, rows 300 apart, centres 113 above the tops.
RouteLayout TwipLayout() {
    RouteLayout layout;
    layout.adminTops = {0, 300, 600, 900, 1200};
    layout.userTops = layout.adminTops;
    layout.rowOffset = RouteRowOffset(255, 240);
    layout.pixel = 15;
    layout.innerWidth = 1500;
    layout.unitsPerPixelX = layout.unitsPerPixelY = 15;
    return layout;
}

ArrowHead Head(QPoint tip, QPoint back1, QPoint back2) {
    return {tip, back1, back2, tip};
}

TEST(RouteLines, DownloadRunsDarkRedFromTheAdminRowToTheUserRow) {
    EXPECT_TRUE(RouteStrokes(TwipLayout(), 0, 2, kDownloadNever, kUploadNever).empty());
    const auto strokes = RouteStrokes(TwipLayout(), 0, 2, kDownloadAlways, kUploadNever);
    ASSERT_EQ(strokes.size(), 1u);
    EXPECT_EQ(strokes[0].colour, (RouteColour{128, 0, 0}));
    EXPECT_EQ(strokes[0].lineWidth, 2);
    EXPECT_EQ(strokes[0].from, QPoint(0, -113));
    EXPECT_EQ(strokes[0].to, QPoint(1500, 487));
    // In pixels (0, -8) to (100, 32): the tip at 65 %, pointing to the user side.
    EXPECT_EQ(strokes[0].arrow, Head({65, 18}, {56, 10}, {53, 17}));
    EXPECT_EQ(RouteStrokes(TwipLayout(), 1, 1, kDownloadDate, kUploadNever)[0].lineWidth, 1);
}

TEST(RouteLines, UploadsEndAtTheUsersOwnRowOnTheAdminSide) {
    auto strokes =
        RouteStrokes(TwipLayout(), kLocationApplication, 1, kDownloadNever, kUploadAlways);
    ASSERT_EQ(strokes.size(), 1u);
    EXPECT_EQ(strokes[0].colour, (RouteColour{0, 0, 255}));
    EXPECT_EQ(strokes[0].from, QPoint(1500, 300 - 113));
    EXPECT_EQ(strokes[0].to, QPoint(0, 600 - 113));
    strokes = RouteStrokes(TwipLayout(), kLocationUserCurrent, 0, kDownloadNever, kUploadOnce);
    EXPECT_EQ(strokes[0].to, QPoint(0, 900 - 113));
}

TEST(RouteLines, BothDirectionsMoveTwoPixelsApart) {
    const auto strokes =
        RouteStrokes(TwipLayout(), kLocationUser, 1, kDownloadAlways, kUploadAlways);
    ASSERT_EQ(strokes.size(), 2u);
    EXPECT_EQ(strokes[0].from, QPoint(0, 600 - 113 - 30));
    EXPECT_EQ(strokes[0].to, QPoint(1500, 300 - 113 - 30));
    EXPECT_EQ(strokes[1].from, QPoint(1500, 300 - 113 + 30));
    EXPECT_EQ(strokes[1].to, QPoint(0, 600 - 113 + 30));
    EXPECT_TRUE(RouteStrokes(TwipLayout(), -1, 0, kDownloadAlways, kUploadAlways).empty());
}

TEST(ArrowHead, PointsAlongTheLineWithItsTipAtSixtyFivePercent) {
    // 65 % of 30 pixels is just below 19.5 in single precision, so the tip is at 19.
    EXPECT_EQ(ArrowPolygon({0, 0}, {30, 0}), Head({19, 0}, {7, -4}, {7, 4}));
    EXPECT_EQ(ArrowPolygon({10, 0}, {10, 100}), Head({10, 65}, {6, 53}, {14, 53}));
    EXPECT_FALSE(ArrowPolygon({4, 4}, {4, 4}).has_value());
    // Slanted lines, both ways: the back points lie towards the start.
    EXPECT_EQ(ArrowPolygon({0, 0}, {100, 100}), Head({65, 65}, {60, 54}, {54, 60}));
    EXPECT_EQ(ArrowPolygon({100, 50}, {0, 0}), Head({35, 18}, {44, 26}, {47, 20}));
}

} // namespace
} // namespace quorvel
