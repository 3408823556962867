// Data labels: the labeling children of a mark, drawn beside what the mark drew for a group of
// rows. Guides use the same placement for their own labels.
#ifndef PLOTAID_RENDER_MARKS_LABELS_H
#define PLOTAID_RENDER_MARKS_LABELS_H

#include "render/Plot.h"

namespace plotaid::render {

// Where a label sits against what it labels: 1 centre, 2 positive (right/up), 3 negative;
// 0 when the labelling's styles do not say.
struct LabelPlace {
    int horizontal = 0, vertical = 0;
};
LabelPlace labelPlaceOf(const Plot& plot, const Element* e, const char* styleAttribute = "style");

// The text of one labeling for `rows`: a category, or its statistic (else the value) formatted
// by the labeling's format or its variable's. `total` is what percentages count against.
std::string labelText(const Plot& plot, const Element* labeling, const Element* mark,
                      const std::vector<std::size_t>& rows, std::size_t total);

// The text style of a label or labeling, over the chart's.
Style textStyleOf(const Plot& plot, const Element* label);

// Text in `style` with a frame of `frame` around it, its anchor placed as in Canvas::text.
void framedText(Canvas& canvas, const std::string& text, Point anchor, const Style& style, const Style& frame,
                double ax, double ay);

// Every labeling of `mark` for one drawn item running from `base` to `tip` (a point: the same).
void drawLabels(const Plot& plot, const Element* mark, const std::vector<std::size_t>& rows,
                std::size_t total, Point base, Point tip);

} // namespace plotaid::render

#endif
