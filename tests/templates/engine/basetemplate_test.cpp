// The operations every action shares: graphs, dimensions, attributes, coordinates and variables.
#include "templates/TemplateSupport.h"

using namespace template_test;

namespace {

class BaseTemplateTest : public TemplateTest {
protected:
    // An instruction element with the given attributes.
    const DOMElement* instruction(std::initializer_list<std::pair<const XMLCh*, const XMLCh*>> attributes) {
        DOMElement* e = root(chart_)->getOwnerDocument()->createElement(u"setStyle");
        for (const auto& [name, value] : attributes)
            e->setAttribute(name, value);
        return e;
    }
    GrxVisualization& chart_ = empty();
    GrrUviza& g_ = chart_.addGraph();
    Probe probe_{nullptr, chart_, nullptr};
};

TEST_F(BaseTemplateTest, GraphsAreSelectedByNumberAndAllCounted) {
    GrrUviza& b = chart_.addGraph();
    GrrUviza& c = chart_.addContainer().addGraph(); // deeper graphs count too
    const struct {
        const DOMElement* instruction;
        std::vector<GrrUviza*> picked;
    } cases[] = {{instruction({{u"graph", u"2"}}), {&b}},
                 {instruction({{u"graph", u"3"}}), {&c}},
                 {instruction({}), {&g_, &b, &c}},
                 {instruction({{u"graph", u"7"}}), {}},
                 {nullptr, {&g_, &b, &c}}};
    for (const auto& row : cases) {
        std::vector<GrrUviza*> picked;
        EXPECT_EQ(Probe(nullptr, chart_, row.instruction).getGraphs(picked), 3u);
        EXPECT_EQ(picked, row.picked);
    }
}

TEST_F(BaseTemplateTest, DimensionRolesCountReferencesButReturnOnlyDimensions) {
    GrxCoordinates& first = g_.addCoordinates();
    GrxDimension& x = first.addDimension();
    GrxDimension& y = first.addDimension();
    EXPECT_TRUE(probe_.getDimensionsByRole(g_, ChartString("y2")).empty());
    GrxCoordinates& second = g_.addCoordinates();
    second.addDimensionReference().setDimension(x); // takes the first place
    GrxDimension& y2 = second.addDimension();
    GrxDimension& z = second.addDimension();
    const std::pair<const char*, GrxDimension*> roles[] = {
        {"x", &x}, {"y", &y}, {"y2", &y2}, {"z", &z}, {"w", nullptr}};
    for (const auto& [role, dimension] : roles)
        EXPECT_EQ(probe_.getDimensionsByRole(g_, ChartString(role)),
                  dimension ? std::vector<GrxDimension*>{dimension} : std::vector<GrxDimension*>{})
            << role;
}

// A scatterplot matrix element needs slashes in both expressions.
TEST_F(BaseTemplateTest, AScatterplotMatrixElementHasSlashesInBothExpressions) {
    GrxPoint& point = g_.addPoint();
    GrxExpressionVariable& ex = chart_.addExpressionVariable();
    GrxExpressionVariable& ey = chart_.addExpressionVariable();
    ex.setValue(u"a/b");
    ey.setValue(u"c");
    point.addX().setVariable(ex);
    point.addY().setVariable(ey);
    EXPECT_EQ(probe_.getFirstSPLOMElement(g_), nullptr);
    ey.setValue(u"c/d");
    EXPECT_EQ(probe_.getFirstSPLOMElement(g_), &point);
}

TEST_F(BaseTemplateTest, BooleanAttributesAreExactAndCoordinatesMatchByPosition) {
    const DOMElement* e = instruction({{u"a", u"true"}, {u"b", u"false"}, {u"c", u"TRUE"}, {u"d", u""}});
    const struct {
        const DOMElement* element;
        const XMLCh* name;
        bool absent, read;
    } booleans[] = {{e, u"a", false, true},     {e, u"b", true, false}, {e, u"c", true, true},
                    {e, u"c", false, false},    {e, u"d", true, true},  {e, u"absent", false, false},
                    {nullptr, u"a", true, true}};
    for (const auto& b : booleans)
        EXPECT_EQ(BaseTemplate::getBooleanAttribute(b.element, b.name, b.absent), b.read)
            << u8(b.name) << b.absent;

    GrxCoordinates& first = g_.addCoordinates();
    GrxCoordinates& second = g_.addCoordinates();
    GrxPoint& own = g_.addPoint();
    const CTElementType& none = g_.addLine();
    own.setCoordinates(second);
    const GrxBaseElement& inSecond = second.addDimension();
    const GrxBaseElement& inFirst = first.addDimension();
    const struct {
        const CTElementType* element;
        const GrxBaseElement* other;
        const char* coordinate;
        bool matches;
    } coordinates[] = {
        {&own, nullptr, "1", true},       {&own, nullptr, "0", false},    {&own, nullptr, "5", false},
        {&none, nullptr, "", true},       {&none, nullptr, "1", false},   {nullptr, &inSecond, "y2", true},
        {nullptr, &inSecond, "y", false}, {nullptr, &inFirst, "y", true}, {nullptr, &g_, "y", false}};
    for (const auto& c : coordinates)
        EXPECT_EQ(c.element ? probe_.doesCoordinateMatch(*c.element, ChartString(c.coordinate))
                            : probe_.doesCoordinateMatch(*c.other, ChartString(c.coordinate)),
                  c.matches)
            << c.coordinate;
}

TEST_F(BaseTemplateTest, VariablesOfAnElementAndTheirCopies) {
    GrxDimension& x = g_.addCoordinates().addDimension();
    GrxPoint& from = g_.addPoint();
    GrxPoint& to = g_.addPoint();
    GrxSourceVariable& vx = chart_.addSourceVariable();
    GrxSourceVariable& vy = chart_.addSourceVariable();
    from.addX().setVariable(vx);
    from.addY().setVariable(vy);
    Probe probe(nullptr, chart_, instruction({}));
    EXPECT_EQ(probe.getElementVariable(from, ChartString("x")), &vx);
    EXPECT_EQ(probe.getElementVariable(from, ChartString("y")), &vy);
    EXPECT_EQ(probe.getElementVariable(from, ChartString("z")), nullptr);
    GrxSourceVariable& cluster = chart_.addSourceVariable();
    x.setClusterVariable(cluster);
    EXPECT_EQ(probe.getElementVariable(from, ChartString("x")), &cluster);

    probe.copyVariables(to, from);
    ASSERT_NE(to.getX(), nullptr);
    EXPECT_EQ(to.getX()->getVariable(), &vx);
    EXPECT_EQ(to.getY()->getVariable(), &vy);
    EXPECT_EQ(to.getZ(), nullptr);
}

} // namespace
