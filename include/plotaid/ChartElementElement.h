#ifndef PLOTAID_CHARTELEMENTELEMENT_H
#define PLOTAID_CHARTELEMENTELEMENT_H

#include <plotaid/ChartElement.h>

// A data element (bars, lines, points, areas).
class PLOTAID_API ChartElementElement : public ChartElement {
public:
    using ChartElement::ChartElement;

    // The variable id of the first descendant named after the role; null when none.
    const XMLCh* getRoleVariable(const XMLCh* role) const;
    bool isInterpolationLine() const;
    // An interval whose document's first y position has a range statistic.
    bool isRangeBar() const;
    // An area with a line in the same document, or a line with an area.
    bool isDifferenceLine() const;
};

#endif
