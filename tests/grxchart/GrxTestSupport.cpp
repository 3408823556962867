#include "GrxTestSupport.h"

#include <xercesc/dom/DOMAttr.hpp>
#include <xercesc/dom/DOMImplementation.hpp>
#include <xercesc/dom/DOMImplementationRegistry.hpp>
#include <xercesc/dom/DOMNamedNodeMap.hpp>
#include <xercesc/util/PlatformUtils.hpp>

#include <gtest/gtest.h>

#include <algorithm>

using namespace xercesc;

namespace {

// The object model leaves Xerces-C to its user; the tests hold it for the whole run.
class XercesEnvironment : public ::testing::Environment {
public:
    void SetUp() override { XMLPlatformUtils::Initialize(); }
    void TearDown() override { XMLPlatformUtils::Terminate(); }
};

[[maybe_unused]] ::testing::Environment* const xercesEnvironment =
    ::testing::AddGlobalTestEnvironment(new XercesEnvironment);

void describe(const DOMElement* e, int depth, std::string& out) {
    out.append(static_cast<std::size_t>(depth) * 2, ' ');
    out += ChartString(e->getLocalName() ? e->getLocalName() : e->getNodeName()).toUTF8();
    if (GrxBaseElement::wrapperOf(e))
        out += '*';
    std::vector<std::string> attrs;
    const DOMNamedNodeMap* map = e->getAttributes();
    for (XMLSize_t i = 0; i < map->getLength(); ++i) {
        const DOMNode* a = map->item(i);
        // Namespace declarations are the serialiser's business, not the chart's structure.
        if (ChartString(a->getNamespaceURI()).equals(u"http://www.w3.org/2000/xmlns/"))
            continue;
        attrs.push_back(ChartString(a->getNodeName()).toUTF8() + "=" +
                        ChartString(a->getNodeValue()).toUTF8());
    }
    std::sort(attrs.begin(), attrs.end());
    for (const std::string& a : attrs)
        out += " " + a;
    std::string text;
    for (const DOMNode* n = e->getFirstChild(); n; n = n->getNextSibling())
        if (n->getNodeType() == DOMNode::TEXT_NODE)
            text += ChartString(n->getNodeValue()).toUTF8();
    text.erase(std::remove_if(text.begin(), text.end(), [](char c) { return c == ' ' || c == '\n'; }),
               text.end());
    if (!text.empty())
        out += " \"" + text + "\"";
    out += '\n';
    for (const DOMElement* c = e->getFirstElementChild(); c; c = c->getNextElementSibling())
        describe(c, depth + 1, out);
}

} // namespace

namespace grxtest {

DOMDocument* newChartDocument() {
    DOMImplementation* impl = DOMImplementationRegistry::getDOMImplementation(u"LS");
    DOMDocument* doc = impl->createDocument(kChartNamespace, GrxUni::_visualization, nullptr);
    doc->getDocumentElement()->setAttributeNS(
        u"http://www.w3.org/2001/XMLSchema-instance", u"xsi:schemaLocation",
        u"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-2.9.xsd");
    return doc;
}

std::string signature(const DOMElement* root) {
    std::string out;
    describe(root, 0, out);
    return out;
}

} // namespace grxtest
