#include "support/TestSupport.h"
#include "support/ToolRunner.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>

namespace {

class CompressTool : public ::testing::Test {
protected:
    void SetUp() override {
        // NULs and every byte value, compressible enough to shrink.
        original_ = "<chart>";
        for (int r = 0; r < 40; ++r)
            for (int b = 0; b < 256; ++b)
                original_ += static_cast<char>(b);
        original_ += "</chart>";
        std::ofstream(dir_.file("in.bin"), std::ios::binary) << original_;
        const ToolResult c = runTool("compress " + q("in.bin") + " -o " + q("in.z"));
        ASSERT_EQ(c.exitCode, 0) << c.output;
        packed_ = readAll(dir_.file("in.z"));
        EXPECT_TRUE(outputHas(c, "(" + std::to_string(original_.size()) + " bytes)")) << c.output;
        EXPECT_TRUE(outputHas(c, "(" + std::to_string(packed_.size()) + " bytes)")) << c.output;
    }
    std::string q(const std::string& name) const { return "'" + dir_.file(name) + "'"; }
    TempDir dir_;
    std::string original_, packed_;
};

TEST_F(CompressTool, RoundTripsThroughFilesAndPipesWithinTheLimit) {
    ASSERT_FALSE(packed_.empty());
    EXPECT_LT(packed_.size(), original_.size());
    // Standard input and output: nothing but the text on stdout.
    std::ofstream(dir_.file("text.xml")) << "<chart title=\"sales\"/>\n";
    ASSERT_EQ(runTool("compress - -o " + q("text.z") + " < " + q("text.xml")).exitCode, 0);
    EXPECT_EQ(runTool("decompress " + q("text.z")).output, "<chart title=\"sales\"/>\n");
    const ToolResult piped = runTool("compress " + q("text.xml") + " | '" PLOTAID_TOOL_PATH "' decompress -");
    EXPECT_EQ(piped.exitCode, 0);
    EXPECT_EQ(piped.output, "<chart title=\"sales\"/>\n");

    const std::string size = std::to_string(original_.size());
    EXPECT_EQ(runTool("decompress " + q("in.z") + " --limit " + size + " --output " + q("ok")).exitCode, 0);
    EXPECT_EQ(readAll(dir_.file("ok")), original_);
}

// Bad input fails (1) with a readable line and no output file; a wrong command line fails (2) and
// points to --help.
TEST_F(CompressTool, FailuresSayWhyAndWriteNothing) {
    std::ofstream(dir_.file("truncated.z"), std::ios::binary) << packed_.substr(0, packed_.size() - 3);
    std::ofstream(dir_.file("plain.xml")) << "<chart/>";
    const std::string out = " -o " + q("out"), in = " " + q("in.bin");
    const std::string below = std::to_string(original_.size() - 1);
    const std::vector<ToolRun> runs = {
        {"decompress " + q("in.z") + " --limit=" + below + out,
         1,
         {"exceeds the limit of " + below + " bytes"}},
        {"decompress " + q("truncated.z") + out, 1, {"plotaid decompress: cannot decompress"}},
        {"decompress " + q("plain.xml") + out, 1, {"is not a compressed text"}},
        {"compress " + q("missing") + out, 1, {"cannot open '" + dir_.file("missing") + "'"}},
        {"compress" + in + " -o " + q("no/such/dir/out"), 1, {"cannot write"}},
        {"compress", 2, {"no input file"}},
        {"compress" + in + in, 2, {"more than one input file"}},
        {"compress" + in + " -o", 2, {"option '-o' needs a file name"}},
        {"compress" + in + " --limit 5", 2, {"unknown option '--limit'"}},
        {"decompress" + in + " --limit", 2, {"option '--limit' needs a number of bytes"}},
        {"decompress" + in + " --limit 12k", 2, {"'12k' is not a number of bytes"}},
        {"decompress" + in + " --limit 99999999999999999999999", 2, {"is not a number of bytes"}},
        {"decompress" + in + " --fast", 2, {"unknown option '--fast'"}},
    };
    for (const ToolRun& run : runs) {
        SCOPED_TRACE(run.args);
        const ToolResult r = runTool(run.args);
        EXPECT_EQ(r.exitCode, run.exitCode);
        EXPECT_TRUE(outputHas(r, run.texts.at(0))) << r.output;
        EXPECT_EQ(outputHas(r, "--help"), run.exitCode == 2) << r.output;
        EXPECT_FALSE(std::filesystem::exists(dir_.file("out")));
    }
}

} // namespace
