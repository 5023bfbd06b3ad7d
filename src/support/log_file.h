#pragma once
// Log files: one line per event, "yyyy-mm-dd HH:MM:SS:" then the text. The file
// is opened and closed for every line, so it can be read or deleted any time.

#include <QString>

namespace quorvel {

// Appends one line to a log file; false when it could not be written.
bool AppendLogLine(const QString& file, const QString& text);

// The program's own log ("<program>.log" in the program folder). A failure is
// reported in a plain box naming the file; the caller goes on.
void WriteLogFile(const QString& text);

} // namespace quorvel
