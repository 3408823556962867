// bench_tree: the PMML of a 4,095-node decision tree handed out as a document, beside its floor:
// inflating the stored text, one validated parse and one serialisation, the least any reader and
// writer of the same document must do.
#include "BenchSupport.h"

#include "foundation/ValidatingParser.h"

#include <plotaid/TreeTransformer.h>

#include <grx/ChartPrinter.h>
#include <zpack/zpack.h>

#include <sstream>
#include <string>

namespace {

// The operation is the floor plus a deep copy of the whole model into the output document, which
// costs about as much again as building it did.
constexpr double kAllowedRatio = 2.0;

void node(std::string& out, int id, int depth, const char* predicate) {
    out += "<Node id=\"" + std::to_string(id) + "\" score=\"" + (id % 2 ? "yes" : "no") +
           "\" recordCount=\"" + std::to_string(10000 >> (12 - depth)) + "\">" + predicate +
           "<ScoreDistribution value=\"no\" recordCount=\"" + std::to_string(id * 3 + 1) +
           "\"/><ScoreDistribution value=\"yes\" recordCount=\"" + std::to_string(id * 2 + 1) + "\"/>";
    if (depth > 0) {
        const std::string cut = std::to_string(id % 97 + 0.5);
        node(out, 2 * id + 1, depth - 1,
             ("<SimplePredicate field=\"x" + std::to_string(depth) + "\" operator=\"lessOrEqual\" value=\"" +
              cut + "\"/>")
                 .c_str());
        node(out, 2 * id + 2, depth - 1,
             ("<SimplePredicate field=\"x" + std::to_string(depth) + "\" operator=\"greaterThan\" value=\"" +
              cut + "\"/>")
                 .c_str());
    }
    out += "</Node>";
}

const std::string& pmml() {
    static const std::string text = [] {
        std::string t =
            "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<PMML version=\"2.1\" "
            "xmlns=\"http://www.dmg.org/PMML-2_1\" xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
            "xsi:schemaLocation=\"http://www.dmg.org/PMML-2_1 http://www.dmg.org/PMML-2_1/pmml-2-1.xsd\">"
            "<Header/><DataDictionary><DataField name=\"y\" optype=\"categorical\"/>";
        for (int i = 1; i <= 11; ++i)
            t += "<DataField name=\"x" + std::to_string(i) + "\" optype=\"continuous\"/>";
        t += "</DataDictionary><TreeModel functionName=\"classification\"><MiningSchema>"
             "<MiningField name=\"y\" usageType=\"predicted\"/>";
        for (int i = 1; i <= 11; ++i)
            t += "<MiningField name=\"x" + std::to_string(i) + "\"/>";
        t += "</MiningSchema>";
        node(t, 0, 11, "<True/>");
        return t + "</TreeModel></PMML>\n";
    }();
    return text;
}

const std::string& packed() {
    static const std::string bytes = [] {
        std::string out;
        zpack::compressString(pmml(), out);
        return out;
    }();
    return bytes;
}

void floorInflateParsePrint(benchmark::State& state) {
    plotaid::detail::ValidatingParser parser;
    ChartPrinter printer;
    printer.setPrintWhiteSpace(true);
    for (auto _ : state) {
        std::string text;
        zpack::decompressString(text, packed(), static_cast<unsigned long>(pmml().size()));
        auto* document =
            parser.parse(text, "bench", ChartException("bench", "bench", 1), plotaid::detail::DocumentKind::Pmml);
        if (document == nullptr) {
            state.SkipWithError("the generated tree does not validate");
            return;
        }
        std::ostringstream out;
        printer.Print(document, out);
        benchmark::DoNotOptimize(out.str().size());
    }
}

void uncompressedPMML(benchmark::State& state) {
    TreeTransformer tree(pmml(), "");
    for (auto _ : state) {
        const std::string text = tree.getUncompressedPMML(nullptr);
        if (text.size() < pmml().size() / 2) {
            state.SkipWithError("no PMML document");
            return;
        }
        benchmark::DoNotOptimize(text.size());
    }
}

void displayData(benchmark::State& state) {
    TreeTransformer tree(pmml(), "");
    for (int i = 0; i < 200; ++i)
        tree.addPredictorPrecision("x" + std::to_string(i), i % 5);
    for (auto _ : state)
        benchmark::DoNotOptimize(tree.getDisplayData(nullptr).size());
}

BENCHMARK(floorInflateParsePrint)->Unit(benchmark::kMillisecond)->Repetitions(5);
BENCHMARK(uncompressedPMML)->Unit(benchmark::kMillisecond)->Repetitions(5);
BENCHMARK(displayData)->Unit(benchmark::kMicrosecond)->Repetitions(3);

} // namespace

int main(int argc, char** argv) {
    if (!bench::initialize(argc, argv))
        return 1;
    std::printf("PMML: %zu bytes, compressed: %zu bytes\n", pmml().size(), packed().size());
    bench::BestTimes times;
    benchmark::RunSpecifiedBenchmarks(&times);
    benchmark::Shutdown();
    const double mb = static_cast<double>(pmml().size()) / 1e6;
    return bench::within(times, "uncompressedPMML", "floorInflateParsePrint", kAllowedRatio, mb) ? 0 : 1;
}
