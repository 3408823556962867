#ifndef PLOTAID_TESTS_AESTHETICS_AESTHETICSSUPPORT_H
#define PLOTAID_TESTS_AESTHETICS_AESTHETICSSUPPORT_H

// Charts and instructions for the aesthetic actions: one instruction applied straight to a chart,
// and what "the same chart" means once cycles are renewed.

#include "support/EngineSupport.h"

#include "foundation/ValidatingParser.h"
#include "templates/actions/aesthetics.h"

#include <plotaid/ChartException.h>

#include <grx/GrxModel.h>

#include <xercesc/dom/DOM.hpp>

#include <stdexcept>
#include <string>
#include <vector>

namespace aesthetics_test {

using engine_test::Chart;

// Keeps Xerces up and every chart the test parses; a chart that does not parse fails the test.
class AestheticsTest : public engine_test::EngineTest {
protected:
    GrxVisualization& parse(const std::string& text) {
        charts_.push_back(Chart::parse(text));
        if (!charts_.back().vis)
            throw std::runtime_error("the chart does not parse");
        return *charts_.back().vis;
    }
    GrxVisualization& sample(const std::string& name) {
        return parse(engine_test::example("charts/" + name));
    }

private:
    std::vector<Chart> charts_;
};

// A template of the current form around `body`.
std::string templateOf(const std::string& body);

// Makes the action T of the template's first instruction over the chart and applies it once.
template <class T>
bool applyAction(const std::string& instructionXml, GrxVisualization& target,
                 const GrxVisualization* source = nullptr) {
    plotaid::detail::ValidatingParser parser;
    const auto* document =
        parser.parse(templateOf(instructionXml), "instruction", ChartException("test template", "test", 0));
    EXPECT_NE(document, nullptr) << instructionXml;
    if (document == nullptr)
        return false;
    T action(source, target, document->getDocumentElement()->getFirstElementChild());
    return action.apply();
}

// A chart text around a graph body: variables var_a and var_b, a domain, styles "plainStyle"
// (colour #112233) and "otherStyle", and a style cycle "chartCycle" to refer to.
std::string chartWith(const std::string& graphBody, const std::string& extra = std::string());

// The chart with every `cycle` reference replaced by the styles of that cycle (ids left out) and
// the style cycles themselves dropped: charts that differ only in cycle ids read the same.
std::string canonical(const GrxVisualization& chart);

template <class T> T* byId(const GrxVisualization& chart, const std::string& id) {
    return GrxBaseElement::wrapperOf<T>(chart.getElementById(ChartString(id)));
}

// The id of the style cycle the aesthetic of that id uses, and that cycle's styles as
// "[({name=value;...}...)...]" without ids; empty when there is none.
std::string cycleIdOf(const GrxVisualization& chart, const std::string& aestheticId);
std::string stylesOf(const GrxVisualization& chart, const std::string& aestheticId);

inline std::string text(const XMLCh* value) {
    return ChartString(value).toUTF8();
}
inline std::string attribute(const GrxBaseElement& element, const std::string& name) {
    return text(element.GetAttribute(ChartString(name).xc_str()));
}

} // namespace aesthetics_test

#endif
