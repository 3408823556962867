#include "data/Numbers.h"
#include "data/XmlText.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <limits>
#include <utility>

using namespace plotaid::detail;

TEST(DataNumbers, ReadLikeAtofWithADotWholeOnlyWithoutTrailingText) {
    const double inf = std::numeric_limits<double>::infinity();
    const struct {
        const char* text;
        double value;
        bool whole;
    } rows[] = {
        {"1.5", 1.5, true},   {"  -2.5e3 ", -2500, true},
        {"+7", 7, true},      {".25", 0.25, true},
        {"0x1p3", 8, true},   {"-0x10", -16, true},
        {"1e999", inf, true}, {"-inf", -inf, true},
        {"1e-400", 0, true},  {"12abc", 12, false},
        {"1,5", 1, false},    {"", 0, false},
        {"   ", 0, false},    {"abc", 0, false},
        {"--5", 0, false},    {"+-5", 0, false},
        {"-", 0, false},      {".", 0, false},
    };
    for (const auto& r : rows) {
        double value = -1;
        EXPECT_EQ(parseNumber(r.text, r.text + std::strlen(r.text), value), r.whole) << '"' << r.text << '"';
        EXPECT_EQ(value, r.value) << '"' << r.text << '"';
    }
    double value = 0;
    const char nan[] = "nan";
    EXPECT_TRUE(parseNumber(nan, nan + 3, value));
    EXPECT_TRUE(std::isnan(value));
    const char text[] = "123456"; // never past the end it is given
    EXPECT_TRUE(parseNumber(text, text + 3, value));
    EXPECT_EQ(value, 123);
}

TEST(DataNumbers, CellsAsText) {
    const std::pair<double, const char*> rows[] = {
        {-std::numeric_limits<double>::max(), ""},
        {-0.0, "0"},
        {2147483647.5, "2147483647.5"},
        {-2147483649.0, "-2147483649"},
        {1.0 / 3, "0.3333333333333333"},
    };
    for (const auto& r : rows)
        EXPECT_EQ(formatCell(r.first), r.second) << r.second;
}

TEST(DataXmlText, EscapingByKindAndUnescapingWellFormedReferencesOnly) {
    std::string out = "kept:";
    appendEscaped(out, "a;\"&'<>b", EscapeKind::SourceName);
    appendEscaped(out, "a;b", EscapeKind::VariableName);
    appendEscaped(out, "a;b", EscapeKind::Value);
    appendEscaped(out, "", EscapeKind::Value);
    EXPECT_EQ(out, "kept:a;&quot;&amp;&apos;&lt;&gt;ba&#59;ba,b");

    EXPECT_EQ(unescape("a&lt;b&gt;c&amp;d&quot;e&apos;f"), "a<b>c&d\"e'f");
    EXPECT_EQ(unescape("&#59;&#x3B;&#X41;"), ";;A");
    EXPECT_EQ(unescape("&#233;&#x20AC;&#x1F600;"), "\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80");
    EXPECT_EQ(unescape("&&amp;"), "&&");
    for (const char* kept :
         {"&", "&amp", "&unknown;", "&#;", "&#x;", "&#0;", "&#xD800;", "&#x110000;", "&#12a;", "a & b", "&;"})
        EXPECT_EQ(unescape(kept), kept);
}
