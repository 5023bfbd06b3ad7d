#pragma once
// The window's side of a run: the engine walks the list box, each entry's
// record is shown in the fields before it is processed (so the user sees the
// walk and the fields go back into their records), the "Files" progress moves
// and the window's states follow the run.

#include "app/run/run_host.h"

namespace quorvel {

class frm_WebDataClient;

class WindowRun : public RunHost, public RunObserver {
public:
    explicit WindowRun(frm_WebDataClient& window) : window_(window) {}

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
};

} // namespace quorvel
