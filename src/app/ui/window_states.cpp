// The window states: every enabled and visible state is derived from the
// window's data (DeriveControlStates), never stored. The status rows of the
// record's two files are refreshed in a step of their own, because they look
// at files and may ask the service.

#include "app/app_services.h"
#include "app/control_states.h"
#include "app/run/run_engine.h"
#include "app/ui/frm_web_data_client.h"
#include "support/files.h"
#include "support/texts.h"
#include "support/ui/status_label.h"

#include <QApplication>
#include <QFileInfo>
#include <QRadioButton>
#include <QRegularExpression>

#include <utility>

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

void SetEnabled(std::initializer_list<QWidget*> widgets, bool enabled) {
    for (QWidget* w : widgets)
        w->setEnabled(enabled);
}

// The lines of a text joined into one, for a label one line high.
QString OneLine(const QString& text) {
    if (!text.contains(QLatin1Char('\n')) && !text.contains(QLatin1Char('\r'))) return text;
    QStringList lines =
        text.split(QRegularExpression(QStringLiteral("[\r\n]+")), Qt::SkipEmptyParts);
    for (QString& line : lines)
        line = line.trimmed();
    return lines.join(QStringLiteral(" \u2014 "));
}

// What an empty file list tells the user to do next.
QString EmptyListHint(bool listFromUser) {
    if (listFromUser)
        return QStringLiteral("No data files in this list yet.\n\nPress New to choose them, "
                              "or drag them here from your file manager.");
    return QStringLiteral("No file list yet.\n\nLog in on the Main tab to get the list kept "
                          "for you at the web site, or choose \"File list from... User\" on the "
                          "Files tab to make your own.");
}

} // namespace

void frm_WebDataClient::EnableControls() {
    ControlInputs in;
    in.listFromUser = FileListFromUser();
    in.foldersFromUser = c_.Opt_GetLocalFolders->Button(0)->isChecked();
    in.busy = engine_->IsBusy();
    in.support = c_.Chk_Trace->isChecked();
    in.recordEdited = flags_.RecordEdited;
    in.selected = SelectedRow();
    in.count = c_.Lst_Files->count();
    const ControlStates s = DeriveControlStates(in);

    SetEnabled({c_.Cmd_LocateFile, c_.Chk_Active, c_.Chk_Zip, c_.Txt_Name, c_.Txt_FileName,
                c_.Frame_AdminLocationID, c_.Frame_UserLocationID, c_.Frame_MethodID,
                c_.Frame_Download, c_.Frame_Upload, c_.Txt_FileDate, c_.Txt_FileDateLocal,
                c_.Txt_Folder, c_.Cmb_TypeID},
               s.recordFields);
    c_.Lst_Files->setEnabled(s.fileList);
    c_.Lst_Files->SetEmptyHint(EmptyListHint(in.listFromUser));
    for (QAction* entry :
         {c_.mnu_File[0], c_.mnu_File[1], c_.mnu_File[2], c_.mnu_File[3], c_.mnu_SaveList}) {
        entry->setVisible(s.fileMenu);
        entry->setEnabled(s.fileMenuEnabled);
    }
    ConfigureRecentFiles();
    for (int i = 1; i <= RecentFiles::kEntries; ++i)
        c_.mnu_RecentFile[i]->setEnabled(s.fileMenuEnabled);
    c_.Cmd_GetFileList->setEnabled(s.getFileList);
    c_.Cmd_ClearFiles->setEnabled(s.clearFiles);
    c_.Cmd_DoFile[kFileNew]->setEnabled(s.newEntry);
    c_.Cmd_DoFile[kFileMoveUp]->setEnabled(s.moveUp);
    c_.Cmd_DoFile[kFileMoveDown]->setEnabled(s.moveDown);
    c_.Cmd_DoFile[kFileDelete]->setEnabled(s.deleteEntry);
    c_.Cmd_DoFile[kFileSave]->setEnabled(s.saveRecord);
    c_.Cmd_DoFile[kFileSave]->setVisible(s.saveVisible);
    SetEnabled({c_.Cmd_LocateFolder[1], c_.Txt_LocalFolder[1], c_.Txt_UserFolder,
                c_.Txt_UserCurrentFolder},
               s.userFolders);
    c_.Cmd_Process[RunEngine::kProcessAll]->setEnabled(s.processAll);
    c_.Cmd_Process[RunEngine::kProcessFile]->setEnabled(s.processFile);
    c_.Cmd_Cancel->setEnabled(s.cancel);
    c_.Cmd_Close->setEnabled(s.close);
    for (QWidget* w : std::initializer_list<QWidget*>{
             c_.Cmd_GetCFG, c_.Cmd_GetFileList, c_.Cmd_Admin, c_.Cmd_ClearFiles, c_.Chk_GotFileList,
             c_.Frame_WebDetails, c_.Chk_GotPHP})
        w->setVisible(s.supportControls);

    const LocationFolders folders = Folders();
    for (int i = 0; i < 4; ++i) {
        c_.lbl_UserLocationFolder[i]->setText(GetLocationFolder(folders, i, kOnThisPc));
        c_.lbl_UserLocationFolder[i]->setToolTip(c_.lbl_UserLocationFolder[i]->text());
    }
    PlotRouteLines();
    // A run hands the fields to the services itself, before every file.
    if (!in.busy) ConfigureClass();
}

void frm_WebDataClient::RefreshFileStatus() {
    // Asking the service waits for its reply in the event loop. A selection
    // made meanwhile never starts a second exchange inside the first: it asks
    // for one more refresh, which shows the latest selection when the wait is
    // over.
    if (refreshing_) {
        refreshAgain_ = true;
        return;
    }
    refreshing_ = true;
    do {
        refreshAgain_ = false;
        RefreshFileStatusOnce();
    } while (refreshAgain_);
    refreshing_ = false;
    if (const auto which = std::exchange(processAfterRefresh_, std::nullopt))
        Cmd_Process_Click(*which);
}

void frm_WebDataClient::RefreshFileStatusOnce() {
    if (currentRecord_ == 0) {
        for (int i = 0; i < 2; ++i) {
            c_.Lbl_FullFilename[i]->clear();
            SetFileStatus(c_.Lbl_FileStatus[i], QString(), false);
            c_.Lbl_LastDate[i]->clear();
        }
        return;
    }
    // During a run the files are the run's: their dates are read by the
    // exchange itself and the service is busy with it. Both are looked at
    // again when the run ends.
    const bool running = engine_->IsBusy();
    for (int i = 0; i < 2 && !refreshAgain_; ++i) {
        const LocationPath full = FullFilename(i);
        c_.Lbl_FullFilename[i]->setText(full.ok() ? full.path : full.refusal);
        c_.Lbl_FullFilename[i]->setToolTip(c_.Lbl_FullFilename[i]->text());
        if (running) {
            c_.Lbl_LastDate[i]->clear();
            continue;
        }
        c_.Lbl_LastDate[i]->setText(
            full.ok()
                ? services_->LastDateInFile(full.path, c_.Opt_UserLocationID->SelectedIndex(), i,
                                            SelectedTypeID(), c_.chk_ShowDate[i]->isChecked())
                : QString());
    }
    // A selection during a wait above: the next pass shows that one.
    if (refreshAgain_) return;
    ShowLocalStatus(FullFilename(kOnThisPc));
    if (!running)
        ShowRemoteStatus(FullFilename(kAtService));
    else
        SetFileStatus(c_.Lbl_FileStatus[1], QString(), false);
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
    c_.Cmd_DoFile[kFileSave]->setEnabled(true);
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
    // The label is one line high: a text of several lines is shown as one.
    const QString line = OneLine(text);
    if (engine_->IsBusy() && !line.isEmpty() && !c_.Lbl_status->text().isEmpty()) {
        // During a run the exchanges report several texts a file: the label
        // keeps its colour and is drawn at the window's pace.
        c_.Lbl_status->setText(line);
    } else {
        SetStatusLabel(c_.Lbl_status, line);
    }
    c_.Lbl_status->setToolTip(line);
    if (isMinimized()) setWindowTitle(line);
}

} // namespace quorvel
