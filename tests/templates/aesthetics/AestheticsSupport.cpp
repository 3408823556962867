#include "AestheticsSupport.h"

#include <map>

using namespace XERCES_CPP_NAMESPACE;

namespace aesthetics_test {

namespace {

std::map<std::string, std::string> attributesOf(const DOMElement* e, bool withId) {
    std::map<std::string, std::string> out;
    const DOMNamedNodeMap* map = e->getAttributes();
    for (XMLSize_t i = 0; i < map->getLength(); ++i)
        if (withId || text(map->item(i)->getNodeName()) != "id")
            out[text(map->item(i)->getNodeName())] = text(map->item(i)->getNodeValue());
    return out;
}

std::string describeStyles(const DOMElement* styleCycle) {
    std::string out = "[";
    for (const DOMElement* cycle = styleCycle->getFirstElementChild(); cycle;
         cycle = cycle->getNextElementSibling()) {
        out += "(";
        for (const DOMElement* style = cycle->getFirstElementChild(); style;
             style = style->getNextElementSibling()) {
            out += "{";
            for (const auto& [name, value] : attributesOf(style, false))
                out += name + "=" + value + ";";
            out += "}";
        }
        out += ")";
    }
    return out + "]";
}

void writeCanonical(const DOMElement* e, std::string& out, int depth) {
    const std::string name = text(e->getTagName());
    if (depth == 1 && name == "styleCycle")
        return;
    out += std::string(static_cast<std::size_t>(depth) * 2, ' ') + "<" + name;
    for (const auto& [attr, value] : attributesOf(e, true)) {
        const DOMElement* referred =
            attr == "cycle" ? e->getOwnerDocument()->getElementById(ChartString(value).xc_str()) : nullptr;
        out += " " + attr + "=" + (referred != nullptr ? describeStyles(referred) : "\"" + value + "\"");
    }
    out += ">\n";
    for (const DOMNode* n = e->getFirstChild(); n != nullptr; n = n->getNextSibling())
        if (n->getNodeType() == DOMNode::ELEMENT_NODE)
            writeCanonical(static_cast<const DOMElement*>(n), out, depth + 1);
        else if (n->getNodeType() == DOMNode::TEXT_NODE)
            out += text(n->getNodeValue());
}

const GrxStyleCycle* cycleOf(const GrxVisualization& chart, const std::string& aestheticId) {
    const CTAesthetic* aesthetic = byId<CTAesthetic>(chart, aestheticId);
    return aesthetic != nullptr ? aesthetic->getCycle() : nullptr;
}

} // namespace

std::string templateOf(const std::string& body) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
           "<template xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml "
           "http://plotaid.org/grxml/grxml-template-3.5.xsd\">" +
           body + "</template>";
}

std::string chartWith(const std::string& graphBody, const std::string& extra) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
           "<visualization xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-2.9.xsd\" "
           "id=\"visualization\">\n"
           "<style id=\"plainStyle\" color=\"#112233\"/><style id=\"otherStyle\" color2=\"#445566\"/>\n"
           "<sourceVariable id=\"var_a\" source=\"data\" sourceName=\"a\" categorical=\"1\"/>\n"
           "<sourceVariable id=\"var_b\" source=\"data\" sourceName=\"b\" categorical=\"0\"/>\n"
           "<categoricalDomain id=\"domain_a\"><variableReference variable=\"var_a\"/></categoricalDomain>\n"
           "<styleCycle id=\"chartCycle\"><cycle><style color=\"red\"/><style color=\"blue\"/></cycle>"
           "</styleCycle>\n<graph id=\"graph_1\"><coordinates id=\"coordinates_1\"><dimension "
           "id=\"dim_x\"/><dimension id=\"dim_y\"/></coordinates>\n" +
           graphBody + "</graph>\n" + extra + "<userSource id=\"data\"/>\n</visualization>\n";
}

std::string canonical(const GrxVisualization& chart) {
    std::string out;
    writeCanonical(static_cast<const GrxBaseElement&>(chart).getImplementation(), out, 0);
    return out;
}

std::string cycleIdOf(const GrxVisualization& chart, const std::string& aestheticId) {
    const GrxStyleCycle* cycle = cycleOf(chart, aestheticId);
    return cycle != nullptr ? text(cycle->getId()) : std::string();
}

std::string stylesOf(const GrxVisualization& chart, const std::string& aestheticId) {
    const GrxStyleCycle* cycle = cycleOf(chart, aestheticId);
    return cycle != nullptr ? describeStyles(cycle->getImplementation()) : std::string();
}

} // namespace aesthetics_test
