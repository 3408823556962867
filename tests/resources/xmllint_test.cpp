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

// Every sample chart, every bundled data document, and every embedded source of a sample moved
// into a data document on its own: a source moves between chart and data document unchanged.
TEST_F(Xmllint, SampleChartsTheirSourcesAndBundledDataValidate) {
    const std::vector<std::string> charts = sampleCharts();
    ASSERT_EQ(charts.size(), 15u);
    for (const std::string& chart : charts) {
        const LintResult r = xmllint(kChart, chart);
        EXPECT_EQ(r.exitCode, 0) << chart << "\n" << r.output;
        const std::string text = readText(chart);
        const std::string::size_type from = text.find("<embeddedSource ");
        const std::string::size_type to = text.find("</embeddedSource>");
        ASSERT_TRUE(from != std::string::npos && to != std::string::npos) << chart;
        expectValid(kData, "moved.xml", dataDocument(text.substr(from, to + 17 - from) + "\n"));
    }
    std::size_t checked = 0;
    for (const auto& entry : std::filesystem::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/data"))
        if (entry.path().extension() == ".xml") {
            const LintResult r = xmllint(kData, entry.path().string());
            EXPECT_EQ(r.exitCode, 0) << entry.path() << "\n" << r.output;
            ++checked;
        }
    EXPECT_GT(checked, 0u);
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
    const std::string empty =
        "<embeddedSource id=\"nothing\"><names></names><types></types><row/></embeddedSource>";
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

} // namespace
