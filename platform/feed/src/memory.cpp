#include <feed/memory.h>

#include <kovar/kovarconv.h>

#include <cstring>

namespace feed {

namespace {
std::string withoutTrailingBlanks(std::string text) {
    while (!text.empty() && text.back() == ' ')
        text.pop_back();
    return text;
}
} // namespace

void MemoryValueLabels::add(const std::string& value, std::string label) {
    texts_[withoutTrailingBlanks(value)] = std::move(label);
}

bool MemoryValueLabels::GetLabel(double value, std::string& label) const {
    auto it = numbers_.find(value);
    if (it == numbers_.end())
        return false;
    label = it->second;
    return true;
}

bool MemoryValueLabels::GetLabel(const std::string& value, std::string& label) const {
    auto it = texts_.find(withoutTrailingBlanks(value));
    if (it == texts_.end())
        return false;
    label = it->second;
    return true;
}

int MemoryVariable::IsMissing(double value) const {
    return (value == kovar::kMissingValue || missing_.count(value) != 0) ? 1 : 0;
}

MemoryValueLabels& MemoryVariable::valueLabels() {
    if (!labels_)
        labels_ = std::make_unique<MemoryValueLabels>();
    return *labels_;
}

int MemoryDataSource::addVariable(std::string name, std::string label, Kovar_Format format) {
    variables_.push_back(std::make_unique<MemoryVariable>(std::move(name), std::move(label), format));
    return static_cast<int>(variables_.size()) - 1;
}

const Kovar_Variable* MemoryDataSource::GetVariable(int index) const {
    if (index < 0 || static_cast<std::size_t>(index) >= variables_.size())
        return nullptr;
    return variables_[static_cast<std::size_t>(index)].get();
}

int MemoryDataSource::GetSplitVariableIndex(int i) const {
    if (i < 0 || static_cast<std::size_t>(i) >= split_.size())
        return -1;
    return split_[static_cast<std::size_t>(i)];
}

bool MemoryDataSource::UsesSplitHeading(const BpProcedure& procedure) const {
    return noHeading_.count(procedure.Name()) == 0;
}

void MemoryCase::setNumber(unsigned index, double value) {
    OBS cell;
    cell.number = value;
    cells_[index] = {cell};
}

void MemoryCase::setText(unsigned index, const std::string& value) {
    std::vector<OBS> cells((value.size() + 7) / 8 + (value.empty() ? 1 : 0));
    for (OBS& cell : cells)
        std::memset(cell.text, ' ', sizeof cell.text);
    for (std::size_t i = 0; i < value.size(); ++i)
        cells[i / 8].text[i % 8] = value[i];
    cells_[index] = std::move(cells);
}

const OBS* MemoryCase::GetObsPointer(unsigned index) const {
    auto it = cells_.find(index);
    return it == cells_.end() ? nullptr : it->second.data();
}

unsigned MemoryCase::GetObsCount(unsigned index) const {
    auto it = cells_.find(index);
    return it == cells_.end() ? 0u : static_cast<unsigned>(it->second.size());
}

} // namespace feed
