// How long the window takes to come up with a long list, and to follow a
// selection (with the local data file's last date shown) -- each next to the
// bare Qt work it cannot avoid.

#include "app/sample_list.h"
#include "app/ui/frm_web_data_client.h"
#include "support/ini_store.h"
#include "support/program_home.h"

#include <QApplication>
#include <QFile>
#include <QListWidget>
#include <QMainWindow>
#include <QTemporaryDir>

#include <benchmark/benchmark.h>

#include <memory>

namespace quorvel {
namespace {

constexpr int kRecords = 10000;
constexpr qint64 kDataFileBytes = qint64(1) << 30;

// A program folder with a list of kRecords records that the user maintains.
class BenchHome {
public:
    BenchHome() {
        ProgramHome::SetFolder(dir_.path());
        LocalSettings settings(ProgramHome::SettingsFile());
        settings.SaveLocalSetting(QStringLiteral("GetFileList"), QStringLiteral("0"));
        settings.SaveLocalSetting(QStringLiteral("GetLocalFolders"), QStringLiteral("0"));
        testing::WriteSampleList(dir_.filePath(QStringLiteral("files.txt")), kRecords);
    }
    ~BenchHome() { ProgramHome::SetFolder({}); }
    QString File(const QString& name) const { return dir_.filePath(name); }

private:
    QTemporaryDir dir_;
};

void Pump() {
    for (int i = 0; i < 3; ++i)
        QApplication::processEvents();
}

// A 1 GB data file whose last lines carry dates; sparse where the file system allows.
bool MakeBigDataFile(const QString& path) {
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly) || !file.resize(kDataFileBytes - 200)) return false;
    file.seek(kDataFileBytes - 200);
    QByteArray tail;
    while (tail.size() < 200)
        tail += "\r\n2024-11-05 10:20:30,1.5,2.5";
    file.write(tail.right(200));
    return true;
}

void BM_StartupShownWithLongList(benchmark::State& state) {
    BenchHome home;
    for (auto _ : state) {
        frm_WebDataClient window({});
        window.Form_Load();
        window.show();
        Pump();
        if (window.Controls().Lst_Files->count() != kRecords)
            state.SkipWithError("list not loaded");
        window.hide();
    }
}

void BM_StartupAnchorBareListWindow(benchmark::State& state) {
    BenchHome home;
    for (auto _ : state) {
        // Reading the same file and showing its names in a plain window.
        FileList list;
        list.LoadDataFile(home.File(QStringLiteral("files.txt")));
        QMainWindow window;
        auto* names = new QListWidget(&window);
        window.setCentralWidget(names);
        QStringList texts;
        for (const FileRecord& record : list.Records())
            texts << record.Name;
        names->addItems(texts);
        names->setCurrentRow(0);
        window.show();
        Pump();
        window.hide();
    }
}

void BM_SelectRecordWithBigDataFile(benchmark::State& state) {
    BenchHome home;
    if (!MakeBigDataFile(home.File(QStringLiteral("big.dat")))) {
        state.SkipWithError("cannot make the 1 GB data file");
        return;
    }
    frm_WebDataClient window({});
    window.Form_Load();
    window.show();
    Pump();
    auto& c = window.Controls();
    // Record 0 names the big file (DateTime layout, this PC's application folder).
    c.Lst_Files->setCurrentRow(0);
    c.Txt_FileName->setText(QStringLiteral("big.dat"));
    c.Opt_UserLocationID->SetIndex(kLocationApplication);
    c.Cmb_TypeID->setCurrentIndex(c.Cmb_TypeID->findData(1));
    c.chk_ShowDate[0]->setChecked(true);
    c.Lst_Files->setCurrentRow(1);
    int row = 0;
    for (auto _ : state) {
        c.Lst_Files->setCurrentRow(row);
        row = 1 - row;
    }
    c.Lst_Files->setCurrentRow(0);
    if (c.Lbl_LastDate[0]->text() != QStringLiteral("5 Nov 2024 10:20:30"))
        state.SkipWithError("the data file's last date was not shown");
    QFile::remove(home.File(QStringLiteral("big.dat")));
}

void BM_SelectAnchorBareListAndFileTail(benchmark::State& state) {
    BenchHome home;
    const QString path = home.File(QStringLiteral("big.dat"));
    if (!MakeBigDataFile(path)) {
        state.SkipWithError("cannot make the 1 GB data file");
        return;
    }
    QListWidget list;
    for (int i = 0; i < 100; ++i)
        list.addItem(QString::number(i));
    list.show();
    int row = 0;
    for (auto _ : state) {
        // The least a selection with a shown file date needs: move the
        // selection, look at the file and read its end.
        list.setCurrentRow(row);
        row = 1 - row;
        QFile file(path);
        file.open(QIODevice::ReadOnly);
        file.seek(file.size() - 4096);
        benchmark::DoNotOptimize(file.read(4096));
    }
    QFile::remove(path);
}

BENCHMARK(BM_StartupShownWithLongList)->Unit(benchmark::kMillisecond)->Iterations(5)->UseRealTime();
BENCHMARK(BM_StartupAnchorBareListWindow)
    ->Unit(benchmark::kMillisecond)
    ->Iterations(5)
    ->UseRealTime();
BENCHMARK(BM_SelectRecordWithBigDataFile)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(BM_SelectAnchorBareListAndFileTail)->Unit(benchmark::kMillisecond)->UseRealTime();

} // namespace
} // namespace quorvel

int main(int argc, char** argv) {
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication app(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
