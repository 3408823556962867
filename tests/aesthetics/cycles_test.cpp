// "setDash", "setShape", "setPattern" and "setSize": a new cycle per selected aesthetic, the white
// fill under patterns, and sizes given as explicit length mappings.
#include "AestheticsSupport.h"

#include "templates/actions/aesthetics.h"

#include <xercesc/dom/DOM.hpp>

using namespace aesthetics_test;
using engine_test::EngineTest;
using plotaid::detail::TSetDash;
using plotaid::detail::TSetPattern;
using plotaid::detail::TSetShape;
using plotaid::detail::TSetSize;
using XERCES_CPP_NAMESPACE::DOMElement;

namespace {

const std::string kCycle =
    "<cycle><style stroke-dasharray=\"4 4\"/><style stroke-dasharray=\"1 3\"/></cycle>";
const std::vector<std::map<std::string, std::string>> kTemplateStyles = {{{"stroke-dasharray", "4 4"}},
                                                                         {{"stroke-dasharray", "1 3"}}};

// Two lines with a dash each and a point with a shape and a size.
const std::string kSeries = "    <line id=\"line_1\" coordinates=\"coordinates_1\">\n"
                            "      <dash id=\"dash_1\" variable=\"var_a\" cycle=\"chartCycle\"/>\n"
                            "      <size id=\"lineSize\" variable=\"var_b\" low=\"1pt\" high=\"3pt\"/>\n"
                            "    </line>\n"
                            "    <line id=\"line_2\" coordinates=\"coordinates_1\">\n"
                            "      <dash id=\"dash_2\" variable=\"var_a\" cycle=\"chartCycle\"/>\n"
                            "    </line>\n"
                            "    <point id=\"point_1\" coordinates=\"coordinates_1\">\n"
                            "      <shape id=\"shape_1\" variable=\"var_a\" cycle=\"chartCycle\"/>\n"
                            "      <size id=\"pointSize\" variable=\"var_b\" low=\"2pt\" high=\"8pt\" "
                            "cycle=\"chartCycle\" domain=\"domain_a\"/>\n"
                            "    </point>\n";

using SetDashAndShape = EngineTest;

TEST_F(SetDashAndShape, EachSelectedAestheticGetsACycleOfItsOwn) {
    Chart chart = Chart::parse(chartWith(kSeries));
    ASSERT_TRUE(chart.vis);
    const std::size_t cyclesBefore = chart.vis->getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetDash>("<setDash>" + kCycle + "</setDash>", *chart.vis));
    // Unlike colours, two lines do not share: one cycle each.
    EXPECT_EQ(chart.vis->getStyleCycles().size(), cyclesBefore + 2);
    EXPECT_NE(cycleIdOf(*chart.vis, "dash_1"), cycleIdOf(*chart.vis, "dash_2"));
    EXPECT_EQ(cycleStylesOf(*chart.vis, "dash_1"), kTemplateStyles);
    EXPECT_EQ(cycleStylesOf(*chart.vis, "dash_2"), kTemplateStyles);
    // Shapes and sizes are not dashes.
    EXPECT_EQ(cycleIdOf(*chart.vis, "shape_1"), "chartCycle");
    EXPECT_EQ(cycleIdOf(*chart.vis, "pointSize"), "chartCycle");

    EXPECT_TRUE(applyAction<TSetShape>("<setShape><cycle><style symbol=\"triangle\"/></cycle></setShape>",
                                       *chart.vis));
    const std::vector<std::map<std::string, std::string>> triangle = {{{"symbol", "triangle"}}};
    EXPECT_EQ(cycleStylesOf(*chart.vis, "shape_1"), triangle);
    EXPECT_EQ(cycleStylesOf(*chart.vis, "dash_1"), kTemplateStyles);
}

TEST_F(SetDashAndShape, OnTheSampleChartsOnlyTheDashOrShapeChanges) {
    Chart lines = Chart::parse(engine_test::example("charts/line-series.xml"));
    ASSERT_TRUE(lines.vis);
    EXPECT_TRUE(applyAction<TSetDash>("<setDash>" + kCycle + "</setDash>", *lines.vis));
    EXPECT_EQ(cycleStylesOf(*lines.vis, "dash_1"), kTemplateStyles);
    EXPECT_EQ(cycleIdOf(*lines.vis, "color_1"), "styleCycleColor");
    EXPECT_EQ(cycleIdOf(*lines.vis, "styleBy_dash"), "styleCycleDash");

    Chart points = Chart::parse(engine_test::example("charts/scatter.xml"));
    ASSERT_TRUE(points.vis);
    EXPECT_TRUE(applyAction<TSetShape>("<setShape><cycle><style symbol=\"square\"/></cycle></setShape>",
                                       *points.vis));
    EXPECT_EQ(cycleStylesOf(*points.vis, "shape_1"),
              (std::vector<std::map<std::string, std::string>>{{{"symbol", "square"}}}));
    EXPECT_EQ(cycleIdOf(*points.vis, "color_1"), "styleCycleRepository");
}

TEST_F(SetDashAndShape, AnAestheticNumberAndAMissingCycleLimitWhatChanges) {
    Chart chart = Chart::parse(chartWith(kSeries));
    ASSERT_TRUE(chart.vis);
    const std::string before = chart.vis->AsUTF8();
    EXPECT_TRUE(applyAction<TSetDash>("<setDash aestheticNumber=\"2\">" + kCycle + "</setDash>", *chart.vis));
    EXPECT_TRUE(applyAction<TSetDash>("<setDash/>", *chart.vis));
    EXPECT_TRUE(applyAction<TSetShape>("<setShape><style symbol=\"square\"/></setShape>", *chart.vis));
    EXPECT_EQ(chart.vis->AsUTF8(), before);
}

TEST_F(SetDashAndShape, TheLastCycleChildCounts) {
    Chart chart = Chart::parse(chartWith(kSeries));
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetDash>(
        "<setDash><cycle><style stroke-dasharray=\"9 9\"/></cycle>" + kCycle + "</setDash>", *chart.vis));
    EXPECT_EQ(cycleStylesOf(*chart.vis, "dash_1"), kTemplateStyles);
}

TEST_F(SetDashAndShape, TheSourceGuardsEachAestheticItGivesACycle) {
    const std::string text = chartWith(kSeries);
    Chart chart = Chart::parse(text);
    Chart source = Chart::parse(text);
    ASSERT_TRUE(chart.vis && source.vis);
    byId<GrxDash>(*source.vis, "dash_2")->removeCycle();
    EXPECT_TRUE(applyAction<TSetDash>("<setDash>" + kCycle + "</setDash>", *chart.vis, source.vis.get()));
    EXPECT_EQ(cycleIdOf(*chart.vis, "dash_1"), "chartCycle");
    EXPECT_EQ(cycleStylesOf(*chart.vis, "dash_2"), kTemplateStyles);

    const std::string before = chart.vis->AsUTF8();
    EXPECT_TRUE(applyAction<TSetShape>("<setShape><cycle><style symbol=\"square\"/></cycle></setShape>",
                                       *chart.vis, source.vis.get()));
    EXPECT_EQ(chart.vis->AsUTF8(), before);
}

TEST_F(SetDashAndShape, AppliedTwiceTheyReplaceRatherThanAppend) {
    for (const std::string& instruction :
         {"<setDash>" + kCycle + "</setDash>",
          std::string("<setShape><cycle><style symbol=\"x\"/></cycle></setShape>")}) {
        Chart once = Chart::parse(chartWith(kSeries));
        Chart twice = Chart::parse(chartWith(kSeries));
        ASSERT_TRUE(once.vis && twice.vis);
        if (instruction.rfind("<setDash", 0) == 0) {
            applyAction<TSetDash>(instruction, *once.vis);
            applyAction<TSetDash>(instruction, *twice.vis);
            applyAction<TSetDash>(instruction, *twice.vis);
        } else {
            applyAction<TSetShape>(instruction, *once.vis);
            applyAction<TSetShape>(instruction, *twice.vis);
            applyAction<TSetShape>(instruction, *twice.vis);
        }
        EXPECT_EQ(canonical(*twice.vis), canonical(*once.vis)) << instruction;
        EXPECT_GT(orphanedStyleCycles(*twice.vis), orphanedStyleCycles(*once.vis)) << instruction;
    }
}

// ---- setPattern ---------------------------------------------------------------------------------

const std::string kPatterns =
    "    <interval id=\"styled\" style=\"plainStyle\" coordinates=\"coordinates_1\">\n"
    "      <pattern id=\"pattern_1\" variable=\"var_a\" cycle=\"chartCycle\"/>\n"
    "    </interval>\n"
    "    <area id=\"bare\" coordinates=\"coordinates_1\">\n"
    "      <pattern id=\"pattern_2\" variable=\"var_a\"/>\n"
    "    </area>\n"
    "    <line id=\"plain\" style=\"otherStyle\" coordinates=\"coordinates_1\"/>\n";
const std::string kPatternCycle = "<cycle><style pattern=\"3\"/><style pattern=\"5\"/></cycle>";

using SetPattern = EngineTest;

TEST_F(SetPattern, PatternsGetANewCycleOverAWhiteFill) {
    Chart chart = Chart::parse(chartWith(kPatterns));
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetPattern>("<setPattern>" + kPatternCycle + "</setPattern>", *chart.vis));
    const std::vector<std::map<std::string, std::string>> patterns = {{{"pattern", "3"}}, {{"pattern", "5"}}};
    EXPECT_EQ(cycleStylesOf(*chart.vis, "pattern_1"), patterns);
    EXPECT_EQ(cycleStylesOf(*chart.vis, "pattern_2"), patterns);

    // Without a source the chart's own style colour gives way to white.
    EXPECT_EQ(attribute(*byId<GrxStyle>(*chart.vis, "plainStyle"), "color"), "white");
    // An element without a style gets one of the template's, white, in the container.
    GrxStyle* made = byId<GrxArea>(*chart.vis, "bare")->getStyle();
    ASSERT_NE(made, nullptr);
    EXPECT_EQ(attribute(*made, "color"), "white");
    const auto* holder = static_cast<const DOMElement*>(made->getImplementation()->getParentNode());
    EXPECT_EQ(text(holder->getAttribute(u"id")), "c-o-n-t-a-i-n-er");
    // No pattern on the line: its style keeps its colours.
    EXPECT_FALSE(byId<GrxStyle>(*chart.vis, "otherStyle")->isColorPresent());
    EXPECT_EQ(xercesProblems(*chart.vis), "");
}

TEST_F(SetPattern, AColourThatTheSourceStyleSetsStays) {
    const std::string text = chartWith(kPatterns);
    Chart chart = Chart::parse(text);
    Chart source = Chart::parse(text);
    ASSERT_TRUE(chart.vis && source.vis);
    EXPECT_TRUE(applyAction<TSetPattern>("<setPattern>" + kPatternCycle + "</setPattern>", *chart.vis,
                                         source.vis.get()));
    EXPECT_EQ(attribute(*byId<GrxStyle>(*chart.vis, "plainStyle"), "color"), "#112233");
    // The source sets pattern_1's cycle, so it stays; pattern_2 has none there and is replaced.
    EXPECT_EQ(cycleIdOf(*chart.vis, "pattern_1"), "chartCycle");
    EXPECT_EQ(cycleStylesOf(*chart.vis, "pattern_2").size(), 2u);
    EXPECT_EQ(attribute(*byId<GrxArea>(*chart.vis, "bare")->getStyle(), "color"), "white");
}

TEST_F(SetPattern, WithoutACycleTheFillStillTurnsWhite) {
    Chart chart = Chart::parse(chartWith(kPatterns));
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetPattern>("<setPattern/>", *chart.vis));
    EXPECT_EQ(cycleIdOf(*chart.vis, "pattern_1"), "chartCycle");
    EXPECT_EQ(attribute(*byId<GrxStyle>(*chart.vis, "plainStyle"), "color"), "white");
}

TEST_F(SetPattern, AppliedTwiceItMakesNoSecondStyle) {
    Chart once = Chart::parse(chartWith(kPatterns));
    Chart twice = Chart::parse(chartWith(kPatterns));
    ASSERT_TRUE(once.vis && twice.vis);
    const std::string instruction = "<setPattern>" + kPatternCycle + "</setPattern>";
    applyAction<TSetPattern>(instruction, *once.vis);
    applyAction<TSetPattern>(instruction, *twice.vis);
    applyAction<TSetPattern>(instruction, *twice.vis);
    EXPECT_EQ(canonical(*twice.vis), canonical(*once.vis));
    EXPECT_EQ(twice.vis->getStyleCycles().size(), once.vis->getStyleCycles().size() + 2);
}

// ---- setSize --------------------------------------------------------------------------------------

using SetSize = EngineTest;

const std::string kMappings =
    "<parameter name=\"small\" value=\"2pt\"/><parameter name=\"large\" value=\"9pt\"/>";

std::vector<std::pair<std::string, std::string>> mappingsOf(const GrxSize& size) {
    std::vector<std::pair<std::string, std::string>> out;
    for (const GrxLengthMapping* m : size.getLengthMappings())
        out.emplace_back(text(m->getFrom()), text(m->getTo()));
    return out;
}

TEST_F(SetSize, ParametersReplaceLowHighCycleAndDomainByMappingsInOrder) {
    Chart chart = Chart::parse(chartWith(kSeries));
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize>" + kMappings + kCycle + "</setSize>", *chart.vis));
    const std::vector<std::pair<std::string, std::string>> expected = {{"small", "2pt"}, {"large", "9pt"}};
    for (const char* id : {"lineSize", "pointSize"}) {
        const GrxSize& size = *byId<GrxSize>(*chart.vis, id);
        EXPECT_EQ(mappingsOf(size), expected) << id;
        EXPECT_FALSE(size.isLowPresent()) << id;
        EXPECT_FALSE(size.isHighPresent()) << id;
        EXPECT_FALSE(size.isCyclePresent()) << id; // the cycle child is ignored then
        EXPECT_FALSE(size.isDomainPresent()) << id;
        EXPECT_EQ(attribute(size, "variable"), "var_b") << id;
    }
    EXPECT_EQ(xercesProblems(*chart.vis), "");
}

TEST_F(SetSize, WithoutParametersTheCycleIsReplaced) {
    Chart chart = Chart::parse(chartWith(kSeries));
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize><cycle><style size=\"5pt\"/></cycle></setSize>", *chart.vis));
    EXPECT_EQ(cycleStylesOf(*chart.vis, "pointSize"),
              (std::vector<std::map<std::string, std::string>>{{{"size", "5pt"}}}));
    const GrxSize& size = *byId<GrxSize>(*chart.vis, "pointSize");
    EXPECT_EQ(text(size.getLow()), "2pt");
    EXPECT_TRUE(size.getLengthMappings().empty());
}

TEST_F(SetSize, TheElementTypeChoosesWhichElementsChange) {
    struct Case {
        const char* elementType;
        bool line;
        bool point;
    };
    for (const Case c : {Case{"line", true, false}, Case{"point", false, true},
                         Case{"labeling", false, false}, Case{"interval", false, false},
                         Case{"element", true, true}, Case{"bogus", true, true}, Case{"", true, true}}) {
        Chart chart = Chart::parse(chartWith(kSeries));
        ASSERT_TRUE(chart.vis);
        EXPECT_TRUE(applyAction<TSetSize>(std::string("<setSize elementType=\"") + c.elementType + "\">" +
                                              kMappings + "</setSize>",
                                          *chart.vis));
        EXPECT_EQ(byId<GrxSize>(*chart.vis, "lineSize")->getLengthMappings().size(), c.line ? 2u : 0u)
            << c.elementType;
        EXPECT_EQ(byId<GrxSize>(*chart.vis, "pointSize")->getLengthMappings().size(), c.point ? 2u : 0u)
            << c.elementType;
    }
}

TEST_F(SetSize, TheSourceGuardsSizesWithACycle) {
    const std::string text = chartWith(kSeries);
    Chart chart = Chart::parse(text);
    Chart source = Chart::parse(text);
    ASSERT_TRUE(chart.vis && source.vis);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize>" + kMappings + "</setSize>", *chart.vis, source.vis.get()));
    // The point's size has a cycle in the source; the line's has none.
    EXPECT_TRUE(byId<GrxSize>(*chart.vis, "pointSize")->getLengthMappings().empty());
    EXPECT_EQ(aesthetics_test::text(byId<GrxSize>(*chart.vis, "pointSize")->getLow()), "2pt");
    EXPECT_EQ(byId<GrxSize>(*chart.vis, "lineSize")->getLengthMappings().size(), 2u);
}

TEST_F(SetSize, MappingsOfAnEarlierApplicationAreReplacedNotExtended) {
    Chart chart = Chart::parse(chartWith(kSeries));
    ASSERT_TRUE(chart.vis);
    const std::string instruction = "<setSize elementType=\"point\">" + kMappings + "</setSize>";
    EXPECT_TRUE(applyAction<TSetSize>(instruction, *chart.vis));
    const std::string once = canonical(*chart.vis);
    EXPECT_TRUE(applyAction<TSetSize>(instruction, *chart.vis));
    EXPECT_EQ(canonical(*chart.vis), once);
    // A later template with other values takes effect instead of landing behind the first one's.
    EXPECT_TRUE(applyAction<TSetSize>(
        "<setSize elementType=\"point\"><parameter name=\"small\" value=\"1pt\"/></setSize>", *chart.vis));
    EXPECT_EQ(mappingsOf(*byId<GrxSize>(*chart.vis, "pointSize")),
              (std::vector<std::pair<std::string, std::string>>{{"small", "1pt"}}));
}

} // namespace
