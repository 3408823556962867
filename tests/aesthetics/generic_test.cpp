// "setGenericAttributes": the instruction's attributes written straight onto chosen chart nodes or
// their styles, counted by tag and parent, with the text replaced through `text`.
#include "AestheticsSupport.h"

#include "templates/actions/aesthetics.h"

using namespace aesthetics_test;
using plotaid::detail::TSetGenericAttributes;
using XERCES_CPP_NAMESPACE::DOMElement;

namespace {

// Three labels: one under an axis (first in document order), two under label frames.
const std::string kLabels =
    chartWith("    <coordinates id='coordinates_2'><dimension id='dim_z'>\n"
              "      <axis id='axis_z'><label id='label_3'><text>Axis</text></label></axis>\n"
              "    </dimension></coordinates>\n",
              "  <labelFrame id='frame_1'><label id='label_1' "
              "style='plainStyle'><text>First</text></label></labelFrame>\n"
              "  <labelFrame id='frame_2'><label id='label_2'><text>Second</text></label></labelFrame>\n");

bool set(GrxVisualization& chart, const std::string& attributes, const GrxVisualization* source = nullptr) {
    return applyAction<TSetGenericAttributes>("<setGenericAttributes " + attributes + "/>", chart, source);
}

// The attribute of the node of that id, for each id: "id=value ...".
std::string written(const GrxVisualization& chart, const char* name, std::initializer_list<const char*> ids) {
    std::string out;
    for (const char* id : ids) {
        const DOMElement* e = chart.getElementById(ChartString(id));
        out +=
            std::string(id) + "=" + (e ? text(e->getAttribute(ChartString(name).xc_str())) : "<none>") + " ";
    }
    return out;
}

std::string labelText(const GrxVisualization& chart, const char* id) {
    return text(byId<GrxLabel>(chart, id)->getAllText().xc_str());
}

class SetGenericAttributes : public AestheticsTest {
protected:
    void SetUp() override { chart_ = &parse(kLabels); }
    GrxVisualization& chart() { return *chart_; }
    GrxVisualization* chart_ = nullptr;
};

TEST_F(SetGenericAttributes, EveryMatchingNodeTakesTheAttributesButNotTheSelectors) {
    EXPECT_TRUE(set(chart(), "elementName='label' textFrameStyle='plainStyle' data-note='n'"));
    EXPECT_EQ(written(chart(), "data-note", {"label_1", "label_2", "label_3", "frame_1"}),
              "label_1=n label_2=n label_3=n frame_1= ");
    EXPECT_EQ(written(chart(), "textFrameStyle", {"label_1", "label_3"}),
              "label_1=plainStyle label_3=plainStyle ");
    EXPECT_EQ(written(chart(), "elementName", {"label_1"}), "label_1= ");
    EXPECT_EQ(grammar_test::chartFaults(chart()), "");
}

TEST_F(SetGenericAttributes, CountPicksTheNthMatchAndParentNameNarrowsWhatIsCounted) {
    EXPECT_TRUE(set(chart(), "elementName='label' count='2' data-n='2'"));
    EXPECT_TRUE(set(chart(), "elementName='label' parentName='labelFrame' count='2' data-p='x'"));
    EXPECT_TRUE(set(chart(), "elementName='label' parentName='axis' data-a='y'"));
    EXPECT_EQ(written(chart(), "data-n", {"label_3", "label_1", "label_2"}), "label_3= label_1=2 label_2= ");
    EXPECT_EQ(written(chart(), "data-p", {"label_3", "label_1", "label_2"}), "label_3= label_1= label_2=x ");
    EXPECT_EQ(written(chart(), "data-a", {"label_3", "label_1", "label_2"}), "label_3=y label_1= label_2= ");
    // A count past the matches writes nothing.
    const std::string before = chart().AsUTF8();
    EXPECT_TRUE(set(chart(), "elementName='label' count='4' data-n='9'"));
    EXPECT_EQ(chart().AsUTF8(), before);
}

TEST_F(SetGenericAttributes, TheTextAttributeReplacesTheNodesText) {
    EXPECT_TRUE(set(chart(), "elementName='text' parentName='label' count='3' text='Replaced'"));
    EXPECT_EQ(labelText(chart(), "label_2"), "Replaced");
    EXPECT_EQ(labelText(chart(), "label_1"), "First");
    // Written as text, not as an attribute.
    const auto* texts =
        byId<GrxLabel>(chart(), "label_2")->getImplementation()->getElementsByTagName(u"text");
    ASSERT_EQ(texts->getLength(), 1u);
    EXPECT_FALSE(static_cast<const DOMElement*>(texts->item(0))->hasAttribute(u"text"));
    EXPECT_EQ(grammar_test::chartFaults(chart()), "");
}

TEST_F(SetGenericAttributes, AStyleNameWritesOnTheReferredStyleOrOnANewLinkedOne) {
    EXPECT_TRUE(
        set(chart(), "elementName='label' parentName='labelFrame' styleName='style' font-weight='bold'"));
    // label_1 refers to plainStyle: written there, the label itself untouched.
    EXPECT_EQ(written(chart(), "font-weight", {"plainStyle", "label_1", "label_2"}),
              "plainStyle=bold label_1= label_2= ");
    // label_2 had no style: a new one, linked and written.
    const GrxStyle* made = byId<GrxLabel>(chart(), "label_2")->getStyle();
    ASSERT_NE(made, nullptr);
    EXPECT_NE(text(made->getId()), "plainStyle");
    EXPECT_EQ(attribute(*made, "font-weight"), "bold");

    // A reference that names nothing is passed over; an empty one gets a new style.
    byId<GrxLabel>(chart(), "label_2")->SetAttribute(u"textFrameStyle", u"nowhere");
    const std::size_t stylesBefore = chart().getStyleById(u"c-o-n-t-a-i-n-er")->getStyles().size();
    EXPECT_TRUE(
        set(chart(), "elementName='label' parentName='labelFrame' styleName='textFrameStyle' data-x='1'"));
    EXPECT_EQ(written(chart(), "textFrameStyle", {"label_2"}), "label_2=nowhere ");
    const std::string linked = text(byId<GrxLabel>(chart(), "label_1")->GetAttribute(u"textFrameStyle"));
    EXPECT_EQ(written(chart(), "data-x", {linked.c_str()}), linked + "=1 ");
    EXPECT_EQ(chart().getStyleById(u"c-o-n-t-a-i-n-er")->getStyles().size(), stylesBefore + 1);
    // label_3's "id" names label_3 itself, so that is the node written.
    EXPECT_TRUE(set(chart(), "elementName='label' count='1' styleName='id' data-y='1'"));
    EXPECT_EQ(written(chart(), "data-y", {"label_3"}), "label_3=1 ");
    EXPECT_EQ(grammar_test::chartFaults(chart()), "");
}

TEST_F(SetGenericAttributes, WithASourceOnlyWhatTheSourceStyleLeavesEmptyIsWritten) {
    GrxVisualization& source = parse(kLabels);
    EXPECT_TRUE(set(
        chart(), "elementName='label' count='2' styleName='style' color='#FFFFFF' font-size='20pt' text='t'",
        &source));
    // With a source node `text` is an attribute like any other.
    std::string style;
    for (const char* name : {"color", "font-size", "text"})
        style += written(chart(), name, {"plainStyle"});
    EXPECT_EQ(style, "plainStyle=#112233 plainStyle=20pt plainStyle=t ");
}

TEST_F(SetGenericAttributes, NothingToFindOrNothingToWriteIsAFailure) {
    const std::string before = chart().AsUTF8();
    EXPECT_FALSE(set(chart(), ""));
    EXPECT_FALSE(set(chart(), "data-x='1'"));
    EXPECT_FALSE(set(chart(), "elementName='' data-x='1'"));
    TSetGenericAttributes missing(nullptr, chart(), nullptr);
    EXPECT_FALSE(missing.apply());
    EXPECT_EQ(chart().AsUTF8(), before);
}

TEST_F(SetGenericAttributes, TheInstructionsIdAndQualifiedAttributesStayInTheTemplate) {
    EXPECT_TRUE(set(chart(), "id='rule7' elementName='label' xml:space='preserve' data-x='1'"));
    EXPECT_EQ(written(chart(), "data-x", {"label_1"}), "label_1=1 ");
    EXPECT_EQ(chart().getElementById(ChartString("rule7")), nullptr);
    EXPECT_FALSE(byId<GrxLabel>(chart(), "label_1")->getImplementation()->hasAttribute(u"xml:space"));
    EXPECT_EQ(grammar_test::chartFaults(chart()), "");
}

TEST_F(SetGenericAttributes, StylesMadeOnTheWayAreNotMatchedAgainAndARepeatWritesTheSame) {
    const auto* styles =
        static_cast<const GrxBaseElement&>(chart()).getImplementation()->getElementsByTagName(u"style");
    const XMLSize_t before = styles->getLength();
    ASSERT_GT(before, 0u);
    // Every style without a "textStyle" gets a new one, which is a style without one too.
    EXPECT_TRUE(set(chart(), "elementName='style' styleName='textStyle' color='red'"));
    // The chart's own styles each got one new style, all inside the one new container.
    EXPECT_EQ(styles->getLength(), 2 * before + 1);
    EXPECT_EQ(chart().getStyleById(u"c-o-n-t-a-i-n-er")->getStyles().size(), before);

    // Applied twice, the same values are written to the same nodes again.
    GrxVisualization& once = parse(kLabels);
    GrxVisualization& twice = parse(kLabels);
    const std::string instruction = "elementName='label' styleName='style' color='#0000FF' data-k='v'";
    for (GrxVisualization* target : {&once, &twice, &twice})
        EXPECT_TRUE(set(*target, instruction));
    EXPECT_EQ(twice.AsUTF8(), once.AsUTF8());
}

} // namespace
