// No password in any output: traces, the trace pane's lines, status texts,
// message boxes, the program log, ftp.log, error texts and whatever the
// process writes to its standard error (Qt's warnings, libcurl's own verbose
// text), over every exchange that carries one.
#include "ftps_peer.h"
#include "security_fixture.h"

#include "common/command_line_process.h"
#include "common/reference_service.h"
#include "support/ini_store.h"
#include "transfer/ftp.h"

#include <QDir>
#include <QUrl>

#include <cstdio>
#include <unistd.h>

namespace quorvel::testing {
namespace {

const QString kFtpPassword = "Pw-9ftp#x:y@z";

QString Encoded(const QString& password) {
    return QString::fromLatin1(QUrl::toPercentEncoding(password));
}

// Everything the process writes to its standard error while it lives.
class StderrCapture {
public:
    explicit StderrCapture(const QString& path) : path_(path) {
        std::fflush(stderr);
        saved_ = dup(STDERR_FILENO);
        if (FILE* file = std::fopen(path.toLocal8Bit().constData(), "w")) {
            dup2(fileno(file), STDERR_FILENO);
            std::fclose(file);
        }
    }
    ~StderrCapture() { Restore(); }
    QString Text() {
        Restore();
        QFile file(path_);
        return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
    }

private:
    void Restore() {
        if (saved_ < 0) return;
        std::fflush(stderr);
        dup2(saved_, STDERR_FILENO);
        close(saved_);
        saved_ = -1;
    }
    QString path_;
    int saved_ = -1;
};

QString ReadFile(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
}

// Each output, by name, holds no part of the service's or the FTP password.
void ExpectNoPassword(const QMap<QString, QString>& outputs) {
    for (auto it = outputs.begin(); it != outputs.end(); ++it) {
        SCOPED_TRACE(it.key().toStdString());
        for (const char* secret : {"Tr0ub", "Pw-9ftp"})
            EXPECT_FALSE(it.value().contains(secret)) << it.value().toStdString();
    }
}

TEST_F(TlsServiceTest, NoOutputEverShowsAPassword) {
    QTemporaryDir certs, ftpRoot;
    QString error;
    ASSERT_TRUE(MakeTestCertificates(certs.path(), error)) << error.toStdString();
    TlsTrust::SetExtraCaFiles({web.CaFile(), certs.filePath("ca.pem")});
    QFile(ftpRoot.filePath("site1.dat")).open(QIODevice::WriteOnly);
    FtpsPeer ftp;
    ASSERT_TRUE(ftp.Start("explicit", ftpRoot.path(), certs.path(), "good", kFtpPassword));
    RecordingTraceView ftpTrace;
    SetFTPDisplay(&ftpTrace, nullptr);
    // curl prints its verbose text to standard error when nothing takes it.
    StderrCapture captured(home.File("stderr.txt"));

    // The service: success, a refused password, a refused certificate, a
    // password with every character a careless request would break on.
    object.SetRemoteHost(web.Address(TlsSite::Good));
    ASSERT_TRUE(object.Initialise()) << object.LastError().toStdString();
    const QString local = home.Write("site1.dat", "");
    object.GetNewData(local, 1, 1);
    QStringList lastErrors{object.LastError()};
    object.SetPassword(kAnnPassword + "\r\nX-Injected: 1");
    EXPECT_FALSE(object.Initialise());
    lastErrors << object.LastError();
    ShortGap();
    object.Disconnect();
    object.SetRemoteHost(web.Address(TlsSite::Expired));
    EXPECT_FALSE(object.Initialise());
    lastErrors << object.LastError();

    // Fetches with the password inside the address, traced (curl's waits
    // follow the reply gap: a sanitizer build's handshakes are slow).
    clock.SetWaits(WaitLengths{.replyGap = std::chrono::milliseconds(5000)});
    const QString site = "@localhost:" + QString::number(web.Port(TlsSite::Good));
    const QString withUser = "https://ann:" + Encoded(kAnnPassword) + site;
    SetFTPDetails("localhost", "logger", kFtpPassword, true);
    QString body;
    EXPECT_TRUE(HTTPGetFileContents(withUser + "/cfg/ann.cfg", body))
        << ftpLastError().toStdString();
    EXPECT_FALSE(HTTPGetFileContents(withUser + "/nothing", body));
    lastErrors << ftpLastError();
    // Typed into the address unescaped, it makes no valid address, and is not shown either.
    EXPECT_FALSE(HTTPGetFileContents("https://ann:" + kAnnPassword + site + "/cfg/ann.cfg", body));
    lastErrors << ftpLastError();

    // FTP over TLS, the password given apart and inside the server address.
    const QString ftpHost = "localhost:" + QString::number(ftp.Port());
    SetFTPDetails("ftpes://logger:" + Encoded(kFtpPassword) + '@' + ftpHost, "logger", kFtpPassword,
                  true);
    EXPECT_TRUE(ftpDownLoadFile("site1.dat", home.File("f.dat"))) << ftpLastError().toStdString();
    EXPECT_FALSE(ftpDownLoadFile("missing.dat", home.File("g")));
    lastErrors << ftpLastError();
    SetFTPDetails("ftpes://logger:" + kFtpPassword + '@' + ftpHost, "logger", kFtpPassword, true);
    EXPECT_FALSE(ftpDownLoadFile("site1.dat", home.File("h")));
    lastErrors << ftpLastError();
    SetFTPDetails("ftpes://" + ftpHost, "logger", "wrong " + kFtpPassword, true);
    EXPECT_FALSE(ftpUploadFile(local, "up.dat"));
    lastErrors << ftpLastError();
    ftpClose();
    SetFTPDisplay(nullptr, nullptr);

    QStringList boxes;
    for (const auto& shown : prompter.shown)
        boxes << shown.message;
    const QMap<QString, QString> outputs{
        {"web-data traces", traces.join('\n')},
        {"status texts", statuses.join('\n')},
        {"FTP traces", ftpTrace.traces.join('\n')},
        {"FTP status texts", ftpTrace.statuses.join('\n')},
        {"message boxes", boxes.join('\n')},
        {"error texts", lastErrors.join('\n')},
        {"program log", ProgramLog()},
        {"ftp.log", ReadFile(ProgramHome::FtpLogFile())},
        {"standard error", captured.Text()},
    };
    // The outputs did record the exchanges: an empty check would pass anyway.
    EXPECT_TRUE(outputs.value("web-data traces").contains("pwd=***"));
    EXPECT_TRUE(outputs.value("FTP traces").contains("Getting: "));
    EXPECT_TRUE(outputs.value("ftp.log").contains("site1.dat"));
    EXPECT_TRUE(outputs.value("program log").contains("S>GET"));
    ExpectNoPassword(outputs);
}

// The command-line run, as cron would see it: what it prints, what it writes
// to standard error and to its logs, over a good run, a failed file, a
// refused login and a dry run.
TEST(CommandLineRunPasswords, NoOutputOfTheCommandLineRunShowsAPassword) {
    TempHome home;
    ReferenceService service;
    ASSERT_TRUE(service.AddUser(
        {.name = "ann", .password = "Tr0ub-cli&pw d", .ftpPassword = "Pw-9ftp-cli"}))
        << service.LastError().toStdString();
    service.PlaceFile("ann", "site1.dat", "2024-11-01 10:00:00,1\r\n");
    service.PlaceFile("ann", "files.txt",
                      " 1 ~1~Site~site1.dat~1~2~1~1~0~1~0~~~0\r\n"
                      " 2 ~1~Whole~site1.dat~0~2~1~0~0~1~0~~~0\r\n"
                      " 3 ~1~Gone~gone.dat~0~2~1~0~0~1~0~~~0\r\n");
    ASSERT_TRUE(service.Start()) << service.LastError().toStdString();
    LocalSettings settings(home.File("quorvel.ini"));
    settings.SaveLocalSetting("CFG_URL", service.CfgUrl("ann"));
    settings.SaveLocalSetting("UserID", "ann");
    settings.SaveLocalSetting("Password", "Tr0ub-cli&pw d");
    settings.SaveLocalSetting("DataFolder", home.File("data"));

    CommandLineProcess cli(home.Path());
    QStringList printed;
    const auto good = cli.Run({"--run-all"});
    EXPECT_EQ(good.code, 1) << good.err.toStdString(); // gone.dat fails
    printed << good.out << good.err;
    const auto dry = cli.Run({"--run-all", "--dry-run"});
    printed << dry.out << dry.err;
    settings.SaveLocalSetting("Password", "Tr0ub-cli&pw wrong");
    const auto refused = cli.Run({"--run-all"});
    EXPECT_EQ(refused.code, 2);
    printed << refused.out << refused.err;

    const QMap<QString, QString> outputs{
        {"standard output and error", printed.join('\n')},
        {"program log", ReadFile(home.File("quorvel.log"))},
        {"ftp.log", ReadFile(home.File("ftp.log"))},
    };
    const QString printedText = outputs.value("standard output and error");
    EXPECT_TRUE(printedText.contains("Login failed")) << printedText.toStdString();
    EXPECT_TRUE(printedText.contains("[3/3] Gone: failed"));
    EXPECT_TRUE(outputs.value("ftp.log").contains("site1.dat"));
    ExpectNoPassword(outputs);
}

} // namespace
} // namespace quorvel::testing
