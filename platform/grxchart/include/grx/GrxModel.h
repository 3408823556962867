#ifndef GRX_GRXMODEL_H
#define GRX_GRXMODEL_H

// Every class of the chart object model. Each is a thin list of typed names over the generic core
// (GrxBaseElement); the element names are GrxUni texts where a constant exists.

#include <grx/ChartString.h>
#include <grx/GrxBaseElement.h>
#include <grx/GrxDocument.h>
#include <grx/GrxEnums.h>
#include <grx/GrxMembers.h>
#include <grx/GrxUni.h>

#include <iterator>
#include <string>
#include <vector>

class GrxLocation;
class GrxStyle;
class GrxLabel;
class CTTextType;
class GrxFormat;
class GrxCoordinates;
class GrxDimension;
class GrxCategoricalDomain;
class GrxStyleCycle;
class CTVariableType;
class CTElementType;
class GrxLegend;
class GrxLabelFrame;
class GrxKey;

// ---- styles ---------------------------------------------------------------------------------------

// A CSS-like property set. Font size, width and size are compound: "preferred;minimum;maximum"
// in one attribute, trailing empty parts left out; a null part given to a setter stays unchanged.
class GRX_API GrxStyle : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_style)
    static constexpr XMLCh _black[] = u"black";
    static constexpr XMLCh _white[] = u"white";
    static constexpr XMLCh _transparent[] = u"transparent";
    static constexpr XMLCh _margin_left[] = u"margin-left";
    static constexpr XMLCh _margin_right[] = u"margin-right";
    static constexpr XMLCh _margin_top[] = u"margin-top";
    static constexpr XMLCh _margin_bottom[] = u"margin-bottom";
    static constexpr XMLCh _padding_left[] = u"padding-left";
    static constexpr XMLCh _padding_right[] = u"padding-right";
    static constexpr XMLCh _padding_top[] = u"padding-top";
    static constexpr XMLCh _padding_bottom[] = u"padding-bottom";
    static constexpr XMLCh _textAlignment[] = u"textAlignment";
    static constexpr XMLCh _maxAttachedTextWidth[] = u"maxAttachedTextWidth";
    static constexpr XMLCh _maxAttachedTextHeight[] = u"maxAttachedTextHeight";

    GRX_LIST(Style, GrxStyle)
    GRX_TEXT(Color, GrxUni::_color)
    GRX_TEXT(Color2, GrxUni::_color2)
    GRX_TEXT(Stroke_width, GrxUni::_stroke_width)
    GRX_TEXT(Stroke_dasharray, GrxUni::_stroke_dasharray)
    GRX_TEXT(Padding, GrxUni::_padding)
    GRX_TEXT(Margin, GrxUni::_margin)
    GRX_TEXT(Symbol, GrxUni::_symbol)
    GRX_TEXT(Depth, GrxUni::_depth)
    GRX_TEXT(Font_family, GrxUni::_font_family)
    GRX_TEXT(Shadow_color, GrxUni::_shadow_color)
    GRX_TEXT(Shadow_dx, GrxUni::_shadow_dx)
    GRX_TEXT(Shadow_dy, GrxUni::_shadow_dy)
    GRX_TEXT(Gradient_color, GrxUni::_gradient_color)
    GRX_DOUBLE(Shadow_opacity, GrxUni::_shadow_opacity, 1.0)
    GRX_INT(Glyph_sides, GrxUni::_glyph_sides, 0)
    GRX_DOUBLE(Glyph_angle, GrxUni::_glyph_angle, 0.0)
    GRX_DOUBLE(Glyph_aspect, GrxUni::_glyph_aspect, 1.0)
    GRX_ENUM(FontWeight, GrxUni::_font_weight, grx::kFontWeight, 0) // 0: not given
    GRX_INT(LabelLocationHorizontal, GrxUni::_labelLocationHorizontal, 0)
    GRX_INT(LabelLocationVertical, GrxUni::_labelLocationVertical, 0)
    GRX_INT(LabelInside, GrxUni::_labelInside, 0)
    GRX_INT(Pattern, GrxUni::_pattern, 0)

    // Visible unless the attribute says "false" (or the CSS word "hidden").
    bool getVisible() const;
    void setVisible(bool visible) { setBool(GrxUni::_visible, visible); }
    GRX_PRESENCE(Visible, GrxUni::_visible)

    void setFontSize(const XMLCh* preferred, const XMLCh* minimum, const XMLCh* maximum) {
        setCompound(GrxUni::_font_size, preferred, minimum, maximum);
    }
    void getFontSize(ChartString* preferred, ChartString* minimum, ChartString* maximum) const {
        getPreferredMinMax(GetAttribute(GrxUni::_font_size), preferred, minimum, maximum);
    }
    // Present when the preferred or the minimum part is given.
    bool isFontSizePresent() const;
    void removeFontSize() { removeAttribute(GrxUni::_font_size); }

    void setWidth(const XMLCh* preferred, const XMLCh* minimum, const XMLCh* maximum) {
        setCompound(GrxUni::_width, preferred, minimum, maximum);
    }
    void getWidth(ChartString* preferred, ChartString* minimum, ChartString* maximum) const {
        getPreferredMinMax(GetAttribute(GrxUni::_width), preferred, minimum, maximum);
    }
    GRX_PRESENCE(Width, GrxUni::_width)

    void setSize(const XMLCh* size) { SetAttribute(GrxUni::_size, size); }
    void setSize(const ChartString& size) { SetAttribute(GrxUni::_size, size.xc_str()); }
    void getSize(ChartString* preferred, ChartString* minimum, ChartString* maximum) const {
        getPreferredMinMax(GetAttribute(GrxUni::_size), preferred, minimum, maximum);
    }
    GRX_PRESENCE(Size, GrxUni::_size)

    // Splits a compound value; any output may be null. Parts are trimmed of blanks.
    static void getPreferredMinMax(const XMLCh* value, ChartString* preferred, ChartString* minimum,
                                   ChartString* maximum);

private:
    void setCompound(const XMLCh* name, const XMLCh* preferred, const XMLCh* minimum, const XMLCh* maximum);
};

// The ids of frames, styles and other references live in these attributes.
#define GRX_STYLED GRX_REF(Style, GrxUni::_style, GrxStyle)

// ---- frames and locations -------------------------------------------------------------------------

class GRX_API GrxLocation : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_location)
    enum ENUM_part {
        part_left = grx::LocationPart::left,
        part_right = grx::LocationPart::right,
        part_top = grx::LocationPart::top,
        part_bottom = grx::LocationPart::bottom,
        part_width = grx::LocationPart::width,
        part_height = grx::LocationPart::height
    };
    enum ENUM_method {
        method_fixed = grx::LocationMethod::fixed,
        method_content = grx::LocationMethod::content,
        method_sameEdge = grx::LocationMethod::sameEdge,
        method_nextTo = grx::LocationMethod::nextTo
    };
    GRX_ENUM(Part, u"part", grx::kLocationPart, grx::LocationPart::left)
    GRX_ENUM(Method, GrxUni::_method, grx::kLocationMethod, grx::LocationMethod::fixed)
    GRX_TEXT(Value, GrxUni::_value)
    GRX_TEXT(Max, GrxUni::_max)
    GRX_REF(Target, GrxUni::_target, GrxBaseElement)
    GRX_BOOL(SpecifiedByUser, u"specifiedByUser", false)
};

// What every frame has: locations (with a removal of one) and a style reference.
#define GRX_FRAME                                                                                            \
    GRX_LIST(Location, GrxLocation)                                                                          \
    GrxLocation& addLocation(int part) {                                                                     \
        GrxLocation& l = add<GrxLocation>();                                                                 \
        l.setPart(part);                                                                                     \
        return l;                                                                                            \
    }                                                                                                        \
    void removeLocation(GrxLocation& location) {                                                             \
        removeChild(location);                                                                               \
    }                                                                                                        \
    GRX_STYLED                                                                                               \
    GRX_TEXT(Name, GrxUni::_name)

// ---- labels and texts -----------------------------------------------------------------------------

class GRX_API CTTextType : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_text)
    ChartString getText() const { return getTextContent(); }
    void setText(const ChartString& text) { setTextContent(text.xc_str()); }
    GRX_INT(Position, GrxUni::_position, 0)
    GRX_TEXT(FontSize, GrxUni::_font_size)
    GRX_STYLED
};

class GRX_API GrxDescription : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"description")
    GRX_INT(Kind, u"kind", 0)
    GRX_ONE(Format, GrxFormat)
};

class GRX_API GrxDescriptionGroup : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"descriptionGroup")
    GRX_TEXT(Separator, u"separator")
    GRX_REF(Target, GrxUni::_target, GrxBaseElement)
    GRX_LIST(Description, GrxDescription)
    GRX_LIST(Text, CTTextType)
};

class GRX_API CTLabelType : public GrxBaseElement {
    GRX_KIND(GrxBaseElement)
    GRX_STYLED
    GRX_REF(TextFrameStyle, u"textFrameStyle", GrxStyle)
    GRX_LIST(Text, CTTextType)
    GRX_LIST(DescriptionGroup, GrxDescriptionGroup)
    // Every text of the label, joined.
    ChartString getAllText() const;
};

class GRX_API GrxLabel : public CTLabelType {
    GRX_ELEMENT(CTLabelType, GrxUni::_label)
};

#define GRX_LABELED GRX_ONE(Label, GrxLabel)

// ---- formats --------------------------------------------------------------------------------------

class GRX_API GrxRelabel : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_relabel)
    GRX_TEXT(From, GrxUni::_from)
    GRX_TEXT(To, GrxUni::_to)
};

class GRX_API GrxUnitRule : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"unitRule")
    GRX_DOUBLE(Min, GrxUni::_min, 0.0)
    GRX_DOUBLE(Max, GrxUni::_max, 0.0)
    GRX_DOUBLE(Scale, GrxUni::_scale, 1.0)
    GRX_TEXT(Suffix, GrxUni::_suffix)
};

class GRX_API CTFormatType : public GrxBaseElement {
    GRX_KIND(GrxBaseElement)
    enum ENUM_scientific {
        scientific_always = 1,
        scientific_never = 2,
        scientific_exponent = 3,
        scientific_auto = 4
    };
    enum ENUM_baseFormat {
        baseFormat_date = 1,
        baseFormat_time = 2,
        baseFormat_dateTime = 3,
        baseFormat_elapsed = 4
    };
    enum ENUM_dayType { dayType_dayOfMonth = 1, dayType_dayOfYear = 2 };
    enum ENUM_monthFormat {
        monthFormat_short = 1,
        monthFormat_long = 2,
        monthFormat_number = 3,
        monthFormat_padded = 4
    };
    enum ENUM_hourFormat { hourFormat_12 = 1, hourFormat_24 = 2, hourFormat_12NoAMPM = 3 };
    enum ENUM_mdyOrder { mdyOrder_1 = 1, mdyOrder_3 = 3, mdyOrder_6 = 6 };

    GRX_TEXT(ErrorCharacter, u"errorCharacter")
    GRX_TEXT(Prefix, GrxUni::_prefix)
    GRX_TEXT(Suffix, GrxUni::_suffix)
    // Decimal, grouping, date and time separator characters, in that order.
    GRX_TEXT(Separators, u"separators")
    GRX_TEXT(QuarterPrefix, u"quarterPrefix")
    GRX_TEXT(QuarterSuffix, u"quarterSuffix")
    GRX_TEXT(WeekSuffix, u"weekSuffix")
    GRX_TEXT(HiddenSeparator, u"hiddenSeparator")
    GRX_INT(MinimumFractionDigits, GrxUni::_minimumFractionDigits, 0)
    GRX_INT(MaximumFractionDigits, GrxUni::_maximumFractionDigits, 0)
    GRX_INT(MinimumIntegerDigits, GrxUni::_minimumIntegerDigits, 0)
    GRX_INT(MaximumIntegerDigits, GrxUni::_maximumIntegerDigits, 0)
    GRX_BOOL(UseGrouping, GrxUni::_useGrouping, false)
    GRX_BOOL(NegativesOutside, GrxUni::_negativesOutside, false)
    GRX_BOOL(NegativesInParentheses, GrxUni::_negativesInParentheses, false)
    GRX_BOOL(HideNegatives, GrxUni::_hideNegatives, false)
    GRX_BOOL(ShowDay, u"showDay", false)
    GRX_BOOL(ShowDayOfWeek, u"showDayOfWeek", false)
    GRX_BOOL(ShowMonth, u"showMonth", false)
    GRX_BOOL(ShowYear, u"showYear", false)
    GRX_BOOL(ShowQuarter, u"showQuarter", false)
    GRX_BOOL(ShowWeek, u"showWeek", false)
    GRX_BOOL(ShowHour, u"showHour", false)
    GRX_BOOL(ShowMinute, u"showMinute", false)
    GRX_BOOL(ShowSecond, u"showSecond", false)
    GRX_BOOL(ShowMilliseconds, u"showMilliseconds", false)
    GRX_BOOL(ShowEra, u"showEra", false)
    GRX_BOOL(DayPadding, u"dayPadding", false)
    GRX_BOOL(DayOfMonthPadding, u"dayOfMonthPadding", false)
    GRX_BOOL(HourPadding, u"hourPadding", false)
    GRX_BOOL(MinutePadding, u"minutePadding", false)
    GRX_BOOL(SecondPadding, u"secondPadding", false)
    GRX_BOOL(WeekPadding, u"weekPadding", false)
    GRX_BOOL(YearAbbreviation, u"yearAbbreviation", false)
    GRX_BOOL(DayOfWeekAbbreviation, u"dayOfWeekAbbreviation", false)
    GRX_INT(Scientific, GrxUni::_scientific, 0)
    GRX_INT(BaseFormat, u"baseFormat", 0)
    GRX_INT(DayType, u"dayType", 0)
    GRX_INT(MonthFormat, u"monthFormat", 0)
    GRX_INT(HourFormat, u"hourFormat", 0)
    GRX_INT(MdyOrder, u"mdyOrder", 0)
    GRX_DOUBLE(SmallNumberThreshold, u"smallNumberThreshold", 0.0)
    GRX_DOUBLE(ScalingFactor, GrxUni::_scalingFactor, 1.0)
};

class GRX_API GrxFormat : public CTFormatType {
    GRX_ELEMENT(CTFormatType, u"format")
    GRX_LIST(Relabel, GrxRelabel)
    GRX_LIST(UnitRule, GrxUnitRule)
};

// ---- variables ------------------------------------------------------------------------------------

class GRX_API GrxAggregation : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"aggregation")
    GRX_TEXT(Category, GrxUni::_category)
    GRX_REF(Variable, GrxUni::_variable, CTVariableType)
    GRX_DOUBLE(MinFraction, GrxUni::_minFraction, 0.0)
};

class GRX_API CTVariableType : public GrxBaseElement {
    GRX_KIND(GrxBaseElement)
    // An integer, not a flag: 1 is categorical, 0 (also when absent) is not.
    GRX_INT(Categorical, GrxUni::_categorical, 0)
    GRX_REF(CategoricalDomain, GrxUni::_categoricalDomain, GrxCategoricalDomain)
    GRX_REF(Source, u"source", GrxBaseElement)
    GRX_TEXT(Name, GrxUni::_name)
    GRX_LIST(Format, GrxFormat)
    GRX_LIST(Aggregation, GrxAggregation)
    GrxAggregation& addAggregation(const ChartString& categoryName, CTVariableType& valueVariable,
                                   double minFraction);
};

class GRX_API GrxExtensionSV : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"variableExtension")
    GRX_INT(Statistic, GrxUni::_statistic, 0)
};

class GRX_API GrxSourceVariable : public CTVariableType {
    GRX_ELEMENT(CTVariableType, u"sourceVariable")
    GRX_ONE(Extension, GrxExtensionSV)
    GRX_TEXT(SourceName, u"sourceName")
    GRX_TEXT(Description, u"description")
};

class GRX_API GrxExpressionVariable : public CTVariableType {
    GRX_ELEMENT(CTVariableType, u"expressionVariable")
    GRX_TEXT(Value, GrxUni::_value)
};

class GRX_API GrxDerivedVariable : public CTVariableType {
    GRX_ELEMENT(CTVariableType, GrxUni::_derivedVariable)
    GRX_TEXT(Value, GrxUni::_value)
    GRX_TEXT(Creator, u"creator")
};

// ---- domains --------------------------------------------------------------------------------------

class GRX_API GrxDomain : public GrxBaseElement {
    GRX_KIND(GrxBaseElement)
};

class GRX_API GrxRange : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_range)
    GRX_TEXT(Min, GrxUni::_min)
    GRX_TEXT(Max, GrxUni::_max)
    GRX_BOOL(Exact, GrxUni::_exact, false)
};

class GRX_API GrxIntervalDomain : public GrxDomain {
    GRX_ELEMENT(GrxDomain, u"intervalDomain")
    GRX_BOOL(Date, u"date", false)
    GRX_LIST(Range, GrxRange)
};

class GRX_API GrxVariableReference : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"variableReference")
    GRX_REF(Variable, GrxUni::_variable, CTVariableType)
};

class GRX_API GrxCategoryOrder : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"categoryOrder")
};

class GRX_API GrxSortMove : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"sortMove")
    GRX_TEXT(Category, GrxUni::_category)
    GRX_BOOL(First, u"first", true)
};

class GRX_API GrxSimpleSort : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_simpleSort)
    GRX_INT(Method, GrxUni::_method, 0)
    GRX_BOOL(Descending, GrxUni::_descending, false)
    GRX_ONE(CategoryOrder, GrxCategoryOrder)
    GRX_LIST(SortMove, GrxSortMove)
};

class GRX_API GrxStatisticSort : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_statisticSort)
    GRX_INT(Method, GrxUni::_method, 0)
    GRX_BOOL(Descending, GrxUni::_descending, false)
    GRX_REF(Variable, GrxUni::_variable, CTVariableType)
    GRX_LIST(SortMove, GrxSortMove)
};

// Its text is the values joined by ";".
class GRX_API GrxCategories : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"categories")
    GRX_BOOL(Remove, u"remove", false)
    GRX_BOOL(Explode, u"explode", false)
};

class GRX_API GrxCategoricalDomain : public GrxDomain {
    GRX_ELEMENT(GrxDomain, GrxUni::_categoricalDomain)
    GRX_LIST(VariableReference, GrxVariableReference)
    GrxVariableReference& addVariableReference(CTVariableType& variable);
    GRX_LIST(SimpleSort, GrxSimpleSort)
    GrxSimpleSort& addSimpleSort(bool descending, int method);
    GRX_LIST(StatisticSort, GrxStatisticSort)
    GrxStatisticSort& addStatisticSort(bool descending, CTVariableType& statisticVariable);
    GRX_LIST(Categories, GrxCategories)
};

// ---- style cycles ---------------------------------------------------------------------------------

class GRX_API GrxCycle : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_cycle)
    GRX_LIST(Style, GrxStyle)
};

class GRX_API GrxStyleCycleExtension : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"styleCycleExtension")
};

class GRX_API GrxStyleCycle : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_styleCycle)
    GRX_LIST(Cycle, GrxCycle)
    GRX_LIST(Extension, GrxStyleCycleExtension)
};

// ---- statistics -----------------------------------------------------------------------------------

class GRX_API CTStatisticType : public GrxBaseElement {
    GRX_KIND(GrxBaseElement)
    // A number; kinds with words for their methods say so through methodWords().
    int getMethod() const {
        const MethodWords w = methodWords();
        return getEnum(GrxUni::_method, w.words, w.count, 0);
    }
    void setMethod(int method) {
        const MethodWords w = methodWords();
        setEnum(GrxUni::_method, w.words, w.count, method);
    }
    GRX_PRESENCE(Method, GrxUni::_method)

protected:
    struct MethodWords {
        const grx::EnumWord* words;
        std::size_t count;
    };
    virtual MethodWords methodWords() const { return {nullptr, 0}; }
};

class GRX_API GrxSummaryStatistic : public CTStatisticType {
    GRX_ELEMENT(CTStatisticType, u"summaryStatistic")
    GRX_INT(Augment, u"augment", 0)
    GRX_INT(SummaryBase, u"summaryBase", 0)
    GRX_TEXT(SummaryIndex, u"summaryIndex")
    GRX_BOOL(ConvertIntervals, u"convertIntervals", true)
    GRX_REF(Variable, GrxUni::_variable, CTVariableType)
};

class GRX_API GrxBinStatistic : public CTStatisticType {
    GRX_ELEMENT(CTStatisticType, u"binStatistic")
    static constexpr XMLCh _binStart[] = u"binStart";
    static constexpr XMLCh _binWidth[] = u"binWidth";
    static constexpr XMLCh _binCount[] = u"binCount";
    GRX_TEXT(BinStart, _binStart)
    GRX_TEXT(BinWidth, _binWidth)
    GRX_TEXT(BinCount, _binCount)
    GRX_ENUM(GridType, GrxUni::_gridType, grx::kGridType, grx::GridType::hex)
    GRX_ENUM(Location, GrxUni::_location, grx::kBinLocation, grx::BinLocation::grid)

protected:
    MethodWords methodWords() const override { return {grx::kBinMethod, std::size(grx::kBinMethod)}; }
};

class GRX_API GrxSmoothStatistic : public CTStatisticType {
    GRX_ELEMENT(CTStatisticType, u"smoothStatistic")
    GRX_INT(Degree, GrxUni::_degree, 0)
    GRX_BOOL(Bounded, u"bounded", true)
    GRX_DOUBLE(Proportion, GrxUni::_proportion, 0.0)
    GRX_ENUM(Kernel, GrxUni::_kernel, grx::kKernel, grx::Kernel::uniform)
    GRX_TEXT(Bandwidth, u"bandwidth")
    GRX_BOOL(Intercept, u"intercept", true)
    GRX_BOOL(Spikes, GrxUni::_spikes, false)
};

class GRX_API GrxRegionStatistic : public CTStatisticType {
    GRX_ELEMENT(CTStatisticType, u"regionStatistic")
    GRX_INT(Degree, GrxUni::_degree, 0)
    GRX_INT(Type, GrxUni::_type, 0)
    GRX_BOOL(PredictIndividuals, GrxUni::_predictIndividuals, false)
    GRX_DOUBLE(Alpha, GrxUni::_alpha, 0.05)
};

class GRX_API GrxDistributionStatistic : public CTStatisticType {
    GRX_ELEMENT(CTStatisticType, u"distributionStatistic")
    GRX_ENUM(Distribution, GrxUni::_distribution, grx::kDistribution, 0) // 0: not given
    GRX_TEXT(Parameter, GrxUni::_parameter)
    GRX_TEXT(SecondaryParameter, u"secondaryParameter")
};

class GRX_API GrxLinkStatistic : public CTStatisticType {
    GRX_ELEMENT(CTStatisticType, u"linkStatistic")
    GRX_INT(Type, GrxUni::_type, 0)
    GRX_ENUM(XReference, GrxUni::_x, grx::kLinkReference, grx::LinkReference::none)
    GRX_ENUM(YReference, GrxUni::_y, grx::kLinkReference, grx::LinkReference::none)
    GRX_ENUM(ZReference, GrxUni::_z, grx::kLinkReference, grx::LinkReference::none)
};

// Statistics the library only tests for.
#define GRX_PLAIN_STATISTIC(Class, Name)                                                                     \
    class GRX_API Class : public CTStatisticType {                                                           \
        GRX_ELEMENT(CTStatisticType, Name)                                                                   \
    };
GRX_PLAIN_STATISTIC(GrxCollectRowsStatistic, u"collectRowsStatistic")
GRX_PLAIN_STATISTIC(GrxAggregateStatistic, u"aggregateStatistic")
GRX_PLAIN_STATISTIC(GrxClusteringStatistic, u"clusteringStatistic")
GRX_PLAIN_STATISTIC(GrxGraphLayoutStatistic, u"graphLayoutStatistic")
GRX_PLAIN_STATISTIC(GrxMapStatistic, u"mapStatistic")
GRX_PLAIN_STATISTIC(GrxTagCloudStatistic, u"tagCloudStatistic")
GRX_PLAIN_STATISTIC(GrxTreeLayoutStatistic, u"treeLayoutStatistic")
GRX_PLAIN_STATISTIC(GrxFixedWindowDensityStatistic, u"fixedWindowDensityStatistic")
GRX_PLAIN_STATISTIC(GrxNearestNeighborDensityStatistic, u"nearestNeighborDensityStatistic")
GRX_PLAIN_STATISTIC(GrxTukeyStatistic, u"tukeyStatistic")
GRX_PLAIN_STATISTIC(GrxSelfOrganizingMapStatistic, u"selfOrganizingMapStatistic")
GRX_PLAIN_STATISTIC(GrxPatternLinkStatistic, u"patternLinkStatistic")
#undef GRX_PLAIN_STATISTIC

// ---- aesthetics and mappings ----------------------------------------------------------------------

class GRX_API CTAestheticMapping : public GrxBaseElement {
    GRX_KIND(GrxBaseElement)
    GRX_TEXT(From, GrxUni::_from)
    GRX_TEXT(To, GrxUni::_to)
};

#define GRX_MAPPING(Class, Name)                                                                             \
    class GRX_API Class : public CTAestheticMapping {                                                        \
        GRX_ELEMENT(CTAestheticMapping, Name)                                                                \
    };
GRX_MAPPING(GrxColorMapping, u"colorMapping")
GRX_MAPPING(GrxDoubleMapping, u"doubleMapping")
GRX_MAPPING(GrxDashMapping, u"dashMapping")
GRX_MAPPING(GrxIntegerMapping, u"integerMapping")
GRX_MAPPING(GrxSymbolMapping, u"symbolMapping")
GRX_MAPPING(GrxLengthMapping, u"lengthMapping")
#undef GRX_MAPPING

class GRX_API GrxScale : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_scale)
    static constexpr XMLCh _UTF_method_logit[] = u"logit";
    static constexpr XMLCh _UTF_method_probit[] = u"probit";
    static constexpr XMLCh _UTF_method_asn[] = u"asn";
    static constexpr XMLCh _UTF_method_atanh[] = u"atanh";
    static constexpr XMLCh _UTF_method_prob[] = u"prob";
    static constexpr XMLCh _UTF_method_cLoglog[] = u"cLoglog";
    GRX_ENUM(Method, GrxUni::_method, grx::kScaleMethod, grx::ScaleMethod::linear)
    GRX_TEXT(Origin, GrxUni::_origin)
    GRX_BOOL(Invert, GrxUni::_invert, false)
    GRX_DOUBLE(Base, GrxUni::_UTF_base, 10.0)
    GRX_DOUBLE(Power, GrxUni::_power, 1.0)
};

class GRX_API CTAesthetic : public GrxBaseElement {
    GRX_KIND(GrxBaseElement)
    GRX_REF(Variable, GrxUni::_variable, CTVariableType)
    GRX_REF(Domain, GrxUni::_domain, GrxDomain)
    GRX_REF(Dimension, GrxUni::_dimension, GrxDimension)
    GRX_REF(Cycle, GrxUni::_cycle, GrxStyleCycle)
    GRX_BOOL(Clamp, u"clamp", false)
    GRX_BOOL(Split, u"split", false)
    GRX_TEXT(Missing, u"missing")
    GRX_TEXT(Name, GrxUni::_name)
    GRX_ONE(Scale, GrxScale)
    GrxScale& addScale(int method) {
        GrxScale& s = add<GrxScale>();
        s.setMethod(method);
        return s;
    }
    GRX_ONE(SummaryStatistic, GrxSummaryStatistic)
    GRX_LIST(ColorMapping, GrxColorMapping)
    GRX_LIST(DoubleMapping, GrxDoubleMapping)
    GRX_LIST(DashMapping, GrxDashMapping)
    GRX_LIST(IntegerMapping, GrxIntegerMapping)
    GRX_LIST(SymbolMapping, GrxSymbolMapping)
    GRX_LIST(LengthMapping, GrxLengthMapping)
};

#define GRX_LOW_HIGH                                                                                         \
    GRX_TEXT(Low, GrxUni::_low)                                                                              \
    GRX_TEXT(High, GrxUni::_high)

class GRX_API GrxStyleBy : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, GrxUni::_styleBy)
};
class GRX_API GrxDash : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, GrxUni::_dash)
};
class GRX_API GrxShape : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, GrxUni::_shape)
};
class GRX_API GrxSize : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, GrxUni::_size)
    GRX_LOW_HIGH
};
class GRX_API GrxRotation : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, u"rotation")
};
class GRX_API GrxColor : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, GrxUni::_color)
    GRX_ENUM(Affect, u"affect", grx::kAffect, grx::Affect::none)
};
class GRX_API GrxOffset : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, u"offset")
    GRX_LOW_HIGH
};
class GRX_API GrxPattern : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, GrxUni::_pattern)
};
class GRX_API GrxTransparency : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, u"transparency")
};
class GRX_API GrxSplit : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, u"split")
};
class GRX_API GrxColorComponent : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, GrxUni::_colorComponent)
    GRX_LOW_HIGH
    GRX_INT(Type, GrxUni::_type, 0)
    GRX_ENUM(Affect, u"affect", grx::kAffect, grx::Affect::none)
};
class GRX_API GrxVisibility : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, u"visibility")
};
class GRX_API GrxImage : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, u"image")
};

class GRX_API GrxLabeling : public CTAesthetic {
    GRX_ELEMENT(CTAesthetic, GrxUni::_labeling)
    GRX_STYLED
    GRX_REF(TextFrameStyle, u"textFrameStyle", GrxStyle)
    GRX_BOOL(ConnectingLines, GrxUni::_connectingLines, false)
    GRX_LIST(StyleBy, GrxStyleBy)
    GRX_LIST(ColorComponent, GrxColorComponent)
    GRX_LIST(Color, GrxColor)
    GRX_LIST(Size, GrxSize)
    GRX_LIST(SummaryStatistic, GrxSummaryStatistic)
    GRX_LIST(Format, GrxFormat)
};

// ---- elements -------------------------------------------------------------------------------------

// The x, y or z of an element: one class under the three role names.
class GRX_API CTCoordinate : public GrxBaseElement {
    GRX_KIND(GrxBaseElement)
    GRX_REF(Variable, GrxUni::_variable, CTVariableType)
};

class GRX_API GrxConditionalStyle : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"conditionalStyle")
    GRX_TEXT(When, GrxUni::_when)
    GRX_STYLED
};

// Lists of conditional styles, with the two-argument add every holder offers.
#define GRX_CONDITIONAL_STYLES                                                                               \
    GRX_LIST(ConditionalStyle, GrxConditionalStyle)                                                          \
    GrxConditionalStyle& addConditionalStyle(const ChartString& when, GrxStyle& style) {                     \
        GrxConditionalStyle& c = add<GrxConditionalStyle>();                                                 \
        c.setWhen(when);                                                                                     \
        c.setStyle(style);                                                                                   \
        return c;                                                                                            \
    }

class GRX_API CTElementType : public GrxBaseElement {
    GRX_KIND(GrxBaseElement)
    GRX_STYLED
    GRX_REF(Coordinates, GrxUni::_coordinates, GrxCoordinates)
    GRX_BOOL(Dot, GrxUni::_dot, false)
    GRX_INT(PositionModifier, GrxUni::_positionModifier, 0)
    GRX_DOUBLE(ZLocation, GrxUni::_zLocation, 0.0)
    GRX_BOOL(ShowCollidingLabels, GrxUni::_showCollidingLabels, false)
    GRX_TEXT(Name, GrxUni::_name)
    GRX_BOOL(ShowDiscontinuity, u"showDiscontinuity", false)
    GRX_ENUM(BreakRepresentation, u"breakRepresentation", grx::kBreakRepresentation, grx::BreakRepresentation::none)

    CTCoordinate* getX() const { return first<CTCoordinate>(GrxUni::_x); }
    CTCoordinate* getY() const { return first<CTCoordinate>(GrxUni::_y); }
    CTCoordinate* getZ() const { return first<CTCoordinate>(GrxUni::_z); }
    CTCoordinate& addX() { return add<CTCoordinate>(GrxUni::_x); }
    CTCoordinate& addY() { return add<CTCoordinate>(GrxUni::_y); }
    CTCoordinate& addZ() { return add<CTCoordinate>(GrxUni::_z); }

    GRX_LIST(StyleBy, GrxStyleBy)
    GRX_LIST(Dash, GrxDash)
    GRX_LIST(Shape, GrxShape)
    GRX_LIST(Size, GrxSize)
    GRX_LIST(Rotation, GrxRotation)
    GRX_LIST(Color, GrxColor)
    void removeColor(GrxColor& color) { removeChild(color); }
    GRX_LIST(Offset, GrxOffset)
    GRX_LIST(Pattern, GrxPattern)
    GRX_LIST(Transparency, GrxTransparency)
    GRX_LIST(Split, GrxSplit)
    GRX_LIST(ColorComponent, GrxColorComponent)
    GRX_LIST(Visibility, GrxVisibility)
    GRX_LIST(Image, GrxImage)
    GRX_LIST(Labeling, GrxLabeling)
    void removeLabeling(GrxLabeling& labeling) { removeChild(labeling); }
    GRX_CONDITIONAL_STYLES

    GRX_LIST(SummaryStatistic, GrxSummaryStatistic)
    GRX_LIST(BinStatistic, GrxBinStatistic)
    GRX_LIST(SmoothStatistic, GrxSmoothStatistic)
    GRX_LIST(RegionStatistic, GrxRegionStatistic)
    GRX_LIST(DistributionStatistic, GrxDistributionStatistic)
    GRX_LIST(LinkStatistic, GrxLinkStatistic)
    GRX_LIST(CollectRowsStatistic, GrxCollectRowsStatistic)
    GRX_LIST(AggregateStatistic, GrxAggregateStatistic)
    GRX_LIST(ClusteringStatistic, GrxClusteringStatistic)
    GRX_LIST(GraphLayoutStatistic, GrxGraphLayoutStatistic)
    GRX_LIST(MapStatistic, GrxMapStatistic)
    GRX_LIST(TagCloudStatistic, GrxTagCloudStatistic)
    GRX_LIST(TreeLayoutStatistic, GrxTreeLayoutStatistic)
    GRX_LIST(FixedWindowDensityStatistic, GrxFixedWindowDensityStatistic)
    GRX_LIST(NearestNeighborDensityStatistic, GrxNearestNeighborDensityStatistic)
    GRX_LIST(TukeyStatistic, GrxTukeyStatistic)
    GRX_LIST(SelfOrganizingMapStatistic, GrxSelfOrganizingMapStatistic)
    GRX_LIST(PatternLinkStatistic, GrxPatternLinkStatistic)
    // Every statistic child, whatever its kind, in document order.
    std::vector<CTStatisticType*> getStatistics() const;
};

class GRX_API GrxPoint : public CTElementType {
    GRX_ELEMENT(CTElementType, GrxUni::_point)
};
class GRX_API GrxLine : public CTElementType {
    GRX_ELEMENT(CTElementType, GrxUni::_line)
};
class GRX_API GrxArea : public CTElementType {
    GRX_ELEMENT(CTElementType, GrxUni::_area)
};
class GRX_API GrxInterval : public CTElementType {
    GRX_ELEMENT(CTElementType, GrxUni::_interval)
};
class GRX_API GrxPath : public CTElementType {
    GRX_ELEMENT(CTElementType, GrxUni::_path)
};
class GRX_API GrxEdge : public CTElementType {
    GRX_ELEMENT(CTElementType, u"edge")
};
class GRX_API GrxPolygon : public CTElementType {
    GRX_ELEMENT(CTElementType, u"polygon")
};
class GRX_API GrxSchema : public CTElementType {
    GRX_ELEMENT(CTElementType, GrxUni::_schema)
    GRX_REF(MedianStyle, u"medianStyle", GrxStyle)
    GRX_REF(FenceStyle, u"fenceStyle", GrxStyle)
    GRX_REF(HingeStyle, u"hingeStyle", GrxStyle)
    GRX_REF(OutlierStyle, u"outlierStyle", GrxStyle)
    GRX_REF(ExtremeStyle, u"extremeStyle", GrxStyle)
};

// ---- guides ---------------------------------------------------------------------------------------

class GRX_API CTGuideType : public GrxBaseElement {
    GRX_KIND(GrxBaseElement)
    GRX_STYLED
    GRX_REF(Coordinates, GrxUni::_coordinates, GrxCoordinates)
    GRX_TEXT(Name, GrxUni::_name)
    GRX_INT(ZOrder, GrxUni::_zOrder, 0)
    GRX_LIST(Label, GrxLabel)
    GRX_CONDITIONAL_STYLES
};

#define GRX_XYZ                                                                                              \
    GRX_TEXT(X, GrxUni::_x)                                                                                  \
    GRX_TEXT(Y, GrxUni::_y)                                                                                  \
    GRX_TEXT(Z, GrxUni::_z)

class GRX_API GrxPointGuide : public CTGuideType {
    GRX_ELEMENT(CTGuideType, u"pointGuide")
    GRX_XYZ
};
class GRX_API GrxLineGuide : public CTGuideType {
    GRX_ELEMENT(CTGuideType, GrxUni::_lineGuide)
    GRX_XYZ
};
class GRX_API GrxFunctionGuide : public CTGuideType {
    GRX_ELEMENT(CTGuideType, u"functionGuide")
    GRX_INT(Segments, u"segments", 0)
    GRX_TEXT(Value, GrxUni::_value)
};
class GRX_API GrxRectangleGuide : public CTGuideType {
    GRX_ELEMENT(CTGuideType, u"rectangleGuide")
    GRX_TEXT(X1, GrxUni::_x1)
    GRX_TEXT(X2, GrxUni::_x2)
    GRX_TEXT(Y1, GrxUni::_y1)
    GRX_TEXT(Y2, GrxUni::_y2)
};
class GRX_API GrxPlaneGuide : public CTGuideType {
    GRX_ELEMENT(CTGuideType, u"planeGuide")
    GRX_INT(Normal, u"normal", 0)
};
class GRX_API GrxFrameGuide : public CTGuideType {
    GRX_ELEMENT(CTGuideType, u"frameGuide")
    GRX_BOOL(Complete, GrxUni::_complete, false)
};
#undef GRX_XYZ

// ---- axes and ticks -------------------------------------------------------------------------------

class GRX_API GrxGridline : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"gridline")
    GRX_STYLED
    GRX_CONDITIONAL_STYLES
};

class GRX_API GrxMajorTicks : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_majorTicks)
    GRX_ENUM(Position, GrxUni::_position, grx::kTickPosition, grx::TickPosition::inside)
    GRX_TEXT(Length, GrxUni::_length)
    GRX_TEXT(Stagger, GrxUni::_stagger)
    GRX_DOUBLE(Delta, GrxUni::_delta, 0.0)
    GRX_ENUM(DeltaUnit, u"deltaUnit", grx::kDeltaUnit, grx::DeltaUnit::second)
    GRX_TEXT(Base, GrxUni::_UTF_base)
    GRX_DOUBLE(LabelAngle, GrxUni::_labelAngle, 0.0)
    GRX_INT(LabelFrequency, GrxUni::_labelFrequency, 1)
    GRX_STYLED
    GRX_REF(MarkStyle, GrxUni::_markStyle, GrxStyle)
    GRX_REF(TickFrameStyle, u"tickFrameStyle", GrxStyle)
    GRX_ONE(Gridline, GrxGridline)
    GRX_LIST(Format, GrxFormat)
    GrxFormat* getFormat() const { return first<GrxFormat>(); }
};

class GRX_API GrxMinorTicks : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_minorTicks)
    GRX_INT(Number, GrxUni::_number, 2)
    GRX_ENUM(Position, GrxUni::_position, grx::kTickPosition, grx::TickPosition::inside)
    GRX_TEXT(Length, GrxUni::_length)
    GRX_REF(MarkStyle, GrxUni::_markStyle, GrxStyle)
    GRX_ONE(Gridline, GrxGridline)
};

class GRX_API GrxAxisTransformParameter : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"axisTransformParameter")
    GRX_TEXT(ParameterName, GrxUni::_name)
    GRX_TEXT(ParameterValue, GrxUni::_value)
};

class GRX_API GrxAxis : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_axis)
    GRX_STYLED
    GRX_TEXT(Name, GrxUni::_name)
    GRX_LABELED
    // A plain axis (no transform attribute) is not derived.
    GRX_ENUM(Transform, GrxUni::_transform, grx::kAxisTransform, grx::AxisTransform::none)
    GRX_BOOL(Opposite, GrxUni::_opposite, false)
    GRX_LIST(MajorTicks, GrxMajorTicks)
    GRX_LIST(MinorTicks, GrxMinorTicks)
    GRX_LIST(AxisTransformParameter, GrxAxisTransformParameter)
};

// ---- coordinates and dimensions -------------------------------------------------------------------

class GRX_API GrxDimension : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_dimension)
    GRX_LIST(Axis, GrxAxis)
    void removeAxis(GrxAxis& axis) { removeChild(axis); }
    // The axis at `index` in document order; past the end nothing happens.
    void removeAxis(unsigned index);
    GRX_ONE(Scale, GrxScale)
    GrxScale& addScale(int method) {
        GrxScale& s = add<GrxScale>();
        s.setMethod(method);
        return s;
    }
    GRX_REF(Domain, GrxUni::_domain, GrxDomain)
    GRX_REF(ClusterVariable, u"clusterVariable", CTVariableType)
    GRX_TEXT(ClusterGap, u"clusterGap")
    GRX_TEXT(UpperMargin, GrxUni::_upperMargin)
    GRX_TEXT(LowerMargin, GrxUni::_lowerMargin)
    GRX_BOOL(UnionDomain, u"unionDomain", false)
    GRX_BOOL(NiceLowerMapping, u"niceLowerMapping", false)
    GRX_BOOL(NiceUpperMapping, u"niceUpperMapping", false)
};

// Takes a dimension's place among the coordinates' children without being one.
class GRX_API GrxDimensionReference : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"dimensionReference")
    GRX_REF(Dimension, GrxUni::_dimension, GrxDimension)
};

class GRX_API GrxPolarTransform : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"polarTransform")
    GRX_DOUBLE(StartAngle, GrxUni::_startAngle, 0.0)
    GRX_DOUBLE(Cycles, GrxUni::_cycles, 1.0)
    GRX_BOOL(CounterClockwise, GrxUni::_counterClockwise, false)
};
class GRX_API GrxTransposeTransform : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"transposeTransform")
};
class GRX_API GrxReflectionTransform : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"reflectionTransform")
    GRX_INT(Dimension, GrxUni::_dimension, 0)
    GRX_BOOL(Alternating, u"alternating", false)
};
class GRX_API GrxInsetTransform : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"insetTransform")
    GRX_DOUBLE(XMin, u"xMin", 0.0)
    GRX_DOUBLE(XMax, u"xMax", 0.0)
    GRX_DOUBLE(YMin, u"yMin", 0.0)
    GRX_DOUBLE(YMax, u"yMax", 0.0)
};

#define GRX_PROJECTION                                                                                       \
    GRX_DOUBLE(Distance, GrxUni::_distance, 0.0)                                                             \
    GRX_DOUBLE(Theta, GrxUni::_theta, 0.0)                                                                   \
    GRX_DOUBLE(Xscale, GrxUni::_xscale, 1.0)                                                                 \
    GRX_DOUBLE(Yscale, GrxUni::_yscale, 1.0)                                                                 \
    GRX_DOUBLE(Dx, GrxUni::_dx, 0.0)                                                                         \
    GRX_DOUBLE(Dy, GrxUni::_dy, 0.0)

class GRX_API GrxRectangularTransform : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"rectangularTransform")
    GRX_PROJECTION
    GRX_DOUBLE(Zeta, GrxUni::_zeta, 0.0)
    GRX_DOUBLE(Phi, GrxUni::_phi, 0.0)
    GRX_DOUBLE(Zscale, GrxUni::_zscale, 1.0)
    GRX_DOUBLE(ProjectionDistance, GrxUni::_projectionDistance, 0.0)
};
class GRX_API GrxObliqueTransform : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"obliqueTransform")
    GRX_PROJECTION
    GRX_DOUBLE(ForeShortening, GrxUni::_foreShortening, 0.0)
};
#undef GRX_PROJECTION
class GRX_API GrxParallelCoordinatesTransform : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"parallelCoordinatesTransform")
};

class GRX_API GrxCoordinates : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_coordinates)
    GRX_LIST(Dimension, GrxDimension)
    void removeDimension(GrxDimension& dimension) { removeChild(dimension); }
    GRX_LIST(DimensionReference, GrxDimensionReference)
    GRX_LIST(PolarTransform, GrxPolarTransform)
    GRX_LIST(TransposeTransform, GrxTransposeTransform)
    GRX_LIST(ReflectionTransform, GrxReflectionTransform)
    GRX_LIST(InsetTransform, GrxInsetTransform)
    GRX_LIST(RectangularTransform, GrxRectangularTransform)
    GRX_LIST(ObliqueTransform, GrxObliqueTransform)
    GRX_LIST(ParallelCoordinatesTransform, GrxParallelCoordinatesTransform)
};

// ---- facets ---------------------------------------------------------------------------------------

class GRX_API GrxFacetLevel : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_facetLevel)
    GRX_INT(Level, GrxUni::_level, 0)
    GRX_TEXT(Gap, GrxUni::_gap)
    GRX_REF(Variable, GrxUni::_variable, CTVariableType)
    GRX_LIST(Axis, GrxAxis)
};
class GRX_API GrxTableLayout : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"tableLayout")
};
class GRX_API GrxFacetLayout : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"facetLayout")
    GRX_INT(Method, GrxUni::_method, 0)
    GRX_DOUBLE(CellAspect, u"cellAspect", 1.0)
    GRX_LIST(FacetLevel, GrxFacetLevel)
    GRX_LIST(TableLayout, GrxTableLayout)
};
class GRX_API GrxFaceting : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"faceting")
    GRX_REF(Variable, GrxUni::_variable, CTVariableType)
};

// ---- the graph ------------------------------------------------------------------------------------

class GRX_API GrrUviza : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_graph)
    GRX_FRAME
    GRX_REF(CellStyle, u"cellStyle", GrxStyle)
    GRX_LIST(Coordinates, GrxCoordinates)
    GRX_ONE(FacetLayout, GrxFacetLayout)
    GRX_ONE(Faceting, GrxFaceting)
    GRX_LIST(Point, GrxPoint)
    GRX_LIST(Line, GrxLine)
    GRX_LIST(Area, GrxArea)
    GRX_LIST(Interval, GrxInterval)
    GRX_LIST(Path, GrxPath)
    GRX_LIST(Edge, GrxEdge)
    GRX_LIST(Polygon, GrxPolygon)
    GRX_LIST(Schema, GrxSchema)
    void removeElement(CTElementType& element) { removeChild(element); }
    GRX_LIST(PointGuide, GrxPointGuide)
    GRX_LIST(LineGuide, GrxLineGuide)
    GRX_LIST(FunctionGuide, GrxFunctionGuide)
    GRX_LIST(RectangleGuide, GrxRectangleGuide)
    GRX_LIST(PlaneGuide, GrxPlaneGuide)
    GRX_LIST(FrameGuide, GrxFrameGuide)
};

// ---- frames ---------------------------------------------------------------------------------------

class GRX_API GrxLabelFrame : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_labelFrame)
    GRX_FRAME
    GRX_LABELED
};

class GRX_API GrxLegendTarget : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_legendTarget)
    GRX_REF(Target, GrxUni::_target, GrxBaseElement)
    GRX_REF(Variable, GrxUni::_variable, CTVariableType)
};

class GRX_API GrxLegend : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_legend)
    GRX_FRAME
    GRX_LABELED
    GRX_REF(TickTextStyle, u"tickTextStyle", GrxStyle)
    GRX_REF(TickFrameStyle, u"tickFrameStyle", GrxStyle)
    GRX_LIST(LegendTarget, GrxLegendTarget)
    // A target showing `shown` (an aesthetic or an element); the caller gives it its id.
    GrxLegendTarget& addLegendTarget(GrxBaseElement& shown) {
        GrxLegendTarget& t = add<GrxLegendTarget>();
        t.setTarget(shown);
        return t;
    }
};

class GRX_API GrxControlFrame : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"controlFrame")
    GRX_FRAME
    GRX_LABELED
};

class GRX_API GrxKey : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"key")
    GRX_FRAME
    GRX_LABELED
};

#define GRX_FRAME_HOLDER                                                                                     \
    GRX_LIST(Graph, GrrUviza)                                                                                \
    GRX_LIST(Container, GrxContainer)                                                                        \
    GRX_LIST(LabelFrame, GrxLabelFrame)                                                                      \
    GRX_LIST(Legend, GrxLegend)                                                                              \
    GRX_LIST(ControlFrame, GrxControlFrame)                                                                  \
    GRX_LIST(Key, GrxKey)

class GRX_API GrxContainer : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_container)
    GRX_FRAME
    GRX_FRAME_HOLDER
};

// ---- the visualization's extension and popups -----------------------------------------------------

// Chart-wide settings and the special frames, registered by id in attributes named by the slot:
// "title1", "title2", "subtitle", "footnote1".., "legend0".."legend12", "statisticsSummary1"..,
// "key1".., "text1"... Any other attribute may be set (drill-down settings and the like).
class GRX_API GrxExtensionVis : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, GrxUni::_extension)
    GrxLabelFrame* getTitle(int count) const;
    GrxLabelFrame* getTitle1() const { return getTitle(1); }
    GrxLabelFrame* getTitle2() const { return getTitle(2); }
    void setTitle(GrxLabelFrame& frame, int count);
    GrxLabelFrame* getSubtitle() const;
    void setSubtitle(GrxLabelFrame& frame);
    GrxLabelFrame* getFootnote(int count) const;
    void setFootnote(GrxLabelFrame& frame, int count);
    GrxLegend* getLegend(int slot) const;
    GrxLegend* getLegend1() const { return getLegend(1); }
    GrxLegend* getLegend2() const { return getLegend(2); }
    void setLegend(GrxLegend& legend, int slot);
    GrxLabelFrame* getStatisticsSummary(int count) const;
    void setStatisticsSummary(GrxLabelFrame& frame, int count);
    GrxKey* getKey(int count) const;
    void setKey(GrxKey& key, int count);
    GrxLabelFrame* getText(int count) const;
    void setText(GrxLabelFrame& frame, int count);
    GRX_BOOL(PreserveLocations, u"preserveLocations", false)
    GRX_REF(StyleCycleRepository, u"styleCycleRepository", GrxStyleCycle)
    GRX_TEXT(HistogramStatistic, GrxUni::_histogramStatistic)
    void setAttribute(const XMLCh* name, const XMLCh* value) { SetAttribute(name, value); }
    void setAttribute(const XMLCh* name, const ChartString& value) { SetAttribute(name, value.xc_str()); }

private:
    GrxBaseElement* slot(const XMLCh* name, int count) const;
    void setSlot(const XMLCh* name, int count, GrxBaseElement& frame);
};

// Only its name is used: an attribute of a drill-down extension.
struct GRX_API GrxDrillDown {
    static const XMLCh* getElementName() { return u"drillDown"; }
};

class GRX_API GrxTokenMapping : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"tokenMapping")
    GRX_INT(Token, u"token", 0)
    GRX_REF(Variable, GrxUni::_variable, CTVariableType)
    GRX_LIST(SummaryStatistic, GrxSummaryStatistic)
};

class GRX_API GrxPopup : public GrxBaseElement {
    GRX_ELEMENT(GrxBaseElement, u"popup")
    GRX_REF(Target, GrxUni::_target, CTElementType)
    GRX_TEXT(TokenTemplate, u"tokenTemplate")
    GRX_LIST(TokenMapping, GrxTokenMapping)
};

// ---- data sources ---------------------------------------------------------------------------------

class GRX_API CTDataSourceType : public GrxBaseElement {
    GRX_KIND(GrxBaseElement)
    GRX_TEXT(Name, GrxUni::_name)
};
class GRX_API GrxUserSource : public CTDataSourceType {
    GRX_ELEMENT(CTDataSourceType, u"userSource")
};
class GRX_API GrxDatabaseSource : public CTDataSourceType {
    GRX_ELEMENT(CTDataSourceType, u"databaseSource")
};
class GRX_API GrxDelimitedFileSource : public CTDataSourceType {
    GRX_ELEMENT(CTDataSourceType, u"delimitedFileSource")
};
class GRX_API GrxStreamingSource : public CTDataSourceType {
    GRX_ELEMENT(CTDataSourceType, u"streamingSource")
};
// Holds "names", "types" and "row" children exactly as a data document does.
class GRX_API GrxEmbeddedSource : public CTDataSourceType {
    GRX_ELEMENT(CTDataSourceType, u"embeddedSource")
};

// ---- the visualization ----------------------------------------------------------------------------

class GRX_API GrxVisualization : public GrxDocument {
public:
    static const XMLCh* getElementName() { return GrxUni::_visualization; }
    // Wraps the whole document of `root` (its document element).
    explicit GrxVisualization(xercesc::DOMElement* root, bool ownsDocument = false)
        : GrxDocument(root, ownsDocument) {}

    GRX_FRAME
    GRX_FRAME_HOLDER
    GRX_LIST(Style, GrxStyle)
    std::vector<GrxStyleCycle*> getStyleCycles() const { return children<GrxStyleCycle>(); }
    GrxStyleCycle& addStyleCycle(const ChartString& id) {
        GrxStyleCycle& c = add<GrxStyleCycle>();
        c.setId(id);
        return c;
    }
    void removeStyleCycles() { removeAll<GrxStyleCycle>(); }
    GRX_LIST(Extension, GrxExtensionVis)
    GrxExtensionVis* getExtension() const { return first<GrxExtensionVis>(); }
    GRX_LIST(Popup, GrxPopup)
    GrxPopup& addPopup(CTElementType& target) {
        GrxPopup& p = add<GrxPopup>();
        p.setTarget(target);
        return p;
    }
    GRX_LIST(UserSource, GrxUserSource)
    GRX_LIST(DatabaseSource, GrxDatabaseSource)
    GRX_LIST(DelimitedFileSource, GrxDelimitedFileSource)
    GRX_LIST(StreamingSource, GrxStreamingSource)
    GRX_LIST(EmbeddedSource, GrxEmbeddedSource)
    GRX_LIST(SourceVariable, GrxSourceVariable)
    GRX_LIST(ExpressionVariable, GrxExpressionVariable)
    GRX_LIST(DerivedVariable, GrxDerivedVariable)
    GRX_LIST(IntervalDomain, GrxIntervalDomain)
    GRX_LIST(CategoricalDomain, GrxCategoricalDomain)
    GRX_TEXT(Lang, u"lang")

    // Moves the frames held by `container` (graphs, containers, label frames, legends, control
    // frames, keys) up to the container's parent, just before it; their wrappers stay the same.
    void reparentContainerChildren(GrxContainer& container);

    // The whole document as UTF-8, whatever encoding it declares.
    std::string AsUTF8() const;
};

// The helpers that spell the classes above stay out of every file that includes this one.
#undef GRX_FRAME_HOLDER
#undef GRX_FRAME
#undef GRX_STYLED
#undef GRX_LABELED
#undef GRX_LOW_HIGH
#undef GRX_CONDITIONAL_STYLES
#undef GRX_ELEMENT
#undef GRX_KIND
#undef GRX_LIST
#undef GRX_ONE
#undef GRX_PRESENCE
#undef GRX_TEXT
#undef GRX_BOOL
#undef GRX_INT
#undef GRX_DOUBLE
#undef GRX_ENUM
#undef GRX_REF

#endif
