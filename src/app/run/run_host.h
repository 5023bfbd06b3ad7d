#pragma once
// What the engine knows of whoever shows a run.
//
// RunHost holds the entries and the fields: the window over its list box and
// record fields, ListRunHost over a FileList alone. RunObserver watches: the
// window moves its "Files" progress, a command-line run prints a line per
// file. Both are called on the engine's thread, in this order for a run of
// all files:
//   observer.BusyChanged(true)
//   observer.FilesBegin(active)           once
//   host.BeginFile(i)                     every entry, in list order
//   observer.FileBegins(n, record)        active entries only
//   host.SetFromDate / host.EndFile(i, r) after the file
//   observer.FileEnds(record, outcome)
//   host.SaveFileList(); observer.FilesEnd(processed); host.StampLastRun(text)
//   observer.BusyChanged(false)

#include "app/app_error.h"
#include "app/file_record.h"
#include "app/run/run_settings.h"

#include <QString>

#include <cstdint>
#include <optional>

namespace quorvel {

// What processing one file came to.
struct FileOutcome {
    bool ok = true;
    QString reason;         // why it failed; empty when it did not
    bool showReason = true; // false when the failing step has told the user itself
    bool downloaded = false;
    bool uploaded = false;
    FileRecord record; // the record afterwards (a "Date" download sets its local date)
    // A "FROMDATE" record: the "Download which dates" choice for the files after it.
    std::optional<int> fromDateChoice;
    QString afterDate;
    // What moved, for a report of the run: the local file a download wrote
    // (its size before, -1 when there was none; newRecords when only new
    // records were asked for) and the file an upload sent.
    QString downloadedFile;
    std::int64_t sizeBefore = -1;
    bool newRecords = false;
    QString uploadedFile;
};

class RunHost {
public:
    virtual ~RunHost() = default;
    // The folders, account and options as they stand now.
    virtual RunSettings Settings() const = 0;
    virtual int EntryCount() const = 0;
    // Records of the list taking part in runs of all files.
    virtual int ActiveCount() const = 0;
    // The entry "Process file" works on; -1 for none.
    virtual int CurrentEntry() const = 0;
    // Shows entry i (the fields of the entry shown before go back into its
    // record) and returns its record as the fields now hold it.
    virtual FileRecord BeginFile(int index) = 0;
    // The record after processing: its local date goes back to the fields.
    virtual void EndFile(int index, const FileRecord& record) = 0;
    // A "FROMDATE" record changed the "Download which dates" choice.
    virtual void SetFromDate(int choice, const QString& afterDate) = 0;
    // Writes the list when it changed; the error when it could not.
    virtual std::optional<AppError> SaveFileList() = 0;
    // "Last:" of a run of all files, "d mmm yyyy HH:MM:SS".
    virtual void StampLastRun(const QString& when) = 0;
};

class RunObserver {
public:
    virtual ~RunObserver() = default;
    virtual void BusyChanged(bool /*busy*/) {}
    virtual void FilesBegin(int /*activeCount*/) {}
    virtual void FileBegins(int /*number*/, const FileRecord& /*record*/) {}
    virtual void FileEnds(const FileRecord& /*record*/, const FileOutcome& /*outcome*/) {}
    virtual void FilesEnd(int /*processed*/) {}
    // A message box is about to be shown.
    virtual void MessageShown() {}
};

} // namespace quorvel
