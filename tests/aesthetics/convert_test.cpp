// "addDash" and "addImage": colour aesthetics turned into dash or image aesthetics that keep the
// colour's variable, domain and id under a new cycle.
#include "AestheticsSupport.h"

#include "templates/actions/aesthetics.h"

using namespace aesthetics_test;

namespace {

// A line with a colour that carries every attribute, its own dash, and a bare colour; a legend
// listing both colours.
const std::string kChart = chartWith(
    "    <line id='line_1' coordinates='coordinates_1'>\n"
    "      <color id='colour_a' variable='var_a' cycle='chartCycle' domain='domain_a' missing='gap' "
    "dimension='dim_x' clamp='true' split='false' affect='main'/>\n"
    "      <dash id='dash_own' variable='var_a'/><color id='colour_b' variable='var_b'/>\n"
    "    </line>\n",
    "  <legend id='legend_1'><legendTarget id='target_a' target='colour_a'/>"
    "<legendTarget id='target_b' target='colour_b'/></legend>\n");
const std::string kCycle = "<cycle><style stroke-dasharray='3 1'/></cycle>";

struct ToDash {
    using Action = plotaid::detail::TAddDash;
    using Aesthetic = GrxDash;
    static constexpr const char* tag = "addDash";
    static std::vector<GrxDash*> made(const GrxLine& line) { return line.getDashs(); }
    static constexpr std::size_t before = 1; // the line's own dash
};
struct ToImage {
    using Action = plotaid::detail::TAddImage;
    using Aesthetic = GrxImage;
    static constexpr const char* tag = "addImage";
    static std::vector<GrxImage*> made(const GrxLine& line) { return line.getImages(); }
    static constexpr std::size_t before = 0;
};

template <class Kind> class ConvertColours : public AestheticsTest {
protected:
    static bool apply(GrxVisualization& chart, const std::string& attributes, const std::string& body,
                      const GrxVisualization* source = nullptr) {
        const std::string tag = Kind::tag;
        return applyAction<typename Kind::Action>(
            "<" + tag + " " + attributes + ">" + body + "</" + tag + ">", chart, source);
    }
};
using Kinds = ::testing::Types<ToDash, ToImage>;
TYPED_TEST_SUITE(ConvertColours, Kinds);

TYPED_TEST(ConvertColours, EveryColourBecomesTheNewAestheticUnderItsId) {
    using A = typename TypeParam::Aesthetic;
    GrxVisualization& chart = this->parse(kChart);
    EXPECT_TRUE(this->apply(chart, "", kCycle));

    EXPECT_TRUE(byId<GrxLine>(chart, "line_1")->getColors().empty());
    const std::vector<A*> made = TypeParam::made(*byId<GrxLine>(chart, "line_1"));
    ASSERT_EQ(made.size(), TypeParam::before + 2);
    const A* a = byId<A>(chart, "colour_a");
    const A* b = byId<A>(chart, "colour_b");
    ASSERT_TRUE(a && b);
    EXPECT_EQ(made[TypeParam::before], a);
    EXPECT_EQ(made[TypeParam::before + 1], b);

    // Variable, domain, missing values, dimension, clamp and split come with it; the affect does not.
    std::string kept;
    for (const char* name : {"variable", "domain", "missing", "dimension", "clamp", "split", "affect"})
        kept += std::string(name) + "=" + attribute(*a, name) + " ";
    EXPECT_EQ(kept,
              "variable=var_a domain=domain_a missing=gap dimension=dim_x clamp=true split=false affect= ");
    EXPECT_FALSE(a->isAttributePresent(u"affect"));
    EXPECT_EQ(attribute(*b, "variable"), "var_b");
    EXPECT_FALSE(b->isDomainPresent() || b->isMissingPresent());

    // A cycle each, with the template's styles.
    EXPECT_NE(cycleIdOf(chart, "colour_a"), cycleIdOf(chart, "colour_b"));
    EXPECT_EQ(stylesOf(chart, "colour_a"), "[({stroke-dasharray=3 1;})]");
    EXPECT_EQ(stylesOf(chart, "colour_b"), "[({stroke-dasharray=3 1;})]");

    // The legend shows what the colours were.
    EXPECT_EQ(byId<GrxLegendTarget>(chart, "target_a")->getTarget(), a);
    EXPECT_EQ(byId<GrxLegendTarget>(chart, "target_b")->getTarget(), b);
    EXPECT_EQ(grammar_test::chartFaults(chart), "");

    // Applied again it finds no colour left.
    const std::string once = chart.AsUTF8();
    EXPECT_TRUE(this->apply(chart, "", kCycle));
    EXPECT_EQ(chart.AsUTF8(), once);
}

TYPED_TEST(ConvertColours, AnAestheticNumberACycleAndTheSourceSelectWhatIsConverted) {
    using A = typename TypeParam::Aesthetic;
    GrxVisualization& chart = this->parse(kChart);
    // Without a cycle nothing changes.
    const std::string before = chart.AsUTF8();
    EXPECT_TRUE(this->apply(chart, "", ""));
    EXPECT_TRUE(this->apply(chart, "", "<style stroke-dasharray='3 1'/>"));
    EXPECT_EQ(chart.AsUTF8(), before);

    EXPECT_TRUE(this->apply(chart, "aestheticNumber='2'", kCycle));
    const std::vector<GrxColor*> left = byId<GrxLine>(chart, "line_1")->getColors();
    ASSERT_EQ(left.size(), 1u);
    EXPECT_EQ(text(left.front()->getId()), "colour_a");
    EXPECT_NE(byId<A>(chart, "colour_b"), nullptr);

    // colour_a has a cycle in the source and stays a colour; colour_b has none and is converted.
    GrxVisualization& guarded = this->parse(kChart);
    GrxVisualization& source = this->parse(kChart);
    EXPECT_TRUE(this->apply(guarded, "", kCycle, &source));
    EXPECT_NE(byId<GrxColor>(guarded, "colour_a"), nullptr);
    EXPECT_NE(byId<A>(guarded, "colour_b"), nullptr);
}

} // namespace
