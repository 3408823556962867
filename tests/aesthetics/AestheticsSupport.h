#ifndef PLOTAID_TESTS_AESTHETICS_AESTHETICSSUPPORT_H
#define PLOTAID_TESTS_AESTHETICS_AESTHETICSSUPPORT_H

// Charts and instructions for the aesthetic actions: one instruction applied straight to a chart,
// a whole template through the walk, and what "the same chart" means once cycles are renewed.

#include "support/EngineSupport.h"
#include "support/GrammarSupport.h"

#include "foundation/ValidatingParser.h"
#include "templates/InstructionWalk.h"

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
    const XERCES_CPP_NAMESPACE::DOMDocument* document =
        parser.parse(templateOf(instructionXml), "instruction", ChartException("test template", "test", 0));
    EXPECT_NE(document, nullptr) << instructionXml;
    if (document == nullptr)
        return false;
    T action(source, target, document->getDocumentElement()->getFirstElementChild());
    return action.apply();
}

// Applies a template through ChartTemplate and the walk; the outcome of every instruction.
std::vector<plotaid::detail::InstructionOutcome>
applyTemplate(GrxVisualization& target, const std::string& body, GrxVisualization* source = nullptr);

// A chart text built around a graph body: variables, domains and a style cycle "chartCycle" of
// red and blue to refer to.
std::string chartWith(const std::string& graphBody, const std::string& extra = std::string());

// The chart with every style cycle folded into the aesthetics that use it: each `cycle`
// reference is replaced by the styles of that cycle (ids left out), and the style cycles
// themselves are dropped. Two charts that differ only in the ids of their style cycles, and in
// cycles nothing refers to any more, read the same.
std::string canonical(const GrxVisualization& chart);

// Style cycles that no attribute of the chart refers to.
std::size_t orphanedStyleCycles(const GrxVisualization& chart);

// The element of that id, wrapped as T; null when absent or of another kind.
template <class T> T* byId(const GrxVisualization& chart, const std::string& id) {
    return GrxBaseElement::wrapperOf<T>(chart.getElementById(ChartString(id)));
}

// The id of the style cycle that the aesthetic of that id uses; empty when there is none.
std::string cycleIdOf(const GrxVisualization& chart, const std::string& aestheticId);
// That cycle's styles as "[({name=value;...}...)...]", ids left out; empty when there is none.
std::string stylesOf(const GrxVisualization& chart, const std::string& aestheticId);

std::string text(const XMLCh* value);
std::string attribute(const GrxBaseElement& element, const std::string& name);

} // namespace aesthetics_test

#endif
