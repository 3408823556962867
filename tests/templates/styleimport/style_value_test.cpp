#include <plotaid/ChartStyleValue.h>

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace {

std::string utf8(const ChartString& s) {
    return s.toUTF8();
}

using Getter = const ChartString& (ChartStyleValue::*)() const;

// Every property name with the getter of its field, in the order a style text is written.
const std::vector<std::pair<std::string, Getter>>& namedFields() {
    using V = ChartStyleValue;
    // clang-format off
    static const std::vector<std::pair<std::string, Getter>> fields = {
        {"depth", &V::getDepth}, {"fill-pattern", &V::getFill_Pattern}, {"fill", &V::getFill},
        {"color", &V::getPrimaryColor}, {"color2", &V::getSecondaryColor},
        {"font-family", &V::getFont_Family}, {"font-style", &V::getFont_Style},
        {"font-size", &V::getFont_Size}, {"font-weight", &V::getFont_Weight},
        {"label-location-inside", &V::getLabel_Location_Inside},
        {"label-location-x", &V::getLabel_Location_X}, {"label-location-y", &V::getLabel_Location_Y},
        {"margin", &V::getMargin}, {"max-width", &V::getMax_Width}, {"padding", &V::getPadding},
        {"shadow", &V::getShadow}, {"shadow-dx", &V::getShadow_dx}, {"shadow-dy", &V::getShadow_dy},
        {"shadow-opacity", &V::getShadow_opacity}, {"stroke", &V::getStroke},
        {"stroke-dasharray", &V::getStroke_Dasharray}, {"stroke-linecap", &V::getStroke_Linecap},
        {"stroke-width", &V::getStroke_Width}, {"visibility", &V::getVisibility}, {"width", &V::getWidth},
        {"text-fit", &V::getTextFit}, {"min-font-size", &V::getMinFontSize}, {"size", &V::getSize},
        {"symbol", &V::getSymbol}, {"glyph-sides", &V::getGlyphSides}, {"glyph-angle", &V::getGlyphAngle},
        {"glyph-aspect", &V::getGlyphAspect},
    };
    // clang-format on
    return fields;
}

// Declarations "name:v<i>" for every property, in the order of the field list.
std::string everyProperty() {
    std::string text;
    for (std::size_t i = 0; i < namedFields().size(); ++i)
        text += (i ? ";" : "") + namedFields()[i].first + ":v" + std::to_string(i);
    return text;
}

TEST(StyleValue, EachPropertyNameFillsItsOwnFieldAndIsWrittenInTheFixedOrder) {
    const ChartStyleValue value(ChartString(everyProperty()).xc_str());
    for (std::size_t i = 0; i < namedFields().size(); ++i)
        EXPECT_EQ(utf8((value.*namedFields()[i].second)()), "v" + std::to_string(i))
            << namedFields()[i].first;
    EXPECT_EQ(utf8(value.getUnknown()), "");
    // Whatever order the declarations come in; the unknown part last.
    std::string reversed = "foo:bar";
    for (std::size_t i = namedFields().size(); i-- > 0;)
        reversed += ";" + namedFields()[i].first + ":v" + std::to_string(i);
    EXPECT_EQ(utf8(ChartStyleValue(ChartString(reversed).xc_str()).getValue()), everyProperty() + ";foo:bar");
    for (const ChartStyleValue& empty : {ChartStyleValue(), ChartStyleValue(nullptr)}) {
        for (const auto& [name, getter] : namedFields())
            EXPECT_TRUE((empty.*getter)().empty()) << name;
        EXPECT_TRUE(empty.getValue().empty());
    }
}

TEST(StyleValue, PiecesNamesAndValues) {
    const struct {
        const char16_t* text;
        const char* fill;
        const char* unknown;
    } rows[] = {
        // Names match exactly: a blank or a capital lands in the unknown part.
        {u"fill:red; stroke:blue;Fill:green", "red", " stroke:blue;Fill:green"},
        {u"fill: red ", " red ", ""}, // values are not trimmed
        {u"fill:a;width:1cm;fill:b", "b", ""},
        {u"fill:url:#ff0000;foo:a:b", "#ff0000", "foo:b"}, // the last piece is the value
        {u";;fill:red;;::;bogus;stroke", "red", "bogus:"}, // empty pieces dropped, a bare name has no value
        {u"fill:red;fill:", "", ""},
    };
    for (const auto& row : rows) {
        const ChartStyleValue value(row.text);
        EXPECT_EQ(utf8(value.getFill()), row.fill) << ChartString(row.text).toUTF8();
        EXPECT_EQ(utf8(value.getUnknown()), row.unknown) << ChartString(row.text).toUTF8();
        EXPECT_EQ(utf8(value.getStroke()), "") << ChartString(row.text).toUTF8();
    }
    // Only the dash array knows "none" as absence.
    EXPECT_EQ(utf8(ChartStyleValue(u"fill:none").getFill()), "none");
    EXPECT_TRUE(ChartStyleValue(u"stroke-dasharray:4 2;stroke-dasharray:none").getStroke_Dasharray().empty());
}

TEST(StyleValue, SettersCopiesAndRereadTextCarryEveryFieldIndependently) {
    ChartStyleValue set(u"fill:red;font-size:9pt");
    set.SetFill(u"blue");
    set.SetFont_Size(ChartString());
    set.SetShadow_DX(u"2px");
    EXPECT_EQ(utf8(set.getValue()), "fill:blue;shadow-dx:2px");

    const ChartStyleValue original(ChartString(everyProperty() + ";x-one:1; x-two:2").xc_str());
    const ChartStyleValue reread(original.getValue().xc_str());
    ChartStyleValue copy(original);
    ChartStyleValue assigned;
    assigned = original;
    for (const ChartStyleValue* v : {&reread, static_cast<const ChartStyleValue*>(&copy),
                                     static_cast<const ChartStyleValue*>(&assigned)}) {
        for (const auto& [name, getter] : namedFields())
            EXPECT_EQ(utf8((v->*getter)()), utf8((original.*getter)())) << name;
        EXPECT_EQ(utf8(v->getUnknown()), "x-one:1; x-two:2");
    }
    copy.SetFill(u"changed");
    EXPECT_EQ(utf8(original.getFill()), "v2");
}

} // namespace
