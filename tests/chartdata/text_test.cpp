#include "data/Numbers.h"
#include "data/XmlText.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <limits>

using plotaid::detail::appendEscaped;
using plotaid::detail::EscapeKind;
using plotaid::detail::parseNumber;
using plotaid::detail::unescape;

namespace {

struct Parsed {
    bool whole;
    double value;
};

Parsed parse(const char* text) {
    Parsed p{};
    p.whole = parseNumber(text, text + std::strlen(text), p.value);
    return p;
}

} // namespace

TEST(DataNumbers, ReadLikeAtofWithADot) {
    EXPECT_EQ(parse("1.5").value, 1.5);
    EXPECT_TRUE(parse("1.5").whole);
    EXPECT_EQ(parse("  -2.5e3 ").value, -2500);
    EXPECT_TRUE(parse("  -2.5e3 ").whole);
    EXPECT_EQ(parse("+7").value, 7);
    EXPECT_EQ(parse(".25").value, 0.25);
    EXPECT_EQ(parse("0x1p3").value, 8);
    EXPECT_EQ(parse("-0x10").value, -16);
    EXPECT_EQ(parse("1e999").value, std::numeric_limits<double>::infinity());
    EXPECT_EQ(parse("-1e999").value, -std::numeric_limits<double>::infinity());
    EXPECT_EQ(parse("1e-400").value, 0);
    EXPECT_TRUE(std::isnan(parse("nan").value));
    EXPECT_EQ(parse("-inf").value, -std::numeric_limits<double>::infinity());
    // A number followed by text reads its number part, but is not a number as a whole.
    EXPECT_EQ(parse("12abc").value, 12);
    EXPECT_FALSE(parse("12abc").whole);
    EXPECT_EQ(parse("1,5").value, 1);
    EXPECT_FALSE(parse("1,5").whole);
    for (const char* none : {"", "   ", "abc", "--5", "+-5", "-", "."}) {
        const Parsed p = parse(none);
        EXPECT_EQ(p.value, 0) << '"' << none << '"';
        EXPECT_FALSE(p.whole) << '"' << none << '"';
    }
    // Never past the end it is given.
    const char text[] = "123456";
    double v = 0;
    EXPECT_TRUE(parseNumber(text, text + 3, v));
    EXPECT_EQ(v, 123);
}

TEST(DataNumbers, CellsAsText) {
    using plotaid::detail::formatCell;
    EXPECT_EQ(formatCell(-std::numeric_limits<double>::max()), "");
    EXPECT_EQ(formatCell(-0.0), "0");
    EXPECT_EQ(formatCell(2147483647.0), "2147483647");
    EXPECT_EQ(formatCell(2147483647.5), "2147483647.5");
    EXPECT_EQ(formatCell(-2147483649.0), "-2147483649");
    EXPECT_EQ(formatCell(0.1 + 0.2), "0.3"); // 16 digits, trailing zeros dropped
    EXPECT_EQ(formatCell(1.0 / 3), "0.3333333333333333");
    EXPECT_EQ(formatCell(std::numeric_limits<double>::infinity()), "inf");
}

TEST(DataXmlText, EscapingByKind) {
    std::string out;
    appendEscaped(out, "a;\"&'<>b", EscapeKind::SourceName);
    EXPECT_EQ(out, "a;&quot;&amp;&apos;&lt;&gt;b");
    out.clear();
    appendEscaped(out, "a;b", EscapeKind::VariableName);
    EXPECT_EQ(out, "a&#59;b");
    out.clear();
    appendEscaped(out, "a;b", EscapeKind::Value);
    EXPECT_EQ(out, "a,b");
    out = "kept:";
    appendEscaped(out, "", EscapeKind::Value);
    EXPECT_EQ(out, "kept:");
}

TEST(DataXmlText, UnescapeResolvesOnlyWellFormedReferences) {
    EXPECT_EQ(unescape("a&lt;b&gt;c&amp;d&quot;e&apos;f"), "a<b>c&d\"e'f");
    EXPECT_EQ(unescape("&#59;&#x3B;&#X41;"), ";;A");
    EXPECT_EQ(unescape("&#233;&#x20AC;&#x1F600;"), "\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80");
    for (const char* kept :
         {"&", "&amp", "&unknown;", "&#;", "&#x;", "&#0;", "&#xD800;", "&#x110000;", "&#12a;", "a & b", "&;"})
        EXPECT_EQ(unescape(kept), kept);
    EXPECT_EQ(unescape("&&amp;"), "&&");
}
