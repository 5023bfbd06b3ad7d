#include "app/ui/window_run.h"

#include "app/run/run_engine.h"
#include "app/ui/frm_web_data_client.h"
#include "support/ui/progress_bar.h"

#include <QCoreApplication>

#include <utility>

namespace quorvel {

PaintThrottle::PaintThrottle(QWidget* window) : window_(window) {
    timer_.setInterval(kPaintMs);
    connect(&timer_, &QTimer::timeout, this, [this] { Release(); });
}

void PaintThrottle::SetOn(bool on) {
    if (on == on_) return;
    on_ = on;
    if (on) {
        QCoreApplication::instance()->installEventFilter(this);
        sinceTurn_.start();
        timer_.start();
    } else {
        QCoreApplication::instance()->removeEventFilter(this);
        timer_.stop();
        Release();
    }
}

// Qt asks a window to lay out and to draw what changed with one request each,
// and asks again only after the request was handled; a held request is sent
// anew when its turn comes.
bool PaintThrottle::eventFilter(QObject* watched, QEvent* event) {
    const QEvent::Type type = event->type();
    if (releasing_ || (type != QEvent::UpdateRequest && type != QEvent::LayoutRequest))
        return false;
    auto* widget = qobject_cast<QWidget*>(watched);
    if (widget == nullptr || (widget != window_ && !window_->isAncestorOf(widget))) return false;
    if (sinceTurn_.elapsed() >= kPaintMs) {
        Release();
        return false;
    }
    if (type == QEvent::UpdateRequest)
        drawHeld_ = true;
    else if (!layoutHeld_.contains(widget))
        layoutHeld_.append(widget);
    return true;
}

void PaintThrottle::Release() {
    sinceTurn_.start();
    releasing_ = true;
    const QList<QPointer<QWidget>> layouts = std::exchange(layoutHeld_, {});
    for (const QPointer<QWidget>& widget : layouts) {
        QEvent request(QEvent::LayoutRequest);
        if (widget) QCoreApplication::sendEvent(widget, &request);
    }
    if (std::exchange(drawHeld_, false)) {
        QEvent request(QEvent::UpdateRequest);
        QCoreApplication::sendEvent(window_, &request);
    }
    releasing_ = false;
}

WindowRun::WindowRun(frm_WebDataClient& window) : window_(window), throttle_(&window) {}

RunSettings WindowRun::Settings() const {
    return window_.FieldSettings();
}

int WindowRun::EntryCount() const {
    return window_.Controls().Lst_Files->count();
}

int WindowRun::ActiveCount() const {
    int count = 0;
    for (const FileRecord& record : window_.Files().Records())
        count += record.Active != 0 ? 1 : 0;
    return count;
}

int WindowRun::CurrentEntry() const {
    return window_.SelectedRow();
}

FileRecord WindowRun::BeginFile(int index) {
    // Selecting stores the fields of the entry shown before and shows this one.
    window_.Controls().Lst_Files->setCurrentRow(index);
    return window_.FieldsRecord();
}

void WindowRun::EndFile(int index, const FileRecord& record) {
    window_.ShowLocalDate(index, record.FileDateLocal);
}

void WindowRun::SetFromDate(int choice, const QString& afterDate) {
    window_.Controls().Txt_AfterDate->setText(afterDate);
    window_.Controls().Opt_Whichdates->SetIndex(choice);
}

std::optional<AppError> WindowRun::SaveFileList() {
    return window_.SaveChangedList();
}

void WindowRun::StampLastRun(const QString& when) {
    window_.Controls().Lbl_LastDownload->setText(when);
}

void WindowRun::BusyChanged(bool busy) {
    throttle_.SetOn(busy);
    window_.EnableControls();
    if (!busy) window_.RefreshFileStatus();
}

void WindowRun::FilesBegin(int activeCount) {
    window_.Controls().Pic_ProgressFile->Initialise(activeCount, 0, QStringLiteral("Files"));
}

void WindowRun::FileBegins(int number, const FileRecord& record) {
    window_.Controls().Pic_ProgressFile->Show(number, record.Name);
}

void WindowRun::FilesEnd(int) {
    window_.Controls().Pic_ProgressFile->Finish();
}

void WindowRun::MessageShown() {
    window_.Flags().InMessage = true;
}

} // namespace quorvel
