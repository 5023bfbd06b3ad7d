#pragma once
// The main window: the program's settings and account fields, the editor of
// the selected file record, the file list, the trace pane and the run buttons.
// Loading it starts the client and closing it ends it.

#include "app/account_login.h"
#include "app/app_error.h"
#include "app/file_list.h"
#include "app/locations.h"
#include "app/recent_files.h"
#include "app/run/run_settings.h"
#include "app/ui/route_view.h"
#include "app/ui/window_controls.h"
#include "support/ini_store.h"
#include "support/ports.h"

#include <QMainWindow>
#include <QStringList>

#include <functional>
#include <memory>
#include <optional>

class QMimeData;

namespace quorvel {

class AppServices;
class CTALUWebData;
class FtpDisplay;
class RunEngine;
class RunLock;
class WindowRun;
class WindowTray;
class WindowScheduler;
struct AppSettings;
struct RunSummary;
struct FileRecord;
struct TransferRules;

// The window's flags. ListChanged lives with the file list; IsBusy,
// CancelRequested and LastErrorText with the run engine.
struct WindowFlags {
    bool IsLoading = false;    // the program fills controls; field handlers stay quiet
    bool InMessage = false;    // a box was shown; the next activation must not initialise
    bool RecordEdited = false; // the record fields differ from their record
};

// The file-list buttons Cmd_DoFile(0) to Cmd_DoFile(4).
enum FileCommand : int {
    kFileNew = 0,
    kFileMoveUp = 1,
    kFileMoveDown = 2,
    kFileDelete = 3,
    kFileSave = 4,
};

// The file dialogs, replaceable so that tests and scripted use can answer them.
// An empty answer means the user cancelled.
struct FileDialogs {
    std::function<QStringList(QWidget*, const QString& title, const QString& folder,
                              const QString& filter)>
        openFiles;
    std::function<QString(QWidget*, const QString& title, const QString& start,
                          const QString& filter)>
        openFile;
    std::function<QString(QWidget*, const QString& title, const QString& start,
                          const QString& filter)>
        saveFile;
    // The list has changes that are not saved: QMessageBox::Save, Discard or
    // Cancel. listName is the list's file name, empty for a new list.
    std::function<int(QWidget*, const QString& listName)> saveChanges;
    // A box that only informs (About).
    std::function<void(QWidget*, const QString& title, const QString& text)> about;
    static FileDialogs System();
};

class frm_WebDataClient : public QMainWindow, public TraceView {
    Q_OBJECT
public:
    // arguments: the command line without the program name ("/S" in any letter
    // case starts minimised and leaves initialisation to the scheduler).
    explicit frm_WebDataClient(QStringList arguments, QWidget* parent = nullptr);
    ~frm_WebDataClient() override;

    static constexpr const char* kApplicationTitle = "TALU Quorvel";

    // Lifecycle.
    void Form_Load();
    void Form_Activate();
    bool Initialise();
    bool ConfigureClass();

    // Login and account configuration (the steps are AccountLogin's).
    bool GetSecureFTPDetails();
    bool GetUserDetails();
    bool GetFileListFromServer();
    void Cmd_Login_Click();
    void Cmd_GetCFG_Click();
    void Cmd_GetFileList_Click();
    AccountFields AccountFieldsShown() const;
    void ShowAccountFields(const AccountFields& fields);

    // Runs: 0 all files, 1 the file shown (RunEngine::Which). Nothing runs
    // while another process on this program home runs (summary.lockHeld).
    RunSummary Process(int which);
    // The "Process all" and "Process file" buttons: a run, or the news that
    // one is under way elsewhere.
    void Cmd_Process_Click(int which);

    // Window states, trace and status. EnableControls derives the states
    // alone; RefreshFileStatus looks at the record's files (the local file,
    // its last date and, when asked for, the copy at the service).
    void EnableControls();
    void RefreshFileStatus();
    // True while RefreshFileStatus waits for the service.
    bool RefreshingFileStatus() const { return refreshing_; }
    void AddTrace(const QString& text) override;
    void ShowStatus(const QString& text) override;
    bool ShowError(const QString& where, const QString& description);
    bool ShowError(const AppError& error) { return ShowError(error.where, error.description); }
    void SetChanged();

    // The file list and the record fields.
    bool OpenFileList(const QString& path);
    bool LoadDataFile(const QString& path);
    void LoadFilesListBox();
    bool SaveFileList();
    // Before the list in memory is replaced or the window closes: true when
    // nothing is unsaved, or it was saved, or the user let it go. Asks Save /
    // Discard / Cancel; an unattended window saves without asking.
    bool ConfirmUnsavedList();
    // Writes the list to its file, asking for a name when it has none (and
    // mayAsk); false when it was not written (cancelled or failed, after the
    // report).
    bool SaveListNow(bool mayAsk = true);
    // Writes the list when it changed; the error instead of a report.
    std::optional<AppError> SaveChangedList();
    bool StoreCurrentRecord();
    void ShowCurrentRecord();
    void ClearRecordFields();
    // The record as the fields hold it now.
    FileRecord FieldsRecord() const;
    // The local date a run found for entry index: into the fields when they
    // show that entry, else into its record.
    void ShowLocalDate(int index, const QString& date);
    void AddNewFileRecord(const QString& path);
    void SaveFileName(const QString& path);
    void DoFile(int index);

    // Drag and drop of files from the file manager.
    bool AcceptsListDrop(const QMimeData* data) const;
    bool AcceptsFileNameDrop(const QMimeData* data) const;
    void DropOnList(const QMimeData* data);
    void DropOnFileName(const QMimeData* data);

    // Menus and the recent list.
    void ConfigureRecentFiles();
    void AddToRecentFiles(const QString& fileName);
    void mnu_File_Click(int index);
    void mnu_RecentFile_Click(int index);
    void mnu_About_Click();
    // The version and where the program keeps its files.
    static QString AboutText();

    // The folder fields as the location rules take them.
    LocationFolders Folders() const;
    // What ConfigureClass hands to the services, and what a run takes from the fields.
    AccountSettings FieldAccount() const;
    RunSettings FieldSettings() const;
    // The full path of side 0 (this PC) or 1 (the service) of the current record.
    LocationPath FullFilename(int which) const;

    // The web-data object the window owns for the whole run.
    CTALUWebData& WebData();
    RunEngine& Engine() { return *engine_; }
    // Timer1 and the schedule labels; NextDue() is the next automatic run.
    WindowScheduler& Scheduler() { return *scheduler_; }
    WindowTray& Tray() { return *tray_; }

    WindowControls& Controls() { return c_; }
    const WindowControls& Controls() const { return c_; }
    WindowFlags& Flags() { return flags_; }
    const FileList& Files() const { return files_; }
    const RecentFiles& Recent() const { return recent_; }
    int CurrentRecordNumber() const { return currentRecord_; }
    // The list entry the list highlights, -1 for none: the record operations
    // act on it, and without one there is no current record.
    int SelectedRow() const;
    bool StartedMinimised() const { return scheduledStart_; }
    void SetFileDialogs(FileDialogs dialogs) { dialogs_ = std::move(dialogs); }
    // The command line of the start at log-on: "/S", and "--home DIR" when the
    // program's home is not the one it would find by itself.
    static QStringList StartupArguments();

protected:
    void closeEvent(QCloseEvent* event) override;
    void changeEvent(QEvent* event) override;
    void showEvent(QShowEvent* event) override;
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    // Set-up of the handlers, one group per file.
    void ConnectHandlers();
    void ConnectRecordHandlers();
    void ConnectWindowHandlers();
    void ConnectMenus();
    void ConnectLoginHandlers();
    void InstallDropTargets();

    // Lifecycle details.
    // The size the window opens with, and the first share of its splitters.
    QSize FirstSize() const;
    void FirstSplit();
    bool AccountSteps(bool& listFromService);
    void ApplySettings(const AppSettings& values);
    AppSettings CurrentSettings() const;
    void Form_QueryUnload(bool& cancel);
    // Nobody may be there to answer: started with "/S" or the session ends.
    bool Unattended() const { return scheduledStart_ || sessionEnding_; }
    // Where an unattended window puts a list that has no file (or whose file
    // cannot be written), so that it is never dropped.
    bool RescueList();
    void ConnectSessionEnd();
    void Form_Unload();
    void NoteActivation(QEvent* event);

    // States details.
    void RefreshFileStatusOnce();
    void ShowLocalStatus(const LocationPath& full);
    void ShowRemoteStatus(const LocationPath& full);
    void PlotRouteLines();
    RouteDrawing RouteLines() const;

    // Field handlers.
    void Txt_Name_Change();
    void ShowTransferRules(const TransferRules& rules);
    void Opt_Download_Click(int index);
    void Opt_Upload_Click(int index);
    void Opt_MethodID_Click(int index);
    void Chk_Zip_Click();
    void Cmb_TypeID_Click();
    void Opt_Location_Click();
    void Lst_Files_Click();
    void Cmd_ClearFiles_Click();
    void Cmd_LocateFile_Click();
    void Cmd_LocateFolder_Click(int index);
    void Cmd_EditFile_Click();
    void Cmd_Cancel_Click();
    void Chk_RunAtStartUp_Click();
    void Chk_Trace_Click();

    void SetLoadedFile(const QString& path);
    // StoreCurrentRecord without deriving the states.
    void StoreFields();
    const FileRecord& RecordAt(int number) const;
    bool FileListFromUser() const;
    int SelectedTypeID() const;

    WindowControls c_;
    WindowFlags flags_;
    FileList files_;
    RecentFiles recent_;
    int currentRecord_ = 0; // record number shown in the fields, 0 for none
    bool scheduledStart_ = false;
    bool sessionEnding_ = false;
    // RefreshFileStatus may wait for the service; a selection during that wait
    // asks for another refresh instead of starting an exchange inside it, and
    // a run asked for meanwhile starts when the wait is over.
    bool refreshing_ = false;
    bool refreshAgain_ = false;
    std::optional<int> processAfterRefresh_;
    bool activated_ = false;
    bool split_ = false; // the splitters got their first share
    bool reactivate_ = false;
    LocalSettings settings_;
    FileDialogs dialogs_;
    std::unique_ptr<FtpDisplay> ftpDisplay_;
    std::unique_ptr<AppServices> services_;
    std::unique_ptr<RunLock> runLock_;
    std::unique_ptr<RunEngine> engine_;
    std::unique_ptr<WindowRun> run_;
    std::unique_ptr<WindowScheduler> scheduler_;
    std::unique_ptr<WindowTray> tray_;
};

// True when the arguments hold "/S" in any letter case.
bool HasScheduleSwitch(const QStringList& arguments);

} // namespace quorvel
