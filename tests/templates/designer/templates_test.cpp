// Every example template is sound to both validators; each designer template, applied by
// `plotaid apply --report` to each sample chart, applies every instruction and writes a chart sound
// to both validators, and applied twice in-process restyles nothing further.
#include "DesignerSupport.h"

#include "support/GrammarSupport.h"
#include "support/ToolRunner.h"

using namespace designer_test;
using engine_test::Chart;
using engine_test::EngineTest;

namespace {

using ExampleTemplates = EngineTest;

TEST_F(ExampleTemplates, EachValidatesWithXercesAndXmllint) {
    const std::vector<std::string> names = exampleFiles("templates", ".sgt");
    for (const std::string& wanted : designerTemplates())
        EXPECT_NE(std::find(names.begin(), names.end(), wanted), names.end()) << wanted;
    for (const std::string& name : names) {
        SCOPED_TRACE(name);
        plotaid::detail::ValidatingParser parser;
        EXPECT_NE(parser.parse(engine_test::example("templates/" + name), name.c_str(),
                               ChartException("example template", "designer_test", 0)),
                  nullptr)
            << ::testing::PrintToString(parser.lastErrors());
        if (grammar_test::haveXmllint()) {
            const grammar_test::LintResult r =
                grammar_test::xmllint("grxml-template-3.5.xsd", examplePath("templates/" + name));
            EXPECT_EQ(r.exitCode, 0) << r.output;
        }
    }
}

TEST_F(ExampleTemplates, OnEverySampleChartEachInstructionAppliesTheResultValidatesAndTwiceIsOnce) {
    const std::vector<std::string> charts = exampleFiles("charts", ".xml");
    ASSERT_GE(charts.size(), 15u);
    TempDir scratch;
    for (const std::string& name : designerTemplates()) {
        const std::string templatePath = examplePath("templates/" + name);
        const std::vector<std::string> tags = instructionsOf(name);
        ASSERT_GE(std::set<std::string>(tags.begin(), tags.end()).size(), 3u) << name;
        for (const std::string& chart : charts) {
            SCOPED_TRACE(name + " on " + chart);
            const std::string out = scratch.file(name + "-" + chart);
            const ToolResult r = runTool("apply --chart '" + examplePath("charts/" + chart) +
                                         "' --template '" + templatePath + "' -o '" + out + "' --report");
            EXPECT_EQ(r.exitCode, 0) << r.output;
            for (std::size_t i = 0; i < tags.size(); ++i) {
                const std::string line =
                    templatePath + " #" + std::to_string(i + 1) + " " + tags[i] + ": applied\n";
                EXPECT_NE(r.output.find(line), std::string::npos) << line << r.output;
            }
            const std::string written = readAll(out);
            ASSERT_FALSE(written.empty()) << r.output;
            EXPECT_EQ(grammar_test::chartFaults(written), "");

            // Every instruction of these templates replaces what it sets (the one that appends
            // does so once per chart), so a second application changes no style.
            const Chart original = Chart::parse(engine_test::example("charts/" + chart));
            const Chart once = applied(chart, {name});
            const Chart twice = applied(chart, {name, name});
            ASSERT_TRUE(original.vis && once.vis && twice.vis);
            const auto first = stylePicture(once);
            EXPECT_NE(stylePicture(original), first);
            EXPECT_EQ(stylePicture(twice), first);
        }
    }
}

} // namespace
