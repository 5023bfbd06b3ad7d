#include "app/ui/frm_web_data_client.h"

#include "app/app_services.h"
#include "app/run/run_engine.h"
#include "app/run/run_lock.h"
#include "app/ui/desktop_identity.h"
#include "app/ui/route_view.h"
#include "app/ui/window_displays.h"
#include "app/ui/window_run.h"
#include "app/ui/window_scheduler.h"
#include "app/ui/window_tray.h"
#include "support/program_home.h"
#include "support/ui/list_ops.h"
#include "support/ui/progress_bar.h"

#include <QFileDialog>
#include <QGuiApplication>
#include <QMessageBox>
#include <QRadioButton>

namespace quorvel {

bool HasScheduleSwitch(const QStringList& arguments) {
    for (const QString& argument : arguments)
        if (argument.compare(QLatin1String("/S"), Qt::CaseInsensitive) == 0) return true;
    return false;
}

FileDialogs FileDialogs::System() {
    FileDialogs dialogs;
    dialogs.openFiles = [](QWidget* owner, const QString& title, const QString& folder,
                           const QString& filter) {
        return QFileDialog::getOpenFileNames(owner, title, folder, filter);
    };
    dialogs.openFile = [](QWidget* owner, const QString& title, const QString& start,
                          const QString& filter) {
        return QFileDialog::getOpenFileName(owner, title, start, filter);
    };
    dialogs.saveFile = [](QWidget* owner, const QString& title, const QString& start,
                          const QString& filter) {
        QFileDialog dialog(owner, title, start, filter);
        dialog.setAcceptMode(QFileDialog::AcceptSave);
        dialog.setDefaultSuffix(QStringLiteral("txt"));
        return dialog.exec() == QDialog::Accepted ? dialog.selectedFiles().value(0) : QString();
    };
    dialogs.saveChanges = [](QWidget* owner, const QString& listName) {
        QMessageBox box(
            QMessageBox::Warning, QGuiApplication::applicationDisplayName(),
            listName.isEmpty()
                ? QStringLiteral("The new file list has not been saved.")
                : QStringLiteral("The file list %1 has changes that are not saved.").arg(listName),
            QMessageBox::Save | QMessageBox::Discard | QMessageBox::Cancel, owner);
        box.setInformativeText(QStringLiteral("Save them before you go on?"));
        box.setDefaultButton(QMessageBox::Save);
        return box.exec();
    };
    dialogs.about = [](QWidget* owner, const QString& title, const QString& text) {
        QMessageBox::about(owner, title, text);
    };
    return dialogs;
}

frm_WebDataClient::frm_WebDataClient(QStringList arguments, QWidget* parent)
    : QMainWindow(parent), scheduledStart_(HasScheduleSwitch(arguments)),
      settings_(ProgramHome::SettingsFile()), dialogs_(FileDialogs::System()) {
    setObjectName(QStringLiteral("frm_WebDataClient"));
    // Every box and dialog of the program carries its title and icon.
    ApplyDesktopIdentity(QString::fromLatin1(kApplicationTitle));
    setWindowTitle(QStringLiteral("Quorvel"));
    BuildWindowControls(this, c_);
    for (auto* picture : c_.Pic_Route)
        picture->SetSource(c_.FilesPage, [this] { return RouteLines(); });
    c_.Frame_UserLocationID->installEventFilter(this);
    ftpDisplay_ = std::make_unique<FtpDisplay>(c_.Lst_Trace, c_.Lbl_status);
    services_ = std::make_unique<AppServices>();
    runLock_ = std::make_unique<RunLock>();
    engine_ = std::make_unique<RunEngine>(*services_, *this);
    engine_->SetRunLock(runLock_.get());
    run_ = std::make_unique<WindowRun>(*this);
    scheduler_ = std::make_unique<WindowScheduler>(*this);
    engine_->CalculateNextProcessDue = [this] { scheduler_->CalculateNextProcessDue(); };
    tray_ = std::make_unique<WindowTray>(*this, *scheduler_);
    ConnectHandlers();
    ConnectSessionEnd();
    InstallDropTargets();
    setMinimumSize(760, 540); // below this the editor has no room left to work in
    resize(FirstSize());
}

frm_WebDataClient::~frm_WebDataClient() = default;

CTALUWebData& frm_WebDataClient::WebData() {
    return services_->WebData();
}

RunSummary frm_WebDataClient::Process(int which) {
    // A command never starts while another one waits for its reply: the run
    // starts when the wait is over.
    if (refreshing_) {
        processAfterRefresh_ = which;
        return {};
    }
    return engine_->Process(which, *run_, *run_);
}

void frm_WebDataClient::ConnectHandlers() {
    ConnectRecordHandlers();
    ConnectWindowHandlers();
    ConnectMenus();
    ConnectLoginHandlers();
}

void frm_WebDataClient::SetLoadedFile(const QString& path) {
    files_.LoadedFile = path;
    c_.Lbl_LoadedFile->setText(path);
    c_.Lbl_LoadedFile->setToolTip(path);
}

const FileRecord& frm_WebDataClient::RecordAt(int number) const {
    // Numbers past the end stand for the empty record a new entry starts from.
    static const FileRecord empty;
    return number >= 1 && number <= files_.Count() ? files_.At(number - 1) : empty;
}

bool frm_WebDataClient::FileListFromUser() const {
    return c_.Opt_GetFileList->Button(0)->isChecked();
}

int frm_WebDataClient::SelectedTypeID() const {
    return ListItemDataValue(c_.Cmb_TypeID);
}

LocationFolders frm_WebDataClient::Folders() const {
    LocationFolders folders;
    folders.application = c_.Txt_LocalFolder[0]->text();
    folders.data = c_.Txt_LocalFolder[1]->text();
    folders.user = c_.Txt_UserFolder->text();
    folders.userCurrent = c_.Txt_UserCurrentFolder->text();
    folders.web = c_.Txt_WebFolder->text();
    folders.other = c_.Txt_Folder->text();
    return folders;
}

AccountSettings frm_WebDataClient::FieldAccount() const {
    AccountSettings a;
    a.ftpServer = c_.Txt_ftpServer->text();
    a.ftpUserId = c_.txt_ftpUserID->text();
    a.ftpPassword = c_.Txt_ftpPassword->text();
    a.ftpTrace = c_.Chk_Trace->isChecked();
    for (std::size_t i = 0; i < a.logs.size(); ++i)
        a.logs[i] = c_.chk_Log[i]->isChecked();
    a.httpServer = c_.Txt_httpServer->text();
    a.webFolder = c_.Txt_WebFolder->text();
    a.fromDateChoice = c_.Opt_Whichdates->SelectedIndex();
    a.afterDate = c_.Txt_AfterDate->text();
    a.userId = c_.Txt_UserID->text();
    a.password = c_.Txt_Password->text();
    return a;
}

RunSettings frm_WebDataClient::FieldSettings() const {
    RunSettings settings;
    settings.folders = Folders();
    settings.folders.other.clear();
    settings.account = FieldAccount();
    settings.downloadOnly = c_.Chk_DownloadOnly->isChecked();
    return settings;
}

LocationPath frm_WebDataClient::FullFilename(int which) const {
    // The service side shows only the user's own folders when the file is uploaded.
    const bool userFoldersOnly = c_.Opt_Upload->SelectedIndex() != kUploadNever;
    return ProcessFilename(Folders(), c_.Txt_FileName->text(),
                           c_.Opt_UserLocationID->SelectedIndex(),
                           c_.Opt_AdminLocationID->SelectedIndex(), userFoldersOnly, which);
}

bool frm_WebDataClient::ShowError(const QString& where, const QString& description) {
    // A run clears its own busy state when it ends; clearing it here would let
    // a second run start inside the first.
    flags_.IsLoading = false;
    flags_.InMessage = true;
    CurrentPrompter().MyMsgBox(ErrorBoxText({description, where}), kButtonsOk | kIconExclamation);
    return false;
}

} // namespace quorvel
