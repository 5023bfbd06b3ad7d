// The pages "Main", "Folders", "New Season" and "Options" of the tab strip.

#include "app/ui/window_controls.h"

#include <QGridLayout>
#include <QHBoxLayout>
#include <QVBoxLayout>

namespace quorvel {

namespace {

// Adds "caption [edit]" as one row of a grid.
QLineEdit* AddEditRow(QGridLayout* grid, int row, const QString& caption, const QString& name,
                      QWidget* parent) {
    grid->addWidget(MakeLabel(caption, parent), row, 0);
    auto* edit = MakeEdit(name, parent);
    grid->addWidget(edit, row, 1);
    return edit;
}

QGroupBox* BuildScheduleFrame(WindowControls& c, QWidget* page) {
    c.Frame1 = MakeFrame(QStringLiteral("Frame1"), QStringLiteral("Download"), page);
    auto* grid = new QGridLayout(c.Frame1);
    c.Opt_Automatic =
        new OptionButtons(QStringLiteral("Opt_Automatic"),
                          {QStringLiteral("Manual"), QStringLiteral("Automatic every")}, c.Frame1);
    c.Cmb_interval = new QComboBox(c.Frame1);
    c.Cmb_interval->setObjectName(QStringLiteral("Cmb_interval"));
    c.Cmb_interval->setEditable(true);
    c.Cmb_interval->setMinimumWidth(120);
    grid->addWidget(c.Opt_Automatic->Button(0), 0, 0);
    grid->addWidget(c.Opt_Automatic->Button(1), 1, 0);
    grid->addWidget(c.Cmb_interval, 1, 1);
    const char* captions[] = {"Due in:", "Now:", "Next:", "Last:"};
    QLabel** values[] = {&c.Lbl_Due, &c.Lbl_Now, &c.Lbl_NextDownloadDue, &c.Lbl_LastDownload};
    const char* names[] = {"Lbl_Due", "Lbl_Now", "Lbl_NextDownloadDue", "Lbl_LastDownload"};
    for (int i = 0; i < 4; ++i) {
        grid->addWidget(MakeLabel(QLatin1String(captions[i]), c.Frame1), 2 + i, 0, Qt::AlignRight);
        *values[i] = MakeLabel(QString(), c.Frame1, QLatin1String(names[i]));
        (*values[i])->setMinimumWidth(170);
        grid->addWidget(*values[i], 2 + i, 1, 1, 2);
    }
    grid->setColumnStretch(2, 1);
    return c.Frame1;
}

} // namespace

QWidget* BuildMainTab(WindowControls& c) {
    auto* page = new QWidget;
    page->setObjectName(QStringLiteral("MainPage"));
    auto* layout = new QVBoxLayout(page);
    auto* grid = new QGridLayout;
    c.Txt_CFG_URL = AddEditRow(grid, 0, QStringLiteral("CFG file web address:"),
                               QStringLiteral("Txt_CFG_URL"), page);
    c.Txt_UserID =
        AddEditRow(grid, 1, QStringLiteral("User ID:"), QStringLiteral("Txt_UserID"), page);
    c.Txt_Password =
        AddEditRow(grid, 2, QStringLiteral("Password:"), QStringLiteral("Txt_Password"), page);
    c.Txt_Password->setEchoMode(QLineEdit::Password);
    c.Cmd_Login = MakeButton(QStringLiteral("Cmd_Login"), QStringLiteral("Login"), page);
    grid->addWidget(c.Cmd_Login, 2, 2);
    grid->addWidget(MakeLabel(QStringLiteral("Welcome..."), page), 3, 0);
    c.Lbl_UserName = MakeLabel(QString(), page, QStringLiteral("Lbl_UserName"));
    c.Lbl_UserName->setAutoFillBackground(true);
    grid->addWidget(c.Lbl_UserName, 3, 1, 1, 2);
    c.Chk_RunAtStartUp =
        MakeCheck(QStringLiteral("Chk_RunAtStartUp"), QStringLiteral("Run at StartUp"), page);
    grid->addWidget(c.Chk_RunAtStartUp, 4, 1);
    grid->setColumnStretch(1, 1);
    layout->addLayout(grid);
    auto* row = new QHBoxLayout;
    row->addWidget(BuildScheduleFrame(c, page));
    row->addStretch(1);
    layout->addLayout(row);
    layout->addStretch(1);
    return page;
}

QWidget* BuildFoldersTab(WindowControls& c) {
    auto* page = new QWidget;
    page->setObjectName(QStringLiteral("FoldersPage"));
    auto* layout = new QVBoxLayout(page);
    auto* top = new QHBoxLayout;
    c.Frame9 = MakeFrame(QStringLiteral("Frame9"), QStringLiteral("Folders from..."), page);
    auto* frameLayout = new QHBoxLayout(c.Frame9);
    c.Opt_GetLocalFolders =
        new OptionButtons(QStringLiteral("Opt_GetLocalFolders"),
                          {QStringLiteral("User"), QStringLiteral("Administrator")}, c.Frame9);
    frameLayout->addWidget(c.Opt_GetLocalFolders->Button(0));
    frameLayout->addWidget(c.Opt_GetLocalFolders->Button(1));
    top->addWidget(c.Frame9);
    c.Chk_GotPHP =
        MakeCheck(QStringLiteral("Chk_GotPHP"), QStringLiteral("Got user folders"), page);
    top->addWidget(c.Chk_GotPHP);
    top->addStretch(1);
    layout->addLayout(top);

    auto* grid = new QGridLayout;
    const char* captions[] = {"Application folder:", "Data folder:"};
    const char* words[] = {"application", "data"};
    for (int i = 0; i < 2; ++i) {
        c.Txt_LocalFolder[i] =
            AddEditRow(grid, i, QLatin1String(captions[i]), Indexed("Txt_LocalFolder", i), page);
        // The word the folder chooser puts into its prompt.
        c.Txt_LocalFolder[i]->setProperty("tag", QLatin1String(words[i]));
        c.Cmd_LocateFolder[i] =
            MakeButton(Indexed("Cmd_LocateFolder", i), QStringLiteral("..."), page);
        c.Cmd_LocateFolder[i]->setFixedWidth(32);
        grid->addWidget(c.Cmd_LocateFolder[i], i, 2);
    }
    c.Txt_UserFolder =
        AddEditRow(grid, 2, QStringLiteral("User folder:"), QStringLiteral("Txt_UserFolder"), page);
    c.Txt_UserCurrentFolder = AddEditRow(grid, 3, QStringLiteral("User current folder:"),
                                         QStringLiteral("Txt_UserCurrentFolder"), page);
    grid->addWidget(MakeLabel(QStringLiteral("User folder on web site:"), page), 4, 0);
    c.Lbl_UserFolder = MakePathLabel(QStringLiteral("Lbl_UserFolder"), page);
    grid->addWidget(c.Lbl_UserFolder, 4, 1);
    grid->setColumnStretch(1, 1);
    layout->addLayout(grid);
    layout->addStretch(1);
    return page;
}

QWidget* BuildNewSeasonTab(WindowControls& c) {
    auto* page = new QWidget;
    page->setObjectName(QStringLiteral("NewSeasonPage"));
    auto* layout = new QVBoxLayout(page);
    c.Frame2 = MakeFrame(QStringLiteral("Frame2"), QStringLiteral("Download which dates"), page);
    auto* frame = new QGridLayout(c.Frame2);
    c.Opt_Whichdates =
        new OptionButtons(QStringLiteral("Opt_Whichdates"),
                          {QStringLiteral("New data"), QStringLiteral("Data after")}, c.Frame2);
    c.Txt_AfterDate = MakeEdit(QStringLiteral("Txt_AfterDate"), c.Frame2);
    c.lbl_Help[0] =
        MakeLabel(QStringLiteral("To only download data from the end of last seasons data file"),
                  c.Frame2, Indexed("lbl_Help", 0));
    c.lbl_Help[0]->setWordWrap(true);
    frame->addWidget(c.Opt_Whichdates->Button(0), 0, 0);
    frame->addWidget(c.Opt_Whichdates->Button(1), 1, 0);
    frame->addWidget(c.Txt_AfterDate, 1, 1);
    frame->addWidget(c.lbl_Help[0], 2, 0, 1, 3);
    frame->setColumnStretch(2, 1);
    layout->addWidget(c.Frame2);

    auto* grid = new QGridLayout;
    c.Cmd_Admin = MakeButton(QStringLiteral("Cmd_Admin"), QStringLiteral("Admin"), page);
    c.Cmd_DoFile[4] = MakeButton(Indexed("Cmd_DoFile", 4), QStringLiteral("Save"), page);
    c.Chk_GotFileList =
        MakeCheck(QStringLiteral("Chk_GotFileList"), QStringLiteral("Got file list"), page);
    c.Cmd_GetFileList = MakeButton(QStringLiteral("Cmd_GetFileList"), QStringLiteral("Get"), page);
    c.Cmd_ClearFiles = MakeButton(QStringLiteral("Cmd_ClearFiles"), QStringLiteral("Clear"), page);
    grid->addWidget(c.Cmd_Admin, 0, 0);
    grid->addWidget(c.Cmd_DoFile[4], 0, 1);
    grid->addWidget(c.Chk_GotFileList, 1, 0);
    grid->addWidget(c.Cmd_GetFileList, 1, 1);
    grid->addWidget(c.Cmd_ClearFiles, 1, 2);
    grid->setColumnStretch(3, 1);
    layout->addLayout(grid);
    auto* loaded = new QHBoxLayout;
    loaded->addWidget(MakeLabel(QStringLiteral("File:"), page));
    c.Lbl_LoadedFile = MakePathLabel(QStringLiteral("Lbl_LoadedFile"), page);
    c.Lbl_LoadedFile->setTextInteractionFlags(Qt::TextSelectableByMouse);
    loaded->addWidget(c.Lbl_LoadedFile, 1);
    layout->addLayout(loaded);
    layout->addStretch(1);
    return page;
}

QWidget* BuildOptionsTab(WindowControls& c) {
    auto* page = new QWidget;
    page->setObjectName(QStringLiteral("OptionsPage"));
    auto* layout = new QVBoxLayout(page);
    auto* top = new QHBoxLayout;
    c.Chk_DownloadOnly =
        MakeCheck(QStringLiteral("Chk_DownloadOnly"), QStringLiteral("Download only"), page);
    c.lbl_Help[1] = MakeLabel(QStringLiteral("Support mode: download all files for this user"),
                              page, Indexed("lbl_Help", 1));
    top->addWidget(c.Chk_DownloadOnly);
    top->addWidget(c.lbl_Help[1], 1);
    layout->addLayout(top);

    c.Frame_WebDetails =
        MakeFrame(QStringLiteral("Frame_WebDetails"), QStringLiteral("Web details"), page);
    auto* grid = new QGridLayout(c.Frame_WebDetails);
    auto* f = c.Frame_WebDetails;
    c.Txt_ftpServer =
        AddEditRow(grid, 0, QStringLiteral("ftp URL:"), QStringLiteral("Txt_ftpServer"), f);
    c.txt_ftpUserID =
        AddEditRow(grid, 1, QStringLiteral("ftp UserID:"), QStringLiteral("txt_ftpUserID"), f);
    c.Txt_ftpPassword =
        AddEditRow(grid, 2, QStringLiteral("ftp pwd:"), QStringLiteral("Txt_ftpPassword"), f);
    c.Txt_ftpPassword->setEchoMode(QLineEdit::Password);
    c.Txt_httpServer =
        AddEditRow(grid, 3, QStringLiteral("http Server:"), QStringLiteral("Txt_httpServer"), f);
    c.Txt_WebFolder =
        AddEditRow(grid, 4, QStringLiteral("Folder:"), QStringLiteral("Txt_WebFolder"), f);
    c.Chk_GotSecure = MakeCheck(QStringLiteral("Chk_GotSecure"), QStringLiteral("Got Secure"), f);
    c.Cmd_GetCFG = MakeButton(QStringLiteral("Cmd_GetCFG"), QStringLiteral("Get"), f);
    grid->addWidget(c.Chk_GotSecure, 5, 1);
    grid->addWidget(c.Cmd_GetCFG, 5, 2);
    grid->setColumnStretch(1, 1);
    layout->addWidget(c.Frame_WebDetails);
    layout->addStretch(1);
    return page;
}

} // namespace quorvel
