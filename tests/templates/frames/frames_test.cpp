// Frame actions: frames found or made, placed, snapped to their neighbours and styled; frames
// hidden; the statistics box of a histogram with its localised labels.
#include "templates/FrameSupport.h"
#include "templates/actions/frames.h"

#include <msgbook/FacSTDictionary.h>

using namespace template_test;
using namespace plotaid::detail;

namespace {

class Frames : public TemplateTest {};

const std::string kPlace = R"(<location left="5%" right="95%" top="3%" bottom="9%"/>)";
// Title 1 ("t") from 2% down to `bottom`.
std::string titleTo(const std::string& bottom) {
    return R"(<labelFrame id="t"><location part="top" method="fixed" value="2%"/>)"
           R"(<location part="bottom" method="fixed" value=")" + bottom + "\"/></labelFrame>";
}

TEST_F(Frames, AddFramePlacesSnapsAndStyles) {
    const struct {
        const char *chart, *extension, *body, *instruction;
        bool result;
        const char *id, *expected;
    } rows[] = {
        // A new title, merged and snapped: the subtitle half a per cent below joins it.
        {"", "subtitle=\"s\"", R"(<labelFrame id="s"><location part="top" method="fixed" value="20.5%"/></labelFrame>)",
         "<addFrame frameId=\"frame_title_1\"><label>Sales</label></addFrame>", true, "title1 s",
         "left:fixed:2%;right:fixed:98%;top:fixed:2%;bottom:fixed:20%;|top:nextTo:title1;"},
        {"", "title1=\"t\"", "T20%", "<addFrame frameId=\"frame_title_2\"><label>B</label></addFrame>", true,
         "title1", "left:fixed:2%;right:fixed:98%;top:nextTo:t;bottom:fixed:30%;"},
        // A value without "%" is no per-cent value and never snaps.
        {"", "title1=\"t\"", "T200", "<addFrame frameId=\"frame_title_2\"><label>B</label></addFrame>", true,
         "title1", "left:fixed:2%;right:fixed:98%;top:fixed:20%;bottom:fixed:30%;"},
        {"", "", "", "<addFrame type=\"subtitle\"><label>S</label></addFrame>", true, "frame_subtitle_11",
         "left:fixed:2%;right:fixed:98%;top:fixed:30%;bottom:fixed:35%;"},
        {"", "", "", "<addFrame type=\"footnote\" count=\"1\"><label>F</label></addFrame>", true, "footnote1",
         "left:fixed:2%;right:fixed:98%;top:fixed:88%;bottom:fixed:96%;"},
        {"", "", "", "<addFrame frameId=\"frame_footnote_2\"><label>F</label></addFrame>", true, "footnote1",
         "left:fixed:2%;right:fixed:98%;top:fixed:96%;bottom:fixed:99%;"},
        {"", "", "", "<addFrame frameId=\"frame_title_1\"/>", true, "title1", "<none>"},
        {"", "", "", "<addFrame frameId=\"frame_title_1\"><label>T</label>{place}</addFrame>", true, "title1",
         "left:fixed:5%;right:fixed:95%;top:fixed:3%;bottom:fixed:9%;"},
        {"", "title1=\"t\"", "T20%", "<addFrame frameId=\"frame_title_1\" styleOnly=\"true\">{place}</addFrame>",
         true, "t", "top:fixed:2%;bottom:fixed:20%;"},
        {"", "title1=\"t\" preserveLocations=\"true\"", "T20%", "<addFrame frameId=\"frame_title_1\">{place}</addFrame>",
         true, "t", "top:fixed:2%;bottom:fixed:20%;"},
        {"histogram.xml", "", "", "<addFrame type=\"statisticsSummary\" count=\"1\">{place}</addFrame>", true,
         "frame_statistics_summary_1", "left:fixed:5%;right:fixed:95%;top:fixed:3%;bottom:fixed:9%;"},
        {"histogram.xml", "", "", "<addFrame type=\"statisticsSummary\" count=\"1\" styleOnly=\"true\">{place}</addFrame>",
         true, "frame_statistics_summary_1", "right:fixed:99%;top:fixed:15%;width:content:-;height:content:-;"},
        // Graphs: only the edges given are replaced, never with styleOnly; counts beyond the graphs fail.
        {"histogram.xml", "", "", R"(<addFrame type="graph" count="1"><location left="5%" top="6%"/></addFrame>)",
         true, "frame_graph_1", "right:fixed:80%;bottom:fixed:85%;left:fixed:5%;top:fixed:6%;"},
        {"histogram.xml", "", "", R"(<addFrame type="graph" count="1" styleOnly="true"><location left="5%"/></addFrame>)",
         true, "frame_graph_1", "left:fixed:12%;right:fixed:80%;top:fixed:12%;bottom:fixed:85%;"},
        {"histogram.xml", "", "", R"(<addFrame type="graph"><location left="5%"/></addFrame>)", true, "frame_graph_1",
         "left:fixed:12%;right:fixed:80%;top:fixed:12%;bottom:fixed:85%;"},
        {"container-lines.xml", "", "", "<addFrame type=\"graph\" count=\"3\"/>", false, "", ""},
        {"container-lines.xml", "", "", "<addFrame type=\"graph\" count=\"0\"/>", false, "", ""},
        {"histogram.xml", "", "", "<addFrame type=\"legend\" count=\"2\"/>", false, "", ""},
        // A hidden legend hands its right edge to the only graph.
        {"histogram.xml", "", "", R"(<addFrame type="legend" count="1"><style value="visibility:hidden"/></addFrame>)",
         true, "frame_graph_1", "left:fixed:12%;right:fixed:99%;top:fixed:12%;bottom:fixed:85%;"},
        // Free texts: without a label exactly one free frame is needed; with one a new text is made.
        {"", "", R"(<labelFrame id="a"/><labelFrame id="b"/>)", "<addFrame type=\"labelFrame\"/>", false, "", ""},
        {"", "", "", "<addFrame type=\"labelFrame\"/>", false, "", ""},
        {"", "", R"(<labelFrame id="a"/>)", "<addFrame type=\"labelFrame\" styleOnly=\"true\" count=\"2\"/>", false,
         "", ""},
        {"", "text1=\"a\"", R"(<labelFrame id="a"/>)", "<addFrame type=\"labelFrame\"><label>Note</label></addFrame>",
         true, "labelFrame1 extension", "left:fixed:50%;top:fixed:50%;width:content:-;height:content:-;|text2"},
        {"", "", "", "<addFrame frameId=\"frame_graph_1\">{place}<style number=\"1\" color=\"red\"/></addFrame>", true,
         "visualization c-o-n-t-a-i-n-er", "left:fixed:5%;right:fixed:95%;top:fixed:3%;bottom:fixed:9%;|red"},
    };
    for (const auto& row : rows) {
        const std::string body = row.body[0] == 'T' ? titleTo(row.body + 1) : row.body;
        GrxVisualization& chart = *row.chart ? sample(row.chart)
                                             : parse(chartOf("<extension id=\"extension\" " + std::string(row.extension) +
                                                             "/>" + body));
        std::string instruction = row.instruction;
        if (const auto at = instruction.find("{place}"); at != std::string::npos)
            instruction.replace(at, 7, kPlace);
        EXPECT_EQ(act<TAddFrame>(instruction, chart), row.result) << instruction;
        std::string seen, separator;
        for (std::string ids = row.id; !ids.empty();) {
            const std::string id = ids.substr(0, ids.find(' '));
            ids = ids.find(' ') == std::string::npos ? "" : ids.substr(ids.find(' ') + 1);
            seen += separator + (id == "extension"        ? attr(byId(chart, id), "text2") == "labelFrame1" ? "text2" : ""
                                 : id == "c-o-n-t-a-i-n-er" ? attr(byId(chart, id), "color")
                                                           : places(chart, id));
            separator = "|";
        }
        EXPECT_EQ(seen, row.expected) << instruction;
        EXPECT_EQ(grammar_test::chartFaults(chart), "") << instruction;
    }
}

TEST_F(Frames, HideFrameHidesTheSelectedFramesAndReportsNoChange) {
    const std::string body =
        R"(<extension id="e" title1="a" subtitle="c" footnote1="b" statisticsSummary1="s" legend1="l"/>)"
        R"(<labelFrame id="a"/><labelFrame id="b"/><labelFrame id="c"/><labelFrame id="s"/><labelFrame id="x"/>)"
        R"(<labelFrame id="frame_statistics_summary9"/><labelFrame id="y"/><graph id="g1"/><graph id="g2"/>)"
        R"(<container id="k"/><legend id="l"/>)";
    const struct {
        const char *instruction, *hidden;
    } rows[] = {
        {R"(type="title" count="1")", "a "},        {R"(type="subtitle")", "c "},
        {R"(type="footnote" count="1")", "b "},     {R"(type="legend" count="1")", "l "},
        {R"(type="statisticsSummary" count="1")", "s frame_statistics_summary9 "},
        {R"(type="graph" count="2")", "g2 "},       {R"(type="graph" count="0")", ""},
        {R"(type="graph" count="3")", ""},          {R"(type="labelFrame")", "s x frame_statistics_summary9 y "},
        {R"(type="labelFrame" count="2")", "x "},   {R"(type="container")", "k "},
        {R"(type="visualization")", ""},
    };
    for (const auto& row : rows) {
        GrxVisualization& chart = parse(chartOf(body));
        EXPECT_FALSE(act<THideFrame>("<hideFrame " + std::string(row.instruction) + "/>", chart));
        std::string hidden;
        for (const char* id : {"a", "b", "c", "s", "x", "frame_statistics_summary9", "y", "g1", "g2", "k", "l"}) {
            const GrxStyle* style = byId(chart, id)->ref<GrxStyle>(u"style");
            hidden += style && !style->getVisible() ? std::string(id) + " " : "";
        }
        EXPECT_EQ(hidden, row.hidden) << row.instruction;
        EXPECT_EQ(grammar_test::chartFaults(chart), "") << row.instruction;
    }
}

// The new summary's description group, one "|" between parts: descriptions as their kind and
// format, texts as they read.
std::string summaryOf(const GrxVisualization& chart) {
    const GrxBaseElement* frame = byId(chart, "frame_statistics_summary1");
    if (frame == nullptr)
        return "<none>";
    std::string out;
    for (const GrxDescriptionGroup* group : frame->first<GrxLabel>()->getDescriptionGroups())
        for (const DOMElement* e = group->getImplementation()->getFirstElementChild(); e; e = e->getNextElementSibling())
            out += (out.empty() ? "" : "|") + (u8(e->getLocalName()) == "text"
                                                   ? ChartString(e->getTextContent()).toUTF8()
                                                   : attr(e, "kind") + (e->getFirstElementChild()
                                                                            ? "{" + attributesOf(e->getFirstElementChild()) + "}"
                                                                            : ""));
    return out;
}

TEST_F(Frames, TheHistogramSummaryShowsLocalisedStatistics) {
    const std::string format = R"(<format prefix="$" useGrouping="true" maximumFractionDigits="0" />)";
    const struct {
        const char *language, *from, *to;
        bool result;
        const char* expected;
    } rows[] = {
        {"en", "", "", true,
         "1|Mean = |5{maximumFractionDigits=2;prefix=$;useGrouping=true;}|Std. Dev. = "
         "|7{maximumFractionDigits=3;prefix=$;useGrouping=true;}|N = |6"},
        {"de", "", "", true,
         "1|Mittelwert = |5{maximumFractionDigits=2;prefix=$;useGrouping=true;}|Std.-Abw. = "
         "|7{maximumFractionDigits=3;prefix=$;useGrouping=true;}|N = |6"},
        // A date's spread shows in days.
        {"en", format.c_str(), R"(<format baseFormat="1" maximumFractionDigits="1"/>)", true,
         "1|Mean = |5{baseFormat=1;maximumFractionDigits=3;}|Std. Dev. = |7{scalingFactor=86400;suffix= days;}|N = |6"},
        {"en", format.c_str(), R"(<format maximumFractionDigits="15"/>)", true,
         "1|Mean = |5{maximumFractionDigits=16;}|Std. Dev. = |7{maximumFractionDigits=16;}|N = |6"},
        {"en", "histogramStatistic=\"count\"", "histogramStatistic=\"none\"", false, "<none>"},
        {"en", "<coordinates ", "<faceting variable=\"var_salary\"/><coordinates ", true, "<none>"},
    };
    const std::string language = msgbook::hostLanguage();
    for (const auto& row : rows) {
        msgbook::setHostLanguage(row.language);
        GrxVisualization& chart = parse(replaceOnce(example("charts/histogram.xml"), row.from, row.to));
        EXPECT_EQ(act<TAddHistogramSummaryFrame>("<addHistogramSummaryFrame/>", chart), row.result) << row.to;
        EXPECT_EQ(summaryOf(chart), row.expected) << row.to;
        const bool made = std::string(row.expected) != "<none>";
        EXPECT_EQ(attr(chart.getExtension(), "statisticsSummary2"), made ? "frame_statistics_summary1" : "-");
        EXPECT_EQ(grammar_test::chartFaults(chart), "") << row.to;
    }
    msgbook::setHostLanguage(language);
    EXPECT_EQ(summaryLabel(ChartString(u"Std.\\nDev.")).toUTF8(), "Std.\nDev. ");
}

} // namespace
