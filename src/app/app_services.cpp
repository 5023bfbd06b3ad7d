#include "app/app_services.h"

#include "transfer/ftp.h"
#include "webdata/display_link.h"
#include "webdata/service_socket_control.h"
#include "webdata/talu_web_data.h"

namespace quorvel {

class AppServices::WebDataRecords : public NewRecordsChannel {
public:
    explicit WebDataRecords(CTALUWebData& web) : web_(web) {}
    bool GetNewData(const QString& local, int locationId, int dataType) override {
        return web_.GetNewData(local, locationId, dataType);
    }
    bool SendNewData(const QString& local, int locationId, int dataType) override {
        return web_.SendNewData(local, locationId, dataType);
    }
    QString LastError() const override { return web_.LastError(); }

private:
    CTALUWebData& web_;
};

class AppServices::FtpFiles : public WholeFileChannel {
public:
    bool Download(const QString& remote, const QString& local) override {
        return ftpDownLoadFile(remote, local);
    }
    bool Upload(const QString& local, const QString& remote) override {
        return ftpUploadFile(local, remote);
    }
    bool RemoteFileExists(const QString& remote) override { return ftpRemoteFileExists(remote); }
    QString LastError() const override { return ftpLastError(); }
};

// The web-data object's texts go to whichever status view is set, if any.
class AppServices::StatusRelay : public TraceView {
public:
    explicit StatusRelay(TraceView*& view) : view_(view) {}
    void AddTrace(const QString& line) override {
        if (view_) view_->AddTrace(line);
    }
    void ShowStatus(const QString& text) override {
        if (view_) view_->ShowStatus(text);
    }

private:
    TraceView*& view_;
};

AppServices::AppServices()
    : socket_(std::make_unique<ServiceSocketControl>(1)),
      webData_(std::make_unique<CTALUWebData>()), relay_(std::make_unique<StatusRelay>(status_)),
      displayLink_(std::make_unique<DisplayLink>(*webData_, *relay_)),
      records_(std::make_unique<WebDataRecords>(*webData_)), files_(std::make_unique<FtpFiles>()) {
    webData_->MyWinsock(socket_.get());
}

AppServices::~AppServices() {
    // The FTP module must not keep pointers to displays that are going away.
    SetFTPDisplay(nullptr, nullptr);
}

void AppServices::SetViews(TraceView* status, TraceView* ftpTrace, ProgressView* transferProgress) {
    status_ = status;
    ftpTrace_ = ftpTrace;
    transferProgress_ = transferProgress;
    Attach();
}

void AppServices::Attach() {
    SetFTPDisplay(ftpTrace_, transferProgress_);
}

void AppServices::FillIntervals(ComboSink& combo) const {
    webData_->LoadComboWithIntervals(combo);
}

void AppServices::FillDataTypes(ComboSink& combo) const {
    webData_->LoadComboWithDataTypes(combo);
}

void AppServices::Configure(const AccountSettings& a) {
    SetFTPDetails(a.ftpServer, a.ftpUserId, a.ftpPassword, a.ftpTrace);
    webData_->SetAgent(QStringLiteral("TALUQuorvel"));
    for (int i = 0; i < static_cast<int>(a.logs.size()); ++i)
        webData_->EnableLog(i, a.logs[static_cast<std::size_t>(i)] ? 1 : 0);
    // Received text is prepared only while the trace pane shows it.
    displayLink_->SetTracesShown(a.logs[0]);
    webData_->SetRemoteHost(a.httpServer);
    webData_->SetWebFolder(a.webFolder);
    webData_->SetFromDate(a.fromDateChoice, a.afterDate);
    webData_->SetUserID(a.userId);
    webData_->SetPassword(a.password);
    webData_->SetPictureBox(transferProgress_);
}

bool AppServices::FetchText(const QString& url, QString& contents) {
    lastError_.clear();
    if (HTTPGetFileContents(url, contents)) return true;
    lastError_ = ftpLastError();
    return false;
}

std::optional<UserDetails> AppServices::GetUserFolders() {
    lastError_.clear();
    if (!webData_->Initialise()) {
        lastError_ = webData_->LastError();
        return std::nullopt;
    }
    return UserDetails{webData_->UserName(), webData_->UserFolder(), webData_->UserCurrentFolder(),
                       webData_->UserDataFolder()};
}

NewRecordsChannel& AppServices::NewRecords() {
    return *records_;
}

WholeFileChannel& AppServices::WholeFiles() {
    return *files_;
}

void AppServices::Cancel() {
    webData_->SetUserCancel(1);
    if (ProcessFtpSession().State() == TransferState::Download) ftpClose();
}

void AppServices::CloseFtp() {
    ftpClose();
}

QString AppServices::LastDateInFile(const QString& file, int locationId, int which, int dataType,
                                    bool display) {
    return webData_->LastDateInFile(file, locationId, which, dataType, display ? 1 : 0);
}

std::optional<std::int64_t> AppServices::RemoteFileSize(const QString& remote) {
    std::int64_t size = 0;
    if (!ftpRemoteFileSize(remote, size)) return std::nullopt;
    return size;
}

} // namespace quorvel
