// Axis actions. Each visits every graph of the chart and, in it, the dimensions that play the
// instruction's role; the first axis of a dimension is its main axis, a second one the derived or
// opposite axis.
#include "templates/actions/axes.h"

#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartException.h>

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

#include <string>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

const char kFile[] = "backend/chartxml/plotaid/src/templates/axes";

constexpr XMLCh kParameter[] = u"parameter";
constexpr XMLCh kExponent[] = u"exponent";
constexpr XMLCh kSafe[] = u"safe";
constexpr XMLCh kExact[] = u"exact";
constexpr XMLCh kPercent[] = u"percent";
constexpr XMLCh kAxisLabelStyle[] = u"axisLabelStyle";

bool isXyz(const ChartString& role) {
    return role.equals(GrxUni::_x) || role.equals(GrxUni::_y) || role.equals(GrxUni::_z);
}

bool hasParallelCoordinates(const GrrUviza& graph) {
    for (const GrxCoordinates* coordinates : graph.getCoordinatess())
        if (!coordinates->getParallelCoordinatesTransforms().empty())
            return true;
    return false;
}

bool holds(const GrrUviza& graph, const XMLCh* name) {
    return graph.getImplementation()->getElementsByTagName(name)->getLength() > 0;
}

// A date-time with milliseconds ("2026-03-04 09:05:07.000") marks its domain as one of dates.
bool looksLikeDateTime(const ChartString& text) {
    return text.length() == 23 && text.ContainsString(u"-");
}

// The axis title from an instruction's label element: its text and its styles.
void retitle(BaseTemplate& action, GrxAxis& axis, const DOMElement* label) {
    if (label == nullptr)
        return;
    GrxLabel& title = axis.getLabel() ? *axis.getLabel() : axis.addLabel();
    action.mergeText(label, title);
    action.styleLabel(title, label);
}

} // namespace

// ---- setAxisScale ------------------------------------------------------------------------------------

TSetAxisScale::TSetAxisScale(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), role_(attributeOf(instruction, GrxUni::_role)),
      origin_(attributeOf(instruction, GrxUni::_origin)),
      invert_(booleanAttribute(instruction, GrxUni::_invert, false)) {
    if (!wordValue(grx::kScaleMethod, attributeOf(instruction, GrxUni::_method), method_))
        method_ = grx::ScaleMethod::linear;
    for (const DOMElement* parameter : descendantsNamed(instruction, kParameter)) {
        const ChartString name = attributeOf(parameter, GrxUni::_name);
        const ChartString value = attributeOf(parameter, GrxUni::_value);
        if (name.equals(kExponent) || name.equals(GrxUni::_UTF_base)) {
            base_ = value.convertToDouble();
            baseGiven_ = true;
        } else if (name.equals(kSafe) && value.equals(GrxUni::_true)) {
            if (method_ == grx::ScaleMethod::log)
                method_ = grx::ScaleMethod::log_safe;
            else if (method_ == grx::ScaleMethod::power)
                method_ = grx::ScaleMethod::power_safe;
        }
    }
    if (const ChartString base = attributeOf(instruction, GrxUni::_UTF_base); !base.empty()) {
        base_ = base.convertToDouble();
        baseGiven_ = true;
    }
}

bool TSetAxisScale::apply() {
    if (instruction_ == nullptr)
        return false;
    for (GrrUviza* graph : allGraphs(target_)) {
        if (isGraphPolar(*graph) || isRoleCategorical(*graph, role_))
            continue;
        for (GrxDimension* dimension : getDimensionsByRole(*graph, role_)) {
            if (!doesCoordinateMatch(*dimension, role_))
                continue;
            GrxScale& scale = dimension->getScale() ? *dimension->getScale() : dimension->addScale(method_);
            scale.setMethod(method_);
            if (origin_.empty())
                scale.removeOrigin();
            else
                scale.setOrigin(origin_);
            scale.setInvert(invert_);
            if (baseGiven_)
                scale.setBase(base_);
        }
    }
    return true;
}

// ---- setAxisInterval ---------------------------------------------------------------------------------

bool TSetAxisInterval::apply() {
    if (instruction_ == nullptr || !isXyz(role_))
        return false;
    const bool exactLower = attributeOf(instruction_, u"lowerMapping").equals(kExact);
    const bool exactUpper = attributeOf(instruction_, u"upperMapping").equals(kExact);
    for (GrrUviza* graph : allGraphs(target_)) {
        if (isGraphPolar(*graph) || isRoleCategorical(*graph, role_))
            continue;
        for (GrxDimension* dimension : getDimensionsByRole(*graph, role_)) {
            if (!doesCoordinateMatch(*dimension, role_))
                continue;
            GrxDomain* existing = dimension->getDomain();
            if (existing == nullptr) {
                GrxIntervalDomain& made = target_.addIntervalDomain();
                made.setId(CreateUniqueId(ChartString(GrxUni::_domain)));
                dimension->setDomain(made);
                existing = &made;
            }
            // A categorical domain has no ranges to set; such a dimension is left as it is.
            auto* domain = dynamic_cast<GrxIntervalDomain*>(existing);
            if (domain == nullptr)
                continue;
            domain->removeRanges();
            dimension->setUnionDomain(!exactLower && !exactUpper);
            dimension->setNiceLowerMapping(!exactLower);
            dimension->setNiceUpperMapping(!exactUpper);
            if (!min_.empty()) {
                GrxRange& range = domain->addRange();
                range.setMin(min_);
                range.setExact(true);
                if (looksLikeDateTime(min_))
                    domain->setDate(true);
                for (GrxAxis* axis : dimension->getAxiss())
                    for (GrxMajorTicks* ticks : axis->getMajorTickss())
                        ticks->setBase(min_);
            }
            if (!max_.empty()) {
                GrxRange& range = domain->addRange();
                range.setMax(max_);
                range.setExact(true);
                if (looksLikeDateTime(max_))
                    domain->setDate(true);
            }
        }
    }
    return true;
}

// ---- setAxisMargin -----------------------------------------------------------------------------------

bool TSetAxisMargin::apply() {
    if (instruction_ == nullptr)
        return false;
    const ChartString upper = attributeOf(instruction_, GrxUni::_upperMargin);
    const ChartString lower = attributeOf(instruction_, GrxUni::_lowerMargin);
    const CategoricalFilter categorical{true, booleanAttribute(instruction_, GrxUni::_categorical, false)};
    for (GrrUviza* graph : allGraphs(target_)) {
        if (isGraphPolar(*graph) || !categorical.passes(*this, *graph, role_) || hasParallelCoordinates(*graph))
            continue;
        for (GrxDimension* dimension : getDimensionsByRole(*graph, role_)) {
            const DOMElement* own = sourceObject(source_, dimension->getId());
            const GrxDimension* defined = own ? GrxBaseElement::wrapperOf<GrxDimension>(own) : nullptr;
            if (!upper.empty() && !(defined && hasText(defined->getUpperMargin())))
                dimension->setUpperMargin(upper);
            if (!lower.empty() && !(defined && hasText(defined->getLowerMargin())))
                dimension->setLowerMargin(lower);
        }
    }
    return true;
}

// ---- setAxisStyle ------------------------------------------------------------------------------------

TSetAxisStyle::TSetAxisStyle(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), role_(attributeOf(instruction, GrxUni::_role)),
      derived_(booleanAttribute(instruction, _derived, false)),
      style_(lastChildNamed(instruction, GrxUni::_style)), label_(lastChildNamed(instruction, GrxUni::_label)) {
    const ChartString categorical = attributeOf(instruction, GrxUni::_categorical);
    categorical_ = {!categorical.empty(), booleanAttribute(instruction, GrxUni::_categorical, false)};
    for (const DOMElement* styles : childrenNamed(instruction, kAxisLabelStyle))
        for (const DOMElement* style : descendantsNamed(styles, GrxUni::_style))
            (unsignedAttribute(style, GrxUni::_number) == 1 ? labelFrameStyle_ : labelStyle_) = style;
}

bool TSetAxisStyle::apply() {
    if (instruction_ == nullptr)
        return false;
    for (GrrUviza* graph : allGraphs(target_)) {
        if (!categorical_.passes(*this, *graph, role_))
            continue;
        const bool matrix = getFirstSPLOMElement(*graph) != nullptr;
        for (GrxDimension* dimension : getDimensionsByRole(*graph, role_)) {
            for (GrxAxis* axis : dimension->getAxiss()) {
                if (isAxisDerived(*axis) != derived_ || !doesCoordinateMatch(*axis, role_))
                    continue;
                if (style_ != nullptr)
                    importStyle(style_, styleOf(*this, *axis, &GrxAxis::getStyle, &GrxAxis::setStyle,
                                                CreateUniqueId(ChartString(GrxUni::_style))));
                retitle(*this, *axis, label_);
                if (GrxLabel* label = axis->getLabel()) {
                    CTLabelType& owner = *label;
                    GrxStyle& text = styleOf(*this, owner, &CTLabelType::getStyle, &CTLabelType::setStyle, {});
                    GrxStyle& frame = textFrameStyleOf(*this, *label);
                    if (labelStyle_ != nullptr)
                        importStyle(labelStyle_, text);
                    if (labelFrameStyle_ != nullptr)
                        importStyle(labelFrameStyle_, frame);
                }
                // A scatterplot matrix draws its axes through the cells' frames, never as lines.
                if (matrix)
                    styleOf(*this, *axis, &GrxAxis::getStyle, &GrxAxis::setStyle,
                            CreateUniqueId(ChartString(GrxUni::_style)))
                        .setColor(GrxStyle::_transparent);
            }
        }
    }
    return true;
}

// ---- setAxisMajorTicks, setAxisMinorTicks ---------------------------------------------------------

bool TSetAxisMajorTicks::apply() {
    if (ticks_ == nullptr)
        return false;
    const bool derived = booleanAttribute(ticks_, _derived, false);
    const ChartString role = attributeOf(ticks_, GrxUni::_role);
    const ChartString categorical = attributeOf(ticks_, GrxUni::_categorical);
    const CategoricalFilter filter{!categorical.empty(), booleanAttribute(ticks_, GrxUni::_categorical, false)};
    for (GrrUviza* graph : allGraphs(target_)) {
        if (isGraphPolar(*graph) && !holds(*graph, GrxMajorTicks::getElementName()))
            continue;
        if (!filter.passes(*this, *graph, role))
            continue;
        const bool matrix = getFirstSPLOMElement(*graph) != nullptr;
        for (GrxDimension* dimension : getDimensionsByRole(*graph, role))
            for (GrxAxis* axis : dimension->getAxiss()) {
                if (matrix)
                    axis->removeMajorTickss();
                else if (isAxisDerived(*axis) == derived)
                    setMajorTicks(*axis, ticks_);
            }
    }
    return true;
}

bool TSetAxisMinorTicks::apply() {
    if (ticks_ == nullptr)
        return false;
    const bool derived = booleanAttribute(ticks_, _derived, false);
    const ChartString role = attributeOf(ticks_, GrxUni::_role);
    for (GrrUviza* graph : allGraphs(target_)) {
        if (isGraphPolar(*graph) && !holds(*graph, GrxMinorTicks::getElementName()))
            continue;
        for (GrxDimension* dimension : getDimensionsByRole(*graph, role))
            for (GrxAxis* axis : dimension->getAxiss())
                if (isAxisDerived(*axis) == derived)
                    setMinorTicks(*axis, ticks_);
    }
    return true;
}

// ---- setAxisOpposite ---------------------------------------------------------------------------------

bool TSetAxisOpposite::apply() {
    if (instruction_ == nullptr)
        return false;
    const ChartString role = attributeOf(instruction_, GrxUni::_role);
    const ChartString categorical = attributeOf(instruction_, GrxUni::_categorical);
    const CategoricalFilter filter{!categorical.empty(), categorical.equals(GrxUni::_true)};
    const bool opposite = booleanAttribute(instruction_, GrxUni::_opposite, false);
    for (GrrUviza* graph : allGraphs(target_)) {
        if (isGraphPolar(*graph) || !filter.passes(*this, *graph, role))
            continue;
        for (GrxDimension* dimension : getDimensionsByRole(*graph, role)) {
            const std::vector<GrxAxis*> axes = dimension->getAxiss();
            if (axes.empty())
                continue;
            axes[0]->setOpposite(opposite);
            if (axes.size() > 1)
                axes[1]->setOpposite(!axes[0]->getOpposite());
        }
    }
    return true;
}

// ---- addDerivedAxis ----------------------------------------------------------------------------------

bool TAddDerivedAxis::apply() {
    if (instruction_ == nullptr || !isXyz(role_))
        return false;
    for (GrrUviza* graph : allGraphs(target_)) {
        const bool taken = graph->getCoordinatess().size() == 1 || !(role_.equals(GrxUni::_y) || role_.equals(_y2));
        if (!taken || isRoleCategorical(*graph, role_))
            continue;
        for (GrxDimension* dimension : getDimensionsByRole(*graph, role_)) {
            if (dimension->getAxiss().empty())
                continue;
            if (transform_ != nullptr)
                transformAxes(*dimension);
            styleDerivedAxes(*dimension);
        }
    }
    // The walk never reads this action's result.
    return false;
}

void TAddDerivedAxis::transformAxes(GrxDimension& dimension) {
    std::vector<GrxAxis*> axes = dimension.getAxiss();
    if (isAxisDerived(*axes[0]))
        dimension.removeAxis(0u);
    else if (axes.size() > 1 && isAxisDerived(*axes[1]))
        dimension.removeAxis(1u);
    axes = dimension.getAxiss();
    // Two plain axes leave no room for a derived one: nothing to give the transform to.
    if (axes.size() >= 2)
        return;
    GrxAxis& added = dimension.addAxis();
    added.addMajorTicks();
    GrxStyle& style = addStyle(added, nullptr);
    added.setStyle(style);
    if (!axes.empty()) {
        if (const GrxStyle* main = axes[0]->getStyle())
            duplicateAttributes(*main, style);
        added.setOpposite(!axes[0]->getOpposite());
    }
    if (attributeOf(transform_, GrxUni::_method).equals(kPercent)) {
        added.setTransform(grx::AxisTransform::percent);
        return;
    }
    added.setTransform(grx::AxisTransform::derived);
    const std::vector<const DOMElement*> parameters = descendantsNamed(transform_, kParameter);
    for (const XMLCh* name : {u"base-ratio", u"base-match", u"derived-ratio", u"derived-match"}) {
        ChartString value = attributeOf(transform_, name);
        for (auto p = parameters.begin(); value.empty() && p != parameters.end(); ++p)
            if (attributeOf(*p, GrxUni::_name).equals(name)) {
                value = attributeOf(*p, GrxUni::_value);
                break;
            }
        if (value.empty())
            continue;
        GrxAxisTransformParameter& parameter = added.addAxisTransformParameter();
        parameter.setParameterName(name);
        parameter.setParameterValue(value);
    }
}

void TAddDerivedAxis::styleDerivedAxes(GrxDimension& dimension) {
    for (GrxAxis* axis : dimension.getAxiss()) {
        if (!isAxisDerived(*axis))
            continue;
        retitle(*this, *axis, label_);
        setMajorTicks(*axis, majorTicks_);
        setMinorTicks(*axis, minorTicks_);
        GrxStyle& style = styleOf(*this, *axis, &GrxAxis::getStyle, &GrxAxis::setStyle, {});
        if (style_ != nullptr)
            importStyle(style_, style);
    }
}

// ---- tick labels -------------------------------------------------------------------------------------

bool TickLabelAction::apply() {
    if (instruction_ == nullptr || !valid())
        return false;
    bool last = false;
    for (GrrUviza* graph : allGraphs(target_))
        last = applyTo(*graph);
    return last;
}

bool TickLabelAction::applyTo(const GrrUviza& graph) {
    if (!hasValue() || !categorical_.passes(*this, graph, role_))
        return false;
    const auto setOn = [&](GrxAxis& axis, bool coordinateAxis) {
        const std::vector<GrxMajorTicks*> ticks = axis.getMajorTickss();
        if (isAxisDerived(axis) == derived_ && (!coordinateAxis || doesCoordinateMatch(axis, role_)) &&
            !ticks.empty())
            set(*ticks.front());
    };
    if (getFirstSPLOMElement(graph) != nullptr) {
        // A scatterplot matrix keeps its axes on the facet levels: x on the first, y on the second.
        // They belong to no coordinates, so there are none to match.
        const GrxFacetLayout* layout = graph.getFacetLayout();
        const std::vector<GrxFacetLevel*> levels = layout ? layout->getFacetLevels() : std::vector<GrxFacetLevel*>();
        const std::size_t level = role_.equals(GrxUni::_x) ? 0 : role_.equals(GrxUni::_y) ? 1 : levels.size();
        if (level < levels.size())
            for (GrxAxis* axis : levels[level]->getAxiss())
                setOn(*axis, false);
        return false;
    }
    const std::vector<GrxDimension*> dimensions = getDimensionsByRole(graph, role_);
    for (GrxDimension* dimension : dimensions)
        for (GrxAxis* axis : dimension->getAxiss())
            setOn(*axis, true);
    return !dimensions.empty();
}

void TSetTickLabelAngle::set(GrxMajorTicks& ticks) {
    ticks.setLabelAngle(angle_.convertToDouble());
}

bool TSetTickLabelFrequency::valid() const {
    // A negative count would wrap into billions through the unsigned reading.
    if (!frequency_.empty() && frequency_.xc_str()[0] == u'-') {
        ChartErrorHandler().error(
            ChartException("Tick label frequency must not be negative: " + frequency_.toUTF8(), kFile, 1));
        return false;
    }
    return true;
}

void TSetTickLabelFrequency::set(GrxMajorTicks& ticks) {
    const unsigned frequency = frequency_.convertToInteger();
    ticks.setLabelFrequency(frequency == 0 ? 1 : static_cast<int>(frequency));
}

TSetTickLabelFormat::TSetTickLabelFormat(const GrxVisualization* source, GrxVisualization& target,
                                         const DOMElement* instruction)
    : TickLabelAction(source, target, instruction) {
    static const XMLCh* const kNames[] = {u"format", u"numberFormat", u"stringFormat", u"dateTimeFormat",
                                          u"elapsedTimeFormat"};
    if (instruction == nullptr)
        return;
    // Only element children count: the white space and comments between them are the author's.
    for (const DOMElement* child = instruction->getFirstElementChild(); child; child = child->getNextElementSibling()) {
        bool known = false;
        for (std::size_t k = 0; k < 5; ++k)
            if (named(child, kNames[k])) {
                formats_[k] = child;
                known = true;
            }
        valid_ = valid_ && known;
    }
    if (booleanAttribute(instruction, GrxUni::_categorical, false) && formats_[2] == nullptr)
        valid_ = false;
}

void TSetTickLabelFormat::set(GrxMajorTicks& ticks) {
    ticks.removeFormats();
    GrxFormat& format = ticks.addFormat();
    if (formats_[0] != nullptr)
        importFormat(format, formats_[0]);
    else if (formats_[1] != nullptr)
        importNumberFormat(format, formats_[1]);
    else if (formats_[2] != nullptr)
        importStringFormat(format, formats_[2]);
    else if (formats_[3] != nullptr)
        importDateTimeFormat(format, formats_[3]);
    else if (formats_[4] != nullptr)
        importElapsedTimeFormat(format, formats_[4]);
}

namespace {

const ActionFamily family{
    {u"setAxisScale", "TSetAxisScale", makeAction<TSetAxisScale>},
    {u"setAxisInterval", "TSetAxisInterval", makeAction<TSetAxisInterval>},
    {u"setAxisMargin", "TSetAxisMargin", makeAction<TSetAxisMargin>},
    {u"setAxisStyle", "TSetAxisStyle", makeAction<TSetAxisStyle>},
    {u"setAxisMajorTicks", "TSetAxisMajorTicks", makeAction<TSetAxisMajorTicks>},
    {u"setAxisMinorTicks", "TSetAxisMinorTicks", makeAction<TSetAxisMinorTicks>},
    {u"setAxisOpposite", "TSetAxisOpposite", makeAction<TSetAxisOpposite>},
    {u"addDerivedAxis", "TAddDerivedAxis", makeAction<TAddDerivedAxis>},
    {u"setTickLabelAngle", "TSetTickLabelAngle", makeAction<TSetTickLabelAngle>},
    {u"setTickLabelFormat", "TSetTickLabelFormat", makeAction<TSetTickLabelFormat>},
    {u"setTickLabelFrequency", "TSetTickLabelFrequency", makeAction<TSetTickLabelFrequency>},
};

} // namespace

} // namespace plotaid::detail
