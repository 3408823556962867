#include "foundation/ValidatingParser.h"

#include "foundation/HostText.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartBase.h>
#include <plotaid/ChartErrorHandler.h>


#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMException.hpp>
#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/framework/XMLGrammarPoolImpl.hpp>
#include <xercesc/validators/schema/ComplexTypeInfo.hpp>
#include <xercesc/validators/schema/SchemaGrammar.hpp>
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

#include <scratchloc/PathFactory.h>

#include <array>
#include <atomic>
#include <map>
#include <mutex>
#include <optional>
#include <utility>

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
    explicit Parser(XMLGrammarPool* pool = nullptr)
        : XercesDOMParser(nullptr, XMLPlatformUtils::fgMemoryManager, pool) {}

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

constexpr std::size_t kKinds = static_cast<std::size_t>(DocumentKind::Pmml) + 1;

// The grammar file each kind starts from; what it includes and imports comes along.
const char* grammarFile(DocumentKind kind) {
    switch (kind) {
    case DocumentKind::Named:
        break;
    case DocumentKind::Chart:
        return "grxml-2.9.xsd";
    case DocumentKind::Template:
        return "grxml-template-3.5.xsd";
    case DocumentKind::ConvertedTemplate:
        return "grxml-template-1.0.xsd";
    case DocumentKind::Data:
        return "grxml-data-2.1.xsd";
    case DocumentKind::TreeDisplay:
        return "treeview-1.0.xsd";
    case DocumentKind::Pmml:
        return "pmml-2-1.xsd";
    }
    return nullptr;
}

std::string resourceFolder() {
    const scratchloc::PathFinder* finder =
        scratchloc::PathFactory::getPathInstance(scratchloc::PathFactory::ResourceFolder);
    return finder ? finder->getPath() : std::string();
}

// A locked pool: parsers only read it, apart from the namespace names they meet, which a locked
// pool keeps in a string pool of its own behind a lock. Those accumulate over hostile documents,
// so a pool that has taken in this many is replaced.
struct LoadedPool {
    static constexpr unsigned kMaxNewNames = 10000;
    XMLGrammarPoolImpl pool{XMLPlatformUtils::fgMemoryManager};
    unsigned names = 0;
    bool crowded() { return pool.getURIStringPool()->getStringCount() > names + kMaxNewNames; }
};
using Pool = std::shared_ptr<LoadedPool>;

// The process's pools, by kind and resource folder. Emptied before Xerces-C terminates.
class PoolCache {
public:
    // Never destroyed: a runtime reference held by a static object may drop the pools at exit,
    // after function-local statics made later are gone.
    static PoolCache& instance() {
        static PoolCache* const cache = new PoolCache;
        return *cache;
    }

    // Null when the grammar cannot be read; errors then says why. The caller holds Xerces-C up.
    Pool get(DocumentKind kind, const std::string& folder, std::vector<std::string>& errors) {
        const std::lock_guard<std::mutex> guard(lock_);
        Pool& slot = pools_[{kind, folder}];
        if (!slot) {
            slot = load(kind, errors);
            if (!slot) {
                pools_.erase({kind, folder});
                return nullptr;
            }
            ++loads_[static_cast<std::size_t>(kind)];
        }
        return slot;
    }

    void retire(DocumentKind kind, const std::string& folder, const Pool& pool) {
        const std::lock_guard<std::mutex> guard(lock_);
        const auto found = pools_.find({kind, folder});
        if (found != pools_.end() && found->second == pool)
            pools_.erase(found);
    }

    unsigned loads(DocumentKind kind) const noexcept { return loads_[static_cast<std::size_t>(kind)]; }

private:
    PoolCache() { XercesRuntime::beforeTermination(&PoolCache::dropAll); }

    static void dropAll() {
        PoolCache& cache = instance();
        const std::lock_guard<std::mutex> guard(cache.lock_);
        cache.pools_.clear();
    }

    // Xerces builds a type's content model and attribute list on first use and keeps them in the
    // grammar. Built here, before the pool is shared, so no two parsers race to build (and leak)
    // the same one.
    static void buildLazyParts(XMLGrammarPool& pool) {
        RefHashTableOfEnumerator<Grammar> grammars = pool.getGrammarEnumerator();
        while (grammars.hasMoreElements()) {
            Grammar& grammar = grammars.nextElement();
            if (grammar.getGrammarType() != Grammar::SchemaGrammarType)
                continue;
            const auto& schema = static_cast<const SchemaGrammar&>(grammar);
            if (RefHashTableOf<ComplexTypeInfo>* types = schema.getComplexTypeRegistry()) {
                RefHashTableOfEnumerator<ComplexTypeInfo> each(types, false, XMLPlatformUtils::fgMemoryManager);
                while (each.hasMoreElements()) {
                    ComplexTypeInfo& type = each.nextElement();
                    type.getContentModel();
                    type.getAttDefList();
                }
            }
            RefHash3KeysIdPoolEnumerator<SchemaElementDecl> elements = schema.getElemEnumerator();
            while (elements.hasMoreElements())
                if (ComplexTypeInfo* type = elements.nextElement().getComplexTypeInfo()) {
                    type->getContentModel();
                    type->getAttDefList();
                }
        }
    }

    static Pool load(DocumentKind kind, std::vector<std::string>& errors) {
        Pool loaded = std::make_shared<LoadedPool>();
        RecordingHandler handler(errors);
        try {
            Parser loader(&loaded->pool);
            loader.setDoNamespaces(true);
            loader.setDoSchema(true);
            loader.setHandleMultipleImports(true);
            loader.setErrorHandler(&handler);
            loader.setEntityResolver(&handler);
            loader.setDisableDefaultEntityResolution(true);
            // The resolver maps the name after the last '/' into the schema folder.
            const WideText id = toWide((std::string("http://plotaid.org/grxml/") + grammarFile(kind)).c_str());
            std::unique_ptr<InputSource> source(handler.resolveEntity(nullptr, id.get()));
            if (!source || loader.loadGrammar(*source, Grammar::SchemaGrammarType, true) == nullptr) {
                errors.push_back(std::string("the grammar ") + grammarFile(kind) + " cannot be read");
                return nullptr;
            }
        } catch (const SAXParseException& e) {
            errors.push_back(describe(e));
            return nullptr;
        } catch (const XMLException& e) {
            errors.push_back(toHost(e.getMessage()));
            return nullptr;
        } catch (...) {
            errors.push_back(std::string("the grammar ") + grammarFile(kind) + " cannot be read");
            return nullptr;
        }
        try {
            buildLazyParts(loaded->pool);
        } catch (...) {
            errors.push_back(std::string("the grammar ") + grammarFile(kind) + " cannot be prepared");
            return nullptr;
        }
        loaded->pool.lockPool();
        loaded->names = loaded->pool.getURIStringPool()->getStringCount();
        return loaded;
    }

    std::mutex lock_;
    std::map<std::pair<DocumentKind, std::string>, Pool> pools_;
    std::array<std::atomic<unsigned>, kKinds> loads_{};
};

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
    // One parser per kind, made when first needed, with the pool of the folder it was made for.
    struct Slot {
        std::string folder;
        Pool pool; // outlives the parser below
        std::optional<Parser> parser;
    };

    // Declared first: Xerces-C outlives everything below.
    XercesRuntime runtime;
    std::vector<std::string> errors;
    RecordingHandler handler{errors};
    SecurityManager security;
    std::array<Slot, kKinds> slots;
    Parser* last = nullptr;
    DOMDocument* document = nullptr;
    // What a failed parse built before it stopped; it lives until the next parse.
    DOMDocument* partial = nullptr;

    Impl() { security.setEntityExpansionLimit(kEntityExpansionLimit); }

    // Null (with errors) when Xerces-C is down or the kind's grammar cannot be read.
    Parser* parserFor(DocumentKind kind) {
        if (!runtime.ready()) {
            errors.push_back("the XML parser library is not available");
            return nullptr;
        }
        Slot& slot = slots[static_cast<std::size_t>(kind)];
        if (kind == DocumentKind::Named) {
            if (!slot.parser)
                configure(slot.parser.emplace());
            return &*slot.parser;
        }
        std::string folder = resourceFolder();
        if (slot.parser && slot.folder == folder)
            return &*slot.parser;
        slot.parser.reset();
        slot.pool = PoolCache::instance().get(kind, folder, errors);
        if (!slot.pool)
            return nullptr;
        slot.folder = std::move(folder);
        Parser& p = slot.parser.emplace(&slot.pool->pool);
        configure(p);
        p.useCachedGrammarInParse(true);
        // A document's own DTD or foreign schema stays with that document.
        p.cacheGrammarFromParse(false);
        return &p;
    }

    // Between parses only: the parser's document dies with it.
    void retireIfCrowded(DocumentKind kind) {
        Slot& slot = slots[static_cast<std::size_t>(kind)];
        if (!slot.pool || !slot.pool->crowded())
            return;
        slot.parser.reset();
        PoolCache::instance().retire(kind, slot.folder, slot.pool);
        slot.pool.reset();
    }

    void configure(Parser& p) {
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
                                     const ChartException& failure, DocumentKind kind) {
    Impl& in = *impl_;
    in.errors.clear();
    in.document = nullptr;
    in.partial = nullptr;
    if (in.last != nullptr) {
        // The previous document dies here unless it was adopted.
        try {
            in.last->resetDocumentPool();
        } catch (...) {
        }
        in.last = nullptr;
    }
    in.retireIfCrowded(kind);
    if (Parser* parser = in.parserFor(kind)) {
        try {
            static const char nothing = 0;
            MemBufInputSource source(reinterpret_cast<const XMLByte*>(text.empty() ? &nothing : text.data()),
                                     text.size(), systemId ? systemId : "");
            in.last = parser;
            parser->parse(source);
            in.document = parser->getDocument();
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
            in.partial = parser->getDocument();
            if (in.partial == nullptr) {
                parser->resetDocumentPool();
                in.last = nullptr;
            }
        } catch (...) {
            in.partial = nullptr;
            in.last = nullptr;
        }
    }
    try {
        ChartBase::printString(std::string(text), "parseError_", ".xml", 0, ChartBase::PRINT_XML_WITH_POPUPS);
    } catch (...) {
    }
    ChartErrorHandler().error(failure);
    return nullptr;
}

const DOMDocument* ValidatingParser::partialDocument() const noexcept {
    return impl_->partial;
}

OwnedDocument ValidatingParser::adoptDocument() {
    Impl& in = *impl_;
    if (in.document == nullptr || in.last == nullptr)
        return OwnedDocument();
    in.document = nullptr;
    return OwnedDocument(in.last->adoptDocument());
}

const std::vector<std::string>& ValidatingParser::lastErrors() const noexcept {
    return impl_->errors;
}

unsigned ValidatingParser::grammarLoads(DocumentKind kind) noexcept {
    return PoolCache::instance().loads(kind);
}

} // namespace plotaid::detail
