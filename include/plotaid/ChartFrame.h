#ifndef PLOTAID_CHARTFRAME_H
#define PLOTAID_CHARTFRAME_H

#include <plotaid/ChartDimension.h>

// A frame, with what its position aesthetics and facet variable say.
class PLOTAID_API ChartFrame : public ChartElement {
public:
    using ChartElement::ChartElement;

    // The role of the first facet variable below the frame.
    const XMLCh* getFacetRole() const;
    // The first element below the frame named after the role (x, y, ...).
    ChartElement getPositionAesthetic(const XMLCh* role) const;
    ChartDimension getFacetDimension() const;
    const XMLCh* getRoleVariableId(const XMLCh* role) const;
    bool isFacetCategorical() const;
};

#endif
