#include "support/EngineSupport.h"

#include <plotaid/BaseTemplate.h>

#include <xercesc/dom/DOM.hpp>

using namespace XERCES_CPP_NAMESPACE;
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

class BaseTemplateTest : public EngineTest {
protected:
    void SetUp() override { chart_ = Chart::empty(); }
    // An instruction element with the given attributes, in a document of its own.
    const DOMElement* instruction(std::initializer_list<std::pair<const XMLCh*, const XMLCh*>> attributes) {
        if (!instructions_.vis)
            instructions_ = Chart::empty();
        DOMDocument* d = instructions_.document();
        DOMElement* e = d->createElement(u"setStyle");
        d->getDocumentElement()->appendChild(e);
        for (const auto& [name, value] : attributes)
            e->setAttribute(name, value);
        return e;
    }
    GrrUviza& graph() { return chart_.vis->addGraph(); }
    Chart chart_;
    Chart instructions_;
};

TEST_F(BaseTemplateTest, StylesGoIntoOneContainerUnderFreshIds) {
    Probe probe(nullptr, *chart_.vis, nullptr);
    GrxStyle& first = probe.addStyle(*chart_.vis, u"");
    GrxStyle& second = probe.addStyle(*chart_.vis, nullptr);
    EXPECT_EQ(utf8(first.getId()), "style1");
    EXPECT_EQ(utf8(second.getId()), "style2");
    GrxStyle* container = chart_.vis->getStyleById(u"c-o-n-t-a-i-n-er");
    ASSERT_NE(container, nullptr);
    EXPECT_EQ(container->getStyles().size(), 2u);
    EXPECT_EQ(first.getImplementation()->getParentNode(), container->getImplementation());
    EXPECT_EQ(chart_.vis->getStyles().size(), 1u); // only the container at the top
}

TEST_F(BaseTemplateTest, AnExistingStyleIsReturnedAndNothingAdded) {
    GrxStyle& own = chart_.vis->addStyle();
    own.setId(u"titleStyle");
    Probe probe(nullptr, *chart_.vis, nullptr);
    EXPECT_EQ(&probe.addStyle(*chart_.vis, u"titleStyle"), &own);
    EXPECT_EQ(chart_.vis->getStyleById(u"c-o-n-t-a-i-n-er"), nullptr);
}

TEST_F(BaseTemplateTest, AnIdHeldByAnotherKindOfElementIsNotTakenFromIt) {
    GrrUviza& g = graph();
    g.setId(u"main");
    Probe probe(nullptr, *chart_.vis, nullptr);
    GrxStyle& style = probe.addStyle(*chart_.vis, u"main");
    EXPECT_EQ(chart_.vis->getElementById(u"main"), g.getImplementation());
    EXPECT_EQ(utf8(style.getId()), "main1");
}

TEST_F(BaseTemplateTest, GraphsAreSelectedByNumberAndAllCounted) {
    GrrUviza& a = graph();
    GrrUviza& b = graph();
    GrxContainer& box = chart_.vis->addContainer();
    GrrUviza& c = box.addGraph(); // deeper graphs count too
    std::vector<GrrUviza*> picked;
    EXPECT_EQ(Probe(nullptr, *chart_.vis, instruction({{u"graph", u"2"}})).getGraphs(picked), 3u);
    EXPECT_EQ(picked, (std::vector<GrrUviza*>{&b}));
    picked.clear();
    EXPECT_EQ(Probe(nullptr, *chart_.vis, instruction({})).getGraphs(picked), 3u);
    EXPECT_EQ(picked, (std::vector<GrrUviza*>{&a, &b, &c}));
    picked.clear();
    EXPECT_EQ(Probe(nullptr, *chart_.vis, instruction({{u"graph", u"7"}})).getGraphs(picked), 3u);
    EXPECT_TRUE(picked.empty());
    EXPECT_EQ(Probe(nullptr, *chart_.vis).getGraphs(picked), 3u); // no instruction: all
    EXPECT_EQ(picked.size(), 3u);
}

TEST_F(BaseTemplateTest, DimensionRolesCountReferencesButReturnOnlyDimensions) {
    GrrUviza& g = graph();
    GrxCoordinates& first = g.addCoordinates();
    GrxDimension& x = first.addDimension();
    GrxDimension& y = first.addDimension();
    Probe probe(nullptr, *chart_.vis, nullptr);
    EXPECT_EQ(probe.getDimensionsByRole(g, ChartString("x")), (std::vector<GrxDimension*>{&x}));
    EXPECT_EQ(probe.getDimensionsByRole(g, ChartString("y")), (std::vector<GrxDimension*>{&y}));
    EXPECT_TRUE(probe.getDimensionsByRole(g, ChartString("y2")).empty());
    EXPECT_TRUE(probe.getDimensionsByRole(g, ChartString("z")).empty());
    EXPECT_TRUE(probe.getDimensionsByRole(g, ChartString("w")).empty());

    GrxCoordinates& second = g.addCoordinates();
    second.addDimensionReference().setDimension(x); // takes the first place
    GrxDimension& y2 = second.addDimension();
    GrxDimension& z = second.addDimension();
    EXPECT_EQ(probe.getDimensionsByRole(g, ChartString("x")), (std::vector<GrxDimension*>{&x}));
    EXPECT_EQ(probe.getDimensionsByRole(g, ChartString("y")), (std::vector<GrxDimension*>{&y}));
    EXPECT_EQ(probe.getDimensionsByRole(g, ChartString("y2")), (std::vector<GrxDimension*>{&y2}));
    EXPECT_EQ(probe.getDimensionsByRole(g, ChartString("z")), (std::vector<GrxDimension*>{&z}));
}

TEST_F(BaseTemplateTest, QuestionsAboutAGraph) {
    GrrUviza& g = graph();
    GrxCoordinates& coordinates = g.addCoordinates();
    GrxDimension& x = coordinates.addDimension();
    coordinates.addDimension();
    Probe probe(nullptr, *chart_.vis, nullptr);
    EXPECT_FALSE(probe.isGraphPolar(g));
    EXPECT_FALSE(probe.isGraphClustered(g));
    coordinates.addPolarTransform();
    EXPECT_TRUE(probe.isGraphPolar(g));
    GrxSourceVariable& cluster = chart_.vis->addSourceVariable();
    x.setClusterVariable(cluster);
    EXPECT_TRUE(probe.isGraphClustered(g));

    EXPECT_FALSE(probe.isChartTrue3D(g));
    probe.addZDimension(g);
    ASSERT_EQ(coordinates.getDimensions().size(), 3u);
    probe.addZDimension(g); // three already: nothing more
    EXPECT_EQ(coordinates.getDimensions().size(), 3u);
    coordinates.getDimensions()[2]->addAxis();
    GrxPoint& point = g.addPoint();
    EXPECT_FALSE(probe.isChartTrue3D(g));
    point.addZ();
    EXPECT_TRUE(probe.isChartTrue3D(g));
}

TEST_F(BaseTemplateTest, ElementsKindByKindAndRangesAndAxes) {
    GrrUviza& g = graph();
    GrxInterval& bar = g.addInterval();
    GrxPoint& point = g.addPoint();
    GrxLine& line = g.addLine();
    std::vector<CTElementType*> all;
    BaseTemplate::getAllElements(g, all);
    EXPECT_EQ(all, (std::vector<CTElementType*>{&point, &line, &bar}));

    Probe probe(nullptr, *chart_.vis, nullptr);
    EXPECT_FALSE(probe.isIntervalRangeElement(bar));
    bar.addSummaryStatistic().setMethod(7);
    EXPECT_TRUE(probe.isIntervalRangeElement(bar));
    point.addSummaryStatistic().setMethod(7);
    EXPECT_FALSE(probe.isIntervalRangeElement(point));
    EXPECT_EQ(probe.getElementsWithSummaryStatistics(g), std::vector<CTElementType*>{});
    line.addSummaryStatistic().setMethod(4);
    EXPECT_EQ(probe.getElementsWithSummaryStatistics(g), (std::vector<CTElementType*>{&line}));

    GrxAxis& axis = g.addCoordinates().addDimension().addAxis();
    EXPECT_FALSE(probe.isAxisDerived(axis));
    axis.setTransform(0);
    EXPECT_TRUE(probe.isAxisDerived(axis));

    std::vector<CTElementType*> lines;
    probe.getAllElementsByType(u"line", lines);
    EXPECT_EQ(lines, (std::vector<CTElementType*>{&line}));
}

TEST_F(BaseTemplateTest, ScatterplotMatrixElementNeedsSlashesInBothExpressions) {
    GrrUviza& g = graph();
    GrxPoint& point = g.addPoint();
    GrxExpressionVariable& ex = chart_.vis->addExpressionVariable();
    GrxExpressionVariable& ey = chart_.vis->addExpressionVariable();
    ex.setValue(u"a/b");
    ey.setValue(u"c");
    point.addX().setVariable(ex);
    point.addY().setVariable(ey);
    Probe probe(nullptr, *chart_.vis, nullptr);
    EXPECT_EQ(probe.getFirstSPLOMElement(g), nullptr);
    ey.setValue(u"c/d");
    EXPECT_EQ(probe.getFirstSPLOMElement(g), &point);
}

TEST_F(BaseTemplateTest, BooleanAttributesAreExact) {
    const DOMElement* e = instruction({{u"a", u"true"}, {u"b", u"false"}, {u"c", u"TRUE"}, {u"d", u""}});
    EXPECT_TRUE(BaseTemplate::getBooleanAttribute(e, u"a", false));
    EXPECT_FALSE(BaseTemplate::getBooleanAttribute(e, u"b", true));
    EXPECT_TRUE(BaseTemplate::getBooleanAttribute(e, u"c", true));
    EXPECT_FALSE(BaseTemplate::getBooleanAttribute(e, u"c", false));
    EXPECT_TRUE(BaseTemplate::getBooleanAttribute(e, u"d", true));
    EXPECT_FALSE(BaseTemplate::getBooleanAttribute(e, u"absent", false));
    EXPECT_TRUE(BaseTemplate::getBooleanAttribute(nullptr, u"a", true));
}

TEST_F(BaseTemplateTest, CoordinatesMatchByPosition) {
    GrrUviza& g = graph();
    GrxCoordinates& first = g.addCoordinates();
    GrxCoordinates& second = g.addCoordinates();
    GrxPoint& own = g.addPoint();
    GrxLine& none = g.addLine();
    own.setCoordinates(second);
    Probe probe(nullptr, *chart_.vis, nullptr);
    EXPECT_TRUE(probe.doesCoordinateMatch(static_cast<const CTElementType&>(own), ChartString("1")));
    EXPECT_FALSE(probe.doesCoordinateMatch(static_cast<const CTElementType&>(own), ChartString("0")));
    EXPECT_FALSE(probe.doesCoordinateMatch(static_cast<const CTElementType&>(own), ChartString("5")));
    EXPECT_TRUE(probe.doesCoordinateMatch(static_cast<const CTElementType&>(none), ChartString("")));
    EXPECT_FALSE(probe.doesCoordinateMatch(static_cast<const CTElementType&>(none), ChartString("1")));

    GrxDimension& inSecond = second.addDimension();
    GrxDimension& inFirst = first.addDimension();
    EXPECT_TRUE(probe.doesCoordinateMatch(static_cast<const GrxBaseElement&>(inSecond), ChartString("y2")));
    EXPECT_FALSE(probe.doesCoordinateMatch(static_cast<const GrxBaseElement&>(inSecond), ChartString("y")));
    EXPECT_TRUE(probe.doesCoordinateMatch(static_cast<const GrxBaseElement&>(inFirst), ChartString("y")));
    EXPECT_FALSE(probe.doesCoordinateMatch(static_cast<const GrxBaseElement&>(g), ChartString("y")));
}

TEST_F(BaseTemplateTest, VariablesOfAnElementAndTheirCopies) {
    GrrUviza& g = graph();
    GrxDimension& x = g.addCoordinates().addDimension();
    GrxPoint& from = g.addPoint();
    GrxPoint& to = g.addPoint();
    GrxSourceVariable& vx = chart_.vis->addSourceVariable();
    GrxSourceVariable& vy = chart_.vis->addSourceVariable();
    from.addX().setVariable(vx);
    from.addY().setVariable(vy);
    Probe probe(nullptr, *chart_.vis, instruction({}));
    EXPECT_EQ(probe.getElementVariable(from, ChartString("x")), &vx);
    EXPECT_EQ(probe.getElementVariable(from, ChartString("y")), &vy);
    EXPECT_EQ(probe.getElementVariable(from, ChartString("z")), nullptr);
    GrxSourceVariable& cluster = chart_.vis->addSourceVariable();
    x.setClusterVariable(cluster);
    EXPECT_EQ(probe.getElementVariable(from, ChartString("x")), &cluster);

    probe.copyVariables(to, from);
    ASSERT_NE(to.getX(), nullptr);
    EXPECT_EQ(to.getX()->getVariable(), &vx);
    EXPECT_EQ(to.getY()->getVariable(), &vy);
    EXPECT_EQ(to.getZ(), nullptr);
}

TEST_F(BaseTemplateTest, VocabularyTextsThatDifferFromTheirNames) {
    EXPECT_EQ(utf8(BaseTemplate::_scalar), "scalarDot");
    EXPECT_EQ(utf8(BaseTemplate::_when), "facet1==facet2");
    EXPECT_EQ(utf8(BaseTemplate::_legend_1), "_legend_1");
}

} // namespace
