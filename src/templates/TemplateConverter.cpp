// The conversion point for templates of the earlier form.
#include "templates/TemplateConverter.h"

#include "foundation/OwnedDocument.h"
#include "templates/InstructionWalk.h"

#include <plotaid/ChartErrorHandler.h>

#include <grx/ChartPrinter.h>
#include <grx/ChartString.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/framework/XMLPScanToken.hpp>
#include <xercesc/sax/SAXParseException.hpp>
#include <xercesc/sax2/DefaultHandler.hpp>
#include <xercesc/sax2/SAX2XMLReader.hpp>
#include <xercesc/sax2/XMLReaderFactory.hpp>
#include <xercesc/util/SecurityManager.hpp>
#include <xercesc/util/XMLString.hpp>
#include <xercesc/util/XMLUni.hpp>

#include <atomic>
#include <memory>
#include <sstream>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

constexpr XMLCh kTemplate[] = u"template";
constexpr XMLCh kNamespace[] = u"http://plotaid.org/grxml";
constexpr XMLCh kXmlnsUri[] = u"http://www.w3.org/2000/xmlns/";
constexpr XMLCh kSchemaInstanceUri[] = u"http://www.w3.org/2001/XMLSchema-instance";
constexpr XMLCh kSchemaLocation[] =
    u"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-template-1.0.xsd";

// What the DOM cannot make is still a template: the bare root, written out by hand.
const char* const kBareTemplate =
    "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
    "<template xmlns=\"http://plotaid.org/grxml\" xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
    "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-template-1.0.xsd\"/>\n";

std::atomic<unsigned> conversions{0};

const char* const kMarker = "grxml-template-";
const char* const kConvertedMarker = "grxml-template-1.0";

// The root and its children's names, read without validation and without reading anything the text
// names. It stops as soon as the text is known for a current template, or else reads to the end to
// learn whether it is XML at all.
class Outline final : public DefaultHandler {
public:
    void startElement(const XMLCh* const uri, const XMLCh* const localname, const XMLCh* const,
                      const Attributes&) override {
        if (++depth_ > static_cast<int>(ValidatingParser::kNestingLimit))
            throw std::string("elements are nested more than " +
                              std::to_string(ValidatingParser::kNestingLimit) + " deep");
        if (depth_ == 1)
            template_ = XMLString::equals(uri, kNamespace) && XMLString::equals(localname, kTemplate);
        else if (depth_ == 2 && template_ && XMLString::equals(uri, kNamespace) && isInstruction(localname))
            instruction_ = true;
    }
    void endElement(const XMLCh* const, const XMLCh* const, const XMLCh* const) override { --depth_; }
    // Expansion is bounded in count by the security manager; this bounds it in length.
    void internalEntityDecl(const XMLCh* const name, const XMLCh* const value) override {
        if (XMLString::stringLen(value) > ValidatingParser::kEntityValueLimit)
            throw std::string("entity '" + ChartString(name).toUTF8() + "' is longer than the limit");
    }
    void fatalError(const SAXParseException& e) override {
        ChartErrorHandler().fatalError(e); // logged, then thrown on
    }

    bool currentTemplate() const { return template_ && instruction_; }

private:
    static bool isInstruction(const XMLCh* name) {
        const InstructionTable table = instructionTable();
        for (std::size_t i = 0; i < table.count; ++i)
            if (XMLString::equals(name, table.entries[i].tag))
                return true;
        return false;
    }

    int depth_ = 0;
    bool template_ = false;
    bool instruction_ = false;
};

// Whether the text is a current template by its outline; notXml says why it is not XML, when not.
bool hasCurrentTemplateOutline(std::string_view text, std::string& notXml) {
    Outline outline;
    SecurityManager security;
    security.setEntityExpansionLimit(ValidatingParser::kEntityExpansionLimit);
    try {
        std::unique_ptr<SAX2XMLReader> reader(XMLReaderFactory::createXMLReader());
        reader->setFeature(XMLUni::fgSAX2CoreNameSpaces, true);
        reader->setFeature(XMLUni::fgSAX2CoreValidation, false);
        reader->setFeature(XMLUni::fgXercesLoadExternalDTD, false);
        reader->setFeature(XMLUni::fgXercesDisableDefaultEntityResolution, true);
        reader->setProperty(XMLUni::fgXercesSecurityManager, &security);
        reader->setContentHandler(&outline);
        reader->setDeclarationHandler(&outline);
        reader->setErrorHandler(&outline);
        static const char nothing = 0;
        MemBufInputSource source(reinterpret_cast<const XMLByte*>(text.empty() ? &nothing : text.data()),
                                 text.size(), "ChartTemplate");
        XMLPScanToken token;
        if (reader->parseFirst(source, token))
            while (!outline.currentTemplate() && reader->parseNext(token)) {
            }
        reader->parseReset(token);
    } catch (const SAXParseException& e) {
        notXml = std::to_string(e.getLineNumber()) + ":" + std::to_string(e.getColumnNumber()) + ": " +
                 ChartString(e.getMessage()).toUTF8();
    } catch (const std::string& limit) {
        notXml = limit;
    } catch (...) {
        notXml = "the text cannot be read as XML";
    }
    return notXml.empty() && outline.currentTemplate();
}

} // namespace

std::string convertTemplate(const DOMDocument* /*old*/) {
    try {
        DOMImplementation* implementation = DOMImplementationRegistry::getDOMImplementation(u"LS");
        if (implementation == nullptr)
            return kBareTemplate;
        const plotaid::detail::OwnedDocument converted(
            implementation->createDocument(kNamespace, kTemplate, nullptr));
        DOMElement* root = converted->getDocumentElement();
        root->setAttributeNS(kXmlnsUri, u"xmlns", kNamespace);
        root->setAttributeNS(kXmlnsUri, u"xmlns:xsi", kSchemaInstanceUri);
        root->setAttributeNS(kSchemaInstanceUri, u"xsi:schemaLocation", kSchemaLocation);
        ChartPrinter printer;
        printer.setPrintWhiteSpace(true);
        std::ostringstream out;
        printer.Print(converted.get(), out);
        std::string text = out.str();
        return text.empty() ? std::string(kBareTemplate) : text;
    } catch (...) {
        return kBareTemplate;
    }
}

DocumentKind templateKind(std::string_view text, std::string& notXml) {
    notXml.clear();
    if (text.find(kMarker) != std::string_view::npos)
        return text.find(kConvertedMarker) != std::string_view::npos ? DocumentKind::ConvertedTemplate
                                                                      : DocumentKind::Template;
    return hasCurrentTemplateOutline(text, notXml) ? DocumentKind::Template : DocumentKind::Named;
}

unsigned nextConversionCount() noexcept {
    return ++conversions;
}

} // namespace plotaid::detail
