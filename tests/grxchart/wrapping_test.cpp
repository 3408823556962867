#include "GrxTestSupport.h"

#include "support/EngineSupport.h"
#include "support/GrammarSupport.h"

#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMElement.hpp>
#include <xercesc/dom/DOMNodeList.hpp>

#include <gtest/gtest.h>

using namespace xercesc;

namespace {

class Wrapping : public ::testing::Test {
protected:
    static void SetUpTestSuite() { grammar_test::useSourceGrammars(); }
    void SetUp() override {
        vis = engine_test::Chart::parse(engine_test::example("charts/boxplot.xml")).vis;
        ASSERT_TRUE(vis);
    }
    DOMElement* byTag(const XMLCh* tag, XMLSize_t i = 0) const {
        return static_cast<DOMElement*>(vis->getDOMDocument()->getElementsByTagName(tag)->item(i));
    }
    std::unique_ptr<GrxVisualization> vis;
};

TEST_F(Wrapping, ParsedIdsAnswerAndRemovedSubtreesStopAnswering) {
    DOMDocument* doc = vis->getDOMDocument();
    GrxLabelFrame* title = vis->getExtension()->getTitle1();
    GrxLabel* label = title->getLabel();
    const ChartString labelId(label->getId());
    ASSERT_FALSE(labelId.empty());
    ASSERT_NE(doc->getElementById(labelId.xc_str()), nullptr);

    const std::size_t frames = vis->getLabelFrames().size();
    vis->removeChild(*title);
    EXPECT_EQ(vis->getLabelFrames().size(), frames - 1);
    EXPECT_EQ(doc->getElementById(u"frame_title_1"), nullptr);
    EXPECT_EQ(doc->getElementById(labelId.xc_str()), nullptr); // ids below the frame too
    EXPECT_EQ(vis->getExtension()->getTitle1(), nullptr);      // the slot now dangles
    // The wrapper read before the removal is still usable.
    EXPECT_TRUE(ChartString(title->getId()).equals(u"frame_title_1"));
    EXPECT_EQ(title->getLabel(), label);
}

TEST_F(Wrapping, RawDomEditsShowThroughTheLayer) {
    GrxStyle* style = vis->getStyleById(u"titleStyle");
    ASSERT_NE(style, nullptr);
    style->getImplementation()->setAttribute(GrxUni::_color, u"silver");
    EXPECT_TRUE(ChartString(style->getColor()).equals(u"silver"));

    // A child appended by hand is found (and wrapped) by the typed list.
    GrrUviza* graph = vis->getGraphs()[0];
    const std::size_t lines = graph->getLines().size();
    DOMElement* raw = vis->getDOMDocument()->createElementNS(grxtest::kChartNamespace, GrxUni::_line);
    DOMElement* rawX = vis->getDOMDocument()->createElementNS(grxtest::kChartNamespace, GrxUni::_x);
    raw->appendChild(rawX);
    graph->getImplementation()->appendChild(raw);
    ASSERT_EQ(graph->getLines().size(), lines + 1);
    GrxLine* line = graph->getLines().back();
    EXPECT_EQ(line->getImplementation(), raw);
    EXPECT_EQ(raw->getUserData(GrxUni::_line), line);
    EXPECT_NE(rawX->getUserData(GrxUni::_x), nullptr); // the subtree came along
    EXPECT_EQ(line->getX(), GrxBaseElement::wrapperOf(rawX));

    // Attributes imported from another element replace, and their id answers.
    DOMElement* from = vis->getDOMDocument()->createElementNS(grxtest::kChartNamespace, GrxUni::_line);
    from->setAttribute(GrxUni::_id, u"importedLine");
    from->setAttribute(GrxUni::_name, u"fit");
    line->importAttributes(from);
    EXPECT_EQ(vis->getElementById(u"importedLine"), raw);
    EXPECT_TRUE(ChartString(line->getName()).equals(u"fit"));
}

TEST_F(Wrapping, ReparentingKeepsWrappers) {
    GrxContainer& box = vis->addContainer();
    GrxLegend& legend = box.addLegend();
    GrxLocation& where = box.addLocation(GrxLocation::part_left);
    legend.setId(u"movedLegend");
    const std::size_t legends = vis->getLegends().size();
    vis->reparentContainerChildren(box);
    EXPECT_EQ(vis->getLegends().size(), legends + 1);
    EXPECT_EQ(vis->getLegends().back(), &legend);
    EXPECT_EQ(legend.getImplementation()->getNextElementSibling(), box.getImplementation());
    EXPECT_TRUE(box.getLegends().empty());
    // The container's own locations stay with it.
    ASSERT_EQ(box.getLocations().size(), 1u);
    EXPECT_EQ(box.getLocations()[0], &where);
    EXPECT_EQ(vis->getElementById(u"movedLegend"), legend.getImplementation());
}

} // namespace
