// What each designer template visibly does to a chart it fits.
#include "DesignerSupport.h"

using namespace designer_test;
using engine_test::Chart;
using engine_test::EngineTest;

namespace {

std::vector<std::string> attrs(const std::vector<DOMElement*>& elements, const std::string& name) {
    std::vector<std::string> out;
    for (const DOMElement* e : elements)
        out.push_back(attr(e, name));
    return out;
}

// The single graph of a sample chart.
DOMElement* graphOf(const Chart& c) {
    const std::vector<DOMElement*> graphs = elementsNamed(c.document(), "graph");
    return graphs.size() == 1 ? graphs.front() : nullptr;
}

using CorporateLook = EngineTest;

TEST_F(CorporateLook, BarsTakeTheBrandFillAndOutlineAndClusteredBarsTheirOwnWidth) {
    const Chart clustered = applied("clustered-bar.xml", {"corporate.sgt"});
    ASSERT_TRUE(clustered.vis);
    // A bar's style is a filled-area style: fill is its colour, stroke its colour 2.
    EXPECT_EQ(attrOf(clustered, "barStyle", "color"), "#1F4E79");
    EXPECT_EQ(attrOf(clustered, "barStyle", "color2"), "#0B2540");
    EXPECT_EQ(attrOf(clustered, "barStyle", "stroke-width"), "0.5pt");
    // Only the clustered declaration reaches the bars of a clustered graph. Its width attribute
    // replaces the chart's whole range.
    EXPECT_EQ(attrOf(clustered, "barStyle", "width"), "80%");

    const Chart simple = applied("simple-bar.xml", {"corporate.sgt"});
    ASSERT_TRUE(simple.vis);
    EXPECT_EQ(attrOf(simple, "barStyle", "color"), "#1F4E79");
    // A width in the style text is the preferred width: the chart's minimum and maximum stay.
    EXPECT_EQ(attrOf(simple, "barStyle", "width"), "70%;10%;90%");
}

TEST_F(CorporateLook, HouseFontsTitleAndLegendText) {
    const Chart c = applied("clustered-bar.xml", {"corporate.sgt"});
    ASSERT_TRUE(c.vis);
    EXPECT_EQ(attrOf(c, "visualizationStyle", "font-family"), "Verdana");
    EXPECT_EQ(attrOf(c, "visualizationStyle", "color"), "#FFFFFF");
    EXPECT_EQ(attrOf(c, "titleStyle", "font-family"), "Georgia");
    EXPECT_EQ(attrOf(c, "titleStyle", "font-weight"), "bold");
    EXPECT_EQ(attrOf(c, "titleStyle", "color"), "#1F4E79");
    EXPECT_EQ(preferred(attrOf(c, "titleStyle", "font-size")), "14pt");
    // "normal" in a style text is the object model's regular weight.
    EXPECT_EQ(attrOf(c, "legend_1tickTextStyle", "font-weight"), "regular");
    EXPECT_EQ(attrOf(c, "legend_1tickTextStyle", "color"), "#404040");
    // Axis titles (and the legend title, which shares their style) end bold in brand blue.
    EXPECT_EQ(attrOf(c, "axisLabelStyle", "font-weight"), "bold");
    EXPECT_EQ(attrOf(c, "axisLabelStyle", "color"), "#1F4E79");
    EXPECT_EQ(attrOf(c, "axisLabelStyle", "font-family"), "Verdana");
    // The graph's cell and the legend are filled areas too.
    EXPECT_EQ(attrOf(c, "graphStyle", "color"), "#F7F9FC");
    EXPECT_EQ(attrOf(c, "graphStyle", "color2"), "#1F4E79");
    EXPECT_EQ(attrOf(c, "legendStyle", "color"), "#FFFFFF");
    EXPECT_EQ(attrOf(c, "legendStyle", "color2"), "#1F4E79");
    EXPECT_EQ(attrOf(c, "gridStyle", "stroke-dasharray"), "1 3");
}

TEST_F(CorporateLook, GroupedElementsCycleThroughTheBrandPalette) {
    const Chart c = applied("clustered-bar.xml", {"corporate.sgt"});
    ASSERT_TRUE(c.vis);
    const DOMElement* colour = byId(c, "color_1");
    ASSERT_NE(colour, nullptr);
    EXPECT_NE(attr(colour, "cycle"), "styleCycleRepository");
    EXPECT_EQ(attrs(cycleStyles(c, colour), "color"),
              (std::vector<std::string>{"#1F4E79", "#F28E2B", "#76B7B2", "#59A14F", "#EDC948", "#B07AA1"}));
    // No affect was asked for: the colour keeps the one the chart gave it.
    EXPECT_EQ(attr(colour, "affect"), "main");
}

TEST_F(CorporateLook, SeriesLinesAreDashedInTurn) {
    const Chart c = applied("line-series.xml", {"corporate.sgt"});
    ASSERT_TRUE(c.vis);
    const DOMElement* dash = byId(c, "dash_1");
    ASSERT_NE(dash, nullptr);
    EXPECT_EQ(attrs(cycleStyles(c, dash), "stroke-dasharray"),
              (std::vector<std::string>{"none", "6 3", "2 2", "8 3 2 3"}));
    EXPECT_EQ(attrOf(c, "lineStyle", "stroke-width"), "1.5pt");
    EXPECT_EQ(attrOf(c, "lineStyle", "stroke-linecap"), "round");
    // The series colour of a line sits in colour 2, which the template does not touch.
    EXPECT_EQ(attrOf(c, "lineStyle", "color2"), "#3E58AC");
}

TEST_F(CorporateLook, BoxesTakeThePaleFillAndARedMedian) {
    const Chart c = applied("boxplot.xml", {"corporate.sgt"});
    ASSERT_TRUE(c.vis);
    EXPECT_EQ(attrOf(c, "boxStyle", "color"), "#DCE6F0");
    EXPECT_EQ(attrOf(c, "boxStyle", "color2"), "#1F4E79");
    EXPECT_EQ(attrOf(c, "boxStyle", "stroke-width"), "0.75pt");
    // A hinge style is a filled area: fill and stroke land in colour and colour 2.
    EXPECT_EQ(attrOf(c, "hingeStyle", "color"), "#DCE6F0");
    EXPECT_EQ(attrOf(c, "hingeStyle", "color2"), "#1F4E79");
    EXPECT_EQ(attrOf(c, "medianStyle", "color2"), "#C00000");
    EXPECT_EQ(attrOf(c, "medianStyle", "stroke-width"), "2pt");
    // The fence is not among the parts the template styles.
    EXPECT_EQ(attrOf(c, "fenceStyle", "stroke-width"), "1pt");
}

TEST_F(CorporateLook, HistogramBinsAreStyledAsSuchAndPointsAndAreasKeepTheirFill) {
    const Chart histogram = applied("histogram.xml", {"corporate.sgt"});
    ASSERT_TRUE(histogram.vis);
    // Bins take the histogram declaration (white outline), not the bar one.
    EXPECT_EQ(attrOf(histogram, "barStyle", "color"), "#1F4E79");
    EXPECT_EQ(attrOf(histogram, "barStyle", "color2"), "#FFFFFF");
    EXPECT_EQ(attrOf(histogram, "barStyle", "width"), "100%");

    // A point's style is no filled area: the template gives it colour 2, its own colour stays.
    const Chart errorBars = applied("error-bars.xml", {"corporate.sgt"});
    ASSERT_TRUE(errorBars.vis);
    EXPECT_EQ(attrOf(errorBars, "meanStyle", "color"), "black");
    EXPECT_EQ(attrOf(errorBars, "meanStyle", "color2"), "#FFFFFF");
    EXPECT_EQ(attrOf(errorBars, "meanStyle", "symbol"), "circle");
    // The error bar is neither a bar nor a point.
    EXPECT_EQ(attrOf(errorBars, "errorbarStyle", "color2"), "black");

    const Chart area = applied("area.xml", {"corporate.sgt"});
    ASSERT_TRUE(area.vis);
    EXPECT_EQ(attrOf(area, "areaStyle", "color"), "#1F4E79");
    EXPECT_EQ(attrOf(area, "areaStyle", "color2"), "#0B2540");
    EXPECT_EQ(attrOf(area, "areaStyle", "opacity"), "0.8");
}

// No sample chart varies a pattern; a variant of the bar chart does. Patterns are drawn on white:
// with no source visualization that says otherwise, the bars' own colour gives way.
TEST_F(CorporateLook, PatternedBarsCycleThroughHatchesOnWhite) {
    std::string text = engine_test::example("charts/simple-bar.xml");
    const std::string at = "<color id=\"color_1\"";
    const std::string::size_type where = text.find(at);
    ASSERT_NE(where, std::string::npos);
    text.insert(where, "<pattern id=\"pattern_1\" variable=\"var_jobcat\" cycle=\"styleCycleRepository\" "
                       "domain=\"domain_jobcat\"/>");
    Chart c = Chart::parse(text);
    ASSERT_TRUE(c.vis);
    ChartTemplate t(*c.vis, nullptr);
    ASSERT_TRUE(t.setTemplate(engine_test::example("templates/corporate.sgt")));
    t.applyTemplate();
    const DOMElement* pattern = byId(c, "pattern_1");
    ASSERT_NE(pattern, nullptr);
    EXPECT_EQ(attrs(cycleStyles(c, pattern), "pattern"), (std::vector<std::string>{"0", "3", "5", "7"}));
    EXPECT_EQ(attrOf(c, "barStyle", "color"), "white");
    // The outline keeps the brand colour the bar declaration gave it.
    EXPECT_EQ(attrOf(c, "barStyle", "color2"), "#0B2540");
}

using MonochromeLook = EngineTest;

TEST_F(MonochromeLook, TheLineChartLosesItsColourAestheticToADashInGreys) {
    const Chart c = applied("line-series.xml", {"monochrome.sgt"});
    ASSERT_TRUE(c.vis);
    const DOMElement* graph = graphOf(c);
    ASSERT_NE(graph, nullptr);
    EXPECT_TRUE(elementsNamed(graph, "color").empty());
    // The colour became a dash under the colour's id, with a cycle of its own.
    const DOMElement* converted = byId(c, "color_1");
    ASSERT_NE(converted, nullptr);
    EXPECT_EQ(text(converted->getLocalName()), "dash");
    EXPECT_EQ(attr(converted, "variable"), "var_region");
    EXPECT_EQ(attr(converted, "domain"), "domain_region");
    const std::vector<DOMElement*> styles = cycleStyles(c, converted);
    EXPECT_EQ(attrs(styles, "stroke-dasharray"), (std::vector<std::string>{"none", "6 3", "2 2", "8 3 2 3"}));
    EXPECT_EQ(attrs(styles, "color"), (std::vector<std::string>{"#000000", "#595959", "#808080", "#A6A6A6"}));
    // The chart's own dash is still there beside it.
    ASSERT_NE(byId(c, "dash_1"), nullptr);
    EXPECT_EQ(text(byId(c, "dash_1")->getLocalName()), "dash");
    EXPECT_EQ(attrOf(c, "lineStyle", "color2"), "#000000");
}

TEST_F(MonochromeLook, ALoneLineGetsHollowShapeMarkersInTheLegend) {
    const Chart c = applied("line-series.xml", {"monochrome.sgt"});
    ASSERT_TRUE(c.vis);
    const DOMElement* graph = graphOf(c);
    ASSERT_NE(graph, nullptr);
    const std::vector<DOMElement*> points = childrenNamed(graph, "point");
    ASSERT_EQ(points.size(), 1u);
    const DOMElement* marker = points.front();
    EXPECT_EQ(attr(marker, "id").compare(0, 5, "point"), 0) << attr(marker, "id");
    EXPECT_TRUE(childrenNamed(marker, "dash").empty());
    EXPECT_TRUE(childrenNamed(marker, "color").empty());
    const std::vector<DOMElement*> shapes = childrenNamed(marker, "shape");
    ASSERT_EQ(shapes.size(), 1u);
    // Later instructions reach the marker too: the shape cycle and the points' look.
    EXPECT_EQ(attrs(cycleStyles(c, shapes.front()), "symbol"),
              (std::vector<std::string>{"circle", "square", "triangle", "polygon"}));
    const DOMElement* style = byId(c, attr(marker, "style"));
    ASSERT_NE(style, nullptr);
    EXPECT_EQ(attr(style, "symbol"), "square");
    EXPECT_EQ(preferred(attr(style, "size")), "4pt");
    EXPECT_EQ(attr(style, "color"), "#FFFFFF");
    EXPECT_EQ(attr(style, "color2"), "#000000");
    bool inLegend = false;
    for (const DOMElement* target : elementsNamed(byId(c, "legend_1"), "legendTarget"))
        inLegend = inLegend || attr(target, "target") == attr(shapes.front(), "id");
    EXPECT_TRUE(inLegend);
}

TEST_F(MonochromeLook, BarsAreWhiteAndHatchedAndPointsTakeShapes) {
    const Chart bars = applied("simple-bar.xml", {"monochrome.sgt"});
    ASSERT_TRUE(bars.vis);
    EXPECT_EQ(attrOf(bars, "barStyle", "color"), "#FFFFFF");
    EXPECT_EQ(attrOf(bars, "barStyle", "color2"), "#000000");
    EXPECT_EQ(attrOf(bars, "barStyle", "pattern"), "2");
    EXPECT_EQ(attrOf(bars, "graphStyle", "color"), "#FFFFFF");
    EXPECT_EQ(attrOf(bars, "visualizationStyle", "font-family"), "Times New Roman");

    const Chart scatter = applied("scatter.xml", {"monochrome.sgt"});
    ASSERT_TRUE(scatter.vis);
    const std::vector<DOMElement*> shapes = cycleStyles(scatter, byId(scatter, "shape_1"));
    EXPECT_EQ(attrs(shapes, "symbol"), (std::vector<std::string>{"circle", "square", "triangle", "polygon"}));
    ASSERT_EQ(shapes.size(), 4u);
    EXPECT_EQ(attr(shapes[3], "glyph-sides"), "5");
    EXPECT_EQ(attrOf(scatter, "pointStyle", "color"), "#FFFFFF");
    EXPECT_TRUE(elementsNamed(graphOf(scatter), "color").empty());
    // A scatter is not a chart of one line: no markers are added.
    EXPECT_EQ(childrenNamed(graphOf(scatter), "point").size(), 1u);
}

using PresentationLook = EngineTest;

TEST_F(PresentationLook, LargeTitlesAxisTextsAndLegend) {
    const Chart c = applied("scatter.xml", {"presentation.sgt"});
    ASSERT_TRUE(c.vis);
    EXPECT_EQ(attrOf(c, "titleStyle", "font-size"), "32pt;24pt;40pt");
    EXPECT_EQ(attrOf(c, "titleStyle", "font-weight"), "bold");
    EXPECT_EQ(attrOf(c, "axisLabelStyle", "font-size"), "20pt;16pt;24pt");
    EXPECT_EQ(attrOf(c, "tickLabelStyle", "font-size"), "16pt;12pt");
    EXPECT_EQ(attrOf(c, "legend_1tickTextStyle", "font-size"), "16pt;12pt");
    EXPECT_EQ(attrOf(c, "footnoteStyle", "font-size"), "14pt;12pt;16pt");
    EXPECT_EQ(attrOf(c, "visualizationStyle", "font-family"), "Arial");
    EXPECT_EQ(preferred(attrOf(c, "visualizationStyle", "font-size")), "16pt");
    EXPECT_EQ(attrOf(c, "visualizationStyle", "padding"), "8pt");
}

TEST_F(PresentationLook, ThickStrokesLongTicksAndBigMarkers) {
    const Chart lines = applied("line-series.xml", {"presentation.sgt"});
    ASSERT_TRUE(lines.vis);
    EXPECT_EQ(attrOf(lines, "lineStyle", "stroke-width"), "4pt");
    EXPECT_EQ(attrOf(lines, "axisStyle", "stroke-width"), "2pt");
    EXPECT_EQ(attrOf(lines, "gridStyle", "stroke-width"), "1pt");
    EXPECT_EQ(attrOf(lines, "legendStyle", "stroke-width"), "2pt");
    const std::vector<DOMElement*> ticks = elementsNamed(lines.document(), "majorTicks");
    ASSERT_EQ(ticks.size(), 2u);
    EXPECT_EQ(attrs(ticks, "length"), (std::vector<std::string>{"8pt", "8pt"}));
    // Minor ticks are another element: untouched.
    EXPECT_EQ(attrs(elementsNamed(lines.document(), "minorTicks"), "length"),
              (std::vector<std::string>{"2pt"}));

    const Chart scatter = applied("scatter.xml", {"presentation.sgt"});
    ASSERT_TRUE(scatter.vis);
    EXPECT_EQ(preferred(attrOf(scatter, "pointStyle", "size")), "10pt");
    EXPECT_EQ(attrOf(scatter, "pointStyle", "stroke-width"), "1pt");
}

// No sample chart sizes its points by a variable; a bubble variant of the scatter does.
TEST_F(PresentationLook, PointSizesStepUpWhereSizeTellsGroupsApart) {
    std::string text = engine_test::example("charts/scatter.xml");
    const std::string at = "<shape id=\"shape_1\"";
    const std::string::size_type where = text.find(at);
    ASSERT_NE(where, std::string::npos);
    text.insert(where, "<size id=\"size_1\" variable=\"var_gender\" cycle=\"styleCycleRepository\" "
                       "domain=\"domain_gender\"/>");
    Chart c = Chart::parse(text);
    ASSERT_TRUE(c.vis);
    ChartTemplate t(*c.vis, nullptr);
    ASSERT_TRUE(t.setTemplate(engine_test::example("templates/presentation.sgt")));
    t.applyTemplate();
    const DOMElement* size = byId(c, "size_1");
    ASSERT_NE(size, nullptr);
    EXPECT_NE(attr(size, "cycle"), "styleCycleRepository");
    EXPECT_EQ(attrs(cycleStyles(c, size), "size"), (std::vector<std::string>{"8pt", "14pt", "20pt", "26pt"}));
}

} // namespace
