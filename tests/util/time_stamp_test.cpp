#include "support/TestSupport.h"

#include <plotaid/ChartBase.h>
#include <plotaid/TimeStamp.h>

#include <gtest/gtest.h>

#include <chrono>
#include <ctime>
#include <filesystem>
#include <regex>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

namespace {

// One log line: tag, wall clock, elapsed seconds, total elapsed seconds, text.
struct Parsed {
    std::string tag, text, elapsedField, totalField;
    double elapsed = -1, total = -1;
};

std::vector<Parsed> parsedLines(const std::string& path) {
    static const std::regex layout(
        R"((.*) time = ([01]\d|2[0-3]):[0-5]\d:[0-6]\d\.\d{3} )"
        R"(elapsed seconds = ( *\d+)\.(\d{3}) total elapsed seconds = ( *\d+)\.(\d{3}) (.*))");
    std::vector<Parsed> out;
    std::istringstream in(readAll(path));
    std::smatch m;
    for (std::string line; std::getline(in, line);) {
        EXPECT_TRUE(std::regex_match(line, m, layout)) << line;
        out.push_back({m[1], m[7], m[3], m[5],
                       std::stoi("0" + m[3].str()) + std::stoi("0" + m[4].str()) / 1000.0,
                       std::stoi("0" + m[5].str()) + std::stoi("0" + m[6].str()) / 1000.0});
    }
    return out;
}

TEST(TimeStamp, FileNameCarriesTheNumberInAtLeastTwoDigits) {
    EXPECT_EQ(TimeStamp("log", 123).fileName(), "log123.txt");
}

TEST(TimeStamp, LinesFollowTheLayoutAppendAndKeepTheirBytes) {
    TempDir dir;
    TimeStamp stamp(dir.file("P"), 0);
    stamp.logTime("load", "first step");
    std::this_thread::sleep_for(std::chrono::milliseconds(30));
    stamp.logTime("", "second step");
    TimeStamp again(dir.file("P"), 0); // appends rather than replaces
    again.logTime(std::string("t\0g", 3), std::string("a\0b", 3));

    const std::vector<Parsed> lines = parsedLines(dir.file("P00.txt"));
    ASSERT_EQ(lines.size(), 3u);
    EXPECT_EQ(lines[0].tag + "|" + lines[0].text + "|" + lines[1].tag + "|" + lines[1].text,
              "load|first step||second step");
    EXPECT_EQ(lines[2].tag + lines[2].text, std::string("t\0ga\0b", 6));
    // The first line's two durations are the same, padded with blanks to three digits.
    EXPECT_EQ(lines[0].elapsedField, lines[0].totalField);
    EXPECT_EQ(lines[0].elapsedField.size(), 3u);
    EXPECT_GE(lines[1].elapsed, 0.030);
    EXPECT_GE(lines[1].total, lines[0].total + lines[1].elapsed - 0.0005);

    TimeStamp lost(dir.file("no/such/folder/x"), 0);
    lost.logTime("a", "b"); // must neither crash nor create anything
    EXPECT_FALSE(std::filesystem::exists(dir.file("no")));
}

TEST(TimeStamp, RenumberingRestartsTheClocksCopiesShareTheStart) {
    TempDir dir;
    TimeStamp stamp(dir.file("run"), 1);
    std::this_thread::sleep_for(std::chrono::milliseconds(30));
    TimeStamp copy(stamp);
    stamp.setFileNum(2);
    stamp.logTime("a", "b");
    copy.logTime("copy", "x");
    const std::vector<Parsed> renumbered = parsedLines(dir.file("run02.txt"));
    const std::vector<Parsed> copied = parsedLines(dir.file("run01.txt"));
    ASSERT_EQ(renumbered.size() + copied.size(), 2u);
    EXPECT_LT(renumbered.at(0).total, 0.030);
    EXPECT_GE(copied.at(0).total, 0.030);
}

// One test: the debug log is fixed for the process at its first use.
TEST(PrintDebugInfo, WritesTheProcessTimingLogOnlyWhenAsked) {
    const auto expectedName = [] { // ctime's month and blank-padded day
        const std::time_t now = std::time(nullptr);
        std::tm local{};
        char name[64];
        return std::string(
            name, std::strftime(name, sizeof name, "chartxmldebug_%b%e00.txt", localtime_r(&now, &local)));
    };
    TempDir dir;
    {
        ScopedEnv off("DumpChartTimePath", nullptr);
        ChartBase::printDebugInfo("not written");
    }
    EXPECT_TRUE(std::filesystem::is_empty(dir.path()));
    const std::string nameBefore = expectedName();
    {
        ScopedEnv on("DumpChartTimePath", dir.path().c_str());
        ChartBase::printDebugInfo("first");
        ChartBase::printDebugInfo("second");
    }
    ChartBase::printDebugInfo("unset again: not written");
    const std::string nameAfter = expectedName(); // the date may roll over meanwhile

    std::vector<std::string> files;
    for (const auto& entry : std::filesystem::directory_iterator(dir.path()))
        files.push_back(entry.path().filename().string());
    ASSERT_EQ(files.size(), 1u);
    EXPECT_TRUE(files[0] == nameBefore || files[0] == nameAfter) << files[0];
    const std::vector<Parsed> lines = parsedLines(dir.file(files[0]));
    ASSERT_EQ(lines.size(), 2u);
    EXPECT_EQ(lines[0].tag + lines[0].text + "|" + lines[1].tag + lines[1].text, "first|second");
}

} // namespace
