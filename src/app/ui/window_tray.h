#pragma once
// The tray icon of a program that works unattended ("/S" or automatic runs):
// its tooltip gives the next due time, its menu offers Show, Process all and
// Quit, and closing the window while runs are automatic leaves the program
// working in the tray (the first time, a notice says so).

#include <QAction>
#include <QCoreApplication>
#include <QMenu>
#include <QObject>
#include <QSystemTrayIcon>

#include <functional>
#include <optional>

namespace quorvel {

class frm_WebDataClient;
class WindowScheduler;

class WindowTray : public QObject {
    Q_OBJECT
public:
    WindowTray(frm_WebDataClient& window, WindowScheduler& scheduler);
    ~WindowTray() override;

    // Whether the desktop has a tray; tests stand in for one (nullopt: ask Qt).
    static void SetAvailable(std::optional<bool> available);

    // Shows or hides the icon as the window's mode asks and brings the
    // tooltip's due time up to date.
    void Refresh();
    bool Shown() const { return shown_; }
    QString ToolTip() const;
    QMenu& Menu() { return menu_; }
    QAction* ShowAction() const { return show_; }
    QAction* ProcessAllAction() const { return processAll_; }
    QAction* QuitAction() const { return quit_; }

    // Asked by the window's close: true when the program goes on in the tray
    // instead (runs are automatic and the close does not come from Quit).
    bool KeepRunningOnClose();
    // The window closed for good: the icon goes, and the program ends with it.
    void Closed();
    // The notices shown so far (the tray's balloon messages).
    const QStringList& Notices() const { return notices_; }

    // Ends the program once Quit closed the window (tests record it instead).
    std::function<void()> quitProgram = [] { QCoreApplication::quit(); };

private:
    static bool Available();
    void ShowWindow();
    void Quit();
    void UpdateMenu();

    frm_WebDataClient& window_;
    WindowScheduler& scheduler_;
    QSystemTrayIcon icon_;
    QMenu menu_;
    QAction* show_ = nullptr;
    QAction* processAll_ = nullptr;
    QAction* quit_ = nullptr;
    bool shown_ = false;
    bool quitting_ = false;
    QStringList notices_;
};

} // namespace quorvel
