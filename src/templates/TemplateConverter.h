#ifndef PLOTAID_TEMPLATES_TEMPLATECONVERTER_H
#define PLOTAID_TEMPLATES_TEMPLATECONVERTER_H

#include "foundation/ValidatingParser.h"

#include <xercesc/util/XercesDefs.hpp>

#include <string>
#include <string_view>

XERCES_CPP_NAMESPACE_BEGIN
class DOMDocument;
XERCES_CPP_NAMESPACE_END

namespace plotaid::detail {

// Writes a template of the earlier form (null when its parse built nothing) as text of the
// current form: a "template" root naming grxml-template-1.0.xsd, one instruction per part of the
// old document that a conversion pass recognises. No pass is built yet, so the result is the bare
// root, which applies no instruction. Never empty, and always carries the current-form marker.
std::string convertTemplate(const XERCES_CPP_NAMESPACE::DOMDocument* old);

// The grammar a template text is read with. Text naming the marker "grxml-template-" is of the
// current form, read as the converter's form when it names grxml-template-1.0; so is text whose root
// is "template" in the chart namespace with an instruction among its children, schema line or not.
// Anything else is of the earlier form (Named: read with whatever it names, for the converter). Text
// without the marker is read through without validation: when it is not XML, notXml says why
// ("LINE:COLUMN: message", also logged). The caller holds Xerces-C up.
DocumentKind templateKind(std::string_view text, std::string& notXml);

// Numbers the conversions of this process for their dumps: 1, 2, 3, ...
unsigned nextConversionCount() noexcept;

} // namespace plotaid::detail

#endif
