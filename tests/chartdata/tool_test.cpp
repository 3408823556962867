#include "TestStreams.h"
#include "support/ToolRunner.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <sstream>
#include <unistd.h>

namespace {

const std::string kExamples = PLOTAID_EXAMPLES_DIR;

std::string slurp(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream s;
    s << in.rdbuf();
    return s.str();
}

struct Scratch {
    Scratch() {
        char dir[] = "/tmp/chartdata_toolXXXXXX";
        path = ::mkdtemp(dir) ? dir : "/tmp";
    }
    ~Scratch() { std::system(("rm -rf '" + path + "'").c_str()); }
    std::string path;
};

} // namespace

TEST(DataTool, ExamplesConvertBothWays) {
    Scratch tmp;
    for (const char* name : {"simple-bar", "line-series", "area", "dual-y-axis", "population-pyramid"}) {
        const std::string stream = kExamples + "/data/" + name + ".stream";
        const std::string xml = kExamples + "/data/" + name + ".xml";
        ToolResult r = runTool("data to-xml '" + stream + "' -o '" + tmp.path + "/out.xml'");
        ASSERT_EQ(r.exitCode, 0) << r.output;
        EXPECT_TRUE(slurp(tmp.path + "/out.xml") == slurp(xml)) << name;
        // The string table may come out in another order, so the stream is compared by its XML.
        r = runTool("data to-stream '" + xml + "' -o '" + tmp.path + "/out.stream'");
        ASSERT_EQ(r.exitCode, 0) << r.output;
        r = runTool("data to-xml '" + tmp.path + "/out.stream' -o '" + tmp.path + "/again.xml'");
        ASSERT_EQ(r.exitCode, 0) << r.output;
        EXPECT_TRUE(slurp(tmp.path + "/again.xml") == slurp(xml)) << name;
    }
}

TEST(DataTool, ShowPrintsAnAlignedTable) {
    ToolResult r = runTool("data show '" + kExamples + "/data/simple-bar.stream' --rows 2");
    ASSERT_EQ(r.exitCode, 0) << r.output;
    EXPECT_NE(r.output.find("data stream: 1 data source"), std::string::npos) << r.output;
    EXPECT_NE(r.output.find("source \"graphdataset\": 120 rows, 8 variables"), std::string::npos);
    EXPECT_NE(r.output.find("row  educ  gender  id  jobcat"), std::string::npos) << r.output;
    EXPECT_NE(r.output.find("  0    19  Female   1  Clerical"), std::string::npos) << r.output;
    EXPECT_NE(r.output.find("... 118 more rows"), std::string::npos);

    Scratch tmp;
    ASSERT_EQ(
        runTool("data to-xml '" + kExamples + "/data/area.stream' --compressed -o '" + tmp.path + "/a.z'")
            .exitCode,
        0);
    r = runTool("data show '" + tmp.path + "/a.z' --rows 1");
    EXPECT_EQ(r.exitCode, 0) << r.output;
    EXPECT_NE(r.output.find("compressed XML data: 1 data source"), std::string::npos) << r.output;
    r = runTool("data show '" + kExamples + "/charts/area.xml' --rows 0");
    EXPECT_EQ(r.exitCode, 0) << r.output;
    EXPECT_NE(r.output.find("source \"rain\": 54 rows, 3 variables"), std::string::npos) << r.output;
}

TEST(DataTool, BadInputAndUsage) {
    Scratch tmp;
    const std::string stream = slurp(kExamples + "/data/line-series.stream");
    std::ofstream(tmp.path + "/cut", std::ios::binary) << stream.substr(0, stream.size() / 2);
    EXPECT_EQ(runTool("data show '" + tmp.path + "/cut'").exitCode, 1);
    EXPECT_EQ(runTool("data to-xml '" + tmp.path + "/cut'").exitCode, 1);
    std::ofstream(tmp.path + "/none.xml") << "<gs:graphSources/>";
    EXPECT_EQ(runTool("data to-stream '" + tmp.path + "/none.xml'").exitCode, 1);
    EXPECT_EQ(runTool("data to-stream '" + tmp.path + "/missing.xml'").exitCode, 1);
    EXPECT_EQ(runTool("data").exitCode, 2);
    EXPECT_EQ(runTool("data convert x").exitCode, 2);
    EXPECT_EQ(runTool("data show").exitCode, 2);
    EXPECT_EQ(runTool("data show a b").exitCode, 2);
    EXPECT_EQ(runTool("data show x --rows many").exitCode, 2);
    EXPECT_EQ(runTool("data to-stream x --compressed").exitCode, 2);
    ToolResult help = runTool("data --help");
    EXPECT_EQ(help.exitCode, 0);
    EXPECT_NE(help.output.find("to-stream XMLDATA"), std::string::npos);
}
