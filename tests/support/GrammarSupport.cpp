#include "support/GrammarSupport.h"
#include "support/TestSupport.h"

#include "foundation/ValidatingParser.h"

#include <plotaid/ChartException.h>

#include <grx/GrxModel.h>

#include <xercesc/dom/DOM.hpp>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <stdexcept>

namespace grammar_test {
namespace fs = std::filesystem;

namespace {
// Made on first use, removed with everything in it when the test program ends.
const std::string& scratchFolder() {
    static const TempDir folder;
    static const std::string path =
        folder.path().empty() ? throw std::runtime_error("no scratch folder") : folder.path() + "/";
    return path;
}

std::string quoted(const std::string& s) {
    std::string out = "'";
    for (char c : s)
        out += c == '\'' ? std::string("'\\''") : std::string(1, c);
    return out + "'";
}

const std::string& catalog() {
    static const std::string path = [] {
        const std::string to = "file://" + schemaFolder();
        std::string text = "<?xml version=\"1.0\"?>\n"
                           "<catalog xmlns=\"urn:oasis:names:tc:entity:xmlns:xml:catalog\">\n";
        for (const char* from : {"http://plotaid.org/grxml/data/", "http://plotaid.org/grxml/"}) {
            text += "  <rewriteSystem systemIdStartString=\"" + std::string(from) + "\" rewritePrefix=\"" +
                    to + "\"/>\n";
            text +=
                "  <rewriteURI uriStartString=\"" + std::string(from) + "\" rewritePrefix=\"" + to + "\"/>\n";
        }
        text += "</catalog>\n";
        return writeScratch("catalog.xml", text);
    }();
    return path;
}
} // namespace

std::string schemaFolder() {
    return std::string(PLOTAID_SOURCE_DIR) + "/resources/schemas/";
}

std::vector<std::string> sampleCharts() {
    std::vector<std::string> charts;
    for (const auto& entry : fs::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/charts"))
        if (entry.path().extension() == ".xml")
            charts.push_back(entry.path().string());
    std::sort(charts.begin(), charts.end());
    return charts;
}

std::string readText(const std::string& path) {
    if (!std::ifstream(path))
        throw std::runtime_error("cannot read " + path);
    return readAll(path);
}

std::string writeScratch(const std::string& name, const std::string& text) {
    const std::string path = scratchFolder() + name;
    if (!(std::ofstream(path, std::ios::binary | std::ios::trunc) << text))
        throw std::runtime_error("cannot write " + path);
    return path;
}

std::string replaceOnce(const std::string& text, const std::string& from, const std::string& to) {
    const std::string::size_type at = text.find(from);
    return at == std::string::npos ? std::string() : std::string(text).replace(at, from.size(), to);
}

bool haveXmllint() {
    return std::system("xmllint --version >/dev/null 2>&1") == 0;
}

LintResult xmllint(const std::string& schema, const std::string& file) {
    return runCommand("XML_CATALOG_FILES=" + quoted(catalog()) + " xmllint --nonet --noout --schema " +
                      quoted(schemaFolder() + schema) + " " + quoted(file) + " 2>&1");
}

void useSourceGrammars() {
    [[maybe_unused]] static const bool done = [] {
        // The grammars both directly inside the folder and in its schemas/
        // subfolder, so the test holds whichever of the two the resolver reads.
        const std::string folder = scratchFolder() + "resources/";
        fs::create_directories(folder + "schemas");
        for (const auto& entry : fs::directory_iterator(schemaFolder())) {
            if (entry.path().extension() != ".xsd")
                continue;
            for (const std::string& to : {folder, folder + "schemas/"})
                fs::copy_file(entry.path(), to + entry.path().filename().string(),
                              fs::copy_options::overwrite_existing);
        }
        return ::setenv("PLOTAID_RESOURCE_DIR", folder.c_str(), 1) == 0;
    }();
}

std::string dataDocument(const std::string& sources) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"no\"?> \n"
           "<gs:graphSources xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"\n"
           "xmlns:gs=\"http://plotaid.org/grxml/data\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml/data "
           "http://plotaid.org/grxml/data/grxml-data-2.1.xsd\">\n" +
           sources + "</gs:graphSources>\n";
}

std::string duplicateIds(const XERCES_CPP_NAMESPACE::DOMDocument* document) {
    using namespace XERCES_CPP_NAMESPACE;
    std::map<std::string, int> counts;
    const DOMNodeList* all = document->getElementsByTagName(u"*");
    for (XMLSize_t i = 0; i < all->getLength(); ++i)
        if (const auto* e = static_cast<const DOMElement*>(all->item(i)); e->getAttributeNode(u"id"))
            ++counts[ChartString(e->getAttribute(u"id")).toUTF8()];
    std::string out;
    for (const auto& [id, count] : counts)
        if (count > 1)
            out += id + " (" + std::to_string(count) + ") ";
    return out.empty() ? out : "repeated ids: " + out;
}

std::string chartFaults(const std::string& chart) {
    plotaid::detail::ValidatingParser parser;
    if (parser.parse(chart, "chart", ChartException("chart under test", "grammar_test", 0)) == nullptr) {
        std::string out = "Xerces rejects the chart: ";
        for (const std::string& e : parser.lastErrors())
            out += e + "; ";
        return out;
    }
    return lintFaults("grxml-2.9.xsd", chart);
}

std::string lintFaults(const std::string& schema, const std::string& text) {
    if (!haveXmllint())
        return std::string();
    static unsigned counter = 0;
    const std::string file = writeScratch("lint-" + std::to_string(++counter) + ".xml", text);
    const LintResult result = xmllint(schema, file);
    std::remove(file.c_str());
    return result.exitCode == 0 ? std::string() : "xmllint rejects the text: " + result.output;
}

std::string chartFaults(const GrxVisualization& chart) {
    const GrxBaseElement& root = chart;
    const std::string repeated = duplicateIds(root.getImplementation()->getOwnerDocument());
    return repeated.empty() ? chartFaults(chart.AsUTF8()) : repeated;
}

} // namespace grammar_test
