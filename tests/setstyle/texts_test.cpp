// "setStyle" without a type (one style by id) and for texts: titles, legends, axes and panels.
#include "StyleSupport.h"

using namespace setstyle_test;

namespace {

using StyleById = SetStyleTest;

TEST_F(StyleById, TheNamedStyleTakesDeclarationZero) {
    Chart chart = sample("simple-bar.xml");
    const auto before = styleSnapshot(chart);
    EXPECT_TRUE(apply(chart, "<setStyle id=\"titleStyle\"><style color=\"red\"/></setStyle>"));
    EXPECT_EQ(changedStyles(before, styleSnapshot(chart)), (std::vector<std::string>{"titleStyle"}));
    EXPECT_EQ(attr(styleById(chart, "titleStyle"), "color"), "red");
}

TEST_F(StyleById, NestedStylesAreFound) {
    Chart chart = load(chartOf("<style id=\"outer\" color=\"black\"><style id=\"middle\">"
                               "<style id=\"inner\" color=\"black\"/></style></style><style id=\"after\"/>"));
    EXPECT_TRUE(apply(chart, "<setStyle id=\"inner\"><style color=\"red\"/></setStyle>"));
    EXPECT_EQ(attr(styleById(chart, "inner"), "color"), "red");
    EXPECT_EQ(attr(styleById(chart, "outer"), "color"), "black");
    EXPECT_TRUE(apply(chart, "<setStyle id=\"after\"><style color=\"blue\"/></setStyle>"));
    EXPECT_EQ(attr(styleById(chart, "after"), "color"), "blue");
}

TEST_F(StyleById, NoSuchStyleOrNoDeclarationZeroFailsAndChangesNothing) {
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

TEST_F(TextStyles, AxisTitlesByRoleAndSecondAxis) {
    const struct {
        const char* subtype;
        const char* styled;
    } cases[] = {{"xaxis_title", "l1"},
                 {"xaxis_title2", "l2"},
                 {"yaxis_title", "l3"},
                 // A dimension with one axis gives its first for "2" as well.
                 {"yaxis_title2", "l3"}};
    for (const auto& c : cases) {
        Chart chart = load(axesChart());
        const auto before = styleSnapshot(chart);
        EXPECT_TRUE(apply(chart, std::string("<setStyle type=\"text\" subtype=\"") + c.subtype +
                                     "\"><style color=\"red\"/></setStyle>"));
        EXPECT_EQ(changedStyles(before, styleSnapshot(chart)), (std::vector<std::string>{c.styled}))
            << c.subtype;
        EXPECT_EQ(attr(styleById(chart, c.styled), "color"), "red") << c.subtype;
    }
    // No z axis: nothing.
    Chart chart = load(axesChart());
    const std::string before = chart.vis->AsUTF8();
    apply(chart, "<setStyle type=\"text\" subtype=\"zaxis_title\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(chart.vis->AsUTF8(), before);
}

TEST_F(TextStyles, ATextFrameOfALabelIsMadeWhereMissing) {
    Chart chart = load(axesChart());
    apply(chart, "<setStyle type=\"textFrame\" subtype=\"xaxis_title\"><style color=\"red\"/></setStyle>");
    auto* label = dynamic_cast<GrxLabel*>(byId(chart, "x1l"));
    ASSERT_NE(label, nullptr);
    GrxStyle* frame = label->getTextFrameStyle();
    ASSERT_NE(frame, nullptr);
    EXPECT_EQ(attr(frame, "id"), "text1");
    EXPECT_EQ(attr(frame, "color"), "red");
    EXPECT_EQ(attr(styleById(chart, "l1"), "color"), "black");
}

TEST_F(TextStyles, LegendTickTextsAndTheLegendTitle) {
    Chart chart = sample("simple-bar.xml");
    const auto before = styleSnapshot(chart);
    EXPECT_TRUE(
        apply(chart, "<setStyle type=\"text\" subtype=\"legend1\"><style color=\"red\"/></setStyle>"));
    EXPECT_EQ(attr(styleById(chart, "legend_1tickTextStyle"), "color"), "red");
    // The slot "legend1" also names the legend, whose title style is styled as well.
    EXPECT_EQ(attr(styleById(chart, "axisLabelStyle"), "color"), "red");
    EXPECT_EQ(changedStyles(before, styleSnapshot(chart)),
              (std::vector<std::string>{"axisLabelStyle", "legend_1tickTextStyle"}));

    // Missing tick styles are made under fresh ids.
    const std::string without = replaced(engine_test::example("charts/simple-bar.xml"),
                                         " tickTextStyle=\"legend_1tickTextStyle\"", "");
    Chart made = load(without);
    apply(made, "<setStyle type=\"text\" subtype=\"legend1\"><style color=\"red\"/></setStyle>");
    auto* legend = dynamic_cast<GrxLegend*>(byId(made, "legend_1"));
    ASSERT_NE(legend, nullptr);
    ASSERT_NE(legend->getTickTextStyle(), nullptr);
    EXPECT_EQ(attr(legend->getTickTextStyle(), "id"), "legend_1tickTextStyle1");
    EXPECT_EQ(attr(legend->getTickTextStyle(), "color"), "red");
    EXPECT_EQ(attr(styleById(made, "legend_1tickTextStyle"), "color"), "black");

    Chart frames = sample("simple-bar.xml");
    apply(frames, "<setStyle type=\"textFrame\" subtype=\"legend1\"><style color=\"red\"/></setStyle>");
    legend = dynamic_cast<GrxLegend*>(byId(frames, "legend_1"));
    ASSERT_NE(legend->getTickFrameStyle(), nullptr);
    EXPECT_EQ(attr(legend->getTickFrameStyle(), "id"), "legend_11");
    EXPECT_EQ(attr(legend->getTickFrameStyle(), "color"), "red");
    EXPECT_EQ(attr(styleById(frames, "legend_1tickTextStyle"), "color"), "black");

    // The second legend slot is empty here.
    Chart second = sample("simple-bar.xml");
    const std::string text = second.vis->AsUTF8();
    apply(second, "<setStyle type=\"text\" subtype=\"legend2\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(second.vis->AsUTF8(), text);
}

TEST_F(TextStyles, ExtensionSlotsNameTitlesFootnotesAndTheirFrames) {
    Chart title = sample("simple-bar.xml");
    apply(title,
          "<setStyle type=\"text\" subtype=\"title1\"><style color=\"red\"/><style font-size=\"20pt\"/>"
          "</setStyle>");
    EXPECT_EQ(attr(styleById(title, "titleStyle"), "color"), "red");
    EXPECT_EQ(attr(styleById(title, "titleStyle"), "font-size").substr(0, 4), "20pt");
    EXPECT_NE(attr(styleById(title, "footnoteStyle"), "color"), "red");

    Chart footnote = sample("simple-bar.xml");
    const auto before = styleSnapshot(footnote);
    apply(footnote, "<setStyle type=\"text\" subtype=\"footnote2\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(changedStyles(before, styleSnapshot(footnote)), (std::vector<std::string>{"footnoteStyle"}));

    Chart frame = sample("simple-bar.xml");
    apply(frame, "<setStyle type=\"labelFrame\" subtype=\"title1\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(frame, "frameStyle"), "color"), "red");
    EXPECT_NE(attr(styleById(frame, "titleStyle"), "color"), "red");

    // A frame without a style gets one named after it.
    Chart bare = load(chartOf("<extension id=\"ext\" title1=\"t\" legend1=\"g\"/>"
                              "<labelFrame id=\"t\"><label id=\"tl\"/></labelFrame><graph id=\"g\"/>"));
    apply(bare, "<setStyle type=\"labelFrame\" subtype=\"title1\"><style color=\"red\"/></setStyle>");
    auto* labelFrame = dynamic_cast<GrxLabelFrame*>(byId(bare, "t"));
    ASSERT_NE(labelFrame->getStyle(), nullptr);
    EXPECT_EQ(attr(labelFrame->getStyle(), "id"), "t1");
    EXPECT_EQ(attr(labelFrame->getStyle(), "color"), "red");
    // A slot naming something else than a frame or a legend is passed over.
    const std::string text = bare.vis->AsUTF8();
    apply(bare, "<setStyle type=\"labelFrame\" subtype=\"legend1\"><style color=\"red\"/></setStyle>");
    apply(bare, "<setStyle type=\"text\" subtype=\"legend1\"><style color=\"red\"/></setStyle>");
    apply(bare, "<setStyle type=\"labelFrame\" subtype=\"\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(bare.vis->AsUTF8(), text);
}

TEST_F(TextStyles, AxisTickLabelsAndTheirFrames) {
    Chart chart = load(axesChart());
    apply(chart, "<setStyle type=\"text\" subtype=\"xaxis_labels\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(chart, "tick"), "color"), "red");
    EXPECT_EQ(attr(styleById(chart, "tickFrame"), "color"), "black");
    Chart frames = load(axesChart());
    apply(frames, "<setStyle type=\"textFrame\" subtype=\"xaxis_labels\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(frames, "tickFrame"), "color"), "red");
    EXPECT_EQ(attr(styleById(frames, "tick"), "color"), "black");

    // Missing ones are made as "<ticks id>s"; a frame style never takes the text style's place.
    Chart bare = load(axesChart("<majorTicks id=\"xt\" style=\"tick\"/>"));
    apply(bare, "<setStyle type=\"textFrame\" subtype=\"xaxis_labels\"><style color=\"red\"/></setStyle>");
    auto* ticks = dynamic_cast<GrxMajorTicks*>(byId(bare, "xt"));
    ASSERT_NE(ticks, nullptr);
    ASSERT_NE(ticks->getTickFrameStyle(), nullptr);
    EXPECT_EQ(attr(ticks->getTickFrameStyle(), "id"), "xts");
    EXPECT_EQ(attr(ticks->getTickFrameStyle(), "color"), "red");
    EXPECT_EQ(attr(ticks->getStyle(), "id"), "tick");
    EXPECT_EQ(attr(styleById(bare, "tick"), "color"), "black");

    Chart unstyled = load(axesChart("<majorTicks id=\"xt\"/>"));
    apply(unstyled, "<setStyle type=\"text\" subtype=\"xaxis_labels\"><style color=\"red\"/></setStyle>");
    ticks = dynamic_cast<GrxMajorTicks*>(byId(unstyled, "xt"));
    ASSERT_NE(ticks->getStyle(), nullptr);
    EXPECT_EQ(attr(ticks->getStyle(), "id"), "xts");
    EXPECT_EQ(attr(ticks->getStyle(), "color"), "red");

    // The sample: x and y ticks share one style.
    Chart bar = sample("simple-bar.xml");
    apply(bar, "<setStyle type=\"text\" subtype=\"yaxis_labels\"><style font-size=\"11pt\"/></setStyle>");
    EXPECT_EQ(attr(styleById(bar, "tickLabelStyle"), "font-size").substr(0, 4), "11pt");
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

TEST_F(TextStyles, PanelTickLabelsByLevel) {
    Chart all = load(facetChart());
    apply(all, "<setStyle type=\"text\" subtype=\"panel_labels\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(all, "ticksA"), "color"), "red");
    EXPECT_EQ(attr(styleById(all, "axisA"), "color"), "black");
    // The bare level gets an axis that draws nothing, and ticks; they have no style to take the text.
    auto* levelB = dynamic_cast<GrxFacetLevel*>(byId(all, "B"));
    ASSERT_NE(levelB, nullptr);
    ASSERT_EQ(levelB->getAxiss().size(), 1u);
    GrxAxis* axis = levelB->getAxiss().front();
    ASSERT_NE(axis->getStyle(), nullptr);
    EXPECT_EQ(attr(axis->getStyle(), "color"), "transparent");
    EXPECT_EQ(attr(axis->getStyle(), "id"), "axis1");
    EXPECT_EQ(axis->getMajorTickss().size(), 1u);

    Chart second = load(facetChart());
    apply(second,
          "<setStyle type=\"text\" subtype=\"panel_labels\" level=\"2\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(second, "ticksA"), "color"), "black");
    EXPECT_EQ(dynamic_cast<GrxFacetLevel*>(byId(second, "B"))->getAxiss().size(), 1u);

    Chart first = load(facetChart());
    apply(first,
          "<setStyle type=\"text\" subtype=\"panel_labels\" level=\"1\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(first, "ticksA"), "color"), "red");
    EXPECT_TRUE(dynamic_cast<GrxFacetLevel*>(byId(first, "B"))->getAxiss().empty());

    // Frames: only ticks that have a frame style take it.
    Chart frames = load(facetChart());
    const auto before = styleSnapshot(frames);
    apply(frames, "<setStyle type=\"textFrame\" subtype=\"panel_labels\" level=\"1\"><style "
                  "color=\"red\"/></setStyle>");
    EXPECT_TRUE(changedStyles(before, styleSnapshot(frames)).empty());

    Chart panels = sample("panels.xml");
    apply(panels, "<setStyle type=\"text\" subtype=\"panel_labels\"><style font-size=\"7pt\"/></setStyle>");
    EXPECT_EQ(attr(styleById(panels, "panelLabelStyle"), "font-size").substr(0, 3), "7pt");
}

TEST_F(TextStyles, PanelTitlesByLevelWithMissingLabelsMade) {
    Chart first = load(facetChart());
    apply(first,
          "<setStyle type=\"text\" subtype=\"panel_title\" level=\"1\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(first, "titleA"), "color"), "red");
    EXPECT_TRUE(dynamic_cast<GrxFacetLevel*>(byId(first, "B"))->getAxiss().empty());

    Chart second = load(facetChart());
    apply(second,
          "<setStyle type=\"text\" subtype=\"panel_title\" level=\"2\"><style color=\"red\"/></setStyle>");
    EXPECT_EQ(attr(styleById(second, "titleA"), "color"), "black");
    auto* levelB = dynamic_cast<GrxFacetLevel*>(byId(second, "B"));
    ASSERT_EQ(levelB->getAxiss().size(), 1u);
    GrxLabel* label = levelB->getAxiss().front()->getLabel();
    ASSERT_NE(label, nullptr);
    EXPECT_EQ(attr(label, "id"), "labelB1");
    ASSERT_NE(label->getStyle(), nullptr);
    EXPECT_EQ(attr(label->getStyle(), "id"), "stylelabelB11");
    EXPECT_EQ(attr(label->getStyle(), "color"), "red");

    Chart panels = sample("panels.xml");
    apply(panels, "<setStyle type=\"textFrame\" subtype=\"panel_title\"><style color=\"red\"/></setStyle>");
    auto* facetLabel = dynamic_cast<GrxLabel*>(byId(panels, "facet_gender_label"));
    ASSERT_NE(facetLabel->getTextFrameStyle(), nullptr);
    EXPECT_EQ(attr(facetLabel->getTextFrameStyle(), "color"), "red");
    EXPECT_NE(attr(styleById(panels, "axisLabelStyle"), "color"), "red");
}

TEST_F(TextStyles, LabelsInsideElementsAreNotStyledHere) {
    Chart chart = sample("simple-bar.xml");
    const std::string before = chart.vis->AsUTF8();
    EXPECT_TRUE(apply(
        chart, "<setStyle type=\"text\" subtype=\"labeling_inside\"><style color=\"red\"/></setStyle>"));
    EXPECT_EQ(chart.vis->AsUTF8(), before);
}

} // namespace
