#ifndef PLOTAID_TEMPLATES_ACTIONS_EFFECTS_H
#define PLOTAID_TEMPLATES_ACTIONS_EFFECTS_H

// Visual effects: exploded slices, back planes and wire frames, the 3-D projection, drop shadows,
// and depth for bars and pies.
#include "templates/actions/Actions.h"

namespace plotaid::detail {

class TSetExplodeSlice final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;
};

class TSetBackPlane final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const std::vector<const XERCES_CPP_NAMESPACE::DOMElement*> planes_ = descendantsNamed(instruction_, u"plane");
};

// Replaces the projection of three-dimensional graphs.
class TSetRotation final : public BaseTemplate {
public:
    TSetRotation(const GrxVisualization* source, GrxVisualization& target,
                 const XERCES_CPP_NAMESPACE::DOMElement* instruction);
    bool apply() override;

    enum Value { Distance, Zeta, Phi, Theta, Xscale, Yscale, Zscale, ForeShortening, ProjectionDistance, Dx, Dy, Count };

private:
    ChartString method_;
    ChartString values_[Count];
};

class TShadowEffects final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    // The style's own names; the earlier "shadow_dx" spelling is read too.
    const ChartString dx_ = either(GrxUni::_shadow_dx, u"shadow_dx");
    const ChartString dy_ = either(GrxUni::_shadow_dy, u"shadow_dy");
    ChartString either(const XMLCh* name, const XMLCh* other) const {
        const ChartString value = attributeOf(instruction_, name);
        return value.empty() ? attributeOf(instruction_, other) : value;
    }
};

// Depth, an oblique view and a frame with three silver back planes for the bars of flat charts.
class TAddBarEffects : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;
};

// Depth and a rectangular three-dimensional view for the slices of pies.
class TAddPieEffects final : public TAddBarEffects {
public:
    using TAddBarEffects::TAddBarEffects;
    bool apply() override;
};

class TSetWireFrame final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const XERCES_CPP_NAMESPACE::DOMElement* style_ = firstDescendantNamed(instruction_, GrxUni::_style);
    const bool complete_ = booleanAttribute(instruction_, GrxUni::_complete, false);
};

} // namespace plotaid::detail

#endif
