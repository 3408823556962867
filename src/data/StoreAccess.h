#ifndef PLOTAID_DATA_STOREACCESS_H
#define PLOTAID_DATA_STOREACCESS_H

#include <plotaid/VarDataProcessor.h>

#include <algorithm>
#include <climits>
#include <limits>

namespace plotaid::detail {

inline constexpr double kMissingValue = -std::numeric_limits<double>::max();

// The capacity a data source grows to for rows: doubling, saturating instead of wrapping.
inline unsigned grownCapacity(unsigned capacity, unsigned rows) {
    unsigned long long c = std::max(capacity, 1u);
    while (c < rows)
        c *= 2;
    return static_cast<unsigned>(std::min<unsigned long long>(c, UINT_MAX));
}

// The stream and XML code walk the store's records directly: per-cell name look-ups would cost
// more than the conversion itself.
struct StoreAccess {
    using Store = VarDataProcessor;
    static auto& sources(Store& s) { return s.sources; }
    static const auto& sources(const Store& s) { return s.sources; }
    static auto& stringMaps(Store& s) { return s.stringMaps; }
    static const auto& stringMaps(const Store& s) { return s.stringMaps; }
    static auto& strings(Store& s) { return s.strings; }
    static const auto& strings(const Store& s) { return s.strings; }
    static bool byteOrderFlag(const Store& s) { return s.byteOrderFlag; }
    static bool reallocBag(Store& s, Store::_sourcebag& bag, unsigned rows) {
        return s.ReallocBag(bag, rows);
    }
    static bool allocBag(Store& s, Store::_sourcebag& bag, const std::string& variable) {
        return s.AllocBag(bag, variable);
    }
    static bool removeString(Store& s, unsigned index) { return s.RemoveString(index); }
    static int addString(Store& s, const std::string& text) { return s.AddString(text); }
};

} // namespace plotaid::detail

#endif
