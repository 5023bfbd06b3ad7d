#include "support/ui/progress_bar.h"

#include "support/texts.h"

#include <QPainter>

#include <algorithm>
#include <cmath>

namespace quorvel {

namespace {

constexpr int kFontPoints = 8;
constexpr double kSecondsPerDay = 86400.0;
constexpr int kSummaryIndent = 3; // the summary has no leading blank of its own

} // namespace

CProgress::CProgress(QWidget* parent) : QWidget(parent) {
    QFont small = font();
    small.setPointSize(kFontPoints);
    setFont(small);
    setAttribute(Qt::WA_OpaquePaintEvent);
}

QSize CProgress::sizeHint() const {
    return {200, fontMetrics().height() + 4};
}

void CProgress::Initialise(std::int64_t total, int style, const QString& units) {
    total_ = total;
    style_ = style;
    units_ = units;
    start_ = CurrentClock().Now();
    value_ = 0;
    barWidth_ = 0;
    caption_.clear();
    shown_ = false;
    finished_ = false;
    update();
}

int CProgress::BarWidthFor(std::int64_t value, std::int64_t total, int areaWidth) {
    if (total == 0) return areaWidth;
    const double full = total < 0 ? 100.0 : double(total);
    const double width = std::round(double(value) / full * areaWidth);
    // Values past the end (or below the start) show a full (or empty) bar.
    return static_cast<int>(std::clamp(width, 0.0, double(areaWidth)));
}

QString CProgress::CaptionFor(int style, const QString& text) {
    switch (style) {
    case 0:
        return QLatin1Char(' ') + text;
    case 2:
        return text + QLatin1Char(' ');
    case 3:
        return QLatin1Char(' ') + text + QLatin1Char(' ');
    default:
        return text;
    }
}

void CProgress::Show(std::int64_t value, const QString& text) {
    const QString caption = CaptionFor(style_, text);
    const int bar = BarWidthFor(value, total_, width());
    value_ = value;
    // A transfer calls this for every block: repaint only when the picture changes.
    if (shown_ && !finished_ && bar == barWidth_ && caption == caption_) return;
    barWidth_ = bar;
    caption_ = caption;
    shown_ = true;
    finished_ = false;
    update();
}

void CProgress::Finish() {
    const double seconds = start_.isValid() ? start_.secsTo(CurrentClock().Now()) : 0;
    const QString elapsed = DurationText(std::max(0.0, seconds) / kSecondsPerDay);
    if (total_ < 1)
        caption_ = QStringLiteral("Finished: ") + elapsed;
    else
        caption_ = QStringLiteral("Finished: %1 %2 in %3").arg(total_).arg(units_, elapsed);
    barWidth_ = 0;
    shown_ = true;
    finished_ = true;
    update();
}

Qt::Alignment CProgress::CaptionAlignment() const {
    if (finished_) return Qt::AlignLeft;
    switch (style_) {
    case 1:
        return Qt::AlignHCenter;
    case 2:
        return Qt::AlignRight;
    default:
        return Qt::AlignLeft;
    }
}

int CProgress::BarWidth() const {
    return shown_ && !finished_ ? BarWidthFor(value_, total_, width()) : 0;
}

void CProgress::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    if (!shown_) {
        // Nothing to show yet: an empty groove, not a coloured bar that looks busy.
        painter.fillRect(rect(), palette().color(QPalette::Window));
        painter.setPen(palette().color(QPalette::Mid));
        painter.drawRect(rect().adjusted(0, 0, -1, -1));
        return;
    }
    painter.fillRect(rect(), kBackColour);
    PaintBar(painter);
}

void CProgress::PaintBar(QPainter& painter) {
    const QRect area = rect();
    const int flags = Qt::TextSingleLine | Qt::AlignVCenter;
    painter.setPen(kTextColour);
    if (finished_) {
        painter.drawText(area.adjusted(kSummaryIndent, 0, 0, 0), flags | Qt::AlignLeft, caption_);
        return;
    }
    painter.drawText(area, flags | CaptionAlignment(), caption_);
    const int barWidth = BarWidth(); // from the area as it is now
    if (barWidth <= 0) return;

    const QRect bar(0, 0, barWidth, area.height());
    painter.fillRect(bar, kBarColour);
    painter.setClipRect(bar);
    painter.setPen(kBarTextColour);
    // The white caption lies exactly over the black one, so the caption changes
    // colour where the bar ends; style 3 instead carries it at the bar's end
    // once the bar is wide enough for it.
    const bool travel =
        style_ == 3 && painter.fontMetrics().horizontalAdvance(caption_) <= barWidth;
    if (travel)
        painter.drawText(bar, flags | Qt::AlignRight, caption_);
    else
        painter.drawText(area, flags | CaptionAlignment(), caption_);
}

} // namespace quorvel
