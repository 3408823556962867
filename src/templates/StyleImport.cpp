// Template styles: the CSS-like style text (ChartStyleValue) and how a template "style" element is
// merged into a style of the chart (BaseTemplate::importStyle). Everything about importing a style
// is in this one file.
#include "templates/Kit.h"
#include <plotaid/ChartBase.h>
#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartException.h>
#include <plotaid/ChartStyleValue.h>

#include <grx/ChartPrinter.h>
#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLString.hpp>

#include <sstream>
#include <string>
#include <string_view>
#include <vector>

using namespace XERCES_CPP_NAMESPACE;

const XMLCh* const ChartStyleValue::_fill_pattern = u"fill-pattern";
const XMLCh* const ChartStyleValue::_label_location_inside = u"label-location-inside";
const XMLCh* const ChartStyleValue::_label_location_x = u"label-location-x";
const XMLCh* const ChartStyleValue::_label_location_y = u"label-location-y";
const XMLCh* const ChartStyleValue::_max_width = u"max-width";
const XMLCh* const ChartStyleValue::_min_font_size = u"min-font-size";
const XMLCh* const ChartStyleValue::_visibility = u"visibility";

// ---- the style text -------------------------------------------------------------------------------

namespace {

// The pieces of `text` between separators; empty pieces are dropped and nothing is trimmed.
std::vector<std::u16string_view> pieces(std::u16string_view text, char16_t separator) {
    std::vector<std::u16string_view> out;
    std::size_t start = 0;
    while (start <= text.size()) {
        std::size_t cut = text.find(separator, start);
        if (cut == std::u16string_view::npos)
            cut = text.size();
        if (cut > start)
            out.push_back(text.substr(start, cut - start));
        start = cut + 1;
    }
    return out;
}

} // namespace

ChartStyleValue::ChartStyleValue() = default;

ChartStyleValue::ChartStyleValue(const XMLCh* text) {
    initialize(text);
}

ChartStyleValue::ChartStyleValue(const ChartStyleValue& other) = default;
ChartStyleValue& ChartStyleValue::operator=(const ChartStyleValue& other) = default;
ChartStyleValue::~ChartStyleValue() = default;

const ChartStyleValue::Property ChartStyleValue::kProperties[32] = {
    {GrxUni::_depth, &ChartStyleValue::depth_},
    {_fill_pattern, &ChartStyleValue::fillPattern_},
    {GrxUni::_fill, &ChartStyleValue::fill_},
    {GrxUni::_color, &ChartStyleValue::primaryColor_},
    {GrxUni::_color2, &ChartStyleValue::secondaryColor_},
    {GrxUni::_font_family, &ChartStyleValue::fontFamily_},
    {GrxUni::_font_style, &ChartStyleValue::fontStyle_},
    {GrxUni::_font_size, &ChartStyleValue::fontSize_},
    {GrxUni::_font_weight, &ChartStyleValue::fontWeight_},
    {_label_location_inside, &ChartStyleValue::labelLocationInside_},
    {_label_location_x, &ChartStyleValue::labelLocationX_},
    {_label_location_y, &ChartStyleValue::labelLocationY_},
    {GrxUni::_margin, &ChartStyleValue::margin_},
    {_max_width, &ChartStyleValue::maxWidth_},
    {GrxUni::_padding, &ChartStyleValue::padding_},
    {GrxUni::_shadow, &ChartStyleValue::shadow_},
    {GrxUni::_shadow_dx, &ChartStyleValue::shadowDx_},
    {GrxUni::_shadow_dy, &ChartStyleValue::shadowDy_},
    {GrxUni::_shadow_opacity, &ChartStyleValue::shadowOpacity_},
    {GrxUni::_stroke, &ChartStyleValue::stroke_},
    {GrxUni::_stroke_dasharray, &ChartStyleValue::strokeDasharray_},
    {GrxUni::_stroke_linecap, &ChartStyleValue::strokeLinecap_},
    {GrxUni::_stroke_width, &ChartStyleValue::strokeWidth_},
    {_visibility, &ChartStyleValue::visibility_},
    {GrxUni::_width, &ChartStyleValue::width_},
    {GrxUni::_text_fit, &ChartStyleValue::textFit_},
    {_min_font_size, &ChartStyleValue::minFontSize_},
    {GrxUni::_size, &ChartStyleValue::size_},
    {GrxUni::_symbol, &ChartStyleValue::symbol_},
    {GrxUni::_glyph_sides, &ChartStyleValue::glyphSides_},
    {GrxUni::_glyph_angle, &ChartStyleValue::glyphAngle_},
    {GrxUni::_glyph_aspect, &ChartStyleValue::glyphAspect_},
};

void ChartStyleValue::initialize(const XMLCh* text) {
    if (text == nullptr)
        return;
    for (std::u16string_view declaration : pieces(std::u16string_view(text), u';')) {
        const std::vector<std::u16string_view> tokens = pieces(declaration, u':');
        if (tokens.empty())
            continue; // only colons: no name at all
        const std::u16string name(tokens.front());
        // With two colons the value is the piece after the second one.
        const std::u16string value = tokens.size() > 1 ? std::u16string(tokens.back()) : std::u16string();
        const Property* match = nullptr;
        for (const Property& p : kProperties)
            if (name == p.name) {
                match = &p;
                break;
            }
        if (match == nullptr) {
            if (!unknown_.empty())
                unknown_.append(u";");
            unknown_.append(name.c_str()).append(u":").append(value.c_str());
            continue;
        }
        // "none" means no dash array, so an attribute of the same style may give one.
        if (match->field == &ChartStyleValue::strokeDasharray_ && value == GrxUni::_none)
            this->*match->field = ChartString();
        else
            this->*match->field = ChartString(value);
    }
}

ChartString ChartStyleValue::getValue() const {
    ChartString text;
    for (const Property& p : kProperties) {
        const ChartString& value = this->*p.field;
        if (value.empty())
            continue;
        if (!text.empty())
            text.append(u";");
        text.append(p.name).append(u":").append(value);
    }
    if (!unknown_.empty()) {
        if (!text.empty())
            text.append(u";");
        text.append(unknown_);
    }
    return text;
}

// ---- importing a style element --------------------------------------------------------------------

namespace {

const char kFile[] = "backend/chartxml/plotaid/src/templates/basetemplate";

// The CSS-like value when there is one, else the attribute's.
ChartString eitherValue(const ChartString& css, const XMLCh* attribute) {
    return css.empty() ? ChartString(attribute) : css;
}

const XMLCh* nameOf(const DOMNode* node) {
    const XMLCh* local = node->getLocalName();
    return local ? local : node->getNodeName();
}

using plotaid::detail::printed;

// The style of the chart's own definition that carries the target style's id, if any: whatever it
// sets explicitly, the template leaves alone.
class SourceGuard {
public:
    SourceGuard(const GrxVisualization* source, const GrxStyle& target) {
        const ChartString id(target.getId());
        if (source != nullptr && !id.empty())
            style_ = GrxBaseElement::wrapperOf<GrxStyle>(source->getElementById(id));
    }

    bool has(const XMLCh* attribute) const { return style_ && style_->isAttributePresent(attribute); }
    bool has(bool (GrxStyle::*present)() const) const { return style_ && (style_->*present)(); }
    bool hasPreferredFontSize() const { return !fontSizePart(0).empty(); }
    bool hasMinimumFontSize() const { return !fontSizePart(1).empty(); }
    // A preferred (and, when asked, a maximum) width or size.
    bool hasWidthOrSize(bool maximumToo) const {
        if (style_ == nullptr)
            return false;
        ChartString parts[6];
        style_->getWidth(&parts[0], nullptr, &parts[1]);
        style_->getSize(&parts[2], nullptr, &parts[3]);
        return !parts[0].empty() || !parts[2].empty() ||
               (maximumToo && (!parts[1].empty() || !parts[3].empty()));
    }

private:
    ChartString fontSizePart(int which) const {
        ChartString parts[2];
        if (style_)
            style_->getFontSize(&parts[0], &parts[1], nullptr);
        return parts[which];
    }

    const GrxStyle* style_ = nullptr;
};

// One property of the style element, from its CSS-like text or from its attribute `name`: skipped
// when both are empty or the source sets the property; the CSS-like value goes through `write`,
// otherwise the attribute is copied as it is.
template <class Write>
void mergeProperty(GrxStyle& style, const DOMElement& element, const ChartString& css, const XMLCh* name,
                   bool guarded, Write write) {
    const XMLCh* attribute = element.getAttribute(name);
    if ((css.empty() && !plotaid::detail::hasText(attribute)) || guarded)
        return;
    if (!css.empty())
        write(css);
    else
        style.SetAttribute(name, attribute);
}

// A property written only as an attribute, from either value, when `accept` takes that value.
template <class Accept>
void mergeChecked(GrxStyle& style, const DOMElement& element, const ChartString& css, const XMLCh* name,
                  bool guarded, Accept accept) {
    const ChartString value = eitherValue(css, element.getAttribute(name));
    if (value.empty() || guarded || !accept(value))
        return;
    style.SetAttribute(name, value);
}

bool anyValue(const ChartString&) {
    return true;
}
bool notNegative(const ChartString& v) {
    return v.convertToSignedInteger() >= 0;
}
// As an unsigned number: "0.5" reads 0, "-1" reads huge.
bool zeroOrOne(const ChartString& v) {
    return v.convertToInteger() <= 1;
}
bool glyphSidesInRange(unsigned sides) {
    return sides >= 2 && sides <= 100;
}

// The interpolation of a style: smoothing and missing-value representation for the lines, areas
// and paths whose style it is (areas and paths are smoothed whatever their style).
class Interpolation {
public:
    Interpolation(BaseTemplate& action, const GrxVisualization* source, const GrxStyle& style,
                  const DOMElement& child)
        : action_(action), source_(source), styleId_(style.getId()), type_(child.getAttribute(GrxUni::_type)),
          missing_(child.getAttribute(GrxUni::_missingRepresentation)) {
        if (type_.equals(GrxUni::_step) || type_.equals(GrxUni::_jump)) {
            const ChartString position(child.getAttribute(GrxUni::_pointPosition));
            method_ = position.equals(GrxUni::_left) ? 13 : position.equals(GrxUni::_right) ? 14 : 15;
        }
    }

    void apply() {
        applyTo<GrxLine>(GrxUni::_line, true);
        applyTo<GrxArea>(GrxUni::_area, false);
        applyTo<GrxPath>(GrxUni::_path, false);
    }

private:
    template <class Kind> void applyTo(const XMLCh* kind, bool smoothOnlyMatching) {
        std::vector<CTElementType*> elements;
        action_.getAllElementsByType(kind, elements);
        for (CTElementType* element : elements) {
            GrxStyle* own = element->getStyle();
            if (own == nullptr) {
                own = &action_.addStyle(*element, nullptr);
                element->setStyle(*own);
            }
            const bool matching = styleId_.equals(ChartBase::_container) || styleId_.equals(own->getId());
            if (matching && sourceSetsNoBreak<Kind>(*element)) {
                if (missing_.equals(GrxUni::_gap))
                    element->setBreakRepresentation(grx::BreakRepresentation::gap);
                else if (missing_.equals(GrxUni::_wings))
                    element->setBreakRepresentation(grx::BreakRepresentation::wings);
                else if (missing_.equals(GrxUni::_interpolated))
                    element->setBreakRepresentation(grx::BreakRepresentation::interpolated);
            }
            if (type_.empty() || (smoothOnlyMatching && !matching))
                continue;
            std::vector<GrxSmoothStatistic*> smooths = element->getSmoothStatistics();
            GrxSmoothStatistic& smooth = smooths.empty() ? element->addSmoothStatistic() : *smooths.front();
            smooth.setMethod(method_);
            element->setShowDiscontinuity(type_.equals(GrxUni::_jump));
        }
    }

    // Only an element that the chart's definition holds, without a break representation of its own.
    template <class Kind> bool sourceSetsNoBreak(const CTElementType& element) const {
        const ChartString id(element.getId());
        if (source_ == nullptr || id.empty())
            return false;
        const DOMElement* node = source_->getElementById(id);
        if (node == nullptr)
            return false;
        const Kind* same = GrxBaseElement::wrapperOf<Kind>(node);
        return same == nullptr || same->getBreakRepresentation() == grx::BreakRepresentation::none;
    }

    BaseTemplate& action_;
    const GrxVisualization* source_;
    const ChartString styleId_;
    const ChartString type_;
    const ChartString missing_;
    int method_ = 0;
};

// Whether `style` fills an area: the chart's own style, an interval's, a selected graph's cell or
// box hinge, a legend's. The first match ends the search.
bool isFilledAreaStyle(const BaseTemplate& action, const GrxVisualization& target, const GrxStyle& style) {
    const ChartString id(style.getId());
    // An empty id matches any style that exists.
    auto same = [&](const GrxStyle* candidate) {
        return candidate != nullptr && (id.empty() || id.equals(candidate->getId()));
    };
    if (same(target.getStyle()))
        return true;
    std::vector<GrxInterval*> intervals;
    action.getIntervalElements(intervals, false);
    action.getIntervalElements(intervals, true);
    for (const GrxInterval* interval : intervals)
        if (same(interval->getStyle()))
            return true;
    std::vector<GrrUviza*> graphs;
    action.getGraphs(graphs);
    for (const GrrUviza* graph : graphs) {
        if (graph == nullptr)
            continue;
        if (same(graph->getCellStyle()))
            return true;
        for (const GrxSchema* schema : graph->getSchemas())
            if (same(schema->getHingeStyle()))
                return true;
    }
    for (const GrxLegend* legend : action.getLegends())
        if (same(legend->getStyle()))
            return true;
    return false;
}

} // namespace

void BaseTemplate::importStyle(const DOMElement* element, GrxStyle& style) {
    if (element == nullptr)
        return;
    const DOMElement& e = *element;
    const SourceGuard source(source_, style);
    const ChartStyleValue css(e.getAttribute(GrxUni::_value));

    // Rows in their fixed order; a later row may overwrite what an earlier one wrote.
    mergeProperty(style, e, css.getPrimaryColor(), GrxUni::_color, source.has(&GrxStyle::isColorPresent),
                  [&](const ChartString& v) { style.setColor(v); });
    mergeProperty(style, e, css.getSecondaryColor(), GrxUni::_color2, source.has(&GrxStyle::isColor2Present),
                  [&](const ChartString& v) { style.setColor2(v); });
    mergeProperty(style, e, css.getStroke_Width(), GrxUni::_stroke_width,
                  source.has(&GrxStyle::isStroke_widthPresent),
                  [&](const ChartString& v) { style.setStroke_width(v); });

    // Font size: the CSS-like text gives the preferred size only; the attribute gives all three
    // parts, except a minimum that the source sets.
    {
        const ChartString attribute(e.getAttribute(GrxUni::_font_size));
        if ((!css.getFont_Size().empty() || !attribute.empty()) && !source.hasPreferredFontSize()) {
            if (!css.getFont_Size().empty()) {
                style.setFontSize(css.getFont_Size().xc_str(), nullptr, nullptr);
            } else {
                ChartString preferred, minimum, maximum;
                GrxStyle::getPreferredMinMax(attribute.xc_str(), &preferred, &minimum, &maximum);
                style.setFontSize(preferred.xc_str(),
                                  source.hasMinimumFontSize() ? nullptr : minimum.xc_str(), maximum.xc_str());
            }
        }
    }

    // Font weight: the CSS word "normal" is the regular weight, any other word bold; the
    // attribute's "normal" is written as the object model's "regular".
    {
        ChartString attribute(e.getAttribute(GrxUni::_font_weight));
        const ChartString& weight = css.getFont_Weight();
        if ((!weight.empty() || !attribute.empty()) && !source.has(&GrxStyle::isFontWeightPresent)) {
            if (attribute.equals(GrxUni::_normal))
                attribute = ChartString(GrxUni::_regular);
            if (weight.empty())
                style.SetAttribute(GrxUni::_font_weight, attribute);
            else
                style.setFontWeight(weight.equals(GrxUni::_normal) ? 1 : 2);
        }
    }

    mergeProperty(style, e, css.getStroke_Dasharray(), GrxUni::_stroke_dasharray,
                  source.has(&GrxStyle::isStroke_dasharrayPresent),
                  [&](const ChartString& v) { style.setStroke_dasharray(v); });
    mergeProperty(style, e, css.getLabel_Location_X(), GrxUni::_labelLocationHorizontal,
                  source.has(&GrxStyle::isLabelLocationHorizontalPresent),
                  [&](const ChartString& v) { style.SetAttribute(GrxUni::_labelLocationHorizontal, v); });
    mergeProperty(style, e, css.getLabel_Location_Y(), GrxUni::_labelLocationVertical,
                  source.has(&GrxStyle::isLabelLocationVerticalPresent),
                  [&](const ChartString& v) { style.SetAttribute(GrxUni::_labelLocationVertical, v); });
    mergeProperty(style, e, css.getPadding(), GrxUni::_padding, source.has(&GrxStyle::isPaddingPresent),
                  [&](const ChartString& v) { style.setPadding(v); });
    mergeProperty(style, e, css.getMargin(), GrxUni::_margin, source.has(&GrxStyle::isMarginPresent),
                  [&](const ChartString& v) { style.setMargin(v); });
    mergeProperty(
        style, e, css.getVisibility(), GrxUni::_visible, source.has(&GrxStyle::isVisiblePresent),
        [&](const ChartString& v) { style.setVisible(!(v.equals(GrxUni::_hidden) || v.equals(GrxUni::_false))); });
    mergeProperty(style, e, css.getMax_Width(), GrxUni::_width, source.hasWidthOrSize(true),
                  [&](const ChartString& v) { style.setWidth(nullptr, nullptr, v.xc_str()); });
    mergeProperty(style, e, css.getWidth(), GrxUni::_width, source.hasWidthOrSize(false),
                  [&](const ChartString& v) { style.setWidth(v.xc_str(), nullptr, nullptr); });
    mergeProperty(style, e, css.getSymbol(), GrxUni::_symbol, source.has(&GrxStyle::isSymbolPresent),
                  [&](const ChartString& v) { style.setSymbol(v); });
    mergeProperty(style, e, css.getSize(), GrxUni::_size, source.has(&GrxStyle::isSizePresent),
                  [&](const ChartString& v) { style.setSize(v); });
    mergeChecked(style, e, css.getStroke_Linecap(), GrxUni::_stroke_linecap,
                 source.has(GrxUni::_stroke_linecap), anyValue);
    mergeProperty(style, e, css.getDepth(), GrxUni::_depth, source.has(&GrxStyle::isDepthPresent),
                  [&](const ChartString& v) { style.setDepth(v); });
    mergeChecked(style, e, css.getFill_Pattern(), GrxUni::_pattern, source.has(&GrxStyle::isPatternPresent),
                 notNegative);
    mergeProperty(style, e, css.getFont_Family(), GrxUni::_font_family,
                  source.has(&GrxStyle::isFont_familyPresent),
                  [&](const ChartString& v) { style.setFont_family(v); });
    mergeChecked(style, e, css.getGlyphAngle(), GrxUni::_glyph_angle,
                 source.has(&GrxStyle::isGlyph_anglePresent), anyValue);
    mergeChecked(style, e, css.getTextFit(), GrxUni::_text_fit, source.has(GrxUni::_text_fit), anyValue);
    mergeChecked(style, e, css.getLabel_Location_Inside(), GrxUni::_labelInside,
                 source.has(&GrxStyle::isLabelInsidePresent), anyValue);
    mergeChecked(style, e, css.getFont_Style(), GrxUni::_font_style, source.has(GrxUni::_font_style),
                 anyValue);

    // Minimum font size, from the CSS-like text or the attribute's minimum part.
    {
        ChartString fromAttribute;
        GrxStyle::getPreferredMinMax(e.getAttribute(GrxUni::_font_size), nullptr, &fromAttribute, nullptr);
        const ChartString minimum = eitherValue(css.getMinFontSize(), fromAttribute.xc_str());
        if (!minimum.empty() && !source.hasMinimumFontSize())
            style.setFontSize(nullptr, minimum.xc_str(), nullptr);
    }

    mergeProperty(style, e, css.getShadow(), GrxUni::_shadow_color,
                  source.has(&GrxStyle::isShadow_colorPresent),
                  [&](const ChartString& v) { style.setShadow_color(v); });
    mergeProperty(style, e, css.getShadow_dx(), GrxUni::_shadow_dx, source.has(&GrxStyle::isShadow_dxPresent),
                  [&](const ChartString& v) { style.setShadow_dx(v); });
    mergeProperty(style, e, css.getShadow_dy(), GrxUni::_shadow_dy, source.has(&GrxStyle::isShadow_dyPresent),
                  [&](const ChartString& v) { style.setShadow_dy(v); });
    mergeChecked(style, e, css.getShadow_opacity(), GrxUni::_shadow_opacity,
                 source.has(&GrxStyle::isShadow_opacityPresent), zeroOrOne);
    mergeChecked(style, e, css.getGlyphAspect(), GrxUni::_glyph_aspect,
                 source.has(&GrxStyle::isGlyph_aspectPresent), notNegative);
    mergeChecked(style, e, css.getGlyphSides(), GrxUni::_glyph_sides,
                 source.has(&GrxStyle::isGlyph_sidesPresent),
                 [](const ChartString& v) { return glyphSidesInRange(v.convertToInteger()); });

    // Stroke and fill: a filled area (the chart's own style, an interval, a cell, a box hinge, a
    // legend) is filled with the fill and outlined with the stroke; anything else is drawn with
    // the stroke and has no fill. Each is guarded by the property it would write.
    if (!css.getStroke().empty() || !css.getFill().empty()) {
        const bool filled = isFilledAreaStyle(*this, target_, style);
        if (!css.getStroke().empty()) {
            if (filled && !source.has(&GrxStyle::isColor2Present))
                style.setColor2(css.getStroke());
            else if (!filled && !source.has(&GrxStyle::isColorPresent))
                style.setColor(css.getStroke());
        }
        if (!css.getFill().empty() && filled && !source.has(&GrxStyle::isColorPresent))
            style.setColor(css.getFill());
    }

    for (const DOMNode* node = e.getFirstChild(); node != nullptr; node = node->getNextSibling()) {
        if (node->getNodeType() != DOMNode::ELEMENT_NODE)
            continue;
        const DOMElement& child = static_cast<const DOMElement&>(*node);
        const XMLCh* name = nameOf(node);
        if (XMLString::equals(name, GrxUni::_glyph)) {
            // Only what the glyph says: an attribute it leaves out changes nothing.
            const ChartString sides(child.getAttribute(GrxUni::_sides));
            if (!sides.empty() && glyphSidesInRange(sides.convertToInteger()) &&
                !source.has(&GrxStyle::isGlyph_sidesPresent))
                style.setGlyph_sides(static_cast<int>(sides.convertToInteger()));
            const ChartString angle(child.getAttribute(GrxUni::_angle));
            if (!angle.empty() && !source.has(&GrxStyle::isGlyph_anglePresent))
                style.setGlyph_angle(angle.convertToDouble());
            const ChartString aspect(child.getAttribute(GrxUni::_aspect));
            if (!aspect.empty() && aspect.convertToDouble() >= 0.0 &&
                !source.has(&GrxStyle::isGlyph_aspectPresent))
                style.setGlyph_aspect(aspect.convertToDouble());
            const ChartString size(child.getAttribute(GrxUni::_size));
            if (!size.empty() && !source.has(&GrxStyle::isSizePresent))
                style.setSize(size);
            const ChartString symbol(child.getAttribute(GrxUni::_type));
            if (!symbol.empty() && !source.has(&GrxStyle::isSymbolPresent))
                style.setSymbol(symbol);
        } else if (XMLString::equals(name, GrxUni::_interpolation)) {
            Interpolation(*this, source_, style, child).apply();
        } else if (XMLString::equals(name, GrxUni::_intervalGlyph)) {
            const ChartString symbol(child.getAttribute(GrxUni::_type));
            if (!symbol.empty())
                style.setSymbol(symbol);
        } else if (XMLString::equals(name, GrxUni::_shadow)) {
            const ChartString color(child.getAttribute(GrxUni::_color));
            if (!color.empty() && !source.has(&GrxStyle::isShadow_colorPresent))
                style.setShadow_color(color);
            const ChartString dx(child.getAttribute(GrxUni::_dx));
            if (!dx.empty() && !source.has(&GrxStyle::isShadow_dxPresent))
                style.setShadow_dx(dx);
            const ChartString dy(child.getAttribute(GrxUni::_dy));
            if (!dy.empty() && !source.has(&GrxStyle::isShadow_dyPresent))
                style.setShadow_dy(dy);
            const ChartString opacity(child.getAttribute(GrxUni::_opacity));
            if (!opacity.empty() && !source.has(&GrxStyle::isShadow_opacityPresent))
                style.setShadow_opacity(opacity.convertToDouble());
        } else {
            ChartErrorHandler().error(
                ChartException("Unsupported style child encountered (" + printed(node) + ")", kFile, 4672));
        }
    }

    // Properties that only an attribute of the style element gives.
    struct Plain {
        const XMLCh* name;
        bool (*accept)(const ChartString&);
    };
    static const Plain plain[] = {
        {GrxUni::_gradient_method, anyValue},
        {GrxUni::_gradient_color, anyValue},
        {GrxUni::_gradient_focus, anyValue},
        {GrxUni::_gradient_angle, anyValue},
        {GrxUni::_gradient_size, anyValue},
        {GrxUni::_gradient_opacity, zeroOrOne},
        {GrxUni::_gradient_isInverted, anyValue},
        {GrxUni::_opacity2, zeroOrOne},
        {GrxUni::_background_method, anyValue},
        {GrxUni::_background_image, anyValue},
        {GrxUni::_opacity, anyValue},
        {GrxUni::_stroke_decoration, anyValue},
        {GrxUni::_bevel_size, anyValue},
        {GrxUni::_depthRelativeToWidth, anyValue},
        {GrxUni::_labelAngle, anyValue},
        {GrxUni::_fill_opacity, anyValue},
        {GrxUni::_stroke_opacity, anyValue},
        {GrxStyle::_margin_left, anyValue},
        {GrxStyle::_margin_right, anyValue},
        {GrxStyle::_margin_top, anyValue},
        {GrxStyle::_margin_bottom, anyValue},
        {GrxStyle::_padding_left, anyValue},
        {GrxStyle::_padding_right, anyValue},
        {GrxStyle::_padding_top, anyValue},
        {GrxStyle::_padding_bottom, anyValue},
        {GrxStyle::_textAlignment, anyValue},
        {GrxStyle::_maxAttachedTextWidth, anyValue},
        {GrxStyle::_maxAttachedTextHeight, anyValue},
    };
    for (const Plain& p : plain) {
        const ChartString value(e.getAttribute(p.name));
        if (source.has(p.name))
            continue;
        // A style without a gradient colour of its own takes away the one the chart had.
        if (value.empty() && XMLString::equals(p.name, GrxUni::_gradient_color))
            style.removeGradient_color();
        if (!value.empty() && p.accept(value))
            style.SetAttribute(p.name, value);
    }
}
