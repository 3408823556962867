// Style cycle actions. A style cycle hands its styles out in turn to the categories of a style-by;
// "setStyleCycle" rebuilds such cycles, from the instruction or, when the instruction is the
// repository, from the repository's cycles by the kind of element; "addStyleCycle" adds style-bys.
#include "templates/actions/stylecycles.h"

#include <plotaid/ChartBase.h>

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

constexpr XMLCh kRepository[] = u"styleCycleRepository";
constexpr XMLCh kUnchangeable[] = u"color_pattern"; // a cycle the template never rebuilds
constexpr XMLCh kColorCycle[] = u"styleCycleColor"; // a point cycle that stays filled
constexpr XMLCh kComposedName[] = u"RUVIZA";

bool contains(const XMLCh* text, const XMLCh* part) {
    return ChartString(text).ContainsString(part);
}

// The style an element's cycle colours: a box's hinge, else the element's own.
GrxStyle& targetStyle(BaseTemplate& action, CTElementType& element) {
    if (auto* schema = dynamic_cast<GrxSchema*>(&element))
        return styleOf(action, *schema, &GrxSchema::getHingeStyle, &GrxSchema::setHingeStyle, {});
    return styleOf(action, element, &CTElementType::getStyle, &CTElementType::setStyle, {});
}

void blackOnWhite(GrxStyle& style) {
    style.setColor2(GrxStyle::_black);
    style.setColor(GrxStyle::_white);
}

// Points drawn as outlines: the fill colour moves to the outline where that has none.
void makeHollow(GrxCycle& cycle) {
    for (GrxStyle* style : cycle.getStyles()) {
        const ChartString outline(style->getColor2());
        if (outline.empty() || outline.equals(GrxStyle::_transparent))
            style->setColor2(style->getColor());
        style->setColor(GrxStyle::_transparent);
    }
}

} // namespace

// ---- setStyleCycle -----------------------------------------------------------------------------------

TStyleCycle::TStyleCycle(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction)
    : BaseTemplate(source, target, instruction),
      repository_(attributeOf(instruction, GrxUni::_id).equals(kRepository)),
      styleByNumber_(unsignedAttribute(instruction, u"styleByNumber")),
      cycles_(childrenNamed(instruction, GrxUni::_cycle)) {
    const ChartString create = attributeOf(instruction, u"createType");
    if (create.equals(u"ColorsOnly"))
        create_ = Create::ColorsOnly;
    else if (create.equals(u"PatternsOnly"))
        create_ = Create::PatternsOnly;
    else if (create.equals(u"ColorsThenPatterns"))
        create_ = Create::ColorsThenPatterns;
}

TStyleCycle::CycleKind TStyleCycle::kindOf(const GrxCycle& cycle) {
    const std::vector<GrxStyle*> styles = cycle.getStyles();
    if (styles.empty())
        return CycleKind::None;
    const GrxStyle& first = *styles[0];
    if (first.isPatternPresent())
        return CycleKind::Pattern;
    if (first.isSymbolPresent())
        return CycleKind::Symbol;
    if (first.isStroke_dasharrayPresent() || (styles.size() > 1 && styles[1]->isStroke_dasharrayPresent()))
        return CycleKind::Dash;
    if (first.isColorPresent() || first.isColor2Present())
        return CycleKind::Color;
    return CycleKind::None;
}

bool TStyleCycle::apply() {
    if (instruction_ == nullptr)
        return false;
    if (repository_)
        updateRepository();
    for (GrrUviza* graph : allGraphs(target_)) {
        if (kind_.labelings())
            restyleLabelings(*graph);
        else
            restyleElements(*graph);
    }
    return true;
}

void TStyleCycle::fillFromInstruction(GrxStyleCycle& cycle) {
    cycle.removeCycles();
    for (const DOMElement* element : cycles_)
        fillCycle(*this, cycle.addCycle(), *element);
}

GrxStyleCycle& TStyleCycle::cycleOf(CTAesthetic& aesthetic) {
    // A style-by that hands out the repository itself gets a cycle of its own: rebuilding the
    // repository in its place would lose the cycles every other aesthetic takes from it.
    const GrxExtensionVis* extension = target_.getExtension();
    GrxStyleCycle* existing = aesthetic.getCycle();
    if (existing != nullptr && (extension == nullptr || existing != extension->getStyleCycleRepository()))
        return *existing;
    GrxStyleCycle& made = target_.addStyleCycle(CreateUniqueId(ChartString(GrxUni::_styleCycle)));
    aesthetic.setCycle(made);
    return made;
}

void TStyleCycle::updateRepository() {
    GrxExtensionVis& extension = target_.getExtension() ? *target_.getExtension() : target_.addExtension();
    GrxStyleCycle* repository = extension.getStyleCycleRepository();
    if (repository == nullptr) {
        repository = &target_.addStyleCycle(CreateUniqueId(ChartString(GrxUni::_styleCycle)));
        extension.setStyleCycleRepository(*repository);
    }
    repository->removeExtensions();
    fillFromInstruction(*repository);
    // Of several cycles of one kind, the last counts.
    for (const GrxCycle* cycle : repository->getCycles())
        repositoryCycles_[static_cast<int>(kindOf(*cycle))] = cycle;
    repositoryCycles_[static_cast<int>(CycleKind::None)] = nullptr;
}

void TStyleCycle::restyleElements(const GrrUviza& graph) {
    std::size_t k = 0; // counted over the graph, not per element
    for (CTElementType* element : elementsOf(graph)) {
        if (!kind_.takes(*element))
            continue;
        const std::vector<GrxStyleBy*> styleBys = element->getStyleBys();
        for (GrxStyleBy* styleBy : styleBys)
            if (selects(styleByNumber_, ++k))
                restyle(*element, *styleBy, styleBys.size());
    }
}

void TStyleCycle::restyleLabelings(const GrrUviza& graph) {
    std::size_t k = 0;
    for (const CTElementType* element : elementsOf(graph))
        for (GrxLabeling* labeling : element->getLabelings())
            for (GrxStyleBy* styleBy : labeling->getStyleBys())
                if (selects(styleByNumber_, ++k))
                    fillFromInstruction(cycleOf(*styleBy));
}

void TStyleCycle::restyle(CTElementType& element, GrxStyleBy& styleBy, std::size_t styleBys) {
    GrxStyle& style = targetStyle(*this, element);
    GrxStyleCycle& cycle = cycleOf(styleBy);
    if (same(cycle.getId(), kUnchangeable))
        return;
    if (!repository_) {
        fillFromInstruction(cycle);
        const std::vector<GrxCycle*> cycles = cycle.getCycles();
        if (!cycles.empty() && kindOf(*cycles[0]) == CycleKind::Pattern)
            blackOnWhite(style);
    } else {
        // A box keeps its hinge as the cycle's style, but gets a style of its own too.
        styleOf(*this, element, &CTElementType::getStyle, &CTElementType::setStyle, {});
        if (const GrxCycle* from = repositoryCycleFor(element, cycle, styleBy, styleBys, style)) {
            cycle.removeCycles();
            GrxCycle& copy = cycle.addCycle();
            for (const GrxStyle* original : from->getStyles()) {
                GrxStyle& made = copy.addStyle();
                ChartBase::mergeAttributes(original->getImplementation(), made.getImplementation());
                // The copy is a style of its own: the repository's id would be held twice.
                made.removeAttribute(GrxUni::_id);
            }
            if (isA<GrxPoint>(element) && from == repositoryCycles_[static_cast<int>(CycleKind::Color)] &&
                !same(cycle.getId(), kColorCycle))
                makeHollow(copy);
        }
    }
    if (cycle.getCycles().empty())
        cycle.addCycle();
    for (GrxCycle* styles : cycle.getCycles())
        if (styles->getStyles().empty())
            styles->addStyle();
}

const GrxCycle* TStyleCycle::repositoryCycleFor(CTElementType& element, const GrxStyleCycle& cycle,
                                                const GrxStyleBy& styleBy, std::size_t styleBys,
                                                GrxStyle& style) const {
    const auto repository = [&](CycleKind kind) { return repositoryCycles_[static_cast<int>(kind)]; };
    const bool interval = isA<GrxInterval>(element);
    const XMLCh* id = styleBy.getId();
    if (interval && styleBys > 1) {
        if (contains(id, GrxUni::_color))
            return repository(CycleKind::Color);
        if (contains(id, GrxUni::_pattern))
            return repository(CycleKind::Pattern);
    }
    if (create_ == Create::None)
        return nullptr;
    const bool patternsOnly = create_ == Create::PatternsOnly;
    const ChartString symbol(element.getStyle() ? element.getStyle()->getSymbol() : nullptr);
    if (isA<GrxEdge>(element) || isA<GrxLine>(element) || isA<GrxPath>(element) ||
        (interval && (symbol.equals(u"line") || symbol.equals(u"ibeam"))))
        return patternsOnly && repository(CycleKind::Dash) ? repository(CycleKind::Dash) : repository(CycleKind::Color);
    if (isA<GrxArea>(element) || isA<GrxPolygon>(element) || isA<GrxSchema>(element) || interval) {
        const bool composed = interval && same(target_.getName(), kComposedName);
        const bool patternWanted =
            (composed && contains(id, GrxUni::_pattern) && !contains(id, GrxUni::_color)) ||
            (patternsOnly && !(composed && contains(id, GrxUni::_color)));
        if (patternWanted && repository(CycleKind::Pattern)) {
            blackOnWhite(style);
            return repository(CycleKind::Pattern);
        }
        return repository(CycleKind::Color);
    }
    if (isA<GrxPoint>(element))
        return patternsOnly && repository(CycleKind::Symbol) ? repository(CycleKind::Symbol)
                                                             : repository(CycleKind::Color);
    (void)cycle;
    return nullptr;
}

// ---- addStyleCycle -----------------------------------------------------------------------------------

bool TAddStyleCycle::apply() {
    if (instruction_ == nullptr || elementName_.empty() || cycle_ == nullptr)
        return false;
    // One search of the whole chart: searching once per graph would add a style-by per graph.
    const std::vector<DOMNode*> nodes = nodesNamed(target_, elementName_.xc_str());
    for (std::size_t n = 1; n <= nodes.size(); ++n) {
        if (!selects(count_, n))
            continue;
        const CTElementType* element = GrxBaseElement::wrapperOf<CTElementType>(nodes[n - 1]->getParentNode());
        GrxBaseElement* holder = GrxBaseElement::wrapperOf(nodes[n - 1]);
        if (element == nullptr || holder == nullptr)
            continue;
        const std::vector<CTAesthetic*> aesthetics = getAesthetics(*element);
        if (aesthetics.empty() || aesthetics[0]->getVariable() == nullptr)
            continue;
        GrxStyleBy& styleBy = holder->add<GrxStyleBy>();
        styleBy.setVariable(*aesthetics[0]->getVariable());
        GrxStyleCycle& cycle = target_.addStyleCycle(CreateUniqueId(ChartString(GrxStyleCycle::getElementName())));
        styleBy.setCycle(cycle);
        fillCycle(*this, cycle.addCycle(), *cycle_);
    }
    return true;
}

namespace {

const ActionFamily family{
    {u"setStyleCycle", "TStyleCycle", makeAction<TStyleCycle>},
    {u"addStyleCycle", "TAddStyleCycle", makeAction<TAddStyleCycle>},
};

} // namespace

} // namespace plotaid::detail
