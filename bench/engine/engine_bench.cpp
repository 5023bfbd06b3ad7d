// Runs of all files through the engine against the reference service, next to
// curl doing the same requests or downloads in one process, and the same run
// through the window offscreen.
//
// run.sh starts the service with user "bench" and sets the environment:
//   ENGINE_BENCH_HTTP       "127.0.0.1:PORT" of wd.php
//   ENGINE_BENCH_FTP        "127.0.0.1:PORT" of the FTP server
//   ENGINE_BENCH_FTP_PASSWORD
//   ENGINE_BENCH_USER_DIR   the user's folder on disk (r<i>.dat and w<i>.dat)
// "engine_bench --peak-records=N" runs N records once and prints the peak memory.

#include "app/app_services.h"
#include "app/run/list_run_host.h"
#include "app/run/run_engine.h"
#include "app/ui/frm_web_data_client.h"
#include "support/ini_store.h"
#include "support/program_home.h"

#include <QApplication>
#include <QDir>
#include <QFile>
#include <QTemporaryDir>

#include <benchmark/benchmark.h>
#include <curl/curl.h>

#include <cstdio>
#include <unistd.h>

namespace quorvel {
namespace {

constexpr int kNewDataRecords = 1000;
constexpr int kWholeFiles = 100;
const QString kLastDate = QStringLiteral("2024-11-01%2010%3A20%3A00"); // of every r<i>.dat

QString Env(const char* name) {
    return qEnvironmentVariable(name);
}

class Quiet : public TraceView {
public:
    void AddTrace(const QString&) override {}
    void ShowStatus(const QString&) override {}
};

// " 0 ~1~name~file~type~admin 2~user 1~method~0~download Always~upload Never~~~0"
QString RecordLine(const QString& file, int method) {
    return QStringLiteral(" 0 ~1~%1~%1~%2~2~1~%3~0~1~0~~~0")
        .arg(file)
        .arg(method == kMethodOnlyNewData ? 1 : 0)
        .arg(method);
}

// A program folder whose data folder holds copies of the service's r<i>.dat,
// so that the service has nothing new for them.
class BenchHome {
public:
    explicit BenchHome(int records) {
        ProgramHome::SetFolder(dir_.path());
        QDir().mkpath(Data());
        const QString userDir = Env("ENGINE_BENCH_USER_DIR");
        QByteArray list;
        for (int i = 0; i < records; ++i) {
            const QString name = QStringLiteral("r%1.dat").arg(i);
            QFile::copy(userDir + u'/' + name, Data() + u'/' + name);
            list += RecordLine(name, kMethodOnlyNewData).toUtf8() + "\r\n";
        }
        QFile file(dir_.filePath(QStringLiteral("files.txt")));
        if (file.open(QIODevice::WriteOnly)) file.write(list);
    }
    ~BenchHome() { ProgramHome::SetFolder({}); }
    QString Path() const { return dir_.path(); }
    QString Data() const { return dir_.filePath(QStringLiteral("data")); }

private:
    QTemporaryDir dir_;
};

RunSettings Settings(const BenchHome& home) {
    RunSettings s;
    s.folders.application = home.Path();
    s.folders.data = home.Data();
    s.folders.user = QStringLiteral("/bench");
    s.folders.web = QStringLiteral("/wd");
    s.account.httpServer = Env("ENGINE_BENCH_HTTP");
    s.account.webFolder = QStringLiteral("/wd");
    s.account.userId = QStringLiteral("bench");
    s.account.password = QStringLiteral("bench");
    s.account.ftpServer = Env("ENGINE_BENCH_FTP");
    s.account.ftpUserId = QStringLiteral("bench");
    s.account.ftpPassword = Env("ENGINE_BENCH_FTP_PASSWORD");
    return s;
}

// One run of all files of the list through the engine; false when a file failed.
bool EngineRun(const BenchHome& home, FileList& list) {
    Quiet quiet;
    AppServices services;
    services.SetViews(&quiet, &quiet, nullptr);
    RunEngine engine(services, quiet);
    ListRunHost host(list, Settings(home));
    RunObserver observer;
    const RunSummary summary = engine.Process(RunEngine::kProcessAll, host, observer);
    services.CloseFtp();
    return summary.ran && summary.failed == 0;
}

void BM_EngineNewData(benchmark::State& state) {
    BenchHome home(kNewDataRecords);
    FileList list;
    list.LoadDataFile(home.Path() + QStringLiteral("/files.txt"));
    for (auto _ : state)
        if (!EngineRun(home, list)) state.SkipWithError("a file failed");
    state.counters["records"] = kNewDataRecords;
}

void BM_WindowNewData(benchmark::State& state) {
    BenchHome home(kNewDataRecords);
    LocalSettings settings(ProgramHome::SettingsFile());
    settings.SaveLocalSetting(QStringLiteral("GetFileList"), QStringLiteral("0"));
    settings.SaveLocalSetting(QStringLiteral("GetLocalFolders"), QStringLiteral("0"));
    settings.SaveLocalSetting(QStringLiteral("DataFolder"), home.Data());
    frm_WebDataClient window({});
    window.Form_Load();
    window.show();
    for (int i = 0; i < 3; ++i)
        QApplication::processEvents();
    const RunSettings s = Settings(home);
    auto& c = window.Controls();
    c.Txt_httpServer->setText(s.account.httpServer);
    c.Txt_WebFolder->setText(s.account.webFolder);
    c.Txt_UserID->setText(s.account.userId);
    c.Txt_Password->setText(s.account.password);
    c.Txt_UserFolder->setText(s.folders.user);
    if (c.Lst_Files->count() != kNewDataRecords) state.SkipWithError("list not loaded");
    for (auto _ : state) {
        window.Process(RunEngine::kProcessAll);
        if (!window.Engine().LastErrorText().isEmpty()) state.SkipWithError("a file failed");
    }
    window.hide();
}

size_t Discard(char*, size_t size, size_t count, void*) {
    return size * count;
}

void BM_CurlNewData(benchmark::State& state) {
    const QString base = QStringLiteral("http://") + Env("ENGINE_BENCH_HTTP") +
                         QStringLiteral("/wd/wd.php?user=bench&pwd=bench&dt=1&filelocation=1");
    CURL* curl = curl_easy_init();
    curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, Discard);
    curl_easy_setopt(curl, CURLOPT_USERAGENT, "TALUQuorvel");
    for (auto _ : state) {
        for (int i = 0; i < kNewDataRecords; ++i) {
            const QString file = QStringLiteral("&file=r%1.dat").arg(i);
            for (const QString& command : {QStringLiteral("&cmd=GETLASTDATE"),
                                           QStringLiteral("&cmd=GETDATA&date=") + kLastDate}) {
                curl_easy_setopt(curl, CURLOPT_URL, (base + file + command).toUtf8().constData());
                if (curl_easy_perform(curl) != CURLE_OK) state.SkipWithError("curl failed");
            }
        }
    }
    curl_easy_cleanup(curl);
}

void BM_EngineWholeFiles(benchmark::State& state) {
    BenchHome home(0);
    FileList list;
    for (int i = 0; i < kWholeFiles; ++i) {
        const auto parsed = RecordLine(QStringLiteral("w%1.dat").arg(i), kMethodCompleteFile);
        list.LoadFilesRecord(parsed);
    }
    for (auto _ : state)
        if (!EngineRun(home, list)) state.SkipWithError("a file failed");
}

size_t WriteToFile(char* data, size_t size, size_t count, void* file) {
    return std::fwrite(data, size, count, static_cast<std::FILE*>(file));
}

// curl downloading the files; with checked, also the two steps the described
// download takes around the transfer: it finds the file at the server first
// (size and time), and the received copy reaches the disk before it replaces
// the old one.
void CurlWholeFiles(benchmark::State& state, bool checked) {
    QTemporaryDir dir;
    const QString server = Env("ENGINE_BENCH_FTP");
    CURL* curl = curl_easy_init();
    curl_easy_setopt(curl, CURLOPT_USERNAME, "bench");
    curl_easy_setopt(curl, CURLOPT_PASSWORD, Env("ENGINE_BENCH_FTP_PASSWORD").toUtf8().constData());
    for (auto _ : state) {
        for (int i = 0; i < kWholeFiles; ++i) {
            const QString name = QStringLiteral("w%1.dat").arg(i);
            const QByteArray url =
                (QStringLiteral("ftp://") + server + QStringLiteral("/wd/bench/") + name).toUtf8();
            curl_easy_setopt(curl, CURLOPT_URL, url.constData());
            if (checked) {
                curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, Discard);
                curl_easy_setopt(curl, CURLOPT_NOBODY, 1L);
                curl_easy_setopt(curl, CURLOPT_FILETIME, 1L);
                if (curl_easy_perform(curl) != CURLE_OK) state.SkipWithError("curl find failed");
                curl_easy_setopt(curl, CURLOPT_NOBODY, 0L);
                curl_easy_setopt(curl, CURLOPT_FILETIME, 0L);
            }
            const QString target = dir.filePath(name);
            const QString part = checked ? target + QStringLiteral(".part") : target;
            std::FILE* out = std::fopen(part.toUtf8().constData(), "wb");
            curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, WriteToFile);
            curl_easy_setopt(curl, CURLOPT_WRITEDATA, out);
            const CURLcode code = curl_easy_perform(curl);
            if (checked) {
                std::fflush(out);
                ::fdatasync(fileno(out));
            }
            std::fclose(out);
            if (checked) std::rename(part.toUtf8().constData(), target.toUtf8().constData());
            if (code != CURLE_OK) state.SkipWithError("curl failed");
        }
    }
    curl_easy_cleanup(curl);
}

void BM_CurlWholeFiles(benchmark::State& state) {
    CurlWholeFiles(state, false);
}

void BM_CurlWholeFilesFoundAndSynced(benchmark::State& state) {
    CurlWholeFiles(state, true);
}

BENCHMARK(BM_EngineNewData)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(3);
BENCHMARK(BM_WindowNewData)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(3);
BENCHMARK(BM_CurlNewData)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(3);
BENCHMARK(BM_EngineWholeFiles)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(3);
BENCHMARK(BM_CurlWholeFilesFoundAndSynced)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(3);
BENCHMARK(BM_CurlWholeFiles)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(3);

// The high-water mark of the process's resident memory, in kB.
long PeakKb() {
    QFile status(QStringLiteral("/proc/self/status"));
    if (!status.open(QIODevice::ReadOnly)) return -1;
    for (const QByteArray& line : status.readAll().split('\n'))
        if (line.startsWith("VmHWM:")) return line.mid(6).trimmed().split(' ').first().toLong();
    return -1;
}

int PeakRun(int records) {
    BenchHome home(records);
    FileList list;
    list.LoadDataFile(home.Path() + QStringLiteral("/files.txt"));
    if (list.Count() != records || !EngineRun(home, list)) {
        std::fprintf(stderr, "engine bench: the run of %d records failed\n", records);
        return 1;
    }
    std::printf("%ld\n", PeakKb());
    return 0;
}

} // namespace
} // namespace quorvel

int main(int argc, char** argv) {
    qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication app(argc, argv);
    curl_global_init(CURL_GLOBAL_DEFAULT);
    const QString peak = QStringLiteral("--peak-records=");
    for (const QString& arg : app.arguments())
        if (arg.startsWith(peak)) return quorvel::PeakRun(arg.mid(peak.size()).toInt());
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    curl_global_cleanup();
    return 0;
}
