#ifndef PLOTAID_CHARTAXIS_H
#define PLOTAID_CHARTAXIS_H

#include <plotaid/ChartDimension.h>

// An axis; it answers through its parent dimension or facet label, and has no dimension under any
// other parent.
class PLOTAID_API ChartAxis : public ChartElement {
public:
    using ChartElement::ChartElement;

    bool isCategorical() const override;
    ChartElement getPositionAesthetic() const;
    ChartDimension getDimension() const;
};

#endif
