#include <grx/ChartString.h>
#include <grx/formatter.h>

#include <gtest/gtest.h>

#include <clocale>
#include <cmath>
#include <limits>

namespace {

// Malformed input (truncated sequence, stray continuation byte, overlong '/', encoded surrogate, lone
// surrogate) becomes U+FFFD instead of failing.
TEST(ChartString, ConvertsBetweenUtf8AndUtf16) {
    const std::pair<std::string, std::u16string> rows[] = {{"Gr\xC3\xB6\xC3\x9F"
                                                            "e \xE2\x82\xAC \xF0\x9F\x93\x88",
                                                            u"Gr\u00F6\u00DFe \u20AC \U0001F4C8"},
                                                           {"a\xE2\x82", u"a\uFFFD"},
                                                           {"\x80z", u"\uFFFDz"},
                                                           {"\xC0\xAF", u"\uFFFD"},
                                                           {"\xED\xA0\x80!", u"\uFFFD!"}};
    for (const auto& [utf8, utf16] : rows) {
        EXPECT_EQ(ChartString(utf8.c_str()).str(), utf16) << utf8;
        if (utf16.find(u'\uFFFD') == std::u16string::npos) {
            EXPECT_EQ(ChartString(utf16.c_str()).toUTF8(), utf8);
        }
    }
    EXPECT_EQ(ChartString(std::u16string{u'x', char16_t(0xD800), u'y'}).toUTF8(), "x\xEF\xBF\xBDy");
    EXPECT_TRUE(ChartString(static_cast<const char*>(nullptr)).empty());
    EXPECT_TRUE(ChartString(static_cast<const XMLCh*>(nullptr)).empty());
}

TEST(ChartString, ComparesExactlyAndFindsSubstrings) {
    const ChartString s(u"tickTextStyle");
    EXPECT_TRUE(s.equals(u"tickTextStyle"));
    EXPECT_FALSE(s.equals(u"ticktextstyle"));
    EXPECT_FALSE(s.equals(static_cast<const XMLCh*>(nullptr)));
    EXPECT_TRUE(ChartString().equals(static_cast<const XMLCh*>(nullptr)));
    EXPECT_TRUE(s.ContainsString(u"Text"));
    EXPECT_FALSE(s.ContainsString(u"text"));
    EXPECT_FALSE(s.ContainsString(static_cast<const XMLCh*>(nullptr)));
    EXPECT_TRUE(ChartString("a") < ChartString("b"));
    EXPECT_EQ(ChartString("ab"), ChartString("a") + ChartString("b"));
}

TEST(ChartString, EditsInPlace) {
    ChartString id("frameLegendBin");
    id.appendInteger(12).append(u"_").appendInteger(-3);
    EXPECT_EQ(id.toUTF8(), "frameLegendBin12_-3");
    id.truncateString(3);
    EXPECT_EQ(id.toUTF8(), "frameLegendBin12");
    id.truncateString(100);
    EXPECT_TRUE(id.empty());

    ChartString text("%s of %s, %s");
    text.replaceSubstring(ChartString("%s"), ChartString("x%sx"));
    EXPECT_EQ(text.toUTF8(), "x%sx of x%sx, x%sx"); // no re-scan of the replacement
    text.replaceSubstring(ChartString(), ChartString("never"));
    EXPECT_EQ(text.toUTF8(), "x%sx of x%sx, x%sx");
    text.assign(u"new").append("er");
    EXPECT_EQ(text.toUTF8(), "newer");
    text.assign(static_cast<const XMLCh*>(nullptr));
    EXPECT_TRUE(text.empty());
}

TEST(ChartString, IntegersReadLikeStrtoulOrSaturateWhenSigned) {
    constexpr unsigned kMax = std::numeric_limits<unsigned>::max();
    // "-1" is neither 0 nor 1: it wraps, and reads -1 again as a signed number.
    const std::pair<const char*, unsigned> plain[] = {
        {"2", 2u},   {"  42abc", 42u}, {"0.5", 0u},  {"", 0u},
        {"abc", 0u}, {"+7", 7u},       {"-1", kMax}, {"99999999999999999999999", kMax}};
    for (const auto& [text, value] : plain)
        EXPECT_EQ(ChartString(text).convertToInteger(), value) << text;
    EXPECT_EQ(static_cast<int>(ChartString("-1").convertToInteger()), -1);
    const std::pair<const char*, int> sign[] = {{"-5", -5},
                                                {" 12 ", 12},
                                                {"-2147483648", std::numeric_limits<int>::min()},
                                                {"-99999999999", std::numeric_limits<int>::min()},
                                                {"99999999999", std::numeric_limits<int>::max()},
                                                {"x1", 0}};
    for (const auto& [text, value] : sign)
        EXPECT_EQ(ChartString(text).convertToSignedInteger(), value) << text;
}

TEST(ChartString, ConvertToDoubleIgnoresTheLocale) {
    const char* saved = std::setlocale(LC_NUMERIC, nullptr);
    const std::string restore = saved ? saved : "C";
    std::setlocale(LC_NUMERIC, "de_DE.UTF-8"); // may be missing; the check holds either way
    EXPECT_DOUBLE_EQ(ChartString("12.5").convertToDouble(), 12.5);
    EXPECT_DOUBLE_EQ(ChartString(" +1.5e3px").convertToDouble(), 1500.0);
    EXPECT_DOUBLE_EQ(ChartString("-0.25").convertToDouble(), -0.25);
    EXPECT_EQ(ChartString("abc").convertToDouble(), 0.0);
    EXPECT_EQ(ChartString("1e999").convertToDouble(), HUGE_VAL);
    EXPECT_EQ(ChartString("1e-999").convertToDouble(), 0.0);
    EXPECT_EQ(formatter::AsString(1234.5, 16), "1234.5");
    std::setlocale(LC_NUMERIC, restore.c_str());
}

TEST(ChartString, IsNumberAcceptsOnlyAWholeFiniteDecimal) {
    for (const char* yes : {"3", "3.0", " -2.5 ", "1e3", ".5", "+4"})
        EXPECT_TRUE(ChartString(yes).isNumber()) << yes;
    for (const char* no : {"", " ", "3x", "x3", "inf", "nan", "0x10", "1 2", "1e999", "-"})
        EXPECT_FALSE(ChartString(no).isNumber()) << no;
}

TEST(Formatter, AsStringGivesTheShortestFormWithinTheDigits) {
    EXPECT_EQ(formatter::AsString(12.3, 16), "12.3");
    EXPECT_EQ(formatter::AsString(0.1 + 0.2, 16), "0.3");
    EXPECT_EQ(formatter::AsString(0.1 + 0.2, 17), "0.30000000000000004");
    EXPECT_EQ(formatter::AsString(3.0, 16), "3");
    EXPECT_EQ(formatter::AsString(-0.0, 16), "0");
    EXPECT_EQ(formatter::AsString(-0.06, 16), "-0.06");
    EXPECT_EQ(formatter::AsString(2.0 / 3.0, 3), "0.667");
    EXPECT_EQ(formatter::AsString(1e20, 16), "1e+20");
    EXPECT_EQ(formatter::AsString(0.1 + 0.2, 0), "0.30000000000000004");
    EXPECT_EQ(formatter::AsString(std::numeric_limits<double>::infinity(), 16), "inf");
    EXPECT_EQ(formatter::AsString(-std::numeric_limits<double>::quiet_NaN(), 16), "nan");

    ChartString s;
    s.assignDouble(-0.0, 16);
    EXPECT_EQ(s.toUTF8(), "0");
    s.assignDouble(45.6, 16).append(u"%");
    EXPECT_EQ(s.toUTF8(), "45.6%");
}

} // namespace
