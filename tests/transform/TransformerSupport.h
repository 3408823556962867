#ifndef PLOTAID_TESTS_TRANSFORMER_SUPPORT_H
#define PLOTAID_TESTS_TRANSFORMER_SUPPORT_H

#include "support/EngineSupport.h"
#include "support/GrammarSupport.h"

#include <plotaid/ChartTransformer.h>

#include <zpack/zpack.h>

#include <string>
#include <vector>

namespace transformer_test {

using engine_test::example;
using TransformerTest = engine_test::EngineTest;

inline std::string deflate(const std::string& text) {
    std::string out;
    EXPECT_TRUE(zpack::compressString(text, out));
    return out;
}

inline std::string inflate(const std::string& compressed) {
    std::string out;
    EXPECT_TRUE(zpack::decompressString(out, compressed));
    return out;
}

inline std::size_t count(const std::string& text, const std::string& part) {
    std::size_t n = 0;
    for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1))
        ++n;
    return n;
}

// The area chart with its source "rain" renamed to an id that is no XML name.
inline std::string areaWithSpacedSource() {
    std::string chart = example("charts/area.xml");
    for (std::size_t at; (at = chart.find("\"rain\"")) != std::string::npos;)
        chart.replace(at, 6, "\"my data\"");
    return chart;
}

// A parsed document the test owns (data documents too: the wrapper only needs a root).
struct Parsed : engine_test::Chart {
    explicit Parsed(const std::string& text) : Chart(parse(text)) {}
    bool ok() const { return vis != nullptr; }
    XERCES_CPP_NAMESPACE::DOMElement* root() const { return vis->getImplementation(); }
    // ids of the root's children of that local name, in order.
    std::vector<std::string> idsOf(const char16_t* localName) const {
        std::vector<std::string> ids;
        for (auto* e = root()->getFirstElementChild(); e != nullptr; e = e->getNextElementSibling())
            if (ChartString(e->getLocalName()) == ChartString(localName))
                ids.push_back(ChartString(e->getAttribute(u"id")).toUTF8());
        return ids;
    }
};

} // namespace transformer_test

#endif
