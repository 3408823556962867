#ifndef TESTS_GRXCHART_GRXTESTSUPPORT_H
#define TESTS_GRXCHART_GRXTESTSUPPORT_H

#include <grx/grx.h>

#include <string>

namespace grxtest {

constexpr XMLCh kChartNamespace[] = u"http://plotaid.org/grxml";

// An empty chart made through DOM calls only: a "visualization" root in the chart namespace.
xercesc::DOMDocument* newChartDocument();

// The element tree as text: names, attributes (sorted) and text, one element per line, with a mark
// for every element that carries a wrapper. Two equal signatures mean the same structure.
std::string signature(const xercesc::DOMElement* root);

// An attribute's text as UTF-8 ("" when absent).
inline std::string attr(const GrxBaseElement& e, const XMLCh* name) {
    return ChartString(e.GetAttribute(name)).toUTF8();
}

} // namespace grxtest

#endif
