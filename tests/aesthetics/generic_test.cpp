// "setGenericAttributes": the instruction's attributes written straight onto chosen chart nodes or
// their styles, counted by tag and parent, with the text replaced through `text`.
#include "AestheticsSupport.h"

#include "templates/actions/aesthetics.h"

#include <xercesc/dom/DOM.hpp>

using namespace aesthetics_test;
using engine_test::EngineTest;
using plotaid::detail::TSetGenericAttributes;
using XERCES_CPP_NAMESPACE::DOMElement;
using XERCES_CPP_NAMESPACE::DOMNodeList;

namespace {

// Three labels: two under label frames, one under an axis.
const std::string kFrames = "  <labelFrame id=\"frame_1\">\n"
                            "    <label id=\"label_1\" style=\"plainStyle\"><text>First</text></label>\n"
                            "  </labelFrame>\n"
                            "  <labelFrame id=\"frame_2\">\n"
                            "    <label id=\"label_2\"><text>Second</text></label>\n"
                            "  </labelFrame>\n";
const std::string kAxis = "    <coordinates id=\"coordinates_2\"><dimension id=\"dim_z\">\n"
                          "      <axis id=\"axis_z\"><label id=\"label_3\"><text>Axis</text></label></axis>\n"
                          "    </dimension></coordinates>\n";

Chart labels() {
    return Chart::parse(chartWith(kAxis, kFrames));
}

std::string written(const GrxVisualization& chart, const char* id, const char* name) {
    const DOMElement* e = chart.getElementById(ChartString(id));
    return e != nullptr ? text(e->getAttribute(ChartString(name).xc_str())) : std::string("<no such id>");
}

using SetGenericAttributes = EngineTest;

TEST_F(SetGenericAttributes, EveryMatchingNodeTakesTheAttributes) {
    Chart chart = labels();
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"label\" textFrameStyle=\"plainStyle\" data-note=\"n\"/>",
        *chart.vis));
    for (const char* id : {"label_1", "label_2", "label_3"}) {
        EXPECT_EQ(written(*chart.vis, id, "textFrameStyle"), "plainStyle") << id;
        EXPECT_EQ(written(*chart.vis, id, "data-note"), "n") << id;
        // The selectors are the instruction's own.
        EXPECT_EQ(written(*chart.vis, id, "elementName"), "") << id;
    }
    EXPECT_EQ(written(*chart.vis, "frame_1", "data-note"), "");
}

TEST_F(SetGenericAttributes, OnASampleChartTheTitleAndTickLengthsChange) {
    Chart chart = Chart::parse(engine_test::example("charts/line-series.xml"));
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(
        applyAction<TSetGenericAttributes>("<setGenericAttributes elementName=\"text\" parentName=\"label\" "
                                           "count=\"1\" text=\"Quarterly Sales\"/>",
                                           *chart.vis));
    EXPECT_EQ(text(byId<GrxLabel>(*chart.vis, "title_1_label")->getAllText().xc_str()), "Quarterly Sales");
    EXPECT_EQ(text(byId<GrxLabel>(*chart.vis, "subtitle_1_label")->getAllText().xc_str()),
              "Fiscal year 2025");
    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"majorTicks\" length=\"8pt\"/>", *chart.vis));
    EXPECT_EQ(written(*chart.vis, "dim_x_majorTicks", "length"), "8pt");
    EXPECT_EQ(written(*chart.vis, "dim_y_majorTicks", "length"), "8pt");
    EXPECT_EQ(xercesProblems(*chart.vis), "");
    EXPECT_EQ(xmllintProblems(*chart.vis), "");
}

TEST_F(SetGenericAttributes, CountPicksTheNthMatchAndParentNameNarrowsWhatIsCounted) {
    Chart chart = labels();
    ASSERT_TRUE(chart.vis);
    // In document order the axis label comes first (the graph precedes the frames).
    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"label\" count=\"2\" data-n=\"2\"/>", *chart.vis));
    EXPECT_EQ(written(*chart.vis, "label_3", "data-n"), "");
    EXPECT_EQ(written(*chart.vis, "label_1", "data-n"), "2");
    EXPECT_EQ(written(*chart.vis, "label_2", "data-n"), "");

    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"label\" parentName=\"labelFrame\" count=\"2\" data-p=\"x\"/>",
        *chart.vis));
    EXPECT_EQ(written(*chart.vis, "label_2", "data-p"), "x");
    EXPECT_EQ(written(*chart.vis, "label_1", "data-p"), "");
    EXPECT_EQ(written(*chart.vis, "label_3", "data-p"), "");

    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"label\" parentName=\"axis\" data-a=\"y\"/>", *chart.vis));
    EXPECT_EQ(written(*chart.vis, "label_3", "data-a"), "y");
    EXPECT_EQ(written(*chart.vis, "label_1", "data-a"), "");

    // A count past the matches writes nothing.
    const std::string before = chart.vis->AsUTF8();
    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"label\" count=\"4\" data-n=\"9\"/>", *chart.vis));
    EXPECT_EQ(chart.vis->AsUTF8(), before);
}

TEST_F(SetGenericAttributes, TheTextAttributeReplacesTheNodesText) {
    Chart chart = labels();
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"text\" parentName=\"label\" count=\"3\" text=\"Replaced\"/>",
        *chart.vis));
    EXPECT_EQ(text(byId<GrxLabel>(*chart.vis, "label_2")->getAllText().xc_str()), "Replaced");
    EXPECT_EQ(text(byId<GrxLabel>(*chart.vis, "label_1")->getAllText().xc_str()), "First");
    // Written as text, not as an attribute.
    const DOMNodeList* texts =
        byId<GrxLabel>(*chart.vis, "label_2")->getImplementation()->getElementsByTagName(u"text");
    ASSERT_EQ(texts->getLength(), 1u);
    EXPECT_FALSE(static_cast<const DOMElement*>(texts->item(0))->hasAttribute(u"text"));
    EXPECT_EQ(xercesProblems(*chart.vis), "");
}

TEST_F(SetGenericAttributes, AStyleNameWritesOnTheReferredStyleOrOnANewLinkedOne) {
    Chart chart = labels();
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"label\" parentName=\"labelFrame\" styleName=\"style\" "
        "font-weight=\"bold\"/>",
        *chart.vis));
    // label_1 refers to plainStyle: written there, the label itself untouched.
    EXPECT_EQ(written(*chart.vis, "plainStyle", "font-weight"), "bold");
    EXPECT_EQ(written(*chart.vis, "label_1", "font-weight"), "");
    // label_2 had no style: a new one, linked and written.
    const GrxStyle* made = byId<GrxLabel>(*chart.vis, "label_2")->getStyle();
    ASSERT_NE(made, nullptr);
    EXPECT_NE(text(made->getId()), "plainStyle");
    EXPECT_EQ(attribute(*made, "font-weight"), "bold");
    EXPECT_EQ(written(*chart.vis, "label_2", "font-weight"), "");
    // A reference that names nothing is passed over; an empty one gets a new style.
    byId<GrxLabel>(*chart.vis, "label_2")->SetAttribute(u"textFrameStyle", u"nowhere");
    const std::size_t stylesBefore = chart.vis->getStyleById(u"c-o-n-t-a-i-n-er")->getStyles().size();
    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"label\" parentName=\"labelFrame\" styleName=\"textFrameStyle\" "
        "data-x=\"1\"/>",
        *chart.vis));
    EXPECT_EQ(written(*chart.vis, "label_2", "textFrameStyle"), "nowhere");
    const std::string linked = written(*chart.vis, "label_1", "textFrameStyle");
    EXPECT_EQ(written(*chart.vis, linked.c_str(), "data-x"), "1");
    EXPECT_EQ(chart.vis->getStyleById(u"c-o-n-t-a-i-n-er")->getStyles().size(), stylesBefore + 1);
    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"label\" count=\"1\" styleName=\"id\" data-y=\"1\"/>",
        *chart.vis));
    // label_3's "id" names label_3 itself, so that is the node written.
    EXPECT_EQ(written(*chart.vis, "label_3", "data-y"), "1");
    EXPECT_EQ(xercesProblems(*chart.vis), "");
}

TEST_F(SetGenericAttributes, WithASourceOnlyWhatTheSourceStyleLeavesEmptyIsWritten) {
    const std::string chartText = chartWith(kAxis, kFrames);
    Chart chart = Chart::parse(chartText);
    Chart source = Chart::parse(chartText);
    ASSERT_TRUE(chart.vis && source.vis);
    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"label\" count=\"2\" styleName=\"style\" color=\"#FFFFFF\" "
        "font-size=\"20pt\" text=\"t\"/>",
        *chart.vis, source.vis.get()));
    EXPECT_EQ(written(*chart.vis, "plainStyle", "color"), "#112233");
    EXPECT_EQ(written(*chart.vis, "plainStyle", "font-size"), "20pt");
    // With a source node `text` is an attribute like any other.
    EXPECT_EQ(written(*chart.vis, "plainStyle", "text"), "t");
}

TEST_F(SetGenericAttributes, NothingToFindOrNothingToWriteIsAFailure) {
    Chart chart = labels();
    ASSERT_TRUE(chart.vis);
    const std::string before = chart.vis->AsUTF8();
    EXPECT_FALSE(applyAction<TSetGenericAttributes>("<setGenericAttributes/>", *chart.vis));
    EXPECT_FALSE(applyAction<TSetGenericAttributes>("<setGenericAttributes data-x=\"1\"/>", *chart.vis));
    EXPECT_FALSE(applyAction<TSetGenericAttributes>("<setGenericAttributes elementName=\"\" data-x=\"1\"/>",
                                                    *chart.vis));
    TSetGenericAttributes missing(nullptr, *chart.vis, nullptr);
    EXPECT_FALSE(missing.apply());
    EXPECT_EQ(chart.vis->AsUTF8(), before);
}

TEST_F(SetGenericAttributes, TheInstructionsIdAndQualifiedAttributesStayInTheTemplate) {
    Chart chart = labels();
    ASSERT_TRUE(chart.vis);
    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes id=\"rule7\" elementName=\"label\" xml:space=\"preserve\" data-x=\"1\"/>",
        *chart.vis));
    EXPECT_EQ(written(*chart.vis, "label_1", "data-x"), "1");
    EXPECT_EQ(chart.vis->getElementById(ChartString("rule7")), nullptr);
    // Attributes of the template document's own vocabularies stay there.
    EXPECT_FALSE(byId<GrxLabel>(*chart.vis, "label_1")->getImplementation()->hasAttribute(u"xml:space"));
    EXPECT_EQ(xercesProblems(*chart.vis), "");
}

TEST_F(SetGenericAttributes, StylesMadeOnTheWayAreNotMatchedAgain) {
    Chart chart = labels();
    ASSERT_TRUE(chart.vis);
    const DOMNodeList* styles = chart.base().getImplementation()->getElementsByTagName(u"style");
    const XMLSize_t before = styles->getLength();
    ASSERT_GT(before, 0u);
    // Every style without a "textStyle" gets a new one, which is a style without one too.
    EXPECT_TRUE(applyAction<TSetGenericAttributes>(
        "<setGenericAttributes elementName=\"style\" styleName=\"textStyle\" color=\"red\"/>", *chart.vis));
    // The chart's own styles each got one new style, all inside the one new container.
    EXPECT_EQ(styles->getLength(), 2 * before + 1);
    EXPECT_EQ(chart.vis->getStyleById(u"c-o-n-t-a-i-n-er")->getStyles().size(), before);
}

TEST_F(SetGenericAttributes, AppliedTwiceItWritesTheSameValuesAgain) {
    Chart once = labels();
    Chart twice = labels();
    ASSERT_TRUE(once.vis && twice.vis);
    const std::string instruction =
        "<setGenericAttributes elementName=\"label\" styleName=\"style\" color=\"#0000FF\" data-k=\"v\"/>";
    applyAction<TSetGenericAttributes>(instruction, *once.vis);
    applyAction<TSetGenericAttributes>(instruction, *twice.vis);
    applyAction<TSetGenericAttributes>(instruction, *twice.vis);
    EXPECT_EQ(twice.vis->AsUTF8(), once.vis->AsUTF8());
}

} // namespace
