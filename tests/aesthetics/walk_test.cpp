// The nine aesthetic instructions through the real walk and the tool: each tag reaches its action,
// every sample chart stays valid, and a template of replacing instructions applied twice reads
// the same as applied once.
#include "AestheticsSupport.h"

#include "support/TestSupport.h"
#include "support/ToolRunner.h"

#include <fstream>

using namespace aesthetics_test;
using plotaid::detail::InstructionOutcome;

namespace {

const std::string kReplacing =
    "<setColor affect='both'><cycle><style color='#101010'/><style color='#202020'/></cycle></setColor>\n"
    "<setDash><cycle><style stroke-dasharray='4 2'/></cycle></setDash>\n"
    "<setPattern><cycle><style pattern='2'/></cycle></setPattern>\n"
    "<setShape><cycle><style symbol='diamond'/></cycle></setShape>\n"
    "<setSize><parameter name='small' value='3pt'/><parameter name='large' value='7pt'/></setSize>\n"
    "<setGenericAttributes elementName='labelFrame' count='1' styleName='style' font-style='normal'/>\n";
const std::string kConverting =
    "<addDash aestheticNumber='2'><cycle><style stroke-dasharray='1 1'/></cycle></addDash>\n"
    "<addImage aestheticNumber='1'><cycle><style color='#303030'/></cycle></addImage>\n"
    "<setShowLineMarkers><style size='5pt'/></setShowLineMarkers>\n";
const std::vector<std::string> kTags = {"setColor", "setDash",  "setPattern",
                                        "setShape", "setSize",  "setGenericAttributes",
                                        "addDash",  "addImage", "setShowLineMarkers"};

std::string outcomesText(const std::vector<InstructionOutcome>& outcomes) {
    std::string out;
    for (const InstructionOutcome& o : outcomes)
        out += "#" + std::to_string(o.position) + " " + o.tag + " " + std::to_string(o.kind) + " " +
               o.reason + "\n";
    return out;
}

using AestheticWalk = AestheticsTest;

TEST_F(AestheticWalk, EveryTagReachesItsActionThroughTheTemplate) {
    // A line with two colours, a dash and a size, a point with a shape and a pattern, an area whose
    // third colour neither "addDash" (the second) nor "addImage" (the first) converts.
    GrxVisualization& chart =
        parse(chartWith("<line id='line_1' coordinates='coordinates_1'><color id='colour_1' variable='var_a' "
                        "cycle='chartCycle'/>"
                        "<color id='colour_2' variable='var_a' cycle='chartCycle'/>"
                        "<dash id='dash_1' variable='var_a' cycle='chartCycle'/><size id='size_1' "
                        "variable='var_b' low='1pt'/></line>"
                        "<point id='point_a' coordinates='coordinates_1'><shape id='shape_a' "
                        "variable='var_a' cycle='chartCycle'/>"
                        "<pattern id='pattern_a' variable='var_a' cycle='chartCycle'/></point>"
                        "<area id='area_1' coordinates='coordinates_1'><color id='area_c1' variable='var_a'/>"
                        "<color id='area_c2' variable='var_a'/><color id='colour_3' variable='var_a' "
                        "cycle='chartCycle'/></area>",
                        "<labelFrame id='frame_1'/>"));
    const std::vector<InstructionOutcome> outcomes = applyTemplate(chart, kReplacing + kConverting);
    ASSERT_EQ(outcomes.size(), kTags.size()) << outcomesText(outcomes);
    for (std::size_t i = 0; i < kTags.size(); ++i) {
        EXPECT_EQ(outcomes[i].tag, kTags[i]);
        EXPECT_EQ(outcomes[i].kind, InstructionOutcome::Applied) << outcomesText(outcomes);
    }
    // One visible effect per instruction.
    EXPECT_EQ(stylesOf(chart, "colour_3"), "[({color=#101010;}{color=#202020;})]");
    EXPECT_EQ(stylesOf(chart, "dash_1"), "[({stroke-dasharray=4 2;})]");
    EXPECT_EQ(stylesOf(chart, "pattern_a"), "[({pattern=2;})]");
    EXPECT_EQ(stylesOf(chart, "shape_a"), "[({symbol=diamond;})]");
    EXPECT_EQ(byId<GrxSize>(chart, "size_1")->getLengthMappings().size(), 2u);
    EXPECT_NE(byId<GrxLabelFrame>(chart, "frame_1")->getStyle(), nullptr);
    ASSERT_NE(byId<GrxDash>(chart, "colour_2"), nullptr);
    EXPECT_EQ(stylesOf(chart, "colour_2"), "[({stroke-dasharray=1 1;})]");
    ASSERT_NE(byId<GrxImage>(chart, "colour_1"), nullptr);
    EXPECT_EQ(stylesOf(chart, "colour_1"), "[({color=#303030;})]");
    EXPECT_EQ(chart.getGraphs().front()->getPoints().size(), 1u); // not a lone line
    EXPECT_EQ(grammar_test::chartFaults(chart), "");
}

TEST_F(AestheticWalk, ASourceGivenToTheTemplateGuardsTheChartsOwnCycles) {
    const std::string text = engine_test::example("charts/line-series.xml");
    GrxVisualization& chart = parse(text);
    GrxVisualization& source = parse(text);
    const std::vector<InstructionOutcome> outcomes =
        applyTemplate(chart,
                      "<setColor><cycle><style color='#101010'/></cycle></setColor>"
                      "<setDash><cycle><style stroke-dasharray='4 2'/></cycle></setDash>"
                      "<addDash><cycle><style stroke-dasharray='4 2'/></cycle></addDash>",
                      &source);
    ASSERT_EQ(outcomes.size(), 3u);
    EXPECT_EQ(cycleIdOf(chart, "color_1"), "styleCycleColor");
    EXPECT_EQ(cycleIdOf(chart, "dash_1"), "styleCycleDash");
    EXPECT_EQ(chart.AsUTF8(), source.AsUTF8());
}

TEST_F(AestheticWalk, EverySampleChartStaysValidAndReplacingTwiceReadsAsOnce) {
    for (const std::string& path : grammar_test::sampleCharts()) {
        SCOPED_TRACE(path);
        const std::string text = grammar_test::readText(path);
        GrxVisualization& all = parse(text);
        GrxVisualization& once = parse(text);
        GrxVisualization& twice = parse(text);
        const std::vector<InstructionOutcome> outcomes = applyTemplate(all, kReplacing + kConverting);
        for (const InstructionOutcome& o : outcomes)
            EXPECT_EQ(o.kind, InstructionOutcome::Applied) << outcomesText(outcomes);
        EXPECT_EQ(grammar_test::chartFaults(all), "");

        applyTemplate(once, kReplacing);
        applyTemplate(twice, kReplacing);
        applyTemplate(twice, kReplacing);
        EXPECT_EQ(canonical(twice), canonical(once));
        // What the second application replaced is left behind, referred to by nothing.
        EXPECT_EQ(twice.getStyleCycles().size() - once.getStyleCycles().size(),
                  orphanedStyleCycles(twice) - orphanedStyleCycles(once));
    }
}

TEST(AestheticTool, ReportsEachTagAppliedAndWritesAValidChart) {
    TempDir dir;
    std::ofstream(dir.file("looks.sgt")) << templateOf(kReplacing + kConverting);
    const std::string chartOut = dir.file("out.xml");
    const ToolResult r = runTool("apply --chart '" + std::string(PLOTAID_EXAMPLES_DIR) +
                                 "/charts/line-series.xml' --template '" + dir.file("looks.sgt") + "' -o '" +
                                 chartOut + "' --report");
    EXPECT_EQ(r.exitCode, 0) << r.output;
    for (std::size_t i = 0; i < kTags.size(); ++i)
        EXPECT_NE(r.output.find("looks.sgt #" + std::to_string(i + 1) + " " + kTags[i] + ": applied\n"),
                  std::string::npos)
            << r.output;
    EXPECT_EQ(r.output.find("failed"), std::string::npos) << r.output;
    const ToolResult valid = runTool("validate '" + chartOut + "'");
    EXPECT_EQ(valid.exitCode, 0) << valid.output;
    // The markers the template asked for are in the written chart.
    EXPECT_NE(readAll(chartOut).find("id=\"point1\""), std::string::npos);
}

} // namespace
