#pragma once
// Every control of the main window, by its described name. The window builds
// them once (BuildWindowControls) and its procedures reach them through here.

#include "app/ui/option_buttons.h"
#include "support/ui/hint_list.h"

#include <QAction>
#include <QCheckBox>
#include <QComboBox>
#include <QGroupBox>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QPushButton>
#include <QRadioButton>
#include <QTabWidget>

#include <array>

class QMainWindow;
class QSplitter;

namespace quorvel {

class CProgress;
class RouteView;

struct WindowControls {
    QSplitter* Spl_Window = nullptr; // the editor and list above, runs and trace below
    QTabWidget* SSTab1 = nullptr;

    // "Main"
    QLineEdit* Txt_CFG_URL = nullptr;
    QLineEdit* Txt_UserID = nullptr;
    QLineEdit* Txt_Password = nullptr;
    QPushButton* Cmd_Login = nullptr;
    QLabel* Lbl_UserName = nullptr;
    QCheckBox* Chk_RunAtStartUp = nullptr;
    QGroupBox* Frame1 = nullptr;
    OptionButtons* Opt_Automatic = nullptr;
    QComboBox* Cmb_interval = nullptr;
    QLabel* Lbl_Due = nullptr;
    QLabel* Lbl_Now = nullptr;
    QLabel* Lbl_NextDownloadDue = nullptr;
    QLabel* Lbl_LastDownload = nullptr;

    // "Files"
    QWidget* FilesPage = nullptr;
    QLineEdit* Txt_Name = nullptr;
    QLineEdit* Txt_FileName = nullptr;
    QPushButton* Cmd_LocateFile = nullptr;
    QPushButton* Cmd_EditFile = nullptr;
    QCheckBox* Chk_Active = nullptr;
    QCheckBox* Chk_Zip = nullptr;
    QComboBox* Cmb_TypeID = nullptr;
    QGroupBox* Frame_Upload = nullptr;
    OptionButtons* Opt_Upload = nullptr;
    QGroupBox* Frame_Download = nullptr;
    OptionButtons* Opt_Download = nullptr;
    QLineEdit* Txt_FileDate = nullptr;
    QLineEdit* Txt_FileDateLocal = nullptr;
    QGroupBox* Frame_MethodID = nullptr;
    OptionButtons* Opt_MethodID = nullptr;
    QGroupBox* Frame_AdminLocationID = nullptr;
    OptionButtons* Opt_AdminLocationID = nullptr;
    QGroupBox* Frame_UserLocationID = nullptr;
    OptionButtons* Opt_UserLocationID = nullptr;
    QLineEdit* Txt_Folder = nullptr;
    std::array<QLabel*, 4> lbl_UserLocationFolder{};
    std::array<RouteView*, 2> Pic_Route{};
    std::array<QLabel*, 2> Lbl_FullFilename{};
    std::array<QLabel*, 2> Lbl_FileStatus{};
    std::array<QLabel*, 2> Lbl_LastDate{};
    std::array<QCheckBox*, 2> chk_ShowDate{};
    QGroupBox* Frame_Files = nullptr;
    OptionButtons* Opt_GetFileList = nullptr;

    // "Folders"
    QGroupBox* Frame9 = nullptr;
    OptionButtons* Opt_GetLocalFolders = nullptr;
    QCheckBox* Chk_GotPHP = nullptr;
    std::array<QLineEdit*, 2> Txt_LocalFolder{};
    std::array<QPushButton*, 2> Cmd_LocateFolder{};
    QLineEdit* Txt_UserFolder = nullptr;
    QLineEdit* Txt_UserCurrentFolder = nullptr;
    QLabel* Lbl_UserFolder = nullptr;

    // "New Season"
    QGroupBox* Frame2 = nullptr;
    OptionButtons* Opt_Whichdates = nullptr;
    QLineEdit* Txt_AfterDate = nullptr;
    std::array<QLabel*, 2> lbl_Help{};
    QPushButton* Cmd_Admin = nullptr;
    QCheckBox* Chk_GotFileList = nullptr;
    QPushButton* Cmd_GetFileList = nullptr;
    QPushButton* Cmd_ClearFiles = nullptr;
    QLabel* Lbl_LoadedFile = nullptr;

    // "Options"
    QCheckBox* Chk_DownloadOnly = nullptr;
    QGroupBox* Frame_WebDetails = nullptr;
    QLineEdit* Txt_ftpServer = nullptr;
    QLineEdit* txt_ftpUserID = nullptr;
    QLineEdit* Txt_ftpPassword = nullptr;
    QLineEdit* Txt_httpServer = nullptr;
    QLineEdit* Txt_WebFolder = nullptr;
    QCheckBox* Chk_GotSecure = nullptr;
    QPushButton* Cmd_GetCFG = nullptr;

    // Outside the tab strip
    HintList* Lst_Files = nullptr;            // says what to do while it is empty
    std::array<QPushButton*, 5> Cmd_DoFile{}; // 4 "Save" stands on "New Season"
    std::array<QPushButton*, 2> Cmd_Process{};
    QPushButton* Cmd_Cancel = nullptr;
    QPushButton* Cmd_Close = nullptr;
    QListWidget* Lst_Trace = nullptr;
    QPushButton* Cmd_Clear = nullptr;
    QCheckBox* Chk_Trace = nullptr;
    QCheckBox* chk_TraceServer = nullptr;
    std::array<QCheckBox*, 5> chk_Log{};
    QLabel* Lbl_status = nullptr;
    CProgress* Pic_ProgressFile = nullptr;
    CProgress* Pic_ProgressFTP = nullptr;

    // Menus
    std::array<QAction*, 5> mnu_File{};       // New, Open, Save As, separator, Exit
    QAction* mnu_SaveList = nullptr;          // Save: the list to its own file
    std::array<QAction*, 6> mnu_RecentFile{}; // 0 is the separator above the entries
    std::array<QAction*, 2> mnu_Help{};       // Contents, About
};

// Creates every control inside window (central widget and menu bar).
void BuildWindowControls(QMainWindow* window, WindowControls& c);

// Tab builders, one per page of SSTab1.
QWidget* BuildMainTab(WindowControls& c);
QWidget* BuildFilesTab(WindowControls& c);
QWidget* BuildFoldersTab(WindowControls& c);
QWidget* BuildNewSeasonTab(WindowControls& c);
QWidget* BuildOptionsTab(WindowControls& c);

// Small makers that give each control its described name.
QLabel* MakeLabel(const QString& caption, QWidget* parent, const QString& name = {});
// A label for paths and messages of any length: it takes the room the layout
// gives it and never widens the window.
QLabel* MakePathLabel(const QString& name, QWidget* parent);
QLineEdit* MakeEdit(const QString& name, QWidget* parent);
QPushButton* MakeButton(const QString& name, const QString& caption, QWidget* parent);
QCheckBox* MakeCheck(const QString& name, const QString& caption, QWidget* parent);
QGroupBox* MakeFrame(const QString& name, const QString& caption, QWidget* parent);
QString Indexed(const char* name, int index);

} // namespace quorvel
