// Category order and layout actions on the sample charts: what each stores, what it leaves alone,
// and that setting twice is setting once.
#include "templates/TemplateSupport.h"
#include "templates/actions/categories.h"

#include <algorithm>

using namespace template_test;
using namespace plotaid::detail;

namespace {

class CategoryActions : public TemplateTest {
protected:
    // The object's attributes, or its children but dimensions as "tag{attributes}...".
    static std::string described(const GrxVisualization& chart, const std::string& id, bool children) {
        const DOMElement* e = byId(chart, id)->getImplementation();
        if (!children)
            return attributesOf(e);
        std::string out;
        for (const DOMElement* c = e->getFirstElementChild(); c; c = c->getNextElementSibling())
            if (u8(c->getLocalName()) != "dimension")
                out += u8(c->getLocalName()) + "{" + attributesOf(c) + "}";
        return out;
    }
    // The variable's first format relabels 1 and 2 to the first two job categories.
    static void relabel(GrxVisualization& chart, const char* variable) {
        GrxFormat& format = byId<CTVariableType>(chart, variable)->addFormat();
        for (const auto& [from, to] : {std::pair{"1", "Clerical"}, std::pair{"2", "Custodial"}}) {
            GrxRelabel& r = format.addRelabel();
            r.setFrom(ChartString(from));
            r.setTo(ChartString(to));
        }
    }
    // The domain's sorts and categories entries, as "tag{attributes}text|...".
    static std::string domainOf(const GrxVisualization& chart, const char* id) {
        std::string out;
        for (const DOMElement* e = byId(chart, id)->getImplementation()->getFirstElementChild(); e;
             e = e->getNextElementSibling())
            if (u8(e->getLocalName()) != "variableReference")
            {
                std::string text = u8(e->getTextContent());
                text.erase(std::remove_if(text.begin(), text.end(), [](char c) { return c == ' ' || c == '\n'; }), text.end());
                out += u8(e->getLocalName()) + "{" + attributesOf(e) + "}" + text + "|";
            }
        return out;
    }
};

TEST_F(CategoryActions, OrderExcludeAndSortingStoreMappedValues) {
    struct Row {
        const char* chart;
        bool relabelled;
        const char* instruction;
        const char* domain;
        const char* stored;
    } rows[] = {
        {"simple-bar.xml", true, "<setOrder role=\"x\"><categoryValue>Custodial;Clerical;Other</categoryValue></setOrder>",
         "domain_jobcat", "simpleSort{descending=false;method=1;}2;1;Other|"},
        {"simple-bar.xml", true, "<setExclude role=\"x\"><categoryValue>Custodial;;Clerical;Other</categoryValue></setExclude>",
         "domain_jobcat", "simpleSort{descending=false;method=1;}Clerical;Custodial;Manager|categories{remove=true;}2;1|"},
        {"simple-bar.xml", false, "<setExclude role=\"x\"><categoryValue>Custodial</categoryValue></setExclude>",
         "domain_jobcat", "simpleSort{descending=false;method=1;}Clerical;Custodial;Manager|categories{remove=true;}|"},
        {"simple-bar.xml", false, "<setCategorySorting role=\"x\"/>", "domain_jobcat",
         "simpleSort{descending=false;method=2;}|"},
        {"clustered-bar.xml", false, "<setCategorySorting role=\"x\" useGroupVar=\"true\"><sort descending=\"true\"><simpleSort method=\"data\"/></sort></setCategorySorting>",
         "domain_gender", "simpleSort{descending=true;method=0;}|"},
        {"clustered-bar.xml", false, "<setCategorySorting role=\"legend\"><sort><statisticSort/></sort></setCategorySorting>",
         "domain_gender", "statisticSort{descending=false;method=0;variable=var_salary;}|"},
    };
    for (const Row& row : rows) {
        GrxVisualization& chart = sample(row.chart);
        if (row.relabelled)
            relabel(chart, "var_jobcat");
        EXPECT_TRUE(applyOnce(row.instruction, chart)) << row.instruction;
        EXPECT_EQ(domainOf(chart, row.domain), row.stored) << row.instruction;
    }
    GrxVisualization& chart = sample("simple-bar.xml");
    const std::string before = canonical(chart);
    EXPECT_FALSE(act<TSetOrder>("<setOrder role=\"x\"/>", chart));
    EXPECT_FALSE(act<TSetExclude>("<setExclude role=\"x\"/>", chart));
    EXPECT_FALSE(act<TSetCategorySorting>("<setCategorySorting role=\"x\"><sort/></setCategorySorting>", chart));
    act<TSetOrder>("<setOrder role=\"y\"><categoryValue>1</categoryValue></setOrder>", chart); // not categorical
    EXPECT_EQ(canonical(chart), before);
}

TEST_F(CategoryActions, CollapseMovesTheNamedCategoryLast) {
    GrxVisualization& chart = sample("simple-bar.xml");
    byId<GrxSourceVariable>(chart, "var_salary")->addExtension().setStatistic(1);
    byId<GrxSummaryStatistic>(chart, "summary_1")->setMethod(3);
    act<TSetCollapse>("<setCollapse role=\"x\" categoryName=\"Other\" minFraction=\"0.05\"/>", chart);
    const std::vector<GrxAggregation*> aggregations = byId<CTVariableType>(chart, "var_jobcat")->getAggregations();
    ASSERT_EQ(aggregations.size(), 1u);
    EXPECT_EQ(attributesOf(aggregations[0]->getImplementation()), "category=Other;minFraction=0.05;variable=var_salary;");
    EXPECT_EQ(domainOf(chart, "domain_jobcat"), "simpleSort{descending=false;method=1;}Clerical;Custodial;Manager|");
    EXPECT_EQ(attributesOf(byId<GrxCategoricalDomain>(chart, "domain_jobcat")->getSimpleSorts()[0]->getSortMoves()[0]->getImplementation()),
              "category=Other;first=false;");
    EXPECT_EQ(attributesOf(byId<CTElementType>(chart, "interval_1")->getSummaryStatistics()[1]->getImplementation()),
              "convertIntervals=false;method=1;summaryBase=2;");
    // Without counted cases a categorical role is left alone.
    GrxVisualization& plain = sample("simple-bar.xml");
    const std::string before = canonical(plain);
    act<TSetCollapse>("<setCollapse role=\"x\" categoryName=\"Other\"/>", plain);
    EXPECT_EQ(canonical(plain), before);
}

TEST_F(CategoryActions, LayoutSwitches) {
    struct Row {
        const char* chart;
        const char* instruction;
        const char* id;
        bool children;
        const char* expected;
    } rows[] = {
        {"clustered-bar.xml", "<setClusterWidth gap=\"25%\"/>", "dim_x", false, "clusterGap=25%;clusterVariable=var_gender;domain=domain_jobcat;lowerMargin=5%;upperMargin=5%;"},
        {"pie.xml", "<setPieTranspose cycles=\"2\"/>", "coordinates_1", true, "polarTransform{counterClockwise=false;cycles=2;startAngle=0;}transposeTransform{}"},
        {"pie.xml", "<setPieTranspose startAngle=\"90\"><parameter name=\"startAngle\" value=\"10\"/><parameter name=\"ccw\" value=\"true\"/></setPieTranspose>",
         "coordinates_1", true, "polarTransform{counterClockwise=true;cycles=1;startAngle=90;}transposeTransform{}"},
        {"simple-bar.xml", "<setTranspose transpose=\"true\"/>", "coordinates_1", true, "transposeTransform{}"},
        {"pie.xml", "<setTranspose transpose=\"false\"/>", "coordinates_1", true, "polarTransform{counterClockwise=false;cycles=1.0;startAngle=0;}transposeTransform{}"},
        {"panels.xml", "<setWrapPanels wrap=\"true\"/>", "facetLayout_1", false, "cellAspect=1.0;method=2;"},
        {"simple-bar.xml", "<setPanelOptions mirror=\"true\"/>", "coordinates_1", true,
         "reflectionTransform{alternating=true;dimension=0;}reflectionTransform{alternating=true;dimension=1;}"},
        {"simple-bar.xml", "<setPanelOptions mirror=\"true\" role=\"y\"/>", "coordinates_1", true, "reflectionTransform{alternating=true;dimension=1;}"},
        {"panels.xml", "<setPanelOptions gap=\"7%\"/>", "facetLayout_1", true, "facetLevel{gap=7%;level=1;variable=var_gender;}"},
        {"scatterplot-matrix.xml", "<setPanelOptions gap=\"7%\"/>", "facetLayout_1", true, "facetLevel{gap=0%;level=1;}facetLevel{gap=0%;level=2;}tableLayout{}"},
    };
    for (const Row& row : rows) {
        GrxVisualization& chart = sample(row.chart);
        applyOnce(row.instruction, chart);
        EXPECT_EQ(described(chart, row.id, row.children), row.expected) << row.instruction;
    }
    GrxVisualization& chart = sample("clustered-bar.xml");
    act<TSetClusterWidth>("<setClusterWidth gap=\"25%\"/>", chart);
    EXPECT_TRUE(act<TSetClusterWidth>("<setClusterWidth/>", chart));
    EXPECT_EQ(attr(byId(chart, "dim_x"), "clusterGap"), "0%");
    EXPECT_FALSE(act<TSetClusterWidth>("<setClusterWidth/>", sample("simple-bar.xml")));
    act<TSetPanelOptions>("<setPanelOptions mirror=\"true\"/>", chart);
    act<TSetPanelOptions>("<setPanelOptions mirror=\"false\"/>", chart);
    EXPECT_TRUE(byId<GrxCoordinates>(chart, "coordinates_1")->getReflectionTransforms().empty());
}

TEST_F(CategoryActions, ScaleByFractionTurnsStacksIntoPercentages) {
    GrxVisualization& chart = sample("stacked-bar.xml");
    EXPECT_TRUE(act<TSetScaleByFraction>("<setScaleByFraction/>", chart));
    const std::vector<GrxSummaryStatistic*> statistics = byId<CTElementType>(chart, "interval_1")->getSummaryStatistics();
    ASSERT_EQ(statistics.size(), 1u);
    EXPECT_EQ(attributesOf(statistics[0]->getImplementation()), "method=5;summaryBase=2;");
    const std::vector<GrxFormat*> formats = byId<GrxMajorTicks>(chart, "dim_y_majorTicks")->getFormats();
    ASSERT_EQ(formats.size(), 1u);
    EXPECT_EQ(attributesOf(formats[0]->getImplementation()), "scalingFactor=0.01;suffix=%;");
    GrxVisualization& bars = sample("simple-bar.xml"); // no stack: nothing to scale
    const std::string before = canonical(bars);
    act<TSetScaleByFraction>("<setScaleByFraction/>", bars);
    EXPECT_EQ(canonical(bars), before);
}

TEST_F(CategoryActions, ChartsOnTheDiagonal) {
    GrxVisualization& chart = sample("scatterplot-matrix.xml");
    const std::string histogram = "<addChartsOnDiagonal type=\"histogram\"><setHistogramBinning binWidth=\"5\" binCount=\"9\"/></addChartsOnDiagonal>";
    EXPECT_TRUE(act<TAddChartsOnDiagonal>(histogram, chart));
    EXPECT_TRUE(act<TAddChartsOnDiagonal>(histogram, chart));
    const GrrUviza& graph = *byId<GrrUviza>(chart, "frame_graph_1");
    ASSERT_EQ(graph.getCoordinatess().size(), 2u);
    std::string margins;
    for (const GrxDimension* d : graph.getCoordinatess()[1]->getDimensions())
        margins += attributesOf(d->getImplementation());
    EXPECT_EQ(margins, "lowerMargin=5%;upperMargin=5%;lowerMargin=15%;upperMargin=5%;");
    ASSERT_EQ(graph.getIntervals().size(), 1u);
    const GrxInterval& bars = *graph.getIntervals()[0];
    EXPECT_EQ(attr(bars.getStyle(), "color"), "#DBD8AC");
    EXPECT_EQ(u8(bars.getConditionalStyles()[0]->getWhen()), "facet1!=facet2");
    EXPECT_EQ(attributesOf(bars.getBinStatistics()[0]->getImplementation()), "binWidth=5;");
    EXPECT_EQ(bars.getCoordinates(), graph.getCoordinatess()[1]);
    EXPECT_EQ(grammar_test::chartFaults(chart), "");

    GrxVisualization& hidden = sample("scatterplot-matrix.xml");
    EXPECT_TRUE(act<TAddChartsOnDiagonal>("<addChartsOnDiagonal type=\"none\"/>", hidden));
    const CTElementType& matrix = *byId<CTElementType>(hidden, "point_1");
    EXPECT_FALSE(matrix.getConditionalStyles()[0]->getStyle()->getVisible());
    EXPECT_TRUE(byId<GrrUviza>(hidden, "frame_graph_1")->getIntervals().empty());
    EXPECT_EQ(grammar_test::chartFaults(hidden), "");
    act<TAddChartsOnDiagonal>("<addChartsOnDiagonal type=\"NormalCurve\"><style color=\"blue\"/></addChartsOnDiagonal>", hidden);
    ASSERT_EQ(byId<GrrUviza>(hidden, "frame_graph_1")->getLines().size(), 1u);
    EXPECT_EQ(attr(byId<GrrUviza>(hidden, "frame_graph_1")->getLines()[0]->getStyle(), "color"), "blue");
    EXPECT_EQ(grammar_test::chartFaults(hidden), "");
    GrxVisualization& untouched = sample("scatterplot-matrix.xml");
    const std::string before = canonical(untouched);
    EXPECT_FALSE(act<TAddChartsOnDiagonal>("<addChartsOnDiagonal type=\"bars\"/>", untouched));
    EXPECT_EQ(canonical(untouched), before);
}

// Setting twice is setting once, and every chart these actions make is sound. Left out as adders
// that add again: setCollapse (a summary more on a percent element) and addChartsOnDiagonal (its
// replaced chart and hidden style come back under new style ids).
TEST_F(CategoryActions, SettingTwiceIsSettingOnceAndChartsStayValid) {
    const std::pair<const char*, const char*> cases[] = {
        {"simple-bar.xml", "<setOrder role=\"x\"><categoryValue>Manager;Clerical</categoryValue></setOrder>"},
        {"clustered-bar.xml", "<setExclude role=\"legend\"><categoryValue>Male</categoryValue></setExclude>"},
        {"simple-bar.xml", "<setCategorySorting role=\"x\"><sort><simpleSort method=\"natural\"/></sort></setCategorySorting>"},
        {"panels.xml", "<setWrapPanels wrap=\"true\"/>"},
        {"simple-bar.xml", "<setTranspose transpose=\"true\"/>"},
        {"pie.xml", "<setPieTranspose startAngle=\"45\" counterClockwise=\"true\"/>"},
        {"clustered-bar.xml", "<setClusterWidth gap=\"10%\"/>"},
        {"stacked-bar.xml", "<setScaleByFraction/>"},
        {"panels.xml", "<setPanelOptions mirror=\"true\" gap=\"3%\"><axisStyle><style color=\"red\"/></axisStyle></setPanelOptions>"},
    };
    for (const auto& [name, body] : cases) {
        SCOPED_TRACE(body);
        GrxVisualization& once = sample(name);
        GrxVisualization& twice = sample(name);
        const std::string original = canonical(once);
        applyOnce(body, once);
        applyOnce(body, twice);
        applyOnce(body, twice);
        EXPECT_TRUE(canonical(once) != original);
        EXPECT_TRUE(canonical(twice) == canonical(once));
        EXPECT_EQ(grammar_test::chartFaults(once), "");
    }
}

} // namespace
