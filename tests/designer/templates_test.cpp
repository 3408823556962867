// Every example template is a valid template to both validators, and uses only what the template
// grammar and the style import know.
#include "DesignerSupport.h"

#include "foundation/ValidatingParser.h"

using namespace designer_test;
using engine_test::EngineTest;

namespace {

using ExampleTemplates = EngineTest;

TEST_F(ExampleTemplates, TheDesignerTemplatesAreThere) {
    const std::vector<std::string> names = exampleFiles("templates", ".sgt");
    for (const std::string& wanted : designerTemplates())
        EXPECT_NE(std::find(names.begin(), names.end(), wanted), names.end()) << wanted;
}

TEST_F(ExampleTemplates, EachValidatesWithXerces) {
    const std::vector<std::string> names = exampleFiles("templates", ".sgt");
    ASSERT_GE(names.size(), designerTemplates().size());
    for (const std::string& name : names) {
        plotaid::detail::ValidatingParser parser;
        const auto* doc = parser.parse(engine_test::example("templates/" + name), name.c_str(),
                                       ChartException("example template", "designer_test", 0));
        ASSERT_NE(doc, nullptr) << name << ": " << ::testing::PrintToString(parser.lastErrors());
        // Current form: the marker that keeps the template from being converted as an earlier one.
        EXPECT_NE(engine_test::example("templates/" + name).find("grxml-template-3.5.xsd"), std::string::npos)
            << name;
        EXPECT_EQ(text(doc->getDocumentElement()->getLocalName()), "template") << name;
    }
}

TEST_F(ExampleTemplates, EachValidatesWithXmllint) {
    if (!haveXmllint())
        GTEST_SKIP() << "xmllint is not installed (Debian package libxml2-utils)";
    TempDir scratch;
    for (const std::string& name : exampleFiles("templates", ".sgt")) {
        const LintResult r = xmllint(scratch, "grxml-template-3.5.xsd", examplePath("templates/" + name));
        EXPECT_EQ(r.exitCode, 0) << name << "\n" << r.output;
    }
}

// xmllint must be able to refuse a template here, or the check above proves nothing.
TEST_F(ExampleTemplates, XmllintRefusesABrokenTemplate) {
    if (!haveXmllint())
        GTEST_SKIP() << "xmllint is not installed (Debian package libxml2-utils)";
    TempDir scratch;
    std::string broken = engine_test::example("templates/corporate.sgt");
    const std::string ns = "xmlns=\"http://plotaid.org/grxml\"";
    const std::string::size_type at = broken.find(ns);
    ASSERT_NE(at, std::string::npos);
    broken.replace(at, ns.size(), "xmlns=\"http://plotaid.org/other\"");
    const std::string path = scratch.file("broken.sgt");
    std::ofstream(path, std::ios::binary) << broken;
    const LintResult r = xmllint(scratch, "grxml-template-3.5.xsd", path);
    EXPECT_NE(r.exitCode, 0) << r.output;
    EXPECT_NE(r.output.find("No matching global declaration"), std::string::npos) << r.output;
}

// Style declarations hold only children the style import reads; anything else would be logged
// and make the instruction fail.
TEST_F(ExampleTemplates, StyleDeclarationsHoldOnlyChildrenTheImportKnows) {
    const std::set<std::string> known{"glyph", "interpolation", "intervalGlyph", "shadow"};
    for (const std::string& name : designerTemplates()) {
        plotaid::detail::ValidatingParser parser;
        const auto* doc = parser.parse(engine_test::example("templates/" + name), name.c_str(),
                                       ChartException("example template", "designer_test", 0));
        ASSERT_NE(doc, nullptr) << name;
        std::size_t styles = 0;
        for (const DOMElement* style : elementsNamed(doc, "style")) {
            ++styles;
            for (const DOMElement* c = style->getFirstElementChild(); c != nullptr;
                 c = c->getNextElementSibling())
                EXPECT_EQ(known.count(text(c->getLocalName())), 1u)
                    << name << ": " << text(c->getLocalName());
        }
        EXPECT_GE(styles, 10u) << name;
    }
}

// Each designer template uses several of the ten style and aesthetic instructions, and nothing
// else, so that every instruction can be expected to apply.
TEST_F(ExampleTemplates, EachUsesSeveralOfTheTenInstructions) {
    const std::set<std::string> ten{
        "setColor", "setDash",  "setPattern",           "setShape",           "setSize",
        "addDash",  "addImage", "setGenericAttributes", "setShowLineMarkers", "setStyle"};
    for (const std::string& name : designerTemplates()) {
        plotaid::detail::ValidatingParser parser;
        const auto* doc = parser.parse(engine_test::example("templates/" + name), name.c_str(),
                                       ChartException("example template", "designer_test", 0));
        ASSERT_NE(doc, nullptr) << name;
        std::set<std::string> used;
        for (const DOMElement* i = doc->getDocumentElement()->getFirstElementChild(); i != nullptr;
             i = i->getNextElementSibling()) {
            EXPECT_EQ(ten.count(text(i->getLocalName())), 1u) << name << ": " << text(i->getLocalName());
            used.insert(text(i->getLocalName()));
        }
        EXPECT_GE(used.size(), 3u) << name;
    }
}

} // namespace
