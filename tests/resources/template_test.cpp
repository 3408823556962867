// Template grammars: the walk, not the parse, decides what an instruction is (the engine suite checks
// that the grammar declares every tag of the walk).
#include "support/GrammarSupport.h"

#include <gtest/gtest.h>

using namespace grammar_test;

namespace {

std::string templateText(const std::string& schema, const std::string& instructions) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"no\"?>\n"
           "<template Kovar-Version=\"2.10\" xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/" +
           schema + "\">\n" + instructions + "</template>\n";
}

class TemplateLint : public ::testing::Test {
protected:
    void SetUp() override {
        if (!haveXmllint())
            GTEST_SKIP() << "xmllint is not installed";
    }
    static LintResult lint(const std::string& schema, const std::string& name, const std::string& text) {
        return xmllint(schema, writeScratch(name, text));
    }
};

TEST_F(TemplateLint, UnknownInstructionsAreLeftToTheWalk) {
    const std::string body =
        "  <addPopups x=\"true\" y=\"true\" z=\"true\" legend=\"true\"/>\n"
        "  <fooBar anything=\"1\"><deeper/></fooBar>\n"
        "  <p:setStyle xmlns:p=\"urn:elsewhere\"/>\n"
        "  <setGenericAttributes elementName=\"label\" count=\"2\" madeUp=\"x\" text=\"T\"/>\n"
        "  <setStyle type=\"bar\" subtype=\"simple\"><style number=\"1\" value=\"color:red\">"
        "<glyph sides=\"5\"/></style></setStyle>\n"
        "  <setColor affect=\"main\"><cycle><style value=\"color:#3E58AC\"/></cycle></setColor>\n"
        "  <setTickLabelFormat role=\"x\"><numberFormat useGrouping=\"true\"/></setTickLabelFormat>\n"
        "  <!-- comments and text between instructions are skipped -->\n";
    const LintResult current =
        lint("grxml-template-3.5.xsd", "t35.xml", templateText("grxml-template-3.5.xsd", body));
    EXPECT_EQ(current.exitCode, 0) << current.output;
    const LintResult converted = lint(
        "grxml-template-1.0.xsd", "t10.xml",
        templateText("grxml-template-1.0.xsd",
                     body + "  <setAxisMajorTicks role=\"x\"><majorticks position=\"outside\"><gridlines/>"
                            "</majorticks></setAxisMajorTicks>\n"));
    EXPECT_EQ(converted.exitCode, 0) << converted.output;
}

TEST_F(TemplateLint, TheRootMustBeATemplate) {
    const std::string chart =
        replaceOnce(templateText("grxml-template-3.5.xsd", "<setStyle/>"), "<template ", "<visualization ");
    const LintResult r = lint("grxml-template-3.5.xsd", "not-template.xml",
                              replaceOnce(chart, "</template>", "</visualization>"));
    EXPECT_NE(r.exitCode, 0) << r.output;
    EXPECT_NE(r.output.find("No matching global declaration"), std::string::npos) << r.output;
}

TEST_F(TemplateLint, OlderDocumentsAreReadLeniently) {
    const std::string old =
        "<?xml version=\"1.0\"?>\n"
        "<graph xmlns=\"http://plotaid.org/grxml\" xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
        "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-1.4.xsd\">"
        "<style id=\"c-o-n-t-a-i-n-er\" value=\"color:red\"><style id=\"frame1s\" "
        "value=\"visibility:hidden\"/></style>"
        "<frame id=\"frame1\"><location left=\"1%\" right=\"99%\"/><frame id=\"frame2\"/></frame>"
        "<dimension role=\"y\" domain=\"d1\"><axis opposite=\"true\"><majorticks "
        "labelangle=\"45\"/></axis></dimension>"
        "<domain id=\"d1\"><interval min=\"0\" max=\"10\"/></domain>"
        "<source id=\"data\"><row><dataValue name=\"a\">1</dataValue></row></source></graph>\n";
    const LintResult ok = lint("grxml-1.4.xsd", "old.xml", old);
    EXPECT_EQ(ok.exitCode, 0) << ok.output;
    // ids are IDs there too, since the converter looks styles up by id
    const LintResult twice =
        lint("grxml-1.4.xsd", "old-twice.xml", replaceOnce(old, "id=\"frame2\"", "id=\"frame1\""));
    EXPECT_NE(twice.exitCode, 0) << twice.output;
}

} // namespace
