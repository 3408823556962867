#ifndef PLOTAID_TESTS_GRAMMAR_GRAMMARSUPPORT_H
#define PLOTAID_TESTS_GRAMMAR_GRAMMARSUPPORT_H

#include "support/ToolRunner.h"

#include <xercesc/util/XercesDefs.hpp>

#include <string>
#include <vector>

XERCES_CPP_NAMESPACE_BEGIN
class DOMDocument;
XERCES_CPP_NAMESPACE_END

class GrxVisualization;

namespace grammar_test {

// Every sample chart under examples/charts, sorted.
std::vector<std::string> sampleCharts();

// The source tree's grammars, ending with '/'.
std::string schemaFolder();
std::string readText(const std::string& path);
// Writes text to a new file in the test's scratch folder and returns its path.
std::string writeScratch(const std::string& name, const std::string& text);

// text with the first `from` replaced by `to`; an empty result when `from` does not occur, so a
// variant that silently stayed valid cannot pass for a broken one.
std::string replaceOnce(const std::string& text, const std::string& from, const std::string& to);

using LintResult = ToolResult;
// Validates file against schema (a file name under resources/schemas) with the xmllint binary, a
// validator independent of Xerces-C. Schema URIs are mapped to the source tree through an XML
// catalog and the network is off, so imports resolve exactly as the library resolves them.
LintResult xmllint(const std::string& schema, const std::string& file);
bool haveXmllint();

// Points the library (and tools started from the test) at a resource folder that holds the
// source tree's grammars, so the resolver finds them by file name.
void useSourceGrammars();

// Soundness of a chart the library produced, empty when sound (else what is wrong):
// ids held by more than one element (the library's parser lets them pass);
std::string duplicateIds(const XERCES_CPP_NAMESPACE::DOMDocument* document);
// what the library's validating parser, then xmllint on grxml-2.9.xsd (when installed), say;
std::string chartFaults(const std::string& chart);
// both, and the ids, on the chart as the library prints it.
std::string chartFaults(const GrxVisualization& chart);
// what xmllint says of the text against schema; empty when it accepts it or is not installed.
std::string lintFaults(const std::string& schema, const std::string& text);

// The data document of a small store, byte for byte as the XML data handler writes it.
std::string dataDocument(const std::string& sources);

} // namespace grammar_test

#endif
