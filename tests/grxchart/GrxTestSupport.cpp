#include "GrxTestSupport.h"

#include <xercesc/dom/DOMAttr.hpp>
#include <xercesc/dom/DOMImplementation.hpp>
#include <xercesc/dom/DOMImplementationRegistry.hpp>
#include <xercesc/dom/DOMNamedNodeMap.hpp>
#include <xercesc/framework/LocalFileInputSource.hpp>
#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/parsers/XercesDOMParser.hpp>
#include <xercesc/sax/EntityResolver.hpp>
#include <xercesc/sax/ErrorHandler.hpp>
#include <xercesc/sax/SAXParseException.hpp>
#include <xercesc/util/PlatformUtils.hpp>

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <sstream>

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

std::string readFile(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream s;
    s << in.rdbuf();
    return s.str();
}

std::vector<std::string> sampleCharts() {
    std::vector<std::string> out;
    const std::filesystem::path dir = std::filesystem::path(PLOTAID_EXAMPLES_DIR) / "charts";
    if (!std::filesystem::is_directory(dir))
        return out;
    for (const auto& entry : std::filesystem::directory_iterator(dir))
        if (entry.path().extension() == ".xml")
            out.push_back(entry.path().string());
    std::sort(out.begin(), out.end());
    return out;
}

void DocumentRelease::operator()(DOMDocument* doc) const {
    if (doc)
        doc->release();
}

namespace {

class Collector : public ErrorHandler, public EntityResolver {
public:
    std::string errors;
    void warning(const SAXParseException& e) override { note(e); }
    void error(const SAXParseException& e) override { note(e); }
    void fatalError(const SAXParseException& e) override { note(e); }
    void resetErrors() override {}
    // Schemas come from the source tree by file name; anything else is refused.
    InputSource* resolveEntity(const XMLCh* const, const XMLCh* const systemId) override {
        const std::string id = ChartString(systemId).toUTF8();
        const std::string::size_type slash = id.rfind('/');
        const std::string name = slash == std::string::npos ? id : id.substr(slash + 1);
        const std::filesystem::path file =
            std::filesystem::path(PLOTAID_SOURCE_DIR) / "resources" / "schemas" / name;
        if (name.empty() || !std::filesystem::is_regular_file(file)) {
            errors += "refused " + id + "\n";
            return new MemBufInputSource(reinterpret_cast<const XMLByte*>(""), 0, systemId);
        }
        return new LocalFileInputSource(ChartString(file.string()).xc_str());
    }

private:
    void note(const SAXParseException& e) {
        errors += std::to_string(e.getLineNumber()) + ":" + std::to_string(e.getColumnNumber()) + ": " +
                  ChartString(e.getMessage()).toUTF8() + "\n";
    }
};

} // namespace

OwnedDocument parseValidated(const std::string& text, std::string* errors) {
    Collector collector;
    XercesDOMParser parser;
    parser.setValidationScheme(XercesDOMParser::Val_Always);
    parser.setDoNamespaces(true);
    parser.setDoSchema(true);
    parser.setErrorHandler(&collector);
    parser.setEntityResolver(&collector);
    MemBufInputSource input(reinterpret_cast<const XMLByte*>(text.data()), text.size(), "grxchart-test");
    parser.parse(input);
    if (!collector.errors.empty() || parser.getErrorCount() != 0) {
        if (errors)
            *errors += collector.errors;
        return nullptr;
    }
    return OwnedDocument(parser.adoptDocument());
}

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
