// Element aesthetics: new style cycles for colours, dashes, patterns, shapes and sizes; colours
// turned into dashes or images; attributes written straight onto the chart; markers over a line.
#include "templates/actions/aesthetics.h"

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLString.hpp>

#include <cstdint>
#include <initializer_list>
#include <vector>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

// Dashes, shapes and the like: guard, then a new cycle each.
template <class A>
void replaceSelectedCycles(BaseTemplate& action, GrxVisualization& target, const GrxVisualization* source,
                           const CycleInstruction& instruction, std::vector<A*> (CTElementType::*kind)() const) {
    if (instruction.cycle == nullptr)
        return;
    forEachSelectedAesthetic(target, instruction.aestheticNumber, kind,
                             [&](const std::vector<CTElementType*>&, std::size_t, A& aesthetic) {
                                 if (!sourceSetsCycle(source, aesthetic))
                                     replaceCycle(action, target, aesthetic, instruction.cycle);
                             });
}

void copyAttributeIfPresent(const GrxBaseElement& from, GrxBaseElement& to, const XMLCh* name) {
    if (from.isAttributePresent(name))
        to.SetAttribute(name, from.GetAttribute(name));
}

// A colour aesthetic becomes a dash or an image that keeps its variable, domain and id, so the
// legend entries that showed the colour show the new aesthetic.
template <class A>
void convertSelectedColors(BaseTemplate& action, GrxVisualization& target, const GrxVisualization* source,
                           const CycleInstruction& instruction, A& (CTElementType::*add)()) {
    if (instruction.cycle == nullptr)
        return;
    forEachSelectedAesthetic(
        target, instruction.aestheticNumber, &CTElementType::getColors,
        [&](const std::vector<CTElementType*>& elements, std::size_t k, GrxColor& color) {
            if (sourceSetsCycle(source, color))
                return;
            CTElementType& element = *elements[k];
            A& converted = (element.*add)();
            for (const XMLCh* name : std::initializer_list<const XMLCh*>{GrxUni::_missing, GrxUni::_dimension, GrxUni::_clamp, GrxUni::_split})
                copyAttributeIfPresent(color, converted, name);
            if (GrxDomain* domain = color.getDomain())
                converted.setDomain(*domain);
            copyAttributeIfPresent(color, converted, GrxUni::_variable);
            const ChartString id(color.getId());
            element.removeColor(color);
            if (!id.empty())
                converted.setId(id);
            giveNewCycle(action, target, converted, *instruction.cycle);
        });
}

bool isPointNode(const DOMNode* node) {
    return node != nullptr && node->getUserData(GrxUni::_point) != nullptr;
}

} // namespace

// ---- setColor -------------------------------------------------------------------------------------

namespace {

// A point's primary colour is its fill, where every other element's is its outline.
void setAffect(GrxColor& color, TSetColor::Affect affect) {
    const bool point = isPointNode(color.getImplementation()->getParentNode());
    switch (affect) {
    case TSetColor::Affect::Main:
        color.setAffect(point ? grx::Affect::secondary : grx::Affect::main);
        break;
    case TSetColor::Affect::Secondary:
        color.setAffect(point ? grx::Affect::main : grx::Affect::secondary);
        break;
    case TSetColor::Affect::Both:
        color.setAffect(grx::Affect::both);
        break;
    case TSetColor::Affect::Unchanged:
        break;
    }
}

// Elements of one tag in a graph show one series each: they continue the first one's cycle.
// With an aesthetic number only that colour of an earlier element is taken, so a second colour
// never continues the cycle of an earlier element's first one.
GrxStyleCycle* sharedCycle(const std::vector<CTElementType*>& elements, std::size_t k,
                           std::uint32_t aestheticNumber) {
    const XMLCh* tag = elements[k]->getImplementation()->getTagName();
    for (std::size_t j = 0; j < k; ++j) {
        if (!same(elements[j]->getImplementation()->getTagName(), tag))
            continue;
        const std::vector<GrxColor*> earlier = elements[j]->getColors();
        for (std::size_t p = 1; p <= earlier.size(); ++p)
            if (selects(aestheticNumber, p))
                if (GrxStyleCycle* cycle = earlier[p - 1]->getCycle())
                    return cycle;
    }
    return nullptr;
}

} // namespace

TSetColor::Affect TSetColor::readAffect() const {
    const ChartString word = attributeOf(instruction_, GrxUni::_affect);
    return word.equals(GrxUni::_main)        ? Affect::Main
           : word.equals(GrxUni::_secondary) ? Affect::Secondary
           : word.equals(GrxUni::_both)      ? Affect::Both
                                             : Affect::Unchanged;
}

bool TSetColor::apply() {
    if (cycle_.cycle == nullptr)
        return true;
    forEachSelectedAesthetic(target_, cycle_.aestheticNumber, &CTElementType::getColors,
                             [&](const std::vector<CTElementType*>& elements, std::size_t k, GrxColor& color) {
                                 if (sourceSetsCycle(source_, color))
                                     return;
                                 // Without a mode the colour keeps the affect it had; only the cycle goes.
                                 color.removeCycle();
                                 setAffect(color, affect_);
                                 if (k != 0)
                                     if (GrxStyleCycle* shared = sharedCycle(elements, k, cycle_.aestheticNumber)) {
                                         color.setCycle(*shared);
                                         return;
                                     }
                                 giveNewCycle(*this, target_, color, *cycle_.cycle);
                             });
    return true;
}

// ---- setDash, setShape ----------------------------------------------------------------------------

bool TSetDash::apply() {
    replaceSelectedCycles(*this, target_, source_, cycle_, &CTElementType::getDashs);
    return true;
}

bool TSetShape::apply() {
    replaceSelectedCycles(*this, target_, source_, cycle_, &CTElementType::getShapes);
    return true;
}

// ---- setPattern -----------------------------------------------------------------------------------

bool TSetPattern::apply() {
    forEachGraphElements(target_, [&](const std::vector<CTElementType*>& elements) {
        for (CTElementType* element : elements) {
            // A pattern is drawn over the fill: white unless the chart's own style sets a colour.
            GrxStyle* style = element->getStyle();
            ChartString sourceColor;
            if (style == nullptr) {
                style = &addStyle(*element, nullptr);
                element->setStyle(*style);
            } else if (const DOMElement* own = sourceObject(source_, style->getId())) {
                sourceColor = own->getAttribute(GrxUni::_color);
            }
            const std::vector<GrxPattern*> patterns = element->getPatterns();
            for (std::size_t p = 1; p <= patterns.size(); ++p) {
                if (!selects(cycle_.aestheticNumber, p))
                    continue;
                if (!sourceSetsCycle(source_, *patterns[p - 1]))
                    replaceCycle(*this, target_, *patterns[p - 1], cycle_.cycle);
                if (sourceColor.empty())
                    style->setColor(GrxStyle::_white);
            }
        }
    });
    return true;
}

// ---- setSize --------------------------------------------------------------------------------------

bool TSetSize::apply() {
    forEachGraphElements(target_, [&](const std::vector<CTElementType*>& elements) {
        for (CTElementType* element : elements) {
            if (!kind_.takes(*element))
                continue;
            const std::vector<GrxSize*> sizes = element->getSizes();
            for (std::size_t p = 1; p <= sizes.size(); ++p) {
                if (!selects(cycle_.aestheticNumber, p) || sourceSetsCycle(source_, *sizes[p - 1]))
                    continue;
                GrxSize& size = *sizes[p - 1];
                if (mappings_.empty()) {
                    replaceCycle(*this, target_, size, cycle_.cycle);
                    continue;
                }
                // The template's mappings are the whole of the size from now on: mappings an
                // earlier template left would otherwise come first and win.
                size.removeLow();
                size.removeHigh();
                size.removeCycle();
                size.removeDomain();
                size.removeLengthMappings();
                for (const DOMElement* parameter : mappings_) {
                    GrxLengthMapping& mapping = size.addLengthMapping();
                    mapping.setFrom(ChartString(parameter->getAttribute(GrxUni::_name)));
                    mapping.setTo(ChartString(parameter->getAttribute(GrxUni::_value)));
                }
            }
        }
    });
    return true;
}

// ---- addDash, addImage ----------------------------------------------------------------------------

bool TAddDash::apply() {
    convertSelectedColors(*this, target_, source_, cycle_, &CTElementType::addDash);
    return true;
}

bool TAddImage::apply() {
    convertSelectedColors(*this, target_, source_, cycle_, &CTElementType::addImage);
    return true;
}

// ---- setGenericAttributes -------------------------------------------------------------------------

namespace {

// The selectors are the instruction's own. An id written onto several chart objects would take it
// from all but one. Namespace declarations and qualified attributes (xsi:type, xml:space) belong
// to the template document, not to the chart.
bool copied(const DOMNode& attribute) {
    const XMLCh* name = attribute.getNodeName();
    for (const XMLCh* selector : std::initializer_list<const XMLCh*>{GrxUni::_elementName, GrxUni::_count, GrxUni::_styleName, GrxUni::_parentName,
                                  GrxUni::_id, GrxUni::_xmlns})
        if (same(name, selector))
            return false;
    const XMLCh* uri = attribute.getNamespaceURI();
    return !hasText(uri) && XMLString::indexOf(name, chColon) < 0;
}

} // namespace

bool TSetGenericAttributes::apply() {
    const ChartString elementName = attributeOf(instruction_, GrxUni::_elementName);
    const ChartString styleName = attributeOf(instruction_, GrxUni::_styleName);
    const ChartString parentName = attributeOf(instruction_, GrxUni::_parentName);
    const std::uint32_t count = unsignedAttribute(instruction_, GrxUni::_count);
    const DOMNamedNodeMap* attributes = instruction_ != nullptr ? instruction_->getAttributes() : nullptr;
    if (elementName.empty() || attributes == nullptr || attributes->getLength() == 0)
        return false;

    const GrxBaseElement& chart = target_;
    DOMElement* root = chart.getImplementation();
    DOMDocument* document = root->getOwnerDocument();
    // Taken before anything is written: a style made below may carry the very name searched for.
    const std::vector<DOMNode*> matched = nodesNamed(target_, elementName.xc_str());

    std::uint32_t m = 0;
    for (DOMNode* matchedNode : matched) {
        auto* node = static_cast<DOMElement*>(matchedNode);
        if (!parentName.empty() &&
            (node->getParentNode() == nullptr || !parentName.equals(node->getParentNode()->getNodeName())))
            continue;
        ++m;
        if (count != 0 && count != m)
            continue;

        DOMElement* written = node;
        const DOMElement* own = nullptr;
        if (!styleName.empty()) {
            const ChartString styleId(node->getAttribute(styleName.xc_str()));
            if (styleId.empty()) {
                GrxStyle& style = addStyle(target_, nullptr);
                node->setAttribute(styleName.xc_str(), style.getId());
                written = style.getImplementation();
            } else {
                written = target_.getElementById(styleId);
            }
            if (written == nullptr)
                continue;
            own = sourceObject(source_, written->getAttribute(GrxUni::_id));
        }

        for (XMLSize_t i = 0; i < attributes->getLength(); ++i) {
            const DOMNode* attribute = attributes->item(i);
            if (!copied(*attribute))
                continue;
            const XMLCh* name = attribute->getNodeName();
            const XMLCh* value = attribute->getNodeValue();
            if (own != nullptr) {
                if (*own->getAttribute(name) == 0)
                    written->setAttribute(name, value);
            } else if (XMLString::equals(name, GrxUni::_text)) {
                for (DOMNode* child = written->getFirstChild(); child != nullptr;) {
                    DOMNode* next = child->getNextSibling();
                    if (child->getNodeType() == DOMNode::TEXT_NODE)
                        written->removeChild(child)->release();
                    child = next;
                }
                written->appendChild(document->createTextNode(value));
            } else {
                written->setAttribute(name, value);
            }
        }
    }
    return true;
}

// ---- setShowLineMarkers ---------------------------------------------------------------------------

bool TSetShowLineMarkers::apply() {
    if (instruction_ == nullptr)
        return false;
    // The first style anywhere in the instruction dresses the markers.
    const DOMNodeList* styles = instruction_->getElementsByTagName(GrxUni::_style);
    const auto* markerStyle = styles->getLength() > 0 ? static_cast<const DOMElement*>(styles->item(0)) : nullptr;
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    for (GrrUviza* graph : graphs) {
        const std::vector<CTElementType*> elements = elementsOf(*graph);
        if (elements.size() != 1 || (dynamic_cast<GrxLine*>(elements[0]) == nullptr &&
                                     dynamic_cast<GrxPath*>(elements[0]) == nullptr))
            continue;
        const CTElementType& line = *elements[0];

        GrxPoint& point = graph->addPoint();
        point.setId(CreateUniqueId(ChartString(GrxUni::_point)));
        GrxStyle& style = addStyle(point, nullptr);
        point.setStyle(style);
        cloneElementChildren(line, point, false);
        changeColor2ToColor(point, false);
        for (GrxColor* color : point.getColors())
            color->setAffect(grx::Affect::secondary);

        // The line's dash series becomes the markers' shape series.
        const std::vector<GrxDash*> dashes = line.getDashs();
        if (!dashes.empty()) {
            const GrxDash& dash = *dashes.front();
            GrxShape& shape = point.addShape();
            if (const GrxScale* scale = dash.getScale())
                duplicateAttributes(*scale, shape.addScale(grx::ScaleMethod::power));
            if (const GrxSummaryStatistic* statistic = dash.getSummaryStatistic())
                duplicateAttributes(*statistic, shape.addSummaryStatistic());
            duplicateAttributes(dash, shape);
            point.removeDashs();
            shape.setId(CreateUniqueId(ChartString(GrxUni::_shape)));
            shape.removeCycle();
            const std::vector<GrxLegend*> legends = getLegends();
            if (!legends.empty())
                legends.front()->addLegendTarget(shape).setId(
                    CreateUniqueId(ChartString(GrxUni::_legendTarget)));
        }
        if (markerStyle != nullptr)
            importStyle(markerStyle, style);
    }
    return !graphs.empty();
}

namespace {

const ActionFamily family{
    {u"addImage", "TAddImage", makeAction<TAddImage>},
    {u"setColor", "TSetColor", makeAction<TSetColor>},
    {u"setDash", "TSetDash", makeAction<TSetDash>},
    {u"setPattern", "TSetPattern", makeAction<TSetPattern>},
    {u"setShape", "TSetShape", makeAction<TSetShape>},
    {u"setSize", "TSetSize", makeAction<TSetSize>},
    {u"addDash", "TAddDash", makeAction<TAddDash>},
    {u"setShowLineMarkers", "TSetShowLineMarkers", makeAction<TSetShowLineMarkers>},
    {u"setGenericAttributes", "TSetGenericAttributes", makeAction<TSetGenericAttributes>},
};

} // namespace

} // namespace plotaid::detail
