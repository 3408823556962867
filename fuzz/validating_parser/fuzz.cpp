// Bytes as chart XML for the validating parser, with the library's own grammars: every input must
// give either a document with a root element and no reported error, or null with a reason, never
// a crash, a hang or unbounded memory; only files of the resource folder may be read.
#include "foundation/ValidatingParser.h"

#include <xercesc/dom/DOMDocument.hpp>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string_view>

namespace {
// One parser for the whole run, as a builder keeps its own: reuse after failures is part of the test.
plotaid::detail::ValidatingParser* parser = nullptr;
} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    // No error log or dumps: the fuzzer would fill the disk.
    ::unsetenv("DumpChartXMLPath");
    parser = new plotaid::detail::ValidatingParser();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    const ChartException failure("fuzz input refused", "fuzz", 1);
    XERCES_CPP_NAMESPACE::DOMDocument* document = parser->parse(text, "ChartBase", failure);
    if ((document == nullptr) == parser->lastErrors().empty())
        __builtin_trap();
    if (document != nullptr) {
        if (document->getDocumentElement() == nullptr)
            __builtin_trap();
        // Every other accepted document is taken over and released by its new owner.
        if (size % 2 == 0) {
            plotaid::detail::OwnedDocument owned = parser->adoptDocument();
            if (owned.get() != document)
                __builtin_trap();
        }
    }
    return 0;
}
