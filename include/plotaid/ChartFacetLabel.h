#ifndef PLOTAID_CHARTFACETLABEL_H
#define PLOTAID_CHARTFACETLABEL_H

#include <plotaid/ChartDimension.h>

// One facet label; it answers through its parent facet labeling.
class PLOTAID_API ChartFacetLabel : public ChartElement {
public:
    using ChartElement::ChartElement;

    bool isCategorical() const override;
    ChartElement getPositionAesthetic() const;
    ChartDimension getDimension() const;
};

#endif
