#ifndef PLOTAID_TESTS_DESIGNER_DESIGNERSUPPORT_H
#define PLOTAID_TESTS_DESIGNER_DESIGNERSUPPORT_H

// What the checks of the example templates share: the sample charts and templates, a template
// applied in-process, and the chart's DOM read by id and name.

#include "support/EngineSupport.h"
#include "support/TestSupport.h"

#include "foundation/ValidatingParser.h"

#include <plotaid/ChartTemplate.h>

#include <grx/ChartString.h>

#include <xercesc/dom/DOM.hpp>

#include <algorithm>
#include <filesystem>
#include <map>
#include <set>
#include <string>
#include <vector>

namespace designer_test {

using XERCES_CPP_NAMESPACE::DOMElement;
using XERCES_CPP_NAMESPACE::DOMNode;

// The templates this suite is about; every template under examples/templates is validated too.
inline const std::vector<std::string>& designerTemplates() {
    static const std::vector<std::string> names{"corporate.sgt", "monochrome.sgt", "presentation.sgt"};
    return names;
}

// File names (not paths) under examples/<folder> ending with `extension`, sorted.
inline std::vector<std::string> exampleFiles(const std::string& folder, const std::string& extension) {
    std::vector<std::string> names;
    for (const auto& entry :
         std::filesystem::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/" + folder))
        if (entry.path().extension() == extension)
            names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
}

inline std::string examplePath(const std::string& relative) {
    return std::string(PLOTAID_EXAMPLES_DIR) + "/" + relative;
}

// The tags of an example template's instructions, in order; empty when it does not parse.
inline std::vector<std::string> instructionsOf(const std::string& name) {
    plotaid::detail::ValidatingParser parser;
    const auto* doc = parser.parse(engine_test::example("templates/" + name), name.c_str(),
                                   ChartException("example template", "designer_test", 0));
    std::vector<std::string> tags;
    for (const auto* i = doc ? doc->getDocumentElement()->getFirstElementChild() : nullptr; i != nullptr;
         i = i->getNextElementSibling())
        tags.push_back(ChartString(i->getLocalName()).toUTF8());
    return tags;
}

// A sample chart with the named example templates applied in order, in-process and without a
// source visualization, as the tool applies them. Null `vis` when the chart does not parse.
inline engine_test::Chart applied(const std::string& chart, const std::vector<std::string>& templates) {
    engine_test::Chart c = engine_test::Chart::parse(engine_test::example("charts/" + chart));
    if (!c.vis)
        return c;
    for (const std::string& name : templates) {
        ChartTemplate t(*c.vis, nullptr);
        if (!t.setTemplate(engine_test::example("templates/" + name))) {
            ADD_FAILURE() << name << " does not parse";
            continue;
        }
        t.applyTemplate();
    }
    return c;
}

inline std::string text(const XMLCh* s) {
    return ChartString(s).toUTF8();
}

// The element of the chart with that id, or null.
inline DOMElement* byId(const engine_test::Chart& c, const std::string& id) {
    return c.document()->getElementById(ChartString(id).xc_str());
}

// The attribute's value ("" when absent); the element must exist.
inline std::string attr(const DOMElement* e, const std::string& name) {
    return e == nullptr ? std::string("<no element>") : text(e->getAttribute(ChartString(name).xc_str()));
}

inline std::string attrOf(const engine_test::Chart& c, const std::string& id, const std::string& name) {
    return attr(byId(c, id), name);
}

// Every element of that local name, in document order.
inline std::vector<DOMElement*> elementsNamed(const DOMNode* below, const std::string& name) {
    std::vector<DOMElement*> out;
    const auto* scope =
        below->getNodeType() == DOMNode::DOCUMENT_NODE
            ? static_cast<const XERCES_CPP_NAMESPACE::DOMDocument*>(below)->getDocumentElement()
            : static_cast<const DOMElement*>(below);
    XERCES_CPP_NAMESPACE::DOMNodeList* list = scope->getElementsByTagNameNS(u"*", ChartString(name).xc_str());
    for (XMLSize_t i = 0; i < list->getLength(); ++i)
        out.push_back(static_cast<DOMElement*>(list->item(i)));
    return out;
}

inline std::vector<DOMElement*> childrenNamed(const DOMElement* parent, const std::string& name) {
    std::vector<DOMElement*> out;
    for (DOMElement* c = parent->getFirstElementChild(); c != nullptr; c = c->getNextElementSibling())
        if (text(c->getLocalName()) == name)
            out.push_back(c);
    return out;
}

// The styles of the style cycle an aesthetic refers to, in order; empty when it refers to none.
inline std::vector<DOMElement*> cycleStyles(const engine_test::Chart& c, const DOMElement* aesthetic) {
    const DOMElement* cycle = byId(c, attr(aesthetic, "cycle"));
    if (cycle == nullptr || text(cycle->getLocalName()) != "styleCycle")
        return {};
    return elementsNamed(cycle, "style");
}

// What the chart's styles say, keyed so that two applications can be compared: a style by its id,
// a style inside a style cycle by what refers to that cycle (element, id and attribute of each
// referrer) and its position there. Style cycles nothing refers to any more are left out, as are
// ids themselves. The value is the style's other attributes, sorted.
inline std::map<std::string, std::string> stylePicture(const engine_test::Chart& c) {
    // Who refers to each id, by any attribute but the id itself.
    std::map<std::string, std::set<std::string>> referrers;
    for (DOMElement* e : elementsNamed(c.document(), "*")) {
        const auto* attrs = e->getAttributes();
        for (XMLSize_t i = 0; i < attrs->getLength(); ++i) {
            const std::string name = text(attrs->item(i)->getNodeName());
            if (name != "id")
                referrers[text(attrs->item(i)->getNodeValue())].insert(text(e->getLocalName()) + "#" +
                                                                       attr(e, "id") + "." + name);
        }
    }
    const auto describe = [](const DOMElement* style) {
        std::vector<std::string> parts;
        const auto* attrs = style->getAttributes();
        for (XMLSize_t i = 0; i < attrs->getLength(); ++i) {
            const std::string name = text(attrs->item(i)->getNodeName());
            if (name != "id")
                parts.push_back(name + "=" + text(attrs->item(i)->getNodeValue()));
        }
        std::sort(parts.begin(), parts.end());
        std::string out;
        for (const std::string& p : parts)
            out += p + " ";
        return out;
    };

    std::map<std::string, std::string> picture;
    for (DOMElement* styleCycle : elementsNamed(c.document(), "styleCycle")) {
        const auto found = referrers.find(attr(styleCycle, "id"));
        if (found == referrers.end())
            continue; // orphaned by a replacement
        std::string key = "cycle of";
        for (const std::string& r : found->second)
            key += " " + r;
        const std::vector<DOMElement*> styles = elementsNamed(styleCycle, "style");
        for (std::size_t i = 0; i < styles.size(); ++i)
            picture[key + " [" + std::to_string(i) + "]"] = describe(styles[i]);
    }
    for (DOMElement* style : elementsNamed(c.document(), "style")) {
        bool inCycle = false;
        for (const DOMNode* p = style->getParentNode(); p != nullptr && !inCycle; p = p->getParentNode())
            inCycle = p->getNodeType() == DOMNode::ELEMENT_NODE && text(p->getLocalName()) == "styleCycle";
        if (!inCycle)
            picture["style " + attr(style, "id")] = describe(style);
    }
    return picture;
}

} // namespace designer_test

#endif
