// The grammars as the library reads them: Xerces-C with the library's own parser settings,
// schemas found by file name in the resource folder.
#include "support/GrammarSupport.h"

#include "foundation/ValidatingParser.h"

#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMElement.hpp>
#include <xercesc/dom/DOMNodeList.hpp>
#include <xercesc/util/XMLString.hpp>

#include <gtest/gtest.h>

using namespace grammar_test;
using plotaid::detail::ValidatingParser;
using namespace XERCES_CPP_NAMESPACE;

namespace {

const ChartException kFailure("grammar test parse failed", "tests/grammar", 0);

std::string joined(const std::vector<std::string>& errors) {
    std::string all;
    for (const std::string& e : errors)
        all += e + "\n";
    return all;
}

class XercesGrammar : public ::testing::Test {
protected:
    static void SetUpTestSuite() { useSourceGrammars(); }
    ValidatingParser parser;

    const DOMDocument* parse(const std::string& text, const char* name) {
        return parser.parse(text, name, kFailure);
    }
    void expectRejected(const std::string& text, const char* name, const std::string& fault) {
        ASSERT_FALSE(text.empty()) << name << ": the variant was not made";
        EXPECT_EQ(parse(text, name), nullptr) << name << " was accepted";
        EXPECT_NE(joined(parser.lastErrors()).find(fault), std::string::npos) << joined(parser.lastErrors());
    }
};

TEST_F(XercesGrammar, EverySampleChartParsesAndRegistersItsIds) {
    const std::vector<std::string> charts = sampleCharts();
    ASSERT_EQ(charts.size(), 15u);
    for (const std::string& chart : charts) {
        const DOMDocument* document = parse(readText(chart), chart.c_str());
        ASSERT_NE(document, nullptr) << chart << "\n" << joined(parser.lastErrors());
        // ids are xs:ID, so the parsed document finds them without help from the object model
        const DOMElement* legend = document->getElementById(u"legend_1");
        ASSERT_NE(legend, nullptr) << chart;
        EXPECT_TRUE(XMLString::equals(legend->getLocalName(), u"legend"));
        const DOMNodeList* sources = document->getElementsByTagNameNS(u"*", u"embeddedSource");
        ASSERT_GT(sources->getLength(), 0u) << chart;
        const auto* source = static_cast<const DOMElement*>(sources->item(0));
        EXPECT_EQ(document->getElementById(source->getAttribute(u"id")), source) << chart;
        EXPECT_NE(document->getElementById(u"c-o-n-t-a-i-n-er"), nullptr) << chart;
    }
}

TEST_F(XercesGrammar, StructuralFaultsStopTheParse) {
    const std::string bar = readText(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/simple-bar.xml");
    expectRejected(replaceOnce(bar, "<graph ", "<chart/><graph "), "undeclared", "'chart'");
    expectRejected(replaceOnce(bar, "<embeddedSource id=\"graphdataset\">", "<embeddedSource>"), "no-id",
                   "missing required attribute 'id'");
    expectRejected(replaceOnce(bar, "<row>1;", "<row><names/>1;"), "row-with-child", "cannot have elements");
}

// The library lets a value of a wrong data type pass (the error handler's rule); to Xerces-C a
// repeated id and a word outside an enumeration are such values. xmllint rejects both.
TEST_F(XercesGrammar, WrongDataTypeValuesPassAsTheLibraryReadsThem) {
    const std::string bar = readText(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/simple-bar.xml");
    const std::string sideways = replaceOnce(bar, "position=\"outside\"", "position=\"sideways\"");
    EXPECT_NE(parse(sideways, "sideways"), nullptr) << joined(parser.lastErrors());
    const std::string twice =
        replaceOnce(bar, "<sourceVariable id=\"var_gender\"", "<sourceVariable id=\"var_jobcat\"");
    EXPECT_NE(parse(twice, "twice"), nullptr) << joined(parser.lastErrors());
}

TEST_F(XercesGrammar, DataDocumentsAndTemplates) {
    const std::string data = dataDocument("\t<embeddedSource id=\"graphdataset\">\n"
                                          "\t\t<names>a;b</names>\n"
                                          "\t\t<types>string;string</types>\n"
                                          "\t\t<row>1;2</row>\n"
                                          "\t\t<row>3;</row>\n"
                                          "\t</embeddedSource>\n");
    const DOMDocument* document = parse(data, "data");
    ASSERT_NE(document, nullptr) << joined(parser.lastErrors());
    // the sources keep the chart namespace, so they move into a chart unchanged
    const DOMNodeList* rows = document->getElementsByTagNameNS(u"http://plotaid.org/grxml", u"row");
    EXPECT_EQ(rows->getLength(), 2u);
    EXPECT_NE(document->getElementById(u"graphdataset"), nullptr);

    // the fixed template that adds popups, and an instruction no action knows
    const std::string popups =
        "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"no\"?>\n"
        "<template Kovar-Version=\"2.10\" xmlns=\"http://plotaid.org/grxml\" "
        "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
        "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-template-3.5.xsd\">"
        "<addPopups x=\"true\" y=\"true\" z=\"true\" legend=\"true\"/><fooBar/></template>";
    EXPECT_NE(parse(popups, "popups"), nullptr) << joined(parser.lastErrors());
    const std::string converted = replaceOnce(popups, "grxml-template-3.5.xsd", "grxml-template-1.0.xsd");
    EXPECT_NE(parse(converted, "converted"), nullptr) << joined(parser.lastErrors());
}

} // namespace
