// Ticks, grid lines and labels of an axis instruction, driven directly on the sample charts.
#include "templates/TemplateSupport.h"

using namespace template_test;

namespace {

const char* const kRed = "<style color=\"red\"/>";

class AxisParts : public TemplateTest {
protected:
    GrxVisualization& chart = sample("simple-bar.xml");
    Probe probe{nullptr, chart};
    GrxAxis& x = *byId<GrxAxis>(chart, "dim_x_axis");
    GrxAxis& y = *byId<GrxAxis>(chart, "dim_y_axis");
    const DOMElement* part(const std::string& text) { return instruction(text); }
    std::string colourOf(const GrxStyle* style) { return style ? attr(style, "color") : "<none>"; }
    void TearDown() override { EXPECT_EQ(grammar_test::chartFaults(chart), ""); }
};

TEST_F(AxisParts, MajorTicksAddOnlyWithoutStyleOnlyAndStyleOnlyStillSetsProperties) {
    // styleOnly on an axis without ticks adds none and changes nothing.
    x.removeMajorTickss();
    const std::string before = canonical(chart);
    probe.setMajorTicks(x, part("<majorTicks styleOnly=\"true\" position=\"inside\"><gridLines/></majorTicks>"));
    EXPECT_EQ(canonical(chart), before);
    // A role the axis's coordinates do not have: nothing either.
    probe.setMajorTicks(x, part("<majorTicks role=\"y2\"/>"));
    EXPECT_EQ(canonical(chart), before);
    probe.setMajorTicks(x, part("<majorTicks/>"));
    ASSERT_EQ(x.getMajorTickss().size(), 1u);

    // With ticks, styleOnly still applies every property, the grid line and the formats.
    GrxMajorTicks& ticks = *x.getMajorTickss().front();
    ticks.setDelta(7.0);
    probe.setMajorTicks(
        x, part("<majorTicks styleOnly=\"true\" position=\"cross\" length=\"5pt\" stagger=\"auto\" delta=\"2.5\""
                " deltaUnit=\"day\" base=\"10\"><gridLines/><numberFormat maximumFractionDigits=\"3\"/>"
                "<stringFormat prefix=\"[\"/></majorTicks>"));
    EXPECT_EQ(attributesOf(ticks.getImplementation()).find("stagger"), std::string::npos);
    for (const auto& [name, value] : std::vector<std::pair<const char*, const char*>>{
             {"position", "cross"}, {"length", "5pt"}, {"delta", "2.5"}, {"deltaUnit", "day"}, {"base", "10"}})
        EXPECT_EQ(attr(&ticks, name), value) << name;
    EXPECT_NE(ticks.getGridline(), nullptr);
    ASSERT_EQ(ticks.getFormats().size(), 1u); // every kind of format went into the one format
    EXPECT_EQ(attr(ticks.getFormats().front(), "maximumFractionDigits"), "3");
    EXPECT_EQ(attr(ticks.getFormats().front(), "prefix"), "[");

    // "auto" removes the delta; words the grammar does not know leave a property alone.
    probe.setMajorTicks(x, part("<majorTicks delta=\"auto\" position=\"sideways\" deltaUnit=\"fortnight\"/>"));
    EXPECT_EQ(attr(&ticks, "delta"), "-");
    EXPECT_EQ(attr(&ticks, "position"), "cross");
    EXPECT_EQ(attr(&ticks, "deltaUnit"), "day");
    probe.setMajorTicks(x, part("<majorTicks stagger=\"2\"/>"));
    EXPECT_EQ(attr(&ticks, "stagger"), "2");
}

TEST_F(AxisParts, TickLabelStylesSplitByNumberAndANewTickFrameIsHidden) {
    GrxMajorTicks& ticks = *x.getMajorTickss().front();
    ticks.removeTickFrameStyle();
    probe.setMajorTicks(x, part("<majorTicks><tickLabelStyle><style number=\"1\" color=\"red\"/>"
                                "<style number=\"2\" color=\"blue\"/></tickLabelStyle>"
                                "<markStyle><style color=\"green\"/></markStyle></majorTicks>"));
    ASSERT_NE(ticks.getTickFrameStyle(), nullptr);
    EXPECT_EQ(colourOf(ticks.getTickFrameStyle()), "red");
    EXPECT_FALSE(ticks.getTickFrameStyle()->getVisible());
    EXPECT_EQ(colourOf(ticks.getStyle()), "blue");
    EXPECT_EQ(colourOf(ticks.getMarkStyle()), "green");
}

TEST_F(AxisParts, MinorTicksNumberStyleOnlyAndTheMajorMarkColour) {
    GrxMinorTicks& minor = *y.getMinorTickss().front();
    probe.setMinorTicks(y, part("<minorTicks number=\"4\" position=\"outside\" length=\"1pt\"/>"));
    EXPECT_EQ(minor.getNumber(), 4);
    EXPECT_EQ(attr(&minor, "position"), "outside");
    EXPECT_EQ(attr(&minor, "length"), "1pt");
    // styleOnly restyles and sets nothing else: the number stays.
    probe.setMinorTicks(y, part("<minorTicks styleOnly=\"true\" number=\"9\"><markStyle>" + std::string(kRed) +
                                "</markStyle></minorTicks>"));
    EXPECT_EQ(minor.getNumber(), 4);
    EXPECT_EQ(colourOf(minor.getMarkStyle()), "red");
    probe.setMinorTicks(y, part("<minorTicks/>"));
    EXPECT_EQ(minor.getNumber(), 2);
    // Only a new mark style takes the major colour; so does only a new grid-line style.
    minor.setMarkStyle(*byId<GrxStyle>(chart, "titleStyle"));
    y.getMajorTickss().front()->getMarkStyle()->setColor(ChartString("#123456"));
    probe.setMinorTicks(y, part("<minorTicks/>"));
    probe.setMajorTicks(y, part("<majorTicks><gridLines/></majorTicks>"));
    EXPECT_EQ(colourOf(minor.getMarkStyle()), "black");
    EXPECT_EQ(attr(y.getMajorTickss().front()->getGridline()->getStyle(), "color"), "-");

    // New minor ticks get a mark style of the major mark colour.
    x.getMajorTickss().front()->getMarkStyle()->setColor(ChartString("#123456"));
    probe.setMinorTicks(x, part("<minorTicks styleOnly=\"true\"/>"));
    EXPECT_TRUE(x.getMinorTickss().empty());
    probe.setMinorTicks(x, part("<minorTicks/>"));
    ASSERT_EQ(x.getMinorTickss().size(), 1u);
    EXPECT_EQ(colourOf(x.getMinorTickss().front()->getMarkStyle()), "#123456");
}

TEST_F(AxisParts, GridLinesTakeTheMarkColourAndOneConditionalStyle) {
    GrxMajorTicks& ticks = *x.getMajorTickss().front();
    ticks.getMarkStyle()->setColor(ChartString("#654321"));
    const std::string withFacet =
        "<majorTicks><gridLines><style stroke-width=\"2pt\"/><facetStyle when=\"facet1==facet2\">" +
        std::string(kRed) + "</facetStyle></gridLines></majorTicks>";
    probe.setMajorTicks(x, part(withFacet));
    probe.setMajorTicks(x, part(withFacet)); // the condition replaces, never piles up
    const GrxGridline& grid = *ticks.getGridline();
    EXPECT_EQ(colourOf(grid.getStyle()), "#654321");
    EXPECT_EQ(attr(grid.getStyle(), "stroke-width"), "2pt");
    ASSERT_EQ(grid.getConditionalStyles().size(), 1u);
    EXPECT_EQ(attr(grid.getConditionalStyles().front(), "when"), "facet1==facet2");
    EXPECT_EQ(colourOf(grid.getConditionalStyles().front()->getStyle()), "red");
    // Without a condition the conditional styles stay.
    probe.styleGridLines(nullptr, *ticks.getGridline(), part("<gridLines><facetStyle/></gridLines>"));
    EXPECT_EQ(grid.getConditionalStyles().size(), 1u);
}

TEST_F(AxisParts, LabelsGetBlackTextAndAHiddenTransparentFrame) {
    GrxLabel& label = *x.getLabel();
    label.removeStyle();
    probe.styleLabel(label, nullptr);
    EXPECT_EQ(colourOf(label.getStyle()), "black");
    EXPECT_EQ(colourOf(y.getLabel()->getTextFrameStyle()), "<none>"); // only the label asked for
    const GrxStyle* frame = label.getTextFrameStyle();
    ASSERT_NE(frame, nullptr);
    EXPECT_EQ(attr(frame, "color") + " " + attr(frame, "color2"), "transparent transparent");
    EXPECT_FALSE(frame->getVisible());
    probe.styleLabel(label, part("<label><style number=\"1\" color=\"red\"/><style color=\"blue\"/></label>"));
    EXPECT_EQ(colourOf(label.getTextFrameStyle()), "red");
    EXPECT_EQ(colourOf(label.getStyle()), "blue");
}

} // namespace
