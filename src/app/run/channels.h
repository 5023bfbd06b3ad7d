#pragma once
// The services a run uses, as the engine sees them: the two ways a file
// travels and the configuration that precedes each file. The program's own go
// through the web-data object and the FTP session (AppServices); tests put
// recording stand-ins in their place.

#include "app/run/run_settings.h"
#include "support/ports.h"

#include <QString>

namespace quorvel {

// Only the records newer than the local copy's last one.
class NewRecordsChannel {
public:
    virtual ~NewRecordsChannel() = default;
    // Appends the service's newer records to the local file.
    virtual bool GetNewData(const QString& local, int locationId, int dataType) = 0;
    virtual bool SendNewData(const QString& local, int locationId, int dataType) = 0;
    // The reason of the latest failure.
    virtual QString LastError() const = 0;
};

// Whole files.
class WholeFileChannel {
public:
    virtual ~WholeFileChannel() = default;
    // Replaces the local file only with a completely received copy.
    virtual bool Download(const QString& remote, const QString& local) = 0;
    virtual bool Upload(const QString& local, const QString& remote) = 0;
    virtual bool RemoteFileExists(const QString& remote) = 0;
    virtual QString LastError() const = 0;
};

// Everything a run uses beyond the files on this PC.
class RunServices {
public:
    virtual ~RunServices() = default;
    // ConfigureClass: the services work with the fields as they stand.
    virtual void Configure(const AccountSettings& account) = 0;
    virtual NewRecordsChannel& NewRecords() = 0;
    virtual WholeFileChannel& WholeFiles() = 0;
    // Where zipping and unzipping show their progress; may be null.
    virtual ProgressView* TransferProgress() = 0;
    // "Cancel": ends the wait of a running exchange.
    virtual void Cancel() = 0;
};

} // namespace quorvel
