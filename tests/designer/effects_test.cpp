// What each designer template visibly does to a chart it fits.
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

using CorporateLook = EngineTest;

TEST_F(CorporateLook, FilledAreasTakeFillAndOutlineAndBarsTheirSubtypesWidth) {
    const Chart clustered = applied("clustered-bar.xml", {"corporate.sgt"});
    ASSERT_TRUE(clustered.vis);
    // A bar's style is a filled-area style: fill is its colour, stroke its colour 2.
    EXPECT_EQ(attrOf(clustered, "barStyle", "color") + " " + attrOf(clustered, "barStyle", "color2"),
              "#1F4E79 #0B2540");
    // Only the clustered declaration reaches the bars of a clustered graph; its width attribute
    // replaces the chart's whole range.
    EXPECT_EQ(attrOf(clustered, "barStyle", "width"), "80%");
    // A width in the style text is the preferred width: the chart's minimum and maximum stay.
    EXPECT_EQ(attrOf(applied("simple-bar.xml", {"corporate.sgt"}), "barStyle", "width"), "70%;10%;90%");
    // The graph's cell and the legend are filled areas too.
    EXPECT_EQ(attrOf(clustered, "graphStyle", "color") + " " + attrOf(clustered, "graphStyle", "color2"),
              "#F7F9FC #1F4E79");
    EXPECT_EQ(attrOf(clustered, "legendStyle", "color2"), "#1F4E79");
    // Bins take the histogram declaration (white outline), not the bar one.
    const Chart histogram = applied("histogram.xml", {"corporate.sgt"});
    EXPECT_EQ(attrOf(histogram, "barStyle", "color2") + " " + attrOf(histogram, "barStyle", "width"),
              "#FFFFFF 100%");
    // A hinge is a filled area, a median a line; the fence is not styled.
    const Chart box = applied("boxplot.xml", {"corporate.sgt"});
    EXPECT_EQ(attrOf(box, "hingeStyle", "color") + " " + attrOf(box, "hingeStyle", "color2"),
              "#DCE6F0 #1F4E79");
    EXPECT_EQ(attrOf(box, "medianStyle", "color2"), "#C00000");
    EXPECT_EQ(attrOf(box, "fenceStyle", "stroke-width"), "1pt");
    const Chart area = applied("area.xml", {"corporate.sgt"});
    EXPECT_EQ(attrOf(area, "areaStyle", "color") + " " + attrOf(area, "areaStyle", "opacity"), "#1F4E79 0.8");
}

TEST_F(CorporateLook, TextsPointsAndLines) {
    const Chart c = applied("clustered-bar.xml", {"corporate.sgt"});
    ASSERT_TRUE(c.vis);
    EXPECT_EQ(attrOf(c, "titleStyle", "font-family"), "Georgia");
    EXPECT_EQ(preferred(attrOf(c, "titleStyle", "font-size")), "14pt");
    // "normal" in a style text is the object model's regular weight.
    EXPECT_EQ(attrOf(c, "legend_1tickTextStyle", "font-weight"), "regular");
    // Axis titles (and the legend title, which shares their style) end bold in brand blue.
    EXPECT_EQ(attrOf(c, "axisLabelStyle", "font-weight") + " " + attrOf(c, "axisLabelStyle", "color"),
              "bold #1F4E79");
    EXPECT_EQ(attrOf(c, "gridStyle", "stroke-dasharray"), "1 3");

    // A point's style is no filled area: the template gives it colour 2, its own colour stays.
    const Chart errorBars = applied("error-bars.xml", {"corporate.sgt"});
    EXPECT_EQ(attrOf(errorBars, "meanStyle", "color") + " " + attrOf(errorBars, "meanStyle", "color2"),
              "black #FFFFFF");
    // The error bar is neither a bar nor a point.
    EXPECT_EQ(attrOf(errorBars, "errorbarStyle", "color2"), "black");

    const Chart lines = applied("line-series.xml", {"corporate.sgt"});
    EXPECT_EQ(attrOf(lines, "lineStyle", "stroke-linecap"), "round");
    // The series colour of a line sits in colour 2, which the template does not touch.
    EXPECT_EQ(attrOf(lines, "lineStyle", "color2"), "#3E58AC");
}

TEST_F(CorporateLook, GroupedElementsCycleThroughTheBrandPaletteAndDashes) {
    const Chart c = applied("clustered-bar.xml", {"corporate.sgt"});
    ASSERT_TRUE(c.vis);
    const DOMElement* colour = byId(c, "color_1");
    ASSERT_NE(colour, nullptr);
    EXPECT_NE(attr(colour, "cycle"), "styleCycleRepository");
    EXPECT_EQ(attrs(cycleStyles(c, colour), "color"),
              (std::vector<std::string>{"#1F4E79", "#F28E2B", "#76B7B2", "#59A14F", "#EDC948", "#B07AA1"}));
    // No affect was asked for: the colour keeps the one the chart gave it.
    EXPECT_EQ(attr(colour, "affect"), "main");
    const Chart lines = applied("line-series.xml", {"corporate.sgt"});
    EXPECT_EQ(attrs(cycleStyles(lines, byId(lines, "dash_1")), "stroke-dasharray"),
              (std::vector<std::string>{"none", "6 3", "2 2", "8 3 2 3"}));
}

using MonochromeLook = EngineTest;

TEST_F(MonochromeLook, TheLineChartLosesItsColourAestheticToADashInGreys) {
    const Chart c = applied("line-series.xml", {"monochrome.sgt"});
    ASSERT_NE(graphOf(c), nullptr);
    EXPECT_TRUE(elementsNamed(graphOf(c), "color").empty());
    // The colour became a dash under the colour's id, with a cycle of its own.
    const DOMElement* converted = byId(c, "color_1");
    ASSERT_NE(converted, nullptr);
    EXPECT_EQ(text(converted->getLocalName()) + " " + attr(converted, "variable") + " " +
                  attr(converted, "domain"),
              "dash var_region domain_region");
    const std::vector<DOMElement*> styles = cycleStyles(c, converted);
    EXPECT_EQ(attrs(styles, "stroke-dasharray"), (std::vector<std::string>{"none", "6 3", "2 2", "8 3 2 3"}));
    EXPECT_EQ(attrs(styles, "color"), (std::vector<std::string>{"#000000", "#595959", "#808080", "#A6A6A6"}));
    // The chart's own dash is still there beside it.
    EXPECT_EQ(text(byId(c, "dash_1")->getLocalName()), "dash");
}

// "setShowLineMarkers" adds rather than replaces: once to the chart of one line, and not again when
// the graph holds two elements.
TEST_F(MonochromeLook, ALoneLineGetsHollowShapeMarkersInTheLegendOnce) {
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
    EXPECT_EQ(attr(marker, "id").compare(0, 5, "point"), 0) << attr(marker, "id");
    EXPECT_TRUE(childrenNamed(marker, "dash").empty() && childrenNamed(marker, "color").empty());
    const std::vector<DOMElement*> shapes = childrenNamed(marker, "shape");
    ASSERT_EQ(shapes.size(), 1u);
    // Later instructions reach the marker too: the shape cycle and the points' look.
    EXPECT_EQ(attrs(cycleStyles(c, shapes.front()), "symbol"),
              (std::vector<std::string>{"circle", "square", "triangle", "polygon"}));
    const DOMElement* style = byId(c, attr(marker, "style"));
    EXPECT_EQ(attr(style, "symbol") + " " + attr(style, "color") + " " + attr(style, "color2"),
              "square #FFFFFF #000000");
    bool inLegend = false;
    for (const DOMElement* target : elementsNamed(byId(c, "legend_1"), "legendTarget"))
        inLegend = inLegend || attr(target, "target") == attr(shapes.front(), "id");
    EXPECT_TRUE(inLegend);
}

TEST_F(MonochromeLook, BarsAreWhiteAndHatchedAndPointsTakeShapes) {
    const Chart bars = applied("simple-bar.xml", {"monochrome.sgt"});
    ASSERT_TRUE(bars.vis);
    EXPECT_EQ(attrOf(bars, "barStyle", "color") + " " + attrOf(bars, "barStyle", "color2") + " " +
                  attrOf(bars, "barStyle", "pattern"),
              "#FFFFFF #000000 2");

    const Chart scatter = applied("scatter.xml", {"monochrome.sgt"});
    ASSERT_TRUE(scatter.vis);
    const std::vector<DOMElement*> shapes = cycleStyles(scatter, byId(scatter, "shape_1"));
    EXPECT_EQ(attrs(shapes, "symbol"), (std::vector<std::string>{"circle", "square", "triangle", "polygon"}));
    ASSERT_EQ(shapes.size(), 4u);
    EXPECT_EQ(attr(shapes[3], "glyph-sides"), "5");
    EXPECT_TRUE(elementsNamed(graphOf(scatter), "color").empty());
    // A scatter is not a chart of one line: no markers are added.
    EXPECT_EQ(childrenNamed(graphOf(scatter), "point").size(), 1u);
}

using PresentationLook = EngineTest;

TEST_F(PresentationLook, LargeTextsThickStrokesLongTicksAndBigMarkers) {
    const Chart c = applied("scatter.xml", {"presentation.sgt"});
    ASSERT_TRUE(c.vis);
    // A whole size attribute, a style text's preferred size beside the chart's minimum.
    EXPECT_EQ(attrOf(c, "titleStyle", "font-size"), "32pt;24pt;40pt");
    EXPECT_EQ(attrOf(c, "tickLabelStyle", "font-size"), "16pt;12pt");
    EXPECT_EQ(preferred(attrOf(c, "pointStyle", "size")), "10pt");

    const Chart lines = applied("line-series.xml", {"presentation.sgt"});
    ASSERT_TRUE(lines.vis);
    EXPECT_EQ(attrOf(lines, "lineStyle", "stroke-width"), "4pt");
    EXPECT_EQ(attrs(elementsNamed(lines.document(), "majorTicks"), "length"),
              (std::vector<std::string>{"8pt", "8pt"}));
    // Minor ticks are another element: untouched.
    EXPECT_EQ(attrs(elementsNamed(lines.document(), "minorTicks"), "length"),
              (std::vector<std::string>{"2pt"}));
}

// No sample chart varies a pattern or a size by a variable; variants of the bar chart and the
// scatter do.
TEST_F(CorporateLook, PatternedBarsTakeHatchesOnWhiteAndSizesStepUpInThePresentationLook) {
    const auto variant = [](const std::string& chart, const std::string& before, const std::string& aesthetic,
                            const std::string& look) {
        Chart c =
            Chart::parse(grammar_test::replaceOnce(engine_test::example("charts/" + chart), before,
                                                   aesthetic + " cycle=\"styleCycleRepository\"/>" + before));
        if (!c.vis)
            return c;
        ChartTemplate t(*c.vis, nullptr);
        EXPECT_TRUE(t.setTemplate(engine_test::example("templates/" + look)));
        t.applyTemplate();
        return c;
    };
    const Chart bars = variant("simple-bar.xml", "<color id=\"color_1\"",
                               "<pattern id=\"pattern_1\" variable=\"var_jobcat\" domain=\"domain_jobcat\"",
                               "corporate.sgt");
    ASSERT_TRUE(bars.vis);
    EXPECT_EQ(attrs(cycleStyles(bars, byId(bars, "pattern_1")), "pattern"),
              (std::vector<std::string>{"0", "3", "5", "7"}));
    // Patterns are drawn on white: with no source that says otherwise, the bars' own colour gives
    // way; the outline keeps the brand colour the bar declaration gave it.
    EXPECT_EQ(attrOf(bars, "barStyle", "color") + " " + attrOf(bars, "barStyle", "color2"), "white #0B2540");

    const Chart bubbles =
        variant("scatter.xml", "<shape id=\"shape_1\"",
                "<size id=\"size_1\" variable=\"var_gender\" domain=\"domain_gender\"", "presentation.sgt");
    EXPECT_NE(attrOf(bubbles, "size_1", "cycle"), "styleCycleRepository");
    EXPECT_EQ(attrs(cycleStyles(bubbles, byId(bubbles, "size_1")), "size"),
              (std::vector<std::string>{"8pt", "14pt", "20pt", "26pt"}));
}

} // namespace
