// The grammars checked by xmllint, a validator independent of the Xerces-C the library uses.
#include "support/GrammarSupport.h"

#include <gtest/gtest.h>

#include <filesystem>

using namespace grammar_test;

namespace {

class Xmllint : public ::testing::Test {
protected:
    void SetUp() override {
        if (!haveXmllint())
            GTEST_SKIP() << "xmllint is not installed (Debian package libxml2-utils)";
    }

    static void expectValid(const std::string& schema, const std::string& name, const std::string& text) {
        ASSERT_FALSE(text.empty()) << name << ": the variant was not made";
        const LintResult r = xmllint(schema, writeScratch(name, text));
        EXPECT_EQ(r.exitCode, 0) << name << "\n" << r.output;
    }

    // Fails unless xmllint rejects the text and names the expected fault.
    static void expectInvalid(const std::string& schema, const std::string& name, const std::string& text,
                              const std::string& fault) {
        ASSERT_FALSE(text.empty()) << name << ": the variant was not made";
        const LintResult r = xmllint(schema, writeScratch(name, text));
        EXPECT_NE(r.exitCode, 0) << name << " was accepted";
        EXPECT_NE(r.output.find(fault), std::string::npos) << name << "\n" << r.output;
    }
};

const char* const kChart = "grxml-2.9.xsd";
const char* const kData = "grxml-data-2.1.xsd";

TEST_F(Xmllint, EverySampleChartValidates) {
    const std::vector<std::string> charts = sampleCharts();
    ASSERT_EQ(charts.size(), 15u);
    for (const std::string& chart : charts) {
        const LintResult r = xmllint(kChart, chart);
        EXPECT_EQ(r.exitCode, 0) << chart << "\n" << r.output;
    }
}

TEST_F(Xmllint, BrokenChartsAreRejected) {
    const std::string bar = readText(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/simple-bar.xml");
    expectInvalid(kChart, "undeclared.xml", replaceOnce(bar, "<graph ", "<chart/><graph "),
                  "'{http://plotaid.org/grxml}chart': This element is not expected");
    expectInvalid(kChart, "duplicate-id.xml",
                  replaceOnce(bar, "<sourceVariable id=\"var_gender\"", "<sourceVariable id=\"var_jobcat\""),
                  "var_jobcat");
    expectInvalid(kChart, "source-without-id.xml",
                  replaceOnce(bar, "<embeddedSource id=\"graphdataset\">", "<embeddedSource>"),
                  "The attribute 'id' is required");
    expectInvalid(kChart, "cycle-without-id.xml",
                  replaceOnce(bar, "<styleCycle id=\"styleCycleRepository\">", "<styleCycle>"),
                  "The attribute 'id' is required");
    expectInvalid(kChart, "id-not-a-name.xml", replaceOnce(bar, "id=\"legend_1\"", "id=\"legend 1\""),
                  "legend 1");
    expectInvalid(kChart, "tick-position.xml",
                  replaceOnce(bar, "position=\"outside\"", "position=\"sideways\""), "sideways");
    expectInvalid(kChart, "row-with-child.xml", replaceOnce(bar, "<row>1;", "<row><names/>1;"),
                  "Element content is not allowed");
    expectInvalid(
        kChart, "wrong-namespace.xml",
        replaceOnce(bar, "xmlns=\"http://plotaid.org/grxml\"", "xmlns=\"http://plotaid.org/other\""),
        "No matching global declaration");
}

// What the library writes through the object model must stay valid: children appended in any
// order, unknown attributes on any element (setGenericAttributes), text replaced anywhere.
TEST_F(Xmllint, EditsTheLibraryMakesStayValid) {
    const std::string bar = readText(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/simple-bar.xml");
    expectValid(kChart, "style-appended-last.xml",
                replaceOnce(bar, "</visualization>", "<style id=\"style1\" color=\"red\"/></visualization>"));
    expectValid(kChart, "generic-attribute.xml", replaceOnce(bar, "<graph ", "<graph madeUp=\"1\" "));
    expectValid(kChart, "generic-text.xml",
                replaceOnce(bar, "<legend id=\"legend_1\"", "text<legend id=\"legend_1\""));
    expectValid(kChart, "extension-attributes.xml",
                replaceOnce(bar, "<extension ",
                            "<extension originLineY=\"lineGuide1\" frameLegendBin2=\"legend3\" "));
    expectValid(
        kChart, "popup.xml",
        replaceOnce(bar, "</visualization>",
                    "<popup id=\"popup1\" target=\"interval_1\" tokenTemplate=\"Y = $[1]$\">"
                    "<tokenMapping token=\"1\" variable=\"var_salary\"><summaryStatistic method=\"10\"/>"
                    "</tokenMapping></popup></visualization>"));
    // an enumerated attribute declared in the grammar still rejects a word outside its list
    expectInvalid(kChart, "generic-bad-enum.xml", replaceOnce(bar, "method=\"fixed\"", "method=\"floating\""),
                  "floating");
}

TEST_F(Xmllint, DataDocumentsInTheWritersForm) {
    const std::string two = "\t<embeddedSource id=\"graphdataset\">\n"
                            "\t\t<names>a;b&lt;c</names>\n"
                            "\t\t<types>string;string</types>\n"
                            "\t\t<row>1;2</row>\n"
                            "\t\t<row>3;</row>\n"
                            "\t</embeddedSource>\n";
    const std::string empty = "\t<embeddedSource id=\"nothing\">\n"
                              "\t\t<names></names>\n"
                              "\t\t<types></types>\n"
                              "\t\t<row/>\n"
                              "\t</embeddedSource>\n";
    expectValid(kData, "data.xml", dataDocument(two + empty));
    expectValid(kData, "data-empty.xml", dataDocument(""));
    // what the transformer moves out of a chart: every kind of source
    expectValid(kData, "data-moved.xml",
                dataDocument("<userSource id=\"u\"/><databaseSource id=\"d\" query=\"select\"/>"
                             "<delimitedFileSource id=\"f\" file=\"a.csv\"/><streamingSource id=\"s\"/>" +
                             two));
    expectInvalid(kData, "data-duplicate.xml", dataDocument(two + two), "graphdataset");
    expectInvalid(kData, "data-foreign.xml", dataDocument("<graph/>"), "This element is not expected");
    expectInvalid(kData, "data-row-outside.xml", dataDocument("<row>1</row>"),
                  "This element is not expected");
}

// The bundled data documents, as the XML data handler writes them.
TEST_F(Xmllint, BundledDataDocumentsValidate) {
    std::size_t checked = 0;
    for (const auto& entry :
         std::filesystem::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/data")) {
        if (entry.path().extension() != ".xml")
            continue;
        const LintResult r = xmllint(kData, entry.path().string());
        EXPECT_EQ(r.exitCode, 0) << entry.path() << "\n" << r.output;
        ++checked;
    }
    EXPECT_GT(checked, 0u);
}

// A source moves between chart and data document unchanged: every embedded source of every
// sample chart is a valid data document on its own.
TEST_F(Xmllint, SampleSourcesMoveIntoDataDocuments) {
    for (const std::string& chart : sampleCharts()) {
        const std::string text = readText(chart);
        const std::string::size_type from = text.find("<embeddedSource ");
        const std::string::size_type to = text.find("</embeddedSource>");
        ASSERT_NE(from, std::string::npos) << chart;
        ASSERT_NE(to, std::string::npos) << chart;
        const std::string source = text.substr(from, to + std::string("</embeddedSource>").size() - from);
        expectValid(kData, "moved-" + chart.substr(chart.find_last_of('/') + 1), dataDocument(source + "\n"));
    }
}

} // namespace
