#include <plotaid/TreeEntityResolver.h>

#include "foundation/XercesRuntime.h"
#include "tree/TreeVocabulary.h"

#include <plotaid/ChartErrorHandler.h>

#include <xercesc/util/XMLString.hpp>

using namespace XERCES_CPP_NAMESPACE;

namespace {

bool endsWith(const XMLCh* text, const XMLCh* tail) {
    const XMLSize_t length = XMLString::stringLen(text);
    const XMLSize_t tailLength = XMLString::stringLen(tail);
    return length >= tailLength && XMLString::equals(text + (length - tailLength), tail);
}

} // namespace

TreeEntityResolver::~TreeEntityResolver() = default;

InputSource* TreeEntityResolver::resolveEntity(const XMLCh* const publicId, const XMLCh* const systemId) {
    using namespace plotaid::detail;
    // Input sources need the parser library up; outside a parse nothing is resolved.
    if (XercesRuntime::references() == 0)
        return nullptr;
    // Only the file name counts: the library's own resolver then reads it from the schema folder,
    // the one place it ever reads from.
    const XMLCh* location = nullptr;
    if (systemId != nullptr && endsWith(systemId, kPmmlSchemaFile))
        location = kPmmlSchemaUri;
    else if (systemId != nullptr && endsWith(systemId, kTreeViewSchemaFile))
        location = kTreeViewSchemaUri;
    // Anything else is refused (and logged) by the same resolver.
    return ChartErrorHandler().resolveEntity(publicId, location ? location : systemId);
}
