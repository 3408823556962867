#ifndef PLOTAID_TEMPLATES_ACTIONS_FITLINES_H
#define PLOTAID_TEMPLATES_ACTIONS_FITLINES_H

// Statistical lines added to the data elements of a graph: fit lines with their confidence lines,
// spikes and R-squared label; interpolation lines through points; the density of a distribution
// over a histogram; spikes from points to a reference; and projection lines cut at a category.
#include "templates/actions/Actions.h"

namespace plotaid::detail {

class TFitLine final : public BaseTemplate {
public:
    TFitLine(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

private:
    void restyle(GrrUviza& graph, const GrxCoordinates& coordinates);
    void add(GrrUviza& graph, GrxCoordinates& coordinates, CTElementType& element, bool total);
    void addSpikes(GrrUviza& graph, GrxCoordinates& coordinates, CTElementType& element, GrxLine& line,
                   const GrxSmoothStatistic& fit);
    void addRSquared(GrxLine& line, bool total);
    GrxLine* addConfidenceLine(GrrUviza& graph, GrxCoordinates& coordinates, GrxLine& line);

    const DOMElement* mainStyle_ = nullptr;
    const DOMElement* style1_ = nullptr;
    const DOMElement* confidence_ = nullptr;
    bool primary_, styleOnly_, spikes_, colorSpikes_, rSquared_;
    ChartString fitTarget_, type_, proportion_, kernel_, bandwidth_, intercept_;
    ChartString totalLabel_, confidenceLabel_, message_;
};

class TInterpolationLine final : public BaseTemplate {
public:
    TInterpolationLine(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

private:
    const DOMElement* style_ = nullptr;
    const DOMElement* interpolation_ = nullptr;
    bool primary_ = false;
    ChartString type_, missing_, pointPosition_;
};

class THistogramNormalLine final : public BaseTemplate {
public:
    THistogramNormalLine(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

private:
    CTElementType* histogramOf(const GrrUviza& graph) const;

    const DOMElement* style_ = nullptr;
    int distribution_ = 0;
    bool valid_ = true;
    ChartString parameter_, secondary_, nameKey_;
};

class TAddSpikes final : public BaseTemplate {
public:
    TAddSpikes(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

private:
    int x_ = 0, y_ = 0, z_ = 0; // reference codes; 0 leaves the role alone
    const DOMElement* style_ = nullptr;
    bool styleOnly_ = false, colorSpikes_ = false;
};

class TSetProjectionLine final : public BaseTemplate {
public:
    TSetProjectionLine(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

private:
    bool before_ = false;
    ChartString high_, low_, category_;
    bool hasCategory_ = false;
};

} // namespace plotaid::detail

#endif
