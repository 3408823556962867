// Template format elements carried over to the object model's formats. "format" replaces what the
// format says; the other four only add to it, so a template can adjust a chart's own format.
#include "templates/Kit.h"

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLString.hpp>

using namespace XERCES_CPP_NAMESPACE;

namespace {

using plotaid::detail::hasText;
using plotaid::detail::named;

bool is(const XMLCh* value, const XMLCh* word) {
    return XMLString::equals(value, word);
}

// Descendants of `root` with that name, in document order.
std::vector<const DOMElement*> descendants(const DOMElement* root, const XMLCh* name) {
    std::vector<const DOMElement*> found;
    const DOMNode* node = root->getFirstChild();
    while (node != nullptr) {
        if (named(node, name))
            found.push_back(static_cast<const DOMElement*>(node));
        if (node->getFirstChild() != nullptr) {
            node = node->getFirstChild();
            continue;
        }
        while (node != nullptr && node != root && node->getNextSibling() == nullptr)
            node = node->getParentNode();
        node = (node == nullptr || node == root) ? nullptr : node->getNextSibling();
    }
    return found;
}

const DOMElement* firstDescendant(const DOMElement* root, const XMLCh* name) {
    const std::vector<const DOMElement*> found = descendants(root, name);
    return found.empty() ? nullptr : found.front();
}

// Every attribute of the template element; an id that already names another object of the chart
// is left out, since two holders would make every reference to it ambiguous.
void importKeepingIdsUnique(GrxBaseElement& to, const DOMElement* from) {
    const XMLCh* id = from->getAttribute(GrxUni::_id);
    DOMElement* holder = hasText(id) ? to.getElementById(id) : nullptr;
    if (holder == to.getImplementation())
        holder = nullptr;
    to.importAttributes(from);
    if (holder == nullptr)
        return;
    // Importing declared the id on `to`, taking it from its holder: undo both.
    to.removeAttribute(GrxUni::_id);
    holder->setIdAttributeNode(holder->getAttributeNode(GrxUni::_id), true);
}

void importAffixes(GrxFormat& format, const DOMElement* element) {
    const XMLCh* prefix = element->getAttribute(GrxUni::_prefix);
    if (hasText(prefix))
        format.setPrefix(prefix);
    else
        format.removePrefix();
    const XMLCh* suffix = element->getAttribute(GrxUni::_suffix);
    if (hasText(suffix))
        format.setSuffix(suffix);
    else
        format.removeSuffix();
}

int readInteger(const XMLCh* text) {
    return static_cast<int>(ChartString(text).convertToInteger());
}

// A "true" or "false" attribute given to `set`; any other value leaves the setting alone.
template <class Set> void onTrueFalse(const DOMElement* part, const XMLCh* name, Set set) {
    const XMLCh* value = part->getAttribute(name);
    if (is(value, GrxUni::_true))
        set(true);
    else if (is(value, GrxUni::_false))
        set(false);
}

void importDateParts(GrxFormat& format, const DOMElement* date) {
    if (const DOMElement* part = firstDescendant(date, GrxUni::_dayOfWeek)) {
        format.setShowDayOfWeek(true);
        onTrueFalse(part, GrxUni::_long, [&](bool on) { format.setDayOfWeekAbbreviation(!on); });
    }
    if (const DOMElement* part = firstDescendant(date, GrxUni::_dayOfMonth)) {
        format.setShowDay(true);
        format.setDayType(CTFormatType::dayType_dayOfMonth);
        onTrueFalse(part, GrxUni::_fill, [&](bool on) { format.setDayPadding(on); });
    }
    if (const DOMElement* part = firstDescendant(date, GrxUni::_dayOfYear)) {
        format.setShowDay(true);
        format.setDayType(CTFormatType::dayType_dayOfYear);
        onTrueFalse(part, GrxUni::_fill, [&](bool on) { format.setDayPadding(on); });
    }
    if (const DOMElement* part = firstDescendant(date, GrxUni::_week)) {
        format.setShowWeek(true);
        onTrueFalse(part, GrxUni::_fill, [&](bool on) { format.setWeekPadding(on); });
    }
    if (const DOMElement* part = firstDescendant(date, GrxUni::_month)) {
        format.setShowMonth(true);
        onTrueFalse(part, GrxUni::_fill, [&](bool on) {
            format.setMonthFormat(on ? CTFormatType::monthFormat_padded : CTFormatType::monthFormat_number);
        });
    }
    if (const DOMElement* part = firstDescendant(date, GrxUni::_monthName)) {
        format.setShowMonth(true);
        onTrueFalse(part, GrxUni::_long, [&](bool on) {
            format.setMonthFormat(on ? CTFormatType::monthFormat_long : CTFormatType::monthFormat_short);
        });
    }
    if (const DOMElement* part = firstDescendant(date, GrxUni::_quarter)) {
        format.setShowQuarter(true);
        if (const XMLCh* prefix = part->getAttribute(GrxUni::_prefix); hasText(prefix))
            format.setQuarterPrefix(prefix);
        if (const XMLCh* suffix = part->getAttribute(GrxUni::_suffix); hasText(suffix))
            format.setQuarterSuffix(suffix);
    }
    if (const DOMElement* part = firstDescendant(date, GrxUni::_year)) {
        format.setShowYear(true);
        onTrueFalse(part, GrxUni::_showCentury, [&](bool on) { format.setYearAbbreviation(!on); });
    }
    if (firstDescendant(date, GrxUni::_era) != nullptr)
        format.setShowEra(true);
}

void importTimeParts(GrxFormat& format, const DOMElement* time) {
    if (const DOMElement* part = firstDescendant(time, GrxUni::_hour)) {
        format.setShowHour(true);
        onTrueFalse(part, GrxUni::_twentyFour, [&](bool on) {
            format.setHourFormat(on ? CTFormatType::hourFormat_24 : CTFormatType::hourFormat_12NoAMPM);
        });
        // Asking for AM and PM wins over the 24-hour clock; saying no leaves the clock alone.
        if (is(part->getAttribute(GrxUni::_showAMPM), GrxUni::_true))
            format.setHourFormat(CTFormatType::hourFormat_12);
        onTrueFalse(part, GrxUni::_fill, [&](bool on) { format.setHourPadding(on); });
    }
    if (const DOMElement* part = firstDescendant(time, GrxUni::_minute)) {
        format.setShowMinute(true);
        onTrueFalse(part, GrxUni::_fill, [&](bool on) { format.setMinutePadding(on); });
    }
    if (const DOMElement* part = firstDescendant(time, GrxUni::_second)) {
        format.setShowSecond(true);
        onTrueFalse(part, GrxUni::_fill, [&](bool on) { format.setSecondPadding(on); });
        onTrueFalse(part, GrxUni::_milliseconds, [&](bool on) { format.setShowMilliseconds(on); });
    }
}

} // namespace

void BaseTemplate::importFormat(GrxFormat& format, const DOMElement* element) {
    if (element == nullptr)
        return;
    DOMElement* own = format.getImplementation();
    const DOMNamedNodeMap* attributes = own->getAttributes();
    while (attributes->getLength() > 0) {
        const XMLSize_t before = attributes->getLength();
        const ChartString name(attributes->item(0)->getNodeName());
        format.removeAttribute(name.xc_str());
        if (attributes->getLength() == before)
            break; // not removable by name (cannot happen in a parsed chart); never loop forever
    }
    importKeepingIdsUnique(format, element);
    format.removeUnitRules();
    // Only one unit rule is taken over: the first anywhere below the template element.
    if (const DOMElement* rule = firstDescendant(element, GrxUnitRule::getElementName()))
        importKeepingIdsUnique(format.addUnitRule(), rule);
}

void BaseTemplate::importNumberFormat(GrxFormat& format, const DOMElement* element) {
    if (element == nullptr)
        return;
    const XMLCh* scientific = element->getAttribute(GrxUni::_scientific);
    if (is(scientific, GrxUni::_always) || is(scientific, GrxUni::_true))
        format.setScientific(CTFormatType::scientific_always);
    else if (is(scientific, GrxUni::_never) || is(scientific, GrxUni::_false))
        format.setScientific(CTFormatType::scientific_never);

    if (const XMLCh* v = element->getAttribute(GrxUni::_minimumFractionDigits); hasText(v))
        format.setMinimumFractionDigits(readInteger(v));
    if (const XMLCh* v = element->getAttribute(GrxUni::_maximumFractionDigits); hasText(v))
        format.setMaximumFractionDigits(readInteger(v));
    if (const XMLCh* v = element->getAttribute(GrxUni::_minimumIntegerDigits); hasText(v))
        format.setMinimumIntegerDigits(readInteger(v));
    if (const XMLCh* v = element->getAttribute(GrxUni::_maximumIntegerDigits); hasText(v))
        format.setMaximumIntegerDigits(readInteger(v));

    // Grouping is off unless asked for; hiding negatives changes only when the template says so.
    format.setUseGrouping(is(element->getAttribute(GrxUni::_useGrouping), GrxUni::_true));
    if (const XMLCh* v = element->getAttribute(GrxUni::_hideNegatives); hasText(v))
        format.setHideNegatives(is(v, GrxUni::_true));
    format.setNegativesOutside(is(element->getAttribute(GrxUni::_negativesOutside), GrxUni::_true));
    if (const XMLCh* v = element->getAttribute(GrxUni::_scalingFactor); hasText(v))
        format.setScalingFactor(ChartString(v).convertToDouble());
    format.setNegativesInParentheses(
        is(element->getAttribute(GrxUni::_negativesInParentheses), GrxUni::_true));
    importAffixes(format, element);
}

void BaseTemplate::importStringFormat(GrxFormat& format, const DOMElement* element) {
    if (element != nullptr)
        importAffixes(format, element);
}

void BaseTemplate::importElapsedTimeFormat(GrxFormat& format, const DOMElement* element) {
    if (element != nullptr)
        importAffixes(format, element);
}

void BaseTemplate::importDateTimeFormat(GrxFormat& format, const DOMElement* element) {
    if (element == nullptr)
        return;
    importAffixes(format, element);
    const std::vector<const DOMElement*> dates = descendants(element, GrxUni::_dateFormat);
    const std::vector<const DOMElement*> times = descendants(element, GrxUni::_timeFormat);
    if (!dates.empty() && !times.empty())
        format.setBaseFormat(CTFormatType::baseFormat_dateTime);
    else if (!dates.empty())
        format.setBaseFormat(CTFormatType::baseFormat_date);
    else if (!times.empty())
        format.setBaseFormat(CTFormatType::baseFormat_time);
    if (!dates.empty())
        importDateParts(format, dates.front());
    if (!times.empty())
        importTimeParts(format, times.front());
}
