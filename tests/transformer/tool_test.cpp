#include "TransformerSupport.h"
#include "support/ToolRunner.h"

#include <cstdlib>
#include <fstream>

using namespace transformer_test;

namespace {

std::string examplePath(const std::string& relative) {
    return "'" + std::string(PLOTAID_EXAMPLES_DIR) + "/" + relative + "'";
}

void write(const std::string& path, const std::string& bytes) {
    std::ofstream(path, std::ios::binary) << bytes;
}

// Whether xmllint accepts the file against the schema, the chart grammar's imports read locally.
bool xmllintAccepts(const TempDir& dir, const std::string& schema, const std::string& file,
                    std::string& output) {
    const std::string schemas = std::string(PLOTAID_SOURCE_DIR) + "/resources/schemas/";
    write(
        dir.file("catalog.xml"),
        "<?xml version=\"1.0\"?>\n<catalog xmlns=\"urn:oasis:names:tc:entity:xmlns:xml:catalog\">\n"
        "<rewriteSystem systemIdStartString=\"http://plotaid.org/grxml/data/\" rewritePrefix=\"file://" +
            schemas +
            "\"/>\n<rewriteSystem systemIdStartString=\"http://plotaid.org/grxml/\" rewritePrefix=\"file://" +
            schemas + "\"/>\n</catalog>\n");
    const std::string command = "XML_CATALOG_FILES='" + dir.file("catalog.xml") +
                                "' xmllint --nonet --noout --schema '" + schemas + schema + "' '" + file +
                                "' 2>&1";
    FILE* pipe = ::popen(command.c_str(), "r");
    if (pipe == nullptr)
        return false;
    char buf[512];
    for (std::size_t n; (n = std::fread(buf, 1, sizeof buf, pipe)) > 0;)
        output.append(buf, n);
    const int status = ::pclose(pipe);
    return WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

} // namespace

TEST_F(TransformerTest, SplitThenMergeGivesTheWholeChartBack) {
    TempDir dir;
    const ToolResult s =
        runTool("chart split " + examplePath("charts/area.xml") + " -o '" + dir.file("area.chart.xml") + "'");
    ASSERT_EQ(s.exitCode, 0) << s.output;
    Parsed chart(readAll(dir.file("area.chart.xml")));
    ASSERT_TRUE(chart.ok());
    EXPECT_EQ(chart.idsOf(u"userSource"), std::vector<std::string>{"rain"});
    EXPECT_TRUE(chart.idsOf(u"embeddedSource").empty());
    Parsed data(readAll(dir.file("area.data.xml")));
    ASSERT_TRUE(data.ok());
    EXPECT_EQ(data.idsOf(u"embeddedSource"), std::vector<std::string>{"rain"});

    const ToolResult m = runTool("chart merge '" + dir.file("area.chart.xml") + "' '" +
                                 dir.file("area.data.xml") + "' -o '" + dir.file("whole.xml") + "'");
    ASSERT_EQ(m.exitCode, 0) << m.output;
    ChartTransformer direct(example("charts/area.xml"));
    EXPECT_EQ(readAll(dir.file("whole.xml")), direct.getEntireXML(u"UTF-8"));
}

TEST_F(TransformerTest, ApplyTakesAStreamAndWritesTheWholeDocument) {
    TempDir dir;
    ASSERT_EQ(runTool("chart split " + examplePath("charts/area.xml") + " -o '" + dir.file("c.xml") +
                      "' --compressed")
                  .exitCode,
              0);
    const std::string compressedChart = readAll(dir.file("c.xml"));
    ASSERT_EQ(static_cast<unsigned char>(compressedChart.at(0)), 0x78);
    const ToolResult r =
        runTool("apply --chart '" + dir.file("c.xml") + "' --data " + examplePath("data/area.stream") +
                " --template " + examplePath("templates/bar-tidy.sgt") + " --entire --report -o '" +
                dir.file("out.xml") + "'");
    EXPECT_EQ(r.exitCode, 0) << r.output;
    EXPECT_NE(r.output.find("bar-tidy.sgt #1 setStyle:"), std::string::npos) << r.output;
    Parsed whole(readAll(dir.file("out.xml")));
    ASSERT_TRUE(whole.ok());
    EXPECT_EQ(whole.idsOf(u"embeddedSource"), std::vector<std::string>{"rain"});
    EXPECT_TRUE(whole.idsOf(u"userSource").empty());

    // The same with the XML data document, and compressed output.
    const ToolResult x = runTool(
        "apply --chart '" + dir.file("c.xml") + "' --data " + examplePath("data/area.xml") + " --template " +
        examplePath("templates/bar-tidy.sgt") + " --entire --compressed -o '" + dir.file("out.z") + "'");
    EXPECT_EQ(x.exitCode, 0) << x.output;
    Parsed fromXml(inflate(readAll(dir.file("out.z"))));
    ASSERT_TRUE(fromXml.ok());
    EXPECT_EQ(fromXml.idsOf(u"embeddedSource"), std::vector<std::string>{"rain"});
}

TEST_F(TransformerTest, ToolRefusesDataThatIsNotChartData) {
    TempDir dir;
    write(dir.file("junk.bin"), std::string("\x01\xb0 not a stream at all", 22));
    const ToolResult r =
        runTool("apply --chart " + examplePath("charts/area.xml") + " --data '" + dir.file("junk.bin") +
                "' --template " + examplePath("templates/bar-tidy.sgt"));
    EXPECT_EQ(r.exitCode, 1) << r.output;
    write(dir.file("trunc.z"), std::string("x\x9c\x01\x02", 4));
    EXPECT_EQ(
        runTool("chart merge " + examplePath("charts/area.xml") + " '" + dir.file("trunc.z") + "'").exitCode,
        1);
    write(dir.file("bad.z"), std::string("x\x9c garbage", 10));
    const ToolResult c = runTool("chart split '" + dir.file("bad.z") + "' -o '" + dir.file("o.xml") + "'");
    EXPECT_EQ(c.exitCode, 1) << c.output;
    EXPECT_EQ(runTool("chart").exitCode, 2);
    EXPECT_EQ(runTool("chart join a b").exitCode, 2);
    EXPECT_EQ(runTool("chart merge " + examplePath("charts/area.xml")).exitCode, 2);
}

// Every document the transformer writes passes both validators.
TEST_F(TransformerTest, WrittenDocumentsValidate) {
    TempDir dir;
    ChartTransformer t(example("charts/simple-bar.xml"));
    ASSERT_TRUE(t.applyTemplate(example("templates/bar-tidy.sgt")));
    EXPECT_EQ(t.addPopups(), 1u);
    const std::pair<std::string, std::string> documents[] = {
        {"chart.xml", t.getXML()},
        {"entire.xml", t.getEntireXML(u"UTF-8")},
        {"compressed.xml", inflate(t.getCompressedXML())},
    };
    const bool haveXmllint = std::system("xmllint --version >/dev/null 2>&1") == 0;
    for (const auto& [name, text] : documents) {
        SCOPED_TRACE(name);
        EXPECT_TRUE(ChartBase::ValidXML(text));
        write(dir.file(name), text);
        std::string output;
        if (haveXmllint) {
            EXPECT_TRUE(xmllintAccepts(dir, "grxml-2.9.xsd", dir.file(name), output)) << output;
        }
    }
    const std::string data = inflate(t.getCompressedData());
    EXPECT_TRUE(ChartBase::ValidXML(data));
    write(dir.file("data.xml"), data);
    std::string output;
    if (haveXmllint) {
        EXPECT_TRUE(xmllintAccepts(dir, "grxml-data-2.1.xsd", dir.file("data.xml"), output)) << output;
    }

    // Data converted from a stream, too.
    const std::string stream = readAll(std::string(PLOTAID_EXAMPLES_DIR) + "/data/simple-bar.stream");
    ChartTransformer s(t.getCompressedXML(), reinterpret_cast<const unsigned char*>(stream.data()),
                       static_cast<unsigned>(stream.size()));
    const std::string converted = inflate(s.getCompressedData());
    EXPECT_TRUE(ChartBase::ValidXML(converted));
    write(dir.file("converted.xml"), converted);
    output.clear();
    if (haveXmllint) {
        EXPECT_TRUE(xmllintAccepts(dir, "grxml-data-2.1.xsd", dir.file("converted.xml"), output)) << output;
    }
}
