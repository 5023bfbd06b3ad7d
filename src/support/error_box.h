#pragma once
// The plain error box of the support modules.

#include <QString>

namespace quorvel {

// Shows description + CR LF + where in the waiting system box; returns false.
bool ShowErrorBox(const QString& description, const QString& where);

} // namespace quorvel
