#ifndef PLOTAID_BASETEMPLATE_H
#define PLOTAID_BASETEMPLATE_H

#include <plotaid/Export.h>

#include <grx/ChartString.h>

#include <xercesc/util/XercesDefs.hpp>

#include <cstdint>
#include <string>
#include <vector>

XERCES_CPP_NAMESPACE_BEGIN
class DOMElement;
XERCES_CPP_NAMESPACE_END

class CTAesthetic;
class CTElementType;
class CTVariableType;
class GrrUviza;
class GrxAxis;
class GrxBaseElement;
class GrxCategoricalDomain;
class GrxDimension;
class GrxFormat;
class GrxGridline;
class GrxInterval;
class GrxLabel;
class GrxLabeling;
class GrxLegend;
class GrxMajorTicks;
class GrxMinorTicks;
class GrxStyle;
class GrxStyleBy;
class GrxStyleCycle;
class GrxVisualization;

// Base of every template action: what an action works on (the target visualization, the chart's
// own definition as the source, the instruction element) and the look-ups and small edits that
// many actions share. An action is made for one instruction, applied once and destroyed.
class PLOTAID_API BaseTemplate {
public:
    BaseTemplate(const GrxVisualization* source, GrxVisualization& target,
                 const XERCES_CPP_NAMESPACE::DOMElement* instruction);
    BaseTemplate(const GrxVisualization* source, GrxVisualization& target);
    BaseTemplate(const BaseTemplate& other) = default;
    BaseTemplate& operator=(const BaseTemplate&) = delete;

    // Carries out the instruction; false when it changed nothing it was asked to.
    virtual bool apply() = 0;
    virtual ~BaseTemplate();

    // `prefix` followed by the first number from 1 up that is no id of the target.
    ChartString CreateUniqueId(const ChartString& prefix) const;
    ChartString CreateUniqueId(const std::string& prefix) const;
    // A style with `id` (a fresh "style<n>" when empty) inside the one container style that holds
    // every style a template adds; an existing style of that id is returned as it is. The style
    // is not attached to `element`: callers refer to it by its id.
    GrxStyle& addStyle(GrxBaseElement& element, const XMLCh* id);

    // The graphs the instruction's "graph" attribute selects (its number from 1, or all for 0 or
    // none) are appended; returns how many graphs the target holds.
    std::uint32_t getGraphs(std::vector<GrrUviza*>& graphs) const;
    std::vector<GrxLegend*> getLegends() const;
    // Points, lines, edges, paths, intervals, areas, polygons, schemas: kind by kind.
    static void getAllElements(const GrrUviza& graph, std::vector<CTElementType*>& elements);
    void getAllElementsByType(const XMLCh* name, std::vector<CTElementType*>& elements) const;
    std::vector<CTElementType*> getElementsWithSummaryStatistics(const GrrUviza& graph) const;
    std::vector<CTAesthetic*> getAesthetics(const CTElementType& element) const;
    // Intervals of the selected graphs that are polar exactly when `polar` is; returns the list's size.
    std::uint32_t getIntervalElements(std::vector<GrxInterval*>& intervals, bool polar) const;
    CTElementType* getFirstSPLOMElement(const GrrUviza& graph) const;

    // Dimensions of role x, y, "y2" or z, counted with dimension references among each coordinates.
    std::vector<GrxDimension*> getDimensionsByRole(const GrrUviza& graph, const ChartString& role) const;
    CTVariableType* getElementVariable(const CTElementType& element, const ChartString& role) const;
    void copyVariables(CTElementType& to, const CTElementType& from) const;
    void addZDimension(GrrUviza& graph) const;

    bool isGraphPolar(const GrrUviza& graph) const;
    bool isGraphClustered(const GrrUviza& graph) const;
    bool isChartTrue3D(const GrrUviza& graph) const;
    bool isIntervalRangeElement(const CTElementType& element) const;
    bool isAxisDerived(const GrxAxis& axis) const;
    // Exactly "true" or "false"; anything else (absent, empty, "TRUE") gives `absent`.
    static bool getBooleanAttribute(const XERCES_CPP_NAMESPACE::DOMElement* element, const XMLCh* name,
                                    bool absent);
    // Whether the element's coordinates are the coordinates at the given 0-based position.
    bool doesCoordinateMatch(const CTElementType& element, const ChartString& number) const;
    // Whether the nearest coordinates at or above the element are the first, or the second for "y2".
    bool doesCoordinateMatch(const GrxBaseElement& element, const ChartString& name) const;

    // Merges a template "style" element into `style`, property by property; what the chart's own
    // definition (the source) sets on the style of the same id is never overwritten.
    void importStyle(const XERCES_CPP_NAMESPACE::DOMElement* element, GrxStyle& style);

    // Template format elements onto an object-model format; a null element does nothing.
    // "format" is a literal copy; the others only add to what the format already says.
    static void importFormat(GrxFormat& format, const XERCES_CPP_NAMESPACE::DOMElement* element);
    void importNumberFormat(GrxFormat& format, const XERCES_CPP_NAMESPACE::DOMElement* element);
    void importStringFormat(GrxFormat& format, const XERCES_CPP_NAMESPACE::DOMElement* element);
    void importDateTimeFormat(GrxFormat& format, const XERCES_CPP_NAMESPACE::DOMElement* element);
    void importElapsedTimeFormat(GrxFormat& format, const XERCES_CPP_NAMESPACE::DOMElement* element);

    // The tick, grid-line and label parts of an axis instruction (its majorTicks, minorTicks or
    // label element): parts and styles that are missing are made, then the element's styles and
    // formats are imported. "styleOnly" never adds ticks; with it, minor ticks are only restyled.
    void setMajorTicks(GrxAxis& axis, const XERCES_CPP_NAMESPACE::DOMElement* element);
    void setMinorTicks(GrxAxis& axis, const XERCES_CPP_NAMESPACE::DOMElement* element);
    void styleMajorTicks(GrxMajorTicks& ticks, const XERCES_CPP_NAMESPACE::DOMElement* element);
    void styleMinorTicks(GrxMinorTicks& minor, const XERCES_CPP_NAMESPACE::DOMElement* element,
                         GrxMajorTicks* major);
    // A new grid-line style takes the colour of `from` (may be null).
    void styleGridLines(GrxStyle* from, GrxGridline& gridline, const XERCES_CPP_NAMESPACE::DOMElement* element);
    void styleLabel(GrxLabel& label, const XERCES_CPP_NAMESPACE::DOMElement* element);
    // The label's texts become the element's own text with its date and time placeholders filled
    // in the user's language; an element without text leaves the label as it is.
    void mergeText(const XERCES_CPP_NAMESPACE::DOMElement* element, GrxLabel& label);

    // Category look-ups on a graph of the target, for role x, y, "y2", z (and legend where said).
    bool isRoleCategorical(const GrrUviza& graph, const ChartString& role) const;
    // With an element, its own x or z variable (or, for legend, its aesthetics) answers first.
    GrxCategoricalDomain* getCategoricalDomain(const GrrUviza& graph, const ChartString& role,
                                               const CTElementType* element) const;
    // Aesthetic variables, in element and kind order, repeats kept: all of them for legend, else
    // those that are the element's variable of the role.
    std::vector<CTVariableType*> getLegendVariables(const GrrUviza& graph, const ChartString& role) const;
    // The category value whose relabel reads `label` (first format of each variable only); empty
    // when none does.
    ChartString getCategoryValue(const GrrUviza& graph, const XMLCh* role, const ChartString& label) const;

    // Cloning one object of the target into another: every copied aesthetic gets a fresh id.
    // Every attribute but the id; returns how many were copied.
    std::uint32_t duplicateAttributes(const GrxBaseElement& from, GrxBaseElement& to);
    // Variables, aesthetics and conditional styles.
    bool cloneElementChildren(const CTElementType& from, CTElementType& to, bool cloneLegend);
    // From and to are elements or labelings; anything else is left alone. Always false.
    bool cloneElementAesthetics(const GrxBaseElement& from, GrxBaseElement& to, bool cloneLegend);
    void cloneStyleBy(const GrxStyleBy& from, GrxStyleBy& to);
    void cloneStyleCycle(const GrxStyleCycle& from, GrxStyleCycle& to);
    // A style-by on `to` like the first of `from`, whose cycle keeps only the colours (swapped
    // from a point onto a line or a text).
    void cloneStyleCycle(CTElementType& to, const CTElementType& from, const XMLCh* prefix,
                         const ChartString& fromKind, const ChartString& toKind);
    bool cloneConditionalStyles(const CTElementType& from, CTElementType& to);
    // Every legend that shows the aesthetic `oldId` shows `aesthetic` too.
    void CloneLegendEntry(const ChartString& oldId, GrxBaseElement& aesthetic);
    // Cycle styles without a colour of their own take their colour 2; returns the style-by count.
    std::uint32_t changeColor2ToColor(CTElementType& element, bool force);
    std::uint32_t changeColor2ToColor(GrxLabeling& labeling, bool force);

    static const XMLCh* const _before;
    static const XMLCh* const _casenum;
    static const XMLCh* const _categoryValue;
    static const XMLCh* const _clustered;
    static const XMLCh* const _derived;
    static const XMLCh* const _diffln;
    static const XMLCh* const _dropline;
    static const XMLCh* const _errorbar;
    static const XMLCh* const _frameId;
    static const XMLCh* const _gridLines;
    static const XMLCh* const _hilo;
    static const XMLCh* const _legendFrameStyle;
    static const XMLCh* const _legendLabelStyle;
    static const XMLCh* const _legendStyle;
    static const XMLCh* const _legend_1;
    static const XMLCh* const _multiple;
    static const XMLCh* const _parentFrameId;
    static const XMLCh* const _pie;
    static const XMLCh* const _populationPyramid;
    static const XMLCh* const _scalar;
    static const XMLCh* const _scatter;
    static const XMLCh* const _styleOnly;
    static const XMLCh* const _textFrame;
    static const XMLCh* const _tickLabelStyle;
    static const XMLCh* const _when;
    static const XMLCh* const _xaxis_title;
    static const XMLCh* const _y2;
    static const XMLCh* const _yaxis_title;
    static const XMLCh* const _zaxis_title;

protected:
    GrxVisualization& target_;
    const GrxVisualization* source_;
    const XERCES_CPP_NAMESPACE::DOMElement* instruction_;
};

#endif
