// The chart transformer: a chart kept apart from its data sources, merged back on request.
#include <plotaid/ChartTransformer.h>

#include "foundation/OwnedDocument.h"
#include "foundation/Report.h"
#include "foundation/ValidatingParser.h"

#include <plotaid/ChartException.h>
#include <plotaid/ChartTemplate.h>
#include <plotaid/XmlDataHandler.h>

#include <grx/ChartPrinter.h>
#include <grx/ChartString.h>
#include <grx/GrxUni.h>
#include <grx/GrxVisualization.h>

#include <zpack/zpack.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLString.hpp>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <sstream>
#include <vector>

using namespace XERCES_CPP_NAMESPACE;
using plotaid::detail::guarded;

namespace {

const char* const kFile = "backend/chartxml/plotaid/src/charttransformer";
const char* const kBaseFile = "backend/chartxml/plotaid/src/chartbase";

constexpr XMLCh kUtf8[] = u"UTF-8";
constexpr XMLCh kGraphSources[] = u"graphSources";

// Process-wide dump counters: one shared by the template dumps of one application, one for popups.
int templateDumpCount = 1;
int popupDumpCount = 1;

void report(const std::string& message, unsigned line) {
    plotaid::detail::reportFailure(message, kFile, line);
}

bool dumpsWanted() {
    return std::getenv("DumpChartXMLPath") != nullptr;
}

std::string utf8(const XMLCh* text) {
    return text != nullptr ? ChartString(text).toUTF8() : std::string();
}

bool sameText(const XMLCh* a, const XMLCh* b) {
    return XMLString::equals(a, b);
}

// The popup template: one "addPopups" instruction for every axis and the legend.
const char* const kPopupTemplate =
    "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"no\"?>\n"
    "<template Kovar-Version=\"2.10\" xmlns=\"http://plotaid.org/grxml\" "
    "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
    "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-template-3.5.xsd\">"
    "<addPopups x=\"true\" y=\"true\" z=\"true\" legend=\"true\"/></template>\n";

bool isDataRoot(const DOMElement* root) {
    return root != nullptr && sameText(root->getLocalName(), kGraphSources) &&
           sameText(root->getNamespaceURI(), ChartBase::_schemaDatabLocationValue);
}

} // namespace

struct ChartTransformer::MadeData {
    plotaid::detail::OwnedDocument document;
};

ChartTransformer::ChartTransformer(const std::string& xml) {
    const bool built = guarded(kFile, 120, "ChartTransformer ctor fatal error", false, [&] {
        if (!xml.empty() && buildVisualization(xml))
            moveSourcesToData();
        return true;
    });
    if (!built) {
        visualization_.reset();
        data_.clear();
        madeData_.reset();
        sources_.clear();
    }
}

ChartTransformer::ChartTransformer(const std::string& compressedXml, const std::string& compressedData)
    : data_(compressedData) {
    try {
        if (compressedXml.empty() || static_cast<unsigned char>(compressedXml[0]) != 0x78)
            return;
        std::string text;
        if (!zpack::decompressString(text, compressedXml))
            return;
        buildVisualization(text.empty() ? compressedXml : text);
    } catch (...) {
        visualization_.reset(); // silently: the host sees a transformer without a chart
    }
}

ChartTransformer::ChartTransformer(const std::string& compressedXml, const unsigned char* dataStream,
                                   unsigned int length)
    : dataStream_(dataStream), dataStreamLength_(dataStream != nullptr ? length : 0) {
    const bool built = guarded(kFile, 260, "ChartTransformer ctor fatal error", false, [&] {
        std::string text;
        if (zpack::decompressString(text, compressedXml))
            buildVisualization(text);
        return true;
    });
    if (!built)
        visualization_.reset();
}

ChartTransformer::~ChartTransformer() = default;

bool ChartTransformer::buildVisualization(const std::string& text) {
    if (text.empty())
        return false;
    // The chart needs a parser of its own: the visualization keeps the document, while the
    // builder's parser is reused for data documents.
    plotaid::detail::ValidatingParser parser;
    DOMDocument* parsed = parser.parse(
        text, "ChartBase", ChartException("parseDocument fatal error while parsing", kBaseFile, 1105),
        plotaid::detail::DocumentKind::Chart);
    if (parsed == nullptr)
        return false;
    DOMElement* root = parsed->getDocumentElement();
    if (root == nullptr || !sameText(root->getLocalName(), GrxUni::_visualization)) {
        report("ChartTransformer: the document is not a chart (root " +
                   utf8(root ? root->getTagName() : nullptr) + ")",
               140);
        return false;
    }
    plotaid::detail::OwnedDocument owned = parser.adoptDocument();
    visualization_ = std::make_unique<GrxVisualization>(root, true);
    owned.release(); // the visualization releases it
    document_ = root->getOwnerDocument();
    return true;
}

void ChartTransformer::moveSourcesToData() {
    GrxVisualization& vis = *visualization_;
    // Copies of the sources that stay, in the order the data document lists them; the embedded ones
    // themselves follow once they leave the chart. All remain nodes of the chart's document.
    for (GrxBaseElement* s : vis.getUserSources())
        sources_.push_back(static_cast<DOMElement*>(s->getImplementation()->cloneNode(true)));
    for (GrxBaseElement* s : vis.getDatabaseSources())
        sources_.push_back(static_cast<DOMElement*>(s->getImplementation()->cloneNode(true)));
    for (GrxBaseElement* s : vis.getDelimitedFileSources())
        sources_.push_back(static_cast<DOMElement*>(s->getImplementation()->cloneNode(true)));
    for (GrxBaseElement* s : vis.getStreamingSources())
        sources_.push_back(static_cast<DOMElement*>(s->getImplementation()->cloneNode(true)));

    // An embedded source without an id could never be found again, so it stays in the chart.
    std::vector<ChartString> moved;
    for (GrxEmbeddedSource* s : vis.getEmbeddedSources()) {
        const XMLCh* id = s->getId();
        if (id == nullptr || *id == 0)
            continue;
        moved.emplace_back(id);
        sources_.push_back(s->getImplementation());
        vis.removeChild(*s);
    }
    for (const ChartString& id : moved)
        vis.addUserSource().setId(id);
}

const DOMDocument* ChartTransformer::madeDataDocument() {
    if (madeData_ || sources_.empty())
        return madeData_ ? madeData_->document.get() : nullptr;
    plotaid::detail::OwnedDocument made(createDataDocument(kUtf8));
    if (!made || made->getDocumentElement() == nullptr) {
        report("ChartTransformer: no data document could be made", 180);
        return nullptr;
    }
    DOMElement* root = made->getDocumentElement();
    for (const DOMElement* source : sources_)
        root->appendChild(made->importNode(source, true));
    madeData_ = std::make_unique<MadeData>(MadeData{std::move(made)});
    return madeData_->document.get();
}

const std::string& ChartTransformer::compressedData() {
    if (data_.empty() && !sources_.empty())
        if (const DOMDocument* made = madeDataDocument())
            data_ = compressDocument(made);
    return data_;
}

namespace {

// Puts sources in place of their references for as long as it lives (the whole document is the
// chart's own document, printed in between), and the references back whatever happens.
class SourcesInPlace {
public:
    SourcesInPlace(DOMElement* chartRoot, const std::vector<DOMElement*>& sources) {
        std::vector<DOMNode*> used;
        for (DOMNode* child = chartRoot->getFirstChild(); child != nullptr; child = child->getNextSibling()) {
            if (child->getNodeType() != DOMNode::ELEMENT_NODE ||
                !sameText(static_cast<DOMElement*>(child)->getLocalName(), GrxUserSource::getElementName()))
                continue;
            const XMLCh* id = static_cast<DOMElement*>(child)->getAttribute(GrxUni::_id);
            DOMNode* put = nullptr;
            for (DOMElement* s : sources)
                if (sameText(s->getAttribute(GrxUni::_id), id)) {
                    put = s;
                    break;
                }
            // A reference without a source is left out: an empty text stands in its place. A source
            // asked for twice is copied, so that each reference has a node of its own to swap back.
            if (put == nullptr) {
                put = chartRoot->getOwnerDocument()->createTextNode(u"");
                placeholders_.push_back(put);
            } else if (std::find(used.begin(), used.end(), put) != used.end()) {
                put = put->cloneNode(true);
                placeholders_.push_back(put);
            } else {
                used.push_back(put);
            }
            swaps_.push_back({child, put});
        }
        root_ = chartRoot;
        try {
            for (Swap& swap : swaps_)
                chartRoot->replaceChild(swap.put, swap.reference);
        } catch (...) {
            restore(); // a swap that fails part-way leaves the chart as it was
            throw;
        }
    }
    ~SourcesInPlace() { restore(); }
    SourcesInPlace(const SourcesInPlace&) = delete;
    SourcesInPlace& operator=(const SourcesInPlace&) = delete;

private:
    void restore() noexcept {
        try {
            for (Swap& swap : swaps_)
                if (swap.put->getParentNode() == root_)
                    root_->replaceChild(swap.reference, swap.put);
            for (DOMNode* p : placeholders_)
                p->release();
        } catch (...) {
        }
        swaps_.clear();
        placeholders_.clear();
    }

    struct Swap {
        DOMNode* reference;
        DOMNode* put;
    };
    DOMElement* root_ = nullptr;
    std::vector<Swap> swaps_;
    std::vector<DOMNode*> placeholders_;
};

} // namespace

std::string ChartTransformer::getXML(const XMLCh*) {
    return visualization_ ? visualization_->AsUTF8() : std::string();
}

std::string ChartTransformer::getEntireXML(const XMLCh* encoding) {
    if (!visualization_)
        return {};
    return guarded(kFile, 427, "getEntireXML fatal error", std::string(), [&]() -> std::string {
        if (visualization_->getUserSources().empty())
            return visualization_->AsUTF8();
        DOMElement* chartRoot = visualization_->getImplementation();
        // The chart's own sources go back into its document without copying them, as long as the
        // chart's root declares what a new whole document's root would.
        if (!sources_.empty() && chartRoot->hasAttribute(_schemaInstanceName) &&
            chartRoot->hasAttribute(_schemaLocationName) && chartRoot->hasAttribute(_schemaDefaultNSName)) {
            SourcesInPlace inPlace(chartRoot, sources_);
            return visualization_->AsUTF8();
        }
        DOMDocument* dataDocument = getDataDocument();
        if (dataDocument == nullptr)
            return visualization_->AsUTF8();
        const DOMElement* dataRoot = dataDocument->getDocumentElement();

        DOMDocument* whole = createGrxDocument(encoding != nullptr && *encoding != 0 ? encoding : kUtf8);
        if (whole == nullptr || whole->getDocumentElement() == nullptr) {
            releaseDocument(whole);
            report("getEntireXML fatal error", 427);
            return {};
        }
        // The temporary visualization releases the document whatever happens below.
        DOMElement* wholeRoot = whole->getDocumentElement();
        GrxVisualization merged(wholeRoot, true);
        mergeAttributes(chartRoot, wholeRoot);
        for (const DOMNode* child = chartRoot->getFirstChild(); child != nullptr;
             child = child->getNextSibling()) {
            const DOMNode* take = child;
            if (child->getNodeType() == DOMNode::ELEMENT_NODE &&
                sameText(static_cast<const DOMElement*>(child)->getLocalName(),
                         GrxUserSource::getElementName())) {
                const XMLCh* id = static_cast<const DOMElement*>(child)->getAttribute(GrxUni::_id);
                take = nullptr;
                for (const DOMElement* s = dataRoot->getFirstElementChild(); s != nullptr;
                     s = s->getNextElementSibling()) {
                    if (sameText(s->getAttribute(GrxUni::_id), id)) {
                        take = s;
                        break;
                    }
                }
                if (take == nullptr)
                    continue;
            }
            DOMNode* imported = wholeRoot->appendChild(whole->importNode(take, true));
            if (take != child) // a source carries no namespace declaration of its own here
                static_cast<DOMElement*>(imported)->removeAttributeNS(XMLUni::fgXMLNSURIName,
                                                                      XMLUni::fgXMLNSString);
        }
        merged.wrap(wholeRoot);
        return merged.AsUTF8();
    });
}

std::string ChartTransformer::getCompressedXML() {
    return compressDocument(visualization_ ? visualization_->getDOMDocument() : nullptr);
}

std::string ChartTransformer::getCompressedData() {
    if (!sources_.empty())
        return compressedData();
    if (const DOMDocument* dataDocument = getDataDocument())
        data_ = compressDocument(dataDocument);
    return data_;
}

unsigned char* ChartTransformer::getCompressedDataStream(unsigned int& length) {
    length = 0;
    unsigned char* none = nullptr;
    return guarded(kFile, 500, "getCompressedDataStream fatal error", none, [&]() -> unsigned char* {
        if (dataStream_ != nullptr && dataStreamLength_ != 0) {
            unsigned char* copy = new unsigned char[dataStreamLength_];
            std::memcpy(copy, dataStream_, dataStreamLength_);
            length = dataStreamLength_;
            return copy;
        }
        if (compressedData().empty())
            return nullptr;
        XmlDataHandler handler(data_);
        unsigned char* stream = handler.GetDataStream(length);
        if (stream == nullptr)
            length = 0;
        return stream;
    });
}

bool ChartTransformer::applyTemplate(const std::string& templateText) {
    if (!visualization_)
        return false;
    const bool dump = dumpsWanted();
    if (dump && willPrintString(PRINT_XML_BEFORE_TEMPLATE)) {
        printString(getEntireXML(kUtf8), "Xml_before_template_", ".xml", templateDumpCount,
                    PRINT_XML_BEFORE_TEMPLATE);
        printString(templateText, "Template_", ".sgt", templateDumpCount, PRINT_TEMPLATE);
    }
    bool applied = true;
    try {
        ChartTemplate chartTemplate(*visualization_, nullptr);
        // A template that cannot be read changes nothing, which the host must not take for success.
        if (chartTemplate.setTemplate(templateText))
            chartTemplate.applyTemplate();
        else
            applied = false;
    } catch (...) {
        applied = false;
    }
    if (dump && willPrintString(PRINT_XML_AFTER_TEMPLATE)) {
        printString(getEntireXML(kUtf8), "Xml_after_template_", ".xml", templateDumpCount,
                    PRINT_XML_AFTER_TEMPLATE);
        ++templateDumpCount;
    }
    return applied;
}

unsigned int ChartTransformer::addPopups() {
    if (!visualization_ || !visualization_->getPopups().empty())
        return 0;
    applyTemplate(kPopupTemplate);
    if (dumpsWanted() && willPrintString(PRINT_XML_WITH_POPUPS)) {
        printString(getEntireXML(kUtf8), "xml_with_popups", ".xml", popupDumpCount, PRINT_XML_WITH_POPUPS);
        ++popupDumpCount;
    }
    return 1;
}

std::string ChartTransformer::compressDocument(const DOMDocument* document) {
    return guarded(kFile, 552, "compressDocument fatal error", std::string(), [&] {
        std::ostringstream text;
        if (document != nullptr) {
            ChartPrinter printer;
            printer.setPrintWhiteSpace(false);
            printer.Print(document, text);
        }
        std::string compressed;
        zpack::compressString(text.str(), compressed);
        return compressed;
    });
}

DOMDocument* ChartTransformer::createDataDocument(const XMLCh* encoding) {
    DOMDocument* document = nullptr;
    guarded(kFile, 330, "createDataDocument fatal error", [&] {
        DOMImplementation* impl = DOMImplementationRegistry::getDOMImplementation(_implFeatures);
        if (impl == nullptr)
            return;
        document = impl->createDocument(_schemaDatabLocationValue, _gsgraphSources, nullptr);
        document->setStrictErrorChecking(true);
        document->setXmlStandalone(false);
        document->setXmlVersion(_XMLversion);
        (void)encoding; // the DOM keeps no settable encoding; the printer writes UTF-8
        DOMElement* root = document->getDocumentElement();
        root->setAttributeNS(xercesc::XMLUni::fgXMLNSURIName, _schemaDefaultNSName, _schemaDefaultNSValue);
        root->setAttributeNS(xercesc::XMLUni::fgXMLNSURIName, _schemaInstanceName, _schemaInstanceValue);
        root->setAttributeNS(xercesc::XMLUni::fgXMLNSURIName, _schemaDataLocationName,
                             _schemaDatabLocationValue);
        root->setAttributeNS(_schemaInstanceValue, _schemaLocationName, _schemaDataLocationValue);
    });
    return document;
}

DOMDocument* ChartTransformer::getDataDocument() {
    if (!sources_.empty())
        return const_cast<DOMDocument*>(madeDataDocument());
    DOMDocument* none = nullptr;
    DOMDocument* document = nullptr;
    unsigned line = 452;
    if (!data_.empty()) {
        document = guarded(kFile, line, "getDataDocument fatal error", none, [&]() -> DOMDocument* {
            std::string text;
            return zpack::decompressString(text, data_) ? parseDocument(text) : nullptr;
        });
    } else if (dataStream_ != nullptr && dataStreamLength_ != 0) {
        line = 471;
        document = guarded(kFile, line, "getDataDocument fatal error", none, [&]() -> DOMDocument* {
            std::string text;
            XmlDataHandler handler(dataStream_, dataStreamLength_);
            return handler.GetXmlData(text, false) ? parseDocument(text) : nullptr;
        });
    }
    if (document == nullptr)
        return nullptr;
    // Source ids are taken as the chart's parse took them: one that is no XML name still names its
    // source, and dropping it here would drop its rows from the chart.
    if (!isDataRoot(document->getDocumentElement())) {
        report("getDataDocument: the data is not a data document", line);
        return nullptr;
    }
    return document;
}
