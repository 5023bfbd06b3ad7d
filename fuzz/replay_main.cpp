// Runs a fuzz target without libFuzzer, for the test suite's own compiler:
// every file of the seed corpus once, then simple mutations of them (bit
// flips, changed, inserted and removed bytes, copied ranges, two seeds joined)
// for the given seconds, from a fixed seed so that a failure can be repeated.
//
// usage: TARGET_replay CORPUS_DIR [SECONDS]
#include <chrono>
#include <csignal>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <random>
#include <string>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);
extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv) __attribute__((weak));

namespace {

using Bytes = std::vector<std::uint8_t>;

const Bytes* current = nullptr;

// A failing input is printed in hex, so that it can be added to the corpus.
void OnAbort(int) {
    if (current) {
        std::fprintf(stderr, "failing input (%zu bytes):\n", current->size());
        for (const std::uint8_t b : *current)
            std::fprintf(stderr, "%02x", b);
        std::fprintf(stderr, "\n");
    }
    std::signal(SIGABRT, SIG_DFL);
    std::abort();
}

void Run(const Bytes& input) {
    current = &input;
    LLVMFuzzerTestOneInput(input.data(), input.size());
    current = nullptr;
}

Bytes Mutate(const std::vector<Bytes>& seeds, std::mt19937& random) {
    const auto pick = [&](std::size_t n) { return n == 0 ? 0 : random() % n; };
    Bytes out = seeds[pick(seeds.size())];
    for (int steps = 1 + int(pick(4)); steps > 0; --steps) {
        const std::size_t at = pick(out.size() + 1);
        switch (pick(6)) {
        case 0:
            if (at < out.size()) out[at] ^= std::uint8_t(1u << pick(8));
            break;
        case 1:
            if (at < out.size()) out[at] = std::uint8_t(random());
            break;
        case 2:
            out.insert(out.begin() + long(at), std::uint8_t("\r\n0123456789:;, -OKHT"[pick(20)]));
            break;
        case 3:
            if (at < out.size())
                out.erase(out.begin() + long(at),
                          out.begin() + long(std::min(out.size(), at + 1 + pick(8))));
            break;
        case 4: {
            if (out.empty()) break;
            const std::size_t from = pick(out.size());
            const std::size_t n = 1 + pick(std::min<std::size_t>(32, out.size() - from));
            const Bytes copy(out.begin() + long(from), out.begin() + long(from + n));
            out.insert(out.begin() + long(at), copy.begin(), copy.end());
            break;
        }
        default: {
            const Bytes& other = seeds[pick(seeds.size())];
            out.resize(at);
            out.insert(out.end(), other.begin() + long(pick(other.size() + 1)), other.end());
            break;
        }
        }
    }
    if (out.size() > 4096) out.resize(4096);
    return out;
}

} // namespace

int main(int argc, char** argv) {
    if (argc < 2) {
        std::fprintf(stderr, "usage: %s CORPUS_DIR [SECONDS]\n", argv[0]);
        return 2;
    }
    if (LLVMFuzzerInitialize) LLVMFuzzerInitialize(&argc, &argv);
    std::signal(SIGABRT, OnAbort);
    std::vector<Bytes> seeds;
    for (const auto& entry : std::filesystem::directory_iterator(argv[1])) {
        std::ifstream file(entry.path(), std::ios::binary);
        seeds.emplace_back(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
    }
    if (seeds.empty()) {
        std::fprintf(stderr, "no seeds in %s\n", argv[1]);
        return 2;
    }
    for (const Bytes& seed : seeds)
        Run(seed);
    const double seconds = argc > 2 ? std::atof(argv[2]) : 3.0;
    std::mt19937 random(1234567);
    const auto start = std::chrono::steady_clock::now();
    const auto end = start + std::chrono::duration<double>(seconds);
    long runs = 0;
    while (std::chrono::steady_clock::now() < end) {
        Run(Mutate(seeds, random));
        ++runs;
    }
    const double took =
        std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    std::printf("%zu seeds, %ld mutated inputs in %.1f s (%.0f per second)\n", seeds.size(), runs,
                took, runs / (took > 0 ? took : 1));
    return 0;
}
