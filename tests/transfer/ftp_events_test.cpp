// Connection events turned into status texts, traces and progress.
#include "common/recorders.h"
#include "transfer/ftp_status_events.h"

#include <gtest/gtest.h>

namespace quorvel {
namespace {

class FtpEventsTest : public ::testing::Test {
protected:
    void SetUp() override {
        report.SetDisplay(&view, &progress);
        report.SetTracing(true);
    }
    HandleIds ids;
    FtpReport report{ids};
    testing::RecordingPorts ports;
    testing::RecordingTraceView view;
    testing::RecordingProgressView progress;
};

TEST_F(FtpEventsTest, DownloadBeyondFourGigabytesCountsIn64BitsAndNeverPastOneHundredPercent) {
    const std::int64_t total = (std::int64_t{5} << 30) + 7;
    report.Counters().currentFile = QStringLiteral("big.dat");
    report.ProgressStart(TransferState::Download, total, QStringLiteral("big.dat=>/tmp/big.dat"));
    HandleFtpStatus(report, 41, QString(), std::int64_t{3} << 30);
    HandleFtpStatus(report, 41, QString(), total - (std::int64_t{3} << 30));
    EXPECT_EQ(progress.total, total);
    ASSERT_EQ(progress.steps.size(), 2u);
    EXPECT_EQ(progress.steps[1].value, total);
    EXPECT_EQ(progress.steps[1].text, QStringLiteral("big.dat"));
    EXPECT_TRUE(
        view.traces.last().contains(QStringLiteral(":Downloading  5368709127 of 5368709127 ")));
    EXPECT_EQ(
        view.traces.filter(QStringLiteral("FTPProgress: 5368709127/5368709127 = 100%")).size(), 1);

    // Progress beyond the total has no percentage.
    EXPECT_EQ(PercentText(26, 25), QString());
    EXPECT_EQ(PercentText(5, 0), QString());
    EXPECT_EQ(PercentText(25, 100), QStringLiteral("25%"));
}

} // namespace
} // namespace quorvel
