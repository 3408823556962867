#include "support/GrammarSupport.h"
#include "support/ToolRunner.h"

#include <gtest/gtest.h>

#include <string>

using namespace grammar_test;

namespace {

const std::string kCharts = std::string(PLOTAID_EXAMPLES_DIR) + "/charts/";
const std::string kPmml = std::string(PLOTAID_EXAMPLES_DIR) + "/pmml/credit-risk.xml";

bool has(const ToolResult& r, const std::string& text) {
    return r.output.find(text) != std::string::npos;
}

// A file with one replacement, written to a scratch file.
std::string variant(const std::string& name, const std::string& from, const std::string& to,
                    const std::string& of = kCharts + "simple-bar.xml") {
    const std::string text = replaceOnce(readText(of), from, to);
    EXPECT_FALSE(text.empty()) << from;
    return writeScratch(name, text);
}

TEST(Tool, VersionHelpAndUnknownCommand) {
    EXPECT_EQ(runTool("--version").exitCode, 0);
    EXPECT_TRUE(has(runTool("--version"), "plotaid "));
    EXPECT_EQ(runTool("--help").exitCode, 0);
    EXPECT_TRUE(has(runTool("--help"), "usage: plotaid"));
    EXPECT_EQ(runTool("").exitCode, 2);
    EXPECT_EQ(runTool("frobnicate").exitCode, 2);
    EXPECT_TRUE(has(runTool("frobnicate"), "unknown command 'frobnicate'"));
}

TEST(ToolValidate, EachFileGetsALineAndAnyFaultFailsTheRun) {
    useSourceGrammars();
    const std::string root = "<?xml version=\"1.0\"?><ROOT xmlns=\"http://plotaid.org/grxml\" "
                             "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
                             "xsi:schemaLocation=\"http://plotaid.org/grxml "
                             "http://plotaid.org/grxml/grxml-2.9.xsd\"/>";
    const std::string settings = writeScratch("tree-settings.xml", "");
    ASSERT_EQ(runTool("tree --pmml '" + kPmml + "' > '" + settings + "'").exitCode, 0);
    const struct {
        std::string file;
        std::string line;
    } cases[] = {
        {kCharts + "pie.xml", ": valid (chart, grxml-2.9.xsd)"},
        {kPmml, ": valid (tree model, pmml-2-1.xsd)"},
        {settings, ": valid (tree display settings document, treeview-1.0.xsd)"},
        {variant("undeclared.xml", "<graph ", "<chart/><graph "), ": "},
        {variant("twice.xml", "<sourceVariable id=\"var_gender\"", "<sourceVariable id=\"var_jobcat\""),
         ": id 'var_jobcat' is used more than once"},
        {variant("bad-tree.xml", "<Header ", "<Bogus/><Header ", kPmml), ": "},
        // "graph" is declared by the chart grammar too, but a graph root is an older chart.
        {writeScratch("graph-root.xml", replaceOnce(root, "ROOT", "graph")),
         ": an older chart must name its grammar grxml-1.4.xsd (it names grxml-2.9.xsd)"},
        {writeScratch("style-root.xml", replaceOnce(root, "ROOT", "style id=\"s\"")), ": "},
        {"/nonexistent/chart.xml", ": cannot open"},
    };
    std::string all = "validate";
    for (const auto& c : cases) {
        SCOPED_TRACE(c.file);
        const ToolResult r = runTool("validate '" + c.file + "'");
        const bool valid = c.line.rfind(": valid", 0) == 0;
        EXPECT_EQ(r.exitCode, valid ? 0 : 1) << r.output;
        EXPECT_TRUE(has(r, c.file + c.line)) << r.output;
        all += " '" + c.file + "'";
    }
    const ToolResult r = runTool(all);
    EXPECT_EQ(r.exitCode, 1);
    EXPECT_TRUE(has(r, "'chart'") && has(r, "Bogus") && has(r, "root element 'style'")) << r.output;
    EXPECT_TRUE(has(r, kCharts + "pie.xml: valid") && has(r, settings + ": valid")) << r.output;
    EXPECT_EQ(runTool("validate '" + kCharts + "pie.xml' '" + kCharts + "boxplot.xml'").exitCode, 0);

    EXPECT_EQ(runTool("validate").exitCode, 2);
    const ToolResult help = runTool("validate --help");
    EXPECT_EQ(help.exitCode, 0);
    EXPECT_TRUE(has(help, "usage: plotaid validate FILE...")) << help.output;
}

} // namespace
