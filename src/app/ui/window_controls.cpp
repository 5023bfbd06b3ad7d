#include "app/ui/window_controls.h"

#include "support/ui/hint_list.h"
#include "support/ui/progress_bar.h"

#include <QGridLayout>
#include <QHBoxLayout>
#include <QMainWindow>
#include <QMenuBar>
#include <QScrollArea>
#include <QSplitter>
#include <QStyle>
#include <QVBoxLayout>

namespace quorvel {

QString Indexed(const char* name, int index) {
    return QStringLiteral("%1(%2)").arg(QLatin1String(name)).arg(index);
}

QLabel* MakeLabel(const QString& caption, QWidget* parent, const QString& name) {
    auto* label = new QLabel(caption, parent);
    if (!name.isEmpty()) label->setObjectName(name);
    return label;
}

namespace {

// Its size never follows its text, so a long text cannot widen the window and
// a new one costs no measuring when the window lays itself out (a run changes
// these texts for every file).
class PathLabel : public QLabel {
public:
    using QLabel::QLabel;
    QSize sizeHint() const override { return minimumSizeHint(); }
    QSize minimumSizeHint() const override {
        const QMargins m = contentsMargins();
        return {0, fontMetrics().height() + m.top() + m.bottom() + 2 * margin()};
    }
};

} // namespace

QLabel* MakePathLabel(const QString& name, QWidget* parent) {
    auto* label = new PathLabel(parent);
    label->setObjectName(name);
    label->setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred);
    label->setMinimumWidth(60);
    return label;
}

QLineEdit* MakeEdit(const QString& name, QWidget* parent) {
    auto* edit = new QLineEdit(parent);
    edit->setObjectName(name);
    return edit;
}

QPushButton* MakeButton(const QString& name, const QString& caption, QWidget* parent) {
    auto* button = new QPushButton(caption, parent);
    button->setObjectName(name);
    return button;
}

QCheckBox* MakeCheck(const QString& name, const QString& caption, QWidget* parent) {
    auto* check = new QCheckBox(caption, parent);
    check->setObjectName(name);
    return check;
}

QGroupBox* MakeFrame(const QString& name, const QString& caption, QWidget* parent) {
    auto* frame = new QGroupBox(caption, parent);
    frame->setObjectName(name);
    return frame;
}

namespace {

constexpr int kMoveUp = 1;
constexpr int kMoveDown = 2;

QWidget* BuildFileListColumn(WindowControls& c, QWidget* parent) {
    auto* column = new QWidget(parent);
    auto* layout = new QVBoxLayout(column);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(MakeLabel(QStringLiteral("Files"), column));
    c.Lst_Files = new HintList(column);
    c.Lst_Files->setObjectName(QStringLiteral("Lst_Files"));
    c.Lst_Files->setMinimumWidth(170);
    // One line of text each: the view need not measure every entry to place one.
    c.Lst_Files->setUniformItemSizes(true);
    layout->addWidget(c.Lst_Files, 1);

    auto* buttons = new QHBoxLayout;
    c.Cmd_DoFile[0] = MakeButton(Indexed("Cmd_DoFile", 0), QStringLiteral("New"), column);
    c.Cmd_DoFile[1] = MakeButton(Indexed("Cmd_DoFile", 1), QString(), column);
    c.Cmd_DoFile[1]->setIcon(column->style()->standardIcon(QStyle::SP_ArrowUp));
    c.Cmd_DoFile[1]->setToolTip(QStringLiteral("Move the selected file up"));
    c.Cmd_DoFile[2] = MakeButton(Indexed("Cmd_DoFile", 2), QString(), column);
    c.Cmd_DoFile[2]->setIcon(column->style()->standardIcon(QStyle::SP_ArrowDown));
    c.Cmd_DoFile[2]->setToolTip(QStringLiteral("Move the selected file down"));
    c.Cmd_DoFile[3] = MakeButton(Indexed("Cmd_DoFile", 3), QStringLiteral("Delete"), column);
    // The arrows need no more room than their pictures: the list may be narrow.
    for (int i : {kMoveUp, kMoveDown})
        c.Cmd_DoFile[i]->setMaximumWidth(c.Cmd_DoFile[i]->sizeHint().height() + 8);
    for (int i = 0; i < 4; ++i)
        buttons->addWidget(c.Cmd_DoFile[i], i == kMoveUp || i == kMoveDown ? 0 : 1);
    layout->addLayout(buttons);
    return column;
}

QLayout* BuildRunRow(WindowControls& c, QWidget* parent) {
    auto* row = new QHBoxLayout;
    c.Cmd_Process[0] = MakeButton(Indexed("Cmd_Process", 0), QStringLiteral("Process all"), parent);
    c.Cmd_Process[1] =
        MakeButton(Indexed("Cmd_Process", 1), QStringLiteral("Process file"), parent);
    c.Cmd_Cancel = MakeButton(QStringLiteral("Cmd_Cancel"), QStringLiteral("Cancel"), parent);
    c.Cmd_Close = MakeButton(QStringLiteral("Cmd_Close"), QStringLiteral("Close"), parent);
    for (auto* button : {c.Cmd_Process[0], c.Cmd_Process[1], c.Cmd_Cancel, c.Cmd_Close})
        row->addWidget(button);
    row->addSpacing(12);
    c.Pic_ProgressFile->setObjectName(QStringLiteral("Pic_ProgressFile"));
    c.Pic_ProgressFTP->setObjectName(QStringLiteral("Pic_ProgressFTP"));
    for (auto* picture : {c.Pic_ProgressFile, c.Pic_ProgressFTP}) {
        picture->setFixedHeight(20);
        picture->setMinimumWidth(160);
        row->addWidget(picture, 1);
    }
    return row;
}

QWidget* BuildTraceArea(WindowControls& c, QWidget* parent) {
    auto* area = new QWidget(parent);
    auto* layout = new QVBoxLayout(area);
    layout->setContentsMargins(0, 0, 0, 0);
    // The switches stand in one row above the pane, so the pane keeps the
    // window's whole width and a short window still shows some trace.
    auto* switches = new QHBoxLayout;
    c.Chk_Trace = MakeCheck(QStringLiteral("Chk_Trace"), QStringLiteral("Trace"), area);
    c.chk_TraceServer =
        MakeCheck(QStringLiteral("chk_TraceServer"), QStringLiteral("TraceServer"), area);
    switches->addWidget(c.Chk_Trace);
    switches->addWidget(c.chk_TraceServer);
    switches->addSpacing(12);
    const char* logs[] = {"Status", "Send", "Receive", "Decisions", "Receive detail"};
    for (int i = 0; i < 5; ++i) {
        c.chk_Log[i] = MakeCheck(Indexed("chk_Log", i), QLatin1String(logs[i]), area);
        switches->addWidget(c.chk_Log[i]);
    }
    switches->addStretch(1);
    c.Cmd_Clear = MakeButton(QStringLiteral("Cmd_Clear"), QStringLiteral("Clear"), area);
    switches->addWidget(c.Cmd_Clear);
    layout->addLayout(switches);
    c.Lst_Trace = new QListWidget(area);
    c.Lst_Trace->setObjectName(QStringLiteral("Lst_Trace"));
    // The trace pane takes whatever room the window has left, but never less than this.
    c.Lst_Trace->setMinimumSize(67, 48);
    layout->addWidget(c.Lst_Trace, 1);
    return area;
}

// A page of the tab strip that scrolls rather than force its size on the
// window: a small screen still gets the whole window.
QScrollArea* Scrolled(QWidget* page) {
    auto* area = new QScrollArea;
    area->setObjectName(page->objectName() + QStringLiteral("Scroll"));
    area->setFrameShape(QFrame::NoFrame);
    area->setWidgetResizable(true);
    area->setWidget(page);
    return area;
}

void BuildMenus(QMainWindow* window, WindowControls& c) {
    auto* file = window->menuBar()->addMenu(QStringLiteral("&File"));
    file->setObjectName(QStringLiteral("mnu_FileMenu"));
    const char* captions[] = {"&New...", "&Open...", "Save &As...", "-", "E&xit"};
    const QKeySequence keys[] = {QKeySequence::New, QKeySequence::Open, QKeySequence::SaveAs,
                                 QKeySequence(), QKeySequence::Quit};
    for (int i = 0; i < 5; ++i) {
        // The separator is drawn as a line; its "-" caption would show beside it.
        auto* action = new QAction(i == 3 ? QString() : QLatin1String(captions[i]), window);
        action->setSeparator(i == 3);
        action->setObjectName(Indexed("mnu_File", i));
        action->setShortcut(keys[i]);
        c.mnu_File[i] = action;
    }
    c.mnu_SaveList = new QAction(QStringLiteral("&Save"), window);
    c.mnu_SaveList->setObjectName(QStringLiteral("mnu_SaveList"));
    c.mnu_SaveList->setShortcut(QKeySequence::Save);
    file->addActions({c.mnu_File[0], c.mnu_File[1], c.mnu_SaveList, c.mnu_File[2], c.mnu_File[3],
                      c.mnu_File[4]});
    for (int i = 0; i < 6; ++i) {
        auto* action = new QAction(i == 0 ? QString() : QString::number(i), window);
        action->setSeparator(i == 0);
        action->setObjectName(Indexed("mnu_RecentFile", i));
        action->setVisible(false);
        // Above Exit, as file managers and editors place them.
        file->insertAction(c.mnu_File[3], action);
        c.mnu_RecentFile[i] = action;
    }
    auto* help = window->menuBar()->addMenu(QStringLiteral("&Help"));
    help->setObjectName(QStringLiteral("mnu_HelpMenu"));
    c.mnu_Help[0] = help->addAction(QStringLiteral("&Contents"));
    c.mnu_Help[0]->setObjectName(Indexed("mnu_Help", 0));
    c.mnu_Help[1] = help->addAction(QStringLiteral("&About Quorvel"));
    c.mnu_Help[1]->setObjectName(Indexed("mnu_Help", 1));
}

} // namespace

void BuildWindowControls(QMainWindow* window, WindowControls& c) {
    auto* central = new QWidget(window);
    central->setObjectName(QStringLiteral("central"));
    auto* root = new QVBoxLayout(central);
    c.Pic_ProgressFile = new CProgress(central);
    c.Pic_ProgressFTP = new CProgress(central);

    // The editor with the list beside it above, the runs and the trace below;
    // the user moves the line between them, and both grow with the window.
    c.Spl_Window = new QSplitter(Qt::Vertical, central);
    c.Spl_Window->setObjectName(QStringLiteral("Spl_Window"));
    c.Spl_Window->setChildrenCollapsible(false);
    // The list beside the editor may be widened at the editor's cost.
    auto* upper = new QSplitter(Qt::Horizontal, c.Spl_Window);
    upper->setObjectName(QStringLiteral("Spl_Editor"));
    upper->setChildrenCollapsible(false);
    c.SSTab1 = new QTabWidget(upper);
    c.SSTab1->setObjectName(QStringLiteral("SSTab1"));
    c.SSTab1->addTab(Scrolled(BuildMainTab(c)), QStringLiteral("Main"));
    c.SSTab1->addTab(Scrolled(BuildFilesTab(c)), QStringLiteral("Files"));
    c.SSTab1->addTab(Scrolled(BuildFoldersTab(c)), QStringLiteral("Folders"));
    c.SSTab1->addTab(Scrolled(BuildNewSeasonTab(c)), QStringLiteral("New Season"));
    c.SSTab1->addTab(Scrolled(BuildOptionsTab(c)), QStringLiteral("Options"));
    upper->addWidget(c.SSTab1);
    upper->addWidget(BuildFileListColumn(c, upper));
    upper->setStretchFactor(0, 4);
    upper->setStretchFactor(1, 1);

    auto* lower = new QWidget(c.Spl_Window);
    auto* bottom = new QVBoxLayout(lower);
    bottom->setContentsMargins(0, 0, 0, 0);
    bottom->addLayout(BuildRunRow(c, lower));
    c.Lbl_status = MakePathLabel(QStringLiteral("Lbl_status"), lower);
    c.Lbl_status->setAutoFillBackground(true);
    c.Lbl_status->setFrameShape(QFrame::Panel);
    c.Lbl_status->setFrameShadow(QFrame::Sunken);
    c.Lbl_status->setMinimumHeight(22);
    bottom->addWidget(c.Lbl_status);
    bottom->addWidget(BuildTraceArea(c, lower), 1);
    c.Spl_Window->setStretchFactor(0, 3);
    c.Spl_Window->setStretchFactor(1, 2);
    root->addWidget(c.Spl_Window, 1);

    window->setCentralWidget(central);
    BuildMenus(window, c);
}

} // namespace quorvel
