// Bytes as a chart document, drawn small: whatever the chart says (hostile counts, NaN data, deep
// nesting, frames that attach to each other in a circle), the renderer answers without crashing,
// hanging or allocating without bound.
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartRenderer.h>
#include <plotaid/ChartTransformer.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    static const plotaid::detail::XercesRuntime held;
    ::unsetenv("DumpChartXMLPath"); // no error log or dumps: the fuzzer would fill the disk
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    // Large inputs only slow the search; small charts reach every branch.
    if (size > 64 * 1024)
        return 0;
    ChartTransformer chart(std::string(reinterpret_cast<const char*>(data), size));
    ChartRenderer renderer;
    renderer.setSize(160, 120);
    std::string png;
    renderer.render(chart, ChartRenderer::PNG, png);
    return 0;
}
