// "setColor": new colour cycles, the affect modes, one cycle shared by elements of one tag, and the
// source guard.
#include "AestheticsSupport.h"

#include "templates/actions/aesthetics.h"

#include <grx/GrxUni.h>

using namespace aesthetics_test;
using engine_test::EngineTest;
using plotaid::detail::TSetColor;

namespace {

const std::string kCycle = "<cycle><style color=\"#010101\"/><style color=\"#020202\"/></cycle>";

std::string setColor(const std::string& attributes = std::string()) {
    return "<setColor " + attributes + ">" + kCycle + "</setColor>";
}

const std::vector<std::map<std::string, std::string>> kTemplateStyles = {{{"color", "#010101"}},
                                                                         {{"color", "#020202"}}};

using SetColor = EngineTest;

TEST_F(SetColor, EveryColourOfEveryElementGetsTheTemplateCycle) {
    Chart chart = Chart::parse(engine_test::example("charts/error-bars.xml"));
    ASSERT_TRUE(chart.vis);
    const std::size_t cyclesBefore = chart.vis->getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetColor>(setColor(), *chart.vis));

    // An interval and a point: different tags, so a new cycle each.
    EXPECT_EQ(chart.vis->getStyleCycles().size(), cyclesBefore + 2);
    for (const char* id : {"color_1", "color_2"}) {
        GrxColor* color = byId<GrxColor>(*chart.vis, id);
        ASSERT_NE(color, nullptr) << id;
        ASSERT_NE(color->getCycle(), nullptr) << id;
        EXPECT_NE(text(color->getCycle()->getId()), "styleCycleRepository") << id;
        EXPECT_EQ(text(color->getCycle()->getId()).rfind("styleCycle", 0), 0u) << id;
        EXPECT_EQ(cycleStyles(*color->getCycle()), kTemplateStyles) << id;
        // The rest of the aesthetic stays as the chart made it.
        EXPECT_EQ(attribute(*color, "variable"), "var_gender");
        EXPECT_EQ(attribute(*color, "domain"), "domain_gender");
    }
    EXPECT_NE(cycleIdOf(*chart.vis, "color_1"), cycleIdOf(*chart.vis, "color_2"));
    // The chart's own cycle stays: the extension still names it as the chart's repository.
    EXPECT_NE(byId<GrxStyleCycle>(*chart.vis, "styleCycleRepository"), nullptr);
}

TEST_F(SetColor, AnAestheticNumberPastTheListSelectsNothing) {
    Chart chart = Chart::parse(engine_test::example("charts/error-bars.xml"));
    ASSERT_TRUE(chart.vis);
    const std::string before = chart.vis->AsUTF8();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber=\"2\" affect=\"both\""), *chart.vis));
    EXPECT_EQ(chart.vis->AsUTF8(), before);

    // The first colour is the one that "1" selects.
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber=\"1\""), *chart.vis));
    EXPECT_NE(chart.vis->AsUTF8(), before);
}

TEST_F(SetColor, TheSecondColourOfAnElementIsSelectedByItsPosition) {
    Chart chart =
        Chart::parse(chartWith("    <interval id=\"bar\" coordinates=\"coordinates_1\">\n"
                               "      <color id=\"first\" variable=\"var_a\" cycle=\"chartCycle\"/>\n"
                               "      <color id=\"second\" variable=\"var_a\" cycle=\"chartCycle\"/>\n"
                               "    </interval>\n"));
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber=\"2\""), *chart.vis));
    EXPECT_EQ(cycleIdOf(*chart.vis, "first"), "chartCycle");
    EXPECT_EQ(cycleStylesOf(*chart.vis, "second"), kTemplateStyles);
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
        Chart chart = Chart::parse(engine_test::example("charts/error-bars.xml"));
        ASSERT_TRUE(chart.vis);
        const std::string attributes = *c.affect ? std::string("affect=\"") + c.affect + "\"" : std::string();
        EXPECT_TRUE(applyAction<TSetColor>(setColor(attributes), *chart.vis));
        EXPECT_EQ(attribute(*byId<GrxColor>(*chart.vis, "color_1"), "affect"), c.interval) << c.affect;
        EXPECT_EQ(attribute(*byId<GrxColor>(*chart.vis, "color_2"), "affect"), c.point) << c.affect;
    }
    // As numbers: 3 on a point's colour and 2 on the interval's for "main".
    Chart chart = Chart::parse(engine_test::example("charts/error-bars.xml"));
    ASSERT_TRUE(chart.vis);
    applyAction<TSetColor>(setColor("affect=\"main\""), *chart.vis);
    EXPECT_EQ(byId<GrxColor>(*chart.vis, "color_1")->getAffect(), 2);
    EXPECT_EQ(byId<GrxColor>(*chart.vis, "color_2")->getAffect(), 3);
}

TEST_F(SetColor, WithoutACycleNothingChangesNotEvenTheAffect) {
    Chart chart = Chart::parse(engine_test::example("charts/error-bars.xml"));
    ASSERT_TRUE(chart.vis);
    const std::string before = chart.vis->AsUTF8();
    EXPECT_TRUE(applyAction<TSetColor>("<setColor affect=\"both\"/>", *chart.vis));
    EXPECT_TRUE(
        applyAction<TSetColor>("<setColor affect=\"both\"><style color=\"red\"/></setColor>", *chart.vis));
    EXPECT_EQ(chart.vis->AsUTF8(), before);
}

TEST_F(SetColor, ElementsOfOneTagShareOneNewCycleAndOtherTagsGetTheirOwn) {
    Chart chart = Chart::parse(chartWith("    <interval id=\"bars_1\" coordinates=\"coordinates_1\">\n"
                                         "      <color id=\"c1\" variable=\"var_a\" cycle=\"chartCycle\"/>\n"
                                         "    </interval>\n"
                                         "    <point id=\"marks\" coordinates=\"coordinates_1\">\n"
                                         "      <color id=\"c3\" variable=\"var_a\" cycle=\"chartCycle\"/>\n"
                                         "    </point>\n"
                                         "    <interval id=\"bars_2\" coordinates=\"coordinates_1\">\n"
                                         "      <color id=\"c2\" variable=\"var_a\" cycle=\"chartCycle\"/>\n"
                                         "    </interval>\n"));
    ASSERT_TRUE(chart.vis);
    const std::size_t cyclesBefore = chart.vis->getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetColor>(setColor(), *chart.vis));
    EXPECT_EQ(chart.vis->getStyleCycles().size(), cyclesBefore + 2);
    const std::string bars = cycleIdOf(*chart.vis, "c1");
    EXPECT_NE(bars, "chartCycle");
    EXPECT_EQ(cycleIdOf(*chart.vis, "c2"), bars);
    const std::string marks = cycleIdOf(*chart.vis, "c3");
    EXPECT_NE(marks, bars);
    EXPECT_NE(marks, "chartCycle");
    EXPECT_EQ(cycleStylesOf(*chart.vis, "c1"), kTemplateStyles);
    EXPECT_EQ(cycleStylesOf(*chart.vis, "c3"), kTemplateStyles);
}

TEST_F(SetColor, WithAnAestheticNumberTheSameColourOfAnEarlierElementIsShared) {
    Chart chart = Chart::parse(chartWith("    <interval id=\"bars_1\" coordinates=\"coordinates_1\">\n"
                                         "      <color id=\"a1\" variable=\"var_a\" cycle=\"chartCycle\"/>\n"
                                         "      <color id=\"a2\" variable=\"var_b\"/>\n"
                                         "    </interval>\n"
                                         "    <interval id=\"bars_2\" coordinates=\"coordinates_1\">\n"
                                         "      <color id=\"b1\" variable=\"var_a\" cycle=\"chartCycle\"/>\n"
                                         "      <color id=\"b2\" variable=\"var_b\"/>\n"
                                         "    </interval>\n"));
    ASSERT_TRUE(chart.vis);
    const std::size_t cyclesBefore = chart.vis->getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber=\"2\""), *chart.vis));
    // The second bars continue the first bars' new cycle, not the cycle of their first colour.
    EXPECT_EQ(chart.vis->getStyleCycles().size(), cyclesBefore + 1);
    EXPECT_EQ(cycleStylesOf(*chart.vis, "a2"), kTemplateStyles);
    EXPECT_EQ(cycleIdOf(*chart.vis, "b2"), cycleIdOf(*chart.vis, "a2"));
    EXPECT_EQ(cycleIdOf(*chart.vis, "a1"), "chartCycle");
    EXPECT_EQ(cycleIdOf(*chart.vis, "b1"), "chartCycle");
}

TEST_F(SetColor, ASourceThatSetsTheCycleKeepsTheColourAsItIs) {
    const std::string chartText = engine_test::example("charts/error-bars.xml");
    Chart chart = Chart::parse(chartText);
    Chart source = Chart::parse(chartText);
    ASSERT_TRUE(chart.vis && source.vis);
    const std::string before = chart.vis->AsUTF8();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("affect=\"both\""), *chart.vis, source.vis.get()));
    EXPECT_EQ(chart.vis->AsUTF8(), before);

    // Where the source's colour has no cycle of its own, the template decides for that colour only.
    byId<GrxColor>(*source.vis, "color_2")->removeCycle();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("affect=\"both\""), *chart.vis, source.vis.get()));
    EXPECT_EQ(cycleIdOf(*chart.vis, "color_1"), "styleCycleRepository");
    EXPECT_EQ(attribute(*byId<GrxColor>(*chart.vis, "color_1"), "affect"), "secondary");
    EXPECT_EQ(cycleStylesOf(*chart.vis, "color_2"), kTemplateStyles);
    EXPECT_EQ(attribute(*byId<GrxColor>(*chart.vis, "color_2"), "affect"), "both");
}

TEST_F(SetColor, AppliedTwiceItIsTheSameChartAsOnceBesidesTheOrphanedCycles) {
    const std::string chartText = engine_test::example("charts/error-bars.xml");
    Chart once = Chart::parse(chartText);
    Chart twice = Chart::parse(chartText);
    ASSERT_TRUE(once.vis && twice.vis);
    applyAction<TSetColor>(setColor("affect=\"main\""), *once.vis);
    applyAction<TSetColor>(setColor("affect=\"main\""), *twice.vis);
    applyAction<TSetColor>(setColor("affect=\"main\""), *twice.vis);
    EXPECT_EQ(canonical(*twice.vis), canonical(*once.vis));
    // Each application replaces the references and leaves the cycles it replaced behind.
    EXPECT_EQ(twice.vis->getStyleCycles().size(), once.vis->getStyleCycles().size() + 2);
    EXPECT_EQ(orphanedStyleCycles(*twice.vis), orphanedStyleCycles(*once.vis) + 2);
    // ... and a different template really reads differently.
    applyAction<TSetColor>("<setColor><cycle><style color=\"#999999\"/></cycle></setColor>", *twice.vis);
    EXPECT_NE(canonical(*twice.vis), canonical(*once.vis));
}

} // namespace
