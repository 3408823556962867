// Copying the content of one chart object onto another under fresh ids.
#include "support/EngineSupport.h"
#include "support/GrammarSupport.h"

#include <plotaid/BaseTemplate.h>

#include <xercesc/dom/DOM.hpp>

#include <sstream>

using engine_test::Chart;
using engine_test::EngineTest;

namespace {

// The base as an action that does nothing, to reach its shared operations.
class Probe : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override { return false; }
};

std::string utf8(const XMLCh* s) {
    return ChartString(s).toUTF8();
}

bool startsWith(const std::string& text, const std::string& start) {
    return text.compare(0, start.size(), start) == 0;
}

// The scatter sample: a point with a shape and a colour by gender, both listed by the legend.
class Cloning : public EngineTest {
protected:
    void SetUp() override {
        chart_ = Chart::parse(engine_test::example("charts/scatter.xml"));
        ASSERT_TRUE(chart_.vis);
        graph_ = chart_.vis->getGraphs().at(0);
        point_ = graph_->getPoints().at(0);
        legend_ = chart_.vis->getLegends().at(0);
        repository_ = chart_.vis->getExtension()->getStyleCycleRepository();
        ASSERT_NE(repository_, nullptr);
    }
    Probe probe() { return Probe(nullptr, *chart_.vis, nullptr); }
    // A new style of the cycle, dashed when `dashes` is given.
    GrxStyle& styleIn(GrxCycle& cycle, const XMLCh* dashes) {
        GrxStyle& style = cycle.addStyle();
        if (dashes != nullptr)
            style.setStroke_dasharray(dashes);
        return style;
    }
    // Legend targets that name `id`.
    int listed(const std::string& id) const {
        int n = 0;
        for (const GrxLegendTarget* t : legend_->getLegendTargets())
            n += utf8(t->GetAttribute(GrxUni::_target)) == id;
        return n;
    }
    static std::vector<std::string> dashes(const GrxStyleCycle* sc) {
        std::vector<std::string> out;
        for (const GrxStyle* s : sc->getCycles().at(0)->getStyles())
            out.push_back(utf8(s->getStroke_dasharray()));
        return out;
    }

    Chart chart_;
    GrrUviza* graph_ = nullptr;
    GrxPoint* point_ = nullptr;
    GrxLegend* legend_ = nullptr;
    GrxStyleCycle* repository_ = nullptr;
};

TEST_F(Cloning, DuplicateAttributesCopiesAllButTheId) {
    GrxStyle& onlyId = chart_.vis->addStyle();
    onlyId.setId(u"onlyId");
    GrxStyle& to = chart_.vis->addStyle();
    to.setId(u"to");
    to.setColor(u"red");
    EXPECT_EQ(probe().duplicateAttributes(onlyId, to), 0u);
    EXPECT_EQ(to.getImplementation()->getAttributes()->getLength(), 2u);

    GrxStyle& from = chart_.vis->addStyle();
    from.setId(u"from");
    from.setColor(u"blue");
    from.setSymbol(u"circle");
    EXPECT_EQ(probe().duplicateAttributes(from, to), 2u);
    EXPECT_EQ(utf8(to.getColor()) + " " + utf8(to.getSymbol()) + " " + utf8(to.getId()), "blue circle to");
    EXPECT_EQ(chart_.vis->getElementById(u"from"), from.getImplementation());
}

TEST_F(Cloning, APointOntoALineTurnsShapesIntoDashesOfTheRepositoryDashCycle) {
    GrxCycle& dashCycle = repository_->addCycle();
    styleIn(dashCycle, u"none").setId(u"repositoryDash1");
    styleIn(dashCycle, u"4 2").setStroke_width(u"2pt");
    GrxLine& line = graph_->addLine();
    const std::size_t cyclesBefore = chart_.vis->getStyleCycles().size();

    EXPECT_TRUE(probe().cloneElementChildren(*point_, line, true));

    EXPECT_TRUE(line.getShapes().empty());
    ASSERT_EQ(line.getDashs().size(), 1u);
    const GrxDash& dash = *line.getDashs()[0];
    EXPECT_TRUE(startsWith(utf8(dash.getId()), "shape") && utf8(dash.getId()) != "shape_1");
    EXPECT_EQ(utf8(dash.GetAttribute(GrxUni::_variable)), "var_gender");
    EXPECT_EQ(utf8(dash.GetAttribute(GrxUni::_domain)), "domain_gender");

    // The dash cycles through a new style cycle holding copies of the repository's dash styles.
    ASSERT_EQ(chart_.vis->getStyleCycles().size(), cyclesBefore + 1);
    const GrxStyleCycle* made = dash.getCycle();
    ASSERT_TRUE(made != nullptr && made != repository_);
    EXPECT_TRUE(startsWith(utf8(made->getId()), "styleCycle"));
    EXPECT_EQ(dashes(made), (std::vector<std::string>{"none", "4 2"}));
    const std::vector<GrxStyle*> styles = made->getCycles()[0]->getStyles();
    EXPECT_EQ(utf8(styles[1]->getStroke_width()), "2pt");
    EXPECT_FALSE(styles[0]->isIdPresent());

    // The colour comes along; variables, coordinates and the dot setting follow the point.
    ASSERT_EQ(line.getColors().size(), 1u);
    const GrxColor& colour = *line.getColors()[0];
    EXPECT_TRUE(startsWith(utf8(colour.getId()), "color") && utf8(colour.getId()) != "color_1");
    EXPECT_EQ(colour.getCycle(), repository_);
    EXPECT_EQ(colour.getAffect(), 1);
    ASSERT_TRUE(line.getX() && line.getY());
    EXPECT_EQ(utf8(line.getX()->GetAttribute(GrxUni::_variable)), "var_salbegin");
    EXPECT_EQ(utf8(line.getY()->GetAttribute(GrxUni::_variable)), "var_salary");
    EXPECT_EQ(line.getCoordinates(), point_->getCoordinates());
    EXPECT_TRUE(line.isDotPresent() && !line.getDot());

    // Both new aesthetics are childless, so the legend lists them beside the old ones.
    EXPECT_EQ(listed("color_1") + listed("shape_1"), 2);
    EXPECT_EQ(listed(utf8(colour.getId())) + listed(utf8(dash.getId())), 2);
    for (const GrxLegendTarget* t : legend_->getLegendTargets())
        EXPECT_TRUE(startsWith(utf8(t->getId()), "legend")) << utf8(t->getId());
    EXPECT_EQ(grammar_test::chartFaults(*chart_.vis), "");
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
    const std::size_t cyclesBefore = chart_.vis->getStyleCycles().size();
    probe().cloneElementAesthetics(*point_, path, false);
    ASSERT_EQ(path.getDashs().size(), 1u);
    EXPECT_FALSE(path.getDashs()[0]->isCyclePresent());
    EXPECT_EQ(chart_.vis->getStyleCycles().size(), cyclesBefore);
    EXPECT_EQ(listed(utf8(path.getDashs()[0]->getId())), 0); // no legend flag

    styleIn(repository_->addCycle(), u"1 1");
    GrxCycle& second = repository_->addCycle();
    styleIn(second, nullptr).setColor(u"red");
    styleIn(second, u"9 9"); // its second style dashes: still a dash cycle
    styleIn(repository_->addCycle(), u"5 5").setSymbol(u"square");
    GrxLine& line = graph_->addLine();
    probe().cloneElementAesthetics(*point_, line, false);
    ASSERT_EQ(line.getDashs().size(), 1u);
    ASSERT_NE(line.getDashs()[0]->getCycle(), nullptr);
    EXPECT_EQ(dashes(line.getDashs()[0]->getCycle()), (std::vector<std::string>{"", "9 9"}));
    EXPECT_EQ(grammar_test::chartFaults(*chart_.vis), "");
}

TEST_F(Cloning, APointOntoAPointKeepsShapesMappingsScalesStatisticsAndStyledConditions) {
    GrxSymbolMapping& mapping = point_->getShapes().at(0)->addSymbolMapping();
    mapping.setFrom(u"Male");
    mapping.setTo(u"square");
    point_->getShapes()[0]->addScale(1).removeMethod(); // a scale that does not say its method
    GrxColor& colour = *point_->getColors()[0];
    colour.addScale(2).setInvert(true);
    colour.addColorMapping().setTo(u"red");
    colour.addColorMapping().setFrom(u"Male");
    colour.addDashMapping().setFrom(u"ignored");
    colour.addSummaryStatistic().setMethod(4);
    GrxStyle& style = chart_.vis->addStyle();
    style.setId(u"highlight");
    point_->addConditionalStyle(ChartString("x > 10"), style);
    point_->addConditionalStyle(ChartString("y > 5"), style).SetAttribute(GrxUni::_style, u"nowhere");
    point_->setDot(true);

    GrxPoint& copy = graph_->addPoint();
    probe().cloneElementAesthetics(*point_, copy, true);
    EXPECT_TRUE(copy.getDashs().empty());
    EXPECT_TRUE(copy.getDot());
    ASSERT_EQ(copy.getShapes().size(), 1u);
    const GrxShape& shape = *copy.getShapes()[0];
    EXPECT_EQ(shape.getCycle(), repository_);
    ASSERT_EQ(shape.getSymbolMappings().size(), 1u);
    EXPECT_EQ(utf8(shape.getSymbolMappings()[0]->getTo()), "square");
    // The new scale starts as method 3; only what the old one says is copied over it.
    ASSERT_NE(shape.getScale(), nullptr);
    EXPECT_EQ(shape.getScale()->getMethod(), 3);

    const GrxColor& made = *copy.getColors().at(0);
    ASSERT_TRUE(made.getScale() && made.getSummaryStatistic());
    EXPECT_EQ(made.getScale()->getMethod(), 2);
    EXPECT_TRUE(made.getScale()->getInvert());
    ASSERT_EQ(made.getColorMappings().size(), 2u);
    EXPECT_EQ(utf8(made.getColorMappings()[0]->getTo()) + utf8(made.getColorMappings()[1]->getFrom()),
              "redMale");
    EXPECT_TRUE(made.getDashMappings().empty());
    EXPECT_EQ(made.getSummaryStatistic()->getMethod(), 4);
    // Aesthetics with children get no legend entry.
    EXPECT_EQ(listed(utf8(shape.getId())) + listed(utf8(made.getId())), 0);

    // A condition whose style names nothing is skipped, and reported.
    EXPECT_FALSE(probe().cloneConditionalStyles(*point_, copy));
    const std::vector<GrxConditionalStyle*> conditions = copy.getConditionalStyles();
    ASSERT_EQ(conditions.size(), 1u);
    EXPECT_EQ(utf8(conditions[0]->getWhen()), "x > 10");
    EXPECT_EQ(conditions[0]->getStyle(), &style);
}

TEST_F(Cloning, OntoALabelingOnlyStyleBysComponentsColoursAndSizesAndSizesGetTheElementDefaults) {
    point_->addStyleBy().setVariable(*point_->getColors()[0]->getVariable());
    point_->addColorComponent().setType(1);
    point_->addDash();
    point_->addPattern();
    point_->addSize();
    point_->addRotation();
    point_->addTransparency();
    point_->addOffset();
    GrxLabeling& labeling = point_->addLabeling();
    const std::size_t before = labeling.getImplementation()->getChildElementCount();
    EXPECT_FALSE(probe().cloneElementAesthetics(*point_, labeling, false));

    EXPECT_EQ(labeling.getImplementation()->getChildElementCount(), before + 4);
    EXPECT_EQ(labeling.getColors().size(), 1u);
    ASSERT_EQ(labeling.getStyleBys().size(), 1u);
    ASSERT_EQ(labeling.getColorComponents().size(), 1u);
    ASSERT_EQ(labeling.getSizes().size(), 1u);
    EXPECT_EQ(utf8(labeling.getSizes()[0]->getLow()) + "-" + utf8(labeling.getSizes()[0]->getHigh()),
              "6pt-18pt");
    EXPECT_EQ(labeling.getColorComponents()[0]->getType(), 1);
    EXPECT_TRUE(startsWith(utf8(labeling.getSizes()[0]->getId()), "length"));
    EXPECT_TRUE(startsWith(utf8(labeling.getColorComponents()[0]->getId()), "colorComponent"));
    EXPECT_TRUE(startsWith(utf8(labeling.getStyleBys()[0]->getId()), "styleBy"));
    EXPECT_EQ(grammar_test::chartFaults(*chart_.vis), "");

    // Onto an interval, a size without bounds gets the interval's; one with a bound keeps it alone.
    point_->addSize().setLow(u"1pt");
    GrxInterval& interval = graph_->addInterval();
    probe().cloneElementAesthetics(*point_, interval, false);
    const std::vector<GrxSize*> sizes = interval.getSizes();
    ASSERT_EQ(sizes.size(), 2u);
    EXPECT_EQ(utf8(sizes[0]->getLow()) + "-" + utf8(sizes[0]->getHigh()), "0.25pt-3pt");
    EXPECT_EQ(utf8(sizes[1]->getLow()), "1pt");
    EXPECT_FALSE(sizes[1]->isHighPresent());
    EXPECT_NE(utf8(sizes[0]->getId()), utf8(sizes[1]->getId()));
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
    EXPECT_TRUE(startsWith(utf8(made.getId()), "styleBy") && utf8(made.getId()) != "styleBy_gender");
    for (const XMLCh* name : {GrxUni::_dimension, GrxUni::_domain, GrxUni::_variable})
        EXPECT_EQ(utf8(made.GetAttribute(name)), utf8(styleBy.GetAttribute(name)));
    const GrxStyleCycle* cycle = made.getCycle();
    ASSERT_TRUE(cycle != nullptr && cycle != repository_);
    ASSERT_EQ(cycle->getCycles().size(), 1u);
    const std::vector<GrxStyle*> styles = cycle->getCycles()[0]->getStyles();
    const std::vector<GrxStyle*> old = repository_->getCycles()[0]->getStyles();
    ASSERT_EQ(styles.size(), old.size());
    for (std::size_t i = 0; i < styles.size(); ++i) {
        EXPECT_EQ(utf8(styles[i]->getColor()) + utf8(styles[i]->getSymbol()),
                  utf8(old[i]->getColor()) + utf8(old[i]->getSymbol()));
        EXPECT_FALSE(styles[i]->isIdPresent());
    }
    // A domain of another kind is not taken over.
    GrxStyleBy& other = point_->addStyleBy();
    other.SetAttribute(GrxUni::_domain, u"dim_x");
    GrxStyleBy& target = line.addStyleBy();
    probe().cloneStyleBy(other, target);
    EXPECT_FALSE(target.isDomainPresent() || target.isCyclePresent());
    EXPECT_EQ(grammar_test::chartFaults(*chart_.vis), "");
}

TEST_F(Cloning, AStyleCycleOfTheElementKeepsOnlyColoursSwappedFromAPoint) {
    GrxStyleCycle& own = chart_.vis->addStyleCycle(ChartString("ownCycle"));
    GrxCycle& cycle = own.addCycle();
    GrxStyle& first = cycle.addStyle();
    first.setColor(u"red");
    first.setColor2(u"black");
    first.setSymbol(u"circle");
    cycle.addStyle().setColor(u"blue"); // no colour 2
    GrxStyleBy& styleBy = point_->addStyleBy();
    styleBy.SetAttribute(GrxUni::_variable, u"var_gender");
    styleBy.setCycle(own);

    const struct {
        const char* from;
        const char* to;
        bool swapped;
    } cases[] = {
        {"point", "text", true}, {"point", "line", true}, {"area", "line", false}, {"point", "area", false}};
    for (const auto& c : cases) {
        SCOPED_TRACE(std::string(c.from) + " to " + c.to);
        GrxArea& to = graph_->addArea();
        probe().cloneStyleCycle(to, *point_, u"labelCycle", ChartString(c.from), ChartString(c.to));
        ASSERT_EQ(to.getStyleBys().size(), 1u);
        const GrxStyleBy& made = *to.getStyleBys()[0];
        EXPECT_EQ(utf8(made.GetAttribute(GrxUni::_variable)), "var_gender");
        ASSERT_NE(made.getCycle(), nullptr);
        EXPECT_TRUE(startsWith(utf8(made.getCycle()->getId()), "labelCycle"));
        const std::vector<GrxStyle*> styles = made.getCycle()->getCycles().at(0)->getStyles();
        ASSERT_EQ(styles.size(), 2u);
        EXPECT_EQ(utf8(styles[0]->getColor()) + "/" + utf8(styles[0]->getColor2()),
                  c.swapped ? "black/red" : "red/black");
        EXPECT_EQ(styles[0]->getImplementation()->getAttributes()->getLength(), 2u); // no symbol
        EXPECT_EQ(styles[1]->isColorPresent(), !c.swapped);
        EXPECT_EQ(styles[1]->isColor2Present(), c.swapped);
    }
    EXPECT_EQ(grammar_test::chartFaults(*chart_.vis), "");

    // The new style-by's variable is a source or an expression variable only; a from without
    // style-bys adds none.
    GrxDerivedVariable& derived = chart_.vis->addDerivedVariable();
    derived.setId(u"derived1");
    GrxExpressionVariable& expression = chart_.vis->addExpressionVariable();
    expression.setId(u"expression1");
    GrxArea& none = graph_->addArea();
    probe().cloneStyleCycle(none, graph_->addPoint(), u"c", ChartString("point"), ChartString("line"));
    EXPECT_TRUE(none.getStyleBys().empty());
    styleBy.removeCycle();
    styleBy.setVariable(derived);
    GrxArea& a = graph_->addArea();
    probe().cloneStyleCycle(a, *point_, u"c", ChartString("point"), ChartString("line"));
    ASSERT_EQ(a.getStyleBys().size(), 1u);
    EXPECT_FALSE(a.getStyleBys()[0]->isVariablePresent() || a.getStyleBys()[0]->isCyclePresent());
    styleBy.setVariable(expression);
    GrxArea& b = graph_->addArea();
    probe().cloneStyleCycle(b, *point_, u"c", ChartString("point"), ChartString("line"));
    EXPECT_EQ(b.getStyleBys().at(0)->getVariable(), &expression);
}

TEST_F(Cloning, ColourTwoReplacesColourWhereUnsetOrForcedAndColoursTurnMain) {
    // A style cycle with one style per "colour/colour2" word; "-" leaves one out.
    const auto cycleOf = [&](const std::string& words) -> GrxStyleCycle& {
        GrxStyleCycle& sc = chart_.vis->addStyleCycle(probe().CreateUniqueId(ChartString("swap")));
        GrxCycle& cycle = sc.addCycle();
        std::istringstream in(words);
        for (std::string word; in >> word;) {
            GrxStyle& s = cycle.addStyle();
            const std::string colour = word.substr(0, word.find('/')),
                              colour2 = word.substr(word.find('/') + 1);
            if (colour != "-")
                s.setColor(ChartString(colour).xc_str());
            if (colour2 != "-")
                s.setColor2(ChartString(colour2).xc_str());
        }
        return sc;
    };
    const auto colours = [](const GrxStyleCycle& sc) {
        std::string out;
        for (const GrxStyle* s : sc.getCycles()[0]->getStyles())
            out += utf8(s->getColor()) + " ";
        return out;
    };
    // Without force explicit colours stay; colour 2 itself stays too.
    GrxStyleCycle& sc = cycleOf("red/blue transparent/- -/green transparent/transparent -/-");
    GrxLine& line = graph_->addLine();
    line.addStyleBy().setCycle(sc);
    line.addStyleBy(); // without a cycle: counted, nothing to change
    GrxColor& absent = line.addColor();
    GrxColor& both = line.addColor();
    both.setAffect(1);
    GrxColor& secondary = line.addColor();
    secondary.setAffect(3);
    EXPECT_EQ(probe().changeColor2ToColor(line, false), 2u);
    EXPECT_EQ(colours(sc), "red black green black black ");
    EXPECT_EQ(utf8(sc.getCycles()[0]->getStyles()[0]->getColor2()), "blue");
    EXPECT_EQ(absent.getAffect(), 2);
    EXPECT_EQ(both.getAffect(), 1);
    EXPECT_EQ(secondary.getAffect(), 2);

    // With force every style takes its colour 2; the element's own colour is not the labeling's.
    GrxStyleCycle& forced = cycleOf("red/blue white/- red/transparent");
    GrxLabeling& labeling = point_->addLabeling();
    labeling.addStyleBy().setCycle(forced);
    GrxColor& colour = labeling.addColor();
    colour.setAffect(0);
    EXPECT_EQ(probe().changeColor2ToColor(labeling, true), 1u);
    EXPECT_EQ(colours(forced), "blue black black ");
    EXPECT_EQ(colour.getAffect(), 2);
    EXPECT_EQ(point_->getColors()[0]->getAffect(), 1);
}

TEST_F(Cloning, CloneLegendEntryAddsATargetPerMatchingTargetOfEveryLegend) {
    GrxColor& made = graph_->addLine().addColor();
    made.setId(probe().CreateUniqueId(ChartString("color")));
    GrxLegend& second = chart_.vis->addLegend();
    second.setId(u"legend_2");
    second.addLegendTarget(*point_->getColors()[0]).setId(u"legend_2_target1");
    second.addLegendTarget(*point_->getShapes()[0]).setId(u"legend_2_target2");
    probe().CloneLegendEntry(ChartString("color_1"), made);
    EXPECT_EQ(listed(utf8(made.getId())), 1);
    ASSERT_EQ(second.getLegendTargets().size(), 3u);
    EXPECT_EQ(second.getLegendTargets()[2]->getTarget(), &made);
    // An empty old id matches nothing, not even targets without a reference.
    legend_->addLegendTarget(made).removeTarget();
    const std::size_t count = legend_->getLegendTargets().size();
    probe().CloneLegendEntry(ChartString(), made);
    EXPECT_EQ(legend_->getLegendTargets().size(), count);
    legend_->getLegendTargets().back()->setId(u"untargeted");
    EXPECT_EQ(grammar_test::chartFaults(*chart_.vis), "");
}

// Every element of every sample chart cloned onto a new line and a new point, legends and
// labelings included: the ids stay unique and the chart stays valid for both validators.
TEST(ClonedSamples, StayValidWithUniqueIds) {
    plotaid::detail::XercesRuntime runtime;
    const std::vector<std::string> charts = grammar_test::sampleCharts();
    ASSERT_GE(charts.size(), 10u);
    std::size_t labelings = 0;
    for (const std::string& path : charts) {
        Chart chart = Chart::parse(grammar_test::readText(path));
        ASSERT_TRUE(chart.vis) << path;
        Probe probe(nullptr, *chart.vis, nullptr);
        std::size_t clones = 0;
        for (GrrUviza* graph : chart.vis->getGraphs()) {
            std::vector<CTElementType*> elements;
            BaseTemplate::getAllElements(*graph, elements);
            for (CTElementType* element : elements) {
                probe.cloneElementChildren(*element, graph->addLine(), true);
                probe.cloneElementChildren(*element, graph->addPoint(), true);
                for (GrxLabeling* labeling : element->getLabelings()) {
                    probe.cloneElementAesthetics(*element, *labeling, true);
                    ++labelings;
                }
                clones += 2;
            }
        }
        EXPECT_GT(clones, 0u) << path;
        EXPECT_EQ(grammar_test::chartFaults(*chart.vis), "") << path;
    }
    EXPECT_GT(labelings, 0u);
}

} // namespace
