// The File menu with its recent file lists, and the Help menu.

#include "app/ui/frm_web_data_client.h"
#include "support/program_home.h"

#include <QDir>

namespace quorvel {

namespace {

const QString kListFilter = QStringLiteral("files.txt (file*.txt);;All files (*)");

// A file name shown as a menu caption: "&" would mark a shortcut letter.
QString MenuCaption(const QString& text) {
    QString caption = text;
    return caption.replace(QLatin1Char('&'), QLatin1String("&&"));
}

} // namespace

void frm_WebDataClient::ConnectMenus() {
    for (int i = 0; i < 5; ++i)
        connect(c_.mnu_File[i], &QAction::triggered, this, [this, i] { mnu_File_Click(i); });
    for (int i = 1; i <= RecentFiles::kEntries; ++i)
        connect(c_.mnu_RecentFile[i], &QAction::triggered, this,
                [this, i] { mnu_RecentFile_Click(i); });
    connect(c_.mnu_SaveList, &QAction::triggered, this, [this] { SaveListNow(); });
    // "&Contents" has no help file to open yet.
    c_.mnu_Help[0]->setEnabled(false);
    connect(c_.mnu_Help[1], &QAction::triggered, this, [this] { mnu_About_Click(); });
}

QString frm_WebDataClient::AboutText() {
    return QStringLiteral("<p><b>Quorvel %1</b></p>"
                          "<p>Keeps the files of your data loggers and weather stations in step "
                          "with your account on the web service.</p>"
                          "<p>Settings, logs and the file list: %2</p>")
        .arg(QStringLiteral(QUORVEL_VERSION), ProgramHome::Folder().toHtmlEscaped());
}

void frm_WebDataClient::mnu_About_Click() {
    dialogs_.about(this, QStringLiteral("About"), AboutText());
}

void frm_WebDataClient::ConfigureRecentFiles() {
    const bool fromUser = FileListFromUser();
    for (int i = 1; i <= RecentFiles::kEntries; ++i) {
        c_.mnu_RecentFile[i]->setText(MenuCaption(recent_.Caption(i)));
        c_.mnu_RecentFile[i]->setVisible(recent_.IsEntryVisible(i, fromUser));
    }
    c_.mnu_RecentFile[0]->setVisible(recent_.IsSeparatorVisible(fromUser));
}

void frm_WebDataClient::AddToRecentFiles(const QString& fileName) {
    recent_.Add(fileName);
    ConfigureRecentFiles();
    SetLoadedFile(fileName);
}

void frm_WebDataClient::mnu_File_Click(int index) {
    StoreCurrentRecord();
    switch (index) {
    case 0: {
        if (!ConfirmUnsavedList()) break;
        files_.Clear();
        files_.ListChanged = false;
        currentRecord_ = 0;
        const bool loading = flags_.IsLoading;
        flags_.IsLoading = true;
        c_.Lst_Files->clear();
        flags_.IsLoading = loading;
        SetLoadedFile(QString());
        EnableControls();
        RefreshFileStatus();
        break;
    }
    case 1: {
        const QString chosen = dialogs_.openFile(this, QStringLiteral("Open file list"),
                                                 files_.LoadedFile, kListFilter);
        if (!chosen.isEmpty() && ConfirmUnsavedList())
            OpenFileList(QDir::toNativeSeparators(chosen));
        break;
    }
    case 2: {
        const QString chosen = dialogs_.saveFile(this, QStringLiteral("Save file list"),
                                                 files_.LoadedFile, kListFilter);
        if (chosen.isEmpty()) break;
        const QString path = QDir::toNativeSeparators(chosen);
        AddToRecentFiles(path);
        // Saving under a chosen name writes the list even when it has not changed.
        if (const auto error = files_.SaveFileListAs(path, Folders())) ShowError(*error);
        break;
    }
    case 4:
        close();
        break;
    default:
        break;
    }
}

void frm_WebDataClient::mnu_RecentFile_Click(int index) {
    if (!recent_.Entry(index).isEmpty() && ConfirmUnsavedList()) OpenFileList(recent_.Entry(index));
}

} // namespace quorvel
