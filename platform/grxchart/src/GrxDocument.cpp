#include <grx/GrxDocument.h>
#include <grx/GrxModel.h>

#include "Names.h"

#include <xercesc/dom/DOMAttr.hpp>

#include <string_view>
#include <unordered_map>
#include <vector>

using namespace xercesc;
using grx::detail::nameOf;
using grx::detail::sameText;

struct GrxDocument::Registry {
    using Maker = GrxBaseElement* (*)(DOMElement*, GrxDocument*);
    std::unordered_map<std::u16string_view, Maker> makers;

    template <class T> void add(const XMLCh* name = T::getElementName()) { makers.emplace(name, &make<T>); }
    template <class... T> void addAll() { (add<T>(), ...); }
    Maker find(const XMLCh* name) const {
        auto it = makers.find(std::u16string_view(name));
        return it == makers.end() ? nullptr : it->second;
    }
};

struct GrxDocument::Arena {
    std::vector<std::unique_ptr<GrxBaseElement>> wrappers;
};

const GrxDocument::Registry& GrxDocument::registry() {
    static const Registry r = [] {
        Registry reg;
        reg.addAll<GrxStyle, GrxLocation, CTTextType, GrxDescription, GrxDescriptionGroup, GrxLabel,
                   GrxRelabel, GrxUnitRule, GrxFormat, GrxAggregation, GrxExtensionSV, GrxSourceVariable,
                   GrxExpressionVariable, GrxDerivedVariable, GrxRange, GrxIntervalDomain,
                   GrxVariableReference, GrxCategoryOrder, GrxSortMove, GrxSimpleSort, GrxStatisticSort,
                   GrxCategories, GrxCategoricalDomain, GrxCycle, GrxStyleCycleExtension, GrxStyleCycle>();
        reg.addAll<GrxSummaryStatistic, GrxBinStatistic, GrxSmoothStatistic, GrxRegionStatistic,
                   GrxDistributionStatistic, GrxLinkStatistic, GrxCollectRowsStatistic, GrxAggregateStatistic,
                   GrxClusteringStatistic, GrxGraphLayoutStatistic, GrxMapStatistic, GrxTagCloudStatistic,
                   GrxTreeLayoutStatistic, GrxFixedWindowDensityStatistic, GrxNearestNeighborDensityStatistic,
                   GrxTukeyStatistic, GrxSelfOrganizingMapStatistic, GrxPatternLinkStatistic>();
        reg.addAll<GrxColorMapping, GrxDoubleMapping, GrxDashMapping, GrxIntegerMapping, GrxSymbolMapping,
                   GrxLengthMapping, GrxScale, GrxStyleBy, GrxDash, GrxShape, GrxSize, GrxRotation, GrxColor,
                   GrxOffset, GrxPattern, GrxTransparency, GrxSplit, GrxColorComponent, GrxVisibility,
                   GrxImage, GrxLabeling, GrxConditionalStyle>();
        reg.add<CTCoordinate>(GrxUni::_x);
        reg.add<CTCoordinate>(GrxUni::_y);
        reg.add<CTCoordinate>(GrxUni::_z);
        reg.addAll<GrxPoint, GrxLine, GrxArea, GrxInterval, GrxPath, GrxEdge, GrxPolygon, GrxSchema,
                   GrxPointGuide, GrxLineGuide, GrxFunctionGuide, GrxRectangleGuide, GrxPlaneGuide,
                   GrxFrameGuide, GrxGridline, GrxMajorTicks, GrxMinorTicks, GrxAxisTransformParameter,
                   GrxAxis, GrxDimension, GrxDimensionReference, GrxPolarTransform, GrxTransposeTransform,
                   GrxReflectionTransform, GrxInsetTransform, GrxRectangularTransform, GrxObliqueTransform,
                   GrxParallelCoordinatesTransform, GrxCoordinates, GrxFacetLevel, GrxTableLayout,
                   GrxFacetLayout, GrxFaceting, GrrUviza>();
        reg.addAll<GrxLabelFrame, GrxLegendTarget, GrxLegend, GrxControlFrame, GrxKey, GrxContainer,
                   GrxExtensionVis, GrxTokenMapping, GrxPopup, GrxUserSource, GrxDatabaseSource,
                   GrxDelimitedFileSource, GrxStreamingSource, GrxEmbeddedSource>();
        return reg;
    }();
    return r;
}

bool GrxDocument::isKnownElement(const XMLCh* name) {
    return name && registry().find(name) != nullptr;
}

GrxDocument::GrxDocument(DOMElement* root, bool ownsDocument)
    : GrxBaseElement(Key(), root, this), arena_(std::make_unique<Arena>()), owns_(ownsDocument) {
    if (DOMAttr* id = root->getAttributeNode(GrxUni::_id); id && !id->isId())
        root->setIdAttributeNode(id, true);
    // Whatever user data the nodes carry is stale (an earlier document over the same DOM).
    wrapTree(root, true);
}

GrxDocument::~GrxDocument() {
    DOMDocument* doc = getDOMDocument();
    arena_.reset();
    if (owns_)
        doc->release();
}

DOMDocument* GrxDocument::getDOMDocument() const {
    return getImplementation()->getOwnerDocument();
}

std::size_t GrxDocument::wrapperCount() const {
    return arena_->wrappers.size();
}

GrxBaseElement* GrxDocument::wrapOne(DOMElement* element, bool overwrite) {
    if (DOMAttr* id = element->getAttributeNode(GrxUni::_id); id && !id->isId())
        element->setIdAttributeNode(id, true);
    if (!overwrite)
        if (GrxBaseElement* existing = wrapperOf(element))
            return existing;
    // Foreign content is not the chart's; a node made without a namespace is taken as ours.
    const XMLCh* ns = element->getNamespaceURI();
    if (ns && *ns && !sameText(ns, getImplementation()->getNamespaceURI()))
        return nullptr;
    const Registry::Maker maker = registry().find(nameOf(element));
    if (!maker)
        return nullptr;
    arena_->wrappers.emplace_back(maker(element, this));
    return arena_->wrappers.back().get();
}

void GrxDocument::wrapTree(DOMElement* top, bool overwrite) {
    std::vector<DOMElement*> pending;
    for (DOMElement* c = top->getFirstElementChild(); c; c = c->getNextElementSibling())
        pending.push_back(c);
    while (!pending.empty()) {
        DOMElement* e = pending.back();
        pending.pop_back();
        wrapOne(e, overwrite);
        for (DOMElement* c = e->getFirstElementChild(); c; c = c->getNextElementSibling())
            pending.push_back(c);
    }
}

GrxBaseElement* GrxDocument::wrap(DOMElement* element) {
    if (!element || element->getOwnerDocument() != getDOMDocument())
        return nullptr;
    if (element == getImplementation())
        return this;
    GrxBaseElement* w = wrapOne(element, false);
    wrapTree(element, false);
    return w;
}
