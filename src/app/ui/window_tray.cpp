#include "app/ui/window_tray.h"

#include "app/run/run_engine.h"
#include "app/ui/desktop_identity.h"
#include "app/ui/frm_web_data_client.h"
#include "app/ui/window_scheduler.h"

#include <QApplication>
#include <QLocale>

namespace quorvel {

namespace {

std::optional<bool>& AvailableOverride() {
    static std::optional<bool> available;
    return available;
}

} // namespace

WindowTray::WindowTray(frm_WebDataClient& window, WindowScheduler& scheduler)
    : window_(window), scheduler_(scheduler) {
    icon_.setIcon(ProgramIcon());
    show_ = menu_.addAction(QStringLiteral("&Show"), this, [this] { ShowWindow(); });
    processAll_ = menu_.addAction(QStringLiteral("&Process all"), this, [this] {
        QPushButton* button = window_.Controls().Cmd_Process[RunEngine::kProcessAll];
        if (button->isEnabled()) button->click();
    });
    menu_.addSeparator();
    quit_ = menu_.addAction(QStringLiteral("&Quit"), this, [this] { Quit(); });
    connect(&menu_, &QMenu::aboutToShow, this, [this] { UpdateMenu(); });
    icon_.setContextMenu(&menu_);
    connect(&icon_, &QSystemTrayIcon::activated, this,
            [this](QSystemTrayIcon::ActivationReason why) {
                if (why == QSystemTrayIcon::Trigger) ShowWindow();
            });
    connect(&scheduler_, &WindowScheduler::ScheduleChanged, this, [this] { Refresh(); });
}

WindowTray::~WindowTray() {
    if (shown_) QApplication::setQuitOnLastWindowClosed(true);
}

void WindowTray::SetAvailable(std::optional<bool> available) {
    AvailableOverride() = available;
}

bool WindowTray::Available() {
    if (AvailableOverride()) return *AvailableOverride();
    return QSystemTrayIcon::isSystemTrayAvailable();
}

void WindowTray::Closed() {
    if (!shown_) return;
    shown_ = false;
    icon_.hide();
    QApplication::setQuitOnLastWindowClosed(true);
}

void WindowTray::Refresh() {
    const bool unattended = window_.StartedMinimised() || scheduler_.IsAutomatic();
    const bool show = unattended && Available();
    if (show != shown_) {
        shown_ = show;
        icon_.setVisible(show);
        // While the tray holds the program, a box closing over a hidden window
        // must not end it.
        QApplication::setQuitOnLastWindowClosed(!show);
    }
    if (shown_) icon_.setToolTip(ToolTip());
}

QString WindowTray::ToolTip() const {
    const QString title = QString::fromLatin1(frm_WebDataClient::kApplicationTitle);
    if (window_.Engine().IsBusy()) return title + QStringLiteral("\nProcessing files");
    const auto due = scheduler_.NextDue();
    if (!due) return title + QStringLiteral("\nNo automatic run planned");
    return title + QStringLiteral("\nNext run: %1 (in %2)")
                       .arg(QLocale::c().toString(*due, QStringLiteral("d MMM yyyy HH:mm")),
                            scheduler_.DueIn().trimmed());
}

bool WindowTray::KeepRunningOnClose() {
    if (!shown_ || quitting_ || !scheduler_.IsAutomatic()) return false;
    if (notices_.isEmpty()) {
        notices_ << QStringLiteral("Quorvel keeps running in the tray and processes your files "
                                   "when they are due. To end it, choose Quit in its menu.");
        icon_.showMessage(QString::fromLatin1(frm_WebDataClient::kApplicationTitle),
                          notices_.back(), ProgramIcon());
    }
    return true;
}

void WindowTray::ShowWindow() {
    window_.showNormal();
    window_.raise();
    window_.activateWindow();
}

void WindowTray::Quit() {
    quitting_ = true;
    // The usual shut-down: a run is asked to stop, unsaved changes are asked about.
    if (window_.close()) {
        quitProgram();
        return;
    }
    quitting_ = false;
}

void WindowTray::UpdateMenu() {
    processAll_->setEnabled(window_.Controls().Cmd_Process[RunEngine::kProcessAll]->isEnabled());
}

} // namespace quorvel
