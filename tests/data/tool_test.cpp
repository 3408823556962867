#include "support/TestSupport.h"
#include "support/ToolRunner.h"

#include <gtest/gtest.h>

#include <fstream>
#include <vector>

namespace {

const std::string kData = std::string(PLOTAID_EXAMPLES_DIR) + "/data/";

// The string table may come out in another order, so a stream is compared by its XML.
TEST(DataTool, ExamplesConvertBothWays) {
    TempDir tmp;
    for (const char* name : {"simple-bar", "line-series", "area", "dual-y-axis", "population-pyramid"}) {
        const std::string xml = kData + name + ".xml";
        EXPECT_EQ(runTool("data to-stream '" + xml + "' -o '" + tmp.file("stream") + "'").exitCode, 0);
        for (const std::string& input : {kData + name + ".stream", tmp.file("stream")}) {
            EXPECT_EQ(runTool("data to-xml '" + input + "' -o '" + tmp.file("out") + "'").exitCode, 0);
            EXPECT_TRUE(readAll(tmp.file("out")) == readAll(xml)) << input;
        }
    }
}

TEST(DataTool, ShowRefusalsAndUsage) {
    TempDir tmp;
    const std::string stream = readAll(kData + "line-series.stream");
    std::ofstream(tmp.file("cut"), std::ios::binary) << stream.substr(0, stream.size() / 2);
    std::ofstream(tmp.file("none.xml")) << "<gs:graphSources/>";
    const std::string cut = " '" + tmp.file("cut") + "'";
    const std::vector<ToolRun> rows = {
        {"show '" + kData + "simple-bar.stream' --rows 2",
         0,
         {"data stream: 1 data source\n\nsource \"graphdataset\": 120 rows, 8 variables\n",
          "row  educ  gender  id  jobcat", "  0    19  Female   1  Clerical", "\n... 118 more rows"}},
        {"to-xml '" + kData + "area.stream' --compressed -o '" + tmp.file("a.z") + "'", 0, {}},
        {"show '" + tmp.file("a.z") + "' --rows 1", 0, {"compressed XML data: 1 data source"}},
        {"show '" + std::string(PLOTAID_EXAMPLES_DIR) + "/charts/area.xml' --rows 0",
         0,
         {"source \"rain\": 54 rows, 3 variables"}},
        {"show" + cut, 1, {"is neither a readable data stream nor XML data"}},
        {"to-xml" + cut, 1, {"is no readable data stream"}},
        {"to-stream '" + tmp.file("none.xml") + "'", 1, {"holds no readable data source"}},
        {"", 2, {"no action"}},
        {"convert x", 2, {"unknown action 'convert'"}},
        {"show", 2, {"no input file"}},
        {"show a b", 2, {"more than one input file"}},
        {"show x --rows many", 2, {"needs a whole number, not 'many'"}},
        {"to-stream x --compressed", 2, {"unknown option '--compressed'"}},
        {"--help", 0, {"to-stream XMLDATA"}}};
    expectToolRuns("data ", rows);
}

} // namespace
