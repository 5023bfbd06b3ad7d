// The service's own tools: server/run starts and stops cleanly, add-user
// refuses what it cannot make, simulate appends records the client can date.
#include "common/recorders.h"
#include "common/reference_service.h"
#include "webdata/line_dates.h"

#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QProcess>
#include <QTcpSocket>

#include <gtest/gtest.h>

namespace quorvel::testing {
namespace {

// Processes that belong to a service: their command line or their environment
// (QUORVEL_DATA, which PHP's web server and its workers inherit) names its data root.
int ServiceProcesses(const QString& root) {
    int found = 0;
    for (const QString& pid : QDir(QStringLiteral("/proc")).entryList(QDir::Dirs)) {
        if (pid.toInt() <= 0) continue;
        for (const char* what : {"/cmdline", "/environ"}) {
            QFile file(QStringLiteral("/proc/") + pid + QLatin1String(what));
            if (file.open(QIODevice::ReadOnly) && file.readAll().contains(root.toUtf8())) {
                ++found;
                break;
            }
        }
    }
    return found;
}

bool Accepts(int port) {
    QTcpSocket probe;
    probe.connectToHost(QStringLiteral("127.0.0.1"), static_cast<quint16>(port));
    return probe.waitForConnected(2000);
}

// Runs a server tool; returns its exit code and fills output.
int Tool(const QString& name, const QStringList& args, QString* output = nullptr) {
    QProcess process;
    process.setProcessChannelMode(QProcess::MergedChannels);
    process.start(QDir(ReferenceService::ServerDir()).filePath(name), args);
    if (!process.waitForFinished(30000)) return -1;
    if (output) *output = QString::fromUtf8(process.readAll());
    return process.exitStatus() == QProcess::NormalExit ? process.exitCode() : -1;
}

TEST(ServiceRun, StopsBothServersOnSigtermAndLeavesNothingRunning) {
    ReferenceService service;
    ASSERT_TRUE(service.AddUser({.name = QStringLiteral("ann"), .password = QStringLiteral("a")}));
    ASSERT_TRUE(service.Start()) << service.LastError().toStdString();
    EXPECT_TRUE(Accepts(service.HttpPort()));
    EXPECT_TRUE(Accepts(service.FtpPort()));
    // server/run, the FTP server, the guard of PHP's web server, PHP and its two workers.
    EXPECT_GE(ServiceProcesses(service.DataRoot()), 6);

    // A second service on the same ports says why it cannot start.
    QString output;
    EXPECT_EQ(Tool(QStringLiteral("run"),
                   {QStringLiteral("--port"), QString::number(service.HttpPort()),
                    QStringLiteral("--data"), service.DataRoot()},
                   &output),
              1);
    EXPECT_TRUE(output.contains(QStringLiteral("port %1 is in use").arg(service.HttpPort())))
        << output.toStdString();

    service.Stop();
    EXPECT_FALSE(service.IsRunning());
    EXPECT_FALSE(Accepts(service.HttpPort()));
    EXPECT_FALSE(Accepts(service.FtpPort()));
    EXPECT_EQ(ServiceProcesses(service.DataRoot()), 0);
}

TEST(ServiceRun, AddUserRefusesWhatItCannotMake) {
    ReferenceService service;
    ASSERT_TRUE(service.AddUser({.name = QStringLiteral("ann"), .password = QStringLiteral("a")}));
    const QString root = service.DataRoot();
    const QString program = ReferenceService::ProgramPath();
    struct Row {
        QStringList args;
        const char* says;
    };
    const Row rows[] = {
        {{QStringLiteral("ann"), QStringLiteral("b")}, "the user ann exists already"},
        {{QStringLiteral("../x"), QStringLiteral("b")}, "cannot be a user name"},
        {{QStringLiteral("cfg"), QStringLiteral("b")}, "cannot be a user name"},
        {{QStringLiteral("dan"), QString()}, "the password must not be empty"},
        {{QStringLiteral("dan"), QStringLiteral("d"), QStringLiteral("--display-name"),
          QStringLiteral("a|b")},
         "must not contain '|'"},
        {{QStringLiteral("dan"), QStringLiteral("d"), QStringLiteral("--season"),
          QStringLiteral("../up")},
         "cannot be a season folder name"},
        {{QStringLiteral("dan")}, "usage: server/add-user NAME PASSWORD"},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.says);
        QString output;
        EXPECT_NE(Tool(QStringLiteral("add-user"),
                       row.args + QStringList{QStringLiteral("--data"), root,
                                              QStringLiteral("--quorvel"), program},
                       &output),
                  0);
        EXPECT_TRUE(output.contains(QLatin1String(row.says))) << output.toStdString();
    }
    QString output;
    EXPECT_NE(Tool(QStringLiteral("add-user"),
                   {QStringLiteral("dan"), QStringLiteral("d"), QStringLiteral("--data"), root,
                    QStringLiteral("--quorvel"), root + QStringLiteral("/no-such-program")},
                   &output),
              0);
    EXPECT_TRUE(output.contains(QStringLiteral("--encipher failed")) ||
                output.contains(QStringLiteral("cannot run")))
        << output.toStdString();
    // Nothing of the refused accounts was made.
    EXPECT_FALSE(QFile::exists(service.UserPath(QStringLiteral("dan"))));
    EXPECT_FALSE(QFile::exists(root + QStringLiteral("/cfg/dan.cfg")));
}

TEST(ServiceRun, SimulateAppendsRecordsWithRisingDatesInEveryLayout) {
    ReferenceService service;
    ASSERT_TRUE(service.AddUser({.name = QStringLiteral("ann"), .password = QStringLiteral("a")}));
    for (int type = 0; type <= 8; ++type) {
        SCOPED_TRACE(type);
        const QString file = QStringLiteral("current/sim%1.dat").arg(type);
        for (int run = 0; run < 2;
             ++run) { // the second run continues after the first one's records
            QString output;
            ASSERT_EQ(Tool(QStringLiteral("simulate"),
                           {QStringLiteral("ann"), file, QStringLiteral("--layout"),
                            QString::number(type), QStringLiteral("--every"), QStringLiteral("0"),
                            QStringLiteral("--count"), QStringLiteral("2"),
                            QStringLiteral("--data"), service.DataRoot()},
                           &output),
                      0)
                << output.toStdString();
        }
        const QByteArray bytes = service.ReadFile(QStringLiteral("ann"), file);
        ASSERT_TRUE(bytes.endsWith("\r\n"));
        const QList<QByteArray> lines = bytes.chopped(2).split('\n');
        ASSERT_EQ(lines.size(), 4);
        double previous = 0;
        for (const QByteArray& line : lines) {
            const LineDate date = DateOfLine(QString::fromLatin1(line.trimmed()), type);
            EXPECT_TRUE(date.found) << line.toStdString();
            if (type == 0) continue;
            EXPECT_TRUE(date.hasDate) << line.toStdString();
            EXPECT_GT(date.value, previous) << line.toStdString();
            previous = date.value;
        }
    }
}

TEST(ServiceRecords, BlockCheckNeverPassesALineTheClientWouldHoldBack) {
    QProcess php;
    php.setProcessChannelMode(QProcess::MergedChannels);
    php.start(QStringLiteral("php"),
              {QStringLiteral(QUORVEL_SERVER_TEST_DIR "/php/block_check.php")});
    ASSERT_TRUE(php.waitForFinished(60000));
    const QString output = QString::fromUtf8(php.readAll());
    EXPECT_EQ(php.exitCode(), 0) << output.toStdString();
    EXPECT_TRUE(output.contains(QStringLiteral(" 0 disagreements"))) << output.toStdString();
}

} // namespace
} // namespace quorvel::testing
