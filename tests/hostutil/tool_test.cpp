#include "support/ToolRunner.h"

#include <gtest/gtest.h>

#include <string>

namespace {
bool has(const ToolResult& r, const std::string& text) {
    return r.output.find(text) != std::string::npos;
}
} // namespace

TEST(ToolTime, DateShowsTheHostValueAndTheCalendarDate) {
    const ToolResult first = runTool("time date 1582-10-15");
    EXPECT_EQ(first.exitCode, 0) << first.output;
    EXPECT_TRUE(has(first, "host value: 86400\n")) << first.output;
    EXPECT_TRUE(has(first, "date:       1582-10-15 00:00:00\n")) << first.output;

    // Day 0 and month 13 show the day they stand for.
    const ToolResult loose = runTool("time date '2023-13-00 23:59:59'");
    EXPECT_EQ(loose.exitCode, 0) << loose.output;
    EXPECT_TRUE(has(loose, "date:       2023-12-31 23:59:59\n")) << loose.output;

    const ToolResult epoch = runTool("time date 1970-01-01");
    EXPECT_TRUE(has(epoch, "days since 1582-10-14: 141428\n")) << epoch.output;
}

TEST(ToolTime, DateBeforeTheCalendarIsMissingAndFails) {
    for (const char* text : {"1582-10-13", "2024-02", "nonsense"}) {
        const ToolResult r = runTool(std::string("time date ") + text);
        EXPECT_EQ(r.exitCode, 1) << text;
        EXPECT_TRUE(has(r, "host value: missing")) << r.output;
    }
}

TEST(ToolTime, TimeShowsSecondsAndClock) {
    const ToolResult r = runTool("time time 10:30:15,250");
    EXPECT_EQ(r.exitCode, 0);
    EXPECT_TRUE(has(r, "host value: 37815.25\n")) << r.output;
    EXPECT_TRUE(has(r, "time:       10:30:15.250\n")) << r.output;
    const ToolResult duration = runTool("time time 100:00");
    EXPECT_TRUE(has(duration, "time:       100:00:00\n")) << duration.output;
}

TEST(ToolTime, UsageErrors) {
    EXPECT_EQ(runTool("time").exitCode, 2);
    EXPECT_EQ(runTool("time date").exitCode, 2);
    EXPECT_EQ(runTool("time week 2024-01-01").exitCode, 2);
    const ToolResult help = runTool("time --help");
    EXPECT_EQ(help.exitCode, 0);
    EXPECT_TRUE(has(help, "usage: plotaid time date TEXT"));
}

TEST(ToolFormat, PrintsTheConvertedSettings) {
    const ToolResult time = runTool("format --type 21 --width 8 --decimals 2");
    EXPECT_EQ(time.exitCode, 0) << time.output;
    EXPECT_TRUE(has(time, "host format: type 21, width 8, decimals 2\n"));
    EXPECT_TRUE(has(time, "  showSecond = \"true\"\n")) << time.output;
    EXPECT_TRUE(has(time, "  maximumFractionDigits = \"3\"\n")) << time.output;

    const ToolResult text = runTool("format --type 1 --width 60 --decimals 0");
    EXPECT_EQ(text.exitCode, 0);
    EXPECT_TRUE(has(text, "width 60"));
    EXPECT_EQ(text.output, "host format: type 1, width 60, decimals 0\n  errorCharacter = \"*\"\n");

    const ToolResult narrowed = runTool("format --type 5 --width 60 --decimals 2 --grouping");
    EXPECT_TRUE(has(narrowed, "width 40")) << narrowed.output;
    EXPECT_TRUE(has(narrowed, "  useGrouping = \"true\"\n")) << narrowed.output;

    const ToolResult digits = runTool("format --type 5 --width 8 --decimals 2 --integer-digits 3");
    EXPECT_TRUE(has(digits, "  minimumIntegerDigits = \"3\"\n")) << digits.output;
}

TEST(ToolFormat, UsageErrors) {
    EXPECT_EQ(runTool("format --type 5 --width 8").exitCode, 2);
    EXPECT_EQ(runTool("format --type 256 --width 8 --decimals 0").exitCode, 2);
    EXPECT_EQ(runTool("format --type 5 --width -1 --decimals 0").exitCode, 2);
    EXPECT_EQ(runTool("format --type 5 --width 8 --decimals").exitCode, 2);
    EXPECT_EQ(runTool("format --type 5 --width 8 --decimals 1 --bogus").exitCode, 2);
}
