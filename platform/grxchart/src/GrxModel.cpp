#include <grx/ChartPrinter.h>
#include <grx/GrxModel.h>

#include "Names.h"

#include <xercesc/dom/DOMDocument.hpp>

#include <sstream>

using namespace xercesc;
using grx::detail::nameOf;
using grx::detail::sameText;

// ---- GrxStyle -------------------------------------------------------------------------------------

namespace {

std::u16string trimmed(std::u16string_view s) {
    auto blank = [](char16_t c) { return c == u' ' || c == u'\t' || c == u'\n' || c == u'\r'; };
    while (!s.empty() && blank(s.front()))
        s.remove_prefix(1);
    while (!s.empty() && blank(s.back()))
        s.remove_suffix(1);
    return std::u16string(s);
}

} // namespace

void GrxStyle::getPreferredMinMax(const XMLCh* value, ChartString* preferred, ChartString* minimum,
                                  ChartString* maximum) {
    ChartString* out[3] = {preferred, minimum, maximum};
    std::u16string_view rest = value ? std::u16string_view(value) : std::u16string_view();
    for (ChartString* part : out) {
        const std::size_t cut = rest.find(u';');
        const std::u16string_view piece = rest.substr(0, cut);
        if (part)
            *part = ChartString(trimmed(piece));
        rest = cut == std::u16string_view::npos ? std::u16string_view() : rest.substr(cut + 1);
    }
}

void GrxStyle::setCompound(const XMLCh* name, const XMLCh* preferred, const XMLCh* minimum,
                           const XMLCh* maximum) {
    ChartString parts[3];
    getPreferredMinMax(GetAttribute(name), &parts[0], &parts[1], &parts[2]);
    const XMLCh* given[3] = {preferred, minimum, maximum};
    for (int i = 0; i < 3; ++i)
        if (given[i])
            parts[i] = ChartString(trimmed(given[i]));
    std::size_t used = 3;
    while (used > 0 && parts[used - 1].empty())
        --used;
    if (used == 0) {
        removeAttribute(name);
        return;
    }
    ChartString text;
    for (std::size_t i = 0; i < used; ++i) {
        if (i)
            text.append(u";");
        text.append(parts[i]);
    }
    SetAttribute(name, text.xc_str());
}

bool GrxStyle::isFontSizePresent() const {
    ChartString preferred, minimum;
    getFontSize(&preferred, &minimum, nullptr);
    return !preferred.empty() || !minimum.empty();
}

bool GrxStyle::getVisible() const {
    const XMLCh* v = GetAttribute(GrxUni::_visible);
    return !(sameText(v, GrxUni::_false) || sameText(v, u"0") || sameText(v, u"hidden"));
}

// ---- labels, variables, domains -------------------------------------------------------------------

ChartString CTLabelType::getAllText() const {
    ChartString all;
    for (CTTextType* t : getTexts())
        all.append(t->getText());
    return all;
}

GrxAggregation& CTVariableType::addAggregation(const ChartString& categoryName, CTVariableType& valueVariable,
                                               double minFraction) {
    GrxAggregation& a = add<GrxAggregation>();
    a.setCategory(categoryName);
    a.setVariable(valueVariable);
    a.setMinFraction(minFraction);
    return a;
}

GrxVariableReference& GrxCategoricalDomain::addVariableReference(CTVariableType& variable) {
    GrxVariableReference& r = add<GrxVariableReference>();
    r.setVariable(variable);
    return r;
}

GrxSimpleSort& GrxCategoricalDomain::addSimpleSort(bool descending, int method) {
    GrxSimpleSort& s = add<GrxSimpleSort>();
    s.setDescending(descending);
    s.setMethod(method);
    return s;
}

GrxStatisticSort& GrxCategoricalDomain::addStatisticSort(bool descending, CTVariableType& statisticVariable) {
    GrxStatisticSort& s = add<GrxStatisticSort>();
    s.setDescending(descending);
    s.setMethod(0);
    s.setVariable(statisticVariable);
    return s;
}

// ---- elements and dimensions ----------------------------------------------------------------------

std::vector<CTStatisticType*> CTElementType::getStatistics() const {
    std::vector<CTStatisticType*> out;
    for (DOMElement* c = getImplementation()->getFirstElementChild(); c; c = c->getNextElementSibling())
        if (auto* s = wrapperOf<CTStatisticType>(c))
            out.push_back(s);
    return out;
}

void GrxDimension::removeAxis(unsigned index) {
    const std::vector<GrxAxis*> axes = getAxiss();
    if (index < axes.size())
        removeChild(*axes[index]);
}

// ---- the extension's slots ------------------------------------------------------------------------

GrxBaseElement* GrxExtensionVis::slot(const XMLCh* name, int count) const {
    ChartString attr(name);
    if (count >= 0)
        attr.appendInteger(count);
    return referenced(attr.xc_str());
}

void GrxExtensionVis::setSlot(const XMLCh* name, int count, GrxBaseElement& frame) {
    ChartString attr(name);
    if (count >= 0)
        attr.appendInteger(count);
    setReference(attr.xc_str(), frame);
}

namespace {
constexpr XMLCh kTitle[] = u"title";
constexpr XMLCh kSubtitle[] = u"subtitle";
constexpr XMLCh kFootnote[] = u"footnote";
constexpr XMLCh kStatisticsSummary[] = u"statisticsSummary";
constexpr XMLCh kKey[] = u"key";
constexpr XMLCh kText[] = u"text";
} // namespace

GrxLabelFrame* GrxExtensionVis::getTitle(int count) const {
    return dynamic_cast<GrxLabelFrame*>(slot(kTitle, count));
}
void GrxExtensionVis::setTitle(GrxLabelFrame& frame, int count) {
    setSlot(kTitle, count, frame);
}
GrxLabelFrame* GrxExtensionVis::getSubtitle() const {
    return dynamic_cast<GrxLabelFrame*>(slot(kSubtitle, -1));
}
void GrxExtensionVis::setSubtitle(GrxLabelFrame& frame) {
    setSlot(kSubtitle, -1, frame);
}
GrxLabelFrame* GrxExtensionVis::getFootnote(int count) const {
    return dynamic_cast<GrxLabelFrame*>(slot(kFootnote, count));
}
void GrxExtensionVis::setFootnote(GrxLabelFrame& frame, int count) {
    setSlot(kFootnote, count, frame);
}
GrxLegend* GrxExtensionVis::getLegend(int slotNumber) const {
    return dynamic_cast<GrxLegend*>(slot(GrxUni::_legend, slotNumber));
}
void GrxExtensionVis::setLegend(GrxLegend& legend, int slotNumber) {
    setSlot(GrxUni::_legend, slotNumber, legend);
}
GrxLabelFrame* GrxExtensionVis::getStatisticsSummary(int count) const {
    return dynamic_cast<GrxLabelFrame*>(slot(kStatisticsSummary, count));
}
void GrxExtensionVis::setStatisticsSummary(GrxLabelFrame& frame, int count) {
    setSlot(kStatisticsSummary, count, frame);
}
GrxKey* GrxExtensionVis::getKey(int count) const {
    return dynamic_cast<GrxKey*>(slot(kKey, count));
}
void GrxExtensionVis::setKey(GrxKey& key, int count) {
    setSlot(kKey, count, key);
}
GrxLabelFrame* GrxExtensionVis::getText(int count) const {
    return dynamic_cast<GrxLabelFrame*>(slot(kText, count));
}
void GrxExtensionVis::setText(GrxLabelFrame& frame, int count) {
    setSlot(kText, count, frame);
}

// ---- the visualization ----------------------------------------------------------------------------

void GrxVisualization::reparentContainerChildren(GrxContainer& container) {
    DOMElement* box = container.getImplementation();
    DOMNode* parent = box->getParentNode();
    if (!parent)
        return;
    static const XMLCh* const frames[] = {GrxUni::_graph,  GrxUni::_container, GrxUni::_labelFrame,
                                          GrxUni::_legend, u"controlFrame",    u"key"};
    for (DOMElement* c = box->getFirstElementChild(); c;) {
        DOMElement* next = c->getNextElementSibling();
        for (const XMLCh* f : frames)
            if (sameText(nameOf(c), f)) {
                parent->insertBefore(box->removeChild(c), box);
                break;
            }
        c = next;
    }
}

std::string GrxVisualization::AsUTF8() const {
    ChartPrinter printer;
    printer.setEncoding(u"UTF-8");
    std::ostringstream out;
    printer.Print(getDOMDocument(), out);
    return out.str();
}
