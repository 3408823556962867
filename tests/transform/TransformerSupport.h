#ifndef PLOTAID_TESTS_TRANSFORMER_SUPPORT_H
#define PLOTAID_TESTS_TRANSFORMER_SUPPORT_H

#include "support/EngineSupport.h"
#include "support/TestSupport.h"

#include <plotaid/ChartTransformer.h>

#include <zpack/zpack.h>

#include <string>
#include <vector>

namespace transformer_test {

using TransformerTest = engine_test::EngineTest;

inline std::string example(const std::string& relative) {
    return readAll(std::string(PLOTAID_EXAMPLES_DIR) + "/" + relative);
}

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

// Whether an error or warning logged while it lives contains the text.
struct Records {
    plotaid::detail::RecordCollector collector;
    bool mentions(const std::string& part) const {
        for (const auto& r : collector.records())
            if (r.message.find(part) != std::string::npos)
                return true;
        return false;
    }
};

} // namespace transformer_test

#endif
