#pragma once
// A note kept beside a data file while records are appended to it, holding the
// file's length before the append. An append that ends normally or fails
// removes it; one that is killed leaves it, and the next run cuts the file back
// to the end of its last whole record before it reads the file's last date.
//
// The note is a hidden file in the data file's folder (".NAME.appending").

#include <QString>

#include <optional>

namespace quorvel::append_note {

QString NotePath(const QString& dataFile);
// Writes the note; false when it cannot be written.
bool Begin(const QString& dataFile, qint64 lengthBefore);
void End(const QString& dataFile);
// When a note says an append was cut off: the length of the file up to the
// end of its last whole record (never below the length the note holds).
// nullopt when no append was cut off.
std::optional<qint64> WholeLength(const QString& dataFile);
// Cuts the torn tail that WholeLength finds and removes the note; false when
// the file cannot be cut.
bool Repair(const QString& dataFile);

} // namespace quorvel::append_note
