// Frame actions. Locations are per cent of the chart; a title or footnote placed right against its
// neighbour is attached to it, so that the two move together when either grows.
#include "templates/actions/frames.h"

#include "templates/Localise.h"

#include <plotaid/ChartBase.h>

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

#include <algorithm>
#include <array>
#include <cmath>
#include <utility>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

constexpr XMLCh kSubtitle[] = u"subtitle";
constexpr XMLCh kFootnote[] = u"footnote";
constexpr XMLCh kStatisticsSummary[] = u"statisticsSummary";
constexpr XMLCh kSummaryId[] = u"frame_statistics_summary";

enum Kind { Title, Subtitle, Footnote, Legend, Summary, Visualization, Graph, LabelFrame, Container, Control, Other };

// The kind a "type" word names; the title words are shared with "hideFrame".
int kindOf(const ChartString& type) {
    const std::pair<const XMLCh*, int> words[] = {
        {ChartBase::_title, Title},           {kSubtitle, Subtitle},        {kFootnote, Footnote},
        {GrxUni::_legend, Legend},         {kStatisticsSummary, Summary}, {GrxUni::_visualization, Visualization},
        {GrxUni::_graph, Graph},           {GrxUni::_labelFrame, LabelFrame}, {GrxUni::_container, Container},
        {GrxControlFrame::getElementName(), Control},
    };
    for (const auto& [word, kind] : words)
        if (type.equals(word))
            return kind;
    return Other;
}

// The kind and count a well-known frame id stands for; a count of -1 is the instruction's own.
std::pair<int, int> kindOfFrameId(const ChartString& id) {
    const struct {
        const XMLCh* id;
        int kind, count;
    } ids[] = {
        {u"frame_graph_1", Visualization, -1}, {u"frame_data_1", Graph, 1},
        {u"frame_pie_1", Graph, 1},            {u"frame_title_1", Title, 1},
        {u"frame_title_2", Title, 2},          {u"frame_subtitle_1", Subtitle, -1},
        {u"frame_footnote_1", Footnote, 1},    {u"frame_footnote_2", Footnote, 2},
        {u"frame_footnote_3", Footnote, 3},    {u"frame_legend_1", Legend, 1},
        {u"frame_legend_2", Legend, 2},        {u"frame_statistics_summary_1", Summary, -1},
    };
    for (const auto& row : ids)
        if (id.equals(row.id))
            return {row.kind, row.count};
    return {Other, -1};
}

// The first location of that part, or null.
GrxLocation* locationOf(const GrxBaseElement* frame, int part) {
    if (frame == nullptr)
        return nullptr;
    for (GrxLocation* location : frame->children<GrxLocation>())
        if (location->getPart() == part)
            return location;
    return nullptr;
}

// A per-cent value that snapping may compare: non-empty and ending in "%".
bool percentOf(const GrxLocation* location, double& value) {
    if (location == nullptr)
        return false;
    ChartString text(location->getValue());
    if (text.empty() || text.str().back() != u'%')
        return false;
    value = text.truncateString(1).convertToDouble();
    return true;
}

bool nearlyMeet(double a, double b) {
    return a > 0 && b > 0 && std::fabs(a - b) < 2.0;
}

void attach(GrxLocation& location, GrxBaseElement& to) {
    location.setMethod(GrxLocation::method_nextTo);
    location.setTarget(to);
    location.removeValue();
}

// Joins a title or footnote to the frames just above and below it when their edges nearly meet.
void snap(GrxLabelFrame& frame, const std::vector<GrxBaseElement*>& above,
          const std::vector<GrxBaseElement*>& below) {
    GrxBaseElement* attachedTo = nullptr;
    double top = 0;
    if (GrxLocation* own = locationOf(&frame, GrxLocation::part_top); percentOf(own, top))
        for (GrxBaseElement* neighbour : above) {
            GrxLocation* edge = locationOf(neighbour, GrxLocation::part_bottom);
            double bottom = 0;
            if (edge && edge->getMethod() == GrxLocation::method_fixed && percentOf(edge, bottom) &&
                nearlyMeet(top, bottom)) {
                attach(*own, *neighbour);
                attachedTo = neighbour;
                break;
            }
        }
    double bottom = 0;
    if (!percentOf(locationOf(&frame, GrxLocation::part_bottom), bottom))
        return;
    for (GrxBaseElement* neighbour : below) {
        GrxLocation* edge = locationOf(neighbour, GrxLocation::part_top);
        if (edge == nullptr)
            continue;
        double top = 0;
        const int method = edge->getMethod();
        if ((method == GrxLocation::method_fixed && percentOf(edge, top) && nearlyMeet(top, bottom)) ||
            (method == GrxLocation::method_nextTo && attachedTo && edge->getTarget() == attachedTo)) {
            attach(*edge, frame);
            break;
        }
    }
}

// The neighbours above and below a snapped frame; nothing for a frame that does not snap.
void snapFrame(GrxLabelFrame& frame, const GrxExtensionVis& extension, const GrxVisualization& target) {
    const std::vector<GrrUviza*> graphs = allGraphs(target);
    GrxBaseElement* graph = graphs.size() == 1 ? graphs.front() : nullptr;
    GrxBaseElement* title1 = extension.getTitle1();
    GrxBaseElement* title2 = extension.getTitle2();
    GrxBaseElement* subtitle = extension.getSubtitle();
    GrxBaseElement* footnote1 = extension.getFootnote(1);
    GrxBaseElement* footnote2 = extension.getFootnote(2);
    std::vector<GrxBaseElement*> above, below;
    if (&frame == title1)
        below = {title2, subtitle, graph};
    else if (&frame == title2)
        above = {title1}, below = {subtitle, graph};
    else if (&frame == subtitle)
        above = {title2, title1}, below = {graph};
    else if (&frame == footnote1)
        above = {graph}, below = {footnote2};
    else if (&frame == footnote2)
        above = {graph, footnote1};
    else
        return;
    const auto present = [](std::vector<GrxBaseElement*>& frames) {
        frames.erase(std::remove(frames.begin(), frames.end(), nullptr), frames.end());
    };
    present(above);
    present(below);
    snap(frame, above, below);
}

template <class Owner> GrxStyle& frameStyle(BaseTemplate& action, Owner& owner, bool* made = nullptr) {
    if (made)
        *made = owner.getStyle() == nullptr;
    return styleOf(action, owner, &Owner::getStyle, &Owner::setStyle, ChartString());
}

// The default place of a title, subtitle or footnote made without one.
std::array<const XMLCh*, 4> defaultPlace(int kind, int count) {
    if (kind == Title)
        return count <= 1 ? std::array<const XMLCh*, 4>{u"2%", u"98%", u"2%", u"20%"}
                          : std::array<const XMLCh*, 4>{u"2%", u"98%", u"20%", u"30%"};
    if (kind == Subtitle)
        return {u"2%", u"98%", u"30%", u"35%"};
    return count <= 1 ? std::array<const XMLCh*, 4>{u"2%", u"98%", u"88%", u"96%"}
                      : std::array<const XMLCh*, 4>{u"2%", u"98%", u"96%", u"99%"};
}

GrxLabelFrame* namedFrame(const GrxExtensionVis* extension, int kind, int count) {
    if (extension == nullptr)
        return nullptr;
    return kind == Title ? extension->getTitle(count) : kind == Subtitle ? extension->getSubtitle()
                                                                         : extension->getFootnote(count);
}

// Label frames that are no title, subtitle or first two footnotes (compared by id).
std::vector<GrxLabelFrame*> freeLabelFrames(const GrxVisualization& target) {
    std::vector<const XMLCh*> taken;
    if (const GrxExtensionVis* extension = target.getExtension())
        for (const GrxLabelFrame* frame : {extension->getTitle1(), extension->getTitle2(), extension->getSubtitle(),
                                           extension->getFootnote(1), extension->getFootnote(2)})
            if (frame)
                taken.push_back(frame->getId());
    std::vector<GrxLabelFrame*> found;
    for (GrxLabelFrame* frame : allOfKind<GrxLabelFrame>(target, GrxUni::_labelFrame))
        if (std::none_of(taken.begin(), taken.end(), [&](const XMLCh* id) { return same(id, frame->getId()); }))
            found.push_back(frame);
    return found;
}

bool invisible(const GrxBaseElement* frame) {
    const auto* legend = dynamic_cast<const GrxLegend*>(frame);
    return legend && legend->getStyle() && !legend->getStyle()->getVisible();
}

} // namespace

// ---- addFrame -----------------------------------------------------------------------------------------

bool TAddFrame::apply() {
    if (instruction_ == nullptr)
        return false;
    GrxExtensionVis& extension = target_.getExtension() ? *target_.getExtension() : target_.addExtension();
    const bool styleOnly = booleanAttribute(instruction_, _styleOnly, false);
    const ChartString countText = attributeOf(instruction_, GrxUni::_count);
    const bool countGiven = !countText.empty();
    int count = countText.convertToSignedInteger();
    int kind = kindOf(attributeOf(instruction_, GrxUni::_type));
    if (attributeOf(instruction_, GrxUni::_type).empty()) {
        const auto [byId, fixedCount] = kindOfFrameId(attributeOf(instruction_, _frameId));
        kind = byId;
        if (fixedCount >= 0)
            count = fixedCount;
    }
    const DOMElement* label = lastChildNamed(instruction_, GrxUni::_label);
    const DOMElement* place = lastChildNamed(instruction_, GrxUni::_location);
    const std::array<ChartString, 4> values{attributeOf(place, GrxUni::_left), attributeOf(place, GrxUni::_right),
                                            attributeOf(place, GrxUni::_top), attributeOf(place, GrxUni::_bottom)};
    const bool allFour = std::none_of(values.begin(), values.end(), [](const ChartString& v) { return v.empty(); });
    const bool relocate = allFour && !styleOnly && !extension.getPreserveLocations();
    const DOMElement *mainStyle = nullptr, *style1 = nullptr, *style2 = nullptr;
    for (const DOMElement* style : childrenNamed(instruction_, GrxUni::_style)) {
        const std::uint32_t number = unsignedAttribute(style, GrxUni::_number);
        (number == 1 ? style1 : number == 2 ? style2 : mainStyle) = style;
    }

    GrxStyle *mainTarget = nullptr, *target1 = nullptr, *target2 = nullptr;
    std::array<GrxLocation*, 4> fresh{};
    const auto replaceLocations = [&](auto& frame) {
        if (!relocate)
            return;
        frame.removeLocations();
        for (int part = 0; part < 4; ++part)
            fresh[part] = &frame.addLocation(part);
    };
    GrxLabelFrame* snapped = nullptr;
    GrxLegend* legend = nullptr;

    switch (kind) {
    case Title:
    case Subtitle:
    case Footnote: {
        GrxLabelFrame* frame = namedFrame(&extension, kind, count);
        bool made = false;
        if (!frame && !styleOnly && label && !namedFrame(source_ ? source_->getExtension() : nullptr, kind, count)) {
            frame = &target_.addLabelFrame();
            frame->setId(CreateUniqueId(ChartString(kind == Title ? "title" : kind == Subtitle ? "frame_subtitle_1" : "footnote")));
            if (kind == Title)
                extension.setTitle(*frame, count);
            else if (kind == Subtitle)
                extension.setSubtitle(*frame);
            else
                extension.setFootnote(*frame, count);
            if (!allFour) {
                const std::array<const XMLCh*, 4> at = defaultPlace(kind, count);
                for (int part = 0; part < 4; ++part) {
                    GrxLocation& location = frame->addLocation(part);
                    location.setMethod(GrxLocation::method_fixed);
                    location.setValue(at[part]);
                }
            }
        }
        if (frame == nullptr)
            return true;
        mainTarget = &frameStyle(*this, *frame, &made);
        if (made)
            mainTarget->setColor2(GrxStyle::_transparent);
        if (!styleOnly) {
            replaceLocations(*frame);
            if (label)
                mergeText(label, frame->getLabel() ? *frame->getLabel() : frame->addLabel());
        }
        if (frame->getLabel())
            styleLabel(*frame->getLabel(), label);
        snapped = frame;
        break;
    }
    case Legend: {
        legend = extension.getLegend(count);
        if (legend == nullptr)
            return false;
        if (relocate) {
            legend->removeLocations();
            if (auto* holder = GrxBaseElement::wrapperOf<GrxContainer>(legend->getImplementation()->getParentNode())) {
                target_.reparentContainerChildren(*holder);
                if ((legend = extension.getLegend(count)) == nullptr)
                    return false;
            }
            for (int part = 0; part < 4; ++part)
                fresh[part] = &legend->addLocation(part);
        }
        mainTarget = &frameStyle(*this, *legend);
        target1 = &styleOf(*this, *legend, &GrxLegend::getTickTextStyle, &GrxLegend::setTickTextStyle, ChartString());
        target2 = &styleOf(*this, *legend, &GrxLegend::getTickFrameStyle, &GrxLegend::setTickFrameStyle, ChartString());
        if (legend->getLabel())
            styleLabel(*legend->getLabel(), label);
        break;
    }
    case Summary:
        if (GrxLabelFrame* frame = extension.getStatisticsSummary(count)) {
            replaceLocations(*frame);
            mainTarget = &frameStyle(*this, *frame);
            if (frame->getLabel())
                styleLabel(*frame->getLabel(), label);
        }
        break;
    case Visualization: {
        if (source_ == nullptr || source_->getLocations().empty())
            replaceLocations(target_);
        mainTarget = &frameStyle(*this, target_);
        for (GrxStyle* style : target_.getStyles())
            if (same(style->getId(), ChartBase::_container))
                target1 = style;
        if (target1 == nullptr) {
            target1 = &target_.addStyle();
            target1->setId(ChartBase::_container);
        }
        break;
    }
    case Graph: {
        std::vector<GrrUviza*> graphs;
        getGraphs(graphs);
        if (!countGiven) {
            for (GrrUviza* graph : graphs) {
                GrxStyle& own = frameStyle(*this, *graph);
                GrxStyle& cell = styleOf(*this, *graph, &GrrUviza::getCellStyle, &GrrUviza::setCellStyle, ChartString());
                const DOMElement* cellStyle = isGraphPolar(*graph) ? style2 : style1;
                if (cellStyle)
                    importStyle(cellStyle, cell);
                if (mainStyle)
                    importStyle(mainStyle, own);
            }
            return true;
        }
        if (count < 0 || graphs.size() < static_cast<std::size_t>(count) || graphs.empty() ||
            (count == 0 && graphs.size() > 1))
            return false;
        GrrUviza& graph = *graphs[count == 0 ? 0 : count - 1];
        if (!extension.getPreserveLocations() && !styleOnly)
            for (int part = 0; part < 4; ++part) {
                if (values[part].empty())
                    continue;
                for (GrxLocation* old : graph.getLocations())
                    if (old->getPart() == part)
                        graph.removeLocation(*old);
                fresh[part] = &graph.addLocation(part);
            }
        mainTarget = &frameStyle(*this, graph);
        GrxStyle& cell = styleOf(*this, graph, &GrrUviza::getCellStyle, &GrrUviza::setCellStyle, ChartString());
        (isGraphPolar(graph) ? target2 : target1) = &cell;
        break;
    }
    case Container:
    case Control: {
        const std::vector<DOMNode*> nodes =
            nodesNamed(target_, kind == Container ? GrxUni::_container : GrxControlFrame::getElementName());
        if (count < 1 || nodes.size() < static_cast<std::size_t>(count))
            break;
        if (auto* container = GrxBaseElement::wrapperOf<GrxContainer>(nodes[count - 1])) {
            replaceLocations(*container);
            mainTarget = &frameStyle(*this, *container);
        } else if (auto* control = GrxBaseElement::wrapperOf<GrxControlFrame>(nodes[count - 1])) {
            replaceLocations(*control);
            mainTarget = &frameStyle(*this, *control);
        }
        break;
    }
    default: {
        if (styleOnly && count >= 2)
            return false;
        GrxLabelFrame* frame = nullptr;
        if (label == nullptr) {
            const std::vector<GrxLabelFrame*> free = freeLabelFrames(target_);
            if (free.size() != 1)
                return false;
            frame = free.front();
        } else {
            frame = &target_.addLabelFrame();
            frame->setId(CreateUniqueId(ChartString(GrxUni::_labelFrame)));
            int number = 1;
            while (extension.getText(number))
                ++number;
            extension.setText(*frame, number);
            if (!allFour) {
                for (const int part : {GrxLocation::part_left, GrxLocation::part_top}) {
                    GrxLocation& location = frame->addLocation(part);
                    location.setMethod(GrxLocation::method_fixed);
                    location.setValue(u"50%");
                }
                for (const int part : {GrxLocation::part_width, GrxLocation::part_height})
                    frame->addLocation(part).setMethod(GrxLocation::method_content);
            }
        }
        mainTarget = &frameStyle(*this, *frame);
        replaceLocations(*frame);
        if (!frame->getLabel() && label)
            mergeText(label, frame->addLabel());
        if (frame->getLabel())
            styleLabel(*frame->getLabel(), label);
        break;
    }
    }

    for (int part = 0; part < 4; ++part)
        if (fresh[part] && !values[part].empty()) {
            fresh[part]->setValue(values[part]);
            fresh[part]->setMethod(GrxLocation::method_fixed);
        }
    if (snapped)
        snapFrame(*snapped, extension, target_);
    if (style1 && target1)
        importStyle(style1, *target1);
    if (style2 && target2)
        importStyle(style2, *target2);
    if (mainStyle && mainTarget)
        importStyle(mainStyle, *mainTarget);

    // A hidden legend gives its room to the only graph, unless the other legend still shows.
    if (legend && mainTarget && !mainTarget->getVisible()) {
        const GrxLegend* other = extension.getLegend(count == 1 ? 2 : 1);
        const std::vector<GrrUviza*> graphs = allGraphs(target_);
        GrxLocation* from = locationOf(legend, GrxLocation::part_right);
        GrxLocation* to = graphs.size() == 1 ? locationOf(graphs.front(), GrxLocation::part_right) : nullptr;
        if ((other == nullptr || invisible(other)) && from && to && hasText(from->getValue()))
            to->setValue(ChartString(from->getValue()));
    }
    return true;
}

// ---- hideFrame ----------------------------------------------------------------------------------------

THideFrame::THideFrame(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), count_(unsignedAttribute(instruction, GrxUni::_count)) {
    const int kind = kindOf(attributeOf(instruction, GrxUni::_type));
    kind_ = kind <= Summary || kind == Graph || kind == LabelFrame || kind == Container ? kind : Other;
}

bool THideFrame::apply() {
    const auto hide = [this](auto* frame) {
        if (frame)
            frameStyle(*this, *frame).setVisible(false);
    };
    const GrxExtensionVis* extension = target_.getExtension();
    const int count = static_cast<int>(std::min<std::uint32_t>(count_, 0x7fffffff));
    switch (kind_) {
    case Title:
    case Subtitle:
    case Footnote:
        hide(namedFrame(extension, kind_, count));
        break;
    case Legend:
        hide(extension ? extension->getLegend(count) : nullptr);
        break;
    case Summary:
        hide(extension ? extension->getStatisticsSummary(count) : nullptr);
        for (GrxLabelFrame* frame : allOfKind<GrxLabelFrame>(target_, GrxUni::_labelFrame))
            if (ChartString(frame->getId()).ContainsString(kSummaryId))
                hide(frame);
        break;
    case Graph: {
        std::vector<GrrUviza*> graphs;
        getGraphs(graphs);
        if (count_ >= 1 && count_ <= graphs.size())
            hide(graphs[count_ - 1]);
        break;
    }
    case LabelFrame:
    case Container: {
        std::vector<GrxBaseElement*> frames;
        if (kind_ == LabelFrame)
            for (GrxLabelFrame* frame : freeLabelFrames(target_))
                frames.push_back(frame);
        else
            for (GrxContainer* container : allOfKind<GrxContainer>(target_, GrxUni::_container))
                frames.push_back(container);
        for (std::size_t i = 0; i < frames.size(); ++i) {
            if (count_ != 0 && count_ != i + 1)
                continue;
            if (auto* frame = dynamic_cast<GrxLabelFrame*>(frames[i]))
                hide(frame);
            else
                hide(dynamic_cast<GrxContainer*>(frames[i]));
        }
        break;
    }
    default:
        break;
    }
    return false;
}

// ---- addHistogramSummaryFrame ----------------------------------------------------------------------

ChartString summaryLabel(ChartString word) {
    word.replaceSubstring(ChartString(u"\\n"), ChartString(u"\n"));
    return word.append(u" ");
}

void TAddHistogramSummaryFrame::loadLabels() {
    if (loaded_)
        return;
    loaded_ = true;
    mean_ = summaryLabel(chartWord("histoMean"));
    stdDev_ = summaryLabel(chartWord("histoStdDev"));
    n_ = summaryLabel(chartWord("histoN"));
    days_ = ChartString(u" ").append(chartWord("days"));
}

bool TAddHistogramSummaryFrame::apply() {
    if (const GrxExtensionVis* extension = target_.getExtension();
        extension && ChartString(extension->getHistogramStatistic()).equals(GrxUni::_none))
        return false;
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    if (graphs.size() > 1) {
        for (const GrrUviza* graph : graphs)
            total_ += getElementsWithSummaryStatistics(*graph).size();
        if (total_ > 1 && target_.getContainers().empty())
            target_.addContainer().setId(CreateUniqueId(ChartString("container_")));
    }
    const auto digits = [](const GrxFormat* format, long long more) {
        const long long own = format ? format->getMaximumFractionDigits() : 0;
        return static_cast<int>(std::clamp(own + more, 0LL, 16LL));
    };
    for (GrrUviza* graph : graphs) {
        if (graph->getFaceting())
            continue;
        for (CTElementType* element : getElementsWithSummaryStatistics(*graph)) {
            if (element->getBinStatistics().empty())
                continue;
            loadLabels();
            const GrxFormat* xFormat = nullptr;
            if (const CTCoordinate* x = element->getX(); x && x->getVariable() && !x->getVariable()->getFormats().empty())
                xFormat = x->getVariable()->getFormats().front();

            const std::vector<GrxContainer*> containers = target_.getContainers();
            GrxLabelFrame& frame = containers.empty() ? target_.addLabelFrame() : containers.front()->addLabelFrame();
            frame.setId(CreateUniqueId(ChartString(kSummaryId)));
            GrxExtensionVis& extension = target_.getExtension() ? *target_.getExtension() : target_.addExtension();
            int number = 1;
            while (extension.getStatisticsSummary(number))
                ++number;
            extension.setStatisticsSummary(frame, number);
            GrxLabel& label = frame.addLabel();

            if (total_ > 1) {
                ChartString axisTitles;
                for (const GrxDimension* dimension : getDimensionsByRole(*graph, ChartString(GrxUni::_x)))
                    for (const GrxAxis* axis : dimension->getAxiss())
                        if (const GrxLabel* title = axis->getLabel())
                            axisTitles.append(title->getAllText());
                if (!axisTitles.empty())
                    label.addText().setText(axisTitles);
            }

            GrxDescriptionGroup& group = label.addDescriptionGroup();
            group.setSeparator(u"\n \n");
            group.setTarget(*element);
            group.addDescription().setKind(1);
            group.addText().setText(mean_);
            GrxDescription& mean = group.addDescription();
            mean.setKind(5);
            GrxFormat& meanFormat = mean.addFormat();
            if (xFormat)
                duplicateAttributes(*xFormat, meanFormat);
            meanFormat.setMaximumFractionDigits(digits(xFormat, 2));
            group.addText().setText(stdDev_);
            GrxDescription& spread = group.addDescription();
            spread.setKind(7);
            GrxFormat& spreadFormat = spread.addFormat();
            // A date's spread is a span of time, shown in days.
            if (xFormat && xFormat->getBaseFormat() != 0) {
                spreadFormat.setScalingFactor(86400.0);
                spreadFormat.setSuffix(days_);
            } else {
                if (xFormat)
                    duplicateAttributes(*xFormat, spreadFormat);
                spreadFormat.setMaximumFractionDigits(digits(xFormat, 3));
            }
            group.addText().setText(n_);
            group.addDescription().setKind(6);
        }
    }
    return !graphs.empty();
}

const ActionFamily family{{u"addFrame", "TAddFrame", makeAction<TAddFrame>},
                          {u"hideFrame", "THideFrame", makeAction<THideFrame>},
                          {u"addHistogramSummaryFrame", "TAddHistogramSummaryFrame",
                           makeAction<TAddHistogramSummaryFrame>}};

} // namespace plotaid::detail
