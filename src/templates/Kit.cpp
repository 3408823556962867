#include "templates/Kit.h"

#include "transform/ElementWalk.h"

#include <grx/ChartPrinter.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLString.hpp>

#include <sstream>
#include <utility>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

const XMLCh* localNameOf(const DOMNode* node) {
    const XMLCh* local = node->getLocalName();
    return local != nullptr ? local : node->getNodeName();
}

void collectGraphs(const DOMElement* parent, std::vector<GrrUviza*>& graphs) {
    for (const DOMElement* child = parent->getFirstElementChild(); child;
         child = child->getNextElementSibling()) {
        const XMLCh* name = localNameOf(child);
        if (XMLString::equals(name, GrxUni::_graph)) {
            if (auto* graph = GrxBaseElement::wrapperOf<GrrUviza>(child))
                graphs.push_back(graph);
        } else if (XMLString::equals(name, GrxUni::_container)) {
            collectGraphs(child, graphs);
        }
    }
}

template <class Base, class T> void appendAll(std::vector<Base*>& out, const std::vector<T*>& in) {
    out.insert(out.end(), in.begin(), in.end());
}

} // namespace

std::vector<GrrUviza*> allGraphs(const GrxVisualization& target) {
    std::vector<GrrUviza*> graphs;
    const GrxBaseElement& root = target;
    collectGraphs(root.getImplementation(), graphs);
    return graphs;
}

std::vector<GrrUviza*> selectedGraphs(const std::vector<GrrUviza*>& graphs, const DOMElement* instruction) {
    const std::uint32_t wanted = unsignedAttribute(instruction, GrxUni::_graph);
    if (wanted == 0)
        return graphs;
    if (wanted > graphs.size())
        return {};
    return {graphs[wanted - 1]};
}

std::vector<CTElementType*> elementsOf(const GrrUviza& graph) {
    std::vector<CTElementType*> elements;
    appendAll(elements, graph.getPoints());
    appendAll(elements, graph.getLines());
    appendAll(elements, graph.getEdges());
    appendAll(elements, graph.getPaths());
    appendAll(elements, graph.getIntervals());
    appendAll(elements, graph.getAreas());
    appendAll(elements, graph.getPolygons());
    appendAll(elements, graph.getSchemas());
    return elements;
}

std::vector<CTAesthetic*> aestheticsOf(const CTElementType& element, AestheticList list) {
    std::vector<CTAesthetic*> out;
    appendAll(out, element.getStyleBys());
    appendAll(out, element.getDashs());
    appendAll(out, element.getShapes());
    appendAll(out, element.getSizes());
    appendAll(out, element.getRotations());
    appendAll(out, element.getColors());
    appendAll(out, element.getOffsets());
    appendAll(out, element.getPatterns());
    appendAll(out, element.getTransparencys());
    if (list == AestheticList::LegendDomains)
        appendAll(out, element.getLabelings());
    appendAll(out, element.getSplits());
    appendAll(out, element.getColorComponents());
    if (list == AestheticList::Selectable)
        appendAll(out, element.getVisibilitys());
    return out;
}

std::vector<DOMNode*> nodesNamed(const GrxVisualization& target, const XMLCh* name) {
    std::vector<DOMNode*> found;
    if (!hasText(name))
        return found;
    const GrxBaseElement& root = target;
    const DOMNodeList* nodes = root.getImplementation()->getElementsByTagName(name);
    const XMLSize_t count = nodes->getLength();
    found.reserve(count);
    for (XMLSize_t i = 0; i < count; ++i)
        found.push_back(nodes->item(i));
    return found;
}

GrxStyle* styleWithId(const GrxVisualization& target, const XMLCh* id) {
    // An explicit stack: nesting comes from the chart document and can be deep.
    const std::vector<GrxStyle*> top = target.getStyles();
    std::vector<GrxStyle*> pending(top.rbegin(), top.rend());
    while (!pending.empty()) {
        GrxStyle* style = pending.back();
        pending.pop_back();
        if (same(style->getId(), id))
            return style;
        const std::vector<GrxStyle*> nested = style->getStyles();
        pending.insert(pending.end(), nested.rbegin(), nested.rend());
    }
    return nullptr;
}

bool same(const XMLCh* a, const XMLCh* b) {
    return XMLString::equals(a, b);
}

ChartString attributeOf(const DOMElement* element, const XMLCh* name) {
    return element != nullptr ? ChartString(element->getAttribute(name)) : ChartString();
}

std::uint32_t unsignedAttribute(const DOMElement* element, const XMLCh* name) {
    return attributeOf(element, name).convertToInteger();
}

bool booleanAttribute(const DOMElement* element, const XMLCh* name, bool absent) {
    if (element == nullptr || !hasText(name))
        return absent;
    const XMLCh* value = element->getAttribute(name);
    if (same(value, GrxUni::_true))
        return true;
    if (same(value, GrxUni::_false))
        return false;
    return absent;
}

bool named(const DOMNode* node, const XMLCh* name) {
    return node != nullptr && node->getNodeType() == DOMNode::ELEMENT_NODE && same(localNameOf(node), name);
}

const DOMElement* firstChildNamed(const DOMElement* parent, const XMLCh* name) {
    if (parent == nullptr)
        return nullptr;
    for (const DOMElement* child = parent->getFirstElementChild(); child; child = child->getNextElementSibling())
        if (named(child, name))
            return child;
    return nullptr;
}

std::vector<const DOMElement*> descendantsNamed(const DOMElement* element, const XMLCh* name) {
    std::vector<const DOMElement*> found;
    if (element == nullptr)
        return found;
    for (const DOMElement* e = nextElement(element, element); e != nullptr; e = nextElement(element, e))
        if (named(e, name))
            found.push_back(e);
    return found;
}

const DOMElement* firstDescendantNamed(const DOMElement* element, const XMLCh* name) {
    if (element == nullptr)
        return nullptr;
    for (const DOMElement* e = nextElement(element, element); e != nullptr; e = nextElement(element, e))
        if (named(e, name))
            return e;
    return nullptr;
}

ChartString directText(const DOMElement* element) {
    std::u16string text;
    if (element == nullptr)
        return ChartString();
    for (const DOMNode* n = element->getFirstChild(); n; n = n->getNextSibling())
        if (n->getNodeType() == DOMNode::TEXT_NODE)
            text += n->getNodeValue();
    return ChartString(std::move(text));
}

const DOMElement* lastChildNamed(const DOMElement* parent, const XMLCh* name) {
    if (parent == nullptr)
        return nullptr;
    for (const DOMElement* child = parent->getLastElementChild(); child;
         child = child->getPreviousElementSibling())
        if (named(child, name))
            return child;
    return nullptr;
}

std::vector<const DOMElement*> childrenNamed(const DOMElement* parent, const XMLCh* name) {
    std::vector<const DOMElement*> found;
    if (parent == nullptr)
        return found;
    for (const DOMElement* child = parent->getFirstElementChild(); child; child = child->getNextElementSibling())
        if (named(child, name))
            found.push_back(child);
    return found;
}

CycleInstruction::CycleInstruction(const DOMElement* instruction)
    : aestheticNumber(unsignedAttribute(instruction, GrxUni::_aestheticNumber)),
      cycle(lastChildNamed(instruction, GrxUni::_cycle)) {}

namespace {
bool noElement(const CTElementType&) {
    return false;
}
} // namespace

ElementKind::ElementKind(const DOMElement* instruction) {
    static const struct {
        const XMLCh* word;
        bool (*accepts)(const CTElementType&);
    } kinds[] = {
        {GrxArea::getElementName(), &isA<GrxArea>},         {GrxEdge::getElementName(), &isA<GrxEdge>},
        {GrxInterval::getElementName(), &isA<GrxInterval>}, {GrxLabeling::getElementName(), &noElement},
        {GrxLine::getElementName(), &isA<GrxLine>},         {GrxPath::getElementName(), &isA<GrxPath>},
        {GrxPoint::getElementName(), &isA<GrxPoint>},       {GrxPolygon::getElementName(), &isA<GrxPolygon>},
        {GrxSchema::getElementName(), &isA<GrxSchema>},
    };
    const ChartString word = attributeOf(instruction, GrxUni::_elementType);
    for (const auto& kind : kinds)
        if (word.equals(kind.word)) {
            accepts_ = kind.accepts;
            labelings_ = kind.accepts == &noElement;
        }
}

const DOMElement* sourceObject(const GrxVisualization* source, const XMLCh* id) {
    if (source == nullptr || !hasText(id))
        return nullptr;
    return source->getElementById(id);
}

bool sourceSetsCycle(const GrxVisualization* source, const CTAesthetic& aesthetic) {
    const DOMElement* own = sourceObject(source, aesthetic.getId());
    return own != nullptr && hasText(own->getAttribute(GrxUni::_cycle));
}

GrxStyle& textFrameStyleOf(BaseTemplate& action, GrxLabel& label) {
    CTLabelType& owner = label;
    const bool made = owner.getTextFrameStyle() == nullptr;
    GrxStyle& frame = styleOf(action, owner, &CTLabelType::getTextFrameStyle, &CTLabelType::setTextFrameStyle, {});
    if (made) {
        frame.setColor(GrxStyle::_transparent);
        frame.setColor2(GrxStyle::_transparent);
        frame.setVisible(false);
    }
    return frame;
}

void fillCycle(BaseTemplate& action, GrxCycle& styles, const DOMElement& cycle) {
    for (const DOMElement* style : childrenNamed(&cycle, GrxUni::_style))
        action.importStyle(style, styles.addStyle());
}

void giveNewCycle(BaseTemplate& action, GrxVisualization& target, CTAesthetic& aesthetic,
                  const DOMElement& cycle) {
    GrxStyleCycle& styleCycle = target.addStyleCycle(action.CreateUniqueId(ChartString(GrxUni::_styleCycle)));
    aesthetic.setCycle(styleCycle);
    fillCycle(action, styleCycle.addCycle(), cycle);
}

void replaceCycle(BaseTemplate& action, GrxVisualization& target, CTAesthetic& aesthetic,
                  const DOMElement* cycle) {
    if (cycle == nullptr)
        return;
    aesthetic.removeCycle();
    giveNewCycle(action, target, aesthetic, *cycle);
}

bool categoryList(const DOMElement* instruction, ChartString& list) {
    const DOMElement* values = firstDescendantNamed(instruction, BaseTemplate::_categoryValue);
    if (values == nullptr)
        return false;
    list = ChartString(values->getTextContent());
    return true;
}

ChartString mappedCategories(const CTVariableType& variable, const ChartString& list, bool keepUnknown) {
    const std::vector<GrxFormat*> formats = variable.getFormats();
    ChartString joined;
    bool first = true;
    const std::u16string& text = list.str();
    std::size_t start = 0;
    while (start <= text.size()) {
        std::size_t end = text.find(u';', start);
        if (end == std::u16string::npos)
            end = text.size();
        const ChartString value(text.substr(start, end - start));
        start = end + 1;
        if (value.empty())
            continue;
        ChartString mapped;
        if (!formats.empty())
            for (const GrxRelabel* relabel : formats.front()->getRelabels())
                if (value.equals(relabel->getTo())) {
                    mapped = ChartString(relabel->getFrom());
                    break;
                }
        if (mapped.empty() && keepUnknown)
            mapped = value;
        if (mapped.empty())
            continue;
        if (!first)
            joined.append(u";");
        joined.append(mapped);
        first = false;
    }
    return joined;
}

GrxCategories& replaceCategories(GrxCategoricalDomain& domain, const ChartString& values) {
    domain.removeCategoriess();
    GrxCategories& categories = domain.addCategories();
    categories.setTextContent(values.xc_str());
    return categories;
}

std::string utf8(const XMLCh* text) {
    return ChartString(text).toUTF8();
}

std::string printed(const DOMNode* node) {
    if (node == nullptr)
        return std::string();
    try {
        std::ostringstream out;
        ChartPrinter printer;
        printer.setPrintWhiteSpace(false);
        printer.Print(node, out);
        return out.str();
    } catch (...) {
        return utf8(node->getNodeName());
    }
}

} // namespace plotaid::detail
