#include "support/ToolRunner.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

namespace {

const std::string kCharts = std::string(PLOTAID_EXAMPLES_DIR) + "/charts/";

// The tool reads grammars from its resource folder; this one holds the source tree's, both
// directly inside and in schemas/, whichever the resolver reads.
class ToolValidate : public ::testing::Test {
protected:
    static void SetUpTestSuite() {
        namespace fs = std::filesystem;
        const std::string folder = ::testing::TempDir() + "validate-resources/";
        fs::create_directories(folder + "schemas");
        for (const auto& entry :
             fs::directory_iterator(std::string(PLOTAID_SOURCE_DIR) + "/resources/schemas")) {
            fs::copy_file(entry.path(), folder + entry.path().filename().string(),
                          fs::copy_options::overwrite_existing);
            fs::copy_file(entry.path(), folder + "schemas/" + entry.path().filename().string(),
                          fs::copy_options::overwrite_existing);
        }
        ::setenv("PLOTAID_RESOURCE_DIR", folder.c_str(), 1);
    }
};

std::string variant(const std::string& name, const std::string& from, const std::string& to) {
    std::ifstream in(kCharts + "simple-bar.xml", std::ios::binary);
    std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
    const std::string::size_type at = text.find(from);
    if (at == std::string::npos)
        return std::string();
    text.replace(at, from.size(), to);
    const std::string path = ::testing::TempDir() + name;
    std::ofstream(path, std::ios::binary) << text;
    return path;
}

TEST_F(ToolValidate, SampleChartsAreValid) {
    const ToolResult r = runTool("validate '" + kCharts + "pie.xml' '" + kCharts + "boxplot.xml'");
    EXPECT_EQ(r.exitCode, 0) << r.output;
    EXPECT_NE(r.output.find(kCharts + "pie.xml: valid (chart, grxml-2.9.xsd)"), std::string::npos)
        << r.output;
    EXPECT_NE(r.output.find(kCharts + "boxplot.xml: valid (chart, grxml-2.9.xsd)"), std::string::npos);
}

TEST_F(ToolValidate, EachFaultIsALineAndTheExitCodeSaysSo) {
    const std::string undeclared = variant("undeclared.xml", "<graph ", "<chart/><graph ");
    const std::string twice =
        variant("twice.xml", "<sourceVariable id=\"var_gender\"", "<sourceVariable id=\"var_jobcat\"");
    ASSERT_FALSE(undeclared.empty() || twice.empty());
    const ToolResult r = runTool("validate '" + kCharts + "pie.xml' '" + undeclared + "' '" + twice + "'");
    EXPECT_EQ(r.exitCode, 1) << r.output;
    EXPECT_NE(r.output.find(kCharts + "pie.xml: valid"), std::string::npos) << r.output;
    EXPECT_NE(r.output.find(undeclared + ": "), std::string::npos) << r.output;
    EXPECT_NE(r.output.find("'chart'"), std::string::npos) << r.output;
    EXPECT_NE(r.output.find(twice + ": id 'var_jobcat' is used more than once"), std::string::npos)
        << r.output;
}

TEST_F(ToolValidate, KindAndGrammarMustAgree) {
    // "graph" is declared in the chart grammar too, but a graph root is an older chart
    const std::string path = ::testing::TempDir() + "graph-root.xml";
    std::ofstream(path, std::ios::binary)
        << "<?xml version=\"1.0\"?><graph xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-2.9.xsd\"/>";
    const ToolResult r = runTool("validate '" + path + "'");
    EXPECT_EQ(r.exitCode, 1) << r.output;
    EXPECT_NE(
        r.output.find(path + ": an older chart must name its grammar grxml-1.4.xsd (it names grxml-2.9.xsd)"),
        std::string::npos)
        << r.output;

    const std::string style = ::testing::TempDir() + "style-root.xml";
    std::ofstream(style, std::ios::binary)
        << "<?xml version=\"1.0\"?><style xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-2.9.xsd\" "
           "id=\"s\"/>";
    const ToolResult s = runTool("validate '" + style + "'");
    EXPECT_EQ(s.exitCode, 1) << s.output;
    EXPECT_NE(s.output.find("root element 'style'"), std::string::npos) << s.output;
}

TEST_F(ToolValidate, UsageAndMissingFiles) {
    EXPECT_EQ(runTool("validate").exitCode, 2);
    const ToolResult help = runTool("validate --help");
    EXPECT_EQ(help.exitCode, 0);
    EXPECT_NE(help.output.find("usage: plotaid validate FILE..."), std::string::npos);
    const ToolResult missing = runTool("validate /nonexistent/chart.xml");
    EXPECT_EQ(missing.exitCode, 1);
    EXPECT_NE(missing.output.find("/nonexistent/chart.xml: cannot open"), std::string::npos)
        << missing.output;
}

} // namespace

TEST(ToolValidateTree, TreeModelsAndDisplaySettingsAreKnownKinds) {
    const std::string pmml = std::string(PLOTAID_EXAMPLES_DIR) + "/pmml/credit-risk.xml";
    const std::string settings = ::testing::TempDir() + "tree-settings.xml";
    ASSERT_EQ(runTool("tree --pmml '" + pmml + "' > '" + settings + "'").exitCode, 0);
    const ToolResult good = runTool("validate '" + pmml + "' '" + settings + "'");
    EXPECT_EQ(good.exitCode, 0) << good.output;
    EXPECT_NE(good.output.find(pmml + ": valid (tree model, pmml-2-1.xsd)"), std::string::npos)
        << good.output;
    EXPECT_NE(good.output.find(settings + ": valid (tree display settings document, treeview-1.0.xsd)"),
              std::string::npos)
        << good.output;

    // A tree model is validated, not only recognised.
    std::ifstream in(pmml, std::ios::binary);
    std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
    const std::string::size_type at = text.find("<Header ");
    ASSERT_NE(at, std::string::npos);
    text.insert(at, "<Bogus/>");
    const std::string broken = ::testing::TempDir() + "broken-tree.xml";
    std::ofstream(broken, std::ios::binary) << text;
    const ToolResult bad = runTool("validate '" + broken + "'");
    EXPECT_EQ(bad.exitCode, 1) << bad.output;
    EXPECT_NE(bad.output.find("Bogus"), std::string::npos) << bad.output;
}
