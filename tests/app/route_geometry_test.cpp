// Lines and arrow heads of the route diagram.

#include "app/file_record.h"
#include "app/route_geometry.h"

#include <gtest/gtest.h>

namespace quorvel {
namespace {

// A picture measured in twips, 15 to the pixel, rows 300 apart.
RouteLayout TwipLayout() {
    RouteLayout layout;
    layout.adminTops = {0, 300, 600, 900, 1200};
    layout.userTops = {0, 300, 600, 900, 1200};
    layout.rowOffset = RouteRowOffset(255, 240);
    layout.pixel = 15;
    layout.innerWidth = 1500;
    layout.unitsPerPixelX = 15;
    layout.unitsPerPixelY = 15;
    return layout;
}

TEST(RouteLines, NothingIsDrawnWhenNeitherDirectionIsUsed) {
    EXPECT_TRUE(RouteStrokes(TwipLayout(), 0, 2, kDownloadNever, kUploadNever).empty());
}

TEST(RouteLines, RowOffsetCentresTheLineOnTheRows) {
    EXPECT_EQ(RouteRowOffset(255, 240), -113);
    EXPECT_EQ(RouteRowOffset(24, 0), 12);
}

TEST(RouteLines, DownloadAlwaysIsOneWideDarkRedLineToTheUserRow) {
    const auto strokes = RouteStrokes(TwipLayout(), 0, 2, kDownloadAlways, kUploadNever);
    ASSERT_EQ(strokes.size(), 1u);
    const RouteStroke& s = strokes[0];
    EXPECT_EQ(s.colour, (RouteColour{128, 0, 0}));
    EXPECT_EQ(s.lineWidth, 2);
    EXPECT_EQ(s.from, QPoint(0, -113));
    EXPECT_EQ(s.to, QPoint(1500, 487));
    // In pixels the line runs from (0, -8) to (100, 32); the tip lies at 65 %.
    ASSERT_TRUE(s.arrow.has_value());
    EXPECT_EQ(*s.arrow,
              (ArrowHead{QPoint(65, 18), QPoint(56, 10), QPoint(53, 17), QPoint(65, 18)}));
}

TEST(RouteLines, DownloadByDateOrOnceIsOnePixelWide) {
    for (int rule : {int(kDownloadOnce), int(kDownloadDate)}) {
        const auto strokes = RouteStrokes(TwipLayout(), 1, 1, rule, kUploadNever);
        ASSERT_EQ(strokes.size(), 1u);
        EXPECT_EQ(strokes[0].lineWidth, 1);
    }
}

TEST(RouteLines, UploadsFromTheApplicationRowEndAtTheUserFolderRow) {
    const auto strokes =
        RouteStrokes(TwipLayout(), kLocationApplication, 1, kDownloadNever, kUploadAlways);
    ASSERT_EQ(strokes.size(), 1u);
    const RouteStroke& s = strokes[0];
    EXPECT_EQ(s.colour, (RouteColour{0, 0, 255}));
    EXPECT_EQ(s.lineWidth, 2);
    EXPECT_EQ(s.from, QPoint(1500, 300 - 113));
    EXPECT_EQ(s.to, QPoint(0, 600 - 113));
}

TEST(RouteLines, UploadsKeepTheSeasonRow) {
    const auto strokes =
        RouteStrokes(TwipLayout(), kLocationUserCurrent, 0, kDownloadNever, kUploadOnce);
    ASSERT_EQ(strokes.size(), 1u);
    EXPECT_EQ(strokes[0].to, QPoint(0, 900 - 113));
}

TEST(RouteLines, BothDirectionsMoveTwoPixelsApart) {
    const auto strokes =
        RouteStrokes(TwipLayout(), kLocationUser, 1, kDownloadAlways, kUploadAlways);
    ASSERT_EQ(strokes.size(), 2u);
    EXPECT_EQ(strokes[0].colour, kDownloadColour);
    EXPECT_EQ(strokes[0].from, QPoint(0, 600 - 113 - 30));
    EXPECT_EQ(strokes[0].to, QPoint(1500, 300 - 113 - 30));
    EXPECT_EQ(strokes[1].colour, kUploadColour);
    EXPECT_EQ(strokes[1].from, QPoint(1500, 300 - 113 + 30));
    EXPECT_EQ(strokes[1].to, QPoint(0, 600 - 113 + 30));
    EXPECT_EQ(RouteShift(1, kDownloadDate, kUploadNever), 0);
    EXPECT_EQ(RouteShift(1, kDownloadDate, kUploadOnce), 2);
}

TEST(RouteLines, ARowOutsideTheGroupDrawsNothing) {
    EXPECT_TRUE(RouteStrokes(TwipLayout(), -1, 0, kDownloadAlways, kUploadAlways).empty());
    EXPECT_TRUE(RouteStrokes(TwipLayout(), 0, 5, kDownloadAlways, kUploadAlways).empty());
}

TEST(ArrowHead, LevelLineHasBackPointsTwelveBehindAndFourAside) {
    // 65 % of 30 pixels is just below 19.5 in single precision, so the tip is at 19.
    EXPECT_EQ(*ArrowPolygon({0, 0}, {30, 0}),
              (ArrowHead{QPoint(19, 0), QPoint(7, -4), QPoint(7, 4), QPoint(19, 0)}));
    EXPECT_EQ(*ArrowPolygon({100, 5}, {0, 5}),
              (ArrowHead{QPoint(35, 5), QPoint(47, 1), QPoint(47, 9), QPoint(35, 5)}));
}

TEST(ArrowHead, UprightLineHasBackPointsAboveTheTip) {
    EXPECT_EQ(*ArrowPolygon({10, 0}, {10, 100}),
              (ArrowHead{QPoint(10, 65), QPoint(6, 53), QPoint(14, 53), QPoint(10, 65)}));
}

TEST(ArrowHead, SlantedLinesPointAlongTheLine) {
    EXPECT_EQ(*ArrowPolygon({0, 0}, {100, 100}),
              (ArrowHead{QPoint(65, 65), QPoint(60, 54), QPoint(54, 60), QPoint(65, 65)}));
    // Going up and to the left the back points lie below and to the right of the tip.
    EXPECT_EQ(*ArrowPolygon({100, 50}, {0, 0}),
              (ArrowHead{QPoint(35, 18), QPoint(44, 26), QPoint(47, 20), QPoint(35, 18)}));
}

TEST(ArrowHead, NoHeadForALineOfNoLength) {
    EXPECT_FALSE(ArrowPolygon({4, 4}, {4, 4}).has_value());
}

} // namespace
} // namespace quorvel
