// The chart's data as drawing needs it: the rows of each embedded source, the chart's variables
// (source columns and expression variables) and their categories in domain order.
#ifndef PLOTAID_RENDER_DATA_H
#define PLOTAID_RENDER_DATA_H

#include "render/Dom.h"

#include <map>
#include <string>
#include <vector>

namespace plotaid::render {

struct Table {
    std::vector<std::string> names;
    std::vector<std::vector<std::string>> rows;
    int column(const std::string& name) const;
};

// One variable's values over the rows of its source.
struct Column {
    std::string id;
    std::string label; // the description, else the source name
    bool categorical = false;
    const Element* format = nullptr; // the variable's number format, when it has one
    std::vector<std::string> text;
    std::vector<double> values; // NaN where the text is empty or not a number
};

class ChartData {
public:
    // Limits that keep a hostile chart from making the renderer allocate without bound.
    static constexpr std::size_t kMaxRows = 200000;
    static constexpr std::size_t kMaxColumns = 1000;

    explicit ChartData(const Element* root);

    // The variable with the id (a source variable; an expression variable listing several
    // columns, as a scatterplot matrix has, gives the first); null when unknown.
    const Column* variable(const std::string& id) const;
    // The columns an expression variable lists ("a/b/c"), for matrix layouts.
    std::vector<const Column*> expressionColumns(const std::string& id) const;
    // The categories of a categorical variable: the domain's order when the chart gives one,
    // else first appearance. Worked out once per variable and domain: marks ask for every row.
    const std::vector<std::string>& categories(const std::string& variableId,
                                               const std::string& domainId = "") const;
    std::size_t rowCount(const std::string& variableId) const;

private:
    const Column* load(const std::string& id) const;
    const Element* root_;
    std::map<std::string, Table> tables_;
    mutable std::map<std::string, Column> columns_;
    mutable std::map<std::pair<std::string, std::string>, std::vector<std::string>> categories_;
};

// Parses a number the way the chart writes it ("." decimal, no grouping); NaN otherwise.
double parseNumber(const std::string& text);

} // namespace plotaid::render

#endif
