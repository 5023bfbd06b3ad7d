#pragma once
// The services the client uses for the whole run, without any widget: the
// web-data object with its socket, the FTP session, and the channels a run
// moves files through. The window owns one; a command-line run builds its own.
//
// How a host wires it:
//   SetViews(status, ftpTrace, transferProgress)   once, before the first use
//   Attach()                                        again when the window is activated
//   Configure(account)                              before every exchange (ConfigureClass)
//   Cancel()                                        the "Cancel" button
//   CloseFtp()                                      when the program closes

#include "app/account_login.h"
#include "app/run/channels.h"
#include "webdata/combo_sink.h"

#include <QString>

#include <cstdint>
#include <memory>
#include <optional>

namespace quorvel {

class CTALUWebData;
class DisplayLink;
class ServiceSocketControl;

class AppServices : public RunServices, public AccountService {
public:
    AppServices();
    ~AppServices() override;
    AppServices(const AppServices&) = delete;
    AppServices& operator=(const AppServices&) = delete;

    // status: the web-data object's status texts and trace lines; ftpTrace: the
    // FTP module's trace (switched by "Trace") and status; transferProgress:
    // transfers, received records and zip steps. Any may be null.
    void SetViews(TraceView* status, TraceView* ftpTrace, ProgressView* transferProgress);
    // Hands the FTP module its displays again.
    void Attach();

    void FillIntervals(ComboSink& combo) const;
    void FillDataTypes(ComboSink& combo) const;

    void Configure(const AccountSettings& account) override;

    // The login's side: the configuration file and the file list by HTTP,
    // the user's details from the service.
    bool FetchText(const QString& url, QString& contents) override;
    std::optional<UserDetails> GetUserFolders() override;
    QString LastError() const override { return lastError_; }

    NewRecordsChannel& NewRecords() override;
    WholeFileChannel& WholeFiles() override;
    ProgressView* TransferProgress() override { return transferProgress_; }
    // Ends the wait of a running exchange and stops a running download (its
    // local file stays as it was). An upload is left to finish: a half-sent
    // file at the service would pass for the whole one.
    void Cancel() override;
    void CloseFtp();

    QString LastDateInFile(const QString& file, int locationId, int which, int dataType,
                           bool display);
    // The size of a file at the FTP server; nullopt when it is not there.
    std::optional<std::int64_t> RemoteFileSize(const QString& remote);

    CTALUWebData& WebData() { return *webData_; }

private:
    class WebDataRecords;
    class FtpFiles;
    class StatusRelay;

    TraceView* status_ = nullptr;
    TraceView* ftpTrace_ = nullptr;
    ProgressView* transferProgress_ = nullptr;
    std::unique_ptr<ServiceSocketControl> socket_; // plain or TLS by the server text
    std::unique_ptr<CTALUWebData> webData_;
    std::unique_ptr<StatusRelay> relay_;
    std::unique_ptr<DisplayLink> displayLink_;
    std::unique_ptr<WebDataRecords> records_;
    std::unique_ptr<FtpFiles> files_;
    QString lastError_;
};

} // namespace quorvel
