#include <plotaid/ChartException.h>

#include <gtest/gtest.h>

TEST(ChartException, KeepsItsThreeFieldsThroughCopyAndAssignment) {
    const ChartException raised("bad thing", "src/here", 42);
    ChartException copy(raised);
    ChartException assigned;
    EXPECT_STREQ(assigned.what(), "");
    EXPECT_EQ(assigned.line(), 0u);
    assigned = raised;
    for (const ChartException* e : {&copy, &assigned}) {
        EXPECT_STREQ(e->what(), "bad thing");
        EXPECT_STREQ(e->file(), "src/here");
        EXPECT_EQ(e->line(), 42u);
    }
    // Caught as the standard base, the message is still there.
    try {
        throw copy;
    } catch (const std::exception& e) {
        EXPECT_STREQ(e.what(), "bad thing");
    }
}
