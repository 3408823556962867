#ifndef PLOTAID_TEMPLATES_ACTIONS_STYLE_H
#define PLOTAID_TEMPLATES_ACTIONS_STYLE_H

// "setStyle": finds the parts of a chart a style is meant for (bars, hinges, an axis title, a
// legend's tick labels) and imports the instruction's numbered style declarations into them.

#include "templates/actions/ActionShape.h"

#include <xercesc/util/XercesDefs.hpp>

#include <vector>

namespace plotaid::detail {

// Keeps its declarations in the action itself rather than in a settings record: they are all it
// reads, and one list indexed by declaration number is the record.
class TStyle final : public BaseTemplate {
public:
    TStyle(const GrxVisualization* source, GrxVisualization& target,
           const XERCES_CPP_NAMESPACE::DOMElement* instruction);
    ~TStyle() override;
    TStyle(const TStyle&) = delete;
    TStyle& operator=(const TStyle&) = delete;
    bool apply() override;

private:
    // Declarations by their "number"; null where the instruction gives none.
    std::vector<XERCES_CPP_NAMESPACE::DOMElement*> declarations_;
};

} // namespace plotaid::detail

#endif
