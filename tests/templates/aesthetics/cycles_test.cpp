// "setDash", "setPattern" and "setSize": a new cycle per selected aesthetic (the guard every cycle
// action shares; "setShape" takes the dash's path), the white fill under patterns, sizes as mappings.
#include "AestheticsSupport.h"

using namespace aesthetics_test;
using plotaid::detail::TSetDash;
using plotaid::detail::TSetPattern;
using plotaid::detail::TSetSize;

namespace {

const std::string kDashes = "<cycle><style stroke-dasharray='4 4'/><style stroke-dasharray='1 3'/></cycle>";
const std::string kDashStyles = "[({stroke-dasharray=4 4;}{stroke-dasharray=1 3;})]";
const std::string kSetDash = "<setDash>" + kDashes + "</setDash>";

// Two lines with a dash each, a point with a shape and a size, patterns on a styled interval and
// on an area without a style.
const std::string kSeries = chartWith(
    "<line id='line_1' coordinates='coordinates_1'><dash id='dash_1' variable='var_a' cycle='chartCycle'/>"
    "<size id='lineSize' variable='var_b' low='1pt' high='3pt'/></line>"
    "<line id='line_2' style='otherStyle' coordinates='coordinates_1'><dash id='dash_2' variable='var_a' "
    "cycle='chartCycle'/></line><point id='point_1' coordinates='coordinates_1'><shape id='shape_1' "
    "variable='var_a' cycle='chartCycle'/><size id='pointSize' variable='var_b' low='2pt' high='8pt' "
    "cycle='chartCycle' domain='domain_a'/></point><interval id='styled' style='plainStyle' "
    "coordinates='coordinates_1'><pattern id='pattern_1' variable='var_a' cycle='chartCycle'/></interval>"
    "<area id='bare' coordinates='coordinates_1'><pattern id='pattern_2' variable='var_a'/></area>");

using SetCycles = AestheticsTest;

TEST_F(SetCycles, EachSelectedDashGetsACycleOfItsOwnAndOnlyADashCycleCounts) {
    GrxVisualization& chart = parse(kSeries);
    const std::size_t cyclesBefore = chart.getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetDash>(kSetDash, chart));
    // Unlike colours, two lines do not share.
    EXPECT_EQ(chart.getStyleCycles().size(), cyclesBefore + 2);
    EXPECT_NE(cycleIdOf(chart, "dash_1"), cycleIdOf(chart, "dash_2"));
    EXPECT_EQ(stylesOf(chart, "dash_2"), kDashStyles);
    EXPECT_EQ(cycleIdOf(chart, "shape_1"), "chartCycle");
    EXPECT_EQ(cycleIdOf(chart, "pointSize"), "chartCycle");

    // The last cycle child counts; a number past the list, or no cycle at all, changes nothing.
    GrxVisualization& other = parse(kSeries);
    const std::string before = other.AsUTF8();
    EXPECT_TRUE(applyAction<TSetDash>("<setDash aestheticNumber='2'>" + kDashes + "</setDash>", other));
    EXPECT_TRUE(applyAction<TSetDash>("<setDash><style stroke-dasharray='9 9'/></setDash>", other));
    EXPECT_EQ(other.AsUTF8(), before);
    EXPECT_TRUE(applyAction<TSetDash>(
        "<setDash><cycle><style stroke-dasharray='9 9'/></cycle>" + kDashes + "</setDash>", other));
    EXPECT_EQ(stylesOf(other, "dash_1"), kDashStyles);
}

TEST_F(SetCycles, TheSourceGuardsEachAestheticItGivesACycle) {
    GrxVisualization& chart = parse(kSeries);
    GrxVisualization& source = parse(kSeries);
    byId<GrxDash>(source, "dash_2")->removeCycle();
    EXPECT_TRUE(applyAction<TSetDash>(kSetDash, chart, &source));
    EXPECT_EQ(cycleIdOf(chart, "dash_1"), "chartCycle");
    EXPECT_EQ(stylesOf(chart, "dash_2"), kDashStyles);
}

TEST_F(SetCycles, PatternsGetANewCycleOverAWhiteFillUnlessTheSourceStyleHasAColour) {
    const std::string setPattern = "<setPattern><cycle><style pattern='3'/></cycle></setPattern>";
    GrxVisualization& chart = parse(kSeries);
    EXPECT_TRUE(applyAction<TSetPattern>(setPattern, chart));
    EXPECT_EQ(stylesOf(chart, "pattern_1"), "[({pattern=3;})]");
    EXPECT_EQ(attribute(*byId<GrxStyle>(chart, "plainStyle"), "color"), "white");
    // An element without a style gets a new white one; no pattern on a line, no white there.
    ASSERT_NE(byId<GrxArea>(chart, "bare")->getStyle(), nullptr);
    EXPECT_EQ(attribute(*byId<GrxArea>(chart, "bare")->getStyle(), "color"), "white");
    EXPECT_FALSE(byId<GrxStyle>(chart, "otherStyle")->isColorPresent());
    // A second application makes no second style.
    const std::string once = canonical(chart);
    EXPECT_TRUE(applyAction<TSetPattern>(setPattern, chart));
    EXPECT_EQ(canonical(chart), once);

    GrxVisualization& guarded = parse(kSeries);
    EXPECT_TRUE(applyAction<TSetPattern>(setPattern, guarded, &parse(kSeries)));
    EXPECT_EQ(attribute(*byId<GrxStyle>(guarded, "plainStyle"), "color"), "#112233");
    EXPECT_EQ(attribute(*byId<GrxArea>(guarded, "bare")->getStyle(), "color"), "white");
}

const std::string kMappings = "<parameter name='small' value='2pt'/><parameter name='large' value='9pt'/>";

std::string mappingsOf(const GrxVisualization& chart, const char* id) {
    std::string out;
    for (const GrxLengthMapping* m : byId<GrxSize>(chart, id)->getLengthMappings())
        out += text(m->getFrom()) + "=" + text(m->getTo()) + " ";
    return out;
}

TEST_F(SetCycles, SizeParametersReplaceLowHighCycleAndDomainByMappings) {
    GrxVisualization& chart = parse(kSeries);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize>" + kMappings + kDashes + "</setSize>", chart));
    const GrxSize& size = *byId<GrxSize>(chart, "pointSize");
    EXPECT_EQ(mappingsOf(chart, "pointSize"), "small=2pt large=9pt ");
    EXPECT_FALSE(size.isLowPresent() || size.isHighPresent() || size.isCyclePresent() ||
                 size.isDomainPresent());

    // Without parameters only the cycle is replaced.
    GrxVisualization& cycled = parse(kSeries);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize><cycle><style size='5pt'/></cycle></setSize>", cycled));
    EXPECT_EQ(stylesOf(cycled, "pointSize") + attribute(*byId<GrxSize>(cycled, "pointSize"), "low"),
              "[({size=5pt;})]2pt");

    // The element type chooses which sizes change.
    const struct {
        const char* elementType;
        bool line, point;
    } cases[] = {
        {"line", true, false}, {"point", false, true}, {"interval", false, false}, {"bogus", true, true}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.elementType);
        GrxVisualization& chart = parse(kSeries);
        EXPECT_TRUE(applyAction<TSetSize>(
            std::string("<setSize elementType='") + c.elementType + "'>" + kMappings + "</setSize>", chart));
        EXPECT_EQ(mappingsOf(chart, "lineSize").empty(), !c.line);
        EXPECT_EQ(mappingsOf(chart, "pointSize").empty(), !c.point);
    }
}

TEST_F(SetCycles, SizeMappingsOfAnEarlierApplicationAreReplacedNotExtended) {
    GrxVisualization& chart = parse(kSeries);
    const std::string instruction = "<setSize elementType='point'>" + kMappings + "</setSize>";
    EXPECT_TRUE(applyAction<TSetSize>(instruction, chart));
    const std::string once = canonical(chart);
    EXPECT_TRUE(applyAction<TSetSize>(instruction, chart));
    EXPECT_EQ(canonical(chart), once);
    EXPECT_TRUE(applyAction<TSetSize>("<setSize><parameter name='small' value='1pt'/></setSize>", chart));
    EXPECT_EQ(mappingsOf(chart, "pointSize"), "small=1pt ");
}

} // namespace
