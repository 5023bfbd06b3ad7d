// Runs of the engine over a list, with recording stand-ins for the services.

#include "run_fakes.h"

#include "support/date_text.h"
#include "transfer/zip_archive.h"
#include "transfer/zip_codes.h"

#include <QRegularExpression>

#include <gtest/gtest.h>

namespace quorvel::testing {
namespace {

using RunEngineTest = EngineTest;

TEST_F(RunEngineTest, ARunOfAllFilesWalksEveryEntryAndTakesUpTheActiveOnes) {
    home.Write("c.csv", "local");
    home.Write("e.csv", "2024-11-01 10:00:00,1\r\n");
    FileRecord inactive = Rec("B", "b.csv", kDownloadAlways, kUploadNever);
    inactive.Active = 0;
    FileRecord fromDate = Rec("fromdate", "1 Nov 2023", kDownloadNever, kUploadNever);
    for (const FileRecord& r :
         {Rec("A", "a.csv", kDownloadAlways, kUploadNever), inactive,
          Rec("C", "c.csv", kDownloadNever, kUploadAlways), fromDate,
          Rec("E", "e.csv", kDownloadAlways, kUploadNever, kMethodOnlyNewData),
          // Nothing to append to: the whole file comes, and nothing goes back.
          Rec("F", "f.csv", kDownloadOnce, kUploadAlways, kMethodOnlyNewData)})
        list.Append(r);
    list.ListChanged = true;

    const RunSummary summary = Run();
    EXPECT_EQ(services.calls, (QStringList{"down web/a.csv a.csv", "up c.csv web/c.csv",
                                           "get e.csv 0 1", "down web/f.csv f.csv"}));
    EXPECT_EQ(observer.events,
              (QStringList{"busy", "files 5", "file 1 A", "file 2 C", "file 3 fromdate", "file 4 E",
                           "file 5 F", "end 5", "idle"}));
    EXPECT_TRUE(summary.ran && summary.processed == 5 && summary.failed == 0);
    EXPECT_EQ(trace.statuses.last(), "Processed 5 file(s)");
    EXPECT_EQ(lastRun, "1 Nov 2024 10:20:00");
    EXPECT_TRUE(Boxes().isEmpty());
    // The files after FROMDATE ask for the data after its date; those before it do not.
    ASSERT_EQ(services.configured.size(), 5u);
    EXPECT_EQ(services.configured[0].fromDateChoice, 0);
    EXPECT_EQ(services.configured[3].fromDateChoice, 1);
    EXPECT_EQ(services.configured[3].afterDate, "1 Nov 2023");
    // The changed list is written at the end of the run.
    EXPECT_TRUE(home.Read("files.txt").contains("~fromdate~1 Nov 2023~"));
    EXPECT_FALSE(list.ListChanged);
}

TEST_F(RunEngineTest, FromDateThatIsNoDateAsksForNewDataAgain) {
    settings.account.fromDateChoice = 1;
    list.Append(Rec("FROMDATE", "next season", kDownloadAlways, kUploadAlways));
    list.Append(Rec("A", "a.csv", kDownloadAlways, kUploadNever));
    Run();
    EXPECT_EQ(services.calls, QStringList{"down web/a.csv a.csv"});
    EXPECT_EQ(services.configured.back().fromDateChoice, 0);
    EXPECT_EQ(services.configured.back().afterDate, "next season");
}

TEST_F(RunEngineTest, AFailedFileShowsItsReasonAndNoToContinueStopsTheRun) {
    for (const char* name : {"A", "B", "C"})
        list.Append(Rec(name, QString(name).toLower() + ".csv", kDownloadAlways, kUploadNever));
    services.failing = {"b.csv"};
    ports.prompter.Script(kAnswerOk);
    ports.prompter.Script(kAnswerNo);
    const RunSummary summary = Run();
    EXPECT_EQ(Boxes(), (QStringList{"down failed", "Continue ?"}));
    EXPECT_EQ(ports.prompter.shown[0].buttons, kButtonsOk);
    EXPECT_EQ(ports.prompter.shown[1].buttons, kButtonsYesNo | kIconQuestion);
    EXPECT_EQ(observer.messages, 2);
    EXPECT_FALSE(observer.events.contains("file 3 C"));
    EXPECT_TRUE(summary.cancelled && summary.failed == 1);
    EXPECT_EQ(engine.LastErrorText(), "down failed");
    EXPECT_EQ(trace.statuses.last(), "Processed 2 file(s)");

    // Nobody answering means going on; the next run starts without the old reason.
    services.calls.clear();
    services.failing.clear();
    Run();
    EXPECT_EQ(services.calls.size(), 3);
    EXPECT_TRUE(engine.LastErrorText().isEmpty());
}

TEST_F(RunEngineTest, EmptyListProcessesNothingButStampsTheRunAndAsksForTheNextDueTime) {
    int nextDue = 0;
    engine.CalculateNextProcessDue = [&] { ++nextDue; };
    const RunSummary summary = Run();
    EXPECT_TRUE(summary.ran);
    EXPECT_EQ(trace.statuses.last(), "Processed 0 file(s)");
    EXPECT_EQ(lastRun, "1 Nov 2024 10:20:00");
    EXPECT_EQ(nextDue, 1);
    // One file is no run of all files: nothing stamped, no due time.
    list.Append(Rec("A", "a.csv", kDownloadAlways, kUploadNever));
    current = 0;
    Run(RunEngine::kProcessFile);
    EXPECT_TRUE(lastRun.isEmpty());
    EXPECT_EQ(nextDue, 1);
}

TEST_F(RunEngineTest, ProcessFileFailingShowsTheReasonWithoutAskingToContinue) {
    list.Append(Rec("A", "a.csv", kDownloadAlways, kUploadNever));
    list.Append(Rec("B", "../outside.csv", kDownloadAlways, kUploadNever));
    current = 1;
    const RunSummary summary = Run(RunEngine::kProcessFile);
    EXPECT_EQ(summary.failed, 1);
    ASSERT_EQ(Boxes().size(), 1);
    EXPECT_TRUE(Boxes()[0].contains("../outside.csv")) << Boxes()[0].toStdString();
    EXPECT_TRUE(services.calls.isEmpty());
}

TEST_F(RunEngineTest, DateRuleDownloadsForALaterDayAndTakesTheDateOnlyWhenAllWent) {
    struct Case {
        const char *listDate, *localDate;
        bool download;
    };
    const Case cases[] = {{"2 Nov 2024 08:00", "2 Nov 2024 23:59", false},
                          {"3 Nov 2024", "2 Nov 2024 23:59", true},
                          {"3 Nov 2024", "not a date", true},
                          {"not a date", "", false}};
    for (const Case& c : cases) {
        FileRecord r = Rec("D", "d.csv", kDownloadDate, kUploadNever);
        r.FileDate = c.listDate;
        r.FileDateLocal = c.localDate;
        list.Append(r);
    }
    Run();
    for (int i = 0; i < 4; ++i) {
        const QString expected = cases[i].download ? cases[i].listDate : cases[i].localDate;
        EXPECT_EQ(list.At(i).FileDateLocal, expected) << i;
    }
    EXPECT_EQ(services.calls.size(), 2);
    EXPECT_TRUE(trace.traces.contains("Downloading: web/d.csv because new date: 3 Nov 2024 "
                                      "Local:2 Nov 2024 23:59"));

    // A download that fails, or arrives but cannot be unpacked, keeps the old date.
    list.Clear();
    FileRecord failing = Rec("D", "d.csv", kDownloadDate, kUploadNever);
    failing.FileDate = "3 Nov 2024";
    list.Append(failing);
    failing.FileName = "z.csv";
    failing.Zip = 1;
    list.Append(failing);
    services.failing = {"d.csv"};
    services.remoteFiles["web/z_csv.zip"] = "no zip";
    Run();
    EXPECT_TRUE(list.At(0).FileDateLocal.isEmpty());
    EXPECT_TRUE(list.At(1).FileDateLocal.isEmpty());
    EXPECT_EQ(Boxes().filter(QRegularExpression("^UnZip:")).size(), 1)
        << Boxes().join(" | ").toStdString();
}

TEST_F(RunEngineTest, ZippedFilesTravelWholeAndArePackedAndUnpacked) {
    // The service holds a zip of z.csv.
    const QString source = home.Write("staging/z.csv", "zipped content\r\n");
    ASSERT_EQ(ZipFiles({source}, home.File("staging/z.zip")), kZipOk);
    services.remoteFiles["web/z_csv.zip"] = home.Read("staging/z.zip");
    home.Write("u.csv", "to send\r\n");
    // A list from the service may ask for a zipped file by new data: it still travels whole.
    list.Append(Rec("Z", "z.csv", kDownloadAlways, kUploadNever, kMethodOnlyNewData, 1));
    list.Append(Rec("U", "u.csv", kDownloadNever, kUploadAlways, kMethodCompleteFile, 1));
    Run();
    EXPECT_EQ(services.calls,
              (QStringList{"down web/z_csv.zip z_csv.zip", "up u_csv.zip web/u_csv.zip"}));
    EXPECT_EQ(home.Read("z.csv"), "zipped content\r\n");
    EXPECT_TRUE(services.remoteFiles["web/u_csv.zip"].startsWith("PK"));
    EXPECT_TRUE(Boxes().isEmpty()) << Boxes().join(" | ").toStdString();
    // The zip steps show their progress as percentages.
    EXPECT_EQ(services.progress.total, -1);
    EXPECT_GE(services.progress.finished, 2);
}

TEST_F(RunEngineTest, UploadOnceSendsOnlyWhileTheFileIsMissingAtTheService) {
    home.Write("o.csv", "local");
    list.Append(Rec("O", "o.csv", kDownloadNever, kUploadOnce));
    Run();
    Run();
    EXPECT_EQ(services.calls,
              (QStringList{"exists web/o.csv", "up o.csv web/o.csv", "exists web/o.csv"}));
}

TEST_F(RunEngineTest, DownloadOnlyDownloadsWhatMovesEitherWayAndUploadsNothing) {
    home.Write("up.csv", "2024-11-01 10:00:00,1\r\n");
    list.Append(Rec("Up", "up.csv", kDownloadNever, kUploadAlways, kMethodOnlyNewData));
    list.Append(Rec("Once", "once.csv", kDownloadNever, kUploadOnce));
    list.Append(Rec("Still", "still.csv", kDownloadNever, kUploadNever));
    settings.downloadOnly = true;
    Run();
    EXPECT_EQ(services.calls, (QStringList{"get up.csv 0 1", "down web/once.csv once.csv"}));
}

TEST_F(RunEngineTest, DirRecordWritesTheListingThenFollowsItsOwnRules) {
    home.Write("data/site.csv", "1,2\r\n");
    list.Append(Rec("dir", "listing.txt", kDownloadNever, kUploadAlways));
    Run();
    EXPECT_EQ(services.calls, QStringList{"up listing.txt web/listing.txt"});
    const QString listing = QString::fromUtf8(services.remoteFiles["web/listing.txt"]);
    EXPECT_TRUE(listing.startsWith("Date: 1 Nov 2024 10:20:00\r\n")) << listing.toStdString();
    EXPECT_TRUE(listing.contains("site.csv")) << listing.toStdString();
}

TEST_F(RunEngineTest, CancelDuringAFileStopsAfterItWithoutAskingAnything) {
    list.Append(Rec("A", "a.csv", kDownloadAlways, kUploadNever));
    list.Append(Rec("B", "b.csv", kDownloadAlways, kUploadNever));
    services.failing = {"a.csv"};
    services.onCall = [this](const QString&) { engine.Cancel(); };
    const RunSummary summary = Run();
    EXPECT_EQ(services.cancels, 1);
    EXPECT_TRUE(summary.cancelled);
    EXPECT_EQ(services.calls.size(), 1);
    EXPECT_TRUE(Boxes().isEmpty());
    EXPECT_TRUE(trace.traces.contains("Cancelled: A: down failed"));
    EXPECT_EQ(lastRun, "1 Nov 2024 10:20:00");
}

TEST_F(RunEngineTest, ARunNeverWaitsForAnAnswerAndNeverStartsInsideItself) {
    list.Append(Rec("A", "a.csv", kDownloadAlways, kUploadNever));
    int answer = 0;
    RunSummary inner;
    services.onCall = [&](const QString&) {
        answer = CurrentPrompter().SystemMsgBox("Do you want to debug ?", kButtonsYesNo);
        inner = Run();
    };
    Run();
    EXPECT_EQ(answer, kAnswerNo);
    EXPECT_EQ(Boxes(), QStringList{"Do you want to debug ?"});
    EXPECT_EQ(ports.prompter.shown[0].buttons, kButtonsOk);
    EXPECT_FALSE(inner.ran);
    EXPECT_EQ(services.calls.size(), 1);
    EXPECT_FALSE(engine.IsBusy());
    // Outside a run the system's box waits again.
    CurrentPrompter().SystemMsgBox("Remove 'a.csv' ?", kButtonsYesNo);
    EXPECT_EQ(Boxes().last(), "WAITING:Remove 'a.csv' ?");
}

TEST_F(RunEngineTest, UnusableFoldersStopTheRunOrTheFileWithoutATransfer) {
    home.Write("blocker", "a file where a folder should be");
    list.Append(Rec("A", "a.csv", kDownloadAlways, kUploadNever));
    list.Append(Rec("B", "b.csv", kDownloadAlways, kUploadNever));
    RunSettings good = settings;
    settings.folders.data = home.File("blocker/data");
    EXPECT_FALSE(Run().ran);
    EXPECT_TRUE(lastRun.isEmpty());

    // A user folder that cannot be made fails the file; the folder check told
    // which folder, so only "Continue ?" follows.
    settings = good;
    settings.folders.user = "../blocker";
    ports.prompter.shown.clear();
    const RunSummary summary = Run();
    EXPECT_EQ(summary.failed, 2);
    EXPECT_TRUE(services.calls.isEmpty());
    EXPECT_EQ(Boxes().filter("Continue ?").size(), 2);
}

} // namespace
} // namespace quorvel::testing
