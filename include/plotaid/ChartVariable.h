#ifndef PLOTAID_CHARTVARIABLE_H
#define PLOTAID_CHARTVARIABLE_H

#include <plotaid/ChartElement.h>

// A variable of an older chart document.
class PLOTAID_API ChartVariable : public ChartElement {
public:
    using ChartElement::ChartElement;

    // Whether a legend shows it: a style-by anywhere in the document uses this variable and a
    // legend target names that style-by.
    bool isLegendVariable() const;
};

#endif
