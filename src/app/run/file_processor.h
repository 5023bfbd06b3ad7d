#pragma once
// The steps of one file of a run: the folder check, the "DIR" and "FROMDATE"
// commands, the decision, and the transfers with their zip steps.

#include "app/run/channels.h"
#include "app/run/run_host.h"

#include <functional>

namespace quorvel {

class FileProcessor {
public:
    // trace: the "Date" rule's reason and what the engine traces; report: the
    // common error box for failures that are not the file's own (a listing
    // that could not be written).
    FileProcessor(RunServices& services, TraceView& trace,
                  std::function<void(const AppError&)> report);

    // The record is taken as the fields show it (AsShownInFields).
    FileOutcome Process(const FileRecord& record, const RunSettings& settings);

private:
    bool Download(const FileRecord& record, const QString& local, const QString& remote, int method,
                  FileOutcome& out);
    bool Upload(const FileRecord& record, const QString& local, const QString& remote, int method,
                FileOutcome& out);
    bool Fail(FileOutcome& out, const QString& reason);

    RunServices& services_;
    TraceView& trace_;
    std::function<void(const AppError&)> report_;
};

// True when a record's name is the command word (any letter case).
bool IsCommandRecord(const FileRecord& record, const char* word);

} // namespace quorvel
