// What the designer templates visibly do to the charts they fit, and what they must leave alone.
#include "DesignerSupport.h"

#include "support/GrammarSupport.h"

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

std::string colours(const Chart& c, const std::string& style) {
    return attrOf(c, style, "color") + " " + attrOf(c, style, "color2");
}

using CorporateLook = EngineTest;

TEST_F(CorporateLook, FilledAreasTakeFillAndOutlineLinesAndPointsDoNot) {
    const Chart clustered = applied("clustered-bar.xml", {"corporate.sgt"});
    ASSERT_TRUE(clustered.vis);
    // A bar's style is a filled-area style: fill is its colour, stroke its colour 2. Only the
    // clustered declaration reaches a clustered graph; its width attribute replaces the whole range.
    EXPECT_EQ(colours(clustered, "barStyle") + " " + attrOf(clustered, "barStyle", "width"),
              "#1F4E79 #0B2540 80%");
    // A width in the style text is the preferred width: the chart's minimum and maximum stay.
    EXPECT_EQ(attrOf(applied("simple-bar.xml", {"corporate.sgt"}), "barStyle", "width"), "70%;10%;90%");
    // "normal" in a style text is the object model's regular weight.
    EXPECT_EQ(attrOf(clustered, "legend_1tickTextStyle", "font-weight"), "regular");
    // Bins take the histogram declaration (white outline), not the bar one.
    EXPECT_EQ(attrOf(applied("histogram.xml", {"corporate.sgt"}), "barStyle", "color2"), "#FFFFFF");
    // A hinge is a filled area, a median a line.
    const Chart box = applied("boxplot.xml", {"corporate.sgt"});
    EXPECT_EQ(colours(box, "hingeStyle") + " " + attrOf(box, "medianStyle", "color2"),
              "#DCE6F0 #1F4E79 #C00000");
    // A point's style is no filled area: the template gives it colour 2, its own colour stays; the
    // error bar is neither a bar nor a point.
    const Chart errorBars = applied("error-bars.xml", {"corporate.sgt"});
    EXPECT_EQ(colours(errorBars, "meanStyle") + " " + attrOf(errorBars, "errorbarStyle", "color2"),
              "black #FFFFFF black");
    // The series colour of a line sits in colour 2, which the line declaration does not touch.
    const Chart lines = applied("line-series.xml", {"corporate.sgt"});
    EXPECT_EQ(attrOf(lines, "lineStyle", "stroke-linecap") + " " + attrOf(lines, "lineStyle", "color2"),
              "round #3E58AC");
    // The colour aesthetic gets a cycle of its own and keeps the affect the chart gave it.
    const DOMElement* colour = byId(clustered, "color_1");
    ASSERT_NE(colour, nullptr);
    EXPECT_NE(attr(colour, "cycle"), "styleCycleRepository");
    EXPECT_EQ(cycleStyles(clustered, colour).size(), 6u);
    EXPECT_EQ(attr(colour, "affect"), "main");
}

TEST_F(CorporateLook, PatternedBarsAreDrawnOnWhite) {
    Chart c = Chart::parse(grammar_test::replaceOnce(
        engine_test::example("charts/simple-bar.xml"), "<color id=\"color_1\"",
        "<pattern id=\"pattern_1\" variable=\"var_jobcat\" domain=\"domain_jobcat\" "
        "cycle=\"styleCycleRepository\"/><color id=\"color_1\""));
    ASSERT_TRUE(c.vis);
    ChartTemplate t(*c.vis, nullptr);
    ASSERT_TRUE(t.setTemplate(engine_test::example("templates/corporate.sgt")));
    t.applyTemplate();
    EXPECT_EQ(cycleStyles(c, byId(c, "pattern_1")).size(), 4u);
    // With no source that says otherwise, the bars' own colour gives way; the outline keeps the
    // colour the bar declaration gave it.
    EXPECT_EQ(colours(c, "barStyle"), "white #0B2540");
}

using MonochromeLook = EngineTest;

TEST_F(MonochromeLook, TheLineChartLosesItsColourAestheticToADash) {
    const Chart c = applied("line-series.xml", {"monochrome.sgt"});
    ASSERT_NE(graphOf(c), nullptr);
    EXPECT_TRUE(elementsNamed(graphOf(c), "color").empty());
    // The colour became a dash under the colour's id, with a cycle of its own.
    const DOMElement* converted = byId(c, "color_1");
    ASSERT_NE(converted, nullptr);
    EXPECT_EQ(text(converted->getLocalName()) + " " + attr(converted, "variable") + " " +
                  attr(converted, "domain"),
              "dash var_region domain_region");
    EXPECT_EQ(cycleStyles(c, converted).size(), 4u);
    EXPECT_NE(attr(converted, "cycle"), attrOf(c, "dash_1", "cycle"));
    // The chart's own dash is still there beside it.
    EXPECT_EQ(text(byId(c, "dash_1")->getLocalName()), "dash");
}

// "setShowLineMarkers" adds rather than replaces: once to the chart of one line, and not again when
// the graph holds two elements.
TEST_F(MonochromeLook, ALoneLineGetsShapeMarkersInTheLegendOnce) {
    const Chart original = Chart::parse(engine_test::example("charts/line-series.xml"));
    const Chart c = applied("line-series.xml", {"monochrome.sgt"});
    const Chart twice = applied("line-series.xml", {"monochrome.sgt", "monochrome.sgt"});
    ASSERT_TRUE(original.vis && c.vis && twice.vis && graphOf(c));
    const auto count = [](const Chart& chart, const std::string& name) {
        return elementsNamed(chart.document(), name).size();
    };
    EXPECT_EQ(count(original, "point"), 0u);
    EXPECT_EQ(count(twice, "point"), 1u);
    EXPECT_EQ(count(c, "legendTarget"), count(original, "legendTarget") + 1);
    EXPECT_EQ(count(twice, "legendTarget"), count(c, "legendTarget"));
    const std::vector<DOMElement*> points = childrenNamed(graphOf(c), "point");
    ASSERT_EQ(points.size(), 1u);
    const DOMElement* marker = points.front();
    EXPECT_TRUE(childrenNamed(marker, "dash").empty() && childrenNamed(marker, "color").empty());
    const std::vector<DOMElement*> shapes = childrenNamed(marker, "shape");
    ASSERT_EQ(shapes.size(), 1u);
    // Later instructions reach the marker too: the shape cycle and the points' look.
    EXPECT_EQ(cycleStyles(c, shapes.front()).size(), 4u);
    EXPECT_EQ(attrOf(c, attr(marker, "style"), "color2"), "#000000");
    bool inLegend = false;
    for (const DOMElement* target : elementsNamed(byId(c, "legend_1"), "legendTarget"))
        inLegend = inLegend || attr(target, "target") == attr(shapes.front(), "id");
    EXPECT_TRUE(inLegend);
    // A scatter is not a chart of one line: no markers are added.
    const Chart scatter = applied("scatter.xml", {"monochrome.sgt"});
    EXPECT_EQ(childrenNamed(graphOf(scatter), "point").size(), 1u);
}

using PresentationLook = EngineTest;

TEST_F(PresentationLook, MajorTicksGrowAndMinorTicksStay) {
    const Chart lines = applied("line-series.xml", {"presentation.sgt"});
    ASSERT_TRUE(lines.vis);
    const Chart original = Chart::parse(engine_test::example("charts/line-series.xml"));
    EXPECT_NE(attrs(elementsNamed(lines.document(), "majorTicks"), "length"),
              attrs(elementsNamed(original.document(), "majorTicks"), "length"));
    EXPECT_EQ(attrs(elementsNamed(lines.document(), "minorTicks"), "length"),
              attrs(elementsNamed(original.document(), "minorTicks"), "length"));
    EXPECT_FALSE(elementsNamed(lines.document(), "minorTicks").empty());
}

} // namespace
