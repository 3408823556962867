#include "support/ToolRunner.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <unistd.h>

namespace fs = std::filesystem;

namespace {

class CompressTool : public ::testing::Test {
protected:
    void SetUp() override {
        std::string pattern = (fs::temp_directory_path() / "plotaid-compress-XXXXXX").string();
        ASSERT_NE(::mkdtemp(&pattern[0]), nullptr);
        dir_ = pattern;
    }
    void TearDown() override {
        std::error_code ec;
        fs::remove_all(dir_, ec);
    }

    std::string path(const std::string& name) const { return (dir_ / name).string(); }
    std::string quoted(const std::string& name) const { return "'" + path(name) + "'"; }

    void write(const std::string& name, const std::string& bytes) const {
        std::ofstream(path(name), std::ios::binary) << bytes;
    }
    std::string read(const std::string& name) const {
        std::ifstream in(path(name), std::ios::binary);
        return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
    }

    // Binary content with NULs and every byte value, compressible enough to shrink.
    static std::string sample() {
        std::string bytes = "<chart>";
        for (int r = 0; r < 40; ++r)
            for (int b = 0; b < 256; ++b)
                bytes += static_cast<char>(b);
        return bytes + "</chart>";
    }

private:
    fs::path dir_;
};

bool mentions(const ToolResult& r, const std::string& text) {
    return r.output.find(text) != std::string::npos;
}

} // namespace

TEST_F(CompressTool, Help) {
    for (const char* command : {"compress", "decompress"}) {
        const ToolResult r = runTool(std::string(command) + " --help");
        EXPECT_EQ(r.exitCode, 0) << command;
        EXPECT_TRUE(mentions(r, std::string("usage: plotaid ") + command + " IN [-o OUT]")) << r.output;
    }
    EXPECT_TRUE(mentions(runTool("decompress -h"), "--limit BYTES"));
    const ToolResult list = runTool("--help");
    EXPECT_TRUE(mentions(list, "compress")) << list.output;
    EXPECT_TRUE(mentions(list, "decompress")) << list.output;
}

TEST_F(CompressTool, RoundTripThroughFiles) {
    const std::string original = sample();
    write("in.bin", original);
    const ToolResult c = runTool("compress " + quoted("in.bin") + " -o " + quoted("in.z"));
    ASSERT_EQ(c.exitCode, 0) << c.output;
    const std::string packed = read("in.z");
    ASSERT_FALSE(packed.empty());
    EXPECT_EQ(static_cast<unsigned char>(packed[0]), 0x78);
    EXPECT_LT(packed.size(), original.size());
    EXPECT_TRUE(mentions(c, "(" + std::to_string(original.size()) + " bytes)")) << c.output;
    EXPECT_TRUE(mentions(c, "(" + std::to_string(packed.size()) + " bytes)")) << c.output;

    const ToolResult d = runTool("decompress --output " + quoted("in.z") + "x " + quoted("in.z"));
    ASSERT_EQ(d.exitCode, 0) << d.output;
    EXPECT_EQ(read("in.zx"), original);
}

TEST_F(CompressTool, StandardInputAndOutput) {
    write("text.xml", "<chart title=\"sales\"/>\n");
    ASSERT_EQ(runTool("compress - -o " + quoted("text.z") + " < " + quoted("text.xml")).exitCode, 0);
    const ToolResult d = runTool("decompress " + quoted("text.z"));
    EXPECT_EQ(d.exitCode, 0);
    EXPECT_EQ(d.output, "<chart title=\"sales\"/>\n"); // nothing but the text on stdout
    const ToolResult piped =
        runTool("compress " + quoted("text.xml") + " | '" PLOTAID_TOOL_PATH "' decompress -");
    EXPECT_EQ(piped.exitCode, 0);
    EXPECT_EQ(piped.output, "<chart title=\"sales\"/>\n");
}

TEST_F(CompressTool, LimitBoundsTheOutput) {
    const std::string original = sample();
    write("in.bin", original);
    ASSERT_EQ(runTool("compress " + quoted("in.bin") + " -o " + quoted("in.z")).exitCode, 0);
    const std::string size = std::to_string(original.size());

    ToolResult r = runTool("decompress " + quoted("in.z") + " --limit " + size + " -o " + quoted("ok"));
    EXPECT_EQ(r.exitCode, 0) << r.output;
    EXPECT_EQ(read("ok"), original);

    const std::string below = std::to_string(original.size() - 1);
    r = runTool("decompress " + quoted("in.z") + " --limit=" + below + " -o " + quoted("refused"));
    EXPECT_EQ(r.exitCode, 1);
    EXPECT_TRUE(mentions(r, "exceeds the limit of " + below + " bytes")) << r.output;
    EXPECT_FALSE(fs::exists(path("refused")));
}

TEST_F(CompressTool, BadInputFailsReadably) {
    write("in.bin", sample());
    ASSERT_EQ(runTool("compress " + quoted("in.bin") + " -o " + quoted("in.z")).exitCode, 0);
    std::string packed = read("in.z");
    write("truncated.z", packed.substr(0, packed.size() - 3));
    packed.back() = static_cast<char>(packed.back() ^ 0x20);
    write("checksum.z", packed);
    write("plain.xml", "<chart/>");

    for (const char* name : {"truncated.z", "checksum.z"}) {
        const ToolResult r = runTool("decompress " + quoted(name) + " -o " + quoted("out"));
        EXPECT_EQ(r.exitCode, 1) << name;
        EXPECT_TRUE(mentions(r, "plotaid decompress: cannot decompress")) << r.output;
        EXPECT_FALSE(fs::exists(path("out"))) << name;
    }
    ToolResult r = runTool("decompress " + quoted("plain.xml"));
    EXPECT_EQ(r.exitCode, 1);
    EXPECT_TRUE(mentions(r, "is not a compressed text")) << r.output;

    r = runTool("compress " + quoted("missing") + " -o " + quoted("out"));
    EXPECT_EQ(r.exitCode, 1);
    EXPECT_TRUE(mentions(r, "cannot open '" + path("missing") + "'")) << r.output;

    r = runTool("compress " + quoted("in.bin") + " -o " + quoted("no/such/dir/out"));
    EXPECT_EQ(r.exitCode, 1);
    EXPECT_TRUE(mentions(r, "cannot write")) << r.output;
}

TEST_F(CompressTool, WrongCommandLines) {
    write("a", "x");
    const struct {
        std::string args;
        std::string message;
    } cases[] = {
        {"compress", "no input file"},
        {"decompress", "no input file"},
        {"compress " + quoted("a") + " " + quoted("a"), "more than one input file"},
        {"compress " + quoted("a") + " -o", "option '-o' needs a file name"},
        {"compress " + quoted("a") + " --limit 5", "unknown option '--limit'"},
        {"decompress " + quoted("a") + " --limit", "option '--limit' needs a number of bytes"},
        {"decompress " + quoted("a") + " --limit 12k", "'12k' is not a number of bytes"},
        {"decompress " + quoted("a") + " --limit -1", "'-1' is not a number of bytes"},
        {"decompress " + quoted("a") + " --limit 99999999999999999999999", "is not a number of bytes"},
        {"decompress " + quoted("a") + " --fast", "unknown option '--fast'"},
    };
    for (const auto& c : cases) {
        const ToolResult r = runTool(c.args);
        EXPECT_EQ(r.exitCode, 2) << c.args;
        EXPECT_TRUE(mentions(r, c.message)) << c.args << "\n" << r.output;
        EXPECT_TRUE(mentions(r, "--help")) << r.output;
    }
}
