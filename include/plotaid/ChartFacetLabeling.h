#ifndef PLOTAID_CHARTFACETLABELING_H
#define PLOTAID_CHARTFACETLABELING_H

#include <plotaid/ChartDimension.h>

// The labels of a frame's facets; it answers through its parent frame's facet variable.
class PLOTAID_API ChartFacetLabeling : public ChartElement {
public:
    using ChartElement::ChartElement;

    bool isCategorical() const override;
    ChartElement getPositionAesthetic() const;
    ChartDimension getDimension() const;
};

#endif
