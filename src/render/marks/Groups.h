// Rows of a mark summarised per category of x and of one splitting variable (cluster, stack or
// colour): what bars, lines, areas and mean points draw.
#ifndef PLOTAID_RENDER_MARKS_GROUPS_H
#define PLOTAID_RENDER_MARKS_GROUPS_H

#include "render/Plot.h"

namespace plotaid::render {

struct Summary {
    std::size_t xIndex = 0;        // category of x (categorical x) ...
    double x = NAN;                // ... or the x value (continuous x)
    std::size_t splitIndex = 0;    // category of the split variable, 0 without one
    double y = NAN;                // the statistic
    std::size_t firstRow = 0;      // a row of the group, for its style
    std::vector<double> values;    // the y values of the group's rows
    std::vector<std::size_t> rows; // the group's rows, for labels
};

struct Grouping {
    std::vector<Summary> summaries;
    std::size_t splits = 1; // number of split categories
    const Column* split = nullptr;
    std::vector<std::string> splitCategories;
};

// The variable a mark is split by: the dimension's cluster variable, the split child, else the
// first categorical aesthetic.
std::string splitVariableOf(const Plot& plot, const Element* mark, std::string* domain = nullptr);
// The summary method of a mark (its summaryStatistic child), `fallback` without one.
int methodOf(const Element* mark, int fallback);
// The x fraction of a summary's centre: its category's band, moved aside within the band when the
// x dimension clusters by the split variable; `band` receives the width the item may take.
double centreOf(const Plot& plot, const Grouping& g, const Summary& s, double* band = nullptr);
// The rows of the summaries together: what percent labels count against.
std::size_t rowsIn(const Grouping& g);
// Groups the shown rows of `mark` by x and split, applying its statistic.
Grouping group(const Plot& plot, const Element* mark);
// Whether bars or areas of `mark` stand on those of the categories before them.
bool stacked(const Element* mark);

// Where a summary stands along x, as a fraction: the centre and the width of its slot, which is
// the category's band shared among the clusters when x is clustered.
struct Slot {
    double centre = 0, band = 0;
};
Slot slotOf(const Plot& plot, const Grouping& g, const Summary& s);

} // namespace plotaid::render

#endif
