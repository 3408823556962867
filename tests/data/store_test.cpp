#include "TestStreams.h"

#include <gtest/gtest.h>

#include <vector>

using chartdata_test::kMissing;
using Names = std::vector<std::string>;

TEST(VarDataStore, CapacityIsClampedAndNamesAreUnique) {
    VarDataProcessor store;
    EXPECT_TRUE(store.AddDataSource("small", 5));
    EXPECT_TRUE(store.AddDataSource("large", 50000));
    EXPECT_TRUE(store.AddDataSource("mid", 3000));
    EXPECT_FALSE(store.AddDataSource("small", 7));
    EXPECT_TRUE(store.AddVariable("auto", "x"));
    EXPECT_FALSE(store.AddVariable("auto", "x"));
    for (const auto& [source, capacity] : {std::pair<const char*, unsigned>{"small", 1000},
                                           {"large", 20000},
                                           {"mid", 3000},
                                           {"absent", 0},
                                           {"auto", 1000}})
        EXPECT_EQ(store.GetCapacity(source), capacity) << source;
    Names names{"keep"};
    EXPECT_EQ(store.GetVariableNames("absent", names), 0);
    EXPECT_EQ(names, Names{"keep"});
    EXPECT_EQ(store.GetSourceNames(names), 4);
    EXPECT_EQ(names, (Names{"auto", "large", "mid", "small"}));
}

TEST(VarDataStore, GrowingKeepsValuesAndTheRowCountIsTheLongestVariable) {
    VarDataProcessor store;
    store.AddDataSource("s", 0);
    for (unsigned r = 0; r < 1000; ++r)
        ASSERT_TRUE(store.SetVariableValue("s", "v", r, r * 0.5));
    ASSERT_TRUE(store.SetVariableValue("s", "v", 1000, 7));
    EXPECT_EQ(store.GetCapacity("s"), 2000u); // doubled
    const double* cells = store.GetDataPointer("s", "v");
    for (unsigned r = 0; r < 2000; ++r)
        ASSERT_EQ(cells[r], r < 1000 ? r * 0.5 : r == 1000 ? 7 : kMissing) << r;
    EXPECT_FALSE(store.SetVariableValue("absent", "v", 0, 1));
    EXPECT_FALSE(store.SetVariableValue("s", "v", 0xFFFFFFFFu, 1));

    const double three[] = {1, 2, 3};
    ASSERT_TRUE(store.SetVariableValueRange("s", "a", three, 0, 3));
    EXPECT_EQ(store.GetRowCount("s"), 1001u);
    EXPECT_EQ(store.GetDataPointer("s", "a")[3], kMissing);
    ASSERT_TRUE(store.InitializeVariableValueRange("s", "c", 2.5, 4, 3));
    EXPECT_EQ(store.GetDataPointer("s", "c")[6], 2.5);
    EXPECT_EQ(store.GetDataPointer("s", "c")[3], kMissing);
    // A count of 0 only raises the row count, and the arrays grow with it.
    ASSERT_TRUE(store.SetVariableValueRange("s", "d", nullptr, 2500, 0));
    EXPECT_EQ(store.GetRowCount("s"), 2500u);
    EXPECT_GE(store.GetCapacity("s"), 2500u);
    EXPECT_EQ(store.GetDataPointer("s", "a")[2499], kMissing);
    EXPECT_FALSE(store.SetVariableValueRange("s", "d", nullptr, 0, 2));
    EXPECT_FALSE(store.SetVariableValueRange("s", "d", three, 0xFFFFFFFEu, 3));

    // The record setter grows the arrays too.
    VarDataProcessor::_varinfo info, empty;
    store.AddVariable("t", "v", &info);
    ASSERT_TRUE(store.SetVariableValue(&info, 2999, 1));
    EXPECT_EQ(store.GetCapacity("t"), 4000u);
    EXPECT_EQ(store.GetRowCount("t"), 3000u);
    EXPECT_FALSE(store.SetVariableValue(&empty, 0, 1) || store.SetVariableValue(nullptr, 0, 1));
}

// Deleting a row moves the later values and strings up with their rows, whether or not the deleted row held a
// string; a text that loses its last reference frees its slot.
TEST(VarDataStore, ValuesAsTextAndDeletedRows) {
    VarDataProcessor store;
    store.AddDataSource("s", 0);
    const double values[] = {3.0, -2.0, kMissing, 0.1, 2147483648.0, 1.5e300};
    store.SetVariableValueRange("s", "v", values, 0, 6);
    EXPECT_EQ(store.GetValueAsString("s", "v", 5), "1.5e+300");
    EXPECT_EQ(store.GetValueAsString("s", "v", 2), "");
    EXPECT_EQ(store.GetValueAsString("s", "v", 6), "");
    EXPECT_EQ(store.GetValueAsString("absent", "v", 0), "");
    EXPECT_EQ(store.GetValueAsString("s", "new", 0), "")
        << "an absent variable is made, and reads as missing";
    Names names;
    EXPECT_EQ(store.GetVariableNames("s", names), 2);

    store.SetStringVariableValue("s", "v", 0, "zero");
    store.SetStringVariableValue("s", "v", 3, "three");
    store.SetVariableValue("s", "short", 0, 1);
    const struct {
        unsigned row, rows;
        std::vector<const char*> texts;
    } deletions[] = {
        {0, 5, {"-2", "", "three", "2147483648", "1.5e+300", ""}},
        {0, 4, {"", "three", "2147483648", "1.5e+300", ""}},
        {10, 4, {"", "three", "2147483648", "1.5e+300", ""}},
    };
    for (const auto& d : deletions) {
        SCOPED_TRACE(&d - deletions);
        EXPECT_EQ(store.DeleteRow("s", d.row), d.rows);
        for (unsigned r = 0; r < d.texts.size(); ++r)
            EXPECT_EQ(store.GetValueAsString("s", "v", r), d.texts[r]) << r;
        EXPECT_EQ(store.GetDataPointer("s", "v")[d.rows], kMissing);
        EXPECT_EQ(store.GetValueAsString("s", "short", 0), "");
    }
    EXPECT_EQ(store.DeleteRow("absent", 0), 0u);
    VarDataProcessor::_varinfo info;
    store.AddVariable("s", "w", &info);
    store.SetStringVariableValue(&info, 0, "new");
    EXPECT_EQ(info.stringMap->at(0), 0u) << "slot 0 of \"zero\" is taken again";
}

TEST(VarDataStore, StringTableCountsReferencesAndReusesSlots) {
    VarDataProcessor store;
    VarDataProcessor::_varinfo info;
    ASSERT_TRUE(store.AddVariable("s", "v", &info));
    EXPECT_EQ(info.source + "/" + info.variable, "s/v");
    ASSERT_NE(info.column, nullptr);
    ASSERT_NE(info.stringMap, nullptr);
    ASSERT_TRUE(store.SetStringVariableValue("s", "v", 0, "first"));
    ASSERT_TRUE(store.SetStringVariableValue("s", "v", 0,
                                             "second")); // takes the freed slot 0
    ASSERT_TRUE(store.SetStringVariableValue(&info, 4, "second"));
    ASSERT_TRUE(store.SetStringVariableValue("s", "v", 2, "third"));
    EXPECT_EQ(*info.stringMap, (VarDataProcessor::StringMap{{0, 0}, {2, 1}, {4, 0}}));
    EXPECT_EQ(store.GetValueAsString("s", "v", 0), "second");
    EXPECT_EQ(store.GetRowCount("s"), 5u);
    EXPECT_FALSE(store.SetStringVariableValue("s", "absent", 0, "x"));
    EXPECT_FALSE(store.SetStringVariableValue("absent", "v", 0, "x"));
    EXPECT_FALSE(store.SetStringVariableValue(nullptr, 0, "x"));

    // The single setter keeps the arrays as long as the row count; the range setter leaves it.
    ASSERT_TRUE(store.SetStringVariableValue("s", "v", 4999, "far"));
    EXPECT_EQ(store.GetRowCount("s"), 5000u);
    EXPECT_GE(store.GetCapacity("s"), 5000u);
    EXPECT_EQ(store.GetDataPointer("s", "v")[4998], kMissing);
    ASSERT_TRUE(store.SetStringVariableValueRange("s", "v", 6000, {"x", "y"}));
    ASSERT_TRUE(store.SetStringVariableValueRange("s", "v", 0, {}));
    EXPECT_EQ(store.GetRowCount("s"), 5000u);
    EXPECT_FALSE(store.SetStringVariableValueRange("s", "nothing", 0, {"x"}));

    // Deleting the column gives back its references: the next texts reuse slots 0 and 1.
    ASSERT_TRUE(store.DeleteColumn("s", "v"));
    EXPECT_FALSE(store.DeleteColumn("s", "v"));
    EXPECT_FALSE(store.DeleteColumn("nothing", "w"));
    VarDataProcessor::_varinfo other;
    ASSERT_TRUE(store.AddVariable("s", "w", &other));
    store.SetStringVariableValue("s", "w", 0, "a");
    store.SetStringVariableValue("s", "w", 1, "b");
    EXPECT_EQ(*other.stringMap, (VarDataProcessor::StringMap{{0, 0}, {1, 1}}));
}

TEST(VarDataStore, ManyDistinctStringsKeepTheirSlots) {
    VarDataProcessor store;
    VarDataProcessor::_varinfo info;
    store.AddVariable("s", "v", &info);
    for (unsigned r = 0; r < 50000; ++r)
        ASSERT_TRUE(store.SetStringVariableValue(&info, r, "t" + std::to_string(r % 40000)));
    EXPECT_EQ(info.stringMap->at(45000), 5000u);
    EXPECT_EQ(store.GetValueAsString("s", "v", 49999), "t9999");
}

TEST(VarDataStore, CopiesOwnTheirArraysMergeStopsAtAClashResetEmpties) {
    VarDataProcessor original;
    original.SetVariableValue("s", "v", 0, 1); // absent data source: refused
    EXPECT_EQ(original.GetRowCount("s"), 0u);
    original.AddVariable("s", "v");
    original.SetVariableValue("s", "v", 0, 1);
    original.SetStringVariableValue("s", "v", 1, "text");
    VarDataProcessor copy(original);
    VarDataProcessor assigned;
    assigned.AddVariable("old", "x");
    assigned = original;
    original.SetVariableValue("s", "v", 0, 99);
    original.SetStringVariableValue("s", "v", 1, "changed");
    original.DeleteColumn("s", "v");
    assigned = assigned;
    for (VarDataProcessor* c : {&copy, &assigned}) {
        EXPECT_EQ(c->GetValueAsString("s", "v", 0) + c->GetValueAsString("s", "v", 1), "1text");
        EXPECT_EQ(c->GetCapacity("old"), 0u);
    }
    VarDataProcessor moved(std::move(copy));
    EXPECT_EQ(moved.GetValueAsString("s", "v", 1), "text");
    EXPECT_EQ(copy.GetRowCount("s"), 0u); // NOLINT(bugprone-use-after-move)

    // Merging copies every source; a second merge stops at the first clash.
    VarDataProcessor target;
    moved.AddVariable("two", "w");
    moved.SetVariableValue("two", "w", 0, 8);
    EXPECT_TRUE(target.AddVDP(moved));
    EXPECT_EQ(target.GetValueAsString("s", "v", 1) + target.GetValueAsString("two", "w", 0), "text8");
    VarDataProcessor b;
    b.AddVariable("aaa", "z");
    b.SetVariableValue("aaa", "z", 0, 3);
    b.AddVariable("s", "v");
    b.AddVariable("zzz", "q");
    EXPECT_FALSE(target.AddVDP(b));
    EXPECT_EQ(target.GetValueAsString("aaa", "z", 0), "3");
    EXPECT_EQ(target.GetCapacity("zzz"), 0u);
    EXPECT_FALSE(target.AddVDP(target));

    target.Reset();
    Names names;
    EXPECT_EQ(target.GetSourceNames(names), 0);
    EXPECT_FALSE(target.SetStringVariableValue("s", "v", 0, "t"));
    target.AddVariable("s", "v");
    target.SetStringVariableValue("s", "v", 0, "u");
    EXPECT_EQ(target.GetValueAsString("s", "v", 0), "u");
}
