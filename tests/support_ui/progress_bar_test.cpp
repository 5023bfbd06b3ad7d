#include "support/ui/progress_bar.h"

#include "common/recorders.h"

#include <QImage>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

constexpr int kWidth = 200;
constexpr int kHeight = 20;

// Counts pixels of columns [left, right) by their red part: the bar has 18,
// the background 129; white text raises it above both, black text lowers it.
int Count(const QImage& image, int left, int right, bool white) {
    int count = 0;
    for (int x = left; x < right; ++x)
        for (int y = 0; y < image.height(); ++y) {
            const int red = QColor(image.pixel(x, y)).red();
            count += (white ? red > 150 : red < 100) ? 1 : 0;
        }
    return count;
}

class ProgressBarTest : public ::testing::Test {
protected:
    ProgressBarTest() : scope_(Ports{&prompter_, &clock_, nullptr}) { bar.resize(kWidth, kHeight); }
    QImage Render() { return bar.grab().toImage(); }
    QColor BottomPixel(int x) { return Render().pixel(x, kHeight - 1); }

    testing::RecordingPrompter prompter_;
    testing::ManualClock clock_;
    ScopedPorts scope_;
    CProgress bar;
};

// Before anything is shown the display looks idle: no coloured area at all.
TEST_F(ProgressBarTest, AnIdleDisplayShowsNoColouredBar) {
    for (const bool initialised : {false, true}) {
        if (initialised) bar.Initialise(1000, 1, QStringLiteral("bytes"));
        const QImage image = Render();
        for (const int x : {1, kWidth / 2, kWidth - 2})
            EXPECT_EQ(QColor(image.pixel(x, kHeight / 2)), bar.palette().color(QPalette::Window))
                << x << (initialised ? " initialised" : "");
    }
    bar.Show(0, QStringLiteral("site1.dat"));
    EXPECT_EQ(BottomPixel(kWidth / 2), CProgress::kBackColour);
}

TEST_F(ProgressBarTest, CentredCaptionIsWhiteOnlyOverAQuarterBar) {
    bar.Initialise(1000, 1, QStringLiteral("bytes"));
    bar.Show(250, QStringLiteral("WWWWWWWWWWWWWWWWWWWW"));
    EXPECT_EQ(BottomPixel(49), CProgress::kBarColour);
    EXPECT_EQ(BottomPixel(50), CProgress::kBackColour);
    const QImage image = Render();
    EXPECT_GT(Count(image, 0, 50, true), 0);
    EXPECT_EQ(Count(image, 50, kWidth, true), 0);
    EXPECT_GT(Count(image, 50, kWidth, false), 0);
    bar.resize(400, kHeight); // the bar keeps its share of a resized area
    EXPECT_EQ(BottomPixel(99), CProgress::kBarColour);
}

TEST_F(ProgressBarTest, TravellingCaptionRidesAtTheEndOfTheBar) {
    bar.Initialise(1000, 3, QStringLiteral("bytes"));
    bar.Show(750, QStringLiteral("site1.dat"));
    EXPECT_EQ(bar.Caption(), " site1.dat ");
    QImage image = Render();
    EXPECT_EQ(Count(image, 0, 60, true), 0);
    EXPECT_GT(Count(image, 90, 150, true), 0);
    EXPECT_EQ(Count(image, 150, kWidth, false), 0); // the black caption is under the bar
    bar.Show(50, QStringLiteral("site1.dat"));      // narrower than the caption: stays left
    image = Render();
    EXPECT_GT(Count(image, 0, 10, true), 0);
    EXPECT_GT(Count(image, 10, kWidth, false), 0);
}

TEST_F(ProgressBarTest, WidthInEveryMode) {
    EXPECT_EQ(CProgress::BarWidthFor(50, -1, kWidth), 100); // percentages
    EXPECT_EQ(CProgress::BarWidthFor(12345, 0, kWidth), kWidth);
    EXPECT_EQ(CProgress::BarWidthFor(-5, -1, kWidth), 0);
    EXPECT_EQ(CProgress::BarWidthFor(1, 3, kWidth), 67);
    EXPECT_EQ(CProgress::BarWidthFor(6'000'000'000LL, 8'000'000'000LL, kWidth), 150);
    bar.Initialise(0, 2, {});
    bar.Show(0, QStringLiteral("WWWW")); // right-aligned over a full bar
    const QImage image = Render();
    EXPECT_EQ(Count(image, 0, 100, true), 0);
    EXPECT_GT(Count(image, 150, kWidth, true), 0);
}

TEST_F(ProgressBarTest, FinishWritesTheSummaryWithTheElapsedTime) {
    bar.Initialise(20480, 3, QStringLiteral("bytes"));
    bar.Show(20480, QStringLiteral("site1.dat"));
    clock_.AdvanceSeconds(7);
    bar.Finish();
    EXPECT_EQ(bar.Caption(), "Finished: 20480 bytes in 00:00:07");
    EXPECT_EQ(BottomPixel(5), CProgress::kBackColour);
    EXPECT_GT(Count(Render(), 0, kWidth, false), 0);
    bar.Initialise(-1, 0, {});
    clock_.AdvanceSeconds(65);
    bar.Finish();
    EXPECT_EQ(bar.Caption(), "Finished: 00:01:05");
    bar.Initialise(5'000'000'000LL, 3, QStringLiteral("bytes"));
    EXPECT_EQ(Count(Render(), 0, kWidth, false), 0); // a fresh, empty bar
}

} // namespace
} // namespace quorvel
