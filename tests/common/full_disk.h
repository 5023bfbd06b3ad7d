#pragma once
// A folder on a disk that runs out of room, for tests of writes that must fail
// cleanly.
//
// Where the test may mount file systems (as root, or in a container that
// allows it), the folder is a small tmpfs of its own, mounted in a private
// mount namespace of the test process and unmounted when the object goes (the
// namespace ends with the process, so even a crashed test leaves no mount
// behind). Fill() then takes its free space down to the byte count asked for.
//
// Elsewhere (CI without mount rights, or QUORVEL_TEST_NO_MOUNT=1) the folder is
// an ordinary temporary folder, and Run() carries out the write in a child
// process whose files may not grow beyond the room left (RLIMIT_FSIZE, with
// SIGXFSZ ignored, so the write fails with "File too large" instead).
//
// Use:
//   FullDisk disk;
//   const QString old = disk.Write("files.txt", oldBytes);  // before it fills
//   disk.Fill();                                           // or Fill(8 * 1024)
//   const auto outcome = disk.Run([&] { return FullDisk::Outcome{ok, error}; });
//   EXPECT_FALSE(outcome.ok);
//   EXPECT_TRUE(outcome.text.contains(disk.Reason()));
//
// In the child process Run() must not touch state that the parent needs
// afterwards (an FTP connection opened before, for instance).

#include <QByteArray>
#include <QString>
#include <QTemporaryDir>

#include <functional>

namespace quorvel::testing {

class FullDisk {
public:
    struct Outcome {
        bool ok = false;
        QString text;
    };

    // size: the size of the tmpfs when one is mounted.
    explicit FullDisk(qint64 size = 1 << 20);
    ~FullDisk();
    FullDisk(const FullDisk&) = delete;
    FullDisk& operator=(const FullDisk&) = delete;

    bool Valid() const { return dir_.isValid(); }
    bool Mounted() const { return mounted_; }
    QString Path() const;
    QString File(const QString& name) const;
    // Writes a file while there is room (creating missing folders).
    QString Write(const QString& name, const QByteArray& bytes) const;
    QByteArray Read(const QString& name) const;
    // Every regular file in the folder tree, relative names, sorted.
    QStringList Files() const;

    // Leaves about `room` bytes for what Run() writes.
    void Fill(qint64 room = 0);
    // Runs the write with only the room Fill() left.
    Outcome Run(const std::function<Outcome()>& write) const;
    // The system's text for the failure the test should see.
    QString Reason() const;

private:
    QTemporaryDir dir_;
    bool mounted_ = false;
    qint64 room_ = -1;
};

} // namespace quorvel::testing
