// The route diagram between the "Admin PC" and "User PC" frames.

#include "app/ui/frm_web_data_client.h"
#include "app/ui/route_view.h"

#include <QRadioButton>

namespace quorvel {

namespace {

// Space left between the line ends and the "User PC" option buttons.
constexpr int kGapBeforeButtons = 3;

} // namespace

RouteDrawing frm_WebDataClient::RouteLines() const {
    QWidget* page = c_.FilesPage;
    const QPoint origin = c_.Pic_Route[0]->mapTo(page, QPoint(0, 0));
    RouteLayout layout;
    for (int i = 0; i < 5; ++i) {
        layout.adminTops[i] =
            c_.Opt_AdminLocationID->Button(i)->mapTo(page, QPoint(0, 0)).y() - origin.y();
        layout.userTops[i] =
            c_.Opt_UserLocationID->Button(i)->mapTo(page, QPoint(0, 0)).y() - origin.y();
    }
    layout.rowOffset = RouteRowOffset(c_.Opt_AdminLocationID->Button(0)->height(), 0);
    layout.innerWidth = c_.Opt_UserLocationID->Button(0)->mapTo(page, QPoint(0, 0)).x() -
                        origin.x() - kGapBeforeButtons;
    RouteDrawing drawing;
    drawing.origin = origin;
    drawing.strokes = RouteStrokes(
        layout, c_.Opt_AdminLocationID->SelectedIndex(), c_.Opt_UserLocationID->SelectedIndex(),
        c_.Opt_Download->SelectedIndex(), c_.Opt_Upload->SelectedIndex());
    return drawing;
}

void frm_WebDataClient::PlotRouteLines() {
    // The second picture covers the strip of the "User PC" frame left of its
    // buttons, where the lines run on from the first one.
    QWidget* frame = c_.Frame_UserLocationID;
    const int buttonsLeft = c_.Opt_UserLocationID->Button(0)->geometry().left();
    c_.Pic_Route[1]->setGeometry(0, 0, std::max(0, buttonsLeft), frame->height());
    c_.Pic_Route[1]->raise();
    for (auto* picture : c_.Pic_Route)
        picture->update();
}

} // namespace quorvel
