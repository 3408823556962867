// "setStyle" without a type (one style by id) and for texts: titles, legends, axes and panels.
#include "StyleSupport.h"

using namespace setstyle_test;

namespace {

std::string textStyle(const std::string& type, const std::string& subtype, const std::string& style = kRed) {
    return setStyle(type, style, sub(subtype));
}

using StyleById = SetStyleTest;

TEST_F(StyleById, TheNamedStyleTakesDeclarationZeroWhereverItIs) {
    expectStyles("simple-bar.xml", "<setStyle id=\"titleStyle\"><style color=\"red\"/></setStyle>",
                 "titleStyle:red", "titleStyle");
    const std::string nested = chartOf("<style id=\"outer\" color=\"black\"><style id=\"middle\">"
                                       "<style id=\"inner\" color=\"black\"/></style></style>");
    expectStyles(nested, "<setStyle id=\"inner\"><style color=\"red\"/></setStyle>", "inner:red outer:black",
                 "inner");

    const std::string text = chartOf("<style color=\"black\"/><style id=\"known\" color=\"black\"/>"
                                     "<graph id=\"notAStyle\"/>");
    for (const char* body :
         {"<setStyle id=\"unknown\"><style color=\"red\"/></setStyle>",
          "<setStyle id=\"notAStyle\"><style color=\"red\"/></setStyle>",
          "<setStyle id=\"known\"><style number=\"1\" color=\"red\"/></setStyle>", "<setStyle id=\"known\"/>",
          // An empty id does not pick the style that has none.
          "<setStyle><style color=\"red\"/></setStyle>"}) {
        Chart chart = load(text);
        const std::string before = chart.vis->AsUTF8();
        EXPECT_FALSE(apply(chart, body)) << body;
        EXPECT_EQ(chart.vis->AsUTF8(), before) << body;
    }
}

// A chart with an x dimension of two titled axes and a y dimension of one.
std::string
axesChart(const std::string& xTicks = "<majorTicks id=\"xt\" style=\"tick\" tickFrameStyle=\"tickFrame\"/>") {
    return chartOf("<style id=\"l1\" color=\"black\"/><style id=\"l2\" color=\"black\"/>"
                   "<style id=\"l3\" color=\"black\"/><style id=\"tick\" color=\"black\"/>"
                   "<style id=\"tickFrame\" color=\"black\"/>"
                   "<graph id=\"g\"><coordinates id=\"c\">"
                   "<dimension id=\"x\"><axis id=\"x1\"><label id=\"x1l\" style=\"l1\"/>" +
                   xTicks +
                   "</axis><axis id=\"x2\"><label id=\"x2l\" style=\"l2\"/></axis></dimension>"
                   "<dimension id=\"y\"><axis id=\"y1\"><label id=\"y1l\" style=\"l3\"/></axis></dimension>"
                   "</coordinates></graph>");
}

using TextStyles = SetStyleTest;

TEST_F(TextStyles, EachSlotReachesItsOwnTextsOnly) {
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

TEST_F(TextStyles, MissingFrameAndTickStylesAreMadeUnderFreshIds) {
    const std::string legendWithout = replaceOnce(engine_test::example("charts/simple-bar.xml"),
                                                  " tickTextStyle=\"legend_1tickTextStyle\"", "");
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
    for (const auto& row : rows) {
        const Chart chart = expectStyles(row.chart, row.body, row.expect);
        EXPECT_EQ(referred(chart, row.element.c_str(), row.reference.c_str()), row.made) << row.body;
    }
    // A slot naming neither a frame nor a legend is passed over.
    for (const std::string& body : {textStyle("labelFrame", "legend1"), textStyle("labelFrame", "")})
        expectStyles(extension, body, "", "");
}

// Two facet levels: the first with an axis of its own, the second with none.
std::string facetChart() {
    return chartOf("<style id=\"axisA\" color=\"black\"/><style id=\"ticksA\" color=\"black\"/>"
                   "<style id=\"titleA\" color=\"black\"/>"
                   "<graph id=\"g\"><facetLayout id=\"fl\">"
                   "<facetLevel id=\"A\" level=\"1\"><axis id=\"axA\" style=\"axisA\"><label id=\"labA\" "
                   "style=\"titleA\"/><majorTicks id=\"mtA\" style=\"ticksA\"/></axis></facetLevel>"
                   "<facetLevel id=\"B\" level=\"2\"/>"
                   "</facetLayout></graph>");
}

std::string panel(const std::string& type, const std::string& subtype, const std::string& level) {
    return setStyle(type, kRed, sub(subtype) + (level.empty() ? "" : " level=\"" + level + "\""));
}

// The number of axes of the facet level B.
std::size_t axesOfB(const Chart& chart) {
    auto* level = dynamic_cast<GrxFacetLevel*>(GrxBaseElement::wrapperOf(chart.vis->getElementById(u"B")));
    return level ? level->getAxiss().size() : 99;
}

TEST_F(TextStyles, PanelLabelsAndTitlesByLevel) {
    EXPECT_EQ(axesOfB(expectStyles(facetChart(), panel("text", "panel_labels", "1"), "ticksA:red axisA:black",
                                   "ticksA")),
              0u);
    expectStyles(facetChart(), panel("text", "panel_title", "1"), "titleA:red", "titleA");
    expectStyles(facetChart(), panel("text", "panel_title", "2"), "titleA:black", nullptr);
    // Only ticks that have a frame style take a frame.
    expectStyles(facetChart(), panel("textFrame", "panel_labels", "1"), "", "");
    expectStyles("panels.xml", panel("text", "panel_labels", ""), "panelLabelStyle:red", nullptr);

    // A level without an axis gets one that draws nothing, with ticks that have no style to take.
    Chart all = load(facetChart());
    apply(all, panel("text", "panel_labels", ""));
    EXPECT_EQ(attr(styleById(all, "ticksA"), "color"), "red");
    ASSERT_EQ(axesOfB(all), 1u);
    GrxAxis* axis = dynamic_cast<GrxFacetLevel*>(byId(all, "B"))->getAxiss().front();
    EXPECT_EQ(attr(axis->getStyle(), "id") + " " + attr(axis->getStyle(), "color"), "axis1 transparent");
    EXPECT_EQ(axis->getMajorTickss().size(), 1u);
    // A panel title of such a level is made with its label.
    Chart second = load(facetChart());
    apply(second, panel("text", "panel_title", "2"));
    ASSERT_EQ(axesOfB(second), 1u);
    GrxLabel* label = dynamic_cast<GrxFacetLevel*>(byId(second, "B"))->getAxiss().front()->getLabel();
    ASSERT_NE(label, nullptr);
    EXPECT_EQ(attr(label, "id"), "labelB1");
    EXPECT_EQ(attr(label->getStyle(), "id") + " " + attr(label->getStyle(), "color"), "stylelabelB11 red");

    Chart panels = sample("panels.xml");
    apply(panels, panel("textFrame", "panel_title", ""));
    auto* facetLabel = dynamic_cast<GrxLabel*>(byId(panels, "facet_gender_label"));
    ASSERT_NE(facetLabel, nullptr);
    EXPECT_EQ(attr(facetLabel->getTextFrameStyle(), "color"), "red");
    EXPECT_NE(attr(styleById(panels, "axisLabelStyle"), "color"), "red");
}

} // namespace
