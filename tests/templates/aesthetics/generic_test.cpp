// "setGenericAttributes": the instruction's attributes written onto chosen chart nodes or their
// styles, counted by tag and parent, with the text replaced through `text`.
#include "AestheticsSupport.h"

using namespace aesthetics_test;
using plotaid::detail::TSetGenericAttributes;

namespace {

// Three labels: one under an axis (first in document order), two under label frames.
const std::string kLabels = chartWith(
    "<coordinates id='coordinates_2'><dimension id='dim_z'><axis id='axis_z'><label id='label_3'>"
    "<text>Axis</text></label></axis></dimension></coordinates>\n",
    "<labelFrame id='frame_1'><label id='label_1' style='plainStyle'><text>First</text></label>"
    "</labelFrame><labelFrame id='frame_2'><label id='label_2'><text>Second</text></label></labelFrame>\n");

// The attribute of the node of each id: "value,value,...".
std::string written(const GrxVisualization& chart, const char* name, std::initializer_list<const char*> ids) {
    std::string out;
    for (const char* id : ids)
        if (const auto* e = chart.getElementById(ChartString(id)))
            out += text(e->getAttribute(ChartString(name).xc_str())) + ",";
    return out;
}

class SetGenericAttributes : public AestheticsTest {
protected:
    void SetUp() override { chart_ = &parse(kLabels); }
    bool set(const std::string& attributes, const GrxVisualization* source = nullptr) {
        return applyAction<TSetGenericAttributes>("<setGenericAttributes " + attributes + "/>", *chart_,
                                                  source);
    }
    GrxVisualization& chart() { return *chart_; }
    GrxVisualization* chart_ = nullptr;
};

TEST_F(SetGenericAttributes, MatchingNodesCountedByTagAndParentTakeTheAttributesButNotTheSelectors) {
    EXPECT_TRUE(
        set("id='rule7' elementName='label' xml:space='preserve' textFrameStyle='plainStyle' data-n='n'"));
    EXPECT_EQ(written(chart(), "data-n", {"label_1", "label_2", "label_3", "frame_1"}), "n,n,n,,");
    EXPECT_EQ(written(chart(), "textFrameStyle", {"label_3"}), "plainStyle,");
    EXPECT_EQ(written(chart(), "elementName", {"label_1"}), ",");
    EXPECT_EQ(chart().getElementById(ChartString("rule7")), nullptr);
    EXPECT_FALSE(byId<GrxLabel>(chart(), "label_1")->getImplementation()->hasAttribute(u"xml:space"));
    // Count picks the nth match; parentName narrows what is counted.
    EXPECT_TRUE(set("elementName='label' count='2' data-c='2'"));
    EXPECT_TRUE(set("elementName='label' parentName='labelFrame' count='2' data-p='x'"));
    EXPECT_EQ(written(chart(), "data-c", {"label_3", "label_1", "label_2"}), ",2,,");
    EXPECT_EQ(written(chart(), "data-p", {"label_3", "label_1", "label_2"}), ",,x,");
    const std::string before = chart().AsUTF8();
    EXPECT_TRUE(set("elementName='label' count='4' data-c='9'"));
    EXPECT_EQ(chart().AsUTF8(), before);
}

TEST_F(SetGenericAttributes, TheTextAttributeReplacesTheNodesText) {
    EXPECT_TRUE(set("elementName='text' parentName='label' count='3' text='Replaced'"));
    EXPECT_EQ(text(byId<GrxLabel>(chart(), "label_2")->getAllText().xc_str()), "Replaced");
    EXPECT_EQ(text(byId<GrxLabel>(chart(), "label_1")->getAllText().xc_str()), "First");
}

TEST_F(SetGenericAttributes, AStyleNameWritesOnTheReferredStyleOrANewLinkedOneUnlessTheSourceSetsIt) {
    EXPECT_TRUE(set("elementName='label' parentName='labelFrame' styleName='style' font-weight='bold'"));
    EXPECT_EQ(written(chart(), "font-weight", {"plainStyle", "label_1", "label_2"}), "bold,,,");
    const GrxStyle* made = byId<GrxLabel>(chart(), "label_2")->getStyle();
    ASSERT_NE(made, nullptr);
    EXPECT_NE(text(made->getId()), "plainStyle");
    EXPECT_EQ(attribute(*made, "font-weight"), "bold");
    // A reference that names nothing is passed over.
    byId<GrxLabel>(chart(), "label_2")->SetAttribute(u"textFrameStyle", u"nowhere");
    const std::string before = chart().AsUTF8();
    set("elementName='label' parentName='labelFrame' count='2' styleName='textFrameStyle' data-x='1'");
    EXPECT_EQ(chart().AsUTF8(), before);
    // With a source, only what the source's style leaves empty is written.
    EXPECT_TRUE(set("elementName='label' count='2' styleName='style' color='#FFFFFF' font-size='20pt'",
                    &parse(kLabels)));
    EXPECT_EQ(written(chart(), "color", {"plainStyle"}) + written(chart(), "font-size", {"plainStyle"}),
              "#112233,20pt,");
}

TEST_F(SetGenericAttributes, NothingToFindOrNothingToWriteIsAFailure) {
    const std::string before = chart().AsUTF8();
    EXPECT_FALSE(set(""));
    EXPECT_FALSE(set("data-x='1'"));
    EXPECT_FALSE(set("elementName='' data-x='1'"));
    TSetGenericAttributes missing(nullptr, chart(), nullptr);
    EXPECT_FALSE(missing.apply());
    EXPECT_EQ(chart().AsUTF8(), before);
}

TEST_F(SetGenericAttributes, StylesMadeOnTheWayAreNotMatchedAgainAndARepeatWritesTheSame) {
    const auto* styles =
        static_cast<const GrxBaseElement&>(chart()).getImplementation()->getElementsByTagName(u"style");
    const XMLSize_t before = styles->getLength();
    // Every style without a "textStyle" gets a new one, which is a style without one too.
    EXPECT_TRUE(set("elementName='style' styleName='textStyle' color='red'"));
    EXPECT_EQ(styles->getLength(), 2 * before + 1); // and one container
    EXPECT_TRUE(set("elementName='label' styleName='style' color='#0000FF'"));
    const std::string once = chart().AsUTF8();
    EXPECT_TRUE(set("elementName='label' styleName='style' color='#0000FF'"));
    EXPECT_EQ(chart().AsUTF8(), once);
}

} // namespace
