#pragma once
// Stand-ins for the services of a run: channels that record every call and
// answer from a script, and the list, folders and ports of a test run.

#include "app/run/channels.h"
#include "app/run/list_run_host.h"
#include "app/run/run_engine.h"
#include "common/recorders.h"
#include "common/temp_home.h"

#include <QFile>
#include <QMap>
#include <QStringList>

#include <gtest/gtest.h>

#include <functional>
#include <set>

namespace quorvel::testing {

// Each call is written as one line to calls, e.g. "get a.csv 1 2" or "down
// r/a.csv a.csv" (paths relative to the test folder). A name in failing fails
// with "<verb> failed"; onCall runs first, so a test can act during a transfer.
class FakeServices : public RunServices, public NewRecordsChannel, public WholeFileChannel {
public:
    explicit FakeServices(const TempHome& home) : home_(home) {}

    void Configure(const AccountSettings& account) override { configured.push_back(account); }
    NewRecordsChannel& NewRecords() override { return *this; }
    WholeFileChannel& WholeFiles() override { return *this; }
    ProgressView* TransferProgress() override { return &progress; }
    void Cancel() override { ++cancels; }

    bool GetNewData(const QString& local, int location, int type) override {
        return Call(QStringLiteral("get %1 %2 %3").arg(Rel(local)).arg(location).arg(type), local);
    }
    bool SendNewData(const QString& local, int location, int type) override {
        return Call(QStringLiteral("send %1 %2 %3").arg(Rel(local)).arg(location).arg(type), local);
    }
    bool Download(const QString& remote, const QString& local) override {
        if (!Call(QStringLiteral("down %1 %2").arg(remote, Rel(local)), remote)) return false;
        QFile file(local);
        return file.open(QIODevice::WriteOnly) && file.write(remoteFiles.value(remote, "x")) >= 0;
    }
    bool Upload(const QString& local, const QString& remote) override {
        if (!Call(QStringLiteral("up %1 %2").arg(Rel(local), remote), local)) return false;
        QFile file(local);
        if (!file.open(QIODevice::ReadOnly)) return false;
        remoteFiles[remote] = file.readAll();
        return true;
    }
    bool RemoteFileExists(const QString& remote) override {
        calls << QStringLiteral("exists ") + remote;
        return remoteFiles.contains(remote);
    }
    QString LastError() const override { return lastError_; }

    QStringList calls;
    std::vector<AccountSettings> configured;
    QMap<QString, QByteArray> remoteFiles; // what the service holds, by remote path
    QStringList failing;                   // names whose transfer fails
    std::function<void(const QString& call)> onCall;
    RecordingProgressView progress;
    int cancels = 0;

private:
    QString Rel(const QString& path) const {
        return QString(path).remove(home_.Path() + QLatin1Char('/'));
    }
    bool Call(const QString& call, const QString& path) {
        calls << call;
        if (onCall) onCall(call);
        for (const QString& name : failing) {
            if (path.endsWith(name)) {
                lastError_ = call.section(QLatin1Char(' '), 0, 0) + QStringLiteral(" failed");
                return false;
            }
        }
        return true;
    }
    const TempHome& home_;
    QString lastError_;
};

// Records what a run showed, one line per call.
class RecordingObserver : public RunObserver {
public:
    void BusyChanged(bool busy) override { events << (busy ? "busy" : "idle"); }
    void FilesBegin(int active) override { events << QStringLiteral("files %1").arg(active); }
    void FileBegins(int n, const FileRecord& r) override {
        events << QStringLiteral("file %1 %2").arg(n).arg(r.Name);
    }
    void FilesEnd(int processed) override { events << QStringLiteral("end %1").arg(processed); }
    void MessageShown() override { ++messages; }
    QStringList events;
    int messages = 0;
};

// A record for a file in the application folder; "Only new data" takes the DateTime layout.
inline FileRecord Rec(const QString& name, const QString& file, int download, int upload,
                      int method = kMethodCompleteFile, int zip = 0) {
    FileRecord r = NewFileRecord(file, kLocationApplication, {});
    r.Name = name;
    r.Download = static_cast<std::int16_t>(download);
    r.Upload = static_cast<std::int16_t>(upload);
    r.MethodID = static_cast<std::int16_t>(method);
    r.TypeID = method == kMethodOnlyNewData ? 1 : 0;
    r.Zip = static_cast<std::int16_t>(zip);
    return r;
}

// A run over a list in a temporary program folder, with recorders as ports.
class EngineTest : public ::testing::Test {
protected:
    EngineTest()
        : scope(Ports{&ports.prompter, &clock, &ports.busy}), services(home),
          engine(services, trace) {
        settings.folders.application = home.Path();
        settings.folders.data = home.File("data");
        settings.folders.web = "web";
        list.LoadedFile = home.File("files.txt");
    }
    RunSummary Run(int which = RunEngine::kProcessAll) {
        ListRunHost host(list, settings);
        host.SetCurrentEntry(current);
        const RunSummary summary = engine.Process(which, host, observer);
        lastRun = host.LastRun();
        return summary;
    }
    QStringList Boxes() const {
        QStringList shown;
        for (const auto& box : ports.prompter.shown)
            shown << (box.timed ? "" : "WAITING:") + box.message;
        return shown;
    }

    TempHome home;
    RecordingPorts ports;
    ManualClock clock; // 1 Nov 2024 10:20:00
    ScopedPorts scope;
    RecordingTraceView trace;
    FakeServices services;
    RunEngine engine;
    RecordingObserver observer;
    FileList list;
    RunSettings settings;
    int current = -1;
    QString lastRun;
};

} // namespace quorvel::testing
