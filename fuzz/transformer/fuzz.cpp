// Bytes as the compressed chart, as the compressed data document and as the data stream of a
// transformer: whatever they hold (not zlib, truncated, inflating to anything), building the
// transformer and reading the chart back never crashes.
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartTransformer.h>

#include <zpack/zpack.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>

namespace {

std::string sampleChart; // compressed, its source a reference
std::string sampleData;  // compressed data document

// Reads back everything a host would.
void exercise(ChartTransformer& t) {
    t.getXML();
    t.getEntireXML(u"UTF-8");
    t.getCompressedXML();
    unsigned length = 0;
    std::unique_ptr<unsigned char[]> stream(t.getCompressedDataStream(length));
    t.getCompressedData();
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    // Xerces-C stays up between inputs, as a host keeps it, so the grammars are read once.
    static const plotaid::detail::XercesRuntime held;
    ::unsetenv("DumpChartXMLPath"); // no error log or dumps: the fuzzer would fill the disk
    // Inputs may inflate enormously; the cap keeps the fuzzer's memory small.
    zpack::setDecompressionLimit(std::size_t(16) << 20);
    std::ifstream in(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/area.xml", std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    ChartTransformer t(text.str());
    sampleChart = t.getCompressedXML();
    sampleData = t.getCompressedData();
    if (t.getVisualization() == nullptr || sampleData.empty())
        std::abort();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string bytes(reinterpret_cast<const char*>(data), size);
    {
        ChartTransformer asChart(bytes, sampleData);
        exercise(asChart);
    }
    {
        ChartTransformer asData(sampleChart, bytes);
        exercise(asData);
    }
    {
        ChartTransformer asStream(sampleChart, data, static_cast<unsigned>(size));
        exercise(asStream);
    }
    return 0;
}
