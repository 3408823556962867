#include "foundation/FoundationSupport.h"
#include "foundation/TextPlaceholders.h"

#include <plotaid/ChartTranscoder.h>

#include <msgbook/FacSTDictionary.h>

#include <gtest/gtest.h>

#include <fstream>

using namespace foundation_test;

namespace {

std::tm at(int year, int month, int day, int hour, int minute, int second, int weekday) {
    std::tm t{};
    t.tm_year = year - 1900;
    t.tm_mon = month - 1;
    t.tm_mday = day;
    t.tm_hour = hour;
    t.tm_min = minute;
    t.tm_sec = second;
    t.tm_wday = weekday;
    return t;
}

const std::string kResources = std::string(PLOTAID_SOURCE_DIR) + "/resources/";

msgbook::FacSTDictionary graphWords(const std::string& languageFolder) {
    auto d = msgbook::FacSTDictionary::overLanguageFolder(languageFolder);
    d.SetProcedure("GRAPH");
    return d;
}

// At fixed moments, with the shipped English and German words, with none, with a table that has
// only "a.m." and with a code page that does not exist.
TEST(TextPlaceholders, FilledAtFixedMoments) {
    TempDir partialFolder;
    std::filesystem::create_directories(partialFolder.file("messages"));
    std::ofstream(partialFolder.file("messages/GRAPH.xx.txt")) << "a.m.\tAM\n";
    const msgbook::FacSTDictionary en = graphWords(kResources + "messages/en/"),
                                   de = graphWords(kResources + "messages/de"),
                                   notALanguageFolder = graphWords(kResources + "de/"),
                                   partial = graphWords(partialFolder.path() + "/messages/xx/");
    const std::tm morning = at(2026, 3, 4, 9, 5, 7, 3), midnight = at(2026, 3, 4, 0, 30, 0, 3),
                  lastSecond = at(1999, 12, 31, 23, 59, 59, 5), early = at(2005, 1, 1, 12, 0, 0, 6);
    const struct {
        const msgbook::FacSTDictionary* dictionary;
        const char* encoding;
        const std::tm& now;
        const char* text;
        const char16_t* filled;
    } cases[] = {
        {&en, "CP1252", morning, "@@current_date@@ )DATE @@current_time@@ )TIME",
         u"2026-03-04 2026/03/04 09:05:07 9:05:07 a.m."},
        {&en, "CP1252", morning,
         "@@current_YYYY@@ @@current_YY@@ @@current_month@@ @@current_day@@ @@current_hour@@:@@current_min@@:"
         "@@current_sec@@",
         u"2026 26 03 04 09:05:07"},
        {&en, "CP1252", morning, "@@current_weekday@@, @@current_monthname@@ @@current_ampm@@",
         u"Wednesday, March a.m."},
        {&de, "CP1252", morning, "@@current_weekday@@, @@current_monthname@@ @@current_ampm@@ )TIME",
         u"Mittwoch, März vorm. 9:05:07 vorm."},
        {&en, "CP1252", midnight, "@@current_hour@@ @@current_time@@ )TIME", u"12 12:30:00 0:30:00 a.m."},
        {&en, "CP1252", midnight, "@@current_hour24@@ @@current_hour@@", u"00 @@current_hour@@"},
        {&en, "CP1252", lastSecond,
         "@@current_YY@@ )TIME @@current_ampm@@ @@current_hour@@ @@current_weekday@@",
         u"99 23:59:59 p.m. p.m. 11 Friday"},
        {&en, "CP1252", early, "@@current_YY@@ @@current_time@@ @@current_ampm@@", u"05 12:00:00 p.m."},
        {&en, "CP1252", morning, "@@current_day@@-@@current_day@@ )DATE)DATE", u"04-04 2026/03/042026/03/04"},
        {&en, "CP1252", morning, "plain @@ text )date @@current_Day@@",
         u"plain @@ text )date @@current_Day@@"},
        // No word to put in leaves just that placeholder.
        {nullptr, "CP1252", morning,
         "@@current_monthname@@ )TIME @@current_ampm@@ @@current_weekday@@ @@current_day@@",
         u"@@current_monthname@@ )TIME @@current_ampm@@ @@current_weekday@@ 04"},
        {&partial, "CP1252", morning, ")TIME @@current_monthname@@", u"9:05:07 AM @@current_monthname@@"},
        {&notALanguageFolder, "CP1252", morning, "@@current_ampm@@", u"@@current_ampm@@"},
        {&de, "NO-SUCH-CODE-PAGE", morning, "@@current_monthname@@ @@current_sec@@",
         u"@@current_monthname@@ 07"},
        {&de, "UTF-8", morning, "@@current_monthname@@", u"@@current_monthname@@"}, // Latin-1 byte
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.text);
        ChartString text(c.text);
        plotaid::detail::updateTextAt(text, c.dictionary, c.encoding, c.now);
        EXPECT_EQ(text.str(), c.filled);
    }
}

TEST(ChartTranscoderTest, RoundTripsAndFailsSafely) {
    const ChartTranscoder latin("CP1252"), japanese("CP932");
    EXPECT_TRUE(latin.transcode("").empty());
    EXPECT_EQ(latin.transcode("M\xe4rz").str(), u"März");
    EXPECT_EQ(latin.transcodeTo(u"März"), "M\xe4rz");
    EXPECT_EQ(japanese.transcode("\x93\xfa\x96\x7b").str(), u"日本");
    EXPECT_EQ(japanese.transcodeTo(u"日本"), "\x93\xfa\x96\x7b");

    DumpFolder log;
    EXPECT_EQ(japanese.transcode("\x93").str(), u""); // cut in the middle of a character
    EXPECT_EQ(latin.transcodeTo(u"日本"), "");
    EXPECT_EQ(latin.transcodeTo(nullptr), "");
    const ChartTranscoder unknown("NO-SUCH-CODE-PAGE");
    EXPECT_FALSE(unknown.valid());
    EXPECT_TRUE(unknown.transcode("abc").empty());
    EXPECT_EQ(unknown.transcodeTo(u"abc"), "");
    EXPECT_NE(log.log().find("NO-SUCH-CODE-PAGE"), std::string::npos);
}

} // namespace
