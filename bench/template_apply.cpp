// The presentation template applied to the largest sample chart, beside its floor, in one run.
// - applyPresentation/N: validated parse of the chart scaled to N elements, the template parsed
//   (validated) and applied, the chart printed once.
// - applyFloor/N: the validated parse of the same chart and template and one serialisation.
// Targets: at 1,000 elements at most 1.5x the floor; 10,000 elements at most 11x the time of 1,000,
// so that no instruction grows faster than the chart.
#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartTemplate.h>

#include <grx/grx.h>

#include "BenchSupport.h"
#include "ScaledChart.h"
#include "TemplateBench.h"

#include <benchmark/benchmark.h>

#include <xercesc/dom/DOM.hpp>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <map>
#include <sstream>
#include <string>

using namespace XERCES_CPP_NAMESPACE;

namespace {

constexpr long kSmall = 1000;
constexpr long kLarge = 10000;
constexpr double kFloorLimit = 1.5;
constexpr double kScalingLimit = 11.0;
const std::string kSample = std::string(PLOTAID_EXAMPLES_DIR) + "/charts/scatterplot-matrix.xml";
const std::string kTemplate = std::string(PLOTAID_EXAMPLES_DIR) + "/templates/presentation.sgt";

const std::string& scaledChart(long elements) {
    static std::map<long, std::string> charts;
    auto found = charts.find(elements);
    if (found == charts.end())
        found =
            charts.emplace(elements, bench::scaleChart(kSample, static_cast<std::size_t>(elements))).first;
    return found->second;
}

const std::string& presentation() {
    static const std::string text = [] {
        std::ifstream in(kTemplate, std::ios::binary);
        std::ostringstream out;
        out << in.rdbuf();
        return out.str();
    }();
    return text;
}

void applyPresentation(benchmark::State& state) {
    bench::applyTemplateLoop(state, scaledChart(state.range(0)), presentation());
}

void applyFloor(benchmark::State& state) {
    bench::applyTemplateFloorLoop(state, scaledChart(state.range(0)), presentation());
}

BENCHMARK(applyPresentation)->Arg(kSmall)->Arg(kLarge)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(applyFloor)->Arg(kSmall)->Arg(kLarge)->Unit(benchmark::kMillisecond)->Repetitions(3);

} // namespace

int main(int argc, char** argv) {
    ::unsetenv("DumpChartXMLPath"); // measure the engine, not the error log's disk writes
    plotaid::detail::XercesRuntime runtime;
    if (!bench::initialize(argc, argv))
        return 1;
    if (presentation().empty() || scaledChart(kSmall).empty() || scaledChart(kLarge).empty()) {
        std::fprintf(stderr, "cannot read %s or scale %s\n", kTemplate.c_str(), kSample.c_str());
        return 1;
    }
    std::printf("scaled charts: %zu and %zu bytes\n", scaledChart(kSmall).size(), scaledChart(kLarge).size());
    bench::BestTimes reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();
    const std::string small = "/" + std::to_string(kSmall), large = "/" + std::to_string(kLarge);
    const bool floor =
        bench::within(reporter, "applyPresentation" + small, "applyFloor" + small, kFloorLimit);
    bench::within(reporter, "applyPresentation" + large, "applyFloor" + large, 0);
    const bool scaling =
        bench::within(reporter, "applyPresentation" + large, "applyPresentation" + small, kScalingLimit);
    return floor && scaling ? 0 : 1;
}
