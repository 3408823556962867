#include "support/ToolRunner.h"

#include <gtest/gtest.h>

#include <string>

namespace {

// Runs the tool and checks its exit code and that each expected line is in its output.
void expectRun(const std::string& args, int exitCode, std::initializer_list<const char*> lines = {}) {
    const ToolResult r = runTool(args);
    EXPECT_EQ(r.exitCode, exitCode) << args << "\n" << r.output;
    for (const char* line : lines)
        EXPECT_NE(r.output.find(line), std::string::npos) << args << ": no \"" << line << "\" in\n"
                                                          << r.output;
}

} // namespace

TEST(ToolTime, ShowsHostValuesAndCalendarTexts) {
    expectRun("time date 1582-10-15", 0, {"host value: 86400\n", "date:       1582-10-15 00:00:00\n"});
    // Day 0 and month 13 show the day they stand for.
    expectRun("time date '2023-13-00 23:59:59'", 0, {"date:       2023-12-31 23:59:59\n"});
    expectRun("time date 1970-01-01", 0, {"days since 1582-10-14: 141428\n"});
    for (const char* text : {"1582-10-13", "2024-02", "nonsense"})
        expectRun(std::string("time date ") + text, 1, {"host value: missing"});
    expectRun("time time 10:30:15,250", 0, {"host value: 37815.25\n", "time:       10:30:15.250\n"});
    expectRun("time time 100:00", 0, {"time:       100:00:00\n"});
    expectRun("time --help", 0, {"usage: plotaid time date TEXT"});
    for (const char* args : {"time", "time date", "time week 2024-01-01"})
        expectRun(args, 2);
}

TEST(ToolFormat, PrintsTheConvertedSettings) {
    EXPECT_EQ(runTool("format --type 1 --width 60 --decimals 0").output,
              "host format: type 1, width 60, decimals 0\n  errorCharacter = \"*\"\n");
    expectRun("format --type 21 --width 8 --decimals 2", 0,
              {"host format: type 21, width 8, decimals 2\n", "  showSecond = \"true\"\n",
               "  maximumFractionDigits = \"3\"\n"});
    expectRun("format --type 5 --width 60 --decimals 2 --grouping", 0,
              {"width 40", "  useGrouping = \"true\"\n"});
    expectRun("format --type 5 --width 8 --decimals 2 --integer-digits 3", 0,
              {"  minimumIntegerDigits = \"3\"\n"});
    for (const char* args :
         {"format --type 5 --width 8", "format --type 256 --width 8 --decimals 0",
          "format --type 5 --width -1 --decimals 0", "format --type 5 --width 8 --decimals",
          "format --type 5 --width 8 --decimals 1 --bogus"})
        expectRun(args, 2);
}
