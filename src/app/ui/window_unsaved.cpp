// Changes to the file list are never dropped without a word: before another
// list replaces it, and before the window closes, the user chooses Save,
// Discard or Cancel. An unattended window cannot ask, so it saves.

#include "app/app_settings.h"
#include "app/ui/frm_web_data_client.h"
#include "support/log_file.h"
#include "support/program_home.h"

#include <QDateTime>
#include <QDir>
#include <QFileInfo>
#include <QGuiApplication>
#include <QMessageBox>
#include <QSessionManager>

namespace quorvel {

namespace {

const QString kListFilter = QStringLiteral("files.txt (file*.txt);;All files (*)");

} // namespace

void frm_WebDataClient::ConnectSessionEnd() {
    // The desktop session ends: nobody will answer a question, and the list
    // must not be lost with the session.
    // The settings are written too: a program in the tray is never closed.
    connect(qApp, &QGuiApplication::commitDataRequest, this, [this](QSessionManager&) {
        sessionEnding_ = true;
        ConfirmUnsavedList();
        CurrentSettings().Save(settings_);
        sessionEnding_ = false;
    });
}

bool frm_WebDataClient::ConfirmUnsavedList() {
    if (!files_.ListChanged && !flags_.RecordEdited) return true;
    // Nobody may be there to answer, and saving loses nothing; a list the
    // administrator keeps came from the service, not from an edit, and is
    // written back as it always was.
    if (Unattended() || !FileListFromUser()) {
        if (SaveListNow(false)) return true;
        return RescueList();
    }
    const QString name =
        files_.LoadedFile.isEmpty() ? QString() : QFileInfo(files_.LoadedFile).fileName();
    switch (dialogs_.saveChanges(this, name)) {
    case QMessageBox::Save:
        return SaveListNow();
    case QMessageBox::Discard:
        files_.ListChanged = false;
        flags_.RecordEdited = false;
        return true;
    default:
        return false;
    }
}

bool frm_WebDataClient::SaveListNow(bool mayAsk) {
    StoreCurrentRecord();
    QString path = files_.LoadedFile;
    std::optional<AppError> error;
    if (path.isEmpty()) {
        // A new list has no file yet: it gets one rather than being dropped.
        if (!mayAsk) return false;
        const QString chosen = dialogs_.saveFile(this, QStringLiteral("Save file list"),
                                                 c_.Txt_LocalFolder[0]->text(), kListFilter);
        if (chosen.isEmpty()) return false;
        path = QDir::toNativeSeparators(chosen);
        AddToRecentFiles(path);
        error = files_.SaveFileListAs(path, Folders());
    } else {
        error = files_.SaveFileList(Folders());
    }
    if (error) return ShowError(*error);
    if (files_.ListChanged) {
        // The save waits for folders that do not exist and cannot be made.
        return ShowError(QStringLiteral("SaveFileList:") + path,
                         QStringLiteral("The application folder or the data folder does not "
                                        "exist, so the file list was not saved"));
    }
    return true;
}

bool frm_WebDataClient::RescueList() {
    const QString path = ProgramHome::Folder() + QDir::separator() +
                         QStringLiteral("files-unsaved-%1.txt")
                             .arg(CurrentClock().Now().toString(QStringLiteral("yyyyMMdd-HHmmss")));
    if (const auto error = files_.WriteTo(path)) {
        WriteLogFile(QStringLiteral("The file list could not be saved: ") + error->description);
        return true; // nothing more an unattended window can do
    }
    WriteLogFile(QStringLiteral("The unsaved file list was written to ") + path);
    files_.ListChanged = false;
    flags_.RecordEdited = false;
    return true;
}

} // namespace quorvel
