// "setStyle": one style chosen by id, the parts of every graph of one element type, or the texts of
// titles, legends, axes and panels, each given the instruction's style declarations.
#include "templates/actions/style.h"

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLString.hpp>

#include <algorithm>
#include <iterator>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

constexpr XMLCh kThreeD[] = u"3D";
constexpr XMLCh kFull[] = u"100%";

// Elements with these words in their id belong to special charts (series, control, survival,
// biplot ...) and keep the look their procedure gave them.
constexpr const XMLCh* kExcludedIdWords[] = {u"AIM",  u"biplot", u"centroid", u"control",
                                             u"uide", u"series", u"survival", u"triplot"};

const XMLCh* const kIntervalTypes[] = {GrxUni::_bar, GrxUni::_range, GrxUni::_histogram, GrxUni::_population,
                                       BaseTemplate::_errorbar, BaseTemplate::_pie, BaseTemplate::_dropline};

bool isExcluded(const CTElementType& element) {
    const ChartString id(element.getId());
    return std::any_of(std::begin(kExcludedIdWords), std::end(kExcludedIdWords),
                       [&](const XMLCh* word) { return id.ContainsString(word); });
}

// The object of the chart whose id an extension slot attribute holds, for any extension.
template <class T> T* slotObject(const GrxExtensionVis& extension, const ChartString& slot) {
    if (slot.empty())
        return nullptr;
    const ChartString id(extension.GetAttribute(slot.xc_str()));
    if (id.empty())
        return nullptr;
    return GrxBaseElement::wrapperOf<T>(extension.getElementById(id));
}

} // namespace

TStyle::TStyle(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction)
    : BaseTemplate(source, target, instruction) {
    if (instruction_ == nullptr)
        return;
    // Numbers past the last graph name nothing, so the list never grows beyond the graph count.
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    const std::uint64_t kept = std::max<std::uint64_t>(graphs.size(), 1);
    DOMNodeList* styles = instruction_->getElementsByTagName(GrxUni::_style);
    for (XMLSize_t i = 0, count = styles->getLength(); i < count; ++i) {
        auto* declaration = static_cast<DOMElement*>(styles->item(i));
        const std::uint64_t number =
            ChartString(declaration->getAttribute(GrxUni::_number)).convertToInteger();
        extent_ = std::max(extent_, number + 1);
        if (number >= kept)
            continue;
        if (declarations_.size() <= number)
            declarations_.resize(number + 1, nullptr);
        declarations_[number] = declaration;
    }
}

DOMElement* TStyle::declaration(std::uint64_t number) const {
    return number < declarations_.size() ? declarations_[number] : nullptr;
}

DOMElement* TStyle::declarationForGraph(std::uint64_t graph) const {
    return declaration(extent_ == 1 ? 0 : graph);
}

bool TStyle::apply() {
    if (instruction_ == nullptr)
        return false;

    const XMLCh* type = instruction_->getAttribute(GrxUni::_type);
    if (*type == 0)
        return styleById();
    if (same(type, GrxUni::_text) || same(type, BaseTemplate::_textFrame) || same(type, GrxUni::_labelFrame)) {
        styleTexts();
        return true;
    }
    styleElements();
    return true;
}

// ---- one style by id ------------------------------------------------------------------------------

bool TStyle::styleById() {
    const XMLCh* wanted = instruction_->getAttribute(GrxUni::_id);
    DOMElement* declaration0 = declaration(0);
    // An empty id names no style: it would otherwise pick whichever style happens to have none.
    if (*wanted == 0 || declaration0 == nullptr)
        return false;
    GrxStyle* style = styleWithId(target_, wanted);
    if (style == nullptr)
        return false;
    importStyle(declaration0, *style);
    return true;
}

// ---- element types --------------------------------------------------------------------------------

namespace {

// What the chart element kinds share while one instruction styles them.
struct ElementStyling {
    BaseTemplate& action;
    const XMLCh* type;
    const XMLCh* subtype;

    bool is(const XMLCh* word) const { return same(type, word); }

    // With the size rule the declaration itself loses its size and has its width made full, so
    // that a slice keeps the whole radius; later instructions reading it see the change.
    void styleElement(CTElementType& element, DOMElement& declaration, bool sizeRule) const {
        GrxStyle& style = styleOf<CTElementType>(action, element, &CTElementType::getStyle,
                                                 &CTElementType::setStyle, ChartString());
        if (sizeRule) {
            declaration.removeAttribute(GrxUni::_size);
            if (*declaration.getAttribute(GrxUni::_width) != 0)
                declaration.setAttribute(GrxUni::_width, kFull);
        }
        action.importStyle(&declaration, style);
    }

    void styleSchema(GrxSchema& schema, DOMElement& declaration) const {
        struct Part {
            const XMLCh* subtype;
            GrxStyle* (GrxSchema::*get)() const;
            void (GrxSchema::*set)(GrxStyle&);
        };
        static const Part parts[] = {
            {u"medianStyle", &GrxSchema::getMedianStyle, &GrxSchema::setMedianStyle},
            {u"fenceStyle", &GrxSchema::getFenceStyle, &GrxSchema::setFenceStyle},
            {u"hingeStyle", &GrxSchema::getHingeStyle, &GrxSchema::setHingeStyle},
            {u"outlierStyle", &GrxSchema::getOutlierStyle, &GrxSchema::setOutlierStyle},
            {u"extremeStyle", &GrxSchema::getExtremeStyle, &GrxSchema::setExtremeStyle},
        };
        Part chosen{nullptr, &GrxSchema::getStyle, &GrxSchema::setStyle};
        for (const Part& part : parts)
            if (same(subtype, part.subtype))
                chosen = part;
        GrxStyle& style = styleOf<GrxSchema>(action, schema, chosen.get, chosen.set, ChartString());
        action.importStyle(&declaration, style);
    }

    // Clustered bars take only the "clustered" declaration, plain bars only the other one, and a
    // bar moved by position modifier 7 neither.
    void barRule(const GrrUviza& graph, GrxInterval& interval, DOMElement& declaration) const {
        const bool clustered = same(subtype, BaseTemplate::_clustered);
        const bool styled =
            action.isGraphClustered(graph) ? clustered : !clustered && interval.getPositionModifier() != grx::PositionModifier::dodge;
        if (styled)
            styleElement(interval, declaration, false);
    }

    void styleInterval(const GrrUviza& graph, GrxInterval& interval, DOMElement& declaration) const {
        const GrxStyle* own = interval.getStyle();
        const ChartString symbol(own ? own->getSymbol() : nullptr);
        const bool lineSymbol = symbol.equals(GrxUni::_line);
        const bool ibeamSymbol = symbol.equals(GrxUni::_ibeam);
        const bool polar = action.isGraphPolar(graph);

        // Intervals drawn as lines or I-beams are drop lines and error bars whatever else they are.
        if (lineSymbol && is(BaseTemplate::_dropline)) {
            styleElement(interval, declaration, false);
            return;
        }
        if ((lineSymbol || ibeamSymbol) && is(BaseTemplate::_errorbar)) {
            styleElement(interval, declaration, false);
            return;
        }
        if (lineSymbol || ibeamSymbol)
            return;

        bool fallThrough = false;
        const ChartString id(interval.getId());
        if (id.ContainsString(u"dropdownline")) {
            if (is(BaseTemplate::_dropline)) {
                styleElement(interval, declaration, false);
                return;
            }
            fallThrough = true;
        } else if (id.ContainsString(u"errorbar")) {
            if (is(BaseTemplate::_errorbar)) {
                styleElement(interval, declaration, false);
                return;
            }
            fallThrough = true;
        }

        if (!fallThrough) {
            const std::vector<GrxSummaryStatistic*> summaries = interval.getSummaryStatistics();
            if (!interval.getBinStatistics().empty() && !summaries.empty()) {
                if (is(GrxUni::_histogram) || is(GrxUni::_population))
                    styleElement(interval, declaration, false);
                return;
            }
            if (polar) {
                if (is(BaseTemplate::_pie))
                    styleElement(interval, declaration, true);
                return;
            }
            if (!summaries.empty()) {
                const bool range =
                    std::any_of(summaries.begin(), summaries.end(),
                                [](const GrxSummaryStatistic* s) { return s->getMethod() == grx::SummaryMethod::range; });
                if (range && is(GrxUni::_range) && symbol.equals(GrxUni::_square)) {
                    styleElement(interval, declaration, false);
                    return;
                }
            } else if (is(GrxUni::_bar)) {
                barRule(graph, interval, declaration);
                // A patterned bar needs a fill under its pattern.
                for (const GrxStyleBy* by : interval.getStyleBys()) {
                    if (!ChartString(by->getId()).ContainsString(GrxUni::_pattern))
                        continue;
                    GrxStyle* style = interval.getStyle();
                    if (style != nullptr && !style->isColorPresent())
                        style->setColor(GrxStyle::_white);
                    break;
                }
                return;
            }
        }

        if (is(GrxUni::_bar) && !polar)
            barRule(graph, interval, declaration);
    }
};

} // namespace

void TStyle::styleElements() {
    const ElementStyling styling{*this, instruction_->getAttribute(GrxUni::_type),
                                 instruction_->getAttribute(GrxUni::_subtype)};
    const bool scatter = styling.is(BaseTemplate::_scatter);
    const bool line = styling.is(GrxUni::_line);
    const bool area = styling.is(GrxUni::_area);
    const bool schema = styling.is(GrxUni::_schema);
    const bool interval = std::any_of(std::begin(kIntervalTypes), std::end(kIntervalTypes),
                                      [&](const XMLCh* word) { return styling.is(word); });
    if (!scatter && !line && !area && !schema && !interval)
        return;

    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    for (std::size_t g = 0; g < graphs.size(); ++g) {
        DOMElement* declaration = declarationForGraph(g);
        if (declaration == nullptr)
            continue;
        const GrrUviza& graph = *graphs[g];
        const ChartString coordinate(declaration->getAttribute(GrxUni::_coordinate));
        const bool threeD = !getDimensionsByRole(graph, ChartString(GrxUni::_z)).empty();
        for (CTElementType* element : elementsOf(graph)) {
            if (!doesCoordinateMatch(*element, coordinate) || isExcluded(*element))
                continue;
            if (scatter) {
                if (dynamic_cast<GrxPoint*>(element) != nullptr &&
                    (element->getBinStatistics().empty() || same(styling.subtype, GrxUni::_dot)))
                    styling.styleElement(*element, *declaration, false);
            } else if (line) {
                const bool lineKind = dynamic_cast<GrxLine*>(element) != nullptr ||
                                      dynamic_cast<GrxPath*>(element) != nullptr ||
                                      dynamic_cast<GrxEdge*>(element) != nullptr;
                if (lineKind && same(styling.subtype, kThreeD) == threeD)
                    styling.styleElement(*element, *declaration, false);
            } else if (area) {
                if (dynamic_cast<GrxArea*>(element) != nullptr)
                    styling.styleElement(*element, *declaration, false);
            } else if (schema) {
                if (auto* box = dynamic_cast<GrxSchema*>(element))
                    styling.styleSchema(*box, *declaration);
            } else if (auto* bar = dynamic_cast<GrxInterval*>(element)) {
                styling.styleInterval(graph, *bar, *declaration);
            }
        }
    }
}

// ---- texts ----------------------------------------------------------------------------------------

namespace {

struct TextStyling {
    BaseTemplate& action;
    GrxVisualization& target;
    const DOMElement& instruction;
    ChartString sub;
    bool frame; // "textFrame": the frame around the text rather than the text

    bool subHas(const XMLCh* word) const { return sub.ContainsString(word); }

    // A label frame's or a legend's own style, through the first extension slot named `sub` that
    // holds one of them.
    void styleSlotFrame(const DOMElement& declaration) const {
        for (GrxExtensionVis* extension : allOfKind<GrxExtensionVis>(target, GrxUni::_extension)) {
            GrxStyle* style = nullptr;
            if (auto* frameObject = slotObject<GrxLabelFrame>(*extension, sub))
                style = &styleOf<GrxLabelFrame>(action, *frameObject, &GrxLabelFrame::getStyle,
                                                &GrxLabelFrame::setStyle,
                                                action.CreateUniqueId(ChartString(frameObject->getId())));
            else if (auto* legend = slotObject<GrxLegend>(*extension, sub))
                style = &styleOf<GrxLegend>(action, *legend, &GrxLegend::getStyle, &GrxLegend::setStyle,
                                            action.CreateUniqueId(ChartString(legend->getId())));
            if (style != nullptr) {
                action.importStyle(&declaration, *style);
                return;
            }
        }
    }

    void styleLegendTicks(const DOMElement& declaration) const {
        GrxExtensionVis* extension = target.getExtension();
        if (extension == nullptr)
            return;
        GrxLegend* legend = subHas(u"legend1") ? extension->getLegend1() : extension->getLegend2();
        if (legend == nullptr)
            return;
        const ChartString id(legend->getId());
        GrxStyle& style = frame
                              ? styleOf<GrxLegend>(action, *legend, &GrxLegend::getTickFrameStyle,
                                                   &GrxLegend::setTickFrameStyle, action.CreateUniqueId(id))
                              : styleOf<GrxLegend>(action, *legend, &GrxLegend::getTickTextStyle,
                                                   &GrxLegend::setTickTextStyle,
                                                   action.CreateUniqueId(id + ChartString(u"tickTextStyle")));
        action.importStyle(&declaration, style);
    }

    // The role an axis word of `sub` names ("xaxis" ... "zaxis", or the titles), or null.
    const XMLCh* role(const XMLCh* x, const XMLCh* y, const XMLCh* z) const {
        if (subHas(x))
            return GrxUni::_x;
        if (subHas(y))
            return GrxUni::_y;
        if (subHas(z))
            return GrxUni::_z;
        return nullptr;
    }

    GrxLabel* axisTitle(const XMLCh* axisRole) const {
        const bool second = subHas(u"2");
        for (GrrUviza* graph : allGraphs(target))
            for (GrxDimension* dimension : action.getDimensionsByRole(*graph, ChartString(axisRole))) {
                const std::vector<GrxAxis*> axes = dimension->getAxiss();
                if (axes.empty())
                    continue;
                const GrxAxis* axis = second && axes.size() >= 2 ? axes[1] : axes[0];
                if (GrxLabel* label = axis->getLabel())
                    return label;
            }
        return nullptr;
    }

    GrxLabel* slotLabel() const {
        for (GrxExtensionVis* extension : allOfKind<GrxExtensionVis>(target, GrxUni::_extension)) {
            if (auto* frameObject = slotObject<GrxLabelFrame>(*extension, sub)) {
                if (GrxLabel* label = frameObject->getLabel())
                    return label;
            } else if (auto* legend = slotObject<GrxLegend>(*extension, sub)) {
                if (GrxLabel* label = legend->getLabel())
                    return label;
            }
        }
        return nullptr;
    }

    void styleLabel(GrxLabel& label, const DOMElement& declaration) const {
        const ChartString id = action.CreateUniqueId(ChartString(GrxUni::_text));
        GrxStyle& style =
            frame ? styleOf<CTLabelType>(action, label, &CTLabelType::getTextFrameStyle,
                                         &CTLabelType::setTextFrameStyle, id)
                  : styleOf<CTLabelType>(action, label, &CTLabelType::getStyle, &CTLabelType::setStyle, id);
        action.importStyle(&declaration, style);
    }

    void styleAxisTickLabels(const DOMElement& declaration) const {
        const XMLCh* axisRole = role(u"xaxis", u"yaxis", u"zaxis");
        if (axisRole == nullptr)
            return;
        GrxMajorTicks* ticks = nullptr;
        for (GrrUviza* graph : allGraphs(target)) {
            for (GrxDimension* dimension : action.getDimensionsByRole(*graph, ChartString(axisRole))) {
                const std::vector<GrxAxis*> axes = dimension->getAxiss();
                if (axes.empty())
                    continue;
                const std::vector<GrxMajorTicks*> major = axes.front()->getMajorTickss();
                if (!major.empty()) {
                    ticks = major.front();
                    break;
                }
            }
            if (ticks != nullptr)
                break;
        }
        if (ticks == nullptr)
            return;
        // A missing frame style is made as the tick frame style: attaching it as the ticks' own
        // style would cut the tick labels off the text style the chart gave them.
        const ChartString id = ChartString(ticks->getId()) + ChartString(u"s");
        GrxStyle& style = frame ? styleOf<GrxMajorTicks>(action, *ticks, &GrxMajorTicks::getTickFrameStyle,
                                                         &GrxMajorTicks::setTickFrameStyle, id)
                                : styleOf<GrxMajorTicks>(action, *ticks, &GrxMajorTicks::getStyle,
                                                         &GrxMajorTicks::setStyle, id);
        action.importStyle(&declaration, style);
    }

    // Facet levels are counted from 1 in document order, as their "level" attributes are.
    void styleFacetTickLabels(const DOMElement& declaration) const {
        const ChartString levelText(instruction.getAttribute(GrxUni::_level));
        const unsigned level = levelText.empty() ? 0 : levelText.convertToInteger();
        unsigned index = 0;
        for (GrxFacetLevel* facetLevel : allOfKind<GrxFacetLevel>(target, GrxUni::_facetLevel)) {
            ++index;
            if (level > 0 && level != index)
                continue;
            const std::vector<GrxAxis*> axes = facetLevel->getAxiss();
            GrxAxis& axis = axes.empty() ? facetLevel->addAxis() : *axes.front();
            if (axis.getStyle() == nullptr) {
                // An axis made for its tick labels draws no line of its own.
                GrxStyle& style =
                    action.addStyle(axis, action.CreateUniqueId(ChartString(GrxUni::_axis)).xc_str());
                axis.setStyle(style);
                style.setColor(GrxStyle::_transparent);
            }
            const std::vector<GrxMajorTicks*> major = axis.getMajorTickss();
            GrxMajorTicks& ticks = major.empty() ? axis.addMajorTicks() : *major.front();
            GrxStyle* style = nullptr;
            if (frame) {
                style = ticks.getTickFrameStyle();
                if (style == nullptr)
                    continue;
            } else {
                style = ticks.getStyle();
            }
            if (style != nullptr)
                action.importStyle(&declaration, *style);
        }
    }

    void styleFacetTitles(const DOMElement& declaration) const {
        const ChartString levelText(instruction.getAttribute(GrxUni::_level));
        for (GrxFacetLevel* facetLevel : allOfKind<GrxFacetLevel>(target, GrxUni::_facetLevel)) {
            if (!levelText.empty() &&
                facetLevel->getLevel() != static_cast<int>(levelText.convertToInteger()))
                continue;
            const std::vector<GrxAxis*> axes = facetLevel->getAxiss();
            GrxAxis& axis = axes.empty() ? facetLevel->addAxis() : *axes.front();
            GrxLabel* label = axis.getLabel();
            if (label == nullptr) {
                label = &axis.addLabel();
                label->setId(
                    action.CreateUniqueId(ChartString(GrxUni::_label) + ChartString(facetLevel->getId())));
            }
            const ChartString id =
                action.CreateUniqueId(ChartString(GrxUni::_style) + ChartString(label->getId()));
            GrxStyle& style = frame ? styleOf<CTLabelType>(action, *label, &CTLabelType::getTextFrameStyle,
                                                           &CTLabelType::setTextFrameStyle, id)
                                    : styleOf<CTLabelType>(action, *label, &CTLabelType::getStyle,
                                                           &CTLabelType::setStyle, id);
            action.importStyle(&declaration, style);
        }
    }

    void styleText(const DOMElement& declaration) const {
        if (subHas(GrxUni::_legend))
            styleLegendTicks(declaration);
        GrxLabel* label = nullptr;
        if (const XMLCh* titleRole = role(BaseTemplate::_xaxis_title, BaseTemplate::_yaxis_title, BaseTemplate::_zaxis_title))
            label = axisTitle(titleRole);
        else
            label = slotLabel();
        if (label != nullptr) {
            styleLabel(*label, declaration);
            return;
        }
        if (subHas(GrxUni::_label) && subHas(GrxUni::_axis))
            styleAxisTickLabels(declaration);
        else if (subHas(GrxUni::_label) && subHas(u"panel"))
            styleFacetTickLabels(declaration);
        else if (subHas(u"title") && subHas(u"panel"))
            styleFacetTitles(declaration);
        // Labels inside the elements ("labeling", "inside") are the data labels' own business.
    }
};

} // namespace

void TStyle::styleTexts() {
    const XMLCh* type = instruction_->getAttribute(GrxUni::_type);
    const TextStyling styling{*this, target_, *instruction_,
                              ChartString(instruction_->getAttribute(GrxUni::_subtype)), same(type, BaseTemplate::_textFrame)};
    const bool labelFrame = same(type, GrxUni::_labelFrame);
    for (const DOMNode* n = instruction_->getFirstChild(); n != nullptr; n = n->getNextSibling()) {
        if (n->getNodeType() != DOMNode::ELEMENT_NODE || !same(n->getNodeName(), GrxUni::_style))
            continue;
        const auto& declaration = *static_cast<const DOMElement*>(n);
        if (labelFrame)
            styling.styleSlotFrame(declaration);
        else
            styling.styleText(declaration);
    }
}

namespace {

const ActionFamily family{{u"setStyle", "TStyle", makeAction<TStyle>}};

} // namespace

} // namespace plotaid::detail
