// Every example template is a valid template to both validators, and the designer templates use
// only what the template grammar and the style import know.
#include "DesignerSupport.h"

#include "support/GrammarSupport.h"

using namespace designer_test;
using engine_test::EngineTest;

namespace {

using ExampleTemplates = EngineTest;

TEST_F(ExampleTemplates, EachValidatesWithXercesAndXmllintInTheCurrentForm) {
    const std::vector<std::string> names = exampleFiles("templates", ".sgt");
    for (const std::string& wanted : designerTemplates())
        EXPECT_NE(std::find(names.begin(), names.end(), wanted), names.end()) << wanted;
    const bool lint = grammar_test::haveXmllint();
    for (const std::string& name : names) {
        SCOPED_TRACE(name);
        const std::string body = engine_test::example("templates/" + name);
        plotaid::detail::ValidatingParser parser;
        const auto* doc =
            parser.parse(body, name.c_str(), ChartException("example template", "designer_test", 0));
        ASSERT_NE(doc, nullptr) << ::testing::PrintToString(parser.lastErrors());
        EXPECT_EQ(text(doc->getDocumentElement()->getLocalName()), "template");
        // The marker that keeps the template from being converted as an earlier one.
        EXPECT_NE(body.find("grxml-template-3.5.xsd"), std::string::npos);
        if (lint) {
            const grammar_test::LintResult r =
                grammar_test::xmllint("grxml-template-3.5.xsd", examplePath("templates/" + name));
            EXPECT_EQ(r.exitCode, 0) << r.output;
        }
    }
}

// Only the ten style and aesthetic instructions, several of them, so every one can be expected to
// apply; style declarations hold only children the style import reads (anything else would be
// logged and make the instruction fail).
TEST_F(ExampleTemplates, DesignerTemplatesUseOnlyWhatTheWalkAndTheStyleImportKnow) {
    const std::set<std::string> ten{
        "setColor", "setDash",  "setPattern",           "setShape",           "setSize",
        "addDash",  "addImage", "setGenericAttributes", "setShowLineMarkers", "setStyle"};
    const std::set<std::string> children{"glyph", "interpolation", "intervalGlyph", "shadow"};
    for (const std::string& name : designerTemplates()) {
        SCOPED_TRACE(name);
        const std::vector<std::string> tags = instructionsOf(name);
        for (const std::string& tag : tags)
            EXPECT_EQ(ten.count(tag), 1u) << tag;
        EXPECT_GE(std::set<std::string>(tags.begin(), tags.end()).size(), 3u);
        plotaid::detail::ValidatingParser parser;
        const auto* doc = parser.parse(engine_test::example("templates/" + name), name.c_str(),
                                       ChartException("example template", "designer_test", 0));
        ASSERT_NE(doc, nullptr);
        const std::vector<DOMElement*> styles = elementsNamed(doc, "style");
        EXPECT_GE(styles.size(), 10u);
        for (const DOMElement* style : styles)
            for (const DOMElement* c = style->getFirstElementChild(); c != nullptr;
                 c = c->getNextElementSibling())
                EXPECT_EQ(children.count(text(c->getLocalName())), 1u) << text(c->getLocalName());
    }
}

} // namespace
