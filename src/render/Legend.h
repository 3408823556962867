// Legends: one entry per category of each aesthetic a legend targets, drawn with the swatch the
// mark would draw (a bar's fill, a line's stroke and dash, a point's symbol).
#ifndef PLOTAID_RENDER_LEGEND_H
#define PLOTAID_RENDER_LEGEND_H

#include "render/Graph.h"

namespace plotaid::render {

struct LegendEntry {
    std::string text;
    Style style;          // the swatch's style
    std::string markName; // interval, line, point, ...
};

// The legend's title and entries.
std::vector<LegendEntry> legendEntries(const Page& page, const Element* legend);
TextSize legendSize(const Page& page, const Element* legend);
void drawLegend(const Page& page, const Element* legend, const Rect& at);

} // namespace plotaid::render

#endif
