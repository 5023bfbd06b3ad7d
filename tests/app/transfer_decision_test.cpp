// The decision of a run for one file, and the record rules that keep a
// record's choices consistent.

#include "app/run/transfer_decision.h"

#include <gtest/gtest.h>

namespace quorvel {
namespace {

constexpr int N = kDownloadNever, A = kDownloadAlways, O = kDownloadOnce, D = kDownloadDate;
constexpr int C = kMethodCompleteFile, W = kMethodOnlyNewData; // whole file, new records
constexpr int kNone = -1;

struct Row {
    int download, upload, method;
    bool zip, downloadOnly, local, remote;
    int listDay, localDay;
    int down, up; // the method of each transfer, kNone for none
};

// clang-format off
const Row kRows[] = {
    // download upload method zip only local remote list local -> down up
    {N, N, C, 0, 0, 1, 1,  0,  0, kNone, kNone},
    {A, N, C, 0, 0, 1, 1,  0,  0, C,     kNone},
    {A, N, W, 0, 0, 1, 1,  0,  0, W,     kNone},
    {A, N, W, 0, 0, 0, 1,  0,  0, C,     kNone}, // nothing local to append to
    {O, N, C, 0, 0, 1, 1,  0,  0, kNone, kNone},
    {O, N, C, 0, 0, 0, 1,  0,  0, C,     kNone},
    {O, N, W, 0, 0, 0, 1,  0,  0, C,     kNone},
    {D, N, C, 0, 0, 1, 1, 10,  9, C,     kNone},
    {D, N, W, 0, 0, 1, 1, 10, 10, kNone, kNone}, // the same day
    {D, N, W, 0, 0, 1, 1, 10,  0, W,     kNone}, // an unreadable local date
    {D, N, W, 0, 0, 1, 1,  0,  0, kNone, kNone}, // no list date either
    {N, A, C, 0, 0, 1, 1,  0,  0, kNone, C},
    {N, A, W, 0, 0, 1, 1,  0,  0, kNone, W},
    {N, A, W, 0, 0, 0, 1,  0,  0, kNone, W},
    {O, A, W, 0, 0, 0, 1,  0,  0, C,     kNone}, // nothing local to send either
    {O, A, C, 0, 0, 0, 1,  0,  0, C,     C},
    {A, A, C, 0, 0, 1, 1,  0,  0, C,     C},     // a list may hold what the fields exclude
    {N, O, C, 0, 0, 1, 0,  0,  0, kNone, C},
    {N, O, C, 0, 0, 1, 1,  0,  0, kNone, kNone},
    {N, O, W, 0, 0, 1, 0,  0,  0, kNone, W},
    {D, O, C, 0, 0, 1, 0, 10,  9, C,     C},
    {A, N, W, 1, 0, 1, 1,  0,  0, C,     kNone}, // zipped files travel whole
    {N, A, W, 1, 0, 1, 1,  0,  0, kNone, C},
    // "Download only": whatever moves either way comes down, nothing goes up.
    {N, N, W, 0, 1, 1, 1,  0,  0, kNone, kNone},
    {N, A, W, 0, 1, 1, 1,  0,  0, W,     kNone},
    {N, A, W, 0, 1, 0, 1,  0,  0, C,     kNone},
    {N, O, C, 0, 1, 1, 1,  0,  0, C,     kNone},
    {D, N, C, 0, 1, 1, 1, 10, 10, C,     kNone},
    {O, N, W, 0, 1, 1, 1,  0,  0, W,     kNone},
    {A, A, C, 1, 1, 1, 0,  0,  0, C,     kNone},
};
// clang-format on

TEST(TransferDecision, EveryRuleAgainstEveryMethodAndWhatLiesOnEitherSide) {
    for (std::size_t i = 0; i < std::size(kRows); ++i) {
        const Row& r = kRows[i];
        const TransferRules rules{r.download, r.upload, r.method, r.zip};
        TransferFacts facts{r.downloadOnly, r.local, r.remote, r.listDay, r.localDay};
        const TransferPlan plan = DecideTransfers(rules, facts);
        EXPECT_EQ(plan.download ? plan.downloadMethod : kNone, r.down) << "row " << i;
        EXPECT_EQ(plan.upload ? plan.uploadMethod : kNone, r.up) << "row " << i;
        // The service is asked about the file only where the answer counts.
        EXPECT_EQ(NeedsRemoteCheck(rules, r.downloadOnly),
                  r.upload == kUploadOnce && !r.downloadOnly)
            << "row " << i;
        EXPECT_EQ(plan.newerListDate, r.download == D && !r.downloadOnly && r.down != kNone)
            << "row " << i;
    }
}

TEST(RecordRules, EachChoiceSettlesTheOthers) {
    using Choose = TransferRules (*)(TransferRules, int);
    const auto zip = [](TransferRules r, int on) { return ChooseZip(r, on != 0); };
    struct Step {
        Choose choose;
        int value;
        TransferRules after; // download, upload, method, zip
    };
    TransferRules rules{N, kUploadNever, C, false};
    const Step steps[] = {
        {ChooseUpload, kUploadAlways, {N, kUploadAlways, C, false}},
        {ChooseDownload, A, {A, kUploadNever, C, false}},
        {zip, 1, {A, kUploadNever, C, true}},
        {ChooseMethod, W, {A, kUploadNever, W, false}},
        {zip, 1, {A, kUploadNever, C, true}},
        {ChooseUpload, kUploadOnce, {A, kUploadOnce, C, true}},
        {ChooseUpload, kUploadAlways, {N, kUploadAlways, C, true}},
        {ChooseDataType, 4, {N, kUploadAlways, W, false}},
        {zip, 1, {N, kUploadAlways, C, true}},
        {ChooseDataType, 0, {N, kUploadAlways, C, true}},
    };
    for (std::size_t i = 0; i < std::size(steps); ++i) {
        rules = steps[i].choose(rules, steps[i].value);
        EXPECT_EQ(rules, steps[i].after) << "step " << i;
    }
}

TEST(RecordRules, ARecordIsTakenAsItsFieldsWouldShowIt) {
    FileRecord r;
    r.Active = 5;
    r.Zip = -1;
    r.TypeID = 42;
    r.AdminLocationID = 9;
    r.UserLocationID = -3;
    r.MethodID = 7;
    r.Download = 4;
    r.Upload = 3;
    const FileRecord shown = AsShownInFields(r);
    EXPECT_EQ((std::array{shown.Active, shown.Zip, shown.TypeID, shown.AdminLocationID,
                          shown.UserLocationID, shown.MethodID, shown.Download, shown.Upload}),
              (std::array<std::int16_t, 8>{1, 1, 0, kLocationOther, kLocationApplication,
                                           kMethodOnlyNewData, kDownloadDate, kUploadOnce}));
    r.TypeID = 8;
    EXPECT_EQ(AsShownInFields(r).TypeID, 8);
}

} // namespace
} // namespace quorvel
