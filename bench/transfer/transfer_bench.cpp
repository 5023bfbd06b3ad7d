// FTP download and upload of a 256 MB file over loopback, 200 small downloads
// on one connection, and zip and unzip of a 100 MB logger-like text file; each
// against its command-line anchor (curl, zip, unzip) on the same data. The
// data lives in a temporary folder that is removed at the end.
#include "peer_process.h"
#include "transfer/ftp_session.h"
#include "transfer/zip_archive.h"

#include <benchmark/benchmark.h>

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QProcess>
#include <QRandomGenerator>
#include <QTemporaryDir>

#include <cstdio>
#include <cstdlib>

#include <unistd.h>

namespace {

using quorvel::testing::FtpPeer;

struct Bench {
    QTemporaryDir dir;
    FtpPeer peer;
    quorvel::FtpSession session;
    QString Path(const QString& name) const { return dir.filePath(name); }
    QString Url(const QString& name) const {
        return QStringLiteral("ftp://") + peer.Server() + QLatin1Char('/') + name;
    }
};
Bench* bench = nullptr;

QByteArray LoggerLines(QRandomGenerator& generator, qint64& line) {
    QByteArray block;
    while (block.size() < (1 << 20)) {
        block += "2024-11-01 " + QByteArray::number(line / 3600 % 24) + ':' +
                 QByteArray::number(line / 60 % 60) + ':' + QByteArray::number(line % 60) + ',' +
                 QByteArray::number(12.0 + generator.bounded(1000) / 100.0) + ',' +
                 QByteArray::number(generator.bounded(100)) + ",OK\r\n";
        ++line;
    }
    return block;
}

// Text: logger lines throughout. Binary: one random megabyte over and over
// (the transfer does not care what the bytes are).
bool WriteFile(const QString& path, qint64 size, bool text) {
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly)) return false;
    QRandomGenerator generator(42);
    QByteArray random(1 << 20, Qt::Uninitialized);
    generator.fillRange(reinterpret_cast<quint32*>(random.data()), random.size() / 4);
    qint64 line = 0;
    for (qint64 written = 0; written < size;) {
        const QByteArray block = text ? LoggerLines(generator, line) : random;
        const qint64 part = std::min<qint64>(block.size(), size - written);
        if (file.write(block.constData(), part) != part) return false;
        written += part;
    }
    return true;
}

// Every timed run starts with the disk caught up: otherwise the data written by
// earlier runs slows whichever side happens to come later.
void Settle(benchmark::State& state) {
    state.PauseTiming();
    ::sync();
    state.ResumeTiming();
}

void Run(benchmark::State& state, const QString& program, const QStringList& args,
         const QString& workDir = QString()) {
    for (auto _ : state) {
        Settle(state);
        QProcess process;
        process.setWorkingDirectory(workDir.isEmpty() ? bench->dir.path() : workDir);
        process.start(program, args);
        if (!process.waitForFinished(-1) || process.exitCode() != 0)
            state.SkipWithError(qPrintable(program + QStringLiteral(" failed")));
    }
}

void FtpDownloadOurs(benchmark::State& state) {
    for (auto _ : state) {
        Settle(state);
        if (!bench->session.Download(QStringLiteral("big.dat"), bench->Path("down_ours.dat")))
            state.SkipWithError(qPrintable(bench->session.LastError()));
    }
}
void FtpDownloadCurl(benchmark::State& state) {
    Run(state, QStringLiteral("curl"),
        {"-s", "-S", "-u", "logger:secret", bench->Url("big.dat"), "-o",
         bench->Path("down_curl.dat")});
}
void FtpUploadOurs(benchmark::State& state) {
    for (auto _ : state) {
        Settle(state);
        if (!bench->session.Upload(bench->Path("local.dat"), QStringLiteral("up_ours.dat")))
            state.SkipWithError(qPrintable(bench->session.LastError()));
    }
}
void FtpUploadCurl(benchmark::State& state) {
    Run(state, QStringLiteral("curl"),
        {"-s", "-S", "-u", "logger:secret", "-T", bench->Path("local.dat"),
         bench->Url("up_curl.dat")});
}

constexpr int kSmallFiles = 200;

QString SmallName(int i) {
    return QStringLiteral("small/f%1.dat").arg(i);
}

// One log-in, then every file in turn, as a run of many small records does.
void SmallFilesOurs(benchmark::State& state) {
    for (auto _ : state) {
        state.PauseTiming();
        bench->session.Close();
        ::sync();
        state.ResumeTiming();
        for (int i = 1; i <= kSmallFiles; ++i) {
            if (!bench->session.Download(
                    SmallName(i), bench->Path(QStringLiteral("ours_") + QString::number(i)))) {
                state.SkipWithError(qPrintable(bench->session.LastError()));
                break;
            }
        }
    }
}
// curl fetches all of them in one process over one connection.
void SmallFilesCurl(benchmark::State& state) {
    Run(state, QStringLiteral("curl"),
        {"-s", "-S", "-u", "logger:secret", bench->Url("small/f[1-200].dat"), "-o",
         bench->Path("curl_#1")});
}

void ZipOurs(benchmark::State& state) {
    for (auto _ : state) {
        Settle(state);
        QFile::remove(bench->Path("ours.zip"));
        if (quorvel::ZipFiles({bench->Path("logger.dat")}, bench->Path("ours.zip")) != 0)
            state.SkipWithError("zip failed");
    }
}
void ZipCli(benchmark::State& state) {
    for (auto _ : state) {
        Settle(state);
        QFile::remove(bench->Path("cli.zip"));
        QProcess process;
        process.setWorkingDirectory(bench->dir.path());
        process.start(QStringLiteral("zip"), {"-q", "-j", "cli.zip", "logger.dat"});
        if (!process.waitForFinished(-1) || process.exitCode() != 0)
            state.SkipWithError("zip command failed");
    }
}
void UnzipOurs(benchmark::State& state) {
    for (auto _ : state) {
        Settle(state);
        if (quorvel::UnzipFile(bench->Path("input.zip"), bench->Path("out_ours")) != 0)
            state.SkipWithError("unzip failed");
    }
}
void UnzipCli(benchmark::State& state) {
    Run(state, QStringLiteral("unzip"), {"-o", "-q", "input.zip", "-d", bench->Path("out_cli")});
}

void Register(const char* name, void (*function)(benchmark::State&), int repetitions) {
    benchmark::RegisterBenchmark(name, function)
        ->Unit(benchmark::kMillisecond)
        ->UseRealTime()
        ->Iterations(1)
        ->Repetitions(repetitions);
}

} // namespace

int main(int argc, char** argv) {
    QCoreApplication app(argc, argv);
    Bench data;
    bench = &data;
    QDir().mkpath(data.Path("root"));
    QDir().mkpath(data.Path("root/small"));
    for (int i = 1; i <= kSmallFiles; ++i) {
        if (!WriteFile(data.Path("root/" + SmallName(i)), 1500 + 37 * i, true)) return 1;
    }
    if (!WriteFile(data.Path("root/big.dat"), 256ll << 20, false) ||
        !WriteFile(data.Path("local.dat"), 256ll << 20, false) ||
        !WriteFile(data.Path("logger.dat"), 100ll << 20, true) ||
        !data.peer.Start(data.Path("root"))) {
        std::fprintf(stderr, "transfer_bench: could not prepare the data or the FTP server\n");
        return 1;
    }
    // Both unzip benchmarks read the same archive, made by the zip command.
    if (QProcess::execute(QStringLiteral("zip"),
                          {"-q", "-j", data.Path("input.zip"), data.Path("logger.dat")}) != 0) {
        std::fprintf(stderr, "transfer_bench: the zip command failed\n");
        return 1;
    }
    data.session.SetDetails(data.peer.Server(), QStringLiteral("logger"), QStringLiteral("secret"),
                            false);
    Register("ftp_download/ours", FtpDownloadOurs, 15);
    Register("ftp_download/curl", FtpDownloadCurl, 15);
    Register("ftp_upload/ours", FtpUploadOurs, 15);
    Register("ftp_upload/curl", FtpUploadCurl, 15);
    Register("ftp_small_files/ours", SmallFilesOurs, 7);
    Register("ftp_small_files/curl", SmallFilesCurl, 7);
    Register("zip/ours", ZipOurs, 5);
    Register("zip/cli", ZipCli, 5);
    Register("unzip/ours", UnzipOurs, 11);
    Register("unzip/cli", UnzipCli, 11);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    data.session.Close();
    return 0;
}
