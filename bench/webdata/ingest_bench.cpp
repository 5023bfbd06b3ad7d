// Time from the request to the closed data file for a GETDATA reply of many
// records, served by the loopback server that run.sh starts. The object is
// wired as the window wires it (DisplayLink, the "Status" box unticked, a
// trace pane that drops what it is not to show). Environment:
// WD_BENCH_HOST ("127.0.0.1:port"), WD_BENCH_FILE (the data file name the
// server knows), WD_BENCH_DIR (where the local file is written).
#include "support/ports.h"
#include "webdata/display_link.h"
#include "webdata/talu_web_data.h"
#include "webdata/tcp_socket_control.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <benchmark/benchmark.h>
#include <sys/resource.h>

#include <cstdlib>

namespace {

QString Env(const char* name) {
    return QString::fromLocal8Bit(std::getenv(name));
}

// Stands for the window's trace and status displays: like the window, it
// keeps trace lines only while its "Status" box is ticked.
class WindowDisplays : public quorvel::TraceView {
public:
    void AddTrace(const QString& line) override {
        if (statusTicked) lines << line;
    }
    void ShowStatus(const QString& text) override {
        AddTrace(QStringLiteral("Status>") + text);
        status = text;
    }
    bool statusTicked = false;
    QStringList lines;
    QString status;
};

double PeakRssMb() {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return static_cast<double>(usage.ru_maxrss) / 1024.0;
}

void BM_GetNewData(benchmark::State& state) {
    quorvel::TcpSocketControl socket;
    quorvel::CTALUWebData web;
    WindowDisplays displays;
    quorvel::DisplayLink link(web, displays);
    link.SetTracesShown(displays.statusTicked);
    web.MyWinsock(&socket);
    web.SetRemoteHost(Env("WD_BENCH_HOST"));
    web.SetAgent(QStringLiteral("TALUQuorvel"));
    web.SetUserID(QStringLiteral("bench"));
    web.SetPassword(QStringLiteral("bench"));
    const QString local = QDir(Env("WD_BENCH_DIR")).filePath(Env("WD_BENCH_FILE"));
    qint64 size = 0;
    for (auto _ : state) {
        state.PauseTiming();
        QFile::remove(local);
        state.ResumeTiming();
        if (!web.GetNewData(local, 1, 1)) {
            state.SkipWithError(web.LastError().toStdString().c_str());
            break;
        }
        size = QFileInfo(local).size();
    }
    QFile::remove(local);
    state.counters["file_mb"] = static_cast<double>(size) / 1e6;
    state.counters["peak_rss_mb"] = PeakRssMb();
}
BENCHMARK(BM_GetNewData)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(5);

} // namespace

int main(int argc, char** argv) {
    QCoreApplication app(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
