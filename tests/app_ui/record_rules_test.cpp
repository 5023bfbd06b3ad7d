// The record fields and their mutual rules, how edits reach the records, and
// the route diagram drawn from them on the "Files" page.

#include "window_fixture.h"

#include "app/ui/route_view.h"

#include <QDir>
#include <QImage>

namespace quorvel::testing {
namespace {

class RecordRulesTest : public WindowTest {
protected:
    void SetUp() override {
        UserMaintainsList();
        WriteList({Line("A", "a.csv"), Line("B", "b.csv")});
        Start();
        Select(0);
    }
    // The transfer rules as "D<download> U<upload> M<method> Z<zip>".
    QString Rules() {
        return QStringLiteral("D%1 U%2 M%3 Z%4")
            .arg(C().Opt_Download->CheckedIndex())
            .arg(C().Opt_Upload->CheckedIndex())
            .arg(C().Opt_MethodID->CheckedIndex())
            .arg(C().Chk_Zip->isChecked() ? 1 : 0);
    }
    void ChooseType(int typeId) {
        C().Cmb_TypeID->setCurrentIndex(C().Cmb_TypeID->findData(typeId));
    }
};

// The rules themselves are the core's; here the fields follow them.
TEST_F(RecordRulesTest, TheFieldsFollowTheRecordRules) {
    ASSERT_EQ(C().Cmb_TypeID->count(), 9);
    C().Opt_Upload->Button(kUploadAlways)->click();
    EXPECT_EQ(Rules(), "D0 U1 M0 Z0");
    C().Opt_Download->Button(kDownloadAlways)->click();
    EXPECT_EQ(Rules(), "D1 U0 M0 Z0");
    C().Chk_Zip->click();
    ChooseType(4);
    EXPECT_EQ(Rules(), "D1 U0 M1 Z0");
    C().Chk_Zip->click();
    EXPECT_EQ(Rules(), "D1 U0 M0 Z1");
    EXPECT_TRUE(window->Flags().RecordEdited);
}

TEST_F(RecordRulesTest, EditsReachTheRecordWhenAnotherEntryIsSelected) {
    C().Txt_Name->setText("Rain gauge");
    EXPECT_EQ(C().Lst_Files->item(0)->text(), "Rain gauge");
    C().Txt_FileName->setText("sub/rain.csv");
    C().Opt_AdminLocationID->Button(kLocationUser)->click();
    C().Opt_UserLocationID->Button(kLocationOther)->click();
    C().Txt_Folder->setText("logs");
    C().Txt_FileDate->setText("1 Nov 2024");
    C().Chk_Active->setChecked(false);
    ChooseType(2);
    EXPECT_TRUE(window->Flags().RecordEdited && window->Files().ListChanged);
    EXPECT_EQ(window->Files().At(0).Name, "A"); // not stored yet

    Select(1);
    const FileRecord& r = window->Files().At(0);
    EXPECT_EQ(r.Name, "Rain gauge");
    EXPECT_EQ(r.FileName, "sub/rain.csv");
    EXPECT_EQ(r.AdminLocationID, kLocationUser);
    EXPECT_EQ(r.UserLocationID, kLocationOther);
    EXPECT_EQ(r.Folder, "logs");
    EXPECT_EQ(r.FileDate, "1 Nov 2024");
    EXPECT_EQ(r.Active, 0);
    EXPECT_EQ(r.TypeID, 2);
    EXPECT_EQ(r.MethodID, kMethodOnlyNewData);
    // The fields now show the second record, unedited.
    EXPECT_EQ(C().Txt_Name->text(), "B");
    EXPECT_FALSE(window->Flags().RecordEdited);

    Select(0);
    EXPECT_EQ(C().Txt_Folder->text(), "logs");
    EXPECT_EQ(C().Opt_UserLocationID->CheckedIndex(), kLocationOther);
}

TEST_F(RecordRulesTest, FileNameFromTheChooserSetsTheUserLocation) {
    C().Txt_UserFolder->setText("Farm1");
    AnswerDialogs({home.File("Farm1/site.csv")});
    C().Cmd_LocateFile->click();
    EXPECT_EQ(dialogsShown, 1);
    EXPECT_EQ(C().Txt_FileName->text(), "site.csv");
    EXPECT_EQ(C().Opt_UserLocationID->CheckedIndex(), kLocationUser);
    EXPECT_TRUE(C().Txt_Folder->text().isEmpty());

    AnswerDialogs({"/elsewhere/x.dat"});
    C().Cmd_LocateFile->click();
    EXPECT_EQ(C().Opt_UserLocationID->CheckedIndex(), kLocationOther);
    EXPECT_EQ(C().Txt_Folder->text(), QDir::toNativeSeparators("/elsewhere"));

    // A cancelled dialog changes nothing and shows nothing.
    AnswerDialogs({});
    C().Cmd_LocateFile->click();
    EXPECT_EQ(C().Txt_FileName->text(), "x.dat");
    EXPECT_TRUE(ports.prompter.shown.empty());
}

class RouteTest : public WindowTest {
protected:
    void SetUp() override {
        UserMaintainsList();
        WriteList({" 0 ~1~R~r.csv~0~0~2~0~0~1~0~~~0"});
        Start();
        Select(0);
        C().SSTab1->setCurrentIndex(1);
    }
    // How many pixels of the colour the route pictures show.
    int Pixels(QRgb colour) {
        Pump();
        int count = 0;
        for (RouteView* picture : C().Pic_Route) {
            const QImage image = picture->grab().toImage();
            for (int y = 0; y < image.height(); ++y)
                for (int x = 0; x < image.width(); ++x)
                    count += (image.pixel(x, y) & 0xffffff) == (colour & 0xffffff);
        }
        return count;
    }
};

// Where the lines run is the route geometry's; here they are drawn at all.
TEST_F(RouteTest, TheRouteIsDrawnInTheColourOfEachDirectionAndNotWithoutOne) {
    const QRgb darkRed = qRgb(128, 0, 0), blue = qRgb(0, 0, 255);
    EXPECT_GT(Pixels(darkRed), 0);
    EXPECT_EQ(Pixels(blue), 0);
    C().Opt_Upload->Button(kUploadAlways)->click(); // also sets download "Never"
    EXPECT_EQ(Pixels(darkRed), 0);
    EXPECT_GT(Pixels(blue), 0);
    C().Opt_Upload->Button(kUploadNever)->click();
    EXPECT_EQ(Pixels(blue), 0);
}

} // namespace
} // namespace quorvel::testing
