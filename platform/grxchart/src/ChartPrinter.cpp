#include <grx/ChartPrinter.h>

#include <xercesc/dom/DOMAttr.hpp>
#include <xercesc/dom/DOMElement.hpp>
#include <xercesc/dom/DOMImplementation.hpp>
#include <xercesc/dom/DOMImplementationRegistry.hpp>
#include <xercesc/dom/DOMLSOutput.hpp>
#include <xercesc/dom/DOMLSSerializer.hpp>
#include <xercesc/dom/DOMNamedNodeMap.hpp>
#include <xercesc/framework/XMLFormatter.hpp>
#include <xercesc/util/XMLString.hpp>
#include <xercesc/util/XMLUni.hpp>

#include <memory>
#include <set>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

using namespace xercesc;

namespace {

class StreamTarget : public XMLFormatTarget {
public:
    explicit StreamTarget(std::ostream& out) : out_(out) {}
    void writeChars(const XMLByte* const bytes, const XMLSize_t count, XMLFormatter* const) override {
        out_.write(reinterpret_cast<const char*>(bytes), static_cast<std::streamsize>(count));
    }
    void flush() override { out_.flush(); }

private:
    std::ostream& out_;
};

struct Release {
    template <class T> void operator()(T* p) const { p->release(); }
};

// Namespace fix-up. The serialiser keeps every declaration the DOM holds, so one that repeats the
// binding in scope (a parsed data document repeats the chart namespace on every source) is taken
// off for the write. And it does not count a default-namespace declaration made on a prefixed
// element (the data root): it declares that namespace again on each element below that uses it.
using Scope = std::vector<std::pair<const XMLCh*, const XMLCh*>>; // prefix, namespace; innermost last

const XMLCh* boundTo(const Scope& scope, const XMLCh* prefix) {
    for (auto it = scope.rbegin(); it != scope.rend(); ++it)
        if (XMLString::equals(it->first, prefix))
            return it->second;
    return nullptr;
}

// The prefix an attribute declares (empty for the default namespace), or null.
const XMLCh* declaredPrefix(const DOMAttr* attribute) {
    if (!XMLString::equals(attribute->getNamespaceURI(), XMLUni::fgXMLNSURIName))
        return nullptr;
    return XMLString::equals(attribute->getNodeName(), XMLUni::fgXMLNSString) ? XMLUni::fgZeroLenString
                                                                               : attribute->getLocalName();
}

struct Declarations {
    std::vector<std::pair<DOMElement*, DOMAttr*>> repeated;
    // The start tags, as written, that the serialiser gives a declaration already in scope.
    std::set<std::string> redeclared;

    // hidden: the default namespace that a prefixed element declared, while no element below it
    // has used it yet (the serialiser has not seen it).
    void walk(DOMElement* element, Scope& scope, const XMLCh* hidden) {
        const std::size_t outer = scope.size();
        DOMNamedNodeMap* attributes = element->getAttributes();
        const XMLSize_t count = attributes ? attributes->getLength() : 0;
        const XMLCh* prefix = element->getPrefix();
        const XMLCh* ns = element->getNamespaceURI();
        const bool unprefixed = prefix == nullptr || *prefix == 0;
        if (hidden != nullptr && unprefixed && XMLString::equals(ns, hidden)) {
            redeclared.insert("<" + ChartString(element->getTagName()).toUTF8() + " xmlns=\"" +
                              ChartString(ns).toUTF8() + "\"");
            hidden = nullptr;
        }
        for (XMLSize_t i = 0; i < count; ++i) {
            auto* attribute = static_cast<DOMAttr*>(attributes->item(i));
            if (const XMLCh* declared = declaredPrefix(attribute)) {
                const XMLCh* was = boundTo(scope, declared);
                if (was != nullptr && XMLString::equals(was, attribute->getValue()))
                    repeated.emplace_back(element, attribute);
                else if (*declared == 0 && !unprefixed)
                    hidden = attribute->getValue();
            }
        }
        for (XMLSize_t i = 0; i < count; ++i) {
            auto* attribute = static_cast<DOMAttr*>(attributes->item(i));
            if (const XMLCh* declared = declaredPrefix(attribute))
                scope.emplace_back(declared, attribute->getValue());
        }
        if (unprefixed && ns != nullptr)
            hidden = nullptr;
        for (DOMElement* child = element->getFirstElementChild(); child; child = child->getNextElementSibling())
            walk(child, scope, hidden);
        scope.resize(outer);
    }
};

bool asciiBased(const ChartString& encoding) {
    const std::string name = encoding.toUTF8();
    return name.empty() || name == "UTF-8" || name == "utf-8" || name == "US-ASCII" || name == "ISO-8859-1";
}

void dropRedeclarations(std::string& text, const std::set<std::string>& tags) {
    // '<' is escaped everywhere but in markup, so only start tags can match.
    for (const std::string& tag : tags) {
        const std::size_t keep = tag.find(' ');
        for (std::size_t at = text.find(tag); at != std::string::npos; at = text.find(tag, at + keep))
            text.erase(at + keep, tag.size() - keep);
    }
}

} // namespace

void ChartPrinter::Print(const DOMDocument* document, std::ostream& out) const {
    Print(static_cast<const DOMNode*>(document), out);
}

void ChartPrinter::Print(const DOMNode* node, std::ostream& out) const {
    if (!node)
        return;
    static const XMLCh ls[] = u"LS";
    DOMImplementation* impl = DOMImplementationRegistry::getDOMImplementation(ls);
    std::unique_ptr<DOMLSSerializer, Release> writer(impl->createLSSerializer());
    std::unique_ptr<DOMLSOutput, Release> output(impl->createLSOutput());
    DOMConfiguration* config = writer->getDomConfig();
    if (config->canSetParameter(XMLUni::fgDOMWRTFormatPrettyPrint, whiteSpace_))
        config->setParameter(XMLUni::fgDOMWRTFormatPrettyPrint, whiteSpace_);

    output->setEncoding(encoding_.empty() ? XMLUni::fgUTF8EncodingString : encoding_.xc_str());

    const DOMNode* top = node->getNodeType() == DOMNode::DOCUMENT_NODE
                             ? static_cast<const DOMDocument*>(node)->getDocumentElement()
                             : node;
    Declarations declarations;
    if (top != nullptr && top->getNodeType() == DOMNode::ELEMENT_NODE) {
        Scope scope;
        declarations.walk(const_cast<DOMElement*>(static_cast<const DOMElement*>(top)), scope, nullptr);
    }
    auto& repeated = declarations.repeated;
    for (auto& [element, attribute] : repeated)
        element->removeAttributeNode(attribute);
    const auto restore = [&repeated] {
        for (auto& [element, attribute] : repeated)
            element->setAttributeNodeNS(attribute);
    };
    std::ostringstream held;
    const bool rewrite = !declarations.redeclared.empty() && asciiBased(encoding_);
    StreamTarget target(rewrite ? held : out);
    output->setByteStream(&target);
    try {
        writer->write(node, output.get());
    } catch (...) {
        restore();
        throw;
    }
    restore();
    if (rewrite) {
        std::string text = held.str();
        dropRedeclarations(text, declarations.redeclared);
        out << text;
    }
}
