// "setStyle" as templates reach it: through the instruction walk, a ChartTemplate and the tool,
// applied twice, and every restyled sample chart checked by both validators.
#include "StyleSupport.h"

#include "support/GrammarSupport.h"
#include "support/TestSupport.h"
#include "support/ToolRunner.h"

#include "templates/InstructionWalk.h"

#include <plotaid/ChartTemplate.h>

#include <filesystem>
#include <fstream>

using namespace setstyle_test;
using plotaid::detail::InstructionOutcome;
using plotaid::detail::WalkReport;

namespace {

// A house look that reaches every kind of part "setStyle" knows.
const char* const kHouseLook =
    "<setStyle type=\"bar\"><style value=\"fill:#6A8CAF;stroke:#223344\" stroke-width=\"0.5pt\"/></setStyle>"
    "<setStyle type=\"bar\" subtype=\"clustered\"><style color=\"#336699\"/></setStyle>"
    "<setStyle type=\"pie\"><style size=\"80%\" width=\"90%\" color=\"#6A8CAF\"/></setStyle>"
    "<setStyle type=\"line\"><style stroke-width=\"2pt\" value=\"stroke:#AA3333\"/></setStyle>"
    "<setStyle type=\"area\"><style color=\"#99BBDD\"/></setStyle>"
    "<setStyle type=\"scatter\"><style symbol=\"diamond\" size=\"6pt\"/></setStyle>"
    "<setStyle type=\"schema\" subtype=\"medianStyle\"><style stroke-width=\"2pt\"/></setStyle>"
    "<setStyle type=\"errorbar\"><style stroke-width=\"1.5pt\"/></setStyle>"
    "<setStyle type=\"histogram\"><style color=\"#DDDDDD\"/></setStyle>"
    "<setStyle type=\"text\" subtype=\"title1\"><style font-size=\"14pt\" font-weight=\"bold\"/></setStyle>"
    "<setStyle type=\"text\" subtype=\"legend1\"><style font-size=\"8pt\"/></setStyle>"
    "<setStyle type=\"textFrame\" subtype=\"legend1\"><style color=\"white\"/></setStyle>"
    "<setStyle type=\"labelFrame\" subtype=\"footnote1\"><style color=\"transparent\"/></setStyle>"
    "<setStyle type=\"text\" subtype=\"xaxis_title\"><style font-style=\"italic\"/></setStyle>"
    "<setStyle type=\"text\" subtype=\"yaxis_labels\"><style font-size=\"7pt\"/></setStyle>"
    "<setStyle type=\"textFrame\" subtype=\"xaxis_labels\"><style color=\"transparent\"/></setStyle>"
    "<setStyle type=\"text\" subtype=\"panel_labels\"><style font-size=\"7pt\"/></setStyle>"
    "<setStyle type=\"text\" subtype=\"panel_title\"><style font-weight=\"bold\"/></setStyle>"
    "<setStyle id=\"visualizationStyle\"><style font-family=\"Serif\"/></setStyle>";

std::string sampleName(const std::string& path) {
    return std::filesystem::path(path).filename().string();
}

using ThroughTheWalk = SetStyleTest;

TEST_F(ThroughTheWalk, AChartTemplateAppliesEverySetStyleInOrder) {
    Chart chart = sample("simple-bar.xml");
    WalkReport report;
    ChartTemplate t(*chart.vis, nullptr);
    ASSERT_TRUE(t.setTemplate(
        templateOf("<setStyle type=\"bar\"><style color=\"red\"/></setStyle>"
                   "<setStyle type=\"bar\"><style color=\"blue\"/></setStyle>"
                   "<setStyle type=\"text\" subtype=\"legend1\"><style font-size=\"11pt\"/></setStyle>"
                   "<setStyle id=\"noSuchStyle\"><style color=\"red\"/></setStyle>")));
    t.applyTemplate();
    // The later instruction sees and overrides the earlier one.
    EXPECT_EQ(attr(styleById(chart, "barStyle"), "color"), "blue");
    EXPECT_EQ(attr(styleById(chart, "legend_1tickTextStyle"), "font-size").substr(0, 4), "11pt");
    ASSERT_EQ(report.outcomes().size(), 4u);
    for (unsigned i = 0; i < 3; ++i)
        EXPECT_EQ(report.outcomes()[i].kind, InstructionOutcome::Applied) << i;
    EXPECT_EQ(report.outcomes()[3].kind, InstructionOutcome::Failed);
}

TEST_F(ThroughTheWalk, TheChartsOwnDefinitionIsNotOverwritten) {
    // The source sets the bar colour; the template may still add what the source leaves open.
    Chart target = sample("simple-bar.xml");
    Chart source = sample("simple-bar.xml");
    const Template t = Template::parse(
        templateOf("<setStyle type=\"bar\"><style color=\"red\" font-family=\"Serif\"/></setStyle>"));
    plotaid::detail::applyTemplateCommands(source.vis.get(), *target.vis, t.root());
    EXPECT_EQ(attr(styleById(target, "barStyle"), "color"), "#3E58AC");
    EXPECT_EQ(attr(styleById(target, "barStyle"), "font-family"), "Serif");
}

TEST_F(ThroughTheWalk, ApplyingTwiceGivesTheChartOfApplyingOnce) {
    for (const std::string& path : grammar_test::sampleCharts()) {
        const std::string text = engine_test::readText(path);
        Chart once = load(text);
        Chart twice = load(text);
        ASSERT_TRUE(once.vis && twice.vis) << path;
        const std::string before = once.vis->AsUTF8();
        ChartTemplate first(*once.vis, nullptr);
        ASSERT_TRUE(first.setTemplate(templateOf(kHouseLook)));
        first.applyTemplate();
        ChartTemplate second(*twice.vis, nullptr);
        ASSERT_TRUE(second.setTemplate(templateOf(kHouseLook)));
        second.applyTemplate();
        second.applyTemplate();
        EXPECT_NE(once.vis->AsUTF8(), before) << sampleName(path);
        EXPECT_EQ(twice.vis->AsUTF8(), once.vis->AsUTF8()) << sampleName(path);
    }
}

TEST_F(ThroughTheWalk, EveryRestyledSampleChartStillValidates) {
    const bool lint = grammar_test::haveXmllint();
    for (const std::string& path : grammar_test::sampleCharts()) {
        Chart chart = load(engine_test::readText(path));
        ASSERT_TRUE(chart.vis) << path;
        const Template t = Template::parse(templateOf(kHouseLook));
        ASSERT_NE(t.root(), nullptr);
        plotaid::detail::applyTemplateCommands(nullptr, *chart.vis, t.root());
        const std::string written = chart.vis->AsUTF8();
        plotaid::detail::ValidatingParser parser;
        EXPECT_NE(parser.parse(written, "restyled", ChartException("restyled chart", "setstyle_test", 0)),
                  nullptr)
            << sampleName(path) << ": " << (parser.lastErrors().empty() ? "" : parser.lastErrors().front());
        if (!lint)
            continue;
        const grammar_test::LintResult r = grammar_test::xmllint(
            "grxml-2.9.xsd", grammar_test::writeScratch("styled-" + sampleName(path), written));
        EXPECT_EQ(r.exitCode, 0) << sampleName(path) << "\n" << r.output;
    }
}

TEST(SetStyleTool, TheToolReportsSetStyleApplied) {
    TempDir dir;
    {
        std::ofstream out(dir.file("look.sgt"));
        out << templateOf("<setStyle type=\"bar\"><style color=\"#123456\"/></setStyle>"
                          "<setStyle type=\"text\" subtype=\"title1\"><style font-size=\"15pt\"/></setStyle>"
                          "<setStyle id=\"missing\"><style color=\"red\"/></setStyle>");
    }
    const std::string out = dir.file("out.xml");
    const ToolResult r = runTool(std::string("apply --chart '") + PLOTAID_EXAMPLES_DIR +
                                 "/charts/simple-bar.xml' --template '" + dir.file("look.sgt") + "' -o '" +
                                 out + "' --report");
    EXPECT_NE(r.output.find("look.sgt #1 setStyle: applied\n"), std::string::npos) << r.output;
    EXPECT_NE(r.output.find("look.sgt #2 setStyle: applied\n"), std::string::npos) << r.output;
    EXPECT_NE(r.output.find("look.sgt #3 setStyle: failed"), std::string::npos) << r.output;
    const std::string written = readAll(out);
    EXPECT_NE(written.find("color=\"#123456\""), std::string::npos);
    const ToolResult valid = runTool("validate '" + out + "'");
    EXPECT_EQ(valid.exitCode, 0) << valid.output;
}

} // namespace
