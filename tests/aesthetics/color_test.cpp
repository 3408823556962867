// "setColor": new colour cycles, the affect modes, one cycle shared by elements of one tag, and the
// source guard.
#include "AestheticsSupport.h"

#include "templates/actions/aesthetics.h"

using namespace aesthetics_test;
using engine_test::EngineTest;
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
    "    <interval id='bars_1' coordinates='coordinates_1'>\n"
    "      <color id='a1' variable='var_a' cycle='chartCycle'/><color id='a2' variable='var_b'/>\n"
    "    </interval>\n"
    "    <point id='marks' coordinates='coordinates_1'>\n"
    "      <color id='m1' variable='var_a' cycle='chartCycle'/>\n"
    "    </point>\n"
    "    <interval id='bars_2' coordinates='coordinates_1'>\n"
    "      <color id='b1' variable='var_a' cycle='chartCycle'/><color id='b2' variable='var_b'/>\n"
    "    </interval>\n";

Chart errorBars() {
    return Chart::parse(engine_test::example("charts/error-bars.xml"));
}

using SetColor = EngineTest;

TEST_F(SetColor, EveryColourOfEveryElementGetsTheTemplateCycleAndKeepsTheRest) {
    Chart chart = errorBars();
    ASSERT_TRUE(chart.vis);
    const std::size_t cyclesBefore = chart.vis->getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetColor>(setColor(), *chart.vis));
    // An interval and a point: different tags, so a new cycle each.
    EXPECT_EQ(chart.vis->getStyleCycles().size(), cyclesBefore + 2);
    for (const char* id : {"color_1", "color_2"}) {
        SCOPED_TRACE(id);
        EXPECT_EQ(stylesOf(*chart.vis, id), kStyles);
        EXPECT_EQ(cycleIdOf(*chart.vis, id).rfind("styleCycle", 0), 0u);
        EXPECT_NE(cycleIdOf(*chart.vis, id), "styleCycleRepository");
        EXPECT_EQ(attribute(*byId<GrxColor>(*chart.vis, id), "variable"), "var_gender");
        EXPECT_EQ(attribute(*byId<GrxColor>(*chart.vis, id), "domain"), "domain_gender");
    }
    EXPECT_NE(cycleIdOf(*chart.vis, "color_1"), cycleIdOf(*chart.vis, "color_2"));
    // The chart's own cycle stays: the extension still names it as the chart's repository.
    EXPECT_NE(byId<GrxStyleCycle>(*chart.vis, "styleCycleRepository"), nullptr);
    EXPECT_EQ(grammar_test::chartFaults(*chart.vis), "");
}

TEST_F(SetColor, ElementsOfOneTagShareOneNewCycleAndOtherTagsGetTheirOwn) {
    Chart chart = Chart::parse(chartWith(kTags));
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetColor>(setColor(), *chart.vis));
    const std::string bars = cycleIdOf(*chart.vis, "a1");
    const std::string marks = cycleIdOf(*chart.vis, "m1");
    EXPECT_NE(bars, "chartCycle");
    EXPECT_NE(marks, "chartCycle");
    EXPECT_NE(marks, bars);
    EXPECT_EQ(cycleIdOf(*chart.vis, "b1"), bars);
    EXPECT_EQ(stylesOf(*chart.vis, "a1"), kStyles);
    EXPECT_EQ(stylesOf(*chart.vis, "m1"), kStyles);
}

TEST_F(SetColor, AnAestheticNumberSelectsByPositionAndSharesWithTheSameColourOfAnEarlierElement) {
    Chart chart = Chart::parse(chartWith(kTags));
    ASSERT_TRUE(chart.vis);
    const std::size_t cyclesBefore = chart.vis->getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber='2'"), *chart.vis));
    // The second bars continue the first bars' new cycle, not the cycle of their first colour.
    EXPECT_EQ(chart.vis->getStyleCycles().size(), cyclesBefore + 1);
    EXPECT_EQ(stylesOf(*chart.vis, "a2"), kStyles);
    EXPECT_EQ(cycleIdOf(*chart.vis, "b2"), cycleIdOf(*chart.vis, "a2"));
    for (const char* id : {"a1", "b1", "m1"})
        EXPECT_EQ(cycleIdOf(*chart.vis, id), "chartCycle") << id;

    // A number past the list, and an instruction without a cycle, select or change nothing.
    Chart bars = errorBars();
    ASSERT_TRUE(bars.vis);
    const std::string before = bars.vis->AsUTF8();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber='2' affect='both'"), *bars.vis));
    EXPECT_TRUE(applyAction<TSetColor>("<setColor affect='both'/>", *bars.vis));
    EXPECT_TRUE(applyAction<TSetColor>("<setColor affect='both'><style color='red'/></setColor>", *bars.vis));
    EXPECT_EQ(bars.vis->AsUTF8(), before);
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber='1'"), *bars.vis));
    EXPECT_EQ(stylesOf(*bars.vis, "color_1"), kStyles);
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
        Chart chart = errorBars();
        ASSERT_TRUE(chart.vis);
        EXPECT_TRUE(applyAction<TSetColor>(
            *c.affect ? setColor(std::string("affect='") + c.affect + "'") : setColor(), *chart.vis));
        EXPECT_EQ(attribute(*byId<GrxColor>(*chart.vis, "color_1"), "affect"), c.interval);
        EXPECT_EQ(attribute(*byId<GrxColor>(*chart.vis, "color_2"), "affect"), c.point);
        if (std::string(c.affect) == "main") { // as numbers: 3 on a point's colour, 2 on the interval's
            EXPECT_EQ(byId<GrxColor>(*chart.vis, "color_1")->getAffect(), 2);
            EXPECT_EQ(byId<GrxColor>(*chart.vis, "color_2")->getAffect(), 3);
        }
    }
}

TEST_F(SetColor, ASourceThatSetsTheCycleKeepsTheColourAsItIs) {
    Chart chart = errorBars();
    Chart source = errorBars();
    ASSERT_TRUE(chart.vis && source.vis);
    const std::string before = chart.vis->AsUTF8();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("affect='both'"), *chart.vis, source.vis.get()));
    EXPECT_EQ(chart.vis->AsUTF8(), before);

    // Where the source's colour has no cycle of its own, the template decides for that colour only.
    byId<GrxColor>(*source.vis, "color_2")->removeCycle();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("affect='both'"), *chart.vis, source.vis.get()));
    EXPECT_EQ(cycleIdOf(*chart.vis, "color_1"), "styleCycleRepository");
    EXPECT_EQ(attribute(*byId<GrxColor>(*chart.vis, "color_1"), "affect"), "secondary");
    EXPECT_EQ(stylesOf(*chart.vis, "color_2"), kStyles);
    EXPECT_EQ(attribute(*byId<GrxColor>(*chart.vis, "color_2"), "affect"), "both");
}

TEST_F(SetColor, AppliedTwiceItIsTheSameChartAsOnceBesidesTheOrphanedCycles) {
    Chart once = errorBars();
    Chart twice = errorBars();
    ASSERT_TRUE(once.vis && twice.vis);
    applyAction<TSetColor>(setColor("affect='main'"), *once.vis);
    applyAction<TSetColor>(setColor("affect='main'"), *twice.vis);
    applyAction<TSetColor>(setColor("affect='main'"), *twice.vis);
    EXPECT_EQ(canonical(*twice.vis), canonical(*once.vis));
    // Each application replaces the references and leaves the cycles it replaced behind.
    EXPECT_EQ(twice.vis->getStyleCycles().size(), once.vis->getStyleCycles().size() + 2);
    EXPECT_EQ(orphanedStyleCycles(*twice.vis), orphanedStyleCycles(*once.vis) + 2);
    // ... and a different template really reads differently.
    applyAction<TSetColor>("<setColor><cycle><style color='#999999'/></cycle></setColor>", *twice.vis);
    EXPECT_NE(canonical(*twice.vis), canonical(*once.vis));
}

} // namespace
