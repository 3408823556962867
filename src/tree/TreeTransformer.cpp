// The tree viewer's documents: display settings built and edited here, PMML kept compressed.
#include <plotaid/TreeTransformer.h>

#include "foundation/Report.h"
#include "foundation/ValidatingParser.h"
#include "tree/TreeVocabulary.h"

#include <plotaid/ChartException.h>

#include <grx/ChartPrinter.h>
#include <zpack/zpack.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLString.hpp>
#include <xercesc/util/XMLUni.hpp>
#include <xercesc/validators/schema/SchemaSymbols.hpp>

#include <sstream>
#include <utility>

using namespace XERCES_CPP_NAMESPACE;
using namespace plotaid::detail;

namespace {

const char* const kFile = "backend/chartxml/plotaid/src/TreeTransformer";

void report(const std::string& message, std::uint32_t line) {
    reportFailure(message, kFile, line);
}

constexpr XMLCh kDisplaySettings[] = u"displaySettings";
constexpr XMLCh kPMML[] = u"PMML";
constexpr XMLCh kPmmlVersion[] = u"2.1";
constexpr XMLCh kVersion[] = u"version";
constexpr XMLCh kXmlns[] = u"xmlns";
constexpr XMLCh kXmlnsXsi[] = u"xmlns:xsi";
constexpr XMLCh kSchemaLocation[] = u"xsi:schemaLocation";

constexpr XMLCh kTreeZoom[] = u"treeZoom";
constexpr XMLCh kFactor[] = u"factor";
constexpr XMLCh kTreeOrientation[] = u"treeOrientation";
constexpr XMLCh kOrientation[] = u"orientation";
constexpr XMLCh kNodeContents[] = u"nodeContents";
constexpr XMLCh kContents[] = u"contents";
constexpr XMLCh kPredictorRanges[] = u"predictorRanges";
constexpr XMLCh kBranchStatistics[] = u"branchStatistics";
constexpr XMLCh kShow[] = u"show";
constexpr XMLCh kFontData[] = u"fontData";
constexpr XMLCh kFamily[] = u"family";
constexpr XMLCh kChartColors[] = u"chartColors";
constexpr XMLCh kSwatchColors[] = u"swatchColors";
constexpr XMLCh kColorItem[] = u"colorItem";
constexpr XMLCh kValue[] = u"value";
constexpr XMLCh kOlang[] = u"olang";
constexpr XMLCh kLocale[] = u"locale";
constexpr XMLCh kStatFormats[] = u"statFormats";
constexpr XMLCh kPredictorFormats[] = u"predictorFormats";
constexpr XMLCh kPredictorItem[] = u"predictorItem";
constexpr XMLCh kDateFormat[] = u"dateFormat";
constexpr XMLCh kVarName[] = u"varName";
constexpr XMLCh kName[] = u"name";
constexpr XMLCh kWidth[] = u"width";
constexpr XMLCh kPrecision[] = u"precision";
constexpr XMLCh kTrue[] = u"true";
constexpr XMLCh kFalse[] = u"false";

constexpr const XMLCh* kOrientations[] = {u"top-down", u"left-to-right", u"right-to-left"};
constexpr const XMLCh* kDisplayOptions[] = {u"table", u"graph", u"both"};

bool hasRoot(const DOMDocument* document, const XMLCh* name, const XMLCh* ns) {
    const DOMElement* root = document ? document->getDocumentElement() : nullptr;
    return root != nullptr && XMLString::equals(root->getLocalName(), name) &&
           XMLString::equals(root->getNamespaceURI(), ns);
}

// Numbers go out in decimal whatever the locale.
std::u16string decimal(long value) {
    const std::string digits = std::to_string(value);
    return std::u16string(digits.begin(), digits.end());
}

std::string print(const DOMDocument* document, const XMLCh* encoding, bool whiteSpace) {
    ChartPrinter printer;
    printer.setPrintWhiteSpace(whiteSpace);
    printer.setEncoding(encoding);
    std::ostringstream out;
    printer.Print(document, out);
    return out.str();
}

DOMDocument* newOutputDocument(const XMLCh* ns, const XMLCh* rootName, const XMLCh* schemaLocation,
                               const char* failure, std::uint32_t line) {
    DOMDocument* document = nullptr;
    guarded(kFile, line, failure, [&] {
        DOMImplementation* implementation =
            DOMImplementationRegistry::getDOMImplementation(ChartBase::_implFeatures);
        if (implementation == nullptr)
            throw ChartException("no DOM implementation", kFile, line);
        document = implementation->createDocument(ns, rootName, nullptr);
        document->setStrictErrorChecking(true);
        // The serialiser writes the encoding asked of it; the DOM keeps none of its own.
        document->setXmlStandalone(false);
        document->setXmlVersion(ChartBase::_XMLversion);
        DOMElement* root = document->getDocumentElement();
        root->setAttributeNS(kXmlnsNamespace, kXmlns, ns);
        root->setAttributeNS(kXmlnsNamespace, kXmlnsXsi, kSchemaInstanceNamespace);
        root->setAttributeNS(kSchemaInstanceNamespace, kSchemaLocation, schemaLocation);
    });
    return document;
}

} // namespace

const char* const TreeTransformer::s_membufid = "TreeTransformer";

struct TreeTransformer::Impl {
    ValidatingParser parser;
    OwnedDocument display;

    DOMDocument* parse(const std::string& text, DocumentKind kind) {
        return parser.parse(text, s_membufid,
                            ChartException("TreeTransformer::parseDocument() fatal error", kFile, 443), kind);
    }
    OwnedDocument pmml;
    // Texts that fail are reported once, when they are parsed; the option operations then do
    // nothing rather than repeat the report on every call.

    // Takes the display settings over from the parser; anything but a "displaySettings" root of
    // the tree-view namespace is refused, since the options would land in a foreign document.
    static void load(TreeTransformer& self, const std::string& settings, std::uint32_t line) {
        if (self.impl_->parse(settings.empty() ? self.SetupDisplayData() : settings,
                              DocumentKind::TreeDisplay) == nullptr)
            return;
        OwnedDocument document = self.impl_->parser.adoptDocument();
        if (!hasRoot(document.get(), kDisplaySettings, kTreeViewNamespace)) {
            report("TreeTransformer fatal error", line);
            return;
        }
        self.impl_->display = std::move(document);
    }

    // The first element of that name in document order, else a new last child of the root.
    DOMElement* option(const XMLCh* name) {
        DOMDocument* document = display.get();
        if (document == nullptr)
            return nullptr;
        DOMElement* root = document->getDocumentElement();
        DOMNodeList* found = document->getElementsByTagNameNS(root->getNamespaceURI(), name);
        if (found->getLength() > 0)
            return static_cast<DOMElement*>(found->item(0));
        return append(root, name);
    }

    DOMElement* append(DOMElement* parent, const XMLCh* name) {
        DOMElement* element =
            display->createElementNS(display->getDocumentElement()->getNamespaceURI(), name);
        parent->appendChild(element);
        return element;
    }

    // Host text that cannot be converted sets nothing: an empty value would pass for a real one.
    static bool set(DOMElement* element, const XMLCh* attribute, const XMLCh* value) {
        if (element == nullptr)
            return false;
        if (value == nullptr) {
            report("text is not valid in the host encoding; " + ChartString(attribute).toUTF8() +
                       " is not set",
                   600);
            return false;
        }
        element->setAttribute(attribute, value);
        return true;
    }
};

TreeTransformer::TreeTransformer(const std::string& pmml, const std::string& displaySettings)
    : impl_(std::make_unique<Impl>()) {
    guarded(kFile, 257, "TreeTransformer fatal error", [&] {
        if (!zpack::compressString(pmml, compressedPmml_))
            report("TreeTransformer fatal error", 257);
        else
            pmmlLength_ = static_cast<unsigned long>(pmml.size());
        Impl::load(*this, displaySettings, 257);
    });
}

TreeTransformer::TreeTransformer(const std::string& compressedPmml, unsigned long pmmlLength,
                                 const std::string& displaySettings)
    : impl_(std::make_unique<Impl>()) {
    guarded(kFile, 284, "TreeTransformer fatal error", [&] {
        compressedPmml_ = compressedPmml;
        pmmlLength_ = pmmlLength;
        Impl::load(*this, displaySettings, 284);
    });
}

// The documents die before the parser and runtime that made them.
TreeTransformer::~TreeTransformer() {
    document_ = nullptr;
}

std::string TreeTransformer::SetupDisplayData() {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
           "<displaySettings xmlns=\"http://plotaid.org/treeview/1.0\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/treeview/1.0 "
           "http://plotaid.org/treeview/1.0/treeview-1.0.xsd\">\n"
           "<treeZoom/>\n"
           "<treeOrientation/>\n"
           "<nodeContents/>\n"
           "<nodeState/>\n"
           "<predictorRanges/>\n"
           "<branchStatistics/>\n"
           "<fontData/>\n"
           "<colorData bkndFill=\"#FFFFFFFF\" nodeFill=\"#FFFFFFFF\" stroke=\"#FF000000\">\n"
           "<chartColors/>\n"
           "<swatchColors/>\n"
           "</colorData>\n"
           "</displaySettings>\n";
}

DOMDocument* TreeTransformer::parseDocument(const std::string& text) {
    return impl_->parser.parse(text, s_membufid,
                               ChartException("TreeTransformer::parseDocument() fatal error", kFile, 443));
}

DOMDocument* TreeTransformer::displayDocument() const {
    return impl_->display.get();
}

void TreeTransformer::SetOrientation(TreeOrientation orientation) {
    // A host may pass any number: it is read once, as a number, before it is trusted.
    const int value = orientation;
    guarded(kFile, 520, "SetOrientation fatal error", [&] {
        DOMElement* element = impl_->option(kTreeOrientation);
        if (value >= TOP_DOWN && value <= RIGHT_TO_LEFT)
            Impl::set(element, kOrientation, kOrientations[value]);
    });
}

void TreeTransformer::SetTreeDisplayOption(TreeDisplayOption option) {
    const int value = option;
    guarded(kFile, 545, "SetTreeDisplayOption fatal error", [&] {
        DOMElement* element = impl_->option(kNodeContents);
        if (value >= TABLE && value <= BOTH)
            Impl::set(element, kContents, kDisplayOptions[value]);
    });
}

void TreeTransformer::SetZoomFactor(int zoom) {
    if (zoom < 2 || zoom > 500)
        return;
    guarded(kFile, 570, "SetZoomFactor fatal error", [&] {
        Impl::set(impl_->option(kTreeZoom), kFactor, decimal(zoom).c_str());
    });
}

void TreeTransformer::ShowNodeDefs(bool show) {
    guarded(kFile, 590, "ShowNodeDefs fatal error", [&] {
        Impl::set(impl_->option(kPredictorRanges), kShow, show ? kTrue : kFalse);
    });
}

void TreeTransformer::ShowBranchStatistics(bool show) {
    guarded(kFile, 610, "ShowBranchStatistics fatal error", [&] {
        Impl::set(impl_->option(kBranchStatistics), kShow, show ? kTrue : kFalse);
    });
}

void TreeTransformer::applyFont(std::string family) {
    guarded(kFile, 640, "applyFont fatal error", [&] {
        const xmlString text(std::move(family));
        Impl::set(impl_->option(kFontData), kFamily, text.getChars());
    });
}

void TreeTransformer::applyColors(ColorIds id, const std::vector<std::string>& colors) {
    if ((id != CHART_COLORS && id != SWATCH_COLORS) || !impl_->display)
        return;
    guarded(kFile, 700, "applyColors fatal error", [&] {
        DOMElement* element = impl_->option(id == CHART_COLORS ? kChartColors : kSwatchColors);
        DOMNodeList* items = element->getElementsByTagNameNS(element->getNamespaceURI(), kColorItem);
        const XMLSize_t existing = items->getLength();
        for (std::size_t i = 0; i < colors.size(); ++i) {
            const xmlString value(colors[i]);
            // An item without its value would not validate: an unconvertible colour adds none.
            DOMElement* item = i < existing ? static_cast<DOMElement*>(items->item(i))
                               : value.getChars() != nullptr ? impl_->append(element, kColorItem)
                                                             : element;
            Impl::set(item, kValue, value.getChars());
        }
    });
}

namespace {

// "language" or "language-country" on the root.
void setLanguage(DOMDocument* document, const XMLCh* attribute, std::string language,
                 const std::string& country, const char* failure, std::uint32_t line) {
    DOMNodeList* roots = document ? document->getElementsByTagNameNS(
                                        document->getDocumentElement()->getNamespaceURI(), kDisplaySettings)
                                  : nullptr;
    if (roots == nullptr)
        return;
    if (roots->getLength() == 0) {
        report(failure, line);
        return;
    }
    if (!country.empty())
        language += "-" + country;
    const xmlString text(std::move(language));
    if (text.getChars() == nullptr) {
        report(failure, line);
        return;
    }
    static_cast<DOMElement*>(roots->item(0))->setAttribute(attribute, text.getChars());
}

} // namespace

void TreeTransformer::SetOutputLanguage(std::string language, std::string country) {
    guarded(kFile, 738, "SetOutputLanguage fatal error", [&] {
        setLanguage(impl_->display.get(), kOlang, std::move(language), country,
                    "SetOutputLanguage fatal error", 738);
    });
}

void TreeTransformer::SetOutputLocale(std::string language, std::string country) {
    guarded(kFile, 761, "SetOutputLocale fatal error", [&] {
        setLanguage(impl_->display.get(), kLocale, std::move(language), country,
                    "SetOutputLocale fatal error", 761);
    });
}

DOMElement* TreeTransformer::GetStatFormatElement() {
    return impl_->option(kStatFormats);
}

DOMElement* TreeTransformer::GetNewPredictorItem() {
    DOMElement* statFormats = GetStatFormatElement();
    if (statFormats == nullptr)
        return nullptr;
    DOMDocument* document = impl_->display.get();
    DOMNodeList* found = document->getElementsByTagNameNS(statFormats->getNamespaceURI(), kPredictorFormats);
    DOMElement* formats = found->getLength() > 0 ? static_cast<DOMElement*>(found->item(0))
                                                 : impl_->append(statFormats, kPredictorFormats);
    return impl_->append(formats, kPredictorItem);
}

void TreeTransformer::addPredictorPrecision(std::string varName, long precision) {
    guarded(kFile, 800, "addPredictorPrecision fatal error", [&] {
        const xmlString name(std::move(varName));
        if (name.getChars() == nullptr && impl_->display) {
            report("addPredictorPrecision: the variable name is not valid in the host encoding", 800);
            return;
        }
        DOMElement* item = GetNewPredictorItem();
        Impl::set(item, kVarName, name.getChars());
        Impl::set(item, kPrecision, decimal(precision).c_str());
    });
}

void TreeTransformer::addPredictorDate(std::string varName, std::string formatName, long width,
                                       long precision) {
    guarded(kFile, 830, "addPredictorDate fatal error", [&] {
        const xmlString name(std::move(varName));
        const xmlString format(std::move(formatName));
        if ((name.getChars() == nullptr || format.getChars() == nullptr) && impl_->display) {
            report("addPredictorDate: a name is not valid in the host encoding", 830);
            return;
        }
        DOMElement* item = GetNewPredictorItem();
        if (item == nullptr)
            return;
        Impl::set(item, kVarName, name.getChars());
        DOMElement* date = impl_->append(item, kDateFormat);
        Impl::set(date, kName, format.getChars());
        Impl::set(date, kWidth, decimal(width).c_str());
        Impl::set(date, kPrecision, decimal(precision).c_str());
    });
}

void TreeTransformer::addTargetDateFormat(std::string formatName, long width, long precision) {
    guarded(kFile, 870, "addTargetDateFormat fatal error", [&] {
        const xmlString format(std::move(formatName));
        DOMElement* statFormats = GetStatFormatElement();
        if (statFormats == nullptr)
            return;
        DOMElement* date = nullptr;
        for (DOMNode* child = statFormats->getFirstChild(); child && !date; child = child->getNextSibling())
            if (child->getNodeType() == DOMNode::ELEMENT_NODE &&
                XMLString::compareIStringASCII(child->getLocalName(), kDateFormat) == 0)
                date = static_cast<DOMElement*>(child);
        if (date == nullptr)
            date = impl_->append(statFormats, kDateFormat);
        Impl::set(date, kName, format.getChars());
        Impl::set(date, kWidth, decimal(width).c_str());
        Impl::set(date, kPrecision, decimal(precision).c_str());
    });
}

bool TreeTransformer::applyTemplate(const std::string& templateText) {
    if (templateText.empty())
        return false;
    return guarded(kFile, 480, "TreeTransformer::applyTemplate() fatal error", false, [&] {
        if (impl_->parse(templateText, DocumentKind::TreeDisplay) == nullptr)
            return false;
        const OwnedDocument templ = impl_->parser.adoptDocument();
        // A foreign root would smuggle elements the display grammar does not know.
        if (!impl_->display || !hasRoot(templ.get(), kDisplaySettings, kTreeViewNamespace)) {
            report("TreeTransformer::applyTemplate() fatal error", 480);
            return false;
        }
        return mergeDOM(templ.get(), impl_->display.get());
    });
}

bool TreeTransformer::mergeDOM(const DOMDocument* from, DOMDocument* to) {
    const DOMElement* source = from ? from->getDocumentElement() : nullptr;
    DOMElement* target = to ? to->getDocumentElement() : nullptr;
    if (source == nullptr || target == nullptr)
        return false;
    // The root's own attributes only: the text's namespace declarations and schema location stay
    // behind, so what is printed names the bundled grammar, not a file the text made up.
    const DOMNamedNodeMap* attributes = source->getAttributes();
    for (XMLSize_t i = 0, count = attributes->getLength(); i < count; ++i) {
        const DOMNode* attribute = attributes->item(i);
        const XMLCh* uri = attribute->getNamespaceURI();
        if (XMLString::equals(uri, SchemaSymbols::fgURI_XSI) || XMLString::equals(uri, XMLUni::fgXMLNSURIName))
            continue;
        target->setAttribute(attribute->getNodeName(), attribute->getNodeValue());
    }
    for (const DOMNode* child = source->getFirstChild(); child; child = child->getNextSibling())
        target->appendChild(to->importNode(child, true));
    return true;
}

DOMDocument* TreeTransformer::createDisplayDocument(const XMLCh* encoding) {
    (void)encoding;
    // The display settings' own root attributes are merged over these, so the root takes their
    // namespace: a root in another namespace than its children would not validate.
    return newOutputDocument(kTreeViewNamespace, kDisplaySettings, kTreeViewSchemaLocation,
                             "createDisplayDocument fatal error", 1010);
}

std::string TreeTransformer::getDisplayData(const XMLCh* encoding) {
    if (!impl_->display)
        return std::string();
    return guarded(kFile, 347, "getDisplayData fatal error", std::string(), [&] {
        const OwnedDocument output(createDisplayDocument(encoding));
        if (output == nullptr || !mergeDOM(impl_->display.get(), output.get()))
            throw ChartException("getDisplayData fatal error", kFile, 347);
        return print(output.get(), encoding, true);
    });
}

std::string TreeTransformer::getCompressedPMML(unsigned long* length) {
    if (length != nullptr)
        *length = pmmlLength_;
    return compressedPmml_;
}

namespace {

// Learns the length on the first success when it was not known.
bool decompress(const std::string& compressed, unsigned long& length, std::string& text) {
    if (length != 0)
        return zpack::decompressString(text, compressed, length);
    if (!zpack::decompressString(text, compressed)) {
        length = 0;
        return false;
    }
    length = static_cast<unsigned long>(text.size());
    return true;
}

} // namespace

DOMDocument* TreeTransformer::setupPMMLDOM() {
    return guarded(kFile, 971, "setupPMMLDOM fatal error", static_cast<DOMDocument*>(nullptr),
                   [&]() -> DOMDocument* {
                       std::string text;
                       if (!decompress(compressedPmml_, pmmlLength_, text))
                           throw ChartException("setupPMMLDOM fatal error", kFile, 971);
                       if (impl_->parse(text, DocumentKind::Pmml) == nullptr)
                           return nullptr;
                       OwnedDocument document = impl_->parser.adoptDocument();
                       if (!hasRoot(document.get(), kPMML, kPmmlNamespace))
                           throw ChartException("setupPMMLDOM fatal error", kFile, 971);
                       document_ = document.get();
                       impl_->pmml = std::move(document);
                       return document_;
                   });
}

DOMDocument* TreeTransformer::createPMMLDocument(const XMLCh* encoding) {
    (void)encoding;
    DOMDocument* document =
        newOutputDocument(kPmmlNamespace, kPMML, kPmmlSchemaLocation, "createPMMLDocument fatal error", 1048);
    if (document == nullptr)
        return nullptr;
    guarded(kFile, 1048, "createPMMLDocument fatal error", [&] {
        // The model's version; the XML version stays 1.0, the only one the DOM writes.
        document->getDocumentElement()->setAttribute(kVersion, kPmmlVersion);
    });
    return document;
}

std::string TreeTransformer::getUncompressedPMML(const XMLCh* encoding) {
    return guarded(kFile, 407, "getUncompressedPMML fatal error", std::string(), [&] {
        // The previous document goes only once the new one is in place.
        DOMDocument* parsed = setupPMMLDOM();
        if (parsed == nullptr) {
            document_ = nullptr;
            impl_->pmml.reset();
            std::string text;
            return decompress(compressedPmml_, pmmlLength_, text) ? text : std::string();
        }
        const OwnedDocument output(createPMMLDocument(encoding));
        if (output == nullptr || !mergeDOM(parsed, output.get()))
            throw ChartException("getUncompressedPMML fatal error", kFile, 407);
        return print(output.get(), encoding, true);
    });
}

std::string TreeTransformer::compressDocument(const DOMDocument* document) const {
    return guarded(kFile, 938, "compressDocument fatal error", std::string(), [&] {
        const std::string text = document != nullptr ? print(document, nullptr, false) : std::string();
        std::string packed;
        if (zpack::compressString(text, packed))
            return packed;
        report("compressDocument fatal error", 938);
        return text; // what could not be compressed is handed out plain
    });
}
