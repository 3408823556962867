#include <plotaid/ChartKey.h>

#include <algorithm>
#include <new>
#include <utility>

const std::int32_t ChartKey::PRIME_FACTOR[49] = {
    3,   5,   7,   11,  13,  17,  19,  23,  29,  31,  37,  41,  43,  47,  53,  59,  61,
    67,  71,  73,  79,  83,  89,  97,  101, 103, 107, 109, 113, 127, 131, 137, 139, 149,
    151, 157, 163, 167, 173, 179, 181, 191, 193, 197, 199, 211, 223, 227, 229};

const std::int32_t ChartKey::ADD_LOWER_BOUND = 0;

namespace {
// Parts start at zero rather than indeterminate, so reading an unset part is defined. An
// allocation the system refuses leaves an empty key instead of throwing into the host.
std::int32_t* allocateParts(std::int32_t n) {
    if (n < 1)
        return nullptr;
    return new (std::nothrow) std::int32_t[static_cast<std::size_t>(n)]();
}
} // namespace

ChartKey::ChartKey() : ChartKey(1) {}

ChartKey::ChartKey(std::int32_t n) : values_(allocateParts(n)), length_(values_ ? n : 0) {}

ChartKey::ChartKey(const ChartKey& other)
    : values_(allocateParts(other.length_)), length_(values_ ? other.length_ : 0), hash_(other.hash_) {
    if (values_)
        std::copy(other.values_, other.values_ + length_, values_);
}

ChartKey::ChartKey(ChartKey&& other) noexcept
    : values_(std::exchange(other.values_, nullptr)), length_(std::exchange(other.length_, 0)),
      hash_(std::exchange(other.hash_, 0)) {}

ChartKey& ChartKey::operator=(const ChartKey& other) {
    if (this == &other)
        return *this;
    if (length_ != other.length_) {
        std::int32_t* fresh = allocateParts(other.length_);
        if (!fresh && other.length_ > 0)
            return *this; // keep the old, consistent key rather than a length without parts
        delete[] values_;
        values_ = fresh;
        length_ = other.length_ > 0 ? other.length_ : 0;
    }
    if (values_)
        std::copy(other.values_, other.values_ + length_, values_);
    hash_ = other.hash_;
    return *this;
}

ChartKey& ChartKey::operator=(ChartKey&& other) noexcept {
    if (this != &other) {
        delete[] values_;
        values_ = std::exchange(other.values_, nullptr);
        length_ = std::exchange(other.length_, 0);
        hash_ = std::exchange(other.hash_, 0);
    }
    return *this;
}

ChartKey::~ChartKey() {
    delete[] values_;
}

void ChartKey::UpdateHashCode() {
    hash_ = ChartKeyHash();
}

std::int32_t ChartKey::ChartKeyHash() const {
    if (length_ < 1)
        return 0;
    // Unsigned so the products wrap as 32-bit values instead of overflowing.
    std::uint32_t h = 0;
    for (std::int32_t i = 0; i < length_; ++i)
        h ^= static_cast<std::uint32_t>(PRIME_FACTOR[i % 49]) * static_cast<std::uint32_t>(values_[i]);
    return static_cast<std::int32_t>(h);
}

bool ChartKey::operator==(const ChartKey& other) const {
    if (hash_ != other.hash_ || length_ != other.length_)
        return false;
    return std::equal(values_, values_ + length_, other.values_);
}

bool ChartKey::operator<(const ChartKey& other) const {
    if (length_ != other.length_)
        return length_ < other.length_;
    for (std::int32_t i = 0; i < length_; ++i) {
        if (values_[i] != other.values_[i])
            return values_[i] < other.values_[i];
    }
    return false;
}

std::int32_t ChartKey::Mismatch(const ChartKey& other) const {
    const std::int32_t n = std::min(length_, other.length_);
    std::int32_t i = 0;
    while (i < n && values_[i] == other.values_[i])
        ++i;
    return i;
}
