#ifndef FEED_FEED_H
#define FEED_FEED_H

#include <plotaid/Kovar_Format.h>

#include <string>

// The host's data-source interfaces: data sources, variables, value labels and the case iterator.
// A library reads procedure data only through these; feed/memory.h holds a small in-memory
// implementation for tests and the tool.
namespace feed {

class BpProcedure;

// One cell of a case: a number, or eight bytes of a text value. A text value of width w occupies
// (w + 7) / 8 consecutive cells.
union OBS {
    double number;
    char text[8];
};
static_assert(sizeof(OBS) == 8, "a case cell is eight bytes");

class Kovar_ValueLabelMap {
public:
    virtual ~Kovar_ValueLabelMap() = default;
    // The label of a number, or of a text value (compared without trailing blanks); false when
    // the value has none.
    virtual bool GetLabel(double value, std::string& label) const = 0;
    virtual bool GetLabel(const std::string& value, std::string& label) const = 0;
};

class Kovar_Variable {
public:
    virtual ~Kovar_Variable() = default;
    virtual std::string GetName() const = 0;
    // Empty when the variable has no label.
    virtual std::string GetLabel() const = 0;
    virtual Kovar_Format GetFormat() const = 0;
    // Null when the variable has no value labels.
    virtual const Kovar_ValueLabelMap* GetValueLabels() const = 0;
    // 1 when the number is system- or user-missing, else 0.
    virtual int IsMissing(double value) const = 0;
};

class Kovar_DataSource {
public:
    virtual ~Kovar_DataSource() = default;
    virtual int GetVariableCount() const = 0;
    // Null for an index outside the data source.
    virtual const Kovar_Variable* GetVariable(int index) const = 0;
};

// The data source of a procedure, which knows the split-file variables.
class ProcedureDataSource : public Kovar_DataSource {
public:
    virtual int GetSplitVariableCount() const = 0;
    // The data-source index of the i-th split variable.
    virtual int GetSplitVariableIndex(int i) const = 0;
    // Whether the procedure's output carries split headings.
    virtual bool UsesSplitHeading(const BpProcedure& procedure) const = 0;
};

class Kovar_InputCaseIterator {
public:
    virtual ~Kovar_InputCaseIterator() = default;
    // The first cell of the variable's value in the current case, or null.
    virtual const OBS* GetObsPointer(unsigned index) const = 0;
    // How many cells may be read from GetObsPointer(index); 0 when it is null.
    virtual unsigned GetObsCount(unsigned index) const = 0;
};

class ProcDSIterator : public Kovar_InputCaseIterator {};

} // namespace feed

#endif
