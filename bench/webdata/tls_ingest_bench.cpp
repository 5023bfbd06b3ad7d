// Time from the request to the closed data file for a GETDATA reply of many
// records over TLS, as the window makes it (the socket chosen by the server
// text), from the https server that tls_run.sh starts. Environment:
// WD_BENCH_HOST ("https://localhost:port"), WD_BENCH_CA (the server's CA),
// WD_BENCH_FILE (the data file name), WD_BENCH_DIR (where it is written).
#include "support/tls_trust.h"
#include "webdata/service_socket_control.h"
#include "webdata/talu_web_data.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <benchmark/benchmark.h>

#include <cstdlib>

namespace {

QString Env(const char* name) {
    return QString::fromLocal8Bit(std::getenv(name));
}

void BM_GetNewDataTls(benchmark::State& state) {
    quorvel::TlsTrust::SetExtraCaFiles({Env("WD_BENCH_CA")});
    quorvel::ServiceSocketControl socket;
    quorvel::CTALUWebData web;
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
        // Each fetch makes its own connection and handshake, as curl's does.
        web.Disconnect();
        state.ResumeTiming();
        if (!web.GetNewData(local, 1, 1)) {
            state.SkipWithError(web.LastError().toStdString().c_str());
            break;
        }
        size = QFileInfo(local).size();
    }
    QFile::remove(local);
    state.counters["file_mb"] = static_cast<double>(size) / 1e6;
}
BENCHMARK(BM_GetNewDataTls)
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
