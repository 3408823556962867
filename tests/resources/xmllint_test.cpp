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
};

std::string templateText(const std::string& schema, const std::string& instructions) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"no\"?>\n<template Kovar-Version=\"2.10\" "
           "xmlns=\"http://plotaid.org/grxml\" xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/" +
           schema + "\">\n" + instructions + "</template>\n";
}

// Every sample chart, every bundled data document, and every embedded source of a sample moved
// into a data document on its own: a source moves between chart and data document unchanged.
TEST_F(Xmllint, SampleChartsTheirSourcesAndBundledDataValidate) {
    const std::vector<std::string> charts = sampleCharts();
    ASSERT_EQ(charts.size(), 16u);
    for (const std::string& chart : charts) {
        const LintResult r = xmllint("grxml-2.9.xsd", chart);
        EXPECT_EQ(r.exitCode, 0) << chart << "\n" << r.output;
        const std::string text = readText(chart);
        const std::string::size_type from = text.find("<embeddedSource "),
                                     to = text.find("</embeddedSource>");
        ASSERT_TRUE(from != std::string::npos && to != std::string::npos) << chart;
        const std::string moved = dataDocument(text.substr(from, to + 17 - from) + "\n");
        EXPECT_EQ(xmllint("grxml-data-2.1.xsd", writeScratch("moved.xml", moved)).exitCode, 0) << chart;
    }
    std::size_t checked = 0;
    for (const auto& entry : std::filesystem::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/data"))
        if (entry.path().extension() == ".xml") {
            const LintResult r = xmllint("grxml-data-2.1.xsd", entry.path().string());
            EXPECT_EQ(r.exitCode, 0) << entry.path() << "\n" << r.output;
            ++checked;
        }
    EXPECT_GT(checked, 0u);
}

// What the library writes must stay valid (children appended in any order, unknown attributes on any
// element, text anywhere, every kind of source moved out of a chart, unknown template instructions
// left to the walk), while the faults the grammars exist for are still rejected.
TEST_F(Xmllint, WhatTheLibraryWritesIsValidAndRealFaultsAreNot) {
    const std::string bar = readText(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/simple-bar.xml");
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
        {"grxml-2.9.xsd", replaceOnce(bar, "</visualization>", "<style id=\"style1\"/></visualization>"), ""},
        {"grxml-2.9.xsd", replaceOnce(bar, "<graph ", "<graph madeUp=\"1\" "), ""},
        {"grxml-2.9.xsd", replaceOnce(bar, "<legend id=\"legend_1\"", "text<legend id=\"legend_1\""), ""},
        {"grxml-2.9.xsd",
         replaceOnce(bar, "<extension ",
                     "<extension originLineY=\"lineGuide1\" frameLegendBin2=\"legend3\" "),
         ""},
        {"grxml-2.9.xsd",
         replaceOnce(
             bar, "</visualization>",
             "<popup id=\"popup1\" target=\"interval_1\" tokenTemplate=\"Y = $[1]$\"><tokenMapping "
             "token=\"1\" variable=\"var_salary\"><summaryStatistic method=\"10\"/></tokenMapping></popup>"
             "</visualization>"),
         ""},
        // an enumerated attribute declared in the grammar still rejects a word outside its list
        {"grxml-2.9.xsd", replaceOnce(bar, "method=\"fixed\"", "method=\"floating\""), "floating"},
        {"grxml-data-2.1.xsd",
         dataDocument(two +
                      "<embeddedSource id=\"nothing\"><names></names><types></types><row/></embeddedSource>"),
         ""},
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
        {"grxml-template-1.0.xsd",
         templateText("grxml-template-1.0.xsd",
                      instructions +
                          "  <setAxisMajorTicks role=\"x\"><majorticks position=\"outside\"><gridlines/>"
                          "</majorticks></setAxisMajorTicks>\n"),
         ""},
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
