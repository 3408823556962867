#ifndef PLOTAID_TESTS_SETSTYLE_STYLESUPPORT_H
#define PLOTAID_TESTS_SETSTYLE_STYLESUPPORT_H

#include "support/EngineSupport.h"
#include "support/GrammarSupport.h"

#include "templates/actions/style.h"

#include <xercesc/dom/DOM.hpp>

#include <algorithm>
#include <map>
#include <memory>
#include <sstream>
#include <string>

namespace setstyle_test {

using engine_test::Chart;
using grammar_test::replaceOnce;

inline std::string templateOf(const std::string& body) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<template xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml "
           "http://plotaid.org/grxml/grxml-template-3.5.xsd\">" +
           body + "</template>";
}

// A small chart of the test's own making around `body`.
inline std::string chartOf(const std::string& body) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<visualization xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-2.9.xsd\" "
           "id=\"visualization\">" +
           body + "</visualization>";
}

// One "setStyle" instruction; `more` goes into its start tag (subtype, level).
inline std::string setStyle(const std::string& type, const std::string& declarations,
                            const std::string& more = std::string()) {
    return "<setStyle type=\"" + type + "\"" + more + ">" + declarations + "</setStyle>";
}
inline std::string sub(const std::string& subtype) {
    return " subtype=\"" + subtype + "\"";
}
const char* const kRed = "<style color=\"red\"/>";

inline std::string utf8(const XMLCh* text) {
    return ChartString(text).toUTF8();
}

inline std::string attr(const GrxBaseElement* element, const char* name) {
    return element ? utf8(element->GetAttribute(ChartString(name).xc_str())) : std::string("<none>");
}

// A parsed template the test keeps, so that the instructions stay alive while actions read them.
struct Template {
    std::unique_ptr<plotaid::detail::ValidatingParser> parser;
    XERCES_CPP_NAMESPACE::DOMDocument* document = nullptr;

    static Template parse(const std::string& text) {
        Template t;
        t.parser = std::make_unique<plotaid::detail::ValidatingParser>();
        t.document = t.parser->parse(text, "template", ChartException("test template", "setstyle_test", 0));
        return t;
    }
    XERCES_CPP_NAMESPACE::DOMElement* root() const {
        return document ? document->getDocumentElement() : nullptr;
    }
    XERCES_CPP_NAMESPACE::DOMElement* first() const {
        return root() ? root()->getFirstElementChild() : nullptr;
    }
};

// Every style of the chart, by id, with its attributes as one text.
inline std::map<std::string, std::string> styleSnapshot(const Chart& chart) {
    std::map<std::string, std::string> out;
    XERCES_CPP_NAMESPACE::DOMNodeList* nodes = chart.document()->getElementsByTagName(u"style");
    for (XMLSize_t i = 0; i < nodes->getLength(); ++i) {
        XERCES_CPP_NAMESPACE::DOMNamedNodeMap* map = nodes->item(i)->getAttributes();
        std::string& attributes =
            out[utf8(static_cast<XERCES_CPP_NAMESPACE::DOMElement*>(nodes->item(i))->getAttribute(u"id"))];
        for (XMLSize_t a = 0; a < map->getLength(); ++a)
            attributes += utf8(map->item(a)->getNodeName()) + "=" + utf8(map->item(a)->getNodeValue()) + ";";
    }
    return out;
}

// Ids whose styles differ between two snapshots (added, removed or changed), space-separated.
inline std::string changedStyles(std::map<std::string, std::string> before,
                                 const std::map<std::string, std::string>& after) {
    std::string changed;
    for (const auto& [id, text] : after)
        if (const auto old = before.find(id); old == before.end() || old->second != text)
            changed += (changed.empty() ? "" : " ") + id;
    for (const auto& [id, text] : after)
        before.erase(id);
    for (const auto& [id, text] : before)
        changed += (changed.empty() ? "" : " ") + id;
    return changed;
}

class SetStyleTest : public engine_test::EngineTest {
protected:
    Chart load(const std::string& text) {
        Chart c = Chart::parse(text);
        EXPECT_TRUE(c.vis) << "the fixture chart does not parse";
        return c;
    }
    Chart sample(const std::string& name) { return load(engine_test::example("charts/" + name)); }

    // Runs the first instruction of `body` on `chart` as one "setStyle" action.
    bool apply(Chart& chart, const std::string& body, const GrxVisualization* source = nullptr) {
        template_ = Template::parse(templateOf(body));
        XERCES_CPP_NAMESPACE::DOMElement* instruction = template_.first();
        EXPECT_NE(instruction, nullptr) << "the template does not parse: " << body;
        if (instruction == nullptr || !chart.vis)
            return false;
        return plotaid::detail::TStyle(source, *chart.vis, instruction).apply();
    }

    static GrxBaseElement* byId(const Chart& chart, const char* id) {
        return GrxBaseElement::wrapperOf(chart.vis->getElementById(ChartString(id)));
    }
    static GrxStyle* styleById(const Chart& chart, const std::string& id) {
        return chart.vis->getStyleById(ChartString(id));
    }
    // "<id> <colour>" of the style the element refers to by that attribute.
    static std::string referred(const Chart& chart, const char* element, const char* attribute) {
        const GrxStyle* style = styleById(chart, attr(byId(chart, element), attribute));
        return style ? attr(style, "id") + " " + attr(style, "color") : "<none>";
    }

    // Applies `body` to a fresh chart parsed from `chart` (a sample's file name when it ends in
    // ".xml"), then checks `expect`: "style:value" for its colour, "style.attribute:value" for
    // another attribute, "!value" for anything but that value, "^value" for a value that begins so,
    // "-" for absent. With `changed`, the styles added, removed or changed are exactly those
    // (space-separated, sorted); an empty `changed` means the whole chart stays as it was.
    Chart expectStyles(const std::string& chart, const std::string& body, const std::string& expect,
                       const char* changed = nullptr) {
        SCOPED_TRACE(chart.substr(0, 40) + " | " + body);
        const bool isSample = chart.size() < 40 && chart.find(".xml") != std::string::npos;
        Chart c = isSample ? sample(chart) : load(chart);
        if (!c.vis)
            return c;
        const auto before = styleSnapshot(c);
        const std::string text = c.vis->AsUTF8();
        EXPECT_TRUE(apply(c, body));
        std::istringstream in(expect);
        for (std::string item; in >> item;) {
            const std::string::size_type colon = item.find(':'), dot = item.find('.');
            const std::string name = dot < colon ? item.substr(dot + 1, colon - dot - 1) : "color";
            const std::string got = attr(styleById(c, item.substr(0, std::min(colon, dot))), name.c_str());
            const std::string want = item.substr(colon + 1) == "-" ? "" : item.substr(colon + 1);
            if (want.rfind('!', 0) == 0)
                EXPECT_NE(got, want.substr(1)) << item;
            else if (want.rfind('^', 0) == 0)
                EXPECT_EQ(got.substr(0, want.size() - 1), want.substr(1)) << item;
            else
                EXPECT_EQ(got, want) << item;
        }
        if (changed != nullptr) {
            EXPECT_EQ(changedStyles(before, styleSnapshot(c)), changed);
            EXPECT_TRUE(*changed != '\0' || c.vis->AsUTF8() == text) << "the chart changed";
        }
        return c;
    }

    Template template_;
};

} // namespace setstyle_test

#endif
