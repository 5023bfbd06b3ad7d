// The window's first size and the first share of its splitters: the whole
// editor where the screen allows, the trace pane what is left.

#include "app/ui/frm_web_data_client.h"

#include <QLayout>
#include <QScreen>
#include <QScrollArea>
#include <QSplitter>
#include <QTabBar>

#include <algorithm>

namespace quorvel {

namespace {

constexpr int kListWidth = 210;

// The height the tab strip needs to show its tallest page without scrolling.
int TabStripHeight(const QTabWidget* tabs) {
    int page = 0;
    for (int i = 0; i < tabs->count(); ++i)
        if (const auto* area = qobject_cast<const QScrollArea*>(tabs->widget(i)))
            page = std::max(page, area->widget()->sizeHint().height());
    const int frame = 2 * tabs->style()->pixelMetric(QStyle::PM_DefaultFrameWidth, nullptr, tabs);
    return tabs->tabBar()->sizeHint().height() + page + frame + 4;
}

} // namespace

QSize frm_WebDataClient::FirstSize() const {
    // Roomy where the screen allows, never beyond its free area (less the
    // title bar the desktop adds), never below what the controls need.
    const QSize roomy(1060, 690);
    const QSize room = screen()->availableGeometry().size() - QSize(0, 40);
    return roomy.boundedTo(room).expandedTo(minimumSizeHint());
}

void frm_WebDataClient::FirstSplit() {
    if (QLayout* layout = centralWidget()->layout()) layout->activate();
    if (auto* editor = qobject_cast<QSplitter*>(c_.Spl_Window->widget(0))) {
        const int width = editor->width();
        editor->setSizes({width - kListWidth, kListWidth});
    }
    const int height = c_.Spl_Window->height();
    const int lower = c_.Spl_Window->widget(1)->minimumSizeHint().height();
    const int upper = std::min(TabStripHeight(c_.SSTab1), height - lower);
    c_.Spl_Window->setSizes({upper, height - upper});
}

} // namespace quorvel
