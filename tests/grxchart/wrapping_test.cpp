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

TEST_F(Wrapping, EveryKnownElementCarriesItsWrapperUnderItsOwnName) {
    DOMNodeList* all = vis->getDOMDocument()->getElementsByTagName(u"*");
    std::size_t known = 0;
    for (XMLSize_t i = 0; i < all->getLength(); ++i) {
        auto* e = static_cast<DOMElement*>(all->item(i));
        const XMLCh* name = e->getLocalName();
        void* data = e->getUserData(name);
        if (GrxDocument::isKnownElement(name) || e == vis->getImplementation()) {
            ++known;
            ASSERT_NE(data, nullptr) << ChartString(name).toUTF8();
            EXPECT_EQ(static_cast<GrxBaseElement*>(data)->getImplementation(), e);
        } else {
            EXPECT_EQ(data, nullptr) << ChartString(name).toUTF8(); // names, types, row
        }
    }
    EXPECT_GT(known, 50u);
    EXPECT_EQ(vis->wrapperCount() + 1, known); // the root is the visualization itself
    EXPECT_EQ(GrxBaseElement::wrapperOf(vis->getImplementation()), vis.get());
}

TEST_F(Wrapping, GettersHandBackTheOneRegisteredWrapperAlsoThroughTheConstApi) {
    ASSERT_EQ(vis->getGraphs().size(), 1u);
    GrrUviza* graph = vis->getGraphs()[0];
    EXPECT_EQ(graph, GrxBaseElement::wrapperOf<GrrUviza>(byTag(GrxUni::_graph)));
    ASSERT_FALSE(graph->getSchemas().empty());
    GrxSchema* box = graph->getSchemas()[0];
    ASSERT_NE(box->getHingeStyle(), nullptr);
    EXPECT_EQ(box->getHingeStyle(), vis->getStyleById(box->getHingeStyle()->getId()));
    // The x, y and z of an element share one class under their role names.
    CTCoordinate* x = box->getX();
    ASSERT_NE(x, nullptr);
    EXPECT_EQ(x->getImplementation()->getUserData(GrxUni::_x), x);
    EXPECT_NE(x->getVariable(), nullptr);

    const GrxVisualization* source = vis.get();
    const GrxExtensionVis* ext = source->getExtension();
    ASSERT_NE(ext, nullptr);
    EXPECT_TRUE(source->doesIdExist(u"titleStyle"));
    // The extension's slots resolve to the frames' wrappers.
    const GrxLabelFrame* title = ext->getTitle1();
    ASSERT_NE(title, nullptr);
    EXPECT_EQ(title, GrxBaseElement::wrapperOf(source->getElementById(u"frame_title_1")));
    EXPECT_EQ(ext->getTitle2(), nullptr);
    EXPECT_EQ(ext->getLegend1(), vis->getLegends().at(0));
    EXPECT_EQ(title->getLabel()->getAllText().toUTF8(), "Current Salary by Employment Category");
}

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

TEST_F(Wrapping, ASecondDocumentOverTheSameDomRewrapsEverything) {
    DOMElement* root = vis->getImplementation();
    vis->setOwnsDocument(false);
    DOMDocument* doc = vis->getDOMDocument();
    vis.reset();
    GrxVisualization again(root, true);
    ASSERT_EQ(again.getGraphs().size(), 1u);
    EXPECT_EQ(again.getGraphs()[0]->getVisualization(), &again);
    EXPECT_EQ(again.getDOMDocument(), doc);
}

} // namespace
