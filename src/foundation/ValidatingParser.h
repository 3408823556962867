#ifndef PLOTAID_FOUNDATION_VALIDATINGPARSER_H
#define PLOTAID_FOUNDATION_VALIDATINGPARSER_H

#include "foundation/OwnedDocument.h"

#include <plotaid/ChartException.h>

#include <xercesc/util/XercesDefs.hpp>

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

XERCES_CPP_NAMESPACE_BEGIN
class DOMDocument;
XERCES_CPP_NAMESPACE_END

namespace plotaid::detail {

// What the caller reads. Each kind but Named is checked against its bundled grammar, whatever schema
// the text names or whether it names one: charts and templates share a namespace, so the caller,
// not the document, says which grammar applies. The grammars of a kind are loaded once per process
// and resource folder, then shared read-only by every parser on every thread.
enum class DocumentKind {
    Named,             // whatever grammar the text names, read for this parse alone
    Chart,             // grxml-2.9
    Template,          // grxml-template-3.5, the form people write
    ConvertedTemplate, // grxml-template-1.0, the form the converter writes
    Data,              // grxml-data-2.1, and the chart grammar it imports (so charts pass too)
    TreeDisplay,       // treeview-1.0
    Pmml,              // pmml-2-1
};

// The library's one way to parse XML. The parser always validates (namespaces and schemas on,
// ignorable white space dropped), reads schemas and other entities only from the resource folder
// through ChartErrorHandler, limits entity expansion, and lets values of a wrong data type pass:
// any other warning or error stops the parse. It keeps Xerces-C up while it lives.
//
//   ValidatingParser parser;
//   if (DOMDocument* doc = parser.parse(text, "ChartBase", ChartException("...", file, line)))
//       use(doc);                          // owned by the parser until its next parse
//   OwnedDocument mine = parser.adoptDocument(); // or take it over
class ValidatingParser {
public:
    // At most this many entity references are expanded in one document, ...
    static constexpr std::size_t kEntityExpansionLimit = 5000;
    // ... and no internal entity may hold a longer replacement text, which bounds what expansion
    // can produce at a few tens of megabytes.
    static constexpr std::size_t kEntityValueLimit = 2048;
    // Deeper element nesting is refused (charts nest a few dozen levels, tree models a few hundred).
    static constexpr std::size_t kNestingLimit = 1024;

    ValidatingParser();
    ~ValidatingParser();
    ValidatingParser(const ValidatingParser&) = delete;
    ValidatingParser& operator=(const ValidatingParser&) = delete;

    // Parses the bytes of text (read in place, not copied); systemId names the text in reports.
    // Returns the document, which belongs to this parser until its next parse or adoptDocument().
    // On failure returns null after dumping the text as parseError_00.xml (dump kind 9) and
    // logging `failure`; lastErrors() then says why.
    XERCES_CPP_NAMESPACE::DOMDocument* parse(std::string_view text, const char* systemId,
                                             const ChartException& failure,
                                             DocumentKind kind = DocumentKind::Named);

    // After a failed parse, the part of the document built before the parse stopped (null when
    // none), owned by this parser until its next parse.
    const XERCES_CPP_NAMESPACE::DOMDocument* partialDocument() const noexcept;

    // Hands the document of the last successful parse to the caller; null when there is none.
    OwnedDocument adoptDocument();

    // The texts (host encoding) of what stopped the last parse, such as
    // "ChartBase:3:7: no declaration found for element 'bogus'"; empty after a successful parse.
    const std::vector<std::string>& lastErrors() const noexcept;

    // How many grammar sets this process has loaded for the kind (once per resource folder).
    static unsigned grammarLoads(DocumentKind kind) noexcept;

private:
    struct Impl;
    std::unique_ptr<Impl> impl_;
};

} // namespace plotaid::detail

#endif
