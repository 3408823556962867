#ifndef PLOTAID_TEMPLATES_ACTIONS_AXES_H
#define PLOTAID_TEMPLATES_ACTIONS_AXES_H

// Axis actions: scales, intervals, margins, styles and titles, ticks, the side an axis is drawn on,
// derived axes, and the angle, format and frequency of tick labels. An axis is reached through the
// dimensions of a graph that play the instruction's role.
#include "templates/actions/Actions.h"

namespace plotaid::detail {

// Whether a graph's role is categorical, when the instruction asks about it at all.
struct CategoricalFilter {
    bool given;
    bool wanted;
    bool passes(const BaseTemplate& action, const GrrUviza& graph, const ChartString& role) const {
        return !given || action.isRoleCategorical(graph, role) == wanted;
    }
};

class TSetAxisScale final : public BaseTemplate {
public:
    TSetAxisScale(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

private:
    ChartString role_, origin_;
    int method_ = grx::ScaleMethod::linear;
    bool invert_ = false;
    bool baseGiven_ = false;
    double base_ = 0.0;
};

class TSetAxisInterval final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const ChartString role_ = attributeOf(instruction_, GrxUni::_role);
    const ChartString min_ = attributeOf(instruction_, GrxUni::_min);
    const ChartString max_ = attributeOf(instruction_, GrxUni::_max);
};

class TSetAxisMargin final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const ChartString role_ = attributeOf(instruction_, GrxUni::_role);
};

class TSetAxisStyle final : public BaseTemplate {
public:
    TSetAxisStyle(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

private:
    ChartString role_;
    CategoricalFilter categorical_{false, false};
    bool derived_ = false;
    const DOMElement* style_ = nullptr;
    const DOMElement* labelStyle_ = nullptr;      // the axis-label style numbered otherwise than 1
    const DOMElement* labelFrameStyle_ = nullptr; // numbered 1
    const DOMElement* label_ = nullptr;
};

class TSetAxisMajorTicks final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const DOMElement* const ticks_ = firstDescendantNamed(instruction_, GrxUni::_majorTicks);
};

class TSetAxisMinorTicks final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const DOMElement* const ticks_ = firstDescendantNamed(instruction_, GrxUni::_minorTicks);
};

class TSetAxisOpposite final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;
};

class TAddDerivedAxis final : public BaseTemplate, public ResultCarriesNothing {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    void transformAxes(GrxDimension& dimension);
    void styleDerivedAxes(GrxDimension& dimension);

    const ChartString role_ = attributeOf(instruction_, GrxUni::_role);
    const DOMElement* const label_ = lastChildNamed(instruction_, GrxUni::_label);
    const DOMElement* const majorTicks_ = lastChildNamed(instruction_, GrxUni::_majorTicks);
    const DOMElement* const minorTicks_ = lastChildNamed(instruction_, GrxUni::_minorTicks);
    const DOMElement* const transform_ = lastChildNamed(instruction_, GrxUni::_transform);
    const DOMElement* const style_ = lastChildNamed(instruction_, GrxUni::_style);
};

// The three tick label actions share their selection of axes; each sets one thing on the major
// ticks of the axes selected.
class TickLabelAction : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() final;

protected:
    // False when the instruction cannot be carried out at all.
    virtual bool valid() const { return true; }
    virtual bool hasValue() const { return true; }
    virtual void set(GrxMajorTicks& ticks) = 0;

private:
    bool applyTo(const GrrUviza& graph);
    const ChartString role_ = attributeOf(instruction_, GrxUni::_role);
    const CategoricalFilter categorical_{true, booleanAttribute(instruction_, GrxUni::_categorical, false)};
    const bool derived_ = booleanAttribute(instruction_, BaseTemplate::_derived, false);
};

class TSetTickLabelAngle final : public TickLabelAction {
public:
    using TickLabelAction::TickLabelAction;

private:
    bool hasValue() const override { return !angle_.empty(); }
    void set(GrxMajorTicks& ticks) override;
    const ChartString angle_ = attributeOf(instruction_, GrxUni::_labelAngle);
};

class TSetTickLabelFrequency final : public TickLabelAction {
public:
    using TickLabelAction::TickLabelAction;

private:
    bool valid() const override;
    void set(GrxMajorTicks& ticks) override;
    const ChartString frequency_ = attributeOf(instruction_, GrxUni::_labelFrequency);
};

class TSetTickLabelFormat final : public TickLabelAction {
public:
    TSetTickLabelFormat(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);

private:
    bool valid() const override { return valid_; }
    void set(GrxMajorTicks& ticks) override;
    bool valid_ = true;
    const DOMElement* formats_[5] = {}; // format, numberFormat, stringFormat, dateTimeFormat, elapsedTimeFormat
};

} // namespace plotaid::detail

#endif
