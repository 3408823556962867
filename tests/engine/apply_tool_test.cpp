#include "support/EngineSupport.h"

#include "../foundation/FoundationSupport.h"
#include "support/ToolRunner.h"

namespace {

std::string examples(const std::string& relative) {
    return std::string("'") + PLOTAID_EXAMPLES_DIR + "/" + relative + "'";
}

TEST(ApplyTool, ReportsEveryInstructionAndWritesAValidChart) {
    foundation_test::TempDir dir;
    const std::string out = dir.file("out.xml");
    const ToolResult r = runTool("apply --chart " + examples("charts/simple-bar.xml") + " --template " +
                                 examples("templates/bar-tidy.sgt") + " -o '" + out + "' --report");
    EXPECT_EQ(r.exitCode, 0) << r.output;
    EXPECT_NE(r.output.find("bar-tidy.sgt #1 setStyle: applied\n"), std::string::npos) << r.output;
    EXPECT_NE(r.output.find("bar-tidy.sgt #5 setTickLabelAngle: unsupported\n"), std::string::npos)
        << r.output;
    const ToolResult valid = runTool("validate '" + out + "'");
    EXPECT_EQ(valid.exitCode, 0) << valid.output;
}

TEST(ApplyTool, TemplatesApplyInOrderAndABadOneFailsTheRun) {
    foundation_test::TempDir dir;
    {
        std::ofstream bad(dir.file("bad.sgt"));
        bad << "<?xml version=\"1.0\"?><template xmlns=\"http://plotaid.org/grxml\" "
               "data-note=\"grxml-template-3.5.xsd\"><setStyle></template>";
    }
    const ToolResult r = runTool("apply --chart " + examples("charts/simple-bar.xml") + " --template '" +
                                 dir.file("bad.sgt") + "' --template " + examples("templates/bar-tidy.sgt") +
                                 " -o '" + dir.file("out.xml") + "' --report");
    EXPECT_EQ(r.exitCode, 1) << r.output;
    EXPECT_NE(r.output.find("bad.sgt: the template could not be parsed"), std::string::npos) << r.output;
    // The second template is still applied to the chart.
    EXPECT_NE(r.output.find("bar-tidy.sgt #2 setAxisScale: unsupported"), std::string::npos) << r.output;
}

TEST(ApplyTool, RefusesABrokenChartAndAWrongCommandLine) {
    foundation_test::TempDir dir;
    {
        std::ofstream chart(dir.file("chart.xml"));
        chart << "<visualization xmlns=\"http://plotaid.org/grxml\"><nonsense/></visualization>";
    }
    const ToolResult broken = runTool("apply --chart '" + dir.file("chart.xml") + "' --template " +
                                      examples("templates/bar-tidy.sgt"));
    EXPECT_EQ(broken.exitCode, 1) << broken.output;
    EXPECT_EQ(runTool("apply --template " + examples("templates/bar-tidy.sgt")).exitCode, 2);
    EXPECT_EQ(runTool("apply --chart " + examples("charts/simple-bar.xml")).exitCode, 2);
    EXPECT_EQ(runTool("apply --chart " + examples("charts/simple-bar.xml") + " --bogus").exitCode, 2);
    EXPECT_EQ(runTool("apply --help").exitCode, 0);
}

} // namespace
