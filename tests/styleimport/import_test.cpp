#include "StyleImportSupport.h"

#include "support/TestSupport.h"

#include <plotaid/ChartErrorHandler.h>

#include <grx/GrxUni.h>

using namespace XERCES_CPP_NAMESPACE;
using engine_test::Chart;
using engine_test::EngineTest;
using engine_test::Records;
using styleimport_test::Probe;
using styleimport_test::sample;
using styleimport_test::utf8;

namespace {

class StyleImport : public EngineTest {
protected:
    // Imports `style` (template text) into the style `id` of `target`, with `source` as the
    // chart's own definition; returns the style.
    GrxStyle& import(Chart& target, const char16_t* id, const std::string& style,
                     const Chart* source = nullptr) {
        GrxStyle* s = target.vis->getStyleById(id);
        EXPECT_NE(s, nullptr) << utf8(id);
        const DOMElement* e = elements_.make(style);
        EXPECT_NE(e, nullptr) << style;
        if (s && e)
            Probe(source ? source->vis.get() : nullptr, *target.vis, nullptr).importStyle(e, *s);
        return s ? *s : target.vis->addStyle();
    }
    static std::string attr(const GrxBaseElement& e, const char16_t* name) {
        return utf8(e.GetAttribute(name));
    }

    styleimport_test::StyleElements elements_;
};

TEST_F(StyleImport, TheCssLikeTextWinsOverTheAttributeWhichIsCopiedOtherwise) {
    Chart chart = sample("line-series.xml");
    GrxStyle& s = import(chart, u"tickLabelStyle",
                         R"(<style value="color:#102030;stroke-width:2pt" color="red" color2="blue"
                                   stroke-width="9pt" padding="1pt" margin="2pt" symbol="circle" depth="3"
                                   font-family="Serif" labelLocationHorizontal="center"/>)");
    EXPECT_EQ(attr(s, u"color"), "#102030");
    EXPECT_EQ(attr(s, u"stroke-width"), "2pt");
    EXPECT_EQ(attr(s, u"color2"), "blue");
    EXPECT_EQ(attr(s, u"padding"), "1pt");
    EXPECT_EQ(attr(s, u"margin"), "2pt");
    EXPECT_EQ(attr(s, u"symbol"), "circle");
    EXPECT_EQ(attr(s, u"depth"), "3");
    EXPECT_EQ(attr(s, u"font-family"), "Serif");
    EXPECT_EQ(attr(s, u"labelLocationHorizontal"), "center");
    EXPECT_EQ(attr(s, u"font-size"), "8pt"); // given by neither: untouched
}

TEST_F(StyleImport, LibraryOwnNamesWriteTheObjectModelsAttributes) {
    Chart chart = sample("line-series.xml");
    GrxStyle& s = import(chart, u"tickLabelStyle",
                         "<style value=\"label-location-x:left;label-location-y:top;label-location-inside:1;"
                         "text-fit:shrink;font-style:italic;stroke-linecap:butt;glyph-angle:45;"
                         "shadow:gray;shadow-dx:1px;shadow-dy:2px;size:5pt\"/>");
    EXPECT_EQ(attr(s, u"labelLocationHorizontal"), "left");
    EXPECT_EQ(attr(s, u"labelLocationVertical"), "top");
    EXPECT_EQ(attr(s, u"labelInside"), "1");
    EXPECT_EQ(attr(s, u"text-fit"), "shrink");
    EXPECT_EQ(attr(s, u"font-style"), "italic");
    EXPECT_EQ(attr(s, u"stroke-linecap"), "butt");
    EXPECT_EQ(attr(s, u"glyph-angle"), "45");
    EXPECT_EQ(attr(s, u"shadow-color"), "gray");
    EXPECT_EQ(attr(s, u"shadow-dx"), "1px");
    EXPECT_EQ(attr(s, u"shadow-dy"), "2px");
    EXPECT_EQ(attr(s, u"size"), "5pt");
}

TEST_F(StyleImport, ADashArrayOfNoneLetsTheAttributeThrough) {
    Chart chart = sample("line-series.xml");
    EXPECT_EQ(
        attr(import(chart, u"gridStyle", R"(<style value="stroke-dasharray:none" stroke-dasharray="4 2"/>)"),
             u"stroke-dasharray"),
        "4 2");
    EXPECT_EQ(
        attr(import(chart, u"axisStyle", R"(<style value="stroke-dasharray:6 1" stroke-dasharray="4 2"/>)"),
             u"stroke-dasharray"),
        "6 1");
}

TEST_F(StyleImport, SourceGuardKeepsWhatTheChartsOwnDefinitionSets) {
    const Chart source = sample("line-series.xml");
    Chart chart = sample("line-series.xml");
    const std::string style =
        R"(<style value="color:red;fill:blue;stroke:green;font-size:20pt" padding="9pt"/>)";
    GrxStyle& s = import(chart, u"visualizationStyle", style, &source);
    EXPECT_EQ(attr(s, u"color"), "white");   // neither row 1 nor the fill
    EXPECT_EQ(attr(s, u"color2"), "green");  // the source has no colour 2
    EXPECT_EQ(attr(s, u"font-size"), "9pt"); // the source has a preferred size
    EXPECT_EQ(attr(s, u"padding"), "3pt");

    // A chart without a source is restyled freely: for a filled area the fill beats "color".
    Chart free = sample("line-series.xml");
    GrxStyle& f = import(free, u"visualizationStyle", style);
    EXPECT_EQ(attr(f, u"color"), "blue");
    EXPECT_EQ(attr(f, u"color2"), "green");
    EXPECT_EQ(attr(f, u"font-size"), "20pt");
    EXPECT_EQ(attr(f, u"padding"), "9pt");
}

TEST_F(StyleImport, SourceGuardFollowsTheStylesIdNotItsPlace) {
    // The source knows no style "style1": a style a template added is free.
    const Chart source = sample("line-series.xml");
    Chart chart = sample("line-series.xml");
    Probe(nullptr, *chart.vis, nullptr).addStyle(*chart.vis, nullptr).setColor(u"black");
    EXPECT_EQ(attr(import(chart, u"style1", R"(<style value="color:red"/>)", &source), u"color"), "red");
    // An id that the source gives to something other than a style guards nothing.
    Chart graphOnly = Chart::empty();
    GrrUviza& g = graphOnly.vis->addGraph();
    g.setId(u"shared");
    GrxStyle& shared = chart.vis->addStyle();
    shared.setId(u"shared");
    shared.setColor(u"black");
    EXPECT_EQ(attr(import(chart, u"shared", R"(<style value="color:red"/>)", &graphOnly), u"color"), "red");
}

TEST_F(StyleImport, LineStylesTakeTheStrokeAsColourAndIgnoreTheFill) {
    Chart chart = sample("line-series.xml");
    GrxStyle& s = import(chart, u"lineStyle", R"(<style value="stroke:red;fill:blue"/>)");
    EXPECT_EQ(attr(s, u"color"), "red");
    EXPECT_EQ(attr(s, u"color2"), "#3E58AC");
    EXPECT_FALSE(s.isAttributePresent(u"fill"));
    // The stroke also replaces a CSS-like colour of the same text.
    EXPECT_EQ(attr(import(chart, u"tickLabelStyle", R"(<style value="color:navy;stroke:olive"/>)"), u"color"),
              "olive");
}

TEST_F(StyleImport, FilledAreasTakeTheFillAsColourAndTheStrokeAsColour2) {
    struct Case {
        const char* chart;
        const char16_t* style;
    };
    // The chart's own style, an interval's, a graph's cell, a box hinge, a legend.
    for (const Case& c : {Case{"line-series.xml", u"visualizationStyle"}, Case{"simple-bar.xml", u"barStyle"},
                          Case{"area.xml", u"graphStyle"}, Case{"boxplot.xml", u"hingeStyle"},
                          Case{"scatter.xml", u"legendStyle"}, Case{"pie.xml", u"sliceStyle"}}) {
        Chart chart = sample(c.chart);
        ASSERT_TRUE(chart.vis) << c.chart;
        GrxStyle& s = import(chart, c.style, R"(<style value="color:navy;stroke:red;fill:blue"/>)");
        EXPECT_EQ(attr(s, u"color"), "blue") << c.chart << " " << utf8(c.style);
        EXPECT_EQ(attr(s, u"color2"), "red") << c.chart << " " << utf8(c.style);
    }
    // A box's own style and an area's are not among them.
    for (const Case& c : {Case{"boxplot.xml", u"boxStyle"}, Case{"area.xml", u"areaStyle"}}) {
        Chart chart = sample(c.chart);
        GrxStyle& s = import(chart, c.style, R"(<style value="stroke:red;fill:blue"/>)");
        EXPECT_EQ(attr(s, u"color"), "red") << c.chart;
        EXPECT_EQ(attr(s, u"color2"), "black") << c.chart;
    }
}

TEST_F(StyleImport, AStyleWithoutIdCountsAsFilledWhenTheChartHasAnyFilledStyle) {
    Chart chart = sample("line-series.xml");
    GrxStyle& anonymous = chart.vis->addStyle();
    const DOMElement* e = elements_.make(R"(<style value="stroke:red;fill:blue"/>)");
    ASSERT_NE(e, nullptr);
    Probe(nullptr, *chart.vis, nullptr).importStyle(e, anonymous);
    EXPECT_EQ(attr(anonymous, u"color"), "blue");
    EXPECT_EQ(attr(anonymous, u"color2"), "red");

    Chart bare = Chart::empty(); // no style anywhere: nothing is filled
    GrxStyle& lone = bare.vis->addStyle();
    Probe(nullptr, *bare.vis, nullptr).importStyle(e, lone);
    EXPECT_EQ(attr(lone, u"color"), "red");
    EXPECT_FALSE(lone.isColor2Present());
}

TEST_F(StyleImport, StrokeAndFillAreGuardedByThePropertyTheyWrite) {
    const Chart source = sample("line-series.xml");
    // tickLabelStyle is a line-like style with a colour of its own in the source.
    Chart chart = sample("line-series.xml");
    GrxStyle& s = import(chart, u"tickLabelStyle", R"(<style value="stroke:red"/>)", &source);
    EXPECT_EQ(attr(s, u"color"), "black");
    // legendStyle is filled; the source sets both colours.
    GrxStyle& l = import(chart, u"legendStyle", R"(<style value="stroke:red;fill:blue"/>)", &source);
    EXPECT_EQ(attr(l, u"color"), "white");
    EXPECT_EQ(attr(l, u"color2"), "black");
}

TEST_F(StyleImport, FontWeightNormalIsRegularAndAnyOtherWordBold) {
    Chart chart = sample("line-series.xml");
    GrxStyle& a = import(chart, u"titleStyle", R"(<style value="font-weight:normal"/>)");
    EXPECT_EQ(a.getFontWeight(), 1);
    EXPECT_EQ(attr(a, u"font-weight"), "regular");
    GrxStyle& b =
        import(chart, u"tickLabelStyle", R"(<style value="font-weight:600" font-weight="normal"/>)");
    EXPECT_EQ(b.getFontWeight(), 2);
    EXPECT_EQ(attr(b, u"font-weight"), "bold");
    GrxStyle& c = import(chart, u"legendTextStyle", R"(<style font-weight="normal"/>)");
    EXPECT_EQ(attr(c, u"font-weight"), "regular");
    GrxStyle& d = import(chart, u"footnoteStyle", R"(<style font-weight="bold"/>)");
    EXPECT_EQ(d.getFontWeight(), 2);
    // The CSS word is compared exactly.
    EXPECT_EQ(import(chart, u"axisStyle", R"(<style value="font-weight:Normal"/>)").getFontWeight(), 2);
}

TEST_F(StyleImport, HiddenAndFalseMakeAStyleInvisible) {
    Chart chart = sample("line-series.xml");
    for (const char* word : {"hidden", "false"}) {
        GrxStyle& s =
            import(chart, u"gridStyle", std::string(R"(<style value="visibility:)") + word + R"("/>)");
        EXPECT_FALSE(s.getVisible()) << word;
        EXPECT_EQ(attr(s, u"visible"), "false") << word;
    }
    GrxStyle& shown = import(chart, u"gridStyle", R"(<style value="visibility:visible" visible="false"/>)");
    EXPECT_TRUE(shown.getVisible());
    EXPECT_EQ(attr(import(chart, u"axisStyle", R"(<style visible="false"/>)"), u"visible"), "false");
}

TEST_F(StyleImport, FontSizesFollowPreferredMinimumAndMaximum) {
    Chart chart = sample("line-series.xml");
    // The CSS-like size is the preferred part only.
    EXPECT_EQ(attr(import(chart, u"titleStyle", R"(<style value="font-size:16pt"/>)"), u"font-size"),
              "16pt;10pt;14pt");
    // The attribute gives all three parts.
    EXPECT_EQ(attr(import(chart, u"axisLabelStyle", R"(<style font-size="11pt;8pt;13pt"/>)"), u"font-size"),
              "11pt;8pt;13pt");
    // A minimum from the CSS-like text, or from the attribute's minimum part.
    EXPECT_EQ(attr(import(chart, u"tickLabelStyle", R"(<style value="min-font-size:6pt"/>)"), u"font-size"),
              "8pt;6pt");
    EXPECT_EQ(
        attr(import(chart, u"legendTextStyle", R"(<style value="font-size:10pt" font-size="1pt;5pt"/>)"),
             u"font-size"),
        "10pt;5pt");

    // Guards: a source preferred size blocks the size, a source minimum the minimum.
    const Chart source = sample("line-series.xml");
    Chart guarded = sample("line-series.xml");
    EXPECT_EQ(attr(import(guarded, u"tickLabelStyle", R"(<style value="font-size:20pt;min-font-size:6pt"/>)",
                          &source),
                   u"font-size"),
              "8pt;6pt");
    EXPECT_EQ(attr(import(guarded, u"axisLabelStyle",
                          R"(<style value="min-font-size:1pt" font-size="2pt;3pt;4pt"/>)", &source),
                   u"font-size"),
              "9pt;7pt;10pt");
}

TEST_F(StyleImport, AnAttributeFontSizeKeepsAMinimumTheSourceSets) {
    Chart source = sample("line-series.xml");
    source.vis->getStyleById(u"gridStyle")->setFontSize(nullptr, u"7pt", nullptr);
    Chart chart = sample("line-series.xml");
    chart.vis->getStyleById(u"gridStyle")->setFontSize(nullptr, u"7pt", nullptr);
    EXPECT_EQ(
        attr(import(chart, u"gridStyle", R"(<style font-size="11pt;9pt;13pt"/>)", &source), u"font-size"),
        "11pt;7pt;13pt");
}

TEST_F(StyleImport, WidthsGoIntoTheirPartsUnlessTheSourceHasASize) {
    Chart chart = sample("simple-bar.xml");
    EXPECT_EQ(attr(import(chart, u"barStyle", R"(<style value="max-width:95%"/>)"), u"width"), "60%;10%;95%");
    EXPECT_EQ(attr(import(chart, u"barStyle", R"(<style value="width:70%"/>)"), u"width"), "70%;10%;95%");
    EXPECT_EQ(attr(import(chart, u"legendStyle", R"(<style width="3cm"/>)"), u"width"), "3cm");
    const Chart source = sample("simple-bar.xml");
    Chart guarded = sample("simple-bar.xml");
    EXPECT_EQ(
        attr(import(guarded, u"barStyle", R"(<style value="max-width:95%;width:1%"/>)", &source), u"width"),
        "60%;10%;90%");
}

TEST_F(StyleImport, GlyphSidesOutsideTwoToAHundredAreIgnored) {
    Chart chart = sample("scatter.xml");
    GrxStyle& s = *chart.vis->getStyleById(u"legendStyle");
    s.setGlyph_sides(7);
    for (const char* sides : {"1", "101", "0", "-3"}) {
        import(chart, u"legendStyle", std::string(R"(<style><glyph sides=")") + sides + R"("/></style>)");
        EXPECT_EQ(s.getGlyph_sides(), 7) << sides;
        import(chart, u"legendStyle", std::string(R"(<style value="glyph-sides:)") + sides + R"("/>)");
        EXPECT_EQ(s.getGlyph_sides(), 7) << sides;
    }
    import(chart, u"legendStyle", R"(<style><glyph sides="2"/></style>)");
    EXPECT_EQ(s.getGlyph_sides(), 2);
    import(chart, u"legendStyle", R"(<style><glyph sides="100"/></style>)");
    EXPECT_EQ(s.getGlyph_sides(), 100);
    import(chart, u"legendStyle", R"(<style value="glyph-sides:5"/>)");
    EXPECT_EQ(s.getGlyph_sides(), 5);
}

TEST_F(StyleImport, AGlyphChildSetsOnlyWhatItSays) {
    Chart chart = sample("scatter.xml");
    GrxStyle& s = import(chart, u"legendStyle",
                         R"(<style><glyph angle="30" aspect="0.5" size="6pt" type="diamond"/></style>)");
    EXPECT_DOUBLE_EQ(s.getGlyph_angle(), 30.0);
    EXPECT_DOUBLE_EQ(s.getGlyph_aspect(), 0.5);
    EXPECT_EQ(attr(s, u"size"), "6pt");
    EXPECT_EQ(attr(s, u"symbol"), "diamond");
    import(chart, u"legendStyle", R"(<style><glyph aspect="-1"/></style>)");
    EXPECT_DOUBLE_EQ(s.getGlyph_aspect(), 0.5);
    import(chart, u"legendStyle", R"(<style><glyph sides="4"/></style>)");
    EXPECT_DOUBLE_EQ(s.getGlyph_angle(), 30.0);
    EXPECT_EQ(attr(s, u"symbol"), "diamond");
    EXPECT_EQ(s.getGlyph_sides(), 4);
}

TEST_F(StyleImport, IntervalGlyphSetsTheSymbolEvenOverTheSource) {
    Chart source = sample("simple-bar.xml");
    source.vis->getStyleById(u"barStyle")->setSymbol(u"square");
    Chart chart = sample("simple-bar.xml");
    EXPECT_EQ(attr(import(chart, u"barStyle", R"(<style><intervalGlyph type="cross"/></style>)", &source),
                   u"symbol"),
              "cross");
    EXPECT_EQ(
        attr(import(chart, u"barStyle", R"(<style><glyph type="circle"/></style>)", &source), u"symbol"),
        "cross");
}

TEST_F(StyleImport, ShadowOpacityPassesOnlyWhatReadsAsZeroOrOne) {
    Chart chart = sample("line-series.xml");
    GrxStyle& s = *chart.vis->getStyleById(u"frameStyle");
    for (const char* bad : {"2", "-1"}) {
        import(chart, u"frameStyle", std::string(R"(<style value="shadow-opacity:)") + bad + R"("/>)");
        EXPECT_FALSE(s.isShadow_opacityPresent()) << bad;
    }
    import(chart, u"frameStyle", R"(<style value="shadow-opacity:0.5"/>)");
    EXPECT_EQ(attr(s, u"shadow-opacity"), "0.5");
    import(chart, u"frameStyle", R"(<style shadow-opacity="1"/>)");
    EXPECT_EQ(attr(s, u"shadow-opacity"), "1");
}

TEST_F(StyleImport, AShadowChildSetsColourOffsetsAndOpacity) {
    Chart chart = sample("line-series.xml");
    GrxStyle& s = import(chart, u"frameStyle",
                         R"(<style><shadow color="gray" dx="2px" dy="3px" opacity="0.25"/></style>)");
    EXPECT_EQ(attr(s, u"shadow-color"), "gray");
    EXPECT_EQ(attr(s, u"shadow-dx"), "2px");
    EXPECT_EQ(attr(s, u"shadow-dy"), "3px");
    EXPECT_DOUBLE_EQ(s.getShadow_opacity(), 0.25);
    const Chart source = Chart::parse(chart.vis->AsUTF8());
    Chart again = Chart::parse(chart.vis->AsUTF8());
    GrxStyle& g = import(again, u"frameStyle", R"(<style><shadow color="red" dx="9px"/></style>)", &source);
    EXPECT_EQ(attr(g, u"shadow-color"), "gray");
    EXPECT_EQ(attr(g, u"shadow-dx"), "2px");
}

TEST_F(StyleImport, PatternAndGlyphAspectMustNotBeNegative) {
    Chart chart = sample("simple-bar.xml");
    GrxStyle& s = *chart.vis->getStyleById(u"barStyle");
    import(chart, u"barStyle", R"(<style value="fill-pattern:-2;glyph-aspect:-1"/>)");
    EXPECT_FALSE(s.isPatternPresent());
    EXPECT_FALSE(s.isGlyph_aspectPresent());
    import(chart, u"barStyle", R"(<style value="glyph-aspect:2" pattern="3"/>)");
    EXPECT_EQ(s.getPattern(), 3);
    EXPECT_EQ(attr(s, u"glyph-aspect"), "2");
}

TEST_F(StyleImport, AStyleWithoutGradientColourRemovesTheChartsOne) {
    Chart chart = sample("simple-bar.xml");
    GrxStyle& s = *chart.vis->getStyleById(u"barStyle");
    s.setGradient_color(u"yellow");
    import(chart, u"barStyle", R"(<style value="color:red"/>)");
    EXPECT_FALSE(s.isGradient_colorPresent());
    import(chart, u"barStyle", R"(<style gradient-color="green"/>)");
    EXPECT_EQ(attr(s, u"gradient-color"), "green");

    // Unless the source has one.
    Chart source = sample("simple-bar.xml");
    source.vis->getStyleById(u"barStyle")->setGradient_color(u"yellow");
    Chart guarded = sample("simple-bar.xml");
    guarded.vis->getStyleById(u"barStyle")->setGradient_color(u"yellow");
    EXPECT_EQ(
        attr(import(guarded, u"barStyle", R"(<style gradient-color="green"/>)", &source), u"gradient-color"),
        "yellow");
    EXPECT_EQ(attr(import(guarded, u"barStyle", R"(<style/>)", &source), u"gradient-color"), "yellow");
}

TEST_F(StyleImport, AttributeOnlyPropertiesAreCopiedWithTheirChecks) {
    Chart chart = sample("simple-bar.xml");
    GrxStyle& s = import(chart, u"barStyle",
                         R"(<style gradient-method="linear" gradient-angle="90" gradient-opacity="0.5"
                                   opacity2="3" opacity="0.7" margin-left="1pt" padding-bottom="2pt"
                                   textAlignment="right" maxAttachedTextWidth="20%" stroke-opacity="0.4"/>)");
    EXPECT_EQ(attr(s, u"gradient-method"), "linear");
    EXPECT_EQ(attr(s, u"gradient-angle"), "90");
    EXPECT_EQ(attr(s, u"gradient-opacity"), "0.5");
    EXPECT_FALSE(s.isAttributePresent(u"opacity2"));
    EXPECT_EQ(attr(s, u"opacity"), "0.7");
    EXPECT_EQ(attr(s, u"margin-left"), "1pt");
    EXPECT_EQ(attr(s, u"padding-bottom"), "2pt");
    EXPECT_EQ(attr(s, u"textAlignment"), "right");
    EXPECT_EQ(attr(s, u"maxAttachedTextWidth"), "20%");
    EXPECT_EQ(attr(s, u"stroke-opacity"), "0.4");

    const Chart source = sample("line-series.xml");
    Chart guarded = sample("line-series.xml");
    EXPECT_EQ(
        attr(import(guarded, u"titleStyle", R"(<style textAlignment="right"/>)", &source), u"textAlignment"),
        "center");
}

TEST_F(StyleImport, AnUnsupportedChildIsReportedAndTheRestStillApplies) {
    TempDir logs;
    ScopedEnv log("DumpChartXMLPath", logs.path());
    Chart chart = sample("scatter.xml");
    Records records;
    GrxStyle& s = import(chart, u"legendStyle", R"(<style><bogus a="1"/><glyph sides="6"/></style>)");
    EXPECT_EQ(s.getGlyph_sides(), 6);
    ASSERT_EQ(records.errors().size(), 1u);
    const std::string message = records.errors().front();
    EXPECT_EQ(message.rfind("Unsupported style child encountered (<bogus", 0), 0u) << message;
    EXPECT_NE(message.find("a=\"1\""), std::string::npos) << message;
    EXPECT_EQ(message.back(), ')');
    const std::string logged = readAll(logs.file("chartxml_error.log"));
    EXPECT_NE(logged.find("backend/chartxml/plotaid/src/templates/basetemplate, line 4672"),
              std::string::npos)
        << logged;
}

TEST_F(StyleImport, ANullElementChangesNothing) {
    Chart chart = sample("line-series.xml");
    const std::string before = chart.vis->AsUTF8();
    Probe(nullptr, *chart.vis, nullptr).importStyle(nullptr, *chart.vis->getStyleById(u"lineStyle"));
    EXPECT_EQ(chart.vis->AsUTF8(), before);
}

TEST_F(StyleImport, ImportingTwiceGivesTheSameChartAsOnce) {
    const std::string style =
        "<style value=\"fill:#112233;stroke:#445566;font-size:11pt;min-font-size:7pt;font-weight:normal;"
        "max-width:80%;width:50%;visibility:visible;stroke-dasharray:4 2;odd:1\""
        R"( font-size="1pt;2pt;3pt" gradient-method="linear" margin-top="1pt">
             <glyph sides="5" angle="10"/><shadow color="gray" dx="1px"/>
             <interpolation type="step" pointPosition="right" missingRepresentation="gap"/>
           </style>)";
    for (const bool withSource : {false, true}) {
        for (const char* name : {"line-series.xml", "simple-bar.xml", "area.xml", "boxplot.xml"}) {
            const Chart source = sample(name);
            const Chart* guard = withSource ? &source : nullptr;
            Chart once = sample(name);
            Chart twice = sample(name);
            for (const char16_t* id : {u"lineStyle", u"barStyle", u"areaStyle", u"hingeStyle",
                                       u"visualizationStyle", u"titleStyle"}) {
                if (!once.vis->getStyleById(id))
                    continue;
                import(once, id, style, guard);
                import(twice, id, style, guard);
                import(twice, id, style, guard);
            }
            EXPECT_NE(once.vis->AsUTF8(), source.vis->AsUTF8()) << name;
            EXPECT_EQ(twice.vis->AsUTF8(), once.vis->AsUTF8()) << name << (withSource ? " with source" : "");
        }
    }
}

} // namespace
