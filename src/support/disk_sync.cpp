// The one platform file of disk syncing.
#include "support/disk_sync.h"

#include <cerrno>
#include <cstring>

#ifdef _WIN32
#include <io.h>
#else
#include <unistd.h>
#endif

namespace quorvel {

QString SystemErrorText(int error) {
    return QString::fromLocal8Bit(std::strerror(error));
}

bool SyncToDisk(int handle, QString* reason) {
#ifdef _WIN32
    const bool synced = _commit(handle) == 0;
#else
    int result = 0;
    do {
        result = ::fsync(handle);
    } while (result != 0 && errno == EINTR);
    // A file that cannot be synced (some virtual file systems) has nothing to lose.
    const bool synced = result == 0 || errno == EINVAL;
#endif
    if (!synced && reason != nullptr) *reason = SystemErrorText(errno);
    return synced;
}

} // namespace quorvel
