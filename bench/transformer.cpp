// A chart with a large embedded source through the transformer: construction (the source moves to
// the compressed data document) and getEntireXML (merged back), beside a validated parse of the
// same text plus one deflate of the data document.
#include "BenchSupport.h"

#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartTransformer.h>

#include <zpack/zpack.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>

namespace {

const std::string kSample = std::string(PLOTAID_EXAMPLES_DIR) + "/charts/scatterplot-matrix.xml";
constexpr unsigned kRows = 100000;
constexpr unsigned kVariables = 10;
constexpr double kLimit = 1.3;

// The largest sample with its embedded source replaced by one of kRows rows of kVariables numbers.
const std::string& chartText() {
    static const std::string text = [] {
        std::ifstream in(kSample, std::ios::binary);
        std::ostringstream sample;
        sample << in.rdbuf();
        const std::string s = sample.str();
        const std::size_t open = s.find("<embeddedSource");
        const std::string closeTag = "</embeddedSource>";
        const std::size_t close = s.find(closeTag, open);
        if (open == std::string::npos || close == std::string::npos)
            return std::string();
        const std::size_t openEnd = s.find('>', open) + 1;
        std::string source = s.substr(open, openEnd - open) + "<names>";
        for (unsigned v = 0; v < kVariables; ++v)
            source += (v ? ";v" : "v") + std::to_string(v);
        source += "</names><types>";
        for (unsigned v = 0; v < kVariables; ++v)
            source += v ? ";number" : "number";
        source += "</types>\n";
        char cell[32];
        for (unsigned r = 0; r < kRows; ++r) {
            source += "<row>";
            for (unsigned v = 0; v < kVariables; ++v) {
                std::snprintf(cell, sizeof cell, v ? ";%.3f" : "%.3f", r * 0.37 + v * 11.5);
                source += cell;
            }
            source += "</row>\n";
        }
        source += closeTag;
        return s.substr(0, open) + source + s.substr(close + closeTag.size());
    }();
    return text;
}

const std::string& dataDocument() {
    static const std::string text = [] {
        ChartTransformer t(chartText());
        std::string plain;
        zpack::decompressString(plain, t.getCompressedData());
        return plain;
    }();
    return text;
}

void transformEntire(benchmark::State& state) {
    for (auto _ : state) {
        ChartTransformer t(chartText());
        std::string whole = t.getEntireXML(u"UTF-8");
        if (whole.size() < chartText().size() / 2)
            state.SkipWithError("the whole document lost its data");
        benchmark::DoNotOptimize(whole);
    }
}

void transformEntireFloor(benchmark::State& state) {
    plotaid::detail::ValidatingParser parser;
    for (auto _ : state) {
        if (parser.parse(chartText(), "bench", ChartException("bench chart", "bench", 0),
                         plotaid::detail::DocumentKind::Chart) == nullptr)
            state.SkipWithError("the chart does not parse");
        std::string packed;
        zpack::compressString(dataDocument(), packed);
        benchmark::DoNotOptimize(packed);
    }
}

BENCHMARK(transformEntire)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(transformEntireFloor)->Unit(benchmark::kMillisecond)->Repetitions(3);

} // namespace

int main(int argc, char** argv) {
    ::unsetenv("DumpChartXMLPath"); // measure the transformer, not the error log's disk writes
    plotaid::detail::XercesRuntime runtime;
    if (!bench::initialize(argc, argv))
        return 1;
    if (chartText().empty() || dataDocument().empty()) {
        std::fprintf(stderr, "cannot build the chart from %s\n", kSample.c_str());
        return 1;
    }
    std::printf("chart: %zu bytes, data document: %zu bytes (%u rows, %u variables)\n", chartText().size(),
                dataDocument().size(), kRows, kVariables);
    bench::BestTimes reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();
    return bench::within(reporter, "transformEntire", "transformEntireFloor", kLimit,
                         static_cast<double>(chartText().size()) / 1e6)
               ? 0
               : 1;
}
