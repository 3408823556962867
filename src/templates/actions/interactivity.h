#ifndef PLOTAID_TEMPLATES_ACTIONS_INTERACTIVITY_H
#define PLOTAID_TEMPLATES_ACTIONS_INTERACTIVITY_H

// Binning, error bars and interactivity: histogram and scatterplot bins, error bar options, popups
// and drill-downs.
#include "templates/actions/Actions.h"

namespace plotaid::detail {

class THistogramBinning final : public BaseTemplate, public ResultCarriesNothing {
public:
    THistogramBinning(const GrxVisualization* source, GrxVisualization& target,
                      const XERCES_CPP_NAMESPACE::DOMElement* instruction);
    bool apply() override;

private:
    ChartString count_, width_, start_;
};

class TSetErrorBarOptions final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const XERCES_CPP_NAMESPACE::DOMElement* style_ = firstDescendantNamed(instruction_, GrxUni::_style);
    const bool visible_ = booleanAttribute(instruction_, GrxUni::_visible, false);
};

// A popup on every element naming its x, y, z and legend values.
class TAddPopups final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const bool x_ = booleanAttribute(instruction_, GrxUni::_x, false);
    const bool y_ = booleanAttribute(instruction_, GrxUni::_y, true);
    const bool z_ = booleanAttribute(instruction_, GrxUni::_z, false);
    const bool legend_ = booleanAttribute(instruction_, GrxUni::_legend, false);
};

class TAddDrilldowns final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;
};

// Bins the points of a scatterplot on a grid or in hexagons, shown by size or colour with a legend.
class TSetScatterplotBinning final : public BaseTemplate {
public:
    TSetScatterplotBinning(const GrxVisualization* source, GrxVisualization& target,
                           const XERCES_CPP_NAMESPACE::DOMElement* instruction);
    bool apply() override;

private:
    void addLegend(GrrUviza& graph, std::size_t position, GrxBaseElement& aesthetic, CTVariableType& variable);
    CTVariableType* binnedVariable(const CTElementType& point) const;
    void addSize(GrrUviza& graph, std::size_t position, GrxPoint& point);
    void addColorComponent(GrrUviza& graph, std::size_t position, GrxPoint& point);

    const XERCES_CPP_NAMESPACE::DOMElement* legendStyle_;
    const XERCES_CPP_NAMESPACE::DOMElement* legendFrameStyle_;
    const XERCES_CPP_NAMESPACE::DOMElement* legendLabelStyle_;
    const XERCES_CPP_NAMESPACE::DOMElement* label_;
    bool size_;
    ChartString method_, count_, width_, start_, location_, gridType_, high_, low_;
};

// Whether a colour reads as dark: a dark colour name, or "#rrggbb" below half brightness.
bool isDarkColor(const ChartString& color);

} // namespace plotaid::detail

#endif
