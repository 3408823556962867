// Style text ("name:value;...") read into its fields and written back in one fixed order.
#include <plotaid/ChartStyleValue.h>

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace {

using V = ChartStyleValue;
using Getter = const ChartString& (V::*)() const;

// Every property name with the getter of its field, in the order a style text is written.
// clang-format off
const std::vector<std::pair<std::string, Getter>> kFields = {
    {"depth", &V::getDepth}, {"fill-pattern", &V::getFill_Pattern}, {"fill", &V::getFill},
    {"color", &V::getPrimaryColor}, {"color2", &V::getSecondaryColor}, {"font-family", &V::getFont_Family},
    {"font-style", &V::getFont_Style}, {"font-size", &V::getFont_Size}, {"font-weight", &V::getFont_Weight},
    {"label-location-inside", &V::getLabel_Location_Inside}, {"label-location-x", &V::getLabel_Location_X},
    {"label-location-y", &V::getLabel_Location_Y}, {"margin", &V::getMargin}, {"max-width", &V::getMax_Width},
    {"padding", &V::getPadding}, {"shadow", &V::getShadow}, {"shadow-dx", &V::getShadow_dx},
    {"shadow-dy", &V::getShadow_dy}, {"shadow-opacity", &V::getShadow_opacity}, {"stroke", &V::getStroke},
    {"stroke-dasharray", &V::getStroke_Dasharray}, {"stroke-linecap", &V::getStroke_Linecap},
    {"stroke-width", &V::getStroke_Width}, {"visibility", &V::getVisibility}, {"width", &V::getWidth},
    {"text-fit", &V::getTextFit}, {"min-font-size", &V::getMinFontSize}, {"size", &V::getSize},
    {"symbol", &V::getSymbol}, {"glyph-sides", &V::getGlyphSides}, {"glyph-angle", &V::getGlyphAngle},
    {"glyph-aspect", &V::getGlyphAspect}};
// clang-format on

std::string u8(const ChartString& s) {
    return s.toUTF8();
}
// Declarations "name:v<i>" for every property, in the order of the field list or the reverse.
std::string everyProperty(bool reversed = false) {
    std::string text;
    for (std::size_t n = 0; n < kFields.size(); ++n) {
        const std::size_t i = reversed ? kFields.size() - 1 - n : n;
        text += (n ? ";" : "") + kFields[i].first + ":v" + std::to_string(i);
    }
    return text;
}

TEST(StyleValue, EachPropertyNameFillsItsOwnFieldAndIsWrittenInTheFixedOrder) {
    const ChartStyleValue value(ChartString(everyProperty()).xc_str());
    for (std::size_t i = 0; i < kFields.size(); ++i)
        EXPECT_EQ(u8((value.*kFields[i].second)()), "v" + std::to_string(i)) << kFields[i].first;
    EXPECT_EQ(u8(value.getUnknown()), "");
    // Whatever order the declarations come in; the unknown part last.
    EXPECT_EQ(u8(V(ChartString("foo:bar;" + everyProperty(true)).xc_str()).getValue()),
              everyProperty() + ";foo:bar");
    for (const ChartStyleValue& empty : {ChartStyleValue(), ChartStyleValue(nullptr)}) {
        for (const auto& [name, getter] : kFields)
            EXPECT_TRUE((empty.*getter)().empty()) << name;
        EXPECT_TRUE(empty.getValue().empty());
    }
}

TEST(StyleValue, PiecesNamesAndValues) {
    const struct {
        const char16_t* text;
        const char *fill, *unknown;
    } rows[] = {
        // Names match exactly: a blank or a capital lands in the unknown part.
        {u"fill:red; stroke:blue;Fill:green", "red", " stroke:blue;Fill:green"},
        {u"fill: red ", " red ", ""}, // values are not trimmed
        {u"fill:a;width:1cm;fill:b", "b", ""},
        {u"fill:url:#ff0000;foo:a:b", "#ff0000", "foo:b"}, // the last piece is the value
        {u";;fill:red;;::;bogus;stroke", "red", "bogus:"}, // empty pieces dropped, a bare name has no value
        {u"fill:red;fill:", "", ""},
        {u"fill:none", "none", ""}, // only the dash array knows "none" as absence
    };
    for (const auto& row : rows) {
        const ChartStyleValue value(row.text);
        EXPECT_EQ(u8(value.getFill()) + "|" + u8(value.getUnknown()) + "|" + u8(value.getStroke()),
                  std::string(row.fill) + "|" + row.unknown + "|")
            << u8(ChartString(row.text));
    }
    EXPECT_TRUE(ChartStyleValue(u"stroke-dasharray:4 2;stroke-dasharray:none").getStroke_Dasharray().empty());
}

TEST(StyleValue, SettersCopiesAndRereadTextCarryEveryFieldIndependently) {
    ChartStyleValue set(u"fill:red;font-size:9pt");
    set.SetFill(u"blue");
    set.SetFont_Size(ChartString());
    set.SetShadow_DX(u"2px");
    EXPECT_EQ(u8(set.getValue()), "fill:blue;shadow-dx:2px");

    const ChartStyleValue original(ChartString(everyProperty() + ";x-one:1; x-two:2").xc_str());
    const ChartStyleValue reread(original.getValue().xc_str());
    ChartStyleValue copy(original), assigned;
    assigned = original;
    for (const ChartStyleValue* v :
         {&reread, static_cast<const V*>(&copy), static_cast<const V*>(&assigned)}) {
        for (const auto& [name, getter] : kFields)
            EXPECT_EQ(u8((v->*getter)()), u8((original.*getter)())) << name;
        EXPECT_EQ(u8(v->getUnknown()), "x-one:1; x-two:2");
    }
    copy.SetFill(u"changed");
    EXPECT_EQ(u8(original.getFill()), "v2");
}

} // namespace
