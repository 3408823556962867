#ifndef GRX_DETAIL_MODELCLASSES_H
#define GRX_DETAIL_MODELCLASSES_H

// Every concrete class of the object model, once: the document's factory registry is made from
// this list, and a test holds it against the classes GrxModel.h declares and the chart grammar.
// X(Class) registers Class under its own element name; NAMED(Class, name) under another one.

#include <grx/GrxModel.h>

#define GRX_MODEL_CLASSES(X, NAMED) \
    X(GrxStyle) X(GrxLocation) X(CTTextType) X(GrxDescription) X(GrxDescriptionGroup) X(GrxLabel)            \
    X(GrxRelabel) X(GrxUnitRule) X(GrxFormat) X(GrxAggregation) X(GrxExtensionSV) X(GrxSourceVariable)       \
    X(GrxExpressionVariable) X(GrxDerivedVariable) X(GrxRange) X(GrxIntervalDomain)                          \
    X(GrxVariableReference) X(GrxCategoryOrder) X(GrxSortMove) X(GrxSimpleSort) X(GrxStatisticSort)          \
    X(GrxCategories) X(GrxCategoricalDomain) X(GrxCycle) X(GrxStyleCycleExtension) X(GrxStyleCycle)          \
    X(GrxSummaryStatistic) X(GrxBinStatistic) X(GrxSmoothStatistic) X(GrxRegionStatistic)                    \
    X(GrxDistributionStatistic) X(GrxLinkStatistic) X(GrxCollectRowsStatistic) X(GrxAggregateStatistic)      \
    X(GrxClusteringStatistic) X(GrxGraphLayoutStatistic) X(GrxMapStatistic) X(GrxTagCloudStatistic)          \
    X(GrxTreeLayoutStatistic) X(GrxFixedWindowDensityStatistic) X(GrxNearestNeighborDensityStatistic)        \
    X(GrxTukeyStatistic) X(GrxSelfOrganizingMapStatistic) X(GrxPatternLinkStatistic) X(GrxColorMapping)      \
    X(GrxDoubleMapping) X(GrxDashMapping) X(GrxIntegerMapping) X(GrxSymbolMapping) X(GrxLengthMapping)       \
    X(GrxScale) X(GrxStyleBy) X(GrxDash) X(GrxShape) X(GrxSize) X(GrxRotation) X(GrxColor) X(GrxOffset)      \
    X(GrxPattern) X(GrxTransparency) X(GrxSplit) X(GrxColorComponent) X(GrxVisibility) X(GrxImage)           \
    X(GrxLabeling) X(GrxConditionalStyle)                                                                    \
    NAMED(CTCoordinate, GrxUni::_x) NAMED(CTCoordinate, GrxUni::_y) NAMED(CTCoordinate, GrxUni::_z)          \
    X(GrxPoint) X(GrxLine) X(GrxArea) X(GrxInterval) X(GrxPath) X(GrxEdge) X(GrxPolygon) X(GrxSchema)        \
    X(GrxPointGuide) X(GrxLineGuide) X(GrxFunctionGuide) X(GrxRectangleGuide) X(GrxPlaneGuide)               \
    X(GrxFrameGuide) X(GrxGridline) X(GrxMajorTicks) X(GrxMinorTicks) X(GrxAxisTransformParameter)           \
    X(GrxAxis) X(GrxDimension) X(GrxDimensionReference) X(GrxPolarTransform) X(GrxTransposeTransform)        \
    X(GrxReflectionTransform) X(GrxInsetTransform) X(GrxRectangularTransform) X(GrxObliqueTransform)         \
    X(GrxParallelCoordinatesTransform) X(GrxCoordinates) X(GrxFacetLevel) X(GrxTableLayout)                  \
    X(GrxFacetLayout) X(GrxFaceting) X(GrrUviza) X(GrxLabelFrame) X(GrxLegendTarget) X(GrxLegend)            \
    X(GrxControlFrame) X(GrxKey) X(GrxContainer) X(GrxExtensionVis) X(GrxTokenMapping) X(GrxPopup)           \
    X(GrxUserSource) X(GrxDatabaseSource) X(GrxDelimitedFileSource) X(GrxStreamingSource)                    \
    X(GrxEmbeddedSource)

#endif
