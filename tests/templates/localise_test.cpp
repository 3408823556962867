#include "templates/Localise.h"

#include <gtest/gtest.h>

#include <ctime>
#include <string>

using namespace plotaid::detail;

namespace {

TEST(Localise, LanguageCodeAndCodePage) {
    EXPECT_EQ(codePageOf("ja"), "CP932");
    EXPECT_EQ(codePageOf("de"), "CP1252");
    const struct {
        const char* full;
        const char* base;
        const char* code;
    } cases[] = {
        {"/r/messages/ja/", "/r/messages/", "ja"},  {"/r/messages/zh_tw", "/r/messages/", "zh_tw"},
        {"/r/messages/de/x/", "/r/messages", "de"}, {"/r/messages/", "/r/messages/", ""},
        {"/r/other/de/", "/r/messages/", ""},       {"/r/", "/r/messages/", ""},
    };
    for (const auto& c : cases)
        EXPECT_EQ(languageCodeOf(c.full, c.base), c.code) << c.full << " after " << c.base;
}

// The German words are single CP1252 bytes: they arrive only when the language picks that code page.
TEST(Localise, WordsOfTheLanguageFolderInItsCodePage) {
    const std::string base = std::string(PLOTAID_SOURCE_DIR) + "/resources/messages/";
    std::tm now{};
    now.tm_year = 126;
    now.tm_mon = 2;
    now.tm_mday = 4;
    ChartString text("@@current_monthname@@ @@current_day@@");
    localiseChartTextAt(text, base + "de/", base, now);
    EXPECT_EQ(text.str(), u"März 04");

    ChartString japanese("@@current_monthname@@");
    EXPECT_TRUE(localiseChartTextFor(japanese, "ja", now)); // no words of its own: English
    EXPECT_EQ(japanese.str(), u"March");
    ChartString outside("@@current_monthname@@");
    EXPECT_FALSE(localiseChartTextFor(outside, "../de", now));
    EXPECT_EQ(outside.str(), u"@@current_monthname@@");
}

} // namespace
