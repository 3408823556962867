#include "foundation/ValidatingParser.h"

#include "foundation/HostText.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartBase.h>
#include <plotaid/ChartErrorHandler.h>


#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMException.hpp>
#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/internal/XMLScanner.hpp>
#include <xercesc/parsers/XercesDOMParser.hpp>
#include <xercesc/sax/Locator.hpp>
#include <xercesc/sax/SAXParseException.hpp>
#include <xercesc/util/OutOfMemoryException.hpp>
#include <xercesc/util/SecurityManager.hpp>
#include <xercesc/util/XMLExceptMsgs.hpp>
#include <xercesc/util/XMLString.hpp>
#include <xercesc/util/XMLUni.hpp>
#include <xercesc/validators/DTD/DTDEntityDecl.hpp>

#include <optional>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

// A value that its data type rejects: the schema validator hands on the code of the data-type
// validator's exception, in the exception-message domain.
bool isDatatypeError(unsigned code, const XMLCh* domain, XMLErrorReporter::ErrTypes type) {
    if (type != XMLErrorReporter::ErrType_Error || !XMLString::equals(domain, XMLUni::fgExceptDomain))
        return false;
    return (code >= XMLExcepts::VALUE_NotMatch_Pattern && code <= XMLExcepts::XMLNUM_DBL_FLT_InvalidType) ||
           (code >= XMLExcepts::DateTime_dt_invalid && code <= XMLExcepts::DateTime_tz_hh_invalid) ||
           code == XMLExcepts::VALUE_QName_Invalid2;
}

class Parser final : public XercesDOMParser {
public:
    void error(const unsigned int code, const XMLCh* const domain, const XMLErrorReporter::ErrTypes type,
               const XMLCh* const text, const XMLCh* const systemId, const XMLCh* const publicId,
               const XMLFileLoc line, const XMLFileLoc column) override {
        if (isDatatypeError(code, domain, type))
            return;
        XercesDOMParser::error(code, domain, type, text, systemId, publicId, line, column);
    }

    // Together with the expansion limit this bounds the text that entities can produce, which
    // the expansion limit alone does not (a few references to one huge entity).
    void entityDecl(const DTDEntityDecl& decl, const bool isPEDecl, const bool isIgnored) override {
        if (!decl.isExternal() && decl.getValueLen() > ValidatingParser::kEntityValueLimit)
            refuse("entity '" + toHost(decl.getName()) + "' has more than " +
                   std::to_string(ValidatingParser::kEntityValueLimit) +
                   " characters; this is the limit imposed by the application");
        XercesDOMParser::entityDecl(decl, isPEDecl, isIgnored);
    }

    // The scanner's prefix look-up is linear in the depth, so unbounded nesting costs quadratic time.
    void startDocument() override {
        depth_ = 0;
        XercesDOMParser::startDocument();
    }
    void startElement(const XMLElementDecl& decl, const unsigned int urlId, const XMLCh* const prefix,
                      const RefVectorOf<XMLAttr>& attributes, const XMLSize_t count, const bool isEmpty,
                      const bool isRoot) override {
        if (!isEmpty && ++depth_ > ValidatingParser::kNestingLimit)
            refuse("elements are nested more than " + std::to_string(ValidatingParser::kNestingLimit) +
                   " deep; this is the limit imposed by the application");
        XercesDOMParser::startElement(decl, urlId, prefix, attributes, count, isEmpty, isRoot);
    }
    void endElement(const XMLElementDecl& decl, const unsigned int urlId, const bool isRoot,
                    const XMLCh* const prefix) override {
        if (depth_ > 0)
            --depth_;
        XercesDOMParser::endElement(decl, urlId, isRoot, prefix);
    }

private:
    // Reports a limit as a fatal error at the current position and stops the parse even when the
    // handler would let it go on.
    [[noreturn]] void refuse(const std::string& message) {
        const WideText text = toWide(message.c_str());
        const Locator* where = getScanner()->getLocator();
        XercesDOMParser::error(0, XMLUni::fgXMLErrDomain, XMLErrorReporter::ErrType_Fatal, text.get(),
                               where ? where->getSystemId() : nullptr, where ? where->getPublicId() : nullptr,
                               where ? where->getLineNumber() : 0, where ? where->getColumnNumber() : 0);
        throw SAXParseException(text.get(), nullptr, nullptr, 0, 0);
    }

    std::size_t depth_ = 0;
};

// Remembers refusals, so a command-line validator can say which entity was refused.
class RecordingHandler final : public ChartErrorHandler {
public:
    explicit RecordingHandler(std::vector<std::string>& errors) : errors_(errors) {}

    InputSource* resolveEntity(const XMLCh* const publicId, const XMLCh* const systemId) override {
        InputSource* source = ChartErrorHandler::resolveEntity(publicId, systemId);
        if (source == nullptr)
            errors_.push_back("refused to read '" + toHost(systemId) +
                              "': not a file of the resource folder");
        return source;
    }

private:
    std::vector<std::string>& errors_;
};

std::string describe(const SAXParseException& e) {
    return toHost(e.getSystemId()) + ":" + std::to_string(e.getLineNumber()) + ":" +
           std::to_string(e.getColumnNumber()) + ": " + toHost(e.getMessage());
}

} // namespace

void DocumentRelease::operator()(DOMDocument* document) const noexcept {
    if (document == nullptr)
        return;
    try {
        document->release();
    } catch (...) {
    }
}

struct ValidatingParser::Impl {
    // Declared first: Xerces-C outlives everything below.
    XercesRuntime runtime;
    std::vector<std::string> errors;
    RecordingHandler handler{errors};
    SecurityManager security;
    std::optional<Parser> parser;
    DOMDocument* document = nullptr;

    Impl() {
        if (!runtime.ready())
            return;
        security.setEntityExpansionLimit(kEntityExpansionLimit);
        Parser& p = parser.emplace();
        p.setValidationScheme(XercesDOMParser::Val_Always);
        p.setDoNamespaces(true);
        p.setDoSchema(true);
        p.setIncludeIgnorableWhitespace(false);
        p.setErrorHandler(&handler);
        p.setEntityResolver(&handler);
        // What the resolver refuses must fail the parse, not be looked up by the parser itself.
        p.setDisableDefaultEntityResolution(true);
        p.setSecurityManager(&security);
    }
};

ValidatingParser::ValidatingParser() : impl_(std::make_unique<Impl>()) {}

ValidatingParser::~ValidatingParser() = default;

DOMDocument* ValidatingParser::parse(std::string_view text, const char* systemId,
                                     const ChartException& failure) {
    Impl& in = *impl_;
    in.errors.clear();
    in.document = nullptr;
    if (!in.parser) {
        in.errors.push_back("the XML parser library is not available");
    } else {
        try {
            // The previous document dies here unless it was adopted.
            in.parser->resetDocumentPool();
            static const char nothing = 0;
            MemBufInputSource source(reinterpret_cast<const XMLByte*>(text.empty() ? &nothing : text.data()),
                                     text.size(), systemId ? systemId : "");
            in.parser->parse(source);
            in.document = in.parser->getDocument();
            if (in.document != nullptr)
                return in.document;
            in.errors.push_back("no document");
        } catch (const SAXParseException& e) {
            in.errors.push_back(describe(e));
        } catch (const SAXException& e) {
            in.errors.push_back(toHost(e.getMessage()));
        } catch (const XMLException& e) {
            in.errors.push_back(toHost(e.getMessage()));
        } catch (const DOMException& e) {
            in.errors.push_back(toHost(e.getMessage()));
        } catch (const OutOfMemoryException&) {
            in.errors.push_back("out of memory");
        } catch (const std::exception& e) {
            in.errors.push_back(e.what());
        } catch (...) {
            in.errors.push_back("unknown failure");
        }
        try {
            in.parser->resetDocumentPool();
        } catch (...) {
        }
    }
    try {
        ChartBase::printString(std::string(text), "parseError_", ".xml", 0, ChartBase::PRINT_XML_WITH_POPUPS);
    } catch (...) {
    }
    ChartErrorHandler().error(failure);
    return nullptr;
}

OwnedDocument ValidatingParser::adoptDocument() {
    Impl& in = *impl_;
    if (in.document == nullptr || !in.parser)
        return OwnedDocument();
    in.document = nullptr;
    return OwnedDocument(in.parser->adoptDocument());
}

const std::vector<std::string>& ValidatingParser::lastErrors() const noexcept {
    return impl_->errors;
}

} // namespace plotaid::detail
