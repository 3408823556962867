#ifndef PLOTAID_TESTS_TRANSFORMER_SUPPORT_H
#define PLOTAID_TESTS_TRANSFORMER_SUPPORT_H

#include "foundation/RecordSink.h"
#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"
#include "support/TestSupport.h"

#include <plotaid/ChartTransformer.h>
#include <plotaid/XmlDataHandler.h>

#include <grx/GrxModel.h>

#include <zpack/zpack.h>

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

namespace transformer_test {

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

// A parsed document the test owns, wrapped as a visualization (also for data documents: the
// wrapper only needs a root).
struct Parsed {
    std::unique_ptr<GrxVisualization> vis;
    std::vector<std::string> errors;

    explicit Parsed(const std::string& text) {
        plotaid::detail::ValidatingParser parser;
        if (parser.parse(text, "test", ChartException("test document", "transformer_test", 0)) == nullptr) {
            errors = parser.lastErrors();
            return;
        }
        plotaid::detail::OwnedDocument doc = parser.adoptDocument();
        vis = std::make_unique<GrxVisualization>(doc.release()->getDocumentElement(), true);
    }
    bool ok() const { return vis != nullptr; }
    XERCES_CPP_NAMESPACE::DOMElement* root() const { return vis->getImplementation(); }
    // Local names of the root's element children, in order.
    std::vector<std::string> childNames() const {
        std::vector<std::string> names;
        for (auto* e = root()->getFirstElementChild(); e != nullptr; e = e->getNextElementSibling())
            names.push_back(ChartString(e->getLocalName()).toUTF8());
        return names;
    }
    std::vector<std::string> idsOf(const char16_t* localName) const {
        std::vector<std::string> ids;
        for (auto* e = root()->getFirstElementChild(); e != nullptr; e = e->getNextElementSibling())
            if (ChartString(e->getLocalName()) == ChartString(localName))
                ids.push_back(ChartString(e->getAttribute(u"id")).toUTF8());
        return ids;
    }
};

// Error and warning messages logged while it lives.
struct Records {
    plotaid::detail::RecordCollector collector;
    std::vector<std::string> messages() const {
        std::vector<std::string> out;
        for (const auto& r : collector.records())
            out.push_back(r.message);
        return out;
    }
    bool mentions(const std::string& part) const {
        for (const auto& m : messages())
            if (m.find(part) != std::string::npos)
                return true;
        return false;
    }
};

// Keeps Xerces-C up for documents a test parses outside a transformer.
class TransformerTest : public ::testing::Test {
protected:
    plotaid::detail::XercesRuntime runtime_;
};

} // namespace transformer_test

#endif
