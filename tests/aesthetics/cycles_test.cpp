// "setDash", "setShape", "setPattern" and "setSize": a new cycle per selected aesthetic, the white
// fill under patterns, and sizes given as explicit length mappings.
#include "AestheticsSupport.h"

#include "templates/actions/aesthetics.h"

using namespace aesthetics_test;
using engine_test::EngineTest;
using plotaid::detail::TSetDash;
using plotaid::detail::TSetPattern;
using plotaid::detail::TSetShape;
using plotaid::detail::TSetSize;

namespace {

const std::string kDashes = "<cycle><style stroke-dasharray='4 4'/><style stroke-dasharray='1 3'/></cycle>";
const std::string kDashStyles = "[({stroke-dasharray=4 4;}{stroke-dasharray=1 3;})]";
const std::string kSetDash = "<setDash>" + kDashes + "</setDash>";
const std::string kSetShape = "<setShape><cycle><style symbol='triangle'/></cycle></setShape>";

// Two lines with a dash each and a point with a shape and a size.
const std::string kSeries = chartWith("    <line id='line_1' coordinates='coordinates_1'>\n"
                                      "      <dash id='dash_1' variable='var_a' cycle='chartCycle'/>\n"
                                      "      <size id='lineSize' variable='var_b' low='1pt' high='3pt'/>\n"
                                      "    </line>\n"
                                      "    <line id='line_2' coordinates='coordinates_1'>\n"
                                      "      <dash id='dash_2' variable='var_a' cycle='chartCycle'/>\n"
                                      "    </line>\n"
                                      "    <point id='point_1' coordinates='coordinates_1'>\n"
                                      "      <shape id='shape_1' variable='var_a' cycle='chartCycle'/>\n"
                                      "      <size id='pointSize' variable='var_b' low='2pt' high='8pt' "
                                      "cycle='chartCycle' domain='domain_a'/>\n"
                                      "    </point>\n");

using SetDashAndShape = EngineTest;

TEST_F(SetDashAndShape, EachSelectedAestheticGetsACycleOfItsOwn) {
    Chart chart = Chart::parse(kSeries);
    ASSERT_TRUE(chart.vis);
    const std::size_t cyclesBefore = chart.vis->getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetDash>(kSetDash, *chart.vis));
    // Unlike colours, two lines do not share: one cycle each.
    EXPECT_EQ(chart.vis->getStyleCycles().size(), cyclesBefore + 2);
    EXPECT_NE(cycleIdOf(*chart.vis, "dash_1"), cycleIdOf(*chart.vis, "dash_2"));
    EXPECT_EQ(stylesOf(*chart.vis, "dash_1"), kDashStyles);
    EXPECT_EQ(stylesOf(*chart.vis, "dash_2"), kDashStyles);
    // Shapes and sizes are not dashes.
    EXPECT_EQ(cycleIdOf(*chart.vis, "shape_1"), "chartCycle");
    EXPECT_EQ(cycleIdOf(*chart.vis, "pointSize"), "chartCycle");

    EXPECT_TRUE(applyAction<TSetShape>(kSetShape, *chart.vis));
    EXPECT_EQ(stylesOf(*chart.vis, "shape_1"), "[({symbol=triangle;})]");
    EXPECT_EQ(stylesOf(*chart.vis, "dash_1"), kDashStyles);
}

TEST_F(SetDashAndShape, AnAestheticNumberAMissingCycleAndTheLastCycleChildDecide) {
    Chart chart = Chart::parse(kSeries);
    ASSERT_TRUE(chart.vis);
    const std::string before = chart.vis->AsUTF8();
    EXPECT_TRUE(applyAction<TSetDash>("<setDash aestheticNumber='2'>" + kDashes + "</setDash>", *chart.vis));
    EXPECT_TRUE(applyAction<TSetDash>("<setDash/>", *chart.vis));
    EXPECT_TRUE(applyAction<TSetShape>("<setShape><style symbol='square'/></setShape>", *chart.vis));
    EXPECT_EQ(chart.vis->AsUTF8(), before);

    EXPECT_TRUE(applyAction<TSetDash>(
        "<setDash><cycle><style stroke-dasharray='9 9'/></cycle>" + kDashes + "</setDash>", *chart.vis));
    EXPECT_EQ(stylesOf(*chart.vis, "dash_1"), kDashStyles);
}

TEST_F(SetDashAndShape, TheSourceGuardsEachAestheticItGivesACycle) {
    Chart chart = Chart::parse(kSeries);
    Chart source = Chart::parse(kSeries);
    ASSERT_TRUE(chart.vis && source.vis);
    byId<GrxDash>(*source.vis, "dash_2")->removeCycle();
    EXPECT_TRUE(applyAction<TSetDash>(kSetDash, *chart.vis, source.vis.get()));
    EXPECT_EQ(cycleIdOf(*chart.vis, "dash_1"), "chartCycle");
    EXPECT_EQ(stylesOf(*chart.vis, "dash_2"), kDashStyles);

    const std::string before = chart.vis->AsUTF8();
    EXPECT_TRUE(applyAction<TSetShape>(kSetShape, *chart.vis, source.vis.get()));
    EXPECT_EQ(chart.vis->AsUTF8(), before);
}

TEST_F(SetDashAndShape, AppliedTwiceTheyReplaceRatherThanAppend) {
    Chart once = Chart::parse(kSeries);
    Chart twice = Chart::parse(kSeries);
    ASSERT_TRUE(once.vis && twice.vis);
    for (GrxVisualization* chart : {once.vis.get(), twice.vis.get(), twice.vis.get()}) {
        applyAction<TSetDash>(kSetDash, *chart);
        applyAction<TSetShape>(kSetShape, *chart);
    }
    EXPECT_EQ(canonical(*twice.vis), canonical(*once.vis));
    EXPECT_EQ(orphanedStyleCycles(*twice.vis), orphanedStyleCycles(*once.vis) + 3);
}

// ---- setPattern ---------------------------------------------------------------------------------

const std::string kPatterns =
    chartWith("    <interval id='styled' style='plainStyle' coordinates='coordinates_1'>\n"
              "      <pattern id='pattern_1' variable='var_a' cycle='chartCycle'/>\n"
              "    </interval>\n"
              "    <area id='bare' coordinates='coordinates_1'>\n"
              "      <pattern id='pattern_2' variable='var_a'/>\n"
              "    </area>\n"
              "    <line id='plain' style='otherStyle' coordinates='coordinates_1'/>\n");
const std::string kSetPattern =
    "<setPattern><cycle><style pattern='3'/><style pattern='5'/></cycle></setPattern>";
const std::string kPatternStyles = "[({pattern=3;}{pattern=5;})]";

using SetPattern = EngineTest;

TEST_F(SetPattern, PatternsGetANewCycleOverAWhiteFillOnce) {
    Chart chart = Chart::parse(kPatterns);
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetPattern>(kSetPattern, *chart.vis));
    EXPECT_EQ(stylesOf(*chart.vis, "pattern_1"), kPatternStyles);
    EXPECT_EQ(stylesOf(*chart.vis, "pattern_2"), kPatternStyles);
    // Without a source the chart's own style colour gives way to white.
    EXPECT_EQ(attribute(*byId<GrxStyle>(*chart.vis, "plainStyle"), "color"), "white");
    // An element without a style gets one of the template's, white, in the container.
    GrxStyle* made = byId<GrxArea>(*chart.vis, "bare")->getStyle();
    ASSERT_NE(made, nullptr);
    EXPECT_EQ(attribute(*made, "color"), "white");
    const auto* holder =
        static_cast<const XERCES_CPP_NAMESPACE::DOMElement*>(made->getImplementation()->getParentNode());
    EXPECT_EQ(text(holder->getAttribute(u"id")), "c-o-n-t-a-i-n-er");
    // No pattern on the line: its style keeps its colours.
    EXPECT_FALSE(byId<GrxStyle>(*chart.vis, "otherStyle")->isColorPresent());
    EXPECT_EQ(grammar_test::chartFaults(*chart.vis), "");

    // A second application makes no second style.
    const std::string once = canonical(*chart.vis);
    const std::size_t cycles = chart.vis->getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetPattern>(kSetPattern, *chart.vis));
    EXPECT_EQ(canonical(*chart.vis), once);
    EXPECT_EQ(chart.vis->getStyleCycles().size(), cycles + 2);
}

TEST_F(SetPattern, ASourceStyleColourStaysAndWithoutACycleTheFillStillTurnsWhite) {
    Chart chart = Chart::parse(kPatterns);
    Chart source = Chart::parse(kPatterns);
    ASSERT_TRUE(chart.vis && source.vis);
    EXPECT_TRUE(applyAction<TSetPattern>(kSetPattern, *chart.vis, source.vis.get()));
    EXPECT_EQ(attribute(*byId<GrxStyle>(*chart.vis, "plainStyle"), "color"), "#112233");
    // The source sets pattern_1's cycle, so it stays; pattern_2 has none there and is replaced.
    EXPECT_EQ(cycleIdOf(*chart.vis, "pattern_1"), "chartCycle");
    EXPECT_EQ(stylesOf(*chart.vis, "pattern_2"), kPatternStyles);
    EXPECT_EQ(attribute(*byId<GrxArea>(*chart.vis, "bare")->getStyle(), "color"), "white");

    Chart bare = Chart::parse(kPatterns);
    ASSERT_TRUE(bare.vis);
    EXPECT_TRUE(applyAction<TSetPattern>("<setPattern/>", *bare.vis));
    EXPECT_EQ(cycleIdOf(*bare.vis, "pattern_1"), "chartCycle");
    EXPECT_EQ(attribute(*byId<GrxStyle>(*bare.vis, "plainStyle"), "color"), "white");
}

// ---- setSize --------------------------------------------------------------------------------------

using SetSize = EngineTest;

const std::string kMappings = "<parameter name='small' value='2pt'/><parameter name='large' value='9pt'/>";

std::string mappingsOf(const GrxVisualization& chart, const char* id) {
    std::string out;
    for (const GrxLengthMapping* m : byId<GrxSize>(chart, id)->getLengthMappings())
        out += text(m->getFrom()) + "=" + text(m->getTo()) + " ";
    return out;
}

TEST_F(SetSize, ParametersReplaceLowHighCycleAndDomainByMappingsInOrder) {
    Chart chart = Chart::parse(kSeries);
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize>" + kMappings + kDashes + "</setSize>", *chart.vis));
    for (const char* id : {"lineSize", "pointSize"}) {
        SCOPED_TRACE(id);
        const GrxSize& size = *byId<GrxSize>(*chart.vis, id);
        EXPECT_EQ(mappingsOf(*chart.vis, id), "small=2pt large=9pt ");
        // The cycle child is ignored then.
        EXPECT_FALSE(size.isLowPresent() || size.isHighPresent() || size.isCyclePresent() ||
                     size.isDomainPresent());
        EXPECT_EQ(attribute(size, "variable"), "var_b");
    }
    EXPECT_EQ(grammar_test::chartFaults(*chart.vis), "");

    // Without parameters the cycle is replaced and the rest stays.
    Chart cycled = Chart::parse(kSeries);
    ASSERT_TRUE(cycled.vis);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize><cycle><style size='5pt'/></cycle></setSize>", *cycled.vis));
    EXPECT_EQ(stylesOf(*cycled.vis, "pointSize"), "[({size=5pt;})]");
    EXPECT_EQ(attribute(*byId<GrxSize>(*cycled.vis, "pointSize"), "low"), "2pt");
    EXPECT_EQ(mappingsOf(*cycled.vis, "pointSize"), "");
}

TEST_F(SetSize, TheElementTypeAndTheSourceChooseWhichSizesChange) {
    struct Case {
        const char* elementType;
        bool line;
        bool point;
    };
    for (const Case c : {Case{"line", true, false}, Case{"point", false, true},
                         Case{"labeling", false, false}, Case{"interval", false, false},
                         Case{"element", true, true}, Case{"bogus", true, true}, Case{"", true, true}}) {
        SCOPED_TRACE(c.elementType);
        Chart chart = Chart::parse(kSeries);
        ASSERT_TRUE(chart.vis);
        EXPECT_TRUE(applyAction<TSetSize>(std::string("<setSize elementType='") + c.elementType + "'>" +
                                              kMappings + "</setSize>",
                                          *chart.vis));
        EXPECT_EQ(mappingsOf(*chart.vis, "lineSize").empty(), !c.line);
        EXPECT_EQ(mappingsOf(*chart.vis, "pointSize").empty(), !c.point);
    }
    // The point's size has a cycle in the source; the line's has none.
    Chart chart = Chart::parse(kSeries);
    Chart source = Chart::parse(kSeries);
    ASSERT_TRUE(chart.vis && source.vis);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize>" + kMappings + "</setSize>", *chart.vis, source.vis.get()));
    EXPECT_EQ(mappingsOf(*chart.vis, "pointSize"), "");
    EXPECT_EQ(attribute(*byId<GrxSize>(*chart.vis, "pointSize"), "low"), "2pt");
    EXPECT_EQ(mappingsOf(*chart.vis, "lineSize"), "small=2pt large=9pt ");
}

TEST_F(SetSize, MappingsOfAnEarlierApplicationAreReplacedNotExtended) {
    Chart chart = Chart::parse(kSeries);
    ASSERT_TRUE(chart.vis);
    const std::string instruction = "<setSize elementType='point'>" + kMappings + "</setSize>";
    EXPECT_TRUE(applyAction<TSetSize>(instruction, *chart.vis));
    const std::string once = canonical(*chart.vis);
    EXPECT_TRUE(applyAction<TSetSize>(instruction, *chart.vis));
    EXPECT_EQ(canonical(*chart.vis), once);
    // A later template with other values takes effect instead of landing behind the first one's.
    EXPECT_TRUE(applyAction<TSetSize>(
        "<setSize elementType='point'><parameter name='small' value='1pt'/></setSize>", *chart.vis));
    EXPECT_EQ(mappingsOf(*chart.vis, "pointSize"), "small=1pt ");
}

} // namespace
