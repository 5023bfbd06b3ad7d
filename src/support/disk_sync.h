#pragma once
// Waiting until a file's written data is on the disk.

#include <QString>

namespace quorvel {

// Flushes the system's buffers of an open file (its native handle) to the disk.
// False with the system's reason when the disk refused them: a network or
// delayed-allocation file system may only now find that it has no room.
bool SyncToDisk(int handle, QString* reason);

// The system's text for an error number ("No space left on device").
QString SystemErrorText(int error);

} // namespace quorvel
