// Hostile XML against the validating parser: "billion laughs" and one entity referenced over and
// over must be refused within a second, beside the floor of a valid document parsed by the same
// parser in the same run. The program fails when a refusal takes longer than the limit.
#include "foundation/ValidatingParser.h"

#include <benchmark/benchmark.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <string>

namespace {

constexpr double kRefusalLimitSeconds = 1.0;

const char* const kSchema = R"(<?xml version="1.0"?>
<xs:schema xmlns:xs="http://www.w3.org/2001/XMLSchema" targetNamespace="http://plotaid.org/bench"
           elementFormDefault="qualified">
  <xs:element name="chart"><xs:complexType><xs:sequence>
    <xs:element name="label" type="xs:string" minOccurs="0" maxOccurs="unbounded"/>
  </xs:sequence></xs:complexType></xs:element>
</xs:schema>
)";

std::string chart(const std::string& doctype, const std::string& body) {
    return "<?xml version=\"1.0\"?>" + doctype +
           "<chart xmlns=\"http://plotaid.org/bench\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/bench http://plotaid.org/bench/bench.xsd\">" +
           body + "</chart>";
}

const std::string& billionLaughs() {
    static const std::string text = [] {
        std::string doctype = "<!DOCTYPE chart [<!ENTITY l0 \"ha\">";
        for (int level = 1; level <= 10; ++level) {
            doctype += "<!ENTITY l" + std::to_string(level) + " \"";
            for (int i = 0; i < 10; ++i)
                doctype += "&l" + std::to_string(level - 1) + ";";
            doctype += "\">";
        }
        return chart(doctype + "]>", "<label>&l10;</label>");
    }();
    return text;
}

// The largest entity allowed, referenced until the expansion limit stops it.
const std::string& manyReferences() {
    static const std::string text = [] {
        std::string refs;
        for (std::size_t i = 0; i <= plotaid::detail::ValidatingParser::kEntityExpansionLimit; ++i)
            refs += "&big;";
        const std::string big(plotaid::detail::ValidatingParser::kEntityValueLimit, 'x');
        return chart("<!DOCTYPE chart [<!ENTITY big \"" + big + "\">]>", "<label>" + refs + "</label>");
    }();
    return text;
}

// A valid document of about the same size as the billion-laughs text.
const std::string& validChart() {
    static const std::string text = [] {
        std::string body;
        while (body.size() < billionLaughs().size())
            body += "<label>haha</label>";
        return chart("", body);
    }();
    return text;
}

void parse(benchmark::State& state, const std::string& text, bool expectDocument) {
    plotaid::detail::ValidatingParser parser;
    const ChartException failure("refused", "bench", 1);
    for (auto _ : state) {
        const bool parsed = parser.parse(text, "ChartBase", failure) != nullptr;
        if (parsed != expectDocument)
            state.SkipWithError(expectDocument ? "valid document refused" : "hostile document accepted");
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * text.size()));
}

void validFloor(benchmark::State& state) {
    parse(state, validChart(), true);
}
void billionLaughsRefused(benchmark::State& state) {
    parse(state, billionLaughs(), false);
}
void manyReferencesRefused(benchmark::State& state) {
    parse(state, manyReferences(), false);
}

BENCHMARK(validFloor)->Unit(benchmark::kMicrosecond)->Repetitions(3);
BENCHMARK(billionLaughsRefused)->Unit(benchmark::kMicrosecond)->Repetitions(3);
BENCHMARK(manyReferencesRefused)->Unit(benchmark::kMicrosecond)->Repetitions(3);

class WorstTimes : public benchmark::ConsoleReporter {
public:
    void ReportRuns(const std::vector<Run>& runs) override {
        for (const Run& run : runs) {
            if (run.run_type != Run::RT_Iteration || run.iterations == 0)
                continue;
            const double perIteration = run.real_accumulated_time / static_cast<double>(run.iterations);
            auto [it, inserted] = worst.emplace(run.run_name.function_name, perIteration);
            if (!inserted)
                it->second = std::max(it->second, perIteration);
            if (run.error_occurred)
                failed = true;
        }
        ConsoleReporter::ReportRuns(runs);
    }
    std::map<std::string, double> worst;
    bool failed = false;
};

} // namespace

int main(int argc, char** argv) {
    // The parser reads its schema from a resource folder of the program's own.
    const std::filesystem::path folder = std::filesystem::temp_directory_path() / "plotaid-bench-hostile-xml";
    std::filesystem::create_directories(folder / "schemas");
    std::ofstream(folder / "schemas" / "bench.xsd") << kSchema;
    ::setenv("PLOTAID_RESOURCE_DIR", folder.c_str(), 1);
    ::unsetenv("DumpChartXMLPath");

    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv))
        return 1;
    WorstTimes reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();
    std::error_code ignored;
    std::filesystem::remove_all(folder, ignored);

    bool within = !reporter.failed;
    for (const char* name : {"billionLaughsRefused", "manyReferencesRefused"}) {
        const auto it = reporter.worst.find(name);
        if (it == reporter.worst.end())
            continue;
        const auto floor = reporter.worst.find("validFloor");
        std::printf("%-24s worst %8.3f ms (limit %.0f ms)%s", name, it->second * 1e3,
                    kRefusalLimitSeconds * 1e3, it->second > kRefusalLimitSeconds ? "  TOO SLOW" : "");
        if (floor != reporter.worst.end())
            std::printf("  valid parse of %zu bytes: %.3f ms", validChart().size(), floor->second * 1e3);
        std::printf("\n");
        within = within && it->second <= kRefusalLimitSeconds;
    }
    return within ? 0 : 1;
}
