#include "support/ui/progress_bar.h"

#include "common/recorders.h"

#include <QImage>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

constexpr int kWidth = 200;
constexpr int kHeight = 20;

// Counts pixels in columns [left, right) whose red part passes the test: the
// bar is blue (red 18), the background light blue (red 129), white text raises
// red above both and black text lowers it below the background.
template <typename Test> int CountPixels(const QImage& image, int left, int right, Test test) {
    int count = 0;
    for (int x = left; x < right; ++x) {
        for (int y = 0; y < image.height(); ++y)
            count += test(QColor(image.pixel(x, y)).red()) ? 1 : 0;
    }
    return count;
}

bool WhiteText(int red) {
    return red > 150;
}
bool DarkText(int red) {
    return red < 100;
}

class ProgressBarTest : public ::testing::Test {
protected:
    ProgressBarTest() : scope_(Ports{&prompter_, &clock_, nullptr}) { bar.resize(kWidth, kHeight); }

    QImage Render() { return bar.grab().toImage(); }

    testing::RecordingPrompter prompter_;
    testing::ManualClock clock_;
    ScopedPorts scope_;
    CProgress bar;
};

TEST_F(ProgressBarTest, QuarterOfTheTotalFillsAQuarterOfTheArea) {
    bar.Initialise(1000, 1, QStringLiteral("bytes"));
    bar.Show(250, QStringLiteral("site1.dat"));
    EXPECT_EQ(bar.BarWidth(), 50);
    const QImage image = Render();
    // Bottom row, clear of the caption: bar colour up to 50, background after.
    EXPECT_EQ(QColor(image.pixel(10, kHeight - 1)), CProgress::kBarColour);
    EXPECT_EQ(QColor(image.pixel(49, kHeight - 1)), CProgress::kBarColour);
    EXPECT_EQ(QColor(image.pixel(50, kHeight - 1)), CProgress::kBackColour);
    EXPECT_EQ(QColor(image.pixel(kWidth - 1, kHeight - 1)), CProgress::kBackColour);
}

TEST_F(ProgressBarTest, CentredCaptionIsWhiteOnlyWhereItCrossesTheBar) {
    bar.Initialise(1000, 1, QStringLiteral("bytes"));
    bar.Show(500, QStringLiteral("WWWWWWWWWWWWWWWWWW"));
    const QImage image = Render();
    EXPECT_GT(CountPixels(image, 0, 100, WhiteText), 0);
    EXPECT_EQ(CountPixels(image, 100, kWidth, WhiteText), 0);
    EXPECT_GT(CountPixels(image, 100, kWidth, DarkText), 0);
}

TEST_F(ProgressBarTest, TravellingCaptionRidesAtTheEndOfTheBar) {
    bar.Initialise(1000, 3, QStringLiteral("bytes"));
    bar.Show(750, QStringLiteral("site1.dat"));
    EXPECT_EQ(bar.Caption(), " site1.dat ");
    QImage image = Render();
    EXPECT_EQ(CountPixels(image, 0, 60, WhiteText), 0);
    EXPECT_GT(CountPixels(image, 90, 150, WhiteText), 0);
    // The black caption at the left lies under the bar; nothing dark beyond it.
    EXPECT_EQ(CountPixels(image, 150, kWidth, DarkText), 0);

    // While the bar is narrower than the caption, the caption stays at the left.
    bar.Show(50, QStringLiteral("site1.dat"));
    image = Render();
    EXPECT_GT(CountPixels(image, 0, 10, WhiteText), 0);
    EXPECT_GT(CountPixels(image, 10, kWidth, DarkText), 0);
}

TEST_F(ProgressBarTest, StylesPlaceTheCaption) {
    EXPECT_EQ(CProgress::CaptionFor(0, QStringLiteral("a")), " a");
    EXPECT_EQ(CProgress::CaptionFor(1, QStringLiteral("a")), "a");
    EXPECT_EQ(CProgress::CaptionFor(2, QStringLiteral("a")), "a ");
    EXPECT_EQ(CProgress::CaptionFor(3, QStringLiteral("a")), " a ");

    bar.Initialise(0, 2, {});
    bar.Show(0, QStringLiteral("WWWW"));
    // Right-aligned over a full bar: white at the right end only.
    const QImage image = Render();
    EXPECT_EQ(CountPixels(image, 0, 100, WhiteText), 0);
    EXPECT_GT(CountPixels(image, 150, kWidth, WhiteText), 0);
}

TEST_F(ProgressBarTest, ResizedBarKeepsItsShare) {
    bar.Initialise(1000, 0, QStringLiteral("bytes"));
    bar.Show(500, QStringLiteral("a"));
    bar.resize(400, kHeight);
    EXPECT_EQ(bar.BarWidth(), 200);
    EXPECT_EQ(QColor(bar.grab().toImage().pixel(199, kHeight - 1)), CProgress::kBarColour);
}

TEST_F(ProgressBarTest, WidthInEveryMode) {
    EXPECT_EQ(CProgress::BarWidthFor(50, -1, kWidth), 100);  // percentages
    EXPECT_EQ(CProgress::BarWidthFor(0, 0, kWidth), kWidth); // no total: full
    EXPECT_EQ(CProgress::BarWidthFor(12345, 0, kWidth), kWidth);
    EXPECT_EQ(CProgress::BarWidthFor(1500, 1000, kWidth), kWidth); // past the end
    EXPECT_EQ(CProgress::BarWidthFor(150, -1, kWidth), kWidth);
    EXPECT_EQ(CProgress::BarWidthFor(-5, -1, kWidth), 0);
    EXPECT_EQ(CProgress::BarWidthFor(1, 3, kWidth), 67); // rounded
    // Counts beyond 32 bits (files over 4 GB).
    EXPECT_EQ(CProgress::BarWidthFor(3'000'000'000LL, 6'000'000'000LL, kWidth), 100);
    EXPECT_EQ(CProgress::BarWidthFor(6'000'000'000LL, 8'000'000'000LL, kWidth), 150);
}

TEST_F(ProgressBarTest, FinishWritesTheSummaryWithTheElapsedTime) {
    bar.Initialise(20480, 3, QStringLiteral("bytes"));
    bar.Show(20480, QStringLiteral("site1.dat"));
    clock_.AdvanceSeconds(7);
    bar.Finish();
    EXPECT_TRUE(bar.Finished());
    EXPECT_EQ(bar.Caption(), "Finished: 20480 bytes in 00:00:07");
    // The bar is cleared: no blue left, the summary in black.
    const QImage image = Render();
    EXPECT_EQ(QColor(image.pixel(5, kHeight - 1)), CProgress::kBackColour);
    EXPECT_GT(CountPixels(image, 0, kWidth, [](int red) { return red < 30; }), 0);

    bar.Initialise(-1, 0, {});
    clock_.AdvanceSeconds(65);
    bar.Finish();
    EXPECT_EQ(bar.Caption(), "Finished: 00:01:05");
}

TEST_F(ProgressBarTest, LargeTotalsAppearInFull) {
    bar.Initialise(5'000'000'000LL, 3, QStringLiteral("bytes"));
    clock_.AdvanceSeconds(3 * 3600);
    bar.Finish();
    EXPECT_EQ(bar.Caption(), "Finished: 5000000000 bytes in 03:00");
}

TEST_F(ProgressBarTest, InitialiseStartsAFreshBar) {
    bar.Initialise(100, 0, QStringLiteral("bytes"));
    bar.Show(100, QStringLiteral("a"));
    bar.Finish();
    bar.Initialise(100, 0, QStringLiteral("bytes"));
    EXPECT_FALSE(bar.Finished());
    EXPECT_EQ(bar.BarWidth(), 0);
    const QImage image = Render();
    EXPECT_EQ(CountPixels(image, 0, kWidth, DarkText), 0);
    bar.Show(50, QStringLiteral("a"));
    EXPECT_EQ(bar.BarWidth(), 100);
}

} // namespace
} // namespace quorvel
