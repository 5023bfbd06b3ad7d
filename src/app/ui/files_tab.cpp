// The "Files" page: the editor of the selected file record.

#include "app/ui/route_view.h"
#include "app/ui/window_controls.h"

#include <QGridLayout>
#include <QHBoxLayout>
#include <QVBoxLayout>

namespace quorvel {

namespace {

// Every row of the two location frames has this height, so that the rows of
// "Admin PC" and "User PC" stand level and the route lines run straight.
constexpr int kLocationRowHeight = 24;

const QStringList& LocationCaptions() {
    static const QStringList captions = {
        QStringLiteral("Application folder"), QStringLiteral("Data folder"),
        QStringLiteral("User folder"), QStringLiteral("User season folder"),
        QStringLiteral("Other:")};
    return captions;
}

QLayout* BuildNameRows(WindowControls& c, QWidget* page) {
    auto* grid = new QGridLayout;
    grid->addWidget(MakeLabel(QStringLiteral("Name:"), page), 0, 0);
    c.Txt_Name = MakeEdit(QStringLiteral("Txt_Name"), page);
    grid->addWidget(c.Txt_Name, 0, 1);
    c.Chk_Active = MakeCheck(QStringLiteral("Chk_Active"), QStringLiteral("Active"), page);
    c.Chk_Zip = MakeCheck(QStringLiteral("Chk_Zip"), QStringLiteral("Zip"), page);
    auto* checks = new QHBoxLayout;
    checks->addWidget(c.Chk_Active);
    checks->addWidget(c.Chk_Zip);
    checks->addWidget(MakeLabel(QStringLiteral("Format:"), page));
    c.Cmb_TypeID = new QComboBox(page);
    c.Cmb_TypeID->setObjectName(QStringLiteral("Cmb_TypeID"));
    c.Cmb_TypeID->setMinimumWidth(110);
    checks->addWidget(c.Cmb_TypeID);
    grid->addLayout(checks, 0, 2, 1, 2);
    grid->addWidget(MakeLabel(QStringLiteral("File:"), page), 1, 0);
    c.Txt_FileName = MakeEdit(QStringLiteral("Txt_FileName"), page);
    grid->addWidget(c.Txt_FileName, 1, 1, 1, 2);
    auto* buttons = new QHBoxLayout;
    c.Cmd_LocateFile = MakeButton(QStringLiteral("Cmd_LocateFile"), QStringLiteral("..."), page);
    c.Cmd_LocateFile->setFixedWidth(32);
    c.Cmd_EditFile = MakeButton(QStringLiteral("Cmd_EditFile"), QStringLiteral("Edit"), page);
    buttons->addWidget(c.Cmd_LocateFile);
    buttons->addWidget(c.Cmd_EditFile);
    grid->addLayout(buttons, 1, 3);
    grid->setColumnStretch(1, 1);
    return grid;
}

QGroupBox* BuildDownloadFrame(WindowControls& c, QWidget* page) {
    c.Frame_Download =
        MakeFrame(QStringLiteral("Frame_Download"), QStringLiteral("Download"), page);
    c.Opt_Download = new OptionButtons(QStringLiteral("Opt_Download"),
                                       {QStringLiteral("Never"), QStringLiteral("Always"),
                                        QStringLiteral("Once"), QStringLiteral("Date")},
                                       c.Frame_Download);
    auto* grid = new QGridLayout(c.Frame_Download);
    for (int i = 0; i < 4; ++i)
        grid->addWidget(c.Opt_Download->Button(i), i % 2, i / 2);
    c.Txt_FileDate = MakeEdit(QStringLiteral("Txt_FileDate"), c.Frame_Download);
    c.Txt_FileDateLocal = MakeEdit(QStringLiteral("Txt_FileDateLocal"), c.Frame_Download);
    c.Txt_FileDate->setToolTip(QStringLiteral("Date of the file at the web site"));
    c.Txt_FileDateLocal->setToolTip(QStringLiteral("Date of the copy on this PC"));
    // Each date beside its pair of rules: the frame stays three rows high.
    for (auto* date : {c.Txt_FileDate, c.Txt_FileDateLocal})
        date->setMinimumWidth(120);
    grid->addWidget(MakeLabel(QStringLiteral("List:"), c.Frame_Download), 0, 2);
    grid->addWidget(c.Txt_FileDate, 0, 3);
    grid->addWidget(MakeLabel(QStringLiteral("Local:"), c.Frame_Download), 1, 2);
    grid->addWidget(c.Txt_FileDateLocal, 1, 3);
    return c.Frame_Download;
}

QGroupBox* BuildRadioFrame(QGroupBox*& frame, OptionButtons*& group, const QString& frameName,
                           const QString& caption, const QString& groupName,
                           const QStringList& captions, QWidget* page) {
    frame = MakeFrame(frameName, caption, page);
    group = new OptionButtons(groupName, captions, frame);
    auto* layout = new QVBoxLayout(frame);
    for (int i = 0; i < group->Count(); ++i)
        layout->addWidget(group->Button(i));
    layout->addStretch(1);
    return frame;
}

QLayout* BuildRuleRow(WindowControls& c, QWidget* page) {
    auto* row = new QHBoxLayout;
    row->addWidget(BuildDownloadFrame(c, page));
    row->addWidget(BuildRadioFrame(
        c.Frame_Upload, c.Opt_Upload, QStringLiteral("Frame_Upload"), QStringLiteral("Upload"),
        QStringLiteral("Opt_Upload"),
        {QStringLiteral("Never"), QStringLiteral("Always"), QStringLiteral("Once")}, page));
    row->addWidget(
        BuildRadioFrame(c.Frame_MethodID, c.Opt_MethodID, QStringLiteral("Frame_MethodID"),
                        QStringLiteral("Which data"), QStringLiteral("Opt_MethodID"),
                        {QStringLiteral("Complete file"), QStringLiteral("Only new data")}, page));
    row->addWidget(
        BuildRadioFrame(c.Frame_Files, c.Opt_GetFileList, QStringLiteral("Frame_Files"),
                        QStringLiteral("File list from..."), QStringLiteral("Opt_GetFileList"),
                        {QStringLiteral("User"), QStringLiteral("Administrator")}, page));
    row->addStretch(1);
    return row;
}

QGridLayout* LocationGrid(QGroupBox* frame) {
    auto* grid = new QGridLayout(frame);
    grid->setVerticalSpacing(2);
    for (int i = 0; i < 5; ++i)
        grid->setRowMinimumHeight(i, kLocationRowHeight);
    return grid;
}

QLayout* BuildLocationRow(WindowControls& c, QWidget* page) {
    auto* row = new QHBoxLayout;
    row->setSpacing(0);
    c.Frame_AdminLocationID =
        MakeFrame(QStringLiteral("Frame_AdminLocationID"), QStringLiteral("Admin PC"), page);
    c.Opt_AdminLocationID = new OptionButtons(QStringLiteral("Opt_AdminLocationID"),
                                              LocationCaptions(), c.Frame_AdminLocationID);
    auto* admin = LocationGrid(c.Frame_AdminLocationID);
    for (int i = 0; i < 5; ++i) {
        c.Opt_AdminLocationID->Button(i)->setFixedHeight(kLocationRowHeight);
        admin->addWidget(c.Opt_AdminLocationID->Button(i), i, 0);
    }

    c.Pic_Route[0] = new RouteView(Indexed("Pic_Route", 0), page);
    c.Pic_Route[0]->setFixedWidth(90);

    c.Frame_UserLocationID =
        MakeFrame(QStringLiteral("Frame_UserLocationID"), QStringLiteral("User PC"), page);
    c.Opt_UserLocationID = new OptionButtons(QStringLiteral("Opt_UserLocationID"),
                                             LocationCaptions(), c.Frame_UserLocationID);
    auto* user = LocationGrid(c.Frame_UserLocationID);
    // Room on the left of the buttons where the route lines come in.
    user->setContentsMargins(28, user->contentsMargins().top(), user->contentsMargins().right(),
                             user->contentsMargins().bottom());
    for (int i = 0; i < 5; ++i) {
        c.Opt_UserLocationID->Button(i)->setFixedHeight(kLocationRowHeight);
        user->addWidget(c.Opt_UserLocationID->Button(i), i, 0);
    }
    for (int i = 0; i < 4; ++i) {
        c.lbl_UserLocationFolder[i] =
            MakePathLabel(Indexed("lbl_UserLocationFolder", i), c.Frame_UserLocationID);
        c.lbl_UserLocationFolder[i]->setMinimumWidth(120);
        user->addWidget(c.lbl_UserLocationFolder[i], i, 1);
    }
    c.Txt_Folder = MakeEdit(QStringLiteral("Txt_Folder"), c.Frame_UserLocationID);
    c.Txt_Folder->setFixedHeight(kLocationRowHeight - 2);
    user->addWidget(c.Txt_Folder, 4, 1);
    user->setColumnStretch(1, 1);
    c.Pic_Route[1] = new RouteView(Indexed("Pic_Route", 1), c.Frame_UserLocationID);

    row->addWidget(c.Frame_AdminLocationID);
    row->addWidget(c.Pic_Route[0]);
    row->addWidget(c.Frame_UserLocationID, 1);
    return row;
}

QLayout* BuildFileStatusRows(WindowControls& c, QWidget* page) {
    auto* grid = new QGridLayout;
    const char* sides[] = {"This PC:", "Web site:"};
    for (int i = 0; i < 2; ++i) {
        grid->addWidget(MakeLabel(QLatin1String(sides[i]), page), i, 0);
        c.Lbl_FullFilename[i] = MakePathLabel(Indexed("Lbl_FullFilename", i), page);
        c.Lbl_FullFilename[i]->setTextInteractionFlags(Qt::TextSelectableByMouse);
        c.Lbl_FullFilename[i]->setMinimumWidth(200);
        c.Lbl_FileStatus[i] = MakeLabel(QString(), page, Indexed("Lbl_FileStatus", i));
        c.Lbl_FileStatus[i]->setAutoFillBackground(true);
        c.Lbl_FileStatus[i]->setAlignment(Qt::AlignRight | Qt::AlignVCenter);
        c.Lbl_FileStatus[i]->setFixedSize(90, c.Lbl_FileStatus[i]->sizeHint().height());
        c.Lbl_LastDate[i] = MakePathLabel(Indexed("Lbl_LastDate", i), page);
        c.Lbl_LastDate[i]->setMinimumWidth(150);
        c.chk_ShowDate[i] = MakeCheck(Indexed("chk_ShowDate", i), QStringLiteral("Show"), page);
        grid->addWidget(c.Lbl_FullFilename[i], i, 1);
        grid->addWidget(c.Lbl_FileStatus[i], i, 2);
        grid->addWidget(c.Lbl_LastDate[i], i, 3);
        grid->addWidget(c.chk_ShowDate[i], i, 4);
    }
    grid->setColumnStretch(1, 1);
    // The labels never ask for room by their text, so the grid keeps theirs.
    grid->setColumnMinimumWidth(1, 200);
    grid->setColumnMinimumWidth(3, 150);
    return grid;
}

} // namespace

QWidget* BuildFilesTab(WindowControls& c) {
    auto* page = new QWidget;
    page->setObjectName(QStringLiteral("FilesPage"));
    c.FilesPage = page;
    auto* layout = new QVBoxLayout(page);
    layout->addLayout(BuildNameRows(c, page));
    layout->addLayout(BuildRuleRow(c, page));
    layout->addLayout(BuildLocationRow(c, page));
    layout->addLayout(BuildFileStatusRows(c, page));
    layout->addStretch(1);
    return page;
}

} // namespace quorvel
