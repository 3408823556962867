#include "GrxTestSupport.h"

#include "support/EngineSupport.h"
#include "support/GrammarSupport.h"

#include <xercesc/dom/DOMDocument.hpp>

#include <gtest/gtest.h>

#include <regex>
#include <sstream>

using namespace xercesc;

namespace {

// A chart built only through the layer, touching every add operation, every reference and the
// enumerations whose words the grammar checks.
void buildEverything(GrxVisualization& vis) {
    GrxStyle& container = vis.addStyle();
    container.setId(u"c-o-n-t-a-i-n-er");
    GrxStyle& style = container.addStyle();
    style.setFontSize(u"8pt", u"6pt", nullptr);
    style.setFontWeight(2);
    vis.setStyle(style);
    GrxStyleCycle& cycle = vis.addStyleCycle(u"styleCycleColor");
    cycle.addCycle().addStyle().setColor(GrxStyle::_white);
    cycle.addExtension();
    GrxExtensionVis& ext = vis.addExtension();
    ext.setAttribute(GrxDrillDown::getElementName(), GrxUni::_true);

    GrxLabelFrame& title = vis.addLabelFrame();
    title.addLocation(GrxLocation::part_top).setValue(u"2%");
    GrxLocation& next = title.addLocation(GrxLocation::part_left);
    next.setMethod(GrxLocation::method_nextTo);
    next.setTarget(title);
    GrxDescriptionGroup& group = title.addLabel().addDescriptionGroup();
    group.setSeparator(u"\n");
    group.addDescription().setKind(6);
    ext.setTitle(title, 1);
    vis.addControlFrame().addLocation(GrxLocation::part_width);

    GrxSourceVariable& x = vis.addSourceVariable();
    x.addExtension().setStatistic(1);
    x.addFormat().setBaseFormat(CTFormatType::baseFormat_date);
    GrxExpressionVariable& expr = vis.addExpressionVariable();
    GrxDerivedVariable& derived = vis.addDerivedVariable();
    derived.setCategorical(0);
    x.addAggregation(ChartString("Other"), expr, 0.05);

    GrxIntervalDomain& interval = vis.addIntervalDomain();
    interval.addRange().setExact(true);
    GrxCategoricalDomain& domain = vis.addCategoricalDomain();
    domain.addVariableReference(x);
    domain.addSimpleSort(true, 1).addCategoryOrder().setTextContent(u"b;a");
    domain.addStatisticSort(false, derived).addSortMove().setCategory(u"a");
    domain.addCategories().setRemove(true);
    x.setCategoricalDomain(domain);
    for (auto* source : std::initializer_list<GrxBaseElement*>{
             &vis.addUserSource(), &vis.addDatabaseSource(), &vis.addDelimitedFileSource(),
             &vis.addStreamingSource(), &vis.addEmbeddedSource()})
        source->setId(ChartString(source->getImplementation()->getLocalName()).append(u"1"));

    GrxContainer& box = vis.addContainer();
    GrxLegend& legend = box.addLegend();
    legend.setTickTextStyle(style);
    box.addKey();
    box.addLocation(GrxLocation::part_bottom);
    ext.setLegend(legend, 1);

    GrrUviza& graph = box.addGraph();
    graph.setCellStyle(style);
    graph.addLocation(GrxLocation::part_right);
    GrxCoordinates& coords = graph.addCoordinates();
    GrxDimension& dim = coords.addDimension();
    dim.setDomain(interval);
    dim.setClusterVariable(x);
    dim.addScale(2);
    GrxAxis& axis = dim.addAxis();
    axis.setTransform(0);
    axis.addAxisTransformParameter();
    GrxMajorTicks& major = axis.addMajorTicks();
    major.setPosition(1);
    major.setMarkStyle(style);
    major.addGridline().addConditionalStyle(ChartString("facet1==facet2"), style);
    axis.addMinorTicks();
    coords.addDimensionReference().setDimension(dim);
    coords.addPolarTransform();
    coords.addInsetTransform();
    coords.addObliqueTransform();
    GrxFacetLayout& facets = graph.addFacetLayout();
    facets.setMethod(2);
    facets.addFacetLevel().addAxis();
    facets.addTableLayout();
    graph.addFaceting().setVariable(x);
    graph.addPointGuide();
    graph.addFunctionGuide();
    graph.addRectangleGuide().setCoordinates(coords);
    graph.addPlaneGuide().setNormal(2);
    graph.addFrameGuide();

    GrxPoint& point = graph.addPoint();
    point.setStyle(style);
    point.setCoordinates(coords);
    point.addX().setVariable(x);
    point.addY().setVariable(derived);
    GrxStyleBy& by = point.addStyleBy();
    by.setCycle(cycle);
    by.setVariable(x);
    by.addSummaryStatistic().setMethod(10);
    by.addColorMapping();
    by.addDoubleMapping();
    point.addDash();
    point.addShape();
    point.addSize().addLengthMapping();
    point.addRotation();
    point.addColor().setAffect(3);
    point.addOffset();
    point.addPattern();
    point.addColorComponent().setType(2);
    point.addVisibility();
    point.addImage();
    GrxLabeling& labeling = point.addLabeling();
    labeling.setTextFrameStyle(style);
    labeling.addSummaryStatistic().setAugment(2);
    point.addConditionalStyle(ChartString("facet1==facet2"), style);
    point.addSummaryStatistic();
    GrxBinStatistic& bins = point.addBinStatistic();
    bins.setGridType(1);
    bins.setMethod(2);
    point.addSmoothStatistic().setKernel(5);
    point.addRegionStatistic().setType(7);
    point.addDistributionStatistic().setDistribution(12);
    point.addLinkStatistic().setXReference(4);
    point.addSelfOrganizingMapStatistic();
    point.addPatternLinkStatistic();
    graph.addLine().setBreakRepresentation(2);
    graph.addArea();
    graph.addInterval().setPositionModifier(1);
    graph.addPolygon();
    graph.addSchema().setHingeStyle(style);

    legend.addLegendTarget(*point.getColors()[0]).setVariable(x);
    GrxPopup& popup = vis.addPopup(point);
    popup.addTokenMapping().setVariable(x);
}

std::string printed(const DOMDocument* doc, bool whiteSpace, const XMLCh* encoding = nullptr) {
    ChartPrinter printer;
    printer.setPrintWhiteSpace(whiteSpace);
    printer.setEncoding(encoding);
    std::ostringstream out;
    printer.Print(doc, out);
    return out.str();
}

// Parsed by the library and checked by both validators; null (with the faults reported) when unsound.
std::unique_ptr<GrxVisualization> reparsed(const std::string& text) {
    const std::string faults = grammar_test::chartFaults(text);
    EXPECT_EQ(faults, "") << text;
    return faults.empty() ? engine_test::Chart::parse(text).vis : nullptr;
}

bool has(const std::string& text, const std::string& part) {
    return text.find(part) != std::string::npos;
}

class RoundTrip : public ::testing::Test {
protected:
    static void SetUpTestSuite() { grammar_test::useSourceGrammars(); }
};

TEST_F(RoundTrip, AChartBuiltThroughTheLayerPrintsRevalidatesAndRewraps) {
    GrxVisualization vis(grxtest::newChartDocument()->getDocumentElement(), true);
    buildEverything(vis);
    EXPECT_EQ(grammar_test::duplicateIds(vis.getDOMDocument()), "");
    const auto again = reparsed(vis.AsUTF8());
    ASSERT_TRUE(again);
    EXPECT_EQ(again->AsUTF8(), vis.AsUTF8());
    EXPECT_EQ(again->wrapperCount(), vis.wrapperCount());
    // The references still resolve after the trip.
    GrrUviza* graph = again->getContainers().at(0)->getGraphs().at(0);
    GrxPoint* point = graph->getPoints().at(0);
    EXPECT_EQ(point->getCoordinates(), graph->getCoordinatess().at(0));
    EXPECT_EQ(point->getStyleBys().at(0)->getCycle(), again->getStyleCycles().at(0));
    EXPECT_EQ(again->getExtension()->getLegend1(), again->getContainers()[0]->getLegends().at(0));
    EXPECT_EQ(graph->getSchemas().at(0)->getHingeStyle(), again->getStyles().at(0)->getStyles().at(0));

    // Pretty printing changes only white space between elements.
    const std::string pretty = printed(vis.getDOMDocument(), true);
    ASSERT_TRUE(reparsed(pretty));
    EXPECT_EQ(std::regex_replace(pretty, std::regex(">\\s+(<|$)"), ">$1"), vis.AsUTF8());
}

TEST_F(RoundTrip, EverySampleChartSurvivesPrintingAndReparsing) {
    const std::vector<std::string> charts = grammar_test::sampleCharts();
    ASSERT_FALSE(charts.empty());
    for (const std::string& path : charts) {
        SCOPED_TRACE(path);
        const auto vis = engine_test::Chart::parse(grammar_test::readText(path)).vis;
        ASSERT_TRUE(vis);
        const auto again = reparsed(vis->AsUTF8());
        ASSERT_TRUE(again);
        EXPECT_EQ(again->AsUTF8(), vis->AsUTF8());
        EXPECT_EQ(again->wrapperCount(), vis->wrapperCount());
    }
}

TEST_F(RoundTrip, PrinterWritesUtf8UnlessAskedForAnotherEncoding) {
    const auto vis = reparsed("<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>\n"
                              "<visualization xmlns=\"http://plotaid.org/grxml\" "
                              "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
                              "xsi:schemaLocation=\"http://plotaid.org/grxml "
                              "http://plotaid.org/grxml/grxml-2.9.xsd\">"
                              "<labelFrame><label><text>Gr\xF6\xDF"
                              "e</text></label></labelFrame></visualization>");
    ASSERT_TRUE(vis);
    DOMDocument* doc = vis->getDOMDocument();
    // What the document declares does not matter; what is asked for does, and "" means UTF-8.
    const std::string utf8 = printed(doc, false);
    EXPECT_TRUE(has(utf8, "encoding=\"UTF-8\"") && has(utf8, "Gr\xC3\xB6\xC3\x9F")) << utf8;
    EXPECT_EQ(vis->AsUTF8(), utf8);
    EXPECT_EQ(printed(doc, false, u""), utf8);
    const std::string latin = printed(doc, false, u"ISO-8859-1");
    EXPECT_TRUE(has(latin, "encoding=\"ISO-8859-1\"") && has(latin, "Gr\xF6\xDF")) << latin;
    EXPECT_EQ(printed(doc, false, u"UTF-16LE").substr(0, 2), std::string("<\0", 2));
    // A character the encoding cannot hold becomes a character reference, not a loss.
    vis->getLabelFrames()[0]->getLabel()->addText().setText(ChartString("\xE2\x82\xAC"));
    EXPECT_TRUE(has(printed(doc, false, u"ISO-8859-1"), "&#x20AC;"));

    // A node prints alone, without a declaration; pretty printing only on request.
    GrxLegend& legend = vis->addLegend();
    legend.setId(u"legend1");
    legend.addLabel();
    std::ostringstream node;
    ChartPrinter().Print(legend.getImplementation(), node);
    EXPECT_TRUE(!has(node.str(), "<?xml") && has(node.str(), "id=\"legend1\"") && !has(node.str(), "\n"));
    EXPECT_TRUE(has(printed(doc, true), "\n  <legend"));
    ChartPrinter().Print(static_cast<const DOMNode*>(nullptr), node); // nothing to print, no fault
}

} // namespace
