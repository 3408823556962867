// The conversion point for templates of the earlier form.
#include "templates/TemplateConverter.h"

#include "foundation/OwnedDocument.h"
#include "templates/InstructionWalk.h"
#include "transform/ElementWalk.h"

#include <plotaid/ChartAxis.h>
#include <plotaid/ChartBase.h>
#include <plotaid/ChartException.h>
#include <plotaid/ChartGraph.h>
#include <plotaid/ChartGuide.h>
#include <plotaid/ChartStyleValue.h>

#include <plotaid/ChartErrorHandler.h>

#include <grx/ChartPrinter.h>
#include <grx/ChartString.h>
#include <grx/GrxUni.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/framework/XMLPScanToken.hpp>
#include <xercesc/sax/SAXParseException.hpp>
#include <xercesc/sax2/DefaultHandler.hpp>
#include <xercesc/sax2/SAX2XMLReader.hpp>
#include <xercesc/sax2/XMLReaderFactory.hpp>
#include <xercesc/util/SecurityManager.hpp>
#include <xercesc/util/XMLString.hpp>
#include <xercesc/util/XMLUni.hpp>

#include <atomic>
#include <charconv>
#include <cmath>
#include <iomanip>
#include <locale>
#include <memory>
#include <set>
#include <sstream>
#include <unordered_map>
#include <vector>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

constexpr XMLCh kTemplate[] = u"template";
constexpr XMLCh kNamespace[] = u"http://plotaid.org/grxml";
constexpr XMLCh kXmlnsUri[] = u"http://www.w3.org/2000/xmlns/";
constexpr XMLCh kSchemaInstanceUri[] = u"http://www.w3.org/2001/XMLSchema-instance";
constexpr XMLCh kSchemaLocation[] =
    u"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-template-1.0.xsd";

// What the DOM cannot make is still a template: the bare root, written out by hand.
const char* const kBareTemplate =
    "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
    "<template xmlns=\"http://plotaid.org/grxml\" xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
    "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-template-1.0.xsd\"/>\n";

std::atomic<unsigned> conversions{0};

const char* const kFile = "backend/chartxml/plotaid/src/templates/charttemplate";

// Stored templates hold a few hundred elements; several passes ask the whole document about each
// element they convert, so a larger one is refused rather than converted slowly.
constexpr std::size_t kElementLimit = 20000;

std::size_t countElements(const DOMDocument* document) {
    std::size_t count = 0;
    forEachDescendant(document, nullptr, [&](DOMElement*) { return ++count <= kElementLimit; });
    return count;
}

const char* const kMarker = "grxml-template-";
const char* const kConvertedMarker = "grxml-template-1.0";

// The root and its children's names, read without validation and without reading anything the text
// names. It stops as soon as the text is known for a current template, or else reads to the end to
// learn whether it is XML at all.
class Outline final : public DefaultHandler {
public:
    void startElement(const XMLCh* const uri, const XMLCh* const localname, const XMLCh* const,
                      const Attributes&) override {
        if (++depth_ > static_cast<int>(ValidatingParser::kNestingLimit))
            throw std::string("elements are nested more than " +
                              std::to_string(ValidatingParser::kNestingLimit) + " deep");
        if (depth_ == 1)
            template_ = XMLString::equals(uri, kNamespace) && XMLString::equals(localname, kTemplate);
        else if (depth_ == 2 && template_ && XMLString::equals(uri, kNamespace) && isInstruction(localname))
            instruction_ = true;
    }
    void endElement(const XMLCh* const, const XMLCh* const, const XMLCh* const) override { --depth_; }
    // Expansion is bounded in count by the security manager; this bounds it in length.
    void internalEntityDecl(const XMLCh* const name, const XMLCh* const value) override {
        if (XMLString::stringLen(value) > ValidatingParser::kEntityValueLimit)
            throw std::string("entity '" + ChartString(name).toUTF8() + "' is longer than the limit");
    }
    void fatalError(const SAXParseException& e) override {
        ChartErrorHandler().fatalError(e); // logged, then thrown on
    }

    bool currentTemplate() const { return template_ && instruction_; }

private:
    static bool isInstruction(const XMLCh* name) {
        const InstructionTable table = instructionTable();
        for (std::size_t i = 0; i < table.count; ++i)
            if (XMLString::equals(name, table.entries[i].tag))
                return true;
        return false;
    }

    int depth_ = 0;
    bool template_ = false;
    bool instruction_ = false;
};

// Whether the text is a current template by its outline; notXml says why it is not XML, when not.
bool hasCurrentTemplateOutline(std::string_view text, std::string& notXml) {
    Outline outline;
    SecurityManager security;
    security.setEntityExpansionLimit(ValidatingParser::kEntityExpansionLimit);
    try {
        std::unique_ptr<SAX2XMLReader> reader(XMLReaderFactory::createXMLReader());
        reader->setFeature(XMLUni::fgSAX2CoreNameSpaces, true);
        reader->setFeature(XMLUni::fgSAX2CoreValidation, false);
        reader->setFeature(XMLUni::fgXercesLoadExternalDTD, false);
        reader->setFeature(XMLUni::fgXercesDisableDefaultEntityResolution, true);
        reader->setProperty(XMLUni::fgXercesSecurityManager, &security);
        reader->setContentHandler(&outline);
        reader->setDeclarationHandler(&outline);
        reader->setErrorHandler(&outline);
        static const char nothing = 0;
        MemBufInputSource source(reinterpret_cast<const XMLByte*>(text.empty() ? &nothing : text.data()),
                                 text.size(), "ChartTemplate");
        XMLPScanToken token;
        if (reader->parseFirst(source, token))
            while (!outline.currentTemplate() && reader->parseNext(token)) {
            }
        reader->parseReset(token);
    } catch (const SAXParseException& e) {
        notXml = std::to_string(e.getLineNumber()) + ":" + std::to_string(e.getColumnNumber()) + ": " +
                 ChartString(e.getMessage()).toUTF8();
    } catch (const std::string& limit) {
        notXml = limit;
    } catch (...) {
        notXml = "the text cannot be read as XML";
    }
    return notXml.empty() && outline.currentTemplate();
}

} // namespace

namespace {

constexpr XMLCh kMajorOld[] = u"majorticks";
constexpr XMLCh kMinorOld[] = u"minorticks";
constexpr XMLCh kGridLinesOld[] = u"gridlines";
constexpr XMLCh kFacetStyleOld[] = u"facetstyle";
constexpr XMLCh kCoordinateTransform[] = u"coordinatetransform";
constexpr XMLCh kCoordinateFacet[] = u"coordinatefacet";
constexpr XMLCh kAggregateSmall[] = u"aggregatesmall";
constexpr XMLCh kLabelAngleOld[] = u"labelangle";
constexpr XMLCh kTickLabelStyle[] = u"tickLabelStyle";
constexpr XMLCh kContainerId[] = u"c-o-n-t-a-i-n-er";
constexpr XMLCh kDerived[] = u"derived";
constexpr XMLCh kPrimary[] = u"primary";
constexpr XMLCh kFrameId[] = u"frameId";

// The names this converter writes that are not chart-grammar names.
constexpr XMLCh kGridLines[] = u"gridLines";
constexpr XMLCh kFacetStyle[] = u"facetStyle";

bool same(const XMLCh* a, const XMLCh* b) {
    return a != nullptr && b != nullptr && XMLString::equals(a, b);
}
const XMLCh* trueOrFalse(bool b) {
    return b ? GrxUni::_true : GrxUni::_false;
}

// Old-form format names and the current names the format import reads.
constexpr const XMLCh* kFormats[][2] = {{u"numberformat", u"numberFormat"},
                                        {u"stringformat", u"stringFormat"},
                                        {u"datetimeformat", u"dateTimeFormat"}};

// "frameId" texts that name a frame kind and count; any other id is a free label frame.
struct FrameName {
    const char16_t* id;
    const char16_t* type;
    const char16_t* count;
};
constexpr FrameName kFrames[] = {
    {u"frame_data_1", u"graph", u"1"},          {u"frame_pie_1", u"graph", u"1"},
    {u"frame_title_1", u"title", u"1"},         {u"frame_title_2", u"title", u"2"},
    {u"frame_subtitle_1", u"subtitle", u""},    {u"frame_footnote_1", u"footnote", u"1"},
    {u"frame_footnote_2", u"footnote", u"2"},   {u"frame_footnote_3", u"footnote", u"3"},
    {u"frame_legend_1", u"legend", u"1"},       {u"frame_legend_2", u"legend", u"2"},
    {u"frame_statistics_summary_1", u"statisticsSummary", u""},
    {u"frame_graph_1", u"visualization", u""},
};

// The scatterplot binning settings the action reads as attributes.
constexpr const XMLCh* kScatterBinning[] = {u"gridType", u"location", u"method", u"binCount",
                                            u"binWidth", u"binStart", u"high", u"low"};

class Converter {
public:
    Converter(const DOMDocument* old, DOMDocument* converted)
        : oldRoot_(old ? old->getDocumentElement() : nullptr), doc_(converted),
          root_(converted->getDocumentElement()) {
        forEach(nullptr, [&](DOMElement* e) {
            const XMLCh* id = e->getAttribute(GrxUni::_id);
            if (!isEmpty(id))
                ids_.emplace(id, e); // the first of an id answers, as a look-up by id would
        });
    }

    void run() {
        if (oldRoot_ == nullptr)
            return;
        zRole_ = hasZRole();
        chartType_ = ChartGraph(oldRoot_).getChartType();
        addFrames();
        addReferenceLines();
        addAnchoredAnnotations();
        addFitLines();
        addHistogramNormalLine();
        addInterpolationLines();
        addDerivedAxes();
        addBarEffects();
        addPieEffects();
        addShadow();
        addDataLabels();
        setAxisScales();
        setAxisIntervals();
        setAxisMargins();
        setAxisOpposites();
        setAxisStyles();
        setAxisTicks(kMajorOld);
        setAxisTicks(kMinorOld);
        setScaleByFraction();
        setClusterWidth();
        setCollapse();
        setTickLabel(kLabelAngleOld, GrxUni::_labelAngle, u"setTickLabelAngle");
        setTickLabel(GrxUni::_labelFrequency, GrxUni::_labelFrequency, u"setTickLabelFrequency");
        setHistogramBinning();
        hideFrames();
        setBackPlane();
        setStyles();
        setStyleCycles();
        setScatterplotBinning();
    }

private:
    template <class Visit> void forEach(const XMLCh* tag, Visit visit) const {
        forEachDescendant(oldRoot_, tag, [&](DOMElement* e) {
            visit(e);
            return true;
        });
    }
    DOMElement* first(const XMLCh* tag) const { return firstDescendant(oldRoot_, tag); }
    DOMElement* byId(const XMLCh* id) const {
        if (isEmpty(id))
            return nullptr;
        const auto found = ids_.find(id);
        return found == ids_.end() ? nullptr : found->second;
    }

    DOMElement* add(DOMElement* parent, const XMLCh* tag) {
        return static_cast<DOMElement*>(parent->appendChild(doc_->createElementNS(kNamespace, tag)));
    }
    DOMElement* instruction(const XMLCh* tag) { return add(root_, tag); }
    static void setIf(DOMElement* e, const XMLCh* name, const XMLCh* value) {
        if (!isEmpty(value))
            e->setAttribute(name, value);
    }
    static void copyIf(DOMElement* to, const DOMElement* from, const XMLCh* name) {
        setIf(to, name, from->getAttribute(name));
    }
    DOMNode* import(const DOMNode* node, bool deep) { return doc_->importNode(node, deep); }
    void copyChildren(DOMElement* to, const DOMElement* from, const XMLCh* tag) {
        for (DOMElement* c = from->getFirstElementChild(); c; c = c->getNextElementSibling())
            if (isNamed(c, tag))
                to->appendChild(import(c, true));
    }
    // Parameters copied in whole, a distance scaled up.
    void copyParameters(DOMElement* to, const DOMElement* from, bool scaleDistance) {
        for (DOMElement* c = from->getFirstElementChild(); c; c = c->getNextElementSibling()) {
            if (!isNamed(c, GrxUni::_parameter))
                continue;
            auto* copy = static_cast<DOMElement*>(to->appendChild(import(c, true)));
            if (scaleDistance && same(c->getAttribute(GrxUni::_name), GrxUni::_distance))
                copy->setAttribute(GrxUni::_value, scaled(c->getAttribute(GrxUni::_value)).xc_str());
        }
    }

    // The converted style: its value text rewritten, its children but nested styles copied.
    DOMElement* copyStyle(const DOMElement* old, DOMElement* to) {
        DOMElement* style = add(to, GrxUni::_style);
        const XMLCh* value = old->getAttribute(GrxUni::_value);
        if (!isEmpty(value))
            style->setAttribute(GrxUni::_value, ChartStyleValue(value).getValue().xc_str());
        for (DOMElement* c = old->getFirstElementChild(); c; c = c->getNextElementSibling())
            if (!isNamed(c, GrxUni::_style))
                style->appendChild(import(c, true));
        return style;
    }
    // The style the old element names in that attribute, converted into `to`; null without one.
    DOMElement* styleOf(const DOMElement* old, DOMElement* to, const XMLCh* attribute = GrxUni::_style) {
        const DOMElement* style = old ? byId(old->getAttribute(attribute)) : nullptr;
        return isNamed(style, GrxUni::_style) ? copyStyle(style, to) : nullptr;
    }
    // A style wrapped in an element of its own (markStyle, tickLabelStyle, ...), when there is one.
    void wrappedStyleOf(const DOMElement* old, const XMLCh* attribute, DOMElement* to, const XMLCh* wrapper) {
        const DOMElement* style = byId(old->getAttribute(attribute));
        if (isNamed(style, GrxUni::_style))
            copyStyle(style, add(to, wrapper));
    }
    void label(const DOMElement* old, DOMElement* to) {
        if (old == nullptr)
            return;
        ChartString text;
        for (const DOMNode* n = old->getFirstChild(); n; n = n->getNextSibling())
            if (n->getNodeType() == DOMNode::TEXT_NODE)
                text.append(ChartString(n->getNodeValue()));
        if (text.empty())
            return;
        DOMElement* label = add(to, GrxUni::_label);
        label->appendChild(doc_->createTextNode(text.xc_str()));
        styleOf(old, label);
    }
    void format(const DOMElement* old, DOMElement* to) {
        for (const auto& names : kFormats)
            if (DOMElement* f = ChartBase::getChildByTagName(old, names[0])) {
                DOMElement* copy = add(to, names[1]);
                copyAttributes(f, copy);
                for (DOMNode* n = f->getFirstChild(); n; n = n->getNextSibling())
                    copy->appendChild(import(n, true));
                return;
            }
    }
    static void copyAttributes(const DOMElement* from, DOMElement* to) {
        const DOMNamedNodeMap* attributes = from->getAttributes();
        for (XMLSize_t i = 0; i < attributes->getLength(); ++i)
            if (!XMLString::startsWith(attributes->item(i)->getNodeName(), u"xmlns"))
                to->setAttribute(attributes->item(i)->getNodeName(), attributes->item(i)->getNodeValue());
    }
    // Old ticks as the current majorTicks or minorTicks element of the axis role.
    void ticks(const DOMElement* old, DOMElement* to, const XMLCh* role, bool categorical, bool derived) {
        const bool major = isNamed(old, kMajorOld);
        DOMElement* ticks = add(to, major ? GrxUni::_majorTicks : GrxUni::_minorTicks);
        static constexpr const XMLCh* kMajor[] = {GrxUni::_stagger, GrxUni::_position, GrxUni::_length,
                                                  GrxUni::_delta, GrxUni::_UTF_base};
        static constexpr const XMLCh* kMinor[] = {GrxUni::_number, GrxUni::_position, GrxUni::_length};
        if (major)
            for (const XMLCh* name : kMajor)
                copyIf(ticks, old, name);
        else
            for (const XMLCh* name : kMinor)
                copyIf(ticks, old, name);
        setIf(ticks, GrxUni::_role, role);
        ticks->setAttribute(GrxUni::_categorical, trueOrFalse(categorical));
        if (derived)
            ticks->setAttribute(kDerived, GrxUni::_true);
        if (const DOMElement* grid = ChartBase::getChildByTagName(old, kGridLinesOld)) {
            DOMElement* lines = add(ticks, kGridLines);
            styleOf(grid, lines); // the first style is the grid line's own
            if (DOMElement* facet = byId(grid->getAttribute(kFacetStyleOld)); isNamed(facet, GrxUni::_style)) {
                DOMElement* wrapper = add(lines, kFacetStyle);
                copyIf(wrapper, facet, GrxUni::_when);
                copyStyle(facet, wrapper);
            }
        }
        wrappedStyleOf(old, GrxUni::_markStyle, ticks, GrxUni::_markStyle);
        if (!major)
            return;
        format(old, ticks);
        wrappedStyleOf(old, kTickLabelStyle, ticks, kTickLabelStyle);
    }

    // 1.5 times the number, written back with up to 16 digits; any other text stays.
    static ChartString scaled(const XMLCh* value) {
        const std::string text = ChartString(value).toUTF8();
        double number = 0;
        const auto read = std::from_chars(text.data(), text.data() + text.size(), number);
        if (read.ec != std::errc() || read.ptr != text.data() + text.size() || !std::isfinite(number * 1.5))
            return ChartString(value);
        std::ostringstream out;
        out.imbue(std::locale::classic());
        out << std::setprecision(16) << number * 1.5;
        return ChartString(out.str());
    }

    bool hasZRole() const {
        bool found = false;
        forEachDescendant(oldRoot_, nullptr, [&](DOMElement* e) {
            found = (isNamed(e, GrxUni::_dimension) || isNamed(e, kFacetVariable)) &&
                    same(e->getAttribute(GrxUni::_role), GrxUni::_z);
            return !found;
        });
        return found;
    }
    // The role, categorical flag and derived flag of an axis, as the axis instructions carry them.
    struct AxisFacts {
        const XMLCh* role;
        bool categorical;
        bool derived;
    };
    static AxisFacts factsOf(DOMElement* axis) {
        const ChartAxis wrapped(axis);
        return {wrapped.getDimension().getrole(), wrapped.isCategorical(),
                ChartBase::getChildByTagName(axis, GrxUni::_transform) != nullptr};
    }
    static void setAxis(DOMElement* to, const AxisFacts& facts) {
        setIf(to, GrxUni::_role, facts.role);
        to->setAttribute(GrxUni::_categorical, trueOrFalse(facts.categorical));
        if (facts.derived)
            to->setAttribute(kDerived, GrxUni::_true);
    }

    void addFrames() {
        forEach(GrxUni::_frame, [&](DOMElement* frame) {
            const DOMElement* location = ChartBase::getChildByTagName(frame, GrxUni::_location);
            if (location == nullptr)
                return;
            DOMElement* set = instruction(u"addFrame");
            setIf(set, kFrameId, frame->getAttribute(GrxUni::_id));
            if (isNamed(frame->getParentNode(), GrxUni::_frame))
                setIf(set, u"parentFrameId", static_cast<DOMElement*>(frame->getParentNode())->getAttribute(GrxUni::_id));
            DOMElement* edges = add(set, GrxUni::_location);
            for (const XMLCh* edge : {GrxUni::_bottom, GrxUni::_left, GrxUni::_right, GrxUni::_top})
                copyIf(edges, location, edge);
            styleOf(frame, set);
            label(ChartBase::getChildByTagName(frame, GrxUni::_label), set);
        });
    }
    void addReferenceLines() {
        forEach(GrxUni::_guide, [&](DOMElement* guide) {
            if (!same(guide->getAttribute(GrxUni::_type), GrxUni::_line) ||
                ChartBase::getChildByTagName(guide, GrxUni::_parameter) == nullptr)
                return;
            DOMElement* line = instruction(u"addReferenceLine");
            for (DOMElement* p = guide->getFirstElementChild(); p; p = p->getNextElementSibling()) {
                const XMLCh* name = p->getAttribute(GrxUni::_name);
                if (!isNamed(p, GrxUni::_parameter) || same(name, GrxUni::_z))
                    continue;
                const bool xy = same(name, GrxUni::_x) || same(name, GrxUni::_y);
                auto* copy = static_cast<DOMElement*>(line->appendChild(import(p, false)));
                copy->setAttribute(GrxUni::_categorical,
                                   trueOrFalse(xy && ChartParameter(p).getVariable().isCategorical()));
            }
            styleOf(guide, line);
        });
    }
    void addAnchoredAnnotations() {
        forEach(GrxUni::_guide, [&](DOMElement* guide) {
            std::vector<DOMElement*> parameters;
            for (DOMElement* c = guide->getFirstElementChild(); c; c = c->getNextElementSibling())
                if (isNamed(c, GrxUni::_parameter))
                    parameters.push_back(c);
            if (!same(guide->getAttribute(GrxUni::_type), GrxUni::_point) || parameters.size() != 2)
                return;
            DOMElement* note = instruction(u"addAnchoredAnnotation");
            label(ChartBase::getChildByTagName(guide, GrxUni::_label), note);
            for (DOMElement* p : parameters) {
                const XMLCh* name = p->getAttribute(GrxUni::_name);
                const ChartVariable variable = ChartParameter(p).getVariable();
                bool categorical = false;
                if ((same(name, GrxUni::_x) || same(name, GrxUni::_y)) && !variable.isNull())
                    categorical = variable.isCategorical();
                else if (same(name, GrxUni::_x))
                    categorical = ChartElement(ChartBase::getChildByTagName(p, GrxUni::_variable)).isCategorical();
                auto* copy = static_cast<DOMElement*>(note->appendChild(import(p, false)));
                copy->setAttribute(GrxUni::_categorical, trueOrFalse(categorical));
            }
        });
    }
    void addFitLines() {
        forEach(GrxUni::_element, [&](DOMElement* element) {
            if (!same(element->getAttribute(GrxUni::_type), GrxUni::_line))
                return;
            for (DOMElement* s = element->getFirstElementChild(); s; s = s->getNextElementSibling()) {
                const XMLCh* method = s->getAttribute(GrxUni::_method);
                if (isNamed(s, GrxUni::_statistic) && (same(method, u"smooth") || same(method, u"region")))
                    addFitLine(element, s);
            }
        });
    }
    void addFitLine(const DOMElement* element, const DOMElement* statistic) {
        DOMElement* fit = instruction(u"addFitLine");
        fit->setAttribute(GrxUni::_target,
                          ChartBase::getChildByTagName(element, kStyleBy) ? u"subgroup" : u"pair");
        fit->setAttribute(kPrimary, GrxUni::_true);
        const XMLCh* type = GrxUni::_linear;
        bool mean = false;
        bool loess = false;
        const XMLCh* alpha = nullptr;
        const XMLCh* individuals = nullptr;
        for (DOMElement* p = statistic->getFirstElementChild(); p; p = p->getNextElementSibling()) {
            if (!isNamed(p, GrxUni::_parameter))
                continue;
            const XMLCh* name = p->getAttribute(GrxUni::_name);
            const XMLCh* value = p->getAttribute(GrxUni::_value);
            if (same(name, GrxUni::_degree)) {
                mean = same(value, u"0");
                type = same(value, u"2") ? GrxUni::_quadratic : same(value, u"3") ? GrxUni::_cubic : type;
            } else if (same(name, GrxUni::_proportion) || same(name, GrxUni::_kernel)) {
                fit->setAttribute(name, value);
            } else if (same(name, u"model") && same(value, GrxUni::_loess)) {
                loess = true;
            } else if (same(name, GrxUni::_alpha)) {
                alpha = value;
            } else if (same(name, GrxUni::_predictIndividuals)) {
                individuals = value;
            }
        }
        fit->setAttribute(GrxUni::_type, loess ? GrxUni::_loess : mean ? GrxUni::_mean : type);
        if (alpha != nullptr && individuals != nullptr) {
            DOMElement* interval = add(fit, u"confidenceInterval");
            interval->setAttribute(GrxUni::_alpha, alpha);
            interval->setAttribute(GrxUni::_predictIndividuals, individuals);
        }
        styleOf(element, fit);
    }
    void addHistogramNormalLine() {
        const DOMElement* statistic =
            descendantWith(oldRoot_, GrxUni::_statistic, GrxUni::_method, GrxUni::_distribution);
        if (statistic == nullptr)
            return;
        DOMElement* line = instruction(u"addHistogramNormalLine");
        line->setAttribute(GrxUni::_type, GrxUni::_normal);
        const DOMNode* parent = statistic->getParentNode();
        const DOMNode* grandparent = parent ? parent->getParentNode() : nullptr;
        if (grandparent && grandparent->getNodeType() == DOMNode::ELEMENT_NODE)
            styleOf(static_cast<const DOMElement*>(grandparent), line);
    }
    // Whether a style belongs to a line element: inside one, or named by one.
    bool isLineStyle(const DOMNode* style) const {
        if (!isNamed(style, GrxUni::_style))
            return false;
        const DOMNode* owner = style->getParentNode();
        if (isNamed(owner, GrxUni::_element))
            return same(static_cast<const DOMElement*>(owner)->getAttribute(GrxUni::_type), GrxUni::_line);
        return lineStyles_.count(static_cast<const DOMElement*>(style)->getAttribute(GrxUni::_id)) > 0;
    }
    void addInterpolationLines() {
        forEach(GrxUni::_element, [&](DOMElement* e) {
            if (same(e->getAttribute(GrxUni::_type), GrxUni::_line) && !isEmpty(e->getAttribute(GrxUni::_style)))
                lineStyles_.insert(e->getAttribute(GrxUni::_style));
        });
        forEach(GrxUni::_interpolation, [&](DOMElement* old) {
            if (!isLineStyle(old->getParentNode()))
                return;
            DOMElement* interpolation = add(instruction(u"addInterpolationLine"), GrxUni::_interpolation);
            copyIf(interpolation, old, GrxUni::_type);
            copyIf(interpolation, old, GrxUni::_missingRepresentation);
            interpolation->setAttribute(kPrimary, GrxUni::_true);
            if (const DOMElement* p = ChartBase::getChildByTagName(old, GrxUni::_parameter))
                interpolation->setAttribute(GrxUni::_pointPosition, p->getAttribute(GrxUni::_value));
        });
    }
    void addDerivedAxes() {
        forEach(GrxUni::_axis, [&](DOMElement* axis) {
            const DOMElement* transform = ChartBase::getChildByTagName(axis, GrxUni::_transform);
            if (transform == nullptr)
                return;
            const AxisFacts facts = factsOf(axis);
            DOMElement* derived = instruction(u"addDerivedAxis");
            setIf(derived, GrxUni::_role, facts.role);
            label(ChartBase::getChildByTagName(axis, GrxUni::_label), derived);
            for (const XMLCh* tag : {kMajorOld, kMinorOld})
                if (const DOMElement* old = ChartBase::getChildByTagName(axis, tag))
                    ticks(old, derived, facts.role, facts.categorical, true);
            DOMElement* copy = add(derived, GrxUni::_transform);
            copyIf(copy, transform, GrxUni::_method);
            copyChildren(copy, transform, GrxUni::_parameter);
            styleOf(axis, derived);
        });
    }
    // The depth-effect settings of passes for bars and pies.
    void depthSettings(DOMElement* to, bool everyTransform) {
        if (everyTransform)
            forEach(kCoordinateTransform, [&](DOMElement* transform) { copyParameters(to, transform, true); });
        else
            copyParameters(to, first(kCoordinateTransform), true);
        const DOMElement* z = first(GrxUni::_z);
        if (z && !isEmpty(z->getAttribute(GrxUni::_location)))
            add(to, GrxUni::_z)->setAttribute(GrxUni::_location, z->getAttribute(GrxUni::_location));
    }
    void addBarEffects() {
        if (zRole_ && chartType_ == 0 && first(kCoordinateTransform) && first(GrxUni::_z))
            depthSettings(instruction(u"addBarEffects"), false);
    }
    void addPieEffects() {
        if (!zRole_ || chartType_ != 6)
            return;
        DOMElement* pie = instruction(u"addPieEffects");
        if (first(kCoordinateTransform) && first(GrxUni::_z))
            depthSettings(pie, true);
        const DOMElement* element = first(GrxUni::_element);
        const DOMElement* style = element ? byId(element->getAttribute(GrxUni::_style)) : nullptr;
        if (isNamed(style, GrxUni::_style))
            setIf(pie, GrxUni::_depth, ChartStyleValue(style->getAttribute(GrxUni::_value)).getDepth().xc_str());
    }
    void addShadow() {
        const DOMElement* shadowed = nullptr;
        forEachDescendant(oldRoot_, GrxUni::_style, [&](DOMElement* style) {
            const ChartStyleValue value(style->getAttribute(GrxUni::_value));
            shadowed = value.getShadow_dx().empty() && value.getShadow_dy().empty() ? nullptr : style;
            return shadowed == nullptr;
        });
        if (shadowed == nullptr)
            return;
        // The action needs both offsets; a missing one is no offset.
        const ChartStyleValue value(shadowed->getAttribute(GrxUni::_value));
        DOMElement* shadow = instruction(u"addShadow");
        shadow->setAttribute(u"shadow_dx", value.getShadow_dx().empty() ? u"0" : value.getShadow_dx().xc_str());
        shadow->setAttribute(u"shadow_dy", value.getShadow_dy().empty() ? u"0" : value.getShadow_dy().xc_str());
    }
    void addDataLabels() {
        const DOMElement* labeling = nullptr;
        forEach(GrxUni::_element, [&](DOMElement* element) {
            DOMElement* own = ChartBase::getChildByTagName(element, GrxUni::_labeling);
            if (own && descendantWith(element, GrxUni::_statistic, GrxUni::_method, u"tukeyOutliers") &&
                descendantWith(element, GrxUni::_statistic, GrxUni::_method, u"tukeyExtremes"))
                labeling = own;
        });
        if (labeling == nullptr)
            return;
        DOMElement* labels = instruction(u"addDataLabels");
        labels->setAttribute(u"colorByMarker", trueOrFalse(ChartBase::getChildByTagName(labeling, kStyleBy)));
        if (DOMElement* style = styleOf(labeling, labels)) {
            ChartStyleValue value(style->getAttribute(GrxUni::_value));
            value.SetLabel_Location_Inside(ChartString());
            value.SetLabel_Location_X(ChartString());
            value.SetLabel_Location_Y(ChartString());
            style->setAttribute(GrxUni::_value, value.getValue().xc_str());
        }
        const DOMElement* old = byId(labeling->getAttribute(GrxUni::_style));
        if (old == nullptr)
            return;
        // Written with the property names the data-label action parses.
        const ChartStyleValue value(old->getAttribute(GrxUni::_value));
        ChartString position;
        const std::pair<const XMLCh*, const ChartString*> parts[] = {
            {ChartStyleValue::_label_location_inside, &value.getLabel_Location_Inside()},
            {ChartStyleValue::_label_location_x, &value.getLabel_Location_X()},
            {ChartStyleValue::_label_location_y, &value.getLabel_Location_Y()}};
        for (const auto& [name, part] : parts) {
            if (part->empty())
                continue;
            if (!position.empty())
                position.append(";");
            position.append(ChartString(name)).append(":").append(*part);
        }
        setIf(labels, GrxUni::_position, position.xc_str());
        if (value.getVisibility().equals("hidden"))
            labels->setAttribute(GrxUni::_hidden, GrxUni::_true);
    }
    void setAxisScales() {
        forEach(GrxUni::_scale, [&](DOMElement* scale) {
            const DOMNode* dimension = scale->getParentNode();
            if (!isNamed(dimension, GrxUni::_dimension))
                return;
            DOMElement* set = instruction(u"setAxisScale");
            copyIf(set, scale, GrxUni::_method);
            copyIf(set, scale, GrxUni::_origin);
            const XMLCh* role = static_cast<const DOMElement*>(dimension)->getAttribute(GrxUni::_role);
            set->setAttribute(GrxUni::_role, isEmpty(role) ? GrxUni::_y : role);
            copyChildren(set, scale, GrxUni::_parameter);
        });
    }
    // Mappings go with the interval, where the action reads them.
    void setInterval(const ChartDimension& dimension, const DOMElement* interval) {
        DOMElement* set = instruction(u"setAxisInterval");
        setIf(set, GrxUni::_role, dimension.getrole());
        if (interval != nullptr) {
            copyIf(set, interval, GrxUni::_min);
            copyIf(set, interval, GrxUni::_max);
        }
        setIf(set, ChartDimension::_lowerMapping, dimension.getlowerMapping());
        setIf(set, ChartDimension::_upperMapping, dimension.getupperMapping());
        intervals_.insert(dimension.get());
    }
    void setAxisIntervals() {
        forEach(GrxUni::_dimension, [&](DOMElement* dimension) {
            const XMLCh* domain = dimension->getAttribute(GrxUni::_domain);
            if (!isEmpty(domain))
                dimensionsByDomain_.emplace(domain, dimension);
        });
        forEach(GrxUni::_interval, [&](DOMElement* interval) {
            const DOMNode* domain = interval->getParentNode();
            const XMLCh* id = isNamed(domain, GrxUni::_domain) ? static_cast<const DOMElement*>(domain)->getAttribute(GrxUni::_id) : nullptr;
            if (isEmpty(id))
                return;
            const auto users = dimensionsByDomain_.equal_range(id);
            for (auto d = users.first; d != users.second; ++d)
                setInterval(ChartDimension(d->second), interval);
        });
    }
    void setAxisMargins() {
        forEach(GrxUni::_dimension, [&](DOMElement* element) {
            const ChartDimension dimension(element);
            if (!intervals_.count(element) && (!isEmpty(dimension.getlowerMapping()) || !isEmpty(dimension.getupperMapping())))
                setInterval(dimension, nullptr);
            DOMElement* set = instruction(u"setAxisMargin");
            setIf(set, GrxUni::_role, dimension.getrole());
            set->setAttribute(GrxUni::_categorical, trueOrFalse(dimension.isCategorical()));
            setIf(set, GrxUni::_lowerMargin, dimension.getlowerMargin());
            setIf(set, GrxUni::_upperMargin, dimension.getupperMargin());
        });
    }
    void setAxisOpposites() {
        forEach(GrxUni::_axis, [&](DOMElement* axis) {
            if (ChartBase::getChildByTagName(axis, GrxUni::_transform) || !isNamed(axis->getParentNode(), GrxUni::_dimension) ||
                !same(axis->getAttribute(GrxUni::_opposite), GrxUni::_true))
                return;
            const ChartDimension dimension(axis->getParentNode());
            DOMElement* set = instruction(u"setAxisOpposite");
            setIf(set, GrxUni::_role, dimension.getrole());
            set->setAttribute(GrxUni::_categorical, trueOrFalse(dimension.isCategorical()));
            set->setAttribute(GrxUni::_opposite, GrxUni::_true);
        });
    }
    void setAxisStyles() {
        forEach(GrxUni::_axis, [&](DOMElement* axis) {
            const ChartDimension dimension = ChartAxis(axis).getDimension();
            DOMElement* set = instruction(u"setAxisStyle");
            styleOf(axis, set, GrxUni::_baselineStyle);
            if (const DOMElement* label = ChartBase::getChildByTagName(axis, GrxUni::_label))
                styleOf(label, add(set, u"axisLabelStyle"));
            setAxis(set, {dimension.getrole(), dimension.isCategorical(),
                          ChartBase::getChildByTagName(axis, GrxUni::_transform) != nullptr});
        });
    }
    void setAxisTicks(const XMLCh* tag) {
        forEach(GrxUni::_axis, [&](DOMElement* axis) {
            const DOMElement* old = ChartBase::getChildByTagName(axis, tag);
            if (old == nullptr)
                return;
            const AxisFacts facts = factsOf(axis);
            DOMElement* set = instruction(tag == kMajorOld ? u"setAxisMajorTicks" : u"setAxisMinorTicks");
            if (facts.derived)
                set->setAttribute(kDerived, GrxUni::_true);
            ticks(old, set, facts.role, facts.categorical, facts.derived);
        });
    }
    void setScaleByFraction() {
        forEach(GrxUni::_element, [&](DOMElement* element) {
            if (!same(element->getAttribute(GrxUni::_type), GrxUni::_interval) ||
                !same(element->getAttribute(GrxUni::_positionModifier), GrxUni::_stack))
                return;
            forEachDescendant(element, GrxUni::_statistic, [&](DOMElement* statistic) {
                if (same(statistic->getAttribute(GrxUni::_method), GrxUni::_fraction))
                    instruction(u"setScaleByFraction");
                return true;
            });
        });
    }
    void setClusterWidth() {
        const DOMElement* variable = ChartBase::getChildByTagName(first(kCoordinateFacet), kFacetVariable);
        if (variable && !isEmpty(variable->getAttribute(GrxUni::_gap)))
            instruction(u"setClusterWidth")->setAttribute(GrxUni::_gap, variable->getAttribute(GrxUni::_gap));
    }
    // The role whose categories an aggregation collapses: a legend's below a style-by, else the
    // role of the nearest owner that names one, else x.
    static const XMLCh* collapsedRole(const DOMNode* node) {
        for (; node && node->getNodeType() == DOMNode::ELEMENT_NODE; node = node->getParentNode()) {
            if (isNamed(node, kStyleBy))
                return GrxUni::_legend;
            const XMLCh* role = static_cast<const DOMElement*>(node)->getAttribute(GrxUni::_role);
            if (!isEmpty(role))
                return role;
            if (isNamed(node, GrxUni::_z))
                return GrxUni::_z;
        }
        return GrxUni::_x;
    }
    void setCollapse() {
        const DOMElement* small = first(kAggregateSmall);
        if (small == nullptr)
            return;
        ChartString name(small->getAttribute(GrxUni::_category));
        std::vector<const DOMElement*> relabels;
        forEachDescendant(small->getParentNode(), GrxUni::_relabel, [&](DOMElement* r) {
            relabels.push_back(r);
            return true;
        });
        for (auto r = relabels.rbegin(); r != relabels.rend(); ++r)
            if (name.equals(ChartString((*r)->getAttribute(GrxUni::_from))))
                name = ChartString((*r)->getAttribute(GrxUni::_to));
        DOMElement* set = instruction(u"setCollapse");
        copyIf(set, small, GrxUni::_minFraction);
        set->setAttribute(u"categoryName", name.xc_str());
        set->setAttribute(GrxUni::_role, collapsedRole(small->getParentNode()));
    }
    void setTickLabel(const XMLCh* oldName, const XMLCh* name, const XMLCh* tag) {
        forEach(GrxUni::_axis, [&](DOMElement* axis) {
            const DOMElement* major = ChartBase::getChildByTagName(axis, kMajorOld);
            if (major == nullptr || isEmpty(major->getAttribute(oldName)))
                return;
            DOMElement* set = instruction(tag);
            setAxis(set, factsOf(axis));
            set->setAttribute(name, major->getAttribute(oldName));
        });
    }
    void setHistogramBinning() {
        forEach(GrxUni::_statistic, [&](DOMElement* statistic) {
            if (same(statistic->getAttribute(GrxUni::_method), GrxUni::_histogram))
                copyChildren(instruction(u"setHistogramBinning"), statistic, GrxUni::_parameter);
        });
    }
    void hideFrames() {
        forEach(GrxUni::_style, [&](DOMElement* style) {
            const ChartString id(style->getAttribute(GrxUni::_id));
            if (!id.ContainsString(GrxUni::_frame) ||
                !ChartStyleValue(style->getAttribute(GrxUni::_value)).getVisibility().equals("hidden"))
                return;
            ChartString frameId(id);
            frameId.truncateString(1);
            DOMElement* hide = instruction(u"hideFrame");
            setIf(hide, kFrameId, frameId.xc_str());
            // The action picks its frame by kind and count, as "addFrame" reads the id.
            const FrameName* kind = nullptr;
            for (const FrameName& f : kFrames)
                kind = kind ? kind : frameId.equals(ChartString(f.id)) ? &f : nullptr;
            hide->setAttribute(GrxUni::_type, kind ? kind->type : u"labelFrame");
            if (kind)
                setIf(hide, GrxUni::_count, kind->count);
        });
    }
    void setBackPlane() {
        if (!zRole_)
            return;
        DOMElement* back = nullptr;
        forEach(GrxUni::_guide, [&](DOMElement* guide) {
            if (!same(guide->getAttribute(GrxUni::_type), u"plane"))
                return;
            back = back ? back : instruction(u"setBackPlane");
            DOMElement* plane = add(back, u"plane");
            const ChartParameter parameter = ChartGuide(guide).getFirstParameter();
            setIf(plane, GrxUni::_role, parameter.getAttributeValue(GrxUni::_value));
            styleOf(guide, plane);
        });
    }
    static void setId(DOMElement* e, const XMLCh* id) {
        if (isEmpty(id))
            return;
        DOMAttr* attribute = e->getOwnerDocument()->createAttribute(GrxUni::_id);
        attribute->setValue(id);
        e->setAttributeNode(attribute);
    }
    void setStyles() {
        const DOMElement* container = byId(kContainerId);
        if (container == nullptr)
            return;
        DOMElement* own = instruction(u"setStyle");
        setId(own, kContainerId);
        copyStyle(container, own);
        forEachDescendant(container, GrxUni::_style, [&](DOMElement* style) {
            DOMElement* set = instruction(u"setStyle");
            setId(set, style->getAttribute(GrxUni::_id));
            copyStyle(style, set);
            return true;
        });
    }
    void setStyleCycles() {
        for (const XMLCh* id : {u"styleCycleDefault", u"styleCycleRepository"}) {
            const DOMElement* cycles = byId(id);
            if (cycles == nullptr)
                continue;
            DOMElement* set = instruction(u"setStyleCycle");
            setId(set, id);
            forEachDescendant(cycles, GrxUni::_cycle, [&](DOMElement* cycle) {
                DOMElement* copy = add(set, GrxUni::_cycle);
                forEachDescendant(cycle, GrxUni::_style, [&](DOMElement* style) {
                    copyStyle(style, copy);
                    return true;
                });
                return true;
            });
        }
    }
    void setScatterplotBinning() {
        std::vector<DOMElement*> points;
        forEach(GrxUni::_element, [&](DOMElement* e) {
            if (same(e->getAttribute(GrxUni::_type), GrxUni::_point))
                points.push_back(e);
        });
        for (auto e = points.rbegin(); e != points.rend(); ++e) {
            const DOMElement* position = ChartBase::getChildByTagName(*e, GrxUni::_position);
            const DOMElement* statistic = ChartBase::getChildByTagName(position, GrxUni::_statistic);
            if (statistic == nullptr || !same(statistic->getAttribute(GrxUni::_method), u"bin"))
                continue;
            DOMElement* set = instruction(u"setScatterplotBinning");
            for (DOMElement* p = statistic->getFirstElementChild(); p; p = p->getNextElementSibling()) {
                if (!isNamed(p, GrxUni::_parameter))
                    continue;
                // The settings the action reads become attributes; the rest stay as they were.
                const XMLCh* name = p->getAttribute(GrxUni::_name);
                bool read = false;
                for (const XMLCh* setting : kScatterBinning)
                    read = read || same(name, setting);
                if (read)
                    set->setAttribute(name, p->getAttribute(GrxUni::_value));
                else
                    set->appendChild(import(p, true));
            }
            set->setAttribute(GrxUni::_size, trueOrFalse(firstDescendant(*e, GrxUni::_size) != nullptr));
        }
    }

    DOMElement* oldRoot_;
    DOMDocument* doc_;
    DOMElement* root_;
    std::unordered_map<std::u16string, DOMElement*> ids_;
    std::set<const DOMElement*> intervals_;
    std::unordered_multimap<std::u16string, DOMElement*> dimensionsByDomain_;
    std::set<std::u16string> lineStyles_;
    bool zRole_ = false;
    int chartType_ = 0;
};

} // namespace

std::string convertTemplate(const DOMDocument* old) {
    try {
        DOMImplementation* implementation = DOMImplementationRegistry::getDOMImplementation(u"LS");
        if (implementation == nullptr)
            return kBareTemplate;
        const plotaid::detail::OwnedDocument converted(
            implementation->createDocument(kNamespace, kTemplate, nullptr));
        DOMElement* root = converted->getDocumentElement();
        root->setAttributeNS(kXmlnsUri, u"xmlns", kNamespace);
        root->setAttributeNS(kXmlnsUri, u"xmlns:xsi", kSchemaInstanceUri);
        root->setAttributeNS(kSchemaInstanceUri, u"xsi:schemaLocation", kSchemaLocation);
        if (old != nullptr && countElements(old) <= kElementLimit)
            Converter(old, converted.get()).run();
        else if (old != nullptr)
            ChartErrorHandler().warning(ChartException(
                "Earlier-form template has more than " + std::to_string(kElementLimit) + " elements; converted to none",
                kFile, 1));
        ChartPrinter printer;
        printer.setPrintWhiteSpace(true);
        std::ostringstream out;
        printer.Print(converted.get(), out);
        std::string text = out.str();
        return text.empty() ? std::string(kBareTemplate) : text;
    } catch (...) {
        return kBareTemplate;
    }
}

bool convertTemplateText(std::string_view text, const std::string& name, std::string& converted,
                         std::string& error) {
    std::string notXml;
    if (templateKind(text, notXml) != DocumentKind::Named || !notXml.empty()) {
        error = name + (notXml.empty() ? ": the template is of the current form already" : ":" + notXml);
        return false;
    }
    ValidatingParser parser;
    const DOMDocument* old =
        parser.parse(text, name.c_str(), ChartException("Failed to parse earlier-form template " + name, kFile, 59));
    if (old == nullptr) {
        error = parser.lastErrors().empty() ? name + ": the template could not be parsed" : parser.lastErrors().front();
        return false;
    }
    converted = convertTemplate(old);
    return true;
}

DocumentKind templateKind(std::string_view text, std::string& notXml) {
    notXml.clear();
    if (text.find(kMarker) != std::string_view::npos)
        return text.find(kConvertedMarker) != std::string_view::npos ? DocumentKind::ConvertedTemplate
                                                                      : DocumentKind::Template;
    return hasCurrentTemplateOutline(text, notXml) ? DocumentKind::Template : DocumentKind::Named;
}

unsigned nextConversionCount() noexcept {
    return ++conversions;
}

} // namespace plotaid::detail
