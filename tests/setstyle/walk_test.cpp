// "setStyle" as templates reach it: through the instruction walk and a ChartTemplate, applied
// twice, and every restyled sample chart checked by both validators.
#include "StyleSupport.h"

#include "support/GrammarSupport.h"

#include "templates/InstructionWalk.h"

#include <plotaid/ChartTemplate.h>

#include <filesystem>

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

TEST_F(ThroughTheWalk, EverySampleChartRestyledOnceValidatesAndTwiceGivesTheSame) {
    for (const std::string& path : grammar_test::sampleCharts()) {
        SCOPED_TRACE(sampleName(path));
        const std::string text = engine_test::readText(path);
        Chart once = load(text);
        Chart twice = load(text);
        ASSERT_TRUE(once.vis && twice.vis);
        const std::string before = once.vis->AsUTF8();
        for (Chart* chart : {&once, &twice, &twice}) {
            ChartTemplate t(*chart->vis, nullptr);
            ASSERT_TRUE(t.setTemplate(templateOf(kHouseLook)));
            t.applyTemplate();
        }
        EXPECT_NE(once.vis->AsUTF8(), before);
        EXPECT_EQ(twice.vis->AsUTF8(), once.vis->AsUTF8());
        EXPECT_EQ(grammar_test::chartFaults(*once.vis), "");
    }
}

} // namespace
