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
// old document that a conversion pass recognises, the passes in a fixed order whatever the old
// document's order; nothing recognised gives the bare root. Never empty, and always carries the
// current-form marker. The instructions carry the names and values that the actions read.
std::string convertTemplate(const XERCES_CPP_NAMESPACE::DOMDocument* old);

// The text of an earlier-form template, parsed with the grammar it names and converted. False
// with a reason ("NAME:LINE:COLUMN: message" where the parser gives one) when the text is not XML,
// is of the current form or is refused by its grammar. The caller holds Xerces-C up.
bool convertTemplateText(std::string_view text, const std::string& name, std::string& converted,
                         std::string& error);

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
