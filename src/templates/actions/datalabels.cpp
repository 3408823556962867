// Data labels. Labels are made first (per element, per content the instruction names, or the
// first content that fits), then formatted, then styled; a repeated labelling is removed last, so
// labelling twice leaves one label per variable and statistic.
#include "templates/actions/datalabels.h"

#include <plotaid/ChartStyleValue.h>

#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>

#include <algorithm>
#include <initializer_list>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

constexpr XMLCh kPosition[] = u"position";
constexpr XMLCh kColorByMarker[] = u"colorByMarker";

// Without labelling contents, the first of these that fits is shown.
const TAddDataLabels::Kind kFallback[] = {TAddDataLabels::Labeling, TAddDataLabels::CaseNumber,
                                          TAddDataLabels::Count,    TAddDataLabels::Percent,
                                          TAddDataLabels::Y,        TAddDataLabels::X,
                                          TAddDataLabels::Z,        TAddDataLabels::Legend1};

// "true" 1, "false" 2, absent or empty 0; with `loose`, any other word is 2 as well.
int triState(const DOMElement* instruction, const XMLCh* name, bool loose = false) {
    const ChartString v = attributeOf(instruction, name);
    if (v.empty())
        return 0;
    if (v.equals(GrxUni::_true))
        return 1;
    return v.equals(GrxUni::_false) || loose ? 2 : 0;
}

int locationOf(const ChartString& word) {
    if (word.equals(GrxUni::_center))
        return 1;
    if (word.equals(u"positive"))
        return 2;
    return word.equals(u"negative") ? 3 : 0;
}

bool kindOf(const ChartString& word, TAddDataLabels::Kind& kind) {
    static const struct {
        const XMLCh* word;
        TAddDataLabels::Kind kind;
    } kWords[] = {{BaseTemplate::_casenum, TAddDataLabels::CaseNumber}, {GrxUni::_count, TAddDataLabels::Count},
                  {GrxUni::_labeling, TAddDataLabels::Labeling},        {GrxUni::_percent, TAddDataLabels::Percent},
                  {GrxUni::_x, TAddDataLabels::X},                      {u"xortheta", TAddDataLabels::X},
                  {GrxUni::_y, TAddDataLabels::Y},                      {GrxUni::_z, TAddDataLabels::Z},
                  {u"legend1", TAddDataLabels::Legend1},                {u"legend2", TAddDataLabels::Legend2}};
    for (const auto& entry : kWords)
        if (word.equals(entry.word)) {
            kind = entry.kind;
            return true;
        }
    return false;
}

int firstSummaryMethod(const CTElementType& element) {
    const std::vector<GrxSummaryStatistic*> statistics = element.getSummaryStatistics();
    return statistics.empty() ? -1 : statistics.front()->getMethod();
}

bool among(int method, std::initializer_list<int> methods) {
    return std::find(methods.begin(), methods.end(), method) != methods.end();
}

bool noColor(const XMLCh* color) {
    return !hasText(color) || ChartString(color).equals(GrxStyle::_transparent);
}

CTVariableType* variableOf(const CTCoordinate* coordinate) {
    return coordinate ? coordinate->getVariable() : nullptr;
}

CTVariableType* clusterVariable(const BaseTemplate& action, const GrrUviza& graph, const XMLCh* role) {
    for (const GrxDimension* dimension : action.getDimensionsByRole(graph, ChartString(role)))
        if (CTVariableType* cluster = dimension->getClusterVariable())
            return cluster;
    return nullptr;
}

// Every attribute of `from` but its id.
void copyStatistic(const GrxSummaryStatistic& from, GrxSummaryStatistic& to) {
    const DOMNamedNodeMap* attributes = from.getImplementation()->getAttributes();
    for (XMLSize_t i = 0; i < attributes->getLength(); ++i) {
        const DOMNode* a = attributes->item(i);
        if (!XMLString::equals(a->getNodeName(), GrxUni::_id))
            to.SetAttribute(a->getNodeName(), a->getNodeValue());
    }
}

// The labelling of `variable` whose statistic is that method (-1: none).
GrxLabeling* existingLabeling(const CTElementType& element, const CTVariableType& variable, int method) {
    for (GrxLabeling* labeling : element.getLabelings()) {
        if (labeling->getVariable() != &variable)
            continue;
        const std::vector<GrxSummaryStatistic*> statistics = labeling->getSummaryStatistics();
        if ((statistics.empty() ? -1 : statistics.front()->getMethod()) == method)
            return labeling;
    }
    return nullptr;
}

bool hasAnyStatistic(const CTElementType& element) {
    return !element.getStatistics().empty();
}

} // namespace

TAddDataLabels::TAddDataLabels(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction)
    : BaseTemplate(source, target, instruction), styleOnly_(booleanAttribute(instruction, _styleOnly, false)),
      colorByMarker_(triState(instruction, kColorByMarker)), hidden_(triState(instruction, GrxUni::_hidden)),
      colliding_(triState(instruction, GrxUni::_showCollidingLabels, true)),
      connecting_(triState(instruction, GrxUni::_connectingLines)) {
    for (const DOMElement* style : descendantsNamed(instruction, GrxUni::_style))
        (unsignedAttribute(style, GrxUni::_number) == 1 ? style1_ : mainStyle_) = style;
    const ChartStyleValue position(attributeOf(instruction, kPosition).xc_str());
    horizontal_ = locationOf(position.getLabel_Location_X());
    vertical_ = locationOf(position.getLabel_Location_Y());
    if (const int h = locationOf(attributeOf(instruction, GrxUni::_labelLocationHorizontal)))
        horizontal_ = h;
    if (const int v = locationOf(attributeOf(instruction, GrxUni::_labelLocationVertical)))
        vertical_ = v;
    for (const DOMElement* labeling : descendantsNamed(instruction, GrxUni::_labeling)) {
        Kind kind = Y;
        if (kindOf(attributeOf(labeling, GrxUni::_variable), kind))
            contents_.push_back({kind, labeling->getFirstElementChild()});
    }
}

void TAddDataLabels::findSpecialVariables() {
    for (GrxSourceVariable* variable : target_.getSourceVariables()) {
        const int statistic = variable->getExtension() ? variable->getExtension()->getStatistic() : 0;
        const ChartString name(variable->getSourceName());
        if (statistic == 1)
            count_ = variable;
        else if (name.equals(u"$WEIGHT"))
            weight_ = variable;
        else if (name.equals(u"$CASENUM"))
            caseNumber_ = variable;
        else if (statistic == 2 || name.equals(u"$PERCENT"))
            percent_ = variable;
        else if (ChartString(variable->getDescription()).equals(GrxUni::_labeling))
            labeling_ = variable;
    }
    if (count_ == nullptr)
        for (GrxDerivedVariable* variable : target_.getDerivedVariables())
            if (ChartString(variable->getValue()).ContainsString(u"counted")) {
                count_ = variable;
                break;
            }
}

CTVariableType* TAddDataLabels::variableFor(const GrrUviza& graph, const CTElementType& element, Kind kind) const {
    const int method = firstSummaryMethod(element);
    CTVariableType* x = variableOf(element.getX());
    switch (kind) {
    case CaseNumber:
        return caseNumber_;
    case Count:
        return count_ ? count_ : among(method, {4, 10, 14, 25, 26}) ? x : nullptr;
    case Labeling:
        return labeling_;
    case Percent:
        if (percent_ != nullptr || count_ != nullptr)
            return percent_ ? percent_ : count_;
        if (among(method, {3, 4, 10, 14, 22, 23, 25, 26}) || (method < 0 && polar_))
            return x;
        return nullptr;
    case X:
        if (CTVariableType* cluster = clusterVariable(*this, graph, GrxUni::_x))
            return cluster;
        if (x != nullptr && !polar_)
            return x;
        break;
    case Y:
        return variableOf(element.getY());
    case Z:
        if (CTVariableType* cluster = clusterVariable(*this, graph, GrxUni::_z))
            return cluster;
        return variableOf(element.getZ());
    case Legend1:
    case Legend2:
        break;
    }
    const std::vector<CTVariableType*> legend = getLegendVariables(graph, ChartString(GrxUni::_legend));
    const std::size_t wanted = kind == Legend2 ? 1 : 0;
    return legend.size() > wanted ? legend[wanted] : nullptr;
}

GrxLabeling* TAddDataLabels::labelingFor(const GrrUviza& graph, CTElementType& element, Kind kind,
                                         SharedStyles* make) {
    CTVariableType* variable = variableFor(graph, element, kind);
    if (variable == nullptr || !element.getDistributionStatistics().empty())
        return nullptr;
    if (kind == CaseNumber && hasAnyStatistic(element))
        return nullptr;
    const std::vector<GrxSummaryStatistic*> statistics = element.getSummaryStatistics();
    GrxSummaryStatistic* first = statistics.empty() ? nullptr : statistics.front();
    const int method = first ? first->getMethod() : -1;
    int labelMethod = method;
    if (!polar_ && among(method, {3, 4, 22, 23})) {
        if (kind != Percent && kind != Count && kind != X)
            return nullptr;
        if (kind == Count)
            labelMethod = grx::SummaryMethod::count;
    }
    if (!polar_ && among(method, {10, 25, 26}) && kind != Count)
        return nullptr;
    const bool withStatistic = first != nullptr && (!polar_ || kind == Percent);
    const bool percentOfCount = kind == Percent && first == nullptr && percent_ == nullptr;
    if (!withStatistic)
        labelMethod = percentOfCount ? grx::SummaryMethod::percent : -1;
    // A range is labelled at both ends; the low end stands for the pair.
    const int lookFor = method == grx::SummaryMethod::range ? grx::SummaryMethod::rangeLow : labelMethod;
    if (GrxLabeling* existing = existingLabeling(element, *variable, lookFor))
        return existing;
    if (make == nullptr)
        return nullptr;
    if (make->label == nullptr) {
        make->label = &addStyle(element, CreateUniqueId(ChartString(GrxUni::_labeling)).xc_str());
        make->frame = &addStyle(element, CreateUniqueId(ChartString(GrxUni::_text)).xc_str());
    }
    const auto added = [&](int statisticMethod) -> GrxLabeling& {
        GrxLabeling& labeling = element.addLabeling();
        labeling.setVariable(*variable);
        labeling.setStyle(*make->label);
        labeling.setTextFrameStyle(*make->frame);
        if (statisticMethod >= 0) {
            GrxSummaryStatistic& statistic = labeling.addSummaryStatistic();
            if (first != nullptr)
                copyStatistic(*first, statistic);
            statistic.setMethod(statisticMethod);
        }
        return labeling;
    };
    if (method == grx::SummaryMethod::range) {
        added(grx::SummaryMethod::rangeHigh);
        return &added(grx::SummaryMethod::rangeLow);
    }
    GrxLabeling& labeling = added(labelMethod);
    if (withStatistic) {
        GrxSummaryStatistic& statistic = *labeling.getSummaryStatistics().front();
        statistic.setAugment(2);
    } else if (percentOfCount) {
        labeling.addFormat().setMinimumFractionDigits(2);
    }
    return &labeling;
}

void TAddDataLabels::create(const GrrUviza& graph, CTElementType& element) {
    if (!element.getRegionStatistics().empty())
        return;
    SharedStyles made;
    const auto madeOne = [&](Kind kind) {
        GrxLabeling* labeling = labelingFor(graph, element, kind, &made);
        if (labeling != nullptr)
            frameStyle(element, *labeling);
        return labeling != nullptr;
    };
    for (const Content& content : contents_)
        if (content.format == nullptr)
            madeOne(content.kind);
    if (contents_.empty())
        for (Kind kind : kFallback)
            if (madeOne(kind))
                break;
    if (made.label == nullptr)
        return;
    ChartString size, minimum;
    made.label->getFontSize(&size, &minimum, nullptr);
    if (size.empty() || minimum.empty())
        made.label->setFontSize(size.empty() ? u"7pt" : nullptr, minimum.empty() ? u"6pt" : nullptr, nullptr);
}

void TAddDataLabels::format(const GrrUviza& graph, CTElementType& element) {
    static const XMLCh* const kFormats[] = {u"format", u"numberFormat", u"stringFormat", u"dateTimeFormat",
                                            u"elapsedTimeFormat"};
    for (const Content& content : contents_) {
        if (content.format == nullptr || !element.getRegionStatistics().empty())
            continue;
        SharedStyles made;
        GrxLabeling* labeling = labelingFor(graph, element, content.kind, styleOnly_ ? nullptr : &made);
        if (labeling == nullptr)
            continue;
        const std::vector<GrxFormat*> formats = labeling->getFormats();
        GrxFormat& into = formats.empty() ? labeling->addFormat() : *formats.front();
        if (named(content.format, kFormats[0]))
            importFormat(into, content.format);
        else if (named(content.format, kFormats[1]))
            importNumberFormat(into, content.format);
        else if (named(content.format, kFormats[2]))
            importStringFormat(into, content.format);
        else if (named(content.format, kFormats[3]))
            importDateTimeFormat(into, content.format);
        else if (named(content.format, kFormats[4]))
            importElapsedTimeFormat(into, content.format);
    }
}

GrxStyle& TAddDataLabels::frameStyle(CTElementType& element, GrxLabeling& labeling) {
    GrxStyle& frame =
        styleOf(*this, labeling, &GrxLabeling::getTextFrameStyle, &GrxLabeling::setTextFrameStyle, ChartString());
    const GrxStyle* own = element.getStyle();
    const bool clear = dynamic_cast<GrxPoint*>(&element) != nullptr || dynamic_cast<GrxSchema*>(&element) != nullptr ||
                       (dynamic_cast<GrxInterval*>(&element) != nullptr && own != nullptr &&
                        !ChartString(own->getSymbol()).equals(GrxUni::_square));
    if (!frame.isColorPresent())
        frame.setColor(clear ? GrxStyle::_transparent : GrxStyle::_white);
    if (!frame.isColor2Present())
        frame.setColor2(clear ? GrxStyle::_transparent : GrxStyle::_black);
    return frame;
}

void TAddDataLabels::colorByMarker(CTElementType& element, GrxLabeling& labeling, GrxStyle& label, GrxStyle& frame) {
    const GrxStyle* own = element.getStyle();
    const XMLCh* marker = own == nullptr ? nullptr : noColor(own->getColor()) ? own->getColor2() : own->getColor();
    if (hasText(marker)) {
        label.setColor(marker);
        frame.setColor2(GrxStyle::_transparent);
    }
    cloneElementAesthetics(element, labeling, false);
    changeColor2ToColor(labeling, false);
    for (GrxStyleBy* styleBy : labeling.getStyleBys()) {
        GrxStyleCycle* cycle = styleBy->getCycle();
        if (cycle == nullptr)
            continue;
        for (GrxCycle* styles : cycle->getCycles())
            for (GrxStyle* style : styles->getStyles())
                if (noColor(style->getColor()))
                    style->setColor(noColor(style->getColor2()) ? GrxStyle::_black : style->getColor2());
    }
}

void TAddDataLabels::style(CTElementType& element) {
    styleOf(*this, element, &CTElementType::getStyle, &CTElementType::setStyle, ChartString());
    const bool schema = dynamic_cast<GrxSchema*>(&element) != nullptr;
    for (GrxLabeling* labeling : element.getLabelings()) {
        GrxStyle& label = styleOf(*this, *labeling, &GrxLabeling::getStyle, &GrxLabeling::setStyle, ChartString());
        GrxStyle& frame = frameStyle(element, *labeling);
        if (mainStyle_ != nullptr)
            importStyle(mainStyle_, label);
        if (style1_ != nullptr && !(schema && styleOnly_))
            importStyle(style1_, frame);
        if (horizontal_ != 0)
            label.setLabelLocationHorizontal(horizontal_);
        if (vertical_ != 0)
            label.setLabelLocationVertical(vertical_);
        if (connecting_ != 0)
            labeling->setConnectingLines(connecting_ == 1);
        if (colorByMarker_ == 1)
            colorByMarker(element, *labeling, label, frame);
        if (hidden_ != 0) {
            label.setVisible(hidden_ == 2);
            frame.setVisible(hidden_ == 2);
        }
    }
    if (colliding_ != 0)
        element.setShowCollidingLabels(colliding_ == 1);
}

void TAddDataLabels::removeDuplicates(CTElementType& element) {
    const std::vector<GrxLabeling*> labelings = element.getLabelings();
    std::vector<bool> removed(labelings.size(), false);
    for (std::size_t i = 0; i < labelings.size(); ++i) {
        if (removed[i] || labelings[i]->getVariable() == nullptr)
            continue;
        const std::vector<GrxSummaryStatistic*> a = labelings[i]->getSummaryStatistics();
        for (std::size_t j = i + 1; j < labelings.size(); ++j) {
            if (removed[j] || labelings[j]->getVariable() == nullptr ||
                !ChartString(labelings[j]->getVariable()->getId()).equals(labelings[i]->getVariable()->getId()))
                continue;
            const std::vector<GrxSummaryStatistic*> b = labelings[j]->getSummaryStatistics();
            if ((a.empty() && b.empty()) ||
                (!a.empty() && !b.empty() && a.front()->getMethod() == b.front()->getMethod())) {
                element.removeLabeling(*labelings[j]);
                removed[j] = true;
            }
        }
    }
}

// One inset per graph at most: a second labelling that asks for labels inside asks for the same room.
void TAddDataLabels::labelsInside(GrrUviza& graph) {
    const std::vector<GrxCoordinates*> coordinates = graph.getCoordinatess();
    if (coordinates.empty())
        return;
    for (const GrxCoordinates* c : coordinates)
        if (!c->getInsetTransforms().empty())
            return;
    for (const CTElementType* element : elementsOf(graph))
        for (const GrxLabeling* labeling : element->getLabelings()) {
            const GrxStyle* style = labeling->getStyle();
            if (style == nullptr || !style->isLabelInsidePresent() || style->getLabelInside() != 2)
                continue;
            GrxInsetTransform& inset = coordinates.back()->addInsetTransform();
            inset.setXMin(0.1);
            inset.setXMax(0.1);
            inset.setYMin(0.1);
            inset.setYMax(0.1);
            return;
        }
}

bool TAddDataLabels::apply() {
    if (instruction_ == nullptr)
        return false;
    findSpecialVariables();
    const std::vector<GrrUviza*> graphs = allGraphs(target_);
    for (GrrUviza* graph : graphs) {
        polar_ = isGraphPolar(*graph);
        const std::vector<CTElementType*> elements = elementsOf(*graph);
        if (!styleOnly_)
            for (CTElementType* element : elements)
                create(*graph, *element);
        for (CTElementType* element : elements)
            format(*graph, *element);
        for (CTElementType* element : elements)
            style(*element);
        for (CTElementType* element : elements)
            removeDuplicates(*element);
        if (polar_)
            labelsInside(*graph);
    }
    return !graphs.empty();
}

namespace {

const ActionFamily family{
    {u"addDataLabels", "TAddDataLabels", makeAction<TAddDataLabels>},
};

} // namespace

} // namespace plotaid::detail
