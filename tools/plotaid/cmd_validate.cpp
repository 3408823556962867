// plotaid validate FILE...: checks charts, templates and data documents against their grammars with
// the library's own parser settings.
#include "Command.h"

#include "foundation/ValidatingParser.h"

#include <xercesc/dom/DOMAttr.hpp>
#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMElement.hpp>
#include <xercesc/dom/DOMNamedNodeMap.hpp>
#include <xercesc/util/TransService.hpp>

#include <cstdio>
#include <sstream>
#include <string>
#include <unordered_set>
#include <vector>

namespace plotaid::tool {
namespace {

using namespace XERCES_CPP_NAMESPACE;

constexpr const char* kName = "validate";
constexpr const char* kChartNamespace = "http://plotaid.org/grxml";
constexpr const char* kDataNamespace = "http://plotaid.org/grxml/data";
constexpr const char* kTreeViewNamespace = "http://plotaid.org/treeview/1.0";
constexpr const char* kPmmlNamespace = "http://www.dmg.org/PMML-2_1";
constexpr const char* kSchemaInstance = "http://www.w3.org/2001/XMLSchema-instance";

// What a document is, told by its root element and namespace, and the grammars it may name.
struct Kind {
    const char* root;
    const char* ns;
    const char* what;
    const char* article;
    std::vector<std::string> schemas;
};

const std::vector<Kind>& kinds() {
    static const std::vector<Kind> all = {
        {"visualization", kChartNamespace, "chart", "a", {"grxml-2.9.xsd"}},
        {"graph", kChartNamespace, "older chart", "an", {"grxml-1.4.xsd"}},
        {"template", kChartNamespace, "template", "a", {"grxml-template-3.5.xsd", "grxml-template-1.0.xsd"}},
        {"graphSources", kDataNamespace, "data document", "a", {"grxml-data-2.1.xsd"}},
        {"displaySettings", kTreeViewNamespace, "tree display settings document", "a", {"treeview-1.0.xsd"}},
        {"PMML", kPmmlNamespace, "tree model", "a", {"pmml-2-1.xsd"}},
    };
    return all;
}

std::string utf8(const XMLCh* text) {
    if (text == nullptr)
        return std::string();
    TranscodeToStr converted(text, "UTF-8");
    return std::string(reinterpret_cast<const char*>(converted.str()), converted.length());
}

// The file name of the schema that schemaLocation ("ns location ns location ...") gives for ns.
std::string schemaFileFor(const std::string& schemaLocation, const std::string& ns) {
    std::istringstream pairs(schemaLocation);
    std::string name, location;
    while (pairs >> name >> location) {
        if (name == ns)
            return location.substr(location.find_last_of('/') + 1);
    }
    return std::string();
}

// Empty when the validated document is of a known kind and names that kind's grammar.
std::string checkKind(const DOMDocument& document, std::string& what) {
    const DOMElement* root = document.getDocumentElement();
    if (root == nullptr)
        return "no root element";
    const std::string local = utf8(root->getLocalName());
    const std::string ns = utf8(root->getNamespaceURI());
    for (const Kind& kind : kinds()) {
        if (local != kind.root || ns != kind.ns)
            continue;
        XMLCh attribute[] = {u's', u'c', u'h', u'e', u'm', u'a', u'L', u'o',
                             u'c', u'a', u't', u'i', u'o', u'n', 0};
        TranscodeFromStr instance(reinterpret_cast<const XMLByte*>(kSchemaInstance),
                                  std::char_traits<char>::length(kSchemaInstance), "UTF-8");
        const std::string file =
            schemaFileFor(utf8(root->getAttributeNS(instance.str(), attribute)), kind.ns);
        for (const std::string& schema : kind.schemas) {
            if (file == schema) {
                what = std::string(kind.what) + ", " + schema;
                return std::string();
            }
        }
        return std::string(kind.article) + " " + kind.what + " must name its grammar " +
               kind.schemas.front() +
               (file.empty() ? std::string(" (it names none)") : " (it names " + file + ")");
    }
    return "root element '" + local + "' in namespace '" + ns +
           "' is not a chart, template, data document, tree display settings or tree model";
}

// The library's parser lets a repeated id pass (Xerces-C reports it as a wrong data-type value);
// the later element then answers getElementById. A validator says so. Iterative: depth is the
// document's to choose.
std::vector<std::string> repeatedIds(const DOMDocument& document) {
    std::vector<std::string> repeated;
    std::unordered_set<std::string> seen;
    const DOMNode* root = document.getDocumentElement();
    for (const DOMNode* node = root; node != nullptr;) {
        if (node->getNodeType() == DOMNode::ELEMENT_NODE) {
            const DOMNamedNodeMap* attributes = node->getAttributes();
            for (XMLSize_t i = 0; attributes != nullptr && i < attributes->getLength(); ++i) {
                const auto* attribute = static_cast<const DOMAttr*>(attributes->item(i));
                if (!attribute->isId())
                    continue;
                const std::string id = utf8(attribute->getValue());
                if (!seen.insert(id).second)
                    repeated.push_back(id);
            }
        }
        if (const DOMNode* child = node->getFirstChild()) {
            node = child;
            continue;
        }
        while (node != nullptr && node != root && node->getNextSibling() == nullptr)
            node = node->getParentNode();
        node = (node == nullptr || node == root) ? nullptr : node->getNextSibling();
    }
    return repeated;
}

// Drops the "systemId:" that the parser puts before each message, since FILE leads the line.
std::string withoutSource(const std::string& error, const std::string& file) {
    if (error.compare(0, file.size() + 1, file + ":") == 0)
        return error.substr(file.size() + 1);
    return error;
}

bool validateOne(detail::ValidatingParser& parser, const std::string& file) {
    std::string text, error;
    if (!readFile(file, text, error)) {
        std::printf("%s: %s\n", file.c_str(), error.c_str());
        return false;
    }
    const DOMDocument* document = parser.parse(
        text, file.c_str(), ChartException("validation failed: " + file, "tools/plotaid/cmd_validate", 0));
    if (document == nullptr) {
        const std::vector<std::string>& errors = parser.lastErrors();
        if (errors.empty())
            std::printf("%s: not valid\n", file.c_str());
        for (const std::string& e : errors)
            std::printf("%s: %s\n", file.c_str(), withoutSource(e, file).c_str());
        return false;
    }
    std::string what;
    const std::string wrongKind = checkKind(*document, what);
    if (!wrongKind.empty()) {
        std::printf("%s: %s\n", file.c_str(), wrongKind.c_str());
        return false;
    }
    const std::vector<std::string> repeated = repeatedIds(*document);
    for (const std::string& id : repeated)
        std::printf("%s: id '%s' is used more than once\n", file.c_str(), id.c_str());
    if (!repeated.empty())
        return false;
    std::printf("%s: valid (%s)\n", file.c_str(), what.c_str());
    return true;
}

int run(const Args& args) {
    if (wantsHelp(args)) {
        std::printf(
            "usage: plotaid validate FILE...\n\n"
            "Validates each chart, template, data document, tree display settings document or\n"
            "PMML tree model against its grammar, with the library's parser settings: schemas\n"
            "are read from the resource folder\n"
            "(PLOTAID_RESOURCE_DIR overrides it), and values of a wrong data type pass, as they\n"
            "do when the library reads a document. The kind of document is told by its root\n"
            "element and namespace:\n"
            "  visualization (http://plotaid.org/grxml)      chart, grxml-2.9.xsd\n"
            "  graph (http://plotaid.org/grxml)              older chart or template, grxml-1.4.xsd\n"
            "  template (http://plotaid.org/grxml)           template, grxml-template-3.5.xsd or -1.0.xsd\n"
            "  graphSources (http://plotaid.org/grxml/data)  data document, grxml-data-2.1.xsd\n"
            "  displaySettings (http://plotaid.org/treeview/1.0)  tree display settings, treeview-1.0.xsd\n"
            "  PMML (http://www.dmg.org/PMML-2_1)            tree model, pmml-2-1.xsd\n\n"
            "An id used twice is reported although the library reads such a document.\n"
            "Prints one line per file, \"FILE: valid (...)\" or \"FILE: error\" for each error.\n"
            "Exit status: 0 when every file is valid, 1 when any is not, 2 on a usage error.\n");
        return kOk;
    }
    if (args.empty())
        return usageError(kName, "no file given");
    detail::ValidatingParser parser;
    bool allValid = true;
    for (const std::string& file : args) {
        if (!validateOne(parser, file))
            allValid = false;
    }
    std::fflush(stdout);
    return allValid ? kOk : kFailed;
}

const Registrar registrar({kName, "check charts, templates and data documents against their grammars", run});

} // namespace
} // namespace plotaid::tool
