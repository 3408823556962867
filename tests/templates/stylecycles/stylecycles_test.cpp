// Style cycle actions: cycles rebuilt from the instruction or handed out from the repository by the
// kind of element, and style-bys added with cycles of their own.
#include "templates/TemplateSupport.h"
#include "templates/actions/stylecycles.h"

using namespace template_test;
using namespace plotaid::detail;

namespace {

const std::string kRepository =
    "<setStyleCycle id=\"styleCycleRepository\"{create}><cycle><style color=\"red\"/><style color=\"blue\"/></cycle>"
    "<cycle><style color=\"gray\"/></cycle>"
    "<cycle><style value=\"fill-pattern:3\"/><style value=\"fill-pattern:5\"/></cycle>"
    "<cycle><style stroke-dasharray=\"none\"/><style stroke-dasharray=\"2 2\"/></cycle>"
    "<cycle><style value=\"symbol:square\"/></cycle></setStyleCycle>";
std::string repository(const std::string& create) {
    std::string text = kRepository;
    return text.replace(text.find("{create}"), 8, create.empty() ? "" : " createType=\"" + create + "\"");
}

class StyleCycles : public TemplateTest {
protected:
    // A style-by on the element of that id, with the element's first variable.
    GrxStyleBy& styleBy(GrxVisualization& chart, const char* element, const char* id) {
        CTElementType& e = *byId<CTElementType>(chart, element);
        GrxStyleBy& s = e.addStyleBy();
        s.setId(ChartString(id));
        s.setVariable(*e.getX()->getVariable());
        return s;
    }
    void expectSound(const GrxVisualization& chart) {
        for (const GrxStyleCycle* cycle : chart.getStyleCycles()) {
            EXPECT_FALSE(cycle->getCycles().empty()) << u8(cycle->getId());
            for (const GrxCycle* styles : cycle->getCycles())
                EXPECT_FALSE(styles->getStyles().empty()) << u8(cycle->getId());
        }
        EXPECT_EQ(grammar_test::chartFaults(chart), "");
    }
};

TEST_F(StyleCycles, TheStyleByNumberCountsOverTheGraphAndTheLockedCycleStays) {
    GrxVisualization& chart = sample("line-series.xml");
    // The count runs on over the graph's next element.
    GrxStyleBy& third = byId<GrrUviza>(chart, "frame_graph_1")->addLine().addStyleBy();
    third.setId(ChartString("styleBy_third"));
    const std::string color = stylesOf(chart, "styleBy_color"), dash = stylesOf(chart, "styleBy_dash");
    const GrxStyleCycle& repository = *chart.getExtension()->getStyleCycleRepository(); // styleBy_color's
    const std::string kept = describeStyles(repository.getImplementation());
    EXPECT_TRUE(act<TStyleCycle>("<setStyleCycle styleByNumber=\"3\"><cycle><style color=\"red\"/></cycle></setStyleCycle>", chart));
    EXPECT_EQ(stylesOf(chart, "styleBy_third"), "[({color=red;})]");
    EXPECT_EQ(stylesOf(chart, "styleBy_color") + stylesOf(chart, "styleBy_dash"), color + dash);

    // A cycle named "color_pattern" is never rebuilt, not even completed.
    third.setCycle(chart.addStyleCycle(ChartString("color_pattern")));
    act<TStyleCycle>("<setStyleCycle><cycle><style color=\"green\"/></cycle></setStyleCycle>", chart);
    EXPECT_TRUE(third.getCycle()->getCycles().empty());
    EXPECT_EQ(stylesOf(chart, "styleBy_dash"), "[({color=green;})]");
    // No cycle in the instruction still leaves every cycle with a style.
    act<TStyleCycle>("<setStyleCycle styleByNumber=\"1\"/>", chart);
    EXPECT_EQ(stylesOf(chart, "styleBy_color"), "[({})]");
    // The repository is never rebuilt in a style-by's place.
    EXPECT_EQ(describeStyles(repository.getImplementation()), kept);
}

TEST_F(StyleCycles, APatternCycleFromTheInstructionPaintsBlackOnWhite) {
    GrxVisualization& chart = sample("simple-bar.xml");
    styleBy(chart, "interval_1", "styleBy_1");
    act<TStyleCycle>("<setStyleCycle><cycle><style value=\"fill-pattern:3\"/></cycle></setStyleCycle>", chart);
    EXPECT_EQ(attr(chart.getStyleById(u"barStyle"), "color") + " " + attr(chart.getStyleById(u"barStyle"), "color2"),
              "white black");
    expectSound(chart);
}

TEST_F(StyleCycles, TheRepositoryHandsOutCyclesByElementKind) {
    struct Row {
        const char *chart, *element, *create, *cycleId, *expected;
    } rows[] = {
        {"line-series.xml", "line_1", "PatternsOnly", "", "[({stroke-dasharray=none;}{stroke-dasharray=2 2;})]"},
        {"simple-bar.xml", "interval_1", "PatternsOnly", "", "[({pattern=3;}{pattern=5;})]"},
        {"scatter.xml", "point_1", "PatternsOnly", "", "[({symbol=square;})]"},
        {"line-series.xml", "line_1", "ColorsOnly", "", "[({color=gray;})]"}, // the last colour cycle counts
        // Points take colours as outlines, unless their cycle is the one kept filled.
        {"scatter.xml", "point_1", "ColorsOnly", "", "[({color=transparent;color2=gray;})]"},
        {"scatter.xml", "point_1", "ColorsOnly", "styleCycleColor", "[({color=gray;})]"},
        // Without a creation type only a bar with several style-bys is restyled.
        {"scatter.xml", "point_1", "", "", "[({color=black;})]"},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(std::string(row.chart) + " " + row.create + " " + row.cycleId);
        GrxVisualization& chart = sample(row.chart);
        GrxStyleBy& made = styleBy(chart, row.element, "styleBy_new");
        GrxStyleCycle& own = chart.addStyleCycle(ChartString(*row.cycleId ? row.cycleId : "own"));
        own.addCycle().addStyle().setColor(ChartString("black"));
        made.setCycle(own);
        EXPECT_TRUE(act<TStyleCycle>(repository(row.create), chart));
        EXPECT_EQ(stylesOf(chart, "styleBy_new"), row.expected);
        // The repository holds the instruction's cycles; copies never change it.
        EXPECT_EQ(describeStyles(chart.getExtension()->getStyleCycleRepository()->getImplementation()),
                  "[({color=red;}{color=blue;})({color=gray;})({pattern=3;}{pattern=5;})({stroke-dasharray=none;}"
                  "{stroke-dasharray=2 2;})({symbol=square;})]");
        expectSound(chart);
    }
    GrxVisualization& bars = sample("simple-bar.xml");
    styleBy(bars, "interval_1", "color_by");
    styleBy(bars, "interval_1", "pattern_by");
    act<TStyleCycle>(repository(""), bars);
    EXPECT_EQ(stylesOf(bars, "color_by") + stylesOf(bars, "pattern_by"),
              "[({color=gray;})][({pattern=3;}{pattern=5;})]");
}

TEST_F(StyleCycles, LabelingsOnlyWhenTheyAreNamed) {
    GrxVisualization& chart = sample("simple-bar.xml");
    GrxStyleBy& onLabel = byId<GrxLabeling>(chart, "labeling_1")->addStyleBy();
    onLabel.setId(ChartString("labelStyleBy"));
    styleBy(chart, "interval_1", "elementStyleBy");
    const char* const body = "<setStyleCycle elementType=\"labeling\"><cycle><style color=\"red\"/></cycle></setStyleCycle>";
    act<TStyleCycle>(body, chart);
    EXPECT_EQ(stylesOf(chart, "labelStyleBy"), "[({color=red;})]");
    EXPECT_EQ(stylesOf(chart, "elementStyleBy"), "");
}

TEST_F(StyleCycles, AddedStyleBysTakeTheFirstAestheticVariable) {
    GrxVisualization& chart = sample("simple-bar.xml");
    byId<CTAesthetic>(chart, "color_1")->removeVariable(); // the first aesthetic must have a variable
    act<TAddStyleCycle>("<addStyleCycle elementName=\"y\"><cycle/></addStyleCycle>", chart);
    EXPECT_EQ(byId<CTElementType>(chart, "interval_1")->getY()->first<GrxStyleBy>(), nullptr);
    byId<CTAesthetic>(chart, "color_1")->setVariable(*byId<CTVariableType>(chart, "var_jobcat"));
    const std::string before = canonical(chart);
    for (const char* refused : {"<addStyleCycle elementName=\"color\"/>",
                                "<addStyleCycle><cycle><style color=\"red\"/></cycle></addStyleCycle>"})
        EXPECT_FALSE(act<TAddStyleCycle>(refused, chart)) << refused;
    // The second colour does not exist; a style is no child of an element; y's element has an aesthetic.
    for (const char* nothing : {"<addStyleCycle elementName=\"color\" count=\"2\"><cycle/></addStyleCycle>",
                                "<addStyleCycle elementName=\"style\"><cycle/></addStyleCycle>"})
        EXPECT_TRUE(act<TAddStyleCycle>(nothing, chart)) << nothing;
    EXPECT_EQ(canonical(chart), before);

    act<TAddStyleCycle>("<addStyleCycle elementName=\"y\"><cycle><style color=\"red\"/></cycle></addStyleCycle>", chart);
    const GrxStyleBy* added = byId<CTElementType>(chart, "interval_1")->getY()->first<GrxStyleBy>();
    ASSERT_NE(added, nullptr);
    EXPECT_EQ(attr(added, "variable"), "var_jobcat");
    EXPECT_EQ(describeStyles(added->getCycle()->getImplementation()), "[({color=red;})]");
    expectSound(chart);
}

} // namespace
