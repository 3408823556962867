// plotaid tree: options on the command line reach the display settings; the PMML is written as asked.
#include "TreeSupport.h"
#include "support/ToolRunner.h"

#include <fstream>

namespace {

std::string pmmlPath(const char* name) {
    return std::string("'") + PLOTAID_EXAMPLES_DIR + "/pmml/" + name + "'";
}

TEST(TreeTool, PrintsSettingsWithTheOptions) {
    const ToolResult r = runTool("tree --pmml " + pmmlPath("credit-risk.xml") +
                                 " --orientation left-to-right --zoom 250 --contents both --font Serif"
                                 " --colors swatch '#FF010101,#FF020202' --language de-CH");
    ASSERT_EQ(r.exitCode, 0) << r.output;
    Reader reader;
    auto* document = reader.read(r.output);
    ASSERT_NE(document, nullptr) << r.output;
    auto* root = document->getDocumentElement();
    EXPECT_EQ(attr(root, "olang"), "de-CH");
    EXPECT_EQ(attr(elements(root, "treeOrientation").at(0), "orientation"), "left-to-right");
    EXPECT_EQ(attr(elements(root, "treeZoom").at(0), "factor"), "250");
    EXPECT_EQ(attr(elements(root, "nodeContents").at(0), "contents"), "both");
    EXPECT_EQ(attr(elements(root, "fontData").at(0), "family"), "Serif");
    const auto colours = elements(elements(root, "swatchColors").at(0), "colorItem");
    ASSERT_EQ(colours.size(), 2u);
    EXPECT_EQ(attr(colours[1], "value"), "#FF020202");
}

TEST(TreeTool, WritesPlainAndCompressedModelAndReadsTheCompressedBack) {
    TempDir dir;
    const ToolResult r = runTool("tree --pmml " + pmmlPath("churn-surrogates.xml") + " --pmml-out '" +
                                 dir.file("out.xml") + "' --compressed-pmml-out '" + dir.file("out.z") + "'");
    ASSERT_EQ(r.exitCode, 0) << r.output;
    Reader reader;
    auto* model = reader.read(readAll(dir.file("out.xml")));
    ASSERT_NE(model, nullptr);
    EXPECT_EQ(elements(model, "CompoundPredicate").size(), 4u);
    const ToolResult again =
        runTool("tree --pmml '" + dir.file("out.z") + "' --pmml-out '" + dir.file("again.xml") + "'");
    ASSERT_EQ(again.exitCode, 0) << again.output;
    EXPECT_EQ(readAll(dir.file("again.xml")), readAll(dir.file("out.xml")));
}

TEST(TreeTool, RefusesBadInput) {
    TempDir dir;
    std::ofstream(dir.file("bad.xml"))
        << "<PMML version=\"2.1\" xmlns=\"http://www.dmg.org/PMML-2_1\"><x/></PMML>";
    std::ofstream(dir.file("settings.xml")) << "<displaySettings/>";
    const std::string credit = "tree --pmml " + pmmlPath("credit-risk.xml");
    const std::pair<std::string, int> cases[] = {
        {"tree", 2},
        {credit + " --zoom 501", 2},
        {credit + " --orientation sideways", 2},
        {credit + " --bogus x", 2},
        {credit + " --pmml-out -", 2},
        {credit + " --settings '" + dir.file("settings.xml") + "'", 1},
        {"tree --pmml '" + dir.file("missing.xml") + "'", 1},
    };
    for (const auto& [args, exitCode] : cases)
        EXPECT_EQ(runTool(args).exitCode, exitCode) << args;
    const ToolResult model =
        runTool("tree --pmml '" + dir.file("bad.xml") + "' --pmml-out '" + dir.file("o.xml") + "'");
    EXPECT_EQ(model.exitCode, 1) << model.output;
    EXPECT_NE(model.output.find("not a valid PMML 2.1 tree"), std::string::npos) << model.output;
}

} // namespace
