#include "app/ui/window_scheduler.h"

#include "app/run/run_engine.h"
#include "app/run/scheduler.h"
#include "app/ui/frm_web_data_client.h"
#include "support/date_text.h"
#include "support/ports.h"

#include <QEvent>

namespace quorvel {

WindowScheduler::WindowScheduler(frm_WebDataClient& window) : window_(window) {
    timer_.setObjectName(QStringLiteral("Timer1"));
    connect(&timer_, &QTimer::timeout, this, [this] { Timer1_Timer(); });
    window_.installEventFilter(this);
    ConnectHandlers();
}

void WindowScheduler::ConnectHandlers() {
    WindowControls& c = window_.Controls();
    connect(c.Opt_Automatic, &OptionButtons::Clicked, this, [this] { Opt_Automatic_Click(); });
    // A choice from the list and typing alike switch to automatic runs.
    connect(c.Cmb_interval, &QComboBox::activated, this, [this] { Cmb_interval_Change(); });
    connect(c.Cmb_interval, &QComboBox::editTextChanged, this, [this] { Cmb_interval_Change(); });
}

void WindowScheduler::Start() {
    ticking_ = false;
    timer_.start(static_cast<int>(CurrentClock().Waits().firstTick.count()));
}

void WindowScheduler::Opt_Automatic_Click() {
    if (window_.Flags().IsLoading) return;
    CalculateNextProcessDue();
}

void WindowScheduler::Cmb_interval_Change() {
    if (window_.Flags().IsLoading) return;
    window_.Controls().Opt_Automatic->SetIndex(1);
    CalculateNextProcessDue();
}

bool WindowScheduler::IsAutomatic() const {
    return window_.Controls().Opt_Automatic->SelectedIndex() == 1;
}

void WindowScheduler::CalculateNextProcessDue() {
    WindowControls& c = window_.Controls();
    const DueLabels labels =
        quorvel::CalculateNextProcessDue(IsAutomatic(), c.Cmb_interval->currentText(), NowValue());
    switch (labels.kind) {
    case DueLabels::kUnchanged:
        return;
    case DueLabels::kBadUnit:
        window_.ShowError(QStringLiteral("CalculateNextProcessDue"),
                          QString::fromLatin1(kBadUnitText));
        return;
    case DueLabels::kManual:
    case DueLabels::kDue:
        c.Lbl_NextDownloadDue->setText(labels.next);
        c.Lbl_Due->setText(labels.dueIn);
        Q_EMIT ScheduleChanged();
        return;
    }
}

void WindowScheduler::Timer1_Timer() {
    WindowControls& c = window_.Controls();
    if (!ticking_) {
        // In "/S" mode the first tick, not the first activation, signs in and
        // loads the list. A tick arriving during that wait is no first tick.
        ticking_ = true;
        if (window_.StartedMinimised()) window_.Initialise();
    }
    c.Lbl_Now->setText(FormatDate(NowValue(), QString::fromLatin1(kPatternLong)));
    TickInput input;
    input.automatic = IsAutomatic();
    input.busy = window_.Engine().IsBusy();
    input.nowText = c.Lbl_Now->text();
    input.dueText = c.Lbl_NextDownloadDue->text();
    input.interval = c.Cmb_interval->currentText();
    input.minimised = window_.windowState().testFlag(Qt::WindowMinimized);
    const TickDecision decision = DecideTick(input);
    if (decision.startRun) {
        if (window_.Process(RunEngine::kProcessAll).lockHeld)
            window_.AddTrace(QStringLiteral("A run is under way elsewhere: this tick starts none"));
    } else {
        if (decision.dueIn) c.Lbl_Due->setText(*decision.dueIn);
        if (decision.caption) ShowCaption(*decision.caption);
    }
    timer_.setInterval(static_cast<int>(CurrentClock().Waits().tick.count()));
    Q_EMIT ScheduleChanged();
}

void WindowScheduler::ShowCaption(const QString& caption) {
    window_.setWindowTitle(caption);
    captionShown_ = true;
}

bool WindowScheduler::eventFilter(QObject* watched, QEvent* event) {
    // Back from the task bar, the window shows its title again.
    if (watched == &window_ && event->type() == QEvent::WindowStateChange && captionShown_ &&
        !window_.windowState().testFlag(Qt::WindowMinimized)) {
        captionShown_ = false;
        window_.setWindowTitle(QString::fromLatin1(frm_WebDataClient::kApplicationTitle));
    }
    return QObject::eventFilter(watched, event);
}

std::optional<QDateTime> WindowScheduler::NextDue() const {
    if (!IsAutomatic()) return std::nullopt;
    const auto due = ParseDateText(window_.Controls().Lbl_NextDownloadDue->text());
    if (!due) return std::nullopt;
    return ToQDateTime(*due);
}

QString WindowScheduler::DueIn() const {
    return window_.Controls().Lbl_Due->text();
}

} // namespace quorvel
