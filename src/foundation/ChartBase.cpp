// The document base shared by the library's builders.
#include <plotaid/ChartBase.h>

#include "foundation/Report.h"
#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartException.h>

#include <grx/GrxBaseElement.h>
#include <grx/GrxUni.h>
#include <grx/GrxVisualization.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLException.hpp>
#include <xercesc/util/XMLStringTokenizer.hpp>

#include <atomic>
#include <clocale>
#include <cstdint>
#include <limits>
#include <sstream>
#include <unordered_map>
#include <vector>

using namespace XERCES_CPP_NAMESPACE;

namespace {

const char* const kFile = "backend/chartxml/plotaid/src/chartbase";

constexpr XMLCh kOlderSchemaLocation[] = u"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-1.4.xsd";
constexpr XMLCh kXmlnsUri[] = u"http://www.w3.org/2000/xmlns/";
constexpr XMLCh kSchemaInstanceUri[] = u"http://www.w3.org/2001/XMLSchema-instance";
// The grammar requires the root in the chart namespace; _namespaceURI ("xmlns:" + URI) names a
// declaration, not a namespace, so it is not used as one.
constexpr XMLCh kChartNamespace[] = u"http://plotaid.org/grxml";

void report(const std::string& message, unsigned line) {
    plotaid::detail::reportFailure(message, kFile, line);
}

std::string utf8(const XMLCh* text) {
    return ChartString(text).toUTF8();
}

bool xercesUp() {
    return plotaid::detail::XercesRuntime::references() > 0;
}

DOMDocument* newDocument(const XMLCh* rootName, const XMLCh* encoding, const XMLCh* schemaLocation) {
    if (!xercesUp()) {
        report("document creation failed: the XML parser library is not initialised", 60);
        return nullptr;
    }
    DOMDocument* document = nullptr;
    try {
        DOMImplementation* implementation =
            DOMImplementationRegistry::getDOMImplementation(ChartBase::_implFeatures);
        if (implementation == nullptr)
            return nullptr;
        document = implementation->createDocument(kChartNamespace, rootName, nullptr);
        document->setStrictErrorChecking(true);
        // The DOM keeps no settable encoding; the serialiser (ChartPrinter) writes the one asked of it.
        (void)encoding;
        document->setXmlStandalone(false);
        document->setXmlVersion(ChartBase::_XMLversion);
        DOMElement* root = document->getDocumentElement();
        root->setAttributeNS(kXmlnsUri, ChartBase::_schemaDefaultNSName, ChartBase::_schemaDefaultNSValue);
        root->setAttributeNS(kXmlnsUri, ChartBase::_schemaInstanceName, ChartBase::_schemaInstanceValue);
        root->setAttributeNS(kSchemaInstanceUri, ChartBase::_schemaLocationName, schemaLocation);
    } catch (const DOMException& e) {
        ChartErrorHandler().warning(
            ChartException("document creation failed: " + utf8(e.getMessage()), kFile, 60));
    } catch (const XMLException& e) {
        ChartErrorHandler().error(e);
    } catch (...) {
        report("document creation failed", 60);
    }
    return document;
}

// Where CreateUniqueId left off for a prefix in a document. The token (DOM user data of the
// document) tells a document from a later one at the same address.
struct UniqueIdHint {
    const void* token;
    unsigned next;
};
constexpr XMLCh kHintKey[] = u"plotaid-unique-id";
// Per thread, so no lock is needed; documents are used by one thread at a time.
std::unordered_map<const DOMDocument*, std::unordered_map<std::u16string, UniqueIdHint>>& hints() {
    thread_local std::unordered_map<const DOMDocument*, std::unordered_map<std::u16string, UniqueIdHint>> all;
    return all;
}
std::atomic<std::uintptr_t> lastToken{0};
// Bounds the hint table when documents come and go.
constexpr std::size_t kMaxHintDocuments = 64;
constexpr std::size_t kMaxHintPrefixes = 256;

std::vector<plotaid::detail::XercesRuntime>& heldRuntimes() {
    static std::vector<plotaid::detail::XercesRuntime> held;
    return held;
}

} // namespace

struct ChartBase::Parser {
    plotaid::detail::XercesRuntime runtime;
    plotaid::detail::ValidatingParser parser;
};

ChartBase::ChartBase() : parser_(std::make_unique<Parser>()) {
    if (const std::lconv* conventions = std::localeconv();
        conventions && conventions->decimal_point && conventions->decimal_point[0])
        decimalPoint_ = conventions->decimal_point[0];
}

ChartBase::~ChartBase() = default;

void ChartBase::initialize() {
    heldRuntimes().emplace_back();
}

void ChartBase::terminate() {
    if (!heldRuntimes().empty())
        heldRuntimes().pop_back();
}

DOMDocument* ChartBase::createDocument(const XMLCh* encoding) {
    return newDocument(GrxUni::_graph, encoding, kOlderSchemaLocation);
}

DOMDocument* ChartBase::createGrxDocument(const XMLCh* encoding) {
    return newDocument(GrxUni::_visualization, encoding, _schemaLocationValue);
}

DOMDocument* ChartBase::parseDocument(const std::string& text) {
    // Builders read charts and data documents here; the data grammar holds the chart grammar too.
    return parser_->parser.parse(text, "ChartBase",
                                 ChartException("parseDocument fatal error while parsing", kFile, 1105),
                                 plotaid::detail::DocumentKind::Data);
}

bool ChartBase::ValidXML(const std::string& text) {
    plotaid::detail::ValidatingParser parser;
    return parser.parse(text, "ChartBase", ChartException("XML stream validation error", kFile, 236)) !=
           nullptr;
}

void ChartBase::releaseDocument(DOMDocument* document) {
    plotaid::detail::DocumentRelease()(document);
}

int ChartBase::AddAttributeDoc(DOMDocument* document, DOMElement* element, const XMLCh* name,
                               const XMLCh* value) {
    if (value == nullptr) {
        report("attribute value is empty for name " + utf8(name), 122);
        return -1;
    }
    try {
        if (document == nullptr || element == nullptr || name == nullptr || *name == 0)
            throw DOMException(DOMException::INVALID_CHARACTER_ERR);
        DOMAttr* attribute = document->createAttribute(name);
        attribute->setValue(value);
        element->setAttributeNode(attribute);
        return 0;
    } catch (...) {
        report("attribute name does not exist " + utf8(name) + " " + utf8(value), 135);
        return -1;
    }
}

int ChartBase::AddAttribute(DOMElement* element, const XMLCh* name, const XMLCh* value) {
    return AddAttributeDoc(document_, element, name, value);
}

bool ChartBase::AddID(DOMElement* element, const XMLCh* id) {
    if (element == nullptr)
        return false;
    if (id == nullptr || *id == 0) {
        report("ID name attribute is empty for element " + utf8(element->getTagName()), 166);
        return false;
    }
    DOMDocument* owner = element->getOwnerDocument();
    DOMElement* earlier = owner->getElementById(id);
    if (earlier != nullptr && earlier != element)
        report("Attempting to add an existing ID to an element (" + utf8(id) + " " +
                   utf8(element->getTagName()) + ")",
               180);
    try {
        // The object model's own registration makes the later element answer.
        if (GrxBaseElement* wrapper = GrxBaseElement::wrapperOf(element)) {
            wrapper->setId(id);
            return true;
        }
        if (earlier != nullptr && earlier != element)
            earlier->setIdAttributeNode(earlier->getAttributeNode(GrxUni::_id), false);
        DOMAttr* attribute = owner->createAttribute(GrxUni::_id);
        attribute->setValue(id);
        element->setAttributeNode(attribute);
        element->setIdAttributeNode(attribute, true);
        return true;
    } catch (const DOMException&) {
        return false;
    }
}

ChartString ChartBase::CreateUniqueId(const ChartString& base, const GrxVisualization& visualization) {
    const GrxBaseElement& root = visualization;
    DOMDocument* document = root.getImplementation()->getOwnerDocument();
    const auto candidate = [&](unsigned n) {
        ChartString id(n == 1 && base.empty() ? ChartString(GrxUni::_id) : base);
        id.appendInteger(n);
        return id;
    };

    // Remembering where the last call stopped keeps the 10,000th id of a prefix from costing
    // 10,000 look-ups. The hint is trusted only while the id it gave out still exists: an id
    // that was handed out and never used (or removed again) sends the search back to 1.
    auto& table = hints();
    const void* token = document->getUserData(kHintKey);
    unsigned n = 1;
    auto docIt = table.find(document);
    if (docIt != table.end() && token != nullptr) {
        auto it = docIt->second.find(base.str());
        if (it != docIt->second.end() && it->second.token == token && it->second.next > 1 &&
            root.doesIdExist(candidate(it->second.next - 1)))
            n = it->second.next;
    }
    while (root.doesIdExist(candidate(n)))
        ++n;

    if (token == nullptr) {
        // Only compared, never dereferenced.
        token = reinterpret_cast<const void*>(++lastToken);
        document->setUserData(kHintKey, const_cast<void*>(token), nullptr);
    }
    if (table.size() >= kMaxHintDocuments && table.find(document) == table.end())
        table.clear();
    auto& prefixes = table[document];
    if (prefixes.size() >= kMaxHintPrefixes && prefixes.find(base.str()) == prefixes.end())
        prefixes.clear();
    UniqueIdHint& hint = prefixes[base.str()];
    hint.token = token;
    hint.next = n + 1;
    return candidate(n);
}

bool ChartBase::mergeAttributes(const DOMElement* from, DOMElement* to) {
    if (from == nullptr || to == nullptr)
        return false;
    const DOMNamedNodeMap* attributes = from->getAttributes();
    for (XMLSize_t i = 0, count = attributes->getLength(); i < count; ++i) {
        const DOMNode* attribute = attributes->item(i);
        to->setAttribute(attribute->getNodeName(), attribute->getNodeValue());
    }
    return true;
}

DOMElement* ChartBase::getChildByTagName(const DOMNode* parent, const XMLCh* tag) {
    if (parent == nullptr)
        return nullptr;
    for (DOMNode* child = parent->getFirstChild(); child; child = child->getNextSibling())
        if (child->getNodeType() == DOMNode::ELEMENT_NODE && XMLString::equals(child->getNodeName(), tag))
            return static_cast<DOMElement*>(child);
    return nullptr;
}

DOMElement* ChartBase::getElementWithAttribute(const XMLCh* tag, const XMLCh* attribute,
                                               const XMLCh* value) const {
    if (document_ == nullptr || tag == nullptr)
        return nullptr;
    DOMNodeList* elements = document_->getElementsByTagName(tag);
    for (XMLSize_t i = 0, count = elements->getLength(); i < count; ++i) {
        auto* element = static_cast<DOMElement*>(elements->item(i));
        if (XMLString::equals(element->getAttribute(attribute), value))
            return element;
    }
    return nullptr;
}

unsigned int ChartBase::removeAllChildren(DOMNode* node) {
    if (node == nullptr)
        return 0;
    unsigned int count = 0;
    for (DOMNode* child = node->getFirstChild(); child; child = child->getNextSibling())
        ++count;
    // Not released: callers may still hold the removed nodes; the document frees them.
    for (unsigned int i = 0; i < count; ++i)
        node->removeChild(node->getFirstChild());
    return count;
}

DOMElement* ChartBase::addStyle(DOMElement* parent, const XMLCh* id) {
    if (parent == nullptr || id == nullptr || *id == 0 || document_ == nullptr)
        return nullptr;
    DOMNodeList* styles = parent->getElementsByTagName(GrxUni::_style);
    for (XMLSize_t i = 0, count = styles->getLength(); i < count; ++i) {
        auto* style = static_cast<DOMElement*>(styles->item(i));
        if (XMLString::equals(style->getAttribute(GrxUni::_id), id))
            return style;
    }
    try {
        DOMElement* style = document_->createElementNS(parent->getNamespaceURI(), GrxUni::_style);
        parent->appendChild(style);
        AddAttribute(style, GrxUni::_id, id);
        return style;
    } catch (const DOMException&) {
        report("style could not be added: " + utf8(id), 420);
        return nullptr;
    }
}

bool ChartBase::insertBeforeSiblings(DOMElement* parent, DOMElement* child, ConstChartStringSet tags) {
    if (parent == nullptr || child == nullptr)
        return false;
    for (DOMNode* sibling = parent->getFirstChild(); sibling; sibling = sibling->getNextSibling()) {
        if (tags.count(sibling->getNodeName()) != 0) {
            parent->insertBefore(child, sibling);
            return true;
        }
    }
    parent->appendChild(child);
    return true;
}

std::string ChartBase::asString(int value) {
    std::ostringstream out;
    out.imbue(std::locale::classic());
    out << value;
    return out.fail() ? std::string() : out.str();
}

std::string ChartBase::asString(const double& value) {
    // The classic locale already writes '.'; the replacement covers a stream that was not imbued.
    std::ostringstream out;
    out.imbue(std::locale::classic());
    out.precision(16);
    out << value;
    std::string text = out.str();
    if (decimalPoint_ != '.')
        if (const auto at = text.find(decimalPoint_); at != std::string::npos)
            text[at] = '.';
    return text;
}

double ChartBase::asDouble(const std::string& text) const {
    std::istringstream in(text);
    in.imbue(std::locale::classic());
    double value = 0;
    if (!(in >> value))
        return std::numeric_limits<double>::lowest();
    return value;
}

ChartString ChartBase::getToken(const XMLCh* text, const XMLCh* delimiters, unsigned int index) {
    if (text == nullptr || delimiters == nullptr)
        return ChartString();
    XMLStringTokenizer tokens(text, delimiters);
    for (unsigned int i = 0; tokens.hasMoreTokens(); ++i) {
        XMLCh* token = tokens.nextToken();
        if (i == index)
            return ChartString(token);
    }
    return ChartString();
}
