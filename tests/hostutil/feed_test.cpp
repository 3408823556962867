#include <feed/corekit.h>
#include <feed/memory.h>
#include <kovar/kovarconv.h>

#include <gtest/gtest.h>

#include <cstring>
#include <memory>

TEST(FeedMemory, TextValuesFillWholeBlankPaddedCells) {
    feed::MemoryCase cases;
    cases.setText(3, "abcdefghij");
    ASSERT_EQ(cases.GetObsCount(3), 2u);
    const feed::OBS* cells = cases.GetObsPointer(3);
    ASSERT_NE(cells, nullptr);
    EXPECT_EQ(std::string(cells[0].text, 8), "abcdefgh");
    EXPECT_EQ(std::string(cells[1].text, 8), "ij      ");
    cases.setText(4, "");
    EXPECT_EQ(cases.GetObsCount(4), 1u);
    EXPECT_EQ(std::string(cases.GetObsPointer(4)->text, 8), "        ");

    cases.setNumber(3, 2.5);
    EXPECT_EQ(cases.GetObsCount(3), 1u);
    EXPECT_EQ(cases.GetObsPointer(3)->number, 2.5);
    cases.clear(3);
    EXPECT_EQ(cases.GetObsPointer(3), nullptr);
    EXPECT_EQ(cases.GetObsCount(3), 0u);
}

TEST(FeedMemory, DataSourceRefusesIndicesOutsideIt) {
    feed::MemoryDataSource source;
    const int v = source.addVariable("v", "", Kovar_Format(5, 8, 2));
    source.setSplitVariables({v});
    EXPECT_EQ(source.GetVariableCount(), 1);
    EXPECT_NE(source.GetVariable(0), nullptr);
    EXPECT_EQ(source.GetVariable(1), nullptr);
    EXPECT_EQ(source.GetVariable(-1), nullptr);
    EXPECT_EQ(source.GetSplitVariableIndex(0), v);
    EXPECT_EQ(source.GetSplitVariableIndex(1), -1);
    EXPECT_EQ(source.GetVariable(0)->GetValueLabels(), nullptr);
    EXPECT_EQ(source.GetVariable(0)->IsMissing(kovar::kMissingValue), 1);
    EXPECT_EQ(source.GetVariable(0)->IsMissing(0.0), 0);
}

TEST(FeedMemory, TextValueLabelsIgnoreTrailingBlanks) {
    feed::MemoryValueLabels labels;
    labels.add("ab  ", "first");
    labels.add(1.5, "one and a half");
    std::string label;
    EXPECT_TRUE(labels.GetLabel(std::string("ab"), label));
    EXPECT_EQ(label, "first");
    EXPECT_TRUE(labels.GetLabel(std::string("ab      "), label));
    EXPECT_FALSE(labels.GetLabel(std::string(" ab"), label));
    EXPECT_TRUE(labels.GetLabel(1.5, label));
    EXPECT_EQ(label, "one and a half");
    EXPECT_FALSE(labels.GetLabel(1.0, label));
}

TEST(FeedHeadings, ShowModesAndPreferences) {
    feed::MemoryVariable labelled("sex", "Sex of respondent", Kovar_Format(5, 4, 0));
    labelled.valueLabels().add(1.0, "Male");
    const feed::MemoryVariable bare("age", "", Kovar_Format(5, 6, 1));
    EXPECT_EQ(feed::BpVariable(labelled, 1).Text(), "sex");
    EXPECT_EQ(feed::BpVariable(labelled, 2).Text(), "Sex of respondent");
    EXPECT_EQ(feed::BpVariable(labelled, 3).Text(), "sex Sex of respondent");
    EXPECT_EQ(feed::BpVariable(bare, 2).Text(), "age");

    feed::OBS one;
    one.number = 1.0;
    EXPECT_EQ(feed::BpDataValue(labelled, one, 2).Text(), "Male");
    EXPECT_EQ(feed::BpDataValue(labelled, one, 1).Text(), "1");
    feed::OBS age;
    age.number = 42.25;
    EXPECT_EQ(feed::BpDataValue(bare, age, 2).Text(), "42.3");

    const feed::MemoryVariable text("city", "", Kovar_Format(1, 20, 0));
    feed::OBS cell;
    std::memcpy(cell.text, "Lisbon  ", 8);
    EXPECT_EQ(feed::BpDataValue(text, cell, 2).Text(), "Lisbon");
}

TEST(FeedHeadings, CompositeGroupsItemsIntoSublists) {
    const feed::MemoryVariable a("a", "", Kovar_Format(5, 4, 0));
    feed::OBS value;
    value.number = 7.0;
    feed::BpComposite composite("[%1 = %2:, ^1 = ^2:]1", false);
    EXPECT_EQ(composite.Pattern(), "[%1 = %2:, ^1 = ^2:]1");
    EXPECT_FALSE(composite.Localise());
    composite.Sublist();
    composite.Add(std::make_unique<feed::BpVariable>(a, 1));
    composite.Add(nullptr);
    composite.Add(std::make_unique<feed::BpDataValue>(a, value, 1));
    composite.EndSublist();
    composite.Add(std::make_unique<feed::BpVariable>(a, 1)); // outside a sublist: one of its own
    const feed::BpHeading heading = feed::BpProcedure("GRAPH").Heading(composite);
    ASSERT_EQ(heading.Parts().size(), 2u);
    EXPECT_EQ(heading.Parts()[0], (std::vector<std::string>{"a", "7"}));
    EXPECT_EQ(heading.Text(), "a = 7, a");
    EXPECT_EQ(heading.Procedure(), "GRAPH");
}
