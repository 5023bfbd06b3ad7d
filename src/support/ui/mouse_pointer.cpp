#include "support/ui/mouse_pointer.h"

#include <QCursor>
#include <QGuiApplication>

namespace quorvel {

CMousePointer::~CMousePointer() {
    if (saved_) QGuiApplication::restoreOverrideCursor();
}

void CMousePointer::SetMousePointer(Qt::CursorShape shape) {
    // The application keeps a stack of override pointers: the first set pushes
    // (saving what was shown), later sets replace the top.
    if (!saved_) {
        QGuiApplication::setOverrideCursor(QCursor(shape));
        saved_ = true;
    } else {
        QGuiApplication::changeOverrideCursor(QCursor(shape));
    }
}

OverrideBusyPointer::~OverrideBusyPointer() {
    while (depth_ > 0)
        Pop();
}

void OverrideBusyPointer::Push() {
    QGuiApplication::setOverrideCursor(QCursor(Qt::WaitCursor));
    ++depth_;
}

void OverrideBusyPointer::Pop() {
    if (depth_ == 0) return;
    QGuiApplication::restoreOverrideCursor();
    --depth_;
}

} // namespace quorvel
