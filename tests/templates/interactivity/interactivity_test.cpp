// Binning, error bars, popups and drill-downs on the sample charts.
#include "templates/TemplateSupport.h"
#include "templates/actions/interactivity.h"

using namespace template_test;
using namespace plotaid::detail;

namespace {

class Interactivity : public TemplateTest {
protected:
    static std::string popups(const GrxVisualization& chart) {
        std::string out;
        for (const GrxPopup* popup : chart.getPopups()) {
            out += u8(popup->getTokenTemplate()) + "|";
            for (const GrxTokenMapping* m : popup->getTokenMappings())
                out += attributesOf(m->getImplementation()) +
                       (m->getSummaryStatistics().empty() ? "" : attributesOf(m->getSummaryStatistics()[0]->getImplementation())) + "|";
        }
        return out;
    }
};

TEST_F(Interactivity, HistogramBinsAndErrorBars) {
    GrxVisualization& chart = sample("histogram.xml");
    EXPECT_FALSE(act<THistogramBinning>("<setHistogramBinning binWidth=\"100\"><parameter name=\"bin-count\" value=\"5\"/>"
                                        "<parameter name=\"start\" value=\"7\"/></setHistogramBinning>", chart));
    const CTElementType& bars = *byId<CTElementType>(chart, "interval_1");
    ASSERT_EQ(bars.getBinStatistics().size(), 1u);
    EXPECT_EQ(attributesOf(bars.getBinStatistics()[0]->getImplementation()), "binStart=7;binWidth=100;");
    EXPECT_EQ(attributesOf(bars.getSummaryStatistics()[0]->getImplementation()), "method=10;");
    EXPECT_EQ(grammar_test::chartFaults(chart), "");

    GrxVisualization& errors = sample("error-bars.xml");
    EXPECT_TRUE(act<TSetErrorBarOptions>("<setErrorBarOptions><style color=\"red\"/></setErrorBarOptions>", errors));
    EXPECT_EQ(attr(byId<GrxStyle>(errors, "errorbarStyle"), "color") + attr(byId<GrxStyle>(errors, "errorbarStyle"), "visible"), "redfalse");
    EXPECT_EQ(attr(byId<GrxStyle>(errors, "meanStyle"), "visible"), "-");
    act<TSetErrorBarOptions>("<setErrorBarOptions visible=\"true\"/>", errors);
    EXPECT_TRUE(byId<GrxStyle>(errors, "errorbarStyle")->getVisible());
}

TEST_F(Interactivity, PopupsNumberTheirTokens) {
    struct Row {
        const char* chart;
        const char* instruction;
        const char* popups;
    } rows[] = {
        {"simple-bar.xml", "<addPopups/>", "Mean Current Salary = $[1]$|token=1;variable=var_salary;|"},
        {"simple-bar.xml", "<addPopups x=\"true\" y=\"true\"/>",
         "Employment Category = $[1]$\nMean Current Salary = $[2]$|token=1;variable=var_jobcat;|token=2;variable=var_salary;|"},
        {"histogram.xml", "<addPopups x=\"true\"/>",
         "Current Salary = $[1]$\nFrequency = $[2]$|token=1;variable=var_salary;method=0;|token=2;variable=var_salary;method=10;|"},
        {"pie.xml", "<addPopups legend=\"true\"/>", "Employment Category = $[1]$|token=1;variable=var_jobcat;|"},
    };
    for (const Row& row : rows) {
        GrxVisualization& chart = sample(row.chart);
        EXPECT_TRUE(act<TAddPopups>(row.instruction, chart));
        EXPECT_EQ(popups(chart).substr(0, std::string(row.popups).size()), row.popups) << row.instruction;
        EXPECT_EQ(grammar_test::chartFaults(chart), "") << row.instruction;
    }
}

TEST_F(Interactivity, DrillDownsOnePerTarget) {
    GrxVisualization& chart = sample("simple-bar.xml");
    EXPECT_TRUE(act<TAddDrilldowns>("<addDrillDown target=\"element\" interactionType=\"onMouseUp\" function=\"go\" meta=\"m\""
                                    " popup=\"true\" cases=\"true\"/>", chart));
    const std::vector<GrxExtensionVis*> extensions = chart.getExtensions();
    ASSERT_EQ(extensions.size(), 2u);
    std::string order;
    const auto* attributes = extensions[1]->getImplementation()->getAttributes();
    for (XMLSize_t i = 0; i < attributes->getLength(); ++i)
        order += u8(attributes->item(i)->getNodeName()) + "=" + u8(attributes->item(i)->getNodeValue()) + ";";
    // The document keeps attributes by name, whatever order they were set in.
    EXPECT_EQ(order, "cases=true;drillDown=true;function=go;interactionType=onMouseUp;meta=m;popup=true;target=interval_1;");
    GrxVisualization& all = sample("simple-bar.xml");
    act<TAddDrilldowns>("<addDrillDown role=\"x\"/>", all); // axis label, element, legend label, legend target, ticks, labels
    EXPECT_EQ(all.getExtensions().size(), 1u + 1 + 1 + 1 + 1 + 1 + 3);
    EXPECT_EQ(grammar_test::chartFaults(all), "");
}

TEST_F(Interactivity, ScatterplotBinsWithAColourScaleAndItsLegend) {
    GrxVisualization& chart = sample("scatter.xml");
    const std::string binning = "<setScatterplotBinning gridType=\"square\" binWidth=\"9\" binCount=\"4\"><parameter name=\"grid\" value=\"hex\"/>"
                                "</setScatterplotBinning>";
    EXPECT_TRUE(act<TSetScatterplotBinning>(binning, chart));
    const CTElementType& point = *byId<CTElementType>(chart, "point_1");
    EXPECT_EQ(attributesOf(point.getBinStatistics()[0]->getImplementation()), "binCount=4;gridType=hex;method=other;");
    ASSERT_EQ(point.getColorComponents().size(), 1u);
    EXPECT_EQ(attributesOf(point.getColorComponents()[0]->getImplementation()), "affect=none;high=0.1;low=0.9;type=3;variable=var_salbegin;");
    EXPECT_EQ(attr(point.getColors()[0], "affect") + attr(point.getStyle(), "color"), "bothblack");
    GrxExtensionVis& extension = *chart.getExtension();
    const std::string legend = u8(extension.GetAttribute(u"frameLegendBin"));
    ASSERT_EQ(extension.getLegend(2), byId<GrxLegend>(chart, legend)); // the slot after legend1, once
    EXPECT_EQ(extension.getLegend(3), nullptr);
    EXPECT_EQ(u8(extension.getLegend(2)->getLabel()->getAllText().xc_str()), "Scale");
    EXPECT_EQ(grammar_test::chartFaults(chart), "");
    act<TSetScatterplotBinning>(binning, chart);
    EXPECT_EQ(chart.getLegends().size(), 2u);
    EXPECT_EQ(extension.getLegend(2)->getLegendTargets().size(), 2u);

    // Without colour aesthetics the point's own colour decides the direction of the scale.
    for (const auto& [color, type] : {std::pair{"#202020", 3}, std::pair{"#F0F0F0", 2}, std::pair{"Navy", 3}}) {
        GrxVisualization& plain = sample("scatter.xml");
        GrxPoint& p = *byId<GrxPoint>(plain, "point_1");
        p.removeColors();
        p.getStyle()->setColor(ChartString(color));
        act<TSetScatterplotBinning>("<setScatterplotBinning/>", plain);
        EXPECT_EQ(p.getColorComponents()[0]->getType(), type) << color;
    }
    GrxVisualization& deep = sample("bar-3d.xml");
    byId<GrrUviza>(deep, "frame_graph_1")->removeIntervals();
    GrxPoint& p = byId<GrrUviza>(deep, "frame_graph_1")->addPoint();
    p.addZ().setVariable(*byId<CTVariableType>(deep, "var_gender"));
    act<TSetScatterplotBinning>("<setScatterplotBinning gridType=\"hex\" size=\"true\"/>", deep);
    EXPECT_FALSE(p.getBinStatistics()[0]->isGridTypePresent());

    GrxVisualization& sized = sample("scatter.xml");
    act<TSetScatterplotBinning>("<setScatterplotBinning size=\"true\" high=\"12pt\"/>", sized);
    EXPECT_EQ(attributesOf(byId<CTElementType>(sized, "point_1")->getSizes()[0]->getImplementation()), "high=12pt;low=3pt;variable=var_salbegin;");
}

TEST_F(Interactivity, TheBinLegendTakesTheSlotAfterTheHighestInUse) {
    for (const auto& [slots, expected] : {std::pair{"", 1}, std::pair{"legend1", 2}, std::pair{"legend5", 6}}) {
        GrxVisualization& chart = sample("scatter.xml");
        GrxExtensionVis& extension = *chart.getExtension();
        extension.removeAttribute(u"legend1");
        if (*slots)
            extension.SetAttribute(ChartString(slots).xc_str(), u"legend_1");
        extension.SetAttribute(u"frameLegendBin", u"nothing"); // names no legend: a new one is made
        act<TSetScatterplotBinning>("<setScatterplotBinning/>", chart);
        const GrxLegend* made = extension.getLegend(expected);
        ASSERT_NE(made, nullptr) << slots;
        EXPECT_EQ(u8(extension.GetAttribute(u"frameLegendBin")), u8(made->getId()));
        int registered = 0;
        for (int k = 0; k <= 12; ++k)
            registered += extension.getLegend(k) == made;
        EXPECT_EQ(registered, 1) << slots;
    }
}

} // namespace
