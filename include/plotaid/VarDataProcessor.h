#ifndef PLOTAID_VARDATAPROCESSOR_H
#define PLOTAID_VARDATAPROCESSOR_H

#include <plotaid/Export.h>

#include <map>
#include <set>
#include <string>
#include <unordered_map>
#include <vector>

namespace plotaid::detail {
struct StoreAccess;
}

// The in-memory store of chart data: named data sources of named variables, each variable a column
// of doubles sharing its data source's capacity, with optional string values per row. Travels as
// a compressed binary data stream (GetDataStream / ReadStreamData). Copies are deep.
class PLOTAID_API VarDataProcessor {
public:
    struct _column {
        unsigned rowCount = 0;
        std::vector<double> values; // capacity cells; at and beyond rowCount the missing value
    };
    struct _sourcebag {
        unsigned capacity = 0;
        std::map<std::string, _column> variables;
    };
    struct _stringentry {
        std::string text;
        unsigned refCount = 0; // 0: free slot, text empty
    };
    using StringMap = std::map<unsigned, unsigned>;

    // Filled by AddVariable so that values can be set without name look-ups.
    struct _varinfo {
        std::string source;
        std::string variable;
        _column* column = nullptr;
        StringMap* stringMap = nullptr;
    };

    static constexpr unsigned NoString = 0xFFFFFFFFu;

    VarDataProcessor();
    VarDataProcessor(const VarDataProcessor& other);
    VarDataProcessor(VarDataProcessor&& other) noexcept;
    VarDataProcessor& operator=(const VarDataProcessor& other);
    VarDataProcessor& operator=(VarDataProcessor&& other) noexcept;
    ~VarDataProcessor();

    bool AddDataSource(const std::string& source, unsigned initialRows);
    bool AddVariable(const std::string& source, const std::string& variable, _varinfo* info = nullptr);
    bool DeleteColumn(const std::string& source, const std::string& variable);
    unsigned DeleteRow(const std::string& source, unsigned row);
    void Reset();

    bool SetVariableValue(const std::string& source, const std::string& variable, unsigned row, double value);
    bool SetVariableValueRange(const std::string& source, const std::string& variable, const double* values,
                               unsigned first, unsigned count);
    bool InitializeVariableValueRange(const std::string& source, const std::string& variable, double value,
                                      unsigned first, unsigned count);
    bool SetVariableValue(_varinfo* info, unsigned row, double value);

    bool SetStringVariableValue(const std::string& source, const std::string& variable, unsigned row,
                                const std::string& text);
    bool SetStringVariableValue(_varinfo* info, unsigned row, const std::string& text);
    bool SetStringVariableValueRange(const std::string& source, const std::string& variable, unsigned first,
                                     const std::vector<std::string>& texts);

    unsigned GetRowCount(const std::string& source) const;
    unsigned GetCapacity(const std::string& source) const;
    const double* GetDataPointer(const std::string& source, const std::string& variable);
    std::string GetValueAsString(const std::string& source, const std::string& variable, unsigned row);
    int GetSourceNames(std::vector<std::string>& names) const;
    int GetVariableNames(const std::string& source, std::vector<std::string>& names) const;

    // True when every data source and variable of other was copied (none existed here already).
    bool AddVDP(VarDataProcessor& other);

    // A new array (release with delete[]) holding the compressed stream, or null on failure.
    unsigned char* GetDataStream(unsigned& length);
    bool ReadStreamData(void* data, unsigned length);

private:
    friend struct plotaid::detail::StoreAccess;

    bool AllocBag(_sourcebag& bag, const std::string& variable);
    bool ReallocSource(const std::string& source, unsigned rows);
    bool ReallocBag(_sourcebag& bag, unsigned rows);
    double* SetMaxRow(const std::string& source, const std::string& variable, unsigned rows);
    StringMap* FindStringMap(const std::string& source, const std::string& variable);
    int AddString(const std::string& text);
    bool RemoveString(unsigned index);
    bool SetString(StringMap& map, _column& column, const std::string& source, unsigned row,
                   const std::string& text);
    unsigned StringDataSize() const;
    bool ReadStream(void* data, unsigned length);
    void IndexStrings();
    static void SwapBytes(char* bytes, int count);

    std::map<std::string, _sourcebag> sources;
    std::map<std::string, std::map<std::string, StringMap>> stringMaps;
    std::vector<_stringentry> strings;
    // The slot of every text in use, and the free slots (the lowest is taken first).
    std::unordered_map<std::string, unsigned> stringIndex;
    std::set<unsigned> freeStrings;
    bool byteOrderFlag = false;
};

#endif
