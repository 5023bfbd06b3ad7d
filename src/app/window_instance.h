#pragma once
// One window per program home. The window's process holds a lock file in the
// home for its lifetime and listens for a later start on the same home, which
// asks it to come forward instead of opening a second window (whose settings
// would overwrite the first one's at exit). A lock left by a killed process
// is taken over.
//
// How main() uses it, before the window is made:
//   WindowInstance instance(ProgramHome::Folder());
//   if (!instance.Claim()) { instance.AskHolderToShow(); return; }
//   connect(&instance, &WindowInstance::ShowRequested, ... bring the window forward ...);

#include <QLocalServer>
#include <QLockFile>
#include <QObject>
#include <QString>

#include <chrono>

namespace quorvel {

class WindowInstance : public QObject {
    Q_OBJECT
public:
    explicit WindowInstance(const QString& folder, QObject* parent = nullptr);
    ~WindowInstance() override;

    // True when this process is now the window of the home.
    bool Claim();
    // Asks the window of the home to come forward; true when it answered in time.
    bool AskHolderToShow(std::chrono::milliseconds wait);

    QString LockPath() const { return lockPath_; }
    // The local socket's name: one per program home and user.
    QString ServerName() const { return serverName_; }

    static constexpr const char* kFileName = "quorvel-window.lock";

Q_SIGNALS:
    // Another start on the same home asked this window to come forward.
    void ShowRequested();

private:
    void Answer();

    QString lockPath_;
    QString serverName_;
    QLockFile lock_;
    QLocalServer server_;
};

} // namespace quorvel
