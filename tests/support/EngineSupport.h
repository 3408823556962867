#ifndef PLOTAID_TESTS_SUPPORT_ENGINESUPPORT_H
#define PLOTAID_TESTS_SUPPORT_ENGINESUPPORT_H

#include "support/TestSupport.h"

#include "foundation/RecordSink.h"
#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartBase.h>

#include <grx/GrxModel.h>

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

namespace engine_test {

inline std::string example(const std::string& relative) {
    return readAll(std::string(PLOTAID_EXAMPLES_DIR) + "/" + relative);
}

// Keeps Xerces-C up for the objects a test makes.
class EngineTest : public ::testing::Test {
protected:
    plotaid::detail::XercesRuntime runtime_;
};

// A chart document the test owns, wrapped: empty, or parsed from chart text.
struct Chart {
    std::unique_ptr<GrxVisualization> vis;

    static Chart empty() {
        Chart c;
        c.vis = std::make_unique<GrxVisualization>(
            ChartBase::createGrxDocument(ChartBase::_utf8)->getDocumentElement(), true);
        return c;
    }
    static Chart parse(const std::string& text) {
        plotaid::detail::ValidatingParser parser;
        Chart c;
        if (parser.parse(text, "test", ChartException("test chart", "engine_test", 0)) == nullptr)
            return c;
        plotaid::detail::OwnedDocument doc = parser.adoptDocument();
        c.vis = std::make_unique<GrxVisualization>(doc.release()->getDocumentElement(), true);
        return c;
    }
    const GrxBaseElement& base() const { return *vis; }
    XERCES_CPP_NAMESPACE::DOMDocument* document() const {
        return base().getImplementation()->getOwnerDocument();
    }
};

// Messages of the error records reported while it lives.
struct Records {
    plotaid::detail::RecordCollector collector;
    std::vector<std::string> errors() const {
        std::vector<std::string> out;
        for (const auto& r : collector.records())
            if (r.isError())
                out.push_back(r.message);
        return out;
    }
};

} // namespace engine_test

#endif
