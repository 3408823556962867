#ifndef PLOTAID_TEMPLATES_ACTIONS_DATALABELS_H
#define PLOTAID_TEMPLATES_ACTIONS_DATALABELS_H

// Data labels: per data element, which variable a label shows (a count, a percentage, the case
// number, the x, y or z value, a legend variable or the chart's labelling variable), the labelling
// that shows it, and the labels' styles, place, collisions, connecting lines, colours and formats.
#include "templates/actions/Actions.h"

namespace plotaid::detail {

class TAddDataLabels final : public BaseTemplate {
public:
    TAddDataLabels(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    bool apply() override;

    // What a label shows.
    enum Kind { CaseNumber = 0, Count, Labeling, Percent, X, Y, Z, Legend1, Legend2 };

private:
    struct Content {
        Kind kind;
        const DOMElement* format;
    };
    // The element's label and text frame styles, made when a first labelling needs them.
    struct SharedStyles {
        GrxStyle* label = nullptr;
        GrxStyle* frame = nullptr;
    };

    void findSpecialVariables();
    CTVariableType* variableFor(const GrrUviza& graph, const CTElementType& element, Kind kind) const;
    GrxLabeling* labelingFor(const GrrUviza& graph, CTElementType& element, Kind kind, SharedStyles* make);
    void create(const GrrUviza& graph, CTElementType& element);
    void format(const GrrUviza& graph, CTElementType& element);
    void style(CTElementType& element);
    GrxStyle& frameStyle(CTElementType& element, GrxLabeling& labeling);
    void colorByMarker(CTElementType& element, GrxLabeling& labeling, GrxStyle& label, GrxStyle& frame);
    static void removeDuplicates(CTElementType& element);
    void labelsInside(GrrUviza& graph);

    const DOMElement* mainStyle_ = nullptr;
    const DOMElement* style1_ = nullptr;
    bool styleOnly_ = false;
    int horizontal_ = 0, vertical_ = 0;                                 // 0 unset, 1 center, 2 positive, 3 negative
    int colorByMarker_ = 0, hidden_ = 0, colliding_ = 0, connecting_ = 0; // 0 unset, 1 true, 2 false
    std::vector<Content> contents_;
    CTVariableType *count_ = nullptr, *weight_ = nullptr, *caseNumber_ = nullptr, *percent_ = nullptr,
                   *labeling_ = nullptr;
    bool polar_ = false;
};

} // namespace plotaid::detail

#endif
