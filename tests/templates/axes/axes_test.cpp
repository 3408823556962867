// Axis actions on the sample charts: what each sets, what it must leave alone, and that setting
// twice is setting once.
#include "templates/TemplateSupport.h"
#include "templates/actions/axes.h"

using namespace template_test;
using namespace plotaid::detail;

namespace {

class Axes : public TemplateTest {
protected:
    // The element of that id as "name=value;..." (without its id), or "<none>".
    static std::string described(const GrxVisualization& chart, const std::string& id) {
        const GrxBaseElement* e = byId(chart, id);
        return e ? attributesOf(e->getImplementation()) : "<none>";
    }
    static std::string scaleOf(const GrxVisualization& chart, const std::string& dimension) {
        const GrxScale* scale = byId<GrxDimension>(chart, dimension)->getScale();
        return scale ? attributesOf(scale->getImplementation()) : "<none>";
    }
    void walk(GrxVisualization& chart, const std::string& body) {
        applyTemplateCommands(nullptr, chart, templateRoot(body));
    }
};

TEST_F(Axes, ScaleMethodsSafeExponentAndBaseSkippingCategoricalAndPolarRoles) {
    struct Row {
        const char* chart;
        const char* instruction;
        const char* dimension;
        const char* scale;
    } rows[] = {
        {"scatter.xml", "<setAxisScale role=\"y\" method=\"log\"><parameter name=\"safe\" value=\"true\"/></setAxisScale>",
         "dim_y", "invert=false;method=log_safe;"},
        {"scatter.xml", "<setAxisScale role=\"x\" method=\"power\"><parameter name=\"exponent\" value=\"0.5\"/></setAxisScale>",
         "dim_x", "base=0.5;invert=false;method=power;"},
        {"scatter.xml", "<setAxisScale role=\"x\" method=\"power\" base=\"3\"><parameter name=\"base\" value=\"0.5\"/></setAxisScale>",
         "dim_x", "base=3;invert=false;method=power;"},
        {"scatter.xml", "<setAxisScale role=\"y\" method=\"cubic\" origin=\"0\" invert=\"true\"/>", "dim_y",
         "invert=true;method=linear;origin=0;"},
        {"scatter.xml", "<setAxisScale role=\"y\" method=\"probit\"/>", "dim_x", "<none>"},
        {"simple-bar.xml", "<setAxisScale role=\"x\" method=\"log\"/>", "dim_x", "<none>"},
        {"pie.xml", "<setAxisScale role=\"x\" method=\"log\"/>", "dim_y", "<none>"}, // polar
    };
    for (const Row& row : rows) {
        GrxVisualization& chart = sample(row.chart);
        EXPECT_TRUE(act<TSetAxisScale>(row.instruction, chart));
        EXPECT_EQ(scaleOf(chart, row.dimension), row.scale) << row.instruction;
    }
    // An existing origin goes when the instruction gives none.
    GrxVisualization& chart = sample("scatter.xml");
    act<TSetAxisScale>("<setAxisScale role=\"y\" origin=\"5\"/>", chart);
    act<TSetAxisScale>("<setAxisScale role=\"y\"/>", chart);
    EXPECT_EQ(scaleOf(chart, "dim_y"), "invert=false;method=linear;");
}

TEST_F(Axes, IntervalExactDateEndsAndRolesItRejects) {
    GrxVisualization& chart = sample("scatter.xml");
    const std::string start = "2026-03-04 09:05:07.000";
    EXPECT_TRUE(act<TSetAxisInterval>(
        "<setAxisInterval role=\"x\" lowerMapping=\"exact\" min=\"" + start + "\" max=\"2027\"/>", chart));
    const GrxDimension& x = *byId<GrxDimension>(chart, "dim_x");
    EXPECT_FALSE(x.getUnionDomain());
    EXPECT_FALSE(x.getNiceLowerMapping());
    EXPECT_TRUE(x.getNiceUpperMapping());
    const auto* domain = dynamic_cast<const GrxIntervalDomain*>(x.getDomain());
    ASSERT_NE(domain, nullptr);
    EXPECT_TRUE(domain->getDate());
    ASSERT_EQ(domain->getRanges().size(), 2u);
    EXPECT_EQ(attributesOf(domain->getRanges()[0]->getImplementation()), "exact=true;min=" + start + ";");
    EXPECT_EQ(attributesOf(domain->getRanges()[1]->getImplementation()), "exact=true;max=2027;");
    EXPECT_EQ(attr(x.getAxiss()[0]->getMajorTickss()[0], "base"), start);
    // Ranges are replaced, not added to; nice ends come back without "exact".
    act<TSetAxisInterval>("<setAxisInterval role=\"x\" max=\"9\"/>", chart);
    EXPECT_EQ(domain->getRanges().size(), 1u);
    EXPECT_TRUE(x.getUnionDomain() && x.getNiceLowerMapping());

    const std::string before = canonical(chart);
    EXPECT_FALSE(act<TSetAxisInterval>("<setAxisInterval role=\"y2\" min=\"1\"/>", chart));
    EXPECT_EQ(canonical(chart), before);
    GrxVisualization& bars = sample("simple-bar.xml");
    const std::string untouched = canonical(bars);
    EXPECT_TRUE(act<TSetAxisInterval>("<setAxisInterval role=\"x\" min=\"1\"/>", bars));
    EXPECT_EQ(canonical(bars), untouched); // a categorical role has no interval
}

TEST_F(Axes, MarginsKeepWhatTheChartDefinesAndFilterCategoricalRoles) {
    GrxVisualization& source = sample("simple-bar.xml");
    byId<GrxDimension>(source, "dim_y")->removeLowerMargin();
    GrxVisualization& chart = sample("simple-bar.xml");
    const char* const both = "<setAxisMargin role=\"y\" upperMargin=\"20%\" lowerMargin=\"3%\"/>";
    EXPECT_TRUE(act<TSetAxisMargin>(both, chart, &source));
    EXPECT_EQ(attr(byId(chart, "dim_y"), "upperMargin") + " " + attr(byId(chart, "dim_y"), "lowerMargin"), "5% 3%");
    act<TSetAxisMargin>(both, chart);
    EXPECT_EQ(attr(byId(chart, "dim_y"), "upperMargin"), "20%");
    // x is categorical: only an instruction that says so reaches it.
    act<TSetAxisMargin>("<setAxisMargin role=\"x\" upperMargin=\"1%\"/>", chart);
    EXPECT_EQ(attr(byId(chart, "dim_x"), "upperMargin"), "5%");
    act<TSetAxisMargin>("<setAxisMargin role=\"x\" categorical=\"true\" upperMargin=\"1%\"/>", chart);
    EXPECT_EQ(attr(byId(chart, "dim_x"), "upperMargin"), "1%");
}

TEST_F(Axes, DerivedAxesPercentParametersAndTheOppositeSide) {
    GrxVisualization& chart = sample("scatter.xml");
    EXPECT_FALSE(act<TAddDerivedAxis>("<addDerivedAxis role=\"y2\"><transform method=\"percent\"/></addDerivedAxis>", chart));
    act<TAddDerivedAxis>("<addDerivedAxis role=\"y\"><transform method=\"percent\"/><style color=\"red\"/>"
                         "<majorTicks position=\"inside\"/></addDerivedAxis>",
                         chart);
    GrxDimension& y = *byId<GrxDimension>(chart, "dim_y");
    ASSERT_EQ(y.getAxiss().size(), 2u);
    GrxAxis& derived = *y.getAxiss()[1];
    EXPECT_EQ(attr(&derived, "transform") + " " + attr(&derived, "opposite"), "percent true");
    EXPECT_TRUE(derived.getAxisTransformParameters().empty());
    EXPECT_EQ(attr(derived.getStyle(), "color"), "red");
    EXPECT_EQ(attr(derived.getStyle(), "stroke-width"), "0.5pt"); // copied from the main axis style
    EXPECT_EQ(attr(derived.getMajorTickss()[0], "position"), "inside");
    EXPECT_EQ(attr(y.getAxiss()[0]->getMajorTickss()[0], "position"), "outside");

    // A new transform replaces the derived axis; an attribute beats a parameter of its name.
    act<TAddDerivedAxis>("<addDerivedAxis role=\"y\"><transform method=\"ratio\" base-ratio=\"2\">"
                         "<parameter name=\"base-ratio\" value=\"9\"/><parameter name=\"derived-match\" value=\"4\"/>"
                         "</transform></addDerivedAxis>",
                         chart);
    ASSERT_EQ(y.getAxiss().size(), 2u);
    std::string parameters;
    for (const GrxAxisTransformParameter* p : y.getAxiss()[1]->getAxisTransformParameters())
        parameters += u8(p->getParameterName()) + "=" + u8(p->getParameterValue()) + ";";
    EXPECT_EQ(parameters, "base-ratio=2;derived-match=4;");
    EXPECT_EQ(attr(y.getAxiss()[1], "transform"), "derived");

    act<TSetAxisOpposite>("<setAxisOpposite role=\"y\" opposite=\"true\"/>", chart);
    EXPECT_EQ(attr(y.getAxiss()[0], "opposite") + " " + attr(y.getAxiss()[1], "opposite"), "true false");

    // Two plain axes leave no room for a derived one.
    GrxDimension& x = *byId<GrxDimension>(chart, "dim_x");
    x.addAxis();
    const std::string before = canonical(chart);
    act<TAddDerivedAxis>("<addDerivedAxis role=\"x\"><transform method=\"percent\"/></addDerivedAxis>", chart);
    EXPECT_EQ(canonical(chart), before);
}

TEST_F(Axes, StylesTitlesAndTheScatterplotMatrix) {
    GrxVisualization& chart = sample("scatter.xml");
    GrxAxis& y = *byId<GrxAxis>(chart, "dim_y_axis");
    y.getLabel()->removeTextFrameStyle();
    act<TSetAxisStyle>("<setAxisStyle role=\"y\"><style color=\"red\"/><label>\n  Pay\n</label><axisLabelStyle>"
                       "<style number=\"1\" color=\"blue\"/><style number=\"2\" font-size=\"20pt\"/></axisLabelStyle>"
                       "</setAxisStyle>",
                       chart);
    EXPECT_EQ(attr(y.getStyle(), "color"), "red");
    EXPECT_EQ(u8(y.getLabel()->getAllText().xc_str()), "Pay");
    EXPECT_EQ(attr(y.getLabel()->getTextFrameStyle(), "color"), "blue");
    EXPECT_FALSE(y.getLabel()->getTextFrameStyle()->getVisible());
    EXPECT_EQ(attr(y.getLabel()->getStyle(), "font-size"), "20pt");
    // Only a role that is categorical when the instruction asks for one.
    act<TSetAxisStyle>("<setAxisStyle role=\"y\" categorical=\"true\"><style color=\"green\"/></setAxisStyle>", chart);
    EXPECT_EQ(attr(y.getStyle(), "color"), "red");

    GrxVisualization& matrix = sample("scatterplot-matrix.xml");
    byId<GrxAxis>(matrix, "dim_x_axis")->removeStyle();
    act<TSetAxisStyle>("<setAxisStyle role=\"x\"/>", matrix);
    EXPECT_EQ(attr(byId<GrxAxis>(matrix, "dim_x_axis")->getStyle(), "color"), "transparent");
}

TEST_F(Axes, TicksOnlyOnTheAxesTheInstructionSelects) {
    GrxVisualization& chart = sample("scatter.xml");
    act<TAddDerivedAxis>("<addDerivedAxis role=\"y\"><transform method=\"percent\"/></addDerivedAxis>", chart);
    GrxDimension& y = *byId<GrxDimension>(chart, "dim_y");
    act<TSetAxisMajorTicks>("<setAxisMajorTicks><majorTicks role=\"y\" derived=\"true\" position=\"cross\"/></setAxisMajorTicks>", chart);
    EXPECT_EQ(attr(y.getAxiss()[0]->getMajorTickss()[0], "position") + " " +
                  attr(y.getAxiss()[1]->getMajorTickss()[0], "position"),
              "outside cross");
    act<TSetAxisMinorTicks>("<setAxisMinorTicks><minorTicks role=\"y\" number=\"5\"/></setAxisMinorTicks>", chart);
    EXPECT_EQ(y.getAxiss()[0]->getMinorTickss()[0]->getNumber(), 5);
    EXPECT_TRUE(y.getAxiss()[1]->getMinorTickss().empty());
    EXPECT_FALSE(act<TSetAxisMajorTicks>("<setAxisMajorTicks/>", chart));
    // A matrix draws its ticks on the facet axes: the coordinate axes lose theirs.
    GrxVisualization& matrix = sample("scatterplot-matrix.xml");
    act<TSetAxisMajorTicks>("<setAxisMajorTicks><majorTicks role=\"x\"/></setAxisMajorTicks>", matrix);
    EXPECT_TRUE(byId<GrxAxis>(matrix, "dim_x_axis")->getMajorTickss().empty());
    EXPECT_FALSE(byId<GrxAxis>(matrix, "dim_y_axis")->getMajorTickss().empty());
}

TEST_F(Axes, TickLabelAngleFrequencyAndFormat) {
    GrxVisualization& chart = sample("scatter.xml");
    GrxMajorTicks& x = *byId<GrxAxis>(chart, "dim_x_axis")->getMajorTickss()[0];
    EXPECT_TRUE(act<TSetTickLabelAngle>("<setTickLabelAngle role=\"x\" labelAngle=\"45\"/>", chart));
    EXPECT_FALSE(act<TSetTickLabelAngle>("<setTickLabelAngle role=\"x\"/>", chart));
    EXPECT_FALSE(act<TSetTickLabelAngle>("<setTickLabelAngle role=\"x\" categorical=\"true\" labelAngle=\"10\"/>", chart));
    EXPECT_EQ(attr(&x, "labelAngle"), "45");
    act<TSetTickLabelFrequency>("<setTickLabelFrequency role=\"x\" labelFrequency=\"3\"/>", chart);
    EXPECT_EQ(x.getLabelFrequency(), 3);
    act<TSetTickLabelFrequency>("<setTickLabelFrequency role=\"x\" labelFrequency=\"0\"/>", chart);
    EXPECT_EQ(x.getLabelFrequency(), 1);
    EXPECT_FALSE(act<TSetTickLabelFrequency>("<setTickLabelFrequency role=\"x\" labelFrequency=\"-2\"/>", chart));
    EXPECT_EQ(x.getLabelFrequency(), 1);

    // "format" wins over the other kinds; white space and comments between them are fine.
    EXPECT_TRUE(act<TSetTickLabelFormat>("<setTickLabelFormat role=\"x\"> <numberFormat maximumFractionDigits=\"1\"/>"
                                         " <!-- mine --> <format prefix=\"#\"/> </setTickLabelFormat>",
                                         chart));
    ASSERT_EQ(x.getFormats().size(), 1u);
    EXPECT_EQ(attributesOf(x.getFormats()[0]->getImplementation()), "prefix=#;");
    for (const char* refused :
         {"<setTickLabelFormat role=\"x\" categorical=\"true\"><numberFormat/></setTickLabelFormat>",
          "<setTickLabelFormat role=\"x\"><numberFormat/><style/></setTickLabelFormat>"})
        EXPECT_FALSE(act<TSetTickLabelFormat>(refused, chart)) << refused;
    EXPECT_EQ(attributesOf(x.getFormats()[0]->getImplementation()), "prefix=#;");

    // On a scatterplot matrix, y is the second facet level's axes and nothing else.
    GrxVisualization& matrix = sample("scatterplot-matrix.xml");
    act<TSetTickLabelAngle>("<setTickLabelAngle role=\"y\" labelAngle=\"30\"/>", matrix);
    for (const auto& [axis, angle] : std::vector<std::pair<const char*, const char*>>{
             {"facety_educ_axis", "30"}, {"facetx_educ_axis", "-90"}, {"dim_y_axis", "0"}})
        EXPECT_EQ(attr(byId<GrxAxis>(matrix, axis)->getMajorTickss()[0], "labelAngle"), angle) << axis;
}

// Setting twice is setting once, and every chart the axis actions make is sound.
TEST_F(Axes, SettingTwiceIsSettingOnceAndChartsStayValid) {
    const std::pair<const char*, const char*> cases[] = {
        {"scatter.xml", "<setAxisScale role=\"y\" method=\"log\" origin=\"1\"/>"},
        {"scatter.xml", "<setAxisInterval role=\"x\" min=\"0\" max=\"100\" upperMapping=\"exact\"/>"},
        {"dual-y-axis.xml", "<setAxisMargin role=\"y2\" upperMargin=\"9%\"/>"},
        {"dual-y-axis.xml", "<setAxisOpposite role=\"y\" opposite=\"true\"/>"},
        {"bar-3d.xml", "<setAxisStyle role=\"z\"><style color=\"red\"/><label>Depth</label></setAxisStyle>"},
        {"histogram.xml", "<setAxisMajorTicks><majorTicks role=\"y\" delta=\"10\"><gridLines/></majorTicks></setAxisMajorTicks>"},
        {"line-series.xml", "<setAxisMinorTicks><minorTicks role=\"x\" number=\"3\"/></setAxisMinorTicks>"},
        {"simple-bar.xml", "<setTickLabelAngle role=\"x\" categorical=\"true\" labelAngle=\"90\"/>"},
        {"scatterplot-matrix.xml", "<setTickLabelFrequency role=\"x\" labelFrequency=\"2\"/>"},
        {"simple-bar.xml", "<setTickLabelFormat role=\"y\"><numberFormat maximumFractionDigits=\"2\"/></setTickLabelFormat>"},
    };
    for (const auto& [name, body] : cases) {
        SCOPED_TRACE(body);
        GrxVisualization& once = sample(name);
        GrxVisualization& twice = sample(name);
        const std::string original = canonical(once);
        walk(once, body);
        walk(twice, body);
        walk(twice, body);
        EXPECT_TRUE(canonical(once) != original);
        EXPECT_TRUE(canonical(twice) == canonical(once));
        EXPECT_EQ(grammar_test::chartFaults(once), "");
    }
}

// "addDerivedAxis" answers false whatever it did; the report goes by its errors instead.
TEST_F(Axes, ADerivedAxisIsReportedByItsErrorsNotItsAnswer) {
    WalkReport report;
    walk(sample("scatter.xml"),
         "<addDerivedAxis role=\"y\"><transform method=\"percent\"/></addDerivedAxis><setAxisInterval role=\"y2\"/>");
    ASSERT_EQ(report.outcomes().size(), 2u);
    EXPECT_EQ(report.outcomes()[0].kind, InstructionOutcome::Applied);
    EXPECT_EQ(report.outcomes()[1].kind, InstructionOutcome::Failed);
}

} // namespace
