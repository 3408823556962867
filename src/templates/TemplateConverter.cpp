// The conversion point for templates of the earlier form.
#include "templates/TemplateConverter.h"

#include "foundation/OwnedDocument.h"

#include <grx/ChartPrinter.h>

#include <xercesc/dom/DOM.hpp>

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

unsigned nextConversionCount() noexcept {
    return ++conversions;
}

} // namespace plotaid::detail
