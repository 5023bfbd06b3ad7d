#include "app/run/scheduler.h"

#include "support/date_text.h"
#include "support/interval.h"
#include "support/texts.h"

#include <cmath>

namespace quorvel {

namespace {

constexpr std::int64_t kSecondsPerDay = 86400;

std::int64_t UnitSeconds(const QString& unit) {
    // "M" is left out: the date-add operation reads it as months.
    if (unit == QLatin1String("M")) return 0;
    const QString code = unit.toLower();
    if (code == QLatin1String("s")) return 1;
    if (code == QLatin1String("n")) return 60;
    if (code == QLatin1String("h")) return 3600;
    if (code == QLatin1String("d")) return kSecondsPerDay;
    if (code == QLatin1String("w")) return 7 * kSecondsPerDay;
    return 0;
}

} // namespace

std::optional<IntervalSpan> SpanOfInterval(const QString& text) {
    IntervalSpan span;
    if (!ParseInterval(text, span.count, span.unit)) return std::nullopt;
    span.seconds = span.count * UnitSeconds(span.unit);
    return span;
}

bool IsUsableInterval(const QString& text) {
    const auto span = SpanOfInterval(text);
    return span && span->seconds > 0;
}

DateValue NextDueOnGrid(DateValue now, std::int64_t spanSeconds) {
    const DateValue midnight = DatePart(now);
    // Whole milliseconds since midnight: a date value's fraction is not exact,
    // and a time on the grid must not read as a moment before it.
    const std::int64_t sinceMidnight =
        std::llround((now - midnight) * static_cast<double>(kSecondsPerDay) * 1000.0);
    const std::int64_t step = spanSeconds * 1000;
    std::int64_t next = (sinceMidnight / step + 1) * step;
    if (step < kSecondsPerDay * 1000 && next > kSecondsPerDay * 1000) next = kSecondsPerDay * 1000;
    return midnight + static_cast<double>(next) / (static_cast<double>(kSecondsPerDay) * 1000.0);
}

DueLabels CalculateNextProcessDue(bool automatic, const QString& interval, DateValue now) {
    DueLabels labels;
    if (!automatic) {
        labels.kind = DueLabels::kManual;
        labels.next = labels.dueIn = QString::fromLatin1(kNoDueText);
        return labels;
    }
    const auto span = SpanOfInterval(interval);
    if (!span) return labels;
    if (span->seconds <= 0) {
        labels.kind = DueLabels::kBadUnit;
        return labels;
    }
    labels.kind = DueLabels::kDue;
    labels.nextValue = NextDueOnGrid(now, span->seconds);
    labels.next = FormatDate(labels.nextValue, QString::fromLatin1(kPatternDue));
    labels.dueIn = DurationText(labels.nextValue - now);
    return labels;
}

TickDecision DecideTick(const TickInput& input) {
    TickDecision decision;
    if (!input.automatic || input.busy) return decision;
    const DateValue now = DateFromText(input.nowText);
    const DateValue due = DateFromText(input.dueText);
    if (now > due) {
        decision.startRun = IsUsableInterval(input.interval);
        return decision;
    }
    const DateValue left = due - now;
    if (left > 0) decision.dueIn = DurationText(left);
    if (input.minimised) decision.caption = QStringLiteral("Due in: ") + DurationText(left);
    return decision;
}

} // namespace quorvel
