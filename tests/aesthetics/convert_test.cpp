// "addDash" and "addImage": colour aesthetics turned into dash or image aesthetics that keep the
// colour's variable, domain and id under a new cycle.
#include "AestheticsSupport.h"

#include "templates/actions/aesthetics.h"

using namespace aesthetics_test;
using engine_test::EngineTest;
using plotaid::detail::TAddDash;
using plotaid::detail::TAddImage;

namespace {

const std::string kTwoColours = "    <line id=\"line_1\" coordinates=\"coordinates_1\">\n"
                                "      <color id=\"colour_a\" variable=\"var_a\" cycle=\"chartCycle\" "
                                "domain=\"domain_a\" missing=\"gap\" "
                                "dimension=\"dim_x\" clamp=\"true\" split=\"false\" affect=\"main\"/>\n"
                                "      <dash id=\"dash_own\" variable=\"var_a\"/>\n"
                                "      <color id=\"colour_b\" variable=\"var_b\"/>\n"
                                "    </line>\n";
const std::string kLegend = "  <legend id=\"legend_1\">\n"
                            "    <legendTarget id=\"target_a\" target=\"colour_a\"/>\n"
                            "    <legendTarget id=\"target_b\" target=\"colour_b\"/>\n"
                            "  </legend>\n";
const std::string kDashCycle = "<cycle><style stroke-dasharray=\"3 1\"/></cycle>";
const std::vector<std::map<std::string, std::string>> kDashStyles = {{{"stroke-dasharray", "3 1"}}};

template <class A> std::vector<A*> aestheticsOf(const GrxVisualization& chart, const char* element);
template <> std::vector<GrxDash*> aestheticsOf(const GrxVisualization& chart, const char* element) {
    return byId<GrxLine>(chart, element)->getDashs();
}
template <> std::vector<GrxImage*> aestheticsOf(const GrxVisualization& chart, const char* element) {
    return byId<GrxLine>(chart, element)->getImages();
}

template <class Kind> class ConvertColours : public EngineTest {};

struct ToDash {
    using Action = TAddDash;
    using Aesthetic = GrxDash;
    static std::string instruction(const std::string& attributes, const std::string& body) {
        return "<addDash " + attributes + ">" + body + "</addDash>";
    }
    static std::size_t before() { return 1; } // the line's own dash
};
struct ToImage {
    using Action = TAddImage;
    using Aesthetic = GrxImage;
    static std::string instruction(const std::string& attributes, const std::string& body) {
        return "<addImage " + attributes + ">" + body + "</addImage>";
    }
    static std::size_t before() { return 0; }
};

using Kinds = ::testing::Types<ToDash, ToImage>;
TYPED_TEST_SUITE(ConvertColours, Kinds);

TYPED_TEST(ConvertColours, EveryColourBecomesTheNewAestheticUnderItsId) {
    using A = typename TypeParam::Aesthetic;
    Chart chart = Chart::parse(chartWith(kTwoColours, kLegend));
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<typename TypeParam::Action>(TypeParam::instruction("", kDashCycle), *chart.vis));

    EXPECT_TRUE(byId<GrxLine>(*chart.vis, "line_1")->getColors().empty());
    const std::vector<A*> made = aestheticsOf<A>(*chart.vis, "line_1");
    ASSERT_EQ(made.size(), TypeParam::before() + 2);
    ASSERT_TRUE(byId<A>(*chart.vis, "colour_a") && byId<A>(*chart.vis, "colour_b"));
    const A& a = *byId<A>(*chart.vis, "colour_a");
    const A& b = *byId<A>(*chart.vis, "colour_b");
    EXPECT_EQ(made[TypeParam::before()], &a);
    EXPECT_EQ(made[TypeParam::before() + 1], &b);

    // Variable, domain, missing values, dimension, clamp and split come with it; the affect does not.
    EXPECT_EQ(attribute(a, "variable"), "var_a");
    EXPECT_EQ(attribute(a, "domain"), "domain_a");
    EXPECT_EQ(attribute(a, "missing"), "gap");
    EXPECT_EQ(attribute(a, "dimension"), "dim_x");
    EXPECT_EQ(attribute(a, "clamp"), "true");
    EXPECT_EQ(attribute(a, "split"), "false");
    EXPECT_FALSE(a.isAttributePresent(u"affect"));
    EXPECT_EQ(attribute(b, "variable"), "var_b");
    EXPECT_FALSE(b.isDomainPresent());
    EXPECT_FALSE(b.isMissingPresent());

    // A cycle each, with the template's styles; the chart's cycle is no longer used by them.
    ASSERT_TRUE(a.getCycle() && b.getCycle());
    EXPECT_NE(a.getCycle(), b.getCycle());
    EXPECT_EQ(cycleStyles(*a.getCycle()), kDashStyles);
    EXPECT_EQ(cycleStyles(*b.getCycle()), kDashStyles);

    // The legend shows what the colours were.
    EXPECT_EQ(byId<GrxLegendTarget>(*chart.vis, "target_a")->getTarget(), &a);
    EXPECT_EQ(byId<GrxLegendTarget>(*chart.vis, "target_b")->getTarget(), &b);
    EXPECT_EQ(xercesProblems(*chart.vis), "");
}

TYPED_TEST(ConvertColours, AnAestheticNumberConvertsOnlyThatColour) {
    using A = typename TypeParam::Aesthetic;
    Chart chart = Chart::parse(chartWith(kTwoColours, kLegend));
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<typename TypeParam::Action>(
        TypeParam::instruction("aestheticNumber=\"2\"", kDashCycle), *chart.vis));
    const std::vector<GrxColor*> left = byId<GrxLine>(*chart.vis, "line_1")->getColors();
    ASSERT_EQ(left.size(), 1u);
    EXPECT_EQ(text(left.front()->getId()), "colour_a");
    EXPECT_NE(byId<A>(*chart.vis, "colour_b"), nullptr);
}

TYPED_TEST(ConvertColours, WithoutACycleNothingChanges) {
    Chart chart = Chart::parse(chartWith(kTwoColours, kLegend));
    ASSERT_TRUE(chart.vis);
    const std::string before = chart.vis->AsUTF8();
    EXPECT_TRUE(applyAction<typename TypeParam::Action>(TypeParam::instruction("", ""), *chart.vis));
    EXPECT_TRUE(applyAction<typename TypeParam::Action>(
        TypeParam::instruction("", "<style stroke-dasharray=\"3 1\"/>"), *chart.vis));
    EXPECT_EQ(chart.vis->AsUTF8(), before);
}

TYPED_TEST(ConvertColours, TheSourceGuardKeepsAColourWithACycle) {
    using A = typename TypeParam::Aesthetic;
    const std::string text = chartWith(kTwoColours, kLegend);
    Chart chart = Chart::parse(text);
    Chart source = Chart::parse(text);
    ASSERT_TRUE(chart.vis && source.vis);
    EXPECT_TRUE(applyAction<typename TypeParam::Action>(TypeParam::instruction("", kDashCycle), *chart.vis,
                                                        source.vis.get()));
    // colour_a has a cycle in the source and stays a colour; colour_b has none and is converted.
    EXPECT_NE(byId<GrxColor>(*chart.vis, "colour_a"), nullptr);
    EXPECT_NE(byId<A>(*chart.vis, "colour_b"), nullptr);
    EXPECT_EQ(byId<GrxColor>(*chart.vis, "colour_b"), nullptr);
}

TYPED_TEST(ConvertColours, AppliedTwiceTheSecondFindsNoColourLeft) {
    Chart once = Chart::parse(chartWith(kTwoColours, kLegend));
    Chart twice = Chart::parse(chartWith(kTwoColours, kLegend));
    ASSERT_TRUE(once.vis && twice.vis);
    const std::string instruction = TypeParam::instruction("", kDashCycle);
    applyAction<typename TypeParam::Action>(instruction, *once.vis);
    applyAction<typename TypeParam::Action>(instruction, *twice.vis);
    applyAction<typename TypeParam::Action>(instruction, *twice.vis);
    EXPECT_EQ(twice.vis->AsUTF8(), once.vis->AsUTF8());
}

using AddDashOnSamples = EngineTest;

TEST_F(AddDashOnSamples, TheLegendStillShowsWhatTheColoursWere) {
    for (const char* name : {"charts/simple-bar.xml", "charts/line-series.xml", "charts/error-bars.xml"}) {
        Chart chart = Chart::parse(engine_test::example(name));
        ASSERT_TRUE(chart.vis) << name;
        const std::size_t colours = [&] {
            std::vector<CTElementType*> elements;
            for (GrrUviza* graph : chart.vis->getGraphs())
                BaseTemplate::getAllElements(*graph, elements);
            std::size_t n = 0;
            for (const CTElementType* e : elements)
                n += e->getColors().size();
            return n;
        }();
        ASSERT_GT(colours, 0u) << name;
        EXPECT_TRUE(applyAction<TAddDash>("<addDash>" + kDashCycle + "</addDash>", *chart.vis));
        // Every legend target still names an existing aesthetic.
        for (GrxLegend* legend : chart.vis->getLegends())
            for (GrxLegendTarget* target : legend->getLegendTargets())
                EXPECT_NE(target->getTarget(), nullptr) << name << " " << text(target->getId());
        EXPECT_NE(byId<GrxDash>(*chart.vis, "color_1"), nullptr) << name;
        EXPECT_EQ(xercesProblems(*chart.vis), "") << name;
    }
}

} // namespace
