#include "app/ui/window_services.h"

#include "app/ui/frm_web_data_client.h"
#include "support/ui/progress_bar.h"
#include "support/ui/status_label.h"
#include "transfer/ftp.h"
#include "webdata/combo_sink.h"
#include "webdata/display_link.h"
#include "webdata/service_socket_control.h"
#include "webdata/talu_web_data.h"

#include <QComboBox>

namespace quorvel {

namespace {

// Fills a combo box of the window from the web-data object's lists.
class ComboBoxSink : public ComboSink {
public:
    explicit ComboBoxSink(QComboBox* combo) : combo_(combo) {}
    void Clear() override { combo_->clear(); }
    void AddItem(const QString& text, int itemData) override { combo_->addItem(text, itemData); }
    void SetCurrentIndex(int index) override { combo_->setCurrentIndex(index); }

private:
    QComboBox* combo_;
};

} // namespace

// The FTP module's view of the window: its trace lines have their own switch
// ("Trace", handed over by ConfigureClass) and its status texts go to the
// status label alone.
class FtpDisplay : public TraceView {
public:
    explicit FtpDisplay(frm_WebDataClient& window) : window_(window) {}
    void AddTrace(const QString& line) override {
        QListWidget* list = window_.Controls().Lst_Trace;
        list->addItem(line);
        list->scrollToItem(list->item(list->count() - 1), QAbstractItemView::PositionAtTop);
    }
    void ShowStatus(const QString& text) override {
        SetStatusLabel(window_.Controls().Lbl_status, text);
    }

private:
    frm_WebDataClient& window_;
};

WindowServices::WindowServices(frm_WebDataClient& window)
    : window_(window), socket_(std::make_unique<ServiceSocketControl>(1)),
      webData_(std::make_unique<CTALUWebData>()),
      displayLink_(std::make_unique<DisplayLink>(*webData_, window)),
      ftpDisplay_(std::make_unique<FtpDisplay>(window)) {
    webData_->MyWinsock(socket_.get());
}

WindowServices::~WindowServices() {
    // The FTP module must not keep pointers to displays that are going away.
    SetFTPDisplay(nullptr, nullptr);
}

void WindowServices::Attach() {
    SetFTPDisplay(ftpDisplay_.get(), window_.Controls().Pic_ProgressFTP);
}

void WindowServices::FillIntervals(QComboBox* combo) const {
    ComboBoxSink sink(combo);
    webData_->LoadComboWithIntervals(sink);
}

void WindowServices::FillDataTypes(QComboBox* combo) const {
    ComboBoxSink sink(combo);
    webData_->LoadComboWithDataTypes(sink);
}

void WindowServices::Configure(const WebSettings& s) {
    SetFTPDetails(s.ftpServer, s.ftpUserId, s.ftpPassword, s.ftpTrace);
    webData_->SetAgent(QStringLiteral("TALUQuorvel"));
    for (int i = 0; i < static_cast<int>(s.logs.size()); ++i)
        webData_->EnableLog(i, s.logs[i] ? 1 : 0);
    // Received text is prepared only while the trace pane shows it.
    displayLink_->SetTracesShown(s.logs[0]);
    webData_->SetRemoteHost(s.httpServer);
    webData_->SetWebFolder(s.webFolder);
    webData_->SetFromDate(s.fromDateChoice, s.afterDate);
    webData_->SetUserID(s.userId);
    webData_->SetPassword(s.password);
    webData_->SetPictureBox(window_.Controls().Pic_ProgressFTP);
}

void WindowServices::Cancel() {
    webData_->SetUserCancel(1);
}

void WindowServices::CloseFtp() {
    ftpClose();
}

QString WindowServices::LastDateInFile(const QString& file, int locationId, int which, int dataType,
                                       bool display) {
    return webData_->LastDateInFile(file, locationId, which, dataType, display ? 1 : 0);
}

std::optional<std::int64_t> WindowServices::RemoteFileSize(const QString& remote) {
    std::int64_t size = 0;
    if (!ftpRemoteFileSize(remote, size)) return std::nullopt;
    return size;
}

} // namespace quorvel
