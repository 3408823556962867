// Faceted graphs: one panel per category of the facet variables (or, in a scatterplot matrix, per
// pair of listed columns), each drawing the graph's coordinates over its own rows. Panels are drawn
// twice over: a measuring pass finds every panel's data extents and the room its axes need, so
// that the panels share scales and line up; only the outer panels paint axes.
#ifndef PLOTAID_RENDER_FACETS_H
#define PLOTAID_RENDER_FACETS_H

#include "render/Graph.h"

#include <cmath>

namespace plotaid::render {

// What drawCoordinates learns from and tells a panel.
struct Cell {
    bool measuring = false;
    int column = 0, row = 0;
    bool outer[4] = {}; // left, bottom, right, top: the panel lies on that edge of the grid
    std::string variable[2];
    const Column* matrix[2] = {nullptr, nullptr};
    // In: the extents shared with the panels this one compares with. Out: its own.
    double sharedLo[3] = {NAN, NAN, NAN}, sharedHi[3] = {NAN, NAN, NAN};
    double ownLo[3] = {NAN, NAN, NAN}, ownHi[3] = {NAN, NAN, NAN};
    double room[4] = {}; // left, bottom, right, top, as measured
    Rect grid;           // all the panels: one title serves each side
    bool titles[2] = {}; // the panel writes the axis title along x, along y

    // Gives the plot the panel's place and matrix columns.
    void enter(Plot& plot) const;
    // After the marks measured: notes the panel's own extents and widens to the shared ones.
    void share(Plot& plot);
    // Measuring: notes the room the axes want and answers false (stop here). Drawing: the panel is
    // already the data area, so the room becomes zero.
    bool fit(double& left, double& bottom, double& right, double& top);
    // Whether the panel paints the axis on that side.
    bool paints(bool vertical, bool opposite) const;
    // Where the axis title centres: the whole grid for the one panel that writes it, else empty.
    Rect titleSpan(bool vertical) const { return titles[vertical] ? grid : Rect{}; }
};

// Draws a graph that has a facet layout as its grid of panels within `inner`; false when the
// graph has none (nothing drawn).
bool drawFacets(const Page& page, const Element* graph, const Rect& inner);

} // namespace plotaid::render

#endif
