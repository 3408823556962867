#ifndef PLOTAID_TEMPLATES_GRAPHS_H
#define PLOTAID_TEMPLATES_GRAPHS_H

#include <vector>

class GrrUviza;
class GrxVisualization;

namespace plotaid::detail {

// Every graph of the chart, inside containers too, in document order. Graphs sit only directly
// below the root or a container, so only those are walked: a search of the whole document would
// cost each look-up a pass over every data element.
std::vector<GrrUviza*> allGraphs(const GrxVisualization& target);

} // namespace plotaid::detail

#endif
