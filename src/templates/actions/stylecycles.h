#ifndef PLOTAID_TEMPLATES_ACTIONS_STYLECYCLES_H
#define PLOTAID_TEMPLATES_ACTIONS_STYLECYCLES_H

// Style cycle actions: the cycles of style-by aesthetics rebuilt from the instruction or from the
// chart's repository of colour, pattern, dash and symbol cycles, and new style-bys with cycles of
// their own.
#include "templates/actions/Actions.h"

namespace plotaid::detail {

class TStyleCycle final : public BaseTemplate {
public:
    TStyleCycle(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

    enum class Create { None, ColorsOnly, PatternsOnly, ColorsThenPatterns };
    // What a cycle holds, judged by its styles.
    enum class CycleKind { None = 0, Color = 1, Pattern = 2, Dash = 3, Symbol = 4 };
    static CycleKind kindOf(const GrxCycle& cycle);

private:
    void updateRepository();
    void restyleElements(const GrrUviza& graph);
    void restyleLabelings(const GrrUviza& graph);
    void restyle(CTElementType& element, GrxStyleBy& styleBy, std::size_t styleBys);
    const GrxCycle* repositoryCycleFor(CTElementType& element, const GrxStyleCycle& cycle,
                                       const GrxStyleBy& styleBy, std::size_t styleBys, GrxStyle& style) const;
    GrxStyleCycle& cycleOf(CTAesthetic& aesthetic);
    void fillFromInstruction(GrxStyleCycle& cycle);

    bool repository_ = false;
    std::uint32_t styleByNumber_ = 0;
    Create create_ = Create::None;
    const ElementKind kind_{instruction_};
    std::vector<const DOMElement*> cycles_;
    const GrxCycle* repositoryCycles_[5] = {}; // by CycleKind
};

class TAddStyleCycle final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const std::uint32_t count_ = unsignedAttribute(instruction_, u"count");
    const ChartString elementName_ = attributeOf(instruction_, GrxUni::_elementName);
    const DOMElement* const cycle_ = lastChildNamed(instruction_, GrxUni::_cycle);
};

} // namespace plotaid::detail

#endif
