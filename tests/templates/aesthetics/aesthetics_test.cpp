// The aesthetic actions applied straight to a chart: new style cycles for the selected aesthetics,
// colours turned into dashes, attributes written onto chosen nodes, markers over a lone line.
#include "templates/TemplateSupport.h"

using namespace template_test;
using namespace plotaid::detail;

namespace {

using Aesthetics = TemplateTest;

// A chart around a graph body: variables var_a and var_b, a domain, styles "plainStyle" (colour
// #112233) and "otherStyle", and a style cycle "chartCycle" to refer to.
std::string chartWith(const std::string& graphBody, const std::string& extra = std::string()) {
    return chartOf(
        "<style id='plainStyle' color='#112233'/><style id='otherStyle' color2='#445566'/>"
        "<sourceVariable id='var_a' source='data' sourceName='a' categorical='1'/>"
        "<sourceVariable id='var_b' source='data' sourceName='b' categorical='0'/>"
        "<categoricalDomain id='domain_a'><variableReference variable='var_a'/></categoricalDomain>"
        "<styleCycle id='chartCycle'><cycle><style color='red'/><style color='blue'/></cycle>"
        "</styleCycle><graph id='graph_1'><coordinates id='coordinates_1'><dimension id='dim_x'/>"
        "<dimension id='dim_y'/></coordinates>" +
        graphBody + "</graph>" + extra + "<userSource id='data'/>");
}

const std::string kStyles = "[({color=#010101;}{color=#020202;})]";
std::string setColor(const std::string& attributes = std::string()) {
    return "<setColor " + attributes +
           "><cycle><style color='#010101'/><style color='#020202'/></cycle></setColor>";
}
// Two intervals around a point, each with a colour by var_a on the chart's cycle; the intervals
// have a second colour without one.
const std::string kTags = chartWith(
    "<interval id='bars_1' coordinates='coordinates_1'><color id='a1' variable='var_a' cycle='chartCycle'/>"
    "<color id='a2' variable='var_b'/></interval><point id='marks' coordinates='coordinates_1'>"
    "<color id='m1' variable='var_a' cycle='chartCycle'/></point><interval id='bars_2' "
    "coordinates='coordinates_1'><color id='b1' variable='var_a' cycle='chartCycle'/>"
    "<color id='b2' variable='var_b'/></interval>");

TEST_F(Aesthetics, SetColorElementsOfOneTagShareOneNewCycleAndANumberSelectsByPosition) {
    GrxVisualization& chart = parse(kTags);
    EXPECT_TRUE(act<TSetColor>(setColor(), chart));
    const std::string bars = cycleIdOf(chart, "a1");
    EXPECT_NE(bars, "chartCycle");
    EXPECT_NE(cycleIdOf(chart, "m1"), bars);
    EXPECT_EQ(cycleIdOf(chart, "b1"), bars);
    for (const char* id : {"a1", "m1", "b2"})
        EXPECT_EQ(stylesOf(chart, id), kStyles) << id;
    EXPECT_EQ(attr(byId(chart, "m1"), "variable"), "var_a");
    EXPECT_NE(byId(chart, "chartCycle"), nullptr); // still there for whatever else names it

    // The second bars continue the first bars' new cycle; without a cycle nothing changes.
    GrxVisualization& second = parse(kTags);
    const std::size_t cyclesBefore = second.getStyleCycles().size();
    EXPECT_TRUE(act<TSetColor>(setColor("aestheticNumber='2'"), second));
    EXPECT_EQ(second.getStyleCycles().size(), cyclesBefore + 1);
    EXPECT_EQ(stylesOf(second, "a2"), kStyles);
    EXPECT_EQ(cycleIdOf(second, "b2"), cycleIdOf(second, "a2"));
    for (const char* id : {"a1", "b1", "m1"})
        EXPECT_EQ(cycleIdOf(second, id), "chartCycle") << id;
    const std::string before = second.AsUTF8();
    EXPECT_TRUE(act<TSetColor>(setColor("aestheticNumber='3'"), second));
    EXPECT_TRUE(act<TSetColor>("<setColor affect='both'><style color='red'/></setColor>", second));
    EXPECT_EQ(second.AsUTF8(), before);
}

TEST_F(Aesthetics, SetColorAffectModesDependOnWhetherTheColourBelongsToAPoint) {
    // The sample has "secondary" on the interval's colour_1 and "main" on the point's colour_2.
    const struct {
        const char *affect, *interval, *point;
    } cases[] = {{"main", "main", "secondary"},
                 {"secondary", "secondary", "main"},
                 {"both", "both", "both"},
                 {"", "secondary", "main"}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.affect);
        GrxVisualization& chart = sample("error-bars.xml");
        EXPECT_TRUE(
            act<TSetColor>(setColor(*c.affect ? std::string("affect='") + c.affect + "'" : ""), chart));
        EXPECT_EQ(attr(byId(chart, "color_1"), "affect") + " " + attr(byId(chart, "color_2"), "affect"),
                  std::string(c.interval) + " " + c.point);
    }
}

TEST_F(Aesthetics, SetColorASourceThatSetsTheCycleKeepsTheColour) {
    GrxVisualization& chart = sample("error-bars.xml");
    GrxVisualization& source = sample("error-bars.xml");
    byId<GrxColor>(source, "color_2")->removeCycle();
    EXPECT_TRUE(act<TSetColor>(setColor("affect='both'"), chart, &source));
    EXPECT_EQ(cycleIdOf(chart, "color_1") + " " + attr(byId(chart, "color_1"), "affect"),
              "styleCycleRepository secondary");
    // Where the source's colour has no cycle, the template decides.
    EXPECT_EQ(stylesOf(chart, "color_2") + " " + attr(byId(chart, "color_2"), "affect"), kStyles + " both");
}

const std::string kDashes = "<cycle><style stroke-dasharray='4 4'/><style stroke-dasharray='1 3'/></cycle>";
const std::string kDashStyles = "[({stroke-dasharray=4 4;}{stroke-dasharray=1 3;})]";
const std::string kSetDash = "<setDash>" + kDashes + "</setDash>";
const std::string kMappings = "<parameter name='small' value='2pt'/><parameter name='large' value='9pt'/>";

// Two lines with a dash each, a point with a shape and a size, patterns on a styled interval and
// on an area without a style.
const std::string kSeries = chartWith(
    "<line id='line_1' coordinates='coordinates_1'><dash id='dash_1' variable='var_a' cycle='chartCycle'/>"
    "<size id='lineSize' variable='var_b' low='1pt' high='3pt'/></line>"
    "<line id='line_2' style='otherStyle' coordinates='coordinates_1'><dash id='dash_2' variable='var_a' "
    "cycle='chartCycle'/></line><point id='point_1' coordinates='coordinates_1'><shape id='shape_1' "
    "variable='var_a' cycle='chartCycle'/><size id='pointSize' variable='var_b' low='2pt' high='8pt' "
    "cycle='chartCycle' domain='domain_a'/></point><interval id='styled' style='plainStyle' "
    "coordinates='coordinates_1'><pattern id='pattern_1' variable='var_a' cycle='chartCycle'/></interval>"
    "<area id='bare' coordinates='coordinates_1'><pattern id='pattern_2' variable='var_a'/></area>");

std::string mappingsOf(const GrxVisualization& chart, const char* id) {
    std::string out;
    for (const GrxLengthMapping* m : byId<GrxSize>(chart, id)->getLengthMappings())
        out += u8(m->getFrom()) + "=" + u8(m->getTo()) + " ";
    return out;
}

TEST_F(Aesthetics, EachSelectedDashGetsACycleOfItsOwnUnlessTheSourceSetsOne) {
    GrxVisualization& chart = parse(kSeries);
    const std::size_t cyclesBefore = chart.getStyleCycles().size();
    EXPECT_TRUE(act<TSetDash>(kSetDash, chart));
    // Unlike colours, two lines do not share; shapes and sizes are no dashes.
    EXPECT_EQ(chart.getStyleCycles().size(), cyclesBefore + 2);
    EXPECT_NE(cycleIdOf(chart, "dash_1"), cycleIdOf(chart, "dash_2"));
    EXPECT_EQ(stylesOf(chart, "dash_2"), kDashStyles);
    EXPECT_EQ(cycleIdOf(chart, "shape_1") + " " + cycleIdOf(chart, "pointSize"), "chartCycle chartCycle");

    // The last cycle child counts; a number past the list, or no cycle at all, changes nothing.
    GrxVisualization& other = parse(kSeries);
    const std::string before = other.AsUTF8();
    EXPECT_TRUE(act<TSetDash>("<setDash aestheticNumber='2'>" + kDashes + "</setDash>", other));
    EXPECT_TRUE(act<TSetDash>("<setDash><style stroke-dasharray='9 9'/></setDash>", other));
    EXPECT_EQ(other.AsUTF8(), before);
    EXPECT_TRUE(act<TSetDash>(
        "<setDash><cycle><style stroke-dasharray='9 9'/></cycle>" + kDashes + "</setDash>", other));
    EXPECT_EQ(stylesOf(other, "dash_1"), kDashStyles);

    GrxVisualization& guarded = parse(kSeries);
    GrxVisualization& source = parse(kSeries);
    byId<GrxDash>(source, "dash_2")->removeCycle();
    EXPECT_TRUE(act<TSetDash>(kSetDash, guarded, &source));
    EXPECT_EQ(cycleIdOf(guarded, "dash_1"), "chartCycle");
    EXPECT_EQ(stylesOf(guarded, "dash_2"), kDashStyles);
}

TEST_F(Aesthetics, PatternsGetANewCycleOverAWhiteFillUnlessTheSourceStyleHasAColour) {
    const std::string setPattern = "<setPattern><cycle><style pattern='3'/></cycle></setPattern>";
    GrxVisualization& chart = parse(kSeries);
    EXPECT_TRUE(act<TSetPattern>(setPattern, chart));
    EXPECT_EQ(stylesOf(chart, "pattern_1"), "[({pattern=3;})]");
    // An element without a style gets a new white one; no pattern on a line, no white there.
    EXPECT_EQ(attr(byId(chart, "plainStyle"), "color") + " " +
                  attr(byId<GrxArea>(chart, "bare")->getStyle(), "color") + " " +
                  attr(byId(chart, "otherStyle"), "color"),
              "white white -");
    const std::string once = canonical(chart);
    EXPECT_TRUE(act<TSetPattern>(setPattern, chart));
    EXPECT_EQ(canonical(chart), once); // no second style

    GrxVisualization& guarded = parse(kSeries);
    EXPECT_TRUE(act<TSetPattern>(setPattern, guarded, &parse(kSeries)));
    EXPECT_EQ(attr(byId(guarded, "plainStyle"), "color") + " " +
                  attr(byId<GrxArea>(guarded, "bare")->getStyle(), "color"),
              "#112233 white");
}

TEST_F(Aesthetics, SizeParametersReplaceLowHighCycleAndDomainByMappingsOfTheElementType) {
    GrxVisualization& chart = parse(kSeries);
    EXPECT_TRUE(act<TSetSize>("<setSize>" + kMappings + kDashes + "</setSize>", chart));
    const GrxSize& size = *byId<GrxSize>(chart, "pointSize");
    EXPECT_EQ(mappingsOf(chart, "pointSize"), "small=2pt large=9pt ");
    EXPECT_FALSE(size.isLowPresent() || size.isHighPresent() || size.isCyclePresent() ||
                 size.isDomainPresent());
    // Mappings of an earlier application are replaced, not extended.
    EXPECT_TRUE(act<TSetSize>("<setSize><parameter name='small' value='1pt'/></setSize>", chart));
    EXPECT_EQ(mappingsOf(chart, "pointSize"), "small=1pt ");

    // Without parameters only the cycle is replaced.
    GrxVisualization& cycled = parse(kSeries);
    EXPECT_TRUE(act<TSetSize>("<setSize><cycle><style size='5pt'/></cycle></setSize>", cycled));
    EXPECT_EQ(stylesOf(cycled, "pointSize") + attr(byId(cycled, "pointSize"), "low"), "[({size=5pt;})]2pt");

    const struct {
        const char* elementType;
        bool line, point;
    } cases[] = {
        {"line", true, false}, {"point", false, true}, {"interval", false, false}, {"bogus", true, true}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.elementType);
        GrxVisualization& typed = parse(kSeries);
        const std::string instruction =
            std::string("<setSize elementType='") + c.elementType + "'>" + kMappings + "</setSize>";
        EXPECT_TRUE(act<TSetSize>(instruction, typed));
        EXPECT_EQ(mappingsOf(typed, "lineSize").empty(), !c.line);
        EXPECT_EQ(mappingsOf(typed, "pointSize").empty(), !c.point);
    }
}

// A line with a colour that carries every attribute, its own dash, and a bare colour; a legend
// listing both colours.
const std::string kColours = chartWith(
    "<line id='line_1' coordinates='coordinates_1'><color id='colour_a' variable='var_a' cycle='chartCycle' "
    "domain='domain_a' missing='gap' dimension='dim_x' clamp='true' split='false' affect='main'/>"
    "<dash id='dash_own' variable='var_a'/><color id='colour_b' variable='var_b'/></line>",
    "<legend id='legend_1'><legendTarget id='target_a' target='colour_a'/>"
    "<legendTarget id='target_b' target='colour_b'/></legend>");
const std::string kAddDash = "<addDash><cycle><style stroke-dasharray='3 1'/></cycle></addDash>";

TEST_F(Aesthetics, AddDashEveryColourBecomesADashUnderItsIdOnce) {
    GrxVisualization& chart = parse(kColours);
    EXPECT_TRUE(act<TAddDash>(kAddDash, chart));
    const GrxLine& line = *byId<GrxLine>(chart, "line_1");
    EXPECT_TRUE(line.getColors().empty());
    const std::vector<GrxDash*> dashes = line.getDashs();
    ASSERT_EQ(dashes.size(), 3u);
    EXPECT_EQ(u8(dashes[1]->getId()) + " " + u8(dashes[2]->getId()), "colour_a colour_b");
    // Everything but the affect comes with it.
    std::string kept;
    for (const char* name : {"variable", "domain", "missing", "dimension", "clamp", "split", "affect"})
        kept += attr(dashes[1], name) + " ";
    EXPECT_EQ(kept, "var_a domain_a gap dim_x true false - ");
    EXPECT_NE(cycleIdOf(chart, "colour_a"), cycleIdOf(chart, "colour_b"));
    EXPECT_EQ(stylesOf(chart, "colour_b"), "[({stroke-dasharray=3 1;})]");
    EXPECT_EQ(byId<GrxLegendTarget>(chart, "target_a")->getTarget(), dashes[1]); // the legend follows

    // Without a cycle nothing is converted; a number selects the colour.
    GrxVisualization& numbered = parse(kColours);
    const std::string before = numbered.AsUTF8();
    EXPECT_TRUE(act<TAddDash>("<addDash><style stroke-dasharray='3 1'/></addDash>", numbered));
    EXPECT_EQ(numbered.AsUTF8(), before);
    EXPECT_TRUE(act<TAddDash>(
        "<addDash aestheticNumber='2'><cycle><style stroke-dasharray='3 1'/></cycle></addDash>", numbered));
    const std::vector<GrxColor*> left = byId<GrxLine>(numbered, "line_1")->getColors();
    ASSERT_EQ(left.size(), 1u);
    EXPECT_EQ(u8(left.front()->getId()), "colour_a");
    EXPECT_NE(byId<GrxDash>(numbered, "colour_b"), nullptr);
}

// Three labels: one under an axis (first in document order), two under label frames.
const std::string kLabels = chartWith(
    "<coordinates id='coordinates_2'><dimension id='dim_z'><axis id='axis_z'><label id='label_3'>"
    "<text>Axis</text></label></axis></dimension></coordinates>",
    "<labelFrame id='frame_1'><label id='label_1' style='plainStyle'><text>First</text></label>"
    "</labelFrame><labelFrame id='frame_2'><label id='label_2'><text>Second</text></label></labelFrame>");

// The attribute of the node of each id: "value,value,...".
std::string written(const GrxVisualization& chart, const char* name, std::initializer_list<const char*> ids) {
    std::string out;
    for (const char* id : ids)
        out += attr(chart.getElementById(ChartString(id)), name) + ",";
    return out;
}

class SetGenericAttributes : public TemplateTest {
protected:
    void SetUp() override { chart_ = &parse(kLabels); }
    bool set(const std::string& attributes, const GrxVisualization* source = nullptr) {
        return act<TSetGenericAttributes>("<setGenericAttributes " + attributes + "/>", *chart_, source);
    }
    GrxVisualization* chart_ = nullptr;
};

TEST_F(SetGenericAttributes, MatchingNodesCountedByTagAndParentTakeTheAttributesAndTheText) {
    EXPECT_TRUE(
        set("id='rule7' elementName='label' xml:space='preserve' textFrameStyle='plainStyle' data-n='n'"));
    EXPECT_EQ(written(*chart_, "data-n", {"label_1", "label_2", "label_3", "frame_1"}), "n,n,n,-,");
    // The selectors are not written.
    EXPECT_EQ(written(*chart_, "textFrameStyle", {"label_3"}) + written(*chart_, "elementName", {"label_1"}) +
                  written(*chart_, "xml:space", {"label_1"}),
              "plainStyle,-,-,");
    EXPECT_EQ(chart_->getElementById(ChartString("rule7")), nullptr);
    // Count picks the nth match; parentName narrows what is counted.
    EXPECT_TRUE(set("elementName='label' count='2' data-c='2'"));
    EXPECT_TRUE(set("elementName='label' parentName='labelFrame' count='2' data-p='x'"));
    EXPECT_EQ(written(*chart_, "data-c", {"label_3", "label_1", "label_2"}), "-,2,-,");
    EXPECT_EQ(written(*chart_, "data-p", {"label_3", "label_1", "label_2"}), "-,-,x,");
    const std::string before = chart_->AsUTF8();
    EXPECT_TRUE(set("elementName='label' count='4' data-c='9'"));
    EXPECT_EQ(chart_->AsUTF8(), before);
    // The text attribute replaces the node's text.
    EXPECT_TRUE(set("elementName='text' parentName='label' count='3' text='Replaced'"));
    EXPECT_EQ(u8(byId<GrxLabel>(*chart_, "label_2")->getAllText().xc_str()) + " " +
                  u8(byId<GrxLabel>(*chart_, "label_1")->getAllText().xc_str()),
              "Replaced First");
}

TEST_F(SetGenericAttributes, AStyleNameWritesOnTheReferredStyleOrANewLinkedOneUnlessTheSourceSetsIt) {
    EXPECT_TRUE(set("elementName='label' parentName='labelFrame' styleName='style' font-weight='bold'"));
    EXPECT_EQ(written(*chart_, "font-weight", {"plainStyle", "label_1", "label_2"}), "bold,-,-,");
    const GrxStyle* made = byId<GrxLabel>(*chart_, "label_2")->getStyle();
    ASSERT_NE(made, nullptr);
    EXPECT_NE(u8(made->getId()), "plainStyle");
    EXPECT_EQ(attr(made, "font-weight"), "bold");
    // A reference that names nothing is passed over.
    byId(*chart_, "label_2")->SetAttribute(u"textFrameStyle", u"nowhere");
    const std::string before = chart_->AsUTF8();
    set("elementName='label' parentName='labelFrame' count='2' styleName='textFrameStyle' data-x='1'");
    EXPECT_EQ(chart_->AsUTF8(), before);
    // With a source, only what the source's style leaves empty is written.
    EXPECT_TRUE(set("elementName='label' count='2' styleName='style' color='#FFFFFF' font-size='20pt'",
                    &parse(kLabels)));
    EXPECT_EQ(written(*chart_, "color", {"plainStyle"}) + written(*chart_, "font-size", {"plainStyle"}),
              "#112233,20pt,");
}

TEST_F(SetGenericAttributes, NothingToFindOrWriteFailsAndStylesMadeOnTheWayAreNotMatchedAgain) {
    const std::string before = chart_->AsUTF8();
    for (const char* attributes : {"", "data-x='1'", "elementName='' data-x='1'"})
        EXPECT_FALSE(set(attributes)) << attributes;
    EXPECT_FALSE(TSetGenericAttributes(nullptr, *chart_, nullptr).apply());
    EXPECT_EQ(chart_->AsUTF8(), before);

    const auto* styles = root(*chart_)->getElementsByTagName(u"style");
    const XMLSize_t count = styles->getLength();
    // Every style without a "textStyle" gets a new one, which is a style without one too.
    EXPECT_TRUE(set("elementName='style' styleName='textStyle' color='red'"));
    EXPECT_EQ(styles->getLength(), 2 * count + 1); // and one container
}

const std::string kMarkers = "<setShowLineMarkers><style size='6pt' color2='#333333'/></setShowLineMarkers>";

TEST_F(Aesthetics, SetShowLineMarkersALoneLineGetsPointsThatShowItsSeriesOnce) {
    GrxVisualization& chart = sample("line-series.xml");
    const std::size_t legendTargets = chart.getLegends().front()->getLegendTargets().size();
    EXPECT_TRUE(act<TSetShowLineMarkers>(kMarkers, chart));
    GrrUviza& graph = *chart.getGraphs().front();
    ASSERT_EQ(graph.getPoints().size(), 1u);
    const GrxPoint& point = *graph.getPoints().front();
    ASSERT_TRUE(point.getX() && point.getY() && point.getStyle());
    EXPECT_EQ(attr(point.getX(), "variable") + " " + attr(point.getY(), "variable"), "var_month var_sales");
    EXPECT_NE(u8(point.getStyle()->getId()), "lineStyle");
    EXPECT_EQ(attr(point.getStyle(), "size") + " " + attr(point.getStyle(), "color2"), "6pt #333333");
    // Colours fill the markers; the line's colour is untouched.
    ASSERT_FALSE(point.getColors().empty());
    EXPECT_EQ(point.getColors().front()->getAffect(), 3);
    EXPECT_EQ(attr(byId(chart, "color_1"), "affect"), "secondary");
    // The dash series became a shape series without the dash cycle, listed by the legend.
    EXPECT_TRUE(point.getDashs().empty());
    ASSERT_EQ(point.getShapes().size(), 1u);
    const GrxShape& shape = *point.getShapes().front();
    EXPECT_EQ(attr(&shape, "variable") + " " + attr(&shape, "domain") + " " + attr(&shape, "cycle"),
              "var_region domain_region -");
    const std::vector<GrxLegendTarget*> targets = chart.getLegends().front()->getLegendTargets();
    ASSERT_EQ(targets.size(), legendTargets + 1);
    EXPECT_EQ(targets.back()->getTarget(), &shape);
    EXPECT_EQ(graph.getLines().front()->getDashs().size(), 1u);
}

TEST_F(Aesthetics, SetShowLineMarkersADashsScaleAndStatisticGoOverToTheShapeAndNoDashesNoShape) {
    GrxVisualization& chart = parse(chartWith(
        "<path id='path_1' coordinates='coordinates_1'><x variable='var_a'/><y variable='var_b'/>"
        "<dash id='dash_1' variable='var_a' cycle='chartCycle' name='series'><scale method='log' base='2'/>"
        "<summaryStatistic method='4' variable='var_b'/></dash></path>"));
    EXPECT_TRUE(act<TSetShowLineMarkers>("<setShowLineMarkers/>", chart));
    const std::vector<GrxPoint*> points = chart.getGraphs().front()->getPoints();
    ASSERT_EQ(points.size(), 1u);
    ASSERT_EQ(points.front()->getShapes().size(), 1u);
    const GrxShape& shape = *points.front()->getShapes().front();
    EXPECT_EQ(attr(&shape, "name"), "series");
    EXPECT_EQ(attr(shape.getScale(), "base") + " " + attr(shape.getSummaryStatistic(), "variable"),
              "2 var_b");

    GrxVisualization& plain = parse(chartWith("<line id='line_1' coordinates='coordinates_1'>"
                                              "<color id='c' variable='var_a' cycle='chartCycle'/></line>"));
    EXPECT_TRUE(act<TSetShowLineMarkers>("<setShowLineMarkers/>", plain));
    ASSERT_EQ(plain.getGraphs().front()->getPoints().size(), 1u);
    EXPECT_TRUE(plain.getGraphs().front()->getPoints().front()->getShapes().empty());

    // Without graphs or an instruction it fails.
    EXPECT_FALSE(act<TSetShowLineMarkers>(kMarkers, empty()));
    EXPECT_FALSE(TSetShowLineMarkers(nullptr, sample("line-series.xml"), nullptr).apply());
}

} // namespace
