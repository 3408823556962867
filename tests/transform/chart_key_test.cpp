#include <plotaid/ChartKey.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

namespace {

ChartKey keyOf(const std::vector<std::int32_t>& parts, bool hashed = true) {
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
    EXPECT_EQ(keyOf({1, 2}).hashcode(), 3 ^ 10);
    EXPECT_EQ(keyOf({2, 1}).hashcode(), 6 ^ 5);
    ChartKey longKey(50); // the primes repeat after 49 parts
    for (std::int32_t i = 0; i < 50; ++i)
        longKey[i] = i == 49;
    longKey.UpdateHashCode();
    EXPECT_EQ(longKey.hashcode(), 3);
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

// Equal needs hash, length and parts; shorter keys sort first, then the first differing part.
TEST(ChartKey, EqualityOrderAndMismatch) {
    const struct {
        std::vector<std::int32_t> a, b;
        bool equal, less;
        std::int32_t mismatch;
    } rows[] = {
        {{1, 2, 3}, {1, 2, 3}, true, false, 3},  {{1, 2, 3}, {1, 2, 4}, false, true, 2},
        {{0}, {0, 0}, false, true, 1},           {{9, 9}, {0, 0, 0}, false, true, 0},
        {{0, 0, 0}, {9, 9}, false, false, 0},    {{1, 2, 3}, {1, 3, 0}, false, true, 1},
        {{1, 3, 0}, {1, 2, 3}, false, false, 1}, {{-5}, {2}, false, true, 0},
        {{1, 2}, {1, 2, 3}, false, true, 2},     {{1, 2, 3}, {1, 2}, false, false, 2},
    };
    for (const auto& r : rows) {
        const ChartKey a = keyOf(r.a), b = keyOf(r.b);
        SCOPED_TRACE(::testing::PrintToString(r.a) + " vs " + ::testing::PrintToString(r.b));
        EXPECT_EQ(a == b, r.equal);
        EXPECT_EQ(a < b, r.less);
        EXPECT_EQ(a.Mismatch(b), r.mismatch);
    }
    EXPECT_NE(keyOf({4, 5}, false), keyOf({5, 4}, false));
    EXPECT_NE(keyOf({4, 5}, true), keyOf({4, 5}, false));
    // An edited key keeps its stale hash until the next update; equal stale hashes still need equal parts.
    ChartKey edited = keyOf({1, 2});
    edited[1] = 9;
    EXPECT_EQ(edited.hashcode(), 3 ^ 10);
    EXPECT_NE(edited, keyOf({1, 9}));
    edited.UpdateHashCode();
    EXPECT_EQ(edited, keyOf({1, 9}));
    ChartKey stale = keyOf({1, 2});
    stale[0] = 8;
    EXPECT_NE(stale, keyOf({1, 2}));
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
