#include "GrxTestSupport.h"

#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMException.hpp>

#include <gtest/gtest.h>

using namespace xercesc;
using grxtest::attr;

namespace {

class Built : public ::testing::Test {
protected:
    Built() : vis(grxtest::newChartDocument()->getDocumentElement(), true) {}
    GrxVisualization vis;
    DOMDocument* doc = vis.getDOMDocument();
};

TEST_F(Built, IdsSetThroughTheLayerAnswerLookups) {
    GrxStyle& style = vis.addStyle();
    style.setId(u"s1");
    EXPECT_EQ(doc->getElementById(u"s1"), style.getImplementation());
    EXPECT_EQ(vis.getStyleById(u"s1"), &style);
    GrrUviza& graph = vis.addGraph();
    graph.SetAttribute(GrxUni::_id, u"g1");
    EXPECT_EQ(doc->getElementById(u"g1"), graph.getImplementation());
    // A renamed id answers under its new name only; with a duplicate, the one given it last answers.
    style.setId(u"s2");
    EXPECT_EQ(doc->getElementById(u"s1"), nullptr);
    GrxStyle& twin = vis.addStyle();
    twin.setId(u"s2");
    EXPECT_EQ(vis.getStyleById(u"s2"), &twin);
    vis.removeChild(twin);
    EXPECT_EQ(vis.getStyleById(u"s2"), nullptr);
    style.setId(u"s2"); // declared again
    EXPECT_EQ(vis.getStyleById(u"s2"), &style);
    // Removing the attribute or the node withdraws the id.
    graph.removeAttribute(GrxUni::_id);
    EXPECT_EQ(doc->getElementById(u"g1"), nullptr);
    vis.removeStyles();
    EXPECT_FALSE(vis.doesIdExist(u"s2") || vis.doesIdExist(u""));
    EXPECT_EQ(doc->getElementById(u"s2"), nullptr);
}

TEST_F(Built, ReferencesResolveToTheSameWrapper) {
    GrxStyle& taken = vis.addStyle();
    taken.setId(u"style1");
    GrxStyle& style = vis.addStyle();
    GrrUviza& graph = vis.addGraph();
    // A target without an id gets a free one; one with an id keeps it.
    graph.setStyle(style);
    EXPECT_EQ(attr(style, GrxUni::_id), "style2");
    EXPECT_EQ(graph.getStyle(), &style);
    graph.setCellStyle(taken);
    EXPECT_EQ(attr(graph, u"cellStyle"), "style1");
    GrxCoordinates& coords = graph.addCoordinates();
    GrxPoint& point = graph.addPoint();
    point.setCoordinates(coords);
    EXPECT_EQ(point.getCoordinates(), &coords);
    EXPECT_EQ(attr(coords, GrxUni::_id), "coordinates1");
    GrxColor& color = point.addColor();
    color.setCycle(vis.addStyleCycle(u"styleCycleColor"));
    EXPECT_EQ(color.getCycle(), vis.getStyleCycles().at(0));
    color.removeCycle();
    EXPECT_EQ(color.getCycle(), nullptr);
    // A dangling id, or one naming an object of another kind, reads as null.
    point.SetAttribute(GrxUni::_style, u"nowhere");
    EXPECT_EQ(point.getStyle(), nullptr);
    point.SetAttribute(GrxUni::_style, ChartString(coords.getId()));
    EXPECT_EQ(point.getStyle(), nullptr);
    EXPECT_EQ(point.referenced(GrxUni::_style), &coords);
}

TEST_F(Built, CompoundPropertiesKeepThePartsNotGiven) {
    GrxStyle& style = vis.addStyle();
    const auto parts = [&](const XMLCh* name) {
        ChartString p("stale"), n("stale"), x("stale");
        GrxStyle::getPreferredMinMax(style.GetAttribute(name), &p, &n, &x);
        return p.toUTF8() + "|" + n.toUTF8() + "|" + x.toUTF8();
    };
    EXPECT_FALSE(style.isFontSizePresent());
    style.setFontSize(u"8pt", nullptr, nullptr);
    style.setFontSize(nullptr, u"6pt", nullptr);
    EXPECT_EQ(parts(GrxUni::_font_size), "8pt|6pt|");
    style.setWidth(nullptr, nullptr, u"20px");
    style.setWidth(u"1pt", nullptr, nullptr);
    EXPECT_EQ(parts(GrxUni::_width), "1pt||20px");
    // An empty part clears that part; all empty removes the property.
    style.setWidth(u"", nullptr, u"");
    EXPECT_FALSE(style.isWidthPresent());
    // Only the minimum given still reads as a font size.
    style.setFontSize(u"", nullptr, nullptr);
    EXPECT_TRUE(style.isFontSizePresent());
    ChartString p, n("stale");
    style.getFontSize(&p, &n, nullptr);
    EXPECT_EQ(p.toUTF8() + "|" + n.toUTF8(), "|6pt");
    style.SetAttribute(GrxUni::_size, u" 9pt ; ;12pt;junk");
    EXPECT_EQ(parts(GrxUni::_size), "9pt||12pt");
    style.getSize(&p, nullptr, nullptr);
    EXPECT_EQ(p.toUTF8(), "9pt");
    GrxStyle::getPreferredMinMax(nullptr, &p, nullptr, nullptr);
    EXPECT_TRUE(p.empty());
}

TEST_F(Built, EnumerationsAndTypedValuesReadBackAndUnreadableOnesFallBack) {
    GrrUviza& graph = vis.addGraph();
    GrxDimension& dimension = graph.addCoordinates().addDimension();
    GrxAxis& axis = dimension.addAxis();
    GrxLine& line = graph.addLine();
    // Defined absent values: a plain axis is not derived.
    EXPECT_EQ(axis.getTransform(), grx::AxisTransform::none);
    GrxMajorTicks& ticks = axis.addMajorTicks();
    EXPECT_EQ(ticks.getLabelFrequency(), 1);

    axis.setTransform(grx::AxisTransform::percent);
    line.setBreakRepresentation(grx::BreakRepresentation::wings);
    GrxScale& scale = dimension.addScale(grx::ScaleMethod::log_safe);
    GrxLocation& loc = vis.addLocation(GrxLocation::part_height);
    EXPECT_EQ(attr(axis, GrxUni::_transform) + " " + attr(line, u"breakRepresentation") + " " +
                  attr(scale, GrxUni::_method) + " " + attr(loc, u"part"),
              "percent wings log_safe height");
    EXPECT_EQ(axis.getTransform(), grx::AxisTransform::percent);
    // A number without a word is written in decimal and reads back; unreadable counts as absent.
    scale.setMethod(42);
    EXPECT_EQ(attr(scale, GrxUni::_method), "42");
    EXPECT_EQ(scale.getMethod(), 42);
    scale.SetAttribute(GrxUni::_method, u"nonsense");
    EXPECT_EQ(scale.getMethod(), grx::ScaleMethod::linear);

    ticks.setDelta(0.1 + 0.2);
    EXPECT_EQ(ticks.getDelta(), 0.1 + 0.2); // written so that it reads back exactly
    ticks.setLabelAngle(-90.0);
    EXPECT_EQ(attr(ticks, GrxUni::_labelAngle), "-90");
    ticks.SetAttribute(GrxUni::_delta, u"auto");
    EXPECT_EQ(ticks.getDelta(), 0.0);
    EXPECT_TRUE(ticks.isDeltaPresent());
    ticks.removeDelta();
    EXPECT_FALSE(ticks.isDeltaPresent());

    GrxStyle& style = vis.addStyle();
    EXPECT_TRUE(style.getVisible());
    style.setVisible(false);
    EXPECT_FALSE(style.getVisible());
    style.SetAttribute(GrxUni::_visible, u"hidden");
    EXPECT_FALSE(style.getVisible());
    style.setVisible(true);
    EXPECT_EQ(attr(style, GrxUni::_visible), "true");
    CTTextType& text = vis.addLabelFrame().addLabel().addText();
    text.setText(ChartString("R"));
    text.setText(ChartString("R\xC2\xB2")); // replaces, does not append
    EXPECT_EQ(text.getText().toUTF8(), "R\xC2\xB2");
}

TEST_F(Built, ExtensionSlotsHoldFramesById) {
    GrxExtensionVis& ext = vis.addExtension();
    GrxLabelFrame& title = vis.addLabelFrame();
    GrxLegend& legend = vis.addLegend();
    ext.setTitle(title, 2);
    ext.setLegend(legend, 12);
    EXPECT_EQ(ext.getTitle2(), &title);
    EXPECT_EQ(ext.getTitle1(), nullptr);
    EXPECT_EQ(ext.getLegend(12), &legend);
    EXPECT_EQ(ext.getLegend(11), nullptr);
    EXPECT_EQ(attr(ext, u"legend12"), ChartString(legend.getId()).toUTF8());
    // A slot naming a frame of another kind reads as null.
    ext.setAttribute(u"footnote1", legend.getId());
    EXPECT_EQ(ext.getFootnote(1), nullptr);
    ext.setStyleCycleRepository(vis.addStyleCycle(u"styleCycleRepository"));
    EXPECT_EQ(vis.getExtension()->getStyleCycleRepository(), vis.getStyleCycles().at(0));
}

TEST_F(Built, RemovalKeepsEarlierPointersUsable) {
    GrrUviza& graph = vis.addGraph();
    GrxPoint& point = graph.addPoint();
    GrxColor* last = nullptr;
    for (int i = 0; i < 3; ++i)
        (last = &point.addColor())->setId(ChartString("color").appendInteger(i));
    const std::size_t wrappers = vis.wrapperCount();
    // Walk the list read first, removing as we go, as the dash action does.
    for (GrxColor* c : point.getColors()) {
        const ChartString id(c->getId());
        point.removeColor(*c);
        point.addDash().setId(id);
    }
    EXPECT_TRUE(point.getColors().empty());
    ASSERT_EQ(point.getDashs().size(), 3u);
    EXPECT_EQ(attr(*point.getDashs()[1], GrxUni::_id), "color1");
    EXPECT_EQ(attr(*last, GrxUni::_id), "color2");
    EXPECT_EQ(vis.wrapperCount(), wrappers + 3);
    // Removing something that is not our child changes nothing.
    point.removeChild(graph.addLine());
    EXPECT_EQ(graph.getLines().size(), 1u);

    GrxDimension& dim = graph.addCoordinates().addDimension();
    GrxAxis& first = dim.addAxis();
    GrxAxis& second = dim.addAxis();
    dim.removeAxis(5u); // past the end: nothing
    EXPECT_EQ(dim.getAxiss().size(), 2u);
    dim.removeAxis(0u);
    EXPECT_EQ(dim.getAxiss(), std::vector<GrxAxis*>{&second});
    EXPECT_EQ(first.getImplementation()->getParentNode(), nullptr);
}

TEST_F(Built, OnlyChartElementsOfThisDocumentAreWrapped) {
    DOMElement* foreign = doc->createElementNS(u"urn:other", GrxUni::_style);
    DOMElement* plain = doc->createElement(GrxUni::_legend); // no namespace: taken as the chart's
    DOMElement* unknown = doc->createElementNS(grxtest::kChartNamespace, u"notAChartElement");
    for (DOMElement* e : {foreign, plain, unknown})
        vis.getImplementation()->appendChild(e);
    EXPECT_EQ(vis.wrap(foreign), nullptr);
    EXPECT_EQ(foreign->getUserData(GrxUni::_style), nullptr);
    EXPECT_EQ(vis.wrap(unknown), nullptr);
    GrxBaseElement* legend = vis.wrap(plain);
    ASSERT_NE(legend, nullptr);
    EXPECT_EQ(vis.getLegends().at(0), legend);
    EXPECT_EQ(vis.wrap(plain), legend); // wrapping again makes nothing new
    EXPECT_TRUE(vis.getStyles().empty());
    GrxVisualization other(grxtest::newChartDocument()->getDocumentElement(), true);
    EXPECT_EQ(vis.wrap(other.addLegend().getImplementation()), nullptr);
}

TEST_F(Built, StatisticsOfEveryKindInOrderWithTheirOwnMethodWords) {
    GrxInterval& bar = vis.addGraph().addInterval();
    GrxBinStatistic& bins = bar.addBinStatistic();
    bar.addX();
    GrxSummaryStatistic& summary = bar.addSummaryStatistic();
    const std::vector<CTStatisticType*> all = bar.getStatistics();
    ASSERT_EQ(all, (std::vector<CTStatisticType*>{&bins, &summary}));
    bins.setMethod(grx::BinMethod::allDimensions);
    summary.setMethod(grx::SummaryMethod::range);
    EXPECT_EQ(attr(bins, GrxUni::_method) + " " + attr(summary, GrxUni::_method), "allDimensions 7");
    // Through the common base the words still read as their numbers.
    EXPECT_EQ(all[0]->getMethod(), grx::BinMethod::allDimensions);
    all[0]->setMethod(grx::BinMethod::notResponse);
    EXPECT_EQ(attr(bins, GrxUni::_method), "notResponse");
    EXPECT_EQ(all[1]->getMethod(), grx::SummaryMethod::range);
}

TEST(Document, AReferenceDocumentWrapsLikeAVisualization) {
    DOMDocument* doc = grxtest::newChartDocument();
    {
        GrxVisualization build(doc->getDocumentElement());
        GrxLegend& legend = build.addContainer().addLegend();
        legend.setId(u"legend_1");
        legend.addLocation(GrxLocation::part_top).setSpecifiedByUser(true);
    }
    // A plain document wrapper over the same DOM, as a frame packer's reference.
    GrxDocument reference(doc->getDocumentElement(), true);
    EXPECT_EQ(reference.getVisualization(), nullptr);
    DOMElement* legend = doc->getElementById(u"legend_1");
    ASSERT_NE(legend, nullptr);
    auto* location = GrxBaseElement::wrapperOf<GrxLocation>(legend->getFirstElementChild());
    ASSERT_NE(location, nullptr);
    EXPECT_TRUE(location->getSpecifiedByUser());
    EXPECT_EQ(location->getDocument(), &reference);
    EXPECT_NE(legend->getParentNode()->getUserData(GrxUni::_container), nullptr);
}

TEST_F(Built, HostileNamesAndDepthAreHandled) {
    GrxStyle& style = vis.addStyle();
    EXPECT_FALSE(style.isAttributePresent(nullptr));
    EXPECT_EQ(attr(style, nullptr), "");
    style.removeAttribute(nullptr);
    for (const XMLCh* bad : {static_cast<const XMLCh*>(nullptr), u"", u"not a name"})
        EXPECT_THROW(style.SetAttribute(bad, u"x"), DOMException);
    EXPECT_FALSE(style.doesIdExist(static_cast<const XMLCh*>(nullptr)));

    // A chain far deeper than any call stack could follow is wrapped and unwrapped without recursion;
    // the ids of a document made by DOM calls, the root's too, are declared when it is wrapped.
    constexpr int kDepth = 200000;
    DOMDocument* deepDoc = grxtest::newChartDocument();
    DOMElement* at = deepDoc->getDocumentElement();
    at->setAttribute(GrxUni::_id, u"root");
    for (int i = 0; i < kDepth; ++i)
        at = static_cast<DOMElement*>(
            at->appendChild(deepDoc->createElementNS(grxtest::kChartNamespace, GrxUni::_container)));
    at->setAttribute(GrxUni::_id, u"deepest");
    GrxVisualization deep(deepDoc->getDocumentElement(), true);
    EXPECT_EQ(deep.wrapperCount(), static_cast<std::size_t>(kDepth));
    EXPECT_EQ(deep.getElementById(u"deepest"), at);
    EXPECT_EQ(deep.getElementById(u"root"), deepDoc->getDocumentElement());
    deep.removeChild(*deep.getContainers().at(0));
    EXPECT_EQ(deep.getElementById(u"deepest"), nullptr);
}

} // namespace
