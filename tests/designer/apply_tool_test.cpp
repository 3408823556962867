// Each designer template applied by `plotaid apply --report` to each sample chart: every
// instruction is reported applied, in order, and the chart written is sound to both validators.
#include "DesignerSupport.h"

#include "support/GrammarSupport.h"
#include "support/ToolRunner.h"

using namespace designer_test;
using engine_test::EngineTest;

namespace {

ToolResult applyTool(const std::string& chart, const std::string& templatePath, const std::string& out) {
    return runTool("apply --chart '" + examplePath("charts/" + chart) + "' --template '" + templatePath +
                   "' -o '" + out + "' --report");
}

class DesignerTemplateOnEveryChart : public EngineTest, public ::testing::WithParamInterface<std::string> {};

TEST_P(DesignerTemplateOnEveryChart, AppliesEveryInstructionAndTheResultValidates) {
    const std::string templatePath = examplePath("templates/" + GetParam());
    const std::vector<std::string> tags = instructionsOf(GetParam());
    ASSERT_FALSE(tags.empty());
    TempDir scratch;
    const std::vector<std::string> charts = exampleFiles("charts", ".xml");
    ASSERT_GE(charts.size(), 15u);
    for (const std::string& chart : charts) {
        SCOPED_TRACE(GetParam() + " on " + chart);
        const ToolResult r = applyTool(chart, templatePath, scratch.file(chart));
        EXPECT_EQ(r.exitCode, 0) << r.output;
        for (std::size_t i = 0; i < tags.size(); ++i) {
            const std::string line =
                templatePath + " #" + std::to_string(i + 1) + " " + tags[i] + ": applied\n";
            EXPECT_NE(r.output.find(line), std::string::npos) << line << r.output;
        }
        EXPECT_EQ(r.output.find(templatePath + " #" + std::to_string(tags.size() + 1) + " "),
                  std::string::npos);
        const std::string written = readAll(scratch.file(chart));
        ASSERT_FALSE(written.empty()) << r.output;
        EXPECT_EQ(grammar_test::chartFaults(written), "");
    }
}

INSTANTIATE_TEST_SUITE_P(Templates, DesignerTemplateOnEveryChart, ::testing::ValuesIn(designerTemplates()),
                         [](const ::testing::TestParamInfo<std::string>& info) {
                             return info.param.substr(0, info.param.find('.'));
                         });

// The lines looked for above are not written for an instruction that fails or is unknown.
TEST(ApplyReport, NamesAFailedOrUnsupportedInstructionAsSuch) {
    TempDir scratch;
    const std::string path = scratch.file("missing-style.sgt");
    std::ofstream(path, std::ios::binary)
        << "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
           "<template xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-template-3.5.xsd\">"
           "<setStyle id=\"noSuchStyle\"><style color=\"red\"/></setStyle><setBogus/></template>";
    const ToolResult r = applyTool("simple-bar.xml", path, scratch.file("out.xml"));
    EXPECT_NE(r.output.find(path + " #1 setStyle: failed:"), std::string::npos) << r.output;
    EXPECT_NE(r.output.find(path + " #2 setBogus: unsupported\n"), std::string::npos) << r.output;
    EXPECT_EQ(r.output.find(": applied"), std::string::npos) << r.output;
}

} // namespace
