#include "app/run/run_lock.h"

#include "support/program_home.h"

#include <QDir>

namespace quorvel {

RunLock::RunLock() : RunLock(ProgramHome::Folder()) {}

RunLock::RunLock(const QString& folder)
    : path_(QDir(folder).filePath(QString::fromLatin1(kFileName))),
      file_(std::make_unique<QLockFile>(path_)) {
    // A run may take hours: only a holder that no longer exists makes the
    // lock stale, never its age.
    file_->setStaleLockTime(0);
}

RunLock::~RunLock() {
    if (depth_ > 0) file_->unlock();
}

bool RunLock::TryAcquire() {
    if (depth_ > 0) {
        ++depth_;
        return true;
    }
    if (!file_->tryLock(0)) return false;
    depth_ = 1;
    return true;
}

void RunLock::Release() {
    if (depth_ == 0) return;
    if (--depth_ == 0) file_->unlock();
}

QString RunLock::Holder() const {
    qint64 pid = 0;
    QString host, application;
    if (!file_->getLockInfo(&pid, &host, &application)) return {};
    return QStringLiteral("process %1").arg(pid);
}

} // namespace quorvel
