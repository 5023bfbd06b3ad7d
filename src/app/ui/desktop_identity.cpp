#include "app/ui/desktop_identity.h"

#include <QApplication>

namespace quorvel {

QIcon ProgramIcon() {
    const QString id = QString::fromLatin1(kDesktopId);
    return QIcon::fromTheme(id, QIcon(QStringLiteral(":/quorvel/") + id + QStringLiteral(".svg")));
}

void ApplyDesktopIdentity(const QString& title) {
    QGuiApplication::setApplicationDisplayName(title);
    QGuiApplication::setDesktopFileName(QString::fromLatin1(kDesktopId));
    QApplication::setWindowIcon(ProgramIcon());
}

} // namespace quorvel
