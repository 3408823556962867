#include "TempDir.h"

#include <plotaid/TimeStamp.h>

#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <regex>
#include <string>
#include <thread>

namespace {

// tag, wall clock, elapsed seconds, total elapsed seconds, text.
const std::regex
    kLine(R"((.*) time = (\d\d):(\d\d):(\d\d)\.(\d{3}) elapsed seconds = ( *\d+)\.(\d{3}) )"
          R"(total elapsed seconds = ( *\d+)\.(\d{3}) (.*))");

struct Parsed {
    std::string tag, text;
    int hours = -1, minutes = -1, seconds = -1;
    double elapsed = -1, total = -1;
    std::string elapsedField, totalField;
};

bool parse(const std::string& line, Parsed& out) {
    std::smatch m;
    if (!std::regex_match(line, m, kLine))
        return false;
    out.tag = m[1];
    out.hours = std::stoi(m[2]);
    out.minutes = std::stoi(m[3]);
    out.seconds = std::stoi(m[4]);
    out.elapsedField = m[6];
    out.totalField = m[8];
    out.elapsed = std::stoi(m[6]) + std::stoi(m[7]) / 1000.0;
    out.total = std::stoi(m[8]) + std::stoi(m[9]) / 1000.0;
    out.text = m[10];
    return true;
}

} // namespace

TEST(TimeStamp, FileNameCarriesTheNumberInAtLeastTwoDigits) {
    EXPECT_EQ(TimeStamp("P", 0).fileName(), "P00.txt");
    EXPECT_EQ(TimeStamp("/x/log_", 7).fileName(), "/x/log_07.txt");
    EXPECT_EQ(TimeStamp("log", 123).fileName(), "log123.txt");
    TimeStamp renumbered("q", 1);
    renumbered.setFileNum(42);
    EXPECT_EQ(renumbered.fileName(), "q42.txt");
}

TEST(TimeStamp, LinesFollowTheLayoutAndAppend) {
    TempDir dir;
    ASSERT_FALSE(dir.path().empty());
    const std::string prefix = dir.path() + "/P";
    TimeStamp stamp(prefix, 0);
    stamp.logTime("load", "first step");
    std::this_thread::sleep_for(std::chrono::milliseconds(30));
    stamp.logTime("", "second step");

    ASSERT_TRUE(std::filesystem::exists(dir.path() + "/P00.txt"));
    const auto lines = readLines(dir.path() + "/P00.txt");
    ASSERT_EQ(lines.size(), 2u);
    Parsed first, second;
    ASSERT_TRUE(parse(lines[0], first)) << lines[0];
    ASSERT_TRUE(parse(lines[1], second)) << lines[1];
    EXPECT_EQ(first.tag, "load");
    EXPECT_EQ(first.text, "first step");
    EXPECT_EQ(second.tag, "");
    EXPECT_EQ(second.text, "second step");
    EXPECT_EQ(lines[1].rfind(" time = ", 0), 0u) << "an empty tag leaves the line starting with a blank";

    // The first line's two durations are the same; both are padded with blanks to three digits.
    EXPECT_EQ(first.elapsedField, first.totalField);
    EXPECT_EQ(first.elapsedField.size(), 3u);
    EXPECT_GE(second.elapsed, 0.030);
    EXPECT_GE(second.total, first.total + second.elapsed - 0.0005);
    for (const Parsed* p : {&first, &second}) {
        EXPECT_LT(p->hours, 24);
        EXPECT_LT(p->minutes, 60);
        EXPECT_LT(p->seconds, 61);
    }

    // A second stamp over the same file appends rather than replaces.
    TimeStamp again(prefix, 0);
    again.logTime("t", "third");
    EXPECT_EQ(readLines(dir.path() + "/P00.txt").size(), 3u);
}

TEST(TimeStamp, SetFileNumRestartsTheClocksAndSwitchesFile) {
    TempDir dir;
    ASSERT_FALSE(dir.path().empty());
    TimeStamp stamp(dir.path() + "/run", 1);
    std::this_thread::sleep_for(std::chrono::milliseconds(30));
    stamp.setFileNum(2);
    stamp.logTime("a", "b");
    EXPECT_FALSE(std::filesystem::exists(dir.path() + "/run01.txt"));
    const auto lines = readLines(dir.path() + "/run02.txt");
    ASSERT_EQ(lines.size(), 1u);
    Parsed p;
    ASSERT_TRUE(parse(lines[0], p)) << lines[0];
    EXPECT_LT(p.total, 0.030);
}

TEST(TimeStamp, CopiesShareTheStartButLogOnTheirOwn) {
    TempDir dir;
    ASSERT_FALSE(dir.path().empty());
    TimeStamp stamp(dir.path() + "/c", 3);
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
    TimeStamp copy(stamp);
    copy.logTime("copy", "x");
    const auto lines = readLines(dir.path() + "/c03.txt");
    ASSERT_EQ(lines.size(), 1u);
    Parsed p;
    ASSERT_TRUE(parse(lines[0], p)) << lines[0];
    EXPECT_GE(p.total, 0.020);
}

TEST(TimeStamp, TextIsWrittenByteForByteAndUnopenableFileIsSilent) {
    TempDir dir;
    ASSERT_FALSE(dir.path().empty());
    TimeStamp stamp(dir.path() + "/n", 0);
    stamp.logTime(std::string("t\0g", 3), std::string("a\0b", 3));
    const std::string all = readAll(dir.path() + "/n00.txt");
    EXPECT_EQ(all.compare(0, 3, std::string("t\0g", 3)), 0);
    EXPECT_NE(all.find(std::string(" a\0b\n", 5)), std::string::npos);

    TimeStamp lost(dir.path() + "/no/such/folder/x", 0);
    lost.logTime("a", "b"); // must neither crash nor create anything
    EXPECT_FALSE(std::filesystem::exists(dir.path() + "/no"));
}
