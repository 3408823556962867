#include "support/TestSupport.h"
#include "support/ToolRunner.h"

#include <gtest/gtest.h>

#include <fstream>

namespace {

const std::string kData = std::string(PLOTAID_EXAMPLES_DIR) + "/data/";

std::string run(const std::string& args, int exitCode = 0) {
    const ToolResult r = runTool(args);
    EXPECT_EQ(r.exitCode, exitCode) << args << "\n" << r.output;
    return r.output;
}

} // namespace

TEST(DataTool, ExamplesConvertBothWays) {
    TempDir tmp;
    for (const char* name : {"simple-bar", "line-series", "area", "dual-y-axis", "population-pyramid"}) {
        const std::string xml = kData + name + ".xml";
        run("data to-xml '" + kData + name + ".stream' -o '" + tmp.file("out.xml") + "'");
        EXPECT_TRUE(readAll(tmp.file("out.xml")) == readAll(xml)) << name;
        // The string table may come out in another order, so the stream is compared by its XML.
        run("data to-stream '" + xml + "' -o '" + tmp.file("out.stream") + "'");
        run("data to-xml '" + tmp.file("out.stream") + "' -o '" + tmp.file("again.xml") + "'");
        EXPECT_TRUE(readAll(tmp.file("again.xml")) == readAll(xml)) << name;
    }
}

TEST(DataTool, ShowPrintsAnAlignedTable) {
    std::string out = run("data show '" + kData + "simple-bar.stream' --rows 2");
    for (const char* line :
         {"data stream: 1 data source", "source \"graphdataset\": 120 rows, 8 variables",
          "row  educ  gender  id  jobcat", "  0    19  Female   1  Clerical", "... 118 more rows"})
        EXPECT_NE(out.find(line), std::string::npos) << line << " not in\n" << out;

    TempDir tmp;
    run("data to-xml '" + kData + "area.stream' --compressed -o '" + tmp.file("a.z") + "'");
    out = run("data show '" + tmp.file("a.z") + "' --rows 1");
    EXPECT_NE(out.find("compressed XML data: 1 data source"), std::string::npos) << out;
    out = run("data show '" + std::string(PLOTAID_EXAMPLES_DIR) + "/charts/area.xml' --rows 0");
    EXPECT_NE(out.find("source \"rain\": 54 rows, 3 variables"), std::string::npos) << out;
}

TEST(DataTool, BadInputAndUsage) {
    TempDir tmp;
    const std::string stream = readAll(kData + "line-series.stream");
    ASSERT_FALSE(stream.empty());
    std::ofstream(tmp.file("cut"), std::ios::binary) << stream.substr(0, stream.size() / 2);
    std::ofstream(tmp.file("none.xml")) << "<gs:graphSources/>";
    for (const std::string& args :
         {"show '" + tmp.file("cut") + "'", "to-xml '" + tmp.file("cut") + "'",
          "to-stream '" + tmp.file("none.xml") + "'", "to-stream '" + tmp.file("missing.xml") + "'"})
        run("data " + args, 1);
    for (const char* args :
         {"", "convert x", "show", "show a b", "show x --rows many", "to-stream x --compressed"})
        run(std::string("data ") + args, 2);
    EXPECT_NE(run("data --help").find("to-stream XMLDATA"), std::string::npos);
}
