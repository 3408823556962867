#include "TestStreams.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

using namespace chartdata_test;

namespace {

// One data source "src" with variables "a" = {1, 2, 3} and "b" = {4, missing}, no strings: the
// header, one table entry (three unused bytes zero) and the two variable blocks.
std::string smallLayout() {
    std::string raw("\0\xB0\x01\0", 4);
    appendU32(raw, {712, 3, 2, 88});
    appendField(raw, "src", 68);
    appendField(raw, "a", 288);
    for (double v : {1.0, 2.0, 3.0})
        appendDouble(raw, v);
    appendField(raw, "b", 288);
    for (double v : {4.0, kMissing, kMissing})
        appendDouble(raw, v);
    return raw;
}

VarDataProcessor smallStore(const char* bText = nullptr) {
    VarDataProcessor store;
    const double a[] = {1, 2, 3};
    store.AddDataSource("src", 3);
    store.SetVariableValueRange("src", "a", a, 0, 3);
    store.SetVariableValue("src", "b", 0, 4);
    if (bText)
        store.SetStringVariableValue("src", "b", 2, bText);
    return store;
}

std::string rawOfStore(VarDataProcessor store) { return rawOf(streamOf(store)); }

// Slot of a text newly added to the store: tells which slots the string table holds free.
unsigned nextSlot(VarDataProcessor& store, const std::string& text) {
    VarDataProcessor::_varinfo info;
    store.AddVariable("src", "probe", &info);
    store.SetStringVariableValue(&info, 0, text);
    return info.stringMap->at(0);
}

} // namespace

TEST(DataStreamLayout, BytesOfEmptySmallAndStringStores) {
    VarDataProcessor empty;
    const Stream s = streamOf(empty);
    ASSERT_NE(s.bytes, nullptr);
    EXPECT_EQ(s.bytes[0], 0x78);
    EXPECT_EQ(rawOf(s), std::string("\0\xB0\0\0\x08\0\0\0", 8));
    std::string raw = rawOfStore(smallStore());
    ASSERT_EQ(raw.size(), 712u);
    raw.replace(8 + 77, 3, 3, '\0'); // the unused bytes are not part of the contract
    EXPECT_EQ(raw, smallLayout());

    // The string section follows the blocks: sources, variables with their row-to-slot pairs, texts.
    raw = rawOfStore(smallStore("hi"));
    std::string section;
    appendU32(section, {1, 3});
    section += "src";
    appendU32(section, {2, 1});
    section += "a";
    appendU32(section, {0, 1});
    section += "b";
    appendU32(section, {1, 2, 0, 1, 1, 2});
    section += "hi";
    ASSERT_EQ(raw.size(), 712u + section.size());
    EXPECT_EQ(u32At(raw, 4), raw.size());
    EXPECT_EQ(raw.substr(712), section);

    // Empty string maps write no section, and come back as maps all the same.
    VarDataProcessor gone = smallStore();
    gone.SetStringVariableValue("src", "a", 0, "gone");
    gone.DeleteRow("src", 0);
    raw = rawOfStore(gone);
    EXPECT_EQ(raw.size(), 8u + 80 + 2 * (288 + 16));
    VarDataProcessor back;
    ASSERT_TRUE(readInto(back, compressed(raw)));
    EXPECT_TRUE(back.SetStringVariableValue("src", "a", 0, "map exists"));
}

TEST(DataStreamRoundTrip, NumbersStringsShortVariablesAndLongNames) {
    VarDataProcessor store = smallStore();
    store.SetStringVariableValue("src", "a", 1, "two");
    store.SetStringVariableValue("src", "b", 1, "two");
    store.SetStringVariableValue("src", "b", 2, "x;y");
    store.AddVariable("other", "c");
    store.SetVariableValue("other", "c", 30000, 6);
    const std::string source(70, 's'), variable(300, 'v');
    store.AddVariable(source, variable);
    store.SetVariableValue(source, variable, 0, 5);
    const Stream s = streamOf(store);
    VarDataProcessor back;
    ASSERT_TRUE(back.ReadStreamData(s.bytes.get(), s.length));
    std::vector<std::string> sources;
    back.GetSourceNames(sources);
    EXPECT_EQ(sources, (std::vector<std::string>{"other", "src", source.substr(0, 64)}));
    for (const char* v : {"a", "b"})
        for (unsigned r = 0; r < 3; ++r)
            EXPECT_EQ(back.GetValueAsString("src", v, r), store.GetValueAsString("src", v, r)) << v << r;
    EXPECT_EQ(back.GetValueAsString("src", "b", 2), "x;y");
    // Names are cut the same way on both sides; a short variable takes its source's row count.
    EXPECT_EQ(back.GetValueAsString(source.substr(0, 64), variable.substr(0, 287), 0), "5");
    EXPECT_EQ(back.GetRowCount("src"), 3u);
    EXPECT_EQ(back.GetDataPointer("src", "b")[2], kMissing);
    EXPECT_EQ(back.GetRowCount("other"), 30001u);
    EXPECT_EQ(back.GetDataPointer("other", "c")[30000], 6);
    EXPECT_EQ(back.GetCapacity("other"), 32000u); // 1000, doubled as the cells arrived
    // Reference counts came back: freeing both references of "two" frees its slot.
    back.SetStringVariableValue("src", "a", 1, "p");
    back.SetStringVariableValue("src", "b", 1, "q");
    EXPECT_EQ(nextSlot(back, "two"), 3u) << "two was dropped and is appended anew";
}

TEST(DataStreamRoundTrip, RawLayoutAndOtherByteOrderAreReadToo) {
    VarDataProcessor back;
    ASSERT_TRUE(readInto(back, smallLayout()));
    EXPECT_EQ(back.GetValueAsString("src", "a", 2), "3");
    EXPECT_EQ(back.GetValueAsString("src", "b", 1), "");
    std::string raw("\x01\xB0\0\x01", 4);
    appendU32(raw, {0, 2, 1, 88}, true); // total patched below
    appendField(raw, "big", 68);
    appendField(raw, "v", 288);
    appendDouble(raw, 1.25, true);
    appendDouble(raw, -7, true);
    appendU32(raw, {1, 3}, true);
    raw += "big";
    appendU32(raw, {1, 1}, true);
    raw += "v";
    appendU32(raw, {1, 1, 0, 1, 1, 2}, true);
    raw += "ok";
    std::string total;
    appendU32(total, {static_cast<std::uint32_t>(raw.size())}, true);
    raw.replace(4, 4, total);
    ASSERT_TRUE(readInto(back, compressed(raw)));
    EXPECT_EQ(back.GetDataPointer("big", "v")[0], 1.25);
    EXPECT_EQ(back.GetValueAsString("big", "v", 1), "ok");
}

TEST(DataStreamHostile, EveryTruncationAndTrailingByteFails) {
    const std::string raw = rawOfStore(smallStore("hi")), packed = compressed(raw);
    VarDataProcessor back;
    for (std::size_t n = 0; n < raw.size(); ++n) {
        EXPECT_FALSE(readInto(back, compressed(raw.substr(0, n)))) << "raw cut at " << n;
        EXPECT_FALSE(readInto(back, raw.substr(0, n))) << "uncompressed cut at " << n;
        EXPECT_FALSE(n < packed.size() && readInto(back, packed.substr(0, n))) << "compressed cut at " << n;
    }
    EXPECT_TRUE(readInto(back, packed));
    EXPECT_FALSE(back.ReadStreamData(nullptr, 10));
    // A total one byte too long announces a string section that is not there.
    std::string longer = smallLayout(), small = compressed(smallLayout());
    longer[4] = static_cast<char>(713 & 0xFF);
    EXPECT_FALSE(readInto(back, compressed(longer)));
    EXPECT_FALSE(readInto(back, compressed(smallLayout() + "junk")));
    EXPECT_FALSE(readInto(back, small + "x"));
    small.back() ^= 1; // checksum
    EXPECT_FALSE(readInto(back, small));
}

TEST(DataStreamHostile, LyingCountsFailAndLeaveTheStoreEmpty) {
    const struct {
        const char* what;
        std::size_t at;
        std::uint32_t value;
        int bytes;
    } lies[] = {
        {"more sources", 2, 2, 2},        {"wrong mark", 0, 0x0000C000, 2},
        {"total too short", 4, 100, 4},   {"huge total", 4, 0xFFFFFFFF, 4},
        {"more rows", 8, 4, 4},           {"huge rows", 8, 0x20000000, 4},
        {"more variables", 12, 3, 4},     {"huge variables", 12, 0xFFFFFFFF, 4},
        {"offset elsewhere", 16, 400, 4}, {"offset outside", 16, 0xFFFFFF00, 4},
    };
    for (const auto& lie : lies) {
        std::string raw = smallLayout();
        for (int i = 0; i < lie.bytes; ++i)
            raw[lie.at + i] = static_cast<char>(lie.value >> (8 * i));
        VarDataProcessor back;
        back.AddVariable("before", "x");
        EXPECT_FALSE(readInto(back, compressed(raw))) << lie.what;
        std::vector<std::string> names;
        EXPECT_EQ(back.GetSourceNames(names), 0) << lie.what;
    }
}

TEST(DataStreamHostile, CountsThatWrapFailBeforeAnyMemoryIsTaken) {
    // 2^31 variables of 2^30 - 36 rows: each block is 2^33 bytes, so their size wraps to 0.
    std::string raw("\0\xB0\x01\0", 4);
    appendU32(raw, {376, 1073741788u, 0x80000000u, 88});
    appendField(raw, "src", 68);
    appendField(raw, "v", 288);
    for (const std::string& bytes : {compressed(raw), raw}) {
        plotaid::detail::RecordCollector records;
        VarDataProcessor back;
        EXPECT_FALSE(readInto(back, bytes));
        ASSERT_FALSE(records.records().empty());
        EXPECT_NE(records.records().back().message.find("past the stream's end"), std::string::npos);
    }
}

TEST(DataStreamHostile, BadStringSectionKeepsTheNumbers) {
    const std::string raw = rawOfStore(smallStore("hi"));
    // The string index of b's entry (last pair) points past the table.
    const std::size_t indexAt = raw.size() - 2 - 16;
    ASSERT_EQ(u32At(raw, indexAt), 0u);
    std::string bad = raw;
    bad[indexAt] = 5;
    VarDataProcessor back;
    EXPECT_FALSE(readInto(back, compressed(bad)));
    EXPECT_EQ(back.GetValueAsString("src", "a", 2), "3");
    EXPECT_EQ(back.GetValueAsString("src", "b", 2), "");
    bad = raw; // a text length beyond the section
    bad[raw.size() - 2 - 4] = 100;
    EXPECT_FALSE(readInto(back, compressed(bad)));
    EXPECT_EQ(back.GetValueAsString("src", "a", 0), "1");
    // A lying reference count is corrected from the maps, so releasing it cannot underflow.
    bad = raw;
    bad[raw.size() - 2 - 8] = 9;
    ASSERT_TRUE(readInto(back, compressed(bad)));
    back.SetStringVariableValue("src", "b", 2, "other");
    EXPECT_EQ(nextSlot(back, "third"), 1u) << "slot 0 of \"hi\" was freed, \"other\" took it";
}

TEST(DataStreamLimits, MoreSourcesThanTheHeaderCountsAreRefused) {
    VarDataProcessor store;
    for (unsigned s = 0; s < 65536; ++s)
        store.AddDataSource("s" + std::to_string(s), 0);
    unsigned length = 99;
    std::unique_ptr<unsigned char[]> s(store.GetDataStream(length));
    EXPECT_EQ(s, nullptr) << "the count is 16 bits: 65536 would be written as 0";
    EXPECT_EQ(length, 0u);
    store.Reset();
    for (unsigned k = 0; k < 65535; k += 1000)
        store.AddDataSource("s" + std::to_string(k), 0);
    s.reset(store.GetDataStream(length));
    VarDataProcessor back;
    ASSERT_TRUE(back.ReadStreamData(s.get(), length));
    std::vector<std::string> names;
    EXPECT_EQ(back.GetSourceNames(names), 66);
}
