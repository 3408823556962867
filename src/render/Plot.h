// A graph being drawn: its data area, the scales of its dimensions, and what marks need to place
// and style what they draw. Marks (interval, line, point, ...) register themselves by element
// name, like the template families, so each lives in its own file under marks/.
#ifndef PLOTAID_RENDER_PLOT_H
#define PLOTAID_RENDER_PLOT_H

#include "render/Canvas.h"
#include "render/Data.h"
#include "render/Style.h"

#include <cmath>
#include <functional>
#include <string>
#include <vector>

namespace plotaid::render {

// One dimension's mapping of data to a fraction of the data area (0 at the axis origin).
struct Scale {
    bool categorical = false;
    std::vector<std::string> categories;
    double lo = NAN, hi = NAN;               // the data range the marks reported (continuous)
    double lowerMargin = 0, upperMargin = 0; // fractions of the range
    const Element* dimension = nullptr;
    bool mirrored = false; // values left of zero read as their size (a pyramid's two sides)

    void include(double v);
    // Settles the range: nice bounds, margins, zero for bars. Call once after every include.
    void settle(bool includeZero);
    double at(double value) const; // continuous: fraction
    int indexOf(const std::string& category) const;
    double atCategory(std::size_t index) const; // centre of the category's band
    double band() const;                        // fraction per category (continuous: 0)
    double from = 0, to = 1;                    // the settled range with margins
};

struct Plot;

struct MarkKind {
    const char* tag;
    // Widens the scales by what the mark will draw.
    void (*measure)(Plot& plot, const Element* mark);
    void (*draw)(Plot& plot, const Element* mark);
};
// Adds a kind to the registry; use one static instance per mark file.
struct MarkRegistrar {
    explicit MarkRegistrar(const MarkKind& kind);
};
const MarkKind* markKind(const std::string& tag);

// A special form of a kind (a pie, a histogram, error bars) that takes over the kind's measure and
// draw for the marks it applies to; lower `order` is asked first.
struct MarkVariant {
    const char* tag;
    int order;
    bool (*applies)(const Plot& plot, const Element* mark);
    void (*measure)(Plot& plot, const Element* mark);
    void (*draw)(Plot& plot, const Element* mark);
    bool fromZero; // whether the value axis must take in zero
};
struct MarkVariantRegistrar {
    explicit MarkVariantRegistrar(const MarkVariant& variant);
};
const MarkVariant* markVariant(const Plot& plot, const Element* mark);
// A mark's measure and draw, through its variant when one applies; unknown kinds do nothing.
void measureMark(Plot& plot, const Element* mark);
void drawMark(Plot& plot, const Element* mark);
// Whether the mark is drawn from zero up (bars and areas), so the value scale must hold zero.
bool startsAtZero(const Plot& plot, const Element* mark);

struct Plot {
    Canvas& canvas;
    const StyleBook& styles;
    const ChartData& data;
    const Element* graph;
    const Element* coordinates;
    Rect area;               // the data area in device units
    Scale dims[3];           // x, y and (for 3-D) z
    bool transposed = false; // x runs vertically
    bool polar = false;
    bool reflected = false; // the reflection transform of a pyramid
    double depth = 0;       // 3-D: the depth offset of the back plane, device units
    // Rows of the data that this panel shows (empty: all rows).
    std::vector<bool> rowFilter;
    Point back; // 3-D: device offset from the front to the back plane
    // A panel's place in its grid (facet1 the column, facet2 the row; -1 outside a grid) and, in a
    // matrix, the column each of x and y stands for when a mark reads `variable`.
    struct Panel {
        int facet[2] = {-1, -1};
        std::string variable[2];
        const Column* column[2] = {nullptr, nullptr};
    } panel;

    // Device position of the fractions fx (along x) and fy (along y, 0 at the bottom).
    Point at(double fx, double fy) const;
    bool rowShown(std::size_t row) const {
        return rowFilter.empty() || (row < rowFilter.size() && rowFilter[row]);
    }

    // The column a mark's x, y or z child reads (null when it names none or an unknown variable).
    const Column* columnOf(const Element* mark, const char* role) const;
    // The style of a mark for one row: its own style, then each aesthetic's cycle style for the
    // row's category (colour into the main or secondary colour, as the aesthetic affects).
    Style rowStyle(const Element* mark, std::size_t row, const char* styleAttribute = "style") const;
    // The style of the i-th entry of a cycle.
    Style cycleStyle(const std::string& cycleId, std::size_t index) const;
};

// A line (mark or guide) strokes in its secondary colour, or in its main colour where the style
// gives no secondary one: templates write a line's stroke as its main colour.
Style lineStroke(Style s);

// A statistic over values: "method" as charts write it (1 count, 2 mean, 3 percent of the total,
// 4 sum, 5 median, 6 minimum/maximum are read by error bars, 10 count in a bin).
double statistic(int method, const std::vector<double>& values, double total);

// Whether a conditional style's condition ("facet1==facet2", "facet1!=facet2") holds in the
// panel at `facet`; conditions outside a grid or not understood do not hold.
bool conditionHolds(const std::string& when, const int facet[2]);

// Number text the way an axis or label <format> asks (prefix, suffix, grouping, fraction digits).
std::string formatNumber(double value, const Element* format);

} // namespace plotaid::render

#endif
