// Where each frame of a chart lies on the page: its location parts resolved against the page and
// against the frames they attach to.
#ifndef PLOTAID_RENDER_FRAMES_H
#define PLOTAID_RENDER_FRAMES_H

#include "render/Canvas.h"

#include <functional>
#include <map>
#include <vector>

namespace plotaid::render {

// The frames a page holds: label frames, graphs, legends, containers and the other boxes that
// carry locations; graphs inside a container are frames of their own.
bool isFrame(const Element* e);
std::vector<const Element*> framesOf(const Element* root);

// The natural size of a frame's content, for "content" parts.
using Measure = std::function<TextSize(const Element* frame)>;

// Resolves every frame's rectangle within `page`. A part that cannot be resolved (a missing or
// circular target) falls back to the page edge, so every frame gets a rectangle.
std::map<const Element*, Rect> layoutFrames(const std::vector<const Element*>& frames, const Rect& page,
                                            double unit, const Measure& measure);

} // namespace plotaid::render

#endif
