#ifndef PLOTAID_TESTS_SETSTYLE_STYLESUPPORT_H
#define PLOTAID_TESTS_SETSTYLE_STYLESUPPORT_H

#include "support/EngineSupport.h"

#include "templates/actions/style.h"

#include <xercesc/dom/DOM.hpp>

#include <map>
#include <memory>
#include <string>

namespace setstyle_test {

using engine_test::Chart;

inline std::string templateOf(const std::string& body) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
           "<template xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml "
           "http://plotaid.org/grxml/grxml-template-3.5.xsd\">" +
           body + "</template>";
}

// A small chart of the test's own making around `body`.
inline std::string chartOf(const std::string& body) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
           "<visualization xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-2.9.xsd\" "
           "id=\"visualization\">" +
           body + "</visualization>";
}

// `text` with every `from` replaced by `to`; empty when `from` does not occur, so a fixture that
// silently stayed as it was cannot pass for the changed one.
inline std::string replaced(std::string text, const std::string& from, const std::string& to) {
    std::string::size_type at = text.find(from);
    if (at == std::string::npos)
        return std::string();
    for (; at != std::string::npos; at = text.find(from, at + to.size()))
        text.replace(at, from.size(), to);
    return text;
}

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
    // The n-th instruction (from 0).
    XERCES_CPP_NAMESPACE::DOMElement* instruction(unsigned n) const {
        for (XERCES_CPP_NAMESPACE::DOMElement* e = root() ? root()->getFirstElementChild() : nullptr; e;
             e = e->getNextElementSibling())
            if (n-- == 0)
                return e;
        return nullptr;
    }
};

// Every style of the chart, by id, with its attributes as one text.
inline std::map<std::string, std::string> styleSnapshot(const Chart& chart) {
    std::map<std::string, std::string> out;
    XERCES_CPP_NAMESPACE::DOMNodeList* nodes = chart.document()->getElementsByTagName(u"style");
    for (XMLSize_t i = 0; i < nodes->getLength(); ++i) {
        auto* e = static_cast<XERCES_CPP_NAMESPACE::DOMElement*>(nodes->item(i));
        std::string attributes;
        XERCES_CPP_NAMESPACE::DOMNamedNodeMap* map = e->getAttributes();
        for (XMLSize_t a = 0; a < map->getLength(); ++a)
            attributes += utf8(map->item(a)->getNodeName()) + "=" + utf8(map->item(a)->getNodeValue()) + ";";
        out[utf8(e->getAttribute(u"id"))] += attributes;
    }
    return out;
}

// Ids whose styles differ between two snapshots (added, removed or changed).
inline std::vector<std::string> changedStyles(const std::map<std::string, std::string>& before,
                                              const std::map<std::string, std::string>& after) {
    std::vector<std::string> changed;
    for (const auto& [id, text] : after) {
        const auto old = before.find(id);
        if (old == before.end() || old->second != text)
            changed.push_back(id);
    }
    for (const auto& [id, text] : before)
        if (after.find(id) == after.end())
            changed.push_back(id);
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
        XERCES_CPP_NAMESPACE::DOMElement* instruction = template_.instruction(0);
        EXPECT_NE(instruction, nullptr) << "the template does not parse: " << body;
        if (instruction == nullptr || !chart.vis)
            return false;
        plotaid::detail::TStyle action(source, *chart.vis, instruction);
        return action.apply();
    }

    static GrxBaseElement* byId(const Chart& chart, const char* id) {
        return GrxBaseElement::wrapperOf(chart.vis->getElementById(ChartString(id)));
    }
    static GrxStyle* styleById(const Chart& chart, const char* id) {
        return chart.vis->getStyleById(ChartString(id));
    }
    // The style an element (any kind with a "style" reference) refers to.
    static GrxStyle* styleOfElement(const Chart& chart, const char* id) {
        GrxBaseElement* e = byId(chart, id);
        return e ? e->ref<GrxStyle>(u"style") : nullptr;
    }

    Template template_;
};

} // namespace setstyle_test

#endif
