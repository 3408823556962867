#include "GrxTestSupport.h"

#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMException.hpp>

#include <gtest/gtest.h>

using namespace xercesc;

namespace {

class Built : public ::testing::Test {
protected:
    Built() : vis(grxtest::newChartDocument()->getDocumentElement(), true) {}
    GrxVisualization vis;
};

TEST_F(Built, IdsSetThroughTheLayerAnswerLookups) {
    DOMDocument* doc = vis.getDOMDocument();
    GrxStyle& style = vis.addStyle();
    style.setId(u"s1");
    EXPECT_EQ(doc->getElementById(u"s1"), style.getImplementation());
    EXPECT_EQ(vis.getStyleById(u"s1"), &style);

    GrrUviza& graph = vis.addGraph();
    graph.SetAttribute(GrxUni::_id, u"g1");
    EXPECT_EQ(doc->getElementById(u"g1"), graph.getImplementation());

    // A renamed id answers under its new name only.
    style.setId(u"s2");
    EXPECT_EQ(doc->getElementById(u"s1"), nullptr);
    EXPECT_EQ(vis.getStyleById(u"s2"), &style);

    // With a duplicate, the element given the id last answers.
    GrxStyle& twin = vis.addStyle();
    twin.setId(u"s2");
    EXPECT_EQ(vis.getStyleById(u"s2"), &twin);
    vis.removeChild(twin);
    EXPECT_EQ(vis.getStyleById(u"s2"), nullptr);
    style.setId(u"s2"); // declared again

    // Removing the attribute or the node withdraws the id.
    graph.removeAttribute(GrxUni::_id);
    EXPECT_EQ(doc->getElementById(u"g1"), nullptr);
    vis.removeStyles();
    EXPECT_FALSE(vis.doesIdExist(u"s2"));
    EXPECT_EQ(doc->getElementById(u"s2"), nullptr);
    EXPECT_FALSE(vis.doesIdExist(u""));
}

TEST_F(Built, ACreatedDocumentGetsItsIdsDeclaredWhenWrapped) {
    DOMDocument* doc = grxtest::newChartDocument();
    DOMElement* style = doc->createElementNS(grxtest::kChartNamespace, GrxUni::_style);
    style->setAttribute(GrxUni::_id, u"plain");
    doc->getDocumentElement()->appendChild(style);
    ASSERT_EQ(doc->getElementById(u"plain"), nullptr); // a plain attribute is no ID yet
    GrxVisualization wrapped(doc->getDocumentElement(), true);
    EXPECT_EQ(doc->getElementById(u"plain"), style);
    EXPECT_EQ(wrapped.getStyleById(u"plain"), wrapped.getStyles().at(0));
}

TEST_F(Built, ReferencesResolveToTheSameWrapper) {
    GrxStyle& taken = vis.addStyle();
    taken.setId(u"style1");
    GrxStyle& style = vis.addStyle();
    GrrUviza& graph = vis.addGraph();
    // The target gets an id of its own when it has none, avoiding the ones in use; one that has an
    // id keeps it.
    graph.setStyle(style);
    EXPECT_TRUE(ChartString(style.getId()).equals(u"style2"));
    EXPECT_EQ(graph.getStyle(), &style);
    graph.setCellStyle(taken);
    EXPECT_TRUE(ChartString(graph.GetAttribute(u"cellStyle")).equals(u"style1"));

    GrxCoordinates& coords = graph.addCoordinates();
    GrxPoint& point = graph.addPoint();
    point.setCoordinates(coords);
    EXPECT_EQ(point.getCoordinates(), &coords);

    GrxStyleCycle& cycle = vis.addStyleCycle(u"styleCycleColor");
    GrxColor& color = point.addColor();
    color.setCycle(cycle);
    EXPECT_EQ(color.getCycle(), &cycle);
    color.removeCycle();
    EXPECT_EQ(color.getCycle(), nullptr);

    // A dangling id, or one naming an object of another kind, reads as null.
    point.SetAttribute(GrxUni::_style, u"nowhere");
    EXPECT_EQ(point.getStyle(), nullptr);
    point.SetAttribute(GrxUni::_style, ChartString(coords.getId()));
    EXPECT_EQ(point.getStyle(), nullptr);
    EXPECT_EQ(point.referenced(GrxUni::_style), &coords);
}

// The three parts of a compound property as "preferred|minimum|maximum".
template <typename Getter> std::string parts(Getter get) {
    ChartString pref("stale"), min("stale"), max("stale");
    get(&pref, &min, &max);
    return pref.toUTF8() + "|" + min.toUTF8() + "|" + max.toUTF8();
}

TEST_F(Built, CompoundPropertiesKeepThePartsNotGiven) {
    GrxStyle& style = vis.addStyle();
    const auto fontSize = [&](ChartString* p, ChartString* n, ChartString* x) { style.getFontSize(p, n, x); };
    const auto width = [&](ChartString* p, ChartString* n, ChartString* x) { style.getWidth(p, n, x); };
    EXPECT_FALSE(style.isFontSizePresent());
    style.setFontSize(u"8pt", nullptr, nullptr);
    style.setFontSize(nullptr, u"6pt", nullptr);
    EXPECT_EQ(parts(fontSize), "8pt|6pt|");
    // The maximum first, then the preferred width, into the same property.
    style.setWidth(nullptr, nullptr, u"20px");
    style.setWidth(u"1pt", nullptr, nullptr);
    EXPECT_EQ(parts(width), "1pt||20px");
    // An empty part clears that part; all empty removes the property.
    style.setWidth(u"", nullptr, u"");
    EXPECT_FALSE(style.isWidthPresent());
    // Only the minimum given still reads as a font size.
    style.setFontSize(u"", nullptr, nullptr);
    EXPECT_TRUE(style.isFontSizePresent());
    EXPECT_EQ(parts(fontSize), "|6pt|");

    EXPECT_EQ(parts([](ChartString* p, ChartString* n, ChartString* x) {
                  GrxStyle::getPreferredMinMax(u" 9pt ; ;12pt;junk", p, n, x);
              }),
              "9pt||12pt");
    ChartString pref("stale");
    GrxStyle::getPreferredMinMax(nullptr, &pref, nullptr, nullptr);
    EXPECT_TRUE(pref.empty());
}

TEST_F(Built, EnumerationsHaveDefinedAbsentValuesAndStableWords) {
    GrrUviza& graph = vis.addGraph();
    GrxAxis& axis = graph.addCoordinates().addDimension().addAxis();
    EXPECT_EQ(axis.getTransform(), 2); // a plain axis is not derived
    axis.setTransform(1);
    EXPECT_TRUE(ChartString(axis.GetAttribute(GrxUni::_transform)).equals(u"percent"));
    EXPECT_EQ(axis.getTransform(), 1);

    GrxLine& line = graph.addLine();
    EXPECT_EQ(line.getBreakRepresentation(), 0);
    line.setBreakRepresentation(3);
    EXPECT_TRUE(ChartString(line.GetAttribute(u"breakRepresentation")).equals(u"wings"));

    EXPECT_EQ(vis.addDerivedVariable().getCategorical(), 0);
    EXPECT_EQ(axis.addMinorTicks().getNumber(), 2);
    EXPECT_EQ(axis.addMajorTicks().getLabelFrequency(), 1);
    EXPECT_EQ(graph.addPoint().addColor().getAffect(), 0);
    EXPECT_EQ(line.addSmoothStatistic().getKernel(), 0);

    // A number without a word is written in decimal and reads back.
    GrxScale& scale = vis.getGraphs()[0]->getCoordinatess()[0]->getDimensions()[0]->addScale(4);
    EXPECT_TRUE(ChartString(scale.GetAttribute(GrxUni::_method)).equals(u"log_safe"));
    scale.setMethod(42);
    EXPECT_TRUE(ChartString(scale.GetAttribute(GrxUni::_method)).equals(u"42"));
    EXPECT_EQ(scale.getMethod(), 42);
    scale.SetAttribute(GrxUni::_method, u"nonsense");
    EXPECT_EQ(scale.getMethod(), 1); // unreadable counts as absent

    GrxLocation& loc = vis.addLocation(GrxLocation::part_height);
    EXPECT_TRUE(ChartString(loc.GetAttribute(u"part")).equals(u"height"));
    EXPECT_EQ(loc.getPart(), GrxLocation::part_height);
}

TEST_F(Built, TypedValuesReadBackAndUnreadableOnesFallBack) {
    GrxMajorTicks& ticks = vis.addGraph().addCoordinates().addDimension().addAxis().addMajorTicks();
    ticks.setDelta(0.1 + 0.2);
    EXPECT_EQ(ticks.getDelta(), 0.1 + 0.2); // written so that it reads back exactly
    ticks.setLabelAngle(-90.0);
    EXPECT_TRUE(ChartString(ticks.GetAttribute(GrxUni::_labelAngle)).equals(u"-90"));
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
    EXPECT_TRUE(ChartString(style.GetAttribute(GrxUni::_visible)).equals(GrxUni::_true));

    CTTextType& text = vis.addLabelFrame().addLabel().addText();
    text.setText(ChartString("R"));
    text.setText(ChartString("R\xC2\xB2")); // replaces, does not append
    EXPECT_EQ(text.getText().toUTF8(), "R\xC2\xB2");
    EXPECT_TRUE(ChartString(ticks.GetAttribute(u"absent")).empty());
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
    EXPECT_TRUE(ChartString(ext.GetAttribute(u"legend12")).equals(legend.getId()));
    // A slot naming a frame of another kind reads as null.
    ext.setAttribute(u"footnote1", legend.getId());
    EXPECT_EQ(ext.getFootnote(1), nullptr);
    GrxStyleCycle& cycle = vis.addStyleCycle(u"styleCycleRepository");
    ext.setStyleCycleRepository(cycle);
    EXPECT_EQ(vis.getExtension()->getStyleCycleRepository(), &cycle);
}

TEST_F(Built, RemovalKeepsEarlierPointersUsable) {
    GrrUviza& graph = vis.addGraph();
    GrxPoint& point = graph.addPoint();
    std::vector<GrxColor*> colors;
    for (int i = 0; i < 3; ++i) {
        GrxColor& c = point.addColor();
        c.setId(ChartString("color").appendInteger(i));
        colors.push_back(&c);
    }
    const std::size_t wrappers = vis.wrapperCount();
    // Walk the list read first, removing as we go, as the dash action does.
    for (GrxColor* c : point.getColors()) {
        const ChartString id(c->getId());
        point.removeColor(*c);
        GrxDash& dash = point.addDash();
        dash.setId(id);
    }
    EXPECT_TRUE(point.getColors().empty());
    ASSERT_EQ(point.getDashs().size(), 3u);
    EXPECT_TRUE(ChartString(point.getDashs()[1]->getId()).equals(u"color1"));
    EXPECT_TRUE(ChartString(colors[2]->getId()).equals(u"color2"));
    EXPECT_EQ(vis.wrapperCount(), wrappers + 3);
    // Removing something that is not our child changes nothing.
    GrxLine& line = graph.addLine();
    point.removeChild(line);
    EXPECT_EQ(graph.getLines().size(), 1u);
}

TEST_F(Built, OnlyChartElementsAreWrapped) {
    DOMDocument* doc = vis.getDOMDocument();
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
    // Nodes of another document are never wrapped into this one.
    GrxVisualization other(grxtest::newChartDocument()->getDocumentElement(), true);
    EXPECT_EQ(vis.wrap(other.addLegend().getImplementation()), nullptr);
}

TEST_F(Built, PositionalRemovalAndMixedStatistics) {
    GrxDimension& dim = vis.addGraph().addCoordinates().addDimension();
    GrxAxis& first = dim.addAxis();
    GrxAxis& second = dim.addAxis();
    dim.removeAxis(5u); // past the end: nothing
    EXPECT_EQ(dim.getAxiss().size(), 2u);
    dim.removeAxis(0u);
    ASSERT_EQ(dim.getAxiss().size(), 1u);
    EXPECT_EQ(dim.getAxiss()[0], &second);
    EXPECT_EQ(first.getImplementation()->getParentNode(), nullptr);

    GrxInterval& bar = vis.getGraphs()[0]->addInterval();
    GrxBinStatistic& bins = bar.addBinStatistic();
    bar.addX();
    GrxSummaryStatistic& summary = bar.addSummaryStatistic();
    const std::vector<CTStatisticType*> all = bar.getStatistics();
    ASSERT_EQ(all.size(), 2u);
    EXPECT_EQ(all[0], &bins);
    EXPECT_EQ(all[1], &summary);
    // The bin statistic's own words for its method, the summary's plain number.
    bins.setMethod(1);
    summary.setMethod(7);
    EXPECT_TRUE(ChartString(bins.GetAttribute(GrxUni::_method)).equals(u"allDimensions"));
    EXPECT_TRUE(ChartString(summary.GetAttribute(GrxUni::_method)).equals(u"7"));
    // Through the common base the words still read as their numbers.
    EXPECT_EQ(all[0]->getMethod(), 1);
    all[0]->setMethod(2);
    EXPECT_TRUE(ChartString(bins.GetAttribute(GrxUni::_method)).equals(u"notResponse"));
    EXPECT_EQ(all[1]->getMethod(), 7);
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
    DOMElement* legend = reference.getImplementation()->getOwnerDocument()->getElementById(u"legend_1");
    ASSERT_NE(legend, nullptr);
    auto* location =
        static_cast<GrxLocation*>(legend->getFirstElementChild()->getUserData(GrxUni::_location));
    ASSERT_NE(location, nullptr);
    EXPECT_TRUE(location->getSpecifiedByUser());
    EXPECT_EQ(location->getDocument(), &reference);
    EXPECT_NE(legend->getParentNode()->getUserData(GrxUni::_container), nullptr);
}

TEST_F(Built, HostileNamesAndDepthAreHandled) {
    GrxStyle& style = vis.addStyle();
    EXPECT_FALSE(style.isAttributePresent(nullptr));
    EXPECT_TRUE(ChartString(style.GetAttribute(nullptr)).empty());
    style.removeAttribute(nullptr);
    EXPECT_THROW(style.SetAttribute(static_cast<const XMLCh*>(nullptr), u"x"), DOMException);
    EXPECT_THROW(style.SetAttribute(u"", u"x"), DOMException);
    EXPECT_THROW(style.SetAttribute(u"not a name", u"x"), DOMException);
    EXPECT_FALSE(style.doesIdExist(static_cast<const XMLCh*>(nullptr)));

    // A chain far deeper than any call stack could follow is wrapped and unwrapped without recursion.
    constexpr int kDepth = 200000;
    DOMDocument* doc = grxtest::newChartDocument();
    DOMElement* at = doc->getDocumentElement();
    for (int i = 0; i < kDepth; ++i)
        at = static_cast<DOMElement*>(
            at->appendChild(doc->createElementNS(grxtest::kChartNamespace, GrxUni::_container)));
    at->setAttribute(GrxUni::_id, u"deepest");
    GrxVisualization deep(doc->getDocumentElement(), true);
    EXPECT_EQ(deep.wrapperCount(), static_cast<std::size_t>(kDepth));
    EXPECT_EQ(deep.getElementById(u"deepest"), at);
    auto* outer = deep.getContainers().at(0);
    deep.removeChild(*outer);
    EXPECT_EQ(deep.getElementById(u"deepest"), nullptr);
}

} // namespace
