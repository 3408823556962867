#include "TestStreams.h"

#include <gtest/gtest.h>

#include <vector>

using namespace chartdata_test;

namespace {

// One data source "src" with variables "a" = {1, 2, 3} and "b" = {4, missing}, no strings.
std::string expectedSmallLayout() {
    std::string raw;
    raw += '\0';
    raw += static_cast<char>(0xB0);
    raw += '\x01';
    raw += '\0';
    appendU32(raw, 712);
    appendU32(raw, 3);
    appendU32(raw, 2);
    appendU32(raw, 88);
    appendField(raw, "src", 65);
    raw.append(3, '\0');
    appendField(raw, "a", 288);
    for (double v : {1.0, 2.0, 3.0})
        appendDouble(raw, v);
    appendField(raw, "b", 288);
    for (double v : {4.0, kMissing, kMissing})
        appendDouble(raw, v);
    return raw;
}

VarDataProcessor smallStore() {
    VarDataProcessor store;
    const double a[] = {1, 2, 3};
    store.AddDataSource("src", 3);
    store.SetVariableValueRange("src", "a", a, 0, 3);
    store.SetVariableValue("src", "b", 0, 4);
    return store;
}

VarDataProcessor storeWithStrings() {
    VarDataProcessor store = smallStore();
    store.SetStringVariableValue("src", "a", 1, "two");
    store.SetStringVariableValue("src", "b", 1, "two");
    store.SetStringVariableValue("src", "b", 2, "x;y");
    store.AddVariable("other", "c");
    store.SetVariableValue("other", "c", 30000, 6);
    return store;
}

void expectSameContent(VarDataProcessor& a, VarDataProcessor& b) {
    std::vector<std::string> sa, sb;
    ASSERT_EQ(a.GetSourceNames(sa), b.GetSourceNames(sb));
    ASSERT_EQ(sa, sb);
    for (const std::string& s : sa) {
        std::vector<std::string> va, vb;
        a.GetVariableNames(s, va);
        b.GetVariableNames(s, vb);
        ASSERT_EQ(va, vb);
        ASSERT_EQ(a.GetRowCount(s), b.GetRowCount(s));
        for (const std::string& v : va)
            for (unsigned r = 0; r < a.GetRowCount(s); ++r)
                ASSERT_EQ(a.GetValueAsString(s, v, r), b.GetValueAsString(s, v, r))
                    << s << "/" << v << "/" << r;
    }
}

} // namespace

TEST(DataStreamLayout, EmptyStoreIsEightBytes) {
    VarDataProcessor store;
    const Stream s = streamOf(store);
    ASSERT_NE(s.bytes, nullptr);
    EXPECT_EQ(s.bytes[0], 0x78);
    EXPECT_EQ(rawOf(s), std::string("\0\xB0\0\0\x08\0\0\0", 8));
}

TEST(DataStreamLayout, SmallStoreMatchesHandBuiltBytes) {
    VarDataProcessor store = smallStore();
    const std::string raw = rawOf(streamOf(store));
    // The three unused bytes of a table entry are not part of the contract.
    std::string expected = expectedSmallLayout();
    ASSERT_EQ(raw.size(), 712u);
    for (std::size_t i = 8 + 77; i < 8 + 80; ++i)
        expected[i] = raw[i];
    EXPECT_EQ(raw, expected);
    EXPECT_EQ(u32At(raw, 16), 88u);
}

TEST(DataStreamLayout, StringSectionFollowsTheBlocks) {
    VarDataProcessor store = smallStore();
    store.SetStringVariableValue("src", "b", 2, "hi");
    const std::string raw = rawOf(streamOf(store));
    std::string section;
    appendU32(section, 1);
    appendU32(section, 3);
    section += "src";
    appendU32(section, 2);
    appendU32(section, 1);
    section += "a";
    appendU32(section, 0);
    appendU32(section, 1);
    section += "b";
    appendU32(section, 1);
    appendU32(section, 2);
    appendU32(section, 0);
    appendU32(section, 1);
    appendU32(section, 1);
    appendU32(section, 2);
    section += "hi";
    ASSERT_EQ(raw.size(), 712u + section.size());
    EXPECT_EQ(u32At(raw, 4), raw.size());
    EXPECT_EQ(raw.substr(712), section);
}

TEST(DataStreamLayout, EmptyStringMapsWriteNoSection) {
    VarDataProcessor store = smallStore();
    store.SetStringVariableValue("src", "a", 0, "gone");
    store.DeleteRow("src", 0); // the only string goes with its row
    const std::string raw = rawOf(streamOf(store));
    EXPECT_EQ(raw.size(), 8u + 80 + 2 * (288 + 16));
    VarDataProcessor back;
    ASSERT_TRUE(readInto(back, compressed(raw)));
    EXPECT_TRUE(back.SetStringVariableValue("src", "a", 0, "map exists"));
}

TEST(DataStreamRoundTrip, NumbersStringsAndShortVariables) {
    VarDataProcessor store = storeWithStrings();
    const Stream s = streamOf(store);
    VarDataProcessor back;
    ASSERT_TRUE(back.ReadStreamData(s.bytes.get(), s.length));
    expectSameContent(store, back);
    EXPECT_EQ(back.GetValueAsString("src", "b", 2), "x;y");
    // A variable shorter than its data source comes back with the source's row count.
    EXPECT_EQ(back.GetRowCount("src"), 3u);
    EXPECT_EQ(back.GetDataPointer("src", "b")[2], kMissing);
    // 30001 rows: a capacity of 20000 that doubles once.
    EXPECT_EQ(back.GetCapacity("other"), 40000u);
    // Reference counts came back: freeing both references of "two" frees its slot.
    back.SetStringVariableValue("src", "a", 1, "p");
    back.SetStringVariableValue("src", "b", 1, "q");
    VarDataProcessor::_varinfo info;
    back.AddVariable("src", "fresh", &info);
    back.SetStringVariableValue(&info, 0, "two");
    EXPECT_EQ(info.stringMap->at(0), 3u) << "two was dropped and is appended anew";
}

TEST(DataStreamRoundTrip, LongNamesAreCutTheSameWayEverywhere) {
    VarDataProcessor store;
    const std::string source(70, 's');
    const std::string variable(300, 'v');
    store.AddVariable(source, variable);
    store.SetStringVariableValue(source, variable, 0, "text");
    const Stream s = streamOf(store);
    VarDataProcessor back;
    ASSERT_TRUE(back.ReadStreamData(s.bytes.get(), s.length));
    EXPECT_EQ(back.GetValueAsString(source.substr(0, 64), variable.substr(0, 287), 0), "text");
}

TEST(DataStreamRoundTrip, RawLayoutIsReadToo) {
    std::string raw = expectedSmallLayout();
    VarDataProcessor back;
    ASSERT_TRUE(readInto(back, raw));
    EXPECT_EQ(back.GetValueAsString("src", "a", 2), "3");
    EXPECT_EQ(back.GetValueAsString("src", "b", 1), "");
}

TEST(DataStreamRoundTrip, OtherByteOrderIsReversed) {
    std::string raw;
    raw += '\x01';
    raw += static_cast<char>(0xB0);
    raw += '\0';
    raw += '\x01';
    appendU32(raw, 0, true); // total, patched below
    appendU32(raw, 2, true);
    appendU32(raw, 1, true);
    appendU32(raw, 88, true);
    appendField(raw, "big", 65);
    raw.append(3, '\0');
    appendField(raw, "v", 288);
    appendDouble(raw, 1.25, true);
    appendDouble(raw, -7, true);
    appendU32(raw, 1, true);
    appendU32(raw, 3, true);
    raw += "big";
    appendU32(raw, 1, true);
    appendU32(raw, 1, true);
    raw += "v";
    appendU32(raw, 1, true);
    appendU32(raw, 1, true);
    appendU32(raw, 0, true);
    appendU32(raw, 1, true);
    appendU32(raw, 1, true);
    appendU32(raw, 2, true);
    raw += "ok";
    const std::uint32_t total = static_cast<std::uint32_t>(raw.size());
    raw[4] = static_cast<char>(total >> 24);
    raw[5] = static_cast<char>(total >> 16);
    raw[6] = static_cast<char>(total >> 8);
    raw[7] = static_cast<char>(total);
    VarDataProcessor back;
    ASSERT_TRUE(readInto(back, compressed(raw)));
    EXPECT_EQ(back.GetDataPointer("big", "v")[0], 1.25);
    EXPECT_EQ(back.GetValueAsString("big", "v", 0), "1.25");
    EXPECT_EQ(back.GetValueAsString("big", "v", 1), "ok");
}

TEST(DataStreamHostile, EveryTruncationFails) {
    VarDataProcessor store = smallStore();
    store.SetStringVariableValue("src", "b", 2, "hi");
    const std::string raw = rawOf(streamOf(store));
    for (std::size_t n = 0; n < raw.size(); ++n) {
        VarDataProcessor back;
        EXPECT_FALSE(readInto(back, compressed(raw.substr(0, n)))) << "raw cut at " << n;
        EXPECT_FALSE(readInto(back, raw.substr(0, n))) << "uncompressed cut at " << n;
    }
    const std::string packed = compressed(raw);
    for (std::size_t n = 0; n < packed.size(); ++n) {
        VarDataProcessor back;
        EXPECT_FALSE(readInto(back, packed.substr(0, n))) << "compressed cut at " << n;
    }
    VarDataProcessor back;
    EXPECT_TRUE(readInto(back, packed));
    EXPECT_FALSE(back.ReadStreamData(nullptr, 10));
}

TEST(DataStreamHostile, LyingCountsFail) {
    const std::string good = expectedSmallLayout();
    struct Lie {
        const char* what;
        std::size_t at;
        std::uint32_t value;
        bool sixteen;
    };
    const Lie lies[] = {
        {"more sources", 2, 2, true},
        {"total too short", 4, 100, false},
        {"huge total", 4, 0xFFFFFFFF, false},
        {"more rows", 8, 4, false},
        {"huge rows", 8, 0x20000000, false},
        {"more variables", 12, 3, false},
        {"huge variables", 12, 0xFFFFFFFF, false},
        {"offset elsewhere", 16, 400, false},
        {"offset outside", 16, 0xFFFFFF00, false},
        {"wrong mark", 0, 0x0000C000, true},
    };
    for (const Lie& lie : lies) {
        std::string raw = good;
        for (int i = 0; i < (lie.sixteen ? 2 : 4); ++i)
            raw[lie.at + i] = static_cast<char>(lie.value >> (8 * i));
        VarDataProcessor back;
        back.AddVariable("before", "x");
        EXPECT_FALSE(readInto(back, compressed(raw))) << lie.what;
        std::vector<std::string> names;
        EXPECT_EQ(back.GetSourceNames(names), 0) << lie.what << ": a failed read leaves the store empty";
    }
}

TEST(DataStreamHostile, BadStringSectionKeepsTheNumbers) {
    VarDataProcessor store = smallStore();
    store.SetStringVariableValue("src", "b", 2, "hi");
    const std::string raw = rawOf(streamOf(store));
    // The string index of b's entry (last pair) points past the table.
    std::string badIndex = raw;
    const std::size_t indexAt = raw.size() - 2 - 4 - 4 - 4 - 4;
    ASSERT_EQ(u32At(raw, indexAt), 0u);
    badIndex[indexAt] = 5;
    VarDataProcessor back;
    EXPECT_FALSE(readInto(back, compressed(badIndex)));
    EXPECT_EQ(back.GetValueAsString("src", "a", 2), "3");
    EXPECT_EQ(back.GetValueAsString("src", "b", 2), "");

    // A text length beyond the section.
    std::string longText = raw;
    longText[raw.size() - 2 - 4] = 100;
    EXPECT_FALSE(readInto(back, compressed(longText)));
    EXPECT_EQ(back.GetValueAsString("src", "a", 0), "1");

    // A lying reference count is corrected from the maps, so releasing it cannot underflow.
    std::string lyingCount = raw;
    lyingCount[raw.size() - 2 - 4 - 4] = 9;
    ASSERT_TRUE(readInto(back, compressed(lyingCount)));
    back.SetStringVariableValue("src", "b", 2, "other");
    VarDataProcessor::_varinfo info;
    back.AddVariable("src", "c", &info);
    back.SetStringVariableValue(&info, 0, "third");
    EXPECT_EQ(info.stringMap->at(0), 1u) << "slot 0 of \"hi\" was freed, \"other\" took it";
}

TEST(DataStreamHostile, TrailingBytesFail) {
    VarDataProcessor back;
    // A total one byte too long announces a string section that is not there.
    std::string longer = expectedSmallLayout();
    longer[4] = static_cast<char>(713 & 0xFF);
    EXPECT_FALSE(readInto(back, compressed(longer)));
    EXPECT_FALSE(readInto(back, compressed(expectedSmallLayout() + "junk")));
    std::string packed = compressed(expectedSmallLayout());
    EXPECT_FALSE(readInto(back, packed + "x"));
    packed[packed.size() - 1] ^= 1; // checksum
    EXPECT_FALSE(readInto(back, packed));
}

TEST(DataStreamLimits, MoreSourcesThanTheHeaderCountsAreRefused) {
    VarDataProcessor store;
    for (unsigned s = 0; s < 65536; ++s)
        store.AddDataSource("s" + std::to_string(s), 0);
    unsigned length = 99;
    std::unique_ptr<unsigned char[]> s(store.GetDataStream(length));
    EXPECT_EQ(s, nullptr) << "S is 16 bits: 65536 would be written as 0";
    EXPECT_EQ(length, 0u);
    store.Reset();
    for (unsigned k = 0; k < 65535; k += 1000)
        store.AddDataSource("s" + std::to_string(k), 0);
    s.reset(store.GetDataStream(length));
    ASSERT_NE(s, nullptr);
    VarDataProcessor back;
    ASSERT_TRUE(back.ReadStreamData(s.get(), length));
    std::vector<std::string> names;
    EXPECT_EQ(back.GetSourceNames(names), 66);
}
