// `quorvel --run-all` as cron runs it: a process of its own with no display,
// against the reference service. Exit codes, the lines it prints, a dry run,
// two runs at once, and a run killed in the middle of an append.

#include "app/run/run_lock.h"
#include "common/command_line_process.h"
#include "common/reference_service.h"
#include "common/temp_home.h"
#include "support/ini_store.h"

#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QFileInfo>
#include <QRegularExpression>
#include <QTcpServer>
#include <QThread>

#include <gtest/gtest.h>

#include <csignal>
#include <iostream>

#include <sys/types.h>

namespace quorvel::testing {
namespace {

// A list record: admin location 2 (the user's folder at the service), user
// location 1 (the data folder here). method 1 "Only new data", download 1
// "Always", upload 2 "Once".
QByteArray Record(int id, const QString& name, const QString& file, int type, int method,
                  int download, int upload = 0) {
    return QStringLiteral(" %1 ~1~%2~%3~%4~2~1~%5~0~%6~%7~~~0")
        .arg(id)
        .arg(name, file)
        .arg(type)
        .arg(method)
        .arg(download)
        .arg(upload)
        .toUtf8();
}

// Records a minute apart from 1 Nov 2024 on, layout "DateTime".
QByteArray Records(int from, int count) {
    const QDateTime start(QDate(2024, 11, 1), QTime(0, 0));
    QByteArray bytes;
    for (int i = from; i < from + count; ++i)
        bytes += start.addSecs(60LL * i).toString("yyyy-MM-dd HH:mm:ss").toUtf8() + ',' +
                 QByteArray::number(i) + "\r\n";
    return bytes;
}

const QByteArray kSite = Record(1, "Site 1", "site1.dat", 1, 1, 1);
const QByteArray kWeather = Record(2, "Weather", "weather.csv", 0, 0, 1);
const QByteArray kMissing = Record(3, "Missing", "missing.dat", 0, 0, 1);
const QByteArray kNotes = Record(4, "Notes", "notes.csv", 0, 0, 0, 2);

class CommandLineRunTest : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(service.AddUser({.name = "ann", .password = "p&ss word"}))
            << service.LastError().toStdString();
        service.PlaceFile("ann", "site1.dat", Records(0, 3));
        service.PlaceFile("ann", "weather.csv", "Weather\r\n12.5,3\r\n");
        ASSERT_TRUE(service.Start()) << service.LastError().toStdString();
        QDir().mkpath(Data());
        WriteAccount();
    }
    void WriteAccount() {
        Settings({{"CFG_URL", service.CfgUrl("ann")},
                  {"UserID", "ann"},
                  {"Password", "p&ss word"},
                  {"DataFolder", Data()},
                  {"Automatic", "1"},
                  {"Interval", "3 hours"}});
    }
    void TearDown() override {
        if (HasFailure()) std::cerr << "Service log:\n" << service.Log().toStdString();
    }
    void Settings(std::initializer_list<std::pair<const char*, QString>> values) {
        LocalSettings settings(home.File("quorvel.ini"));
        for (const auto& [key, value] : values)
            settings.SaveLocalSetting(QString::fromLatin1(key), value);
    }
    QString Setting(const char* key) const {
        return LocalSettings(home.File("quorvel.ini"))
            .GetLocalSetting(QString::fromLatin1(key), "<none>");
    }
    void ServeList(std::initializer_list<QByteArray> records) {
        QByteArray list;
        for (const QByteArray& r : records)
            list += r + "\r\n";
        service.PlaceFile("ann", "files.txt", list);
    }
    QString Data(const QString& name = {}) const {
        return name.isEmpty() ? home.File("data") : home.File("data/" + name);
    }
    QByteArray Local(const QString& name) const {
        QFile f(Data(name));
        return f.open(QIODevice::ReadOnly) ? f.readAll() : QByteArray("<missing>");
    }
    static void ExpectLines(const QStringList& lines, const QStringList& patterns) {
        ASSERT_EQ(lines.size(), patterns.size()) << lines.join("\n").toStdString();
        for (int i = 0; i < lines.size(); ++i)
            EXPECT_TRUE(QRegularExpression("^" + patterns[i] + "$").match(lines[i]).hasMatch())
                << lines[i].toStdString() << "\n  does not match " << patterns[i].toStdString();
    }

    TempHome home;
    ReferenceService service;
    CommandLineProcess cli{home.Path()};
};

TEST_F(CommandLineRunTest, EveryFileSucceedsAndTheNextRunFetchesOnlyNewRecords) {
    home.Write("data/notes.csv", "Field notes\r\n");
    ServeList({kSite, kWeather, kNotes});
    auto run = cli.Run({"--run-all"});
    EXPECT_EQ(run.code, 0) << run.err.toStdString();
    // A data file that is not here yet comes whole.
    ExpectLines(run.OutLines(),
                {R"(\[1/3\] Site 1: downloaded 69 b)", R"(\[2/3\] Weather: downloaded 17 b)",
                 R"(\[3/3\] Notes: uploaded 13 b)",
                 R"(Processed 3 file\(s\): 3 succeeded, 0 failed)"});
    EXPECT_EQ(Local("site1.dat"), service.ReadFile("ann", "site1.dat"));
    EXPECT_EQ(Local("weather.csv"), service.ReadFile("ann", "weather.csv"));
    EXPECT_EQ(service.ReadFile("ann", "notes.csv"), "Field notes\r\n");
    // What a window would save after a run of all files.
    EXPECT_NE(Setting("LastDownload"), "never");
    EXPECT_TRUE(QRegularExpression(R"(^\d{1,2} \w{3} \d{4} \d\d:(00|15|30|45)$)")
                    .match(Setting("NextDownloadDue"))
                    .hasMatch())
        << Setting("NextDownloadDue").toStdString();
    EXPECT_TRUE(run.err.isEmpty()) << run.err.toStdString();

    QFile site(service.UserPath("ann", "site1.dat"));
    ASSERT_TRUE(site.open(QIODevice::Append));
    site.write(Records(3, 2));
    site.close();
    run = cli.Run({"--run-all"});
    EXPECT_EQ(run.code, 0) << run.err.toStdString();
    EXPECT_EQ(run.OutLines().value(0), "[1/3] Site 1: downloaded 2 new records");
    EXPECT_EQ(run.OutLines().value(2), "[3/3] Notes: nothing to do"); // uploaded once
    EXPECT_EQ(Local("site1.dat"), service.ReadFile("ann", "site1.dat"));
}

TEST_F(CommandLineRunTest, LinesAndExitCodeFollowTheOutcomeAndQuiet) {
    struct Case {
        QStringList arguments;
        bool withFailure;
        int code;
        QStringList lines; // patterns of the standard output's lines
    };
    const QString siteDone = R"(\[1/\d\] Site 1: downloaded 69 b)";
    const QString missingFailed = R"(\[2/2\] Missing: failed: .*missing\.dat.*)";
    const Case cases[] = {
        {{"--run-all"}, false, 0, {siteDone, R"(Processed 1 file\(s\): 1 succeeded, 0 failed)"}},
        {{"--run-all"},
         true,
         1,
         {siteDone, missingFailed, R"(Processed 2 file\(s\): 1 succeeded, 1 failed)"}},
        {{"--run-all", "--quiet"}, false, 0, {}},
        {{"--run-all", "--quiet"}, true, 1, {missingFailed}}, // only the failure
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.arguments.join(' ').toStdString() +
                     (c.withFailure ? " with a failure" : ""));
        QFile::remove(Data("site1.dat")); // each case downloads it whole
        if (c.withFailure)
            ServeList({kSite, kMissing});
        else
            ServeList({kSite});
        const auto run = cli.Run(c.arguments);
        EXPECT_EQ(run.code, c.code) << run.err.toStdString();
        ExpectLines(run.OutLines(), c.lines);
    }
}

TEST_F(CommandLineRunTest, ADryRunTellsEachDecisionAndMovesNothing) {
    home.Write("data/notes.csv", "Field notes\r\n");
    ServeList({kSite, kWeather, kNotes});
    const auto run = cli.Run({"--run-all", "--dry-run"});
    EXPECT_EQ(run.code, 0) << run.err.toStdString();
    const QStringList lines = run.OutLines();
    ASSERT_EQ(lines.size(), 4) << run.out.toStdString();
    EXPECT_TRUE(lines[0].startsWith("[1/3] Site 1: download")) << lines[0].toStdString();
    EXPECT_TRUE(lines[2].startsWith("[3/3] Notes: no download (Never); upload the complete file"))
        << lines[2].toStdString();
    EXPECT_EQ(lines[3], "Dry run: 3 file(s), nothing moved");
    EXPECT_EQ(QDir(Data()).entryList(QDir::Files), QStringList{"notes.csv"});
    EXPECT_EQ(service.ReadFile("ann", "notes.csv"), "<missing>");
    EXPECT_EQ(Setting("LastDownload"), "<none>");
}

TEST_F(CommandLineRunTest, ARunThatCannotStartExitsWithTwoAndSaysWhy) {
    struct Case {
        QStringList arguments;
        const char* setting; // changed before the run ("" for none)
        const char* value;
        const char* err; // what standard error says
    };
    const Case cases[] = {
        {{"--run-all"}, "CFG_URL", "", "No configuration file address"},
        {{"--run-all"},
         "CFG_URL",
         "http://127.0.0.1:1/none.cfg",
         "Could not get details from: http://127.0.0.1:1/none.cfg"},
        {{"--run-all"}, "Password", "wrong", "Login failed"},
        {{"--run-all"}, "Password", "", "No password for user ann"}, // and no secret store
        {{"--run-all", "--fast"}, "", "", "Exit codes of --run-all"},
        {{"--quiet"}, "", "", "--dry-run and --quiet go with"},
    };
    ServeList({kSite});
    for (const Case& c : cases) {
        SCOPED_TRACE(c.err);
        WriteAccount();
        if (*c.setting) Settings({{c.setting, QString::fromUtf8(c.value)}});
        const auto run = cli.Run(c.arguments);
        EXPECT_EQ(run.code, 2);
        EXPECT_TRUE(run.err.contains(QString::fromUtf8(c.err))) << run.err.toStdString();
        EXPECT_TRUE(run.out.isEmpty()) << run.out.toStdString();
        EXPECT_EQ(Local("site1.dat"), "<missing>");
    }
}

TEST_F(CommandLineRunTest, HelpDocumentsTheExitCodes) {
    const auto run = cli.Run({"--help"});
    EXPECT_EQ(run.code, 0);
    EXPECT_TRUE(run.out.contains("3  another run holds the run lock")) << run.out.toStdString();
}

TEST_F(CommandLineRunTest, ASecondRunAtOnceExitsThreeAndAKilledRunsLockIsTakenOver) {
    ServeList({kSite});
    // The first run hangs on a configuration file that never comes.
    QTcpServer silent;
    ASSERT_TRUE(silent.listen(QHostAddress::LocalHost));
    Settings({{"CFG_URL", QStringLiteral("http://127.0.0.1:%1/ann.cfg").arg(silent.serverPort())}});
    CommandLineProcess first(home.Path());
    QProcess& hanging = first.Start({"--run-all"});
    ASSERT_TRUE(silent.waitForNewConnection(30000)) << "the first run never asked for its CFG file";

    Settings({{"CFG_URL", service.CfgUrl("ann")}});
    auto second = cli.Run({"--run-all"});
    EXPECT_EQ(second.code, 3);
    EXPECT_TRUE(second.err.contains("another run holds the run lock")) << second.err.toStdString();
    EXPECT_TRUE(second.err.contains(QStringLiteral("process %1").arg(hanging.processId())));
    EXPECT_EQ(Local("site1.dat"), "<missing>");
    // A dry run moves nothing and needs no lock.
    EXPECT_EQ(cli.Run({"--run-all", "--dry-run"}).code, 0);

    // Killed, it leaves its lock file behind; the next run takes it over.
    ::kill(static_cast<pid_t>(hanging.processId()), SIGKILL);
    first.Finish();
    EXPECT_TRUE(QFileInfo::exists(home.File(RunLock::kFileName)));
    const auto third = cli.Run({"--run-all"});
    EXPECT_EQ(third.code, 0) << third.err.toStdString();
    EXPECT_EQ(Local("site1.dat"), service.ReadFile("ann", "site1.dat"));
}

TEST_F(CommandLineRunTest, ARunKilledInTheMiddleOfAnAppendLosesAndRepeatsNoRecord) {
    // Enough records that the append takes a while; a tenth is here already.
    const int total = 300000;
    const QByteArray all = Records(0, total);
    service.PlaceFile("ann", "site1.dat", all);
    home.Write("data/site1.dat", all.left(all.indexOf('\n', all.size() / 10) + 1));
    ServeList({kSite});

    const QString note = Data(".site1.dat.appending");
    QProcess& run = cli.Start({"--run-all"});
    QElapsedTimer waited;
    waited.start();
    while (!QFileInfo::exists(note) && run.state() == QProcess::Running && waited.elapsed() < 60000)
        QThread::usleep(200);
    const bool caughtMidAppend = QFileInfo::exists(note);
    ::kill(static_cast<pid_t>(run.processId()), SIGKILL);
    cli.Finish();
    ASSERT_TRUE(caughtMidAppend) << "the run ended before its append could be interrupted";
    const qint64 sizeAtKill = QFileInfo(Data("site1.dat")).size();
    EXPECT_LT(sizeAtKill, all.size());

    const auto next = cli.Run({"--run-all"});
    EXPECT_EQ(next.code, 0) << next.err.toStdString();
    const QByteArray local = Local("site1.dat");
    EXPECT_EQ(local.size(), all.size());
    EXPECT_TRUE(local == all) << "the data file differs from the service's";
    EXPECT_FALSE(QFileInfo::exists(note));
}

} // namespace
} // namespace quorvel::testing
