// "setColor": new colour cycles, the affect modes, one cycle shared by elements of one tag, and the
// source guard.
#include "AestheticsSupport.h"

#include "templates/actions/aesthetics.h"

using namespace aesthetics_test;
using plotaid::detail::TSetColor;

namespace {

const std::string kStyles = "[({color=#010101;}{color=#020202;})]";

std::string setColor(const std::string& attributes = std::string()) {
    return "<setColor " + attributes +
           "><cycle><style color='#010101'/><style color='#020202'/></cycle></setColor>";
}

// Two intervals around a point, each with a colour by var_a on the chart's cycle and a second
// colour by var_b without one.
const std::string kTags =
    "<interval id='bars_1' coordinates='coordinates_1'><color id='a1' variable='var_a' cycle='chartCycle'/>"
    "<color id='a2' variable='var_b'/></interval>"
    "<point id='marks' coordinates='coordinates_1'><color id='m1' variable='var_a' "
    "cycle='chartCycle'/></point>"
    "<interval id='bars_2' coordinates='coordinates_1'><color id='b1' variable='var_a' cycle='chartCycle'/>"
    "<color id='b2' variable='var_b'/></interval>";

using SetColor = AestheticsTest;

TEST_F(SetColor, EveryColourOfEveryElementGetsTheTemplateCycleAndKeepsTheRest) {
    GrxVisualization& chart = sample("error-bars.xml");
    const std::size_t cyclesBefore = chart.getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetColor>(setColor(), chart));
    // An interval and a point: different tags, so a new cycle each.
    EXPECT_EQ(chart.getStyleCycles().size(), cyclesBefore + 2);
    for (const char* id : {"color_1", "color_2"}) {
        SCOPED_TRACE(id);
        EXPECT_EQ(stylesOf(chart, id), kStyles);
        EXPECT_EQ(cycleIdOf(chart, id).rfind("styleCycle", 0), 0u);
        EXPECT_NE(cycleIdOf(chart, id), "styleCycleRepository");
        EXPECT_EQ(attribute(*byId<GrxColor>(chart, id), "variable"), "var_gender");
        EXPECT_EQ(attribute(*byId<GrxColor>(chart, id), "domain"), "domain_gender");
    }
    EXPECT_NE(cycleIdOf(chart, "color_1"), cycleIdOf(chart, "color_2"));
    // The chart's own cycle stays: the extension still names it as the chart's repository.
    EXPECT_NE(byId<GrxStyleCycle>(chart, "styleCycleRepository"), nullptr);
    EXPECT_EQ(grammar_test::chartFaults(chart), "");
}

TEST_F(SetColor, ElementsOfOneTagShareOneNewCycleAndOtherTagsGetTheirOwn) {
    GrxVisualization& chart = parse(chartWith(kTags));
    EXPECT_TRUE(applyAction<TSetColor>(setColor(), chart));
    const std::string bars = cycleIdOf(chart, "a1");
    const std::string marks = cycleIdOf(chart, "m1");
    EXPECT_NE(bars, "chartCycle");
    EXPECT_NE(marks, "chartCycle");
    EXPECT_NE(marks, bars);
    EXPECT_EQ(cycleIdOf(chart, "b1"), bars);
    EXPECT_EQ(stylesOf(chart, "a1"), kStyles);
    EXPECT_EQ(stylesOf(chart, "m1"), kStyles);
}

TEST_F(SetColor, AnAestheticNumberSelectsByPositionAndSharesWithTheSameColourOfAnEarlierElement) {
    GrxVisualization& chart = parse(chartWith(kTags));
    const std::size_t cyclesBefore = chart.getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber='2'"), chart));
    // The second bars continue the first bars' new cycle, not the cycle of their first colour.
    EXPECT_EQ(chart.getStyleCycles().size(), cyclesBefore + 1);
    EXPECT_EQ(stylesOf(chart, "a2"), kStyles);
    EXPECT_EQ(cycleIdOf(chart, "b2"), cycleIdOf(chart, "a2"));
    for (const char* id : {"a1", "b1", "m1"})
        EXPECT_EQ(cycleIdOf(chart, id), "chartCycle") << id;

    // A number past the list, and an instruction without a cycle, select or change nothing.
    GrxVisualization& bars = sample("error-bars.xml");
    const std::string before = bars.AsUTF8();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber='2' affect='both'"), bars));
    EXPECT_TRUE(applyAction<TSetColor>("<setColor affect='both'/>", bars));
    EXPECT_TRUE(applyAction<TSetColor>("<setColor affect='both'><style color='red'/></setColor>", bars));
    EXPECT_EQ(bars.AsUTF8(), before);
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber='1'"), bars));
    EXPECT_EQ(stylesOf(bars, "color_1"), kStyles);
}

TEST_F(SetColor, AffectModesDependOnWhetherTheColourBelongsToAPoint) {
    struct Case {
        const char* affect;
        const char* interval; // error bars
        const char* point;    // the mean marker
    };
    // The chart has "secondary" on the interval and "main" on the point.
    for (const Case c :
         {Case{"main", "main", "secondary"}, Case{"secondary", "secondary", "main"},
          Case{"both", "both", "both"}, Case{"", "secondary", "main"}, Case{"Main", "secondary", "main"}}) {
        SCOPED_TRACE(c.affect);
        GrxVisualization& chart = sample("error-bars.xml");
        EXPECT_TRUE(applyAction<TSetColor>(
            *c.affect ? setColor(std::string("affect='") + c.affect + "'") : setColor(), chart));
        EXPECT_EQ(attribute(*byId<GrxColor>(chart, "color_1"), "affect"), c.interval);
        EXPECT_EQ(attribute(*byId<GrxColor>(chart, "color_2"), "affect"), c.point);
        if (std::string(c.affect) == "main") { // as numbers: 3 on a point's colour, 2 on the interval's
            EXPECT_EQ(byId<GrxColor>(chart, "color_1")->getAffect(), 2);
            EXPECT_EQ(byId<GrxColor>(chart, "color_2")->getAffect(), 3);
        }
    }
}

TEST_F(SetColor, ASourceThatSetsTheCycleKeepsTheColourAsItIs) {
    GrxVisualization& chart = sample("error-bars.xml");
    GrxVisualization& source = sample("error-bars.xml");
    const std::string before = chart.AsUTF8();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("affect='both'"), chart, &source));
    EXPECT_EQ(chart.AsUTF8(), before);

    // Where the source's colour has no cycle of its own, the template decides for that colour only.
    byId<GrxColor>(source, "color_2")->removeCycle();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("affect='both'"), chart, &source));
    EXPECT_EQ(cycleIdOf(chart, "color_1"), "styleCycleRepository");
    EXPECT_EQ(attribute(*byId<GrxColor>(chart, "color_1"), "affect"), "secondary");
    EXPECT_EQ(stylesOf(chart, "color_2"), kStyles);
    EXPECT_EQ(attribute(*byId<GrxColor>(chart, "color_2"), "affect"), "both");
}

TEST_F(SetColor, AppliedTwiceItIsTheSameChartAsOnceBesidesTheOrphanedCycles) {
    GrxVisualization& once = sample("error-bars.xml");
    GrxVisualization& twice = sample("error-bars.xml");
    applyAction<TSetColor>(setColor("affect='main'"), once);
    applyAction<TSetColor>(setColor("affect='main'"), twice);
    applyAction<TSetColor>(setColor("affect='main'"), twice);
    EXPECT_EQ(canonical(twice), canonical(once));
    // Each application replaces the references and leaves the cycles it replaced behind.
    EXPECT_EQ(twice.getStyleCycles().size(), once.getStyleCycles().size() + 2);
    EXPECT_EQ(orphanedStyleCycles(twice), orphanedStyleCycles(once) + 2);
    // ... and a different template really reads differently.
    applyAction<TSetColor>("<setColor><cycle><style color='#999999'/></cycle></setColor>", twice);
    EXPECT_NE(canonical(twice), canonical(once));
}

} // namespace
