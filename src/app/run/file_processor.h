#pragma once
// The steps of one file of a run: the folder check, the "DIR" and "FROMDATE"
// commands, the decision, and the transfers with their zip steps.

#include "app/run/channels.h"
#include "app/run/run_host.h"
#include "app/run/transfer_decision.h"

#include <functional>

namespace quorvel {

// What a run would do with one record, decided before anything moves.
struct FilePlan {
    enum Kind { kTransfer, kFromDate, kDirectory, kRefused, kNoUserFolders };
    Kind kind = kTransfer;
    QString local, remote; // the record's paths (before any zip renaming)
    QString refusal;       // why a path was refused
    TransferFacts facts;
    TransferPlan plan;
};

class FileProcessor {
public:
    // trace: the "Date" rule's reason and what the engine traces; report: the
    // common error box for failures that are not the file's own (a listing
    // that could not be written).
    FileProcessor(RunServices& services, TraceView& trace,
                  std::function<void(const AppError&)> report);

    // The record is taken as the fields show it (AsShownInFields).
    FileOutcome Process(const FileRecord& record, const RunSettings& settings);
    // The decision alone: folders are checked (and made) but nothing is
    // written or sent. Asks the service only whether a file is there, for
    // upload "Once".
    FilePlan Plan(const FileRecord& record, const RunSettings& settings);

private:
    // The folder check, the command records and the paths.
    FilePlan Locate(const FileRecord& record, const RunSettings& settings) const;
    void Decide(FilePlan& plan, const FileRecord& record, const RunSettings& settings);
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
