#ifndef PLOTAID_TESTS_CLONING_CLONESUPPORT_H
#define PLOTAID_TESTS_CLONING_CLONESUPPORT_H

#include "support/EngineSupport.h"
#include "support/TestSupport.h"

#include <plotaid/BaseTemplate.h>

#include <xercesc/dom/DOM.hpp>

#include <cstdio>
#include <map>
#include <string>
#include <vector>

#include <sys/wait.h>

namespace clone_test {

// The base as an action that does nothing, to reach its shared operations.
class Probe : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override { return false; }
};

inline std::string utf8(const XMLCh* s) {
    return ChartString(s).toUTF8();
}

// Every id of the document with how often it occurs.
inline std::map<std::string, int> idCounts(const XERCES_CPP_NAMESPACE::DOMDocument* document) {
    std::map<std::string, int> counts;
    std::vector<const XERCES_CPP_NAMESPACE::DOMElement*> pending{document->getDocumentElement()};
    while (!pending.empty()) {
        const XERCES_CPP_NAMESPACE::DOMElement* e = pending.back();
        pending.pop_back();
        if (e->getAttributeNode(u"id") != nullptr)
            ++counts[utf8(e->getAttribute(u"id"))];
        for (const XERCES_CPP_NAMESPACE::DOMElement* c = e->getFirstElementChild(); c;
             c = c->getNextElementSibling())
            pending.push_back(c);
    }
    return counts;
}

// Ids held by more than one element, joined for a failure message; empty when all are unique.
inline std::string duplicateIds(const XERCES_CPP_NAMESPACE::DOMDocument* document) {
    std::string out;
    for (const auto& [id, count] : idCounts(document))
        if (count > 1)
            out += id + " (" + std::to_string(count) + ") ";
    return out;
}

inline bool haveXmllint() {
    return std::system("xmllint --version >/dev/null 2>&1") == 0;
}

// What xmllint, a validator independent of Xerces-C, says of the chart text against the chart
// grammar; the schema location is mapped onto the source tree and the network stays off.
// Empty when the chart is valid.
inline std::string xmllintFaults(const std::string& chart) {
    TempDir folder;
    const std::string schemas = std::string(PLOTAID_SOURCE_DIR) + "/resources/schemas/";
    {
        std::ofstream catalog(folder.file("catalog.xml"));
        catalog
            << "<?xml version=\"1.0\"?>\n<catalog xmlns=\"urn:oasis:names:tc:entity:xmlns:xml:catalog\">\n"
            << "<rewriteSystem systemIdStartString=\"http://plotaid.org/grxml/\" rewritePrefix=\"file://"
            << schemas
            << "\"/>\n<rewriteURI uriStartString=\"http://plotaid.org/grxml/\" rewritePrefix=\"file://"
            << schemas << "\"/>\n</catalog>\n";
        std::ofstream out(folder.file("chart.xml"), std::ios::binary);
        out << chart;
    }
    const std::string command = "XML_CATALOG_FILES='" + folder.file("catalog.xml") +
                                "' xmllint --nonet --noout --schema '" + schemas + "grxml-2.9.xsd' '" +
                                folder.file("chart.xml") + "' 2>&1";
    std::string output;
    FILE* pipe = ::popen(command.c_str(), "r");
    if (pipe == nullptr)
        return "xmllint could not be started";
    char buffer[4096];
    std::size_t n;
    while ((n = std::fread(buffer, 1, sizeof buffer, pipe)) > 0)
        output.append(buffer, n);
    const int status = ::pclose(pipe);
    const bool valid = WIFEXITED(status) && WEXITSTATUS(status) == 0;
    return valid ? std::string() : (output.empty() ? std::string("xmllint failed") : output);
}

// What the library's own validating parser says of the chart text; empty when it is valid.
inline std::string xercesFaults(const std::string& chart) {
    plotaid::detail::ValidatingParser parser;
    if (parser.parse(chart, "cloned", ChartException("cloned chart", "clone_test", 0)) != nullptr)
        return std::string();
    std::string out = "rejected: ";
    for (const std::string& e : parser.lastErrors())
        out += e + "; ";
    return out;
}

} // namespace clone_test

#endif
