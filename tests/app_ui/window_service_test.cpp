// Runs from the window's buttons against the reference service: wd.php under
// PHP's web server and FTP, started on loopback for each test.

#include "window_fixture.h"

#include "app/run/run_engine.h"
#include "common/reference_service.h"
#include "support/date_text.h"
#include "support/program_home.h"
#include "support/ui/progress_bar.h"
#include "transfer/ftp.h"
#include "transfer/zip_archive.h"
#include "transfer/zip_codes.h"

#include <QTimer>

#include <iostream>

namespace quorvel::testing {
namespace {

// " 0 ~1~Name~file~type~admin 2 (user folder at the service)~user 1 (data folder)~...".
QString Record(const QString& name, const QString& file, int download, int upload,
               int method = kMethodCompleteFile, int zip = 0, const QString& date = {}) {
    return QStringLiteral(" 0 ~1~%1~%2~%3~2~1~%4~%5~%6~%7~~%8~0")
        .arg(name, file)
        .arg(method == kMethodOnlyNewData ? 1 : 0)
        .arg(method)
        .arg(zip)
        .arg(download)
        .arg(upload)
        .arg(date);
}

class WindowServiceTest : public WindowTest {
protected:
    void SetUp() override {
        ASSERT_TRUE(service.AddUser({.name = "ann", .password = "p&ss word"}))
            << service.LastError().toStdString();
        ASSERT_TRUE(service.Start()) << service.LastError().toStdString();
        UserMaintainsList();
        Setting("DataFolder", home.File("data"));
    }
    void TearDown() override {
        ftpClose();
        if (HasFailure()) std::cerr << "Service log:\n" << service.Log().toStdString();
    }
    // The account fields as a login would fill them.
    void SignIn() {
        C().Txt_ftpServer->setText(service.FtpServer());
        C().txt_ftpUserID->setText("ann");
        C().Txt_ftpPassword->setText(service.FtpPassword("ann"));
        C().Txt_httpServer->setText(service.HttpHostPort());
        C().Txt_WebFolder->setText(service.WebFolder());
        C().Txt_UserID->setText("ann");
        C().Txt_Password->setText("p&ss word");
        C().Txt_UserFolder->setText(service.UserFolder("ann"));
    }
    void ProcessAll() { C().Cmd_Process[RunEngine::kProcessAll]->click(); }
    QStringList FtpLog() {
        QStringList lines =
            QString::fromUtf8(home.Read(QFileInfo(ProgramHome::FtpLogFile()).fileName()))
                .split("\r\n", Qt::SkipEmptyParts);
        for (QString& line : lines)
            line = line.section("=>", 0, 0).section('/', -1);
        return lines;
    }

    ReferenceService service;
};

TEST_F(WindowServiceTest, AListRunsAgainstTheServiceAndASecondRunMovesOnlyWhatAlwaysMoves) {
    const QByteArray older = "2024-11-01 10:00:00,1\r\n2024-11-01 10:10:00,2\r\n";
    const QByteArray newer = "2024-11-01 10:20:00,3\r\n2024-11-01 10:30:00,4\r\n";
    service.PlaceFile("ann", "whole.csv", "whole file\r\n");
    service.PlaceFile("ann", "new.csv", older + newer);
    service.PlaceFile("ann", "same.csv", "same day\r\n");
    service.PlaceFile("ann", "later.csv", "later day\r\n");
    home.Write("data/new.csv", older);
    home.Write("data/up.csv", "sent always\r\n");
    home.Write("data/once.csv", "sent once\r\n");
    home.Write("data/zu.csv", "zipped up\r\n");
    home.Write("staging/zd.csv", "zipped down\r\n");
    ASSERT_EQ(ZipFiles({home.File("staging/zd.csv")}, home.File("staging/zd.zip")), kZipOk);
    service.PlaceFile("ann", "zd_csv.zip", home.Read("staging/zd.zip"));
    WriteList({Record("Whole", "whole.csv", kDownloadAlways, kUploadNever),
               Record("New", "new.csv", kDownloadAlways, kUploadNever, kMethodOnlyNewData),
               Record("Up", "up.csv", kDownloadNever, kUploadAlways),
               Record("Once", "once.csv", kDownloadNever, kUploadOnce),
               Record("Same", "same.csv", kDownloadDate, kUploadNever, 0, 0, "1 Nov 2024 10:00"),
               Record("Later", "later.csv", kDownloadDate, kUploadNever, 0, 0, "2 Nov 2024"),
               Record("fromdate", "1 Nov 2023", kDownloadNever, kUploadNever),
               Record("ZipDown", "zd.csv", kDownloadAlways, kUploadNever, 0, 1),
               Record("ZipUp", "zu.csv", kDownloadNever, kUploadAlways, 0, 1),
               Record("DIR", "listing.txt", kDownloadNever, kUploadAlways),
               " 0 ~0~Off~off.csv~0~2~1~0~0~1~0~~~0"});
    Start();
    SignIn();
    // The local copies' dates, as this PC's list held them.
    for (int row : {4, 5}) {
        Select(row);
        C().Txt_FileDateLocal->setText("1 Nov 2024 08:00");
    }
    ProcessAll();
    EXPECT_TRUE(Boxes().isEmpty()) << Boxes().join(" | ").toStdString();
    // Every entry was shown, the inactive last one too, but only the active ones count.
    EXPECT_EQ(C().Lst_Files->currentRow(), 10);
    EXPECT_EQ(C().Lbl_status->text(), "Processed 10 file(s)");
    EXPECT_TRUE(C().Pic_ProgressFile->Finished());
    EXPECT_TRUE(IsDateText(C().Lbl_LastDownload->text()));
    EXPECT_EQ(home.Read("data/whole.csv"), "whole file\r\n");
    EXPECT_EQ(home.Read("data/new.csv"), older + newer); // exactly the new records appended
    EXPECT_EQ(service.ReadFile("ann", "up.csv"), "sent always\r\n");
    EXPECT_EQ(service.ReadFile("ann", "once.csv"), "sent once\r\n");
    EXPECT_EQ(home.Read("data/same.csv"), "");
    EXPECT_EQ(home.Read("data/later.csv"), "later day\r\n");
    EXPECT_EQ(home.Read("data/zd.csv"), "zipped down\r\n");
    EXPECT_TRUE(service.ReadFile("ann", "zu_csv.zip").startsWith("PK"));
    EXPECT_TRUE(service.ReadFile("ann", "listing.txt").startsWith("Date: "));
    EXPECT_EQ(C().Txt_AfterDate->text(), "1 Nov 2023");
    EXPECT_EQ(C().Opt_Whichdates->CheckedIndex(), 1);
    Select(5);
    EXPECT_EQ(C().Txt_FileDateLocal->text(), "2 Nov 2024");
    const QStringList first = FtpLog();
    EXPECT_EQ(first, (QStringList{"whole.csv", "up.csv", "once.csv", "later.csv", "zd_csv.zip",
                                  "zu_csv.zip", "listing.txt"}));

    // Straight again: no record appended, nothing under "Once" or "Date" moves.
    home.Write("data/once.csv", "changed here\r\n");
    ProcessAll();
    EXPECT_TRUE(Boxes().isEmpty()) << Boxes().join(" | ").toStdString();
    EXPECT_EQ(home.Read("data/new.csv"), older + newer);
    EXPECT_EQ(service.ReadFile("ann", "once.csv"), "sent once\r\n");
    EXPECT_EQ(FtpLog().mid(first.size()),
              (QStringList{"whole.csv", "up.csv", "zd_csv.zip", "zu_csv.zip", "listing.txt"}));
}

TEST_F(WindowServiceTest, CancelDuringALongDownloadKeepsTheOldCopyAndStopsTheRun) {
    service.PlaceFile("ann", "big.csv", QByteArray(96 << 20, 'x'));
    home.Write("data/big.csv", "old copy\r\n");
    WriteList({Record("Big", "big.csv", kDownloadAlways, kUploadNever),
               Record("Next", "next.csv", kDownloadAlways, kUploadNever)});
    Start();
    SignIn();
    // Presses "Cancel" as soon as the download is under way.
    QTimer watch;
    int pressed = 0;
    QObject::connect(&watch, &QTimer::timeout, [&] {
        if (ProcessFtpSession().State() == TransferState::Download && pressed == 0) {
            ++pressed;
            C().Cmd_Cancel->click();
        }
    });
    watch.start(0);
    ProcessAll();
    EXPECT_EQ(pressed, 1);
    EXPECT_EQ(home.Read("data/big.csv"), "old copy\r\n");
    EXPECT_EQ(C().Lst_Files->currentRow(), 0);
    EXPECT_TRUE(Boxes().isEmpty()) << Boxes().join(" | ").toStdString();
    EXPECT_EQ(QDir(home.File("data")).entryList(QDir::Files), QStringList{"big.csv"});
}

} // namespace
} // namespace quorvel::testing
