// Template style declarations onto the chart's styles: where each property lands, the source
// guard, and interpolation as smoothing statistics on the elements that use the style.
#include "templates/TemplateSupport.h"

#include <sstream>

using namespace template_test;

namespace {

class StyleImport : public TemplateTest {
protected:
    // A template "style" element from its text.
    const DOMElement* style(const std::string& xml) {
        return instruction("<setStyle>" + xml + "</setStyle>")->getFirstElementChild();
    }
    // Imports template style text into the style `id` of `target`, guarded by `source` if given.
    GrxStyle* import(GrxVisualization& target, const XMLCh* id, const std::string& xml,
                     const GrxVisualization* source) {
        GrxStyle* s = target.getStyleById(id);
        EXPECT_NE(s, nullptr) << u8(id);
        if (s)
            Probe(source, target, nullptr).importStyle(style(xml), *s);
        return s;
    }
};

struct Row {
    const char* chart;
    const char* style;
    const char* xml;
    const char* expect; // "name=value|...", value "-" for absent
    // Null: no source. Otherwise the chart's own definition, first given this style (unless empty)
    // by an unguarded import, as is the target with `targetFirst`.
    const char* source = nullptr;
    const char* targetFirst = "";
};

const char* const kLine = "line-series.xml";
const char* const kBar = "simple-bar.xml";
const char* const kScatter = "scatter.xml";
const char* const kNavyRedBlue = R"(<style value="color:navy;stroke:red;fill:blue"/>)";
const char* const kYellow = R"(<style gradient-color="yellow"/>)";
const char* const kPlain = "";
const char* const kGrayShadow = R"(<style><shadow color="gray" dx="2px"/></style>)";

// clang-format off
const Row kRows[] = {
    // The CSS-like text wins over the attribute, which is copied otherwise.
    {kLine, "tickLabelStyle", R"(<style value="color:#102030;stroke-width:2pt" color="red" color2="blue"
        stroke-width="9pt" padding="1pt" symbol="circle" labelLocationHorizontal="center"/>)",
     "color=#102030|stroke-width=2pt|color2=blue|padding=1pt|symbol=circle|labelLocationHorizontal=center|"
     "font-size=8pt"},
    // The library's own property names write the object model's attributes.
    {kLine, "tickLabelStyle", "<style value=\"label-location-x:left;label-location-y:top;"
        "label-location-inside:1;text-fit:shrink;stroke-linecap:butt;shadow:gray;shadow-dy:2px;size:5pt\"/>",
     "labelLocationHorizontal=left|labelLocationVertical=top|labelInside=1|text-fit=shrink|"
     "stroke-linecap=butt|shadow-color=gray|shadow-dy=2px|size=5pt"},
    {kLine, "gridStyle", R"(<style value="stroke-dasharray:none" stroke-dasharray="4 2"/>)",
     "stroke-dasharray=4 2"},
    // Lines take the stroke as their colour, over a CSS colour too, and never a fill.
    {kLine, "lineStyle", R"(<style value="stroke:red;fill:blue"/>)", "color=red|color2=#3E58AC|fill=-"},
    {kLine, "tickLabelStyle", R"(<style value="color:navy;stroke:olive"/>)", "color=olive"},
    // Filled areas take fill and stroke over a CSS colour; a box's own style and an area's are not
    // among them.
    {kBar, "barStyle", kNavyRedBlue, "color=blue|color2=red"},
    {"boxplot.xml", "boxStyle", kNavyRedBlue, "color=red|color2=black"},
    {"area.xml", "areaStyle", kNavyRedBlue, "color=red|color2=black"},
    // Font weight: CSS "normal" (exactly) is regular, any other word bold; attributes alike.
    {kLine, "tickLabelStyle", R"(<style value="font-weight:600" font-weight="normal"/>)", "font-weight=bold"},
    {kLine, "axisStyle", R"(<style value="font-weight:Normal"/>)", "font-weight=bold"},
    {kLine, "legendTextStyle", R"(<style font-weight="normal"/>)", "font-weight=regular"},
    // Visibility.
    {kLine, "gridStyle", R"(<style value="visibility:hidden"/>)", "visible=false"},
    {kLine, "gridStyle", R"(<style value="visibility:visible" visible="false"/>)", "visible=true"},
    // Font sizes: the CSS size is the preferred part, the attribute gives all three.
    {kLine, "titleStyle", R"(<style value="font-size:16pt"/>)", "font-size=16pt;10pt;14pt"},
    {kLine, "legendTextStyle", R"(<style value="font-size:10pt" font-size="1pt;5pt"/>)",
     "font-size=10pt;5pt"},
    {kLine, "tickLabelStyle", R"(<style value="min-font-size:6pt"/>)", "font-size=8pt;6pt"},
    // Widths go into their parts.
    {kBar, "barStyle", R"(<style value="max-width:95%"/>)", "width=60%;10%;95%"},
    // Glyph sides from 2 to 100 only; a glyph child sets only what it says.
    {kScatter, "legendStyle", R"(<style><glyph sides="1"/></style>)", "glyph-sides=-"},
    {kScatter, "legendStyle", R"(<style><glyph sides="101"/></style>)", "glyph-sides=-"},
    {kScatter, "legendStyle", R"(<style value="glyph-sides:-3"/>)", "glyph-sides=-"},
    {kScatter, "legendStyle", R"(<style><glyph sides="2"/></style>)", "glyph-sides=2"},
    {kScatter, "legendStyle", R"(<style value="glyph-sides:100"/>)", "glyph-sides=100"},
    {kScatter, "legendStyle", R"(<style><glyph sides="4" aspect="0.5"/></style>)",
     "glyph-sides=4|glyph-aspect=0.5|glyph-angle=-|symbol=-|size=-"},
    // Aspect, pattern and opacities must read as what they are.
    {kBar, "barStyle", R"(<style value="fill-pattern:-2;glyph-aspect:-1"/>)", "pattern=-|glyph-aspect=-"},
    {kLine, "frameStyle", R"(<style value="shadow-opacity:2"/>)", "shadow-opacity=-"},
    {kLine, "frameStyle", R"(<style value="shadow-opacity:0.5"/>)", "shadow-opacity=0.5"},
    {kLine, "frameStyle", R"(<style><shadow color="gray" dx="2px" opacity="0.25"/></style>)",
     "shadow-color=gray|shadow-dx=2px|shadow-opacity=0.25"},
    {kBar, "barStyle", R"(<style gradient-method="linear" opacity2="3" opacity="0.7" margin-left="1pt"/>)",
     "gradient-method=linear|opacity2=-|opacity=0.7|margin-left=1pt"},
    // A style without a gradient colour removes the chart's one; the source's stays.
    {kBar, "barStyle", R"(<style value="color:red"/>)", "gradient-color=-", nullptr, kYellow},
    {kBar, "barStyle", R"(<style gradient-color="green"/>)", "gradient-color=yellow", kYellow, kYellow},
    {kBar, "barStyle", R"(<style/>)", "gradient-color=yellow", kYellow, kYellow},

    // Under the source guard, what the chart's own definition sets stays.
    {kLine, "visualizationStyle",
     R"(<style value="color:red;fill:blue;stroke:green;font-size:20pt" padding="9pt"/>)",
     "color=white|color2=green|font-size=9pt|padding=3pt", kPlain},
    // Stroke and fill are guarded by the property they write; attribute-only properties too.
    {kLine, "tickLabelStyle", R"(<style value="stroke:red"/>)", "color=black", kPlain},
    {kLine, "legendStyle", kNavyRedBlue, "color=white|color2=black", kPlain},
    {kLine, "titleStyle", R"(<style textAlignment="right"/>)", "textAlignment=center", kPlain},
    // A source preferred size blocks the size, a source minimum the minimum.
    {kLine, "tickLabelStyle", R"(<style value="font-size:20pt;min-font-size:6pt"/>)", "font-size=8pt;6pt",
     kPlain},
    {kLine, "gridStyle", R"(<style font-size="11pt;9pt;13pt"/>)", "font-size=11pt;7pt;13pt",
     R"(<style value="min-font-size:7pt"/>)", R"(<style value="min-font-size:7pt"/>)"},
    {kBar, "barStyle", R"(<style value="max-width:95%;width:1%"/>)", "width=60%;10%;90%", kPlain},
    {kLine, "frameStyle", R"(<style><shadow color="red" dx="9px"/></style>)",
     "shadow-color=gray|shadow-dx=2px", kGrayShadow, kGrayShadow},
    // An interval glyph sets the symbol even over the source; a plain glyph does not.
    {kBar, "barStyle", R"(<style><intervalGlyph type="cross"/></style>)", "symbol=cross",
     R"(<style symbol="square"/>)"},
    {kBar, "barStyle", R"(<style><glyph type="circle"/></style>)", "symbol=cross",
     R"(<style symbol="square"/>)", R"(<style><intervalGlyph type="cross"/></style>)"},
};
// clang-format on

TEST_F(StyleImport, EachPropertyLandsWhereTheRulesSay) {
    for (const Row& row : kRows) {
        SCOPED_TRACE(std::string(row.chart) + " " + row.style + " " + row.xml);
        const ChartString id(row.style);
        GrxVisualization& chart = sample(row.chart);
        GrxVisualization* source = row.source ? &sample(row.chart) : nullptr;
        if (*row.targetFirst)
            import(chart, id.xc_str(), row.targetFirst, nullptr);
        if (row.source && *row.source)
            import(*source, id.xc_str(), row.source, nullptr);
        const GrxStyle* s = import(chart, id.xc_str(), row.xml, source);
        std::istringstream expect(row.expect);
        for (std::string pair; std::getline(expect, pair, '|');)
            EXPECT_EQ(attr(s, pair.substr(0, pair.find('='))), pair.substr(pair.find('=') + 1)) << pair;
    }
}

TEST_F(StyleImport, TheSourceGuardFollowsTheStylesIdNotItsPlace) {
    const GrxVisualization& source = sample("line-series.xml");
    GrxVisualization& chart = sample("line-series.xml");
    // The source knows no style "style1": a style a template added is free.
    Probe(nullptr, chart, nullptr).addStyle(chart, nullptr).setColor(u"black");
    EXPECT_EQ(attr(import(chart, u"style1", R"(<style value="color:red"/>)", &source), "color"), "red");
    // An id that the source gives to something other than a style guards nothing.
    GrxVisualization& graphOnly = empty();
    graphOnly.addGraph().setId(u"shared");
    GrxStyle& shared = chart.addStyle();
    shared.setId(u"shared");
    shared.setColor(u"black");
    EXPECT_EQ(attr(import(chart, u"shared", R"(<style value="color:red"/>)", &graphOnly), "color"), "red");
}

TEST_F(StyleImport, AStyleWithoutIdCountsAsFilledWhenTheChartHasAnyFilledStyle) {
    const DOMElement* e = style(R"(<style value="stroke:red;fill:blue"/>)");
    GrxVisualization& chart = sample("line-series.xml");
    GrxStyle& anonymous = chart.addStyle();
    Probe(nullptr, chart, nullptr).importStyle(e, anonymous);
    EXPECT_EQ(attr(&anonymous, "color") + " " + attr(&anonymous, "color2"), "blue red");
    GrxVisualization& bare = empty(); // no style anywhere: nothing is filled
    GrxStyle& lone = bare.addStyle();
    Probe(nullptr, bare, nullptr).importStyle(e, lone);
    EXPECT_EQ(attr(&lone, "color") + " " + attr(&lone, "color2"), "red -");
}

TEST_F(StyleImport, AnUnsupportedChildIsReportedAndTheRestStillApplies) {
    TempDir logs;
    ScopedEnv log("DumpChartXMLPath", logs.path());
    GrxVisualization& chart = sample("scatter.xml");
    engine_test::Records records;
    GrxStyle* s =
        import(chart, u"legendStyle", R"(<style><bogus a="1"/><glyph sides="6"/></style>)", nullptr);
    EXPECT_EQ(s->getGlyph_sides(), 6);
    ASSERT_EQ(records.errors().size(), 1u);
    const std::string message = records.errors().front();
    EXPECT_EQ(message.rfind("Unsupported style child encountered (<bogus", 0), 0u) << message;
    EXPECT_NE(message.find("a=\"1\""), std::string::npos) << message;
    EXPECT_EQ(message.back(), ')');
    EXPECT_NE(readAll(logs.file("chartxml_error.log"))
                  .find("backend/chartxml/plotaid/src/templates/basetemplate, line 4672"),
              std::string::npos);
}

// A graph with two lines (one of style "lineStyle", one of "otherLine"), an area of "areaStyle"
// and a path without a style; every element has an id.
GrxVisualization& linesAreasAndPaths(GrxVisualization& vis) {
    vis.addStyle().setId(u"c-o-n-t-a-i-n-er");
    GrrUviza& graph = vis.addGraph();
    const auto styled = [&](CTElementType& e, const char16_t* id, const char16_t* style) {
        e.setId(id);
        vis.addStyle().setId(style);
        e.setStyle(*vis.getStyleById(style));
    };
    styled(graph.addLine(), u"line_a", u"lineStyle");
    styled(graph.addLine(), u"line_b", u"otherLine");
    styled(graph.addArea(), u"area_a", u"areaStyle");
    graph.addPath().setId(u"path_a");
    return vis;
}

class Interpolation : public StyleImport {
protected:
    void import(const char16_t* styleId, const std::string& interpolation,
                const GrxVisualization* source = nullptr) {
        StyleImport::import(chart_, styleId, "<style>" + interpolation + "</style>", source);
    }
    CTElementType& element(const char16_t* id) { return *byId<CTElementType>(chart_, u8(id)); }
    // The smoothing method of the element's first smooth statistic; -1 when it has none.
    int method(const char16_t* id) {
        const std::vector<GrxSmoothStatistic*> smooths = element(id).getSmoothStatistics();
        return smooths.empty() ? -1 : smooths.front()->getMethod();
    }
    GrxVisualization& chart_ = linesAreasAndPaths(empty());
};

TEST_F(Interpolation, MatchingLinesAndEveryAreaAndPathShareOneStatisticOfTheChosenMethod) {
    import(u"lineStyle", R"(<interpolation type="step" pointPosition="right"/>)");
    EXPECT_EQ(method(u"line_a"), 14);
    EXPECT_EQ(method(u"line_b"), -1);
    EXPECT_EQ(method(u"area_a"), 14);
    EXPECT_EQ(method(u"path_a"), 14);
    EXPECT_FALSE(element(u"line_b").isShowDiscontinuityPresent());
    // The container style matches every line.
    import(u"c-o-n-t-a-i-n-er", R"(<interpolation type="step" pointPosition="left"/>)");
    EXPECT_EQ(method(u"line_b"), 13);
    const struct {
        const char* interpolation;
        int method;
        bool discontinuity;
    } rows[] = {{R"(<interpolation type="jump" pointPosition="left"/>)", 13, true},
                {R"(<interpolation type="step"/>)", 15, false},
                {R"(<interpolation type="jump" pointPosition="right"/>)", 14, true},
                {R"(<interpolation type="straight" pointPosition="left"/>)", 0, false}};
    for (const auto& row : rows) {
        import(u"lineStyle", row.interpolation);
        EXPECT_EQ(method(u"line_a"), row.method) << row.interpolation;
        EXPECT_EQ(element(u"line_a").getShowDiscontinuity(), row.discontinuity) << row.interpolation;
    }
    EXPECT_EQ(element(u"area_a").getSmoothStatistics().size(), 1u);
    // Written so that it reads back.
    const auto* line = byId<CTElementType>(parse(chart_.AsUTF8()), "line_a");
    ASSERT_NE(line, nullptr);
    ASSERT_EQ(line->getSmoothStatistics().size(), 1u);
    EXPECT_EQ(line->getSmoothStatistics().front()->getMethod(), 0);
}

TEST_F(Interpolation, WithoutATypeNothingIsSmoothedButElementsGetStyles) {
    import(u"lineStyle", R"(<interpolation pointPosition="left"/>)");
    for (const char16_t* id : {u"line_a", u"area_a", u"path_a"})
        EXPECT_EQ(method(id), -1) << u8(id);
    // The path had no style; it has one of the template's now, inside the container.
    GrxStyle* added = element(u"path_a").getStyle();
    ASSERT_NE(added, nullptr);
    EXPECT_EQ(u8(added->getId()), "style1");
    EXPECT_EQ(added->getImplementation()->getParentNode(),
              chart_.getStyleById(u"c-o-n-t-a-i-n-er")->getImplementation());
    import(u"lineStyle", R"(<interpolation/>)");
    EXPECT_EQ(element(u"path_a").getStyle(), added);
}

TEST_F(Interpolation, MissingValuesOnlyWhereTheSourceHoldsTheElementWithNoBreakRepresentation) {
    // No source, a source without the element, or one with a representation of its own: nothing.
    const GrxVisualization& own = linesAreasAndPaths(empty());
    byId<CTElementType>(own, "line_a")->setBreakRepresentation(2);
    const GrxVisualization* sources[] = {nullptr, &empty(), &own};
    for (const GrxVisualization* source : sources) {
        import(u"lineStyle", R"(<interpolation missingRepresentation="gap"/>)", source);
        EXPECT_FALSE(element(u"line_a").isBreakRepresentationPresent());
    }
    const GrxVisualization& source = linesAreasAndPaths(empty());
    import(u"lineStyle", R"(<interpolation missingRepresentation="wings"/>)", &source);
    EXPECT_EQ(u8(element(u"line_a").GetAttribute(u"breakRepresentation")), "wings");
    EXPECT_FALSE(element(u"line_b").isBreakRepresentationPresent()); // not matching
    EXPECT_FALSE(element(u"area_a").isBreakRepresentationPresent());
    import(u"c-o-n-t-a-i-n-er", R"(<interpolation missingRepresentation="interpolated"/>)", &source);
    for (const char16_t* id : {u"line_a", u"line_b", u"area_a"})
        EXPECT_EQ(element(id).getBreakRepresentation(), 2) << u8(id);
    import(u"lineStyle", R"(<interpolation missingRepresentation="gap"/>)", &source);
    import(u"lineStyle", R"(<interpolation missingRepresentation="dots"/>)", &source);
    EXPECT_EQ(element(u"line_a").getBreakRepresentation(), 1);
}

} // namespace
