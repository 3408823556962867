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

TEST_F(ElementTypes, DeclarationsReachTheGraphsOfTheirNumber) {
    const std::string three =
        chartWith({{"g1", bar("b1", "s1")}, {"g2", bar("b2", "s2")}, {"g3", bar("b3", "s3")}});
    // One unnumbered declaration is for every graph, but not a polar one.
    expectStyles(chartWith({{"g1", bar("b1", "s1")}, {"g2", bar("b2", "s2")}, {"g3", bar("b3", "s3"), true}}),
                 setStyle("bar", kRed), "s1:red s2:red", "s1 s2");
    expectStyles(three,
                 setStyle("bar", "<style number=\"0\" color=\"red\"/><style number=\"1\" color=\"blue\"/>"),
                 "s1:red s2:blue s3:black");
    // A lone declaration with a number is no longer the one for every graph.
    expectStyles(three, setStyle("bar", "<style number=\"1\" color=\"blue\"/>"), "s1:black s2:blue s3:black");
    // A later declaration of the same number replaces the earlier one.
    expectStyles(three, setStyle("bar", "<style color=\"red\"/><style number=\"0\" color=\"green\"/>"),
                 "s3:green");
    // Huge numbers name no graph and cost nothing: the unnumbered declaration is graph 0's only.
    for (const char* number : {"4294967295", "-1"})
        expectStyles(chartWith({{"g1", bar("b1", "s1")}, {"g2", bar("b2", "s2")}}),
                     setStyle("bar", std::string(kRed) + "<style number=\"" + number + "\" color=\"blue\"/>"),
                     "s1:red s2:black");
    // Declarations beyond the graphs, unknown types and no declaration change nothing.
    for (const std::string& body :
         {setStyle("interval", kRed), setStyle("bar", "<style number=\"3\" color=\"red\"/>"),
          setStyle("bar", "")})
        expectStyles("simple-bar.xml", body, "", "");
    // A simple bar chart changes only its bar style, and only what the declaration says.
    expectStyles("simple-bar.xml", setStyle("bar", "<style color=\"#112233\" stroke-width=\"2pt\"/>"),
                 "barStyle:#112233 barStyle.stroke-width:2pt barStyle.width:60%;10%;90%", "barStyle");
}

TEST_F(ElementTypes, EachKindOfElementTakesItsOwnType) {
    const std::string posMod = " positionModifier=\"7\"";
    const std::string lined = replaceOnce(
        chartWith({{"g1", bar("b1", "s1")}}, "<style id=\"lineSymbol\" symbol=\"line\" color=\"black\"/>"),
        "style=\"s1\"", "style=\"lineSymbol\"");
    const std::string named =
        chartWith({{"g1", bar("my_dropdownline", "s1") + bar("an_errorbar", "s2") + bar("plain", "s3")}});
    const std::string points =
        chartWith({{"g1", "<point id=\"plain\" style=\"s1\" coordinates=\"COORD\"/>"
                          "<point id=\"binned\" style=\"s2\" coordinates=\"COORD\"><binStatistic/></point>"
                          "<line id=\"line\" style=\"s3\" coordinates=\"COORD\"/>"}});
    const std::string ranges = chartWith(
        {{"g1",
          "<interval id=\"r1\" style=\"sq\" coordinates=\"COORD\"><summaryStatistic method=\"7\"/></interval>"
          "<interval id=\"r2\" style=\"s2\" coordinates=\"COORD\"><summaryStatistic "
          "method=\"7\"/></interval>"}},
        "<style id=\"sq\" symbol=\"square\" color=\"black\"/>");
    std::string special;
    const char* ids[] = {"series_1", "my_control", "AIMx",     "biplot1",
                         "centroid", "guide1",     "survival", "triplot"};
    for (int i = 0; i < 8; ++i)
        special += bar(ids[i], "s" + std::to_string(i + 1));
    const struct {
        std::string chart, body, expect;
        const char* changed;
    } rows[] = {
        // Clustered bars take their own subtype only.
        {"clustered-bar.xml", setStyle("bar", kRed), "barStyle:!red", nullptr},
        {"clustered-bar.xml", setStyle("bar", kRed, sub("clustered")), "barStyle:red", nullptr},
        // Position modifier 7 keeps an unclustered bar out, but not a clustered one.
        {chartWith({{"g1", bar("b1", "s1", posMod) + bar("b2", "s2")}}), setStyle("bar", kRed),
         "s1:black s2:red", nullptr},
        {chartWith({{"g1", bar("b1", "s1", posMod), false, false, true}}),
         setStyle("bar", kRed, sub("clustered")), "s1:red", nullptr},
        // Intervals drawn as lines are drop lines, never bars; I-beams error bars only.
        {lined, setStyle("dropline", kRed), "lineSymbol:red", nullptr},
        {lined, setStyle("bar", kRed), "lineSymbol:black", nullptr},
        {"error-bars.xml", setStyle("errorbar", kRed), "errorbarStyle:red", nullptr},
        {"error-bars.xml", setStyle("dropline", kRed), "errorbarStyle:!red", nullptr},
        // Ids name their interval's kind; under "bar" the named ones are bars like any other.
        {named, setStyle("dropline", kRed), "s1:red s2:black s3:black", nullptr},
        {named, setStyle("bar", kRed), "s1:red s2:red s3:red", nullptr},
        // Special chart elements are never styled.
        {chartWith({{"g1", special + bar("ordinary", "s9")}}), setStyle("bar", kRed), "s9:red", "s9"},
        {chartWith({{"g1", "<line id=\"series_line\" style=\"s1\" coordinates=\"COORD\"/>"
                           "<line id=\"line\" style=\"s2\" coordinates=\"COORD\"/>"}}),
         setStyle("line", kRed), "s1:black s2:red", nullptr},
        // Scatter points with bins take only the dot subtype.
        {points, setStyle("scatter", kRed), "s1:red s2:black s3:black", nullptr},
        {points, setStyle("scatter", kRed, sub("dot")), "s2:red", nullptr},
        // Areas, histograms (bins and summaries: no plain bars) and ranges.
        {"area.xml", setStyle("area", kRed), "areaStyle:red", nullptr},
        {"histogram.xml", setStyle("bar", kRed), "barStyle:!red", nullptr},
        {"histogram.xml", setStyle("histogram", kRed), "barStyle:red normalLineStyle:!red", nullptr},
        {ranges, setStyle("range", kRed), "sq:red s2:black", nullptr},
        // Schema parts take their own styles; an unknown part the box's own.
        {"boxplot.xml", setStyle("schema", kRed, sub("hingeStyle")), "hingeStyle:red", "hingeStyle"},
        {"boxplot.xml", setStyle("schema", kRed, sub("whatever")), "boxStyle:red", nullptr},
        // The coordinate attribute chooses the coordinates.
        {"dual-y-axis.xml", setStyle("line", "<style coordinate=\"1\" color=\"red\"/>"), "lineStyle:red",
         nullptr},
        {"dual-y-axis.xml", setStyle("line", "<style coordinate=\"0\" color=\"red\"/>"), "", ""},
        // Patterned bars without a colour are whitened.
        {chartWith(
             {{"g1",
               "<interval id=\"b1\" style=\"bare\" coordinates=\"COORD\"><styleBy "
               "id=\"pattern_1\"/></interval>"
               "<interval id=\"b2\" style=\"s2\" coordinates=\"COORD\"><styleBy id=\"pattern_2\"/></interval>"
               "<interval id=\"b3\" style=\"bare2\" coordinates=\"COORD\"><styleBy "
               "id=\"dash_1\"/></interval>"}},
             "<style id=\"bare\"/><style id=\"bare2\"/>"),
         setStyle("bar", "<style stroke-width=\"2pt\"/>"),
         "bare:white s2:black bare2:- bare2.stroke-width:2pt", nullptr},
    };
    for (const auto& row : rows)
        expectStyles(row.chart, row.body, row.expect, row.changed);
}

TEST_F(ElementTypes, ThreeDimensionalLinesAreStyledOnlyUnderThe3DSubtype) {
    const std::string text = chartWith({{"flat", "<line id=\"f\" style=\"s1\" coordinates=\"COORD\"/>"},
                                        {"deep",
                                         "<path id=\"p\" style=\"s2\" coordinates=\"COORD\"/>"
                                         "<edge id=\"e\" style=\"s3\" coordinates=\"COORD\"/>",
                                         false, true}});
    expectStyles(text, setStyle("line", kRed, sub("3D")), "s1:black s2:red s3:red");
    expectStyles(text, setStyle("line", kRed), "s1:red s2:black s3:black");
}

TEST_F(ElementTypes, PieSlicesTakeTheDeclarationWithTheSizeRuleWrittenBack) {
    Chart chart = sample("pie.xml");
    EXPECT_TRUE(apply(chart, setStyle("pie", "<style color=\"red\" size=\"30%\" width=\"50%\"/>")));
    EXPECT_EQ(attr(styleById(chart, "sliceStyle"), "color"), "red");
    EXPECT_EQ(attr(styleById(chart, "sliceStyle"), "width"), "100%");
    // The template's own declaration was rewritten.
    const XERCES_CPP_NAMESPACE::DOMElement* declaration = template_.first()->getFirstElementChild();
    EXPECT_FALSE(declaration->hasAttribute(u"size"));
    EXPECT_EQ(utf8(declaration->getAttribute(u"width")), "100%");
    // Without a width none is added; bars of a pie take nothing and leave the declaration be.
    Chart noWidth = sample("pie.xml");
    apply(noWidth, setStyle("pie", "<style color=\"red\" size=\"30%\"/>"));
    EXPECT_FALSE(template_.first()->getFirstElementChild()->hasAttribute(u"width"));
    EXPECT_FALSE(template_.first()->getFirstElementChild()->hasAttribute(u"size"));
    expectStyles("pie.xml", setStyle("bar", "<style color=\"red\" size=\"30%\"/>"), "", "");
    EXPECT_TRUE(template_.first()->getFirstElementChild()->hasAttribute(u"size"));
}

TEST_F(ElementTypes, ElementsAndSchemaPartsWithoutAStyleGetANewOne) {
    const Chart chart = expectStyles(chartWith({{"g1", "<interval id=\"b1\" coordinates=\"COORD\"/>"}}),
                                     setStyle("bar", kRed), "style1:red", "c-o-n-t-a-i-n-er style1");
    EXPECT_EQ(referred(chart, "b1", "style"), "style1 red");

    Chart bare = load(chartWith({{"g1", "<schema id=\"box\" style=\"s1\" coordinates=\"COORD\"/>"}}));
    apply(bare, setStyle("schema", kRed, sub("medianStyle")));
    auto* schema = dynamic_cast<GrxSchema*>(byId(bare, "box"));
    ASSERT_NE(schema, nullptr);
    GrxStyle* median = schema->getMedianStyle();
    ASSERT_NE(median, nullptr);
    EXPECT_EQ(attr(median, "color"), "red");
    EXPECT_EQ(attr(styleById(bare, "s1"), "color"), "black");
    EXPECT_EQ(schema->getHingeStyle(), nullptr);
}

} // namespace
