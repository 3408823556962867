// What a graph's roles say about categories: whether a role is categorical, which domain lists its
// categories, which variables feed the legend, and which value a relabelled category stands for.
// These read the target and change nothing.

#include "templates/Kit.h"

#include <plotaid/BaseTemplate.h>

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

using namespace plotaid::detail;

namespace {

// A variable counts as categorical here only when its attribute is exactly 1; the category actions
// take any non-zero value.
bool categorical(const CTVariableType* variable) {
    return variable != nullptr && variable->getCategorical() == 1;
}

GrxCategoricalDomain* domainOf(const CTCoordinate* coordinate) {
    const CTVariableType* variable = coordinate ? coordinate->getVariable() : nullptr;
    return variable ? variable->getCategoricalDomain() : nullptr;
}

GrxCategoricalDomain* domainOf(const CTAesthetic& aesthetic) {
    if (auto* own = dynamic_cast<GrxCategoricalDomain*>(aesthetic.getDomain()))
        return own;
    const CTVariableType* variable = aesthetic.getVariable();
    return variable ? variable->getCategoricalDomain() : nullptr;
}

} // namespace

bool BaseTemplate::isRoleCategorical(const GrrUviza& graph, const ChartString& role) const {
    for (const GrxDimension* dimension : getDimensionsByRole(graph, role))
        if (dimension->getClusterVariable() != nullptr)
            return true;
    if (role.empty())
        return false;
    const XERCES_CPP_NAMESPACE::DOMNodeList* nodes = graph.getImplementation()->getElementsByTagName(role.xc_str());
    for (XMLSize_t i = 0; i < nodes->getLength(); ++i) {
        const CTCoordinate* coordinate = GrxBaseElement::wrapperOf<CTCoordinate>(nodes->item(i));
        if (coordinate != nullptr && categorical(coordinate->getVariable()))
            return true;
    }
    return false;
}

GrxCategoricalDomain* BaseTemplate::getCategoricalDomain(const GrrUviza& graph, const ChartString& role,
                                                         const CTElementType* element) const {
    if (element != nullptr) {
        GrxCategoricalDomain* found = nullptr;
        if (role.equals(GrxUni::_x))
            found = domainOf(element->getX());
        else if (role.equals(GrxUni::_z))
            found = domainOf(element->getZ());
        else if (role.equals(GrxUni::_legend))
            for (const CTAesthetic* aesthetic : aestheticsOf(*element, AestheticList::LegendDomains))
                if ((found = domainOf(*aesthetic)) != nullptr)
                    break;
        if (found != nullptr)
            return found;
    }
    for (const GrxDimension* dimension : getDimensionsByRole(graph, role))
        if (auto* domain = dynamic_cast<GrxCategoricalDomain*>(dimension->getDomain()))
            return domain;
    return nullptr;
}

std::vector<CTVariableType*> BaseTemplate::getLegendVariables(const GrrUviza& graph,
                                                              const ChartString& role) const {
    std::vector<CTVariableType*> variables;
    const bool legend = role.equals(GrxUni::_legend);
    for (const CTElementType* element : elementsOf(graph)) {
        const CTVariableType* roleVariable = getElementVariable(*element, role);
        for (const CTAesthetic* aesthetic : aestheticsOf(*element)) {
            CTVariableType* variable = aesthetic->getVariable();
            if (variable != nullptr && (legend || variable == roleVariable))
                variables.push_back(variable);
        }
    }
    return variables;
}

ChartString BaseTemplate::getCategoryValue(const GrrUviza& graph, const XMLCh* role,
                                           const ChartString& label) const {
    const ChartString wanted(role);
    const bool x = wanted.equals(GrxUni::_x), y = wanted.equals(GrxUni::_y), z = wanted.equals(GrxUni::_z);
    if (!x && !y && !z)
        return ChartString();
    // Only x looks past the element, to a cluster variable of the graph's x dimensions.
    CTVariableType* cluster = nullptr;
    if (x)
        for (const GrxDimension* dimension : getDimensionsByRole(graph, wanted))
            if ((cluster = dimension->getClusterVariable()) != nullptr)
                break;
    for (const CTElementType* element : elementsOf(graph)) {
        const CTCoordinate* coordinate = x ? element->getX() : y ? element->getY() : element->getZ();
        const CTVariableType* variable = cluster ? cluster : coordinate ? coordinate->getVariable() : nullptr;
        const std::vector<GrxFormat*> formats = variable ? variable->getFormats() : std::vector<GrxFormat*>();
        if (formats.empty())
            continue;
        // The first relabel to this label answers for the element, even with nothing to say.
        for (const GrxRelabel* relabel : formats.front()->getRelabels()) {
            if (!label.equals(relabel->getTo()))
                continue;
            if (hasText(relabel->getFrom()))
                return ChartString(relabel->getFrom());
            break;
        }
    }
    return ChartString();
}
