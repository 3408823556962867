#ifndef PLOTAID_FOUNDATION_OWNEDDOCUMENT_H
#define PLOTAID_FOUNDATION_OWNEDDOCUMENT_H

#include <xercesc/util/XercesDefs.hpp>

#include <memory>

XERCES_CPP_NAMESPACE_BEGIN
class DOMDocument;
XERCES_CPP_NAMESPACE_END

namespace plotaid::detail {

// Releases a document that its holder owns. Xerces-C must still be up (hold a XercesRuntime).
struct DocumentRelease {
    void operator()(XERCES_CPP_NAMESPACE::DOMDocument* document) const noexcept;
};
// The one owner of a Xerces document inside the library.
using OwnedDocument = std::unique_ptr<XERCES_CPP_NAMESPACE::DOMDocument, DocumentRelease>;

} // namespace plotaid::detail

#endif
