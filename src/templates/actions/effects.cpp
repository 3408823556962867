// Visual effects: exploded pie slices, back planes and wire frames of 3-D graphs, the projection,
// drop shadows, and depth with a 3-D view for bars and pies.
#include "templates/actions/effects.h"

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

#include <cstdint>
#include <initializer_list>
#include <utility>
#include <vector>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

void inset(GrrUviza& graph, double xMin, double xMax, double yMin, double yMax) {
    for (GrxCoordinates* coordinates : graph.getCoordinatess()) {
        if (!coordinates->getInsetTransforms().empty())
            continue;
        GrxInsetTransform& transform = coordinates->addInsetTransform();
        transform.setXMin(xMin);
        transform.setXMax(xMax);
        transform.setYMin(yMin);
        transform.setYMax(yMax);
    }
}

GrxStyle& elementStyle(BaseTemplate& action, CTElementType& element, const ChartString& id = {}) {
    return styleOf(action, element, &CTElementType::getStyle, &CTElementType::setStyle, id);
}

// A style of the element's own name, so a bar's new style reads as the bar's.
GrxStyle& namedElementStyle(BaseTemplate& action, CTElementType& element) {
    if (GrxStyle* style = element.getStyle())
        return *style;
    return elementStyle(action, element, action.CreateUniqueId(ChartString(element.getId())));
}

// Each "parameter" descendant fills the first of `names` it names whose value is still empty.
void fillFromParameters(const DOMElement* instruction, std::initializer_list<std::pair<const XMLCh*, ChartString*>> names) {
    for (const DOMElement* parameter : descendantsNamed(instruction, GrxUni::_parameter)) {
        const ChartString name = attributeOf(parameter, GrxUni::_name);
        for (const auto& [wanted, value] : names)
            if (name.equals(wanted)) {
                if (value->empty())
                    *value = attributeOf(parameter, GrxUni::_value);
                break;
            }
    }
}

ChartString zLocationOf(const DOMElement* instruction) {
    ChartString location = attributeOf(instruction, GrxUni::_zLocation);
    if (location.empty())
        for (const DOMElement* z : descendantsNamed(instruction, GrxUni::_z))
            location = attributeOf(z, GrxUni::_location);
    return location;
}

} // namespace

// ---- setExplodeSlice ------------------------------------------------------------------------------

bool TSetExplodeSlice::apply() {
    ChartString list;
    if (!categoryList(instruction_, list))
        return false;
    for (GrrUviza* graph : allGraphs(target_)) {
        if (!isGraphPolar(*graph))
            continue;
        const std::vector<CTVariableType*> legend = getLegendVariables(*graph, ChartString(GrxUni::_legend));
        if (legend.empty() || legend.front()->getCategorical() == 0)
            continue;
        CTVariableType& variable = *legend.front();
        for (CTElementType* element : elementsOf(*graph)) {
            if (getElementVariable(*element, ChartString(GrxUni::_x)) == nullptr)
                continue;
            const std::vector<GrxOffset*> offsets = element->getOffsets();
            GrxOffset* offset = offsets.empty() ? nullptr : offsets.front();
            if (offset == nullptr) {
                offset = &element->addOffset();
                offset->setHigh(ChartString(u"3%"));
                offset->setLow(ChartString(u"3%"));
                offset->setVariable(variable);
            }
            auto* domain = dynamic_cast<GrxCategoricalDomain*>(offset->getDomain());
            if (domain == nullptr) {
                domain = &target_.addCategoricalDomain();
                domain->setId(CreateUniqueId(ChartString(GrxUni::_categoricalDomain)));
                offset->setDomain(*domain);
            }
            replaceCategories(*domain, mappedCategories(variable, list, false));
            inset(*graph, 0.2, 0.2, 0.2, 0.2);
        }
    }
    return true;
}

// ---- setBackPlane, setWireFrame -------------------------------------------------------------------

bool TSetBackPlane::apply() {
    if (planes_.empty())
        return false;
    for (GrrUviza* graph : allGraphs(target_)) {
        if (!isChartTrue3D(*graph))
            continue;
        for (const DOMElement* plane : planes_) {
            const ChartString role = attributeOf(plane, GrxUni::_role);
            const int normal = role.equals(GrxUni::_x) ? 0 : role.equals(GrxUni::_y) ? 1 : 2;
            GrxPlaneGuide* guide = nullptr;
            for (GrxPlaneGuide* candidate : graph->getPlaneGuides())
                if (candidate->getNormal() == normal) {
                    guide = candidate;
                    break;
                }
            if (guide == nullptr) {
                guide = &graph->addPlaneGuide();
                guide->setNormal(normal);
            }
            GrxStyle& style = styleOf(*this, static_cast<CTGuideType&>(*guide), &CTGuideType::getStyle,
                                      &CTGuideType::setStyle, {});
            if (const DOMElement* declaration = firstDescendantNamed(plane, GrxUni::_style))
                importStyle(declaration, style);
        }
    }
    return true;
}

bool TSetWireFrame::apply() {
    if (style_ == nullptr)
        return false;
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    for (GrrUviza* graph : graphs) {
        if (!isChartTrue3D(*graph))
            continue;
        if (graph->getFrameGuides().empty())
            graph->addFrameGuide();
        for (GrxFrameGuide* guide : graph->getFrameGuides()) {
            importStyle(style_, styleOf(*this, static_cast<CTGuideType&>(*guide), &CTGuideType::getStyle,
                                        &CTGuideType::setStyle, {}));
            guide->setComplete(complete_);
        }
    }
    return !graphs.empty();
}

// ---- setRotation ----------------------------------------------------------------------------------

namespace {

const XMLCh* const kRotationNames[TSetRotation::Count] = {
    GrxUni::_distance, GrxUni::_zeta,          GrxUni::_phi,         GrxUni::_theta,
    GrxUni::_xscale,   GrxUni::_yscale,        GrxUni::_zscale,      GrxUni::_foreShortening,
    GrxUni::_projectionDistance, GrxUni::_dx, GrxUni::_dy};

} // namespace

TSetRotation::TSetRotation(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), method_(attributeOf(instruction_, GrxUni::_method)) {
    for (const DOMElement* parameter : descendantsNamed(instruction_, GrxUni::_parameter)) {
        const ChartString name = attributeOf(parameter, GrxUni::_name);
        for (int k = Distance; k <= Zscale; ++k)
            if (name.equals(kRotationNames[k]))
                values_[k] = attributeOf(parameter, GrxUni::_value);
    }
    for (int k = 0; k < Count; ++k)
        if (ChartString given = attributeOf(instruction_, kRotationNames[k]); !given.empty())
            values_[k] = given;
}

bool TSetRotation::apply() {
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    const auto set = [&](GrxBaseElement& transform, int k) {
        if (!values_[k].empty())
            transform.setDouble(kRotationNames[k], values_[k].convertToDouble());
    };
    for (GrrUviza* graph : graphs) {
        if (!isChartTrue3D(*graph))
            continue;
        for (GrxCoordinates* coordinates : graph->getCoordinatess()) {
            coordinates->removeRectangularTransforms();
            coordinates->removeObliqueTransforms();
            if (method_.equals(u"oblique")) {
                GrxObliqueTransform& oblique = coordinates->addObliqueTransform();
                for (int k : {Distance, Theta, Xscale, Yscale, ForeShortening, Dx, Dy})
                    set(oblique, k);
            } else {
                GrxRectangularTransform& rectangular = coordinates->addRectangularTransform();
                for (int k : {Distance, Zeta, Phi, Theta, Xscale, Yscale, Zscale, ProjectionDistance, Dx, Dy})
                    set(rectangular, k);
            }
        }
    }
    return !graphs.empty();
}

// ---- addShadow ------------------------------------------------------------------------------------

bool TShadowEffects::apply() {
    if (dx_.empty() || dy_.empty())
        return false;
    for (GrrUviza* graph : allGraphs(target_)) {
        bool shadowed = false;
        for (CTElementType* element : elementsOf(*graph)) {
            if (dynamic_cast<GrxPoint*>(element) != nullptr)
                continue;
            GrxStyle& style = elementStyle(*this, *element);
            style.setShadow_dx(dx_);
            style.setShadow_dy(dy_);
            style.setShadow_color(ChartString(u"grey"));
            style.setShadow_opacity(0.5);
            shadowed = true;
        }
        if (!shadowed)
            continue;
        for (GrxCoordinates* coordinates : graph->getCoordinatess())
            coordinates->removeRectangularTransforms();
        inset(*graph, 0, 0.05, 0, 0.05);
    }
    return true;
}

// ---- addBarEffects --------------------------------------------------------------------------------

namespace {

bool underGraph(const CTElementType& element) {
    return GrxBaseElement::wrapperOf<GrrUviza>(element.getImplementation()->getParentNode()) != nullptr;
}

bool barEligible(const BaseTemplate& action, const GrrUviza& graph, const CTElementType& element) {
    const CTCoordinate* z = element.getZ();
    return (z == nullptr || z->getVariable() == nullptr) && !action.isGraphPolar(graph) && element.getX() != nullptr;
}

GrxStyle& colouredStyle(BaseTemplate& action, CTGuideType& guide, const XMLCh* color) {
    GrxStyle& style = action.addStyle(guide, nullptr);
    style.setColor(ChartString(color));
    guide.setStyle(style);
    return style;
}

} // namespace

bool TAddBarEffects::apply() {
    if (instruction_ == nullptr)
        return false;
    const bool nonBars = booleanAttribute(instruction_, u"applyToNonBar", false);
    ChartString depth = attributeOf(instruction_, GrxUni::_depth);
    ChartString foreshortening = attributeOf(instruction_, u"foreshortening");
    ChartString xscale = attributeOf(instruction_, GrxUni::_xscale);
    ChartString theta = attributeOf(instruction_, GrxUni::_theta);
    ChartString distance = attributeOf(instruction_, GrxUni::_distance);
    const ChartString zLocation = zLocationOf(instruction_);
    fillFromParameters(instruction_, {{u"foreshortening", &foreshortening}, {GrxUni::_xscale, &xscale},
                                      {GrxUni::_theta, &theta}, {GrxUni::_distance, &distance}});
    if (depth.empty())
        depth = ChartString(u"100%");

    bool any = false;
    for (GrrUviza* graph : target_.getGraphs()) {
        for (CTElementType* element : elementsOf(*graph)) {
            if ((dynamic_cast<GrxInterval*>(element) == nullptr && !nonBars) || !underGraph(*element) ||
                !barEligible(*this, *graph, *element))
                continue;
            any = true;
            addZDimension(*graph);
            namedElementStyle(*this, *element).setDepth(depth);
            if (!theta.empty() || !distance.empty() || !foreshortening.empty() || !xscale.empty())
                for (GrxCoordinates* coordinates : graph->getCoordinatess()) {
                    coordinates->removeObliqueTransforms();
                    GrxObliqueTransform& oblique = coordinates->addObliqueTransform();
                    if (!theta.empty())
                        oblique.setTheta(theta.convertToDouble());
                    if (!distance.empty())
                        oblique.setDistance(distance.convertToDouble());
                    if (!foreshortening.empty())
                        oblique.setForeShortening(foreshortening.convertToDouble());
                    if (!xscale.empty())
                        oblique.setXscale(xscale.convertToDouble());
                }
            if (!zLocation.empty())
                element->setZLocation(zLocation.convertToDouble());

            // The frame goes with the planes, so a second application leaves one of each.
            graph->removePlaneGuides();
            graph->removeFrameGuides();
            GrxFrameGuide& frame = graph->addFrameGuide();
            GrxStyle& frameStyle = colouredStyle(*this, frame, GrxStyle::_black);
            GrxStyle* planeStyles[3];
            for (int normal = 0; normal < 3; ++normal) {
                GrxPlaneGuide& plane = graph->addPlaneGuide();
                plane.setNormal(normal);
                planeStyles[normal] = &colouredStyle(*this, plane, u"silver");
            }
            for (const DOMElement* style : descendantsNamed(instruction_, GrxUni::_style)) {
                const std::uint32_t number = unsignedAttribute(style, GrxUni::_number);
                importStyle(style, number >= 1 && number <= 3 ? *planeStyles[number - 1] : frameStyle);
            }
        }
    }
    return any;
}

// ---- addPieEffects --------------------------------------------------------------------------------

bool TAddPieEffects::apply() {
    if (instruction_ == nullptr)
        return false;
    const ChartString depth = attributeOf(instruction_, GrxUni::_depth);
    ChartString phi = attributeOf(instruction_, GrxUni::_phi);
    ChartString theta = attributeOf(instruction_, GrxUni::_theta);
    ChartString distance = attributeOf(instruction_, GrxUni::_distance);
    const ChartString zLocation = zLocationOf(instruction_);
    fillFromParameters(instruction_, {{GrxUni::_phi, &phi}, {GrxUni::_theta, &theta}, {GrxUni::_distance, &distance}});

    std::vector<GrxInterval*> slices;
    getIntervalElements(slices, true);
    bool any = false;
    for (GrxInterval* slice : slices) {
        auto* graph = GrxBaseElement::wrapperOf<GrrUviza>(slice->getImplementation()->getParentNode());
        if (graph == nullptr)
            continue;
        any = true;
        for (GrxCoordinates* coordinates : graph->getCoordinatess()) {
            if (!coordinates->getTransposeTransforms().empty())
                continue;
            const std::vector<GrxDimension*> dimensions = coordinates->getDimensions();
            if (dimensions.size() > 2)
                coordinates->removeDimension(*dimensions[2]);
            if (dimensions.size() > 1)
                coordinates->removeDimension(*dimensions[1]);
        }
        GrxStyle& style = namedElementStyle(*this, *slice);
        style.removeShadow_color();
        style.removeShadow_opacity();
        style.removeShadow_dx();
        style.removeShadow_dy();
        for (GrxCoordinates* coordinates : graph->getCoordinatess())
            coordinates->removeInsetTransforms();
        if (!zLocation.empty())
            slice->setZLocation(zLocation.convertToDouble());
        if (!depth.empty())
            style.setDepth(depth);
        if (theta.empty() && distance.empty() && phi.empty())
            continue;
        for (GrxCoordinates* coordinates : graph->getCoordinatess()) {
            coordinates->removeRectangularTransforms();
            GrxRectangularTransform& view = coordinates->addRectangularTransform();
            if (!theta.empty())
                view.setTheta(theta.convertToDouble());
            if (!distance.empty())
                view.setDistance(distance.convertToDouble());
            if (!phi.empty())
                view.setPhi(phi.convertToDouble());
        }
    }
    return any;
}

namespace {

const ActionFamily family{
    {u"setExplodeSlice", "TSetExplodeSlice", makeAction<TSetExplodeSlice>},
    {u"setBackPlane", "TSetBackPlane", makeAction<TSetBackPlane>},
    {u"setRotation", "TSetRotation", makeAction<TSetRotation>},
    {u"addShadow", "TShadowEffects", makeAction<TShadowEffects>},
    {u"addBarEffects", "TAddBarEffects", makeAction<TAddBarEffects>},
    {u"addPieEffects", "TAddPieEffects", makeAction<TAddPieEffects>},
    {u"setWireFrame", "TSetWireFrame", makeAction<TSetWireFrame>},
};

} // namespace

} // namespace plotaid::detail
