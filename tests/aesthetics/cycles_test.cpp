// "setDash", "setShape", "setPattern" and "setSize": a new cycle per selected aesthetic, the white
// fill under patterns, and sizes given as explicit length mappings.
#include "AestheticsSupport.h"

#include "templates/actions/aesthetics.h"

using namespace aesthetics_test;
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
const std::string kSeries = chartWith(
    "<line id='line_1' coordinates='coordinates_1'><dash id='dash_1' variable='var_a' cycle='chartCycle'/>"
    "<size id='lineSize' variable='var_b' low='1pt' high='3pt'/></line>"
    "<line id='line_2' coordinates='coordinates_1'><dash id='dash_2' variable='var_a' "
    "cycle='chartCycle'/></line>"
    "<point id='point_1' coordinates='coordinates_1'><shape id='shape_1' variable='var_a' "
    "cycle='chartCycle'/>"
    "<size id='pointSize' variable='var_b' low='2pt' high='8pt' cycle='chartCycle' "
    "domain='domain_a'/></point>");

using SetDashAndShape = AestheticsTest;

TEST_F(SetDashAndShape, EachSelectedAestheticGetsACycleOfItsOwn) {
    GrxVisualization& chart = parse(kSeries);
    const std::size_t cyclesBefore = chart.getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetDash>(kSetDash, chart));
    // Unlike colours, two lines do not share: one cycle each.
    EXPECT_EQ(chart.getStyleCycles().size(), cyclesBefore + 2);
    EXPECT_NE(cycleIdOf(chart, "dash_1"), cycleIdOf(chart, "dash_2"));
    EXPECT_EQ(stylesOf(chart, "dash_1"), kDashStyles);
    EXPECT_EQ(stylesOf(chart, "dash_2"), kDashStyles);
    // Shapes and sizes are not dashes.
    EXPECT_EQ(cycleIdOf(chart, "shape_1"), "chartCycle");
    EXPECT_EQ(cycleIdOf(chart, "pointSize"), "chartCycle");
    // Nor are colours and style-bys.
    GrxVisualization& lines = sample("line-series.xml");
    EXPECT_TRUE(applyAction<TSetDash>(kSetDash, lines));
    EXPECT_EQ(stylesOf(lines, "dash_1"), kDashStyles);
    EXPECT_EQ(cycleIdOf(lines, "color_1"), "styleCycleColor");
    EXPECT_EQ(cycleIdOf(lines, "styleBy_dash"), "styleCycleDash");

    EXPECT_TRUE(applyAction<TSetShape>(kSetShape, chart));
    EXPECT_EQ(stylesOf(chart, "shape_1"), "[({symbol=triangle;})]");
    EXPECT_EQ(stylesOf(chart, "dash_1"), kDashStyles);
}

TEST_F(SetDashAndShape, AnAestheticNumberAMissingCycleAndTheLastCycleChildDecide) {
    GrxVisualization& chart = parse(kSeries);
    const std::string before = chart.AsUTF8();
    EXPECT_TRUE(applyAction<TSetDash>("<setDash aestheticNumber='2'>" + kDashes + "</setDash>", chart));
    EXPECT_TRUE(applyAction<TSetDash>("<setDash/>", chart));
    EXPECT_TRUE(applyAction<TSetShape>("<setShape><style symbol='square'/></setShape>", chart));
    EXPECT_EQ(chart.AsUTF8(), before);

    EXPECT_TRUE(applyAction<TSetDash>(
        "<setDash><cycle><style stroke-dasharray='9 9'/></cycle>" + kDashes + "</setDash>", chart));
    EXPECT_EQ(stylesOf(chart, "dash_1"), kDashStyles);
}

TEST_F(SetDashAndShape, TheSourceGuardsEachAestheticItGivesACycle) {
    GrxVisualization& chart = parse(kSeries);
    GrxVisualization& source = parse(kSeries);
    byId<GrxDash>(source, "dash_2")->removeCycle();
    EXPECT_TRUE(applyAction<TSetDash>(kSetDash, chart, &source));
    EXPECT_EQ(cycleIdOf(chart, "dash_1"), "chartCycle");
    EXPECT_EQ(stylesOf(chart, "dash_2"), kDashStyles);

    const std::string before = chart.AsUTF8();
    EXPECT_TRUE(applyAction<TSetShape>(kSetShape, chart, &source));
    EXPECT_EQ(chart.AsUTF8(), before);
}

// ---- setPattern ---------------------------------------------------------------------------------

const std::string kPatterns =
    chartWith("<interval id='styled' style='plainStyle' coordinates='coordinates_1'>"
              "<pattern id='pattern_1' variable='var_a' cycle='chartCycle'/></interval>"
              "<area id='bare' coordinates='coordinates_1'><pattern id='pattern_2' variable='var_a'/></area>"
              "<line id='plain' style='otherStyle' coordinates='coordinates_1'/>");
const std::string kSetPattern =
    "<setPattern><cycle><style pattern='3'/><style pattern='5'/></cycle></setPattern>";
const std::string kPatternStyles = "[({pattern=3;}{pattern=5;})]";

using SetPattern = AestheticsTest;

TEST_F(SetPattern, PatternsGetANewCycleOverAWhiteFillOnce) {
    GrxVisualization& chart = parse(kPatterns);
    EXPECT_TRUE(applyAction<TSetPattern>(kSetPattern, chart));
    EXPECT_EQ(stylesOf(chart, "pattern_1"), kPatternStyles);
    EXPECT_EQ(stylesOf(chart, "pattern_2"), kPatternStyles);
    // Without a source the chart's own style colour gives way to white.
    EXPECT_EQ(attribute(*byId<GrxStyle>(chart, "plainStyle"), "color"), "white");
    // An element without a style gets one of the template's, white, in the container.
    GrxStyle* made = byId<GrxArea>(chart, "bare")->getStyle();
    ASSERT_NE(made, nullptr);
    EXPECT_EQ(attribute(*made, "color"), "white");
    const auto* holder =
        static_cast<const XERCES_CPP_NAMESPACE::DOMElement*>(made->getImplementation()->getParentNode());
    EXPECT_EQ(text(holder->getAttribute(u"id")), "c-o-n-t-a-i-n-er");
    // No pattern on the line: its style keeps its colours.
    EXPECT_FALSE(byId<GrxStyle>(chart, "otherStyle")->isColorPresent());
    EXPECT_EQ(grammar_test::chartFaults(chart), "");

    // A second application makes no second style.
    const std::string once = canonical(chart);
    const std::size_t cycles = chart.getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetPattern>(kSetPattern, chart));
    EXPECT_EQ(canonical(chart), once);
    EXPECT_EQ(chart.getStyleCycles().size(), cycles + 2);
}

TEST_F(SetPattern, ASourceStyleColourStaysAndWithoutACycleTheFillStillTurnsWhite) {
    GrxVisualization& chart = parse(kPatterns);
    GrxVisualization& source = parse(kPatterns);
    EXPECT_TRUE(applyAction<TSetPattern>(kSetPattern, chart, &source));
    EXPECT_EQ(attribute(*byId<GrxStyle>(chart, "plainStyle"), "color"), "#112233");
    // The source sets pattern_1's cycle, so it stays; pattern_2 has none there and is replaced.
    EXPECT_EQ(cycleIdOf(chart, "pattern_1"), "chartCycle");
    EXPECT_EQ(stylesOf(chart, "pattern_2"), kPatternStyles);
    EXPECT_EQ(attribute(*byId<GrxArea>(chart, "bare")->getStyle(), "color"), "white");

    GrxVisualization& bare = parse(kPatterns);
    EXPECT_TRUE(applyAction<TSetPattern>("<setPattern/>", bare));
    EXPECT_EQ(cycleIdOf(bare, "pattern_1"), "chartCycle");
    EXPECT_EQ(attribute(*byId<GrxStyle>(bare, "plainStyle"), "color"), "white");
}

// ---- setSize --------------------------------------------------------------------------------------

using SetSize = AestheticsTest;

const std::string kMappings = "<parameter name='small' value='2pt'/><parameter name='large' value='9pt'/>";

std::string mappingsOf(const GrxVisualization& chart, const char* id) {
    std::string out;
    for (const GrxLengthMapping* m : byId<GrxSize>(chart, id)->getLengthMappings())
        out += text(m->getFrom()) + "=" + text(m->getTo()) + " ";
    return out;
}

TEST_F(SetSize, ParametersReplaceLowHighCycleAndDomainByMappingsInOrder) {
    GrxVisualization& chart = parse(kSeries);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize>" + kMappings + kDashes + "</setSize>", chart));
    for (const char* id : {"lineSize", "pointSize"}) {
        SCOPED_TRACE(id);
        const GrxSize& size = *byId<GrxSize>(chart, id);
        EXPECT_EQ(mappingsOf(chart, id), "small=2pt large=9pt ");
        // The cycle child is ignored then.
        EXPECT_FALSE(size.isLowPresent() || size.isHighPresent() || size.isCyclePresent() ||
                     size.isDomainPresent());
        EXPECT_EQ(attribute(size, "variable"), "var_b");
    }
    EXPECT_EQ(grammar_test::chartFaults(chart), "");

    // Without parameters the cycle is replaced and the rest stays.
    GrxVisualization& cycled = parse(kSeries);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize><cycle><style size='5pt'/></cycle></setSize>", cycled));
    EXPECT_EQ(stylesOf(cycled, "pointSize"), "[({size=5pt;})]");
    EXPECT_EQ(attribute(*byId<GrxSize>(cycled, "pointSize"), "low"), "2pt");
    EXPECT_EQ(mappingsOf(cycled, "pointSize"), "");
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
        GrxVisualization& chart = parse(kSeries);
        EXPECT_TRUE(applyAction<TSetSize>(
            std::string("<setSize elementType='") + c.elementType + "'>" + kMappings + "</setSize>", chart));
        EXPECT_EQ(mappingsOf(chart, "lineSize").empty(), !c.line);
        EXPECT_EQ(mappingsOf(chart, "pointSize").empty(), !c.point);
    }
    // The point's size has a cycle in the source; the line's has none.
    GrxVisualization& chart = parse(kSeries);
    GrxVisualization& source = parse(kSeries);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize>" + kMappings + "</setSize>", chart, &source));
    EXPECT_EQ(mappingsOf(chart, "pointSize"), "");
    EXPECT_EQ(attribute(*byId<GrxSize>(chart, "pointSize"), "low"), "2pt");
    EXPECT_EQ(mappingsOf(chart, "lineSize"), "small=2pt large=9pt ");
}

TEST_F(SetSize, MappingsOfAnEarlierApplicationAreReplacedNotExtended) {
    GrxVisualization& chart = parse(kSeries);
    const std::string instruction = "<setSize elementType='point'>" + kMappings + "</setSize>";
    EXPECT_TRUE(applyAction<TSetSize>(instruction, chart));
    const std::string once = canonical(chart);
    EXPECT_TRUE(applyAction<TSetSize>(instruction, chart));
    EXPECT_EQ(canonical(chart), once);
    // A later template with other values takes effect instead of landing behind the first one's.
    EXPECT_TRUE(applyAction<TSetSize>(
        "<setSize elementType='point'><parameter name='small' value='1pt'/></setSize>", chart));
    EXPECT_EQ(mappingsOf(chart, "pointSize"), "small=1pt ");
}

} // namespace
