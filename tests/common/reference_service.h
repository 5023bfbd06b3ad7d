#pragma once
// ReferenceService: the project's own web service (server/run: wd.php under
// PHP's web server, the configuration files and file lists, and FTP) for
// end-to-end tests, on free loopback ports over a fresh data root in a
// temporary folder.
//
// How to use it (link quorvel_service_kit):
//
//   ReferenceService service;                        // an empty data root
//   ASSERT_TRUE(service.AddUser({.name = "ann", .password = "p&ss word"}))
//       << service.LastError().toStdString();
//   service.PlaceFile("ann", "site1.dat", "2006-05-01 10:00:00,1\r\n");
//   service.PlaceFile("ann", "files.txt", listLines);  // the user's file list
//   ASSERT_TRUE(service.Start()) << service.LastError().toStdString();
//
//   web.SetRemoteHost(service.HttpHostPort());       // "127.0.0.1:PORT"
//   web.SetWebFolder(service.WebFolder());           // "/wd"
//   HTTPGetFileContents(service.CfgUrl("ann"), cfg); // the five CFG lines
//   SetFTPDetails(service.FtpServer(), "ann", service.FtpPassword("ann"), false);
//
// The destructor stops the service and removes the data root; nothing stays
// running. Users can also be added, and files placed, while it runs.
//
// What the service gives a user (see server/README.md):
//   GETUSERFOLDERS  "/ann|current|/ann/current||Ann"  (user folder, season
//                   folder, the season folder's full path, data folder, name)
//   files on disk   UserPath("ann", "site1.dat") is the user's folder, where
//                   wd.php looks for files of locations 0, 1, 2 and 4 and FTP
//                   puts "/wd/ann/site1.dat" and "/wd/site1.dat";
//                   UserPath("ann", "current/site1.dat") is the season folder
//                   (location 3, FTP "/wd/ann/current/site1.dat").

#include <QByteArray>
#include <QMap>
#include <QProcess>
#include <QString>
#include <QTemporaryDir>

namespace quorvel::testing {

// Every member has a default, so a test names only what it needs:
// AddUser({.name = "ann", .password = "secret"}).
struct ServiceUser {
    QString name{};
    QString password{};
    QString displayName{};                      // what the client greets; empty: the name
    QString season = QStringLiteral("current"); // season folder in the user's folder
    QString dataFolder{};    // the PC data folder the client is told; empty: none
    QString ftpPassword{};   // empty: one made from the name
    bool monthFirst = false; // numeric dates read as m/d/y instead of d/m/y
};

class ReferenceService {
public:
    ReferenceService();
    ~ReferenceService();
    ReferenceService(const ReferenceService&) = delete;
    ReferenceService& operator=(const ReferenceService&) = delete;

    // Creates the account with its folders, files.txt and CFG file (server/add-user).
    bool AddUser(const ServiceUser& user);
    // Writes a file relative to the user's folder (folders made as needed);
    // returns its path on disk.
    QString PlaceFile(const QString& user, const QString& relativePath, const QByteArray& bytes);
    // The bytes of a file relative to the user's folder ("<missing>" when absent).
    QByteArray ReadFile(const QString& user, const QString& relativePath) const;
    // Path on disk of a file or folder relative to the user's folder.
    QString UserPath(const QString& user, const QString& relativePath = {}) const;

    // Starts server/run on free loopback ports and waits until both servers
    // answer. False (with LastError) when it did not come up.
    bool Start();
    // Stops the service (SIGTERM, as Ctrl+C would); idempotent.
    void Stop();
    bool IsRunning() const;

    QString HttpHostPort() const; // "127.0.0.1:PORT", line 4 of a CFG file
    int HttpPort() const { return httpPort_; }
    QString FtpServer() const; // "127.0.0.1:PORT", line 1 of a CFG file
    int FtpPort() const { return ftpPort_; }
    QString FtpUrl() const;                                     // "ftp://127.0.0.1:PORT/"
    QString WebFolder() const { return QStringLiteral("/wd"); } // line 5 of a CFG file
    QString CfgUrl(const QString& user) const;      // "http://127.0.0.1:PORT/cfg/ann.cfg"
    QString FilesTxtUrl(const QString& user) const; // "http://127.0.0.1:PORT/ann/files.txt"
    QString UserFolder(const QString& user) const;  // "/ann", as GETUSERFOLDERS gives it
    QString FtpPassword(const QString& user) const;

    QString DataRoot() const { return root_.path(); }
    QString LastError() const { return lastError_; }
    // The servers' logs so far (passwords masked), for failure messages.
    QString Log() const;

    // Where the scripts and the quorvel program are; set by the build.
    static QString ServerDir();
    static QString ProgramPath();

private:
    bool RunTool(const QString& tool, const QStringList& args);

    QTemporaryDir root_;
    QProcess run_;
    int httpPort_ = 0;
    int ftpPort_ = 0;
    QMap<QString, QString> ftpPasswords_;
    QString lastError_;
};

} // namespace quorvel::testing
