#include <plotaid/VarDataProcessor.h>

#include "data/Numbers.h"
#include "data/Report.h"
#include "data/StoreAccess.h"

#include <algorithm>
#include <charconv>
#include <climits>
#include <cmath>
#include <new>
#include <utility>

using plotaid::detail::grownCapacity;
using plotaid::detail::kMissingValue;
using plotaid::detail::kVarDataFile;
using plotaid::detail::reportFailure;

namespace {

constexpr unsigned kMinCapacity = 1000;
constexpr unsigned kMaxInitialCapacity = 20000;

bool newCells(std::vector<double>& cells, std::size_t count) {
    try {
        cells.assign(count, kMissingValue);
        return true;
    } catch (const std::bad_alloc&) {
        reportFailure("cannot allocate " + std::to_string(count) + " data cells", kVarDataFile, __LINE__);
        return false;
    }
}

} // namespace

VarDataProcessor::VarDataProcessor() = default;
VarDataProcessor::VarDataProcessor(const VarDataProcessor& other) = default;
VarDataProcessor& VarDataProcessor::operator=(const VarDataProcessor& other) = default;
VarDataProcessor::~VarDataProcessor() = default;

VarDataProcessor::VarDataProcessor(VarDataProcessor&& other) noexcept
    : sources(std::move(other.sources)), stringMaps(std::move(other.stringMaps)),
      strings(std::move(other.strings)), stringIndex(std::move(other.stringIndex)),
      freeStrings(std::move(other.freeStrings)), byteOrderFlag(other.byteOrderFlag) {
    other.Reset();
}

VarDataProcessor& VarDataProcessor::operator=(VarDataProcessor&& other) noexcept {
    if (this != &other) {
        Reset();
        sources.swap(other.sources);
        stringMaps.swap(other.stringMaps);
        strings.swap(other.strings);
        stringIndex.swap(other.stringIndex);
        freeStrings.swap(other.freeStrings);
        byteOrderFlag = other.byteOrderFlag;
    }
    return *this;
}

void VarDataProcessor::Reset() {
    sources.clear();
    stringMaps.clear();
    strings.clear();
    stringIndex.clear();
    freeStrings.clear();
}

bool VarDataProcessor::AddDataSource(const std::string& source, unsigned initialRows) {
    if (sources.count(source))
        return false;
    _sourcebag& bag = sources[source];
    bag.capacity = std::clamp(initialRows, kMinCapacity, kMaxInitialCapacity);
    stringMaps[source];
    return true;
}

bool VarDataProcessor::AllocBag(_sourcebag& bag, const std::string& variable) {
    std::vector<double> cells;
    if (!newCells(cells, bag.capacity))
        return false;
    _column& column = bag.variables[variable];
    column.rowCount = 0;
    column.values.swap(cells);
    return true;
}

bool VarDataProcessor::AddVariable(const std::string& source, const std::string& variable, _varinfo* info) {
    auto it = sources.find(source);
    if (it == sources.end()) {
        AddDataSource(source, 0);
        it = sources.find(source);
    }
    _sourcebag& bag = it->second;
    if (bag.variables.count(variable))
        return false;
    if (!AllocBag(bag, variable))
        return false;
    StringMap& map = stringMaps[source][variable];
    map.clear();
    if (info) {
        info->source = source;
        info->variable = variable;
        info->column = &bag.variables[variable];
        info->stringMap = &map;
    }
    return true;
}

bool VarDataProcessor::RemoveString(unsigned index) {
    if (index >= strings.size())
        return false;
    _stringentry& entry = strings[index];
    if (entry.refCount == 0)
        return false; // a free slot holds no reference to give back
    if (--entry.refCount == 0) {
        auto known = stringIndex.find(entry.text);
        if (known != stringIndex.end() && known->second == index)
            stringIndex.erase(known);
        std::string().swap(entry.text);
        freeStrings.insert(index);
    }
    return true;
}

int VarDataProcessor::AddString(const std::string& text) {
    auto known = stringIndex.find(text);
    if (known != stringIndex.end()) {
        ++strings[known->second].refCount;
        return static_cast<int>(known->second);
    }
    unsigned slot = static_cast<unsigned>(strings.size());
    if (!freeStrings.empty()) {
        slot = *freeStrings.begin();
        freeStrings.erase(freeStrings.begin());
    } else {
        strings.emplace_back();
    }
    strings[slot].text = text;
    strings[slot].refCount = 1;
    stringIndex.emplace(text, slot);
    return static_cast<int>(slot);
}

void VarDataProcessor::IndexStrings() {
    stringIndex.clear();
    freeStrings.clear();
    for (unsigned i = 0; i < strings.size(); ++i) {
        if (strings[i].refCount == 0)
            freeStrings.insert(i);
        else
            stringIndex.emplace(strings[i].text, i); // a repeated text keeps its first slot
    }
}

bool VarDataProcessor::DeleteColumn(const std::string& source, const std::string& variable) {
    auto it = sources.find(source);
    if (it == sources.end())
        return false;
    auto var = it->second.variables.find(variable);
    if (var == it->second.variables.end())
        return false;
    it->second.variables.erase(var);
    auto maps = stringMaps.find(source);
    if (maps != stringMaps.end()) {
        auto map = maps->second.find(variable);
        if (map != maps->second.end()) {
            for (const auto& [row, index] : map->second) {
                if (index != NoString)
                    RemoveString(index);
            }
            maps->second.erase(map);
        }
    }
    return true;
}

unsigned VarDataProcessor::DeleteRow(const std::string& source, unsigned row) {
    auto it = sources.find(source);
    if (it == sources.end())
        return 0;
    StringMap* const none = nullptr;
    auto maps = stringMaps.find(source);
    unsigned rows = 0;
    for (auto& [variable, column] : it->second.variables) {
        if (column.rowCount > row) {
            std::copy(column.values.begin() + row + 1, column.values.begin() + column.rowCount,
                      column.values.begin() + row);
            column.values[column.rowCount - 1] = kMissingValue;
            --column.rowCount;
            // The string values follow their rows, or each label would name its neighbour's value.
            StringMap* map = none;
            if (maps != stringMaps.end()) {
                auto m = maps->second.find(variable);
                if (m != maps->second.end())
                    map = &m->second;
            }
            if (map) {
                auto at = map->lower_bound(row);
                if (at != map->end() && at->first == row) {
                    if (at->second != NoString)
                        RemoveString(at->second);
                    at = map->erase(at);
                }
                StringMap moved(map->begin(), at);
                for (; at != map->end(); ++at)
                    moved.emplace_hint(moved.end(), at->first - 1, at->second);
                map->swap(moved);
            }
        }
        rows = std::max(rows, column.rowCount);
    }
    return rows;
}

bool VarDataProcessor::ReallocBag(_sourcebag& bag, unsigned rows) {
    if (rows <= bag.capacity)
        return true;
    const unsigned capacity = grownCapacity(bag.capacity, rows);
    if (capacity == bag.capacity)
        return true;
    // Allocate every array first so that a failure leaves all of them as they were.
    std::vector<std::vector<double>> grown(bag.variables.size());
    std::size_t i = 0;
    for (auto& [variable, column] : bag.variables) {
        if (!newCells(grown[i], capacity))
            return false;
        std::copy(column.values.begin(), column.values.end(), grown[i++].begin());
    }
    i = 0;
    for (auto& [variable, column] : bag.variables)
        column.values.swap(grown[i++]);
    bag.capacity = capacity;
    return true;
}

bool VarDataProcessor::ReallocSource(const std::string& source, unsigned rows) {
    auto it = sources.find(source);
    if (it == sources.end())
        return true;
    return ReallocBag(it->second, rows);
}

double* VarDataProcessor::SetMaxRow(const std::string& source, const std::string& variable, unsigned rows) {
    auto it = sources.find(source);
    if (it == sources.end())
        return nullptr;
    if (!ReallocBag(it->second, rows))
        return nullptr;
    auto var = it->second.variables.find(variable);
    if (var == it->second.variables.end()) {
        if (!AddVariable(source, variable, nullptr))
            return nullptr;
        var = it->second.variables.find(variable);
    }
    var->second.rowCount = std::max(var->second.rowCount, rows);
    return var->second.values.data();
}

bool VarDataProcessor::SetVariableValue(const std::string& source, const std::string& variable, unsigned row,
                                        double value) {
    if (row == UINT_MAX)
        return false;
    double* cells = SetMaxRow(source, variable, row + 1);
    if (!cells)
        return false;
    cells[row] = value;
    return true;
}

bool VarDataProcessor::SetVariableValueRange(const std::string& source, const std::string& variable,
                                             const double* values, unsigned first, unsigned count) {
    if (count > UINT_MAX - first || (count > 0 && !values))
        return false;
    double* cells = SetMaxRow(source, variable, first + count);
    if (!cells)
        return false;
    std::copy_n(values, count, cells + first);
    return true;
}

bool VarDataProcessor::InitializeVariableValueRange(const std::string& source, const std::string& variable,
                                                    double value, unsigned first, unsigned count) {
    if (count > UINT_MAX - first)
        return false;
    double* cells = SetMaxRow(source, variable, first + count);
    if (!cells)
        return false;
    std::fill_n(cells + first, count, value);
    return true;
}

bool VarDataProcessor::SetVariableValue(_varinfo* info, unsigned row, double value) {
    if (!info || !info->column || row == UINT_MAX)
        return false;
    auto it = sources.find(info->source);
    if (it == sources.end() || !ReallocBag(it->second, row + 1))
        return false;
    info->column->rowCount = std::max(info->column->rowCount, row + 1);
    info->column->values[row] = value;
    return true;
}

VarDataProcessor::StringMap* VarDataProcessor::FindStringMap(const std::string& source,
                                                             const std::string& variable) {
    auto maps = stringMaps.find(source);
    if (maps == stringMaps.end())
        return nullptr;
    auto map = maps->second.find(variable);
    return map == maps->second.end() ? nullptr : &map->second;
}

bool VarDataProcessor::SetString(StringMap& map, _column& column, const std::string& source, unsigned row,
                                 const std::string& text) {
    if (row == UINT_MAX)
        return false;
    // A row count beyond the capacity would make the stream writer read past the array.
    if (!ReallocSource(source, row + 1))
        return false;
    auto at = map.find(row);
    if (at != map.end() && at->second != NoString)
        RemoveString(at->second);
    map[row] = static_cast<unsigned>(AddString(text));
    column.rowCount = std::max(column.rowCount, row + 1);
    return true;
}

bool VarDataProcessor::SetStringVariableValue(const std::string& source, const std::string& variable,
                                              unsigned row, const std::string& text) {
    StringMap* map = FindStringMap(source, variable);
    if (!map)
        return false;
    auto it = sources.find(source);
    if (it == sources.end())
        return false;
    auto var = it->second.variables.find(variable);
    if (var == it->second.variables.end())
        return false;
    return SetString(*map, var->second, source, row, text);
}

bool VarDataProcessor::SetStringVariableValue(_varinfo* info, unsigned row, const std::string& text) {
    if (!info || !info->stringMap || !info->column)
        return false;
    return SetString(*info->stringMap, *info->column, info->source, row, text);
}

bool VarDataProcessor::SetStringVariableValueRange(const std::string& source, const std::string& variable,
                                                   unsigned first, const std::vector<std::string>& texts) {
    StringMap* map = FindStringMap(source, variable);
    if (!map)
        return false;
    if (texts.empty())
        return true;
    if (texts.size() - 1 > UINT_MAX - first)
        return false;
    for (std::size_t i = 0; i < texts.size(); ++i) {
        const unsigned row = first + static_cast<unsigned>(i);
        auto at = map->find(row);
        if (at != map->end() && at->second != NoString)
            RemoveString(at->second);
        (*map)[row] = static_cast<unsigned>(AddString(texts[i]));
    }
    return true;
}

unsigned VarDataProcessor::GetRowCount(const std::string& source) const {
    auto it = sources.find(source);
    if (it == sources.end())
        return 0;
    unsigned rows = 0;
    for (const auto& [variable, column] : it->second.variables)
        rows = std::max(rows, column.rowCount);
    return rows;
}

unsigned VarDataProcessor::GetCapacity(const std::string& source) const {
    auto it = sources.find(source);
    return it == sources.end() ? 0 : it->second.capacity;
}

const double* VarDataProcessor::GetDataPointer(const std::string& source, const std::string& variable) {
    auto it = sources.find(source);
    if (it == sources.end())
        return nullptr;
    auto var = it->second.variables.find(variable);
    if (var == it->second.variables.end()) {
        if (!AddVariable(source, variable, nullptr))
            return nullptr;
        var = it->second.variables.find(variable);
    }
    return var->second.values.data();
}

std::string VarDataProcessor::GetValueAsString(const std::string& source, const std::string& variable,
                                               unsigned row) {
    if (row >= GetRowCount(source))
        return std::string();
    if (const StringMap* map = FindStringMap(source, variable)) {
        auto at = map->find(row);
        if (at != map->end() && at->second != NoString && at->second < strings.size())
            return strings[at->second].text;
    }
    const double* cells = GetDataPointer(source, variable);
    if (!cells)
        return std::string();
    return plotaid::detail::formatCell(cells[row]);
}

int VarDataProcessor::GetSourceNames(std::vector<std::string>& names) const {
    names.clear();
    for (const auto& entry : sources)
        names.push_back(entry.first);
    return static_cast<int>(names.size());
}

int VarDataProcessor::GetVariableNames(const std::string& source, std::vector<std::string>& names) const {
    auto it = sources.find(source);
    if (it == sources.end())
        return 0;
    names.clear();
    for (const auto& entry : it->second.variables)
        names.push_back(entry.first);
    return static_cast<int>(names.size());
}

bool VarDataProcessor::AddVDP(VarDataProcessor& other) {
    if (&other == this)
        return false;
    bool complete = true;
    for (auto& [source, bag] : other.sources) {
        const unsigned rows = other.GetRowCount(source);
        if (!AddDataSource(source, rows))
            return false;
        const StringMap* noMap = nullptr;
        auto otherMaps = other.stringMaps.find(source);
        for (auto& [variable, column] : bag.variables) {
            if (!AddVariable(source, variable, nullptr)) {
                complete = false;
                break;
            }
            if (!SetVariableValueRange(source, variable, column.values.data(), 0, rows))
                return false;
            const StringMap* map = noMap;
            if (otherMaps != other.stringMaps.end()) {
                auto m = otherMaps->second.find(variable);
                if (m != otherMaps->second.end())
                    map = &m->second;
            }
            if (!map)
                continue;
            for (const auto& [row, index] : *map) {
                if (index < other.strings.size())
                    SetStringVariableValue(source, variable, row, other.strings[index].text);
            }
        }
    }
    return complete;
}
