#ifndef PLOTAID_TEMPLATES_ACTIONS_CATEGORIES_H
#define PLOTAID_TEMPLATES_ACTIONS_CATEGORIES_H

// Which categories a chart shows and in which order, and simple layout switches of graphs and
// their coordinates.
#include "templates/actions/Actions.h"

namespace plotaid::detail {

// Fixes the order of the categories of a role's variables.
class TSetOrder final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const ChartString role_ = attributeOf(instruction_, GrxUni::_role);
};

class TSetCategorySorting final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;
};

// Removes categories of a role's variables.
class TSetExclude final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const ChartString role_ = attributeOf(instruction_, GrxUni::_role);
};

// Collapses small categories into one named category, shown last.
class TSetCollapse final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const ChartString name_ = attributeOf(instruction_, u"categoryName");
    const ChartString role_ = attributeOf(instruction_, GrxUni::_role);
    const double minFraction_ = attributeOf(instruction_, GrxUni::_minFraction).convertToDouble();
};

class TSetWrapPanels final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const bool wrap_ = booleanAttribute(instruction_, u"wrap", false);
};

class TSetTranspose final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const bool transpose_ = booleanAttribute(instruction_, u"transpose", false);
};

// Start angle, cycles and direction of polar graphs.
class TSetPieTranspose final : public BaseTemplate {
public:
    TSetPieTranspose(const GrxVisualization* source, GrxVisualization& target,
                     const XERCES_CPP_NAMESPACE::DOMElement* instruction);
    bool apply() override;

private:
    double startAngle_ = 0;
    double cycles_ = 1.0;
    bool counterClockwise_ = false;
};

class TSetClusterWidth final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;
};

// Stacked elements become percentages of their total.
class TSetScaleByFraction final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;
};

// Mirrors panels, sets the gap between facet panels and styles the facet axes.
class TSetPanelOptions final : public BaseTemplate {
public:
    TSetPanelOptions(const GrxVisualization* source, GrxVisualization& target,
                     const XERCES_CPP_NAMESPACE::DOMElement* instruction);
    bool apply() override;

private:
    const XERCES_CPP_NAMESPACE::DOMElement* mark_ = nullptr;
    const XERCES_CPP_NAMESPACE::DOMElement* tick_ = nullptr;
    const XERCES_CPP_NAMESPACE::DOMElement* tickFrame_ = nullptr;
    const XERCES_CPP_NAMESPACE::DOMElement* axis_ = nullptr;
    const XERCES_CPP_NAMESPACE::DOMElement* label_ = nullptr;
    const XERCES_CPP_NAMESPACE::DOMElement* labelFrame_ = nullptr;
    ChartString gap_;
    bool reflectX_ = false, reflectY_ = false, removeReflections_ = false;
};

// Histograms or normal curves in the diagonal panels of a scatterplot matrix, or no diagonal points.
class TAddChartsOnDiagonal final : public BaseTemplate {
public:
    TAddChartsOnDiagonal(const GrxVisualization* source, GrxVisualization& target,
                         const XERCES_CPP_NAMESPACE::DOMElement* instruction);
    bool apply() override;

private:
    const XERCES_CPP_NAMESPACE::DOMElement* style_ = nullptr;
    const XERCES_CPP_NAMESPACE::DOMElement* normalLine_ = nullptr;
    const XERCES_CPP_NAMESPACE::DOMElement* normalLineStyle_ = nullptr;
    const XERCES_CPP_NAMESPACE::DOMElement* binning_ = nullptr;
    bool styleOnly_ = false;
    int kind_ = -1; // 0 none, 1 histogram, 2 normal curve; -1 refuses
};

} // namespace plotaid::detail

#endif
