// Bytes as a template applied to sample charts: whatever the text (malformed, invalid, of the
// earlier form, full of entities), loading and walking it never crashes, and the chart stays a
// chart the library can print.
#include "foundation/ValidatingParser.h"
#include "templates/InstructionWalk.h"

#include <plotaid/ChartTemplate.h>

#include <grx/grx.h>

#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMElement.hpp>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>

namespace {

plotaid::detail::ValidatingParser* parser = nullptr;
// Sample charts parsed once (bars, and a lone line for the marker and dash instructions); each
// input works on copies.
XERCES_CPP_NAMESPACE::DOMDocument* charts[2] = {nullptr, nullptr};

XERCES_CPP_NAMESPACE::DOMDocument* load(const char* name) {
    std::ifstream in(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/" + name, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    if (!parser->parse(text.str(), "ChartBase", ChartException("sample chart refused", "fuzz", 1)))
        std::abort();
    return parser->adoptDocument().release();
}

void applyTo(const XERCES_CPP_NAMESPACE::DOMDocument* chart, const std::string& text) {
    auto* copy = static_cast<XERCES_CPP_NAMESPACE::DOMDocument*>(chart->cloneNode(true));
    GrxVisualization vis(copy->getDocumentElement(), true);

    plotaid::detail::WalkReport report;
    ChartTemplate chartTemplate(vis, nullptr);
    try {
        if (chartTemplate.setTemplate(text))
            chartTemplate.applyTemplate();
    } catch (const ChartException&) {
        // A fatal failure of the engine is reported and thrown to its caller by design.
    }
    if (vis.AsUTF8().empty())
        std::abort();
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    ::unsetenv("DumpChartXMLPath"); // no error log or dumps: the fuzzer would fill the disk
    parser = new plotaid::detail::ValidatingParser();
    charts[0] = load("simple-bar.xml");
    charts[1] = load("line-series.xml");
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(reinterpret_cast<const char*>(data), size);
    for (const auto* chart : charts)
        applyTo(chart, text);
    return 0;
}
