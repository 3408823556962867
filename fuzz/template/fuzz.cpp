// Bytes as a template applied to a sample chart: whatever the text (malformed, invalid, of the
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
// The sample chart, parsed once; each input works on a copy.
XERCES_CPP_NAMESPACE::DOMDocument* chart = nullptr;

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    ::unsetenv("DumpChartXMLPath"); // no error log or dumps: the fuzzer would fill the disk
    parser = new plotaid::detail::ValidatingParser();
    std::ifstream in(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/simple-bar.xml", std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    if (!parser->parse(text.str(), "ChartBase", ChartException("sample chart refused", "fuzz", 1)))
        std::abort();
    chart = parser->adoptDocument().release();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    auto* copy = static_cast<XERCES_CPP_NAMESPACE::DOMDocument*>(chart->cloneNode(true));
    GrxVisualization vis(copy->getDocumentElement(), true);

    plotaid::detail::WalkReport report;
    ChartTemplate chartTemplate(vis, nullptr);
    try {
        if (chartTemplate.setTemplate(std::string(reinterpret_cast<const char*>(data), size)))
            chartTemplate.applyTemplate();
    } catch (const ChartException&) {
        // A fatal failure of the engine is reported and thrown to its caller by design.
    }
    if (vis.AsUTF8().empty())
        std::abort();
    return 0;
}
