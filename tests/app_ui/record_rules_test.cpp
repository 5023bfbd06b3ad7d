// The record fields and their mutual rules, how edits reach the records, and
// the route diagram drawn from them on the "Files" page.

#include "window_fixture.h"

#include <QDir>
#include <QImage>

#include <functional>

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

// Each step acts on the fields shown and the rules settle the others.
TEST_F(RecordRulesTest, DirectionMethodZipAndTypeRulesHoldEachOtherInCheck) {
    ASSERT_EQ(C().Cmb_TypeID->count(), 9);
    EXPECT_EQ(C().Cmb_TypeID->itemText(0), "[no date]");
    auto click = [](QAbstractButton* b) { return [b] { b->click(); }; };
    const std::pair<std::function<void()>, QString> steps[] = {
        {click(C().Opt_Upload->Button(kUploadAlways)), "D0 U1 M0 Z0"},
        {click(C().Opt_Download->Button(kDownloadAlways)), "D1 U0 M0 Z0"},
        {[this] { C().Chk_Zip->setChecked(true); }, "D1 U0 M0 Z1"},
        {click(C().Opt_MethodID->Button(kMethodOnlyNewData)), "D1 U0 M1 Z0"},
        {click(C().Chk_Zip), "D1 U0 M0 Z1"},
        {[this] { ChooseType(4); }, "D1 U0 M1 Z0"},
        {[this] { ChooseType(0); }, "D1 U0 M0 Z0"},
    };
    for (std::size_t i = 0; i < std::size(steps); ++i) {
        steps[i].first();
        EXPECT_EQ(Rules(), steps[i].second) << "step " << i;
    }
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

const QRgb kDarkRed = qRgb(128, 0, 0);
const QRgb kBlue = qRgb(0, 0, 255);

class RouteTest : public WindowTest {
protected:
    void SetUp() override {
        UserMaintainsList();
        // admin "Application folder", user "User folder"
        WriteList({" 0 ~1~R~r.csv~0~0~2~0~0~1~0~~~0"});
        Start();
        Select(0);
        C().SSTab1->setCurrentIndex(1);
        Pump();
    }
    // Rows of pixels of the given colour in one column of the page.
    static std::vector<int> RowsOf(const QImage& image, int x, QRgb colour) {
        std::vector<int> rows;
        for (int y = 0; y < image.height(); ++y)
            if ((image.pixel(x, y) & 0xffffff) == (colour & 0xffffff)) rows.push_back(y);
        return rows;
    }
    int RowCentre(QWidget* button) {
        return button->mapTo(C().FilesPage, QPoint(0, button->height() / 2)).y();
    }
};

TEST_F(RouteTest, LinesRunFromTheRowsOfTheRecordInTheColourOfTheirDirection) {
    const int left = C().Pic_Route[0]->geometry().left() + 1;
    const int right = C().Opt_UserLocationID->Button(0)->mapTo(C().FilesPage, QPoint()).x() - 5;
    auto page = [&] {
        Pump();
        return C().FilesPage->grab().toImage();
    };
    // Download always: a two-pixel dark red line from the admin row to the user row; it runs
    // on inside the "User PC" frame up to the buttons.
    QImage image = page();
    const auto start = RowsOf(image, left, kDarkRed);
    ASSERT_EQ(start.size(), 2u);
    EXPECT_NEAR(start.front(), RowCentre(C().Opt_AdminLocationID->Button(0)), 2);
    const auto end = RowsOf(image, right, kDarkRed);
    ASSERT_FALSE(end.empty());
    EXPECT_NEAR(end.front(), RowCentre(C().Opt_UserLocationID->Button(2)), 3);
    EXPECT_TRUE(RowsOf(image, left, kBlue).empty());

    // An upload goes back to the administrator's user row, not the application folder row.
    C().Opt_Upload->Button(kUploadAlways)->click(); // also sets download "Never"
    C().Opt_Download->Button(kDownloadDate)->click();
    image = page();
    const auto blue = RowsOf(image, left, kBlue);
    ASSERT_FALSE(blue.empty());
    EXPECT_NEAR(blue.front(), RowCentre(C().Opt_AdminLocationID->Button(kLocationUser)), 4);
    const auto red = RowsOf(image, left, kDarkRed);
    ASSERT_FALSE(red.empty());
    EXPECT_LT(red.front(), RowCentre(C().Opt_AdminLocationID->Button(0)));

    // No transfer: nothing drawn.
    C().Opt_Upload->Button(kUploadNever)->click();
    C().Opt_Download->Button(kDownloadNever)->click();
    image = page();
    for (int x = left - 1; x < right + 5; x += 7) {
        EXPECT_TRUE(RowsOf(image, x, kDarkRed).empty()) << x;
        EXPECT_TRUE(RowsOf(image, x, kBlue).empty()) << x;
    }
}

} // namespace
} // namespace quorvel::testing
