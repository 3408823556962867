#ifndef PLOTAID_CHARTGUIDE_H
#define PLOTAID_CHARTGUIDE_H

#include <plotaid/ChartParameter.h>

// A line, point or plane guide; it is named by its first parameter.
class PLOTAID_API ChartGuide : public ChartElement {
public:
    using ChartElement::ChartElement;

    const XMLCh* getName() const override;
    ChartParameter getFirstParameter() const;
};

#endif
