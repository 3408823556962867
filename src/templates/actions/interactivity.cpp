// Histogram and scatterplot bins, error bar options, popups and drill-downs.
#include "templates/actions/interactivity.h"

#include "templates/Localise.h"

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLChar.hpp>

#include <cctype>
#include <cstdint>
#include <string>
#include <vector>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

// Start, width and count onto a bin statistic; of width and count only the first given counts.
void setBins(GrxBinStatistic& bins, const ChartString& start, const ChartString& width, const ChartString& count,
             bool countFirst) {
    if (!start.empty())
        bins.setBinStart(start);
    const bool useCount = !count.empty() && (countFirst || width.empty());
    if (useCount)
        bins.setBinCount(count);
    else if (!width.empty())
        bins.setBinWidth(width);
}

ChartString overridden(const DOMElement* instruction, const XMLCh* name, const ChartString& value) {
    const ChartString given = attributeOf(instruction, name);
    return given.empty() ? value : given;
}

} // namespace

// ---- setHistogramBinning --------------------------------------------------------------------------

THistogramBinning::THistogramBinning(const GrxVisualization* source, GrxVisualization& target,
                                     const DOMElement* instruction)
    : BaseTemplate(source, target, instruction) {
    for (const DOMElement* parameter : descendantsNamed(instruction_, GrxUni::_parameter)) {
        const ChartString name = attributeOf(parameter, GrxUni::_name);
        ChartString* value = name.equals(u"start")       ? &start_
                             : name.equals(u"bin-width") ? &width_
                             : name.equals(u"bin-count") ? &count_
                                                         : nullptr;
        if (value != nullptr)
            *value = attributeOf(parameter, GrxUni::_value);
    }
    start_ = overridden(instruction_, GrxBinStatistic::_binStart, start_);
    width_ = overridden(instruction_, GrxBinStatistic::_binWidth, width_);
    count_ = overridden(instruction_, GrxBinStatistic::_binCount, count_);
}

bool THistogramBinning::apply() {
    for (GrrUviza* graph : allGraphs(target_))
        for (CTElementType* element : getElementsWithSummaryStatistics(*graph)) {
            if (element->getBinStatistics().empty())
                continue;
            const int method = element->getSummaryStatistics().front()->getMethod();
            element->removeBinStatistics();
            element->removeSummaryStatistics();
            GrxBinStatistic& bins = element->addBinStatistic();
            element->addSummaryStatistic().setMethod(method);
            setBins(bins, start_, width_, count_, false);
        }
    // The instruction is never reported as applied, whatever it changed.
    return false;
}

// ---- setErrorBarOptions ---------------------------------------------------------------------------

bool TSetErrorBarOptions::apply() {
    forEachGraphElements(target_, [&](const std::vector<CTElementType*>& elements) {
        for (CTElementType* element : elements) {
            if (!isIntervalRangeElement(*element))
                continue;
            GrxStyle& style = styleOf(*this, *element, &CTElementType::getStyle, &CTElementType::setStyle, {});
            if (style_ != nullptr)
                importStyle(style_, style);
            style.setVisible(visible_);
        }
    });
    return true;
}

// ---- addPopups ------------------------------------------------------------------------------------

namespace {

ChartString axisTitle(const GrxCoordinates* coordinates, std::size_t dimension) {
    const std::vector<GrxDimension*> dimensions =
        coordinates ? coordinates->getDimensions() : std::vector<GrxDimension*>();
    if (dimension >= dimensions.size())
        return {};
    const std::vector<GrxAxis*> axes = dimensions[dimension]->getAxiss();
    const GrxLabel* label = axes.empty() ? nullptr : axes.front()->getLabel();
    const std::vector<CTTextType*> texts = label ? label->getTexts() : std::vector<CTTextType*>();
    return texts.empty() ? ChartString() : texts.front()->getText();
}

class PopupText {
public:
    explicit PopupText(GrxPopup& popup) : popup_(popup) {}
    // One "title = $[n]$" part; its token mapping, numbered n.
    GrxTokenMapping& part(const ChartString& title, CTVariableType* variable) {
        if (n_ > 1)
            text_.append(u"\n");
        text_.append(title).append(u" = $[").appendInteger(n_).append(u"]$");
        GrxTokenMapping& mapping = popup_.addTokenMapping();
        mapping.setToken(n_++);
        if (variable != nullptr)
            mapping.setVariable(*variable);
        return mapping;
    }
    const ChartString& text() const { return text_; }

private:
    GrxPopup& popup_;
    ChartString text_;
    int n_ = 1;
};

void summarise(GrxTokenMapping& mapping, bool asIs) {
    if (asIs)
        mapping.addSummaryStatistic().setMethod(0);
}

} // namespace

bool TAddPopups::apply() {
    const std::vector<GrxLegend*> legends = getLegends();
    for (GrrUviza* graph : allGraphs(target_)) {
        const std::vector<GrxCoordinates*> all = graph->getCoordinatess();
        const GrxCoordinates* coordinates = all.empty() ? nullptr : all.front();
        const ChartString titles[3] = {axisTitle(coordinates, 0), axisTitle(coordinates, 1), axisTitle(coordinates, 2)};
        for (CTElementType* element : elementsOf(*graph)) {
            if (element->getCoordinates() != nullptr && element->getCoordinates() != coordinates)
                continue;
            GrxPopup& popup = target_.addPopup(*element);
            PopupText text(popup);
            CTVariableType* x = getElementVariable(*element, ChartString(GrxUni::_x));
            CTVariableType* y = getElementVariable(*element, ChartString(GrxUni::_y));
            CTVariableType* z = getElementVariable(*element, ChartString(GrxUni::_z));
            if (x_ && x != nullptr)
                summarise(text.part(titles[0], x), x->getCategorical() == 0);
            // y asks for method 0 when categorical where x, z and the legend ask when not: kept as
            // the popup format has it.
            if (y_ && (y != nullptr || x != nullptr)) {
                GrxTokenMapping& mapping = text.part(titles[1], y != nullptr ? y : x);
                GrxSummaryStatistic& summary = mapping.addSummaryStatistic();
                if (y == nullptr)
                    summary.setMethod(10);
                else if (y->getCategorical() != 0)
                    summary.setMethod(0);
            }
            if (z_ && z != nullptr)
                summarise(text.part(titles[2], z), z->getCategorical() == 0);
            if (legend_)
                for (const GrxLegend* legend : legends)
                    for (const GrxLegendTarget* target : legend->getLegendTargets()) {
                        auto* variable = GrxBaseElement::wrapperOf<CTVariableType>(
                            target_.getElementById(target->GetAttribute(GrxUni::_variable)));
                        if (dynamic_cast<GrxSourceVariable*>(variable) == nullptr &&
                            dynamic_cast<GrxExpressionVariable*>(variable) == nullptr)
                            continue;
                        const GrxLabel* label = legend->getLabel();
                        summarise(text.part(label ? label->getAllText() : ChartString(), variable),
                                  variable->getCategorical() == 0);
                    }
            popup.setTokenTemplate(text.text());
        }
    }
    return true;
}

// ---- addDrillDown ---------------------------------------------------------------------------------

namespace {

const XMLCh* const kInteractions[] = {GrxUni::_onClick, GrxUni::_onMouseDown, GrxUni::_onMouseUp,
                                      GrxUni::_onMouseOver, GrxUni::_onMouseOut};
const XMLCh* const kTargets[] = {u"axisLabel", u"element", GrxUni::_legend, u"legendLabel", GrxUni::_majorTicks,
                                 GrxUni::_label};
const XMLCh* const kFlags[] = {GrxUni::_coordinates, u"facet", u"cases", u"part", u"numericValue", u"ticks",
                               u"aesthetics", u"class", u"popup", u"metaValue", u"parameters", u"attach"};

// The position from 1 of `word` in `words`; 0 when it is none of them.
template <std::size_t N> int positionOf(const XMLCh* const (&words)[N], const ChartString& word) {
    for (std::size_t k = 0; k < N; ++k)
        if (word.equals(words[k]))
            return static_cast<int>(k) + 1;
    return 0;
}

} // namespace

bool TAddDrilldowns::apply() {
    if (instruction_ == nullptr)
        return false;
    const int interaction = positionOf(kInteractions, attributeOf(instruction_, GrxUni::_interactionType));
    const int kind = positionOf(kTargets, attributeOf(instruction_, GrxUni::_target));
    const std::uint32_t count = unsignedAttribute(instruction_, GrxUni::_count);
    const ChartString role = attributeOf(instruction_, GrxUni::_role);
    const ChartString function = attributeOf(instruction_, GrxUni::_function);
    const ChartString meta = attributeOf(instruction_, u"meta");

    std::vector<ChartString> ids;
    const auto collect = [&](GrxBaseElement& target, const char* prefix) {
        if (!target.isIdPresent())
            target.setId(CreateUniqueId(std::string(prefix)));
        ids.emplace_back(target.getId());
    };
    const auto axes = [&](const GrrUviza& graph, const auto& each) {
        for (const XMLCh* r : {GrxUni::_x, GrxUni::_y, GrxUni::_z}) {
            if (!role.empty() && !role.equals(r))
                continue;
            for (GrxDimension* dimension : getDimensionsByRole(graph, ChartString(r))) {
                const std::vector<GrxAxis*> list = dimension->getAxiss();
                for (std::size_t k = 1; k <= list.size(); ++k)
                    if (selects(count, k))
                        each(*list[k - 1]);
            }
        }
    };
    const int order[] = {1, 2, 4, 3, 5, 6};
    for (GrrUviza* graph : allGraphs(target_))
        for (int wanted : order) {
            if (kind != 0 && kind != wanted)
                continue;
            if (wanted == 1)
                axes(*graph, [&](GrxAxis& axis) {
                    if (GrxLabel* label = axis.getLabel())
                        collect(*label, "label");
                });
            if (wanted == 5)
                axes(*graph, [&](GrxAxis& axis) {
                    for (GrxMajorTicks* ticks : axis.getMajorTickss())
                        collect(*ticks, "majorTicks");
                });
            if (wanted == 2) {
                const std::vector<CTElementType*> elements = elementsOf(*graph);
                for (std::size_t k = 1; k <= elements.size(); ++k)
                    if (selects(count, k))
                        collect(*elements[k - 1], "legend"); // the prefix the drill-down format uses
            }
            // Legends and labels belong to the chart, not to one graph: taken with the first.
            if (graph != allGraphs(target_).front())
                continue;
            if (wanted == 3) {
                std::size_t k = 0;
                for (GrxLegend* legend : getLegends())
                    for (GrxLegendTarget* target : legend->getLegendTargets())
                        if (selects(count, ++k))
                            collect(*target, "legendTarget");
            }
            if (wanted == 4)
                for (GrxLegend* legend : getLegends())
                    if (GrxLabel* label = legend->getLabel())
                        collect(*label, "label");
            if (wanted == 6)
                for (GrxLabelFrame* frame : allOfKind<GrxLabelFrame>(target_, GrxUni::_labelFrame))
                    if (GrxLabel* label = frame->getLabel())
                        collect(*label, "label");
        }

    for (const ChartString& id : ids) {
        GrxExtensionVis& extension = target_.addExtension();
        extension.setAttribute(GrxDrillDown::getElementName(), GrxUni::_true);
        extension.setAttribute(GrxUni::_target, id);
        if (!function.empty())
            extension.setAttribute(GrxUni::_function, function);
        if (interaction != 0)
            extension.setAttribute(GrxUni::_interactionType, kInteractions[interaction - 1]);
        if (!meta.empty())
            extension.setAttribute(u"meta", meta);
        for (const XMLCh* flag : kFlags)
            if (getBooleanAttribute(instruction_, flag, false))
                extension.setAttribute(flag, GrxUni::_true);
    }
    return true;
}

// ---- setScatterplotBinning ------------------------------------------------------------------------

bool isDarkColor(const ChartString& color) {
    static const char* const kDark[] = {
        "black", "blue", "brown", "red", "blueviolet", "chocolate", "crimson", "darkblue", "darkcyan",
        "darkgreen", "darkmagenta", "darkolivegreen", "darkorchid", "darkred", "darkslateblue", "darkslategray",
        "darkslategrey", "darkviolet", "deeppink", "dimgray", "dimgrey", "dodgerblue", "firebrick", "forestgreen",
        "fuchsia", "green", "indianred", "indigo", "magenta", "maroon", "mediumblue", "mediumvioletred",
        "midnightblue", "navy", "olive", "olivedrab", "orangered", "purple", "royalblue", "saddlebrown",
        "seagreen", "sienna", "slateblue", "slategray", "slategrey", "steelblue", "teal"};
    std::string text = color.toUTF8();
    for (char& c : text)
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    for (const char* name : kDark)
        if (text == name)
            return true;
    if (text.size() != 7 || text[0] != '#')
        return false;
    for (std::size_t k = 1; k < 7; ++k)
        if (!std::isxdigit(static_cast<unsigned char>(text[k])))
            return false;
    const auto part = [&](std::size_t at) { return std::stoi(text.substr(at, 2), nullptr, 16); };
    return 0.3 * part(1) + 0.55 * part(3) + 0.15 * part(5) < 127.5;
}

TSetScatterplotBinning::TSetScatterplotBinning(const GrxVisualization* source, GrxVisualization& target,
                                               const DOMElement* instruction)
    : BaseTemplate(source, target, instruction),
      legendStyle_(firstDescendantNamed(firstChildNamed(instruction_, _legendStyle), GrxUni::_style)),
      legendFrameStyle_(firstDescendantNamed(firstChildNamed(instruction_, _legendFrameStyle), GrxUni::_style)),
      legendLabelStyle_(firstDescendantNamed(firstChildNamed(instruction_, _legendLabelStyle), GrxUni::_style)),
      label_(firstChildNamed(instruction_, GrxUni::_label)), size_(booleanAttribute(instruction_, GrxUni::_size, false)),
      method_(attributeOf(instruction_, GrxUni::_method)), count_(attributeOf(instruction_, GrxBinStatistic::_binCount)),
      width_(attributeOf(instruction_, GrxBinStatistic::_binWidth)),
      start_(attributeOf(instruction_, GrxBinStatistic::_binStart)),
      location_(attributeOf(instruction_, GrxUni::_location)), gridType_(attributeOf(instruction_, GrxUni::_gridType)),
      high_(attributeOf(instruction_, GrxUni::_high)), low_(attributeOf(instruction_, GrxUni::_low)) {
    for (const DOMElement* parameter : childrenNamed(instruction_, GrxUni::_parameter)) {
        const ChartString name = attributeOf(parameter, GrxUni::_name);
        const ChartString value = attributeOf(parameter, GrxUni::_value);
        if (name.equals(GrxUni::_grid) && (value.equals(GrxUni::_hex) || value.equals(GrxUni::_square)))
            gridType_ = value;
        else if (name.equals(GrxUni::_location) && (value.equals(GrxUni::_grid) || value.equals(GrxUni::_centroid)))
            location_ = value;
    }
}

CTVariableType* TSetScatterplotBinning::binnedVariable(const CTElementType& point) const {
    const CTCoordinate* x = point.getX();
    CTVariableType* variable = x ? x->getVariable() : nullptr;
    if (dynamic_cast<GrxSourceVariable*>(variable) != nullptr)
        return variable;
    const auto* expression = dynamic_cast<GrxExpressionVariable*>(variable);
    if (expression == nullptr)
        return nullptr;
    // The longest leading name of the expression (never the whole of it) names the variable.
    std::u16string text = ChartString(expression->getValue()).str();
    if (!text.empty())
        text.pop_back();
    while (!text.empty() && !XMLChar1_0::isValidNCName(text.c_str(), text.size()))
        text.pop_back();
    if (text.empty())
        return nullptr;
    return GrxBaseElement::wrapperOf<GrxSourceVariable>(target_.getElementById(text.c_str()));
}

void TSetScatterplotBinning::addLegend(GrrUviza& graph, std::size_t position, GrxBaseElement& aesthetic,
                                       CTVariableType& variable) {
    GrxExtensionVis* extension = target_.getExtension();
    if (extension == nullptr)
        extension = &target_.addExtension();
    ChartString slotName(u"frameLegendBin");
    if (position != 0)
        slotName.appendInteger(static_cast<long long>(position));
    // An id that names no legend gets a new one rather than none.
    GrxLegend* legend = GrxBaseElement::wrapperOf<GrxLegend>(target_.getElementById(extension->GetAttribute(slotName.xc_str())));
    if (legend == nullptr) {
        const std::vector<GrxContainer*> containers = target_.getContainers();
        GrxContainer* holder = nullptr;
        for (GrxContainer* container : containers)
            if (!container->getLocations().empty()) {
                holder = container;
                break;
            }
        legend = holder ? &holder->addLegend() : &target_.addLegend();
        legend->setId(CreateUniqueId(ChartString(GrxUni::_legend)));
        extension->setAttribute(slotName.xc_str(), legend->getId());
        const auto place = [&](int part, int method, GrxBaseElement* target) -> GrxLocation& {
            GrxLocation& location = legend->addLocation(part);
            location.setMethod(method);
            if (target != nullptr)
                location.setTarget(*target);
            return location;
        };
        using Part = grx::LocationPart;
        using Method = grx::LocationMethod;
        place(Part::width, Method::content, nullptr);
        place(Part::height, Method::content, nullptr);
        if (holder != nullptr) {
            place(Part::left, Method::sameEdge, holder);
            const std::vector<GrxLegend*> legends = holder->getLegends(); // the new one included
            const std::vector<GrxLabelFrame*> labels = holder->getLabelFrames();
            if (legends.size() - 1 < 2) {
                if (!labels.empty())
                    place(Part::top, Method::nextTo, labels.back());
                else
                    place(Part::top, Method::sameEdge, holder);
            } else {
                place(Part::top, Method::nextTo, legends[legends.size() - 3]);
            }
        } else {
            // Registered once, after the highest slot in use, so frame packing finds it.
            GrxLegend* existing = nullptr;
            for (int slot = 10; slot >= 0 && existing == nullptr; --slot)
                existing = extension->getLegend(slot);
            int free = 1;
            for (int slot = 0; slot <= 12; ++slot)
                if (extension->getLegend(slot) != nullptr)
                    free = slot + 1;
            extension->setLegend(*legend, free > 12 ? 12 : free);
            if (existing != nullptr) {
                place(Part::left, Method::sameEdge, existing);
                place(Part::top, Method::nextTo, existing);
            } else {
                place(Part::left, Method::fixed, nullptr).setValue(ChartString(u"75%"));
                place(Part::top, Method::sameEdge, &graph);
                for (GrxLocation* location : graph.getLocations())
                    if (location->getPart() == Part::right)
                        graph.removeLocation(*location);
                GrxLocation& right = graph.addLocation(Part::right);
                right.setMethod(Method::nextTo);
                right.setTarget(*legend);
            }
        }
    }

    const auto dressed = [&](GrxStyle* (GrxLegend::*get)() const, void (GrxLegend::*set)(GrxStyle&),
                             const XMLCh* color, const DOMElement* declaration) {
        GrxStyle* style = (legend->*get)();
        if (style == nullptr) {
            style = &addStyle(*legend, nullptr);
            style->setColor(ChartString(color));
            style->setColor2(ChartString(GrxStyle::_transparent));
            (legend->*set)(*style);
        }
        if (declaration != nullptr)
            importStyle(declaration, *style);
    };
    dressed(&GrxLegend::getStyle, &GrxLegend::setStyle, GrxStyle::_transparent, legendStyle_);
    dressed(&GrxLegend::getTickFrameStyle, &GrxLegend::setTickFrameStyle, GrxStyle::_transparent, legendFrameStyle_);
    dressed(&GrxLegend::getTickTextStyle, &GrxLegend::setTickTextStyle, GrxStyle::_black, legendLabelStyle_);

    if (legend->getLabel() == nullptr) {
        GrxLabel& label = legend->addLabel();
        if (label_ != nullptr)
            mergeText(label_, label);
        else
            label.addText().setText(chartWord("Scale"));
    }
    if (label_ != nullptr)
        styleLabel(*legend->getLabel(), label_);
    GrxLegendTarget& target = legend->addLegendTarget(aesthetic);
    target.setId(CreateUniqueId(ChartString(GrxUni::_legendTarget)));
    target.setVariable(variable);
}

void TSetScatterplotBinning::addSize(GrrUviza& graph, std::size_t position, GrxPoint& point) {
    CTVariableType* variable = binnedVariable(point);
    if (variable == nullptr || !point.getSizes().empty())
        return;
    GrxSize& size = point.addSize();
    size.setId(CreateUniqueId(ChartString(GrxUni::_size)));
    size.setVariable(*variable);
    size.addSummaryStatistic().setMethod(10);
    ChartString preferred, minimum, maximum;
    if (const GrxStyle* style = point.getStyle())
        style->getSize(&preferred, &minimum, &maximum);
    size.setLow(!low_.empty() ? low_ : !minimum.empty() ? minimum : ChartString(u"1pt"));
    size.setHigh(!high_.empty()      ? high_
                 : !maximum.empty()  ? maximum
                 : !preferred.empty() ? preferred
                                      : ChartString(u"5pt"));
    if (GrxStyle* style = point.getStyle())
        style->setColor(point.getColors().empty() ? ChartString(style->getColor2()) : ChartString(GrxStyle::_transparent));
    addLegend(graph, position, size, *variable);
}

void TSetScatterplotBinning::addColorComponent(GrrUviza& graph, std::size_t position, GrxPoint& point) {
    CTVariableType* variable = binnedVariable(point);
    if (variable == nullptr)
        return;
    GrxStyle& style = styleOf(*this, static_cast<CTElementType&>(point), &CTElementType::getStyle,
                              &CTElementType::setStyle, {});
    const bool colored = !point.getColors().empty();
    const auto unset = [](const XMLCh* color) { return !hasText(color) || same(color, GrxStyle::_transparent); };
    if (!colored) {
        if (unset(style.getColor()))
            style.setColor(ChartString(style.getColor2()));
        if (unset(style.getColor2()))
            style.setColor2(ChartString(GrxStyle::_black));
    }
    for (GrxColor* color : point.getColors())
        color->setAffect(grx::Affect::both);

    GrxColorComponent& component = point.addColorComponent();
    component.setId(CreateUniqueId(ChartString(GrxUni::_colorComponent)));
    component.setVariable(*variable);
    component.addSummaryStatistic().setMethod(10);
    ChartString lo = low_.empty() ? ChartString(u"0.1") : low_, hi = high_.empty() ? ChartString(u"0.9") : high_;
    if (hi.convertToDouble() < lo.convertToDouble())
        std::swap(lo, hi);
    // Light on dark: the scale runs from the high setting down.
    const bool reversed = colored || isDarkColor(ChartString(style.getColor()));
    component.setType(reversed ? 3 : 2);
    component.setLow(reversed ? hi : lo);
    component.setHigh(reversed ? lo : hi);
    component.setAffect(grx::Affect::none);
    addLegend(graph, position, component, *variable);
    if (colored)
        style.setColor(ChartString(GrxStyle::_black));
    else
        changeColor2ToColor(point, true);
}

bool TSetScatterplotBinning::apply() {
    if (instruction_ == nullptr)
        return false;
    for (GrrUviza* graph : allGraphs(target_)) {
        const bool threeD = isChartTrue3D(*graph);
        const bool hasY = !getDimensionsByRole(*graph, ChartString(GrxUni::_y)).empty();
        std::vector<CTElementType*> elements;
        getAllElements(*graph, elements);
        for (std::size_t p = 0; p < elements.size(); ++p) {
            CTElementType& element = *elements[p];
            auto* point = dynamic_cast<GrxPoint*>(&element);
            const bool line = dynamic_cast<GrxLine*>(&element) != nullptr && element.getSmoothStatistics().empty();
            if (point == nullptr && !line)
                continue;
            element.removeBinStatistics();
            GrxBinStatistic& bins = element.addBinStatistic();
            if (gridType_.equals(GrxUni::_hex) && !threeD)
                bins.setGridType(grx::GridType::hex);
            else if (gridType_.equals(GrxUni::_dot))
                bins.setGridType(grx::GridType::dot);
            else if (gridType_.equals(GrxUni::_square))
                bins.setGridType(grx::GridType::square);
            if (location_.equals(GrxUni::_grid))
                bins.setLocation(grx::BinLocation::grid);
            else if (location_.equals(GrxUni::_centroid))
                bins.setLocation(grx::BinLocation::centroid);
            setBins(bins, start_, width_, count_, true);
            if (!hasY)
                continue;
            bins.setMethod(method_.equals(u"allDimensions") ? grx::BinMethod::allDimensions
                           : method_.equals(u"notResponse") ? grx::BinMethod::notResponse
                                                            : grx::BinMethod::other);
            if (point == nullptr)
                continue;
            if (size_)
                addSize(*graph, p, *point);
            else
                addColorComponent(*graph, p, *point);
        }
    }
    return true;
}

namespace {

const ActionFamily family{
    {u"setHistogramBinning", "THistogramBinning", makeAction<THistogramBinning>},
    {u"setErrorBarOptions", "TSetErrorBarOptions", makeAction<TSetErrorBarOptions>},
    {u"addPopups", "TAddPopups", makeAction<TAddPopups>},
    {u"addDrillDown", "TAddDrilldowns", makeAction<TAddDrilldowns>},
    {u"setScatterplotBinning", "TSetScatterplotBinning", makeAction<TSetScatterplotBinning>},
};

} // namespace

} // namespace plotaid::detail
