#ifndef PLOTAID_TESTS_TEMPLATES_TEMPLATESUPPORT_H
#define PLOTAID_TESTS_TEMPLATES_TEMPLATESUPPORT_H

// What the template tests share: charts and templates made from text, one instruction carried out
// by its action, and the chart read back as text.

#include "support/EngineSupport.h"
#include "support/GrammarSupport.h"
#include "support/TestSupport.h"

#include "foundation/ValidatingParser.h"
#include "templates/InstructionWalk.h"
#include "templates/actions/aesthetics.h"
#include "templates/actions/style.h"

#include <plotaid/BaseTemplate.h>
#include <plotaid/ChartTemplate.h>

#include <grx/GrxModel.h>

#include <xercesc/dom/DOM.hpp>

#include <map>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace template_test {

using engine_test::Chart;
using engine_test::example;
using grammar_test::replaceOnce;
using plotaid::detail::InstructionOutcome;
using plotaid::detail::WalkReport;
using XERCES_CPP_NAMESPACE::DOMElement;

inline std::string u8(const XMLCh* s) {
    return ChartString(s).toUTF8();
}
// The attribute's text; "-" when absent, "<none>" without an element.
inline std::string attr(const DOMElement* e, const std::string& name) {
    const ChartString n(name);
    return !e ? "<none>" : e->hasAttribute(n.xc_str()) ? u8(e->getAttribute(n.xc_str())) : "-";
}
inline std::string attr(const GrxBaseElement* e, const std::string& name) {
    return attr(e ? e->getImplementation() : nullptr, name);
}
inline const DOMElement* root(const GrxVisualization& chart) {
    return static_cast<const GrxBaseElement&>(chart).getImplementation();
}
template <class T = GrxBaseElement> T* byId(const GrxVisualization& chart, const std::string& id) {
    return GrxBaseElement::wrapperOf<T>(chart.getElementById(ChartString(id)));
}

// Every attribute of the element, sorted by name.
inline std::map<std::string, std::string> attributeMap(const DOMElement* e) {
    std::map<std::string, std::string> sorted;
    for (XMLSize_t i = 0; i < e->getAttributes()->getLength(); ++i)
        sorted[u8(e->getAttributes()->item(i)->getNodeName())] =
            u8(e->getAttributes()->item(i)->getNodeValue());
    return sorted;
}
// "name=value;" for each attribute but the id.
inline std::string attributesOf(const DOMElement* e) {
    std::string out;
    for (const auto& [name, value] : attributeMap(e))
        out += name == "id" ? "" : name + "=" + value + ";";
    return out;
}
// A style cycle's styles as "[({name=value;...}...)...]", without ids.
inline std::string describeStyles(const DOMElement* styleCycle) {
    std::string out = "[";
    for (const DOMElement* c = styleCycle->getFirstElementChild(); c; c = c->getNextElementSibling()) {
        out += "(";
        for (const DOMElement* s = c->getFirstElementChild(); s; s = s->getNextElementSibling())
            out += "{" + attributesOf(s) + "}";
        out += ")";
    }
    return out + "]";
}
inline void writeCanonical(const DOMElement* e, std::string& out, std::size_t depth) {
    const std::string name = u8(e->getTagName());
    if (depth == 1 && name == "styleCycle")
        return;
    out += std::string(depth * 2, ' ') + "<" + name;
    for (const auto& [a, value] : attributeMap(e)) {
        const DOMElement* cycle =
            a == "cycle" ? e->getOwnerDocument()->getElementById(ChartString(value).xc_str()) : nullptr;
        out += " " + a + "=" + (cycle ? describeStyles(cycle) : "\"" + value + "\"");
    }
    out += ">\n";
    for (const XERCES_CPP_NAMESPACE::DOMNode* n = e->getFirstChild(); n; n = n->getNextSibling())
        if (n->getNodeType() == XERCES_CPP_NAMESPACE::DOMNode::ELEMENT_NODE)
            writeCanonical(static_cast<const DOMElement*>(n), out, depth + 1);
        else if (n->getNodeType() == XERCES_CPP_NAMESPACE::DOMNode::TEXT_NODE)
            out += u8(n->getNodeValue());
}
// The chart with each `cycle` reference replaced by that cycle's styles and the style cycles
// themselves left out: charts that differ only in cycle ids read the same.
inline std::string canonical(const GrxVisualization& chart) {
    std::string out;
    writeCanonical(root(chart), out, 0);
    return out;
}

// The style cycle the aesthetic of that id uses: its id, and its styles described; empty when none.
inline const GrxStyleCycle* cycleOf(const GrxVisualization& chart, const std::string& id) {
    const CTAesthetic* aesthetic = byId<CTAesthetic>(chart, id);
    return aesthetic ? aesthetic->getCycle() : nullptr;
}
inline std::string cycleIdOf(const GrxVisualization& chart, const std::string& id) {
    return cycleOf(chart, id) ? u8(cycleOf(chart, id)->getId()) : std::string();
}
inline std::string stylesOf(const GrxVisualization& chart, const std::string& id) {
    return cycleOf(chart, id) ? describeStyles(cycleOf(chart, id)->getImplementation()) : std::string();
}

// The node a path names: an id, then "/tag" steps each to the first child of that tag ("/tag#2" to
// the second) and "/@attribute" steps to the element the attribute names; null when a step finds
// nothing.
inline const DOMElement* node(const GrxVisualization& chart, const std::string& path) {
    std::istringstream steps(path);
    std::string step;
    std::getline(steps, step, '/');
    const DOMElement* e = chart.getElementById(ChartString(step));
    while (e != nullptr && std::getline(steps, step, '/')) {
        if (step[0] == '@') {
            e = e->getOwnerDocument()->getElementById(e->getAttribute(ChartString(step.substr(1)).xc_str()));
            continue;
        }
        const std::size_t hash = step.find('#');
        int n = hash == std::string::npos ? 1 : std::stoi(step.substr(hash + 1));
        const DOMElement* c = e->getFirstElementChild();
        while (c != nullptr && (u8(c->getLocalName()) != step.substr(0, hash) || --n > 0))
            c = c->getNextElementSibling();
        e = c;
    }
    return e;
}
// "path.attribute": the attribute's text ("-" when absent); a bare path: every attribute but the id,
// "name=value;" each; "path/tag*": every child of that tag, "{name=value;...}" each; "<none>" without
// the node.
inline std::string at(const GrxVisualization& chart, const std::string& path) {
    const std::size_t slash = path.rfind('/'), dot = path.find('.', slash == std::string::npos ? 0 : slash);
    if (path.back() == '*') {
        std::string out;
        const DOMElement* parent = node(chart, path.substr(0, slash));
        for (const DOMElement* c = parent ? parent->getFirstElementChild() : nullptr; c;
             c = c->getNextElementSibling())
            if (u8(c->getLocalName()) == path.substr(slash + 1, path.size() - slash - 2))
                out += "{" + attributesOf(c) + "}";
        return parent ? out : "<none>";
    }
    const DOMElement* e = node(chart, path.substr(0, dot));
    return !e ? "<none>" : dot == std::string::npos ? attributesOf(e) : attr(e, path.substr(dot + 1));
}
// Checks each "path=value" of `expected` (see at()), '|' between them.
inline void expectAt(const GrxVisualization& chart, const std::string& expected) {
    std::istringstream in(expected);
    for (std::string item; std::getline(in, item, '|');)
        EXPECT_EQ(at(chart, item.substr(0, item.find('='))), item.substr(item.find('=') + 1)) << item;
}
// The word the tool prints for an outcome.
inline std::string label(const InstructionOutcome& o) {
    return o.kind == InstructionOutcome::Applied  ? "applied"
           : o.kind == InstructionOutcome::Failed ? "failed"
                                                  : "unsupported";
}

// A template body walked on a fresh sample: the outcomes' words, and what the chart then holds
// ("path=value|...", see at(); "unchanged" for a chart the walk left as it was).
struct Walked {
    const char* chart;
    std::string body;
    const char* outcomes;
    std::string expected;
};

// The base as an action that does nothing, to reach its shared operations.
class Probe : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override { return false; }
};

inline std::string templateOf(const std::string& body) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<template xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" xsi:schemaLocation=\"http://plotaid.org/"
           "grxml http://plotaid.org/grxml/grxml-template-3.5.xsd\">" +
           body + "</template>";
}
inline std::string chartOf(const std::string& body) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<visualization xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" xsi:schemaLocation=\"http://plotaid.org/"
           "grxml http://plotaid.org/grxml/grxml-2.9.xsd\" id=\"visualization\">" +
           body + "</visualization>";
}

// Keeps Xerces up, and every chart and template the test parses; a chart that does not parse
// fails the test.
class TemplateTest : public engine_test::EngineTest {
protected:
    GrxVisualization& parse(const std::string& text) {
        charts_.push_back(Chart::parse(text));
        if (!charts_.back().vis)
            throw std::runtime_error("the chart does not parse");
        return *charts_.back().vis;
    }
    GrxVisualization& sample(const std::string& name) { return parse(example("charts/" + name)); }
    GrxVisualization& empty() {
        charts_.push_back(Chart::empty());
        return *charts_.back().vis;
    }
    // The template around `body`, parsed; its root element.
    const DOMElement* templateRoot(const std::string& body) {
        if (parser_.parse(templateOf(body), "template", ChartException("test template", "test", 0)) ==
            nullptr)
            throw std::runtime_error("the template does not parse: " + body);
        templates_.push_back(parser_.adoptDocument());
        return templates_.back()->getDocumentElement();
    }
    const DOMElement* instruction(const std::string& body) {
        return templateRoot(body)->getFirstElementChild();
    }
    // The outcomes' words of `body` walked on the chart, a space after each.
    std::string walk(GrxVisualization& chart, const std::string& body) {
        WalkReport report;
        plotaid::detail::applyTemplateCommands(nullptr, chart, templateRoot(body));
        std::string words;
        for (const InstructionOutcome& o : report.outcomes())
            words += label(o) + " ";
        return words;
    }
    // The first instruction of `body` through the walk; whether it reported itself applied.
    bool applyOnce(const std::string& body, GrxVisualization& chart) {
        return walk(chart, body) == "applied ";
    }
    void expectWalks(const std::vector<Walked>& rows) {
        for (const Walked& row : rows) {
            SCOPED_TRACE(std::string(row.chart) + ": " + row.body);
            GrxVisualization& chart = sample(row.chart);
            const std::string before = canonical(chart);
            EXPECT_EQ(walk(chart, row.body), row.outcomes);
            if (row.expected == "unchanged")
                EXPECT_EQ(canonical(chart), before);
            else
                expectAt(chart, row.expected);
            EXPECT_EQ(grammar_test::chartFaults(chart), "");
        }
    }
    // Each instruction through the walk changes a fresh sample into a sound chart, and applied
    // twice to another leaves the same chart as once.
    void expectTwiceIsOnce(const std::vector<std::pair<const char*, const char*>>& cases) {
        for (const auto& [name, body] : cases) {
            SCOPED_TRACE(body);
            GrxVisualization& once = sample(name);
            GrxVisualization& twice = sample(name);
            const std::string original = canonical(once);
            applyOnce(body, once);
            applyOnce(body, twice);
            applyOnce(body, twice);
            EXPECT_NE(canonical(once), original);
            EXPECT_EQ(canonical(twice), canonical(once));
            EXPECT_EQ(grammar_test::chartFaults(once), "");
        }
    }
    // The action T of the first instruction of `body`, applied once.
    template <class T>
    bool act(const std::string& body, GrxVisualization& target, const GrxVisualization* source = nullptr) {
        return T(source, target, instruction(body)).apply();
    }

private:
    std::vector<Chart> charts_;
    plotaid::detail::ValidatingParser parser_;
    std::vector<plotaid::detail::OwnedDocument> templates_;
};

} // namespace template_test

#endif
