// The last date of a large data file (WD_BENCH_BIGFILE, made by run.sh):
// ours, read backwards, against reading the whole file line by line.
#include "webdata/line_dates.h"
#include "webdata/talu_web_data.h"

#include <QCoreApplication>
#include <QFile>

#include <benchmark/benchmark.h>

#include <cstdlib>
#include <cstring>

namespace {

QString BigFile() {
    return QString::fromLocal8Bit(std::getenv("WD_BENCH_BIGFILE"));
}

void BM_LastDateInFile(benchmark::State& state) {
    quorvel::CTALUWebData web;
    const QString file = BigFile();
    for (auto _ : state) {
        const QString date = web.LastDateInFile(file, 0, 0, quorvel::kDateTime, 1);
        if (date == QLatin1String("-")) {
            state.SkipWithError("no date found");
            break;
        }
        benchmark::DoNotOptimize(date);
    }
}
BENCHMARK(BM_LastDateInFile)->Unit(benchmark::kMicrosecond)->UseRealTime();

// The whole file read front to back in large blocks, remembering the last
// non-empty line, then its date: what a reader from the start has to do.
void BM_WholeFileRead(benchmark::State& state) {
    const QString name = BigFile();
    QByteArray block(1 << 20, Qt::Uninitialized);
    for (auto _ : state) {
        QFile file(name);
        if (!file.open(QIODevice::ReadOnly)) {
            state.SkipWithError("cannot open");
            break;
        }
        QByteArray last, current;
        qint64 n;
        while ((n = file.read(block.data(), block.size())) > 0) {
            const char* p = block.constData();
            const char* end = p + n;
            while (p < end) {
                const char* lf = static_cast<const char*>(std::memchr(p, '\n', size_t(end - p)));
                const char* stop = lf ? lf : end;
                current.append(p, stop - p);
                if (!lf) break;
                if (current.endsWith('\r')) current.chop(1);
                if (!current.isEmpty()) last.swap(current);
                current.clear();
                p = lf + 1;
            }
        }
        if (!current.isEmpty()) last.swap(current);
        const quorvel::LineDate date =
            quorvel::DateOfLine(QString::fromLatin1(last), quorvel::kDateTime);
        benchmark::DoNotOptimize(date.value);
    }
}
BENCHMARK(BM_WholeFileRead)->Unit(benchmark::kMillisecond)->UseRealTime()->Iterations(3);

} // namespace

int main(int argc, char** argv) {
    QCoreApplication app(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
