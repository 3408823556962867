#ifndef PLOTAID_CHARTKEY_H
#define PLOTAID_CHARTKEY_H

#include <plotaid/Export.h>

#include <cstdint>

// A compound key of fixed length (for example the category indices of one chart cell) with a
// cached hash code, so that keys compare and hash quickly. The hash is computed only by
// UpdateHashCode; a key edited afterwards keeps its old hash until the next update.
class PLOTAID_API ChartKey {
public:
    static const std::int32_t PRIME_FACTOR[49];
    static const std::int32_t ADD_LOWER_BOUND;

    ChartKey();
    // A length below 1 gives an empty key without parts.
    explicit ChartKey(std::int32_t n);
    ChartKey(const ChartKey& other);
    ChartKey(ChartKey&& other) noexcept;
    ChartKey& operator=(const ChartKey& other);
    ChartKey& operator=(ChartKey&& other) noexcept;
    ~ChartKey();

    // No bounds check: the caller keeps 0 <= i < length().
    std::int32_t& operator[](std::int32_t i) { return values_[i]; }
    const std::int32_t& operator[](std::int32_t i) const { return values_[i]; }

    std::int32_t length() const { return length_; }
    std::int32_t hashcode() const { return hash_; }
    void UpdateHashCode();

    bool operator==(const ChartKey& other) const;
    bool operator!=(const ChartKey& other) const { return !(*this == other); }
    // Order for sorted containers: shorter keys first, then by the first differing part.
    bool operator<(const ChartKey& other) const;

    // The number of leading parts equal in both keys.
    std::int32_t Mismatch(const ChartKey& other) const;

    void display() const {}

private:
    std::int32_t ChartKeyHash() const;

    std::int32_t* values_ = nullptr;
    std::int32_t length_ = 0;
    std::int32_t hash_ = 0;
};

#endif
