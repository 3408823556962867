// The frame layout. Every frame that moves loses its locations and gets new ones in a fixed order,
// so packing a packed chart writes the same document again.
#include <plotaid/FramePacker.h>

#include "layout/Percent.h"

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

#include <algorithm>
#include <climits>
#include <cmath>

using plotaid::detail::percentText;

namespace plotaid::detail {

ChartString percentText(double percent) {
    double tenths = std::trunc(percent * 10);
    if (std::isnan(tenths))
        tenths = 0;
    tenths = std::clamp(tenths, static_cast<double>(INT_MIN), static_cast<double>(INT_MAX));
    ChartString text;
    text.assignDouble(static_cast<int>(tenths) / 10.0, 16);
    return text.append(u"%");
}

} // namespace plotaid::detail

namespace {

constexpr XMLCh kOne[] = u"1%";
constexpr XMLCh kQuarter[] = u"25%";
constexpr XMLCh kThreeQuarters[] = u"75%";
constexpr XMLCh kAll[] = u"99%";

using Location = GrxLocation;

template <class F> void fixedAt(F& frame, int part, const XMLCh* value) {
    Location& location = frame.addLocation(part);
    location.setMethod(Location::method_fixed);
    location.setValue(value);
}
template <class F> Location& toContent(F& frame, int part) {
    Location& location = frame.addLocation(part);
    location.setMethod(Location::method_content);
    return location;
}
template <class F> void against(F& frame, int part, int method, GrxBaseElement& target) {
    Location& location = frame.addLocation(part);
    location.setMethod(method);
    location.setTarget(target);
}
// Next to the first present frame of `targets`, else fixed at `value`.
template <class F>
void nextToFirst(F& frame, int part, std::initializer_list<GrxBaseElement*> targets, const XMLCh* value) {
    for (GrxBaseElement* target : targets)
        if (target) {
            against(frame, part, Location::method_nextTo, *target);
            return;
        }
    fixedAt(frame, part, value);
}

// The frame's own locations in the reference document; empty when it is not there.
std::vector<Location*> referenceLocations(const GrxBaseElement& frame, const GrxDocument* reference) {
    if (reference == nullptr || !frame.isIdPresent())
        return {};
    const GrxBaseElement* there = GrxBaseElement::wrapperOf(reference->getElementById(frame.getId()));
    return there ? there->children<Location>() : std::vector<Location*>{};
}

// Placed by the user: every location in the reference is a fixed value.
bool kept(const GrxBaseElement* frame, const GrxDocument* reference) {
    if (frame == nullptr)
        return false;
    const std::vector<Location*> locations = referenceLocations(*frame, reference);
    return !locations.empty() && std::all_of(locations.begin(), locations.end(), [](const Location* l) {
        return l->getMethod() == Location::method_fixed;
    });
}

// A graph is the user's when every attachment in the reference was made by the user.
bool keptGraph(const GrrUviza& graph, const GrxDocument* reference) {
    const std::vector<Location*> locations = referenceLocations(graph, reference);
    return !locations.empty() && std::all_of(locations.begin(), locations.end(), [](const Location* l) {
        return l->getMethod() == Location::method_fixed || l->getSpecifiedByUser();
    });
}

template <class F> bool userPlaced(const F& frame, const GrxDocument* reference) {
    const std::vector<Location*> locations = frame.getLocations();
    return reference && std::any_of(locations.begin(), locations.end(),
                                    [](const Location* l) { return l->getSpecifiedByUser(); });
}

GrxContainer* holder(const GrxBaseElement* frame) {
    return frame ? GrxBaseElement::wrapperOf<GrxContainer>(frame->getImplementation()->getParentNode()) : nullptr;
}

} // namespace

FramePacker::~FramePacker() = default;

void FramePacker::getGraphChildren(const std::vector<GrxContainer*>& containers, std::vector<GrrUviza*>& graphs) const {
    // A stack instead of recursion: a hostile chart may nest containers deeply.
    std::vector<GrxContainer*> pending(containers.rbegin(), containers.rend());
    while (!pending.empty()) {
        const GrxContainer* container = pending.back();
        pending.pop_back();
        const std::vector<GrrUviza*> own = container->getGraphs();
        graphs.insert(graphs.end(), own.begin(), own.end());
        const std::vector<GrxContainer*> children = container->getContainers();
        pending.insert(pending.end(), children.rbegin(), children.rend());
    }
}

ChartString FramePacker::assignValue(double percent) const {
    return percentText(percent);
}

bool FramePacker::packFrames(GrxVisualization& vis, GrxDocument* reference) const {
    const GrxExtensionVis* extension = vis.getExtension();
    GrxLabelFrame *title1 = nullptr, *title2 = nullptr, *subtitle = nullptr;
    GrxLabelFrame* footnotes[3] = {};
    std::vector<GrxBaseElement*> sideFrames;
    std::vector<GrxLegend*> legends;
    if (extension) {
        title1 = extension->getTitle1();
        title2 = extension->getTitle2();
        subtitle = extension->getSubtitle();
        for (int i = 0; i < 3; ++i)
            footnotes[i] = extension->getFootnote(i + 1);
        for (int n = 1; GrxLabelFrame* summary = extension->getStatisticsSummary(n); ++n)
            sideFrames.push_back(summary);
        for (int n = 1; GrxKey* key = extension->getKey(n); ++n)
            sideFrames.push_back(key);
        for (int n = 1; GrxLegend* legend = extension->getLegend(n); ++n)
            legends.push_back(legend);
    }
    GrxContainer* side = holder(legends.empty() ? nullptr : legends.front());
    if (side == nullptr)
        side = holder(sideFrames.empty() ? nullptr : sideFrames.front());
    if (extension && extension->getPreserveLocations())
        return true;

    std::vector<GrrUviza*> graphs = vis.getGraphs();
    getGraphChildren(vis.getContainers(), graphs);
    const bool single = graphs.size() == 1;
    GrrUviza* firstGraph = graphs.empty() ? nullptr : graphs.front();

    if (single && title1 && !kept(title1, reference)) {
        title1->removeLocations();
        fixedAt(*title1, Location::part_top, kOne);
        toContent(*title1, Location::part_height);
    }
    if (single && title2 && !kept(title2, reference)) {
        title2->removeLocations();
        toContent(*title2, Location::part_height);
        nextToFirst(*title2, Location::part_top, {title1}, kOne);
    }
    if (subtitle && !kept(subtitle, reference)) {
        subtitle->removeLocations();
        nextToFirst(*subtitle, Location::part_top, {title2, title1}, kOne);
        toContent(*subtitle, Location::part_height);
    }

    if (single && !keptGraph(*firstGraph, reference)) {
        GrrUviza& graph = *firstGraph;
        graph.removeLocations();
        fixedAt(graph, Location::part_left, kOne);
        nextToFirst(graph, Location::part_top, {subtitle, title2, title1}, kOne);
        nextToFirst(graph, Location::part_bottom, {footnotes[0], footnotes[1], footnotes[2]}, kAll);
        if (!side && legends.empty() && sideFrames.empty())
            fixedAt(graph, Location::part_right, kAll);
        else
            nextToFirst(graph, Location::part_right,
                        {side, legends.empty() ? nullptr : legends.front(),
                         sideFrames.empty() ? nullptr : sideFrames.front()},
                        kAll);
    }

    for (int i = 0; single && i < 3; ++i) {
        GrxLabelFrame* footnote = footnotes[i];
        if (footnote == nullptr || kept(footnote, reference))
            continue;
        footnote->removeLocations();
        toContent(*footnote, Location::part_height);
        nextToFirst(*footnote, Location::part_bottom,
                    {i < 1 ? footnotes[1] : nullptr, i < 2 ? footnotes[2] : nullptr}, kAll);
    }

    if (side && !kept(side, reference)) {
        side->removeLocations();
        if (firstGraph)
            against(*side, Location::part_top, Location::method_sameEdge, *firstGraph);
        toContent(*side, Location::part_height);
        fixedAt(*side, Location::part_left, kThreeQuarters);
        fixedAt(*side, Location::part_right, kAll);
    }

    GrxLegend* lastLegend = nullptr;
    for (GrxLegend* legend : legends) {
        if (!single || userPlaced(*legend, reference))
            continue;
        legend->removeLocations();
        toContent(*legend, Location::part_height);
        toContent(*legend, Location::part_width);
        if (side) {
            against(*legend, Location::part_left, Location::method_sameEdge, *side);
            against(*legend, Location::part_right, Location::method_sameEdge, *side);
        } else {
            fixedAt(*legend, Location::part_right, kAll);
        }
        if (lastLegend)
            against(*legend, Location::part_top, Location::method_nextTo, *lastLegend);
        else
            against(*legend, Location::part_top, Location::method_sameEdge, side ? *side : *static_cast<GrxBaseElement*>(firstGraph));
        lastLegend = legend;
    }

    GrxBaseElement* lastSide = nullptr;
    for (GrxBaseElement* frame : sideFrames) {
        auto* key = dynamic_cast<GrxKey*>(frame);
        auto* summary = dynamic_cast<GrxLabelFrame*>(frame);
        if (key ? userPlaced(*key, reference) : userPlaced(*summary, reference))
            continue;
        const bool inside = side && holder(frame) == side;
        const auto place = [&](auto& f) {
            f.removeLocations();
            toContent(f, Location::part_height);
            Location& width = toContent(f, Location::part_width);
            if (!inside)
                width.setMax(kQuarter);
            if (inside)
                fixedAt(f, Location::part_left, kOne);
            else if (side)
                against(f, Location::part_left, Location::method_sameEdge, *side);
            else
                fixedAt(f, Location::part_left, kThreeQuarters);
            if (lastSide)
                against(f, Location::part_top, Location::method_nextTo, *lastSide);
            else if (side && !inside)
                against(f, Location::part_top, Location::method_nextTo, *side);
            else if (lastLegend)
                against(f, Location::part_top, Location::method_nextTo, *lastLegend);
            else if (firstGraph)
                against(f, Location::part_top, Location::method_sameEdge, *firstGraph);
        };
        if (key)
            place(*key);
        else
            place(*summary);
        lastSide = frame;
    }
    return true;
}
