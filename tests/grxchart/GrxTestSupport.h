#ifndef TESTS_GRXCHART_GRXTESTSUPPORT_H
#define TESTS_GRXCHART_GRXTESTSUPPORT_H

#include <grx/grx.h>

#include <memory>
#include <string>
#include <vector>

namespace grxtest {

constexpr XMLCh kChartNamespace[] = u"http://plotaid.org/grxml";

std::string readFile(const std::string& path);
std::vector<std::string> sampleCharts();

struct DocumentRelease {
    void operator()(xercesc::DOMDocument* doc) const;
};
using OwnedDocument = std::unique_ptr<xercesc::DOMDocument, DocumentRelease>;

// A parse validated against the chart grammar of the source tree (schemas found by file name in
// resources/schemas, nothing read from the network); null (and `errors` filled) on any error.
OwnedDocument parseValidated(const std::string& text, std::string* errors = nullptr);

// An empty chart made through DOM calls only: a "visualization" root in the chart namespace.
xercesc::DOMDocument* newChartDocument();

// The element tree as text: names, attributes (sorted) and text, one element per line, with a mark
// for every element that carries a wrapper. Two equal signatures mean the same structure.
std::string signature(const xercesc::DOMElement* root);

} // namespace grxtest

#endif
