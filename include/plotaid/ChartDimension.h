#ifndef PLOTAID_CHARTDIMENSION_H
#define PLOTAID_CHARTDIMENSION_H

#include <plotaid/ChartElement.h>

// A dimension of a frame; its data are categorical as its domain is, or, without a domain, as the
// variable of its role's position aesthetic is.
class PLOTAID_API ChartDimension : public ChartElement {
public:
    using ChartElement::ChartElement;

    static const XMLCh* const _upperMapping;
    static const XMLCh* const _lowerMapping;
    static const XMLCh* const _sameRatio;

    bool isCategorical() const override;
    const XMLCh* getdomain() const;
    const XMLCh* getrole() const;
    const XMLCh* getupperMapping() const;
    const XMLCh* getlowerMapping() const;
    const XMLCh* getsameRatio() const;
    const XMLCh* getupperMargin() const;
    const XMLCh* getlowerMargin() const;
    ChartElement getPositionAesthetic() const;
};

#endif
