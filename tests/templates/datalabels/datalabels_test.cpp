// Data labels on the sample charts: which variable a label shows, the labelling and its styles,
// the tri-state settings, the style-only mode, and that labelling twice leaves one label.
#include "templates/TemplateSupport.h"
#include "templates/actions/datalabels.h"

using namespace template_test;
using namespace plotaid::detail;

namespace {

class DataLabels : public TemplateTest {
protected:
    // Special variables the chart's data source may carry, by the marks the action knows them by.
    static void addVariable(GrxVisualization& chart, const char* id, const char* sourceName, int statistic,
                            const char* description = "") {
        GrxSourceVariable& v = chart.addSourceVariable();
        v.setId(ChartString(id));
        v.setSourceName(ChartString(sourceName));
        v.setDescription(ChartString(description));
        if (statistic != 0)
            v.addExtension().setStatistic(statistic);
    }
    // Each labelling of the element: "variable/method/augment" with "-" for what is absent.
    static std::string labelings(const GrxVisualization& chart, const std::string& element) {
        std::string out;
        for (const GrxLabeling* l : byId<CTElementType>(chart, element)->getLabelings()) {
            const std::vector<GrxSummaryStatistic*> s = l->getSummaryStatistics();
            out += attr(l, "variable") + "/" + (s.empty() ? "-/-" : attr(s[0], "method") + "/" + attr(s[0], "augment")) + " ";
        }
        return out;
    }
};

TEST_F(DataLabels, TheFirstKindThatFitsInTheFallbackOrder) {
    const struct {
        const char* chart;
        const char* element;
        const char* extras; // c: count, p: percent, n: case number, l: labelling variable, y/x: coordinate removed
        const char* instruction;
        const char* expected;
    } rows[] = {
        {"scatter.xml", "point_1", "", "<addDataLabels/>", "var_salary/-/- "},                 // y before x
        {"scatter.xml", "point_1", "y", "<addDataLabels/>", "var_salbegin/-/- "},             // x before legend
        {"scatter.xml", "point_1", "yx", "<addDataLabels/>", "var_gender/-/- "},              // legend last
        {"scatter.xml", "point_1", "p", "<addDataLabels/>", "v_p/-/- "},                      // percent before y
        {"scatter.xml", "point_1", "pc", "<addDataLabels/>", "v_c/-/- "},                     // count before percent
        {"scatter.xml", "point_1", "cn", "<addDataLabels/>", "v_n/-/- "},                     // case number before count
        {"scatter.xml", "point_1", "nl", "<addDataLabels/>", "v_l/-/- "},                     // labelling first
        // A percent without a percent variable shows the count's share.
        {"scatter.xml", "point_1", "c", "<addDataLabels><labeling variable='percent'/></addDataLabels>", "v_c/3/- "},
        // Named contents in order; a kind that has no variable adds nothing.
        {"scatter.xml", "point_1", "", "<addDataLabels><labeling variable='x'/><labeling variable='casenum'/><labeling variable='y'/></addDataLabels>",
         "var_salbegin/-/- var_salary/-/- "},
        // A statistic element: no case number; the labelling copies its statistic with augment 2.
        {"error-bars.xml", "point_mean", "n", "<addDataLabels/>", "var_salary/2/2 "},
        // Region statistics are never labelled.
        {"error-bars.xml", "errorbar_1", "", "<addDataLabels/>", ""},
        // Histogram bins admit only counts: the x variable, counted as the bins are.
        {"histogram.xml", "interval_1", "", "<addDataLabels><labeling variable='y'/><labeling variable='count'/></addDataLabels>", "var_salary/10/2 "},
        // The existing labelling for the variable and statistic is the one used.
        {"simple-bar.xml", "interval_1", "", "<addDataLabels/>", "var_salary/2/- "},
        // Style only adds none.
        {"scatter.xml", "point_1", "", "<addDataLabels styleOnly='true'/>", ""},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(std::string(row.chart) + " " + row.extras + " " + row.instruction);
        GrxVisualization& chart = sample(row.chart);
        const std::string extras(row.extras);
        if (extras.find('c') != std::string::npos)
            addVariable(chart, "v_c", "n", 1);
        if (extras.find('p') != std::string::npos)
            addVariable(chart, "v_p", "$PERCENT", 0);
        if (extras.find('n') != std::string::npos)
            addVariable(chart, "v_n", "$CASENUM", 0);
        if (extras.find('l') != std::string::npos)
            addVariable(chart, "v_l", "name", 0, "labeling");
        CTElementType& element = *byId<CTElementType>(chart, row.element);
        if (extras.find('y') != std::string::npos)
            element.removeChild(*element.getY());
        if (extras.find('x') != std::string::npos)
            element.removeChild(*element.getX());
        EXPECT_TRUE(act<TAddDataLabels>(row.instruction, chart));
        EXPECT_EQ(labelings(chart, row.element), row.expected);
        EXPECT_EQ(grammar_test::chartFaults(chart), "");
    }
}

TEST_F(DataLabels, StylesSizesTriStatesAndLabellingTwice) {
    GrxVisualization& chart = sample("scatter.xml");
    EXPECT_TRUE(act<TAddDataLabels>("<addDataLabels position='label-location-x:negative' labelLocationVertical='positive' "
                                    "hidden='false' connectingLines='true' showCollidingLabels='yes'>"
                                    "<style color='red'/><style number='1' color2='blue'/></addDataLabels>",
                                    chart));
    const GrxLabeling& labeling = *byId<GrxPoint>(chart, "point_1")->getLabelings().at(0);
    EXPECT_EQ(attributesOf(labeling.getStyle()->getImplementation()),
              "color=red;font-size=7pt;6pt;labelLocationHorizontal=3;labelLocationVertical=2;visible=true;");
    // A point's frame is clear where the instruction leaves it.
    EXPECT_EQ(attributesOf(labeling.getTextFrameStyle()->getImplementation()), "color=transparent;color2=blue;visible=true;");
    EXPECT_EQ(u8(labeling.getStyle()->getId()) + " " + u8(labeling.getTextFrameStyle()->getId()), "labeling1 text1");
    EXPECT_EQ(attr(&labeling, "connectingLines") + attr(byId(chart, "point_1"), "showCollidingLabels"), "truefalse");
    const std::string once = canonical(chart);
    act<TAddDataLabels>("<addDataLabels position='label-location-x:negative' labelLocationVertical='positive' "
                        "hidden='false' connectingLines='true' showCollidingLabels='yes'>"
                        "<style color='red'/><style number='1' color2='blue'/></addDataLabels>",
                        chart);
    EXPECT_EQ(canonical(chart), once);
    // A repeated labelling is removed; one of another statistic stays.
    GrxInterval& bar = *byId<GrxInterval>(sample("simple-bar.xml"), "interval_1");
    GrxVisualization& bars = *bar.getVisualization();
    bar.addLabeling().setVariable(*byId<CTVariableType>(bars, "var_salary"));
    bar.addLabeling().setVariable(*byId<CTVariableType>(bars, "var_salary"));
    bar.getLabelings().back()->addSummaryStatistic().setMethod(2);
    act<TAddDataLabels>("<addDataLabels styleOnly='true'/>", bars);
    EXPECT_EQ(labelings(bars, "interval_1"), "var_salary/2/- var_salary/-/- ");

    // Absent settings leave the chart's own; "false" is a setting. A square bar's frame is white on black.
    GrxVisualization& pie = sample("pie.xml");
    act<TAddDataLabels>("<addDataLabels styleOnly='true'><style font-size='9pt'/></addDataLabels>", pie);
    EXPECT_EQ(attr(byId(pie, "labeling_1"), "connectingLines") + attr(byId(pie, "legendTextStyle"), "visible"), "true-");
    EXPECT_EQ(attr(byId(pie, "legendTextStyle"), "font-size"), "9pt");
    act<TAddDataLabels>("<addDataLabels connectingLines='false' hidden='true' styleOnly='true'/>", pie);
    EXPECT_EQ(attr(byId(pie, "labeling_1"), "connectingLines") + attr(byId(pie, "legendTextStyle"), "visible"), "falsefalse");
    GrxVisualization& plain = sample("simple-bar.xml");
    byId<GrxLabeling>(plain, "labeling_1")->removeTextFrameStyle();
    byId<GrxStyle>(plain, "barStyle")->setSymbol(u"square");
    act<TAddDataLabels>("<addDataLabels styleOnly='true'/>", plain);
    EXPECT_EQ(attributesOf(byId<GrxLabeling>(plain, "labeling_1")->getTextFrameStyle()->getImplementation()),
              "color=white;color2=black;");
    EXPECT_EQ(grammar_test::chartFaults(chart) + grammar_test::chartFaults(bars) + grammar_test::chartFaults(pie), "");
}

TEST_F(DataLabels, ColourByMarkerAndOneInsetPerPolarGraph) {
    GrxVisualization& chart = sample("scatter.xml");
    act<TAddDataLabels>("<addDataLabels colorByMarker='true'/>", chart);
    const GrxLabeling& labeling = *byId<GrxPoint>(chart, "point_1")->getLabelings().at(0);
    EXPECT_EQ(attr(labeling.getStyle(), "color") + " " + attr(labeling.getTextFrameStyle(), "color2"), "#3E58AC transparent");
    EXPECT_EQ(labeling.getColors().size(), 1u); // the element's colour aesthetic, cloned
    GrxVisualization& unmarked = sample("scatter.xml");
    act<TAddDataLabels>("<addDataLabels colorByMarker='false'/>", unmarked);
    EXPECT_EQ(byId<GrxPoint>(unmarked, "point_1")->getLabelings().at(0)->getColors().size(), 0u);

    GrxVisualization& pie = sample("pie.xml");
    byId<GrxStyle>(pie, "legendTextStyle")->setLabelInside(2);
    GrxLabeling& second = byId<GrxInterval>(pie, "interval_1")->addLabeling();
    second.setStyle(*byId<GrxStyle>(pie, "legendTextStyle"));
    act<TAddDataLabels>("<addDataLabels styleOnly='true'/>", pie);
    act<TAddDataLabels>("<addDataLabels styleOnly='true'/>", pie);
    const std::vector<GrxInsetTransform*> insets = byId<GrxCoordinates>(pie, "coordinates_1")->getInsetTransforms();
    ASSERT_EQ(insets.size(), 1u);
    EXPECT_EQ(attributesOf(insets[0]->getImplementation()), "xMax=0.1;xMin=0.1;yMax=0.1;yMin=0.1;");
    EXPECT_EQ(grammar_test::chartFaults(chart) + grammar_test::chartFaults(pie), "");
}

} // namespace
