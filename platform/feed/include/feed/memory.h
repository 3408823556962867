#ifndef FEED_MEMORY_H
#define FEED_MEMORY_H

#include <feed/corekit.h>
#include <feed/feed.h>

#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

// An in-memory data source with one current case, for tests and the tool.
namespace feed {

class MemoryValueLabels final : public Kovar_ValueLabelMap {
public:
    void add(double value, std::string label) { numbers_[value] = std::move(label); }
    void add(const std::string& value, std::string label);
    bool GetLabel(double value, std::string& label) const override;
    bool GetLabel(const std::string& value, std::string& label) const override;

private:
    std::map<double, std::string> numbers_;
    std::map<std::string, std::string> texts_;
};

class MemoryVariable final : public Kovar_Variable {
public:
    MemoryVariable(std::string name, std::string label, Kovar_Format format)
        : name_(std::move(name)), label_(std::move(label)), format_(format) {}

    std::string GetName() const override { return name_; }
    std::string GetLabel() const override { return label_; }
    Kovar_Format GetFormat() const override { return format_; }
    const Kovar_ValueLabelMap* GetValueLabels() const override { return labels_ ? &*labels_ : nullptr; }
    int IsMissing(double value) const override;

    MemoryValueLabels& valueLabels();
    void addMissingValue(double value) { missing_.insert(value); }

private:
    std::string name_;
    std::string label_;
    Kovar_Format format_;
    std::unique_ptr<MemoryValueLabels> labels_;
    std::set<double> missing_;
};

class MemoryDataSource final : public ProcedureDataSource {
public:
    // The new variable's index.
    int addVariable(std::string name, std::string label, Kovar_Format format);
    MemoryVariable& variable(int index) { return *variables_.at(static_cast<std::size_t>(index)); }

    void setSplitVariables(std::vector<int> indices) { split_ = std::move(indices); }
    // Procedures whose output carries no split heading.
    void suppressSplitHeading(const std::string& procedure) { noHeading_.insert(procedure); }

    int GetVariableCount() const override { return static_cast<int>(variables_.size()); }
    const Kovar_Variable* GetVariable(int index) const override;
    int GetSplitVariableCount() const override { return static_cast<int>(split_.size()); }
    int GetSplitVariableIndex(int i) const override;
    bool UsesSplitHeading(const BpProcedure& procedure) const override;

private:
    std::vector<std::unique_ptr<MemoryVariable>> variables_;
    std::vector<int> split_;
    std::set<std::string> noHeading_;
};

class MemoryCase final : public ProcDSIterator {
public:
    void setNumber(unsigned index, double value);
    // Stored blank-padded to whole cells.
    void setText(unsigned index, const std::string& value);
    void clear(unsigned index) { cells_.erase(index); }

    const OBS* GetObsPointer(unsigned index) const override;
    unsigned GetObsCount(unsigned index) const override;

private:
    std::map<unsigned, std::vector<OBS>> cells_;
};

} // namespace feed

#endif
