#ifndef PLOTAID_CHARTPARAMETER_H
#define PLOTAID_CHARTPARAMETER_H

#include <plotaid/ChartVariable.h>

// A named value of a guide, statistic or transform.
class PLOTAID_API ChartParameter : public ChartElement {
public:
    using ChartElement::ChartElement;

    // The variable of the facet variable whose role is this parameter's name, else of the first
    // element named after it.
    ChartVariable getVariable() const;
};

#endif
