#include "TempDir.h"

#include <plotaid/ChartBase.h>

#include <gtest/gtest.h>

#include <ctime>
#include <filesystem>
#include <regex>
#include <string>

namespace {

std::string expectedFileName() {
    static const char* const months[] = {"Jan", "Feb", "Mar", "Apr", "May", "Jun",
                                         "Jul", "Aug", "Sep", "Oct", "Nov", "Dec"};
    const std::time_t now = std::time(nullptr);
    std::tm local{};
    localtime_r(&now, &local);
    // ctime's layout: month abbreviation, then the day of the month padded with a blank to two.
    const std::string day = (local.tm_mday < 10 ? " " : "") + std::to_string(local.tm_mday);
    return std::string("chartxmldebug_") + months[local.tm_mon] + day + "00.txt";
}

} // namespace

// One test: the log is fixed for the process at its first use.
TEST(PrintDebugInfo, WritesTheProcessTimingLogOnlyWhenAsked) {
    TempDir dir;
    ASSERT_FALSE(dir.path().empty());
    {
        ScopedEnv off("DumpChartTimePath", nullptr);
        ChartBase::printDebugInfo("not written");
    }
    EXPECT_TRUE(std::filesystem::is_empty(dir.path()));

    const std::string nameBefore = expectedFileName();
    {
        ScopedEnv on("DumpChartTimePath", dir.path().c_str());
        ChartBase::printDebugInfo("first");
        ChartBase::printDebugInfo("second");
    }
    ChartBase::printDebugInfo("unset again: not written");

    const std::string nameAfter = expectedFileName();

    // The date may roll over during the calls; either moment's name is right.
    std::string file;
    int files = 0;
    for (const auto& entry : std::filesystem::directory_iterator(dir.path())) {
        file = entry.path().filename().string();
        ++files;
    }
    EXPECT_EQ(files, 1);
    EXPECT_TRUE(file == nameBefore || file == nameAfter) << file;

    const auto lines = readLines(dir.path() + "/" + file);
    ASSERT_EQ(lines.size(), 2u);
    const std::regex line(
        R"( time = \d\d:\d\d:\d\d\.\d{3} elapsed seconds = +\d+\.\d{3} total elapsed seconds = +\d+\.\d{3} (.*))");
    std::smatch m;
    ASSERT_TRUE(std::regex_match(lines[0], m, line)) << lines[0];
    EXPECT_EQ(m[1], "first");
    ASSERT_TRUE(std::regex_match(lines[1], m, line)) << lines[1];
    EXPECT_EQ(m[1], "second");
}
