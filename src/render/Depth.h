// Three-dimensional coordinates drawn in an oblique view: the z dimension recedes from the front
// face along one device direction, so a depth is a fraction of that offset.
#ifndef PLOTAID_RENDER_DEPTH_H
#define PLOTAID_RENDER_DEPTH_H

#include "render/Plot.h"

namespace plotaid::render {

// Whether the coordinates ask for a 3-D view (a rectangular or oblique transform).
bool isThreeD(const Element* coordinates);
// Sets the plot's back offset from the view's angles and shrinks its area to make room for it;
// flat coordinates are left alone.
void setUpDepth(Plot& plot);
// The device position of fractions along x, y and z (0 at the front face).
Point at3(const Plot& plot, double fx, double fy, double fz);
// A colour darkened by `factor` (0..1, 1 keeps it), for the shaded faces.
Style shaded(const Style& s, double factor);

} // namespace plotaid::render

#endif
