// "setStyle" as templates reach it: through the instruction walk, with and without a source.
#include "StyleSupport.h"

#include "templates/InstructionWalk.h"

#include <plotaid/ChartTemplate.h>

using namespace setstyle_test;
using plotaid::detail::InstructionOutcome;
using plotaid::detail::WalkReport;

namespace {

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

} // namespace
