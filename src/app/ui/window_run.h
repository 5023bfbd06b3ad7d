#pragma once
// The window's side of a run: the engine walks the list box, each entry's
// record is shown in the fields before it is processed (so the user sees the
// walk and the fields go back into their records), the "Files" progress moves
// and the window's states follow the run.

#include "app/run/run_host.h"

#include <QElapsedTimer>
#include <QList>
#include <QObject>
#include <QPointer>
#include <QTimer>

namespace quorvel {

class frm_WebDataClient;

// Lays out and draws a window at most every kPaintMs while it is on: a run of
// many small files would otherwise spend more time drawing the walk than
// moving data. Only the parts that changed are drawn, and a long transfer
// still shows its progress at that pace.
class PaintThrottle : public QObject {
public:
    static constexpr int kPaintMs = 50;
    explicit PaintThrottle(QWidget* window);
    void SetOn(bool on);

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    void Release();

    QWidget* window_;
    QTimer timer_;
    QElapsedTimer sinceTurn_;
    bool on_ = false;
    bool drawHeld_ = false;               // a drawing waits for its turn
    QList<QPointer<QWidget>> layoutHeld_; // widgets whose layout waits
    bool releasing_ = false;              // the held requests go through now
};

class WindowRun : public RunHost, public RunObserver {
public:
    explicit WindowRun(frm_WebDataClient& window);

    // RunHost
    RunSettings Settings() const override;
    int EntryCount() const override;
    int ActiveCount() const override;
    int CurrentEntry() const override;
    FileRecord BeginFile(int index) override;
    void EndFile(int index, const FileRecord& record) override;
    void SetFromDate(int choice, const QString& afterDate) override;
    std::optional<AppError> SaveFileList() override;
    void StampLastRun(const QString& when) override;

    // RunObserver
    void BusyChanged(bool busy) override;
    void FilesBegin(int activeCount) override;
    void FileBegins(int number, const FileRecord& record) override;
    void FilesEnd(int processed) override;
    void MessageShown() override;

private:
    frm_WebDataClient& window_;
    PaintThrottle throttle_;
};

} // namespace quorvel
