#include <plotaid/ChartKey.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <initializer_list>
#include <map>
#include <set>
#include <vector>

namespace {

ChartKey keyOf(std::initializer_list<std::int32_t> parts, bool hashed = true) {
    ChartKey k(static_cast<std::int32_t>(parts.size()));
    std::int32_t i = 0;
    for (std::int32_t p : parts)
        k[i++] = p;
    if (hashed)
        k.UpdateHashCode();
    return k;
}

bool isPrime(int n) {
    for (int d = 2; d * d <= n; ++d)
        if (n % d == 0)
            return false;
    return n > 1;
}

} // namespace

TEST(ChartKey, PrimeTableHoldsTheOddPrimesUpTo229) {
    std::vector<std::int32_t> expected;
    for (int n = 3; n <= 229; ++n)
        if (isPrime(n))
            expected.push_back(n);
    ASSERT_EQ(expected.size(), 49u);
    EXPECT_EQ(std::vector<std::int32_t>(ChartKey::PRIME_FACTOR, ChartKey::PRIME_FACTOR + 49), expected);
    EXPECT_EQ(ChartKey::ADD_LOWER_BOUND, 0);
}

TEST(ChartKey, ConstructionGivesLengthAndZeroHash) {
    const ChartKey single;
    EXPECT_EQ(single.length(), 1);
    EXPECT_EQ(single.hashcode(), 0);
    const ChartKey five(5);
    EXPECT_EQ(five.length(), 5);
    EXPECT_EQ(five.hashcode(), 0);
    for (std::int32_t bad : {0, -3}) {
        ChartKey empty(bad);
        EXPECT_EQ(empty.length(), 0);
        empty.UpdateHashCode();
        EXPECT_EQ(empty.hashcode(), 0);
        EXPECT_EQ(empty.Mismatch(keyOf({1})), 0);
    }
}

TEST(ChartKey, HashWeightsEachPartByItsPrime) {
    EXPECT_EQ(keyOf({1, 2}).hashcode(), 3 ^ 10);
    EXPECT_EQ(keyOf({2, 1}).hashcode(), 6 ^ 5);
    EXPECT_EQ(keyOf({7}).hashcode(), 21);

    // The table repeats after 49 parts: part 50 (index 49) is weighted by 3 again.
    ChartKey longKey(50);
    for (std::int32_t i = 0; i < 50; ++i)
        longKey[i] = 0;
    longKey[49] = 1;
    longKey.UpdateHashCode();
    EXPECT_EQ(longKey.hashcode(), 3);
    longKey[49] = 0;
    longKey[48] = 1;
    longKey.UpdateHashCode();
    EXPECT_EQ(longKey.hashcode(), 229);
}

TEST(ChartKey, HashProductsWrapAsThirtyTwoBits) {
    const ChartKey big = keyOf({INT32_MAX, INT32_MIN, -1});
    const std::uint32_t expected = (3u * static_cast<std::uint32_t>(INT32_MAX)) ^
                                   (5u * static_cast<std::uint32_t>(INT32_MIN)) ^ (7u * 0xFFFFFFFFu);
    EXPECT_EQ(static_cast<std::uint32_t>(big.hashcode()), expected);
}

TEST(ChartKey, EqualityComparesHashLengthAndParts) {
    EXPECT_EQ(keyOf({1, 2, 3}), keyOf({1, 2, 3}));
    EXPECT_NE(keyOf({1, 2, 3}), keyOf({1, 2, 4}));
    EXPECT_NE(keyOf({1, 2}), keyOf({1, 2, 0}));
    // Parts 0 and 0,0 hash alike; length still tells them apart.
    EXPECT_NE(keyOf({0}), keyOf({0, 0}));
    // Keys never hashed compare by length and parts.
    EXPECT_EQ(keyOf({4, 5}, false), keyOf({4, 5}, false));
    EXPECT_NE(keyOf({4, 5}, false), keyOf({5, 4}, false));
    // One hashed, one not: the hashes differ.
    EXPECT_NE(keyOf({4, 5}, true), keyOf({4, 5}, false));
}

TEST(ChartKey, StaleHashIsKeptUntilTheNextUpdate) {
    ChartKey edited = keyOf({1, 2});
    edited[1] = 9;
    EXPECT_EQ(edited.hashcode(), 3 ^ 10);
    const ChartKey fresh = keyOf({1, 9});
    EXPECT_NE(edited, fresh); // stale hash differs
    edited.UpdateHashCode();
    EXPECT_EQ(edited, fresh);

    // A stale hash that happens to equal the other's still needs equal parts.
    ChartKey a = keyOf({1, 2});
    const ChartKey b = keyOf({1, 2});
    a[0] = 8;
    EXPECT_EQ(a.hashcode(), b.hashcode());
    EXPECT_NE(a, b);
}

TEST(ChartKey, MismatchCountsEqualLeadingParts) {
    EXPECT_EQ(keyOf({1, 2, 3}).Mismatch(keyOf({1, 2, 4})), 2);
    EXPECT_EQ(keyOf({1, 2}).Mismatch(keyOf({1, 2, 3})), 2);
    EXPECT_EQ(keyOf({1, 2, 3}).Mismatch(keyOf({1, 2})), 2);
    EXPECT_EQ(keyOf({1, 2, 3}).Mismatch(keyOf({1, 2, 3})), 3);
    EXPECT_EQ(keyOf({5, 2, 3}).Mismatch(keyOf({1, 2, 3})), 0);
}

TEST(ChartKey, OrderPutsShorterKeysFirstThenFirstDifferingPart) {
    EXPECT_LT(keyOf({9, 9}), keyOf({0, 0, 0}));
    EXPECT_FALSE(keyOf({0, 0, 0}) < keyOf({9, 9}));
    EXPECT_LT(keyOf({1, 2, 3}), keyOf({1, 3, 0}));
    EXPECT_FALSE(keyOf({1, 3, 0}) < keyOf({1, 2, 3}));
    EXPECT_LT(keyOf({-5}), keyOf({2}));
    EXPECT_FALSE(keyOf({1, 2}) < keyOf({1, 2}));

    std::set<ChartKey> sorted{keyOf({2, 1}), keyOf({7}), keyOf({1, 9}), keyOf({2, 1}), keyOf({1, 2, 3})};
    ASSERT_EQ(sorted.size(), 4u);
    std::vector<ChartKey> order(sorted.begin(), sorted.end());
    EXPECT_EQ(order[0], keyOf({7}));
    EXPECT_EQ(order[1], keyOf({1, 9}));
    EXPECT_EQ(order[2], keyOf({2, 1}));
    EXPECT_EQ(order[3], keyOf({1, 2, 3}));

    std::map<ChartKey, int> cells;
    cells[keyOf({0, 1})] = 1;
    cells[keyOf({0, 1})] += 1;
    EXPECT_EQ(cells.size(), 1u);
    EXPECT_EQ(cells.begin()->second, 2);
}

TEST(ChartKey, CopiesAreDeepAndKeepTheHash) {
    ChartKey original = keyOf({1, 2, 3});
    ChartKey copy(original);
    original[0] = 100;
    EXPECT_EQ(copy[0], 1);
    EXPECT_EQ(copy.length(), 3);
    EXPECT_EQ(copy.hashcode(), keyOf({1, 2, 3}).hashcode());

    // Same length: parts are overwritten in place.
    ChartKey same = keyOf({7, 8, 9});
    same = copy;
    EXPECT_EQ(same, copy);
    copy[2] = 50;
    EXPECT_EQ(same[2], 3);

    // Different length: the array is replaced.
    ChartKey shorter = keyOf({4});
    shorter = copy;
    EXPECT_EQ(shorter.length(), 3);
    EXPECT_EQ(shorter[2], 50);
    EXPECT_EQ(shorter.hashcode(), copy.hashcode());

    ChartKey toEmpty = keyOf({1, 2});
    toEmpty = ChartKey(0);
    EXPECT_EQ(toEmpty.length(), 0);
    EXPECT_EQ(toEmpty.hashcode(), 0);
    const ChartKey copyOfEmpty(toEmpty);
    EXPECT_EQ(copyOfEmpty.length(), 0);
}

TEST(ChartKey, SelfAssignmentKeepsTheKey) {
    ChartKey k = keyOf({3, 1, 4});
    const std::int32_t hash = k.hashcode();
    ChartKey& alias = k;
    k = alias;
    EXPECT_EQ(k.length(), 3);
    EXPECT_EQ(k[0], 3);
    EXPECT_EQ(k[2], 4);
    EXPECT_EQ(k.hashcode(), hash);
}

TEST(ChartKey, MovedFromKeyIsEmpty) {
    ChartKey source = keyOf({1, 2});
    ChartKey target(std::move(source));
    EXPECT_EQ(target, keyOf({1, 2}));
    EXPECT_EQ(source.length(), 0); // NOLINT(bugprone-use-after-move)
    ChartKey other = keyOf({5});
    other = std::move(target);
    EXPECT_EQ(other, keyOf({1, 2}));
}
