// The chart object model beside its floor, the validated parse of the same document, in one run.
// A sample chart scaled to at least 10,000 elements is wrapped (every wrapper made and registered,
// then freed) and parsed with schema validation; wrapping must cost at most half the parse.
// getElementById must stay a hash look-up: from 1,000 to 100,000 ids its cost per look-up may grow
// no more than twice as much as that of a std::unordered_map over the same ids in the same run (the
// floor: random look-ups into 100,000 entries already miss the caches; a scan would grow 100-fold).
#include <grx/grx.h>

#include "BenchSupport.h"
#include "ScaledChart.h"

#include <benchmark/benchmark.h>

#include <xercesc/dom/DOMAttr.hpp>
#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMElement.hpp>
#include <xercesc/dom/DOMImplementation.hpp>
#include <xercesc/dom/DOMImplementationRegistry.hpp>
#include <xercesc/dom/DOMNamedNodeMap.hpp>
#include <xercesc/dom/DOMNodeList.hpp>
#include <xercesc/framework/LocalFileInputSource.hpp>
#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/parsers/XercesDOMParser.hpp>
#include <xercesc/sax/EntityResolver.hpp>
#include <xercesc/sax/HandlerBase.hpp>
#include <xercesc/util/PlatformUtils.hpp>

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <memory>
#include <random>
#include <sstream>
#include <string>
#include <unordered_map>
#include <vector>

using namespace xercesc;

namespace {

constexpr std::size_t kElements = 10000;
constexpr double kWrapLimit = 0.5;
constexpr double kLookupLimit = 2.0;
const std::string kSample = std::string(PLOTAID_EXAMPLES_DIR) + "/charts/scatterplot-matrix.xml";
const std::string kSchemas = std::string(PLOTAID_EXAMPLES_DIR) + "/../resources/schemas/";

// Schemas by file name from the source tree; nothing from the network.
class Resolver : public EntityResolver {
public:
    InputSource* resolveEntity(const XMLCh* const, const XMLCh* const systemId) override {
        const std::string id = ChartString(systemId).toUTF8();
        const std::string path = kSchemas + id.substr(id.rfind('/') + 1);
        return new LocalFileInputSource(ChartString(path).xc_str());
    }
};

class Parser {
public:
    Parser() {
        parser_.setValidationScheme(XercesDOMParser::Val_Always);
        parser_.setDoNamespaces(true);
        parser_.setDoSchema(true);
        parser_.setErrorHandler(&errors_);
        parser_.setEntityResolver(&resolver_);
        // The schema is read once; later parses measure the document alone.
        parser_.cacheGrammarFromParse(true);
        parser_.useCachedGrammarInParse(true);
    }
    DOMDocument* parse(const std::string& text) {
        MemBufInputSource input(reinterpret_cast<const XMLByte*>(text.data()), text.size(), "bench");
        parser_.parse(input);
        return parser_.getErrorCount() == 0 ? parser_.getDocument() : nullptr;
    }
    DOMDocument* adopt() { return parser_.adoptDocument(); }

private:
    XercesDOMParser parser_;
    HandlerBase errors_; // throws on errors, which ends the benchmark loudly
    Resolver resolver_;
};

std::size_t countElements(const DOMDocument* doc) {
    return doc->getElementsByTagName(u"*")->getLength();
}

const std::string& scaledChart() {
    static const std::string text = bench::scaleChart(kSample, kElements);
    return text;
}

void validatedParse(benchmark::State& state) {
    Parser parser;
    const std::string& text = scaledChart();
    for (auto _ : state)
        if (!parser.parse(text))
            state.SkipWithError("the scaled chart does not validate");
}

void wrap(benchmark::State& state) {
    Parser parser;
    DOMDocument* doc = parser.parse(scaledChart());
    if (!doc) {
        state.SkipWithError("the scaled chart does not validate");
        return;
    }
    for (auto _ : state) {
        GrxVisualization vis(doc->getDocumentElement());
        benchmark::DoNotOptimize(vis.wrapperCount());
    }
    state.counters["elements"] = static_cast<double>(countElements(doc));
}

// A chart of `count` styles with ids, wrapped, so every id is a DOM ID.
struct IdChart {
    explicit IdChart(unsigned count) {
        DOMImplementation* impl = DOMImplementationRegistry::getDOMImplementation(u"LS");
        DOMDocument* doc = impl->createDocument(u"http://plotaid.org/grxml", GrxUni::_visualization, nullptr);
        vis = std::make_unique<GrxVisualization>(doc->getDocumentElement(), true);
        for (unsigned i = 0; i < count; ++i) {
            ids.push_back(ChartString("style").appendInteger(i));
            vis->addStyle().setId(ids.back());
        }
        std::shuffle(ids.begin(), ids.end(), std::mt19937(2026));
    }
    std::unique_ptr<GrxVisualization> vis;
    std::vector<ChartString> ids;
};

void getElementById(benchmark::State& state) {
    IdChart chart(static_cast<unsigned>(state.range(0)));
    std::size_t i = 0;
    for (auto _ : state) {
        const ChartString& id = chart.ids[i++ % chart.ids.size()];
        if (!chart.vis->getElementById(id))
            state.SkipWithError("an id was not found");
    }
}

// The floor of the look-up: the same ids, in the same order, in a plain hash map.
void hashMapLookup(benchmark::State& state) {
    IdChart chart(static_cast<unsigned>(state.range(0)));
    std::unordered_map<std::u16string, const DOMElement*> map;
    for (const ChartString& id : chart.ids)
        map.emplace(id.str(), chart.vis->getElementById(id));
    std::size_t i = 0;
    for (auto _ : state) {
        const ChartString& id = chart.ids[i++ % chart.ids.size()];
        const auto it = map.find(id.str());
        if (it == map.end() || !it->second)
            state.SkipWithError("an id was not found");
    }
}

BENCHMARK(validatedParse)->Unit(benchmark::kMillisecond)->Repetitions(5);
BENCHMARK(wrap)->Unit(benchmark::kMillisecond)->Repetitions(5);
BENCHMARK(getElementById)->Arg(1000)->Arg(100000)->Repetitions(5);
BENCHMARK(hashMapLookup)->Arg(1000)->Arg(100000)->Repetitions(5);

} // namespace

int main(int argc, char** argv) {
    XMLPlatformUtils::Initialize();
    bool ok = true;
    {
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
        const bool wrapping = bench::within(reporter, "wrap", "validatedParse", kWrapLimit);
        bool lookup = true;
        const double dom1k = reporter.best("getElementById/1000"),
                     dom100k = reporter.best("getElementById/100000");
        const double map1k = reporter.best("hashMapLookup/1000"),
                     map100k = reporter.best("hashMapLookup/100000");
        if (dom1k > 0 && dom100k > 0 && map1k > 0 && map100k > 0) {
            const double growth = (dom100k / dom1k) / (map100k / map1k);
            std::printf("getElementById %8.1f ns at 1,000 ids, %8.1f ns at 100,000 (x%.2f); hash map x%.2f; "
                        "relative growth %.2f (limit %.2f)%s\n",
                        dom1k * 1e9, dom100k * 1e9, dom100k / dom1k, map100k / map1k, growth, kLookupLimit,
                        growth > kLookupLimit ? "  TOO SLOW" : "");
            lookup = growth <= kLookupLimit;
        }
        ok = wrapping && lookup;
    }
    XMLPlatformUtils::Terminate();
    return ok ? 0 : 1;
}
