#include "support/error_box.h"

#include "support/ports.h"

namespace quorvel {

bool ShowErrorBox(const QString& description, const QString& where) {
    CurrentPrompter().SystemMsgBox(description + QStringLiteral("\r\n") + where, kButtonsOk);
    return false;
}

} // namespace quorvel
