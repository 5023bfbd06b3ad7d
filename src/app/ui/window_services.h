#pragma once
// The window's link to the web-data object and the FTP module: it owns the
// web-data object and its socket for the whole run, routes their events to the
// window's status and trace displays and copies the window's fields into them.

#include <QString>

#include <array>
#include <cstdint>
#include <memory>
#include <optional>

class QComboBox;

namespace quorvel {

class CTALUWebData;
class DisplayLink;
class FtpDisplay;
class ServiceSocketControl;
class frm_WebDataClient;

// What ConfigureClass copies from the window's fields.
struct WebSettings {
    QString ftpServer, ftpUserId, ftpPassword;
    bool ftpTrace = false;
    std::array<bool, 5> logs{};
    QString httpServer, webFolder;
    int fromDateChoice = 0;
    QString afterDate;
    QString userId, password;
};

class WindowServices {
public:
    explicit WindowServices(frm_WebDataClient& window);
    ~WindowServices();
    WindowServices(const WindowServices&) = delete;
    WindowServices& operator=(const WindowServices&) = delete;

    // Hands the window's trace, status and FTP progress displays to the FTP module.
    void Attach();
    void FillIntervals(QComboBox* combo) const;
    void FillDataTypes(QComboBox* combo) const;
    void Configure(const WebSettings& settings);
    // Ends the wait of a running command.
    void Cancel();
    void CloseFtp();

    QString LastDateInFile(const QString& file, int locationId, int which, int dataType,
                           bool display);
    // The size of a file at the FTP server; nullopt when it is not there.
    std::optional<std::int64_t> RemoteFileSize(const QString& remote);

    CTALUWebData& WebData() { return *webData_; }

private:
    frm_WebDataClient& window_;
    std::unique_ptr<ServiceSocketControl> socket_; // plain or TLS by the server text
    std::unique_ptr<CTALUWebData> webData_;
    std::unique_ptr<DisplayLink> displayLink_;
    std::unique_ptr<FtpDisplay> ftpDisplay_;
};

} // namespace quorvel
