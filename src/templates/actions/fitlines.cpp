// Fit, interpolation and distribution lines. Each new line is an element of its own on the
// coordinates it fits, coloured like the element it follows; fit lines for the whole graph are
// named in the user's language and listed in the legend.
#include "templates/actions/fitlines.h"

#include "templates/Localise.h"

#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartException.h>

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

const char kFile[] = "backend/chartxml/plotaid/src/templates/fitlines";

constexpr XMLCh kSubgroup[] = u"subgroup";
constexpr XMLCh kConfidenceInterval[] = u"confidenceInterval";

bool noColor(const XMLCh* color) {
    return !hasText(color) || ChartString(color).equals(GrxStyle::_transparent);
}

// The element's colour, or its colour 2 where the colour says nothing; empty when neither does.
ChartString colorOf(const CTElementType& element) {
    const GrxStyle* style = element.getStyle();
    if (style == nullptr)
        return ChartString();
    if (!noColor(style->getColor()))
        return ChartString(style->getColor());
    return noColor(style->getColor2()) ? ChartString() : ChartString(style->getColor2());
}

bool onCoordinates(const CTElementType& element, const GrxCoordinates& coordinates) {
    const GrxCoordinates* own = element.getCoordinates();
    return own == nullptr || own == &coordinates;
}

bool isLineOrEdge(const CTElementType& element) {
    return dynamic_cast<const GrxLine*>(&element) != nullptr || dynamic_cast<const GrxEdge*>(&element) != nullptr;
}

template <class T> T& addWithId(BaseTemplate& action, GrrUviza& graph, const XMLCh* prefix) {
    T& made = graph.add<T>();
    made.setId(action.CreateUniqueId(ChartString(prefix)));
    return made;
}

void locate(GrxBaseElement& frame, const XMLCh* const (&values)[4]) {
    static const int kParts[] = {grx::LocationPart::left, grx::LocationPart::right, grx::LocationPart::top,
                                 grx::LocationPart::bottom};
    for (int k = 0; k < 4; ++k) {
        GrxLocation& location = frame.add<GrxLocation>();
        location.setPart(kParts[k]);
        location.setMethod(grx::LocationMethod::fixed);
        location.setValue(values[k]);
    }
}

// The chart's first legend, or a new invisible one at the given place.
GrxLegend& legendOf(BaseTemplate& action, GrxVisualization& target, const XMLCh* const (&place)[4]) {
    const std::vector<GrxLegend*> legends = action.getLegends();
    if (!legends.empty())
        return *legends.front();
    GrxLegend& legend = target.addLegend();
    legend.setId(action.CreateUniqueId(ChartString(GrxUni::_legend)));
    GrxStyle& style = action.addStyle(legend, nullptr);
    style.setColor(GrxStyle::_transparent);
    style.setColor2(GrxStyle::_transparent);
    style.setVisible(false);
    legend.setStyle(style);
    locate(legend, place);
    return legend;
}

void addLegendTarget(BaseTemplate& action, GrxLegend& legend, GrxBaseElement& shown) {
    legend.addLegendTarget(shown).setId(action.CreateUniqueId(ChartString(GrxUni::_legendTarget)));
}

// A line that follows one subgroup: its colour from the group's aesthetics, never its size.
void followSubgroup(BaseTemplate& action, const CTElementType& from, GrxLine& line) {
    action.cloneElementAesthetics(from, line, true);
    line.removeSizes();
    action.changeColor2ToColor(line, false);
}

struct FitType {
    const XMLCh* word;
    int method, degree; // degree -1: not set
    const char* message; // the R-squared text; null for none
};
const FitType kFitTypes[] = {
    {GrxUni::_mean, grx::SmoothMethod::polynomial, 0, nullptr},
    {GrxUni::_linear, grx::SmoothMethod::linear, -1, "E60551"},
    {GrxUni::_quadratic, grx::SmoothMethod::polynomial, 2, "E60554"},
    {GrxUni::_cubic, grx::SmoothMethod::polynomial, 3, "E60555"},
    {GrxUni::_loess, grx::SmoothMethod::loess, -1, nullptr},
};
const FitType* fitType(const ChartString& word) {
    for (const FitType& type : kFitTypes)
        if (word.equals(type.word))
            return &type;
    return nullptr;
}

} // namespace

// ---- addFitLine --------------------------------------------------------------------------------------

TFitLine::TFitLine(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), confidence_(lastChildNamed(instruction, kConfidenceInterval)),
      primary_(booleanAttribute(instruction, u"primary", false)),
      styleOnly_(booleanAttribute(instruction, _styleOnly, false)),
      spikes_(booleanAttribute(instruction, GrxUni::_spikes, false)),
      colorSpikes_(booleanAttribute(instruction, u"colorSpikes", false)),
      rSquared_(booleanAttribute(instruction, u"rsquared", false)),
      fitTarget_(attributeOf(instruction, GrxUni::_target)), type_(attributeOf(instruction, GrxUni::_type)),
      proportion_(attributeOf(instruction, GrxUni::_proportion)), kernel_(attributeOf(instruction, GrxUni::_kernel)),
      bandwidth_(attributeOf(instruction, u"bandwidth")), intercept_(attributeOf(instruction, u"intercept")) {
    for (const DOMElement* style : childrenNamed(instruction, GrxUni::_style))
        (unsignedAttribute(style, GrxUni::_number) == 1 ? style1_ : mainStyle_) = style;
}

bool TFitLine::apply() {
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    if (instruction_ == nullptr || graphs.empty())
        return false;
    totalLabel_ = chartWord("Fit line for ") + chartWord("Total");
    confidenceLabel_ = chartWord("Confidence Intervals");
    const FitType* type = fitType(type_);
    message_ = type && type->message ? chartWord(type->message) : ChartString();
    const ChartString y(primary_ ? GrxUni::_y : _y2);
    for (GrrUviza* graph : graphs) {
        const std::vector<GrxCoordinates*> coordinates = graph->getCoordinatess();
        if (isRoleCategorical(*graph, ChartString(GrxUni::_x)) || isRoleCategorical(*graph, y) ||
            getDimensionsByRole(*graph, y).empty() || coordinates.size() < (primary_ ? 1u : 2u))
            continue;
        GrxCoordinates& use = *coordinates[primary_ ? 0 : 1];
        if (styleOnly_) {
            restyle(*graph, use);
            continue;
        }
        const std::vector<CTElementType*> elements = elementsOf(*graph);
        // A graph that has its fit already gets no second one, whichever element carries it.
        bool fitted = false;
        for (const CTElementType* element : elements)
            fitted = fitted || (onCoordinates(*element, use) && (!element->getSmoothStatistics().empty() ||
                                                                 !element->getRegionStatistics().empty()));
        if (fitted)
            continue;
        const bool total = !fitTarget_.equals(kSubgroup);
        for (CTElementType* element : elements) {
            if (isLineOrEdge(*element) || !onCoordinates(*element, use))
                continue;
            if (!total && aestheticsOf(*element).empty())
                break;
            add(*graph, use, *element, total);
        }
    }
    return true;
}

void TFitLine::restyle(GrrUviza& graph, const GrxCoordinates& coordinates) {
    for (CTElementType* element : elementsOf(graph)) {
        if (!onCoordinates(*element, coordinates))
            continue;
        const auto styleOfElement = [&]() -> GrxStyle& {
            return styleOf(*this, *element, &CTElementType::getStyle, &CTElementType::setStyle, ChartString());
        };
        if (dynamic_cast<GrxLine*>(element) != nullptr) {
            if (!element->getSmoothStatistics().empty() && mainStyle_ != nullptr)
                importStyle(mainStyle_, styleOfElement());
            if (!element->getRegionStatistics().empty())
                for (const DOMElement* style : childrenNamed(confidence_, GrxUni::_style))
                    importStyle(style, styleOfElement());
        } else if (dynamic_cast<GrxInterval*>(element) != nullptr && style1_ != nullptr) {
            for (const GrxSmoothStatistic* smooth : element->getSmoothStatistics())
                if (smooth->getSpikes()) {
                    importStyle(style1_, styleOfElement());
                    break;
                }
        }
    }
}

void TFitLine::add(GrrUviza& graph, GrxCoordinates& coordinates, CTElementType& element, bool total) {
    const CTCoordinate* x = element.getX();
    if (x != nullptr && dynamic_cast<const GrxExpressionVariable*>(x->getVariable()) != nullptr)
        total = false;
    GrxLine& line = addWithId<GrxLine>(*this, graph, GrxUni::_line);
    line.setCoordinates(coordinates);
    GrxStyle& style = addStyle(line, nullptr);
    line.setStyle(style);
    if (const ChartString color = colorOf(element); !color.empty())
        style.setColor(color);
    if (mainStyle_ != nullptr)
        importStyle(mainStyle_, style);
    copyVariables(line, element);
    cloneConditionalStyles(element, line);
    if (total)
        line.setName(totalLabel_);

    GrxSmoothStatistic& fit = line.addSmoothStatistic();
    fit.setBounded(false);
    const FitType* type = fitType(type_);
    if (type != nullptr) {
        fit.setMethod(type->method);
        if (type->degree >= 0)
            fit.setDegree(type->degree);
    }
    if (type_.equals(GrxUni::_loess)) {
        if (!proportion_.empty())
            fit.setProportion(proportion_.convertToDouble());
        int kernel = 0;
        if (kernel_.equals(u"Epanechnikov"))
            fit.setKernel(grx::Kernel::epanechnikov);
        else if (wordValue(grx::kKernel, kernel_, kernel))
            fit.setKernel(kernel);
    }
    if (!bandwidth_.empty())
        fit.setBandwidth(bandwidth_);
    if (intercept_.equals(GrxUni::_true) || intercept_.equals(GrxUni::_false))
        fit.setIntercept(intercept_.equals(GrxUni::_true));

    if (spikes_ && (!type_.equals(GrxUni::_loess) || !kernel_.empty()))
        addSpikes(graph, coordinates, element, line, fit);
    if (rSquared_ && type != nullptr && type->message != nullptr)
        addRSquared(line, total);
    GrxLine* confidence = confidence_ != nullptr ? addConfidenceLine(graph, coordinates, line) : nullptr;

    static const XMLCh* const kPlace[4] = {u"75%", u"99%", u"70%", u"80%"};
    GrxLegend& legend = legendOf(*this, target_, kPlace);
    if (total) {
        addLegendTarget(*this, legend, line);
        if (confidence != nullptr)
            addLegendTarget(*this, legend, *confidence);
        return;
    }
    followSubgroup(*this, element, line);
    if (confidence != nullptr)
        followSubgroup(*this, element, *confidence);
}

void TFitLine::addSpikes(GrrUviza& graph, GrxCoordinates& coordinates, CTElementType& element, GrxLine& line,
                         const GrxSmoothStatistic& fit) {
    GrxInterval& spikes = addWithId<GrxInterval>(*this, graph, GrxUni::_spikes);
    spikes.setCoordinates(coordinates);
    spikes.setPositionModifier(grx::PositionModifier::spikes);
    GrxStyle& style = addStyle(spikes, nullptr);
    spikes.setStyle(style);
    if (style1_ != nullptr)
        importStyle(style1_, style);
    copyVariables(spikes, line);
    if (colorSpikes_ && fitTarget_.equals(kSubgroup))
        cloneElementAesthetics(element, spikes, false);
    GrxSmoothStatistic& smooth = spikes.addSmoothStatistic();
    smooth.setSpikes(true);
    smooth.setBounded(false);
    if (fit.isMethodPresent())
        smooth.setMethod(fit.getMethod());
    if (fit.isDegreePresent())
        smooth.setDegree(fit.getDegree());
}

void TFitLine::addRSquared(GrxLine& line, bool total) {
    GrxLabelFrame& frame = target_.addLabelFrame();
    frame.setId(CreateUniqueId(ChartString(GrxUni::_frame)));
    GrxStyle& frameStyle = addStyle(frame, nullptr);
    frameStyle.setColor(GrxStyle::_transparent);
    frameStyle.setColor2(GrxStyle::_transparent);
    frameStyle.setVisible(true);
    frame.setStyle(frameStyle);
    // Each further label frame opens a row higher up; from the sixth on they share one.
    const std::size_t n = allOfKind<GrxLabelFrame>(target_, GrxUni::_labelFrame).size();
    const long p = n < 6 ? 5 * (17 - static_cast<long>(n)) : 80;
    ChartString top, bottom;
    top.appendInteger(p - 10).append(u"%");
    bottom.appendInteger(p).append(u"%");
    const XMLCh* const place[4] = {u"75%", u"99%", top.xc_str(), bottom.xc_str()};
    locate(frame, place);

    GrxLabel& label = frame.addLabel();
    GrxStyle& labelStyle = addStyle(label, nullptr);
    if (const GrxStyle* lineStyle = line.getStyle(); lineStyle != nullptr && hasText(lineStyle->getColor()))
        labelStyle.setColor(lineStyle->getColor());
    labelStyle.setFontSize(u"8pt", u"6pt", u"10pt");
    label.setStyle(labelStyle);
    GrxStyle& textFrame = addStyle(label, nullptr);
    textFrame.setColor(GrxStyle::_transparent);
    textFrame.setColor2(GrxStyle::_transparent);
    label.setTextFrameStyle(textFrame);

    GrxDescriptionGroup& group = label.addDescriptionGroup();
    group.setSeparator(u"\n");
    group.setTarget(line);
    group.addDescription().setKind(1);
    group.addText().setText(ChartString(total ? u"R" : u": R"));
    CTTextType& square = group.addText();
    square.setText(ChartString(u"2"));
    square.setPosition(1);
    square.setFontSize(u"8");
    group.addText().setText(ChartString(u" ") + message_);
    group.addText().setText(ChartString(u" = "));
    GrxDescription& value = group.addDescription();
    value.setKind(14);
    value.addFormat().setMaximumFractionDigits(3);
}

GrxLine* TFitLine::addConfidenceLine(GrrUviza& graph, GrxCoordinates& coordinates, GrxLine& line) {
    GrxLine& confidence = addWithId<GrxLine>(*this, graph, GrxUni::_line);
    confidence.setCoordinates(coordinates);
    GrxStyle& style = addStyle(confidence, nullptr);
    confidence.setStyle(style);
    for (const DOMElement* declared : childrenNamed(confidence_, GrxUni::_style))
        importStyle(declared, style);
    copyVariables(confidence, line);
    confidence.setName(confidenceLabel_);
    GrxRegionStatistic& region = confidence.addRegionStatistic();
    const FitType* type = fitType(type_);
    static const int kDegrees[] = {0, 1, 2, 3};
    for (int k = 0; k < 4; ++k)
        if (type == &kFitTypes[k])
            region.setDegree(kDegrees[k]);
    region.setType(7);
    region.setPredictIndividuals(booleanAttribute(confidence_, GrxUni::_predictIndividuals, false));
    if (const ChartString alpha = attributeOf(confidence_, GrxUni::_alpha); !alpha.empty())
        region.setAlpha(alpha.convertToDouble());
    return &confidence;
}

// ---- addInterpolationLine ----------------------------------------------------------------------------

TInterpolationLine::TInterpolationLine(const GrxVisualization* source, GrxVisualization& target,
                                       const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), style_(firstDescendantNamed(instruction, GrxUni::_style)),
      interpolation_(firstDescendantNamed(instruction, GrxUni::_interpolation)),
      primary_(booleanAttribute(interpolation_, u"primary", false)),
      type_(attributeOf(interpolation_, GrxUni::_type)), missing_(attributeOf(interpolation_, GrxUni::_missingRepresentation)),
      pointPosition_(attributeOf(interpolation_, GrxUni::_pointPosition)) {}

bool TInterpolationLine::apply() {
    if (interpolation_ == nullptr)
        return false;
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    const ChartString y(primary_ ? GrxUni::_y : _y2);
    for (GrrUviza* graph : graphs) {
        const std::vector<GrxCoordinates*> coordinates = graph->getCoordinatess();
        if (isGraphClustered(*graph) || getDimensionsByRole(*graph, y).empty() ||
            coordinates.size() < (primary_ ? 1u : 2u))
            continue;
        GrxCoordinates& use = *coordinates[primary_ ? 0 : 1];
        for (CTElementType* element : elementsOf(*graph)) {
            if (dynamic_cast<GrxLine*>(element) != nullptr || !onCoordinates(*element, use))
                continue;
            GrxLine& line = addWithId<GrxLine>(*this, *graph, GrxUni::_line);
            line.setCoordinates(use);
            line.addSummaryStatistic().setMethod(grx::SummaryMethod::none);
            GrxStyle& style = addStyle(line, nullptr);
            line.setStyle(style);
            if (const GrxStyle* own = element->getStyle()) {
                const bool point = dynamic_cast<GrxPoint*>(element) != nullptr;
                if (point && !noColor(own->getColor2()))
                    style.setColor(own->getColor2());
                else if (!noColor(own->getColor()))
                    style.setColor(own->getColor());
            }
            if (style_ != nullptr)
                importStyle(style_, style);
            cloneElementChildren(*element, line, true);
            changeColor2ToColor(line, false);
            if (!type_.equals(GrxUni::_linear)) {
                GrxSmoothStatistic& smooth = line.addSmoothStatistic();
                const bool step = type_.equals(GrxUni::_step), jump = type_.equals(GrxUni::_jump);
                if (step || jump) {
                    line.setShowDiscontinuity(jump);
                    smooth.setMethod(pointPosition_.equals(GrxUni::_left)      ? grx::SmoothMethod::stepLeft
                                     : pointPosition_.ContainsString(GrxUni::_right) ? grx::SmoothMethod::stepRight
                                                                                      : grx::SmoothMethod::step);
                } else if (type_.equals(GrxUni::_spline)) {
                    line.setShowDiscontinuity(true);
                    smooth.setMethod(grx::SmoothMethod::spline);
                }
            }
            int representation = 0;
            if (missing_.equals(u"interpolate"))
                line.setBreakRepresentation(grx::BreakRepresentation::interpolated);
            else if (wordValue(grx::kBreakRepresentation, missing_, representation) && representation != 0)
                line.setBreakRepresentation(representation);
        }
    }
    return !graphs.empty();
}

// ---- addHistogramNormalLine --------------------------------------------------------------------------

THistogramNormalLine::THistogramNormalLine(const GrxVisualization* source, GrxVisualization& target,
                                           const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), style_(firstDescendantNamed(instruction, GrxUni::_style)),
      parameter_(attributeOf(instruction, GrxUni::_parameter)), secondary_(attributeOf(instruction, u"secondaryParameter")) {
    // What each distribution needs: 0 nothing, 1 a parameter alone, 2 both, 3 no secondary one.
    static const struct {
        int distribution;
        int needs;
        const char* name;
    } kTypes[] = {{grx::Distribution::uniform, 0, "E62227"},       {grx::Distribution::normal, 0, "E62224"},
                  {grx::Distribution::t, 1, "E62323"},             {grx::Distribution::f, 2, "F Distribution"},
                  {grx::Distribution::chisquare, 1, "E62217"},     {grx::Distribution::gamma, 1, "E62219"},
                  {grx::Distribution::beta, 2, "E62216"},          {grx::Distribution::exponential, 3, "E62218"},
                  {grx::Distribution::logistic, 2, "E62222"},      {grx::Distribution::studentizedrange, 2, "Studentized Range"},
                  {grx::Distribution::weibull, 2, "E62228"},       {grx::Distribution::poisson, 3, "Poisson"}};
    int distribution = 0;
    if (!wordValue(grx::kDistribution, attributeOf(instruction, GrxUni::_type), distribution))
        return;
    for (const auto& type : kTypes) {
        if (type.distribution != distribution)
            continue;
        distribution_ = distribution;
        nameKey_ = ChartString(type.name);
        const bool p = !parameter_.empty(), s = !secondary_.empty();
        valid_ = type.needs == 0 || (type.needs == 1 && p && !s) || (type.needs == 2 && p && s) ||
                 (type.needs == 3 && !s);
    }
}

CTElementType* THistogramNormalLine::histogramOf(const GrrUviza& graph) const {
    if (isRoleCategorical(graph, ChartString(GrxUni::_x)))
        return nullptr;
    for (CTElementType* element : elementsOf(graph)) {
        const CTCoordinate* x = element->getX();
        if (x == nullptr || x->getVariable() == nullptr)
            continue;
        const std::vector<GrxSummaryStatistic*> summaries = element->getSummaryStatistics();
        if (!summaries.empty() && summaries.front()->getMethod() == grx::SummaryMethod::histogram)
            return element;
        const CTCoordinate* y = element->getY();
        const auto* yVariable = dynamic_cast<const GrxSourceVariable*>(y ? y->getVariable() : nullptr);
        const int statistic = yVariable && yVariable->getExtension() ? yVariable->getExtension()->getStatistic() : 0;
        if (statistic == 1 || statistic == 2)
            return element;
        const std::vector<GrxBinStatistic*> bins = element->getBinStatistics();
        if ((y == nullptr || y->getVariable() == nullptr) && !bins.empty() &&
            bins.front()->getGridType() == grx::GridType::dot)
            return element;
    }
    return nullptr;
}

bool THistogramNormalLine::apply() {
    if (instruction_ == nullptr || !valid_) {
        if (!valid_)
            ChartErrorHandler().error(ChartException(
                "The distribution's parameters do not fit its type: " + printed(instruction_), kFile, 1));
        return false;
    }
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    for (GrrUviza* graph : graphs) {
        CTElementType* histogram = histogramOf(*graph);
        if (histogram == nullptr)
            continue;
        GrxLine& line = addWithId<GrxLine>(*this, *graph, GrxUni::_distribution);
        if (GrxCoordinates* coordinates = histogram->getCoordinates())
            line.setCoordinates(*coordinates);
        line.addX().setVariable(*histogram->getX()->getVariable());
        GrxStyle& style = addStyle(line, nullptr);
        style.setWidth(u"1pt", nullptr, nullptr);
        line.setStyle(style);
        GrxDistributionStatistic& statistic = line.addDistributionStatistic();
        if (distribution_ != 0)
            statistic.setDistribution(distribution_);
        if (!parameter_.empty())
            statistic.setParameter(parameter_);
        if (!secondary_.empty())
            statistic.setSecondaryParameter(secondary_);
        if (getDimensionsByRole(*graph, ChartString(GrxUni::_y)).empty())
            for (GrxCoordinates* coordinates : graph->getCoordinatess())
                if (coordinates->getDimensions().size() + coordinates->getDimensionReferences().size() == 1)
                    coordinates->addDimension();
        if (!nameKey_.empty())
            line.setName(chartWord(nameKey_.toUTF8()));
        static const XMLCh* const kPlace[4] = {u"75%", u"98%", u"2.5%", u"97.5%"};
        addLegendTarget(*this, legendOf(*this, target_, kPlace), line);
        if (style_ != nullptr)
            importStyle(style_, style);
    }
    return !graphs.empty();
}

// ---- addSpikes ---------------------------------------------------------------------------------------

namespace {

int referenceCode(const ChartString& word) {
    if (word.equals(GrxUni::_centroid))
        return grx::LinkReference::centroid;
    if (word.equals(GrxUni::_UTF_base))
        return grx::LinkReference::base;
    if (word.equals(GrxUni::_origin))
        return grx::LinkReference::origin;
    return word.equals(GrxUni::_midrange) || word.equals(GrxUni::_mean) ? grx::LinkReference::mean : 0;
}

} // namespace

TAddSpikes::TAddSpikes(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), style_(firstDescendantNamed(instruction, GrxUni::_style)),
      styleOnly_(booleanAttribute(instruction, _styleOnly, false)),
      colorSpikes_(booleanAttribute(instruction, u"colorSpikes", false)) {
    ChartString y = attributeOf(instruction, GrxUni::_type);
    const bool typed = !y.empty();
    if (!typed)
        y = attributeOf(instruction, GrxUni::_y);
    ChartString x = attributeOf(instruction, GrxUni::_x), z = attributeOf(instruction, GrxUni::_z);
    // A reference for the whole point stands for every role; the base is the y axis's own.
    if (typed && referenceCode(y) != 0 && !y.equals(GrxUni::_UTF_base)) {
        if (x.empty())
            x = y;
        if (z.empty())
            z = y;
    }
    x_ = referenceCode(x);
    y_ = referenceCode(y);
    z_ = referenceCode(z);
}

bool TAddSpikes::apply() {
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    for (GrrUviza* graph : graphs) {
        bool categorical = false;
        for (const XMLCh* role : {GrxUni::_x, GrxUni::_y, GrxUni::_z})
            categorical = categorical || isRoleCategorical(*graph, ChartString(role));
        if (categorical)
            continue;
        for (CTElementType* element : elementsOf(*graph)) {
            if (auto* point = dynamic_cast<GrxPoint*>(element); point != nullptr && !styleOnly_) {
                auto& edge = addWithId<GrxEdge>(*this, *graph, GrxEdge::getElementName());
                if (GrxCoordinates* coordinates = point->getCoordinates())
                    edge.setCoordinates(*coordinates);
                copyVariables(edge, *point);
                cloneConditionalStyles(*point, edge);
                if (colorSpikes_)
                    cloneElementAesthetics(*point, edge, false);
                changeColor2ToColor(edge, false);
                GrxLinkStatistic& link = edge.addLinkStatistic();
                link.setType(1);
                if (x_ != 0)
                    link.setXReference(x_);
                if (y_ != 0 && edge.getY() != nullptr)
                    link.setYReference(y_);
                if (z_ != 0 && edge.getZ() != nullptr)
                    link.setZReference(z_);
                GrxStyle& style = addStyle(edge, nullptr);
                const ChartString color = colorSpikes_ ? colorOf(*point) : ChartString();
                style.setColor(color.empty() ? ChartString(GrxStyle::_black) : color);
                edge.setStyle(style);
                if (style_ != nullptr)
                    importStyle(style_, style);
            } else if (dynamic_cast<GrxEdge*>(element) != nullptr && styleOnly_ && style_ != nullptr &&
                       !element->getLinkStatistics().empty()) {
                importStyle(style_, styleOf(*this, *element, &CTElementType::getStyle, &CTElementType::setStyle,
                                            ChartString()));
            }
        }
    }
    return !graphs.empty();
}

// ---- setProjectionLine -------------------------------------------------------------------------------

TSetProjectionLine::TSetProjectionLine(const GrxVisualization* source, GrxVisualization& target,
                                       const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), before_(booleanAttribute(instruction, _before, false)),
      high_(attributeOf(instruction, GrxUni::_high)), low_(attributeOf(instruction, GrxUni::_low)) {
    if (const DOMElement* category = firstDescendantNamed(instruction, _categoryValue)) {
        category_ = directText(category);
        hasCategory_ = true;
    }
}

bool TSetProjectionLine::apply() {
    if (!hasCategory_)
        return false;
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    for (GrrUviza* graph : graphs)
        for (CTElementType* element : elementsOf(*graph)) {
            if (dynamic_cast<GrxLine*>(element) == nullptr && dynamic_cast<GrxPath*>(element) == nullptr)
                continue;
            const CTCoordinate* x = element->getX();
            CTVariableType* variable = x ? x->getVariable() : nullptr;
            if (variable == nullptr || variable->getCategorical() != 0)
                continue;
            GrxDerivedVariable& cut = target_.addDerivedVariable();
            cut.setId(CreateUniqueId(ChartString(GrxUni::_derivedVariable)));
            cut.setCreator(u"internal_cutVariable");
            cut.setCategorical(0);
            ChartString value(variable->getId());
            value.append(before_ ? u" > " : u" < ").append(category_).append(u" ? 0 : 1");
            cut.setValue(value);
            GrxSize& size = element->addSize();
            size.setVariable(cut);
            if (!high_.empty())
                size.setHigh(high_);
            if (!low_.empty())
                size.setLow(low_);
        }
    return !graphs.empty();
}

namespace {

const ActionFamily family{
    {u"addFitLine", "TFitLine", makeAction<TFitLine>},
    {u"addInterpolationLine", "TInterpolationLine", makeAction<TInterpolationLine>},
    {u"addHistogramNormalLine", "THistogramNormalLine", makeAction<THistogramNormalLine>},
    {u"addSpikes", "TAddSpikes", makeAction<TAddSpikes>},
    {u"setProjectionLine", "TSetProjectionLine", makeAction<TSetProjectionLine>},
};

} // namespace

} // namespace plotaid::detail
