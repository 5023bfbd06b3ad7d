#pragma once

#include <QString>

#include <cstdint>

namespace quorvel {

// The scheduler's interval text ("15 minutes", "3 hrs", "1 day"): count and
// unit code ("n" minutes, "h" hours, "d" days; other letters passed on).
// Unit is in/out: callers pass it empty.
bool ParseInterval(const QString& text, std::int16_t& count, QString& unit);

} // namespace quorvel
