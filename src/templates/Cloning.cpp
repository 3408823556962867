// Copying one object of the target into another: a point redrawn as a line, a second element over
// the first, a labeling that follows its element. Every aesthetic copied gets a fresh id, so ids
// stay unique in the document and legends can list the copy beside the original.
#include "templates/Kit.h"

#include <plotaid/ChartBase.h>

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLString.hpp>

using namespace XERCES_CPP_NAMESPACE;

namespace {

using plotaid::detail::hasText;

bool isTransparentOrEmpty(const XMLCh* colour) {
    return !hasText(colour) || XMLString::equals(colour, GrxStyle::_transparent);
}

// The repository's dash cycle: the last cycle that starts with a style carrying no pattern and no
// symbol and that dashes its first or second style.
GrxCycle* findDashCycle(const GrxVisualization& visualization) {
    const GrxExtensionVis* extension = visualization.getExtension();
    const GrxStyleCycle* repository = extension ? extension->getStyleCycleRepository() : nullptr;
    if (repository == nullptr)
        return nullptr;
    GrxCycle* found = nullptr;
    for (GrxCycle* cycle : repository->getCycles()) {
        const std::vector<GrxStyle*> styles = cycle->getStyles();
        if (styles.empty())
            continue;
        const GrxStyle& first = *styles.front();
        if (hasText(first.GetAttribute(GrxUni::_pattern)) || hasText(first.getSymbol()))
            continue;
        const bool dashed = hasText(first.getStroke_dasharray()) ||
                            (styles.size() > 1 && hasText(styles[1]->getStroke_dasharray()));
        if (dashed)
            found = cycle;
    }
    return found;
}

// Colour-swapping cycle styles of a style-by's cycle, then every colour acts on the main colour.
template <class Owner> std::uint32_t colour2ToColour(Owner& owner, bool force) {
    const std::vector<GrxStyleBy*> styleBys = owner.getStyleBys();
    for (const GrxStyleBy* styleBy : styleBys) {
        const GrxStyleCycle* styleCycle = styleBy->getCycle();
        if (styleCycle == nullptr)
            continue;
        for (const GrxCycle* cycle : styleCycle->getCycles()) {
            for (GrxStyle* style : cycle->getStyles()) {
                if (!force && !isTransparentOrEmpty(style->getColor()))
                    continue;
                const ChartString colour2(style->getColor2());
                style->setColor(isTransparentOrEmpty(colour2.xc_str()) ? ChartString(GrxStyle::_black)
                                                                       : colour2);
            }
        }
    }
    for (GrxColor* colour : owner.getColors())
        if (colour->getAffect() != grx::Affect::both)
            colour->setAffect(grx::Affect::main);
    return static_cast<std::uint32_t>(styleBys.size());
}

} // namespace

std::uint32_t BaseTemplate::duplicateAttributes(const GrxBaseElement& from, GrxBaseElement& to) {
    const DOMNamedNodeMap* attributes = from.getImplementation()->getAttributes();
    std::uint32_t copied = 0;
    for (XMLSize_t i = 0, count = attributes->getLength(); i < count; ++i) {
        const DOMNode* attribute = attributes->item(i);
        if (XMLString::equals(attribute->getNodeName(), GrxUni::_id))
            continue;
        // Copied first: writing onto the same element may move the map's storage.
        const ChartString name(attribute->getNodeName());
        const ChartString value(attribute->getNodeValue());
        to.SetAttribute(name.xc_str(), value);
        ++copied;
    }
    return copied;
}

bool BaseTemplate::cloneElementChildren(const CTElementType& from, CTElementType& to, bool cloneLegend) {
    copyVariables(to, from);
    cloneElementAesthetics(from, to, cloneLegend);
    cloneConditionalStyles(from, to);
    return true;
}

namespace {

// Scale, summary statistic, mappings of kind M, then the aesthetic's own attributes but its id.
template <class M> void copyAestheticBody(BaseTemplate& cloner, const CTAesthetic& from, CTAesthetic& to) {
    if (const GrxScale* scale = from.getScale())
        cloner.duplicateAttributes(*scale, to.addScale(grx::ScaleMethod::power));
    if (const GrxSummaryStatistic* statistic = from.getSummaryStatistic())
        cloner.duplicateAttributes(*statistic, to.addSummaryStatistic());
    for (const M* mapping : from.children<M>())
        cloner.duplicateAttributes(*mapping, to.add<M>());
    cloner.duplicateAttributes(from, to);
}

} // namespace

bool BaseTemplate::cloneElementAesthetics(const GrxBaseElement& from, GrxBaseElement& to, bool cloneLegend) {
    const auto* fromElement = dynamic_cast<const CTElementType*>(&from);
    const auto* fromLabeling = dynamic_cast<const GrxLabeling*>(&from);
    auto* toElement = dynamic_cast<CTElementType*>(&to);
    auto* toLabeling = dynamic_cast<GrxLabeling*>(&to);
    if ((fromElement == nullptr && fromLabeling == nullptr) ||
        (toElement == nullptr && toLabeling == nullptr))
        return false;

    // Read before anything is added, so cloning an object onto itself copies what it had.
    const std::vector<GrxStyleBy*> styleBys = from.children<GrxStyleBy>();
    const std::vector<GrxColorComponent*> components = from.children<GrxColorComponent>();
    const std::vector<GrxColor*> colours = from.children<GrxColor>();
    const std::vector<GrxDash*> dashes = from.children<GrxDash>();
    const std::vector<GrxPattern*> patterns = from.children<GrxPattern>();
    const std::vector<GrxShape*> shapes = from.children<GrxShape>();
    const std::vector<GrxSize*> sizes = from.children<GrxSize>();

    const auto finish = [&](const CTAesthetic& old, CTAesthetic& made, const XMLCh* prefix) {
        made.setId(CreateUniqueId(ChartString(prefix)));
        if (cloneLegend && !made.getImplementation()->hasChildNodes())
            CloneLegendEntry(ChartString(old.getId()), made);
    };

    for (const GrxStyleBy* old : styleBys) {
        GrxStyleBy& made = to.add<GrxStyleBy>();
        cloneStyleBy(*old, made);
        finish(*old, made, GrxUni::_styleBy);
    }
    for (const GrxColorComponent* old : components) {
        GrxColorComponent& made = to.add<GrxColorComponent>();
        copyAestheticBody<GrxDoubleMapping>(*this, *old, made);
        finish(*old, made, GrxUni::_colorComponent);
    }
    for (const GrxColor* old : colours) {
        GrxColor& made = to.add<GrxColor>();
        copyAestheticBody<GrxColorMapping>(*this, *old, made);
        finish(*old, made, GrxUni::_color);
    }
    if (toElement != nullptr) {
        for (const GrxDash* old : dashes) {
            GrxDash& made = to.add<GrxDash>();
            copyAestheticBody<GrxDashMapping>(*this, *old, made);
            finish(*old, made, GrxUni::_dash);
        }
        for (const GrxPattern* old : patterns) {
            GrxPattern& made = to.add<GrxPattern>();
            copyAestheticBody<GrxIntegerMapping>(*this, *old, made);
            finish(*old, made, GrxUni::_pattern);
        }
        // Lines and paths draw no symbols: a shape that tells categories apart becomes a dash
        // that cycles through the repository's dash patterns.
        const bool dashInstead =
            dynamic_cast<GrxLine*>(toElement) != nullptr || dynamic_cast<GrxPath*>(toElement) != nullptr;
        for (const GrxShape* old : shapes) {
            if (!dashInstead) {
                GrxShape& made = to.add<GrxShape>();
                copyAestheticBody<GrxSymbolMapping>(*this, *old, made);
                finish(*old, made, GrxUni::_shape);
                continue;
            }
            GrxDash& made = to.add<GrxDash>();
            copyAestheticBody<GrxSymbolMapping>(*this, *old, made);
            made.removeCycle();
            if (const GrxCycle* dashCycle = findDashCycle(target_)) {
                GrxStyleCycle& styleCycle =
                    target_.addStyleCycle(CreateUniqueId(ChartString(GrxUni::_styleCycle)));
                GrxCycle& cycle = styleCycle.addCycle();
                for (const GrxStyle* style : dashCycle->getStyles()) {
                    GrxStyle& copy = cycle.addStyle();
                    ChartBase::mergeAttributes(style->getImplementation(), copy.getImplementation());
                    // The repository style keeps its id; a second holder would make it ambiguous.
                    copy.removeAttribute(GrxUni::_id);
                }
                made.setCycle(styleCycle);
            }
            finish(*old, made, GrxUni::_shape);
        }
    }
    for (const GrxSize* old : sizes) {
        GrxSize& made = to.add<GrxSize>();
        copyAestheticBody<GrxLengthMapping>(*this, *old, made);
        if (!hasText(made.getLow()) && !hasText(made.getHigh())) {
            made.setLow(toElement != nullptr ? u"0.25pt" : u"6pt");
            made.setHigh(toElement != nullptr ? u"3pt" : u"18pt");
        }
        finish(*old, made, GrxUni::_length);
    }

    if (fromElement != nullptr && toElement != nullptr) {
        toElement->setDot(fromElement->getDot());
        if (GrxCoordinates* coordinates = fromElement->getCoordinates())
            toElement->setCoordinates(*coordinates);
    }
    return false;
}

void BaseTemplate::cloneStyleBy(const GrxStyleBy& from, GrxStyleBy& to) {
    if (GrxDimension* dimension = from.getDimension())
        to.setDimension(*dimension);
    GrxDomain* domain = from.getDomain();
    if (dynamic_cast<GrxIntervalDomain*>(domain) != nullptr ||
        dynamic_cast<GrxCategoricalDomain*>(domain) != nullptr)
        to.setDomain(*domain);
    if (CTVariableType* variable = from.getVariable())
        to.setVariable(*variable);
    if (const GrxStyleCycle* cycle = from.getCycle()) {
        GrxStyleCycle& made = target_.addStyleCycle(CreateUniqueId(ChartString(GrxUni::_styleCycle)));
        to.setCycle(made);
        cloneStyleCycle(*cycle, made);
    }
}

void BaseTemplate::cloneStyleCycle(const GrxStyleCycle& from, GrxStyleCycle& to) {
    // Read first: a cycle cloned into itself copies what it had once.
    const std::vector<GrxCycle*> cycles = from.getCycles();
    for (const GrxCycle* cycle : cycles) {
        const std::vector<GrxStyle*> styles = cycle->getStyles();
        GrxCycle& made = to.addCycle();
        for (const GrxStyle* style : styles)
            duplicateAttributes(*style, made.addStyle());
    }
}

void BaseTemplate::cloneStyleCycle(CTElementType& to, const CTElementType& from, const XMLCh* prefix,
                                   const ChartString& fromKind, const ChartString& toKind) {
    const std::vector<GrxStyleBy*> styleBys = from.getStyleBys();
    if (styleBys.empty())
        return;
    const GrxStyleBy* old = styleBys.front();
    GrxStyleBy& made = to.addStyleBy();
    CTVariableType* variable = old->getVariable();
    if (dynamic_cast<GrxSourceVariable*>(variable) != nullptr ||
        dynamic_cast<GrxExpressionVariable*>(variable) != nullptr)
        made.setVariable(*variable);

    const GrxStyleCycle* oldCycle = old->getCycle();
    if (oldCycle == nullptr)
        return;
    // An empty prefix would make ids that start with a digit, which are no XML ids.
    const ChartString idPrefix(hasText(prefix) ? prefix : GrxUni::_styleCycle);
    GrxStyleCycle& styleCycle = target_.addStyleCycle(CreateUniqueId(idPrefix));
    made.setCycle(styleCycle);
    // A point fills with its colour and outlines with colour 2; a line or a text draws with its
    // colour alone, so the fill colour moves to where it is drawn.
    const bool swap =
        fromKind.equals(GrxUni::_point) && (toKind.equals(GrxUni::_line) || toKind.equals(GrxUni::_text));
    for (const GrxCycle* cycle : oldCycle->getCycles()) {
        const std::vector<GrxStyle*> styles = cycle->getStyles();
        GrxCycle& madeCycle = styleCycle.addCycle();
        for (const GrxStyle* style : styles) {
            GrxStyle& copy = madeCycle.addStyle();
            const ChartString colour(swap ? style->getColor2() : style->getColor());
            const ChartString colour2(swap ? style->getColor() : style->getColor2());
            if (!colour.empty())
                copy.setColor(colour);
            if (!colour2.empty())
                copy.setColor2(colour2);
        }
    }
}

bool BaseTemplate::cloneConditionalStyles(const CTElementType& from, CTElementType& to) {
    const std::vector<GrxConditionalStyle*> conditionals = from.getConditionalStyles();
    for (const GrxConditionalStyle* conditional : conditionals)
        if (GrxStyle* style = conditional->getStyle())
            to.addConditionalStyle(ChartString(conditional->getWhen()), *style);
    return false;
}

void BaseTemplate::CloneLegendEntry(const ChartString& oldId, GrxBaseElement& aesthetic) {
    // An aesthetic without an id is listed by no legend; matching the empty text would pick up
    // every target whose reference is missing.
    if (oldId.empty())
        return;
    for (GrxLegend* legend : getLegends()) {
        const std::vector<GrxLegendTarget*> targets = legend->getLegendTargets();
        for (const GrxLegendTarget* target : targets) {
            if (!oldId.equals(target->GetAttribute(GrxUni::_target)))
                continue;
            GrxLegendTarget& added = legend->addLegendTarget(aesthetic);
            added.setId(CreateUniqueId(ChartString(GrxUni::_legendTarget)));
        }
    }
}

std::uint32_t BaseTemplate::changeColor2ToColor(CTElementType& element, bool force) {
    return colour2ToColour(element, force);
}

std::uint32_t BaseTemplate::changeColor2ToColor(GrxLabeling& labeling, bool force) {
    return colour2ToColour(labeling, force);
}
