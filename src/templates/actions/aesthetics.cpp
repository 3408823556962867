// Element aesthetics: new style cycles for colours, dashes, patterns, shapes and sizes; colours
// turned into dashes or images; attributes written straight onto the chart; markers over a line.
#include "templates/actions/aesthetics.h"

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLString.hpp>

#include <cstdint>
#include <vector>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

const XMLCh kAestheticNumber[] = u"aestheticNumber";
const XMLCh kAffect[] = u"affect";
const XMLCh kElementType[] = u"elementType";
const XMLCh kElementName[] = u"elementName";
const XMLCh kStyleName[] = u"styleName";
const XMLCh kParentName[] = u"parentName";
const XMLCh kMissing[] = u"missing";
const XMLCh kClamp[] = u"clamp";
const XMLCh kSplit[] = u"split";
const XMLCh kXmlns[] = u"xmlns";

// The object model's colour affect values.
enum : int { kAffectBoth = 1, kAffectPrimary = 2, kAffectSecondary = 3 };

ChartString attributeOf(const DOMElement* element, const XMLCh* name) {
    return element != nullptr ? ChartString(element->getAttribute(name)) : ChartString();
}

bool named(const DOMNode* node, const XMLCh* name) {
    return node != nullptr && node->getNodeType() == DOMNode::ELEMENT_NODE &&
           XMLString::equals(node->getNodeName(), name);
}

// A template may repeat a child; the last one counts.
const DOMElement* lastChildNamed(const DOMElement* parent, const XMLCh* name) {
    const DOMElement* found = nullptr;
    if (parent == nullptr)
        return found;
    for (const DOMNode* n = parent->getFirstChild(); n != nullptr; n = n->getNextSibling())
        if (named(n, name))
            found = static_cast<const DOMElement*>(n);
    return found;
}

std::uint32_t aestheticNumberOf(const DOMElement* instruction) {
    return attributeOf(instruction, kAestheticNumber).convertToInteger();
}

bool selects(std::uint32_t aestheticNumber, std::size_t position) {
    return aestheticNumber == 0 || aestheticNumber == position;
}

// The object of this id as the chart's own definition built it; null without a source.
const DOMElement* sourceObject(const GrxVisualization* source, const XMLCh* id) {
    if (source == nullptr || id == nullptr || *id == 0)
        return nullptr;
    return source->getElementById(id);
}

// What the per-aesthetic steps share: the action (for fresh ids and style import) and both charts.
class CycleEdit {
public:
    CycleEdit(BaseTemplate& action, GrxVisualization& target, const GrxVisualization* source)
        : action_(action), target_(target), source_(source) {}

    // The chart's own definition gives this aesthetic a cycle: the template leaves it alone.
    bool guarded(const CTAesthetic& aesthetic) const {
        const DOMElement* own = sourceObject(source_, aesthetic.getId());
        return own != nullptr && *own->getAttribute(GrxUni::_cycle) != 0;
    }

    // A style cycle of its own under a fresh id, holding one cycle of the template's styles.
    void giveNewCycle(CTAesthetic& aesthetic, const DOMElement* cycle) {
        GrxStyleCycle& styleCycle =
            target_.addStyleCycle(action_.CreateUniqueId(ChartString(GrxUni::_styleCycle)));
        aesthetic.setCycle(styleCycle);
        GrxCycle& styles = styleCycle.addCycle();
        for (const DOMNode* n = cycle->getFirstChild(); n != nullptr; n = n->getNextSibling())
            if (named(n, GrxUni::_style))
                action_.importStyle(static_cast<const DOMElement*>(n), styles.addStyle());
    }

    void replaceCycle(CTAesthetic& aesthetic, const DOMElement* cycle) {
        if (cycle == nullptr)
            return;
        aesthetic.removeCycle();
        giveNewCycle(aesthetic, cycle);
    }

    GrxVisualization& target() const { return target_; }
    const GrxVisualization* source() const { return source_; }

private:
    BaseTemplate& action_;
    GrxVisualization& target_;
    const GrxVisualization* source_;
};

// Every graph's elements, in the graph's order.
template <class Visit> void forEachGraphElements(GrxVisualization& target, Visit visit) {
    for (GrrUviza* graph : target.getGraphs()) {
        std::vector<CTElementType*> elements;
        BaseTemplate::getAllElements(*graph, elements);
        visit(elements);
    }
}

// The selected aesthetics of one kind on every element of every graph. The list of an element is
// taken before its first step, so a step may remove the aesthetic it is given.
template <class A, class Step>
void forEachSelected(GrxVisualization& target, std::uint32_t aestheticNumber,
                     std::vector<A*> (CTElementType::*kind)() const, Step step) {
    forEachGraphElements(target, [&](const std::vector<CTElementType*>& elements) {
        for (std::size_t k = 0; k < elements.size(); ++k) {
            const std::vector<A*> aesthetics = (elements[k]->*kind)();
            for (std::size_t p = 1; p <= aesthetics.size(); ++p)
                if (selects(aestheticNumber, p))
                    step(elements, k, *aesthetics[p - 1]);
        }
    });
}

// Dashes, shapes and the like: guard, then a new cycle each.
template <class A>
void replaceSelectedCycles(CycleEdit& edit, std::uint32_t aestheticNumber, const DOMElement* cycle,
                           std::vector<A*> (CTElementType::*kind)() const) {
    if (cycle == nullptr)
        return;
    forEachSelected(edit.target(), aestheticNumber, kind,
                    [&](const std::vector<CTElementType*>&, std::size_t, A& aesthetic) {
                        if (!edit.guarded(aesthetic))
                            edit.replaceCycle(aesthetic, cycle);
                    });
}

void copyAttributeIfPresent(const GrxBaseElement& from, GrxBaseElement& to, const XMLCh* name) {
    if (from.isAttributePresent(name))
        to.SetAttribute(name, from.GetAttribute(name));
}

// A colour aesthetic becomes a dash or an image that keeps its variable, domain and id, so the
// legend entries that showed the colour show the new aesthetic.
template <class A>
void convertSelectedColors(CycleEdit& edit, std::uint32_t aestheticNumber, const DOMElement* cycle,
                           A& (CTElementType::*add)()) {
    if (cycle == nullptr)
        return;
    forEachSelected(edit.target(), aestheticNumber, &CTElementType::getColors,
                    [&](const std::vector<CTElementType*>& elements, std::size_t k, GrxColor& color) {
                        if (edit.guarded(color))
                            return;
                        CTElementType& element = *elements[k];
                        A& converted = (element.*add)();
                        copyAttributeIfPresent(color, converted, kMissing);
                        copyAttributeIfPresent(color, converted, GrxUni::_dimension);
                        copyAttributeIfPresent(color, converted, kClamp);
                        copyAttributeIfPresent(color, converted, kSplit);
                        if (GrxDomain* domain = color.getDomain())
                            converted.setDomain(*domain);
                        copyAttributeIfPresent(color, converted, GrxUni::_variable);
                        const ChartString id(color.getId());
                        element.removeColor(color);
                        if (!id.empty())
                            converted.setId(id);
                        edit.giveNewCycle(converted, cycle);
                    });
}

bool isPointNode(const DOMNode* node) {
    return node != nullptr && node->getUserData(GrxUni::_point) != nullptr;
}

// What every cycle action reads: which aesthetics (0: all, n: the n-th of each element) and the
// styles of their new cycle (the last "cycle" child; none changes no cycle).
struct CycleSettings {
    std::uint32_t aestheticNumber = 0;
    const DOMElement* cycle = nullptr;

    void read(const DOMElement* instruction) {
        aestheticNumber = aestheticNumberOf(instruction);
        cycle = lastChildNamed(instruction, GrxUni::_cycle);
    }
};

} // namespace

// ---- setColor -------------------------------------------------------------------------------------

struct TSetColor::Settings : CycleSettings {
    enum class Affect { Unchanged, Main, Secondary, Both };

    TSetColor& action;
    Affect affect = Affect::Unchanged;

    explicit Settings(TSetColor& owner) : action(owner) {}

    void read(const DOMElement* instruction) {
        CycleSettings::read(instruction);
        const ChartString word = attributeOf(instruction, kAffect);
        affect = word.equals(GrxUni::_main)        ? Affect::Main
                 : word.equals(GrxUni::_secondary) ? Affect::Secondary
                 : word.equals(GrxUni::_both)      ? Affect::Both
                                                   : Affect::Unchanged;
    }

    // A point's primary colour is its fill, where every other element's is its outline.
    void setAffect(GrxColor& color) const {
        const bool point = isPointNode(color.getImplementation()->getParentNode());
        switch (affect) {
        case Affect::Main:
            color.setAffect(point ? kAffectSecondary : kAffectPrimary);
            break;
        case Affect::Secondary:
            color.setAffect(point ? kAffectPrimary : kAffectSecondary);
            break;
        case Affect::Both:
            color.setAffect(kAffectBoth);
            break;
        case Affect::Unchanged:
            break;
        }
    }

    // Elements of one tag in a graph show one series each: they continue the first one's cycle.
    // With an aesthetic number only that colour of an earlier element is taken, so a second
    // colour never continues the cycle of an earlier element's first one.
    GrxStyleCycle* sharedCycle(const std::vector<CTElementType*>& elements, std::size_t k) const {
        const XMLCh* tag = elements[k]->getImplementation()->getTagName();
        for (std::size_t j = 0; j < k; ++j) {
            if (!XMLString::equals(elements[j]->getImplementation()->getTagName(), tag))
                continue;
            const std::vector<GrxColor*> earlier = elements[j]->getColors();
            for (std::size_t p = 1; p <= earlier.size(); ++p)
                if (selects(aestheticNumber, p))
                    if (GrxStyleCycle* cycle = earlier[p - 1]->getCycle())
                        return cycle;
        }
        return nullptr;
    }
};

PLOTAID_TEMPLATE_ACTION_LIFETIME(TSetColor)

bool TSetColor::apply() {
    Settings& s = *settings_;
    s.read(instruction_);
    if (s.cycle == nullptr)
        return true;
    CycleEdit edit(*this, target_, source_);
    forEachSelected(target_, s.aestheticNumber, &CTElementType::getColors,
                    [&](const std::vector<CTElementType*>& elements, std::size_t k, GrxColor& color) {
                        if (edit.guarded(color))
                            return;
                        // Without a mode the colour keeps the affect it had; only the cycle goes.
                        color.removeCycle();
                        s.setAffect(color);
                        if (k != 0)
                            if (GrxStyleCycle* shared = s.sharedCycle(elements, k)) {
                                color.setCycle(*shared);
                                return;
                            }
                        edit.giveNewCycle(color, s.cycle);
                    });
    return true;
}

// ---- setDash, setShape ----------------------------------------------------------------------------

struct TSetDash::Settings : CycleSettings {
    TSetDash& action;
    explicit Settings(TSetDash& owner) : action(owner) {}
};

PLOTAID_TEMPLATE_ACTION_LIFETIME(TSetDash)

bool TSetDash::apply() {
    settings_->read(instruction_);
    CycleEdit edit(*this, target_, source_);
    replaceSelectedCycles(edit, settings_->aestheticNumber, settings_->cycle, &CTElementType::getDashs);
    return true;
}

struct TSetShape::Settings : CycleSettings {
    TSetShape& action;
    explicit Settings(TSetShape& owner) : action(owner) {}
};

PLOTAID_TEMPLATE_ACTION_LIFETIME(TSetShape)

bool TSetShape::apply() {
    settings_->read(instruction_);
    CycleEdit edit(*this, target_, source_);
    replaceSelectedCycles(edit, settings_->aestheticNumber, settings_->cycle, &CTElementType::getShapes);
    return true;
}

// ---- setPattern -----------------------------------------------------------------------------------

struct TSetPattern::Settings : CycleSettings {
    TSetPattern& action;
    explicit Settings(TSetPattern& owner) : action(owner) {}
};

PLOTAID_TEMPLATE_ACTION_LIFETIME(TSetPattern)

bool TSetPattern::apply() {
    Settings& s = *settings_;
    s.read(instruction_);
    CycleEdit edit(*this, target_, source_);
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
                if (!selects(s.aestheticNumber, p))
                    continue;
                if (!edit.guarded(*patterns[p - 1]))
                    edit.replaceCycle(*patterns[p - 1], s.cycle);
                if (sourceColor.empty())
                    style->setColor(GrxStyle::_white);
            }
        }
    });
    return true;
}

// ---- setSize --------------------------------------------------------------------------------------

struct TSetSize::Settings : CycleSettings {
    using Kind = bool (*)(const CTElementType&);

    TSetSize& action;
    std::vector<ChartString> mappingNames;
    std::vector<ChartString> mappingValues;
    Kind kind = nullptr; // null: every element

    explicit Settings(TSetSize& owner) : action(owner) {}

    template <class T> static bool isA(const CTElementType& element) {
        return dynamic_cast<const T*>(&element) != nullptr;
    }
    // Labelings are aesthetics, never among a graph's elements.
    static bool none(const CTElementType&) { return false; }

    void read(const DOMElement* instruction) {
        CycleSettings::read(instruction);
        mappingNames.clear();
        mappingValues.clear();
        if (instruction != nullptr)
            for (const DOMNode* n = instruction->getFirstChild(); n != nullptr; n = n->getNextSibling())
                if (named(n, GrxUni::_parameter)) {
                    const auto* parameter = static_cast<const DOMElement*>(n);
                    mappingNames.emplace_back(parameter->getAttribute(GrxUni::_name));
                    mappingValues.emplace_back(parameter->getAttribute(GrxUni::_value));
                }
        static const struct {
            const XMLCh* word;
            Kind kind;
        } kinds[] = {
            {GrxUni::_element, nullptr},
            {GrxArea::getElementName(), &isA<GrxArea>},
            {GrxEdge::getElementName(), &isA<GrxEdge>},
            {GrxInterval::getElementName(), &isA<GrxInterval>},
            {GrxLabeling::getElementName(), &none},
            {GrxLine::getElementName(), &isA<GrxLine>},
            {GrxPath::getElementName(), &isA<GrxPath>},
            {GrxPoint::getElementName(), &isA<GrxPoint>},
            {GrxPolygon::getElementName(), &isA<GrxPolygon>},
            {GrxSchema::getElementName(), &isA<GrxSchema>},
        };
        kind = nullptr;
        const ChartString word = attributeOf(instruction, kElementType);
        for (const auto& k : kinds)
            if (word.equals(k.word)) {
                kind = k.kind;
                break;
            }
    }
};

PLOTAID_TEMPLATE_ACTION_LIFETIME(TSetSize)

bool TSetSize::apply() {
    Settings& s = *settings_;
    s.read(instruction_);
    CycleEdit edit(*this, target_, source_);
    forEachGraphElements(target_, [&](const std::vector<CTElementType*>& elements) {
        for (CTElementType* element : elements) {
            if (s.kind != nullptr && !s.kind(*element))
                continue;
            const std::vector<GrxSize*> sizes = element->getSizes();
            for (std::size_t p = 1; p <= sizes.size(); ++p) {
                if (!selects(s.aestheticNumber, p) || edit.guarded(*sizes[p - 1]))
                    continue;
                GrxSize& size = *sizes[p - 1];
                if (s.mappingNames.empty()) {
                    edit.replaceCycle(size, s.cycle);
                    continue;
                }
                // The template's mappings are the whole of the size from now on: mappings an
                // earlier template left would otherwise come first and win.
                size.removeLow();
                size.removeHigh();
                size.removeCycle();
                size.removeDomain();
                size.removeLengthMappings();
                for (std::size_t i = 0; i < s.mappingNames.size(); ++i) {
                    GrxLengthMapping& mapping = size.addLengthMapping();
                    mapping.setFrom(s.mappingNames[i]);
                    mapping.setTo(s.mappingValues[i]);
                }
            }
        }
    });
    return true;
}

// ---- addDash, addImage ----------------------------------------------------------------------------

struct TAddDash::Settings : CycleSettings {
    TAddDash& action;
    explicit Settings(TAddDash& owner) : action(owner) {}
};

PLOTAID_TEMPLATE_ACTION_LIFETIME(TAddDash)

bool TAddDash::apply() {
    settings_->read(instruction_);
    CycleEdit edit(*this, target_, source_);
    convertSelectedColors(edit, settings_->aestheticNumber, settings_->cycle, &CTElementType::addDash);
    return true;
}

struct TAddImage::Settings : CycleSettings {
    TAddImage& action;
    explicit Settings(TAddImage& owner) : action(owner) {}
};

PLOTAID_TEMPLATE_ACTION_LIFETIME(TAddImage)

bool TAddImage::apply() {
    settings_->read(instruction_);
    CycleEdit edit(*this, target_, source_);
    convertSelectedColors(edit, settings_->aestheticNumber, settings_->cycle, &CTElementType::addImage);
    return true;
}

// ---- setGenericAttributes -------------------------------------------------------------------------

struct TSetGenericAttributes::Settings {
    TSetGenericAttributes& action;
    ChartString elementName;
    ChartString styleName;
    ChartString parentName;
    std::uint32_t count = 0;
    const DOMNamedNodeMap* attributes = nullptr;

    explicit Settings(TSetGenericAttributes& owner) : action(owner) {}

    void read(const DOMElement* instruction) {
        elementName = attributeOf(instruction, kElementName);
        styleName = attributeOf(instruction, kStyleName);
        parentName = attributeOf(instruction, kParentName);
        count = attributeOf(instruction, GrxUni::_count).convertToInteger();
        attributes = instruction != nullptr ? instruction->getAttributes() : nullptr;
    }

    // The selectors are the instruction's own. An id written onto several chart objects would
    // take it from all but one. Namespace declarations and qualified attributes (xsi:type,
    // xml:space) belong to the template document, not to the chart.
    static bool copied(const DOMNode& attribute) {
        const XMLCh* name = attribute.getNodeName();
        for (const XMLCh* selector : {kElementName, static_cast<const XMLCh*>(GrxUni::_count), kStyleName,
                                      kParentName, static_cast<const XMLCh*>(GrxUni::_id), kXmlns})
            if (XMLString::equals(name, selector))
                return false;
        const XMLCh* uri = attribute.getNamespaceURI();
        return (uri == nullptr || *uri == 0) && XMLString::indexOf(name, chColon) < 0;
    }
};

PLOTAID_TEMPLATE_ACTION_LIFETIME(TSetGenericAttributes)

bool TSetGenericAttributes::apply() {
    Settings& s = *settings_;
    s.read(instruction_);
    if (instruction_ == nullptr || s.elementName.empty() || s.attributes == nullptr ||
        s.attributes->getLength() == 0)
        return false;

    const GrxBaseElement& chart = target_;
    DOMElement* root = chart.getImplementation();
    DOMDocument* document = root->getOwnerDocument();
    // Taken before anything is written: the list is live, and a style made below may carry the
    // very name that is searched for.
    std::vector<DOMElement*> matched;
    {
        const DOMNodeList* nodes = root->getElementsByTagName(s.elementName.xc_str());
        const XMLSize_t n = nodes->getLength();
        matched.reserve(n);
        for (XMLSize_t i = 0; i < n; ++i)
            matched.push_back(static_cast<DOMElement*>(nodes->item(i)));
    }

    std::uint32_t m = 0;
    for (DOMElement* node : matched) {
        if (!s.parentName.empty() &&
            (node->getParentNode() == nullptr || !s.parentName.equals(node->getParentNode()->getNodeName())))
            continue;
        ++m;
        if (s.count != 0 && s.count != m)
            continue;

        DOMElement* written = node;
        const DOMElement* own = nullptr;
        if (!s.styleName.empty()) {
            const ChartString styleId(node->getAttribute(s.styleName.xc_str()));
            if (styleId.empty()) {
                GrxStyle& style = addStyle(target_, nullptr);
                node->setAttribute(s.styleName.xc_str(), style.getId());
                written = style.getImplementation();
            } else {
                written = target_.getElementById(styleId);
            }
            if (written == nullptr)
                continue;
            own = sourceObject(source_, written->getAttribute(GrxUni::_id));
        }

        for (XMLSize_t i = 0; i < s.attributes->getLength(); ++i) {
            const DOMNode* attribute = s.attributes->item(i);
            if (!Settings::copied(*attribute))
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

struct TSetShowLineMarkers::Settings {
    TSetShowLineMarkers& action;
    const DOMElement* style = nullptr;

    explicit Settings(TSetShowLineMarkers& owner) : action(owner) {}
    void read(const DOMElement* instruction) {
        style = nullptr;
        if (instruction == nullptr)
            return;
        const DOMNodeList* styles = instruction->getElementsByTagName(GrxUni::_style);
        if (styles->getLength() > 0)
            style = static_cast<const DOMElement*>(styles->item(0));
    }
};

PLOTAID_TEMPLATE_ACTION_LIFETIME(TSetShowLineMarkers)

bool TSetShowLineMarkers::apply() {
    Settings& s = *settings_;
    s.read(instruction_);
    if (instruction_ == nullptr)
        return false;
    const std::vector<GrrUviza*> graphs = target_.getGraphs();
    for (GrrUviza* graph : graphs) {
        std::vector<CTElementType*> elements;
        getAllElements(*graph, elements);
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
            color->setAffect(kAffectSecondary);

        // The line's dash series becomes the markers' shape series.
        const std::vector<GrxDash*> dashes = line.getDashs();
        if (!dashes.empty()) {
            const GrxDash& dash = *dashes.front();
            GrxShape& shape = point.addShape();
            if (const GrxScale* scale = dash.getScale())
                duplicateAttributes(*scale, shape.addScale(3));
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
        if (s.style != nullptr)
            importStyle(s.style, style);
    }
    return !graphs.empty();
}

} // namespace plotaid::detail
