// The tick, grid-line and label parts of an axis instruction, turned into object-model settings.
// Missing parts are made; what the instruction's elements declare is imported into them.

#include "templates/Kit.h"
#include "templates/Localise.h"

#include <plotaid/BaseTemplate.h>

#include <grx/GrxEnums.h>
#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

using namespace plotaid::detail;

namespace {

constexpr XMLCh kDeltaUnit[] = u"deltaUnit";
constexpr XMLCh kFacetStyle[] = u"facetStyle";
constexpr XMLCh kAuto[] = u"auto";

const DOMElement* gridLinesOf(const DOMElement* element) {
    return firstDescendantNamed(element, BaseTemplate::_gridLines);
}

// The first `style` inside the first `part` descendant of the element.
const DOMElement* styleInside(const DOMElement* element, const XMLCh* part) {
    return firstDescendantNamed(firstDescendantNamed(element, part), GrxUni::_style);
}

// The style `get` reads, or a new one that `set` attaches; `made` says which.
template <class Owner>
GrxStyle& ownStyle(BaseTemplate& action, Owner& owner, GrxStyle* (Owner::*get)() const,
                   void (Owner::*set)(GrxStyle&), bool& made) {
    made = (owner.*get)() == nullptr;
    return styleOf(action, owner, get, set, ChartString());
}

ChartString trimmed(const ChartString& text) {
    const std::u16string& all = text.str();
    const auto blank = [](char16_t c) { return c == u' ' || c == u'\t' || c == u'\n' || c == u'\r'; };
    std::size_t begin = 0, end = all.size();
    while (begin < end && blank(all[begin]))
        ++begin;
    while (end > begin && blank(all[end - 1]))
        --end;
    return ChartString(all.substr(begin, end - begin));
}

} // namespace

void BaseTemplate::setMajorTicks(GrxAxis& axis, const DOMElement* element) {
    if (element == nullptr || !doesCoordinateMatch(axis, attributeOf(element, GrxUni::_role)))
        return;
    if (!booleanAttribute(element, _styleOnly, false) && axis.getMajorTickss().empty())
        axis.addMajorTicks();
    const std::vector<GrxMajorTicks*> all = axis.getMajorTickss();
    if (all.empty())
        return;
    GrxMajorTicks& ticks = *all.front();

    int value = 0;
    if (wordValue(grx::kTickPosition, attributeOf(element, GrxUni::_position), value))
        ticks.setPosition(value);
    if (const ChartString length = attributeOf(element, GrxUni::_length); !length.empty())
        ticks.setLength(length);
    if (const ChartString stagger = attributeOf(element, GrxUni::_stagger); !stagger.empty()) {
        if (stagger.equals(kAuto))
            ticks.removeStagger();
        else
            ticks.setStagger(stagger);
    }
    if (const ChartString delta = attributeOf(element, GrxUni::_delta); !delta.empty()) {
        if (delta.equals(kAuto))
            ticks.removeDelta();
        else
            ticks.setDelta(delta.convertToDouble());
    }
    if (wordValue(grx::kDeltaUnit, attributeOf(element, kDeltaUnit), value))
        ticks.setDeltaUnit(value);
    if (const ChartString base = attributeOf(element, GrxUni::_UTF_base); !base.empty())
        ticks.setBase(base);
    if (gridLinesOf(element) != nullptr && ticks.getGridline() == nullptr)
        ticks.addGridline();

    // Every kind of format writes into the ticks' one format: a tick label has a single format.
    using Import = void (*)(BaseTemplate&, GrxFormat&, const DOMElement*);
    static const struct {
        const XMLCh* name;
        Import import;
    } kFormats[] = {
        {u"numberFormat", [](BaseTemplate& t, GrxFormat& f, const DOMElement* e) { t.importNumberFormat(f, e); }},
        {u"stringFormat", [](BaseTemplate& t, GrxFormat& f, const DOMElement* e) { t.importStringFormat(f, e); }},
        {u"dateTimeFormat",
         [](BaseTemplate& t, GrxFormat& f, const DOMElement* e) { t.importDateTimeFormat(f, e); }},
        {u"elapsedTimeFormat",
         [](BaseTemplate& t, GrxFormat& f, const DOMElement* e) { t.importElapsedTimeFormat(f, e); }},
        {u"format", [](BaseTemplate&, GrxFormat& f, const DOMElement* e) { importFormat(f, e); }},
    };
    for (const auto& kind : kFormats) {
        const DOMElement* declared = firstDescendantNamed(element, kind.name);
        if (declared == nullptr)
            continue;
        GrxFormat* format = ticks.getFormat();
        kind.import(*this, format ? *format : ticks.addFormat(), declared);
    }
    styleMajorTicks(ticks, element);
}

void BaseTemplate::setMinorTicks(GrxAxis& axis, const DOMElement* element) {
    if (element == nullptr || !doesCoordinateMatch(axis, attributeOf(element, GrxUni::_role)))
        return;
    const bool styleOnly = booleanAttribute(element, _styleOnly, false);
    if (!styleOnly && axis.getMinorTickss().empty())
        axis.addMinorTicks();
    const std::vector<GrxMinorTicks*> all = axis.getMinorTickss();
    if (all.empty())
        return;
    GrxMinorTicks& minor = *all.front();
    const std::vector<GrxMajorTicks*> majors = axis.getMajorTickss();
    GrxMajorTicks* major = majors.empty() ? nullptr : majors.front();
    if (!styleOnly) {
        const ChartString number = attributeOf(element, GrxUni::_number);
        minor.setNumber(number.empty() ? 2 : static_cast<int>(number.convertToInteger()));
        int position = 0;
        if (wordValue(grx::kTickPosition, attributeOf(element, GrxUni::_position), position))
            minor.setPosition(position);
        if (const ChartString length = attributeOf(element, GrxUni::_length); !length.empty())
            minor.setLength(length);
        if (gridLinesOf(element) != nullptr && minor.getGridline() == nullptr)
            minor.addGridline();
    }
    styleMinorTicks(minor, element, major);
}

void BaseTemplate::styleMajorTicks(GrxMajorTicks& ticks, const DOMElement* element) {
    if (element == nullptr)
        return;
    bool made = false;
    GrxStyle& mark = ownStyle(*this, ticks, &GrxMajorTicks::getMarkStyle, &GrxMajorTicks::setMarkStyle, made);
    if (const DOMElement* style = styleInside(element, GrxUni::_markStyle))
        importStyle(style, mark);
    GrxStyle& tickStyle = ownStyle(*this, ticks, &GrxMajorTicks::getStyle, &GrxMajorTicks::setStyle, made);
    GrxStyle& frame =
        ownStyle(*this, ticks, &GrxMajorTicks::getTickFrameStyle, &GrxMajorTicks::setTickFrameStyle, made);
    if (made)
        frame.setVisible(false);
    for (const DOMElement* style : descendantsNamed(firstDescendantNamed(element, _tickLabelStyle), GrxUni::_style))
        importStyle(style, unsignedAttribute(style, GrxUni::_number) == 1 ? frame : tickStyle);
    // Without a "gridLines" part, styleGridLines leaves the grid line alone.
    if (GrxGridline* gridline = ticks.getGridline())
        styleGridLines(&mark, *gridline, gridLinesOf(element));
}

void BaseTemplate::styleMinorTicks(GrxMinorTicks& minor, const DOMElement* element, GrxMajorTicks* major) {
    if (element == nullptr)
        return;
    bool made = false;
    GrxStyle& mark = ownStyle(*this, minor, &GrxMinorTicks::getMarkStyle, &GrxMinorTicks::setMarkStyle, made);
    if (made && major != nullptr)
        if (const GrxStyle* majorMark = major->getMarkStyle())
            mark.setColor(majorMark->getColor());
    if (const DOMElement* style = styleInside(element, GrxUni::_markStyle))
        importStyle(style, mark);
    // Without a "gridLines" part, styleGridLines leaves the grid line alone.
    if (GrxGridline* gridline = minor.getGridline())
        styleGridLines(&mark, *gridline, gridLinesOf(element));
}

void BaseTemplate::styleGridLines(GrxStyle* from, GrxGridline& gridline, const DOMElement* element) {
    if (element == nullptr)
        return;
    bool made = false;
    GrxStyle& style = ownStyle(*this, gridline, &GrxGridline::getStyle, &GrxGridline::setStyle, made);
    if (made && from != nullptr)
        style.setColor(from->getColor());
    if (const DOMElement* declared = firstDescendantNamed(element, GrxUni::_style))
        importStyle(declared, style);
    const DOMElement* facet = firstDescendantNamed(element, kFacetStyle);
    const ChartString when = attributeOf(facet, GrxUni::_when);
    if (when.empty())
        return;
    gridline.removeConditionalStyles();
    GrxStyle& conditional = addStyle(gridline, nullptr);
    gridline.addConditionalStyle(when, conditional);
    if (const DOMElement* declared = firstDescendantNamed(facet, GrxUni::_style))
        importStyle(declared, conditional);
}

void BaseTemplate::styleLabel(GrxLabel& label, const DOMElement* element) {
    CTLabelType& owner = label;
    bool made = false;
    GrxStyle& style = ownStyle(*this, owner, &CTLabelType::getStyle, &CTLabelType::setStyle, made);
    if (made)
        style.setColor(GrxStyle::_black);
    GrxStyle& frame = textFrameStyleOf(*this, label);
    for (const DOMElement* declared : descendantsNamed(element, GrxUni::_style))
        importStyle(declared, unsignedAttribute(declared, GrxUni::_number) == 1 ? frame : style);
}

void BaseTemplate::mergeText(const DOMElement* element, GrxLabel& label) {
    if (element == nullptr)
        return;
    // The indentation around a title's text in a printed template is layout, not text.
    ChartString text = trimmed(directText(element));
    localiseChartText(text);
    if (text.empty())
        return;
    label.removeTexts();
    label.addText().setText(text);
}
