// The window states: every enabled and visible state is derived here from the
// window's data, never stored.

#include "app/ui/frm_web_data_client.h"
#include "app/ui/window_services.h"
#include "support/files.h"
#include "support/texts.h"
#include "support/ui/status_label.h"

#include <QApplication>
#include <QFileInfo>
#include <QRadioButton>

namespace quorvel {

namespace {

const QColor kFileStatusColour(128, 128, 0);

// White text on the status colour, or no text on the button face.
void SetFileStatus(QLabel* label, const QString& text, bool coloured) {
    label->setText(text);
    QPalette palette = label->palette();
    palette.setColor(QPalette::Window, coloured ? kFileStatusColour
                                                : QApplication::palette().color(QPalette::Button));
    palette.setColor(QPalette::WindowText, Qt::white);
    label->setPalette(palette);
}

} // namespace

void frm_WebDataClient::EnableControls() {
    const bool editable = FileListFromUser();
    const bool busy = flags_.IsBusy;
    const int sel = c_.Lst_Files->currentRow();
    const int count = c_.Lst_Files->count();
    const bool support = c_.Chk_Trace->isChecked();

    EnableRecordControls(editable, busy, sel, count, support);

    const bool foldersFromUser = c_.Opt_GetLocalFolders->Button(0)->isChecked();
    for (QWidget* w :
         {static_cast<QWidget*>(c_.Cmd_LocateFolder[1]),
          static_cast<QWidget*>(c_.Txt_LocalFolder[1]), static_cast<QWidget*>(c_.Txt_UserFolder),
          static_cast<QWidget*>(c_.Txt_UserCurrentFolder)})
        w->setEnabled(foldersFromUser);

    c_.Cmd_Process[0]->setEnabled(count > 0 && !busy);
    c_.Cmd_Process[1]->setEnabled(sel >= 0 && !busy);
    c_.Cmd_Cancel->setEnabled(busy);
    c_.Cmd_Close->setEnabled(!busy);
    for (QWidget* w :
         {static_cast<QWidget*>(c_.Cmd_GetCFG), static_cast<QWidget*>(c_.Cmd_GetFileList),
          static_cast<QWidget*>(c_.Cmd_Admin), static_cast<QWidget*>(c_.Cmd_ClearFiles),
          static_cast<QWidget*>(c_.Chk_GotFileList), static_cast<QWidget*>(c_.Frame_WebDetails),
          static_cast<QWidget*>(c_.Chk_GotPHP)})
        w->setVisible(support);

    const LocationFolders folders = Folders();
    for (int i = 0; i < 4; ++i) {
        c_.lbl_UserLocationFolder[i]->setText(GetLocationFolder(folders, i, kOnThisPc));
        c_.lbl_UserLocationFolder[i]->setToolTip(c_.lbl_UserLocationFolder[i]->text());
    }
    PlotRouteLines();
    ConfigureClass();
    ShowFileStatus(sel);
}

void frm_WebDataClient::EnableRecordControls(bool editable, bool busy, int sel, int count,
                                             bool support) {
    for (QWidget* w : std::initializer_list<QWidget*>{
             c_.Cmd_LocateFile, c_.Chk_Active, c_.Chk_Zip, c_.Txt_Name, c_.Txt_FileName,
             c_.Frame_AdminLocationID, c_.Frame_UserLocationID, c_.Frame_MethodID,
             c_.Frame_Download, c_.Frame_Upload, c_.Txt_FileDate, c_.Txt_FileDateLocal,
             c_.Txt_Folder})
        w->setEnabled(editable);
    for (int i = 0; i < 4; ++i)
        c_.mnu_File[i]->setVisible(editable);
    ConfigureRecentFiles();
    c_.Cmd_GetFileList->setEnabled(!editable);
    c_.Cmd_DoFile[0]->setEnabled(sel >= 0 && editable && !busy);
    c_.Cmd_DoFile[1]->setEnabled(sel > 0 && editable && !busy);
    c_.Cmd_DoFile[2]->setEnabled(sel >= 0 && editable && sel < count - 1 && !busy);
    c_.Cmd_DoFile[3]->setEnabled(sel >= 0 && editable && !busy);
    c_.Cmd_DoFile[4]->setEnabled(editable && flags_.RecordEdited);
    c_.Cmd_DoFile[4]->setVisible(support);
}

void frm_WebDataClient::ShowFileStatus(int sel) {
    if (sel < 0) {
        for (int i = 0; i < 2; ++i) {
            c_.Lbl_FullFilename[i]->clear();
            SetFileStatus(c_.Lbl_FileStatus[i], QString(), false);
            c_.Lbl_LastDate[i]->clear();
        }
        return;
    }
    for (int i = 0; i < 2; ++i) {
        const LocationPath full = FullFilename(i);
        c_.Lbl_FullFilename[i]->setText(full.ok() ? full.path : full.refusal);
        c_.Lbl_FullFilename[i]->setToolTip(c_.Lbl_FullFilename[i]->text());
        c_.Lbl_LastDate[i]->setText(
            full.ok()
                ? services_->LastDateInFile(full.path, c_.Opt_UserLocationID->SelectedIndex(), i,
                                            SelectedTypeID(), c_.chk_ShowDate[i]->isChecked())
                : QString());
    }
    ShowLocalStatus(FullFilename(kOnThisPc));
    ShowRemoteStatus(FullFilename(kAtService));
}

void frm_WebDataClient::ShowLocalStatus(const LocationPath& full) {
    QLabel* label = c_.Lbl_FileStatus[0];
    if (!full.ok()) {
        SetFileStatus(label, QStringLiteral("Refused"), true);
    } else if (!full.path.contains(QLatin1Char('.'))) {
        SetFileStatus(label, QString(), false);
    } else if (!FileExists(full.path)) {
        SetFileStatus(label, QStringLiteral("NotExist"), true);
    } else if (full.path.contains(QLatin1Char('*'))) {
        SetFileStatus(label, QStringLiteral(" - "), true);
    } else {
        SetFileStatus(label, FormatByteSize(QFileInfo(full.path).size()), true);
    }
}

void frm_WebDataClient::ShowRemoteStatus(const LocationPath& full) {
    QLabel* label = c_.Lbl_FileStatus[1];
    if (full.path.isEmpty() || !full.ok() || !c_.chk_ShowDate[1]->isChecked()) {
        SetFileStatus(label, QString(), false);
        return;
    }
    const auto size = services_->RemoteFileSize(full.path);
    SetFileStatus(label, size ? FormatByteSize(*size) : QStringLiteral("NotExist"), true);
}

void frm_WebDataClient::SetChanged() {
    flags_.RecordEdited = true;
    files_.ListChanged = true;
    c_.Cmd_DoFile[4]->setEnabled(true);
}

void frm_WebDataClient::AddTrace(const QString& text) {
    if (!c_.chk_Log[0]->isChecked()) return;
    const QStringList lines = text.split(QLatin1Char('\n'));
    for (QString line : lines) {
        if (line.endsWith(QLatin1Char('\r'))) line.chop(1);
        c_.Lst_Trace->addItem(line);
    }
    c_.Lst_Trace->setCurrentRow(c_.Lst_Trace->count() - 1);
}

void frm_WebDataClient::ShowStatus(const QString& text) {
    AddTrace(QStringLiteral("Status>") + text);
    SetStatusLabel(c_.Lbl_status, text);
    if (isMinimized()) setWindowTitle(text);
}

} // namespace quorvel
