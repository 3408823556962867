// Fit, interpolation and distribution lines on the sample charts: the lines and statistics each
// instruction adds, their names in the user's language, where each is refused, and what adding
// twice leaves.
#include "templates/TemplateSupport.h"
#include "templates/actions/fitlines.h"

#include <msgbook/FacSTDictionary.h>

using namespace template_test;
using namespace plotaid::detail;

namespace {

// The language of the tests' words for one scope.
struct HostLanguage {
    explicit HostLanguage(const std::string& language) : before(msgbook::hostLanguage()) {
        msgbook::setHostLanguage(language);
    }
    ~HostLanguage() { msgbook::setHostLanguage(before); }
    std::string before;
};

// Each element the action added to the first graph: "name{attributes}[statistic{attributes}]".
std::string added(const GrxVisualization& before, const GrxVisualization& after) {
    std::string out;
    for (const CTElementType* e : elementsOf(*allGraphs(after).front())) {
        if (before.getElementById(e->getId()) != nullptr)
            continue;
        std::string attrs;
        for (const auto& [name, value] : attributeMap(e->getImplementation()))
            attrs += name == "id" || name == "style" || name == "coordinates" ? "" : name + "=" + value + ";";
        out += u8(e->getImplementation()->getTagName()) + "{" + attrs + "}";
        for (const CTStatisticType* s : e->getStatistics())
            out += u8(s->getImplementation()->getTagName()) + "{" + attributesOf(s->getImplementation()) + "}";
        out += " ";
    }
    return out;
}

class FitLines : public TemplateTest {
public:
    template <class T> bool run(GrxVisualization& chart, const std::string& instruction) {
        return act<T>(instruction, chart);
    }
};

TEST_F(FitLines, WhatEachInstructionAdds) {
    using Act = bool (FitLines::*)(GrxVisualization&, const std::string&);
    const Act fit = &FitLines::run<TFitLine>, interpolate = &FitLines::run<TInterpolationLine>,
              normal = &FitLines::run<THistogramNormalLine>, spikes = &FitLines::run<TAddSpikes>,
              projection = &FitLines::run<TSetProjectionLine>;
    const struct {
        const char* chart;
        Act action;
        const char* instruction;
        bool applied;
        const char* expected;
    } rows[] = {
        {"scatter.xml", fit, "<addFitLine primary='true' type='loess' kernel='gaussian' proportion='0.3' spikes='true'/>", true,
         "line{name=Fit line for Total;}smoothStatistic{bounded=false;kernel=gaussian;method=1;proportion=0.3;} "
         "interval{positionModifier=1;}smoothStatistic{bounded=false;method=1;spikes=true;} "},
        {"scatter.xml", fit, "<addFitLine primary='true' type='loess' spikes='true' bandwidth='2' intercept='false'/>", true,
         "line{name=Fit line for Total;}smoothStatistic{bandwidth=2;bounded=false;intercept=false;method=1;} "},
        {"scatter.xml", fit, "<addFitLine primary='true' type='mean'><confidenceInterval alpha='0.9' predictIndividuals='true'/></addFitLine>", true,
         "line{name=Fit line for Total;}smoothStatistic{bounded=false;degree=0;method=6;} "
         "line{name=Confidence Intervals;}regionStatistic{alpha=0.9;degree=0;predictIndividuals=true;type=7;} "},
        // Without "primary" the line belongs on the second coordinates; a categorical x has none.
        {"scatter.xml", fit, "<addFitLine type='linear'/>", true, ""},
        {"dual-y-axis.xml", fit, "<addFitLine type='linear'/>", true, ""},
        // Interpolation: step methods by point position, jumps shown, missing values bridged.
        {"scatter.xml", interpolate, "<addInterpolationLine><interpolation primary='true' type='step' pointPosition='left' missingRepresentation='wings'/></addInterpolationLine>", true,
         "line{breakRepresentation=wings;dot=false;showDiscontinuity=false;}summaryStatistic{method=0;}smoothStatistic{method=13;} "},
        {"scatter.xml", interpolate, "<addInterpolationLine><interpolation primary='true' type='jump' missingRepresentation='interpolate'/></addInterpolationLine>", true,
         "line{breakRepresentation=interpolated;dot=false;showDiscontinuity=true;}summaryStatistic{method=0;}smoothStatistic{method=15;} "},
        {"scatter.xml", interpolate, "<addInterpolationLine><interpolation primary='true' type='spline' pointPosition='far right'/></addInterpolationLine>", true,
         "line{dot=false;showDiscontinuity=true;}summaryStatistic{method=0;}smoothStatistic{method=12;} "},
        {"scatter.xml", interpolate, "<addInterpolationLine/>", false, ""},
        {"clustered-bar.xml", interpolate, "<addInterpolationLine><interpolation primary='true' type='linear'/></addInterpolationLine>", true, ""},
        // Distributions: parameters by type; a graph without a histogram gets none.
        {"histogram.xml", normal, "<addHistogramNormalLine type='t'/>", false, ""},
        {"histogram.xml", normal, "<addHistogramNormalLine type='beta' parameter='1'/>", false, ""},
        {"histogram.xml", normal, "<addHistogramNormalLine type='exponential' parameter='1'/>", true,
         "line{name=Exponential;}distributionStatistic{distribution=exponential;parameter=1;} "},
        {"histogram.xml", normal, "<addHistogramNormalLine type='normal'/>", true, "line{name=Normal;}distributionStatistic{distribution=normal;} "},
        {"scatter.xml", normal, "<addHistogramNormalLine type='normal'/>", true, ""},
        // Spikes: a reference for the point stands for each role; the base only for y.
        {"scatter.xml", spikes, "<addSpikes type='mean'/>", true, "edge{}linkStatistic{type=1;x=mean;y=mean;} "},
        {"scatter.xml", spikes, "<addSpikes type='base' x='origin'/>", true, "edge{}linkStatistic{type=1;x=origin;y=base;} "},
        {"scatter.xml", spikes, "<addSpikes y='centroid'/>", true, "edge{}linkStatistic{type=1;y=centroid;} "},
        {"simple-bar.xml", spikes, "<addSpikes type='mean'/>", true, ""},
        // Projection lines size a line by its cut at the category.
        {"histogram.xml", projection, "<setProjectionLine><categoryValue>5</categoryValue></setProjectionLine>", true, ""},
        {"histogram.xml", projection, "<setProjectionLine/>", false, ""},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.instruction);
        const GrxVisualization& before = sample(row.chart);
        GrxVisualization& chart = sample(row.chart);
        EXPECT_EQ((this->*row.action)(chart, row.instruction), row.applied);
        EXPECT_EQ(added(before, chart), row.expected);
        EXPECT_EQ(grammar_test::chartFaults(chart), "");
    }
}

TEST_F(FitLines, TotalLineLegendAndRSquaredInTheUsersLanguage) {
    HostLanguage german("de");
    GrxVisualization& chart = sample("scatter.xml");
    chart.removeLabelFrames();
    ASSERT_TRUE(act<TFitLine>("<addFitLine primary='true' type='quadratic' rsquared='true'/>", chart));
    const GrxLine& line = *allGraphs(chart).front()->getLines().at(0);
    EXPECT_EQ(ChartString(line.getName()).toUTF8(), "Anpassungslinie f\xC3\xBCr Gesamt");
    EXPECT_EQ(attr(line.getStyle(), "color"), "#3E58AC"); // the point's colour
    const GrxLegendTarget& target = *byId<GrxLegend>(chart, "legend_1")->getLegendTargets().back();
    EXPECT_EQ(target.getTarget(), &line);
    // The only label frame sits at 70% to 80%; its label reads "R², Quadratisch".
    const GrxLabelFrame& frame = *chart.getLabelFrames().at(0);
    std::string place;
    for (const GrxLocation* l : frame.getLocations())
        place += attr(l, "part") + "=" + attr(l, "value") + " ";
    EXPECT_EQ(place, "left=75% right=99% top=70% bottom=80% ");
    const GrxDescriptionGroup& group = *frame.getLabel()->getDescriptionGroups().at(0);
    EXPECT_EQ(group.getTarget(), &line);
    std::string texts;
    for (const CTTextType* t : group.getTexts())
        texts += t->getText().toUTF8() + "|";
    EXPECT_EQ(texts, "R|2| Quadratisch| = |");
    EXPECT_EQ(attr(group.getDescriptions().back()->getFormat(), "maximumFractionDigits"), "3");
    // Further frames climb: the fifth sits at 50% to 60%.
    GrxVisualization& crowded = sample("scatter.xml");
    act<TFitLine>("<addFitLine primary='true' type='cubic' rsquared='true'/>", crowded);
    EXPECT_EQ(attr(crowded.getLabelFrames().back()->getLocations()[2], "value"), "50%");
    // A fit line once: the second instruction finds it. The normal line in the user's language.
    const std::string once = canonical(chart);
    EXPECT_TRUE(act<TFitLine>("<addFitLine primary='true' type='linear'/>", chart));
    EXPECT_EQ(canonical(chart), once);
    GrxVisualization& histogram = sample("histogram.xml");
    act<THistogramNormalLine>("<addHistogramNormalLine type='uniform'/>", histogram);
    EXPECT_EQ(ChartString(allGraphs(histogram).front()->getLines().back()->getName()).toUTF8(), "Gleichverteilung");
    EXPECT_EQ(grammar_test::chartFaults(chart) + grammar_test::chartFaults(crowded), "");
}

TEST_F(FitLines, SubgroupsSpikesAndProjectionValues) {
    GrxVisualization& chart = sample("scatter.xml");
    act<TFitLine>("<addFitLine primary='true' type='linear' target='subgroup' spikes='true' colorSpikes='true'/>", chart);
    const GrxLine& line = *allGraphs(chart).front()->getLines().at(0);
    EXPECT_FALSE(line.isNamePresent());
    ASSERT_EQ(line.getColors().size(), 1u);
    EXPECT_EQ(attr(line.getColors()[0], "variable"), "var_gender");
    EXPECT_EQ(allGraphs(chart).front()->getIntervals().at(0)->getColors().size(), 1u); // coloured spikes
    // The legend shows the subgroups' colours and shapes, never the line itself.
    for (const GrxLegendTarget* target : byId<GrxLegend>(chart, "legend_1")->getLegendTargets())
        EXPECT_NE(target->getTarget(), &line);
    EXPECT_EQ(byId<GrxLegend>(chart, "legend_1")->getLegendTargets().size(), 4u);
    // A subgroup without aesthetics ends the walk.
    GrxVisualization& plain = sample("scatter.xml");
    byId<GrxPoint>(plain, "point_1")->removeColors();
    byId<GrxPoint>(plain, "point_1")->removeShapes();
    act<TFitLine>("<addFitLine primary='true' type='linear' target='subgroup'/>", plain);
    EXPECT_TRUE(allGraphs(plain).front()->getLines().empty());

    // Spikes on z where the point has one; coloured like the point when asked.
    GrxVisualization& spiked = sample("scatter.xml");
    byId<GrxPoint>(spiked, "point_1")->addZ().setVariable(*byId<CTVariableType>(spiked, "var_salary"));
    act<TAddSpikes>("<addSpikes type='midrange' colorSpikes='true'/>", spiked);
    const GrxEdge& edge = *allGraphs(spiked).front()->getEdges().at(0);
    EXPECT_EQ(attributesOf(edge.getLinkStatistics()[0]->getImplementation()), "type=1;x=mean;y=mean;z=mean;");
    EXPECT_EQ(attr(edge.getStyle(), "color"), "#3E58AC");
    act<TAddSpikes>("<addSpikes styleOnly='true'><style color='gray'/></addSpikes>", spiked);
    EXPECT_EQ(attr(edge.getStyle(), "color"), "gray");
    EXPECT_EQ(allGraphs(spiked).front()->getEdges().size(), 1u);

    GrxVisualization& histogram = sample("histogram.xml");
    act<TSetProjectionLine>("<setProjectionLine before='true' high='4pt'><categoryValue>5</categoryValue></setProjectionLine>", histogram);
    const GrxSize& size = *byId<GrxLine>(histogram, "line_normal")->getSizes().at(0);
    const auto* cut = dynamic_cast<const GrxDerivedVariable*>(size.getVariable());
    ASSERT_NE(cut, nullptr);
    EXPECT_EQ(u8(cut->getValue()) + "|" + u8(cut->getCreator()) + "|" + attr(&size, "high"), "var_salary > 5 ? 0 : 1|internal_cutVariable|4pt");
    act<TSetProjectionLine>("<setProjectionLine><categoryValue>2</categoryValue></setProjectionLine>", histogram);
    EXPECT_EQ(u8(dynamic_cast<const GrxDerivedVariable*>(byId<GrxLine>(histogram, "line_normal")->getSizes().at(1)->getVariable())->getValue()),
              "var_salary < 2 ? 0 : 1");
    EXPECT_EQ(grammar_test::chartFaults(chart) + grammar_test::chartFaults(spiked) + grammar_test::chartFaults(histogram), "");
}

} // namespace
