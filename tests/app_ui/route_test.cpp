// The route diagram as drawn on the "Files" page.

#include "window_fixture.h"

#include <QImage>

namespace quorvel::testing {
namespace {

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
    QImage Page() { return C().FilesPage->grab().toImage(); }
    // x range of the two route pictures on the page.
    int RouteLeft() { return C().Pic_Route[0]->geometry().left(); }
    int RouteRight() {
        return C().Opt_UserLocationID->Button(0)->mapTo(C().FilesPage, QPoint(0, 0)).x();
    }
    // Rows of pixels of the given colour in one column of the page.
    std::vector<int> RowsOf(const QImage& image, int x, QRgb colour) {
        std::vector<int> rows;
        for (int y = 0; y < image.height(); ++y)
            if ((image.pixel(x, y) & 0xffffff) == (colour & 0xffffff)) rows.push_back(y);
        return rows;
    }
    int RowCentre(QWidget* button) {
        return button->mapTo(C().FilesPage, QPoint(0, button->height() / 2)).y();
    }
};

TEST_F(RouteTest, DownloadAlwaysDrawsATwoPixelRedLineFromAdminRowToUserRow) {
    const QImage image = Page();
    const auto start = RowsOf(image, RouteLeft() + 1, kDarkRed);
    ASSERT_EQ(start.size(), 2u);
    EXPECT_NEAR(start.front(), RowCentre(C().Opt_AdminLocationID->Button(0)), 2);
    // The line runs on inside the "User PC" frame up to the buttons.
    const auto end = RowsOf(image, RouteRight() - 5, kDarkRed);
    ASSERT_FALSE(end.empty());
    EXPECT_NEAR(end.front(), RowCentre(C().Opt_UserLocationID->Button(2)), 3);
    EXPECT_TRUE(RowsOf(image, RouteLeft() + 1, kBlue).empty());
}

TEST_F(RouteTest, NoTransferDrawsNothing) {
    C().Opt_Download->Button(kDownloadNever)->click();
    Pump();
    const QImage image = Page();
    for (int x = RouteLeft(); x < RouteRight(); x += 7) {
        EXPECT_TRUE(RowsOf(image, x, kDarkRed).empty()) << x;
        EXPECT_TRUE(RowsOf(image, x, kBlue).empty()) << x;
    }
}

TEST_F(RouteTest, UploadGoesBackToTheAdministratorsUserRow) {
    C().Opt_Upload->Button(kUploadAlways)->click(); // also sets download "Never"
    C().Opt_Download->Button(kDownloadDate)->click();
    Pump();
    const QImage image = Page();
    const auto blue = RowsOf(image, RouteLeft() + 1, kBlue);
    ASSERT_FALSE(blue.empty());
    // Not the "Application folder" row the record names on the admin side.
    EXPECT_NEAR(blue.front(), RowCentre(C().Opt_AdminLocationID->Button(kLocationUser)), 4);
    const auto red = RowsOf(image, RouteLeft() + 1, kDarkRed);
    ASSERT_FALSE(red.empty());
    EXPECT_LT(red.front(), RowCentre(C().Opt_AdminLocationID->Button(0)));
}

} // namespace
} // namespace quorvel::testing
