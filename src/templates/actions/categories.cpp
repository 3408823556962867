// Category order, sorting, exclusion and collapsing; facet wrapping, transposing, pie direction,
// cluster gaps, percentages of a total, panel options and the diagonal of a scatterplot matrix.
#include "templates/actions/categories.h"

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

#include <vector>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

const XMLCh kCategoricalDomain[] = u"categoricalDomain";

// The variables of a role in one graph: the legend's for legend, else each element's own.
std::vector<CTVariableType*> roleVariables(const BaseTemplate& action, const GrrUviza& graph, const ChartString& role) {
    if (role.equals(GrxUni::_legend))
        return action.getLegendVariables(graph, role);
    std::vector<CTVariableType*> variables;
    for (const CTElementType* element : elementsOf(graph))
        if (CTVariableType* variable = action.getElementVariable(*element, role))
            variables.push_back(variable);
    return variables;
}

bool refersTo(const GrxCategoricalDomain& domain, const CTVariableType& variable) {
    for (const GrxVariableReference* reference : domain.getVariableReferences())
        if (reference->getVariable() == &variable)
            return true;
    return false;
}

GrxCategoricalDomain& newDomain(const BaseTemplate& action, GrxVisualization& target) {
    GrxCategoricalDomain& domain = target.addCategoricalDomain();
    domain.setId(action.CreateUniqueId(ChartString(kCategoricalDomain)));
    return domain;
}

// The variable's own domain, else one of the chart that lists it, else the role's first
// categorical dimension domain, else a new one; it becomes the variable's and lists it.
GrxCategoricalDomain& domainOf(const BaseTemplate& action, GrxVisualization& target, const GrrUviza& graph,
                               const ChartString& role, CTVariableType& variable) {
    GrxCategoricalDomain* domain = variable.getCategoricalDomain();
    if (domain == nullptr)
        for (GrxCategoricalDomain* candidate : target.getCategoricalDomains())
            if (refersTo(*candidate, variable)) {
                domain = candidate;
                break;
            }
    if (domain == nullptr)
        for (const GrxDimension* dimension : action.getDimensionsByRole(graph, role))
            if ((domain = dynamic_cast<GrxCategoricalDomain*>(dimension->getDomain())) != nullptr)
                break;
    if (domain == nullptr)
        domain = &newDomain(action, target);
    variable.setCategoricalDomain(*domain);
    if (!refersTo(*domain, variable))
        domain->addVariableReference(variable);
    return *domain;
}

void removeSorts(GrxCategoricalDomain& domain) {
    domain.removeStatisticSorts();
    domain.removeSimpleSorts();
}

void fixOrder(GrxCategoricalDomain& domain, const ChartString& order) {
    removeSorts(domain);
    domain.addSimpleSort(false, 1).addCategoryOrder().setTextContent(order.xc_str());
}

const DOMElement* firstStyleIn(const DOMElement* instruction, const XMLCh* child) {
    return firstDescendantNamed(firstChildNamed(instruction, child), GrxUni::_style);
}

} // namespace

// ---- setOrder, setExclude, setCategorySorting -----------------------------------------------------

bool TSetOrder::apply() {
    ChartString list;
    if (!categoryList(instruction_, list))
        return false;
    for (GrrUviza* graph : allGraphs(target_))
        for (CTVariableType* variable : roleVariables(*this, *graph, role_)) {
            if (variable->getCategorical() == 0)
                continue;
            // Values no relabel knows are taken as the category values themselves.
            const ChartString order = mappedCategories(*variable, list, true);
            GrxCategoricalDomain* last = nullptr;
            for (GrxCategoricalDomain* domain : target_.getCategoricalDomains())
                if (refersTo(*domain, *variable)) {
                    fixOrder(*domain, order);
                    last = domain;
                }
            if (last != nullptr)
                variable->setCategoricalDomain(*last);
            if (variable->getCategoricalDomain() == nullptr)
                fixOrder(domainOf(*this, target_, *graph, role_, *variable), order);
        }
    return true;
}

bool TSetExclude::apply() {
    ChartString list;
    if (!categoryList(instruction_, list))
        return false;
    for (GrrUviza* graph : allGraphs(target_))
        for (CTVariableType* variable : roleVariables(*this, *graph, role_))
            if (variable->getCategorical() == 1)
                replaceCategories(domainOf(*this, target_, *graph, role_, *variable),
                                  mappedCategories(*variable, list, false))
                    .setRemove(true);
    return true;
}

bool TSetCategorySorting::apply() {
    bool simple = true, descending = false;
    int method = 2;
    if (const DOMElement* sort = firstDescendantNamed(instruction_, u"sort")) {
        descending = booleanAttribute(sort, GrxUni::_descending, false);
        if (const DOMElement* simpleSort = firstDescendantNamed(sort, GrxUni::_simpleSort)) {
            const ChartString word = attributeOf(simpleSort, GrxUni::_method);
            method = word.equals(GrxUni::_data) ? 0 : word.equals(GrxUni::_natural) ? 2 : 3;
        } else if (firstDescendantNamed(sort, GrxUni::_statisticSort) != nullptr) {
            simple = false;
        } else {
            return false;
        }
    }
    ChartString role = attributeOf(instruction_, GrxUni::_role);
    if (booleanAttribute(instruction_, u"useGroupVar", false))
        role = ChartString(GrxUni::_legend);

    for (GrrUviza* graph : allGraphs(target_)) {
        const std::vector<CTElementType*> elements = elementsOf(*graph);
        CTVariableType* statistic =
            elements.empty() ? nullptr : getElementVariable(*elements.front(), ChartString(GrxUni::_y));
        for (CTVariableType* variable : roleVariables(*this, *graph, role)) {
            if (variable->getCategorical() != 1)
                continue;
            GrxCategoricalDomain& domain = domainOf(*this, target_, *graph, role, *variable);
            removeSorts(domain);
            if (simple)
                domain.addSimpleSort(descending, method);
            else if (statistic != nullptr)
                domain.addStatisticSort(descending, *statistic);
        }
    }
    return true;
}

// ---- setCollapse ----------------------------------------------------------------------------------

namespace {

// Statistics of the variable extension that count cases, so small categories can be summed.
bool countsCases(const CTElementType& element) {
    const CTCoordinate* y = element.getY();
    const auto* variable = y ? dynamic_cast<const GrxSourceVariable*>(y->getVariable()) : nullptr;
    const GrxExtensionSV* extension = variable ? variable->getExtension() : nullptr;
    if (extension == nullptr)
        return false;
    const int statistic = extension->getStatistic();
    return statistic == 1 || statistic == 2 || statistic == 6 || statistic == 30;
}

} // namespace

bool TSetCollapse::apply() {
    const bool legend = role_.equals(GrxUni::_legend);
    for (GrrUviza* graph : allGraphs(target_)) {
        const std::vector<CTElementType*> elements = elementsOf(*graph);
        if (!legend && isRoleCategorical(*graph, role_)) {
            bool summed = graph->getCoordinatess().size() <= 1;
            for (const CTElementType* element : elements)
                summed = summed && countsCases(*element);
            if (!summed)
                continue;
        }
        for (CTElementType* element : elements) {
            const std::vector<GrxSummaryStatistic*> statistics = element->getSummaryStatistics();
            if (!statistics.empty() && statistics.front()->getMethod() != 3)
                continue;
            CTVariableType* collapsed = nullptr;
            if (role_.equals(GrxUni::_x) || role_.equals(GrxUni::_z)) {
                collapsed = getElementVariable(*element, role_);
            } else if (legend) {
                const std::vector<CTVariableType*> variables = getLegendVariables(*graph, role_);
                if (!variables.empty() && variables.front()->getCategorical() != 0)
                    collapsed = variables.front();
            }
            CTVariableType* value = getElementVariable(*element, ChartString(legend ? GrxUni::_x : GrxUni::_y));
            if (collapsed == nullptr || value == nullptr)
                continue;

            GrxSummaryStatistic& summary = element->addSummaryStatistic();
            summary.setConvertIntervals(false);
            summary.setMethod(1);
            summary.setSummaryBase(2);
            collapsed->removeAggregations();
            collapsed->addAggregation(name_, *value, minFraction_);

            GrxCategoricalDomain* domain = getCategoricalDomain(*graph, role_, element);
            if (domain == nullptr) {
                // Kept on the variable, so a later instruction finds the same domain.
                domain = &newDomain(*this, target_);
                collapsed->setCategoricalDomain(*domain);
            }
            GrxSortMove* move = nullptr;
            if (!domain->getStatisticSorts().empty())
                move = &domain->getStatisticSorts().front()->addSortMove();
            else if (!domain->getSimpleSorts().empty())
                move = &domain->getSimpleSorts().front()->addSortMove();
            else
                move = &domain->addSimpleSort(false, 2).addSortMove();
            move->setCategory(name_);
            move->setFirst(false);
            domain->removeCategoriess();
        }
    }
    return true;
}

// ---- layout switches ------------------------------------------------------------------------------

bool TSetWrapPanels::apply() {
    for (GrrUviza* graph : allGraphs(target_))
        if (GrxFacetLayout* layout = graph->getFacetLayout())
            layout->setMethod(wrap_ ? 2 : 1);
    return true;
}

bool TSetTranspose::apply() {
    for (GrrUviza* graph : allGraphs(target_)) {
        if (isGraphPolar(*graph))
            continue;
        for (GrxCoordinates* coordinates : graph->getCoordinatess())
            if (!transpose_)
                coordinates->removeTransposeTransforms();
            else if (coordinates->getTransposeTransforms().empty())
                coordinates->addTransposeTransform();
    }
    return true;
}

TSetPieTranspose::TSetPieTranspose(const GrxVisualization* source, GrxVisualization& target,
                                   const DOMElement* instruction)
    : BaseTemplate(source, target, instruction) {
    for (const DOMElement* parameter : descendantsNamed(instruction_, GrxUni::_parameter)) {
        const ChartString name = attributeOf(parameter, GrxUni::_name);
        if (name.equals(GrxUni::_startAngle))
            startAngle_ = attributeOf(parameter, GrxUni::_value).convertToDouble();
        else if (name.equals(u"ccw"))
            counterClockwise_ = booleanAttribute(parameter, GrxUni::_value, counterClockwise_);
    }
    counterClockwise_ = booleanAttribute(instruction_, GrxUni::_counterClockwise, counterClockwise_);
    if (const ChartString angle = attributeOf(instruction_, GrxUni::_startAngle); !angle.empty())
        startAngle_ = angle.convertToDouble();
    if (const ChartString cycles = attributeOf(instruction_, GrxUni::_cycles); !cycles.empty())
        cycles_ = cycles.convertToDouble();
}

bool TSetPieTranspose::apply() {
    for (GrrUviza* graph : allGraphs(target_)) {
        if (!isGraphPolar(*graph))
            continue;
        for (GrxCoordinates* coordinates : graph->getCoordinatess())
            for (GrxPolarTransform* polar : coordinates->getPolarTransforms()) {
                polar->setStartAngle(startAngle_);
                polar->setCycles(cycles_);
                polar->setCounterClockwise(counterClockwise_);
            }
    }
    return true;
}

bool TSetClusterWidth::apply() {
    ChartString gap = attributeOf(instruction_, GrxUni::_gap);
    if (gap.empty())
        gap = ChartString(u"0%");
    const ChartString role = attributeOf(instruction_, GrxUni::_role);
    const ChartString dimensionRole(role.equals(GrxUni::_y) || role.equals(GrxUni::_z) ? role.xc_str() : GrxUni::_x);
    bool set = false;
    for (GrrUviza* graph : allGraphs(target_))
        for (GrxDimension* dimension : getDimensionsByRole(*graph, dimensionRole))
            if (dimension->getClusterVariable() != nullptr) {
                dimension->setClusterGap(gap);
                set = true;
            }
    return set;
}

bool TSetScaleByFraction::apply() {
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    if (instruction_ == nullptr)
        return !graphs.empty();
    for (GrrUviza* graph : graphs) {
        bool stacked = false;
        for (CTElementType* element : elementsOf(*graph)) {
            const int modifier = element->getPositionModifier();
            if (modifier != 3 && modifier != 4)
                continue;
            stacked = true;
            element->removeSummaryStatistics();
            GrxSummaryStatistic& summary = element->addSummaryStatistic();
            summary.setSummaryBase(2);
            summary.setMethod(5);
        }
        if (!stacked)
            continue;
        for (GrxDimension* dimension : getDimensionsByRole(*graph, ChartString(GrxUni::_y)))
            for (GrxAxis* axis : dimension->getAxiss())
                for (GrxMajorTicks* ticks : axis->getMajorTickss()) {
                    ticks->removeFormats();
                    GrxFormat& format = ticks->addFormat();
                    format.setSuffix(ChartString(u"%"));
                    format.setScalingFactor(0.01);
                }
    }
    return !graphs.empty();
}

// ---- setPanelOptions ------------------------------------------------------------------------------

TSetPanelOptions::TSetPanelOptions(const GrxVisualization* source, GrxVisualization& target,
                                   const DOMElement* instruction)
    : BaseTemplate(source, target, instruction),
      mark_(firstStyleIn(instruction_, GrxUni::_markStyle)),
      axis_(firstStyleIn(instruction_, u"axisStyle")),
      label_(firstStyleIn(instruction_, u"axisLabelStyle")),
      labelFrame_(firstStyleIn(instruction_, u"axisLabelTextFrameStyle")),
      gap_(attributeOf(instruction_, GrxUni::_gap)) {
    for (const DOMElement* style : descendantsNamed(firstChildNamed(instruction_, _tickLabelStyle), GrxUni::_style))
        (unsignedAttribute(style, GrxUni::_number) == 1 ? tickFrame_ : tick_) = style;
    if (instruction_ != nullptr && instruction_->hasAttribute(GrxUni::_mirror)) {
        const bool mirror = booleanAttribute(instruction_, GrxUni::_mirror, false);
        const ChartString role = attributeOf(instruction_, GrxUni::_role);
        reflectX_ = mirror && !role.equals(GrxUni::_y);
        reflectY_ = mirror && !role.equals(GrxUni::_x);
        removeReflections_ = !mirror;
    }
}

namespace {

bool anyReflection(const GrxVisualization& chart) {
    for (const GrrUviza* graph : allGraphs(chart))
        for (const GrxCoordinates* coordinates : graph->getCoordinatess())
            if (!coordinates->getReflectionTransforms().empty())
                return true;
    return false;
}

// One reflection per dimension: reflecting y must not take over the transform that reflects x.
void reflect(GrxCoordinates& coordinates, int dimension) {
    for (GrxReflectionTransform* reflection : coordinates.getReflectionTransforms())
        if (reflection->getDimension() == dimension) {
            reflection->setAlternating(true);
            return;
        }
    GrxReflectionTransform& reflection = coordinates.addReflectionTransform();
    reflection.setDimension(dimension);
    reflection.setAlternating(true);
}

} // namespace

bool TSetPanelOptions::apply() {
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    const bool sourceReflects = source_ != nullptr && anyReflection(*source_);
    for (GrrUviza* graph : graphs) {
        for (GrxCoordinates* coordinates : graph->getCoordinatess()) {
            const DOMElement* own = sourceObject(source_, coordinates->getId());
            const auto* ownCoordinates = own ? GrxBaseElement::wrapperOf<GrxCoordinates>(own) : nullptr;
            if (ownCoordinates != nullptr && !ownCoordinates->getReflectionTransforms().empty())
                continue;
            if (reflectX_)
                reflect(*coordinates, 0);
            if (reflectY_)
                reflect(*coordinates, 1);
            if (removeReflections_)
                coordinates->removeReflectionTransforms();
        }

        GrxFacetLayout* layout = graph->getFacetLayout();
        if (layout == nullptr)
            continue;
        if (!gap_.empty()) {
            const bool none = getFirstSPLOMElement(*graph) != nullptr || sourceReflects;
            for (GrxFacetLevel* level : layout->getFacetLevels()) {
                const DOMElement* own = sourceObject(source_, level->getId());
                const ChartString ownGap = own ? ChartString(own->getAttribute(GrxUni::_gap)) : ChartString();
                if (!ownGap.empty() && !ownGap.equals(u"20px"))
                    continue;
                level->setGap(none ? ChartString(u"0%") : gap_);
            }
        }
        for (GrxFacetLevel* level : layout->getFacetLevels())
            for (GrxAxis* axis : level->getAxiss()) {
                if (axis_ != nullptr)
                    importStyle(axis_, styleOf(*this, *axis, &GrxAxis::getStyle, &GrxAxis::setStyle, {}));
                if (CTLabelType* label = axis->getLabel()) {
                    if (label_ != nullptr)
                        importStyle(label_, styleOf(*this, *label, &CTLabelType::getStyle, &CTLabelType::setStyle, {}));
                    if (labelFrame_ != nullptr)
                        importStyle(labelFrame_, styleOf(*this, *label, &CTLabelType::getTextFrameStyle,
                                                         &CTLabelType::setTextFrameStyle, {}));
                }
                for (GrxMajorTicks* ticks : axis->getMajorTickss()) {
                    if (tick_ != nullptr)
                        importStyle(tick_, styleOf(*this, *ticks, &GrxMajorTicks::getStyle, &GrxMajorTicks::setStyle, {}));
                    if (tickFrame_ != nullptr)
                        importStyle(tickFrame_, styleOf(*this, *ticks, &GrxMajorTicks::getTickFrameStyle,
                                                        &GrxMajorTicks::setTickFrameStyle, {}));
                    if (mark_ != nullptr)
                        importStyle(mark_, styleOf(*this, *ticks, &GrxMajorTicks::getMarkStyle,
                                                   &GrxMajorTicks::setMarkStyle, {}));
                }
            }
    }
    return !graphs.empty();
}

// ---- addChartsOnDiagonal --------------------------------------------------------------------------

TAddChartsOnDiagonal::TAddChartsOnDiagonal(const GrxVisualization* source, GrxVisualization& target,
                                           const DOMElement* instruction)
    : BaseTemplate(source, target, instruction),
      style_(lastChildNamed(instruction_, GrxUni::_style)),
      normalLine_(lastChildNamed(instruction_, u"addHistogramNormalLine")),
      normalLineStyle_(firstDescendantNamed(normalLine_, GrxUni::_style)),
      binning_(lastChildNamed(instruction_, u"setHistogramBinning")),
      styleOnly_(booleanAttribute(instruction_, _styleOnly, false)) {
    const ChartString type = attributeOf(instruction_, GrxUni::_type);
    kind_ = type.equals(GrxUni::_histogram) ? 1 : type.equals(u"NormalCurve") ? 2 : type.equals(GrxUni::_none) ? 0 : -1;
}

namespace {

const XMLCh kOffDiagonal[] = u"facet1!=facet2";

// A chart an earlier application put on the diagonal: hidden wherever the facets differ.
bool onDiagonal(const CTElementType& element) {
    for (const GrxConditionalStyle* conditional : element.getConditionalStyles()) {
        const ChartString when(conditional->getWhen());
        const GrxStyle* style = conditional->getStyle();
        if (style != nullptr && !style->getVisible() && when.ContainsString(u"!") &&
            when.ContainsString(u"facet1") && when.ContainsString(u"facet2"))
            return true;
    }
    return false;
}

GrxCoordinates* secondCoordinates(const GrrUviza& graph) {
    const std::vector<GrxCoordinates*> all = graph.getCoordinatess();
    return all.size() < 2 ? nullptr : all[1];
}

} // namespace

bool TAddChartsOnDiagonal::apply() {
    if (kind_ < 0)
        return false;
    bool added = false;
    for (GrrUviza* graph : allGraphs(target_)) {
        CTElementType* matrix = getFirstSPLOMElement(*graph);
        if (matrix == nullptr)
            continue;
        if (styleOnly_) {
            GrxCoordinates* diagonal = secondCoordinates(*graph);
            if (diagonal == nullptr)
                continue;
            for (CTElementType* element : elementsOf(*graph)) {
                if (element->getCoordinates() != diagonal)
                    continue;
                const bool line = dynamic_cast<GrxLine*>(element) != nullptr && normalLine_ != nullptr;
                const DOMElement* declaration = line ? normalLineStyle_ : style_;
                if (declaration != nullptr)
                    importStyle(declaration, styleOf(*this, *element, &CTElementType::getStyle,
                                                     &CTElementType::setStyle, {}));
            }
            continue;
        }
        added = true;
        if (kind_ != 0)
            for (CTElementType* element : elementsOf(*graph))
                if (element != matrix && onDiagonal(*element))
                    graph->removeElement(*element);

        std::vector<GrxCoordinates*> coordinates = graph->getCoordinatess();
        if (coordinates.empty())
            continue;
        GrxCoordinates& first = *coordinates.front();
        if (!first.isIdPresent())
            first.setId(CreateUniqueId(ChartString(GrxUni::_coordinates)));
        for (CTElementType* element : elementsOf(*graph))
            if (element->getCoordinates() == nullptr)
                element->setCoordinates(first);
        GrxCoordinates* diagonal = secondCoordinates(*graph);
        if (diagonal == nullptr) {
            diagonal = &graph->addCoordinates();
            diagonal->setId(CreateUniqueId(ChartString(GrxUni::_coordinates)));
            GrxDimension& across = diagonal->addDimension();
            across.setLowerMargin(ChartString(u"5%"));
            across.setUpperMargin(ChartString(u"5%"));
            GrxDimension& up = diagonal->addDimension();
            up.setLowerMargin(ChartString(u"15%"));
            up.setUpperMargin(ChartString(u"5%"));
        }

        if (kind_ == 0) {
            matrix->removeConditionalStyles();
            GrxStyle& hidden = addStyle(*matrix, nullptr);
            hidden.setVisible(false);
            matrix->addConditionalStyle(ChartString(u"facet1==facet2"), hidden);
            if (GrxFacetLayout* layout = graph->getFacetLayout()) {
                layout->setCellAspect(1.0);
                const std::vector<GrxFacetLevel*> levels = layout->getFacetLevels();
                if (levels.size() == 2)
                    for (GrxAxis* axis : levels[1]->getAxiss())
                        for (GrxMajorTicks* ticks : axis->getMajorTickss())
                            if (ticks->getLabelAngle() == 0)
                                ticks->setLabelAngle(-90);
            }
            continue;
        }

        const auto dress = [&](CTElementType& element, const XMLCh* prefix) {
            element.setId(CreateUniqueId(ChartString(prefix)));
            GrxStyle& style = addStyle(element, nullptr);
            element.setStyle(style);
            element.setDot(false);
            element.setCoordinates(*diagonal);
            GrxStyle& hidden = addStyle(element, nullptr);
            hidden.setVisible(false);
            element.addConditionalStyle(ChartString(kOffDiagonal), hidden);
            return &style;
        };
        const auto addNormalLine = [&]() -> CTElementType& {
            GrxLine& line = graph->addLine();
            dress(line, GrxUni::_line);
            line.addDistributionStatistic();
            copyVariables(line, *matrix);
            return line;
        };

        CTElementType* made = nullptr;
        if (kind_ == 1) {
            GrxInterval& histogram = graph->addInterval();
            dress(histogram, GrxUni::_interval)->setColor(ChartString(u"#DBD8AC"));
            GrxBinStatistic& bins = histogram.addBinStatistic();
            histogram.addSummaryStatistic().setMethod(10);
            copyVariables(histogram, *matrix);
            made = &histogram;
            if (normalLine_ != nullptr) {
                CTElementType& line = addNormalLine();
                if (normalLineStyle_ != nullptr)
                    importStyle(normalLineStyle_, *line.getStyle());
            }
            if (binning_ != nullptr) {
                const ChartString start = attributeOf(binning_, GrxBinStatistic::_binStart);
                const ChartString width = attributeOf(binning_, GrxBinStatistic::_binWidth);
                const ChartString count = attributeOf(binning_, GrxBinStatistic::_binCount);
                if (!start.empty())
                    bins.setBinStart(start);
                if (!width.empty())
                    bins.setBinWidth(width);
                else if (!count.empty())
                    bins.setBinCount(count);
            }
        } else {
            made = &addNormalLine();
        }
        if (style_ != nullptr)
            importStyle(style_, *made->getStyle());
    }
    return added;
}

namespace {

const ActionFamily family{
    {u"setOrder", "TSetOrder", makeAction<TSetOrder>},
    {u"setCategorySorting", "TSetCategorySorting", makeAction<TSetCategorySorting>},
    {u"setExclude", "TSetExclude", makeAction<TSetExclude>},
    {u"setCollapse", "TSetCollapse", makeAction<TSetCollapse>},
    {u"setWrapPanels", "TSetWrapPanels", makeAction<TSetWrapPanels>},
    {u"setTranspose", "TSetTranspose", makeAction<TSetTranspose>},
    {u"setPieTranspose", "TSetPieTranspose", makeAction<TSetPieTranspose>},
    {u"setClusterWidth", "TSetClusterWidth", makeAction<TSetClusterWidth>},
    {u"setScaleByFraction", "TSetScaleByFraction", makeAction<TSetScaleByFraction>},
    {u"setPanelOptions", "TSetPanelOptions", makeAction<TSetPanelOptions>},
    {u"addChartsOnDiagonal", "TAddChartsOnDiagonal", makeAction<TAddChartsOnDiagonal>},
};

} // namespace

} // namespace plotaid::detail
