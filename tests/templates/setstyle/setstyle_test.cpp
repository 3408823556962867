// "setStyle": one style by id, the styles of texts (titles, legends, axes, panels), and the styles
// of elements by type, each declaration reaching the graphs of its number.
#include "templates/TemplateSupport.h"

#include <sstream>

using namespace template_test;

namespace {

// One "setStyle" instruction; `more` goes into its start tag (subtype, level).
std::string setStyle(const std::string& type, const std::string& declarations, const std::string& more = "") {
    return "<setStyle type=\"" + type + "\"" + more + ">" + declarations + "</setStyle>";
}
std::string sub(const std::string& subtype) {
    return " subtype=\"" + subtype + "\"";
}
const char* const kRed = "<style color=\"red\"/>";
std::string textStyle(const std::string& type, const std::string& subtype, const std::string& style = kRed) {
    return setStyle(type, style, sub(subtype));
}

// Every style of the chart by id, with its other attributes.
std::map<std::string, std::string> styleSnapshot(const GrxVisualization& chart) {
    std::map<std::string, std::string> out;
    const auto* nodes = root(chart)->getOwnerDocument()->getElementsByTagName(u"style");
    for (XMLSize_t i = 0; i < nodes->getLength(); ++i)
        out[attr(static_cast<const DOMElement*>(nodes->item(i)), "id")] +=
            attributesOf(static_cast<const DOMElement*>(nodes->item(i)));
    return out;
}

class SetStyle : public TemplateTest {
protected:
    bool apply(GrxVisualization& chart, const std::string& body) {
        return act<plotaid::detail::TStyle>(body, chart);
    }
    // "<id> <colour>" of the style the element refers to by that attribute.
    static std::string referred(const GrxVisualization& chart, const char* element, const char* attribute) {
        const GrxStyle* style = chart.getStyleById(ChartString(attr(byId(chart, element), attribute)));
        return style ? attr(style, "id") + " " + attr(style, "color") : "<none>";
    }
    // Applies `body` to a fresh chart parsed from `chart` (a sample's file name when it ends in
    // ".xml"), then checks `expect`: "style:value" for its colour, "style.attribute:value" for
    // another attribute, "!value" for anything but that value, "^value" for a value that begins so,
    // "-" for absent. With `changed`, the styles added, removed or changed are exactly those
    // (space-separated, sorted); an empty `changed` means the whole chart stays as it was.
    GrxVisualization& expectStyles(const std::string& chart, const std::string& body,
                                   const std::string& expect, const char* changed = nullptr) {
        SCOPED_TRACE(chart.substr(0, 40) + " | " + body);
        GrxVisualization& c =
            chart.size() < 40 && chart.find(".xml") != std::string::npos ? sample(chart) : parse(chart);
        const auto before = styleSnapshot(c);
        const std::string text = c.AsUTF8();
        EXPECT_TRUE(apply(c, body));
        std::istringstream in(expect);
        for (std::string item; in >> item;) {
            const std::string::size_type colon = item.find(':'), dot = item.find('.');
            const std::string name = dot < colon ? item.substr(dot + 1, colon - dot - 1) : "color";
            const std::string got =
                attr(c.getStyleById(ChartString(item.substr(0, std::min(colon, dot)))), name);
            const std::string want = item.substr(colon + 1);
            if (want[0] == '!')
                EXPECT_NE(got, want.substr(1)) << item;
            else if (want[0] == '^')
                EXPECT_EQ(got.substr(0, want.size() - 1), want.substr(1)) << item;
            else
                EXPECT_EQ(got, want) << item;
        }
        if (changed != nullptr) {
            auto after = styleSnapshot(c);
            std::string joined;
            for (const auto& [id, attributes] : before) // the ids of both, sorted
                after.emplace(id, "<removed>");
            for (const auto& [id, attributes] : after)
                if (!before.count(id) || before.at(id) != attributes)
                    joined += (joined.empty() ? "" : " ") + id;
            EXPECT_EQ(joined, changed);
            EXPECT_TRUE(*changed != '\0' || c.AsUTF8() == text) << "the chart changed";
        }
        return c;
    }
};

TEST_F(SetStyle, ByIdTheNamedStyleTakesDeclarationZeroWhereverItIs) {
    expectStyles("simple-bar.xml", "<setStyle id=\"titleStyle\"><style color=\"red\"/></setStyle>",
                 "titleStyle:red", "titleStyle");
    const std::string nested = chartOf("<style id=\"outer\" color=\"black\"><style id=\"middle\">"
                                       "<style id=\"inner\" color=\"black\"/></style></style>");
    expectStyles(nested, "<setStyle id=\"inner\"><style color=\"red\"/></setStyle>", "inner:red outer:black",
                 "inner");
    const std::string text =
        chartOf("<style color=\"black\"/><style id=\"known\" color=\"black\"/><graph id=\"notAStyle\"/>");
    for (const char* body :
         {"<setStyle id=\"unknown\"><style color=\"red\"/></setStyle>",
          "<setStyle id=\"notAStyle\"><style color=\"red\"/></setStyle>",
          "<setStyle id=\"known\"><style number=\"1\" color=\"red\"/></setStyle>", "<setStyle id=\"known\"/>",
          "<setStyle><style color=\"red\"/></setStyle>"}) { // an empty id does not pick the style that has
                                                            // none
        GrxVisualization& chart = parse(text);
        const std::string before = chart.AsUTF8();
        EXPECT_FALSE(apply(chart, body)) << body;
        EXPECT_EQ(chart.AsUTF8(), before) << body;
    }
}

// A chart with an x dimension of two titled axes and a y dimension of one.
std::string
axesChart(const std::string& xTicks = "<majorTicks id=\"xt\" style=\"tick\" tickFrameStyle=\"tickFrame\"/>") {
    return chartOf("<style id=\"l1\" color=\"black\"/><style id=\"l2\" color=\"black\"/>"
                   "<style id=\"l3\" color=\"black\"/><style id=\"tick\" color=\"black\"/>"
                   "<style id=\"tickFrame\" color=\"black\"/><graph id=\"g\"><coordinates id=\"c\">"
                   "<dimension id=\"x\"><axis id=\"x1\"><label id=\"x1l\" style=\"l1\"/>" +
                   xTicks +
                   "</axis><axis id=\"x2\"><label id=\"x2l\" style=\"l2\"/></axis></dimension>"
                   "<dimension id=\"y\"><axis id=\"y1\"><label id=\"y1l\" style=\"l3\"/></axis></dimension>"
                   "</coordinates></graph>");
}

TEST_F(SetStyle, EachTextSlotReachesItsOwnTextsOnly) {
    const std::string axes = axesChart();
    const struct {
        std::string chart, body, expect;
        const char* changed;
    } rows[] = {
        // Axis titles by role; a dimension with one axis gives its first for "2" as well; no z axis.
        {axes, textStyle("text", "xaxis_title"), "l1:red", "l1"},
        {axes, textStyle("text", "xaxis_title2"), "l2:red", "l2"},
        {axes, textStyle("text", "yaxis_title2"), "l3:red", "l3"},
        {axes, textStyle("text", "zaxis_title"), "", ""},
        // Axis tick labels and their frames.
        {axes, textStyle("text", "xaxis_labels"), "tick:red tickFrame:black", "tick"},
        {axes, textStyle("textFrame", "xaxis_labels"), "tickFrame:red tick:black", "tickFrame"},
        // The slot "legend1" names the legend too, whose title style is styled as well.
        {"simple-bar.xml", textStyle("text", "legend1"), "legend_1tickTextStyle:red axisLabelStyle:red",
         "axisLabelStyle legend_1tickTextStyle"},
        {"simple-bar.xml", textStyle("text", "legend2"), "", ""},
        // Extension slots name titles, footnotes and their frames.
        {"simple-bar.xml", textStyle("text", "title1", std::string(kRed) + "<style font-size=\"20pt\"/>"),
         "titleStyle:red titleStyle.font-size:^20pt footnoteStyle:!red", nullptr},
        {"simple-bar.xml", textStyle("text", "footnote2"), "footnoteStyle:red", "footnoteStyle"},
        {"simple-bar.xml", textStyle("labelFrame", "title1"), "frameStyle:red titleStyle:!red", nullptr},
        // Labels inside elements are not styled here.
        {"simple-bar.xml", textStyle("text", "labeling_inside"), "", ""},
    };
    for (const auto& row : rows)
        expectStyles(row.chart, row.body, row.expect, row.changed);
}

TEST_F(SetStyle, MissingFrameAndTickStylesAreMadeUnderFreshIds) {
    const std::string legendWithout =
        replaceOnce(example("charts/simple-bar.xml"), " tickTextStyle=\"legend_1tickTextStyle\"", "");
    const std::string extension =
        chartOf("<extension id=\"ext\" title1=\"t\" legend1=\"g\"/>"
                "<labelFrame id=\"t\"><label id=\"tl\"/></labelFrame><graph id=\"g\"/>");
    const struct {
        std::string chart, body, expect, element, reference, made;
    } rows[] = {
        {axesChart(), textStyle("textFrame", "xaxis_title"), "l1:black", "x1l", "textFrameStyle",
         "text1 red"},
        {legendWithout, textStyle("text", "legend1"), "legend_1tickTextStyle:black", "legend_1",
         "tickTextStyle", "legend_1tickTextStyle1 red"},
        {"simple-bar.xml", textStyle("textFrame", "legend1"), "legend_1tickTextStyle:black", "legend_1",
         "tickFrameStyle", "legend_11 red"},
        // Ticks' styles are made as "<ticks id>s"; a frame style never takes the text style's place.
        {axesChart("<majorTicks id=\"xt\" style=\"tick\"/>"), textStyle("textFrame", "xaxis_labels"),
         "tick:black", "xt", "tickFrameStyle", "xts red"},
        {axesChart("<majorTicks id=\"xt\"/>"), textStyle("text", "xaxis_labels"), "", "xt", "style",
         "xts red"},
        // A frame without a style gets one named after it.
        {extension, textStyle("labelFrame", "title1"), "", "t", "style", "t1 red"},
    };
    for (const auto& row : rows)
        EXPECT_EQ(referred(expectStyles(row.chart, row.body, row.expect), row.element.c_str(),
                           row.reference.c_str()),
                  row.made)
            << row.body;
    // A slot naming neither a frame nor a legend is passed over.
    for (const std::string& body : {textStyle("labelFrame", "legend1"), textStyle("labelFrame", "")})
        expectStyles(extension, body, "", "");
}

// Two facet levels: the first with an axis of its own, the second with none.
const std::string kFacets = chartOf(
    "<style id=\"axisA\" color=\"black\"/><style id=\"ticksA\" color=\"black\"/><style id=\"titleA\" "
    "color=\"black\"/>"
    "<graph id=\"g\"><facetLayout id=\"fl\"><facetLevel id=\"A\" level=\"1\"><axis id=\"axA\" "
    "style=\"axisA\">"
    "<label id=\"labA\" style=\"titleA\"/><majorTicks id=\"mtA\" style=\"ticksA\"/></axis></facetLevel>"
    "<facetLevel id=\"B\" level=\"2\"/></facetLayout></graph>");

std::string panel(const std::string& type, const std::string& subtype, const std::string& level) {
    return setStyle(type, kRed, sub(subtype) + (level.empty() ? "" : " level=\"" + level + "\""));
}
// The axes of the facet level B.
std::vector<GrxAxis*> axesOfB(const GrxVisualization& chart) {
    return byId<GrxFacetLevel>(chart, "B")->getAxiss();
}

TEST_F(SetStyle, PanelLabelsAndTitlesByLevel) {
    EXPECT_TRUE(
        axesOfB(expectStyles(kFacets, panel("text", "panel_labels", "1"), "ticksA:red axisA:black", "ticksA"))
            .empty());
    expectStyles(kFacets, panel("text", "panel_title", "1"), "titleA:red", "titleA");
    // Only ticks that have a frame style take a frame.
    expectStyles(kFacets, panel("textFrame", "panel_labels", "1"), "", "");
    expectStyles("panels.xml", panel("text", "panel_labels", ""), "panelLabelStyle:red", nullptr);

    // A level without an axis gets one that draws nothing, with ticks that have no style to take.
    GrxVisualization& all = expectStyles(kFacets, panel("text", "panel_labels", ""), "ticksA:red");
    ASSERT_EQ(axesOfB(all).size(), 1u);
    const GrxAxis* axis = axesOfB(all).front();
    EXPECT_EQ(attr(axis->getStyle(), "id") + " " + attr(axis->getStyle(), "color"), "axis1 transparent");
    EXPECT_EQ(axis->getMajorTickss().size(), 1u);
    // A panel title of such a level is made with its label.
    GrxVisualization& second = expectStyles(kFacets, panel("text", "panel_title", "2"), "titleA:black");
    ASSERT_EQ(axesOfB(second).size(), 1u);
    const GrxLabel* label = axesOfB(second).front()->getLabel();
    ASSERT_NE(label, nullptr);
    EXPECT_EQ(attr(label, "id") + " " + attr(label->getStyle(), "id") + " " +
                  attr(label->getStyle(), "color"),
              "labelB1 stylelabelB11 red");

    GrxVisualization& panels =
        expectStyles("panels.xml", panel("textFrame", "panel_title", ""), "axisLabelStyle:!red");
    EXPECT_EQ(attr(byId<GrxLabel>(panels, "facet_gender_label")->getTextFrameStyle(), "color"), "red");
}

struct GraphPlan {
    std::string id;
    std::string elements; // element XML; "COORD" stands for this graph's coordinates id
    bool polar = false, z = false, clustered = false;
};

// Styles s1 .. s9 (black, each its own) and the graphs.
std::string chartWith(const std::vector<GraphPlan>& graphs, const std::string& extra = std::string()) {
    std::string body = "<sourceVariable id=\"cluster\"/>";
    for (int i = 1; i <= 9; ++i)
        body += "<style id=\"s" + std::to_string(i) + "\" color=\"black\"/>";
    for (const GraphPlan& g : graphs) {
        std::string elements = g.elements;
        for (auto at = elements.find("COORD"); at != std::string::npos; at = elements.find("COORD", at))
            elements.replace(at, 5, "c_" + g.id);
        body += "<graph id=\"" + g.id + "\"><coordinates id=\"c_" + g.id + "\">" +
                (g.polar ? "<polarTransform/>" : "") + "<dimension id=\"" + g.id + "_x\"" +
                (g.clustered ? " clusterVariable=\"cluster\"" : "") + "/><dimension id=\"" + g.id + "_y\"/>" +
                (g.z ? "<dimension id=\"" + g.id + "_z\"/>" : "") + "</coordinates>" + elements + "</graph>";
    }
    return chartOf(body + extra);
}

std::string bar(const std::string& id, const std::string& style, const std::string& more = std::string()) {
    return "<interval id=\"" + id + "\" style=\"" + style + "\" coordinates=\"COORD\"" + more + "/>";
}

TEST_F(SetStyle, DeclarationsReachTheGraphsOfTheirNumber) {
    const std::string three =
        chartWith({{"g1", bar("b1", "s1")}, {"g2", bar("b2", "s2")}, {"g3", bar("b3", "s3")}});
    // One unnumbered declaration is for every graph, but not a polar one.
    expectStyles(chartWith({{"g1", bar("b1", "s1")}, {"g2", bar("b2", "s2")}, {"g3", bar("b3", "s3"), true}}),
                 setStyle("bar", kRed), "s1:red s2:red", "s1 s2");
    expectStyles(three,
                 setStyle("bar", "<style number=\"0\" color=\"red\"/><style number=\"1\" color=\"blue\"/>"),
                 "s1:red s2:blue s3:black");
    // A lone declaration with a number is no longer the one for every graph.
    expectStyles(three, setStyle("bar", "<style number=\"1\" color=\"blue\"/>"), "s1:black s2:blue s3:black");
    // A later declaration of the same number replaces the earlier one.
    expectStyles(three, setStyle("bar", "<style color=\"red\"/><style number=\"0\" color=\"green\"/>"),
                 "s3:green");
    // Huge numbers name no graph and cost nothing: the unnumbered declaration is graph 0's only.
    for (const char* number : {"4294967295", "-1"})
        expectStyles(chartWith({{"g1", bar("b1", "s1")}, {"g2", bar("b2", "s2")}}),
                     setStyle("bar", std::string(kRed) + "<style number=\"" + number + "\" color=\"blue\"/>"),
                     "s1:red s2:black");
    // Declarations beyond the graphs, unknown types and no declaration change nothing.
    for (const std::string& body :
         {setStyle("interval", kRed), setStyle("bar", "<style number=\"3\" color=\"red\"/>"),
          setStyle("bar", "")})
        expectStyles("simple-bar.xml", body, "", "");
}

TEST_F(SetStyle, EachKindOfElementTakesItsOwnType) {
    const std::string posMod = " positionModifier=\"7\"";
    const std::string lined = replaceOnce(
        chartWith({{"g1", bar("b1", "s1")}}, "<style id=\"lineSymbol\" symbol=\"line\" color=\"black\"/>"),
        "style=\"s1\"", "style=\"lineSymbol\"");
    const std::string named =
        chartWith({{"g1", bar("my_dropdownline", "s1") + bar("an_errorbar", "s2") + bar("plain", "s3")}});
    const std::string points =
        chartWith({{"g1", "<point id=\"plain\" style=\"s1\" coordinates=\"COORD\"/>"
                          "<point id=\"binned\" style=\"s2\" coordinates=\"COORD\"><binStatistic/></point>"
                          "<line id=\"line\" style=\"s3\" coordinates=\"COORD\"/>"}});
    const std::string ranges = chartWith(
        {{"g1",
          "<interval id=\"r1\" style=\"sq\" coordinates=\"COORD\"><summaryStatistic method=\"7\"/></interval>"
          "<interval id=\"r2\" style=\"s2\" coordinates=\"COORD\"><summaryStatistic "
          "method=\"7\"/></interval>"}},
        "<style id=\"sq\" symbol=\"square\" color=\"black\"/>");
    std::string special;
    const char* ids[] = {"series_1", "my_control", "AIMx",     "biplot1",
                         "centroid", "guide1",     "survival", "triplot"};
    for (int i = 0; i < 8; ++i)
        special += bar(ids[i], "s" + std::to_string(i + 1));
    const struct {
        std::string chart, body, expect;
        const char* changed;
    } rows[] = {
        // Clustered bars take their own subtype only.
        {"clustered-bar.xml", setStyle("bar", kRed), "barStyle:!red", nullptr},
        {"clustered-bar.xml", setStyle("bar", kRed, sub("clustered")), "barStyle:red", nullptr},
        // Position modifier 7 keeps an unclustered bar out, but not a clustered one.
        {chartWith({{"g1", bar("b1", "s1", posMod) + bar("b2", "s2")}}), setStyle("bar", kRed),
         "s1:black s2:red", nullptr},
        {chartWith({{"g1", bar("b1", "s1", posMod), false, false, true}}),
         setStyle("bar", kRed, sub("clustered")), "s1:red", nullptr},
        // Intervals drawn as lines are drop lines, never bars; I-beams error bars only.
        {lined, setStyle("dropline", kRed), "lineSymbol:red", nullptr},
        {lined, setStyle("bar", kRed), "lineSymbol:black", nullptr},
        {"error-bars.xml", setStyle("errorbar", kRed), "errorbarStyle:red", nullptr},
        {"error-bars.xml", setStyle("dropline", kRed), "errorbarStyle:!red", nullptr},
        // Ids name their interval's kind; under "bar" the named ones are bars like any other.
        {named, setStyle("dropline", kRed), "s1:red s2:black s3:black", nullptr},
        {named, setStyle("bar", kRed), "s1:red s2:red s3:red", nullptr},
        // Special chart elements are never styled.
        {chartWith({{"g1", special + bar("ordinary", "s9")}}), setStyle("bar", kRed), "s9:red", "s9"},
        {chartWith({{"g1", "<line id=\"series_line\" style=\"s1\" coordinates=\"COORD\"/>"
                           "<line id=\"line\" style=\"s2\" coordinates=\"COORD\"/>"}}),
         setStyle("line", kRed), "s1:black s2:red", nullptr},
        // Scatter points with bins take only the dot subtype.
        {points, setStyle("scatter", kRed), "s1:red s2:black s3:black", nullptr},
        {points, setStyle("scatter", kRed, sub("dot")), "s2:red", nullptr},
        // Ranges.
        {ranges, setStyle("range", kRed), "sq:red s2:black", nullptr},
        // Schema parts take their own styles; an unknown part the box's own.
        {"boxplot.xml", setStyle("schema", kRed, sub("whatever")), "boxStyle:red", nullptr},
        // The coordinate attribute chooses the coordinates.
        {"dual-y-axis.xml", setStyle("line", "<style coordinate=\"1\" color=\"red\"/>"), "lineStyle:red",
         nullptr},
        {"dual-y-axis.xml", setStyle("line", "<style coordinate=\"0\" color=\"red\"/>"), "", ""},
        // Patterned bars without a colour are whitened.
        {chartWith(
             {{"g1",
               "<interval id=\"b1\" style=\"bare\" coordinates=\"COORD\"><styleBy "
               "id=\"pattern_1\"/></interval>"
               "<interval id=\"b2\" style=\"s2\" coordinates=\"COORD\"><styleBy id=\"pattern_2\"/></interval>"
               "<interval id=\"b3\" style=\"bare2\" coordinates=\"COORD\"><styleBy "
               "id=\"dash_1\"/></interval>"}},
             "<style id=\"bare\"/><style id=\"bare2\"/>"),
         setStyle("bar", "<style stroke-width=\"2pt\"/>"),
         "bare:white s2:black bare2:- bare2.stroke-width:2pt", nullptr},
    };
    for (const auto& row : rows)
        expectStyles(row.chart, row.body, row.expect, row.changed);
}

TEST_F(SetStyle, ThreeDimensionalLinesOnlyUnderThe3DSubtypeAndPiesWithTheSizeRuleWrittenBack) {
    const std::string text = chartWith({{"flat", "<line id=\"f\" style=\"s1\" coordinates=\"COORD\"/>"},
                                        {"deep",
                                         "<path id=\"p\" style=\"s2\" coordinates=\"COORD\"/>"
                                         "<edge id=\"e\" style=\"s3\" coordinates=\"COORD\"/>",
                                         false, true}});
    expectStyles(text, setStyle("line", kRed, sub("3D")), "s1:black s2:red s3:red");
    expectStyles(text, setStyle("line", kRed), "s1:red s2:black s3:black");

    // The template's own declaration is rewritten: the size goes, the width is the whole.
    expectStyles("pie.xml", setStyle("pie", "<style color=\"red\" size=\"30%\" width=\"50%\"/>"),
                 "sliceStyle:red sliceStyle.width:100%");
    // Without a width none is added; bars of a pie take nothing and leave the declaration be.
    for (const char* type : {"pie", "bar"}) {
        const DOMElement* declaration = instruction(setStyle(type, "<style color=\"red\" size=\"30%\"/>"));
        plotaid::detail::TStyle(nullptr, sample("pie.xml"), declaration).apply();
        EXPECT_EQ(attr(declaration->getFirstElementChild(), "size") + " " +
                      attr(declaration->getFirstElementChild(), "width"),
                  std::string(*type == 'p' ? "-" : "30%") + " -");
    }
    expectStyles("pie.xml", setStyle("bar", "<style color=\"red\" size=\"30%\"/>"), "", "");
}

TEST_F(SetStyle, ElementsAndSchemaPartsWithoutAStyleGetANewOne) {
    EXPECT_EQ(referred(expectStyles(chartWith({{"g1", "<interval id=\"b1\" coordinates=\"COORD\"/>"}}),
                                    setStyle("bar", kRed), "style1:red", "c-o-n-t-a-i-n-er style1"),
                       "b1", "style"),
              "style1 red");
    GrxVisualization& bare =
        expectStyles(chartWith({{"g1", "<schema id=\"box\" style=\"s1\" coordinates=\"COORD\"/>"}}),
                     setStyle("schema", kRed, sub("medianStyle")), "s1:black");
    const GrxSchema* schema = byId<GrxSchema>(bare, "box");
    EXPECT_EQ(attr(schema->getMedianStyle(), "color"), "red");
    EXPECT_EQ(schema->getHingeStyle(), nullptr);
}

} // namespace
