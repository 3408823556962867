// Annotation actions. New guides are decorated one way: an optional label in a white text frame,
// a style of their own with the instruction's style imported, and in a scatterplot matrix a
// condition that hides them on the diagonal. Style-only instructions restyle the guides that match
// instead of adding any.
#include "templates/actions/annotations.h"

#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartException.h>

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

const char kFile[] = "backend/chartxml/plotaid/src/templates/annotations";

constexpr XMLCh kParameter[] = u"parameter";
constexpr XMLCh kOnDiagonal[] = u"facet1==facet2";
constexpr XMLCh kOffDiagonal[] = u"facet1!=facet2";

const XMLCh* const kRoles[] = {GrxUni::_x, GrxUni::_y, GrxUni::_z};

GuideValue valueOf(const DOMElement* instruction, const XMLCh* role) {
    const ChartString flag = ChartString(role) + ChartString(GrxUni::_categorical);
    GuideValue v;
    v.text = attributeOf(instruction, role);
    v.categoricalGiven = hasText(attributeOf(instruction, flag.xc_str()).xc_str());
    v.categorical = booleanAttribute(instruction, flag.xc_str(), false);
    return v;
}

// A "parameter" naming x or y gives that role's value; its own categorical flag counts only where
// the instruction has none for the role.
void takeParameter(const DOMElement* parameter, GuideValue& x, GuideValue& y, bool onlyEmpty) {
    const ChartString name = attributeOf(parameter, GrxUni::_name);
    GuideValue* v = name.equals(GrxUni::_x) ? &x : name.equals(GrxUni::_y) ? &y : nullptr;
    if (v == nullptr || (onlyEmpty && !v->text.empty()))
        return;
    v->text = attributeOf(parameter, GrxUni::_value);
    if (!v->categoricalGiven)
        v->categorical = booleanAttribute(parameter, GrxUni::_categorical, false);
}

bool hasRole(const BaseTemplate& action, const GrrUviza& graph, const XMLCh* role) {
    return !action.getDimensionsByRole(graph, ChartString(role)).empty();
}

// The value as the graph knows it: a category label becomes its category value. False when a
// category label names no category of the graph.
bool resolve(const BaseTemplate& action, const GrrUviza& graph, const XMLCh* role, const GuideValue& v,
             ChartString& out) {
    out = v.text;
    if (!v.categorical || v.text.empty())
        return true;
    out = action.getCategoryValue(graph, role, v.text);
    return !out.empty();
}

// Equal texts, or both numbers of equal value (so 3 matches 3.0).
bool sameValue(const ChartString& given, const XMLCh* guide) {
    if (given.equals(guide))
        return true;
    const ChartString other(guide);
    return given.isNumber() && other.isNumber() && given.convertToDouble() == other.convertToDouble();
}

GrxStyle& guideStyle(BaseTemplate& action, CTGuideType& guide) {
    return styleOf(action, guide, &CTGuideType::getStyle, &CTGuideType::setStyle, ChartString());
}

void hideWhere(BaseTemplate& action, CTGuideType& guide, const XMLCh* condition) {
    GrxStyle& hidden = action.addStyle(guide, nullptr);
    hidden.setVisible(false);
    guide.addConditionalStyle(ChartString(condition), hidden);
}

// A new guide: its label, its own style, and in a scatterplot matrix no line on the diagonal.
void decorate(BaseTemplate& action, const GrrUviza& graph, CTGuideType& guide, const DOMElement* style,
              const DOMElement* labelElement, bool yEmpty, bool hideOnDiagonal) {
    if (labelElement != nullptr) {
        GrxLabel& label = guide.addLabel();
        action.mergeText(labelElement, label);
        GrxStyle& labelStyle = action.addStyle(label, nullptr);
        labelStyle.setLabelLocationHorizontal(yEmpty ? 1 : 2);
        labelStyle.setLabelLocationVertical(yEmpty ? 2 : 1);
        label.setStyle(labelStyle);
        GrxStyle& frame = action.addStyle(label, nullptr);
        frame.setColor(GrxStyle::_white);
        frame.setColor2(GrxStyle::_black);
        label.setTextFrameStyle(frame);
        action.styleLabel(label, labelElement);
    }
    GrxStyle& own = action.addStyle(guide, nullptr);
    guide.setStyle(own);
    if (style != nullptr)
        action.importStyle(style, own);
    if (hideOnDiagonal && action.getFirstSPLOMElement(graph) != nullptr)
        hideWhere(action, guide, kOnDiagonal);
}

// The label declarations of a style-only instruction onto every label of the guide: the last
// unnumbered (or 0) style for the label, the last numbered 1 for its frame.
void restyleLabels(BaseTemplate& action, CTGuideType& guide, const DOMElement* labelElement) {
    const DOMElement* labelDeclaration = nullptr;
    const DOMElement* frameDeclaration = nullptr;
    for (const DOMElement* style : descendantsNamed(labelElement, GrxUni::_style)) {
        const ChartString number = attributeOf(style, GrxUni::_number);
        if (number.empty() || number.equals(u"0"))
            labelDeclaration = style;
        else if (number.equals(u"1"))
            frameDeclaration = style;
    }
    if (labelDeclaration == nullptr && frameDeclaration == nullptr)
        return;
    for (GrxLabel* label : guide.getLabels()) {
        CTLabelType& owner = *label;
        GrxStyle& style = styleOf(action, owner, &CTLabelType::getStyle, &CTLabelType::setStyle, ChartString());
        GrxStyle& frame = styleOf(action, owner, &CTLabelType::getTextFrameStyle, &CTLabelType::setTextFrameStyle,
                                  ChartString());
        if (labelDeclaration != nullptr)
            action.importStyle(labelDeclaration, style);
        if (frameDeclaration != nullptr)
            action.importStyle(frameDeclaration, frame);
    }
}

void restyle(BaseTemplate& action, CTGuideType& guide, const DOMElement* style, const DOMElement* label) {
    GrxStyle& own = guideStyle(action, guide);
    if (style != nullptr)
        action.importStyle(style, own);
    restyleLabels(action, guide, label);
}

// Graphs drawn as tables of facets have no place for a guide.
bool hasTableLayout(const GrrUviza& graph) {
    const GrxFacetLayout* layout = graph.getFacetLayout();
    return layout != nullptr && !layout->getTableLayouts().empty();
}

} // namespace

// ---- addAnchoredAnnotation ---------------------------------------------------------------------------

TAnchoredAnnotation::TAnchoredAnnotation(const GrxVisualization* source, GrxVisualization& target,
                                         const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), label_(firstDescendantNamed(instruction, GrxUni::_label)),
      x_(valueOf(instruction, GrxUni::_x)), y_(valueOf(instruction, GrxUni::_y)),
      z_(valueOf(instruction, GrxUni::_z)), name_(attributeOf(instruction, GrxUni::_name)) {
    for (const DOMElement* parameter : descendantsNamed(instruction, kParameter))
        takeParameter(parameter, x_, y_, false);
    styleOnly_ = booleanAttribute(instruction, _styleOnly, false);
}

bool TAnchoredAnnotation::apply() {
    if (label_ == nullptr || x_.text.empty())
        return false;
    std::vector<GrrUviza*> graphs;
    getGraphs(graphs);
    for (GrrUviza* graph : graphs) {
        if (isGraphPolar(*graph))
            continue;
        ChartString v[3];
        const GuideValue* given[] = {&x_, &y_, &z_};
        bool mapped = true;
        for (int r = 0; r < 3; ++r)
            mapped = resolve(*this, *graph, kRoles[r], *given[r], v[r]) && mapped;
        if (!mapped || v[0].empty())
            continue;
        if (styleOnly_) {
            for (GrxPointGuide* guide : graph->getPointGuides()) {
                guideStyle(*this, *guide);
                const XMLCh* own[] = {guide->getX(), guide->getY(), guide->getZ()};
                bool matches = true;
                for (int r = 0; r < 3; ++r)
                    matches = matches && (v[r].empty() || sameValue(v[r], own[r]));
                if (matches)
                    for (GrxLabel* label : guide->getLabels())
                        styleLabel(*label, label_);
            }
            continue;
        }
        GrxPointGuide& guide = graph->addPointGuide();
        guide.setX(v[0]);
        if (!v[1].empty() && hasRole(*this, *graph, GrxUni::_y))
            guide.setY(v[1]);
        if (!v[2].empty() && hasRole(*this, *graph, GrxUni::_z))
            guide.setZ(v[2]);
        GrxStyle& style = addStyle(guide, nullptr);
        style.setColor(GrxStyle::_transparent);
        style.setColor2(GrxStyle::_transparent);
        style.setSymbol(GrxUni::_none);
        guide.setStyle(style);
        if (!name_.empty())
            guide.setName(name_);
        GrxLabel& label = guide.addLabel();
        CTLabelType& owner = label;
        GrxStyle& frame =
            styleOf(*this, owner, &CTLabelType::getTextFrameStyle, &CTLabelType::setTextFrameStyle, ChartString());
        frame.setColor(GrxStyle::_white);
        mergeText(label_, label);
        styleLabel(label, label_);
        if (getFirstSPLOMElement(*graph) != nullptr)
            hideWhere(*this, guide, kOnDiagonal);
    }
    return true;
}

// ---- addReferenceLine --------------------------------------------------------------------------------

TReferenceLine::TReferenceLine(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), x_(valueOf(instruction, GrxUni::_x)),
      y_(valueOf(instruction, GrxUni::_y)), z_(valueOf(instruction, GrxUni::_z)),
      name_(attributeOf(instruction, GrxUni::_name)),
      coordinate_(unsignedAttribute(instruction, GrxUni::_coordinate)) {
    const ChartString points = attributeOf(instruction, GrxUni::_numberPoints);
    function_ = !points.empty();
    segments_ = points.convertToSignedInteger();
    if (segments_ < 2)
        segments_ = 100;
    if (const DOMElement* parameter = lastChildNamed(instruction, kParameter))
        takeParameter(parameter, x_, y_, true);
    style_ = lastChildNamed(instruction, GrxUni::_style);
    label_ = lastChildNamed(instruction, GrxUni::_label);
    styleOnly_ = booleanAttribute(instruction, _styleOnly, false);
}

bool TReferenceLine::apply() {
    if (instruction_ == nullptr || (x_.text.empty() && y_.text.empty() && z_.text.empty() && !styleOnly_))
        return false;
    std::vector<GrrUviza*> graphs;
    getGraphs(graphs);
    for (GrrUviza* graph : graphs) {
        if (isGraphPolar(*graph) || hasTableLayout(*graph))
            continue;
        const std::vector<GrxCoordinates*> all = graph->getCoordinatess();
        if (coordinate_ >= all.size())
            continue;
        GrxCoordinates* coordinates = all.size() > 1 ? all[coordinate_] : nullptr;
        if (function_)
            functionLine(*graph, coordinates);
        else
            valueLines(*graph, coordinates);
    }
    return true;
}

void TReferenceLine::functionLine(GrrUviza& graph, GrxCoordinates* coordinates) {
    for (const XMLCh* role : kRoles)
        if (isRoleCategorical(graph, ChartString(role)))
            return;
    if (styleOnly_) {
        for (GrxFunctionGuide* guide : graph.getFunctionGuides())
            if (coordinates == nullptr || guide->getCoordinates() == coordinates)
                restyle(*this, *guide, style_, label_);
        return;
    }
    GrxFunctionGuide& guide = graph.addFunctionGuide();
    if (coordinates != nullptr)
        guide.setCoordinates(*coordinates);
    guide.setSegments(segments_);
    guide.setValue(y_.text);
    if (!name_.empty())
        guide.setName(name_);
    decorate(*this, graph, guide, style_, label_, y_.text.empty(), true);
}

void TReferenceLine::valueLines(GrrUviza& graph, GrxCoordinates* coordinates) {
    ChartString v[3];
    const GuideValue* given[] = {&x_, &y_, &z_};
    for (int r = 0; r < 3; ++r)
        if (!resolve(*this, graph, kRoles[r], *given[r], v[r]))
            return;
    if (!styleOnly_) {
        bool added = false;
        for (int r = 0; r < 3; ++r) {
            if (v[r].empty() || (r > 0 && !hasRole(*this, graph, kRoles[r])))
                continue;
            GrxLineGuide& guide = graph.addLineGuide();
            guide.SetAttribute(kRoles[r], v[r]);
            if (coordinates != nullptr)
                guide.setCoordinates(*coordinates);
            if (!name_.empty())
                guide.setName(name_);
            decorate(*this, graph, guide, style_, label_, v[1].empty(), true);
            added = true;
        }
        if (!added)
            ChartErrorHandler().warning(ChartException(
                "No reference line: the graph has no dimension for " + printed(instruction_), kFile, 1));
    }
    for (GrxLineGuide* guide : graph.getLineGuides()) {
        const XMLCh* own[] = {guide->getX(), guide->getY(), guide->getZ()};
        bool matches = true;
        for (int r = 0; r < 3; ++r)
            matches = matches && (v[r].empty() || v[r].equals(own[r]));
        if (matches)
            restyle(*this, *guide, style_, label_);
    }
}

// ---- addReferenceRectangle ---------------------------------------------------------------------------

TReferenceRectangle::TReferenceRectangle(const GrxVisualization* source, GrxVisualization& target,
                                         const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), id_(attributeOf(instruction, GrxUni::_id)),
      x1_(attributeOf(instruction, GrxUni::_x1)), x2_(attributeOf(instruction, GrxUni::_x2)),
      y1_(attributeOf(instruction, GrxUni::_y1)), y2_(attributeOf(instruction, GrxUni::_y2)),
      name_(attributeOf(instruction, GrxUni::_name)), zOrder_(attributeOf(instruction, GrxUni::_zOrder)),
      xCategorical_(booleanAttribute(instruction, u"xcategorical", false)),
      yCategorical_(booleanAttribute(instruction, u"ycategorical", false)),
      coordinate_(unsignedAttribute(instruction, GrxUni::_coordinate)) {
    style_ = lastChildNamed(instruction, GrxUni::_style);
    label_ = lastChildNamed(instruction, GrxUni::_label);
    styleOnly_ = booleanAttribute(instruction, _styleOnly, false);
}

bool TReferenceRectangle::selects(const GrxRectangleGuide& guide, const ChartString (&v)[4]) const {
    const ChartString &x1 = v[0], &x2 = v[1], &y1 = v[2], &y2 = v[3];
    if (!id_.empty() && id_.equals(guide.getId()))
        return true;
    const bool x1Matches = x1.empty() ? !hasText(guide.getX1()) : x1.equals(guide.getX1());
    if ((!x1.empty() || !x2.empty()) &&
        ((x2.empty() && !guide.isX2Present()) || x1Matches || (!x2.empty() && x2.equals(guide.getX2()))))
        return true;
    const bool y2Matches = y2.empty() ? !hasText(guide.getY2()) : y2.equals(guide.getY2());
    return (!y1.empty() || !y2.empty()) &&
           ((y1.empty() && !guide.isY1Present()) || (!y1.empty() && y1.equals(guide.getY1())) || y2Matches);
}

bool TReferenceRectangle::apply() {
    if (instruction_ == nullptr || (x1_.empty() && x2_.empty() && y1_.empty() && y2_.empty() && id_.empty()))
        return false;
    std::vector<GrrUviza*> graphs;
    getGraphs(graphs);
    for (GrrUviza* graph : graphs) {
        const std::vector<GrxCoordinates*> all = graph->getCoordinatess();
        if (isGraphPolar(*graph) || coordinate_ >= all.size())
            continue;
        ChartString v[4];
        const ChartString* given[] = {&x1_, &x2_, &y1_, &y2_};
        bool mapped = true;
        for (int k = 0; k < 4; ++k) {
            const bool isX = k < 2;
            const GuideValue value{*given[k], isX ? xCategorical_ : yCategorical_, true};
            mapped = resolve(*this, *graph, isX ? GrxUni::_x : GrxUni::_y, value, v[k]) && mapped;
        }
        if (!mapped)
            continue;
        if (styleOnly_) {
            for (GrxRectangleGuide* guide : graph->getRectangleGuides()) {
                guideStyle(*this, *guide);
                if (!selects(*guide, v))
                    continue;
                restyle(*this, *guide, style_, label_);
                if (!zOrder_.empty())
                    guide->setZOrder(zOrder_.convertToSignedInteger());
            }
            continue;
        }
        GrxRectangleGuide& guide = graph->addRectangleGuide();
        if (!id_.empty())
            guide.setId(target_.doesIdExist(id_) ? CreateUniqueId(id_) : id_);
        // One pair only: an x range wins over a y range.
        if (v[0].empty()) {
            guide.setY1(v[2]);
            guide.setY2(v[3]);
        } else {
            guide.setX1(v[0]);
            guide.setX2(v[1]);
        }
        if (all.size() > 1)
            guide.setCoordinates(*all[coordinate_]);
        if (!name_.empty())
            guide.setName(name_);
        if (!zOrder_.empty())
            guide.setZOrder(zOrder_.convertToSignedInteger());
        decorate(*this, *graph, guide, style_, label_, v[2].empty(), false);
    }
    return true;
}

// ---- addOriginLine -----------------------------------------------------------------------------------

TAddOriginLine::TAddOriginLine(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), style_(firstDescendantNamed(instruction, GrxUni::_style)) {
    for (const XMLCh* role : kRoles) {
        value_ = attributeOf(instruction, role);
        if (!value_.empty()) {
            role_ = ChartString(role);
            return;
        }
    }
    if (const DOMElement* parameter = firstDescendantNamed(instruction, kParameter)) {
        role_ = attributeOf(parameter, GrxUni::_name);
        for (const XMLCh* role : kRoles)
            if (role_.equals(role))
                value_ = attributeOf(parameter, GrxUni::_value);
    }
}

bool TAddOriginLine::apply() {
    if (value_.empty())
        return false;
    std::vector<GrrUviza*> graphs;
    getGraphs(graphs);
    bool last = false;
    for (GrrUviza* graph : graphs) {
        last = !isRoleCategorical(*graph, role_);
        if (!last)
            continue;
        GrxLineGuide& guide = graph->addLineGuide();
        guide.setId(CreateUniqueId(ChartString(GrxUni::_lineGuide)));
        guide.SetAttribute(role_.xc_str(), value_);
        GrxExtensionVis* extension = target_.getExtension();
        if (extension == nullptr)
            extension = &target_.addExtension();
        ChartString slot(u"originLine");
        slot.append(role_.equals(GrxUni::_x) ? u"X" : role_.equals(GrxUni::_y) ? u"Y" : u"Z");
        extension->setAttribute(slot.xc_str(), ChartString(guide.getId()));
        GrxStyle& style = addStyle(guide, nullptr);
        guide.setStyle(style);
        if (style_ != nullptr)
            importStyle(style_, style);
        if (getFirstSPLOMElement(*graph) != nullptr)
            hideWhere(*this, guide, kOffDiagonal);
    }
    return last;
}

namespace {

const ActionFamily family{
    {u"addAnchoredAnnotation", "TAnchoredAnnotation", makeAction<TAnchoredAnnotation>},
    {u"addReferenceLine", "TReferenceLine", makeAction<TReferenceLine>},
    {u"addReferenceRectangle", "TReferenceRectangle", makeAction<TReferenceRectangle>},
    {u"addOriginLine", "TAddOriginLine", makeAction<TAddOriginLine>},
};

} // namespace

} // namespace plotaid::detail
