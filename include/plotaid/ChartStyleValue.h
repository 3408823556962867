#ifndef PLOTAID_CHARTSTYLEVALUE_H
#define PLOTAID_CHARTSTYLEVALUE_H

#include <plotaid/Export.h>

#include <grx/ChartString.h>

#include <xercesc/util/XercesDefs.hpp>

// The CSS-like text of a template style ("fill:#336699;stroke-width:1pt"), one field per property
// the library knows and the rest kept verbatim, so a style text survives a read and a rewrite.
class PLOTAID_API ChartStyleValue {
public:
    ChartStyleValue();
    explicit ChartStyleValue(const XMLCh* text);
    ChartStyleValue(const ChartStyleValue& other);
    ChartStyleValue& operator=(const ChartStyleValue& other);
    virtual ~ChartStyleValue();

    // The non-empty fields as one text, in a fixed order, unknown declarations last.
    ChartString getValue() const;

    const ChartString& getDepth() const { return depth_; }
    const ChartString& getFill_Pattern() const { return fillPattern_; }
    const ChartString& getFill() const { return fill_; }
    const ChartString& getFont_Family() const { return fontFamily_; }
    const ChartString& getFont_Size() const { return fontSize_; }
    const ChartString& getFont_Style() const { return fontStyle_; }
    const ChartString& getFont_Weight() const { return fontWeight_; }
    const ChartString& getGlyphAngle() const { return glyphAngle_; }
    const ChartString& getGlyphAspect() const { return glyphAspect_; }
    const ChartString& getGlyphSides() const { return glyphSides_; }
    const ChartString& getLabel_Location_Inside() const { return labelLocationInside_; }
    const ChartString& getLabel_Location_X() const { return labelLocationX_; }
    const ChartString& getLabel_Location_Y() const { return labelLocationY_; }
    const ChartString& getMargin() const { return margin_; }
    const ChartString& getMax_Width() const { return maxWidth_; }
    const ChartString& getMinFontSize() const { return minFontSize_; }
    const ChartString& getPadding() const { return padding_; }
    const ChartString& getPrimaryColor() const { return primaryColor_; }
    const ChartString& getSecondaryColor() const { return secondaryColor_; }
    const ChartString& getShadow() const { return shadow_; }
    const ChartString& getShadow_dx() const { return shadowDx_; }
    const ChartString& getShadow_dy() const { return shadowDy_; }
    const ChartString& getShadow_opacity() const { return shadowOpacity_; }
    const ChartString& getSize() const { return size_; }
    const ChartString& getStroke() const { return stroke_; }
    const ChartString& getStroke_Dasharray() const { return strokeDasharray_; }
    const ChartString& getStroke_Linecap() const { return strokeLinecap_; }
    const ChartString& getSymbol() const { return symbol_; }
    const ChartString& getTextFit() const { return textFit_; }
    const ChartString& getStroke_Width() const { return strokeWidth_; }
    const ChartString& getVisibility() const { return visibility_; }
    const ChartString& getWidth() const { return width_; }
    const ChartString& getUnknown() const { return unknown_; }

    void SetDepth(const ChartString& v) { depth_ = v; }
    void SetFill_Pattern(const ChartString& v) { fillPattern_ = v; }
    void SetFill(const ChartString& v) { fill_ = v; }
    void SetFont_Family(const ChartString& v) { fontFamily_ = v; }
    void SetFont_Size(const ChartString& v) { fontSize_ = v; }
    void SetFont_Style(const ChartString& v) { fontStyle_ = v; }
    void SetFont_Weight(const ChartString& v) { fontWeight_ = v; }
    void SetLabel_Location_Inside(const ChartString& v) { labelLocationInside_ = v; }
    void SetLabel_Location_X(const ChartString& v) { labelLocationX_ = v; }
    void SetLabel_Location_Y(const ChartString& v) { labelLocationY_ = v; }
    void SetMargin(const ChartString& v) { margin_ = v; }
    void SetMax_Width(const ChartString& v) { maxWidth_ = v; }
    void SetMinFontSize(const ChartString& v) { minFontSize_ = v; }
    void SetPadding(const ChartString& v) { padding_ = v; }
    void SetPrimaryColor(const ChartString& v) { primaryColor_ = v; }
    void SetSecondaryColor(const ChartString& v) { secondaryColor_ = v; }
    void SetShadow(const ChartString& v) { shadow_ = v; }
    void SetShadow_DX(const ChartString& v) { shadowDx_ = v; }
    void SetShadow_DY(const ChartString& v) { shadowDy_ = v; }
    void SetShadow_Opacity(const ChartString& v) { shadowOpacity_ = v; }
    void SetStroke(const ChartString& v) { stroke_ = v; }
    void SetStroke_Dasharray(const ChartString& v) { strokeDasharray_ = v; }
    void SetStroke_Linecap(const ChartString& v) { strokeLinecap_ = v; }
    void SetTextFit(const ChartString& v) { textFit_ = v; }
    void SetStroke_Width(const ChartString& v) { strokeWidth_ = v; }
    void SetVisibility(const ChartString& v) { visibility_ = v; }
    void SetWidth(const ChartString& v) { width_ = v; }

    // Property names of the library's own (the others are object-model names).
    static const XMLCh* const _fill_pattern;
    static const XMLCh* const _label_location_inside;
    static const XMLCh* const _label_location_x;
    static const XMLCh* const _label_location_y;
    static const XMLCh* const _max_width;
    static const XMLCh* const _min_font_size;
    static const XMLCh* const _visibility;

private:
    void initialize(const XMLCh* text);

    struct Property {
        const XMLCh* name;
        ChartString ChartStyleValue::*field;
    };
    // Every field but the unknown one, in the order getValue writes them.
    static const Property kProperties[32];

    ChartString depth_;
    ChartString fillPattern_;
    ChartString fill_;
    ChartString fontFamily_;
    ChartString fontSize_;
    ChartString fontStyle_;
    ChartString fontWeight_;
    ChartString glyphAngle_;
    ChartString glyphAspect_;
    ChartString glyphSides_;
    ChartString labelLocationInside_;
    ChartString labelLocationX_;
    ChartString labelLocationY_;
    ChartString margin_;
    ChartString maxWidth_;
    ChartString minFontSize_;
    ChartString padding_;
    ChartString primaryColor_;
    ChartString secondaryColor_;
    ChartString shadow_;
    ChartString shadowDx_;
    ChartString shadowDy_;
    ChartString shadowOpacity_;
    ChartString size_;
    ChartString stroke_;
    ChartString strokeDasharray_;
    ChartString strokeLinecap_;
    ChartString symbol_;
    ChartString textFit_;
    ChartString strokeWidth_;
    ChartString visibility_;
    ChartString width_;
    ChartString unknown_;
};

#endif
