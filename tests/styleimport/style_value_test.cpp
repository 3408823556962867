#include <plotaid/ChartStyleValue.h>

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace {

std::string utf8(const ChartString& s) {
    return s.toUTF8();
}

ChartStyleValue parsed(const char16_t* text) {
    return ChartStyleValue(text);
}

using Getter = const ChartString& (ChartStyleValue::*)() const;

// Every property name with the getter of its field.
const std::vector<std::pair<std::string, Getter>>& namedFields() {
    static const std::vector<std::pair<std::string, Getter>> fields = {
        {"depth", &ChartStyleValue::getDepth},
        {"fill-pattern", &ChartStyleValue::getFill_Pattern},
        {"fill", &ChartStyleValue::getFill},
        {"font-family", &ChartStyleValue::getFont_Family},
        {"font-size", &ChartStyleValue::getFont_Size},
        {"font-style", &ChartStyleValue::getFont_Style},
        {"font-weight", &ChartStyleValue::getFont_Weight},
        {"glyph-angle", &ChartStyleValue::getGlyphAngle},
        {"glyph-aspect", &ChartStyleValue::getGlyphAspect},
        {"glyph-sides", &ChartStyleValue::getGlyphSides},
        {"label-location-inside", &ChartStyleValue::getLabel_Location_Inside},
        {"label-location-x", &ChartStyleValue::getLabel_Location_X},
        {"label-location-y", &ChartStyleValue::getLabel_Location_Y},
        {"margin", &ChartStyleValue::getMargin},
        {"max-width", &ChartStyleValue::getMax_Width},
        {"min-font-size", &ChartStyleValue::getMinFontSize},
        {"padding", &ChartStyleValue::getPadding},
        {"color", &ChartStyleValue::getPrimaryColor},
        {"color2", &ChartStyleValue::getSecondaryColor},
        {"shadow", &ChartStyleValue::getShadow},
        {"shadow-dx", &ChartStyleValue::getShadow_dx},
        {"shadow-dy", &ChartStyleValue::getShadow_dy},
        {"shadow-opacity", &ChartStyleValue::getShadow_opacity},
        {"size", &ChartStyleValue::getSize},
        {"stroke", &ChartStyleValue::getStroke},
        {"stroke-dasharray", &ChartStyleValue::getStroke_Dasharray},
        {"stroke-linecap", &ChartStyleValue::getStroke_Linecap},
        {"symbol", &ChartStyleValue::getSymbol},
        {"text-fit", &ChartStyleValue::getTextFit},
        {"stroke-width", &ChartStyleValue::getStroke_Width},
        {"visibility", &ChartStyleValue::getVisibility},
        {"width", &ChartStyleValue::getWidth},
    };
    return fields;
}

// Declarations "name:v<i>" for every property, in the order of the field list.
std::string everyProperty() {
    std::string text;
    for (std::size_t i = 0; i < namedFields().size(); ++i)
        text += (i ? ";" : "") + namedFields()[i].first + ":v" + std::to_string(i);
    return text;
}

TEST(StyleValueParsing, EachPropertyNameFillsItsOwnFieldAndNoOther) {
    const ChartStyleValue value(ChartString(everyProperty()).xc_str());
    for (std::size_t i = 0; i < namedFields().size(); ++i)
        EXPECT_EQ(utf8((value.*namedFields()[i].second)()), "v" + std::to_string(i))
            << namedFields()[i].first;
    EXPECT_EQ(utf8(value.getUnknown()), "");
}

TEST(StyleValueParsing, TheLibrarysOwnNamesAreItsConstants) {
    EXPECT_EQ(utf8(ChartStyleValue::_fill_pattern), "fill-pattern");
    EXPECT_EQ(utf8(ChartStyleValue::_label_location_inside), "label-location-inside");
    EXPECT_EQ(utf8(ChartStyleValue::_label_location_x), "label-location-x");
    EXPECT_EQ(utf8(ChartStyleValue::_label_location_y), "label-location-y");
    EXPECT_EQ(utf8(ChartStyleValue::_max_width), "max-width");
    EXPECT_EQ(utf8(ChartStyleValue::_min_font_size), "min-font-size");
    EXPECT_EQ(utf8(ChartStyleValue::_visibility), "visibility");
}

TEST(StyleValueParsing, NamesMatchExactlySoABlankOrCapitalLandsInUnknown) {
    const ChartStyleValue value = parsed(u"fill:red; stroke:blue;Fill:green");
    EXPECT_EQ(utf8(value.getFill()), "red");
    EXPECT_EQ(utf8(value.getStroke()), "");
    EXPECT_EQ(utf8(value.getUnknown()), " stroke:blue;Fill:green");
}

TEST(StyleValueParsing, ValuesAreNotTrimmed) {
    EXPECT_EQ(utf8(parsed(u"fill: red ").getFill()), " red ");
}

TEST(StyleValueParsing, DashArrayNoneLeavesTheFieldEmpty) {
    EXPECT_EQ(utf8(parsed(u"stroke-dasharray:4 2").getStroke_Dasharray()), "4 2");
    EXPECT_TRUE(parsed(u"stroke-dasharray:4 2;stroke-dasharray:none").getStroke_Dasharray().empty());
    // Only the dash array knows "none" as absence.
    EXPECT_EQ(utf8(parsed(u"fill:none").getFill()), "none");
}

TEST(StyleValueParsing, TheLastOfARepeatedPropertyWins) {
    const ChartStyleValue value = parsed(u"color:red;width:1cm;color:blue");
    EXPECT_EQ(utf8(value.getPrimaryColor()), "blue");
    EXPECT_EQ(utf8(value.getWidth()), "1cm");
}

TEST(StyleValueParsing, WithTwoColonsTheLastPieceIsTheValue) {
    const ChartStyleValue value = parsed(u"fill:url:#ff0000;foo:a:b");
    EXPECT_EQ(utf8(value.getFill()), "#ff0000");
    EXPECT_EQ(utf8(value.getUnknown()), "foo:b");
}

TEST(StyleValueParsing, EmptyPiecesAreDroppedAndABareNameHasNoValue) {
    const ChartStyleValue value = parsed(u";;fill:red;;::;bogus;stroke");
    EXPECT_EQ(utf8(value.getFill()), "red");
    EXPECT_EQ(utf8(value.getStroke()), "");
    EXPECT_EQ(utf8(value.getUnknown()), "bogus:");
    // An empty value after the colon is no value either.
    EXPECT_EQ(utf8(parsed(u"fill:red;fill:").getFill()), "");
}

TEST(StyleValueParsing, NullOrEmptyTextGivesAllFieldsEmpty) {
    for (const ChartStyleValue& value : {ChartStyleValue(), ChartStyleValue(nullptr), parsed(u"")}) {
        for (const auto& [name, getter] : namedFields())
            EXPECT_TRUE((value.*getter)().empty()) << name;
        EXPECT_TRUE(value.getUnknown().empty());
        EXPECT_TRUE(value.getValue().empty());
    }
}

TEST(StyleValueWriting, KnownFieldsFirstUnknownLastWithoutATrailingSeparator) {
    EXPECT_EQ(utf8(parsed(u"foo:bar;fill:red").getValue()), "fill:red;foo:bar");
    EXPECT_EQ(utf8(parsed(u"foo:bar").getValue()), "foo:bar");
    EXPECT_EQ(utf8(parsed(u"fill:red").getValue()), "fill:red");
}

TEST(StyleValueWriting, FieldsComeInTheirFixedOrder) {
    const ChartStyleValue value(ChartString(everyProperty()).xc_str());
    const std::vector<std::string> order = {"depth",
                                            "fill-pattern",
                                            "fill",
                                            "color",
                                            "color2",
                                            "font-family",
                                            "font-style",
                                            "font-size",
                                            "font-weight",
                                            "label-location-inside",
                                            "label-location-x",
                                            "label-location-y",
                                            "margin",
                                            "max-width",
                                            "padding",
                                            "shadow",
                                            "shadow-dx",
                                            "shadow-dy",
                                            "shadow-opacity",
                                            "stroke",
                                            "stroke-dasharray",
                                            "stroke-linecap",
                                            "stroke-width",
                                            "visibility",
                                            "width",
                                            "text-fit",
                                            "min-font-size",
                                            "size",
                                            "symbol",
                                            "glyph-sides",
                                            "glyph-angle",
                                            "glyph-aspect"};
    ASSERT_EQ(order.size(), namedFields().size());
    std::string expected;
    for (const std::string& name : order) {
        std::size_t i = 0;
        while (namedFields()[i].first != name)
            ++i;
        expected += (expected.empty() ? "" : ";") + name + ":v" + std::to_string(i);
    }
    EXPECT_EQ(utf8(value.getValue()), expected);
}

TEST(StyleValueWriting, AWrittenTextReadsBackToTheSameFields) {
    const ChartStyleValue first(ChartString(everyProperty() + ";x-one:1; x-two:2").xc_str());
    const ChartStyleValue again(first.getValue().xc_str());
    for (const auto& [name, getter] : namedFields())
        EXPECT_EQ(utf8((again.*getter)()), utf8((first.*getter)())) << name;
    EXPECT_EQ(utf8(again.getUnknown()), "x-one:1; x-two:2");
}

TEST(StyleValueWriting, SettersReplaceWhatWasParsed) {
    ChartStyleValue value = parsed(u"fill:red;font-size:9pt");
    value.SetFill(u"blue");
    value.SetFont_Size(ChartString());
    value.SetMinFontSize(u"6pt");
    value.SetShadow_DX(u"2px");
    EXPECT_EQ(utf8(value.getValue()), "fill:blue;shadow-dx:2px;min-font-size:6pt");
}

TEST(StyleValueCopies, CopiesCarryEveryFieldAndStayIndependent) {
    const ChartStyleValue original(ChartString(everyProperty() + ";odd:1").xc_str());
    ChartStyleValue copy(original);
    ChartStyleValue assigned;
    assigned = original;
    for (const ChartStyleValue* v : {&copy, &assigned}) {
        for (const auto& [name, getter] : namedFields())
            EXPECT_EQ(utf8((v->*getter)()), utf8((original.*getter)())) << name;
        EXPECT_EQ(utf8(v->getUnknown()), "odd:1");
    }
    copy.SetFill(u"changed");
    EXPECT_EQ(utf8(original.getFill()), "v2");
}

} // namespace
