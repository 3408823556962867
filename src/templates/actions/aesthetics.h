#ifndef PLOTAID_TEMPLATES_ACTIONS_AESTHETICS_H
#define PLOTAID_TEMPLATES_ACTIONS_AESTHETICS_H

// Element aesthetics: colour, dash, pattern, shape and size cycles, colours turned into dashes or
// images, attributes written straight onto the chart, and point markers over a lone line.
#include "templates/actions/ActionShape.h"

namespace plotaid::detail {

PLOTAID_TEMPLATE_ACTION(TSetColor)
PLOTAID_TEMPLATE_ACTION(TSetDash)
PLOTAID_TEMPLATE_ACTION(TSetPattern)
PLOTAID_TEMPLATE_ACTION(TSetShape)
PLOTAID_TEMPLATE_ACTION(TSetSize)
PLOTAID_TEMPLATE_ACTION(TAddDash)
PLOTAID_TEMPLATE_ACTION(TAddImage)
PLOTAID_TEMPLATE_ACTION(TSetGenericAttributes)
PLOTAID_TEMPLATE_ACTION(TSetShowLineMarkers)

} // namespace plotaid::detail

#endif
