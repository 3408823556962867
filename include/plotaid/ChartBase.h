#ifndef PLOTAID_CHARTBASE_H
#define PLOTAID_CHARTBASE_H

#include <plotaid/Export.h>

#include <grx/ChartString.h>

#include <xercesc/util/XMLString.hpp>
#include <xercesc/util/XercesDefs.hpp>

#include <memory>
#include <set>
#include <string>

XERCES_CPP_NAMESPACE_BEGIN
class DOMDocument;
class DOMElement;
class DOMNode;
XERCES_CPP_NAMESPACE_END

class GrxFormat;
class GrxVisualization;
class Kovar_Format;

namespace msgbook {
class FacSTDictionary;
}

// Tags ordered by their text; the set does not own them.
struct ConstChartStringLess {
    bool operator()(const XMLCh* a, const XMLCh* b) const {
        return XERCES_CPP_NAMESPACE::XMLString::compareString(a, b) < 0;
    }
};
using ConstChartStringSet = std::set<const XMLCh*, ConstChartStringLess>;

// Base of the library's document builders: the parser each builder owns, chart document creation
// and parsing, small DOM edits and locale-independent number text. Not copyable: a builder owns
// its parser.
class PLOTAID_API ChartBase {
public:
    virtual ~ChartBase();
    ChartBase(const ChartBase&) = delete;
    ChartBase& operator=(const ChartBase&) = delete;

    // Debug dump kinds. Kind n is switched on by character n of "DumpChartXMLOptions" (any
    // character but '0'); dumps go to the folder named by "DumpChartXMLPath".
    enum PRINTTYPE {
        PRINT_UNUSED_0 = 0,
        PRINT_UNUSED_1 = 1,
        PRINT_UNUSED_2 = 2,
        PRINT_CONVERTED_TEMPLATE = 3,  // "template_converted_" .sgt
        PRINT_TEMPLATE = 4,            // "Template_" .sgt
        PRINT_XML_BEFORE_TEMPLATE = 5, // "Xml_before_template_" .xml
        PRINT_XML_AFTER_TEMPLATE = 6,  // "Xml_after_template_" .xml
        PRINT_UNUSED_7 = 7,
        PRINT_UNUSED_8 = 8,
        PRINT_XML_WITH_POPUPS = 9 // "xml_with_popups" .xml, and "parseError_" .xml for rejected text
    };

    // Writes text to <DumpChartXMLPath>/<name><count, two digits at least><extension>, replacing
    // any earlier file. False when the kind is off, the text is empty or the file cannot be written.
    static bool printString(const std::string& text, const std::string& name, const std::string& extension,
                            int count, int kind);
    // Whether dumps of the kind are switched on; always false for kinds outside 0-9.
    static bool willPrintString(int kind);
    // Appends a timing line to <DumpChartTimePath>/chartxmldebug_<Mon><dd>00.txt when that variable
    // is set. The log is fixed at the first call of the process.
    static void printDebugInfo(const std::string& text);

    // Host print formats to object-model formats, so chart labels print as the host's output does.
    // addFormat dispatches by type and leaves types it does not convert alone (true); the others
    // give false for a type outside their own.
    static bool addFormat(GrxFormat& format, const Kovar_Format& hostFormat);
    static bool FormatNumber(GrxFormat& format, const Kovar_Format& hostFormat);
    static bool FormatDate(GrxFormat& format, const Kovar_Format& hostFormat);
    static bool FormatElapsedTime(GrxFormat& format, const Kovar_Format& hostFormat);
    static bool FormatCustomCurrency(GrxFormat& format, const Kovar_Format& hostFormat);

    // Fills the date and time placeholders of a chart text ("@@current_date@@", ")TIME", ...) from
    // the local time of the call. Month and weekday names and the a.m./p.m. word are the
    // dictionary's words for the English ones, host text in the code page `encoding`; without a
    // dictionary, or for a word it lacks or that does not transcode, that placeholder stays.
    static void updateText(ChartString& text, const msgbook::FacSTDictionary* dictionary,
                           const std::string& encoding);

    // New chart documents owned by the caller (free them with releaseDocument): an older-form
    // "graph" root or a "visualization" root, in the chart namespace with its schema location.
    // Null when no document could be made; failures are logged, never thrown.
    static XERCES_CPP_NAMESPACE::DOMDocument* createDocument(const XMLCh* encoding);
    static XERCES_CPP_NAMESPACE::DOMDocument* createGrxDocument(const XMLCh* encoding);
    // Public, so that whoever may create a document may also free it; null is ignored.
    static void releaseDocument(XERCES_CPP_NAMESPACE::DOMDocument* document);
    // Whether the text parses and validates against the grammar it names.
    static bool ValidXML(const std::string& text);

    // 0 on success, -1 (logged) for a null value or a name the document refuses.
    static int AddAttributeDoc(XERCES_CPP_NAMESPACE::DOMDocument* document,
                               XERCES_CPP_NAMESPACE::DOMElement* element, const XMLCh* name,
                               const XMLCh* value);
    int AddAttribute(XERCES_CPP_NAMESPACE::DOMElement* element, const XMLCh* name, const XMLCh* value);
    // Sets the element's id so that getElementById finds it; a duplicate is logged and the element
    // given it last answers.
    bool AddID(XERCES_CPP_NAMESPACE::DOMElement* element, const XMLCh* id);
    // `base` followed by the first number from 1 up that no element of the visualization has as id.
    static ChartString CreateUniqueId(const ChartString& base, const GrxVisualization& visualization);
    static bool mergeAttributes(const XERCES_CPP_NAMESPACE::DOMElement* from,
                                XERCES_CPP_NAMESPACE::DOMElement* to);

    static XERCES_CPP_NAMESPACE::DOMElement* getChildByTagName(const XERCES_CPP_NAMESPACE::DOMNode* parent,
                                                               const XMLCh* tag);
    XERCES_CPP_NAMESPACE::DOMElement* getElementWithAttribute(const XMLCh* tag, const XMLCh* attribute,
                                                              const XMLCh* value) const;
    unsigned int removeAllChildren(XERCES_CPP_NAMESPACE::DOMNode* node);

    std::string asString(int value);
    // Always with '.' as decimal point, whatever the locale.
    std::string asString(const double& value);
    // The lowest finite double when the text holds no number.
    double asDouble(const std::string& text) const;
    // Token `index` (from 0) of `text` split on any of `delimiters`; empty past the last.
    static ChartString getToken(const XMLCh* text, const XMLCh* delimiters, unsigned int index);

    // Chart XML vocabulary.
    static const XMLCh* const _aggregate;
    static const XMLCh* const _aimcenterstep;
    static const XMLCh* const _attributes;
    static const XMLCh* const _barmargin;
    static const XMLCh* const _binhighval;
    static const XMLCh* const _binlowval;
    static const XMLCh* const _bins;
    static const XMLCh* const _biplot_line;
    static const XMLCh* const _biplot_point;
    static const XMLCh* const _boxplot;
    static const XMLCh* const _boxplotmargin;
    static const XMLCh* const _casenum;
    static const XMLCh* const _categories;
    static const XMLCh* const _centroid;
    static const XMLCh* const _clusteredbar;
    static const XMLCh* const _colon;
    static const XMLCh* const _constant;
    static const XMLCh* const _container;
    static const XMLCh* const _controlchart_Average;
    static const XMLCh* const _controlchart_Center_Step_LCL;
    static const XMLCh* const _controlchart_Center_Step_UCL;
    static const XMLCh* const _controlchart_LCL;
    static const XMLCh* const _controlchart_line;
    static const XMLCh* const _controlchart_LSpec;
    static const XMLCh* const _controlchart_marker;
    static const XMLCh* const _controlchart_UCL;
    static const XMLCh* const _controlchart_USpec;
    static const XMLCh* const _coordinateFacet;
    static const XMLCh* const _coordinateTransform;
    static const XMLCh* const _countname;
    static const XMLCh* const _datasource;
    static const XMLCh* const _dateFormat;
    static const XMLCh* const _dateTimeFormat;
    static const XMLCh* const _dayOfMonth;
    static const XMLCh* const _dayOfWeek;
    static const XMLCh* const _dayOfYear;
    static const XMLCh* const _default_fill;
    static const XMLCh* const _default_font_family;
    static const XMLCh* const _default_style;
    static const XMLCh* const _differenceline;
    static const XMLCh* const _dollarSign;
    static const XMLCh* const _dropdownline;
    static const XMLCh* const _equal;
    static const XMLCh* const _errorbar;
    static const XMLCh* const _errorbarhidden;
    static const XMLCh* const _exponent;
    static const XMLCh* const _external_;
    static const XMLCh* const _facet1;
    static const XMLCh* const _facetGap;
    static const XMLCh* const _facetGapVert;
    static const XMLCh* const _facetLabelAngle;
    static const XMLCh* const _footnote;
    static const XMLCh* const _frame_data_1;
    static const XMLCh* const _frame_footnote_1;
    static const XMLCh* const _frame_footnote_2;
    static const XMLCh* const _frame_footnote_3;
    static const XMLCh* const _frame_graph_1;
    static const XMLCh* const _frame_legend_1;
    static const XMLCh* const _frame_legend_2;
    static const XMLCh* const _frame_pie_1;
    static const XMLCh* const _frame_statistics_summary_1;
    static const XMLCh* const _frame_subtitle_1;
    static const XMLCh* const _frame_title_1;
    static const XMLCh* const _frame_title_2;
    static const XMLCh* const _grid;
    static const XMLCh* const _gridLineStyle;
    static const XMLCh* const _groupbarmargin;
    static const XMLCh* const _gsgraphSources;
    static const XMLCh* const _hex;
    static const XMLCh* const _hiddenline;
    static const XMLCh* const _histogrammargin;
    static const XMLCh* const _implFeatures;
    static const XMLCh* const _internal_;
    static const XMLCh* const _isotropic;
    static const XMLCh* const _labelStyle;
    static const XMLCh* const _manova_line;
    static const XMLCh* const _manova_point;
    static const XMLCh* const _matrixscatter;
    static const XMLCh* const _matrixscatter_1;
    static const XMLCh* const _matrixscatterdiagonal;
    static const XMLCh* const _matrixscatterinnerx;
    static const XMLCh* const _matrixscatterinnery;
    static const XMLCh* const _matrixscatterx;
    static const XMLCh* const _matrixscattery;
    static const XMLCh* const _measure;
    static const XMLCh* const _metaInfo;
    static const XMLCh* const _namespaceURI;
    static const XMLCh* const _nmv;
    static const XMLCh* const _noLegend;
    static const XMLCh* const _order;
    static const XMLCh* const _panel;
    static const XMLCh* const _percent;
    static const XMLCh* const _percentname;
    static const XMLCh* const _publicURI;
    static const XMLCh* const _rangebar;
    static const XMLCh* const _referenceLine;
    static const XMLCh* const _rLocation;
    static const XMLCh* const _scatter;
    static const XMLCh* const _schemaDatabLocationValue;
    static const XMLCh* const _schemaDataLocationName;
    static const XMLCh* const _schemaDataLocationValue;
    static const XMLCh* const _schemaDefaultNSName;
    static const XMLCh* const _schemaDefaultNSValue;
    static const XMLCh* const _schemaInstanceName;
    static const XMLCh* const _schemaInstanceValue;
    static const XMLCh* const _schemaLocationName;
    static const XMLCh* const _schemaLocationValue;
    static const XMLCh* const _semicolon;
    static const XMLCh* const _series;
    static const XMLCh* const _setStyle;
    static const XMLCh* const _setStyleCycle;
    static const XMLCh* const _simplearea;
    static const XMLCh* const _simplebar;
    static const XMLCh* const _simpleline;
    static const XMLCh* const _spikes;
    static const XMLCh* const _stackedarea;
    static const XMLCh* const _stackedbar;
    static const XMLCh* const _stackinterpolating;
    static const XMLCh* const _statVariable;
    static const XMLCh* const _stringFormat;
    static const XMLCh* const _styleCycleColor;
    static const XMLCh* const _styleCycleDefault;
    static const XMLCh* const _styleCyclePattern;
    static const XMLCh* const _styleCycleRepository;
    static const XMLCh* const _subtitle;
    static const XMLCh* const _survival_censored;
    static const XMLCh* const _survival_line;
    static const XMLCh* const _survival_point;
    static const XMLCh* const _system;
    static const XMLCh* const _systemURI;
    static const XMLCh* const _template;
    static const XMLCh* const _thetaLocation;
    static const XMLCh* const _tile;
    static const XMLCh* const _timeFormat;
    static const XMLCh* const _title;
    static const XMLCh* const _triplot_line;
    static const XMLCh* const _triplot_point;
    static const XMLCh* const _underscore;
    static const XMLCh* const _utf16;
    static const XMLCh* const _utf8;
    static const XMLCh* const _validation_feature;
    static const XMLCh* const _version;
    static const XMLCh* const _weightname;
    static const XMLCh* const _wgt;
    static const XMLCh* const _x1;
    static const XMLCh* const _x2;
    static const XMLCh* const _xLocation;
    static const XMLCh* const _XMLversion;
    static const XMLCh* const _xyplane;
    static const XMLCh* const _xzplane;
    static const XMLCh* const _y1;
    static const XMLCh* const _y2;
    static const XMLCh* const _yFunctionOfX;
    static const XMLCh* const _yLocation;
    static const XMLCh* const _yzplane;

protected:
    ChartBase();

    // Xerces-C stays up while any builder lives; these take and drop one reference of the
    // process-wide count for callers outside a builder's lifetime.
    static void initialize();
    static void terminate();

    // The parsed document belongs to this builder's parser until its next parse; null (logged,
    // dumped as parseError_) when the text is not valid chart XML.
    XERCES_CPP_NAMESPACE::DOMDocument* parseDocument(const std::string& text);
    XERCES_CPP_NAMESPACE::DOMElement* addStyle(XERCES_CPP_NAMESPACE::DOMElement* parent, const XMLCh* id);
    // Inserts `child` before the first child of `parent` whose name is in `tags`, else at the end.
    bool insertBeforeSiblings(XERCES_CPP_NAMESPACE::DOMElement* parent,
                              XERCES_CPP_NAMESPACE::DOMElement* child, ConstChartStringSet tags);

    XERCES_CPP_NAMESPACE::DOMDocument* document_ = nullptr; // working document, not owned
    void* second_ = nullptr;
    char decimalPoint_ = '.';

private:
    struct Parser;
    std::unique_ptr<Parser> parser_;
};

#endif
