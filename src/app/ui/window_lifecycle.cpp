// Start-up, activation and shut-down of the window, and the settings file.

#include "app/app_services.h"
#include "app/app_settings.h"
#include "app/run/run_engine.h"
#include "app/ui/frm_web_data_client.h"
#include "app/ui/window_displays.h"
#include "app/ui/window_scheduler.h"
#include "app/ui/window_tray.h"
#include "support/date_value.h"
#include "support/program_home.h"
#include "support/run_at_startup.h"
#include "support/ui/list_ops.h"
#include "support/ui/progress_bar.h"
#include "support/ui/status_label.h"

#include <QApplication>
#include <QCloseEvent>
#include <QFileDialog>
#include <QMessageBox>
#include <QRadioButton>
#include <QTimer>

#include <utility>

namespace quorvel {

namespace {

void SetCheck(QCheckBox* box, int value) {
    box->setCheckState(value != 0 ? Qt::Checked : Qt::Unchecked);
}

std::int16_t CheckOf(const QCheckBox* box) {
    return box->isChecked() ? 1 : 0;
}

std::int16_t IndexOf(const OptionButtons* group) {
    return static_cast<std::int16_t>(group->SelectedIndex());
}

// Positions are kept in twips, 15 to a pixel at the usual 96 dots per inch.
constexpr float kTwipsPerPixel = 15.0f;

void SetBackground(QWidget* widget, const QColor& colour) {
    widget->setAutoFillBackground(true);
    QPalette palette = widget->palette();
    palette.setColor(QPalette::Window, colour);
    palette.setColor(QPalette::Base, colour);
    widget->setPalette(palette);
}

} // namespace

void frm_WebDataClient::Form_Load() {
    flags_.IsLoading = true;
    scheduler_->Start();
    if (scheduledStart_) setWindowState(windowState() | Qt::WindowMinimized);
    services_->SetViews(this, ftpDisplay_.get(), c_.Pic_ProgressFTP);
    ComboBoxSink intervals(c_.Cmb_interval);
    services_->FillIntervals(intervals);
    ComboBoxSink dataTypes(c_.Cmb_TypeID);
    services_->FillDataTypes(dataTypes);
    SetBackground(c_.Lbl_UserName, kStatusHighlight);
    SetBackground(c_.Lst_Files, kStatusHighlight);

    AppSettings values =
        AppSettings::Defaults(ProgramHome::Folder(), CurrentClock().Now().date().year(),
                              ProgramHome::DefaultDataFolder());
    const auto error = values.Load(settings_);
    recent_ = values.recentFiles;
    ApplySettings(values);
    // An unreadable value took its own default; the start goes on.
    if (error)
        ShowError(error->where.isEmpty() ? QStringLiteral("Load") : error->where,
                  error->description);
    c_.Chk_RunAtStartUp->setChecked(GetRunAtStartup(false, StartupArguments()) != 0);
    ConfigureRecentFiles();
    c_.Lbl_Now->setText(FormatDate(NowValue(), QString::fromLatin1(kPatternLong)));
    recent_.SetEntry(1, values.loadedFile);
    SetLoadedFile(values.loadedFile);
    ConfigureRecentFiles();
    ConfigureClass();
    setWindowTitle(QString::fromLatin1(kApplicationTitle));
    EnableControls();
    RefreshFileStatus();
    tray_->Refresh();
    flags_.IsLoading = false;
}

void frm_WebDataClient::ApplySettings(const AppSettings& values) {
    c_.Txt_CFG_URL->setText(values.cfgUrl);
    c_.Txt_UserID->setText(values.userId);
    c_.Txt_Password->setText(values.password);
    c_.Txt_LocalFolder[0]->setText(values.applicationFolder);
    c_.Txt_LocalFolder[1]->setText(values.dataFolder);
    SetCheck(c_.chk_ShowDate[0], values.showDate0);
    c_.Opt_GetLocalFolders->SetIndex(values.getLocalFolders);
    c_.Opt_GetFileList->SetIndex(values.getFileList);
    c_.Opt_Automatic->SetIndex(values.automatic);
    c_.Cmb_interval->setCurrentText(values.interval);
    c_.Lbl_LastDownload->setText(values.lastDownload);
    c_.Lbl_NextDownloadDue->setText(values.nextDownloadDue);
    SetCheck(c_.Chk_DownloadOnly, values.downloadOnly);
    c_.Opt_Whichdates->SetIndex(values.whichdates);
    c_.Txt_AfterDate->setText(values.afterDate);
}

AppSettings frm_WebDataClient::CurrentSettings() const {
    AppSettings values;
    values.left = static_cast<float>(x()) * kTwipsPerPixel;
    values.top = static_cast<float>(y()) * kTwipsPerPixel;
    values.cfgUrl = c_.Txt_CFG_URL->text();
    values.userId = c_.Txt_UserID->text();
    values.password = c_.Txt_Password->text();
    values.applicationFolder = c_.Txt_LocalFolder[0]->text();
    values.dataFolder = c_.Txt_LocalFolder[1]->text();
    values.automatic = IndexOf(c_.Opt_Automatic);
    values.interval = c_.Cmb_interval->currentText();
    values.lastDownload = c_.Lbl_LastDownload->text();
    values.nextDownloadDue = c_.Lbl_NextDownloadDue->text();
    values.whichdates = IndexOf(c_.Opt_Whichdates);
    values.afterDate = c_.Txt_AfterDate->text();
    values.showDate0 = CheckOf(c_.chk_ShowDate[0]);
    values.showDate1 = CheckOf(c_.chk_ShowDate[1]);
    values.getFileList = IndexOf(c_.Opt_GetFileList);
    values.getLocalFolders = IndexOf(c_.Opt_GetLocalFolders);
    values.downloadOnly = CheckOf(c_.Chk_DownloadOnly);
    values.recentFiles = recent_;
    return values;
}

void frm_WebDataClient::Form_Activate() {
    services_->Attach();
    // A return to the window during a run never reloads the list being walked.
    if (!flags_.InMessage && !scheduledStart_ && !engine_->IsBusy()) Initialise();
    flags_.InMessage = false;
}

bool frm_WebDataClient::Initialise() {
    BusyGuard busy(CurrentBusyPointer());
    bool listFromService = false;
    // Nothing to sign in with yet (a first start): the way there, not the
    // failure of a fetch from an empty address.
    const bool configured = !c_.Txt_CFG_URL->text().trimmed().isEmpty();
    const bool signedIn = configured && AccountSteps(listFromService);
    if (!configured)
        ShowStatus(QStringLiteral("Welcome to Quorvel: enter the CFG file web address, your user "
                                  "ID and password on the Main tab, then press Login."));
    // When the service cannot be reached (offline, no account yet) the list on
    // this PC still opens: the user's own list, or at start-up the copy of the
    // service's list saved by the last session. The failed step's reason stays
    // in the status line.
    const bool ownList = c_.Opt_GetLocalFolders->SelectedIndex() != 1;
    const bool openLocal = signedIn ? !listFromService : ownList || files_.Count() == 0;
    if (openLocal && !OpenFileList(recent_.Entry(1))) return false;
    if (!signedIn) return false;
    ShowStatus(QString());
    return true;
}

bool frm_WebDataClient::ConfigureClass() {
    services_->Configure(FieldAccount());
    return true;
}

void frm_WebDataClient::Form_QueryUnload(bool& cancel) {
    if (engine_->IsBusy()) {
        // Only asks the run to stop. The running transfer is left to end (a
        // half-sent file at the service would pass for the whole one) and the
        // run writes the list itself when it ends.
        engine_->RequestStop();
        cancel = true;
        return;
    }
    // Unsaved changes: saved, let go, or the window stays open.
    if (!ConfirmUnsavedList()) {
        cancel = true;
        return;
    }
    services_->CloseFtp();
    SaveFileList();
}

void frm_WebDataClient::Form_Unload() {
    if (!CurrentSettings().Save(settings_))
        ShowError(QStringLiteral("Unload"),
                  QStringLiteral("The settings could not be written to ") + settings_.Path());
    for (QWidget* window : QApplication::topLevelWidgets())
        if (window != this && window->isVisible()) window->close();
}

void frm_WebDataClient::closeEvent(QCloseEvent* event) {
    if (tray_->KeepRunningOnClose()) {
        hide();
        event->ignore();
        return;
    }
    bool cancel = false;
    Form_QueryUnload(cancel);
    if (cancel) {
        event->ignore();
        return;
    }
    Form_Unload();
    tray_->Closed();
    event->accept();
}

void frm_WebDataClient::showEvent(QShowEvent* event) {
    QMainWindow::showEvent(event);
    if (!std::exchange(split_, true)) FirstSplit();
    // The first showing counts as the first activation, also where no window
    // manager ever activates the window.
    if (!activated_)
        QTimer::singleShot(0, this, [this] {
            if (activated_) return;
            activated_ = true;
            Form_Activate();
        });
}

void frm_WebDataClient::changeEvent(QEvent* event) {
    NoteActivation(event);
    QMainWindow::changeEvent(event);
}

void frm_WebDataClient::NoteActivation(QEvent* event) {
    if (event->type() != QEvent::ActivationChange) return;
    if (!isActiveWindow()) {
        // Only a return from another window of the program counts as an
        // activation; file dialogs and the system's boxes do not.
        QWidget* other = QApplication::activeWindow();
        reactivate_ = other != nullptr && other != this && !qobject_cast<QFileDialog*>(other) &&
                      !qobject_cast<QMessageBox*>(other);
        return;
    }
    const bool first = !activated_;
    activated_ = true;
    // A return to the window never reloads a list whose changes are not saved.
    const bool unsaved = files_.ListChanged || flags_.RecordEdited;
    if (first || reactivate_) {
        if (!first && unsaved) flags_.InMessage = true; // skips the initialisation
        Form_Activate();
    }
    reactivate_ = false;
}

} // namespace quorvel
