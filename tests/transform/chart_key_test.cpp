#include <plotaid/ChartKey.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <initializer_list>
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

} // namespace

TEST(ChartKey, HashWeightsEachPartByTheOddPrimesInTurn) {
    std::vector<std::int32_t> primes;
    for (int n = 3; n <= 229; ++n) {
        bool prime = true;
        for (int d = 2; d * d <= n; ++d)
            prime = prime && n % d != 0;
        if (prime)
            primes.push_back(n);
    }
    ASSERT_EQ(primes.size(), 49u);
    EXPECT_EQ(std::vector<std::int32_t>(ChartKey::PRIME_FACTOR, ChartKey::PRIME_FACTOR + 49), primes);
    EXPECT_EQ(ChartKey::ADD_LOWER_BOUND, 0);

    EXPECT_EQ(keyOf({1, 2}).hashcode(), 3 ^ 10);
    EXPECT_EQ(keyOf({2, 1}).hashcode(), 6 ^ 5);
    // The table repeats after 49 parts.
    ChartKey longKey(50);
    for (std::int32_t i = 0; i < 50; ++i)
        longKey[i] = i == 49;
    longKey.UpdateHashCode();
    EXPECT_EQ(longKey.hashcode(), 3);
    // Products wrap as 32 bits.
    const std::uint32_t wrapped = (3u * static_cast<std::uint32_t>(INT32_MAX)) ^
                                  (5u * static_cast<std::uint32_t>(INT32_MIN)) ^ (7u * 0xFFFFFFFFu);
    EXPECT_EQ(static_cast<std::uint32_t>(keyOf({INT32_MAX, INT32_MIN, -1}).hashcode()), wrapped);

    EXPECT_EQ(ChartKey().length(), 1);
    EXPECT_EQ(ChartKey(5).hashcode(), 0);
    for (std::int32_t bad : {0, -3}) {
        ChartKey empty(bad);
        empty.UpdateHashCode();
        EXPECT_EQ(empty.length(), 0);
        EXPECT_EQ(empty.hashcode(), 0);
        EXPECT_EQ(empty.Mismatch(keyOf({1})), 0);
    }
}

TEST(ChartKey, EqualityNeedsHashLengthAndParts) {
    EXPECT_EQ(keyOf({1, 2, 3}), keyOf({1, 2, 3}));
    EXPECT_NE(keyOf({1, 2, 3}), keyOf({1, 2, 4}));
    EXPECT_NE(keyOf({0}), keyOf({0, 0})); // same hash, other length
    EXPECT_NE(keyOf({4, 5}, false), keyOf({5, 4}, false));
    EXPECT_NE(keyOf({4, 5}, true), keyOf({4, 5}, false));

    // An edited key keeps its stale hash until the next update.
    ChartKey edited = keyOf({1, 2});
    edited[1] = 9;
    EXPECT_EQ(edited.hashcode(), 3 ^ 10);
    EXPECT_NE(edited, keyOf({1, 9}));
    edited.UpdateHashCode();
    EXPECT_EQ(edited, keyOf({1, 9}));
    // Equal stale hashes still need equal parts.
    ChartKey a = keyOf({1, 2});
    a[0] = 8;
    EXPECT_NE(a, keyOf({1, 2}));

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

    const std::set<ChartKey> sorted{keyOf({2, 1}), keyOf({7}), keyOf({1, 9}), keyOf({2, 1}),
                                    keyOf({1, 2, 3})};
    EXPECT_EQ(std::vector<ChartKey>(sorted.begin(), sorted.end()),
              (std::vector<ChartKey>{keyOf({7}), keyOf({1, 9}), keyOf({2, 1}), keyOf({1, 2, 3})}));
}

TEST(ChartKey, CopiesAreDeepMovesEmptyTheSource) {
    ChartKey original = keyOf({1, 2, 3});
    ChartKey copy(original);
    original[0] = 100;
    EXPECT_EQ(copy, keyOf({1, 2, 3}));

    ChartKey same = keyOf({7, 8, 9}); // same length: parts overwritten in place
    same = copy;
    copy[2] = 50;
    EXPECT_EQ(same, keyOf({1, 2, 3}));
    ChartKey shorter = keyOf({4}); // other length: array replaced
    shorter = copy;
    EXPECT_EQ(shorter.length(), 3);
    EXPECT_EQ(shorter[2], 50);
    EXPECT_EQ(shorter.hashcode(), copy.hashcode());
    ChartKey toEmpty = keyOf({1, 2});
    toEmpty = ChartKey(0);
    EXPECT_EQ(ChartKey(toEmpty).length(), 0);
    EXPECT_EQ(toEmpty.hashcode(), 0);

    ChartKey& alias = same;
    same = alias;
    EXPECT_EQ(same, keyOf({1, 2, 3}));

    ChartKey target(std::move(same));
    EXPECT_EQ(target, keyOf({1, 2, 3}));
    EXPECT_EQ(same.length(), 0); // NOLINT(bugprone-use-after-move)
    ChartKey other = keyOf({5});
    other = std::move(target);
    EXPECT_EQ(other, keyOf({1, 2, 3}));
}
