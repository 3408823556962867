// The frame packer beside its floor, in one run: the largest sample chart scaled to 10,000
// elements is packed (every graph gathered, the frames laid out again) and, as the floor, parsed
// with schema validation. Packing a parsed chart must cost at most a tenth of parsing it.
#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartException.h>
#include <plotaid/FramePacker.h>

#include <grx/grx.h>

#include "BenchSupport.h"
#include "ScaledChart.h"

#include <benchmark/benchmark.h>

#include <xercesc/dom/DOM.hpp>

#include <cstdio>
#include <memory>
#include <string>

namespace {

constexpr std::size_t kElements = 10000;
constexpr double kPackLimit = 0.1;
const std::string kSample = std::string(PLOTAID_EXAMPLES_DIR) + "/charts/scatterplot-matrix.xml";
const ChartException kRefused("bench input", "bench/frame_packer", 0);

const std::string& scaledChart() {
    static const std::string text = bench::scaleChart(kSample, kElements);
    return text;
}

void validatedParse(benchmark::State& state) {
    plotaid::detail::ValidatingParser parser;
    for (auto _ : state)
        if (!parser.parse(scaledChart(), "bench", kRefused, plotaid::detail::DocumentKind::Chart)) {
            state.SkipWithError("the chart does not validate");
            return;
        }
}

// Packing is idempotent, so one parsed chart is packed again and again.
void packFrames(benchmark::State& state) {
    plotaid::detail::ValidatingParser parser;
    if (!parser.parse(scaledChart(), "bench", kRefused, plotaid::detail::DocumentKind::Chart)) {
        state.SkipWithError("the chart does not validate");
        return;
    }
    GrxVisualization vis(parser.adoptDocument().release()->getDocumentElement(), true);
    const FramePacker packer;
    for (auto _ : state)
        benchmark::DoNotOptimize(packer.packFrames(vis, nullptr));
}

BENCHMARK(validatedParse)->Unit(benchmark::kMillisecond)->Repetitions(5);
BENCHMARK(packFrames)->Unit(benchmark::kMillisecond)->Repetitions(5);

} // namespace

int main(int argc, char** argv) {
    const plotaid::detail::XercesRuntime up;
    if (!bench::initialize(argc, argv))
        return 1;
    if (scaledChart().empty()) {
        std::fprintf(stderr, "cannot scale %s\n", kSample.c_str());
        return 1;
    }
    std::printf("scaled chart: %zu bytes\n", scaledChart().size());
    bench::BestTimes reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();
    return bench::within(reporter, "packFrames", "validatedParse", kPackLimit) ? 0 : 1;
}
