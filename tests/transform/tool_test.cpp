#include "TransformerSupport.h"
#include "support/GrammarSupport.h"
#include "support/ToolRunner.h"

#include <fstream>

using namespace transformer_test;

namespace {

std::string examplePath(const std::string& relative) {
    return "'" + std::string(PLOTAID_EXAMPLES_DIR) + "/" + relative + "'";
}

TEST_F(TransformerTest, ToolSplitsMergesAndAppliesOverAStream) {
    TempDir dir;
    const auto in = [&](const std::string& name) { return " '" + dir.file(name) + "'"; };
    const ToolResult s =
        runTool("chart split " + examplePath("charts/area.xml") + " -o" + in("area.chart.xml"));
    ASSERT_EQ(s.exitCode, 0) << s.output;
    EXPECT_EQ(Parsed(readAll(dir.file("area.chart.xml"))).idsOf(u"userSource"),
              std::vector<std::string>{"rain"});
    const ToolResult m =
        runTool("chart merge" + in("area.chart.xml") + in("area.data.xml") + " -o" + in("whole.xml"));
    ASSERT_EQ(m.exitCode, 0) << m.output;
    EXPECT_EQ(readAll(dir.file("whole.xml")),
              ChartTransformer(example("charts/area.xml")).getEntireXML(u"UTF-8"));

    ASSERT_EQ(runTool("chart split " + examplePath("charts/area.xml") + " -o" + in("c.xml") + " --compressed")
                  .exitCode,
              0);
    ASSERT_EQ(static_cast<unsigned char>(readAll(dir.file("c.xml")).at(0)), 0x78);
    // Data as a stream, and as an XML data document with compressed output.
    const std::string apply = "apply --chart" + in("c.xml") + " --template " +
                              examplePath("templates/bar-tidy.sgt") + " --entire --data ";
    const ToolResult r = runTool(apply + examplePath("data/area.stream") + " -o" + in("out.xml"));
    EXPECT_EQ(r.exitCode, 0) << r.output;
    const ToolResult x = runTool(apply + examplePath("data/area.xml") + " --compressed -o" + in("out.z"));
    EXPECT_EQ(x.exitCode, 0) << x.output;
    for (const std::string& text : {readAll(dir.file("out.xml")), inflate(readAll(dir.file("out.z")))}) {
        Parsed whole(text);
        ASSERT_TRUE(whole.ok());
        EXPECT_EQ(whole.idsOf(u"embeddedSource"), std::vector<std::string>{"rain"});
        EXPECT_TRUE(whole.idsOf(u"userSource").empty());
    }
}

TEST_F(TransformerTest, ToolMergesTheRowsOfASourceNamedWithASpace) {
    TempDir dir;
    std::string chart = example("charts/area.xml");
    for (std::size_t at; (at = chart.find("\"rain\"")) != std::string::npos;)
        chart.replace(at, 6, "\"my data\"");
    std::ofstream(dir.file("my.xml")) << chart;
    ASSERT_EQ(runTool("chart split '" + dir.file("my.xml") + "'").exitCode, 0);
    const ToolResult m = runTool("chart merge '" + dir.file("my.chart.xml") + "' '" + dir.file("my.data.xml") + "'");
    EXPECT_EQ(m.exitCode, 0) << m.output;
    std::size_t rows = 0;
    for (std::size_t at = m.output.find("<row>"); at != std::string::npos; at = m.output.find("<row>", at + 1))
        ++rows;
    EXPECT_EQ(rows, 54u);
    // A chart where its data belong is refused, not merged into a chart without rows.
    EXPECT_EQ(runTool("chart merge '" + dir.file("my.chart.xml") + "' '" + dir.file("my.xml") + "'").exitCode, 1);
}

TEST_F(TransformerTest, ToolRefusesDataThatIsNotChartData) {
    TempDir dir;
    std::ofstream(dir.file("junk.bin"), std::ios::binary) << std::string("\x01\xb0 not a stream at all", 22);
    std::ofstream(dir.file("trunc.z"), std::ios::binary) << std::string("x\x9c\x01\x02", 4);
    std::ofstream(dir.file("bad.z"), std::ios::binary) << std::string("x\x9c garbage", 10);
    const std::string area = examplePath("charts/area.xml");
    const std::pair<std::string, int> cases[] = {
        {"apply --chart " + area + " --data '" + dir.file("junk.bin") + "' --template " +
             examplePath("templates/bar-tidy.sgt"),
         1},
        {"chart merge " + area + " '" + dir.file("trunc.z") + "'", 1},
        {"chart split '" + dir.file("bad.z") + "' -o '" + dir.file("o.xml") + "'", 1},
        {"chart", 2},
        {"chart join a b", 2},
        {"chart merge " + area, 2},
    };
    for (const auto& [args, exitCode] : cases) {
        const ToolResult r = runTool(args);
        EXPECT_EQ(r.exitCode, exitCode) << args << "\n" << r.output;
    }
}

// Every document the transformer writes passes both validators, data converted from a stream too.
TEST_F(TransformerTest, WrittenDocumentsValidate) {
    ChartTransformer t(example("charts/simple-bar.xml"));
    ASSERT_TRUE(t.applyTemplate(example("templates/bar-tidy.sgt")));
    EXPECT_EQ(t.addPopups(), 1u);
    for (const std::string& chart : {t.getXML(), t.getEntireXML(u"UTF-8"), inflate(t.getCompressedXML())})
        EXPECT_EQ(grammar_test::chartFaults(chart), "");
    const std::string stream = example("data/simple-bar.stream");
    ChartTransformer s(t.getCompressedXML(), reinterpret_cast<const unsigned char*>(stream.data()),
                       static_cast<unsigned>(stream.size()));
    for (const std::string& data : {inflate(t.getCompressedData()), inflate(s.getCompressedData())}) {
        ASSERT_FALSE(data.empty());
        EXPECT_TRUE(ChartBase::ValidXML(data));
        if (grammar_test::haveXmllint()) {
            const auto lint =
                grammar_test::xmllint("grxml-data-2.1.xsd", grammar_test::writeScratch("data.xml", data));
            EXPECT_EQ(lint.exitCode, 0) << lint.output;
        }
    }
}

} // namespace
