// Time to fetch a reply of the reference service into a file with libcurl, as
// curl -o would, against PHP's web server serving the same bytes as a static
// file. run.sh starts both servers. Environment: SERVICE_BENCH_GETDATA_URL,
// SERVICE_BENCH_GETALL_URL (the same records asked for with date=0),
// SERVICE_BENCH_STATIC_URL, SERVICE_BENCH_LOGIN_URL (a GETUSERFOLDERS request:
// the password check every request pays), SERVICE_BENCH_OUT (a file to write to).
#include <benchmark/benchmark.h>
#include <curl/curl.h>

#include <cstdio>
#include <cstdlib>
#include <string>

namespace {

std::string Env(const char* name) {
    const char* value = std::getenv(name);
    return value ? value : "";
}

size_t WriteToFile(char* data, size_t size, size_t count, void* file) {
    return std::fwrite(data, size, count, static_cast<std::FILE*>(file));
}

// Fetches url into the output file; the number of bytes, or -1 on failure.
long long Fetch(const std::string& url, const std::string& out) {
    std::FILE* file = std::fopen(out.c_str(), "wb");
    if (!file) return -1;
    CURL* curl = curl_easy_init();
    curl_easy_setopt(curl, CURLOPT_URL, url.c_str());
    curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, WriteToFile);
    curl_easy_setopt(curl, CURLOPT_WRITEDATA, file);
    curl_easy_setopt(curl, CURLOPT_FAILONERROR, 1L);
    const CURLcode code = curl_easy_perform(curl);
    curl_off_t bytes = 0;
    curl_easy_getinfo(curl, CURLINFO_SIZE_DOWNLOAD_T, &bytes);
    curl_easy_cleanup(curl);
    std::fclose(file);
    return code == CURLE_OK ? static_cast<long long>(bytes) : -1;
}

void FetchInto(benchmark::State& state, const std::string& url) {
    const std::string out = Env("SERVICE_BENCH_OUT");
    long long bytes = 0;
    for (auto _ : state) {
        bytes = Fetch(url, out);
        if (bytes < 0) {
            state.SkipWithError(("fetch failed: " + url).c_str());
            break;
        }
    }
    std::remove(out.c_str());
    state.counters["reply_mb"] = static_cast<double>(bytes) / 1e6;
}

void BM_ServiceGetData(benchmark::State& state) {
    FetchInto(state, Env("SERVICE_BENCH_GETDATA_URL"));
}

void BM_ServiceGetAll(benchmark::State& state) {
    FetchInto(state, Env("SERVICE_BENCH_GETALL_URL"));
}

void BM_StaticFile(benchmark::State& state) {
    FetchInto(state, Env("SERVICE_BENCH_STATIC_URL"));
}

void BM_ServiceLoginCheck(benchmark::State& state) {
    FetchInto(state, Env("SERVICE_BENCH_LOGIN_URL"));
}

BENCHMARK(BM_ServiceGetData)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(5);
BENCHMARK(BM_ServiceGetAll)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(5);
BENCHMARK(BM_StaticFile)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(5);
BENCHMARK(BM_ServiceLoginCheck)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(5);

} // namespace

int main(int argc, char** argv) {
    curl_global_init(CURL_GLOBAL_DEFAULT);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    curl_global_cleanup();
    return 0;
}
