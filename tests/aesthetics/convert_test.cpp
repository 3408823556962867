// "addDash" and "addImage": colour aesthetics turned into dash or image aesthetics that keep the
// colour's variable, domain and id under a new cycle.
#include "AestheticsSupport.h"

using namespace aesthetics_test;

namespace {

// A line with a colour that carries every attribute, its own dash, and a bare colour; a legend
// listing both colours.
const std::string kChart = chartWith(
    "<line id='line_1' coordinates='coordinates_1'><color id='colour_a' variable='var_a' cycle='chartCycle' "
    "domain='domain_a' missing='gap' dimension='dim_x' clamp='true' split='false' affect='main'/>"
    "<dash id='dash_own' variable='var_a'/><color id='colour_b' variable='var_b'/></line>",
    "<legend id='legend_1'><legendTarget id='target_a' target='colour_a'/>"
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
    EXPECT_EQ(made[TypeParam::before], a);
    EXPECT_EQ(made[TypeParam::before + 1], byId<A>(chart, "colour_b"));

    // Everything but the affect comes with it.
    std::string kept;
    for (const char* name : {"variable", "domain", "missing", "dimension", "clamp", "split"})
        kept += attribute(*a, name) + " ";
    EXPECT_EQ(kept, "var_a domain_a gap dim_x true false ");
    EXPECT_FALSE(a->isAttributePresent(u"affect"));
    EXPECT_NE(cycleIdOf(chart, "colour_a"), cycleIdOf(chart, "colour_b"));
    EXPECT_EQ(stylesOf(chart, "colour_b"), "[({stroke-dasharray=3 1;})]");
    // The legend shows what the colours were.
    EXPECT_EQ(byId<GrxLegendTarget>(chart, "target_a")->getTarget(), a);

    // Applied again it finds no colour left.
    const std::string once = chart.AsUTF8();
    EXPECT_TRUE(this->apply(chart, "", kCycle));
    EXPECT_EQ(chart.AsUTF8(), once);
}

TYPED_TEST(ConvertColours, AnAestheticNumberAndACycleSelectWhatIsConverted) {
    GrxVisualization& chart = this->parse(kChart);
    const std::string before = chart.AsUTF8();
    EXPECT_TRUE(this->apply(chart, "", "<style stroke-dasharray='3 1'/>"));
    EXPECT_EQ(chart.AsUTF8(), before);

    EXPECT_TRUE(this->apply(chart, "aestheticNumber='2'", kCycle));
    const std::vector<GrxColor*> left = byId<GrxLine>(chart, "line_1")->getColors();
    ASSERT_EQ(left.size(), 1u);
    EXPECT_EQ(text(left.front()->getId()), "colour_a");
    EXPECT_NE(byId<typename TypeParam::Aesthetic>(chart, "colour_b"), nullptr);
}

} // namespace
