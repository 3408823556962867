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

template <class T> bool isA(const GrxBaseElement* e) {
    return dynamic_cast<const T*>(e) != nullptr;
}

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

// Every declared class is listed, and no two rows share a name, so each element is wrapped by the class
// listed for it; each name is an element of the chart grammar.
TEST(Registry, EveryDeclaredClassIsListedAndMadeForItsOwnGrammarElement) {
    const std::string header =
        grammar_test::readText(PLOTAID_SOURCE_DIR "/platform/grxchart/include/grx/GrxModel.h");
    std::set<std::string> declared =
        matches(header, R"(class GRX_API (\w+) : public \w+ \{\s*GRX_ELEMENT\()");
    for (const std::string& c : matches(header, R"(\n(?:GRX_PLAIN_STATISTIC|GRX_MAPPING)\((\w+),)"))
        declared.insert(c);
    declared.insert("CTCoordinate"); // one kind under the three role names
    const std::string grammar = grammar_test::readText(grammar_test::schemaFolder() + "grxml-2.9.xsd");
    DOMDocument* doc = grxtest::newChartDocument();
    std::vector<DOMElement*> made;
    std::set<std::string> listed;
    for (const Listed& l : kListed) {
        const std::string name = ChartString(l.name).toUTF8();
        listed.insert(l.className);
        EXPECT_TRUE(GrxDocument::isKnownElement(l.name)) << name;
        EXPECT_NE(grammar.find("<xs:element name=\"" + name + "\""), std::string::npos) << l.className;
        made.push_back(static_cast<DOMElement*>(
            doc->getDocumentElement()->appendChild(doc->createElementNS(grxtest::kChartNamespace, l.name))));
    }
    EXPECT_EQ(listed, declared);
    GrxVisualization vis(doc->getDocumentElement(), true);
    EXPECT_EQ(vis.wrapperCount(), kListed.size());
    for (std::size_t i = 0; i < kListed.size(); ++i)
        EXPECT_TRUE(kListed[i].isOfClass(GrxBaseElement::wrapperOf(made[i]))) << kListed[i].className;
}

} // namespace
