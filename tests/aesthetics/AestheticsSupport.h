#ifndef PLOTAID_TESTS_AESTHETICS_AESTHETICSSUPPORT_H
#define PLOTAID_TESTS_AESTHETICS_AESTHETICSSUPPORT_H

// Charts and instructions for the aesthetic actions: one instruction applied straight to a chart,
// a whole template through the walk, and what "the same chart" means once cycles are renewed.

#include "support/EngineSupport.h"

#include "templates/InstructionWalk.h"

#include <grx/GrxModel.h>

#include <xercesc/util/XercesDefs.hpp>

#include <map>
#include <memory>
#include <string>
#include <vector>

XERCES_CPP_NAMESPACE_BEGIN
class DOMElement;
XERCES_CPP_NAMESPACE_END

namespace aesthetics_test {

using engine_test::Chart;

// A template of the current form around `body`.
std::string templateOf(const std::string& body);

// The first instruction of a template, parsed and validated; the document lives with this object.
class Instruction {
public:
    explicit Instruction(const std::string& instructionXml);
    ~Instruction();
    Instruction(const Instruction&) = delete;
    Instruction& operator=(const Instruction&) = delete;
    const XERCES_CPP_NAMESPACE::DOMElement* element() const { return element_; }

private:
    struct Holder;
    std::unique_ptr<Holder> holder_;
    const XERCES_CPP_NAMESPACE::DOMElement* element_ = nullptr;
};

// Makes the action T over the chart and applies it once.
template <class T>
bool applyAction(const std::string& instructionXml, GrxVisualization& target,
                 const GrxVisualization* source = nullptr) {
    Instruction instruction(instructionXml);
    EXPECT_NE(instruction.element(), nullptr) << instructionXml;
    T action(source, target, instruction.element());
    return action.apply();
}

// Applies a template through ChartTemplate and the walk; the outcome of every instruction.
std::vector<plotaid::detail::InstructionOutcome>
applyTemplate(GrxVisualization& target, const std::string& body, GrxVisualization* source = nullptr);

// A chart text built around a graph body: variables, domains and a style cycle to refer to.
std::string chartWith(const std::string& graphBody, const std::string& extra = std::string());

// The chart with every style cycle folded into the aesthetics that use it: each `cycle`
// reference is replaced by the styles of that cycle (ids left out), and the style cycles
// themselves are dropped. Two charts that differ only in the ids of their style cycles, and in
// cycles nothing refers to any more, read the same.
std::string canonical(const GrxVisualization& chart);

// Style cycles that no `cycle` attribute of the chart refers to.
std::size_t orphanedStyleCycles(const GrxVisualization& chart);

// The element of that id, wrapped as T; null when absent or of another kind.
template <class T> T* byId(const GrxVisualization& chart, const std::string& id) {
    return GrxBaseElement::wrapperOf<T>(chart.getElementById(ChartString(id)));
}

// The id of the style cycle that the aesthetic of that id uses, and that cycle's styles; empty
// when there is no such aesthetic or it has no cycle.
std::string cycleIdOf(const GrxVisualization& chart, const std::string& aestheticId);
std::vector<std::map<std::string, std::string>> cycleStylesOf(const GrxVisualization& chart,
                                                              const std::string& aestheticId);

std::string text(const XMLCh* value);
std::string attribute(const GrxBaseElement& element, const std::string& name);

// The styles of the (first) cycle of a style cycle, each as its attribute text (id left out).
std::vector<std::map<std::string, std::string>> cycleStyles(const GrxStyleCycle& styleCycle);

// The chart written out and read back with the validating parser; empty when that succeeds.
std::string xercesProblems(const GrxVisualization& chart);
// The chart written out and checked by xmllint against the chart grammar; empty when it passes
// or when xmllint is not installed (then `skipped` is set).
std::string xmllintProblems(const GrxVisualization& chart, bool* skipped = nullptr);

} // namespace aesthetics_test

#endif
