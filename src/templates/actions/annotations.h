#ifndef PLOTAID_TEMPLATES_ACTIONS_ANNOTATIONS_H
#define PLOTAID_TEMPLATES_ACTIONS_ANNOTATIONS_H

// Annotation actions: guides added to graphs, or guides already there restyled. A point guide
// carries a text at a data position, a line guide marks a value of an axis, a function guide draws
// an expression, a rectangle guide shades a range, and the origin line is a line guide the chart's
// extension names as such.
#include "templates/actions/Actions.h"

namespace plotaid::detail {

// An x, y or z value of an instruction, with whether it names a category by its label.
struct GuideValue {
    ChartString text;
    bool categorical = false;
    bool categoricalGiven = false; // the instruction's own "<role>categorical" attribute was there
};

class TAnchoredAnnotation final : public BaseTemplate {
public:
    TAnchoredAnnotation(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

private:
    bool styleOnly_ = false;
    const DOMElement* label_ = nullptr;
    GuideValue x_, y_, z_;
    ChartString name_;
};

class TReferenceLine final : public BaseTemplate {
public:
    TReferenceLine(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

private:
    void functionLine(GrrUviza& graph, GrxCoordinates* coordinates);
    void valueLines(GrrUviza& graph, GrxCoordinates* coordinates);

    const DOMElement* style_ = nullptr;
    const DOMElement* label_ = nullptr;
    bool styleOnly_ = false;
    bool function_ = false;
    int segments_ = 0;
    GuideValue x_, y_, z_;
    ChartString name_;
    std::uint32_t coordinate_ = 0;
};

class TReferenceRectangle final : public BaseTemplate {
public:
    TReferenceRectangle(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

private:
    bool selects(const GrxRectangleGuide& guide, const ChartString (&v)[4]) const;

    const DOMElement* style_ = nullptr;
    const DOMElement* label_ = nullptr;
    bool styleOnly_ = false;
    ChartString id_, x1_, x2_, y1_, y2_, name_, zOrder_;
    bool xCategorical_ = false, yCategorical_ = false;
    std::uint32_t coordinate_ = 0;
};

class TAddOriginLine final : public BaseTemplate {
public:
    TAddOriginLine(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

private:
    ChartString value_, role_;
    const DOMElement* style_ = nullptr;
};

} // namespace plotaid::detail

#endif
