// Copying the content of one chart object onto another under fresh ids.
#include "templates/TemplateSupport.h"

#include <sstream>

using namespace template_test;

namespace {

// A fresh id: made from `prefix`, and not the id it was copied from.
bool fresh(const XMLCh* id, const std::string& prefix, const std::string& old) {
    return u8(id).rfind(prefix, 0) == 0 && u8(id) != old;
}

// The scatter sample: a point with a shape and a colour by gender, both listed by the legend.
class Cloning : public TemplateTest {
protected:
    void SetUp() override { ASSERT_NE(repository_, nullptr); }
    Probe probe() { return Probe(nullptr, chart_, nullptr); }
    // Adds a style to the cycle, dashed when `dashes` is given.
    static GrxStyle& styleIn(GrxCycle& cycle, const XMLCh* dashes) {
        GrxStyle& style = cycle.addStyle();
        if (dashes != nullptr)
            style.setStroke_dasharray(dashes);
        return style;
    }
    // How many legend targets name the aesthetic.
    int listed(const GrxBaseElement& aesthetic) const {
        int n = 0;
        for (const GrxLegendTarget* t : legend_->getLegendTargets())
            n += u8(t->GetAttribute(GrxUni::_target)) == u8(aesthetic.GetAttribute(GrxUni::_id));
        return n;
    }
    // A style's attribute of every style of the cycle's first cycle, joined by '|'.
    static std::string styles(const GrxStyleCycle* sc, const XMLCh* name) {
        std::string out;
        for (const GrxStyle* s : sc->getCycles().at(0)->getStyles())
            out += u8(s->GetAttribute(name)) + "|";
        return out;
    }

    GrxVisualization& chart_ = sample("scatter.xml");
    GrrUviza* graph_ = chart_.getGraphs().at(0);
    GrxPoint* point_ = graph_->getPoints().at(0);
    GrxLegend* legend_ = chart_.getLegends().at(0);
    GrxStyleCycle* repository_ = chart_.getExtension()->getStyleCycleRepository();
};

TEST_F(Cloning, APointOntoALineTurnsShapesIntoDashesOfTheRepositoryDashCycle) {
    GrxCycle& dashCycle = repository_->addCycle();
    styleIn(dashCycle, u"none").setId(u"repositoryDash1");
    styleIn(dashCycle, u"4 2");
    GrxLine& line = graph_->addLine();
    EXPECT_TRUE(probe().cloneElementChildren(*point_, line, true));

    EXPECT_TRUE(line.getShapes().empty());
    ASSERT_EQ(line.getDashs().size(), 1u);
    const GrxDash& dash = *line.getDashs()[0];
    EXPECT_TRUE(fresh(dash.getId(), "shape", "shape_1"));
    EXPECT_EQ(u8(dash.GetAttribute(GrxUni::_variable)) + " " + u8(dash.GetAttribute(GrxUni::_domain)),
              "var_gender domain_gender");
    // A new style cycle holding copies of the repository's dash styles, without their ids.
    const GrxStyleCycle* made = dash.getCycle();
    ASSERT_TRUE(made != nullptr && made != repository_);
    EXPECT_EQ(styles(made, GrxUni::_stroke_dasharray) + styles(made, GrxUni::_id), "none|4 2|||");

    // The colour comes along; variables, coordinates and the dot setting follow the point.
    ASSERT_EQ(line.getColors().size(), 1u);
    const GrxColor& colour = *line.getColors()[0];
    EXPECT_TRUE(fresh(colour.getId(), "color", "color_1"));
    EXPECT_EQ(colour.getCycle(), repository_);
    ASSERT_TRUE(line.getX() && line.getY());
    EXPECT_EQ(u8(line.getY()->GetAttribute(GrxUni::_variable)), "var_salary");
    EXPECT_EQ(line.getCoordinates(), point_->getCoordinates());
    EXPECT_TRUE(line.isDotPresent() && !line.getDot());
    // Both are childless, so the legend lists them beside the old ones.
    EXPECT_EQ(listed(colour) + listed(dash) + listed(*point_->getColors()[0]), 3);
}

TEST_F(Cloning, TheLastDashCycleOfTheRepositoryIsTakenOrNone) {
    // Cycles that start with a symbol or a pattern, or dash neither of their first two styles, are
    // no dash cycles.
    styleIn(repository_->addCycle(), u"4 2").setSymbol(u"circle");
    styleIn(repository_->addCycle(), u"4 2").SetAttribute(GrxUni::_pattern, u"3");
    GrxCycle& third = repository_->addCycle();
    styleIn(third, nullptr);
    styleIn(third, nullptr);
    styleIn(third, u"4 2");
    GrxPath& path = graph_->addPath();
    const std::size_t cyclesBefore = chart_.getStyleCycles().size();
    probe().cloneElementAesthetics(*point_, path, false);
    ASSERT_EQ(path.getDashs().size(), 1u);
    EXPECT_FALSE(path.getDashs()[0]->isCyclePresent());
    EXPECT_EQ(chart_.getStyleCycles().size(), cyclesBefore);
    EXPECT_EQ(listed(*path.getDashs()[0]), 0); // no legend flag

    GrxCycle& second = repository_->addCycle();
    styleIn(second, nullptr);
    styleIn(second, u"9 9"); // its second style dashes: still a dash cycle
    styleIn(repository_->addCycle(), u"5 5").setSymbol(u"square");
    GrxLine& line = graph_->addLine();
    probe().cloneElementAesthetics(*point_, line, false);
    ASSERT_EQ(line.getDashs().size(), 1u);
    ASSERT_NE(line.getDashs()[0]->getCycle(), nullptr);
    EXPECT_EQ(styles(line.getDashs()[0]->getCycle(), GrxUni::_stroke_dasharray), "|9 9|");
}

TEST_F(Cloning, APointOntoAPointKeepsShapesMappingsScalesStatisticsAndStyledConditions) {
    point_->getShapes().at(0)->addSymbolMapping().setTo(u"square");
    point_->getShapes()[0]->addScale(1).removeMethod(); // a scale that does not say its method
    GrxColor& colour = *point_->getColors()[0];
    colour.addScale(2).setInvert(true);
    colour.addColorMapping().setTo(u"red");
    colour.addSummaryStatistic().setMethod(4);
    GrxStyle& style = chart_.addStyle();
    style.setId(u"highlight");
    point_->addConditionalStyle(ChartString("x > 10"), style);
    point_->addConditionalStyle(ChartString("y > 5"), style).SetAttribute(GrxUni::_style, u"nowhere");

    GrxPoint& copy = graph_->addPoint();
    probe().cloneElementAesthetics(*point_, copy, true);
    EXPECT_TRUE(copy.getDashs().empty());
    ASSERT_EQ(copy.getShapes().size(), 1u);
    const GrxShape& shape = *copy.getShapes()[0];
    EXPECT_EQ(shape.getCycle(), repository_);
    ASSERT_EQ(shape.getSymbolMappings().size(), 1u);
    EXPECT_EQ(u8(shape.getSymbolMappings()[0]->getTo()), "square");
    // The new scale starts as method 3; only what the old one says is copied over it.
    ASSERT_NE(shape.getScale(), nullptr);
    EXPECT_EQ(shape.getScale()->getMethod(), 3);
    const GrxColor& made = *copy.getColors().at(0);
    ASSERT_TRUE(made.getScale() && made.getSummaryStatistic());
    EXPECT_TRUE(made.getScale()->getMethod() == 2 && made.getScale()->getInvert());
    ASSERT_EQ(made.getColorMappings().size(), 1u);
    EXPECT_EQ(u8(made.getColorMappings()[0]->getTo()), "red");
    EXPECT_EQ(made.getSummaryStatistic()->getMethod(), 4);
    // Aesthetics with children get no legend entry.
    EXPECT_EQ(listed(shape) + listed(made), 0);

    // A condition whose style names nothing is skipped, and reported.
    EXPECT_FALSE(probe().cloneConditionalStyles(*point_, copy));
    ASSERT_EQ(copy.getConditionalStyles().size(), 1u);
    EXPECT_EQ(u8(copy.getConditionalStyles()[0]->getWhen()), "x > 10");
    EXPECT_EQ(copy.getConditionalStyles()[0]->getStyle(), &style);
}

TEST_F(Cloning, OntoALabelingOnlyStyleBysComponentsColoursAndSizesWithTheElementsDefaultSizes) {
    point_->addStyleBy().setVariable(*point_->getColors()[0]->getVariable());
    point_->addColorComponent().setType(1);
    point_->addDash();
    point_->addPattern();
    point_->addSize();
    point_->addRotation();
    GrxLabeling& labeling = point_->addLabeling();
    const std::size_t before = labeling.getImplementation()->getChildElementCount();
    EXPECT_FALSE(probe().cloneElementAesthetics(*point_, labeling, false));
    EXPECT_EQ(labeling.getImplementation()->getChildElementCount(), before + 4);
    ASSERT_EQ(labeling.getStyleBys().size() + labeling.getColorComponents().size() +
                  labeling.getColors().size(),
              3u);
    ASSERT_EQ(labeling.getSizes().size(), 1u);
    EXPECT_EQ(u8(labeling.getSizes()[0]->getLow()) + "-" + u8(labeling.getSizes()[0]->getHigh()), "6pt-18pt");
    EXPECT_TRUE(fresh(labeling.getSizes()[0]->getId(), "length", ""));

    // Onto an interval, a size without bounds gets the interval's; one with a bound keeps it alone.
    point_->addSize().setLow(u"1pt");
    GrxInterval& interval = graph_->addInterval();
    probe().cloneElementAesthetics(*point_, interval, false);
    const std::vector<GrxSize*> sizes = interval.getSizes();
    ASSERT_EQ(sizes.size(), 2u);
    EXPECT_EQ(u8(sizes[0]->getLow()) + "-" + u8(sizes[0]->getHigh()), "0.25pt-3pt");
    EXPECT_TRUE(u8(sizes[1]->getLow()) == "1pt" && !sizes[1]->isHighPresent());
}

TEST_F(Cloning, StyleBysTakeTheirReferencesAndACopyOfTheirCycle) {
    GrxStyleBy& styleBy = point_->addStyleBy();
    styleBy.setId(u"styleBy_gender");
    styleBy.SetAttribute(GrxUni::_dimension, u"dim_x");
    styleBy.SetAttribute(GrxUni::_domain, u"domain_gender");
    styleBy.SetAttribute(GrxUni::_variable, u"var_gender");
    styleBy.SetAttribute(GrxUni::_cycle, u"styleCycleRepository");
    GrxLine& line = graph_->addLine();
    probe().cloneElementAesthetics(*point_, line, true);
    ASSERT_EQ(line.getStyleBys().size(), 1u);
    const GrxStyleBy& made = *line.getStyleBys()[0];
    EXPECT_TRUE(fresh(made.getId(), "styleBy", "styleBy_gender"));
    for (const XMLCh* name : {GrxUni::_dimension, GrxUni::_domain, GrxUni::_variable})
        EXPECT_EQ(u8(made.GetAttribute(name)), u8(styleBy.GetAttribute(name)));
    ASSERT_TRUE(made.getCycle() != nullptr && made.getCycle() != repository_);
    EXPECT_EQ(styles(made.getCycle(), GrxUni::_color), styles(repository_, GrxUni::_color));
    EXPECT_EQ(styles(made.getCycle(), GrxUni::_id).find_first_not_of('|'), std::string::npos);
    // A domain of another kind is not taken over.
    GrxStyleBy& other = point_->addStyleBy();
    other.SetAttribute(GrxUni::_domain, u"dim_x");
    GrxStyleBy& target = line.addStyleBy();
    probe().cloneStyleBy(other, target);
    EXPECT_FALSE(target.isDomainPresent() || target.isCyclePresent());
}

TEST_F(Cloning, AStyleCycleOfTheElementKeepsOnlyColoursSwappedFromAPoint) {
    GrxStyleCycle& own = chart_.addStyleCycle(ChartString("ownCycle"));
    GrxStyle& first = own.addCycle().addStyle();
    first.setColor(u"red");
    first.setColor2(u"black");
    first.setSymbol(u"circle");
    GrxStyleBy& styleBy = point_->addStyleBy();
    styleBy.SetAttribute(GrxUni::_variable, u"var_gender");
    styleBy.setCycle(own);
    const struct {
        const char* from;
        const char* to;
        const char* colours;
    } cases[] = {
        {"point", "text", "black/red"}, {"point", "line", "black/red"}, {"area", "line", "red/black"}};
    for (const auto& c : cases) {
        SCOPED_TRACE(std::string(c.from) + " to " + c.to);
        GrxArea& to = graph_->addArea();
        probe().cloneStyleCycle(to, *point_, u"labelCycle", ChartString(c.from), ChartString(c.to));
        ASSERT_EQ(to.getStyleBys().size(), 1u);
        const GrxStyleBy& made = *to.getStyleBys()[0];
        EXPECT_EQ(u8(made.GetAttribute(GrxUni::_variable)), "var_gender");
        ASSERT_NE(made.getCycle(), nullptr);
        EXPECT_TRUE(fresh(made.getCycle()->getId(), "labelCycle", ""));
        const GrxStyle& style = *made.getCycle()->getCycles().at(0)->getStyles().at(0);
        EXPECT_EQ(u8(style.getColor()) + "/" + u8(style.getColor2()), c.colours);
        EXPECT_FALSE(style.isSymbolPresent());
    }
    // The new style-by's variable is a source or an expression variable only.
    GrxDerivedVariable& derived = chart_.addDerivedVariable();
    derived.setId(u"derived1");
    styleBy.removeCycle();
    styleBy.setVariable(derived);
    GrxArea& a = graph_->addArea();
    probe().cloneStyleCycle(a, *point_, u"c", ChartString("point"), ChartString("line"));
    ASSERT_EQ(a.getStyleBys().size(), 1u);
    EXPECT_FALSE(a.getStyleBys()[0]->isVariablePresent() || a.getStyleBys()[0]->isCyclePresent());
}

TEST_F(Cloning, ColourTwoReplacesColourWhereUnsetOrForcedAndColoursTurnMain) {
    // One style per "colour/colour2" word; "-" leaves one out.
    const auto cycleOf = [&](const std::string& words) -> GrxStyleCycle& {
        GrxStyleCycle& sc = chart_.addStyleCycle(probe().CreateUniqueId(ChartString("swap")));
        GrxCycle& cycle = sc.addCycle();
        std::istringstream in(words);
        for (std::string word; in >> word;) {
            GrxStyle& style = cycle.addStyle();
            const std::string colour = word.substr(0, word.find('/')),
                              colour2 = word.substr(word.find('/') + 1);
            if (colour != "-")
                style.setColor(ChartString(colour).xc_str());
            if (colour2 != "-")
                style.setColor2(ChartString(colour2).xc_str());
        }
        return sc;
    };
    // Without force explicit colours stay; colour 2 itself stays too.
    GrxStyleCycle& sc = cycleOf("red/blue transparent/- -/green -/-");
    GrxLine& line = graph_->addLine();
    line.addStyleBy().setCycle(sc);
    line.addStyleBy(); // without a cycle: counted, nothing to change
    line.addColor();
    line.addColor().setAffect(1);
    line.addColor().setAffect(3);
    EXPECT_EQ(probe().changeColor2ToColor(line, false), 2u);
    EXPECT_EQ(styles(&sc, GrxUni::_color) + styles(&sc, GrxUni::_color2),
              "red|black|green|black|blue||green||");
    std::string affects;
    for (const GrxColor* colour : line.getColors())
        affects += std::to_string(colour->getAffect());
    EXPECT_EQ(affects, "212");

    // With force every style takes its colour 2; the element's own colour is not the labeling's.
    GrxStyleCycle& forced = cycleOf("red/blue white/- red/transparent");
    GrxLabeling& labeling = point_->addLabeling();
    labeling.addStyleBy().setCycle(forced);
    labeling.addColor().setAffect(0);
    EXPECT_EQ(probe().changeColor2ToColor(labeling, true), 1u);
    EXPECT_EQ(styles(&forced, GrxUni::_color), "blue|black|black|");
    EXPECT_EQ(labeling.getColors()[0]->getAffect(), 2);
    EXPECT_EQ(point_->getColors()[0]->getAffect(), 1);
}

TEST_F(Cloning, CloneLegendEntryAddsATargetPerMatchingTargetOfEveryLegend) {
    GrxColor& made = graph_->addLine().addColor();
    made.setId(probe().CreateUniqueId(ChartString("color")));
    GrxLegend& second = chart_.addLegend();
    second.setId(u"legend_2");
    second.addLegendTarget(*point_->getShapes()[0]).setId(u"legend_2_target1");
    second.addLegendTarget(*point_->getColors()[0]).setId(u"legend_2_target2");
    probe().CloneLegendEntry(ChartString("color_1"), made);
    EXPECT_EQ(listed(made), 1);
    ASSERT_EQ(second.getLegendTargets().size(), 3u);
    EXPECT_EQ(second.getLegendTargets()[2]->getTarget(), &made);
    // An empty old id matches nothing, not even targets without a reference.
    legend_->addLegendTarget(made).removeTarget();
    const std::size_t count = legend_->getLegendTargets().size();
    probe().CloneLegendEntry(ChartString(), made);
    EXPECT_EQ(legend_->getLegendTargets().size(), count);
}

// Onto a new line and a new point, labelings included.
TEST_F(Cloning, EveryElementOfEverySampleClonedStaysValidWithUniqueIds) {
    for (const std::string& path : grammar_test::sampleCharts()) {
        GrxVisualization& chart = parse(grammar_test::readText(path));
        Probe probe(nullptr, chart, nullptr);
        for (GrrUviza* graph : chart.getGraphs()) {
            std::vector<CTElementType*> elements;
            BaseTemplate::getAllElements(*graph, elements);
            for (CTElementType* element : elements) {
                probe.cloneElementChildren(*element, graph->addLine(), true);
                probe.cloneElementChildren(*element, graph->addPoint(), true);
                for (GrxLabeling* labeling : element->getLabelings())
                    probe.cloneElementAesthetics(*element, *labeling, true);
            }
        }
        EXPECT_EQ(grammar_test::chartFaults(chart), "") << path;
    }
}

} // namespace
