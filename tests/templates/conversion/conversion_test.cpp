// Conversion of earlier-form templates: what each pass writes, in which order, and that a converted
// template restyles a chart as its hand-written current-form twin does.
#include "templates/TemplateSupport.h"

#include "templates/TemplateConverter.h"

#include <plotaid/ChartStyleValue.h>

using namespace template_test;
using namespace XERCES_CPP_NAMESPACE;
using plotaid::detail::DocumentKind;

namespace {

std::string older(const std::string& body) {
    return "<graph xmlns=\"http://plotaid.org/grxml\" xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-1.4.xsd\">" +
           body + "</graph>";
}

// tag(attributes sorted, style texts as ChartStyleValue writes them)'text'[children]
std::string outline(const DOMElement* e) {
    std::string out = u8(e->getTagName()), attributes, text, children;
    for (const auto& [name, value] : attributeMap(e))
        attributes += (attributes.empty() ? "" : ",") + name + "=" +
                      (name == "value" && out == "style" ? ChartStyleValue(ChartString(value).xc_str()).getValue().toUTF8() : value);
    for (const DOMNode* n = e->getFirstChild(); n; n = n->getNextSibling())
        if (n->getNodeType() == DOMNode::TEXT_NODE)
            text += u8(n->getNodeValue());
        else if (n->getNodeType() == DOMNode::ELEMENT_NODE)
            children += (children.empty() ? "" : " ") + outline(static_cast<const DOMElement*>(n));
    text.erase(0, text.find_first_not_of(" \n\t"));
    text.erase(text.find_last_not_of(" \n\t") + 1);
    return out + (attributes.empty() ? "" : "(" + attributes + ")") + (text.empty() ? "" : "'" + text + "'") +
           (children.empty() ? "" : "[" + children + "]");
}

class Conversion : public TemplateTest {
protected:
    // The converted text, which must pass both validators of its grammar.
    std::string convert(const std::string& old) {
        std::string converted, error;
        EXPECT_TRUE(plotaid::detail::convertTemplateText(old, "old", converted, error)) << error;
        if (grammar_test::haveXmllint()) {
            const auto lint = grammar_test::xmllint("grxml-template-1.0.xsd", grammar_test::writeScratch("c.sgt", converted));
            EXPECT_EQ(lint.exitCode, 0) << lint.output << converted;
        }
        return converted;
    }
    // The instructions of a template text, one outline each.
    std::string instructions(const std::string& text, DocumentKind kind) {
        plotaid::detail::ValidatingParser parser;
        const DOMDocument* doc = parser.parse(text, "t", ChartException("t", "test", 0), kind);
        EXPECT_NE(doc, nullptr) << joined(parser.lastErrors()) << text;
        std::string out;
        for (const DOMElement* i = doc ? doc->getDocumentElement()->getFirstElementChild() : nullptr; i;
             i = i->getNextElementSibling())
            out += (out.empty() ? "" : " | ") + outline(i);
        return out;
    }
    static std::string joined(const std::vector<std::string>& lines) {
        std::string out;
        for (const std::string& l : lines)
            out += l + "\n";
        return out;
    }
};

TEST_F(Conversion, EachPassWritesWhatTheActionsRead) {
    const struct {
        const char* body;
        const char* expected;
    } rows[] = {
        {"<variable id='v'/><frame id='f'/>", ""},
        {"<element type='point'><position><statistic method='bin'/></position></element>"
         "<frame id='f'><location left='1%'/></frame>",
         "addFrame(frameId=f)[location(left=1%)] | setScatterplotBinning(size=false)"},
        {"<frame id='a'><location/><frame id='b'><location/></frame></frame><frame><location/></frame>",
         "addFrame(frameId=a)[location] | addFrame(frameId=b,parentFrameId=a)[location] | addFrame[location]"},
        {"<style id='s1' value='shadow-dx:3px'/><style id='s2' value='shadow-dx:1px;shadow-dy:1px'/>",
         "addShadow(shadow_dx=3px,shadow_dy=0)"},
        {"<element type='line'><styleby/>"
         "<statistic method='smooth'><parameter name='degree' value='2'/></statistic>"
         "<statistic method='region'><parameter name='degree' value='3'/></statistic>"
         "<statistic method='smooth'><parameter name='degree' value='0'/></statistic>"
         "<statistic method='smooth'><parameter name='degree' value='0'/><parameter name='model' value='loess'/></statistic>"
         "<statistic method='bin'/></element><element type='line'><statistic method='smooth'/></element>",
         "addFitLine(primary=true,target=subgroup,type=quadratic) | addFitLine(primary=true,target=subgroup,type=cubic)"
         " | addFitLine(primary=true,target=subgroup,type=mean) | addFitLine(primary=true,target=subgroup,type=loess)"
         " | addFitLine(primary=true,target=pair,type=linear)"},
        {"<dimension role='z'/><element type='interval'/><z location='3'/>"
         "<coordinatetransform><parameter name='distance' value='-2.5'/><parameter name='theta' value='30'/></coordinatetransform>",
         "addBarEffects[parameter(name=distance,value=-3.75) parameter(name=theta,value=30) z(location=3)]"
         " | setAxisMargin(categorical=false,role=z)"},
        {"<facetvariable role='z'/><theta/><element type='interval' style='p'/><style id='p' value='depth:20%'/>",
         "addPieEffects(depth=20%)"},
        {"<variable><aggregatesmall category='Other' minFraction='0.05'/>"
         "<relabel from='Other' to='Rest'/><relabel from='Rest' to='Misc'/></variable>",
         "setCollapse(categoryName=Rest,minFraction=0.05,role=x)"},
        {"<style id='frame_legend_1s' value='visibility:hidden'/><style id='frameX' value='visibility:hidden'/>"
         "<style id='frame_title_2s' value='fill:#FF0000'/>",
         "hideFrame(count=1,frameId=frame_legend_1,type=legend) | hideFrame(frameId=frame,type=labelFrame)"},
        {"<style id='c-o-n-t-a-i-n-er'><style value='fill:#FF0000'/></style>",
         "setStyle(id=c-o-n-t-a-i-n-er)[style] | setStyle[style(value=fill:#FF0000)]"},
        {"<element><labeling style='lab'><styleby/></labeling><statistic method='tukeyOutliers'/>"
         "<statistic method='tukeyExtremes'/></element><style id='lab' value='label-location-x:positive;visibility:hidden'/>",
         "addDataLabels(colorByMarker=true,hidden=true,position=label-location-x:positive)[style(value=visibility:hidden)]"},
        {"<domain id='d'><interval min='0'/></domain><dimension role='y' domain='d' upperMapping='exact'/>"
         "<dimension role='x' lowerMapping='exact'/>",
         "setAxisInterval(min=0,role=y,upperMapping=exact) | setAxisMargin(categorical=false,role=y)"
         " | setAxisInterval(lowerMapping=exact,role=x) | setAxisMargin(categorical=false,role=x)"},
    };
    for (const auto& row : rows)
        EXPECT_EQ(instructions(convert(older(row.body)), DocumentKind::ConvertedTemplate), row.expected) << row.body;
}

TEST_F(Conversion, TheRootNamesTheConvertedGrammarAndAFailedParseConvertsNothing) {
    const std::string bare = plotaid::detail::convertTemplate(nullptr);
    for (const char* part : {"<template xmlns=\"http://plotaid.org/grxml\"",
                             "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"",
                             "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-template-1.0.xsd\""})
        EXPECT_NE(bare.find(part), std::string::npos) << part;
    EXPECT_EQ(instructions(bare, DocumentKind::ConvertedTemplate), "");
    std::string converted, error;
    EXPECT_FALSE(plotaid::detail::convertTemplateText(templateOf(""), "t", converted, error));
    EXPECT_FALSE(plotaid::detail::convertTemplateText("<graph", "t", converted, error));
    EXPECT_EQ(error, "t:1:7: unexpected end of input");
}

// A parse stopped by a fault late in the text converts what it read before it.
TEST_F(Conversion, AParseThatStoppedHandsOnWhatItBuilt) {
    ChartTemplate t(empty(), nullptr);
    ASSERT_TRUE(t.setTemplate(older("<frame id='f'><location/></frame><style id='d'/><style id='d'/>")));
    WalkReport report;
    t.applyTemplate();
    ASSERT_EQ(report.outcomes().size(), 1u);
    EXPECT_EQ(report.outcomes().front().tag, "addFrame");
}

// Each stored template restyles every sample chart as its twin does, and its conversion is the twin.
TEST_F(Conversion, EarlierFormExamplesDoWhatTheirTwinsDo) {
    for (const char* name : {"axes", "frames", "lines", "styles"}) {
        const std::string old = example(std::string("templates/earlier/") + name + ".xml");
        const std::string twin = example(std::string("templates/earlier/") + name + ".sgt");
        EXPECT_EQ(instructions(convert(old), DocumentKind::ConvertedTemplate), instructions(twin, DocumentKind::Template))
            << name;
        std::size_t changed = 0;
        for (const std::string& chart : grammar_test::sampleCharts()) {
            GrxVisualization& a = parse(grammar_test::readText(chart));
            GrxVisualization& b = parse(grammar_test::readText(chart));
            const std::string before = canonical(a);
            ChartTemplate fromOld(a, nullptr), fromTwin(b, nullptr);
            ASSERT_TRUE(fromOld.setTemplate(old) && fromTwin.setTemplate(twin)) << name;
            fromOld.applyTemplate();
            fromTwin.applyTemplate();
            EXPECT_EQ(canonical(a), canonical(b)) << name << " on " << chart;
            if (canonical(a) == before)
                continue;
            ++changed;
            EXPECT_EQ(grammar_test::chartFaults(a), "") << name << " on " << chart;
        }
        // Every example's instructions take effect now.
        const std::string kind(name);
        EXPECT_GT(changed, 0u) << name;
        if (kind == "styles") {
            EXPECT_EQ(changed, grammar_test::sampleCharts().size());
        }
    }
}

} // namespace
