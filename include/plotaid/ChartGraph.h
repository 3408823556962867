#ifndef PLOTAID_CHARTGRAPH_H
#define PLOTAID_CHARTGRAPH_H

#include <plotaid/ChartVariable.h>

// The root of an older chart document or earlier-form template.
class PLOTAID_API ChartGraph : public ChartElement {
public:
    using ChartElement::ChartElement;

    // The first descendant named tag (not over the whole document, as the base does).
    XERCES_CPP_NAMESPACE::DOMElement* getFirstElementByTagName(const XMLCh* tag) const override;
    // Decided by the domain of that id, else by the variable of that id.
    bool isCategorical(const XMLCh* id) const;
    using ChartElement::isCategorical;
    // The variable named by the first descendant named tag.
    ChartVariable getVariable(const XMLCh* tag) const;
    // 3 histogram, 5 cumulative sum, 1 box plot, 2 range, 6 polar, 7 without bars, 4 with several
    // elements, else 0: the first rule that holds.
    int getChartType() const;
};

#endif
