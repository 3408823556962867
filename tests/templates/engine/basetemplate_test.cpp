#include "support/EngineSupport.h"

#include <plotaid/BaseTemplate.h>

#include <xercesc/dom/DOM.hpp>

using namespace XERCES_CPP_NAMESPACE;
using engine_test::Chart;

namespace {

// The base as an action that does nothing, to reach its shared operations.
class Probe : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override { return false; }
};

class BaseTemplateTest : public engine_test::EngineTest {
protected:
    void SetUp() override {
        chart_ = Chart::empty();
        instructions_ = Chart::empty();
    }
    // An instruction element with the given attributes.
    const DOMElement* instruction(std::initializer_list<std::pair<const XMLCh*, const XMLCh*>> attributes) {
        DOMElement* e = instructions_.document()->createElement(u"setStyle");
        instructions_.document()->getDocumentElement()->appendChild(e);
        for (const auto& [name, value] : attributes)
            e->setAttribute(name, value);
        return e;
    }
    GrrUviza& graph() { return chart_.vis->addGraph(); }
    Chart chart_, instructions_;
};

TEST_F(BaseTemplateTest, StylesGoIntoOneContainerUnderFreshIdsAndExistingOnesAreReused) {
    GrxStyle& own = chart_.vis->addStyle();
    own.setId(u"titleStyle");
    GrrUviza& g = graph();
    g.setId(u"main");
    Probe probe(nullptr, *chart_.vis, nullptr);
    EXPECT_EQ(&probe.addStyle(*chart_.vis, u"titleStyle"), &own);
    EXPECT_EQ(chart_.vis->getStyleById(u"c-o-n-t-a-i-n-er"), nullptr)
        << "nothing added for an existing style";
    GrxStyle& first = probe.addStyle(*chart_.vis, u"");
    GrxStyle& second = probe.addStyle(*chart_.vis, nullptr);
    GrxStyle& third = probe.addStyle(*chart_.vis, u"main"); // held by a graph, which keeps it
    EXPECT_EQ(ChartString(first.getId()).toUTF8() + " " + ChartString(second.getId()).toUTF8() + " " +
                  ChartString(third.getId()).toUTF8(),
              "style1 style2 main1");
    EXPECT_EQ(chart_.vis->getElementById(u"main"), g.getImplementation());
    GrxStyle* container = chart_.vis->getStyleById(u"c-o-n-t-a-i-n-er");
    ASSERT_NE(container, nullptr);
    EXPECT_EQ(container->getStyles().size(), 3u);
    EXPECT_EQ(first.getImplementation()->getParentNode(), container->getImplementation());
    EXPECT_EQ(chart_.vis->getStyles().size(), 2u); // the own style and the container
}

TEST_F(BaseTemplateTest, GraphsAreSelectedByNumberAndAllCounted) {
    GrrUviza& a = graph();
    GrrUviza& b = graph();
    GrrUviza& c = chart_.vis->addContainer().addGraph(); // deeper graphs count too
    const struct {
        const DOMElement* instruction;
        std::vector<GrrUviza*> picked;
    } cases[] = {{instruction({{u"graph", u"2"}}), {&b}},
                 {instruction({}), {&a, &b, &c}},
                 {instruction({{u"graph", u"7"}}), {}},
                 {nullptr, {&a, &b, &c}}};
    for (const auto& row : cases) {
        std::vector<GrrUviza*> picked;
        EXPECT_EQ(Probe(nullptr, *chart_.vis, row.instruction).getGraphs(picked), 3u);
        EXPECT_EQ(picked, row.picked);
    }
}

TEST_F(BaseTemplateTest, DimensionRolesCountReferencesButReturnOnlyDimensions) {
    GrrUviza& g = graph();
    GrxCoordinates& first = g.addCoordinates();
    GrxDimension& x = first.addDimension();
    GrxDimension& y = first.addDimension();
    Probe probe(nullptr, *chart_.vis, nullptr);
    EXPECT_TRUE(probe.getDimensionsByRole(g, ChartString("y2")).empty());
    GrxCoordinates& second = g.addCoordinates();
    second.addDimensionReference().setDimension(x); // takes the first place
    GrxDimension& y2 = second.addDimension();
    GrxDimension& z = second.addDimension();
    const std::pair<const char*, GrxDimension*> roles[] = {{"x", &x}, {"y", &y}, {"y2", &y2}, {"z", &z}};
    for (const auto& [role, dimension] : roles)
        EXPECT_EQ(probe.getDimensionsByRole(g, ChartString(role)), std::vector<GrxDimension*>{dimension})
            << role;
    EXPECT_TRUE(probe.getDimensionsByRole(g, ChartString("w")).empty());
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
    x.setClusterVariable(chart_.vis->addSourceVariable());
    EXPECT_TRUE(probe.isGraphClustered(g));

    probe.addZDimension(g);
    probe.addZDimension(g); // three already: nothing more
    ASSERT_EQ(coordinates.getDimensions().size(), 3u);
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
    std::vector<CTElementType*> lines;
    Probe probe(nullptr, *chart_.vis, nullptr);
    probe.getAllElementsByType(u"line", lines);
    EXPECT_EQ(lines, (std::vector<CTElementType*>{&line}));

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
    const CTElementType& none = g.addLine();
    own.setCoordinates(second);
    const CTElementType& ownElement = own;
    Probe probe(nullptr, *chart_.vis, nullptr);
    EXPECT_TRUE(probe.doesCoordinateMatch(ownElement, ChartString("1")));
    EXPECT_FALSE(probe.doesCoordinateMatch(ownElement, ChartString("0")));
    EXPECT_FALSE(probe.doesCoordinateMatch(ownElement, ChartString("5")));
    EXPECT_TRUE(probe.doesCoordinateMatch(none, ChartString("")));
    EXPECT_FALSE(probe.doesCoordinateMatch(none, ChartString("1")));

    const GrxBaseElement& inSecond = second.addDimension();
    const GrxBaseElement& inFirst = first.addDimension();
    EXPECT_TRUE(probe.doesCoordinateMatch(inSecond, ChartString("y2")));
    EXPECT_FALSE(probe.doesCoordinateMatch(inSecond, ChartString("y")));
    EXPECT_TRUE(probe.doesCoordinateMatch(inFirst, ChartString("y")));
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

} // namespace
