// Compression wrapper beside plain zlib on the same 50 MB chart-like text, in the same run.
// The wrapper's floor is zlib itself: after the runs, each wrapper operation's best time is set
// against its zlib counterpart's, and the program fails when one is more than 5% slower.
#include <zpack/zpack.h>

#include "BenchSupport.h"

#include <benchmark/benchmark.h>
#include <zlib.h>

#include <algorithm>
#include <cstdio>
#include <random>
#include <string>
#include <vector>

namespace {

constexpr std::size_t kTextSize = std::size_t(50) << 20;
constexpr double kAllowedRatio = 1.05;

// Chart XML with its data: the same few elements over and over, with numbers that vary.
const std::string& chartText() {
    static const std::string text = [] {
        std::string xml =
            "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<visualization xmlns=\"http://plotaid.org/grxml\">\n"
            "<dataSource id=\"ds1\">\n";
        xml.reserve(kTextSize + 256);
        std::mt19937 rng(2026);
        std::uniform_real_distribution<double> value(-1000.0, 100000.0);
        char line[256];
        for (unsigned row = 0; xml.size() < kTextSize; ++row) {
            std::snprintf(line, sizeof line,
                          "  <case id=\"c%u\"><value variable=\"v%u\" number=\"%.4f\"/>"
                          "<label text=\"Group %u\" style=\"style%u\"/></case>\n",
                          row, row % 17, value(rng), static_cast<unsigned>(rng() % 40), row % 5);
            xml += line;
        }
        xml += "</dataSource>\n</visualization>\n";
        return xml;
    }();
    return text;
}

const std::string& packedText() {
    static const std::string packed = [] {
        std::string out;
        zpack::compressString(chartText(), out);
        return out;
    }();
    return packed;
}

void wrapperCompress(benchmark::State& state) {
    const std::string& text = chartText();
    for (auto _ : state) {
        std::string out;
        if (!zpack::compressString(text, out))
            state.SkipWithError("compressString failed");
        benchmark::DoNotOptimize(out.data());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * text.size()));
}

void zlibCompress(benchmark::State& state) {
    const std::string& text = chartText();
    for (auto _ : state) {
        std::string out(compressBound(text.size()), '\0');
        uLongf size = out.size();
        if (compress2(reinterpret_cast<Bytef*>(&out[0]), &size, reinterpret_cast<const Bytef*>(text.data()),
                      text.size(), Z_DEFAULT_COMPRESSION) != Z_OK)
            state.SkipWithError("compress2 failed");
        out.resize(size);
        benchmark::DoNotOptimize(out.data());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * text.size()));
}

void wrapperDecompress(benchmark::State& state) {
    const std::string& packed = packedText();
    for (auto _ : state) {
        std::string out;
        if (!zpack::decompressString(out, packed) || out.size() != chartText().size())
            state.SkipWithError("decompressString failed");
        benchmark::DoNotOptimize(out.data());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * chartText().size()));
}

void wrapperDecompressExpectedLength(benchmark::State& state) {
    const std::string& packed = packedText();
    const unsigned long length = chartText().size();
    for (auto _ : state) {
        std::string out;
        if (!zpack::decompressString(out, packed, length) || out.size() != length)
            state.SkipWithError("decompressString failed");
        benchmark::DoNotOptimize(out.data());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * chartText().size()));
}

// zlib is told the exact length, which the two-argument wrapper call has to find out.
void zlibUncompress(benchmark::State& state) {
    const std::string& packed = packedText();
    for (auto _ : state) {
        std::string out(chartText().size(), '\0');
        uLongf size = out.size();
        if (uncompress(reinterpret_cast<Bytef*>(&out[0]), &size,
                       reinterpret_cast<const Bytef*>(packed.data()), packed.size()) != Z_OK ||
            size != out.size())
            state.SkipWithError("uncompress failed");
        benchmark::DoNotOptimize(out.data());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * chartText().size()));
}

// The best of several runs, interleaved at random, is the figure least disturbed by whatever else
// the machine is doing.
BENCHMARK(zlibCompress)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(wrapperCompress)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(zlibUncompress)->Unit(benchmark::kMillisecond)->Repetitions(5);
BENCHMARK(wrapperDecompress)->Unit(benchmark::kMillisecond)->Repetitions(5);
BENCHMARK(wrapperDecompressExpectedLength)->Unit(benchmark::kMillisecond)->Repetitions(5);

} // namespace

int main(int argc, char** argv) {
    if (!bench::initialize(argc, argv))
        return 1;
    std::printf("text: %zu bytes, compressed: %zu bytes\n", chartText().size(), packedText().size());
    bench::BestTimes times;
    benchmark::RunSpecifiedBenchmarks(&times);
    benchmark::Shutdown();

    const double mb = static_cast<double>(chartText().size()) / 1e6;
    bool ok = bench::within(times, "wrapperCompress", "zlibCompress", kAllowedRatio, mb);
    ok = bench::within(times, "wrapperDecompress", "zlibUncompress", kAllowedRatio, mb) && ok;
    ok = bench::within(times, "wrapperDecompressExpectedLength", "zlibUncompress", kAllowedRatio, mb) && ok;
    return ok ? 0 : 1;
}
