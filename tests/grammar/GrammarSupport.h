#ifndef PLOTAID_TESTS_GRAMMAR_GRAMMARSUPPORT_H
#define PLOTAID_TESTS_GRAMMAR_GRAMMARSUPPORT_H

#include <string>
#include <vector>

namespace grammar_test {

// The resources/schemas folder of the source tree, ending with '/'.
std::string schemaFolder();
// Every sample chart under examples/charts, sorted.
std::vector<std::string> sampleCharts();

std::string readText(const std::string& path);
// Writes text to a new file in the test's scratch folder and returns its path.
std::string writeScratch(const std::string& name, const std::string& text);

// text with the first `from` replaced by `to`; an empty result when `from` does not occur, so a
// variant that silently stayed valid cannot pass for a broken one.
std::string replaceOnce(const std::string& text, const std::string& from, const std::string& to);

struct LintResult {
    int exitCode = -1;
    std::string output;
};
// Validates file against schema (a file name under resources/schemas) with the xmllint binary, a
// validator independent of Xerces-C. Schema URIs are mapped to the source tree through an XML
// catalog and the network is off, so imports resolve exactly as the library resolves them.
LintResult xmllint(const std::string& schema, const std::string& file);
bool haveXmllint();

// Points the library (and tools started from the test) at a resource folder that holds the
// source tree's grammars, so the resolver finds them by file name.
void useSourceGrammars();

// The data document of a small store, byte for byte as the XML data handler writes it.
std::string dataDocument(const std::string& sources);

} // namespace grammar_test

#endif
