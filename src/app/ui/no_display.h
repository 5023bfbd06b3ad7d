#pragma once
// A window needs a display. Started without one (no X11 or Wayland display
// and no other platform asked for), the program says so in one line and
// points to the command-line run, instead of Qt's platform-plugin text and
// an abort.

namespace quorvel {

// argv: the program's arguments ("-platform NAME" counts as asking for one).
// True, after the line on standard error, when there is no display to open
// the window on.
bool ReportMissingDisplay(int argc, char* argv[]);

} // namespace quorvel
