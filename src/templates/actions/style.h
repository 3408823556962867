#ifndef PLOTAID_TEMPLATES_ACTIONS_STYLE_H
#define PLOTAID_TEMPLATES_ACTIONS_STYLE_H

// "setStyle": finds the parts of a chart a style is meant for (bars, hinges, an axis title, a
// legend's tick labels) and imports the instruction's numbered style declarations into them.

#include "templates/actions/Actions.h"

#include <xercesc/util/XercesDefs.hpp>

#include <cstdint>
#include <vector>

namespace plotaid::detail {

class TStyle final : public BaseTemplate {
public:
    TStyle(const GrxVisualization* source, GrxVisualization& target,
           const XERCES_CPP_NAMESPACE::DOMElement* instruction);
    bool apply() override;

private:
    XERCES_CPP_NAMESPACE::DOMElement* declaration(std::uint64_t number) const;
    XERCES_CPP_NAMESPACE::DOMElement* declarationForGraph(std::uint64_t graph) const;
    bool styleById();
    void styleElements();
    void styleTexts();

    // Declarations by their "number"; null where the instruction gives none. Only numbers that
    // can name a graph are kept: a number read from the template can be as large as 2^32 - 1.
    std::vector<XERCES_CPP_NAMESPACE::DOMElement*> declarations_;
    // One past the largest number given (0 without declarations), as if every number were kept.
    std::uint64_t extent_ = 0;
};

} // namespace plotaid::detail

#endif
