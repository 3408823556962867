#ifndef PLOTAID_TEMPLATES_TEMPLATECONVERTER_H
#define PLOTAID_TEMPLATES_TEMPLATECONVERTER_H

#include <xercesc/util/XercesDefs.hpp>

#include <string>

XERCES_CPP_NAMESPACE_BEGIN
class DOMDocument;
XERCES_CPP_NAMESPACE_END

namespace plotaid::detail {

// Writes a template of the earlier form (null when its parse built nothing) as text of the
// current form: a "template" root naming grxml-template-1.0.xsd, one instruction per part of the
// old document that a conversion pass recognises. No pass is built yet, so the result is the bare
// root, which applies no instruction. Never empty, and always carries the current-form marker.
std::string convertTemplate(const XERCES_CPP_NAMESPACE::DOMDocument* old);

// Numbers the conversions of this process for their dumps: 1, 2, 3, ...
unsigned nextConversionCount() noexcept;

} // namespace plotaid::detail

#endif
