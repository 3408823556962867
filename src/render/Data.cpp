#include "render/Data.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <set>
#include <sstream>

namespace plotaid::render {

namespace {

std::vector<std::string> split(const std::string& text, char by, std::size_t limit) {
    std::vector<std::string> out;
    std::size_t start = 0;
    while (out.size() < limit) {
        const std::size_t at = text.find(by, start);
        out.push_back(text.substr(start, at == std::string::npos ? std::string::npos : at - start));
        if (at == std::string::npos)
            break;
        start = at + 1;
    }
    return out;
}

std::string trimmed(const std::string& s) {
    const auto b = s.find_first_not_of(" \t\r\n");
    if (b == std::string::npos)
        return {};
    return s.substr(b, s.find_last_not_of(" \t\r\n") - b + 1);
}

} // namespace

double parseNumber(const std::string& text) {
    const std::string t = trimmed(text);
    if (t.empty())
        return NAN;
    // strtod follows the C locale's decimal point, which a host never changes under us (the
    // library keeps the global locale); the end check rejects grouped or partial numbers.
    std::istringstream in(t);
    in.imbue(std::locale::classic());
    double v = NAN;
    in >> v;
    if (in.fail() || !in.eof() || !std::isfinite(v))
        return NAN;
    return v;
}

int Table::column(const std::string& name) const {
    for (std::size_t i = 0; i < names.size(); ++i)
        if (names[i] == name)
            return static_cast<int>(i);
    return -1;
}

ChartData::ChartData(const Element* root) : root_(root) {
    std::size_t rows = 0;
    for (const Element* source : descendants(root, "embeddedSource")) {
        Table table;
        table.names = split(trimmed(textOf(child(source, "names"))), ';', kMaxColumns);
        for (const Element* row : children(source, "row")) {
            if (rows++ >= kMaxRows)
                break;
            table.rows.push_back(split(utf8(row->getTextContent()), ';', table.names.size()));
        }
        tables_.emplace(attr(source, "id"), std::move(table));
    }
}

const Column* ChartData::load(const std::string& id) const {
    auto found = columns_.find(id);
    if (found != columns_.end())
        return &found->second;
    const Element* v = byId(root_, id);
    if (v == nullptr || nameOf(v) != "sourceVariable")
        return nullptr;
    auto table = tables_.find(attr(v, "source"));
    if (table == tables_.end())
        return nullptr;
    const int at = table->second.column(attr(v, "sourceName"));
    if (at < 0)
        return nullptr;
    Column c;
    c.id = id;
    c.label = hasAttr(v, "description") ? attr(v, "description") : attr(v, "sourceName");
    c.categorical = flag(v, "categorical", false);
    c.format = child(v, "format");
    for (const auto& row : table->second.rows) {
        c.text.push_back(static_cast<std::size_t>(at) < row.size() ? trimmed(row[at]) : std::string());
        c.values.push_back(parseNumber(c.text.back()));
    }
    return &columns_.emplace(id, std::move(c)).first->second;
}

std::vector<const Column*> ChartData::expressionColumns(const std::string& id) const {
    std::vector<const Column*> out;
    const Element* v = byId(root_, id);
    if (nameOf(v) != "expressionVariable")
        return out;
    const std::string names = attr(v, "value");
    for (const std::string& name : split(names, '/', kMaxColumns)) {
        // The names are source names; find the variable that reads each one.
        for (const Element* sv : descendants(root_, "sourceVariable"))
            if (attr(sv, "sourceName") == trimmed(name)) {
                if (const Column* c = load(attr(sv, "id")))
                    out.push_back(c);
                break;
            }
    }
    return out;
}

const Column* ChartData::variable(const std::string& id) const {
    if (const Column* c = load(id))
        return c;
    const auto listed = expressionColumns(id);
    return listed.empty() ? nullptr : listed.front();
}

const std::vector<std::string>& ChartData::categories(const std::string& variableId,
                                                      const std::string& domainId) const {
    const auto key = std::make_pair(variableId, domainId);
    if (const auto known = categories_.find(key); known != categories_.end())
        return known->second;
    std::vector<std::string>& out = categories_[key];
    std::set<std::string> seen;
    const Element* domain = byId(root_, domainId);
    if (domain == nullptr) {
        // A categorical domain that refers to the variable gives its order too.
        for (const Element* d : descendants(root_, "categoricalDomain"))
            if (attr(child(d, "variableReference"), "variable") == variableId) {
                domain = d;
                break;
            }
    }
    if (const Element* order = domain ? child(child(domain, "simpleSort"), "categoryOrder") : nullptr)
        for (const std::string& c : split(textOf(order), ';', kMaxRows))
            if (!c.empty() && seen.insert(c).second)
                out.push_back(c);
    if (const Column* c = variable(variableId))
        for (const std::string& t : c->text)
            if (!t.empty() && seen.insert(t).second)
                out.push_back(t);
    return out;
}

std::size_t ChartData::rowCount(const std::string& variableId) const {
    const Column* c = variable(variableId);
    return c ? c->text.size() : 0;
}

} // namespace plotaid::render
