// The element wrappers over older chart documents and earlier-form templates.
#include <plotaid/ChartAxis.h>
#include <plotaid/ChartDimension.h>
#include <plotaid/ChartElement.h>
#include <plotaid/ChartElementElement.h>
#include <plotaid/ChartFacetLabel.h>
#include <plotaid/ChartFacetLabeling.h>
#include <plotaid/ChartFrame.h>
#include <plotaid/ChartGraph.h>
#include <plotaid/ChartGuide.h>
#include <plotaid/ChartParameter.h>
#include <plotaid/ChartVariable.h>

#include "transform/ElementWalk.h"

#include <plotaid/ChartBase.h>

#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

using namespace XERCES_CPP_NAMESPACE;
using plotaid::detail::descendantWith;
using plotaid::detail::firstDescendant;
using plotaid::detail::isEmpty;
using plotaid::detail::isNamed;

namespace {

using plotaid::detail::kFacetVariable;
using plotaid::detail::kStyleBy;
constexpr XMLCh kFacetLabel[] = u"facetlabel";
constexpr XMLCh kLegendTarget[] = u"legendtarget";
constexpr XMLCh kHistogram[] = u"histogram";
constexpr XMLCh kTukeyInnerFence[] = u"tukeyInnerFence";

DOMElement* asElement(DOMNode* node) {
    return node != nullptr && node->getNodeType() == DOMNode::ELEMENT_NODE ? static_cast<DOMElement*>(node)
                                                                           : nullptr;
}

bool equals(const XMLCh* a, const XMLCh* b) {
    return a != nullptr && b != nullptr && XMLString::equals(a, b);
}

// The variable element whose id the text names.
DOMElement* variableById(const ChartElement& from, const XMLCh* id) {
    return isEmpty(id) ? nullptr : from.getElementWithAttribute(GrxUni::_variable, GrxUni::_id, id);
}

} // namespace

const XMLCh* const ChartDimension::_upperMapping = u"upperMapping";
const XMLCh* const ChartDimension::_lowerMapping = u"lowerMapping";
const XMLCh* const ChartDimension::_sameRatio = u"sameRatio";

ChartElement::ChartElement(DOMElement* element) : element_(element) {}
ChartElement::ChartElement(DOMNode* node) : element_(asElement(node)) {}
ChartElement::~ChartElement() = default;

DOMElement* ChartElement::get() const {
    return element_;
}
const XMLCh* ChartElement::getType() const {
    return getAttributeValue(GrxUni::_type);
}
const XMLCh* ChartElement::getStyle() const {
    return getAttributeValue(GrxUni::_style);
}
const XMLCh* ChartElement::getName() const {
    return getAttributeValue(GrxUni::_name);
}
DOMElement* ChartElement::getGraph() const {
    if (element_ == nullptr || element_->getOwnerDocument() == nullptr)
        return nullptr;
    return element_->getOwnerDocument()->getDocumentElement();
}
DOMElement* ChartElement::getParent() const {
    return element_ ? asElement(element_->getParentNode()) : nullptr;
}
bool ChartElement::isCategorical() const {
    return equals(getAttributeValue(GrxUni::_categorical), GrxUni::_true);
}
DOMElement* ChartElement::getChildWithAttribute(const XMLCh* attribute, const XMLCh* value) const {
    if (element_ == nullptr || attribute == nullptr || value == nullptr)
        return nullptr;
    for (DOMElement* child = element_->getFirstElementChild(); child; child = child->getNextElementSibling())
        if (XMLString::equals(child->getAttribute(attribute), value))
            return child;
    return nullptr;
}
DOMElement* ChartElement::getOffspringWithAttribute(const XMLCh* tag, const XMLCh* attribute,
                                                    const XMLCh* value) const {
    if (element_ == nullptr || isEmpty(tag) || isEmpty(attribute) || isEmpty(value))
        return nullptr;
    return descendantWith(element_, tag, attribute, value);
}
DOMElement* ChartElement::getElementWithAttribute(const XMLCh* tag, const XMLCh* attribute,
                                                  const XMLCh* value) const {
    return ChartElement(getGraph()).getOffspringWithAttribute(tag, attribute, value);
}
DOMElement* ChartElement::getFirstElementByTagName(const XMLCh* tag) const {
    // The root itself never counts: it is the graph, not one of its parts.
    return ChartGraph(getGraph()).getFirstElementByTagName(tag);
}
DOMElement* ChartElement::getFirstChildByTagName(const XMLCh* tag) const {
    return element_ == nullptr || isEmpty(tag) ? nullptr : ChartBase::getChildByTagName(element_, tag);
}
void ChartElement::set(DOMNode* node) {
    element_ = asElement(node);
}
void ChartElement::set(DOMElement* element) {
    element_ = element;
}
bool ChartElement::isNull() const {
    return element_ == nullptr;
}
const XMLCh* ChartElement::getAttributeValue(const XMLCh* name) const {
    return element_ == nullptr || name == nullptr ? nullptr : element_->getAttribute(name);
}

// ChartDimension

bool ChartDimension::isCategorical() const {
    if (element_ == nullptr)
        return false;
    const XMLCh* id = getdomain();
    if (isEmpty(id))
        id = ChartFrame(getParent()).getRoleVariableId(getrole());
    return ChartGraph(getGraph()).isCategorical(id);
}
const XMLCh* ChartDimension::getdomain() const {
    return getAttributeValue(GrxUni::_domain);
}
const XMLCh* ChartDimension::getrole() const {
    return getAttributeValue(GrxUni::_role);
}
const XMLCh* ChartDimension::getupperMapping() const {
    return getAttributeValue(_upperMapping);
}
const XMLCh* ChartDimension::getlowerMapping() const {
    return getAttributeValue(_lowerMapping);
}
const XMLCh* ChartDimension::getsameRatio() const {
    return getAttributeValue(_sameRatio);
}
const XMLCh* ChartDimension::getupperMargin() const {
    return getAttributeValue(GrxUni::_upperMargin);
}
const XMLCh* ChartDimension::getlowerMargin() const {
    return getAttributeValue(GrxUni::_lowerMargin);
}
ChartElement ChartDimension::getPositionAesthetic() const {
    return ChartFrame(getParent()).getPositionAesthetic(getrole());
}

// ChartParameter, ChartGuide, ChartVariable

ChartVariable ChartParameter::getVariable() const {
    const XMLCh* name = getName();
    if (isEmpty(name))
        return ChartVariable();
    DOMElement* owner = getElementWithAttribute(kFacetVariable, GrxUni::_role, name);
    if (owner == nullptr)
        owner = getFirstElementByTagName(name);
    return owner ? ChartVariable(variableById(*this, owner->getAttribute(GrxUni::_variable))) : ChartVariable();
}

const XMLCh* ChartGuide::getName() const {
    return element_ ? getFirstParameter().getName() : nullptr;
}
ChartParameter ChartGuide::getFirstParameter() const {
    return ChartParameter(getFirstChildByTagName(GrxUni::_parameter));
}

bool ChartVariable::isLegendVariable() const {
    const XMLCh* id = getAttributeValue(GrxUni::_id);
    if (isEmpty(id))
        return false;
    bool shown = false;
    plotaid::detail::forEachDescendant(getGraph(), kStyleBy, [&](DOMElement* styleBy) {
        shown = XMLString::equals(styleBy->getAttribute(GrxUni::_variable), id) &&
                !isEmpty(styleBy->getAttribute(GrxUni::_id)) &&
                getElementWithAttribute(kLegendTarget, GrxUni::_aesthetic, styleBy->getAttribute(GrxUni::_id));
        return !shown;
    });
    return shown;
}

// ChartFrame

const XMLCh* ChartFrame::getFacetRole() const {
    DOMElement* facet = element_ ? firstDescendant(element_, kFacetVariable) : nullptr;
    return facet ? facet->getAttribute(GrxUni::_role) : nullptr;
}
ChartElement ChartFrame::getPositionAesthetic(const XMLCh* role) const {
    return element_ && !isEmpty(role) ? ChartElement(firstDescendant(element_, role)) : ChartElement();
}
ChartDimension ChartFrame::getFacetDimension() const {
    const XMLCh* role = getFacetRole();
    return isEmpty(role) ? ChartDimension() : ChartDimension(getElementWithAttribute(GrxUni::_dimension, GrxUni::_role, role));
}
const XMLCh* ChartFrame::getRoleVariableId(const XMLCh* role) const {
    return getPositionAesthetic(role).getAttributeValue(GrxUni::_variable);
}
bool ChartFrame::isFacetCategorical() const {
    return ChartGraph(getGraph()).isCategorical(getRoleVariableId(getFacetRole()));
}

// ChartElementElement

const XMLCh* ChartElementElement::getRoleVariable(const XMLCh* role) const {
    DOMElement* aesthetic = element_ && !isEmpty(role) ? firstDescendant(element_, role) : nullptr;
    return aesthetic ? aesthetic->getAttribute(GrxUni::_variable) : nullptr;
}
bool ChartElementElement::isInterpolationLine() const {
    return equals(getType(), GrxUni::_line) && firstDescendant(element_, GrxUni::_interpolation) != nullptr;
}
bool ChartElementElement::isRangeBar() const {
    if (!equals(getType(), GrxUni::_interval))
        return false;
    DOMElement* statistic = ChartBase::getChildByTagName(getFirstElementByTagName(GrxUni::_y), GrxUni::_statistic);
    return statistic != nullptr && XMLString::equals(statistic->getAttribute(GrxUni::_method), GrxUni::_range);
}
bool ChartElementElement::isDifferenceLine() const {
    const XMLCh* other = equals(getType(), GrxUni::_area)   ? GrxUni::_line
                         : equals(getType(), GrxUni::_line) ? GrxUni::_area
                                                            : nullptr;
    return other != nullptr && getElementWithAttribute(GrxUni::_element, GrxUni::_type, other) != nullptr;
}

// ChartAxis, ChartFacetLabeling, ChartFacetLabel

namespace {

// Which parent an axis answers through: 1 a dimension, 2 a facet label, 0 neither.
int axisParent(const ChartElement& axis) {
    DOMElement* parent = axis.getParent();
    return isNamed(parent, GrxUni::_dimension) ? 1 : isNamed(parent, kFacetLabel) ? 2 : 0;
}

} // namespace

bool ChartAxis::isCategorical() const {
    switch (axisParent(*this)) {
    case 1:
        return ChartDimension(getParent()).isCategorical();
    case 2:
        return ChartFacetLabel(getParent()).isCategorical();
    default:
        return false;
    }
}
ChartElement ChartAxis::getPositionAesthetic() const {
    switch (axisParent(*this)) {
    case 1:
        return ChartDimension(getParent()).getPositionAesthetic();
    case 2:
        return ChartFacetLabel(getParent()).getPositionAesthetic();
    default:
        return ChartElement();
    }
}
ChartDimension ChartAxis::getDimension() const {
    switch (axisParent(*this)) {
    case 1:
        return ChartDimension(getParent());
    case 2:
        return ChartFacetLabel(getParent()).getDimension();
    default:
        return ChartDimension();
    }
}

bool ChartFacetLabeling::isCategorical() const {
    return element_ && ChartFrame(getParent()).isFacetCategorical();
}
ChartElement ChartFacetLabeling::getPositionAesthetic() const {
    const ChartFrame frame(getParent());
    return frame.getPositionAesthetic(frame.getFacetRole());
}
ChartDimension ChartFacetLabeling::getDimension() const {
    return ChartFrame(getParent()).getFacetDimension();
}

bool ChartFacetLabel::isCategorical() const {
    return ChartFacetLabeling(getParent()).isCategorical();
}
ChartElement ChartFacetLabel::getPositionAesthetic() const {
    return ChartFacetLabeling(getParent()).getPositionAesthetic();
}
ChartDimension ChartFacetLabel::getDimension() const {
    return ChartFacetLabeling(getParent()).getDimension();
}

// ChartGraph

DOMElement* ChartGraph::getFirstElementByTagName(const XMLCh* tag) const {
    return element_ == nullptr || isEmpty(tag) ? nullptr : firstDescendant(element_, tag);
}
bool ChartGraph::isCategorical(const XMLCh* id) const {
    if (element_ == nullptr || isEmpty(id))
        return false;
    if (DOMElement* domain = getElementWithAttribute(GrxUni::_domain, GrxUni::_id, id))
        return ChartElement(domain).isCategorical();
    return ChartElement(variableById(*this, id)).isCategorical();
}
ChartVariable ChartGraph::getVariable(const XMLCh* tag) const {
    DOMElement* owner = getFirstElementByTagName(tag);
    return owner ? ChartVariable(variableById(*this, owner->getAttribute(GrxUni::_variable))) : ChartVariable();
}
int ChartGraph::getChartType() const {
    if (element_ == nullptr)
        return 0;
    const auto statistic = [&](const XMLCh* method) {
        return getOffspringWithAttribute(GrxUni::_statistic, GrxUni::_method, method) != nullptr;
    };
    if (statistic(kHistogram))
        return 3;
    if (statistic(GrxUni::_cumulativeSum))
        return 5;
    if (statistic(kTukeyInnerFence))
        return 1;
    if (statistic(GrxUni::_range))
        return 2;
    if (firstDescendant(element_, GrxUni::_theta) != nullptr)
        return 6;
    if (getOffspringWithAttribute(GrxUni::_element, GrxUni::_type, GrxUni::_interval) == nullptr)
        return 7;
    int elements = 0;
    plotaid::detail::forEachDescendant(element_, GrxUni::_element, [&](DOMElement*) { return ++elements < 2; });
    return elements > 1 ? 4 : 0;
}
