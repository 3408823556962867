// Template application beside its floor, in one run.
// - applyTemplate: validated parse of the largest sample chart scaled to 1,000 elements, then a
//   template of 500 instructions parsed (validated) and walked over it, then the chart printed once.
//   Floor: the validated parse of the same chart and template and one serialisation, no walk.
// - uniqueStyleId: the 10,000th and later "style<n>" ids of one visualization made with
//   CreateUniqueId and given to a new style. Floor: the same new style with an id known beforehand.
//   The first-free-number rule must not make each id cost a scan from 1.
#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"
#include "templates/InstructionWalk.h"

#include <plotaid/ChartBase.h>
#include <plotaid/ChartTemplate.h>

#include <grx/grx.h>

#include "BenchSupport.h"
#include "ScaledChart.h"
#include "TemplateBench.h"

#include <benchmark/benchmark.h>

#include <xercesc/dom/DOM.hpp>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

using namespace XERCES_CPP_NAMESPACE;

namespace {

constexpr std::size_t kChartElements = 1000;
constexpr std::size_t kInstructions = 500;
constexpr unsigned kStyles = 10000;
constexpr double kApplyLimit = 3.0;
constexpr double kUniqueIdLimit = 2.0;
const std::string kSample = std::string(PLOTAID_EXAMPLES_DIR) + "/charts/scatterplot-matrix.xml";

const std::string& scaledChart() {
    static const std::string text = bench::scaleChart(kSample, kChartElements);
    return text;
}

// kInstructions instructions cycling through every tag the walk knows.
const std::string& bigTemplate() {
    static const std::string text = [] {
        std::string t = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                        "<template xmlns=\"http://plotaid.org/grxml\" "
                        "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
                        "xsi:schemaLocation=\"http://plotaid.org/grxml "
                        "http://plotaid.org/grxml/grxml-template-3.5.xsd\">\n";
        const plotaid::detail::InstructionTable table = plotaid::detail::instructionTable();
        for (std::size_t i = 0; i < kInstructions; ++i)
            t += "  <" + ChartString(table.entries[i % table.count].tag).toUTF8() + " role=\"y\"/>\n";
        return t + "</template>\n";
    }();
    return text;
}

void applyTemplate(benchmark::State& state) {
    bench::applyTemplateLoop(state, scaledChart(), bigTemplate());
}

void applyTemplateFloor(benchmark::State& state) {
    bench::applyTemplateFloorLoop(state, scaledChart(), bigTemplate());
}

// A visualization with style1 .. style<kStyles> made the way actions make them.
std::unique_ptr<GrxVisualization> manyStyles(bool throughCreateUniqueId) {
    auto vis = std::make_unique<GrxVisualization>(
        ChartBase::createGrxDocument(ChartBase::_utf8)->getDocumentElement(), true);
    for (unsigned n = 1; n <= kStyles; ++n) {
        ChartString id("style");
        id.appendInteger(n);
        vis->addStyle().setId(throughCreateUniqueId ? ChartBase::CreateUniqueId(ChartString("style"), *vis)
                                                    : id);
    }
    return vis;
}

void uniqueStyleId(benchmark::State& state) {
    std::unique_ptr<GrxVisualization> vis = manyStyles(true);
    for (auto _ : state)
        vis->addStyle().setId(ChartBase::CreateUniqueId(ChartString("style"), *vis));
}

void uniqueStyleIdFloor(benchmark::State& state) {
    std::unique_ptr<GrxVisualization> vis = manyStyles(false);
    unsigned next = kStyles + 1;
    for (auto _ : state) {
        ChartString id("style");
        id.appendInteger(next++);
        vis->addStyle().setId(id);
    }
}

BENCHMARK(applyTemplate)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(applyTemplateFloor)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(uniqueStyleId)->Iterations(10000)->Repetitions(3);
BENCHMARK(uniqueStyleIdFloor)->Iterations(10000)->Repetitions(3);

} // namespace

int main(int argc, char** argv) {
    ::unsetenv("DumpChartXMLPath"); // measure the engine, not the error log's disk writes
    plotaid::detail::XercesRuntime runtime;
    if (!bench::initialize(argc, argv))
        return 1;
    if (scaledChart().empty()) {
        std::fprintf(stderr, "cannot scale %s\n", kSample.c_str());
        return 1;
    }
    std::printf("scaled chart: %zu bytes, template: %zu instructions\n", scaledChart().size(), kInstructions);
    bench::BestTimes reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();
    const bool apply = bench::within(reporter, "applyTemplate", "applyTemplateFloor", kApplyLimit);
    const bool ids = bench::within(reporter, "uniqueStyleId", "uniqueStyleIdFloor", kUniqueIdLimit);
    return apply && ids ? 0 : 1;
}
