#include "GrxTestSupport.h"

#include "ModelClasses.h"
#include "support/GrammarSupport.h"

#include <xercesc/dom/DOMDocument.hpp>

#include <gtest/gtest.h>

#include <regex>
#include <set>

using namespace xercesc;

namespace {

struct Listed {
    std::string className;
    const XMLCh* name;
    bool (*isOfClass)(const GrxBaseElement*);
};

template <class T> bool isA(const GrxBaseElement* e) { return dynamic_cast<const T*>(e) != nullptr; }

#define LISTED(Class) {#Class, Class::getElementName(), &isA<Class>},
#define LISTED_NAMED(Class, name) {#Class, name, &isA<Class>},
const std::vector<Listed> kListed = {GRX_MODEL_CLASSES(LISTED, LISTED_NAMED)};
#undef LISTED
#undef LISTED_NAMED

std::set<std::string> matches(const std::string& text, const char* pattern) {
    std::set<std::string> found;
    const std::regex re(pattern);
    for (auto it = std::sregex_iterator(text.begin(), text.end(), re); it != std::sregex_iterator(); ++it)
        found.insert((*it)[1]);
    return found;
}

TEST(Registry, EveryDeclaredClassIsListedAndMadeForItsOwnName) {
    const std::string header =
        grammar_test::readText(PLOTAID_SOURCE_DIR "/platform/grxchart/include/grx/GrxModel.h");
    std::set<std::string> declared =
        matches(header, R"(class GRX_API (\w+) : public \w+ \{\s*GRX_ELEMENT\()");
    for (const std::string& c : matches(header, R"(\n(?:GRX_PLAIN_STATISTIC|GRX_MAPPING)\((\w+),)"))
        declared.insert(c);
    declared.insert("CTCoordinate"); // one kind under the three role names
    std::set<std::string> listed;
    for (const Listed& l : kListed)
        listed.insert(l.className);
    EXPECT_EQ(listed, declared);

    // Each name is wrapped by its own class, so no two rows share a name.
    DOMDocument* doc = grxtest::newChartDocument();
    std::vector<DOMElement*> made;
    for (const Listed& l : kListed)
        made.push_back(static_cast<DOMElement*>(doc->getDocumentElement()->appendChild(
            doc->createElementNS(grxtest::kChartNamespace, l.name))));
    GrxVisualization vis(doc->getDocumentElement(), true);
    EXPECT_EQ(vis.wrapperCount(), kListed.size());
    for (std::size_t i = 0; i < kListed.size(); ++i)
        EXPECT_TRUE(kListed[i].isOfClass(GrxBaseElement::wrapperOf(made[i]))) << kListed[i].className;
}

TEST(Registry, EveryRegisteredElementIsDeclaredInTheChartGrammar) {
    const std::set<std::string> grammar = matches(
        grammar_test::readText(grammar_test::schemaFolder() + "grxml-2.9.xsd"), R"re(<xs:element name="(\w+)")re");
    ASSERT_GT(grammar.size(), 100u);
    for (const Listed& l : kListed) {
        const std::string name = ChartString(l.name).toUTF8();
        EXPECT_TRUE(GrxDocument::isKnownElement(l.name)) << name;
        EXPECT_EQ(grammar.count(name), 1u) << name << " of " << l.className;
    }
}

} // namespace
