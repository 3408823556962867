// Drawing one graph frame: its cells (panels), coordinates, axes, grid lines and marks.
#ifndef PLOTAID_RENDER_GRAPH_H
#define PLOTAID_RENDER_GRAPH_H

#include "render/Plot.h"

namespace plotaid::render {

struct Cell;

struct Page {
    Canvas& canvas;
    const StyleBook& styles;
    const ChartData& data;
    Cell* cell = nullptr; // the panel being drawn, in a faceted graph
};

void drawGraph(const Page& page, const Element* graph, const Rect& frame);

// One set of coordinates of a graph drawn into `cell`: scales from the marks that use it, then
// grid lines, marks and axes. `rowFilter` limits the rows (panels); `axes` false leaves the axes
// to the caller (inner panels).
void drawCoordinates(const Page& page, const Element* graph, const Element* coordinates, const Rect& cell,
                     const std::vector<bool>& rowFilter, bool axes, int index);

// Every set of coordinates of a graph drawn into `cell`, sharing one data area: the room each set's
// axes need is taken on every set, so bars and a line over a second y axis line up.
void drawCoordinateSets(const Page& page, const Element* graph, const Rect& cell,
                        const std::vector<bool>& rowFilter, bool axes);

// Nice tick values between lo and hi: `delta` apart when positive, else about `count` of them.
std::vector<double> niceTicks(double lo, double hi, double delta, int count);

// The marks (elements with a registered kind) of a graph that draw into the coordinates.
std::vector<const Element*> marksOf(const Element* graph, const Element* coordinates, bool firstCoordinates);

} // namespace plotaid::render

#endif
