// The template action base: what every action works on and the look-ups they share.
#include <plotaid/BaseTemplate.h>

#include "templates/Kit.h"

#include <plotaid/ChartBase.h>

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLString.hpp>

using namespace XERCES_CPP_NAMESPACE;

const XMLCh* const BaseTemplate::_before = u"before";
const XMLCh* const BaseTemplate::_casenum = u"casenum";
const XMLCh* const BaseTemplate::_categoryValue = u"categoryValue";
const XMLCh* const BaseTemplate::_clustered = u"clustered";
const XMLCh* const BaseTemplate::_derived = u"derived";
const XMLCh* const BaseTemplate::_diffln = u"diffln";
const XMLCh* const BaseTemplate::_dropline = u"dropline";
const XMLCh* const BaseTemplate::_errorbar = u"errorbar";
const XMLCh* const BaseTemplate::_frameId = u"frameId";
const XMLCh* const BaseTemplate::_gridLines = u"gridLines";
const XMLCh* const BaseTemplate::_hilo = u"hilo";
const XMLCh* const BaseTemplate::_legendFrameStyle = u"legendFrameStyle";
const XMLCh* const BaseTemplate::_legendLabelStyle = u"legendLabelStyle";
const XMLCh* const BaseTemplate::_legendStyle = u"legendStyle";
const XMLCh* const BaseTemplate::_legend_1 = u"_legend_1";
const XMLCh* const BaseTemplate::_multiple = u"multiple";
const XMLCh* const BaseTemplate::_parentFrameId = u"parentFrameId";
const XMLCh* const BaseTemplate::_pie = u"pie";
const XMLCh* const BaseTemplate::_populationPyramid = u"populationPyramid";
const XMLCh* const BaseTemplate::_scalar = u"scalarDot";
const XMLCh* const BaseTemplate::_scatter = u"scatter";
const XMLCh* const BaseTemplate::_styleOnly = u"styleOnly";
const XMLCh* const BaseTemplate::_textFrame = u"textFrame";
const XMLCh* const BaseTemplate::_tickLabelStyle = u"tickLabelStyle";
const XMLCh* const BaseTemplate::_when = u"facet1==facet2";
const XMLCh* const BaseTemplate::_xaxis_title = u"xaxis_title";
const XMLCh* const BaseTemplate::_y2 = GrxUni::_y2;
const XMLCh* const BaseTemplate::_yaxis_title = u"yaxis_title";
const XMLCh* const BaseTemplate::_zaxis_title = u"zaxis_title";

namespace {

// Position of `node` among the "coordinates" elements directly below its parent; -1 when absent.
long coordinatesPosition(const DOMNode* node) {
    const DOMNode* parent = node ? node->getParentNode() : nullptr;
    if (parent == nullptr)
        return -1;
    long position = 0;
    for (const DOMNode* n = parent->getFirstChild(); n; n = n->getNextSibling()) {
        if (n->getNodeType() != DOMNode::ELEMENT_NODE ||
            !XMLString::equals(n->getNodeName(), GrxUni::_coordinates))
            continue;
        if (n == node)
            return position;
        ++position;
    }
    return -1;
}

bool isExpressionWithSlash(const CTCoordinate* coordinate) {
    if (coordinate == nullptr)
        return false;
    const auto* expression = dynamic_cast<const GrxExpressionVariable*>(coordinate->getVariable());
    return expression != nullptr && ChartString(expression->getValue()).ContainsString(u"/");
}

} // namespace

BaseTemplate::BaseTemplate(const GrxVisualization* source, GrxVisualization& target,
                           const DOMElement* instruction)
    : target_(target), source_(source), instruction_(instruction) {}

BaseTemplate::BaseTemplate(const GrxVisualization* source, GrxVisualization& target)
    : target_(target), source_(source), instruction_(nullptr) {}

BaseTemplate::~BaseTemplate() = default;

ChartString BaseTemplate::CreateUniqueId(const ChartString& prefix) const {
    return ChartBase::CreateUniqueId(prefix, target_);
}

ChartString BaseTemplate::CreateUniqueId(const std::string& prefix) const {
    return ChartBase::CreateUniqueId(ChartString(prefix), target_);
}

GrxStyle& BaseTemplate::addStyle(GrxBaseElement& element, const XMLCh* id) {
    ChartString styleId(id);
    if (styleId.empty())
        styleId = CreateUniqueId(ChartString(GrxUni::_style));
    if (element.doesIdExist(styleId)) {
        if (GrxStyle* existing = element.getStyleById(styleId))
            return *existing;
        // Taken by something other than a style: a second element with that id would take the id
        // away from the first, so the new style gets a free id of its own.
        styleId = CreateUniqueId(styleId);
    }
    GrxVisualization* visualization = element.getVisualization();
    if (visualization == nullptr)
        visualization = &target_;
    GrxStyle* container = element.getStyleById(ChartBase::_container);
    if (container == nullptr) {
        container = &visualization->addStyle();
        container->setId(ChartBase::_container);
    }
    GrxStyle& style = container->addStyle();
    style.setId(styleId);
    return style;
}

std::uint32_t BaseTemplate::getGraphs(std::vector<GrrUviza*>& graphs) const {
    // One walk serves both the selection and the count.
    const std::vector<GrrUviza*> all = plotaid::detail::allGraphs(target_);
    const std::vector<GrrUviza*> selected = plotaid::detail::selectedGraphs(all, instruction_);
    graphs.insert(graphs.end(), selected.begin(), selected.end());
    return static_cast<std::uint32_t>(all.size());
}

std::vector<GrxLegend*> BaseTemplate::getLegends() const {
    return plotaid::detail::allOfKind<GrxLegend>(target_, GrxUni::_legend);
}

void BaseTemplate::getAllElements(const GrrUviza& graph, std::vector<CTElementType*>& elements) {
    const std::vector<CTElementType*> own = plotaid::detail::elementsOf(graph);
    elements.insert(elements.end(), own.begin(), own.end());
}

void BaseTemplate::getAllElementsByType(const XMLCh* name, std::vector<CTElementType*>& elements) const {
    const std::vector<CTElementType*> found = plotaid::detail::allOfKind<CTElementType>(target_, name);
    elements.insert(elements.end(), found.begin(), found.end());
}

std::vector<CTElementType*> BaseTemplate::getElementsWithSummaryStatistics(const GrrUviza& graph) const {
    std::vector<CTElementType*> all, found;
    getAllElements(graph, all);
    for (CTElementType* element : all) {
        const std::vector<GrxSummaryStatistic*> statistics = element->getSummaryStatistics();
        if (statistics.empty())
            continue;
        const int method = statistics.front()->getMethod();
        if (method == grx::SummaryMethod::binPercent || method == grx::SummaryMethod::histogram)
            found.push_back(element);
    }
    return found;
}

std::vector<CTAesthetic*> BaseTemplate::getAesthetics(const CTElementType& element) const {
    return plotaid::detail::aestheticsOf(element);
}

std::uint32_t BaseTemplate::getIntervalElements(std::vector<GrxInterval*>& intervals, bool polar) const {
    std::vector<GrrUviza*> graphs;
    getGraphs(graphs);
    for (GrrUviza* graph : graphs) {
        if (graph == nullptr || isGraphPolar(*graph) != polar)
            continue;
        const std::vector<GrxInterval*> own = graph->getIntervals();
        intervals.insert(intervals.end(), own.begin(), own.end());
    }
    return static_cast<std::uint32_t>(intervals.size());
}

CTElementType* BaseTemplate::getFirstSPLOMElement(const GrrUviza& graph) const {
    std::vector<CTElementType*> all;
    getAllElements(graph, all);
    for (CTElementType* element : all)
        if (isExpressionWithSlash(element->getX()) && isExpressionWithSlash(element->getY()))
            return element;
    return nullptr;
}

std::vector<GrxDimension*> BaseTemplate::getDimensionsByRole(const GrrUviza& graph,
                                                             const ChartString& role) const {
    std::vector<GrxDimension*> found;
    const bool x = role.equals(GrxUni::_x), y = role.equals(GrxUni::_y), y2 = role.equals(_y2),
               z = role.equals(GrxUni::_z);
    if (!x && !y && !y2 && !z)
        return found;
    unsigned c = 0;
    for (GrxCoordinates* coordinates : graph.getCoordinatess()) {
        unsigned k = 0;
        for (DOMNode* n = coordinates->getImplementation()->getFirstChild(); n; n = n->getNextSibling()) {
            if (n->getNodeType() != DOMNode::ELEMENT_NODE)
                continue;
            auto* dimension = GrxBaseElement::wrapperOf<GrxDimension>(n);
            const bool reference = GrxBaseElement::wrapperOf<GrxDimensionReference>(n) != nullptr;
            if (dimension == nullptr && !reference)
                continue;
            ++k;
            if (dimension == nullptr)
                continue;
            if ((k == 1 && x) || (k == 2 && y && c == 0) || (k == 2 && y2 && c == 1) || (k == 3 && z))
                found.push_back(dimension);
        }
        ++c;
    }
    return found;
}

CTVariableType* BaseTemplate::getElementVariable(const CTElementType& element,
                                                 const ChartString& role) const {
    const auto variableOf = [](const CTCoordinate* coordinate) {
        return coordinate ? coordinate->getVariable() : nullptr;
    };
    if (role.equals(GrxUni::_x)) {
        std::vector<GrrUviza*> graphs;
        getGraphs(graphs);
        if (graphs.empty())
            return nullptr;
        for (GrxDimension* dimension : getDimensionsByRole(*graphs.front(), ChartString(GrxUni::_x)))
            if (CTVariableType* cluster = dimension->getClusterVariable())
                return cluster;
        return variableOf(element.getX());
    }
    if (role.equals(GrxUni::_y))
        return variableOf(element.getY());
    if (role.equals(GrxUni::_z))
        return variableOf(element.getZ());
    return nullptr;
}

void BaseTemplate::copyVariables(CTElementType& to, const CTElementType& from) const {
    if (const CTCoordinate* x = from.getX(); x && x->getVariable())
        to.addX().setVariable(*x->getVariable());
    if (const CTCoordinate* y = from.getY(); y && y->getVariable())
        to.addY().setVariable(*y->getVariable());
    if (const CTCoordinate* z = from.getZ(); z && z->getVariable())
        to.addZ().setVariable(*z->getVariable());
}

void BaseTemplate::addZDimension(GrrUviza& graph) const {
    for (GrxCoordinates* coordinates : graph.getCoordinatess())
        if (coordinates->getDimensions().size() + coordinates->getDimensionReferences().size() == 2)
            coordinates->addDimension();
}

bool BaseTemplate::isGraphPolar(const GrrUviza& graph) const {
    for (const GrxCoordinates* coordinates : graph.getCoordinatess())
        if (!coordinates->getPolarTransforms().empty())
            return true;
    return false;
}

bool BaseTemplate::isGraphClustered(const GrrUviza& graph) const {
    for (const XMLCh* role : {GrxUni::_x, GrxUni::_z})
        for (const GrxDimension* dimension : getDimensionsByRole(graph, ChartString(role)))
            if (dimension->getClusterVariable() != nullptr)
                return true;
    return false;
}

bool BaseTemplate::isChartTrue3D(const GrrUviza& graph) const {
    bool hasAxis = false;
    for (const GrxDimension* dimension : getDimensionsByRole(graph, ChartString(GrxUni::_z)))
        hasAxis = hasAxis || !dimension->getAxiss().empty();
    if (!hasAxis)
        return false;
    std::vector<CTElementType*> all;
    getAllElements(graph, all);
    for (const CTElementType* element : all)
        if (element->getZ() != nullptr)
            return true;
    return false;
}

bool BaseTemplate::isIntervalRangeElement(const CTElementType& element) const {
    if (dynamic_cast<const GrxInterval*>(&element) == nullptr)
        return false;
    for (const GrxSummaryStatistic* statistic : element.getSummaryStatistics())
        if (statistic->getMethod() == grx::SummaryMethod::range)
            return true;
    return false;
}

bool BaseTemplate::isAxisDerived(const GrxAxis& axis) const {
    return axis.getTransform() != grx::AxisTransform::none;
}

bool BaseTemplate::getBooleanAttribute(const DOMElement* element, const XMLCh* name, bool absent) {
    return plotaid::detail::booleanAttribute(element, name, absent);
}

bool BaseTemplate::doesCoordinateMatch(const CTElementType& element, const ChartString& number) const {
    const unsigned wanted = number.convertToInteger();
    const GrxCoordinates* coordinates = element.getCoordinates();
    if (coordinates == nullptr)
        return wanted == 0;
    const long position = coordinatesPosition(coordinates->getImplementation());
    return position >= 0 && static_cast<unsigned long>(position) == wanted;
}

bool BaseTemplate::doesCoordinateMatch(const GrxBaseElement& element, const ChartString& name) const {
    const DOMNode* node = element.getImplementation();
    while (node != nullptr && !(node->getNodeType() == DOMNode::ELEMENT_NODE &&
                                XMLString::equals(node->getNodeName(), GrxUni::_coordinates) &&
                                GrxBaseElement::wrapperOf(node) != nullptr))
        node = node->getParentNode();
    if (node == nullptr)
        return false;
    const long wanted = name.equals(_y2) ? 1 : 0;
    return coordinatesPosition(node) == wanted;
}
