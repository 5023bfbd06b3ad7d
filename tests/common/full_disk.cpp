#include "common/full_disk.h"

#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QFileInfo>

#include <cerrno>
#include <csignal>
#include <cstring>

#include <sched.h>
#include <sys/mount.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

namespace quorvel::testing {

namespace {

const QString kFiller = QStringLiteral(".filler");

// Mounts made from here on are seen by this process (and its children) only,
// and vanish with it.
bool EnterPrivateMountNamespace() {
    return ::unshare(CLONE_NEWNS) == 0 &&
           ::mount(nullptr, "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0;
}

bool MayMount() {
    if (qEnvironmentVariableIsSet("QUORVEL_TEST_NO_MOUNT")) return false;
    static const bool inPrivateNamespace = EnterPrivateMountNamespace();
    return inPrivateNamespace;
}

void WriteAll(int fd, const QByteArray& bytes) {
    for (qsizetype done = 0; done < bytes.size();) {
        const ssize_t n = ::write(fd, bytes.constData() + done, bytes.size() - done);
        if (n <= 0) return;
        done += n;
    }
}

QByteArray ReadAll(int fd) {
    QByteArray bytes;
    char buffer[4096];
    for (ssize_t n; (n = ::read(fd, buffer, sizeof buffer)) > 0;)
        bytes.append(buffer, n);
    return bytes;
}

} // namespace

FullDisk::FullDisk(qint64 size) {
    QDir(dir_.path()).mkdir(QStringLiteral("disk"));
    if (!MayMount()) return;
    const QByteArray target = QFile::encodeName(Path());
    const QByteArray options = "size=" + QByteArray::number(size);
    mounted_ = ::mount("tmpfs", target.constData(), "tmpfs", MS_NOSUID | MS_NODEV,
                       options.constData()) == 0;
}

FullDisk::~FullDisk() {
    if (mounted_) ::umount2(QFile::encodeName(Path()).constData(), MNT_DETACH);
}

QString FullDisk::Path() const {
    return dir_.filePath(QStringLiteral("disk"));
}

QString FullDisk::File(const QString& name) const {
    return Path() + u'/' + name;
}

QString FullDisk::Write(const QString& name, const QByteArray& bytes) const {
    const QString path = File(name);
    QDir().mkpath(QFileInfo(path).absolutePath());
    QFile file(path);
    if (file.open(QIODevice::WriteOnly)) file.write(bytes);
    return path;
}

QByteArray FullDisk::Read(const QString& name) const {
    QFile file(File(name));
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<missing>");
}

QStringList FullDisk::Files() const {
    QStringList names;
    QDirIterator it(Path(), QDir::Files | QDir::Hidden, QDirIterator::Subdirectories);
    while (it.hasNext()) {
        const QString name = QDir(Path()).relativeFilePath(it.next());
        if (name != kFiller) names << name;
    }
    names.sort();
    return names;
}

void FullDisk::Fill(qint64 room) {
    room_ = room;
    if (!mounted_) return;
    QFile filler(File(kFiller));
    if (!filler.open(QIODevice::WriteOnly | QIODevice::Unbuffered)) return;
    const QByteArray block(64 * 1024, 'f');
    for (qint64 step = block.size(); step > 0;) {
        if (filler.write(block.constData(), step) != step) step /= 2;
    }
    if (room > 0) filler.resize(std::max<qint64>(0, filler.size() - room));
}

FullDisk::Outcome FullDisk::Run(const std::function<Outcome()>& write) const {
    if (mounted_ || room_ < 0) return write();
    int channel[2];
    if (::pipe(channel) != 0) return {false, QStringLiteral("no pipe")};
    const pid_t child = ::fork();
    if (child == 0) {
        ::close(channel[0]);
        std::signal(SIGXFSZ, SIG_IGN);
        rlimit limit{static_cast<rlim_t>(room_), static_cast<rlim_t>(room_)};
        ::setrlimit(RLIMIT_FSIZE, &limit);
        const Outcome outcome = write();
        WriteAll(channel[1], (outcome.ok ? "1" : "0") + outcome.text.toUtf8());
        ::_exit(0);
    }
    ::close(channel[1]);
    const QByteArray reply = child > 0 ? ReadAll(channel[0]) : QByteArray();
    ::close(channel[0]);
    int status = 0;
    if (child > 0) ::waitpid(child, &status, 0);
    if (child <= 0 || !WIFEXITED(status) || reply.isEmpty())
        return {false, QStringLiteral("the writing child process failed")};
    return {reply.front() == '1', QString::fromUtf8(reply.mid(1))};
}

QString FullDisk::Reason() const {
    return QString::fromLocal8Bit(std::strerror(mounted_ ? ENOSPC : EFBIG));
}

} // namespace quorvel::testing
