// Reading charts and templates, each beside its floor, in one run.
// - mainJob: a transformer over the simple bar chart, the presentation template applied, the chart
//   written (getXML). Floor: the two texts parsed without validation and the chart printed once.
//   Target: at most 3x the floor, which needs the grammars read once per process, not per parse.
// - restyle/N: 200 sample charts restyled on N threads, one transformer per chart, by wall-clock
//   time. Target: 2 threads at least 1.7x the throughput of 1.
#include "BenchSupport.h"

#include "foundation/XercesRuntime.h"

#include <plotaid/ChartTransformer.h>

#include <grx/ChartPrinter.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/parsers/XercesDOMParser.hpp>

#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

using namespace XERCES_CPP_NAMESPACE;

namespace {

constexpr double kMainJobLimit = 3.0;
constexpr double kTwoThreadLimit = 1 / 1.7; // time of 2 threads over time of 1
constexpr std::size_t kCharts = 200;

std::string readText(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream out;
    out << in.rdbuf();
    return out.str();
}

const std::string& chart() {
    static const std::string text = readText(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/simple-bar.xml");
    return text;
}

const std::string& presentation() {
    static const std::string text =
        readText(std::string(PLOTAID_EXAMPLES_DIR) + "/templates/presentation.sgt");
    return text;
}

// The sample charts, repeated to kCharts.
const std::vector<std::string>& samples() {
    static const std::vector<std::string> all = [] {
        std::vector<std::string> found;
        for (const auto& e :
             std::filesystem::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/charts"))
            found.push_back(readText(e.path().string()));
        std::vector<std::string> charts;
        for (std::size_t i = 0; !found.empty() && i < kCharts; ++i)
            charts.push_back(found[i % found.size()]);
        return charts;
    }();
    return all;
}

bool mainJobOnce(const std::string& text) {
    ChartTransformer t(text);
    if (!t.applyTemplate(presentation()))
        return false;
    const std::string written = t.getXML();
    benchmark::DoNotOptimize(written.data());
    return !written.empty();
}

void mainJob(benchmark::State& state) {
    for (auto _ : state)
        if (!mainJobOnce(chart())) {
            state.SkipWithError("the main job failed");
            return;
        }
}

void mainJobFloor(benchmark::State& state) {
    XercesDOMParser parser;
    parser.setValidationScheme(XercesDOMParser::Val_Never);
    parser.setDoNamespaces(true);
    parser.setLoadExternalDTD(false);
    ChartPrinter printer;
    const auto parse = [&](const std::string& text) {
        MemBufInputSource source(reinterpret_cast<const XMLByte*>(text.data()), text.size(), "bench");
        parser.parse(source);
        return parser.getDocument();
    };
    for (auto _ : state) {
        if (parse(presentation()) == nullptr || parse(chart()) == nullptr) {
            state.SkipWithError("the texts do not parse");
            return;
        }
        std::ostringstream out;
        printer.Print(parser.getDocument(), out);
        benchmark::DoNotOptimize(out.str().data());
    }
}

void restyle(benchmark::State& state) {
    const unsigned threads = static_cast<unsigned>(state.range(0));
    for (auto _ : state) {
        std::atomic<std::size_t> next{0};
        std::atomic<bool> failed{false};
        const auto work = [&] {
            for (std::size_t i; (i = next++) < samples().size();)
                if (!mainJobOnce(samples()[i]))
                    failed = true;
        };
        std::vector<std::thread> others;
        for (unsigned t = 1; t < threads; ++t)
            others.emplace_back(work);
        work();
        for (std::thread& t : others)
            t.join();
        if (failed) {
            state.SkipWithError("a chart failed");
            return;
        }
    }
    state.SetItemsProcessed(static_cast<std::int64_t>(state.iterations() * samples().size()));
}

BENCHMARK(mainJob)->Unit(benchmark::kMillisecond)->Repetitions(3);
BENCHMARK(mainJobFloor)->Unit(benchmark::kMillisecond)->Repetitions(3);
// Process CPU time beside the wall-clock time shows what the threads cost each other, also on a busy machine.
BENCHMARK(restyle)
    ->Arg(1)
    ->Arg(2)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->MeasureProcessCPUTime()
    ->Repetitions(3);

} // namespace

int main(int argc, char** argv) {
    ::unsetenv("DumpChartXMLPath"); // measure the reading, not the error log's disk writes
    plotaid::detail::XercesRuntime runtime;
    if (!bench::initialize(argc, argv))
        return 1;
    if (chart().empty() || presentation().empty() || samples().size() != kCharts) {
        std::fprintf(stderr, "cannot read the sample charts or the presentation template\n");
        return 1;
    }
    bench::BestTimes reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();
    const bool main = bench::within(reporter, "mainJob", "mainJobFloor", kMainJobLimit);
    bench::within(reporter, "restyle/2", "restyle/1", 0); // CPU time of all threads
    const bool threads = bench::within(reporter, "restyle/2", "restyle/1", kTwoThreadLimit, 0, true);
    return main && threads ? 0 : 1;
}
