// "setStyle" by element type: which elements of which graphs take which declaration.
#include "StyleSupport.h"

using namespace setstyle_test;

namespace {

struct GraphPlan {
    std::string id;
    std::string elements; // element XML; "COORD" stands for this graph's coordinates id
    bool polar = false;
    bool z = false;
    bool clustered = false;
};

std::string graphXml(const GraphPlan& g) {
    std::string coordinates = "c_" + g.id;
    std::string xml = "<graph id=\"" + g.id + "\"><coordinates id=\"" + coordinates + "\">";
    if (g.polar)
        xml += "<polarTransform/>";
    xml += "<dimension id=\"" + g.id + "_x\"" + (g.clustered ? " clusterVariable=\"cluster\"" : "") + "/>";
    xml += "<dimension id=\"" + g.id + "_y\"/>";
    if (g.z)
        xml += "<dimension id=\"" + g.id + "_z\"/>";
    xml += "</coordinates>";
    std::string elements = g.elements;
    for (std::string::size_type at = elements.find("COORD"); at != std::string::npos;
         at = elements.find("COORD", at))
        elements.replace(at, 5, coordinates);
    return xml + elements + "</graph>";
}

// Styles s1 .. s9 (black, each its own) and the graphs.
std::string chartWith(const std::vector<GraphPlan>& graphs, const std::string& extra = std::string()) {
    std::string body = "<sourceVariable id=\"cluster\"/>";
    for (int i = 1; i <= 9; ++i)
        body += "<style id=\"s" + std::to_string(i) + "\" color=\"black\"/>";
    for (const GraphPlan& g : graphs)
        body += graphXml(g);
    return chartOf(body + extra);
}

std::string bar(const std::string& id, const std::string& style, const std::string& more = std::string()) {
    return "<interval id=\"" + id + "\" style=\"" + style + "\" coordinates=\"COORD\"" + more + "/>";
}

using ElementTypes = SetStyleTest;

TEST_F(ElementTypes, OneUnnumberedDeclarationStylesTheBarsOfEveryNonPolarGraph) {
    Chart chart = load(chartWith(
        {{"g1", bar("b1", "s1")}, {"g2", bar("b2", "s2")}, {"g3", bar("b3", "s3"), /*polar=*/true}}));
    const auto before = styleSnapshot(chart);
    EXPECT_TRUE(apply(chart, "<setStyle type=\"bar\"><style color=\"red\"/></setStyle>"));
    EXPECT_EQ(attr(styleById(chart, "s1"), "color"), "red");
    EXPECT_EQ(attr(styleById(chart, "s2"), "color"), "red");
    EXPECT_EQ(attr(styleById(chart, "s3"), "color"), "black");
    EXPECT_EQ(changedStyles(before, styleSnapshot(chart)), (std::vector<std::string>{"s1", "s2"}));
}

TEST_F(ElementTypes, NumberedDeclarationsStyleTheGraphOfTheirNumberOnly) {
    const std::string text =
        chartWith({{"g1", bar("b1", "s1")}, {"g2", bar("b2", "s2")}, {"g3", bar("b3", "s3")}});
    Chart chart = load(text);
    EXPECT_TRUE(apply(chart, "<setStyle type=\"bar\"><style number=\"0\" color=\"red\"/>"
                             "<style number=\"1\" color=\"blue\"/></setStyle>"));
    EXPECT_EQ(attr(styleById(chart, "s1"), "color"), "red");
    EXPECT_EQ(attr(styleById(chart, "s2"), "color"), "blue");
    EXPECT_EQ(attr(styleById(chart, "s3"), "color"), "black");

    // A lone declaration with a number is no longer the one for every graph.
    Chart second = load(text);
    EXPECT_TRUE(apply(second, "<setStyle type=\"bar\"><style number=\"1\" color=\"blue\"/></setStyle>"));
    EXPECT_EQ(attr(styleById(second, "s1"), "color"), "black");
    EXPECT_EQ(attr(styleById(second, "s2"), "color"), "blue");
    EXPECT_EQ(attr(styleById(second, "s3"), "color"), "black");

    // A later declaration of the same number replaces the earlier one.
    Chart third = load(text);
    EXPECT_TRUE(apply(third, "<setStyle type=\"bar\"><style color=\"red\"/><style number=\"0\" "
                             "color=\"green\"/></setStyle>"));
    EXPECT_EQ(attr(styleById(third, "s3"), "color"), "green");
}

TEST_F(ElementTypes, HugeDeclarationNumbersNameNoGraphAndCostNothing) {
    const std::string text = chartWith({{"g1", bar("b1", "s1")}, {"g2", bar("b2", "s2")}});
    for (const char* number : {"4294967295", "-1", "99999999999999"}) {
        Chart chart = load(text);
        EXPECT_TRUE(
            apply(chart, std::string("<setStyle type=\"bar\"><style color=\"red\"/><style number=\"") +
                             number + "\" color=\"blue\"/></setStyle>"));
        // Two declarations: the unnumbered one is graph 0's only.
        EXPECT_EQ(attr(styleById(chart, "s1"), "color"), "red") << number;
        EXPECT_EQ(attr(styleById(chart, "s2"), "color"), "black") << number;
    }
}

TEST_F(ElementTypes, ClusteredAndPlainBarsTakeTheirOwnSubtype) {
    for (const std::string name : {"clustered-bar.xml", "simple-bar.xml"}) {
        const bool clusteredChart = name == "clustered-bar.xml";
        Chart plain = sample(name);
        apply(plain, "<setStyle type=\"bar\"><style color=\"red\"/></setStyle>");
        EXPECT_EQ(attr(styleById(plain, "barStyle"), "color") == "red", !clusteredChart) << name;
        Chart clustered = sample(name);
        apply(clustered, "<setStyle type=\"bar\" subtype=\"clustered\"><style color=\"red\"/></setStyle>");
        EXPECT_EQ(attr(styleById(clustered, "barStyle"), "color") == "red", clusteredChart) << name;
    }
    // Position modifier 7 keeps an unclustered bar out, and only that bar.
    Chart chart = load(chartWith({{"g1", bar("b1", "s1", " positionModifier=\"7\"") + bar("b2", "s2")}}));
    apply(chart, "<setStyle type=\"bar\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(chart, "s1"), "color"), "black");
    EXPECT_EQ(attr(styleById(chart, "s2"), "color"), "red");
    // ... but not a clustered one.
    Chart clustered =
        load(chartWith({{"g1", bar("b1", "s1", " positionModifier=\"7\""), false, false, true}}));
    apply(clustered, "<setStyle type=\"bar\" subtype=\"clustered\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(clustered, "s1"), "color"), "red");
}

TEST_F(ElementTypes, IntervalsDrawnAsLinesAreDropLinesAndErrorBarsNeverBars) {
    const std::string text =
        chartWith({{"g1", bar("b1", "s1")}}, "<style id=\"lineSymbol\" symbol=\"line\" color=\"black\"/>");
    const std::string lined = replaced(text, "style=\"s1\"", "style=\"lineSymbol\"");
    for (const char* type : {"dropline", "errorbar", "bar"}) {
        Chart chart = load(lined);
        apply(chart, std::string("<setStyle type=\"") + type + "\"><style color=\"red\"/></setStyle>");
        EXPECT_EQ(attr(styleById(chart, "lineSymbol"), "color"), std::string(type) == "bar" ? "black" : "red")
            << type;
    }
    // I-beams take error bar styles only.
    for (const char* type : {"errorbar", "dropline", "bar", "range"}) {
        Chart chart = sample("error-bars.xml");
        apply(chart, std::string("<setStyle type=\"") + type + "\"><style color=\"red\"/></setStyle>");
        EXPECT_EQ(attr(styleById(chart, "errorbarStyle"), "color") == "red", std::string(type) == "errorbar")
            << type;
    }
}

TEST_F(ElementTypes, IdsNameTheirIntervalsKind) {
    const std::string text =
        chartWith({{"g1", bar("my_dropdownline", "s1") + bar("an_errorbar", "s2") + bar("plain", "s3")}});
    Chart drop = load(text);
    apply(drop, "<setStyle type=\"dropline\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(drop, "s1"), "color"), "red");
    EXPECT_EQ(attr(styleById(drop, "s2"), "color"), "black");
    EXPECT_EQ(attr(styleById(drop, "s3"), "color"), "black");
    // Under "bar" the named ones go on to the bar rule like any other bar.
    Chart bars = load(text);
    apply(bars, "<setStyle type=\"bar\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(bars, "s1"), "color"), "red");
    EXPECT_EQ(attr(styleById(bars, "s2"), "color"), "red");
    EXPECT_EQ(attr(styleById(bars, "s3"), "color"), "red");
}

TEST_F(ElementTypes, SpecialChartElementsAreNeverStyled) {
    std::string elements;
    const char* ids[] = {"series_1", "my_control", "AIMx",     "biplot1",
                         "centroid", "guide1",     "survival", "triplot"};
    for (int i = 0; i < 8; ++i)
        elements += bar(ids[i], "s" + std::to_string(i + 1));
    elements += bar("ordinary", "s9");
    Chart chart = load(chartWith({{"g1", elements}}));
    const auto before = styleSnapshot(chart);
    apply(chart, "<setStyle type=\"bar\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(changedStyles(before, styleSnapshot(chart)), (std::vector<std::string>{"s9"}));

    // The same for lines.
    Chart lines = load(chartWith({{"g1", "<line id=\"series_line\" style=\"s1\" coordinates=\"COORD\"/>"
                                         "<line id=\"line\" style=\"s2\" coordinates=\"COORD\"/>"}}));
    apply(lines, "<setStyle type=\"line\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(lines, "s1"), "color"), "black");
    EXPECT_EQ(attr(styleById(lines, "s2"), "color"), "red");
}

TEST_F(ElementTypes, PieSlicesTakeTheDeclarationWithTheSizeRuleWrittenBack) {
    Chart chart = sample("pie.xml");
    const std::string body =
        "<setStyle type=\"pie\"><style color=\"red\" size=\"30%\" width=\"50%\"/></setStyle>";
    EXPECT_TRUE(apply(chart, body));
    GrxStyle* slice = styleById(chart, "sliceStyle");
    EXPECT_EQ(attr(slice, "color"), "red");
    EXPECT_EQ(attr(slice, "width"), "100%");
    // The template's own declaration was rewritten.
    const XERCES_CPP_NAMESPACE::DOMElement* declaration = template_.instruction(0)->getFirstElementChild();
    EXPECT_FALSE(declaration->hasAttribute(u"size"));
    EXPECT_EQ(utf8(declaration->getAttribute(u"width")), "100%");

    // Without a width none is added; bars of a pie take nothing.
    Chart noWidth = sample("pie.xml");
    apply(noWidth, "<setStyle type=\"pie\"><style color=\"red\" size=\"30%\"/></setStyle>");
    EXPECT_FALSE(template_.instruction(0)->getFirstElementChild()->hasAttribute(u"width"));
    EXPECT_FALSE(template_.instruction(0)->getFirstElementChild()->hasAttribute(u"size"));
    Chart asBars = sample("pie.xml");
    const auto before = styleSnapshot(asBars);
    apply(asBars, "<setStyle type=\"bar\"><style color=\"red\" size=\"30%\"/></setStyle>");
    EXPECT_TRUE(changedStyles(before, styleSnapshot(asBars)).empty());
    EXPECT_TRUE(template_.instruction(0)->getFirstElementChild()->hasAttribute(u"size"));
}

TEST_F(ElementTypes, ThreeDimensionalLinesAreStyledOnlyUnderThe3DSubtype) {
    const std::string elements = "<line id=\"l\" style=\"S1\" coordinates=\"COORD\"/>"
                                 "<path id=\"p\" style=\"S2\" coordinates=\"COORD\"/>"
                                 "<edge id=\"e\" style=\"S3\" coordinates=\"COORD\"/>";
    auto numbered = [&](const std::string& prefix, int first) {
        std::string out = elements;
        for (int i = 1; i <= 3; ++i)
            out = replaced(out, "S" + std::to_string(i), "s" + std::to_string(first + i - 1));
        return replaced(
            replaced(replaced(out, "\"l\"", "\"" + prefix + "l\""), "\"p\"", "\"" + prefix + "p\""), "\"e\"",
            "\"" + prefix + "e\"");
    };
    const std::string text =
        chartWith({{"flat", numbered("f", 1)}, {"deep", numbered("d", 4), false, /*z=*/true}});
    Chart threeD = load(text);
    apply(threeD, "<setStyle type=\"line\" subtype=\"3D\"><style color=\"red\"/></setStyle>");
    Chart flat = load(text);
    apply(flat, "<setStyle type=\"line\"><style color=\"red\"/></setStyle>");
    for (int i = 1; i <= 6; ++i) {
        const std::string id = "s" + std::to_string(i);
        const bool inDeepGraph = i > 3;
        EXPECT_EQ(attr(styleById(threeD, id.c_str()), "color") == "red", inDeepGraph) << id;
        EXPECT_EQ(attr(styleById(flat, id.c_str()), "color") == "red", !inDeepGraph) << id;
    }
}

TEST_F(ElementTypes, SchemaPartsTakeTheirOwnStylesAndMissingOnesAreMade) {
    Chart chart = sample("boxplot.xml");
    const auto before = styleSnapshot(chart);
    apply(chart, "<setStyle type=\"schema\" subtype=\"hingeStyle\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(changedStyles(before, styleSnapshot(chart)), (std::vector<std::string>{"hingeStyle"}));
    EXPECT_EQ(attr(styleById(chart, "hingeStyle"), "color"), "red");

    Chart own = sample("boxplot.xml");
    apply(own, "<setStyle type=\"schema\" subtype=\"whatever\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(own, "boxStyle"), "color"), "red");

    Chart bare = load(chartWith({{"g1", "<schema id=\"box\" style=\"s1\" coordinates=\"COORD\"/>"}}));
    apply(bare, "<setStyle type=\"schema\" subtype=\"medianStyle\"><style color=\"red\"/></setStyle>");
    auto* schema = dynamic_cast<GrxSchema*>(byId(bare, "box"));
    ASSERT_NE(schema, nullptr);
    GrxStyle* median = schema->getMedianStyle();
    ASSERT_NE(median, nullptr);
    EXPECT_EQ(attr(median, "color"), "red");
    const auto* holder =
        static_cast<const XERCES_CPP_NAMESPACE::DOMElement*>(median->getImplementation()->getParentNode());
    EXPECT_EQ(utf8(holder->getAttribute(u"id")), "c-o-n-t-a-i-n-er");
    EXPECT_EQ(attr(styleById(bare, "s1"), "color"), "black");
    EXPECT_EQ(schema->getHingeStyle(), nullptr);
}

TEST_F(ElementTypes, ScatterPointsWithBinsTakeOnlyTheDotSubtype) {
    const std::string text =
        chartWith({{"g1", "<point id=\"plain\" style=\"s1\" coordinates=\"COORD\"/>"
                          "<point id=\"binned\" style=\"s2\" coordinates=\"COORD\"><binStatistic/></point>"
                          "<line id=\"line\" style=\"s3\" coordinates=\"COORD\"/>"}});
    Chart chart = load(text);
    apply(chart, "<setStyle type=\"scatter\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(chart, "s1"), "color"), "red");
    EXPECT_EQ(attr(styleById(chart, "s2"), "color"), "black");
    EXPECT_EQ(attr(styleById(chart, "s3"), "color"), "black");
    Chart dots = load(text);
    apply(dots, "<setStyle type=\"scatter\" subtype=\"dot\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(dots, "s2"), "color"), "red");

    Chart sampleChart = sample("scatter.xml");
    apply(sampleChart, "<setStyle type=\"scatter\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(sampleChart, "pointStyle"), "color"), "red");
}

TEST_F(ElementTypes, AreasHistogramsAndRangesTakeTheirTypes) {
    Chart area = sample("area.xml");
    apply(area, "<setStyle type=\"area\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(area, "areaStyle"), "color"), "red");

    // A histogram bar (bins and summaries) is no plain bar.
    Chart asBar = sample("histogram.xml");
    apply(asBar, "<setStyle type=\"bar\"><style color=\"red\"/></setStyle>");
    EXPECT_NE(attr(styleById(asBar, "barStyle"), "color"), "red");
    Chart histogram = sample("histogram.xml");
    apply(histogram, "<setStyle type=\"histogram\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(histogram, "barStyle"), "color"), "red");
    EXPECT_NE(attr(styleById(histogram, "normalLineStyle"), "color"), "red");

    const std::string ranges = chartWith(
        {{"g1",
          "<interval id=\"r1\" style=\"sq\" coordinates=\"COORD\"><summaryStatistic method=\"7\"/></interval>"
          "<interval id=\"r2\" style=\"s2\" coordinates=\"COORD\"><summaryStatistic "
          "method=\"7\"/></interval>"}},
        "<style id=\"sq\" symbol=\"square\" color=\"black\"/>");
    Chart range = load(ranges);
    apply(range, "<setStyle type=\"range\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(range, "sq"), "color"), "red");
    EXPECT_EQ(attr(styleById(range, "s2"), "color"), "black");
}

TEST_F(ElementTypes, TheCoordinateAttributeChoosesTheCoordinates) {
    Chart second = sample("dual-y-axis.xml");
    apply(second, "<setStyle type=\"line\"><style coordinate=\"1\" color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(second, "lineStyle"), "color"), "red");
    Chart first = sample("dual-y-axis.xml");
    const auto before = styleSnapshot(first);
    apply(first, "<setStyle type=\"line\"><style coordinate=\"0\" color=\"red\"/></setStyle>");
    EXPECT_TRUE(changedStyles(before, styleSnapshot(first)).empty());
    Chart bars = sample("dual-y-axis.xml");
    apply(bars, "<setStyle type=\"bar\"><style coordinate=\"1\" color=\"red\"/></setStyle>");
    EXPECT_NE(attr(styleById(bars, "barStyle"), "color"), "red");
}

TEST_F(ElementTypes, ElementsWithoutAStyleGetANewOne) {
    Chart chart = load(chartWith({{"g1", "<interval id=\"b1\" coordinates=\"COORD\"/>"}}));
    apply(chart, "<setStyle type=\"bar\"><style color=\"red\"/></setStyle>");
    GrxStyle* made = styleOfElement(chart, "b1");
    ASSERT_NE(made, nullptr);
    EXPECT_EQ(attr(made, "color"), "red");
    EXPECT_EQ(attr(made, "id"), "style1");
}

TEST_F(ElementTypes, PatternedBarsWithoutAColourAreWhitened) {
    const std::string text = chartWith(
        {{"g1",
          "<interval id=\"b1\" style=\"bare\" coordinates=\"COORD\"><styleBy id=\"pattern_1\"/></interval>"
          "<interval id=\"b2\" style=\"s2\" coordinates=\"COORD\"><styleBy id=\"pattern_2\"/></interval>"
          "<interval id=\"b3\" style=\"bare2\" coordinates=\"COORD\"><styleBy id=\"dash_1\"/></interval>"}},
        "<style id=\"bare\"/><style id=\"bare2\"/>");
    Chart chart = load(text);
    apply(chart, "<setStyle type=\"bar\"><style stroke-width=\"2pt\"/></setStyle>");
    EXPECT_EQ(attr(styleById(chart, "bare"), "color"), "white");
    EXPECT_EQ(attr(styleById(chart, "s2"), "color"), "black");
    EXPECT_FALSE(styleById(chart, "bare2")->isColorPresent());
    EXPECT_EQ(attr(styleById(chart, "bare2"), "stroke-width"), "2pt");
}

TEST_F(ElementTypes, UnknownTypesAndDeclarationsBeyondTheGraphsChangeNothing) {
    for (const char* body : {"<setStyle type=\"interval\"><style color=\"red\"/></setStyle>",
                             "<setStyle type=\"bar\"><style number=\"3\" color=\"red\"/></setStyle>",
                             "<setStyle type=\"bar\"/>"}) {
        Chart chart = sample("simple-bar.xml");
        const std::string before = chart.vis->AsUTF8();
        EXPECT_TRUE(apply(chart, body)) << body;
        EXPECT_EQ(chart.vis->AsUTF8(), before) << body;
    }
}

TEST_F(ElementTypes, ASimpleBarChangesOnlyItsBarStyle) {
    Chart chart = sample("simple-bar.xml");
    const auto before = styleSnapshot(chart);
    apply(chart, "<setStyle type=\"bar\"><style color=\"#112233\" stroke-width=\"2pt\"/></setStyle>");
    EXPECT_EQ(changedStyles(before, styleSnapshot(chart)), (std::vector<std::string>{"barStyle"}));
    GrxStyle* style = styleById(chart, "barStyle");
    EXPECT_EQ(attr(style, "color"), "#112233");
    EXPECT_EQ(attr(style, "stroke-width"), "2pt");
    EXPECT_EQ(attr(style, "width"), "60%;10%;90%");
}

} // namespace
