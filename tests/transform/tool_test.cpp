#include "TransformerSupport.h"
#include "support/ToolRunner.h"

#include <fstream>
#include <sstream>

using namespace transformer_test;

namespace {

// The steps run in order, later ones reading what earlier ones wrote. In the arguments a word starting with
// '@' names a file in the scratch folder, one starting with '%' a file in examples/.
TEST_F(TransformerTest, ToolSplitsMergesAppliesAndRefuses) {
    TempDir dir;
    const auto expand = [&](const std::string& args) {
        std::istringstream words(args);
        std::string out;
        for (std::string w; words >> w;)
            out += w[0] == '@'   ? " '" + dir.file(w.substr(1)) + "'"
                   : w[0] == '%' ? " '" + std::string(PLOTAID_EXAMPLES_DIR) + "/" + w.substr(1) + "'"
                                 : " " + w;
        return out;
    };
    std::ofstream(dir.file("my.xml")) << areaWithSpacedSource();
    std::ofstream(dir.file("junk.bin"), std::ios::binary) << std::string("\x01\xb0 not a stream at all", 22);
    std::ofstream(dir.file("trunc.z"), std::ios::binary) << std::string("x\x9c\x01\x02", 4);
    std::ofstream(dir.file("bad.z"), std::ios::binary) << std::string("x\x9c garbage", 10);
    const std::string apply = "apply --chart @c.xml --template %templates/bar-tidy.sgt --entire --data ";
    std::vector<ToolRun> steps = {
        {"chart split %charts/area.xml -o @area.chart.xml", 0, {}},
        {"chart merge @area.chart.xml @area.data.xml -o @whole.xml", 0, {}},
        {"chart split %charts/area.xml -o @c.xml --compressed", 0, {}},
        {apply + "%data/area.stream -o @out.xml", 0, {}},
        {apply + "%data/area.xml --compressed -o @out.z", 0, {}},
        {"chart split @my.xml", 0, {}},
        {"chart merge @my.chart.xml @my.data.xml -o @my.whole.xml", 0, {}},
        // A chart where its data belong is refused, not merged into a chart without rows.
        {"chart merge @my.chart.xml @my.xml", 1, {"not a data document"}},
        {"apply --chart %charts/area.xml --data @junk.bin --template %templates/bar-tidy.sgt",
         1,
         {"junk.bin: "}},
        {"chart merge %charts/area.xml @trunc.z", 1, {"cannot be decompressed"}},
        {"chart split @bad.z -o @o.xml", 1, {"the chart cannot be read"}},
        {"chart", 2, {"usage: plotaid chart split"}},
        {"chart join a b", 2, {"unknown action 'join'"}},
        {"chart merge %charts/area.xml", 2, {"needs a chart and its data"}},
    };
    for (ToolRun& step : steps)
        step.args = expand(step.args);
    expectToolRuns("", steps);
    EXPECT_EQ(readAll(dir.file("whole.xml")),
              ChartTransformer(example("charts/area.xml")).getEntireXML(u"UTF-8"));
    EXPECT_EQ(static_cast<unsigned char>(readAll(dir.file("c.xml")).at(0)), 0x78);
    for (const std::string& text : {readAll(dir.file("out.xml")), inflate(readAll(dir.file("out.z")))}) {
        Parsed whole(text);
        ASSERT_TRUE(whole.ok());
        EXPECT_EQ(whole.idsOf(u"embeddedSource"), std::vector<std::string>{"rain"});
        EXPECT_TRUE(whole.idsOf(u"userSource").empty());
    }
    EXPECT_EQ(count(readAll(dir.file("my.whole.xml")), "<row>"), 54u);
}

} // namespace
