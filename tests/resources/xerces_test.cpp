// The grammars as the library reads them (Xerces-C with the library's own parser settings, schemas
// found by file name in the resource folder), against xmllint, a validator independent of Xerces-C.
#include "support/GrammarSupport.h"

#include "foundation/ValidatingParser.h"

#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMNodeList.hpp>

#include <gtest/gtest.h>

#include <filesystem>

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
};

// Structural faults stop the library's parse. A value of a wrong data type passes there (the error
// handler's rule); to Xerces-C a repeated id, a word outside an enumeration and an id that is no
// name are such values. xmllint rejects them all.
TEST_F(XercesGrammar, BrokenChartsAreRejectedByXmllintAndStructurallyBrokenOnesByTheLibrary) {
    const std::string bar = readText(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/simple-bar.xml");
    struct Case {
        const char* from;
        const char* to;
        const char* xercesFault; // null: the library reads the chart
        const char* xmllintFault;
    };
    const Case cases[] = {
        {"<graph ", "<chart/><graph ", "'chart'",
         "'{http://plotaid.org/grxml}chart': This element is not expected"},
        {"<embeddedSource id=\"graphdataset\">", "<embeddedSource>", "missing required attribute 'id'",
         "The attribute 'id' is required"},
        {"<row>1;", "<row><names/>1;", "cannot have elements", "Element content is not allowed"},
        {"<styleCycle id=\"styleCycleRepository\">", "<styleCycle>", "missing required attribute 'id'",
         "The attribute 'id' is required"},
        {"position=\"outside\"", "position=\"sideways\"", nullptr, "sideways"},
        {"<sourceVariable id=\"var_gender\"", "<sourceVariable id=\"var_jobcat\"", nullptr, "var_jobcat"},
        {"id=\"legend_1\"", "id=\"legend 1\"", nullptr, "legend 1"},
        {"xmlns=\"http://plotaid.org/grxml\"", "xmlns=\"http://plotaid.org/other\"", "",
         "No matching global declaration"},
    };
    const bool lint = haveXmllint();
    for (const Case& c : cases) {
        SCOPED_TRACE(c.to);
        const std::string text = replaceOnce(bar, c.from, c.to);
        ASSERT_FALSE(text.empty()) << "the variant was not made";
        const DOMDocument* document = parse(text, "variant");
        if (c.xercesFault == nullptr) {
            EXPECT_NE(document, nullptr) << joined(parser.lastErrors());
        } else {
            EXPECT_EQ(document, nullptr);
            EXPECT_NE(joined(parser.lastErrors()).find(c.xercesFault), std::string::npos)
                << joined(parser.lastErrors());
        }
        if (lint) {
            const LintResult r = xmllint("grxml-2.9.xsd", writeScratch("variant.xml", text));
            EXPECT_NE(r.exitCode, 0);
            EXPECT_NE(r.output.find(c.xmllintFault), std::string::npos) << r.output;
        }
    }
}

TEST_F(XercesGrammar, DataDocumentsAndTemplates) {
    for (const auto& entry : std::filesystem::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/data"))
        if (entry.path().extension() == ".xml") {
            EXPECT_NE(parse(readText(entry.path().string()), "bundled"), nullptr) << entry.path();
        }
    const std::string data = dataDocument("<embeddedSource id=\"graphdataset\"><names>a;b</names>"
                                          "<types>string;string</types><row>1;2</row><row>3;</row>"
                                          "</embeddedSource>");
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
