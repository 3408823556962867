// Compression wrapper beside plain zlib on the same 50 MB chart-like text, in the same run.
// The wrapper's floor is zlib itself: after the runs, each wrapper operation's best time is set
// against its zlib counterpart's, and the program fails when one is more than 5% slower.
#include <zpack/zpack.h>

#include <benchmark/benchmark.h>
#include <zlib.h>

#include <algorithm>
#include <cstdio>
#include <map>
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

// Keeps the best time per benchmark while the console shows everything as usual.
class BestTimes : public benchmark::ConsoleReporter {
public:
    void ReportRuns(const std::vector<Run>& runs) override {
        for (const Run& run : runs) {
            if (run.run_type != Run::RT_Iteration || run.error_occurred || run.iterations == 0)
                continue;
            // CPU time: the machine is shared, and time spent descheduled is nobody's cost here.
            const double perIteration = run.cpu_accumulated_time / static_cast<double>(run.iterations);
            auto [it, inserted] = best.emplace(run.run_name.function_name, perIteration);
            if (!inserted)
                it->second = std::min(it->second, perIteration);
        }
        ConsoleReporter::ReportRuns(runs);
    }
    std::map<std::string, double> best;
};

} // namespace

int main(int argc, char** argv) {
    std::vector<char*> args(argv, argv + argc);
    char interleave[] = "--benchmark_enable_random_interleaving=true";
    args.insert(args.begin() + 1, interleave); // the caller's own flags come later and win
    int count = static_cast<int>(args.size());
    benchmark::Initialize(&count, args.data());
    if (benchmark::ReportUnrecognizedArguments(count, args.data()))
        return 1;
    std::printf("text: %zu bytes, compressed: %zu bytes\n", chartText().size(), packedText().size());
    BestTimes reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();

    const struct {
        const char* wrapper;
        const char* floor;
    } pairs[] = {{"wrapperCompress", "zlibCompress"},
                 {"wrapperDecompress", "zlibUncompress"},
                 {"wrapperDecompressExpectedLength", "zlibUncompress"}};
    bool within = true;
    for (const auto& pair : pairs) {
        const auto w = reporter.best.find(pair.wrapper);
        const auto f = reporter.best.find(pair.floor);
        if (w == reporter.best.end() || f == reporter.best.end())
            continue; // filtered out
        const double mbps = static_cast<double>(chartText().size()) / 1e6;
        const double ratio = w->second / f->second;
        std::printf("%-32s %8.1f MB/s  vs zlib %8.1f MB/s  ratio %.3f (limit %.2f)%s\n", pair.wrapper,
                    mbps / w->second, mbps / f->second, ratio, kAllowedRatio,
                    ratio > kAllowedRatio ? "  TOO SLOW" : "");
        within = within && ratio <= kAllowedRatio;
    }
    return within ? 0 : 1;
}
