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

std::vector<std::string> readLines(const std::string& path) {
    std::vector<std::string> lines;
    std::istringstream in(readAll(path));
    for (std::string line; std::getline(in, line);)
        lines.push_back(line);
    return lines;
}

// tag, wall clock, elapsed seconds, total elapsed seconds, text.
struct Parsed {
    std::string tag, text, elapsedField, totalField;
    double elapsed = -1, total = -1;
};

bool parse(const std::string& line, Parsed& out) {
    static const std::regex layout(
        R"((.*) time = ([01]\d|2[0-3]):[0-5]\d:[0-6]\d\.\d{3} )"
        R"(elapsed seconds = ( *\d+)\.(\d{3}) total elapsed seconds = ( *\d+)\.(\d{3}) (.*))");
    std::smatch m;
    if (!std::regex_match(line, m, layout))
        return false;
    out = {m[1],
           m[7],
           m[3],
           m[5],
           std::stoi(m[3]) + std::stoi(m[4]) / 1000.0,
           std::stoi(m[5]) + std::stoi(m[6]) / 1000.0};
    return true;
}

std::vector<Parsed> parsedLines(const std::string& path) {
    std::vector<Parsed> out;
    for (const std::string& line : readLines(path)) {
        out.emplace_back();
        EXPECT_TRUE(parse(line, out.back())) << line;
    }
    return out;
}

} // namespace

TEST(TimeStamp, FileNameCarriesTheNumberInAtLeastTwoDigits) {
    EXPECT_EQ(TimeStamp("P", 0).fileName(), "P00.txt");
    EXPECT_EQ(TimeStamp("/x/log_", 7).fileName(), "/x/log_07.txt");
    EXPECT_EQ(TimeStamp("log", 123).fileName(), "log123.txt");
}

TEST(TimeStamp, LinesFollowTheLayoutAndAppend) {
    TempDir dir;
    const std::string prefix = dir.path() + "/P";
    TimeStamp stamp(prefix, 0);
    stamp.logTime("load", "first step");
    std::this_thread::sleep_for(std::chrono::milliseconds(30));
    stamp.logTime("", "second step");
    TimeStamp again(prefix, 0); // appends rather than replaces
    again.logTime("t", "third");

    const std::vector<Parsed> lines = parsedLines(dir.path() + "/P00.txt");
    ASSERT_EQ(lines.size(), 3u);
    EXPECT_EQ(lines[0].tag, "load");
    EXPECT_EQ(lines[0].text, "first step");
    EXPECT_EQ(lines[1].tag, "");
    EXPECT_EQ(lines[1].text, "second step");
    // The first line's two durations are the same, padded with blanks to three digits.
    EXPECT_EQ(lines[0].elapsedField, lines[0].totalField);
    EXPECT_EQ(lines[0].elapsedField.size(), 3u);
    EXPECT_GE(lines[1].elapsed, 0.030);
    EXPECT_GE(lines[1].total, lines[0].total + lines[1].elapsed - 0.0005);
}

TEST(TimeStamp, RenumberingRestartsTheClocksCopiesShareTheStart) {
    TempDir dir;
    TimeStamp stamp(dir.path() + "/run", 1);
    std::this_thread::sleep_for(std::chrono::milliseconds(30));
    TimeStamp copy(stamp);
    stamp.setFileNum(2);
    stamp.logTime("a", "b");
    copy.logTime("copy", "x");
    const std::vector<Parsed> renumbered = parsedLines(dir.path() + "/run02.txt");
    const std::vector<Parsed> copied = parsedLines(dir.path() + "/run01.txt");
    ASSERT_EQ(renumbered.size(), 1u);
    ASSERT_EQ(copied.size(), 1u);
    EXPECT_LT(renumbered[0].total, 0.030);
    EXPECT_GE(copied[0].total, 0.030);
}

TEST(TimeStamp, TextIsWrittenByteForByteAndUnopenableFileIsSilent) {
    TempDir dir;
    TimeStamp stamp(dir.path() + "/n", 0);
    stamp.logTime(std::string("t\0g", 3), std::string("a\0b", 3));
    const std::string all = readAll(dir.path() + "/n00.txt");
    EXPECT_EQ(all.compare(0, 3, std::string("t\0g", 3)), 0);
    EXPECT_NE(all.find(std::string(" a\0b\n", 5)), std::string::npos);

    TimeStamp lost(dir.path() + "/no/such/folder/x", 0);
    lost.logTime("a", "b"); // must neither crash nor create anything
    EXPECT_FALSE(std::filesystem::exists(dir.path() + "/no"));
}

// One test: the debug log is fixed for the process at its first use.
TEST(PrintDebugInfo, WritesTheProcessTimingLogOnlyWhenAsked) {
    const auto expectedName = [] {
        static const char* const months[] = {"Jan", "Feb", "Mar", "Apr", "May", "Jun",
                                             "Jul", "Aug", "Sep", "Oct", "Nov", "Dec"};
        const std::time_t now = std::time(nullptr);
        std::tm local{};
        localtime_r(&now, &local);
        // ctime's layout: the day of the month padded with a blank to two.
        return std::string("chartxmldebug_") + months[local.tm_mon] + (local.tm_mday < 10 ? " " : "") +
               std::to_string(local.tm_mday) + "00.txt";
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
    const std::vector<Parsed> lines = parsedLines(dir.path() + "/" + files[0]);
    ASSERT_EQ(lines.size(), 2u);
    EXPECT_EQ(lines[0].tag + lines[0].text, "first");
    EXPECT_EQ(lines[1].tag + lines[1].text, "second");
}
