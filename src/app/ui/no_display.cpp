#include "app/ui/no_display.h"

#include <QByteArray>
#include <QString>
#include <QStringList>

#include <cstdio>

namespace quorvel {

namespace {

bool Given(const char* variable) {
    return !qEnvironmentVariableIsEmpty(variable);
}

// Whether the platform plugin Qt is about to load can find its display.
bool PlatformHasDisplay(const QString& platform) {
    if (platform.startsWith(QLatin1String("xcb"))) return Given("DISPLAY");
    if (platform.startsWith(QLatin1String("wayland"))) return Given("WAYLAND_DISPLAY");
    return true; // offscreen, vnc, eglfs and the others need no desktop display
}

} // namespace

bool ReportMissingDisplay(int argc, char* argv[]) {
#if defined(Q_OS_UNIX) && !defined(Q_OS_DARWIN)
    for (int i = 1; i < argc; ++i) {
        const QByteArray argument(argv[i]);
        if (argument == "-platform" || argument == "--platform") return false;
    }
    const QString platforms = qEnvironmentVariable("QT_QPA_PLATFORM");
    if (platforms.isEmpty()) {
        if (Given("DISPLAY") || Given("WAYLAND_DISPLAY")) return false;
    } else {
        // Qt tries each of "a;b" in turn.
        for (const QString& platform : platforms.split(QLatin1Char(';'), Qt::SkipEmptyParts))
            if (PlatformHasDisplay(platform)) return false;
    }
    std::fputs("Quorvel found no display for its window (DISPLAY and WAYLAND_DISPLAY are not "
               "set); to work without a window, use the command-line run: "
               "quorvel --run-all [--home DIR]\n",
               stderr);
    return true;
#else
    Q_UNUSED(argc);
    Q_UNUSED(argv);
    return false;
#endif
}

} // namespace quorvel
