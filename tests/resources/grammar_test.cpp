// The grammars as the library reads them (Xerces-C with the library's own parser settings, schemas
// found by file name in the resource folder), and as xmllint, a validator independent of Xerces-C, reads
// them.
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

std::string templateText(const std::string& schema, const std::string& instructions) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"no\"?>\n<template Kovar-Version=\"2.10\" "
           "xmlns=\"http://plotaid.org/grxml\" xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/" +
           schema + "\">\n" + instructions + "</template>\n";
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

TEST_F(XercesGrammar, BundledDataDocuments) {
    std::size_t bundled = 0;
    for (const auto& entry : std::filesystem::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/data"))
        if (entry.path().extension() == ".xml") {
            ++bundled;
            const std::string text = readText(entry.path().string());
            EXPECT_NE(parse(text, "bundled"), nullptr) << entry.path();
            EXPECT_EQ(lintFaults("grxml-data-2.1.xsd", text), "") << entry.path();
        }
    EXPECT_GT(bundled, 0u);
}

// The leniencies the grammars promise (every kind of source in a data document, unknown template
// instructions left to the walk, older charts) hold, while the faults the grammars exist for are still
// rejected; the charts the library writes are checked by the suites that write them.
TEST_F(XercesGrammar, LenienciesHoldAndRealFaultsAreRejectedByXmllint) {
    if (!haveXmllint())
        GTEST_SKIP() << "xmllint is not installed (Debian package libxml2-utils)";
    const std::string two = "\t<embeddedSource id=\"graphdataset\">\n\t\t<names>a;b&lt;c</names>\n"
                            "\t\t<types>string;string</types>\n\t\t<row>1;2</row>\n\t\t<row>3;</row>\n"
                            "\t</embeddedSource>\n";
    const std::string instructions =
        "  <addPopups x=\"true\" y=\"true\" z=\"true\" legend=\"true\"/>\n"
        "  <fooBar anything=\"1\"><deeper/></fooBar>\n  <p:setStyle xmlns:p=\"urn:elsewhere\"/>\n"
        "  <setGenericAttributes elementName=\"label\" count=\"2\" madeUp=\"x\" text=\"T\"/>\n"
        "  <setStyle type=\"bar\" subtype=\"simple\"><style number=\"1\" value=\"color:red\">"
        "<glyph sides=\"5\"/></style></setStyle>\n"
        "  <setColor affect=\"main\"><cycle><style value=\"color:#3E58AC\"/></cycle></setColor>\n"
        "  <setTickLabelFormat role=\"x\"><numberFormat useGrouping=\"true\"/></setTickLabelFormat>\n"
        "  <!-- comments and text between instructions are skipped -->\n";
    const std::string old =
        "<?xml version=\"1.0\"?>\n<graph xmlns=\"http://plotaid.org/grxml\" "
        "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
        "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-1.4.xsd\">"
        "<style id=\"c-o-n-t-a-i-n-er\" value=\"color:red\"><style id=\"frame1s\" "
        "value=\"visibility:hidden\"/></style>"
        "<frame id=\"frame1\"><location left=\"1%\" right=\"99%\"/><frame id=\"frame2\"/></frame>"
        "<dimension role=\"y\" domain=\"d1\"><axis opposite=\"true\"><majorticks "
        "labelangle=\"45\"/></axis></dimension><domain id=\"d1\"><interval min=\"0\" max=\"10\"/></domain>"
        "<source id=\"data\"><row><dataValue name=\"a\">1</dataValue></row></source></graph>\n";
    const std::string chart35 = templateText("grxml-template-3.5.xsd", "<setStyle/>");
    const struct {
        const char* schema;
        std::string text;
        const char* fault; // "": valid
    } cases[] = {
        {"grxml-data-2.1.xsd", dataDocument(""), ""},
        {"grxml-data-2.1.xsd",
         dataDocument("<userSource id=\"u\"/><databaseSource id=\"d\" query=\"select\"/>"
                      "<delimitedFileSource id=\"f\" file=\"a.csv\"/><streamingSource id=\"s\"/>" +
                      two),
         ""},
        {"grxml-data-2.1.xsd", dataDocument(two + two), "graphdataset"},
        {"grxml-data-2.1.xsd", dataDocument("<graph/>"), "This element is not expected"},
        {"grxml-data-2.1.xsd", dataDocument("<row>1</row>"), "This element is not expected"},
        {"grxml-template-3.5.xsd", templateText("grxml-template-3.5.xsd", instructions), ""},
        {"grxml-template-3.5.xsd",
         replaceOnce(replaceOnce(chart35, "<template ", "<visualization "), "</template>",
                     "</visualization>"),
         "No matching global declaration"},
        // older charts are read leniently, but their ids are IDs too: the converter looks styles up by id
        {"grxml-1.4.xsd", old, ""},
        {"grxml-1.4.xsd", replaceOnce(old, "id=\"frame2\"", "id=\"frame1\""), "frame1"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.text);
        ASSERT_FALSE(c.text.empty()) << "the variant was not made";
        const LintResult r = xmllint(c.schema, writeScratch("variant.xml", c.text));
        EXPECT_EQ(r.exitCode == 0, *c.fault == '\0') << r.output;
        EXPECT_NE(r.output.find(c.fault), std::string::npos) << r.output;
    }
}

} // namespace
