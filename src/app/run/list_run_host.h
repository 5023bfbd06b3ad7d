#pragma once
// A run over a FileList alone, without any window: the entries are the list's
// records and the fields are a RunSettings held here. For the command-line run
// and for tests of the engine.

#include "app/file_list.h"
#include "app/run/run_host.h"

namespace quorvel {

class ListRunHost : public RunHost {
public:
    ListRunHost(FileList& list, RunSettings settings)
        : list_(list), settings_(std::move(settings)) {}

    RunSettings Settings() const override { return settings_; }
    int EntryCount() const override { return list_.Count(); }
    int ActiveCount() const override;
    int CurrentEntry() const override { return current_; }
    FileRecord BeginFile(int index) override;
    void EndFile(int index, const FileRecord& record) override;
    void SetFromDate(int choice, const QString& afterDate) override;
    std::optional<AppError> SaveFileList() override {
        return list_.SaveFileList(settings_.folders);
    }
    void StampLastRun(const QString& when) override { lastRun_ = when; }

    void SetCurrentEntry(int index) { current_ = index; }
    // "Last:" of the latest run of all files; empty before the first.
    const QString& LastRun() const { return lastRun_; }

private:
    FileList& list_;
    RunSettings settings_;
    int current_ = -1;
    QString lastRun_;
};

} // namespace quorvel
