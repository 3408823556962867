// Bytes as display settings (first half) and as a display template (second half) for a tree: every
// input must give either settings that print and read back valid, or none, never a crash, a hang
// or unbounded memory; the option operations must be harmless either way.
#include "foundation/ValidatingParser.h"

#include <plotaid/TreeTransformer.h>

#include <xercesc/dom/DOMDocument.hpp>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

namespace {
plotaid::detail::ValidatingParser* reader = nullptr;
} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    // No error log or dumps: the fuzzer would fill the disk.
    ::unsetenv("DumpChartXMLPath");
    reader = new plotaid::detail::ValidatingParser();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string bytes(reinterpret_cast<const char*>(data), size);
    const std::size_t half = size / 2;
    TreeTransformer tree("<PMML/>", bytes.substr(0, half));
    tree.applyTemplate(bytes.substr(half));
    tree.SetZoomFactor(static_cast<int>(size % 600));
    tree.SetOrientation(static_cast<TreeTransformer::TreeOrientation>(size % 4));
    tree.applyColors(TreeTransformer::CHART_COLORS, {"#FF000000", "#FFFFFFFF"});
    tree.addPredictorPrecision("x", 2);
    tree.addTargetDateFormat("DATE", 8, 0);
    tree.SetOutputLanguage("en", "US");
    const std::string text = tree.getDisplayData(nullptr);
    // What the library prints must be what its own grammar accepts.
    if (!text.empty() &&
        reader->parse(text, "fuzz", ChartException("fuzz output refused", "fuzz", 1)) == nullptr)
        __builtin_trap();
    return 0;
}
