// The element wrappers over older chart documents, asked about one earlier-form document.
#include "support/EngineSupport.h"

#include "transform/ElementWalk.h"

#include <plotaid/ChartAxis.h>
#include <plotaid/ChartElementElement.h>
#include <plotaid/ChartFacetLabel.h>
#include <plotaid/ChartFrame.h>
#include <plotaid/ChartGraph.h>
#include <plotaid/ChartGuide.h>

#include <xercesc/dom/DOM.hpp>

#include <functional>

using namespace XERCES_CPP_NAMESPACE;

namespace {

std::string older(const std::string& body) {
    return "<graph xmlns=\"http://plotaid.org/grxml\" xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-1.4.xsd\">" +
           body + "</graph>";
}

const char* const kDocument =
    "<variable id='v1' categorical='true'/><variable id='v2' categorical='TRUE'/>"
    "<variable id='v3' categorical='1'/><variable id='v4'/><domain id='d1' categorical='true'/>"
    "<frame id='f1'><x variable='v4'/><y variable='v1'/><z variable='v1'/>"
    " <facetvariable role='z' variable='v2'/>"
    " <dimension id='dx' role='x'/><dimension id='dy' role='y'/><dimension id='dd' role='x' domain='d1'/>"
    " <dimension id='dz' role='z'><axis id='az'/></dimension>"
    " <facetlabeling><facetlabel id='flab'><axis id='afl'/></facetlabel></facetlabeling>"
    " <legend><axis id='astray'/></legend>"
    " <element id='e1' type='line' name='n'><styleby id='sb1' variable='v1'/><interpolation/></element>"
    " <element id='e2' type='area'/>"
    " <guide id='g1' type='line' name='own'><parameter name='y' value='3'/><parameter name='z'/></guide>"
    "</frame><legendtarget aesthetic='sb1'/>";

std::string text(const XMLCh* s) {
    return s == nullptr ? "<null>" : ChartString(s).toUTF8();
}
std::string idOf(const ChartElement& e) {
    return e.isNull() ? "<empty>" : text(e.getAttributeValue(u"id"));
}

class ChartElementTest : public engine_test::EngineTest {
protected:
    DOMElement* root(const std::string& body) {
        EXPECT_NE(parser_.parse(older(body), "older", ChartException("older", "test", 0)), nullptr);
        documents_.push_back(parser_.adoptDocument());
        return documents_.back() ? documents_.back()->getDocumentElement() : nullptr;
    }
    DOMElement* byId(const DOMElement* root, const char* id) {
        DOMElement* found = nullptr;
        plotaid::detail::forEachDescendant(root, nullptr, [&](DOMElement* e) {
            found = ChartString(e->getAttribute(u"id")).equals(id) ? e : nullptr;
            return found == nullptr;
        });
        return found;
    }

private:
    plotaid::detail::ValidatingParser parser_;
    std::vector<plotaid::detail::OwnedDocument> documents_;
};

TEST_F(ChartElementTest, AnswersInTheChartGrammarsTerms) {
    DOMElement* graph = root(kDocument);
    ASSERT_NE(graph, nullptr);
    const auto at = [&](const char* id) { return byId(graph, id); };
    const auto yes = [](bool b) { return std::string(b ? "true" : "false"); };
    const struct {
        const char* what;
        std::function<std::string()> ask;
        const char* expected;
    } rows[] = {
        {"empty: element", [&] { return yes(ChartElement().get() != nullptr); }, "false"},
        {"empty: type", [&] { return text(ChartElement().getType()); }, "<null>"},
        {"empty: graph, parent", [&] { return yes(ChartElement().getGraph() || ChartElement().getParent()); }, "false"},
        {"empty: child with", [&] { return yes(ChartElement().getChildWithAttribute(u"id", u"x") != nullptr); }, "false"},
        {"empty: categorical", [&] { return yes(ChartDimension().isCategorical() || ChartAxis().isCategorical()); }, "false"},
        {"empty: guide name", [&] { return text(ChartGuide().getName()); }, "<null>"},
        {"empty: legend variable", [&] { return yes(ChartVariable().isLegendVariable()); }, "false"},
        {"empty: chart type", [&] { return std::to_string(ChartGraph().getChartType()); }, "0"},
        {"a text node", [&] { return idOf(ChartElement(static_cast<DOMNode*>(graph->getOwnerDocument()->createTextNode(u"t")))); }, "<empty>"},
        {"the document as parent", [&] { return yes(ChartElement(graph).getParent() != nullptr); }, "false"},
        {"absent attribute", [&] { return text(ChartElement(at("e1")).getStyle()); }, ""},
        {"categorical 'true'", [&] { return yes(ChartElement(at("v1")).isCategorical()); }, "true"},
        {"categorical 'TRUE'", [&] { return yes(ChartElement(at("v2")).isCategorical()); }, "false"},
        {"categorical '1'", [&] { return yes(ChartElement(at("v3")).isCategorical()); }, "false"},
        {"graph: domain id", [&] { return yes(ChartGraph(graph).isCategorical(u"d1")); }, "true"},
        {"graph: unknown id", [&] { return yes(ChartGraph(graph).isCategorical(u"nothing")); }, "false"},
        {"graph: variable of the first y", [&] { return idOf(ChartGraph(graph).getVariable(u"y")); }, "v1"},
        {"dimension: empty domain, x variable", [&] { return yes(ChartDimension(at("dx")).isCategorical()); }, "false"},
        {"dimension: empty domain, y variable", [&] { return yes(ChartDimension(at("dy")).isCategorical()); }, "true"},
        {"dimension: domain decides", [&] { return yes(ChartDimension(at("dd")).isCategorical()); }, "true"},
        {"dimension: position", [&] { return text(ChartDimension(at("dy")).getPositionAesthetic().getAttributeValue(u"variable")); }, "v1"},
        {"axis of a dimension", [&] { return idOf(ChartAxis(at("az")).getDimension()); }, "dz"},
        {"axis of a facet label", [&] { return idOf(ChartAxis(at("afl")).getDimension()); }, "dz"},
        {"facet label categorical", [&] { return yes(ChartAxis(at("afl")).isCategorical()); }, "true"},
        {"axis elsewhere: dimension", [&] { return idOf(ChartAxis(at("astray")).getDimension()); }, "<empty>"},
        {"axis elsewhere: categorical", [&] { return yes(ChartAxis(at("astray")).isCategorical()); }, "false"},
        {"axis elsewhere: position", [&] { return idOf(ChartAxis(at("astray")).getPositionAesthetic()); }, "<empty>"},
        {"frame: facet role", [&] { return text(ChartFrame(at("f1")).getFacetRole()); }, "z"},
        {"guide named by its parameter", [&] { return text(ChartGuide(at("g1")).getName()); }, "y"},
        {"parameter: first element so named", [&] { return idOf(ChartGuide(at("g1")).getFirstParameter().getVariable()); }, "v1"},
        {"parameter: facet variable first", [&] { return idOf(ChartParameter(at("g1")->getLastElementChild()).getVariable()); }, "v2"},
        {"legend variable", [&] { return yes(ChartVariable(at("v1")).isLegendVariable()); }, "true"},
        {"no legend variable", [&] { return yes(ChartVariable(at("v4")).isLegendVariable()); }, "false"},
        {"role variable", [&] { return text(ChartElementElement(at("e1")).getRoleVariable(u"styleby")); }, "v1"},
        {"interpolation line", [&] { return yes(ChartElementElement(at("e1")).isInterpolationLine()); }, "true"},
        {"difference line", [&] { return yes(ChartElementElement(at("e2")).isDifferenceLine()); }, "true"},
        {"offspring needs every argument", [&] { return yes(ChartElement(graph).getOffspringWithAttribute(u"element", u"type", u"") != nullptr); }, "false"},
        {"element with, from anywhere", [&] { return idOf(ChartElement(ChartElement(at("v1")).getElementWithAttribute(u"element", u"type", u"area"))); }, "e2"},
    };
    for (const auto& row : rows)
        EXPECT_EQ(row.ask(), row.expected) << row.what;
}

TEST_F(ChartElementTest, ChartTypeTakesTheFirstRuleThatHolds) {
    const struct {
        const char* body;
        int type;
    } rows[] = {
        {"<statistic method='cumulativeSum'/><statistic method='histogram'/><theta/>", 3},
        {"<statistic method='range'/><statistic method='cumulativeSum'/>", 5},
        {"<statistic method='range'/><statistic method='tukeyInnerFence'/>", 1},
        {"<element type='interval'><statistic method='range'/></element>", 2},
        {"<theta/>", 6},
        {"<element type='line'/><element type='line'/>", 7},
        {"<element type='interval'/><element type='line'/>", 4},
        {"<element type='interval'/>", 0},
    };
    for (const auto& row : rows)
        EXPECT_EQ(ChartGraph(root(row.body)).getChartType(), row.type) << row.body;
}

} // namespace
