// Axis actions on the sample charts: what each sets, what it must leave alone, and that setting
// twice is setting once.
#include "templates/TemplateSupport.h"
#include "templates/actions/axes.h"

using namespace template_test;
using namespace plotaid::detail;

namespace {

using Axes = TemplateTest;

TEST_F(Axes, EachInstructionSetsWhatItNamesOnTheRolesItSelects) {
    const std::string start = "2026-03-04 09:05:07.000";
    expectWalks({
        // Scales: the safe log, an exponent or a base; never on a categorical or a polar role. An
        // existing origin goes when the instruction gives none.
        {"scatter.xml",
         "<setAxisScale role='y' method='log'><parameter name='safe' value='true'/></setAxisScale>",
         "applied ", "dim_y/scale=invert=false;method=log_safe;"},
        {"scatter.xml",
         "<setAxisScale role='x' method='power'><parameter name='exponent' value='0.5'/></setAxisScale>",
         "applied ", "dim_x/scale=base=0.5;invert=false;method=power;"},
        {"scatter.xml",
         "<setAxisScale role='x' method='power' base='3'><parameter name='base' value='0.5'/></setAxisScale>",
         "applied ", "dim_x/scale=base=3;invert=false;method=power;"},
        {"scatter.xml", "<setAxisScale role='y' method='cubic' origin='0' invert='true'/>", "applied ",
         "dim_y/scale=invert=true;method=linear;origin=0;"},
        {"scatter.xml", "<setAxisScale role='y' method='probit'/>", "applied ", "dim_x/scale=<none>"},
        {"simple-bar.xml", "<setAxisScale role='x' method='log'/>", "applied ", "unchanged"},
        {"pie.xml", "<setAxisScale role='x' method='log'/>", "applied ", "unchanged"},
        {"scatter.xml", "<setAxisScale role='y' origin='5'/><setAxisScale role='y'/>", "applied applied ",
         "dim_y/scale=invert=false;method=linear;"},
        // Intervals: exact date ends; ranges replaced, not added to, and nice ends back without
        // "exact"; no role the chart lacks, nor a categorical one.
        {"scatter.xml", "<setAxisInterval role='x' lowerMapping='exact' min='" + start + "' max='2027'/>",
         "applied ",
         "dim_x.unionDomain=false|dim_x.niceLowerMapping=false|dim_x.niceUpperMapping=true|dim_x/"
         "@domain.date=true|"
         "dim_x/@domain/range=exact=true;min=" +
             start +
             ";|dim_x/@domain/range#2=exact=true;max=2027;|"
             "dim_x/axis/majorTicks.base=" +
             start},
        {"scatter.xml",
         "<setAxisInterval role='x' lowerMapping='exact' min='1'/><setAxisInterval role='x' max='9'/>",
         "applied applied ",
         "dim_x.unionDomain=true|dim_x.niceLowerMapping=true|dim_x/@domain/range#2=<none>"},
        {"scatter.xml", "<setAxisInterval role='y2' min='1'/>", "failed ", "unchanged"},
        {"simple-bar.xml", "<setAxisInterval role='x' min='1'/>", "applied ", "unchanged"},
        // Margins: x is categorical, so only an instruction that says so reaches it.
        {"simple-bar.xml", "<setAxisMargin role='y' upperMargin='20%' lowerMargin='3%'/>", "applied ",
         "dim_y.upperMargin=20%|dim_y.lowerMargin=3%"},
        {"simple-bar.xml", "<setAxisMargin role='x' upperMargin='1%'/>", "applied ", "dim_x.upperMargin=5%"},
        {"simple-bar.xml", "<setAxisMargin role='x' categorical='true' upperMargin='1%'/>", "applied ",
         "dim_x.upperMargin=1%"},
        // Tick labels: an angle needs a value and a role of its kind; a frequency below one is one, a
        // negative one is refused.
        {"scatter.xml",
         "<setTickLabelAngle role='x' labelAngle='45'/><setTickLabelAngle role='x'/>"
         "<setTickLabelAngle role='x' categorical='true' labelAngle='10'/>",
         "applied failed failed ", "dim_x_axis/majorTicks.labelAngle=45"},
        {"scatter.xml", "<setTickLabelFrequency role='x' labelFrequency='3'/>", "applied ",
         "dim_x_axis/majorTicks.labelFrequency=3"},
        {"scatter.xml",
         "<setTickLabelFrequency role='x' labelFrequency='0'/><setTickLabelFrequency role='x' "
         "labelFrequency='-2'/>",
         "applied failed ", "dim_x_axis/majorTicks.labelFrequency=1"},
        // "format" wins over the other kinds, with white space and comments between them; a refused
        // format leaves the one before.
        {"scatter.xml",
         "<setTickLabelFormat role='x'> <numberFormat maximumFractionDigits='1'/> <!-- mine --> "
         "<format prefix='#'/> </setTickLabelFormat>"
         "<setTickLabelFormat role='x' categorical='true'><numberFormat/></setTickLabelFormat>"
         "<setTickLabelFormat role='x'><numberFormat/><style/></setTickLabelFormat>",
         "applied failed failed ",
         "dim_x_axis/majorTicks/format=prefix=#;|dim_x_axis/majorTicks/format#2=<none>"},
        // A scatterplot matrix draws its ticks on the facet axes: the coordinate axes lose theirs.
        {"scatterplot-matrix.xml", "<setAxisMajorTicks><majorTicks role='x'/></setAxisMajorTicks>",
         "applied ", "dim_x_axis/majorTicks=<none>|dim_y_axis/majorTicks.position=outside"},
        {"scatter.xml", "<setAxisMajorTicks/>", "failed ", "unchanged"},
        // Ticks only on the axes the instruction selects: the derived one, or only the main one.
        {"scatter.xml",
         "<addDerivedAxis role='y'><transform method='percent'/></addDerivedAxis><setAxisMajorTicks>"
         "<majorTicks role='y' derived='true' position='cross'/></setAxisMajorTicks><setAxisMinorTicks>"
         "<minorTicks role='y' number='5'/></setAxisMinorTicks>",
         "applied applied applied ",
         "dim_y/axis/majorTicks.position=outside|dim_y/axis#2/majorTicks.position=cross|"
         "dim_y/axis/minorTicks.number=5|dim_y/axis#2/minorTicks=<none>"},
    });
}

TEST_F(Axes, MarginsKeepWhatTheSourceDefines) {
    GrxVisualization& source = sample("simple-bar.xml");
    byId<GrxDimension>(source, "dim_y")->removeLowerMargin();
    GrxVisualization& chart = sample("simple-bar.xml");
    EXPECT_TRUE(
        act<TSetAxisMargin>("<setAxisMargin role='y' upperMargin='20%' lowerMargin='3%'/>", chart, &source));
    expectAt(chart, "dim_y.upperMargin=5%|dim_y.lowerMargin=3%");
}

TEST_F(Axes, DerivedAxesPercentParametersAndTheOppositeSide) {
    GrxVisualization& chart = sample("scatter.xml");
    EXPECT_FALSE(act<TAddDerivedAxis>(
        "<addDerivedAxis role='y2'><transform method='percent'/></addDerivedAxis>", chart));
    act<TAddDerivedAxis>("<addDerivedAxis role='y'><transform method='percent'/><style color='red'/>"
                         "<majorTicks position='inside'/></addDerivedAxis>",
                         chart);
    // The stroke width is copied from the main axis style.
    expectAt(chart, "dim_y/axis#2.transform=percent|dim_y/axis#2.opposite=true|dim_y/axis#3=<none>|"
                    "dim_y/axis#2/axisTransformParameter=<none>|dim_y/axis#2/@style.color=red|"
                    "dim_y/axis#2/@style.stroke-width=0.5pt|dim_y/axis#2/majorTicks.position=inside|"
                    "dim_y/axis/majorTicks.position=outside");

    // A new transform replaces the derived axis; an attribute beats a parameter of its name.
    act<TAddDerivedAxis>("<addDerivedAxis role='y'><transform method='ratio' base-ratio='2'>"
                         "<parameter name='base-ratio' value='9'/><parameter name='derived-match' value='4'/>"
                         "</transform></addDerivedAxis>",
                         chart);
    act<TSetAxisOpposite>("<setAxisOpposite role='y' opposite='true'/>", chart);
    expectAt(
        chart,
        "dim_y/axis#3=<none>|dim_y/axis#2.transform=derived|"
        "dim_y/axis#2/axisTransformParameter=name=base-ratio;value=2;|"
        "dim_y/axis#2/axisTransformParameter#2=name=derived-match;value=4;|"
        "dim_y/axis#2/axisTransformParameter#3=<none>|dim_y/axis.opposite=true|dim_y/axis#2.opposite=false");

    // Two plain axes leave no room for a derived one.
    byId<GrxDimension>(chart, "dim_x")->addAxis();
    const std::string before = canonical(chart);
    act<TAddDerivedAxis>("<addDerivedAxis role='x'><transform method='percent'/></addDerivedAxis>", chart);
    EXPECT_EQ(canonical(chart), before);
}

TEST_F(Axes, StylesTitlesAndTheScatterplotMatrix) {
    GrxVisualization& chart = sample("scatter.xml");
    GrxAxis& y = *byId<GrxAxis>(chart, "dim_y_axis");
    y.getLabel()->removeTextFrameStyle();
    act<TSetAxisStyle>("<setAxisStyle role='y'><style color='red'/><label>\n  Pay\n</label><axisLabelStyle>"
                       "<style number='1' color='blue'/><style number='2' font-size='20pt'/></axisLabelStyle>"
                       "</setAxisStyle>",
                       chart);
    EXPECT_EQ(u8(y.getLabel()->getAllText().xc_str()), "Pay");
    EXPECT_FALSE(y.getLabel()->getTextFrameStyle()->getVisible());
    // Only a role that is categorical when the instruction asks for one.
    act<TSetAxisStyle>("<setAxisStyle role='y' categorical='true'><style color='green'/></setAxisStyle>",
                       chart);
    expectAt(chart, "dim_y_axis/@style.color=red|dim_y_axis/label/@textFrameStyle.color=blue|"
                    "dim_y_axis/label/@style.font-size=20pt");

    GrxVisualization& matrix = sample("scatterplot-matrix.xml");
    byId<GrxAxis>(matrix, "dim_x_axis")->removeStyle();
    act<TSetAxisStyle>("<setAxisStyle role='x'/>", matrix);
    // On a scatterplot matrix, y is the second facet level's axes and nothing else.
    act<TSetTickLabelAngle>("<setTickLabelAngle role='y' labelAngle='30'/>", matrix);
    expectAt(matrix, "dim_x_axis/@style.color=transparent|facety_educ_axis/majorTicks.labelAngle=30|"
                     "facetx_educ_axis/majorTicks.labelAngle=-90|dim_y_axis/majorTicks.labelAngle=0");
}

TEST_F(Axes, SettingTwiceIsSettingOnceAndChartsStayValid) {
    expectTwiceIsOnce({
        {"scatter.xml", "<setAxisScale role='y' method='log' origin='1'/>"},
        {"scatter.xml", "<setAxisInterval role='x' min='0' max='100' upperMapping='exact'/>"},
        {"dual-y-axis.xml", "<setAxisMargin role='y2' upperMargin='9%'/>"},
        {"dual-y-axis.xml", "<setAxisOpposite role='y' opposite='true'/>"},
        {"bar-3d.xml", "<setAxisStyle role='z'><style color='red'/><label>Depth</label></setAxisStyle>"},
        {"histogram.xml",
         "<setAxisMajorTicks><majorTicks role='y' delta='10'><gridLines/></majorTicks></setAxisMajorTicks>"},
        {"line-series.xml", "<setAxisMinorTicks><minorTicks role='x' number='3'/></setAxisMinorTicks>"},
        {"simple-bar.xml", "<setTickLabelAngle role='x' categorical='true' labelAngle='90'/>"},
        {"scatterplot-matrix.xml", "<setTickLabelFrequency role='x' labelFrequency='2'/>"},
        {"simple-bar.xml",
         "<setTickLabelFormat role='y'><numberFormat maximumFractionDigits='2'/></setTickLabelFormat>"},
    });
}

// "addDerivedAxis" answers false whatever it did; the report goes by its errors instead.
TEST_F(Axes, ADerivedAxisIsReportedByItsErrorsNotItsAnswer) {
    EXPECT_EQ(walk(sample("scatter.xml"), "<addDerivedAxis role='y'><transform "
                                          "method='percent'/></addDerivedAxis><setAxisInterval role='y2'/>"),
              "applied failed ");
}

} // namespace
