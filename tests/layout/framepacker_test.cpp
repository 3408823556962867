// The frame packer: titles from the top, footnotes from the bottom, the graph between them and the
// side column on the right; frames the user placed stay, and packing twice is packing once.
#include "templates/FrameSupport.h"

#include "layout/Percent.h"

#include <plotaid/FramePacker.h>

using namespace template_test;

namespace {

class Packer : public TemplateTest {};

TEST_F(Packer, LaysOutTheFixedPattern) {
    const std::string side = R"(<extension id="e" legend1="l" key1="k1" key2="k2"/><graph id="g"/>)"
                             R"(<container id="c"><legend id="l"/><key id="k1"/></container><key id="k2"/>)";
    const struct {
        const char *chart, *body, *reference, *id, *expected;
    } rows[] = {
        {"", R"(<extension id="e"/><graph id="g"/>)", "", "g",
         "left:fixed:1%;top:fixed:1%;bottom:fixed:99%;right:fixed:99%;"},
        {"histogram.xml", "", "", "frame_title_1", "top:fixed:1%;height:content:-;"},
        {"histogram.xml", "", "", "frame_footnote_1", "height:content:-;bottom:nextTo:frame_footnote_2;"},
        {"histogram.xml", "", "", "frame_footnote_2", "height:content:-;bottom:fixed:99%;"},
        {"histogram.xml", "", "", "frame_graph_1",
         "left:fixed:1%;top:nextTo:frame_title_1;bottom:nextTo:frame_footnote_1;right:nextTo:legend_1;"},
        {"histogram.xml", "", "", "legend_1",
         "height:content:-;width:content:-;right:fixed:99%;top:sameEdge:frame_graph_1;"},
        {"histogram.xml", "", "", "frame_statistics_summary_1",
         "height:content:-;width:content:-<25%;left:fixed:75%;top:nextTo:legend_1;"},
        // Two graphs: the titles, graphs and legends stay; the subtitle still moves.
        {"container-lines.xml", "", "", "frame_title_1",
         "top:fixed:2%;left:fixed:0%;right:fixed:100%;height:content:-;"},
        {"container-lines.xml", "", "", "frame_graph_2",
         "left:fixed:52%;right:fixed:90%;top:fixed:12%;bottom:fixed:85%;"},
        {"container-lines.xml", "", "", "legend_1",
         "right:fixed:99%;top:sameEdge:frame_graph_1;width:content:-;height:content:-;"},
        {"container-lines.xml", "", "", "frame_subtitle_1", "top:nextTo:frame_title_1;height:content:-;"},
        // The side column: the container under the graph's top, a key in it, a key beside it.
        {"", side.c_str(), "", "c", "top:sameEdge:g;height:content:-;left:fixed:75%;right:fixed:99%;"},
        {"", side.c_str(), "", "g", "left:fixed:1%;top:fixed:1%;bottom:fixed:99%;right:nextTo:c;"},
        {"", side.c_str(), "", "l", "height:content:-;width:content:-;left:sameEdge:c;right:sameEdge:c;top:sameEdge:c;"},
        {"", side.c_str(), "", "k1", "height:content:-;width:content:-;left:fixed:1%;top:nextTo:l;"},
        {"", side.c_str(), "", "k2", "height:content:-;width:content:-<25%;left:sameEdge:c;top:nextTo:k1;"},
        // A title 2 placed by fixed values in the reference stays, and the subtitle goes next to it.
        {"", R"(<extension id="e" title2="t2" subtitle="s"/><graph id="g"/><labelFrame id="s"/>)"
             R"(<labelFrame id="t2"><location part="top" method="fixed" value="7%"/></labelFrame>)",
         "t2", "t2 s", "top:fixed:7%;|top:nextTo:t2;height:content:-;"},
        // A graph whose attachments the user made stays.
        {"", R"(<extension id="e"/><graph id="g"><location part="left" method="fixed" value="3%"/>)"
             R"(<location part="top" method="nextTo" target="e" specifiedByUser="true"/></graph>)",
         "g", "g", "left:fixed:3%;top:nextTo:e;"},
        {"", R"(<extension id="e" preserveLocations="true"/><graph id="g"><location part="left" value="3%"/></graph>)",
         "", "g", "left:-:3%;"},
    };
    for (const auto& row : rows) {
        GrxVisualization& chart = *row.chart ? sample(row.chart) : parse(chartOf(row.body));
        GrxVisualization* reference = *row.reference ? &parse(chartOf(row.body)) : nullptr;
        EXPECT_TRUE(FramePacker().packFrames(chart, reference));
        std::string seen;
        for (std::string ids = row.id; !ids.empty();) {
            const std::size_t blank = ids.find(' ');
            seen += (seen.empty() ? "" : "|") + places(chart, ids.substr(0, blank));
            ids = blank == std::string::npos ? "" : ids.substr(blank + 1);
        }
        EXPECT_EQ(seen, row.expected) << row.chart << " " << row.id;
    }
}

TEST_F(Packer, PackingAPackedChartChangesNothingAndEveryChartStaysSound) {
    for (const char* name : {"histogram.xml", "container-lines.xml", "panels.xml", "scatterplot-matrix.xml", "pie.xml"}) {
        GrxVisualization& chart = sample(name);
        FramePacker().packFrames(chart, nullptr);
        const std::string once = canonical(chart);
        FramePacker().packFrames(chart, &chart);
        FramePacker().packFrames(chart, nullptr);
        EXPECT_EQ(canonical(chart), once) << name;
        EXPECT_EQ(grammar_test::chartFaults(chart), "") << name;
    }
}

TEST(PercentText, KeepsOneDecimalTowardZero) {
    const std::pair<double, const char*> rows[] = {{12.34, "12.3%"}, {-0.06, "0%"}, {-1.29, "-1.2%"}, {99, "99%"},
                                                   {1e300, "214748364.7%"}, {-1e300, "-214748364.8%"}};
    for (const auto& [percent, text] : rows)
        EXPECT_EQ(plotaid::detail::percentText(percent).toUTF8(), text) << percent;
}

} // namespace
