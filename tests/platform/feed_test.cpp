#include <feed/corekit.h>
#include <feed/memory.h>

#include <gtest/gtest.h>

#include <cstring>
#include <memory>

TEST(FeedHeadings, ShowModesPreferencesAndSublists) {
    feed::MemoryVariable labelled("sex", "Sex of respondent", Kovar_Format(5, 4, 0));
    labelled.valueLabels().add(1.0, "Male");
    const feed::MemoryVariable bare("age", "", Kovar_Format(5, 6, 1));
    EXPECT_EQ(feed::BpVariable(labelled, 1).Text(), "sex");
    EXPECT_EQ(feed::BpVariable(labelled, 2).Text(), "Sex of respondent");
    EXPECT_EQ(feed::BpVariable(labelled, 3).Text(), "sex Sex of respondent");
    EXPECT_EQ(feed::BpVariable(bare, 2).Text(), "age");
    feed::OBS value;
    value.number = 1.0;
    EXPECT_EQ(feed::BpDataValue(labelled, value, 2).Text(), "Male");
    EXPECT_EQ(feed::BpDataValue(labelled, value, 1).Text(), "1");
    value.number = 42.25;
    EXPECT_EQ(feed::BpDataValue(bare, value, 2).Text(), "42.3");
    std::memcpy(value.text, "Lisbon  ", 8);
    EXPECT_EQ(feed::BpDataValue(feed::MemoryVariable("city", "", Kovar_Format(1, 20, 0)), value, 2).Text(),
              "Lisbon");

    value.number = 7.0;
    feed::BpComposite composite("[%1 = %2:, ^1 = ^2:]1", false);
    composite.Sublist();
    composite.Add(std::make_unique<feed::BpVariable>(bare, 1));
    composite.Add(nullptr);
    composite.Add(std::make_unique<feed::BpDataValue>(labelled, value, 1));
    composite.EndSublist();
    composite.Add(std::make_unique<feed::BpVariable>(bare, 1)); // outside a sublist: one of its own
    const feed::BpHeading heading = feed::BpProcedure("GRAPH").Heading(composite);
    ASSERT_EQ(heading.Parts().size(), 2u);
    EXPECT_EQ(heading.Parts()[0], (std::vector<std::string>{"age", "7"}));
    EXPECT_EQ(heading.Text(), "age = 7, age");
    EXPECT_EQ(heading.Procedure(), "GRAPH");
}
