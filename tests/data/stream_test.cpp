#include "TestStreams.h"

#include <gtest/gtest.h>

#include <vector>

using namespace chartdata_test;

namespace {

// One data source "src" with variables "a" = {1, 2, 3} and "b" = {4, missing, "hi"}: the header, one table
// entry, the two variable blocks and, with the text, the string section (sources, variables with their
// row-to-slot pairs, texts with reference counts).
std::string layout(bool big, bool text = true) {
    std::string raw(big ? "\x01\xB0\0\x01" : "\0\xB0\x01\0", 4);
    appendU32(raw, {0, 3, 2, 88}, big); // the total is set at the end
    appendField(raw, "src", 68);
    appendField(raw, "a", 288);
    for (double v : {1.0, 2.0, 3.0})
        appendDouble(raw, v, big);
    appendField(raw, "b", 288);
    for (double v : {4.0, kMissing, kMissing})
        appendDouble(raw, v, big);
    if (text) {
        appendU32(raw, {1, 3}, big);
        raw += "src";
        appendU32(raw, {2, 1}, big);
        raw += "a";
        appendU32(raw, {0, 1}, big);
        raw += "b";
        appendU32(raw, {1, 2, 0, 1, 1, 2}, big);
        raw += "hi";
    }
    std::string total;
    appendU32(total, {static_cast<std::uint32_t>(raw.size())}, big);
    return raw.replace(4, 4, total);
}

VarDataProcessor smallStore(const char* bText = "hi") {
    VarDataProcessor store;
    const double a[] = {1, 2, 3};
    store.AddDataSource("src", 3);
    store.SetVariableValueRange("src", "a", a, 0, 3);
    store.SetVariableValue("src", "b", 0, 4);
    if (bText)
        store.SetStringVariableValue("src", "b", 2, bText);
    return store;
}

std::string rawOfStore(VarDataProcessor store) {
    return rawOf(streamOf(store));
}

// Slot of a text newly added to the store: tells which slots the string table holds free.
unsigned nextSlot(VarDataProcessor& store, const std::string& text) {
    VarDataProcessor::_varinfo info;
    store.AddVariable("src", "probe", &info);
    store.SetStringVariableValue(&info, 0, text);
    return info.stringMap->at(0);
}

} // namespace

TEST(DataStreamLayout, BytesWrittenAndReadInBothByteOrders) {
    VarDataProcessor empty;
    const Stream s = streamOf(empty);
    ASSERT_NE(s.bytes, nullptr);
    EXPECT_EQ(rawOf(s), std::string("\0\xB0\0\0\x08\0\0\0", 8));
    for (const bool text : {false, true}) {
        std::string raw = rawOfStore(smallStore(text ? "hi" : nullptr));
        ASSERT_GE(raw.size(), 88u);
        raw.replace(8 + 77, 3, 3,
                    '\0'); // the entry's unused bytes are not part of the contract
        EXPECT_EQ(raw, layout(false, text));
    }
    // Empty string maps write no section, and come back as maps all the same.
    VarDataProcessor gone = smallStore(nullptr);
    gone.SetStringVariableValue("src", "a", 0, "gone");
    gone.DeleteRow("src", 0);
    const std::string raw = rawOfStore(gone);
    EXPECT_EQ(raw.size(), 8u + 80 + 2 * (288 + 16));
    VarDataProcessor back;
    ASSERT_TRUE(readInto(back, compressed(raw)));
    EXPECT_TRUE(back.SetStringVariableValue("src", "a", 0, "map exists"));

    for (const bool big : {false, true})
        for (const bool packed : {false, true}) {
            SCOPED_TRACE(std::string(big ? "big" : "little") + (packed ? " endian, compressed" : " endian"));
            ASSERT_TRUE(readInto(back, packed ? compressed(layout(big)) : layout(big)));
            EXPECT_EQ(back.GetValueAsString("src", "a", 2), "3");
            EXPECT_EQ(back.GetValueAsString("src", "b", 1), "");
            EXPECT_EQ(back.GetValueAsString("src", "b", 2), "hi");
        }
}

TEST(DataStreamRoundTrip, NumbersStringsShortVariablesAndLongNames) {
    VarDataProcessor store = smallStore(nullptr);
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
    // Names are cut the same way on both sides; a short variable takes its source's row count.
    EXPECT_EQ(back.GetValueAsString(source.substr(0, 64), variable.substr(0, 287), 0), "5");
    EXPECT_EQ(back.GetRowCount("src"), 3u);
    EXPECT_EQ(back.GetDataPointer("src", "b")[2], kMissing);
    EXPECT_EQ(back.GetRowCount("other"), 30001u);
    EXPECT_EQ(back.GetDataPointer("other", "c")[30000], 6);
    EXPECT_EQ(back.GetCapacity("other"),
              32000u); // 1000, doubled as the cells arrived
    // Reference counts came back: freeing both references of "two" frees its slot.
    back.SetStringVariableValue("src", "a", 1, "p");
    back.SetStringVariableValue("src", "b", 1, "q");
    EXPECT_EQ(nextSlot(back, "two"), 3u) << "two was dropped and is appended anew";
}

TEST(DataStreamHostile, EveryTruncationAndTrailingByteFails) {
    const std::string raw = layout(false), packed = compressed(raw);
    VarDataProcessor back;
    for (std::size_t n = 0; n < raw.size(); ++n) {
        EXPECT_FALSE(readInto(back, compressed(raw.substr(0, n)))) << "raw cut at " << n;
        EXPECT_FALSE(readInto(back, raw.substr(0, n))) << "uncompressed cut at " << n;
        EXPECT_FALSE(n < packed.size() && readInto(back, packed.substr(0, n))) << "compressed cut at " << n;
    }
    EXPECT_TRUE(readInto(back, packed));
    EXPECT_FALSE(back.ReadStreamData(nullptr, 10));
    // A total one byte too long announces a string section that is not there.
    std::string longer = layout(false, false), small = compressed(layout(false, false));
    longer[4] = static_cast<char>(713 & 0xFF);
    EXPECT_FALSE(readInto(back, compressed(longer)));
    EXPECT_FALSE(readInto(back, compressed(layout(false, false) + "junk")));
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
        std::string raw = layout(false, false);
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
    const std::string raw = layout(false);
    // Bytes from the end: b's string index (last pair), a text length beyond the section, and a lying
    // reference count, which is corrected from the maps so releasing it cannot underflow.
    const struct {
        std::size_t fromEnd;
        char value;
        bool read;
    } faults[] = {{2 + 16, 5, false}, {2 + 4, 100, false}, {2 + 8, 9, true}};
    for (const auto& f : faults) {
        std::string bad = raw;
        bad[raw.size() - f.fromEnd] = f.value;
        VarDataProcessor back;
        EXPECT_EQ(readInto(back, compressed(bad)), f.read) << f.fromEnd;
        EXPECT_EQ(back.GetValueAsString("src", "a", 2), "3");
        EXPECT_EQ(back.GetValueAsString("src", "b", 2), f.read ? "hi" : "");
        if (f.read) {
            back.SetStringVariableValue("src", "b", 2, "other");
            EXPECT_EQ(nextSlot(back, "third"), 1u) << "slot 0 of \"hi\" was freed, \"other\" took it";
        }
    }
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
