// Drawing the bar sample to an 800x600 PNG, beside its floor: the transformer reading the same
// text, which every render starts from. The ratio is reported, not judged: drawing is mostly Cairo
// and Pango, whose cost this library does not set.
#include "BenchSupport.h"

#include "foundation/XercesRuntime.h"

#include <plotaid/ChartRenderer.h>
#include <plotaid/ChartTransformer.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>

namespace {

const std::string kSample = std::string(PLOTAID_EXAMPLES_DIR) + "/charts/simple-bar.xml";

const std::string& chartText() {
    static const std::string text = [] {
        std::ifstream in(kSample, std::ios::binary);
        std::ostringstream s;
        s << in.rdbuf();
        return s.str();
    }();
    return text;
}

void renderPng(benchmark::State& state) {
    ChartRenderer renderer;
    renderer.setSize(800, 600);
    std::string png;
    for (auto _ : state) {
        ChartTransformer chart(chartText());
        if (!renderer.render(chart, ChartRenderer::PNG, png))
            state.SkipWithError("the chart does not render");
        benchmark::DoNotOptimize(png);
    }
}

void renderFloor(benchmark::State& state) {
    for (auto _ : state) {
        ChartTransformer chart(chartText());
        if (chart.getVisualization() == nullptr)
            state.SkipWithError("the chart does not parse");
        benchmark::DoNotOptimize(chart);
    }
}

BENCHMARK(renderPng)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(renderFloor)->Unit(benchmark::kMillisecond)->Repetitions(3);

} // namespace

int main(int argc, char** argv) {
    ::unsetenv("DumpChartXMLPath");
    plotaid::detail::XercesRuntime runtime;
    if (!bench::initialize(argc, argv))
        return 1;
    if (chartText().empty()) {
        std::fprintf(stderr, "cannot read %s\n", kSample.c_str());
        return 1;
    }
    std::printf("chart: %zu bytes\n", chartText().size());
    bench::BestTimes reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();
    return bench::within(reporter, "renderPng", "renderFloor", 0) ? 0 : 1;
}
