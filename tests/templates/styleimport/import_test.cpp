#include "StyleImportSupport.h"

#include "support/TestSupport.h"

#include <grx/GrxUni.h>

#include <sstream>

using namespace XERCES_CPP_NAMESPACE;
using engine_test::Chart;
using engine_test::EngineTest;
using engine_test::Records;
using styleimport_test::Probe;
using styleimport_test::sample;
using styleimport_test::utf8;

namespace {

// The attribute's text, "-" when absent.
std::string attr(const GrxBaseElement& e, const std::string& name) {
    const ChartString n(name);
    return e.isAttributePresent(n.xc_str()) ? utf8(e.GetAttribute(n.xc_str())) : "-";
}

class StyleImport : public EngineTest {
protected:
    // Imports template style text into the style `id` of `target`, guarded by `source` if given.
    GrxStyle* import(Chart& target, const XMLCh* id, const std::string& style, const Chart* source) {
        GrxStyle* s = target.vis ? target.vis->getStyleById(id) : nullptr;
        const DOMElement* e = elements_.make(style);
        EXPECT_NE(s, nullptr) << utf8(id);
        EXPECT_NE(e, nullptr) << style;
        if (s && e)
            Probe(source ? source->vis.get() : nullptr, *target.vis, nullptr).importStyle(e, *s);
        return s;
    }

    styleimport_test::StyleElements elements_;
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
    // Filled areas (the chart's own, an interval's, a box hinge) take fill and stroke; a box's own
    // style and an area's are not among them.
    {kLine, "visualizationStyle", kNavyRedBlue, "color=blue|color2=red"},
    {kBar, "barStyle", kNavyRedBlue, "color=blue|color2=red"},
    {"boxplot.xml", "hingeStyle", kNavyRedBlue, "color=blue|color2=red"},
    {"boxplot.xml", "boxStyle", kNavyRedBlue, "color=red|color2=black"},
    {"area.xml", "areaStyle", kNavyRedBlue, "color=red|color2=black"},
    // Font weight: CSS "normal" (exactly) is regular, any other word bold; attributes alike.
    {kLine, "titleStyle", R"(<style value="font-weight:normal"/>)", "font-weight=regular"},
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
    {kBar, "barStyle", R"(<style value="width:70%"/>)", "width=70%;10%;90%"},
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
        Chart chart = sample(row.chart);
        Chart source = row.source ? sample(row.chart) : Chart();
        if (*row.targetFirst)
            import(chart, id.xc_str(), row.targetFirst, nullptr);
        if (row.source && *row.source)
            import(source, id.xc_str(), row.source, nullptr);
        const GrxStyle* s = import(chart, id.xc_str(), row.xml, row.source ? &source : nullptr);
        ASSERT_NE(s, nullptr);
        std::istringstream expect(row.expect);
        std::string pair;
        while (std::getline(expect, pair, '|')) {
            const std::string::size_type eq = pair.find('=');
            EXPECT_EQ(attr(*s, pair.substr(0, eq)), pair.substr(eq + 1)) << pair;
        }
    }
}

TEST_F(StyleImport, TheSourceGuardFollowsTheStylesIdNotItsPlace) {
    const Chart source = sample("line-series.xml");
    Chart chart = sample("line-series.xml");
    // The source knows no style "style1": a style a template added is free.
    Probe(nullptr, *chart.vis, nullptr).addStyle(*chart.vis, nullptr).setColor(u"black");
    EXPECT_EQ(attr(*import(chart, u"style1", R"(<style value="color:red"/>)", &source), "color"), "red");
    // An id that the source gives to something other than a style guards nothing.
    Chart graphOnly = Chart::empty();
    graphOnly.vis->addGraph().setId(u"shared");
    GrxStyle& shared = chart.vis->addStyle();
    shared.setId(u"shared");
    shared.setColor(u"black");
    EXPECT_EQ(attr(*import(chart, u"shared", R"(<style value="color:red"/>)", &graphOnly), "color"), "red");
}

TEST_F(StyleImport, AStyleWithoutIdCountsAsFilledWhenTheChartHasAnyFilledStyle) {
    const DOMElement* e = elements_.make(R"(<style value="stroke:red;fill:blue"/>)");
    ASSERT_NE(e, nullptr);
    Chart chart = sample("line-series.xml");
    GrxStyle& anonymous = chart.vis->addStyle();
    Probe(nullptr, *chart.vis, nullptr).importStyle(e, anonymous);
    EXPECT_EQ(attr(anonymous, "color"), "blue");
    EXPECT_EQ(attr(anonymous, "color2"), "red");

    Chart bare = Chart::empty(); // no style anywhere: nothing is filled
    GrxStyle& lone = bare.vis->addStyle();
    Probe(nullptr, *bare.vis, nullptr).importStyle(e, lone);
    EXPECT_EQ(attr(lone, "color"), "red");
    EXPECT_EQ(attr(lone, "color2"), "-");
}

TEST_F(StyleImport, AnUnsupportedChildIsReportedAndTheRestStillApplies) {
    TempDir logs;
    ScopedEnv log("DumpChartXMLPath", logs.path());
    Chart chart = sample("scatter.xml");
    Records records;
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

TEST_F(StyleImport, ImportingTwiceGivesTheSameChartAsOnce) {
    const std::string style =
        "<style value=\"fill:#112233;stroke:#445566;font-size:11pt;min-font-size:7pt;font-weight:normal;"
        "max-width:80%;width:50%;visibility:visible;stroke-dasharray:4 2;odd:1\""
        R"( font-size="1pt;2pt;3pt" gradient-method="linear" margin-top="1pt">
             <glyph sides="5" angle="10"/><shadow color="gray" dx="1px"/>
             <interpolation type="step" pointPosition="right" missingRepresentation="gap"/>
           </style>)";
    for (const bool withSource : {false, true}) {
        for (const char* name : {"line-series.xml", "boxplot.xml"}) {
            SCOPED_TRACE(std::string(name) + (withSource ? " with source" : ""));
            const Chart source = sample(name);
            Chart once = sample(name);
            Chart twice = sample(name);
            for (const char16_t* id : {u"lineStyle", u"hingeStyle", u"visualizationStyle"}) {
                if (!once.vis->getStyleById(id))
                    continue;
                for (int i = 0; i < 3; ++i)
                    import(i ? twice : once, id, style, withSource ? &source : nullptr);
            }
            EXPECT_NE(once.vis->AsUTF8(), source.vis->AsUTF8());
            EXPECT_EQ(twice.vis->AsUTF8(), once.vis->AsUTF8());
        }
    }
}

} // namespace
